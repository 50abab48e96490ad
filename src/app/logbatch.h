#ifndef MORVEL_LOGBATCH_H
#define MORVEL_LOGBATCH_H

#include <QStringList>
#include <QTextEdit>

// At most this many lines of one list reach the log: its first and last halves. A table or a CIF
// file of hundreds of thousands of lines would otherwise keep the dialog busy for many seconds,
// and nobody reads such a list in the log.
constexpr int logListLimit = 10000;

// The line that stands for the lines left out of a long list.
inline QString leftOutLine(qsizetype count)
{
    return QStringLiteral("<br><b><font color=#FF3300> ") + QString::number(count)
           + QStringLiteral(" more lines are not shown in the log. </font></b><br>");
}

// Appends a list of log lines, one append each, but no more than logListLimit of them.
inline void appendLogLines(QTextEdit *log, const QStringList &lines)
{
    const qsizetype half = logListLimit / 2;
    if (lines.size() <= logListLimit) {
        for (const QString &line : lines)
            log->append(line);
        return;
    }
    for (qsizetype i = 0; i < half; ++i)
        log->append(lines.at(i));
    log->append(leftOutLine(lines.size() - 2 * half));
    for (qsizetype i = lines.size() - half; i < lines.size(); ++i)
        log->append(lines.at(i));
}

#endif
