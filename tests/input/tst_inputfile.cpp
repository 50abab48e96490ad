#include "import.h"
#include "inputpaths.h"
#include "inputtestsupport.h"
#include "modaldriver.h"
#include "testsupport.h"

#include <QtTest>

namespace {
const QString formatQuestion = QStringLiteral("Please check the file format !!");
const QString boxA = QStringLiteral(
    " You have choosen \"CIF\" as input format but the selected file doesnt appear to be a CIF file !");
const QString boxB = QStringLiteral(
    " You have choosen \"Hand made\" or \"old ICSD\" as input format but the selected file seems to be a CIF file instead!");
const QString questionC
    = QStringLiteral("It seems that the selected CIF file does not contain the \"_atom_type_oxidation_number\" flag !");
const QString instructionsC = QStringLiteral(
    "Please edit manually a \"oxidation.dat\" file, in the current working directory, so that the imporation procedure "
    "can modify accordingly the CIF file.\n\n\"oxidation.dat\" file must contain, for each atom, one line : "
    "\n_atom_site_label   _atom_site_type_symbol   _atom_type_oxidation_number \n\nOnce the \"oxidation.dat\" file is "
    "correct, hit OK, otherwise Cancel to keep the CIF file unmodified.");

const QString noOxidationLine
    = QStringLiteral("WARNING : Imput CIF file does not contain \"_atom_type_oxidation_number \"");
const QString usingLine
    = QStringLiteral("Using modified CIF file, charges informations taken from \"oxidation.dat\" file");
const QString modifiedLine
    = QStringLiteral("The input CIF file has been modified according to \"oxidation.dat\" file info.");

void verifyWarningBox(const SeenBox &box, const QString &text, const QString &informative,
                      QMessageBox::StandardButtons buttons)
{
    QCOMPARE(box.title, QStringLiteral("WARNING!"));
    QCOMPARE(box.icon, QMessageBox::Warning);
    QCOMPARE(box.text, text);
    QCOMPARE(box.informativeText, informative);
    QCOMPARE(box.buttons, buttons);
    QCOMPARE(box.defaultButton, QMessageBox::Ok);
}
} // namespace

class TestInputFile : public QObject
{
    Q_OBJECT

private slots:
    void suffixes_data();
    void suffixes();
    void selectionSetsPaths_data();
    void selectionSetsPaths();
    void cancelChangesNothing();
    void formatWarnings_data();
    void formatWarnings();
    void refusedInputStaysCurrent();
    void oxidationTagAnywhere_data();
    void oxidationTagAnywhere();
    void workedExampleThroughBrowse();
    void secondRunKeepsFirstBackup();
    void inputLeftUnchanged_data();
    void inputLeftUnchanged();
    void unopenableInputInRewrite();

private:
    // Chooses path in the Browse dialog, answers the boxes that follow, and checks that every
    // expected window came and no other.
    void browse(Import &dialog, ModalDriver &driver)
    {
        dialog.browseinput->click();
        QVERIFY2(driver.problems.isEmpty(), qPrintable(driver.problems.join('\n')));
        QVERIFY(driver.allAnswered());
    }
};

void TestInputFile::suffixes_data()
{
    QTest::addColumn<QString>("name");
    QTest::addColumn<bool>("mentionsCif");
    QTest::addColumn<bool>("isCif");
    QTest::addColumn<QString>("baseName");

    QTest::newRow("a.cif") << "/d/a.cif" << true << true << "a";
    QTest::newRow("a.CIF") << "/d/a.CIF" << true << true << "a";
    QTest::newRow("a.tar.cif") << "/d/a.tar.cif" << true << false << "a";
    QTest::newRow("a.cif.txt") << "/d/a.cif.txt" << true << false << "a";
    QTest::newRow("a.txt") << "/d/a.txt" << false << false << "a";
    QTest::newRow("a.b.cif") << "/d/a.b.cif" << true << false << "a";
    QTest::newRow("a.mmcif") << "/d/a.mmcif" << true << false << "a";
    QTest::newRow("no suffix") << "/d/cif" << false << false << "cif";
    QTest::newRow("dot in directory") << "/d.cif/a" << false << false << "a";
}

