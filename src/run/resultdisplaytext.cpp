#include "resultdisplaytext.h"
#include "logstyle.h"

#include <QStringDecoder>

#include <cmath>

namespace ResultText {

QString decodeResult(const QByteArray &bytes, bool complete)
{
    const auto bom = QStringConverter::encodingForData(bytes);
    const QStringConverter::Encoding encoding = bom ? *bom : QStringConverter::Utf8;
    // A stateless decoder turns a sequence cut by the end of the file into U+FFFD; a stateful one
    // keeps it back, which is right when the bytes stop at the display limit, not at the file's end.
    QStringDecoder decoder(encoding, complete ? QStringConverter::Flag::Stateless
                                              : QStringConverter::Flag::Default);
    QString text = decoder.decode(bytes);
    text.replace(QChar(0), QChar::ReplacementCharacter);
    return text;
}

double paragraphHeight(qsizetype chars, qsizetype lineBreaks, const LogGeometry &geometry)
{
    double lines = double(lineBreaks) + 1.0;
    if (geometry.textWidth > 0.0)
        lines += std::floor(double(chars) * geometry.averageCharWidth / geometry.textWidth);
    return lines * geometry.lineHeight;
}

qsizetype plainShownLength(const QString &text, const LogGeometry &geometry, double heightBefore)
{
    // The log splits a plain text into paragraphs at LF, CR, CR LF and the paragraph separators;
    // a line separator breaks the line inside the paragraph.
    double height = heightBefore;
    qsizetype paragraphStart = 0;
    qsizetype lineBreaks = 0;
    const qsizetype size = text.size();
    const QChar *data = text.constData();
    for (qsizetype i = 0; i <= size; ++i) {
        const char16_t c = i < size ? data[i].unicode() : u'\n';
        if (c == QChar::LineSeparator) {
            ++lineBreaks;
            continue;
        }
        const bool paragraphEnd = c == u'\n' || c == u'\r' || c == QChar::ParagraphSeparator
                                  || c == 0xfdd0 || c == 0xfdd1;
        if (!paragraphEnd) {
            if (i - paragraphStart >= maxParagraphChars) {
                qsizetype cut = paragraphStart + maxParagraphChars;
                if (data[cut].isLowSurrogate())
                    --cut;
                return cut;
            }
            continue;
        }
        height += paragraphHeight(i - paragraphStart, lineBreaks, geometry);
        if (height > maxLogHeight)
            return paragraphStart;
        if (c == u'\r' && i + 1 < size && data[i + 1] == u'\n')
            ++i;
        paragraphStart = i + 1;
        lineBreaks = 0;
    }
    return size;
}

QString tooLargeLine(const QString &path, qint64 fileSize)
{
    return LogStyle::error(
        QStringLiteral(" The result is larger than the log shows (%1 bytes): open %2 in the editor "
                       "to read all of it. ")
            .arg(fileSize)
            .arg(path.toHtmlEscaped()));
}

} // namespace ResultText
