#include "cifrewrite.h"
#include "filereplace.h"
#include "inputtestsupport.h"
#include "testsupport.h"

#include <QtTest>

Q_DECLARE_METATYPE(CifRewrite::Outcome)

namespace {
const QByteArray siteTags = "loop_\n_atom_site_label\n_atom_site_type_symbol\n_atom_site_fract_x\n";

QByteArray typeLoop(const QByteArray &rows)
{
    return "loop_\n_atom_type_symbol\n_atom_type_oxidation_number\n" + rows;
}

OxidationIndex indexOf(const QByteArray &table)
{
    return OxidationIndex(parseOxidationTable(QString::fromLatin1(table)).entries);
}

const QString pairing = QStringLiteral("<br><b> Now identifying pairs atom symbol/atom names : </b>");
const QString incorrect = QStringLiteral("<br><b> The following atom line is probably incorrect : </b>");
const QString warning = QStringLiteral("<br><b><font color=#FF3300> WARNING ! </font></b>");
const QString noMatch = QStringLiteral("<b>The following atoms do not have any match in \"oxidation.dat\" file : </b>");
const QString noTypeSymbol
    = QStringLiteral("<br><b><font color=#FF3300> The CIF file must at least contain the flag \"_atom_site_type_symbol\" !");
} // namespace

class TestCifRewrite : public QObject
{
    Q_OBJECT

private slots:
    void workedExample();
    void rewrite_data();
    void rewrite();
    void fileLeftAlone_data();
    void fileLeftAlone();
    void replaceFileContent();
};

void TestCifRewrite::workedExample()
{
    const CifRewrite r = rewriteCifText(QString::fromLatin1(exampleCif()), indexOf(exampleTable()));
    QCOMPARE(r.outcome, CifRewrite::Outcome::Rewritten);
    QCOMPARE(r.text.toLatin1(), exampleRewritten());
    QCOMPARE(r.log, (QStringList{pairing, " Atom Fe1 has symbol Fe3+ and charge 3", " Atom O1 has symbol O2- and charge -2",
                                 warning, noMatch, "Xx1"}));
}