void TestInputFile::suffixes()
{
    QFETCH(QString, name);
    QFETCH(bool, mentionsCif);
    QFETCH(bool, isCif);
    QFETCH(QString, baseName);

    QCOMPARE(suffixMentionsCif(name), mentionsCif);
    QCOMPARE(suffixIsCif(name), isCif);
    QCOMPARE(inputPathsFor(name).baseName, baseName);
    QCOMPARE(backupFileName(inputPathsFor(name).baseName), baseName + "_old.cif");
}

void TestInputFile::selectionSetsPaths_data()
{
    QTest::addColumn<int>("format");
    QTest::addColumn<QString>("caption");
    QTest::addColumn<QStringList>("filters");

    QTest::newRow("CIF File") << 0 << "Select an input CIF file" << QStringList{"CIF files (*.cif)", "All files (*)"};
    QTest::newRow("Hand-made") << 1 << "Select an input file" << QStringList{"All files (*)"};
    QTest::newRow("old ICSD") << 2 << "Select an input file" << QStringList{"All files (*)"};
}

void TestInputFile::selectionSetsPaths()
{
    QFETCH(int, format);
    QFETCH(QString, caption);
    QFETCH(QStringList, filters);

    QTemporaryDir dir;
    // a.b.cif passes the contains test only: no box for CIF, box B for the other formats; no check.
    const QString file = dir.filePath("a.b.cif");
    writeFile(file, "data_a\n");
    Import dialog;
    dialog.InputBox->setCurrentIndex(format);
    const QString logBefore = dialog.importlog->toHtml();

    ModalDriver driver;
    driver.chooseFile(file);
    if (format > 0)
        driver.answerBox(QMessageBox::Ok);
    browse(dialog, driver);

    QCOMPARE(driver.dialogCaptions, QStringList{caption});
    QCOMPARE(driver.dialogFilters.value(0), filters);
    QCOMPARE(dialog.inputFile, file);
    QCOMPARE(dialog.inputpath->text(), file);
    QCOMPARE(dialog.workingDir, dir.path());
    QCOMPARE(dialog.stagedInputPath, dir.path() + "/morvel.in");
    QCOMPARE(dialog.inputBaseName, QStringLiteral("a"));
    QCOMPARE(dialog.importlog->toHtml(), logBefore);
    QCOMPARE(fileBytes(file), QByteArray("data_a\n"));
}

void TestInputFile::cancelChangesNothing()
{
    QTemporaryDir dir;
    const QString file = dir.filePath("x.txt");
    writeFile(file, "x\n");
    Import dialog;
    dialog.InputBox->setCurrentIndex(1);

    ModalDriver driver;
    driver.chooseFile(file);
    browse(dialog, driver);
    const QString logBefore = dialog.importlog->toHtml();
    dialog.InputBox->setCurrentIndex(0);
    driver.chooseFile(QString());
    browse(dialog, driver);

    // The second dialog opened in the last working directory, and cancelling it kept everything.
    QCOMPARE(driver.dialogDirectories.value(1), QFileInfo(dir.path()).absoluteFilePath());
    QCOMPARE(dialog.inputFile, file);
    QCOMPARE(dialog.inputpath->text(), file);
    QCOMPARE(dialog.workingDir, dir.path());
    QCOMPARE(dialog.stagedInputPath, dir.path() + "/morvel.in");
    QCOMPARE(dialog.inputBaseName, QStringLiteral("x"));
    QCOMPARE(dialog.importlog->toHtml(), logBefore);
}

