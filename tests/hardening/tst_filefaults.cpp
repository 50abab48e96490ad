// Faults on disk: the working directory or the input file changed between Browse and Run, odd
// path names, broken table, CIF and configuration files, and a rewrite that cannot finish.
// The jobs run the reference stand-ins.

#include "import.h"
#include "inputtestsupport.h"
#include "jobsupport.h"
#include "modaldriver.h"
#include "processprobe.h"
#include "resultdisplay.h"

#include <QRandomGenerator>
#include <QtTest>

#include <csignal>
#include <sys/resource.h>
#include <sys/stat.h>

namespace {
// Loose enough for a busy machine: these catch a dialog that stops for seconds, not jitter.
constexpr qint64 longestStopMs = MORVEL_TEST_SANITIZED ? 3000 : 1000;
// Browse reads and rewrites in one go; even a 10 MB table (800 000 entries, read and indexed in
// about 2 s here) must not stop the dialog for long.
constexpr qint64 longestBrowseMs = 10 * longestStopMs;

const QString demoDir = QStringLiteral(DEMO_DIR);
const QString ready = QStringLiteral("Ready to import the CIF file then to run MORVEL (Run MORVEL button below) !");
const QString parFailure = QStringLiteral("Something went wrong while opening a new \"morvel.par\" file!");
const QString green = QStringLiteral("#00cc00");

QByteArray demoFile(const QString &name)
{
    return fileBytes(demoDir + QLatin1Char('/') + name);
}

QByteArray randomBytes(qint64 size, quint32 seed)
{
    QRandomGenerator random(seed);
    QByteArray bytes(size, Qt::Uninitialized);
    for (char &b : bytes)
        b = char(random.bounded(256));
    return bytes;
}

// A job of the dialog with the reference stand-ins as its programs.
struct StandinJob : Job
{
    explicit StandinJob(const QString &dirName = QStringLiteral("work")) : Job(dirName)
    {
        dlg->parserProgram = QStringLiteral(CIF_PARSER_PATH);
        dlg->morvelProgram = QStringLiteral(MORVEL_PATH);
    }

    // Browse as the user does; every window answered as planned.
    void browse(const QString &path, int format, bool answerOxidationQuestion = false)
    {
        dlg->InputBox->setCurrentIndex(format);
        ModalDriver driver;
        driver.chooseFile(path);
        if (answerOxidationQuestion)
            driver.answerBox(QMessageBox::Ok);
        dlg->browseinput->click();
        QVERIFY2(driver.allAnswered(), qPrintable(driver.problems.join(", ")));
        QCOMPARE(dlg->inputFile, path);
    }

    // Run and wait until no program runs and the result is on show; returns the longest stop.
    qint64 run()
    {
        LoopGapMeter meter;
        dlg->importButton->click();
        if (!runLoopUntil([&] { return idle() && !resultDisplayBusy(dlg->importlog); }, 60000))
            qWarning("the job did not end");
        return meter.longestGapMs();
    }

    QStringList lines() const { return shownLines(dlg->importlog); }
};

// A job of the converter ended in one of the two ways the user may see, never in both.
void checkJudgement(const StandinJob &job, bool converterSucceeds)
{
    const QString text = job.text();
    QVERIFY(job.idle());
    if (converterSucceeds) {
        QVERIFY2(text.contains("DONE !!!") && !text.contains("Something went wrong with Import procedure"),
                 qPrintable(text));
        QVERIFY(text.contains("Starting Morvel"));
        QVERIFY2(fileBytes(job.work + "/MORVEL.OUT").startsWith("MORVEL reference stand-in"), fileBytes(job.work + "/MORVEL.OUT").left(300).constData());
    } else {
        QVERIFY2(text.contains("Something went wrong with Import procedure") && !text.contains("DONE !!!"),
                 qPrintable(text));
        QVERIFY(!text.contains("Starting Morvel"));
    }
}
} // namespace

class TestFileFaults : public QObject
{
    Q_OBJECT

private slots:
    void workingDirChanged_data();
    void workingDirChanged();
    void inputChanged_data();
    void inputChanged();
    void oddPaths_data();
    void oddPaths();
    void oxidationTableBytes_data();
    void oxidationTableBytes();
    void cifBytes_data();
    void cifBytes();
    void binariesFileBytes_data();
    void binariesFileBytes();
    void interruptedRewrite_data();
    void interruptedRewrite();
};

