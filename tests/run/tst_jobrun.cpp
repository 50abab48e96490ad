#include "import.h"
#include "jobsupport.h"
#include "runlogic.h"
#include "testsupport.h"

#include <QMessageBox>
#include <QPushButton>
#include <QTimer>
#include <QtTest>

#include <memory>

namespace {
// What the parameter file writer logs for the start-up form, with "PART" in morvelpartxt.txt.
QStringList params(int format)
{
    return {QStringLiteral("<br><b> Writing morvel.par file: </b><br>"), QStringLiteral("PART"),
            QStringLiteral(" Job options : "), QStringLiteral(" ------------------- "),
            QStringLiteral(" DMAX       \t= 4"), QStringLiteral(" TOLERANCE   \t= 10"),
            QStringLiteral(" THRESH     \t= 3.1"), QStringLiteral(" INPUT      \t= ") + QString::number(format),
            QStringLiteral(" OUTPUT     \t= 0"), QStringLiteral(" PRINT TYPE \t= 0"),
            QStringLiteral(" MAX V-ATOMS\t= 11"), QStringLiteral("<br><b> Done.  </b><br>")};
}

// Answers the next modal message box with the given button and notes what it said.
void answerBox(QMessageBox::StandardButton answer, QString *seen)
{
    QTimer::singleShot(0, [=] {
        for (QWidget *w : QApplication::topLevelWidgets())
            if (auto *box = qobject_cast<QMessageBox *>(w); box && box->isVisible()) {
                *seen = box->windowTitle() + '|' + box->text() + '|' + box->informativeText();
                box->button(answer)->click();
            }
    });
}
} // namespace

class TestJobRun : public QObject
{
    Q_OBJECT

private slots:
    void parameterLine_data()
    {
        QTest::addColumn<float>("dmax");
        QTest::addColumn<int>("format");
        QTest::addColumn<int>("outputIndex");
        QTest::addColumn<int>("choice"); // polyhedra details and print type
        QTest::addColumn<int>("atoms");
        QTest::addColumn<QString>("line");
        QTest::newRow("start-up form") << 4.0f << 0 << 0 << 0 << 11
                                       << "   4          0   0   0   0    10   1.6 3.1   11 .001 0.5";
        QTest::newRow("old ICSD, ionic radii") << 4.0f << 2 << 2 << 1 << 11
                                               << "   4          2   1  -1   1    10   1.6 3.1   11 .001 0.5";
        QTest::newRow("empty DMAX, 20 atoms") << QString().toFloat() << 0 << 1 << 0 << 20
                                              << "   0          0   0   1   0    10   1.6 3.1   20 .001 0.5";
        QTest::newRow("too long, shifts") << QStringLiteral("123.456").toFloat() << 1 << 0 << 0 << 11
                                          << "123.456          1   0   0   0    10   1.6 3.1   11 .001 0.5";
        QTest::newRow("exponent form") << 1.0e6f << 0 << 0 << 0 << 11
                                       << "1e+06          0   0   0   0    10   1.6 3.1   11 .001 0.5";
    }

    void parameterLine()
    {
        QFETCH(float, dmax);
        QFETCH(int, format);
        QFETCH(int, outputIndex);
        QFETCH(int, choice);
        QFETCH(int, atoms);
        const JobOptions o{dmax, 10.0f, QStringLiteral("3.1").toFloat(), atoms, format,
                           outputLevelForIndex(outputIndex), choice, choice};
        QTEST(::parameterLine(o), "line");
        const QStringList echo = jobOptionsEcho(o);
        QCOMPARE(echo.mid(5, 2), QStringList({" INPUT      \t= " + QString::number(format),
                                              " OUTPUT     \t= " + QString::number(o.outputLevel)}));
        QFETCH(QString, line);
        QCOMPARE(echo.at(2), " DMAX       \t= " + line.section(' ', 0, 0, QString::SectionSkipEmpty));
    }

