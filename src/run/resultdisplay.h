#ifndef MORVEL_RESULTDISPLAY_H
#define MORVEL_RESULTDISPLAY_H

#include <QString>

class QTextEdit;

// Shows a result file at the end of the log, looking as one append of its whole text would:
// plain text line by line, rich text rendered, then the view scrolled to the anchor "TITLE".
// Returns false, showing nothing, when the file can be neither opened nor created.
bool showResultFile(QTextEdit *log, const QString &path);

// Stops a display still in progress in this log (for example before the log is cleared).
void cancelResultDisplay(QTextEdit *log);

#endif