void TestFileFaults::workingDirChanged_data()
{
    QTest::addColumn<bool>("removed"); // else made unwritable
    QTest::addColumn<int>("format");
    QTest::newRow("unwritable, CIF") << false << 0;
    QTest::newRow("unwritable, hand-made") << false << 1;
    QTest::newRow("removed, CIF") << true << 0;
    QTest::newRow("removed, hand-made") << true << 1;
}

void TestFileFaults::workingDirChanged()
{
    QFETCH(bool, removed);
    QFETCH(int, format);
    QString report;
    if (!removed && ranAsNobody(QStringLiteral("workingDirChanged:") + QTest::currentDataTag(), {}, &report)) {
        QVERIFY2(report.isEmpty(), qPrintable(report));
        return;
    }

    StandinJob job;
    const QString input = job.work + (format == 0 ? "/nacl.cif" : "/quartz.in");
    writeFile(input, demoFile(format == 0 ? "nacl.cif" : "quartz.in"));
    job.browse(input, format);
    // Earlier job files, longer than the new ones, and an earlier result.
    writeFile(job.work + "/morvel.par", QByteArray(4000, 'p'));
    writeFile(job.work + "/morvel.in", QByteArray(40000, 'i'));
    writeFile(job.work + "/MORVEL.OUT", "earlier result");

    if (removed)
        QVERIFY(QDir(job.work).removeRecursively());
    else
        QVERIFY(QFile::setPermissions(job.work, QFileDevice::ReadOwner | QFileDevice::ExeOwner));
    QVERIFY(job.run() < longestStopMs);
    const QString text = job.text();
    QVERIFY(!job.log().contains(green));
    if (removed) {
        QVERIFY(text.contains(parFailure));
        QVERIFY(!QFileInfo::exists(job.work));
        if (format == 0) {
            // The converter cannot start in a folder that is gone.
            QVERIFY2(job.lines().join('|').contains("error occured : 0|Something went wrong with Import procedure !"),
                     qPrintable(text));
            QVERIFY(!text.contains("DONE !!!"));
        } else {
            QVERIFY(text.contains("Something went wrong while opening a new \"morvel.in\" file!"));
            QVERIFY(job.logEndsWith({morvelFailure, "<br><b><font color=#FF3300> Something went wrong while opening "
                                                    "a \"morvel.out\" file! </font></b><br>"}));
        }
        return;
    }

    // Unwritable: nothing is lost, and what the dialog could write is whole.
    QFile::setPermissions(job.work, QFileDevice::ReadOwner | QFileDevice::WriteOwner | QFileDevice::ExeOwner);
    QCOMPARE(job.file("MORVEL.OUT"), QByteArray("earlier result"));
    QCOMPARE(fileBytes(input), demoFile(format == 0 ? "nacl.cif" : "quartz.in"));
    QVERIFY(!QFile::exists(job.work + "/MORVEL.OUT.old1"));
    // The files can be rewritten though the folder cannot take new ones: no trace of the old ones.
    QVERIFY(!job.file("morvel.par").contains('p'));
    QVERIFY(job.file("morvel.par").endsWith(" PART\n"));
    if (format == 0) {
        checkJudgement(job, false);
    } else {
        QCOMPARE(job.file("morvel.in"), demoFile("quartz.in"));
        QVERIFY2(job.logEndsWith({done, exists,
                                  "<br><b><font color=#FF3300> The earlier \"MORVEL.OUT\" could not be renamed as "
                                  "\"MORVEL.OUT.old1\" to \"MORVEL.OUT.old100\": MORVEL has not been started ! "
                                  "</font></b><br>"}),
                 qPrintable(text));
    }
}

void TestFileFaults::inputChanged_data()
{
    QTest::addColumn<bool>("directory"); // else deleted
    QTest::addColumn<int>("format");
    QTest::newRow("deleted, CIF") << false << 0;
    QTest::newRow("deleted, hand-made") << false << 1;
    QTest::newRow("a directory, CIF") << true << 0;
    QTest::newRow("a directory, hand-made") << true << 1;
}