void TestCifRewrite::rewrite_data()
{
    QTest::addColumn<QByteArray>("table");
    QTest::addColumn<QByteArray>("cif");
    QTest::addColumn<QByteArray>("written");
    QTest::addColumn<QStringList>("log");

    QTest::newRow("type symbol as fallback, rows to the end")
        << QByteArray("Fe Fe3+ 3\n") << siteTags + "Fe1 Fe 0.1\n"
        << siteTags + "Fe1 Fe3+ 0.1\n" + typeLoop("Fe3+ 3\n") + "\n"
        << QStringList{pairing, " Atom Fe1 has symbol Fe3+ and charge 3"};
    QTest::newRow("one inserted row per symbol, comment ends rows")
        << QByteArray("Fe1 Fe2 Fe 3\n") << siteTags + "Fe1 Fe 0.1\nFe2 Fe 0.2\n#end\n"
        << siteTags + "Fe1 Fe 0.1\nFe2 Fe 0.2\n" + typeLoop("Fe 3\n") + "#end\n\n"
        << QStringList{pairing, " Atom Fe1 has symbol Fe and charge 3", " Atom Fe2 has symbol Fe and charge 3"};
    QTest::newRow("inserted loop takes the first charge, next loop follows")
        << QByteArray("Fe1 Fe 2\nFe2 Fe 3\n") << siteTags + "Fe1 Fe 0.1\nFe2 Fe 0.2\nloop_\n_x\n"
        << siteTags + "Fe1 Fe 0.1\nFe2 Fe 0.2\n" + typeLoop("Fe 2\n") + "loop_\n_x\n"
        << QStringList{pairing, " Atom Fe1 has symbol Fe and charge 2", " Atom Fe2 has symbol Fe and charge 3"};
    QTest::newRow("charge 100 matches, 100.5 does not, blank line ends rows")
        << QByteArray("A1 A 100\nB1 B 100.5\n") << siteTags + "A1 A 1\nB1 B 1\n\ndata_y\n"
        << siteTags + "A1 A 1\n" + typeLoop("A 100\n") + "\ndata_y\n"
        << QStringList{pairing, " Atom A1 has symbol A and charge 100", warning, noMatch, "B1"};
    QTest::newRow("tabs do not separate, tag ends rows")
        << QByteArray("Fe1 Fe 3\n") << siteTags + "Fe1\tFe\t0.1\nFe1 Fe 0.2\n_tag\n"
        << siteTags + "Fe1 Fe 0.2\n" + typeLoop("Fe 3\n") + "_tag\n\n"
        << QStringList{pairing, incorrect, "Fe1\tFe\t0.1", " Atom Fe1 has symbol Fe and charge 3"};
    QTest::newRow("CR LF read, LF written")
        << QByteArray("Fe1 Fe 3\r\n") << QByteArray("data_x\r\nloop_\r\n_atom_site_label\r\n_atom_site_type_symbol\r\n"
                                                      "Fe1 Fe 0.1\r\nloop_\r\n_y\r\n")
        << "data_x\nloop_\n_atom_site_label\n_atom_site_type_symbol\nFe1 Fe 0.1\n" + typeLoop("Fe 3\n") + "loop_\n_y\n"
        << QStringList{pairing, " Atom Fe1 has symbol Fe and charge 3"};
    QTest::newRow("blank first row is a row")
        << QByteArray("Fe1 Fe 3\n") << siteTags + "\nFe1 Fe 0.1\n"
        << siteTags + "Fe1 Fe 0.1\n" + typeLoop("Fe 3\n") + "\n"
        << QStringList{pairing, incorrect, "", " Atom Fe1 has symbol Fe and charge 3"};
    QTest::newRow("tags found by their folded form; columns lose alignment")
        << QByteArray("Fe1 Fe3+ 3\n")
        << QByteArray("data_x\n# _atom_site_label\n  _atom_site_label  \n\t_atom_site_type_symbol\n  _atom_site_occ\n"
                      "Fe1    Fe    0.1   0.2  1.0\n")
        << "data_x\n# _atom_site_label\n  _atom_site_label  \n\t_atom_site_type_symbol\n  _atom_site_occ\n"
           "Fe1 Fe3+ 0.1 0.2 1.0\n" + typeLoop("Fe3+ 3\n") + "\n"
        << QStringList{pairing, " Atom Fe1 has symbol Fe3+ and charge 3"};
    // Labels, unchanged lines and values outside ASCII come through byte for byte.
    QTest::newRow("bytes outside ASCII")
        << QByteArray("Fe\xe9 Fe\xb3 3\n") << "data_caf\xc3\xa9\n" + siteTags + "Fe\xe9 Fe 0.\xff\n#\x80\x01\n"
        << "data_caf\xc3\xa9\n" + siteTags + "Fe\xe9 Fe\xb3 0.\xff\n" + typeLoop("Fe\xb3 3\n") + "#\x80\x01\n\n"
        << QStringList{pairing, QString::fromLatin1(" Atom Fe\xe9 has symbol Fe\xb3 and charge 3")};
}

void TestCifRewrite::rewrite()
{
    QFETCH(QByteArray, table);
    QFETCH(QByteArray, cif);
    QFETCH(QByteArray, written);
    QFETCH(QStringList, log);

    const CifRewrite r = rewriteCifText(QString::fromLatin1(cif), indexOf(table));
    QCOMPARE(r.outcome, CifRewrite::Outcome::Rewritten);
    QCOMPARE(r.text.toLatin1(), written);
    QCOMPARE(r.log, log);
}

