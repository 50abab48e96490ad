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

bool suffixMentionsCif(const QString &fileName)
{
    return QFileInfo(fileName).completeSuffix().toLower().contains(QLatin1String("cif"));
}

bool suffixIsCif(const QString &fileName)
{
    return QFileInfo(fileName).completeSuffix().toLower() == QLatin1String("cif");
}

QString backupFileName(const QString &baseName)
{
    return baseName + QLatin1String("_old.cif");
}