    void parameterFile_data()
    {
        QTest::addColumn<QByteArray>("part"); // null: no morvelpartxt.txt
        QTest::addColumn<bool>("parBlocked");
        QTest::addColumn<QByteArray>("file");
        QTest::addColumn<QStringList>("log");
        const QByteArray line = "   4          0   0   0   0    10   1.6 3.1   11 .001 0.5\n";
        QStringList withText = params(0);
        withText[1] = "two\r\nlines";
        QTest::newRow("part text kept as is") << QByteArray("two\r\nlines") << false
                                              << line + " two\r\nlines\n" << withText;
        withText[1] = "";
        QTest::newRow("empty part file") << QByteArray("") << false << line + " \n" << withText;
        withText[1] = "<br><b><font color=#FF3300> Something went wrong while opening \"morvelpartxt.txt\" file! "
                      "</font></b><br>";
        QTest::newRow("no part file") << QByteArray() << false << line << withText;
        QTest::newRow("parameter file blocked")
            << QByteArray("PART") << true << QByteArray("<none>")
            << QStringList{params(0).first(), "<br><b><font color=#FF3300> Something went wrong while opening a "
                                              "new \"morvel.par\" file! </font></b><br>"};
    }

    void parameterFile()
    {
        QFETCH(QByteArray, part);
        QFETCH(bool, parBlocked);
        Job job;
        QFile::remove(job.bin.file("morvelpartxt.txt"));
        if (!part.isNull())
            writeFile(job.bin.file("morvelpartxt.txt"), part);
        if (parBlocked)
            QDir(job.work).mkdir("morvel.par");
        else // an earlier, longer file must leave nothing behind
            writeFile(job.work + "/morvel.par", QByteArray(500, 'x'));
        job.choose("a.cif", "data", 0);
        job.dlg->importlog->clear();
        job.dlg->writeParameterFile();
        QTEST(job.file("morvel.par"), "file");
        QFETCH(QStringList, log);
        QCOMPARE(job.log(), shown(log));
    }

    void noInputFile()
    {
        Job job;
        Import fresh; // the same start-up report
        fresh.importlog->append(
            "<br><b><font color=#FF3300> Please set Input file before starting ! </font></b><br>");
        job.dlg->importButton->click();
        QCOMPARE(job.log(), fresh.importlog->toHtml());
        QVERIFY(job.idle());
    }

    void suffixQuestion_data()
    {
        QTest::addColumn<QString>("name");
        QTest::addColumn<int>("answer");
        QTest::addColumn<bool>("asked");
        QTest::newRow("x.txt, Cancel") << "x.txt" << int(QMessageBox::Cancel) << true;
        QTest::newRow("x.cif.txt, Yes") << "x.cif.txt" << int(QMessageBox::Yes) << true;
        QTest::newRow("X.CIF, no question") << "X.CIF" << int(QMessageBox::Cancel) << false;
    }

    void suffixQuestion()
    {
        QFETCH(QString, name);
        QFETCH(int, answer);
        QFETCH(bool, asked);
        Job job;
        job.choose(name, "data", 0);
        QString seen;
        answerBox(QMessageBox::StandardButton(answer), &seen);
        job.dlg->importButton->click();
        if (asked)
            QCOMPARE(seen, QStringLiteral("WARNING!|The selected file does not have the \".cif\" suffix !|Continue anyway?"));
        if (asked && answer == QMessageBox::Cancel) {
            QCOMPARE(job.log(), shown(params(0)));
            QVERIFY(job.idle());
            QCOMPARE(job.dlg->importProcess->state(), QProcess::NotRunning);
            return;
        }
        QTRY_VERIFY(job.idle());
        QTRY_COMPARE(job.file("MORVEL.OUT"), QByteArray("data"));
        QVERIFY(seen.isEmpty() == !asked);
    }

