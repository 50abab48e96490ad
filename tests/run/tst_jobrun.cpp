// Whole runs through the Run, Kill and editor buttons, with shell scripts in place of the two
// programs: the job files, the converter's judgement, kept results, the result display.
#include "runlogic.h"
#include "testsupport.h"

#include <QScrollBar>
#include <QtTest>

#include <sys/stat.h>

namespace {
// What the parameter file writer logs for the start-up form, with "PART" in morvelpartxt.txt.
QStringList params(int format)
{
    return {"Writing morvel.par file:", "PART", "Job options :", "-------------------", "DMAX       \t= 4",
            "TOLERANCE   \t= 10", "THRESH     \t= 3.1", "INPUT      \t= " + QString::number(format), "OUTPUT     \t= 0",
            "PRINT TYPE \t= 0", "MAX V-ATOMS\t= 11", "Done."};
}
const QString command = "\"./conv\" \"%1/in.cif\" \"%1/morvel.in\"";
const QStringList converting{"Running CIF parser tool ...", "-->  Starting CIF parser ...", command};
const QString failure = "Something went wrong with Import procedure !";
const QStringList errorSeen{failure, "Please check cifparser.log file."};
const QString morvelFailure = "Something went wrong with morvel program !";
const QStringList banner{QString(61, '#'), QString(15, '#'), QString(15, '#') + "\t\t" + QString(12, ' ') + "MORVEL.OUT",
                         QString(15, '#'), QString(61, '#')};
const QStringList killed{"Killing Import program process", "Killing Morvel program process"};
const QString copying = "Copying input file as \"morvel.in\" file";
const QString exists = "A \"MORVEL.OUT\" file already exists in the working directory !";
const QString renamed = "It has been renamed as : /MORVEL.OUT.old";
const QString morvelStart = "--> Starting Morvel ..."; // rich text: blanks run together
} // namespace

class TestJobRun : public QObject
{
    Q_OBJECT

private slots:
    void jobFiles_data()
    {
        QTest::addColumn<QByteArray>("part");   // morvelpartxt.txt; null: none
        QTest::addColumn<QString>("blocked");   // a directory in this job file's place
        QTest::addColumn<QString>("input");     // the chosen file; "gone": it has vanished
        QTest::addColumn<QByteArray>("par");
        QTest::addColumn<QStringList>("lines");
        const QByteArray line = "   4          1   0   0   0    10   1.6 3.1   11 .001 0.5\n";
        QStringList withPart = params(1);
        withPart[1] = "two";
        withPart.insert(2, "lines");
        QTest::newRow("part text kept as is") << QByteArray("two\r\nlines") << "" << "a.txt" << line + " two\r\nlines\n"
                                              << withPart + QStringList{copying, "DONE !!!", exists, renamed + "1", morvelStart};
        withPart.remove(1, 2);
        QTest::newRow("empty part file") << QByteArray("") << "" << "a.txt" << line + " \n"
                                         << withPart + QStringList{copying, "DONE !!!", exists, renamed + "1", morvelStart};
        withPart.insert(1, "Something went wrong while opening \"morvelpartxt.txt\" file!");
        QTest::newRow("no part file, the staged file itself") << QByteArray() << "" << "morvel.in" << line
            << withPart + QStringList{"Input as \"morvel.in\" file", "DONE !!!", exists, renamed + "1", morvelStart};
        // A job file that was not written stops the run: no DONE, no MORVEL on stale files.
        QTest::newRow("morvel.par cannot be written") << QByteArray("PART") << "morvel.par" << "a.txt" << QByteArray("<none>")
            << QStringList{"Writing morvel.par file:", "Something went wrong while opening a new \"morvel.par\" file!"};
        QTest::newRow("morvel.in cannot be written") << QByteArray("PART") << "morvel.in" << "a.txt" << line + " PART\n"
            << params(1) + QStringList{copying, "Something went wrong while opening a new \"morvel.in\" file!"};
        QTest::newRow("the input has vanished") << QByteArray("PART") << "" << "gone" << line + " PART\n"
            << params(1) + QStringList{copying, "Something went wrong while opening input file!", "argument was %1/gone"};
    }
    void jobFiles()
    {
        QFETCH(QByteArray, part);
        QFETCH(QString, blocked);
        QFETCH(QString, input);
        QFETCH(QStringList, lines);
        Job job;
        QFile::remove(job.file("morvelpartxt.txt", job.bin.path()));
        if (!part.isNull())
            writeFile(job.file("morvelpartxt.txt", job.bin.path()), part);
        writeFile(job.file("morvel.par"), QByteArray(500, 'x')); // an earlier, longer file leaves nothing behind
        if (!blocked.isEmpty()) {
            QFile::remove(job.file(blocked));
            QVERIFY(QDir(job.work).mkdir(blocked));
        }
        writeFile(job.file("MORVEL.OUT"), "earlier");
        job.choose(input, "in", 1);
        if (input == "gone")
            QFile::remove(job.file("gone"));
        job.dlg->importButton->click();
        QTRY_VERIFY(job.idle());
        QTEST(job.bytes("morvel.par"), "par");
        const bool ran = lines.constLast() == morvelStart;
        QCOMPARE(job.lines().mid(0, lines.size()), lines.replaceInStrings("%1", job.work));
        QCOMPARE(job.bytes("MORVEL.OUT"), ran ? QByteArray("in") : QByteArray("earlier"));
        QCOMPARE(job.shownRed(), !ran || part.isNull());
    }