void TestCifRewrite::fileLeftAlone_data()
{
    QTest::addColumn<QByteArray>("table");
    QTest::addColumn<QByteArray>("cif");
    QTest::addColumn<CifRewrite::Outcome>("outcome");
    QTest::addColumn<QStringList>("log");

    const QString noLabel = QStringLiteral(
        "<br><b><font color=#FF3300> The CIF file does not contain the flag \"_atom_site_label\" ! The input file is left unchanged. </font></b><br>");
    const QString noneKept = QStringLiteral(
        "<br><b><font color=#FF3300> No atom line matches \"oxidation.dat\" file ! The input file is left unchanged. </font></b><br>");

    QTest::newRow("no _atom_site_label") << exampleTable() << QByteArray("data_x\nloop_\n_atom_site_type_symbol\nFe1 Fe\n")
                                         << CifRewrite::Outcome::NoAtomSiteLabel << QStringList{noLabel};
    QTest::newRow("empty text") << exampleTable() << QByteArray() << CifRewrite::Outcome::NoAtomSiteLabel
                                << QStringList{noLabel};
    QTest::newRow("label on the last line") << exampleTable() << QByteArray("loop_\n_atom_site_label\n")
                                            << CifRewrite::Outcome::NoTypeSymbol << QStringList{noTypeSymbol};
    QTest::newRow("another tag after the label")
        << exampleTable() << QByteArray("loop_\n_atom_site_label\n_atom_site_fract_x\n_atom_site_type_symbol\nFe1 0 Fe\n")
        << CifRewrite::Outcome::NoTypeSymbol << QStringList{noTypeSymbol};
    QTest::newRow("empty table") << QByteArray() << siteTags + "Fe1 Fe 0\nO1 O 0\n" << CifRewrite::Outcome::NoAtomKept
                                 << QStringList{pairing, warning, noMatch, "Fe1", "O1", noneKept};
    QTest::newRow("no row matches") << exampleTable() << siteTags + "Xx1 Xx 0\n" << CifRewrite::Outcome::NoAtomKept
                                    << QStringList{pairing, warning, noMatch, "Xx1", noneKept};
    QTest::newRow("only incorrect rows") << exampleTable() << siteTags + "Fe1\n" << CifRewrite::Outcome::NoAtomKept
                                         << QStringList{pairing, incorrect, "Fe1", noneKept};
    QTest::newRow("tags to the end") << exampleTable() << siteTags << CifRewrite::Outcome::NoAtomKept
                                     << QStringList{pairing, incorrect, "", noneKept};
}

void TestCifRewrite::fileLeftAlone()
{
    QFETCH(QByteArray, table);
    QFETCH(QByteArray, cif);
    QFETCH(CifRewrite::Outcome, outcome);
    QFETCH(QStringList, log);

    const CifRewrite r = rewriteCifText(QString::fromLatin1(cif), indexOf(table));
    QCOMPARE(r.outcome, outcome);
    QCOMPARE(r.log, log);
    QVERIFY(r.text.isEmpty());
}

void TestCifRewrite::replaceFileContent()
{
    QTemporaryDir dir;
    const QString target = dir.filePath("x.cif");
    const QString temporary = dir.filePath("tmp.cif");

    // A longer tmp.cif from an earlier run leaves no tail behind.
    writeFile(target, "old\n");
    writeFile(temporary, QByteArray(5000, '#'));
    QCOMPARE(::replaceFileContent(temporary, "new\n", target), ReplaceResult::Replaced);
    QCOMPARE(fileBytes(target), QByteArray("new\n"));
    QVERIFY(!QFile::exists(temporary));

    // A temporary path that cannot be opened: nothing changes.
    QVERIFY(QDir(dir.path()).mkdir("tmp.cif"));
    QCOMPARE(::replaceFileContent(temporary, "newer\n", target), ReplaceResult::CannotOpenTemporary);
    QCOMPARE(fileBytes(target), QByteArray("new\n"));
    QVERIFY(QDir(dir.path()).rmdir("tmp.cif"));

    // A target that cannot be replaced (a directory that is not empty): it stays, and the
    // temporary file keeps the new content for the user.
    const QString busy = dir.filePath("busy.cif");
    QVERIFY(QDir(dir.path()).mkpath("busy.cif/inner"));
    QCOMPARE(::replaceFileContent(temporary, "newest\n", busy), ReplaceResult::CannotReplace);
    QVERIFY(QFileInfo(busy).isDir());
    QVERIFY(QFileInfo(dir.filePath("busy.cif/inner")).isDir());
    QCOMPARE(fileBytes(temporary), QByteArray("newest\n"));
}

QTEST_MAIN(TestCifRewrite)
#include "tst_cifrewrite.moc"
