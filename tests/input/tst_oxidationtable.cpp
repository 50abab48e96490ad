#include "import.h"
#include "inputtestsupport.h"
#include "oxidationtable.h"
#include "testsupport.h"

#include <QtTest>

Q_DECLARE_METATYPE(OxidationEntry)

// Entries written "name|symbol|charge"; a table given as text in that form, one entry a line.
static QString described(const QList<OxidationEntry> &entries)
{
    QStringList out;
    for (const OxidationEntry &e : entries)
        out.append(e.name + '|' + e.symbol + '|' + QString::number(double(e.charge)));
    return out.join('\n');
}

class TestOxidationTable : public QObject
{
    Q_OBJECT

private slots:
    void parse_data();
    void parse();
    void lookups_data();
    void lookups();
    void indexAgreesWithScanOnLargeTable();
    void readFromWorkingDirectory();
};

void TestOxidationTable::parse_data()
{
    QTest::addColumn<QString>("text");
    QTest::addColumn<QString>("entries");
    QTest::addColumn<QStringList>("log");

    const QString got = "<b>Got the following list of atom symbols and charges :  </b>";
    const QString invalid = "<br><b><font color=#FF3300> Invalid line in \"oxidation.dat\" file! </font></b><br>";
    const QString shouldBe = "<b> should be of type :  atom_names atom_symbol atom_charge </b><br>";

    QTest::newRow("several names") << "Fe1 Fe2 Fe 3\nO1 O -2\n" << "Fe1|Fe|3\nFe2|Fe|3\nO1|O|-2"
                                   << QStringList{got, "Fe1  Fe  3", "Fe2  Fe  3", "O1  O  -2"};
    QTest::newRow("commas, tabs, CR LF, no last line end") << "O1,O2,O,-2\r\n\tFe1 ,,\tFe \t 2.5"
                                                           << "O1|O|-2\nO2|O|-2\nFe1|Fe|2.5"
                                                           << QStringList{got, "O1  O  -2", "O2  O  -2", "Fe1  Fe  2.5"};
    QTest::newRow("not a number, six digits") << "Fe1,Fe,three\nSi1 Si 1.23456789\n" << "Fe1|Fe|0\nSi1|Si|1.23457"
                                              << QStringList{got, "Fe1  Fe  0", "Si1  Si  1.23457"};
    QTest::newRow("two fields stop") << "Fe1 Fe 3\nFe   3\nO1 O -2\n" << "Fe1|Fe|3" << QStringList{invalid, "Fe 3", shouldBe};
    QTest::newRow("blank line stops") << "Fe1 Fe 3\n\nO1 O -2\n" << "Fe1|Fe|3" << QStringList{invalid, "", shouldBe};
    QTest::newRow("extra empty last line") << "Fe1 Fe 3\nO1 O -2\n\n" << "Fe1|Fe|3\nO1|O|-2"
                                           << QStringList{invalid, "", shouldBe};
    QTest::newRow("empty file") << "" << "" << QStringList{invalid, "", shouldBe};
    QTest::newRow("only separators") << " ,\t, " << "" << QStringList{invalid, ", ,", shouldBe};
}

void TestOxidationTable::parse()
{
    QFETCH(QString, text);
    QFETCH(QString, entries);
    QFETCH(QStringList, log);

    const OxidationTableRead read = parseOxidationTable(text);
    QCOMPARE(described(read.entries), entries);
    QCOMPARE(read.log, log);
    QCOMPARE(read.complete, !log.at(0).contains("Invalid line"));
}

