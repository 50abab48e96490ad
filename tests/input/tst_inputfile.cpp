#include "import.h"
#include "inputtestsupport.h"
#include "modaldriver.h"
#include "testsupport.h"

#include <QtTest>

#include <memory>

namespace {
QString boxLine(const QString &text, const QString &informative, QMessageBox::StandardButtons buttons)
{
    return QStringList{"WARNING!", QString::number(QMessageBox::Warning), text, informative,
                       QString::number(buttons), QString::number(QMessageBox::Ok)}
        .join(" | ");
}

const QString boxA = boxLine("Please check the file format !!",
                             " You have choosen \"CIF\" as input format but the selected file doesnt appear to be a CIF file !",
                             QMessageBox::Ok);
const QString boxB = boxLine("Please check the file format !!",
                             " You have choosen \"Hand made\" or \"old ICSD\" as input format but the selected file seems to "
                             "be a CIF file instead!",
                             QMessageBox::Ok);
const QString boxC = boxLine(
    "It seems that the selected CIF file does not contain the \"_atom_type_oxidation_number\" flag !",
    "Please edit manually a \"oxidation.dat\" file, in the current working directory, so that the imporation procedure "
    "can modify accordingly the CIF file.\n\n\"oxidation.dat\" file must contain, for each atom, one line : "
    "\n_atom_site_label   _atom_site_type_symbol   _atom_type_oxidation_number \n\nOnce the \"oxidation.dat\" file is "
    "correct, hit OK, otherwise Cancel to keep the CIF file unmodified.",
    QMessageBox::Ok | QMessageBox::Cancel);
const QString noOxidation = "WARNING : Imput CIF file does not contain \"_atom_type_oxidation_number \"";
} // namespace

class TestInputFile : public QObject
{
    Q_OBJECT

private slots:
    void browse_data();
    void browse();
    void refusedInputStaysCurrent();
    void workedExampleTwice_data();
    void workedExampleTwice();
    void inputLeftUnchanged_data();
    void inputLeftUnchanged();
    void driverAnswers_data();
    void driverAnswers();

private:
    // Presses Browse; the driver must have met every window it expected, and no other.
    static void pressBrowse(Import &dialog, const ModalDriver &driver)
    {
        dialog.browseinput->click();
        QVERIFY2(driver.allAnswered(), qPrintable(driver.problems.join(", ")));
    }
};

void TestInputFile::browse_data()
{
    QTest::addColumn<int>("format");
    QTest::addColumn<QString>("name");
    QTest::addColumn<QByteArray>("cif");
    QTest::addColumn<QString>("box");       // format warning, if any
    QTest::addColumn<QStringList>("log");   // after the selection; empty: the log is not touched

    const QStringList cancelled{noOxidation, "Keeping unmodified CIF file"};
    const QStringList ready{"Ready to import the CIF file then to run MORVEL (Run MORVEL button below) !"};
    const QByteArray withTag = exampleCif + "loop_\n_atom_type_symbol\n_atom_type_oxidation_number\nFe3+ 3\n";
    QTest::newRow("CIF, x.txt") << 0 << "x.txt" << exampleCif << boxA << QStringList();
    QTest::newRow("CIF, x") << 0 << "x" << exampleCif << boxA << QStringList();
    QTest::newRow("CIF, a.b.cif") << 0 << "a.b.cif" << exampleCif << "" << QStringList();
    QTest::newRow("CIF, x.cif.txt") << 0 << "x.cif.txt" << exampleCif << "" << QStringList();
    QTest::newRow("CIF, x.cif, Cancel") << 0 << "x.cif" << exampleCif << "" << cancelled;
    QTest::newRow("CIF, x.CIF, Cancel") << 0 << "x.CIF" << exampleCif << "" << cancelled;
    QTest::newRow("CIF, tag present") << 0 << "x.cif" << withTag << "" << ready;
    QTest::newRow("CIF, tag in a comment") << 0 << "x.cif" << "#_atom_type_oxidation_numbers\n" + exampleCif << ""
                                           << ready;
    QTest::newRow("Hand-made, x.cif") << 1 << "x.cif" << exampleCif << boxB << QStringList();
    QTest::newRow("old ICSD, x.tar.CIF") << 2 << "x.tar.CIF" << exampleCif << boxB << QStringList();
    QTest::newRow("Hand-made, x.dat") << 1 << "x.dat" << exampleCif << "" << QStringList();
}

