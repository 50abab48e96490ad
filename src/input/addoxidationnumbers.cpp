#include "cifrewrite.h"
#include "filereplace.h"
#include "import.h"
#include "inputpaths.h"
#include "logwindow.h"

#include <QFileInfo>

void Import::addOxidationNumbers()
{
    // The file is rewritten only while a copy of it, as it is now, exists: the first copy is never
    // overwritten, and a file that has changed since is kept under the next free name.
    QByteArray original;
    const bool readable = readWholeFile(inputFile, original);
    const QString backupName = backupFileName(inputBaseName);
    const BackupCopy copy = readable ? keepBackupCopy(workingDir, inputBaseName, original) : BackupCopy();
    const QString savedUnder = QStringLiteral("<b> Original CIF file has been saved under </b>");
    if (copy.madeNow && copy.name == backupName) {
        importlog->append(savedUnder + backupName);
    } else {
        importlog->append(LogStyle::error(QStringLiteral(" Cannot overwrite save file "), LogStyle::BreakBefore)
                          + QStringLiteral(" : ") + backupName);
        if (!copy.name.isEmpty() && copy.name != backupName)
            importlog->append(savedUnder + copy.name);
    }
    if (readable && copy.name.isEmpty()) {
        importlog->append(LogStyle::error(
            QStringLiteral(" No copy of the CIF file could be kept: it is left unchanged. ")));
        return;
    }

    readOxidationTable();

    if (!readable) {
        importlog->append(LogStyle::error(QStringLiteral(" Cannot open input file in read-write mode! ")));
        return;
    }

    // Latin-1 both ways: every byte of an unchanged line is written back as it was read.
    const CifRewrite rewrite = rewriteCifText(QString::fromLatin1(original), OxidationIndex(oxidationTable));
    appendLogGroups(importlog, rewrite.log);
    if (rewrite.outcome != CifRewrite::Outcome::Rewritten)
        return;

    // An input that is itself called tmp.cif must not be emptied before it is replaced.
    QString temporaryPath = workingDir + QLatin1String("/tmp.cif");
    if (QFileInfo(temporaryPath) == QFileInfo(inputFile))
        temporaryPath += QLatin1String(".new");

    const QString unchanged = QStringLiteral(" The input CIF file is left unchanged. ");
    switch (replaceFileContent(temporaryPath, rewrite.text.toLatin1(), inputFile)) {
    case ReplaceResult::CannotOpenTemporary:
        importlog->append(LogStyle::error(QStringLiteral(" Cannot open temporary file in read-write mode! ")));
        return;
    case ReplaceResult::CannotWriteTemporary:
        importlog->append(LogStyle::error(QStringLiteral(" Cannot write temporary file \"tmp.cif\"!") + unchanged));
        return;
    case ReplaceResult::CannotReplace:
        importlog->append(
            LogStyle::error(QStringLiteral(" Cannot replace the input CIF file by \"tmp.cif\"!") + unchanged));
        return;
    case ReplaceResult::Replaced:
        break;
    }

    importlog->append(LogStyle::success(
        QStringLiteral(" The input CIF file has been modified according to \"oxidation.dat\" file info."),
        LogStyle::BreakBefore));
    importlog->append(LogStyle::success(QStringLiteral(" Ready to import the CIF file then to run MORVEL !"),
                                        LogStyle::BreakAfter));
}