void TestFileFaults::inputChanged()
{
    QFETCH(bool, directory);
    QFETCH(int, format);

    StandinJob job;
    const QString input = job.work + (format == 0 ? "/nacl.cif" : "/quartz.in");
    writeFile(input, demoFile(format == 0 ? "nacl.cif" : "quartz.in"));
    job.browse(input, format);
    writeFile(job.work + "/MORVEL.OUT", "earlier result");
    QVERIFY(QFile::remove(input));
    if (directory)
        QVERIFY(QDir(job.work).mkdir(QFileInfo(input).fileName()));
    QVERIFY(job.run() < longestStopMs);

    QCOMPARE(QFileInfo(input).isDir(), directory);
    QCOMPARE(QFileInfo::exists(input), directory); // nothing is created in the input's place
    if (format == 0) {
        checkJudgement(job, false);
        QCOMPARE(job.file("MORVEL.OUT"), QByteArray("earlier result"));
        return;
    }
    // The copy fails and says so; MORVEL then refuses the empty input, and the earlier result is kept.
    const QString text = job.text();
    QVERIFY2(job.lines().join('|').contains("Something went wrong while opening input file!|argument was " + input
                                            + "|DONE !!!"),
             qPrintable(text));
    QCOMPARE(job.file("morvel.in"), QByteArray(""));
    QVERIFY(text.contains("Something went wrong with morvel program !"));
    QCOMPARE(job.file("MORVEL.OUT.old1"), QByteArray("earlier result"));
    QVERIFY(job.file("MORVEL.OUT").contains("ERROR"));
}

void TestFileFaults::oddPaths_data()
{
    QTest::addColumn<QString>("dir");   // the working directory, in the binaries directory
    QTest::addColumn<QString>("name");  // the input file
    QTest::addColumn<QString>("tools"); // the programs' folder, in the binaries directory
    QTest::newRow("spaces") << "my work" << "na cl.cif" << "my tools";
    QTest::newRow("double quotes") << "work \"1\"" << "\"na\"cl.cif" << "\"tools\"";
    QTest::newRow("non-ASCII letters") << QString::fromUtf8("Stoff ä ß 日本") << QString::fromUtf8("NaCl-é.cif")
                                       << QString::fromUtf8("Werkzeug ö");
    QTest::newRow("leading dash") << "-work" << "-nacl.cif" << "-tools";
    QTest::newRow("all at once") << QString::fromUtf8("-wo rk \"ü\"") << QString::fromUtf8("-na \"ç\" l.cif")
                                 << QString::fromUtf8("-t \"ø\" ols");
}

void TestFileFaults::oddPaths()
{
    QFETCH(QString, dir);
    QFETCH(QString, name);
    QFETCH(QString, tools);

    StandinJob job(dir);
    // The programs, under names as odd as their folder, found through binaries.txt.
    QVERIFY(QDir(job.bin.path()).mkdir(tools));
    const QString parser = "./" + tools + "/-cif " + name.left(3).trimmed() + " parser";
    const QString morvel = "./" + tools + "/-mor " + name.left(3).trimmed() + " vel";
    QVERIFY(QFile::link(QStringLiteral(CIF_PARSER_PATH), job.bin.file(parser)));
    QVERIFY(QFile::link(QStringLiteral(MORVEL_PATH), job.bin.file(morvel)));
    writeFile(job.bin.file("binaries.txt"), ("MORVEL " + morvel + "\nPARSER " + parser + "\n").toUtf8());
    job.dlg = std::make_unique<Import>();
    QCOMPARE(job.lines().mid(job.lines().size() - 3),
             QStringList({"Using programs :", "Morvel = " + morvel + " version unknown", "Cif Parser = " + parser}));

    const QString input = job.work + '/' + name;
    writeFile(input, demoFile("nacl.cif"));
    if (name.contains('"')) {
        // Qt's own file dialog cannot take a name with a double quote (it separates names with
        // them); a native one can. The choice is made as Browse makes it.
        job.choose(name, QByteArray(), 0);
    } else {
        job.browse(input, 0);
        QCOMPARE(job.lines(), QStringList{ready});
    }
    QCOMPARE(job.dlg->workingDir, job.work);
    QVERIFY(job.run() < longestStopMs);
    checkJudgement(job, true);
    QVERIFY(job.text().contains(QString("\"%1\" \"%2\" \"%3/morvel.in\"").arg(parser, input, job.work)));
    QVERIFY(job.file("MORVEL.OUT").contains("Na1"));
    QVERIFY(job.text().contains("Cl1"));
    QCOMPARE(fileBytes(input), demoFile("nacl.cif"));
}

