#include "import.h"
#include "logstyle.h"

#include <QFile>

void Import::copyInputFile(const QString &inputPath)
{
    const QString targetPath = workingDir + QStringLiteral("/morvel.in");
    if (QFile::exists(targetPath))
        QFile::remove(targetPath);
    QFile target(targetPath);
    // Truncate: where the old file could not be removed (a folder that takes no new files), its
    // longer text must not outlast the new one.
    if (!target.open(QIODevice::ReadWrite | QIODevice::Truncate)) {
        importlog->append(LogStyle::error(
            QStringLiteral(" Something went wrong while opening a new \"morvel.in\" file! ")));
        return;
    }

    // Read-write like every file the dialog opens, but a source that has vanished since it was
    // chosen must be reported, not silently created empty.
    QFile source(inputPath);
    if (!source.open(QIODevice::ReadWrite | QIODevice::ExistingOnly)) {
        importlog->append(LogStyle::error(
            QStringLiteral(" Something went wrong while opening input file! ")));
        importlog->append(QStringLiteral("argument was ") + inputPath);
        return;
    }

    // The computation program gets exactly the bytes of the chosen file.
    target.write(source.readAll());
    target.close();
    source.close();
}
