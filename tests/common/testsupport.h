#ifndef MORVEL_TESTSUPPORT_H
#define MORVEL_TESTSUPPORT_H

#include "import.h"

#include <QApplication>
#include <QDir>
#include <QFile>
#include <QFileDialog>
#include <QMessageBox>
#include <QPointer>
#include <QPushButton>
#include <QTemporaryDir>
#include <QTimer>

#include <functional>
#include <memory>

inline void writeFile(const QString &path, const QByteArray &bytes)
{
    QFile f(path);
    if (!f.open(QIODevice::WriteOnly | QIODevice::Truncate) || f.write(bytes) != bytes.size())
        qFatal("cannot write %s", qPrintable(path));
}

inline QByteArray readFile(const QString &path)
{
    QFile f(path);
    return f.open(QIODevice::ReadOnly) ? f.readAll() : QByteArray("<none>");
}

// The log as the user reads it: its non-empty lines, trimmed.
inline QStringList logLines(const QTextEdit *log)
{
    QStringList lines = log->toPlainText().split(QLatin1Char('\n'));
    for (QString &line : lines)
        line = line.trimmed();
    lines.removeAll(QString());
    return lines;
}

// Plays the user's part in the modal windows a slot opens: each expected window, in order, is
// answered by one step. They run nested event loops, so a timer looks for them from there.
class ModalDriver : public QObject
{
public:
    ModalDriver()
    {
        connect(&timer, &QTimer::timeout, this, &ModalDriver::poll);
        timer.start(5);
    }

    // The next file dialog: choose path, or cancel when path is empty.
    void chooseFile(const QString &path)
    {
        steps.append([this, path](QWidget *w) {
            auto *dialog = qobject_cast<QFileDialog *>(w);
            if (!dialog)
                return unexpected(w);
            seen.append(dialog->windowTitle() + " | " + dialog->nameFilters().join(";;") + " | "
                        + dialog->directory().absolutePath());
            if (path.isEmpty())
                return dialog->reject();
            // Once the dialog is active its name field has the focus, and selectFile leaves it alone.
            if (QWidget *focused = dialog->focusWidget())
                focused->clearFocus();
            dialog->selectFile(path);
            static_cast<QDialog *>(dialog)->accept();
        });
    }

    void answerBox(QMessageBox::StandardButton button)
    {
        steps.append([this, button](QWidget *w) {
            auto *box = qobject_cast<QMessageBox *>(w);
            if (!box || !box->button(button))
                return unexpected(w);
            seen.append(box->windowTitle() + " | " + box->text() + " | " + box->informativeText());
            box->button(button)->click();
        });
    }

    bool allAnswered() const { return steps.isEmpty() && problems.isEmpty(); }

    QStringList seen; // one line per window, in order
    QStringList problems;

private:
    void poll()
    {
        QWidget *w = QApplication::activeModalWidget();
        if (!w || !w->isVisible() || w == handled)
            return;
        handled = w;
        if (steps.isEmpty())
            return unexpected(w);
        // Qt does not fire a timer again while its handler runs: a window that the answer opens
        // is looked for by another one.
        QTimer nested;
        connect(&nested, &QTimer::timeout, this, &ModalDriver::poll);
        nested.start(5);
        steps.takeFirst()(w);
    }

    void unexpected(QWidget *w)
    {
        problems.append(QLatin1String("unexpected ") + w->metaObject()->className());
        if (auto *dialog = qobject_cast<QDialog *>(w))
            dialog->reject();
    }

    QTimer timer;
    QPointer<QWidget> handled;
    QList<std::function<void(QWidget *)>> steps;
};

// One dialog whose binaries directory (the current directory) and working directory are fresh.
// binaries.txt names the programs ./conv and ./morvel, shell scripts that copy the input through;
// or, given their paths, the reference stand-ins.
struct Job
{
    QTemporaryDir bin;
    QString previous = QDir::currentPath();
    QString work = bin.path() + QStringLiteral("/work");
    std::unique_ptr<Import> dlg;

    explicit Job(const QString &converter = QString(), const QString &morvel = QString())
    {
        QDir::setCurrent(bin.path());
        QDir().mkdir(work);
        writeFile(file("morvelpartxt.txt", bin.path()), "PART");
        script("conv", "cp \"$1\" \"$2\"");
        script("morvel", "cat morvel.in > MORVEL.OUT");
        writeFile(file("binaries.txt", bin.path()), "MORVEL " + (morvel.isEmpty() ? "./morvel" : morvel.toUtf8())
                                                        + "\nPARSER " + (converter.isEmpty() ? "./conv" : converter.toUtf8()));
        dlg = std::make_unique<Import>();
    }
    ~Job()
    {
        dlg.reset();
        QDir::setCurrent(previous);
    }
    QString file(const QString &name, const QString &dir = QString()) const
    {
        return (dir.isEmpty() ? work : dir) + QLatin1Char('/') + name;
    }
    void script(const QString &name, const QByteArray &body) const
    {
        writeFile(file(name, bin.path()), "#!/bin/sh\n" + body + "\n");
        QFile(file(name, bin.path())).setPermissions(QFileDevice::ExeOwner | QFileDevice::ReadOwner);
    }
    // Takes the file (written first unless bytes is null) as the input, in the given format.
    void choose(const QString &name, const QByteArray &bytes, int format) const
    {
        if (!bytes.isNull())
            writeFile(file(name), bytes);
        dlg->InputBox->setCurrentIndex(format);
        dlg->takeInputFile(file(name));
    }
    QByteArray bytes(const QString &name) const { return readFile(file(name)); }
    bool idle() const { return dlg->importButton->isEnabled() && !dlg->killbutton->isEnabled(); }
    QString text() const { return dlg->importlog->toPlainText(); }
    QStringList lines() const { return logLines(dlg->importlog); }
    bool shownRed() const { return dlg->importlog->toHtml().contains(QLatin1String("#ff3300")); }
};

// A CIF file the converter scripts take as it is: it has oxidation numbers, so nothing is asked.
inline const QByteArray cifWithNumbers = "data_x\n_atom_type_oxidation_number\n";

#endif
