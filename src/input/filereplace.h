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

// Renames from over to, replacing an existing to in one step (QFile::rename refuses to).
bool renameReplacing(const QString &from, const QString &to);

#endif
