#include "cifrewrite.h"
#include "filereplace.h"
#include "import.h"
#include "logbatch.h"
#include "inputpaths.h"
#include "logstyle.h"

#include <QFile>
#include <QFileInfo>

void Import::addOxidationNumbers()
{
    // The file as it was is kept once: an existing backup copy is never overwritten.
    const QString backupName = backupFileName(inputBaseName);
    if (QFile::copy(inputFile, workingDir + QLatin1Char('/') + backupName))
        importlog->append(QStringLiteral("<b> Original CIF file has been saved under </b>") + backupName);
    else
        importlog->append(QStringLiteral("<br><b><font color=#FF3300> Cannot overwrite save file </font></b> : ") + backupName);

    readOxidationTable();

    QByteArray original;
    {
        QFile input(inputFile);
        if (!input.open(QIODevice::ReadWrite)) {
            importlog->append(LogStyle::error(QStringLiteral(" Cannot open input file in read-write mode! ")));
            return;
        }
        original = input.readAll();
    }

    // Latin-1 both ways: every byte of an unchanged line is written back as it was read.
    const CifRewrite rewrite = rewriteCifText(QString::fromLatin1(original), OxidationIndex(oxidationTable));
    appendLogLines(importlog, rewrite.log);
    if (rewrite.outcome != CifRewrite::Outcome::Rewritten)
        return;

    // An input that is itself called tmp.cif must not be emptied before it is replaced.
    QString temporaryPath = workingDir + QLatin1String("/tmp.cif");
    if (QFileInfo(temporaryPath) == QFileInfo(inputFile))
        temporaryPath += QLatin1String(".new");

    switch (replaceFileContent(temporaryPath, rewrite.text.toLatin1(), inputFile)) {
    case ReplaceResult::CannotOpenTemporary:
        importlog->append(LogStyle::error(QStringLiteral(" Cannot open temporary file in read-write mode! ")));
        return;
    case ReplaceResult::CannotWriteTemporary:
        importlog->append(LogStyle::error(
            QStringLiteral(" Cannot write temporary file \"tmp.cif\"! The input CIF file is left unchanged. ")));
        return;
    case ReplaceResult::CannotReplace:
        importlog->append(LogStyle::error(
            QStringLiteral(" Cannot replace the input CIF file by \"tmp.cif\"! The input CIF file is left unchanged. ")));
        return;
    case ReplaceResult::Replaced:
        break;
    }

    importlog->append(QStringLiteral("<br><b><font color=#00CC00> The input CIF file has been modified according to \"oxidation.dat\" file info.</font></b>"));
    importlog->append(QStringLiteral("<b><font color=#00CC00> Ready to import the CIF file then to run MORVEL !</font></b><br>"));
}
