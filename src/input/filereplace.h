#ifndef MORVEL_FILEREPLACE_H
#define MORVEL_FILEREPLACE_H

#include <QByteArray>
#include <QString>

// Puts new content in the place of a file through a temporary file: the temporary file is emptied,
// written completely and flushed to disk, then renamed over the target in one step. Until that
// last step the target keeps its old content, so a failure never leaves it half written.
enum class ReplaceResult {
    Replaced,
    CannotOpenTemporary, // nothing was written; the target is unchanged
    CannotWriteTemporary, // the incomplete temporary file has been removed; the target is unchanged
    CannotReplace // the temporary file holds the new content; the target is unchanged
};

ReplaceResult replaceFileContent(const QString &temporaryPath, const QByteArray &content, const QString &targetPath);

// A file the dialog writes anew (morvel.par, morvel.in): an earlier file is removed, the new one
// is opened read-write and emptied (so that an old file that could not be removed keeps no
// tail), then written. Written means that every byte reached the file.
enum class WriteResult { Written, CannotOpen, CannotWrite };

WriteResult writeNewFile(const QString &path, const QByteArray &content);

// Keeps a copy of bytes (a file about to be rewritten) in dir, under the first of the names
// backupFileName(baseName, 1 to 100) that is free or already holds exactly these bytes. An
// existing file is never overwritten. name is empty when no copy could be kept.
struct BackupCopy
{
    QString name;
    bool madeNow = false;
};

BackupCopy keepBackupCopy(const QString &dir, const QString &baseName, const QByteArray &bytes);

// The whole content of a file, opened read-write as every file of the program (so a missing
// one is created empty); false when it cannot be opened.
bool readWholeFile(const QString &path, QByteArray &content);

#endif
