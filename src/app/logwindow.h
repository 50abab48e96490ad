#ifndef MORVEL_LOGWINDOW_H
#define MORVEL_LOGWINDOW_H

#include "logstyle.h"

#include <QVariant>

class QTextEdit;
class QUrl;

// At most this many lines of one group reach the log: its first and last halves, with a line
// that says how many are left out. A table or a CIF file of hundreds of thousands of lines would
// otherwise keep the dialog busy for many seconds, and nobody reads such a list in the log.
constexpr int logGroupLimit = 10000;

// Appends every group, one append a line, each group shortened on its own.
void appendLogGroups(QTextEdit *log, const LogGroups &groups);

// Markup in a log entry (a result file, morvelpartxt.txt) may name images or style sheets, which
// the log would read from the file system by itself: a device would never end, a FIFO never
// answer. This gives the log a document that reads only ordinary files of at most
// markupFileLimit bytes for markup, and takes a blank for anything else.
void guardLogResources(QTextEdit *log);

constexpr qint64 markupFileLimit = 4 * 1024 * 1024;

// What the guarded log gets for a resource of this type (QTextDocument::ResourceType) that
// markup names with url; not for data: URLs, which hold their content themselves.
QVariant logResource(int type, const QUrl &url);

#endif
