#include "filereplace.h"
#include "import.h"
#include "logstyle.h"

#include <QFile>

bool Import::copyInputFile(const QString &inputPath)
{
    // Read-write like every file the dialog opens, but a source that has vanished since it was
    // chosen must be reported, not silently created empty.
    QFile source(inputPath);
    const bool opened = source.open(QIODevice::ReadWrite | QIODevice::ExistingOnly);
    // The computation program gets exactly the bytes of the chosen file.
    const QByteArray bytes = opened ? source.readAll() : QByteArray();
    const bool read = opened && source.error() == QFileDevice::NoError;

    const WriteResult written = writeNewFile(workingDir + QStringLiteral("/morvel.in"), read ? bytes : QByteArray());
    if (written == WriteResult::CannotOpen) {
        importlog->append(LogStyle::error(QStringLiteral(" Something went wrong while opening a new \"morvel.in\" file! ")));
        return false;
    }
    if (!read) {
        importlog->append(LogStyle::error(QStringLiteral(" Something went wrong while opening input file! ")));
        importlog->append(QStringLiteral("argument was ") + inputPath);
        return false;
    }
    if (written == WriteResult::CannotWrite) {
        importlog->append(LogStyle::error(QStringLiteral(" \"morvel.in\" could not be written in full! ")));
        return false;
    }
    return true;
}