void TestInputFile::browse()
{
    QFETCH(int, format);
    QFETCH(QString, name);
    QFETCH(QByteArray, cif);
    QFETCH(QString, box);
    QFETCH(QStringList, log);

    QTemporaryDir dir;
    const QString file = dir.filePath(name);
    writeFile(file, cif);
    Import dialog;
    dialog.InputBox->setCurrentIndex(format);
    const QString startLog = dialog.importlog->toHtml();
    const bool asked = log.contains("Keeping unmodified CIF file");

    ModalDriver driver;
    driver.chooseFile(file);
    if (!box.isEmpty())
        driver.answerBox(QMessageBox::Ok);
    if (asked)
        driver.answerBox(QMessageBox::Cancel);
    pressBrowse(dialog, driver);

    const QString dialogLine = format == 0 ? "Select an input CIF file | CIF files (*.cif);;All files (*)"
                                           : "Select an input file | All files (*)";
    QCOMPARE(driver.seen.value(0).section(" | ", 0, 1), dialogLine);
    QCOMPARE(driver.seen.mid(1), (QStringList{box, asked ? boxC : QString()}).filter(QRegularExpression(".")));
    QCOMPARE(dialog.inputFile, file);
    QCOMPARE(dialog.inputpath->text(), file);
    QCOMPARE(dialog.workingDir, dir.path());
    QCOMPARE(dialog.stagedInputPath, dir.path() + "/morvel.in");
    QCOMPARE(dialog.inputBaseName, name.section('.', 0, 0));
    if (log.isEmpty())
        QCOMPARE(dialog.importlog->toHtml(), startLog);
    else
        QCOMPARE(shownLines(dialog.importlog), log);
    QCOMPARE(fileBytes(file), cif);
    QVERIFY(!QFile::exists(dir.filePath("x_old.cif")));

    // Cancelling the next dialog, which opens in the working directory, changes nothing.
    const QString logNow = dialog.importlog->toHtml();
    driver.chooseFile(QString());
    pressBrowse(dialog, driver);
    QCOMPARE(driver.seen.constLast().section(" | ", 2), QFileInfo(dir.path()).absoluteFilePath());
    QCOMPARE(dialog.inputFile, file);
    QCOMPARE(dialog.inputpath->text(), file);
    QCOMPARE(dialog.workingDir, dir.path());
    QCOMPARE(dialog.inputBaseName, name.section('.', 0, 0));
    QCOMPARE(dialog.importlog->toHtml(), logNow);
}

void TestInputFile::refusedInputStaysCurrent()
{
    QTemporaryDir dir;
    const QString file = dir.filePath("x.cif");
    writeFile(file, exampleCif);
    Import dialog;
    dialog.InputBox->setCurrentIndex(1);
    const QStringList startLog = shownLines(dialog.importlog);

    // While box B is up a directory takes the file's place: root cannot open that read-write either.
    ModalDriver driver;
    driver.chooseFile(file);
    driver.answerBox(QMessageBox::Ok, [&] { QFile::remove(file) && QDir(dir.path()).mkdir("x.cif"); });
    pressBrowse(dialog, driver);

    QCOMPARE(shownLines(dialog.importlog), startLog + QStringList{"Cannot open input file in read-write mode!"});
    QVERIFY(dialog.importlog->toHtml().contains("#ff3300"));
    QCOMPARE(dialog.inputFile, file);
    QCOMPARE(dialog.inputpath->text(), file);
}

