#ifndef MORVEL_FILEDROP_H
#define MORVEL_FILEDROP_H

#include <QObject>
#include <QString>
#include <QStringList>

class Import;
class QMimeData;

// The one local, ordinary file a drag carries; empty for folders, several files, remote URLs.
QString droppedFile(const QMimeData *data);

// Lets the dialog take one file dropped on it (or on its log) as if Browse had chosen it, and
// refuses any other drop of files without a word. While Browse is off (a program runs), no drop
// is taken either.
class FileDrop : public QObject
{
public:
    explicit FileDrop(Import *dialog);

protected:
    bool eventFilter(QObject *watched, QEvent *event) override;

private:
    Import *dialog;
};

// The files given on the command line: the first is taken as if Browse had chosen it (a relative
// one against the current directory), the others are named in the log and left.
void takeStartupFiles(Import &dialog, const QStringList &files);

#endif