void TestFileFaults::oxidationTableBytes_data()
{
    QTest::addColumn<QByteArray>("table");
    QTest::addColumn<QByteArray>("rewritten"); // null: the input stays as it was
    QTest::addColumn<QStringList>("shown");    // lines the log must hold, in this order

    const QByteArray head = exampleHead;
    const QByteArray tail = "loop_\n_atom_type_symbol\n_atom_type_oxidation_number\n";
    const QString noMatch = "No atom line matches \"oxidation.dat\" file ! The input file is left unchanged.";
    const QString modified = "The input CIF file has been modified according to \"oxidation.dat\" file info.";
    QTest::newRow("random bytes") << randomBytes(64 << 10, 5) << QByteArray() << QStringList{noMatch};
    QTest::newRow("0 bytes") << QByteArray("") << QByteArray()
                             << QStringList{"Invalid line in \"oxidation.dat\" file!", noMatch};
    // O1 with a NUL byte is another name; only Fe1 matches.
    QTest::newRow("a NUL byte") << QByteArray("Fe1 Fe3+ 3\nO") + '\0' + "1 O2- -2\n"
                                << head + "Fe1 Fe3+ 0.0 0.0 0.0\n" + tail + "Fe3+ 3\nloop_\n_atom_site_aniso_label\n"
                                << QStringList{"Fe1  Fe3+  3", "The following atoms do not have any match in "
                                                              "\"oxidation.dat\" file :", "O1", "Xx1", modified};
    // Without line feeds the table is one line: every name but the last two fields gets O2- and -2,
    // and the echo shows it so.
    QTest::newRow("only CR line ends") << QByteArray("Fe1 Fe3+ 3\rO1 O2- -2\r")
                                       << head + "Fe1 O2- 0.0 0.0 0.0\nO1 O2- 0.5 0.5 0.5\n" + tail
                                              + "O2- -2\nloop_\n_atom_site_aniso_label\n"
                                       << QStringList{"Fe1  O2-  -2", "Fe3+  O2-  -2", "3  O2-  -2", "O1  O2-  -2",
                                                      modified};
    QByteArray large = exampleTable;
    for (int i = 0; large.size() < (10 << 20); ++i)
        large += "Zz" + QByteArray::number(i) + " Zz 2\n";
    QTest::newRow("10 MB") << large << exampleRewritten << QStringList{"Fe1  Fe3+  3", "O1  O2-  -2", modified};
}

void TestFileFaults::oxidationTableBytes()
{
    QFETCH(QByteArray, table);
    QFETCH(QByteArray, rewritten);
    QFETCH(QStringList, shown);

    StandinJob job;
    const QString input = job.work + "/x.cif";
    writeFile(input, exampleCif);
    writeFile(job.work + "/oxidation.dat", table);
    QElapsedTimer clock;
    clock.start();
    job.browse(input, 0, true);
    qInfo("Browse took %lld ms", clock.elapsed());
    QVERIFY(clock.elapsed() < longestBrowseMs);

    QCOMPARE(fileBytes(input), rewritten.isNull() ? exampleCif : rewritten);
    QCOMPARE(fileBytes(job.work + "/x_old.cif"), exampleCif);
    QCOMPARE(fileBytes(job.work + "/oxidation.dat"), table);
    QVERIFY(!QFile::exists(job.work + "/tmp.cif"));
    const QStringList lines = job.lines();
    qsizetype at = 0;
    for (const QString &line : shown) {
        at = lines.indexOf(line, at);
        QVERIFY2(at >= 0, qPrintable(line));
    }
    QCOMPARE(job.log().contains(green), !rewritten.isNull());
}

