#ifndef MORVEL_LINEREADER_H
#define MORVEL_LINEREADER_H

#include <QString>

// Reads a text held in memory line by line, the way QTextStream::readLine() does on a file:
// a line end is LF or CR LF and is not part of the line; a lone CR inside a line is kept;
// after the last line atEnd() is true and readLine() gives an empty string.
class LineReader
{
public:
    explicit LineReader(const QString &text) : text(text) {}

    bool atEnd() const { return pos >= text.size(); }

    QString readLine()
    {
        if (atEnd())
            return QString();
        qsizetype end = text.indexOf(QLatin1Char('\n'), pos);
        qsizetype next = end + 1;
        if (end < 0)
            end = next = text.size();
        qsizetype stop = end;
        if (stop > pos && text.at(stop - 1) == QLatin1Char('\r'))
            --stop;
        const QString line = text.mid(pos, stop - pos);
        pos = next;
        return line;
    }

private:
    QString text; // shared, not copied
    qsizetype pos = 0;
};

#endif