void TestInputFile::formatWarnings_data()
{
    QTest::addColumn<int>("format");
    QTest::addColumn<QString>("name");
    QTest::addColumn<QString>("box"); // the format warning expected: "A", "B" or none
    QTest::addColumn<bool>("checked"); // the oxidation check runs

    QTest::newRow("CIF, x.txt") << 0 << "x.txt" << "A" << false;
    QTest::newRow("CIF, x") << 0 << "x" << "A" << false;
    QTest::newRow("CIF, x.cif.txt") << 0 << "x.cif.txt" << "" << false;
    QTest::newRow("CIF, x.tar.cif") << 0 << "x.tar.cif" << "" << false;
    QTest::newRow("CIF, x.cif") << 0 << "x.cif" << "" << true;
    QTest::newRow("CIF, x.CIF") << 0 << "x.CIF" << "" << true;
    QTest::newRow("Hand-made, x.cif") << 1 << "x.cif" << "B" << false;
    QTest::newRow("old ICSD, x.CIF") << 2 << "x.CIF" << "B" << false;
    QTest::newRow("Hand-made, x.dat") << 1 << "x.dat" << "" << false;
    QTest::newRow("old ICSD, x.txt") << 2 << "x.txt" << "" << false;
}

void TestInputFile::formatWarnings()
{
    QFETCH(int, format);
    QFETCH(QString, name);
    QFETCH(QString, box);
    QFETCH(bool, checked);

    QTemporaryDir dir;
    const QString file = dir.filePath(name);
    writeFile(file, exampleCif());
    writeFile(dir.filePath("oxidation.dat"), exampleTable());
    Import dialog;
    dialog.InputBox->setCurrentIndex(format);
    const QString logBefore = dialog.importlog->toHtml();

    ModalDriver driver;
    driver.chooseFile(file);
    if (!box.isEmpty())
        driver.answerBox(QMessageBox::Ok);
    if (checked)
        driver.answerBox(QMessageBox::Cancel);
    browse(dialog, driver);

    QCOMPARE(driver.boxes.size(), int(!box.isEmpty()) + int(checked));
    if (box == "A")
        verifyWarningBox(driver.boxes.at(0), formatQuestion, boxA, QMessageBox::Ok);
    if (box == "B")
        verifyWarningBox(driver.boxes.at(0), formatQuestion, boxB, QMessageBox::Ok);
    if (checked) {
        verifyWarningBox(driver.boxes.constLast(), questionC, instructionsC, QMessageBox::Ok | QMessageBox::Cancel);
        // The log was cleared first; Cancel keeps the file as it was, without a backup copy.
        QCOMPARE(shownLines(dialog.importlog), (QStringList{noOxidationLine, "Keeping unmodified CIF file"}));
        QVERIFY(!QFile::exists(dir.filePath("x_old.cif")));
    } else {
        QCOMPARE(dialog.importlog->toHtml(), logBefore);
    }
    QCOMPARE(fileBytes(file), exampleCif());
    QCOMPARE(dialog.inputFile, file);
}

void TestInputFile::refusedInputStaysCurrent()
{
    QTemporaryDir dir;
    const QString file = dir.filePath("x.cif");
    writeFile(file, exampleCif());
    Import dialog;
    dialog.InputBox->setCurrentIndex(1);
    const QStringList logBefore = shownLines(dialog.importlog);

    // While box B is up, a directory takes the file's place: root cannot open that read-write either.
    ModalDriver driver;
    driver.chooseFile(file);
    driver.answerBox(QMessageBox::Ok, [&] {
        QFile::remove(file);
        QDir(dir.path()).mkdir("x.cif");
    });
    browse(dialog, driver);

    QCOMPARE(shownLines(dialog.importlog), logBefore + QStringList{"Cannot open input file in read-write mode!"});
    QVERIFY(dialog.importlog->toHtml().contains("#ff3300", Qt::CaseInsensitive));
    QCOMPARE(dialog.inputFile, file);
    QCOMPARE(dialog.workingDir, dir.path());
    QCOMPARE(dialog.inputpath->text(), file);
}

