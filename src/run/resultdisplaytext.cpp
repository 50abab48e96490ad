#include "resultdisplaytext.h"
#include "logstyle.h"

#include <QStringDecoder>

#include <algorithm>
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

namespace {

// Whether a line of this text could take a different direction than the one before it.
bool hasDirectionalText(const QString &text)
{
    const qsizetype size = text.size();
    const QChar *data = text.constData();
    for (qsizetype i = 0; i < size; ++i) {
        char32_t c = data[i].unicode();
        if (c < 0x0590)
            continue; // below Hebrew, every letter is left-to-right
        if (QChar::isHighSurrogate(c) && i + 1 < size && data[i + 1].isLowSurrogate()) {
            c = QChar::surrogateToUcs4(data[i].unicode(), data[i + 1].unicode());
            ++i;
        }
        switch (QChar::direction(c)) {
        case QChar::DirR:
        case QChar::DirAL:
        case QChar::DirAN:
        case QChar::DirRLE:
        case QChar::DirRLO:
        case QChar::DirLRE:
        case QChar::DirLRO:
        case QChar::DirPDF:
        case QChar::DirRLI:
        case QChar::DirLRI:
        case QChar::DirFSI:
        case QChar::DirPDI:
            return true;
        default:
            break;
        }
    }
    return false;
}

bool isParagraphBreak(char16_t c)
{
    return c == u'\n' || c == u'\r' || c == QChar::ParagraphSeparator || c == 0xfdd0 || c == 0xfdd1;
}

} // namespace

bool joinLines(QString &text, qsizetype paragraphChars)
{
    if (hasDirectionalText(text))
        return false;
    // The breaks that stay: the last one (the text's end stays an empty paragraph, as in the
    // log), frame marks, and the first break after paragraphChars characters.
    qsizetype lastBreak = text.size() - 1;
    while (lastBreak >= 0 && !isParagraphBreak(text.at(lastBreak).unicode()))
        --lastBreak;
    if (lastBreak > 0 && text.at(lastBreak) == u'\n' && text.at(lastBreak - 1) == u'\r')
        --lastBreak;

    QChar *data = text.data();
    const qsizetype size = text.size();
    qsizetype out = 0;
    qsizetype paragraphStart = 0;
    bool joined = false;
    for (qsizetype in = 0; in < size; ++in) {
        const char16_t c = data[in].unicode();
        if (!isParagraphBreak(c)) {
            data[out++] = data[in];
            continue;
        }
        const qsizetype breakLength = c == u'\r' && in + 1 < size && data[in + 1] == u'\n' ? 2 : 1;
        if (c == 0xfdd0 || c == 0xfdd1 || in >= lastBreak || out - paragraphStart >= paragraphChars) {
            for (qsizetype k = 0; k < breakLength; ++k)
                data[out++] = data[in + k];
            paragraphStart = out;
        } else {
            data[out++] = QChar::LineSeparator;
            joined = true;
        }
        in += breakLength - 1;
    }
    text.truncate(out);
    return joined;
}

QList<qsizetype> pieceBreaks(const QString &text, qsizetype pieceChars)
{
    QList<qsizetype> breaks;
    qsizetype from = std::max<qsizetype>(pieceChars, 1);
    while (from < text.size()) {
        const qsizetype lineFeed = text.indexOf(QLatin1Char('\n'), from);
        if (lineFeed < 0)
            break;
        breaks.append(lineFeed > 0 && text.at(lineFeed - 1) == QLatin1Char('\r') ? lineFeed - 1 : lineFeed);
        from = lineFeed + 1 + pieceChars;
    }
    return breaks;
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