    void cifRunLog()
    {
        Job job;
        job.choose("in.cif", "DATA 1\nDATA 2", 0);
        writeFile(job.work + "/MORVEL.OUT", "earlier");
        job.dlg->importButton->click();
        QVERIFY(job.busy());
        QTRY_VERIFY(job.idle());
        const QString command = QString("\"./conv\" \"%1/in.cif\" \"%1/morvel.in\"").arg(job.work);
        const QStringList head = params(0) + QStringList{running, starting, command, done, exists,
                                                         "<b>It has been renamed as :</b>  /MORVEL.OUT.old1", morvelStart};
        QCOMPARE(job.text(), shown(head + result("DATA 1\nDATA 2"), false));
        QVERIFY(job.log().startsWith(shown(head).section("</body>", 0, 0)));
        QCOMPARE(job.file("MORVEL.OUT.old1"), QByteArray("earlier"));
    }

    void copyPath_data()
    {
        QTest::addColumn<QString>("name");
        QTest::addColumn<QByteArray>("bytes"); // null: the chosen file has vanished
        QTest::addColumn<QByteArray>("staged");
        QTest::addColumn<QStringList>("lines");
        const QString copying = "<br><b>  Copying input file as \"morvel.in\" file </b>";
        QByteArray all("A\r\nB\r\n");
        for (int b = 0; b < 256; ++b)
            all += char(b);
        QTest::newRow("shorter than earlier") << "a.txt" << QByteArray("short\n") << QByteArray("short\n")
                                              << QStringList{copying};
        QTest::newRow("CR LF and every byte") << "a.txt" << all << all << QStringList{copying};
        QTest::newRow("empty") << "a.txt" << QByteArray("") << QByteArray("") << QStringList{copying};
        QTest::newRow("vanished source") << "gone.txt" << QByteArray() << QByteArray("")
            << QStringList{copying, "<br><b><font color=#FF3300> Something went wrong while opening input file! "
                                    "</font></b><br>", "argument was %1/gone.txt"};
        QTest::newRow("the staged file itself") << "morvel.in" << QByteArray("self") << QByteArray("self")
                                                << QStringList{"<br><b> Input as \"morvel.in\" file </b>"};
        QTest::newRow("Morvel.In is another file here") << "Morvel.In" << QByteArray("other")
                                                        << QByteArray("other") << QStringList{copying};
    }

    void copyPath()
    {
        QFETCH(QString, name);
        QFETCH(QByteArray, bytes);
        QFETCH(QStringList, lines);
        Job job;
        job.script("morvel", "cat morvel.in > MORVEL.OUT; exec sleep 0.3");
        if (name != "morvel.in")
            writeFile(job.work + "/morvel.in", "a much longer earlier input file\n");
        job.choose(name, bytes, 2);
        job.dlg->importButton->click();
        QVERIFY(job.busy()); // fault 1: nothing may start a run while MORVEL runs
        QTRY_VERIFY(job.idle());
        QTEST(job.file("morvel.in"), "staged");
        QTEST(job.file("MORVEL.OUT"), "staged");
        QVERIFY(QFile::exists(job.work + '/' + name) == !bytes.isNull());
        lines.replaceInStrings("%1", job.work);
        const QString head = shown(params(2) + lines + QStringList{done, morvelStart}).section("</body>", 0, 0);
        QVERIFY2(job.log().startsWith(head), qPrintable(job.text()));
    }

    void converterReportsError()
    {
        Job job;
        job.script("conv", "echo NO ERRORS; while [ ! -e go ]; do sleep 0.02; done\n"
                           "echo ERROR; while [ ! -e stop ]; do sleep 0.02; done");
        job.choose("in.cif", "data", 0);
        job.dlg->importButton->click();
        const QString command = QString("\"./conv\" \"%1/in.cif\" \"%1/morvel.in\"").arg(job.work);
        const QStringList head = params(0) + QStringList{running, starting, command};
        QTRY_COMPARE(job.log(), shown(head + errorSeen));
        QVERIFY(job.busy()); // the converter still runs
        writeFile(job.work + "/go", "");
        QTRY_COMPARE(job.log(), shown(head + errorSeen + errorSeen));
        writeFile(job.work + "/stop", "");
        QTRY_VERIFY(job.idle());
        QCOMPARE(job.log(), shown(head + errorSeen + errorSeen));
        QVERIFY(!QFile::exists(job.work + "/MORVEL.OUT"));
    }

