#include "import.h"
#include "inputtestsupport.h"
#include "oxidationtable.h"
#include "testsupport.h"

#include <QtTest>

namespace {
// Entries written as "name|symbol|charge" so that a table row reads at a glance.
QStringList described(const QList<OxidationEntry> &entries)
{
    QStringList out;
    for (const OxidationEntry &e : entries)
        out.append(e.name + QLatin1Char('|') + e.symbol + QLatin1Char('|') + QString::number(double(e.charge)));
    return out;
}

const QString gotList = QStringLiteral("<b>Got the following list of atom symbols and charges :  </b>");
const QString invalidLine
    = QStringLiteral("<br><b><font color=#FF3300> Invalid line in \"oxidation.dat\" file! </font></b><br>");
const QString shouldBe = QStringLiteral("<b> should be of type :  atom_names atom_symbol atom_charge </b><br>");
} // namespace

class TestOxidationTable : public QObject
{
    Q_OBJECT

private slots:
    void parse_data();
    void parse();
    void lookups_data();
    void lookups();
    void readFromWorkingDirectory();
    void unopenableTableKeepsPreviousOne();
};

void TestOxidationTable::parse_data()
{
    QTest::addColumn<QString>("text");
    QTest::addColumn<QStringList>("entries");
    QTest::addColumn<QStringList>("echo");      // for a complete read
    QTest::addColumn<bool>("stopped");
    QTest::addColumn<QString>("invalid");       // the reduced invalid line, when reading stopped

    QTest::newRow("several names, two lines")
        << "Fe1 Fe2 Fe 3\nO1 O -2\n" << QStringList{"Fe1|Fe|3", "Fe2|Fe|3", "O1|O|-2"}
        << QStringList{"Fe1  Fe  3", "Fe2  Fe  3", "O1  O  -2"} << false << QString();
    QTest::newRow("commas") << "O1,O2,O,-2" << QStringList{"O1|O|-2", "O2|O|-2"}
                            << QStringList{"O1  O  -2", "O2  O  -2"} << false << QString();
    QTest::newRow("tabs, runs of separators") << "  Fe1\t,, Fe \t 2.5  \n" << QStringList{"Fe1|Fe|2.5"}
                                              << QStringList{"Fe1  Fe  2.5"} << false << QString();
    QTest::newRow("charge not a number") << "Fe1,Fe,three\n" << QStringList{"Fe1|Fe|0"}
                                         << QStringList{"Fe1  Fe  0"} << false << QString();
    QTest::newRow("CR LF, no final line end") << "Fe1 Fe3+ 3\r\nO1 O2- -2" << QStringList{"Fe1|Fe3+|3", "O1|O2-|-2"}
                                              << QStringList{"Fe1  Fe3+  3", "O1  O2-  -2"} << false << QString();
    QTest::newRow("six digits") << "Si1 Si 1.23456789\n" << QStringList{"Si1|Si|1.23457"}
                                << QStringList{"Si1  Si  1.23457"} << false << QString();
    QTest::newRow("two fields") << "Fe1 Fe 3\nFe   3\nO1 O -2\n" << QStringList{"Fe1|Fe|3"} << QStringList()
                                << true << "Fe 3";
    QTest::newRow("blank line between") << "Fe1 Fe 3\n\nO1 O -2\n" << QStringList{"Fe1|Fe|3"} << QStringList()
                                        << true << "";
    QTest::newRow("extra empty line at the end") << "Fe1 Fe 3\nO1 O -2\n\n" << QStringList{"Fe1|Fe|3", "O1|O|-2"}
                                                 << QStringList() << true << "";
    QTest::newRow("empty file") << "" << QStringList() << QStringList() << true << "";
    QTest::newRow("only separators") << " ,\t, " << QStringList() << QStringList() << true << ", ,";
}

void TestOxidationTable::parse()
{
    QFETCH(QString, text);
    QFETCH(QStringList, entries);
    QFETCH(QStringList, echo);
    QFETCH(bool, stopped);
    QFETCH(QString, invalid);

    const OxidationTableRead read = parseOxidationTable(text);
    QCOMPARE(described(read.entries), entries);
    QCOMPARE(read.complete, !stopped);
    if (stopped)
        QCOMPARE(read.log, (QStringList{invalidLine, invalid, shouldBe}));
    else
        QCOMPARE(read.log, QStringList{gotList} + echo);
}