void TestFileFaults::cifBytes_data()
{
    QTest::addColumn<QByteArray>("cif");
    QTest::addColumn<QByteArray>("rewritten"); // null: the input stays as it was
    QTest::addColumn<bool>("converterSucceeds");

    // The atom rows of the demo file run to its end; the table gives Ti 4 and O -2.
    const QByteArray rutile = demoFile("rutile.cif");
    const QByteArray loop = "loop_\n_atom_type_symbol\n_atom_type_oxidation_number\n";
    QTest::newRow("random bytes") << randomBytes(64 << 10, 6) << QByteArray() << false;
    QTest::newRow("0 bytes") << QByteArray("") << QByteArray() << false;
    // Ti1 with a NUL byte matches nothing and is left out; the rest is a structure of O alone.
    QByteArray withNul = rutile;
    withNul.replace("Ti1 Ti", QByteArray("Ti1\0 Ti", 7));
    QTest::newRow("a NUL byte in an atom row")
        << withNul << QByteArray(rutile).replace("Ti1 Ti 0.00000 0.00000 0.00000\n", "") + loop + "O -2\n\n" << true;
    QTest::newRow("only CR line ends") << QByteArray(rutile).replace('\n', '\r') << QByteArray() << false;
    const QByteArray comment = "#" + QByteArray(10 << 20, 'c') + "\n";
    // The line that ends the atom rows opens the rest, and the rest gets one more (empty) line.
    QTest::newRow("10 MB of comments") << rutile + comment << rutile + loop + "Ti 4\nO -2\n" + comment + "\n" << true;
    // Rows the table does not know are left out, each named in the log.
    QByteArray extra;
    for (int i = 0; extra.size() < (10 << 20); ++i)
        extra += "Q" + QByteArray::number(i) + " Q 0.3 0.3 0.0" + QByteArray::number(i) + "\n";
    QTest::newRow("10 MB of atom rows") << rutile + extra << rutile + loop + "Ti 4\nO -2\n\n" << true;
}

void TestFileFaults::cifBytes()
{
    QFETCH(QByteArray, cif);
    QFETCH(QByteArray, rewritten);
    QFETCH(bool, converterSucceeds);

    StandinJob job;
    const QString input = job.work + "/x.cif";
    writeFile(input, cif);
    writeFile(job.work + "/oxidation.dat", demoFile("oxidation.dat"));
    QElapsedTimer clock;
    clock.start();
    job.browse(input, 0, true);
    qInfo("Browse took %lld ms", clock.elapsed());
    QVERIFY(clock.elapsed() < longestBrowseMs);

    // The input is the old one or the complete new one; its backup is the old one.
    QCOMPARE(fileBytes(job.work + "/x_old.cif"), cif);
    QVERIFY(!QFile::exists(job.work + "/tmp.cif"));
    QCOMPARE(job.log().contains(green), !rewritten.isNull());
    const QByteArray now = fileBytes(input);
    QVERIFY2(now == (rewritten.isNull() ? cif : rewritten), now.right(200).constData());

    const qint64 stop = job.run();
    qInfo("longest stop in Run %lld ms", stop);
    QVERIFY(stop < longestStopMs);
    checkJudgement(job, converterSucceeds);
}

void TestFileFaults::binariesFileBytes_data()
{
    QTest::addColumn<QByteArray>("binaries");
    QTest::addColumn<QString>("morvel");
    QTest::addColumn<QString>("parser");

    // ./m and ./p exist in the binaries directory.
    QTest::newRow("random bytes") << randomBytes(64 << 10, 7) << "./morvel.exe" << "./cif_parser.exe";
    QTest::newRow("0 bytes") << QByteArray("") << "./morvel.exe" << "./cif_parser.exe";
    QTest::newRow("a NUL byte in a path") << QByteArray("MORVEL ./m\0x\nPARSER ./p\n", 24) << "./morvel.exe" << "./p";
    QTest::newRow("only CR line ends") << QByteArray("PARSER ./p\rMORVEL ./m\r") << "./morvel.exe" << "./cif_parser.exe";
    QTest::newRow("CR LF line ends") << QByteArray("PARSER ./p\r\nMORVEL ./m\r\n") << "./m" << "./p";
    QTest::newRow("10 MB") << "MORVEL ./m\nPARSER ./" + QByteArray(10 << 20, 'p') + "\n" << "./m" << "./cif_parser.exe";
}

void TestFileFaults::binariesFileBytes()
{
    QFETCH(QByteArray, binaries);
    QFETCH(QString, morvel);
    QFETCH(QString, parser);

    CurrentDirScope bin;
    writeFile(bin.file("binaries.txt"), binaries);
    writeFile(bin.file("m"), "");
    writeFile(bin.file("p"), "");
    QElapsedTimer clock;
    clock.start();
    Import dialog;
    QVERIFY(clock.elapsed() < 5 * longestStopMs);
    QCOMPARE(dialog.morvelProgram, morvel);
    QCOMPARE(dialog.parserProgram, parser);
    const QStringList lines = shownLines(dialog.importlog);
    QCOMPARE(lines.mid(lines.size() - 2), QStringList({"Morvel = " + morvel + " version unknown", "Cif Parser = " + parser}));
    QVERIFY(dialog.importButton->isEnabled());
}

