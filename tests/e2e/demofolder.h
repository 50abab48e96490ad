#ifndef MORVEL_DEMOFOLDER_H
#define MORVEL_DEMOFOLDER_H

#include <QDir>
#include <QFile>
#include <QFileInfo>
#include <QTemporaryDir>

// A private copy of the demo folder with the two stand-in programs beside binaries.txt, which
// names them ./morvel and ./cif_parser. While the object lives it is the process's current
// directory, so an Import built then reads its configuration there and jobs run there too.
class DemoFolder
{
public:
    DemoFolder(const QString &demoDir, const QString &parserPath, const QString &morvelPath)
        : previous(QDir::currentPath())
    {
        const QDir demo(demoDir);
        const QStringList names = demo.entryList(QDir::Files);
        if (!dir.isValid() || names.isEmpty()) {
            problem = QStringLiteral("no demo files in ") + demoDir;
            return;
        }
        for (const QString &name : names) {
            if (!QFile::copy(demo.filePath(name), file(name)))
                problem = QStringLiteral("cannot copy ") + name;
        }
        // Linked as the demo command does; Windows has no symbolic links for everyone.
        const QList<QPair<QString, QString>> programs{{parserPath, QStringLiteral("cif_parser")},
                                                      {morvelPath, QStringLiteral("morvel")}};
        for (const auto &program : programs) {
#ifdef Q_OS_WIN
            const bool placed = QFile::copy(program.first, file(program.second + QStringLiteral(".exe")));
#else
            const bool placed = QFile::link(program.first, file(program.second));
#endif
            if (!placed)
                problem = QStringLiteral("cannot place ") + program.first;
        }
        QDir::setCurrent(dir.path());
    }
    ~DemoFolder() { QDir::setCurrent(previous); }

    DemoFolder(const DemoFolder &) = delete;
    DemoFolder &operator=(const DemoFolder &) = delete;

    // Empty when the folder is complete.
    QString error() const { return problem; }
    QString path() const { return dir.path(); }
    QString file(const QString &name) const { return dir.path() + QLatin1Char('/') + name; }

    QByteArray bytes(const QString &name) const
    {
        QFile f(file(name));
        return f.open(QIODevice::ReadOnly) ? f.readAll() : QByteArray("<unreadable>");
    }

private:
    QTemporaryDir dir;
    QString previous;
    QString problem;
};

#endif
