#ifndef MORVEL_LOGSTYLE_H
#define MORVEL_LOGSTYLE_H

#include <QList>
#include <QString>
#include <QStringList>

// The log's line styles. Every coloured message of the dialog is made here around its words;
// the line breaks around a message are part of its text, so each says which it has.
namespace LogStyle {
enum Breaks { NoBreak = 0, BreakBefore = 1, BreakAfter = 2, BreaksAround = 3, Unclosed = 4 };

inline QString coloured(const char *colour, const QString &words, int breaks)
{
    QString line = breaks & BreakBefore ? QStringLiteral("<br>") : QString();
    line += QStringLiteral("<b><font color=") + QLatin1String(colour) + QLatin1Char('>') + words;
    if (!(breaks & Unclosed))
        line += QStringLiteral("</font></b>");
    if (breaks & BreakAfter)
        line += QStringLiteral("<br>");
    return line;
}

inline QString error(const QString &words, int breaks = BreaksAround)
{
    return coloured("#FF3300", words, breaks);
}

inline QString success(const QString &words, int breaks)
{
    return coloured("#00CC00", words, breaks);
}

inline QString heading(const QString &words)
{
    return QStringLiteral("<br><b>") + words + QStringLiteral("</b><br>");
}
} // namespace LogStyle

// Log lines in groups, in the order they are shown. A long group (an echoed table, the atoms of
// a file) is shortened on its own, so that no heading or closing line is ever left out.
using LogGroups = QList<QStringList>;

#endif