    void cifRun()
    {
        Job job;
        job.choose("in.cif", cifWithNumbers + "DATA 1\nDATA 2", 0);
        writeFile(job.file("MORVEL.OUT"), "earlier");
        job.script("morvel", "cat morvel.in > MORVEL.OUT; exec sleep 0.5");
        job.dlg->importButton->click();
        QVERIFY(!job.idle());
        QTRY_VERIFY(job.text().contains(morvelStart));
        // The run keeps its folder: no other file can be chosen until it has ended.
        QVERIFY(!job.dlg->browseinput->isEnabled() && !job.idle());
        job.dlg->getInputFile();
        QTRY_VERIFY(job.idle() && job.dlg->browseinput->isEnabled());
        const QStringList expected = params(0) + converting.join('|').arg(job.work).split('|')
                                     + QStringList{"DONE !!!", exists, renamed + "1", morvelStart} + banner
                                     + QStringList{"data_x", "_atom_type_oxidation_number", "DATA 1", "DATA 2"};
        QCOMPARE(job.lines(), expected);
        QCOMPARE(job.bytes("MORVEL.OUT.old1"), QByteArray("earlier"));
    }

    void converter_data()
    {
        QTest::addColumn<QByteArray>("body"); // null: the converter is missing
        QTest::addColumn<QStringList>("tail");
        QTest::newRow("exit 2") << QByteArray("exit 2") << converting + QStringList{failure};
        QTest::newRow("cannot start") << QByteArray()
                                      << QStringList{converting[0], "error occured : 0", failure, converting[2]};
        QTest::newRow("killed by a signal") << QByteArray("kill -KILL $$")
                                            << converting + QStringList{"error occured : 1", failure, failure};
        QTest::newRow("ERROR split, twice, then exit 0")
            << QByteArray("printf 'NO ERR'; sleep 0.3; echo 'ORS'; sleep 0.3; echo ERROR; cp \"$1\" \"$2\"")
            << converting + errorSeen + errorSeen;
        QTest::newRow("100 MB of output, then ERROR") << QByteArray("head -c 100000000 /dev/zero | tr '\\0' x; echo ERROR")
                                                      << converting + errorSeen;
    }
    void converter()
    {
        QFETCH(QByteArray, body);
        QFETCH(QStringList, tail);
        Job job;
        QFile::remove(job.file("conv", job.bin.path()));
        if (!body.isNull())
            job.script("conv", body);
        job.choose("in.cif", cifWithNumbers, 0);
        job.dlg->importButton->click();
        QTRY_VERIFY_WITH_TIMEOUT(job.idle(), 100000); // a flood takes a while on a busy machine
        QTest::qWait(50);
        QCOMPARE(job.lines(), params(0) + tail.replaceInStrings("%1", job.work));
        QVERIFY(!QFile::exists(job.file("MORVEL.OUT")));
    }