    void converterFails_data()
    {
        QTest::addColumn<QByteArray>("body"); // null: the converter is missing
        QTest::addColumn<QStringList>("lines");
        const QString command = "\"./conv\" \"%1/in.cif\" \"%1/morvel.in\"";
        QTest::newRow("exit 2") << QByteArray("exit 2") << QStringList{running, starting, command, failure};
        QTest::newRow("cannot start") << QByteArray()
                                      << QStringList{running, " error occured : 0", failure, command};
        QTest::newRow("killed by a signal") << QByteArray("kill -KILL $$")
            << QStringList{running, starting, command, " error occured : 1", failure, failure};
    }

    void converterFails()
    {
        QFETCH(QByteArray, body);
        QFETCH(QStringList, lines);
        Job job;
        QFile::remove(job.bin.file("conv"));
        if (!body.isNull())
            job.script("conv", body);
        job.choose("in.cif", "data", 0);
        job.dlg->importButton->click();
        lines.replaceInStrings("%1", job.work);
        QTRY_COMPARE(job.log(), shown(params(0) + lines));
        QTRY_VERIFY(job.idle());
        QTest::qWait(50);
        QCOMPARE(job.log(), shown(params(0) + lines));
        QVERIFY(!QFile::exists(job.work + "/MORVEL.OUT"));
    }

    void kill_data()
    {
        QTest::addColumn<int>("format");
        QTest::addColumn<QStringList>("tail");
        QTest::newRow("converter") << 0 << killed + QStringList{" error occured : 1", failure, failure};
        QTest::newRow("MORVEL") << 1 << killed + QStringList{morvelFailure} + result("");
    }

    void kill()
    {
        QFETCH(int, format);
        QFETCH(QStringList, tail);
        Job job;
        job.script(format == 0 ? "conv" : "morvel", "exec sleep 30");
        job.choose("in.cif", "data", format);
        job.dlg->importButton->click();
        QVERIFY(job.busy());
        job.dlg->killbutton->click();
        QTRY_VERIFY(job.idle());
        QTRY_VERIFY(job.text().endsWith(shown(tail, false)));
        QCOMPARE(job.dlg->morvelProcess->state(), QProcess::NotRunning);
        job.dlg->killImport(); // with nothing running: both lines, still idle
        QVERIFY(job.logEndsWith(killed));
        QVERIFY(job.idle());
    }

    void keptResult_data()
    {
        QTest::addColumn<int>("taken");
        QTest::addColumn<QString>("program");
        QTest::addColumn<QStringList>("tail");
        QTest::addColumn<QByteArray>("result");
        QTest::addColumn<QString>("kept");
        const QString renamed = "<b>It has been renamed as :</b>  /MORVEL.OUT.old";
        QTest::newRow("old1 and old2 taken") << 2 << "./morvel" << QStringList{renamed + "3", morvelStart}
                                             << QByteArray("new") << "MORVEL.OUT.old3";
        QTest::newRow("all 100 taken") << 100 << "./morvel"
            << QStringList{"<br><b><font color=#FF3300> The earlier \"MORVEL.OUT\" could not be renamed as "
                           "\"MORVEL.OUT.old1\" to \"MORVEL.OUT.old100\": MORVEL has not been started ! </font></b><br>"}
            << QByteArray("earlier") << "";
        QTest::newRow("MORVEL cannot start") << 0 << "./missing"
            << QStringList{renamed + "1", morvelFailure} + result("") << QByteArray("") << "MORVEL.OUT.old1";
    }

