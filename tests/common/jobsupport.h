#ifndef MORVEL_JOBSUPPORT_H
#define MORVEL_JOBSUPPORT_H

#include "import.h"
#include "testsupport.h"

#include <QDir>
#include <QFile>
#include <QStringList>
#include <QTextEdit>

#include <memory>

// What the log shows of a run, one entry per append.
inline const QString running = QStringLiteral("<br><b> Running CIF parser tool ...</b><br>");
inline const QString starting = QStringLiteral("-->  Starting CIF parser ...");
inline const QString done = QStringLiteral("<br><b> DONE !!!  </b><br>");
inline const QString morvelStart = QStringLiteral("<br>-->  Starting Morvel ...");
inline const QString failure =
    QStringLiteral("<br><b><font color=#FF3300> Something went wrong with Import procedure ! </font></b><br>");
inline const QString morvelFailure =
    QStringLiteral("<br><b><font color=#FF3300> Something went wrong with morvel program ! </font></b><br>");
inline const QString exists =
    QStringLiteral("<br><b>A \"MORVEL.OUT\" file already exists in the working directory !</b>");
inline const QStringList errorSeen = {
    QStringLiteral("<br><b><font color=#FF3300> Something went wrong with Import procedure ! </font></b>"),
    QStringLiteral("<b><font color=#FF3300> Please check cifparser.log file.</font></b><br>")};
inline const QStringList killed = {QStringLiteral("<b>Killing Import program process</b>"),
                                   QStringLiteral("<b>Killing Morvel program process</b>")};

// The spacing and banner above a result, followed by the result's text.
inline QStringList result(const QString &text)
{
    const QString mid = QString(15, '#') + QString(33, ' ');
    return {" ", " ", QString(61, '#'), mid, QString(15, '#') + "\t\t" + QString(12, ' ') + "MORVEL.OUT  ",
            mid, QString(61, '#') + "<br>", text};
}

// The log as it shows after these appends (as HTML, or as the text the user reads).
inline QString shown(const QStringList &appends, bool html = true)
{
    QTextEdit ref;
    for (const QString &a : appends)
        ref.append(a);
    return html ? ref.toHtml() : ref.toPlainText();
}

// The paragraphs of a log's HTML, without the document header.
inline QString paragraphs(const QString &html)
{
    return html.mid(html.indexOf(QLatin1String("<p ")));
}

// One dialog whose binaries directory (current directory) and working directory are fresh.
struct Job
{
    CurrentDirScope bin;
    QString work;
    std::unique_ptr<Import> dlg;

    explicit Job(const QString &dirName = QStringLiteral("work"))
    {
        QDir(bin.path()).mkpath(dirName);
        work = bin.file(dirName);
        writeFile(bin.file("morvelpartxt.txt"), "PART");
        dlg = std::make_unique<Import>();
        dlg->parserProgram = QStringLiteral("./conv");
        dlg->morvelProgram = QStringLiteral("./morvel");
        script("conv", "cp \"$1\" \"$2\"");
        script("morvel", "cat morvel.in > MORVEL.OUT");
    }
    void script(const QString &name, const QByteArray &body) const
    {
        writeFile(bin.file(name), "#!/bin/sh\n" + body + "\n");
        QFile(bin.file(name)).setPermissions(QFileDevice::ExeOwner | QFileDevice::ReadOwner);
    }
    void choose(const QString &name, const QByteArray &bytes, int format) const
    {
        if (!bytes.isNull())
            writeFile(work + '/' + name, bytes);
        dlg->inputFile = work + '/' + name;
        dlg->workingDir = work;
        dlg->stagedInputPath = work + "/morvel.in";
        dlg->InputBox->setCurrentIndex(format);
    }
    QByteArray file(const QString &name) const
    {
        QFile f(work + '/' + name);
        return f.open(QIODevice::ReadOnly) ? f.readAll() : QByteArray("<none>");
    }
    bool idle() const { return dlg->importButton->isEnabled() && !dlg->killbutton->isEnabled(); }
    bool busy() const { return !dlg->importButton->isEnabled() && dlg->killbutton->isEnabled(); }
    QString log() const { return dlg->importlog->toHtml(); }
    QString text() const { return dlg->importlog->toPlainText(); }
    bool logEndsWith(const QStringList &appends) const { return log().endsWith(paragraphs(shown(appends))); }
};

#endif