void TestInputFile::workedExampleTwice_data()
{
    QTest::addColumn<QString>("base");
    QTest::newRow("x.cif") << "x";
    QTest::newRow("an input called tmp.cif") << "tmp";
}

void TestInputFile::workedExampleTwice()
{
    QFETCH(QString, base);
    QTemporaryDir dir;
    const QString file = dir.filePath(base + ".cif");
    const QString backup = base + "_old.cif";
    writeFile(file, exampleCif);
    writeFile(dir.filePath("oxidation.dat"), exampleTable);
    if (base != "tmp")
        writeFile(dir.filePath("tmp.cif"), QByteArray(10000, '#')); // longer than the new text
    Import dialog;
    ModalDriver driver;
    driver.chooseFile(file);
    driver.answerBox(QMessageBox::Ok);
    pressBrowse(dialog, driver);

    QCOMPARE(fileBytes(file), exampleRewritten);
    QCOMPARE(fileBytes(dir.filePath(backup)), exampleCif);
    QCOMPARE(QDir(dir.path()).entryList(QDir::Files), (QStringList{"oxidation.dat", base + ".cif", backup}));
    const QStringList tail{"The input CIF file has been modified according to \"oxidation.dat\" file info.",
                           "Ready to import the CIF file then to run MORVEL !"};
    QCOMPARE(shownLines(dialog.importlog),
             QStringList({noOxidation, "Using modified CIF file, charges informations taken from \"oxidation.dat\" file",
                          "Original CIF file has been saved under " + backup,
                          "Found file \"oxidation.dat\" in working directory :",
                          "Got the following list of atom symbols and charges :", "Fe1  Fe3+  3", "O1  O2-  -2",
                          "Now identifying pairs atom symbol/atom names :", "Atom Fe1 has symbol Fe3+ and charge 3",
                          "Atom O1 has symbol O2- and charge -2", "WARNING !",
                          "The following atoms do not have any match in \"oxidation.dat\" file :", "Xx1"})
                 + tail);
    QVERIFY(dialog.importlog->toHtml().contains("#00cc00"));

    // Again under the same name, with CR LF line ends and bytes outside ASCII: the first backup
    // copy is kept, and the bytes come back as they were.
    writeFile(file, "#caf\xe9 \xff\r\n" + QByteArray(exampleCif).replace("\n", "\r\n").replace("0.0 0.0 0.0", "0.25 0.25 0.25"));
    driver.chooseFile(file);
    driver.answerBox(QMessageBox::Ok);
    pressBrowse(dialog, driver);
    QCOMPARE(fileBytes(file), "#caf\xe9 \xff\n" + QByteArray(exampleRewritten).replace("0.0 0.0 0.0", "0.25 0.25 0.25"));
    QCOMPARE(fileBytes(dir.filePath(backup)), exampleCif);
    QCOMPARE(shownLines(dialog.importlog).value(2), "Cannot overwrite save file : " + backup);
    QCOMPARE(shownLines(dialog.importlog).mid(13), tail);
}

void TestInputFile::inputLeftUnchanged_data()
{
    QTest::addColumn<QByteArray>("cif");
    QTest::addColumn<QByteArray>("table"); // "-": no table file
    QTest::addColumn<bool>("tmpIsDirectory");
    QTest::addColumn<QString>("lastLine");

    const QByteArray tags = "loop_\n_atom_site_label\n_atom_site_type_symbol\n";
    QTest::newRow("no _atom_site_label") << QByteArray("data_x\n_cell_length_a 5.0\n") << exampleTable << false
                                         << "The CIF file does not contain the flag \"_atom_site_label\" ! The input file is left unchanged.";
    QTest::newRow("no type symbol tag") << QByteArray("loop_\n_atom_site_label\n_atom_site_x\nFe1 0\n") << exampleTable
                                        << false << "The CIF file must at least contain the flag \"_atom_site_type_symbol\" !";
    QTest::newRow("empty table") << tags + "Fe1 Fe 0\n" << QByteArray() << false
                                 << "No atom line matches \"oxidation.dat\" file ! The input file is left unchanged.";
    QTest::newRow("no table file") << tags + "Fe1 Fe 0\n" << QByteArray("-") << false
                                   << "No atom line matches \"oxidation.dat\" file ! The input file is left unchanged.";
    QTest::newRow("tmp.cif cannot be opened") << exampleCif << exampleTable << true
                                              << "Cannot open temporary file in read-write mode!";
}

