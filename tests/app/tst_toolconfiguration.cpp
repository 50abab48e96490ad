#include "import.h"
#include "testsupport.h"

#include <QDir>
#include <QtTest>

class TestToolConfiguration : public QObject
{
    Q_OBJECT

private slots:
    void nothingPresent();
    void binariesFile_data();
    void binariesFile();
    void versionText_data();
    void versionText();
    void versionFileCannotBeOpened();
    void binariesFileCannotBeOpened();
};

namespace {
const QString missingMorvel = QStringLiteral(
    "The MORVEL binary file given in ./binaries.txt does not exist in the binaries directory!");
const QString missingParser = QStringLiteral(
    "The CIF converter binary file given in ./binaries.txt does not exist in the binaries directory!");

void makeProgram(const QString &path)
{
    QDir().mkpath(QFileInfo(path).path());
    writeFile(path, "#!/bin/sh\n");
}
} // namespace

void TestToolConfiguration::nothingPresent()
{
    CurrentDirScope cwd;
    Import dialog;
    const QStringList expected = {
        "The file ./binaries.txt does not exist in the binaries directory!",
        "Default binaries names will be used",
        "The version.txt file does not exist in the binaries directory!",
        missingMorvel,
        "Default MORVEL program name will be used",
        missingParser,
        "Default CIF converter program name will be used",
        "Using programs :",
        "Morvel = ./morvel.exe version unknown",
        "Cif Parser = ./cif_parser.exe",
    };
    QCOMPARE(logLines(dialog.importlog), expected);
    QCOMPARE(dialog.morvelProgram, QStringLiteral("./morvel.exe"));
    QCOMPARE(dialog.parserProgram, QStringLiteral("./cif_parser.exe"));
    QCOMPARE(dialog.versionText, QStringLiteral("          version unknown"));
    QVERIFY(dialog.importlog->toHtml().contains(QStringLiteral("font-weight:700;\">Using programs :")));
}

void TestToolConfiguration::binariesFile_data()
{
    QTest::addColumn<QByteArray>("contents");
    QTest::addColumn<QStringList>("programs"); // files made in the current directory
    QTest::addColumn<QString>("morvel");
    QTest::addColumn<QString>("parser");
    QTest::addColumn<bool>("morvelMissingLines");
    QTest::addColumn<bool>("parserMissingLines");

    const QStringList both = {"bin/m", "bin/p"};
    QTest::newRow("morvel first") << QByteArray("MORVEL ./bin/m\nPARSER ./bin/p\n") << both
                                  << "./bin/m" << "./bin/p" << false << false;
    QTest::newRow("parser first") << QByteArray("PARSER ./bin/p\nMORVEL ./bin/m\n") << both
                                  << "./bin/m" << "./bin/p" << false << false;
    QTest::newRow("CR LF line ends") << QByteArray("MORVEL ./bin/m\r\nPARSER ./bin/p\r\n") << both
                                     << "./bin/m" << "./bin/p" << false << false;
    QTest::newRow("no space after key, blanks around value")
        << QByteArray("MORVEL\t ./bin/m  \nPARSER./bin/p\n") << both << "./bin/m" << "./bin/p" << false << false;
    QTest::newRow("key on third line not seen")
        << QByteArray("MORVEL ./bin/m\n\nPARSER ./bin/p\n") << both << "./bin/m" << "./cif_parser.exe" << false
        << true;
    QTest::newRow("leading blank and lower case ignored")
        << QByteArray(" MORVEL ./bin/m\nparser ./bin/p\n") << both << "./morvel.exe" << "./cif_parser.exe" << true
        << true;
    QTest::newRow("same key twice, second wins")
        << QByteArray("MORVEL ./bin/p\nMORVEL ./bin/m\n") << both << "./bin/m" << "./cif_parser.exe" << false
        << true;
    QTest::newRow("inner white space folded")
        << QByteArray("MORVEL ./my  dir/m\nPARSER ./my\t dir/p\n") << QStringList{"my dir/m", "my dir/p"}
        << "./my dir/m" << "./my dir/p" << false << false;
    QTest::newRow("folded path misses the real file")
        << QByteArray("MORVEL ./two  spaces/m\n") << QStringList{"two  spaces/m"} << "./morvel.exe"
        << "./cif_parser.exe" << true << true;
    QTest::newRow("equals sign belongs to the value")
        << QByteArray("MORVEL=./bin/m\nPARSER ./bin/p\n") << both << "./morvel.exe" << "./bin/p" << true << false;
}