    void kill_data()
    {
        QTest::addColumn<int>("format");
        QTest::addColumn<QStringList>("tail");
        QTest::newRow("converter") << 0 << killed + QStringList{"error occured : 1", failure, failure};
        QTest::newRow("MORVEL") << 1 << killed + QStringList{morvelFailure} + banner;
    }
    void kill()
    {
        QFETCH(int, format);
        QFETCH(QStringList, tail);
        Job job;
        // A program that starts another: Kill reaches both.
        job.script(format == 0 ? "conv" : "morvel", "sleep 30 & echo $! > ../helper; wait");
        job.choose(format == 0 ? "in.cif" : "in.dat", cifWithNumbers, format);
        job.dlg->importButton->click();
        QVERIFY(job.dlg->killbutton->isEnabled() && !job.dlg->importButton->isEnabled());
        QTRY_VERIFY(QFile::exists(job.file("helper", job.bin.path())));
        job.dlg->killbutton->click();
        QTRY_VERIFY(job.idle());
        QTRY_COMPARE(job.lines().mid(job.lines().size() - tail.size()), tail);
        // Gone, or a zombie waiting for its new parent to reap it.
        const QString helper = "/proc/" + readFile(job.file("helper", job.bin.path())).trimmed() + "/stat";
        QTRY_VERIFY(!QFile::exists(helper) || readFile(helper).contains(") Z "));
        job.dlg->killImport(); // with nothing running: both lines, still idle
        QCOMPARE(job.lines().mid(job.lines().size() - 2), killed);
        QVERIFY(job.idle());
    }

    void keptResult_data()
    {
        QTest::addColumn<int>("taken");
        QTest::addColumn<bool>("startable");
        QTest::addColumn<QStringList>("tail");
        QTest::addColumn<QByteArray>("result");
        QTest::newRow("old1 and old2 taken") << 2 << true << QStringList{renamed + "3", morvelStart} + banner + QStringList{"new"}
                                             << QByteArray("new");
        QTest::newRow("all 100 taken") << 100 << true
            << QStringList{exists, "The earlier \"MORVEL.OUT\" could not be renamed as \"MORVEL.OUT.old1\" to "
                                   "\"MORVEL.OUT.old100\": MORVEL has not been started !"}
            << QByteArray("earlier");
        QTest::newRow("MORVEL cannot start: an empty result") << 0 << false
                                                              << QStringList{renamed + "1", morvelFailure} + banner << QByteArray("");
    }
    void keptResult()
    {
        QFETCH(int, taken);
        QFETCH(bool, startable);
        QFETCH(QStringList, tail);
        Job job;
        if (!startable)
            QFile::remove(job.file("morvel", job.bin.path()));
        for (int n = 1; n <= taken; ++n)
            writeFile(job.file("MORVEL.OUT.old" + QString::number(n)), QByteArray::number(n));
        writeFile(job.file("MORVEL.OUT"), "earlier");
        job.choose("a.txt", "new", 1);
        job.dlg->importButton->click();
        QTRY_VERIFY(job.idle());
        QTRY_COMPARE(job.lines().mid(job.lines().size() - tail.size()), tail);
        QTEST(job.bytes("MORVEL.OUT"), "result");
        QCOMPARE(job.bytes("MORVEL.OUT.old" + QString::number(qMin(taken + 1, 100))), QByteArray(taken < 100 ? "earlier" : "100"));
    }