void TestInputFile::oxidationTagAnywhere_data()
{
    QTest::addColumn<QByteArray>("cif");

    QTest::newRow("in a loop") << exampleCif() + "loop_\n_atom_type_symbol\n_atom_type_oxidation_number\nFe3+ 3\n";
    QTest::newRow("in a comment") << "# no _atom_type_oxidation_number here\n" + exampleCif();
    QTest::newRow("in a longer word") << exampleCif() + "_atom_type_oxidation_numbers_x 1\n";
}

void TestInputFile::oxidationTagAnywhere()
{
    QFETCH(QByteArray, cif);

    QTemporaryDir dir;
    const QString file = dir.filePath("x.cif");
    writeFile(file, cif);
    Import dialog;
    ModalDriver driver;
    driver.chooseFile(file);
    browse(dialog, driver);

    QVERIFY(driver.boxes.isEmpty());
    QCOMPARE(shownLines(dialog.importlog),
             QStringList{"Ready to import the CIF file then to run MORVEL (Run MORVEL button below) !"});
    QCOMPARE(fileBytes(file), cif);
}

void TestInputFile::workedExampleThroughBrowse()
{
    QTemporaryDir dir;
    const QString file = dir.filePath("x.cif");
    writeFile(file, exampleCif());
    writeFile(dir.filePath("oxidation.dat"), exampleTable());
    // A longer leftover tmp.cif must not leave its tail in the new file.
    writeFile(dir.filePath("tmp.cif"), QByteArray(10000, '#'));

    Import dialog;
    ModalDriver driver;
    driver.chooseFile(file);
    driver.answerBox(QMessageBox::Ok);
    browse(dialog, driver);

    QCOMPARE(fileBytes(file), exampleRewritten());
    QCOMPARE(fileBytes(dir.filePath("x_old.cif")), exampleCif());
    QVERIFY(!QFile::exists(dir.filePath("tmp.cif")));
    QCOMPARE(shownLines(dialog.importlog),
             (QStringList{noOxidationLine, usingLine, "Original CIF file has been saved under x_old.cif",
                          "Found file \"oxidation.dat\" in working directory :",
                          "Got the following list of atom symbols and charges :", "Fe1  Fe3+  3", "O1  O2-  -2",
                          "Now identifying pairs atom symbol/atom names :", "Atom Fe1 has symbol Fe3+ and charge 3",
                          "Atom O1 has symbol O2- and charge -2", "WARNING !",
                          "The following atoms do not have any match in \"oxidation.dat\" file :", "Xx1", modifiedLine,
                          "Ready to import the CIF file then to run MORVEL !"}));
    QVERIFY(dialog.importlog->toHtml().contains("#00cc00", Qt::CaseInsensitive));
}

void TestInputFile::secondRunKeepsFirstBackup()
{
    QTemporaryDir dir;
    const QString file = dir.filePath("x.cif");
    writeFile(dir.filePath("oxidation.dat"), exampleTable());
    writeFile(file, exampleCif());
    Import dialog;
    ModalDriver driver;
    driver.chooseFile(file);
    driver.answerBox(QMessageBox::Ok);
    browse(dialog, driver);

    // A second file of the same base name, with CR LF line ends this time.
    QByteArray second = exampleCif();
    second.replace("0.0 0.0 0.0", "0.25 0.25 0.25").replace("\n", "\r\n");
    writeFile(file, second);
    driver.chooseFile(file);
    driver.answerBox(QMessageBox::Ok);
    browse(dialog, driver);

    QCOMPARE(fileBytes(dir.filePath("x_old.cif")), exampleCif());
    QByteArray expected = exampleRewritten();
    QCOMPARE(fileBytes(file), expected.replace("0.0 0.0 0.0", "0.25 0.25 0.25"));
    const QStringList shown = shownLines(dialog.importlog);
    QCOMPARE(shown.value(2), QStringLiteral("Cannot overwrite save file : x_old.cif"));
    QCOMPARE(shown.constLast(), QStringLiteral("Ready to import the CIF file then to run MORVEL !"));
}