void TestFileFaults::interruptedRewrite_data()
{
    QTest::addColumn<QString>("fault");
    QTest::addColumn<QString>("lastLine"); // empty: the rewrite completes
    QTest::newRow("none") << "none" << "";
    QTest::newRow("disk full") << "disk full"
                               << "Cannot write temporary file \"tmp.cif\"! The input CIF file is left unchanged.";
    QTest::newRow("file size limit") << "file size limit"
                                     << "Cannot write temporary file \"tmp.cif\"! The input CIF file is left unchanged.";
    QTest::newRow("rename refused") << "rename refused"
                                    << "Cannot replace the input CIF file by \"tmp.cif\"! The input CIF file is left unchanged.";
}

void TestFileFaults::interruptedRewrite()
{
    QFETCH(QString, fault);
    QFETCH(QString, lastLine);

    // In a folder with the sticky bit, only a file's owner may rename over it: an ordinary user can
    // write the input (mode 666) and create tmp.cif beside it, but rename fails. Root prepares the
    // folder and runs the rest as nobody.
    QTemporaryDir shared;
    QString work;
    if (fault == "rename refused") {
        if (qEnvironmentVariableIsSet("MORVEL_STICKY_DIR")) {
            work = qEnvironmentVariable("MORVEL_STICKY_DIR");
        } else {
            if (::geteuid() != 0)
                QSKIP("only root can give the input file another owner");
            work = shared.path() + "/work";
            QVERIFY(QDir().mkdir(work));
            QVERIFY(::chmod(QFile::encodeName(shared.path()).constData(), 0755) == 0);
            QVERIFY(::chmod(QFile::encodeName(work).constData(), 01777) == 0);
            writeFile(work + "/x.cif", exampleCif);
            writeFile(work + "/oxidation.dat", exampleTable);
            QVERIFY(::chmod(QFile::encodeName(work + "/x.cif").constData(), 0666) == 0);
            QVERIFY(::chmod(QFile::encodeName(work + "/oxidation.dat").constData(), 0666) == 0);
            QString report;
            QVERIFY(ranAsNobody("interruptedRewrite:rename refused", {"MORVEL_STICKY_DIR=" + work}, &report));
            QVERIFY2(report.isEmpty(), qPrintable(report));
            QCOMPARE(fileBytes(work + "/x.cif"), exampleCif);
            QCOMPARE(fileBytes(work + "/tmp.cif"), exampleRewritten);
            return;
        }
    }

    StandinJob job;
    if (work.isEmpty()) {
        work = job.work;
        writeFile(work + "/x.cif", exampleCif);
        writeFile(work + "/oxidation.dat", exampleTable);
    }
    const QString input = work + "/x.cif";
    if (fault == "disk full")
        QVERIFY(QFile::link("/dev/full", work + "/tmp.cif"));

    rlimit limit{};
    ::getrlimit(RLIMIT_FSIZE, &limit);
    const rlimit unlimited = limit;
    if (fault == "file size limit") {
        // The backup copy fits, the longer new text does not.
        ::signal(SIGXFSZ, SIG_IGN);
        limit.rlim_cur = rlim_t(exampleCif.size() + 16);
        QVERIFY(::setrlimit(RLIMIT_FSIZE, &limit) == 0);
    }
    job.browse(input, 0, true);
    ::setrlimit(RLIMIT_FSIZE, &unlimited);

    QCOMPARE(fileBytes(work + "/x_old.cif"), exampleCif);
    const QStringList lines = job.lines();
    if (lastLine.isEmpty()) {
        QCOMPARE(fileBytes(input), exampleRewritten);
        QCOMPARE(lines.constLast(), "Ready to import the CIF file then to run MORVEL !");
        return;
    }
    QCOMPARE(fileBytes(input), exampleCif);
    QCOMPARE(lines.constLast(), lastLine);
    QVERIFY(!job.log().contains(green));
    if (fault != "rename refused")
        QVERIFY(!QFileInfo(work + "/tmp.cif").exists() && !QFileInfo(work + "/tmp.cif").isSymLink());
}

QTEST_MAIN(TestFileFaults)
#include "tst_filefaults.moc"
