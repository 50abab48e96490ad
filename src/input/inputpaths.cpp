#include "inputpaths.h"

#include <QFileInfo>

InputPaths inputPathsFor(const QString &inputFile)
{
    const QFileInfo info(inputFile);
    InputPaths paths;
    paths.workingDir = info.path();
    paths.baseName = info.baseName();
    paths.stagedInputPath = paths.workingDir + QLatin1String("/morvel.in");
    // The staged file must lie in the working directory; where the two spellings differ
    // (a root directory, for one) the staged file's directory wins.
    const QString stagedDir = QFileInfo(paths.stagedInputPath).path();
    if (stagedDir.simplified() != paths.workingDir.simplified())
        paths.workingDir = stagedDir;
    return paths;
}

bool hasCifSuffix(const QString &fileName, CifSuffix test)
{
    const QFileInfo info(fileName);
    const QLatin1String cif("cif");
    switch (test) {
    case CifSuffix::CompleteSuffixContains:
        return info.completeSuffix().toLower().contains(cif);
    case CifSuffix::CompleteSuffixIs:
        return info.completeSuffix().toLower() == cif;
    case CifSuffix::SuffixIs:
        return info.suffix().toLower() == cif;
    }
    return false;
}

QString backupFileName(const QString &baseName, int n)
{
    return baseName + QLatin1String("_old") + (n > 1 ? QString::number(n) : QString()) + QLatin1String(".cif");
}

bool isStagedInputName(const QString &inputFile)
{
    return QFileInfo(inputFile).fileName().toLower().trimmed() == QLatin1String("morvel.in");
}