void TestToolConfiguration::binariesFile()
{
    QFETCH(QByteArray, contents);
    QFETCH(QStringList, programs);
    QFETCH(QString, morvel);
    QFETCH(QString, parser);
    QFETCH(bool, morvelMissingLines);
    QFETCH(bool, parserMissingLines);

    CurrentDirScope cwd;
    writeFile(cwd.file("binaries.txt"), contents);
    writeFile(cwd.file("version.txt"), "Version : 2.1 (test)\n");
    for (const QString &program : programs)
        makeProgram(cwd.file(program));

    Import dialog;
    QCOMPARE(dialog.morvelProgram, morvel);
    QCOMPARE(dialog.parserProgram, parser);
    const QStringList lines = logLines(dialog.importlog);
    QVERIFY(!lines.contains(QStringLiteral("Default binaries names will be used")));
    QCOMPARE(lines.contains(missingMorvel), morvelMissingLines);
    QCOMPARE(lines.contains(QStringLiteral("Default MORVEL program name will be used")), morvelMissingLines);
    QCOMPARE(lines.contains(missingParser), parserMissingLines);
    QCOMPARE(lines.contains(QStringLiteral("Default CIF converter program name will be used")),
             parserMissingLines);
    QCOMPARE(lines.at(lines.size() - 2), QStringLiteral("Morvel = ") + morvel + QStringLiteral(" 2.1 (test)"));
    QCOMPARE(lines.last(), QStringLiteral("Cif Parser = ") + parser);
}

void TestToolConfiguration::versionText_data()
{
    QTest::addColumn<QByteArray>("contents");
    QTest::addColumn<QString>("versionText");
    QTest::addColumn<QString>("shown");
    QTest::newRow("label and version") << QByteArray("Version : 2015.3\nsecond line\n")
                                       << "Version : 2015.3" << "2015.3";
    QTest::newRow("kept untrimmed") << QByteArray("  label   v1  \n") << "  label   v1  " << "v1  ";
    QTest::newRow("exactly ten characters") << QByteArray("0123456789\n") << "0123456789" << "";
    QTest::newRow("shorter than the label") << QByteArray("v1\n") << "v1" << "";
    QTest::newRow("empty file") << QByteArray() << "" << "";
}

void TestToolConfiguration::versionText()
{
    QFETCH(QByteArray, contents);
    QFETCH(QString, versionText);
    QFETCH(QString, shown);
    CurrentDirScope cwd;
    writeFile(cwd.file("version.txt"), contents);
    Import dialog;
    QCOMPARE(dialog.versionText, versionText);
    // A version of ten characters or fewer leaves the line ending with the space after the path.
    QCOMPARE(logLines(dialog.importlog).at(logLines(dialog.importlog).size() - 2),
             QStringLiteral("Morvel = ./morvel.exe ") + shown);
}

void TestToolConfiguration::versionFileCannotBeOpened()
{
    // A directory in the file's place cannot be opened, not even by root.
    CurrentDirScope cwd;
    QVERIFY(QDir(cwd.path()).mkdir(QStringLiteral("version.txt")));
    Import dialog;
    const QStringList expected = {
        "The file ./binaries.txt does not exist in the binaries directory!",
        "Default binaries names will be used",
        "",
        "Something went wrong while opening \"version.txt\" file! ",
        "",
    };
    QCOMPARE(logLines(dialog.importlog), expected);
    QVERIFY(dialog.importlog->toHtml().contains(QStringLiteral("color:#ff3300")));
    QVERIFY(dialog.versionText.isEmpty());
    // The rest of the start-up report is skipped, the defaults stay unchecked.
    QCOMPARE(dialog.morvelProgram, QStringLiteral("./morvel.exe"));
}

void TestToolConfiguration::binariesFileCannotBeOpened()
{
    CurrentDirScope cwd;
    QVERIFY(QDir(cwd.path()).mkdir(QStringLiteral("binaries.txt")));
    makeProgram(cwd.file("morvel.exe"));
    makeProgram(cwd.file("cif_parser.exe"));
    Import dialog;
    const QStringList expected = {
        "The file ./binaries.txt does not exist in the binaries directory!",
        "Default binaries names will be used",
        "The version.txt file does not exist in the binaries directory!",
        "Using programs :",
        "Morvel = ./morvel.exe version unknown",
        "Cif Parser = ./cif_parser.exe",
    };
    QCOMPARE(logLines(dialog.importlog), expected);
}

QTEST_MAIN(TestToolConfiguration)
#include "tst_toolconfiguration.moc"