void TestOxidationTable::lookups_data()
{
    QTest::addColumn<QString>("table");
    QTest::addColumn<QString>("name");
    QTest::addColumn<QString>("found");  // "name|symbol|charge" of the entry found by name
    QTest::addColumn<QString>("symbol");
    QTest::addColumn<float>("charge");   // found by symbol

    QTest::newRow("first of two names") << "Fe1 Fe 2\nFe1 Fe3+ 3" << "Fe1" << "Fe1|Fe|2" << "Fe3+" << 3.0f;
    QTest::newRow("first of two symbols") << "Fe1 Fe 2\nFe2 Fe 3" << "Fe2" << "Fe2|Fe|3" << "Fe" << 2.0f;
    QTest::newRow("key with blanks") << "Fe1 Fe 2" << " Fe1" << "||1000" << " Fe " << 2.0f;
    QTest::newRow("case matters") << "Fe1 Fe 2" << "fe1" << "||1000" << "FE" << 1000.0f;
    QTest::newRow("empty table") << "" << "Fe1" << "||1000" << "Fe" << 1000.0f;
    QTest::newRow("table side untrimmed") << " Fe1 | Fe |2" << "Fe1" << " Fe1 | Fe |2" << "Fe" << 2.0f;
}

void TestOxidationTable::lookups()
{
    QFETCH(QString, table);
    QFETCH(QString, name);
    QFETCH(QString, found);
    QFETCH(QString, symbol);
    QFETCH(float, charge);

    // Rows are "name symbol charge" or, to carry blanks, "name|symbol|charge".
    QList<OxidationEntry> entries;
    for (const QString &line : table.split(QLatin1Char('\n'), Qt::SkipEmptyParts)) {
        const QStringList f = line.contains(QLatin1Char('|')) ? line.split(QLatin1Char('|')) : line.split(QLatin1Char(' '));
        entries.append(OxidationEntry{f.at(0), f.at(1), f.at(2).toFloat()});
    }

    const OxidationIndex index(entries);
    QCOMPARE(described({firstEntryForName(entries, name)}), QStringList{found});
    QCOMPARE(described({index.entryForName(name)}), QStringList{found});
    QCOMPARE(firstChargeForSymbol(entries, symbol), charge);
    QCOMPARE(index.chargeForSymbol(symbol), charge);

    Import dialog;
    dialog.oxidationTable = entries;
    QCOMPARE(described({dialog.entryForName(name)}), QStringList{found});
    QCOMPARE(dialog.chargeForSymbol(symbol), charge);
}

void TestOxidationTable::readFromWorkingDirectory()
{
    QTemporaryDir dir;
    Import dialog;
    dialog.workingDir = dir.path();

    // A missing table is created empty and read as one invalid (empty) line.
    dialog.importlog->clear();
    dialog.readOxidationTable();
    QVERIFY(QFile::exists(dir.filePath("oxidation.dat")));
    QVERIFY(dialog.oxidationTable.isEmpty());
    QCOMPARE(shownLines(dialog.importlog),
             (QStringList{"Found file \"oxidation.dat\" in working directory :",
                          "Invalid line in \"oxidation.dat\" file!", "should be of type : atom_names atom_symbol atom_charge"}));

    writeFile(dir.filePath("oxidation.dat"), "Fe1 Fe2 Fe 3\nO1 O -2\n");
    dialog.importlog->clear();
    dialog.readOxidationTable();
    QCOMPARE(described(dialog.oxidationTable), (QStringList{"Fe1|Fe|3", "Fe2|Fe|3", "O1|O|-2"}));
    QCOMPARE(shownLines(dialog.importlog),
             (QStringList{"Found file \"oxidation.dat\" in working directory :",
                          "Got the following list of atom symbols and charges :", "Fe1  Fe  3", "Fe2  Fe  3", "O1  O  -2"}));
}

void TestOxidationTable::unopenableTableKeepsPreviousOne()
{
    QTemporaryDir dir;
    Import dialog;
    dialog.workingDir = dir.path();
    writeFile(dir.filePath("oxidation.dat"), "Fe1 Fe 3\n");
    dialog.readOxidationTable();
    QCOMPARE(dialog.oxidationTable.size(), 1);

    // A directory in the file's place cannot be opened for writing, even by root.
    QVERIFY(QFile::remove(dir.filePath("oxidation.dat")));
    QVERIFY(QDir(dir.path()).mkdir("oxidation.dat"));
    dialog.importlog->clear();
    dialog.readOxidationTable();
    QCOMPARE(described(dialog.oxidationTable), QStringList{"Fe1|Fe|3"});
    QCOMPARE(shownLines(dialog.importlog), QStringList{"Cannot open \"oxidation.dat\" file in read-write mode!"});
    QVERIFY(dialog.importlog->toHtml().contains("#ff3300", Qt::CaseInsensitive));
}

QTEST_MAIN(TestOxidationTable)
#include "tst_oxidationtable.moc"
