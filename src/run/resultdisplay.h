#ifndef MORVEL_RESULTDISPLAY_H
#define MORVEL_RESULTDISPLAY_H

#include <QString>

class QTextEdit;

// Shows a result file at the end of the log, looking as one append of its whole text would:
// plain text line by line, rich text rendered, then the view scrolled to the anchor "TITLE".
// Returns false, showing nothing, when the file can be neither opened nor created.
//
// A result up to resultShownNowBytes is complete when this returns. A larger one is prepared off
// the GUI thread, so that the dialog never stops for long: a plain one is then shown in pieces
// laid out as they come into view, a rich one is laid out in slices from the event loop. Until
// it is shown, resultDisplayBusy() is true. Of a result larger than the log can take
// (more than 10 MiB, or a paragraph or total height the text layout cannot handle in time), the
// log shows the first part and then an error line that names the file.
bool showResultFile(QTextEdit *log, const QString &path);

// Stops a display still in progress in this log (for example before the log is cleared).
// A display also stops by itself when someone else clears or replaces the log's text.
void cancelResultDisplay(QTextEdit *log);

// True while a result is still being shown in this log.
bool resultDisplayBusy(QTextEdit *log);

// Results up to this size are shown before showResultFile returns.
constexpr qint64 resultShownNowBytes = 256 * 1024;

#endif