void TestInputFile::inputLeftUnchanged_data()
{
    QTest::addColumn<QByteArray>("cif");
    QTest::addColumn<QByteArray>("table"); // "-" for no table file at all
    QTest::addColumn<bool>("tmpIsDirectory");
    QTest::addColumn<QStringList>("lastLines");

    const QByteArray tags = "loop_\n_atom_site_label\n_atom_site_type_symbol\n";
    QTest::newRow("no _atom_site_label")
        << QByteArray("data_x\n_cell_length_a 5.0\n") << exampleTable() << false
        << QStringList{"O1  O2-  -2", "The CIF file does not contain the flag \"_atom_site_label\" ! The input file is left unchanged."};
    QTest::newRow("no _atom_site_type_symbol after the label")
        << QByteArray("loop_\n_atom_site_label\n_atom_site_fract_x\nFe1 0.1\n") << exampleTable() << false
        << QStringList{"O1  O2-  -2", "The CIF file must at least contain the flag \"_atom_site_type_symbol\" !"};
    QTest::newRow("empty table")
        << tags + "Fe1 Fe 0\nO1 O 0\n" << QByteArray() << false
        << QStringList{"Now identifying pairs atom symbol/atom names :", "WARNING !",
                       "The following atoms do not have any match in \"oxidation.dat\" file :", "Fe1", "O1",
                       "No atom line matches \"oxidation.dat\" file ! The input file is left unchanged."};
    QTest::newRow("no table file")
        << tags + "Fe1 Fe 0\n" << QByteArray("-") << false
        << QStringList{"The following atoms do not have any match in \"oxidation.dat\" file :", "Fe1",
                       "No atom line matches \"oxidation.dat\" file ! The input file is left unchanged."};
    QTest::newRow("tmp.cif cannot be opened")
        << exampleCif() << exampleTable() << true
        << QStringList{"Xx1", "Cannot open temporary file in read-write mode!"};
}

void TestInputFile::inputLeftUnchanged()
{
    QFETCH(QByteArray, cif);
    QFETCH(QByteArray, table);
    QFETCH(bool, tmpIsDirectory);
    QFETCH(QStringList, lastLines);

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
    browse(dialog, driver);

    QCOMPARE(fileBytes(file), cif);
    QCOMPARE(fileBytes(dir.filePath("x_old.cif")), cif);
    QCOMPARE(QFileInfo(dir.filePath("tmp.cif")).isDir(), tmpIsDirectory);
    QVERIFY(tmpIsDirectory || !QFile::exists(dir.filePath("tmp.cif")));
    const QStringList shown = shownLines(dialog.importlog);
    QCOMPARE(shown.mid(shown.size() - lastLines.size()), lastLines);
    QVERIFY(dialog.importlog->toHtml().contains("#ff3300", Qt::CaseInsensitive));
    QVERIFY(!dialog.importlog->toHtml().contains("#00cc00", Qt::CaseInsensitive));
}

void TestInputFile::unopenableInputInRewrite()
{
    // The input vanished after the check, and a directory took its place.
    QTemporaryDir dir;
    QVERIFY(QDir(dir.path()).mkdir("x.cif"));
    writeFile(dir.filePath("oxidation.dat"), exampleTable());
    Import dialog;
    dialog.workingDir = dir.path();
    dialog.inputFile = dir.filePath("x.cif");
    dialog.inputBaseName = QStringLiteral("x");
    dialog.importlog->clear();
    dialog.addOxidationNumbers();

    const QStringList shown = shownLines(dialog.importlog);
    QCOMPARE(shown.first(), QStringLiteral("Cannot overwrite save file : x_old.cif"));
    QCOMPARE(shown.constLast(), QStringLiteral("Cannot open input file in read-write mode!"));
    QVERIFY(!QFile::exists(dir.filePath("tmp.cif")));
}

QTEST_MAIN(TestInputFile)
#include "tst_inputfile.moc"