void TestInputFile::inputLeftUnchanged()
{
    QFETCH(QByteArray, cif);
    QFETCH(QByteArray, table);
    QFETCH(bool, tmpIsDirectory);
    QFETCH(QString, lastLine);

    QTemporaryDir dir;
    const QString file = dir.filePath("x.cif");
    writeFile(file, cif);
    if (table != "-")
        writeFile(dir.filePath("oxidation.dat"), table);
    if (tmpIsDirectory)
        QVERIFY(QDir(dir.path()).mkdir("tmp.cif"));
    Import dialog;
    ModalDriver driver;
    driver.chooseFile(file);
    driver.answerBox(QMessageBox::Ok);
    pressBrowse(dialog, driver);

    QCOMPARE(fileBytes(file), cif);
    QCOMPARE(fileBytes(dir.filePath("x_old.cif")), cif);
    QCOMPARE(QFileInfo(dir.filePath("tmp.cif")).isDir(), tmpIsDirectory);
    QVERIFY(tmpIsDirectory || !QFile::exists(dir.filePath("tmp.cif")));
    QCOMPARE(shownLines(dialog.importlog).constLast(), lastLine);
    QVERIFY(!dialog.importlog->toHtml().contains("#00cc00"));
}

void TestInputFile::driverAnswers_data()
{
    QTest::addColumn<QString>("name");     // chosen in the file dialog
    QTest::addColumn<bool>("activeFirst"); // answered only once the dialog's window is active
    QTest::addColumn<QStringList>("problems");
    QTest::newRow("window already active") << "x.dat" << true << QStringList();
    QTest::newRow("missing file") << "gone.dat" << false
                                  << QStringList{"unexpected QMessageBox", "unexpected QFileDialog"};
}

// The tests' stand-in for the user: a choice is taken however late it comes, and a window the
// answer opens is reported instead of hanging the test.
void TestInputFile::driverAnswers()
{
    QFETCH(QString, name);
    QFETCH(bool, activeFirst);
    QFETCH(QStringList, problems);

    QTemporaryDir dir;
    writeFile(dir.filePath("x.dat"), exampleCif);
    Import dialog;
    dialog.InputBox->setCurrentIndex(1); // hand-made x.dat: no question follows the choice
    std::unique_ptr<ModalDriver> driver;
    auto startDriver = [&] {
        driver = std::make_unique<ModalDriver>();
        driver->chooseFile(dir.filePath(name));
    };
    bool wasActive = false;
    QElapsedTimer clock;
    QTimer late;
    connect(&late, &QTimer::timeout, this, [&] {
        QWidget *w = QApplication::activeModalWidget();
        if (!w || (!w->isActiveWindow() && clock.elapsed() < 2000))
            return;
        wasActive = w->isActiveWindow();
        late.stop();
        startDriver();
    });
    if (activeFirst) {
        clock.start();
        late.start(1);
    } else {
        startDriver();
    }
    dialog.browseinput->click();

    QVERIFY(driver);
    QCOMPARE(wasActive, activeFirst);
    QCOMPARE(driver->problems, problems);
    QCOMPARE(dialog.inputFile, problems.isEmpty() ? dir.filePath(name) : QString());
}

QTEST_MAIN(TestInputFile)
#include "tst_inputfile.moc"
