#ifndef MORVEL_TESTSUPPORT_H
#define MORVEL_TESTSUPPORT_H

#include <QDir>
#include <QFile>
#include <QStringList>
#include <QTemporaryDir>
#include <QTextEdit>

// A fresh temporary folder that is the process's current directory while the object lives.
class CurrentDirScope
{
public:
    CurrentDirScope() : previous(QDir::currentPath()) { QDir::setCurrent(dir.path()); }
    ~CurrentDirScope() { QDir::setCurrent(previous); }
    QString path() const { return dir.path(); }
    QString file(const QString &name) const { return dir.path() + QLatin1Char('/') + name; }

private:
    QTemporaryDir dir;
    QString previous;
};

inline void writeFile(const QString &path, const QByteArray &bytes)
{
    QFile f(path);
    if (!f.open(QIODevice::WriteOnly | QIODevice::Truncate))
        qFatal("cannot write %s", qPrintable(path));
    f.write(bytes);
}

// The log's paragraphs as the user reads them, one entry per line of plain text.
inline QStringList logLines(const QTextEdit *log)
{
    return log->toPlainText().split(QLatin1Char('\n'));
}

#endif