    void keptResult()
    {
        QFETCH(int, taken);
        QFETCH(QStringList, tail);
        QFETCH(QString, kept);
        Job job;
        for (int n = 1; n <= taken; ++n)
            writeFile(job.work + "/MORVEL.OUT.old" + QString::number(n), QByteArray::number(n));
        writeFile(job.work + "/MORVEL.OUT", "earlier");
        QFETCH(QString, program);
        job.dlg->morvelProgram = program;
        job.choose("a.txt", "new", 1);
        job.dlg->importButton->click();
        QTRY_VERIFY(job.idle());
        QTRY_VERIFY(job.log().contains(paragraphs(shown(QStringList{done, exists} + tail)).section("</body>", 0, 0)));
        QTEST(job.file("MORVEL.OUT"), "result");
        QVERIFY(kept.isEmpty() || job.file(kept) == "earlier");
        QCOMPARE(job.file("MORVEL.OUT.old2"), QByteArray(taken ? "2" : "<none>"));
    }

    void resultDisplay_data()
    {
        QTest::addColumn<QByteArray>("text");
        QTest::addColumn<int>("code");
        QTest::newRow("plain") << QByteArray("line 1\n    line 2  \n") << 0;
        QTest::newRow("rich with TITLE, exit 3")
            << QByteArray("<html><body><p>head   er</p><a name=\"TITLE\">Title</a><p>rest</p></body></html>") << 3;
    }

    void resultDisplay()
    {
        QFETCH(QByteArray, text);
        QFETCH(int, code);
        Job job;
        writeFile(job.bin.file("result"), text);
        job.script("morvel", "cat '" + job.bin.file("result").toUtf8() + "' > MORVEL.OUT; exit " + QByteArray::number(code));
        job.choose("a.txt", "x", 1);
        job.dlg->importButton->click();
        QTRY_VERIFY(job.idle());
        const QStringList tail = (code ? QStringList{morvelFailure} : QStringList()) + result(QString::fromUtf8(text));
        QTRY_VERIFY(job.text().endsWith(shown(QStringList{morvelStart} + tail, false)));
    }

    void editor()
    {
        Job job;
        job.script("xdg-open", "printf '%s\\n' \"$@\" >> '" + job.bin.file("args").toUtf8() + "'");
        qputenv("PATH", job.bin.path().toUtf8() + ':' + qgetenv("PATH"));
        job.choose("a.txt", "x", 1);
        job.dlg->openButton->click();
        QVERIFY(job.logEndsWith({"<br><b><font color=#FF3300> There is no MORVEL.OUT file in the current "
                                 "directory! </font></b><br>"}));
        writeFile(job.work + "/MORVEL.OUT", "r");
        job.dlg->openButton->click();
        job.dlg->openButton->click();
        const QByteArray arg = job.work.toUtf8() + "/MORVEL.OUT\n";
        QTRY_COMPARE(QFile(job.bin.file("args")).size(), qint64(2 * arg.size()));
        QFile args(job.bin.file("args"));
        QVERIFY(args.open(QIODevice::ReadOnly));
        QCOMPARE(args.readAll(), arg + arg);
    }

    void pathsWithSpacesAndQuotes()
    {
        Job job("job \"one\" dir");
        QDir(job.bin.path()).mkdir("my tools");
        job.script("my tools/conv \"x\"", "printf '%s\\n' \"$@\" > args; cp \"$1\" \"$2\"");
        job.script("my tools/mor vel", "cat morvel.in > MORVEL.OUT");
        job.dlg->parserProgram = "./my tools/conv \"x\"";
        job.dlg->morvelProgram = "./my tools/mor vel";
        job.choose("in put.cif", "spaced", 0);
        job.dlg->importButton->click();
        QTRY_VERIFY(job.idle());
        QCOMPARE(job.file("args"), (job.work + "/in put.cif\n" + job.work + "/morvel.in\n").toUtf8());
        QCOMPARE(job.file("MORVEL.OUT"), QByteArray("spaced"));
        QVERIFY(job.text().contains(
            QString("\"./my tools/conv \"x\"\" \"%1/in put.cif\" \"%1/morvel.in\"").arg(job.work)));
    }
};

QTEST_MAIN(TestJobRun)
#include "tst_jobrun.moc"