void TestOxidationTable::lookups_data()
{
    QTest::addColumn<QList<OxidationEntry>>("table");
    QTest::addColumn<QString>("name");
    QTest::addColumn<QString>("found");
    QTest::addColumn<QString>("symbol");
    QTest::addColumn<float>("charge");

    const QList<OxidationEntry> twice{{"Fe1", "Fe", 2}, {"Fe1", "Fe3+", 3}, {"Fe2", "Fe", 3}};
    QTest::newRow("first of two names") << twice << "Fe1" << "Fe1|Fe|2" << "Fe" << 2.0f;
    QTest::newRow("first of two symbols") << twice << "Fe2" << "Fe2|Fe|3" << "Fe3+" << 3.0f;
    QTest::newRow("key not trimmed, symbol trimmed") << twice << " Fe1" << "||1000" << " Fe " << 2.0f;
    QTest::newRow("case matters") << twice << "fe1" << "||1000" << "FE" << 1000.0f;
    QTest::newRow("table side trimmed") << QList<OxidationEntry>{{" Fe1 ", " Fe ", 2}} << "Fe1" << " Fe1 | Fe |2" << "Fe"
                                        << 2.0f;
    QTest::newRow("empty table") << QList<OxidationEntry>() << "Fe1" << "||1000" << "Fe" << 1000.0f;
}

void TestOxidationTable::lookups()
{
    QFETCH(QList<OxidationEntry>, table);
    QFETCH(QString, name);
    QFETCH(QString, found);
    QFETCH(QString, symbol);
    QFETCH(float, charge);

    // The dialog's lookups, the plain scans and the index used by the rewriting all agree.
    Import dialog;
    dialog.oxidationTable = table;
    const OxidationIndex index(table);
    QCOMPARE(described({dialog.entryForName(name)}), found);
    QCOMPARE(described({index.entryForName(name)}), found);
    QCOMPARE(dialog.chargeForSymbol(symbol), charge);
    QCOMPARE(index.chargeForSymbol(symbol), charge);
}

void TestOxidationTable::indexAgreesWithScanOnLargeTable()
{
    // Enough entries to make the index grow several times; every name and symbol comes thrice.
    QList<OxidationEntry> table;
    for (int i = 0; i < 3000; ++i)
        table.append({"N" + QString::number(i % 1000), "S" + QString::number(i % 1000), float(i)});
    const OxidationIndex index(table);
    for (int i = 0; i < 1100; ++i) {
        const QString name = "N" + QString::number(i);
        const QString symbol = "S" + QString::number(i);
        QCOMPARE(described({index.entryForName(name)}), described({firstEntryForName(table, name)}));
        QCOMPARE(index.chargeForSymbol(symbol), i < 1000 ? float(i) : 1000.0f);
    }
}

void TestOxidationTable::readFromWorkingDirectory()
{
    QTemporaryDir dir;
    Import dialog;
    dialog.workingDir = dir.path();
    const QString found = "Found file \"oxidation.dat\" in working directory :";

    // A missing table is created empty and read as one empty, invalid line.
    dialog.importlog->clear();
    dialog.readOxidationTable();
    QVERIFY(QFileInfo(dir.filePath("oxidation.dat")).isFile());
    QCOMPARE(shownLines(dialog.importlog), (QStringList{found, "Invalid line in \"oxidation.dat\" file!",
                                                        "should be of type : atom_names atom_symbol atom_charge"}));

    writeFile(dir.filePath("oxidation.dat"), "Fe1 Fe2 Fe 3\nO1 O -2\n");
    dialog.importlog->clear();
    dialog.readOxidationTable();
    QCOMPARE(described(dialog.oxidationTable), "Fe1|Fe|3\nFe2|Fe|3\nO1|O|-2");
    QCOMPARE(shownLines(dialog.importlog), (QStringList{found, "Got the following list of atom symbols and charges :",
                                                        "Fe1  Fe  3", "Fe2  Fe  3", "O1  O  -2"}));

    // A directory in the file's place cannot be opened read-write, even by root: the table stays.
    QVERIFY(QFile::remove(dir.filePath("oxidation.dat")) && QDir(dir.path()).mkdir("oxidation.dat"));
    dialog.importlog->clear();
    dialog.readOxidationTable();
    QCOMPARE(described(dialog.oxidationTable), "Fe1|Fe|3\nFe2|Fe|3\nO1|O|-2");
    QCOMPARE(shownLines(dialog.importlog), QStringList{"Cannot open \"oxidation.dat\" file in read-write mode!"});
    QVERIFY(dialog.importlog->toHtml().contains("#ff3300"));
}

QTEST_MAIN(TestOxidationTable)
#include "tst_oxidationtable.moc"
