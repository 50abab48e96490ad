#ifndef MORVEL_LOGSTYLE_H
#define MORVEL_LOGSTYLE_H

#include <QString>

// The log's line styles. Every message of the dialog is one of these around its words.
namespace LogStyle {
inline QString error(const QString &words)
{
    return QStringLiteral("<br><b><font color=#FF3300>") + words + QStringLiteral("</font></b><br>");
}
inline QString heading(const QString &words)
{
    return QStringLiteral("<br><b>") + words + QStringLiteral("</b><br>");
}
} // namespace LogStyle

#endif
