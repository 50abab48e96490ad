#include "filereplace.h"

#include <QFile>
#include <QFileInfo>

#include <filesystem>
#include <system_error>

#ifdef Q_OS_UNIX
#include <unistd.h>
#endif

namespace {
std::filesystem::path nativePath(const QString &path)
{
#ifdef Q_OS_WIN
    return std::filesystem::path(path.toStdWString());
#else
    return std::filesystem::path(QFile::encodeName(path).toStdString());
#endif
}
} // namespace

bool renameReplacing(const QString &from, const QString &to)
{
    // rename(2) on POSIX, MoveFileEx with MOVEFILE_REPLACE_EXISTING on Windows: both atomic.
    std::error_code error;
    std::filesystem::rename(nativePath(from), nativePath(to), error);
    return !error;
}

ReplaceResult replaceFileContent(const QString &temporaryPath, const QByteArray &content, const QString &targetPath)
{
    QFile temporary(temporaryPath);
    // ReadWrite as every file of the program; Truncate so that an older tmp.cif leaves nothing behind.
    if (!temporary.open(QIODevice::ReadWrite | QIODevice::Truncate))
        return ReplaceResult::CannotOpenTemporary;

    bool written = temporary.write(content) == content.size() && temporary.flush();
#ifdef Q_OS_UNIX
    written = written && ::fsync(temporary.handle()) == 0;
#endif
    temporary.close();
    written = written && temporary.error() == QFileDevice::NoError;
    if (!written) {
        temporary.remove();
        return ReplaceResult::CannotWriteTemporary;
    }

    // The new file takes the place of the old one: let it keep the old one's permissions.
    const QFileInfo target(targetPath);
    if (target.exists())
        QFile::setPermissions(temporaryPath, target.permissions());

    if (!renameReplacing(temporaryPath, targetPath))
        return ReplaceResult::CannotReplace;
    return ReplaceResult::Replaced;
}
