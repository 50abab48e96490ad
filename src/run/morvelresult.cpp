#include "import.h"
#include "logstyle.h"
#include "resultdisplay.h"
#include "runlogic.h"

#include <QFile>
#include <QProcess>

namespace {
QString resultOpenFailure()
{
    return LogStyle::error(QStringLiteral(" Something went wrong while opening a \"morvel.out\" file! "));
}
} // namespace

void Import::checkStartMorvel()
{
    importlog->append(QStringLiteral("<br>-->  Starting Morvel ..."));
}

void Import::endMorvel(int exitCode)
{
    updateRunButtons();
    if (exitCode != 0)
        importlog->append(LogStyle::error(QStringLiteral(" Something went wrong with morvel program ! ")));

    const QString path = workingDir + QStringLiteral("/MORVEL.OUT");
    {
        // Opened read-write like every file here: a missing result is created and shown empty,
        // and a file that can be neither opened nor created gets its line before any banner.
        QFile result(path);
        if (!result.open(QIODevice::ReadWrite)) {
            importlog->append(resultOpenFailure());
            return;
        }
    }

    importlog->append(QStringLiteral(" "));
    importlog->append(QStringLiteral(" "));
    for (const QString &line : resultBanner())
        importlog->append(line);
    if (!showResultFile(importlog, path))
        importlog->append(resultOpenFailure());
}

void Import::openMorvelOut()
{
    const QString path = workingDir + QStringLiteral("/MORVEL.OUT");
    if (!QFile::exists(path)) {
        importlog->append(LogStyle::error(
            QStringLiteral(" There is no MORVEL.OUT file in the current directory! ")));
        return;
    }
    const QString editor = textEditorProgram();
    if (!editor.isEmpty())
        QProcess::startDetached(editor, {path});
}
