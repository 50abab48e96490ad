#ifndef MORVEL_RESULTDISPLAYTEXT_H
#define MORVEL_RESULTDISPLAYTEXT_H

#include <QByteArray>
#include <QList>
#include <QString>

// The plain-text side of showing a result file: decoding, and how much of it the log can take.
namespace ResultText {

// A result up to this size is read whole; of a larger one the log shows this many first bytes.
constexpr qint64 showLimitBytes = 10 * 1024 * 1024;

// A paragraph is laid out in one piece; one longer than this would stop the dialog for seconds.
constexpr int maxParagraphChars = 512 * 1024;

// The text layout counts in 1/64 pixel in a 32-bit integer (2^25 pixels) and slows down badly
// long before; the log keeps its text well below that height.
constexpr double maxLogHeight = 8388608.0; // 2^23 pixels

// The file's bytes as a text stream reads them: UTF-8 unless a byte-order mark names a Unicode
// encoding (the mark itself is dropped). Invalid sequences and NUL bytes become U+FFFD, so that
// binary bytes neither end the text nor reach the log as control characters. A sequence cut at
// the end of the bytes is U+FFFD when they are the whole file, and dropped when not.
QString decodeResult(const QByteArray &bytes, bool complete = true);

// What the log's text layout needs to estimate the height of a text.
struct LogGeometry
{
    double averageCharWidth = 7.0;
    double lineHeight = 14.0;
    double textWidth = 0.0; // 0: no line wrapping
};

// Estimated height in the log of a paragraph of `chars` characters with `lineBreaks` forced breaks.
double paragraphHeight(qsizetype chars, qsizetype lineBreaks, const LogGeometry &geometry);

// How many characters of a plain text the log can show: all of it, or the length up to the point
// where a paragraph grows beyond maxParagraphChars or the estimated height beyond maxLogHeight.
qsizetype plainShownLength(const QString &text, const LogGeometry &geometry,
                           double heightBefore = 0.0);

// The log lays out a plain text paragraph by paragraph, and each paragraph costs far more than
// its characters. Joins the lines of a result into paragraphs of at least `paragraphChars`
// characters with line separators, which the log shows exactly as it shows one paragraph a line
// (same lines, same heights, the same plain text) when the paragraphs' format has no margins,
// indent or list. Text with right-to-left letters or explicit direction marks is left as it is:
// there a paragraph's direction would carry over from one line to the next. The last line break
// stays a paragraph break. Returns whether anything was joined.
bool joinLines(QString &text, qsizetype paragraphChars = 4096);

// Where a plain text is cut into pieces of about `pieceChars` characters each: the positions of
// line feeds (of the CR of a CR LF) that end a piece, in order. Each later piece starts after one.
QList<qsizetype> pieceBreaks(const QString &text, qsizetype pieceChars);

// The log entry (error style) that follows a result shown only in part.
QString tooLargeLine(const QString &path, qint64 fileSize);

} // namespace ResultText

#endif