    void resultDisplay_data()
    {
        QTest::addColumn<QByteArray>("result");
        QTest::addColumn<QStringList>("shown");
        QTest::addColumn<bool>("atTitle"); // the view at the anchor; otherwise at the bottom
        const QByteArray rich = "<html><body><p>head   er<img src=\"/dev/zero\"></p>" + QByteArray(200, '\n').replace("\n", "<p>x</p>")
                                + "<a name=\"TITLE\">Title</a>" + QByteArray(200, '\n').replace("\n", "<p>y</p>");
        QTest::newRow("plain, NUL and a bad byte") << QByteArray("line 1\n    line\0 2\xff\n", 20)
                                                   << QStringList{"line 1", "line\uFFFD 2\uFFFD"} << false;
        QTest::newRow("rich with TITLE") << rich << QStringList{"head er\uFFFC", "x"} << true;
        QTest::newRow("rich without TITLE") << QByteArray(rich).replace("TITLE", "OTHER") << QStringList{"head er\uFFFC", "x"} << false;
        QByteArray large;
        while (large.size() <= resultLogLimit)
            large += "distance " + QByteArray::number(large.size()) + "\n";
        QTest::newRow("larger than the log takes") << large
            << QStringList{"distance 0", "distance 11"} << false;
    }
    void resultDisplay()
    {
        QFETCH(QByteArray, result);
        QFETCH(QStringList, shown);
        QFETCH(bool, atTitle);
        Job job;
        writeFile(job.file("result", job.bin.path()), result);
        // A result that marks up the log may name a device or a FIFO: neither is read.
        job.script("morvel", "cat ../result > MORVEL.OUT; exit 3");
        QVERIFY(::mkfifo(QFile::encodeName(job.file("fifo")).constData(), 0600) == 0);
        writeFile(job.file("morvelpartxt.txt", job.bin.path()), "<img src=\"/dev/zero\"><img src=\"" + job.file("fifo").toUtf8() + "\">");
        job.dlg->resize(600, 400);
        job.dlg->show();
        job.choose("a.txt", "x", 1);
        job.dlg->importButton->click();
        QTRY_VERIFY(job.idle());
        const QStringList lines = job.lines();
        const qsizetype start = lines.indexOf(banner.at(2)) + 3;
        QCOMPARE(lines.at(start - banner.size() - 1), morvelFailure);
        QCOMPARE(lines.mid(start, shown.size()), shown);
        QCOMPARE(job.bytes("MORVEL.OUT"), result);
        const bool whole = result.size() <= resultLogLimit;
        QCOMPARE(lines.constLast().startsWith("The result is larger than the log shows (" + QString::number(result.size()) + " bytes)"), !whole);
        if (!whole)
            QVERIFY(lines.at(lines.size() - 2).startsWith("distance ") && job.text().size() < resultLogLimit + 2000);
        const QScrollBar *bar = job.dlg->importlog->verticalScrollBar();
        QVERIFY(bar->maximum() > 0);
        QCOMPARE(bar->value() == bar->maximum(), !atTitle);
    }

    void editorAndOddPaths()
    {
        Job job;
        job.script("xdg-open", "printf '%s\\n' \"$@\" >> '" + job.file("args", job.bin.path()).toUtf8() + "'");
        const QByteArray path = qgetenv("PATH");
        qputenv("PATH", job.bin.path().toUtf8() + ':' + path);
        job.choose("a.txt", "x", 1);
        job.dlg->openButton->click();
        QCOMPARE(job.lines().constLast(), "There is no MORVEL.OUT file in the current directory!");
        writeFile(job.file("MORVEL.OUT"), "r");
        job.dlg->openButton->click();
        job.dlg->openButton->click();
        const QByteArray arg = job.file("MORVEL.OUT").toUtf8() + "\n";
        QTRY_COMPARE(readFile(job.file("args", job.bin.path())), arg + arg);
        qputenv("PATH", path);

        // Spaces and quotes in every path reach the programs intact.
        QDir(job.bin.path()).mkpath("my tools");
        QDir(job.bin.path()).mkpath("job \"one\" dir");
        job.script("my tools/conv \"x\"", "printf '%s\\n' \"$@\" > args; cp \"$1\" \"$2\"");
        job.script("my tools/mor vel", "cat morvel.in > MORVEL.OUT");
        writeFile(job.file("binaries.txt", job.bin.path()), "MORVEL ./my tools/mor vel\nPARSER ./my tools/conv \"x\"\n");
        job.dlg = std::make_unique<Import>();
        job.work = job.bin.path() + "/job \"one\" dir";
        job.choose("in put.cif", cifWithNumbers, 0);
        job.dlg->importButton->click();
        QTRY_VERIFY(job.idle());
        QCOMPARE(job.bytes("args"), (job.file("in put.cif") + "\n" + job.file("morvel.in") + "\n").toUtf8());
        QCOMPARE(job.bytes("MORVEL.OUT"), cifWithNumbers);
        QVERIFY(job.lines().contains(QString("\"./my tools/conv \"x\"\" \"%1\" \"%2\"").arg(job.file("in put.cif"), job.file("morvel.in"))));
    }
};

QTEST_MAIN(TestJobRun)
#include "tst_jobrun.moc"
