#include "filereplace.h"
#include "inputpaths.h"

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

// Renames from over to, replacing an existing to in one step (QFile::rename refuses to):
// rename(2) on POSIX, MoveFileEx with MOVEFILE_REPLACE_EXISTING on Windows.
bool renameReplacing(const QString &from, const QString &to)
{
    std::error_code error;
    std::filesystem::rename(nativePath(from), nativePath(to), error);
    return !error;
}

// Writes all of content to the open file, on to the disk, and closes it; false if any of it failed
// (a full disk, a file size limit).
bool writeAndClose(QFile &file, const QByteArray &content)
{
    bool written = file.write(content) == content.size() && file.flush();
#ifdef Q_OS_UNIX
    written = written && ::fsync(file.handle()) == 0;
#endif
    file.close();
    return written && file.error() == QFileDevice::NoError;
}
} // namespace

ReplaceResult replaceFileContent(const QString &temporaryPath, const QByteArray &content, const QString &targetPath)
{
    QFile temporary(temporaryPath);
    // ReadWrite as every file of the program; Truncate so that an older tmp.cif leaves nothing behind.
    if (!temporary.open(QIODevice::ReadWrite | QIODevice::Truncate))
        return ReplaceResult::CannotOpenTemporary;
    if (!writeAndClose(temporary, content)) {
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

WriteResult writeNewFile(const QString &path, const QByteArray &content)
{
    if (QFile::exists(path))
        QFile::remove(path);
    QFile file(path);
    if (!file.open(QIODevice::ReadWrite | QIODevice::Truncate))
        return WriteResult::CannotOpen;
    return writeAndClose(file, content) ? WriteResult::Written : WriteResult::CannotWrite;
}

BackupCopy keepBackupCopy(const QString &dir, const QString &baseName, const QByteArray &bytes)
{
    for (int n = 1; n <= 100; ++n) {
        const QString name = backupFileName(baseName, n);
        QFile file(dir + QLatin1Char('/') + name);
        const QFileInfo info(file);
        if (info.exists() || info.isSymLink()) {
            // Only an ordinary file is read: a FIFO in its place would never answer.
            if (info.isFile() && info.size() == bytes.size() && file.open(QIODevice::ReadOnly)
                && file.readAll() == bytes)
                return {name, false};
            continue;
        }
        // NewOnly: a file that appeared meanwhile is not overwritten either.
        if (!file.open(QIODevice::ReadWrite | QIODevice::NewOnly))
            return {};
        if (!writeAndClose(file, bytes)) {
            file.remove();
            return {};
        }
        return {name, true};
    }
    return {};
}

bool readWholeFile(const QString &path, QByteArray &content)
{
    QFile file(path);
    if (!file.open(QIODevice::ReadWrite))
        return false;
    content = file.readAll();
    return true;
}
