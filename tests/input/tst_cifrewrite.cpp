#include "cifrewrite.h"
#include "filereplace.h"
#include "inputtestsupport.h"
#include "testsupport.h"

#include <QtTest>

Q_DECLARE_METATYPE(CifRewrite::Outcome)

namespace {
const QByteArray tags = "loop_\n_atom_site_label\n_atom_site_type_symbol\n";
const QByteArray typeLoop = "loop_\n_atom_type_symbol\n_atom_type_oxidation_number\n";
const QString pairing = "<br><b> Now identifying pairs atom symbol/atom names : </b>";
const QString incorrect = "<br><b> The following atom line is probably incorrect : </b>";
const QStringList noMatch{"<br><b><font color=#FF3300> WARNING ! </font></b>",
                          "<b>The following atoms do not have any match in \"oxidation.dat\" file : </b>"};
} // namespace

class TestCifRewrite : public QObject
{
    Q_OBJECT

private slots:
    void rewrite_data();
    void rewrite();
    void replaceFileContent();
};

void TestCifRewrite::rewrite_data()
{
    QTest::addColumn<QByteArray>("table");
    QTest::addColumn<QByteArray>("cif");
    QTest::addColumn<CifRewrite::Outcome>("outcome");
    QTest::addColumn<QByteArray>("written");
    QTest::addColumn<QStringList>("log");

    const auto ok = CifRewrite::Outcome::Rewritten;
    QTest::newRow("worked example") << exampleTable << exampleCif << ok << exampleRewritten
                                    << QStringList{pairing, " Atom Fe1 has symbol Fe3+ and charge 3",
                                                   " Atom O1 has symbol O2- and charge -2"} + noMatch + QStringList{"Xx1"};
    QTest::newRow("type symbol as name, rows to the end")
        << QByteArray("Fe Fe3+ 3") << tags + "Fe1    Fe  0.1" << ok << tags + "Fe1 Fe3+ 0.1\n" + typeLoop + "Fe3+ 3\n\n"
        << QStringList{pairing, " Atom Fe1 has symbol Fe3+ and charge 3"};
    QTest::newRow("one loop row per symbol, first charge; comment ends rows")
        << QByteArray("Fe1 Fe 2\nFe2 Fe 3") << tags + "Fe1 Fe 0.1\nFe2 Fe 0.2\n#end\n" << ok
        << tags + "Fe1 Fe 0.1\nFe2 Fe 0.2\n" + typeLoop + "Fe 2\n#end\n\n"
        << QStringList{pairing, " Atom Fe1 has symbol Fe and charge 2", " Atom Fe2 has symbol Fe and charge 3"};
    QTest::newRow("charge 100 matches, 100.5 not; blank line ends rows")
        << QByteArray("A1 A 100\nB1 B 100.5") << tags + "A1 A 1\nB1 B 1\n\ndata_y\n" << ok
        << tags + "A1 A 1\n" + typeLoop + "A 100\n\ndata_y\n"
        << QStringList{pairing, " Atom A1 has symbol A and charge 100"} + noMatch + QStringList{"B1"};
    QTest::newRow("tabs do not separate, blank first row; tag ends rows")
        << QByteArray("Fe1 Fe 3") << tags + "\nFe1\tFe\t0.1\nFe1 Fe 0.2\n_tag\nx\n" << ok
        << tags + "Fe1 Fe 0.2\n" + typeLoop + "Fe 3\n_tag\nx\n"
        << QStringList{pairing, incorrect, "", incorrect, "Fe1\tFe\t0.1", " Atom Fe1 has symbol Fe and charge 3"};
    QTest::newRow("CR LF read, LF written; next loop follows; folded tags")
        << QByteArray("Fe1 Fe 3") << QByteArray("# _atom_site_label\r\n _atom_site_label \r\n\t_atom_site_type_symbol\r\n"
                                                 " _atom_site_occ\r\nFe1 Fe 1\r\nloop_\r\n_y\r\n")
        << ok << "# _atom_site_label\n _atom_site_label \n\t_atom_site_type_symbol\n _atom_site_occ\nFe1 Fe 1\n" + typeLoop
               + "Fe 3\nloop_\n_y\n"
        << QStringList{pairing, " Atom Fe1 has symbol Fe and charge 3"};
    QTest::newRow("bytes outside ASCII kept")
        << QByteArray("Fe\xe9 Fe\xb3 3") << "caf\xc3\xa9\n" + tags + "Fe\xe9 Fe 0.\xff\n#\x80\r\x01\n" << ok
        << "caf\xc3\xa9\n" + tags + "Fe\xe9 Fe\xb3 0.\xff\n" + typeLoop + "Fe\xb3 3\n#\x80\r\x01\n\n"
        << QStringList{pairing, QString::fromLatin1(" Atom Fe\xe9 has symbol Fe\xb3 and charge 3")};

    // The input must stay as it is.
    const QString noneKept = "<br><b><font color=#FF3300> No atom line matches \"oxidation.dat\" file ! "
                             "The input file is left unchanged. </font></b><br>";
    const QString noLabel = "<br><b><font color=#FF3300> The CIF file does not contain the flag \"_atom_site_label\" ! "
                            "The input file is left unchanged. </font></b><br>";
    const QString noTypeSymbol
        = "<br><b><font color=#FF3300> The CIF file must at least contain the flag \"_atom_site_type_symbol\" !";
    QTest::newRow("no _atom_site_label") << exampleTable << QByteArray("data_x\n_atom_site_type_symbol\nFe1 Fe\n")
                                         << CifRewrite::Outcome::NoAtomSiteLabel << QByteArray() << QStringList{noLabel};
    QTest::newRow("empty text") << exampleTable << QByteArray() << CifRewrite::Outcome::NoAtomSiteLabel << QByteArray()
                                << QStringList{noLabel};
    QTest::newRow("label last") << exampleTable << QByteArray("loop_\n_atom_site_label\n")
                                << CifRewrite::Outcome::NoTypeSymbol << QByteArray() << QStringList{noTypeSymbol};
    QTest::newRow("other tag after label") << exampleTable << QByteArray("_atom_site_label\n_atom_site_x\n_atom_site_type_symbol\n")
                                           << CifRewrite::Outcome::NoTypeSymbol << QByteArray() << QStringList{noTypeSymbol};
    QTest::newRow("empty table") << QByteArray() << tags + "Fe1 Fe 0\nO1 O 0\n" << CifRewrite::Outcome::NoAtomKept
                                 << QByteArray() << QStringList{pairing} + noMatch + QStringList{"Fe1", "O1", noneKept};
    QTest::newRow("only incorrect rows") << exampleTable << tags + "Fe1\n" << CifRewrite::Outcome::NoAtomKept
                                         << QByteArray() << QStringList{pairing, incorrect, "Fe1", noneKept};
}

void TestCifRewrite::rewrite()
{
    QFETCH(QByteArray, table);
    QFETCH(QByteArray, cif);
    QFETCH(CifRewrite::Outcome, outcome);
    QFETCH(QByteArray, written);
    QFETCH(QStringList, log);

    const OxidationIndex index(parseOxidationTable(QString::fromLatin1(table)).entries);
    const CifRewrite r = rewriteCifText(QString::fromLatin1(cif), index);
    QCOMPARE(r.outcome, outcome);
    QCOMPARE(r.text.toLatin1(), written);
    QCOMPARE(r.log, log);
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

    // A target that cannot be replaced (a directory that is not empty) stays, and the temporary
    // file keeps the new content.
    const QString busy = dir.filePath("busy.cif");
    QVERIFY(QDir(dir.path()).mkpath("busy.cif/inner"));
    QCOMPARE(::replaceFileContent(temporary, "newest\n", busy), ReplaceResult::CannotReplace);
    QVERIFY(QFileInfo(dir.filePath("busy.cif/inner")).isDir());
    QCOMPARE(fileBytes(temporary), QByteArray("newest\n"));
}

QTEST_MAIN(TestCifRewrite)
#include "tst_cifrewrite.moc"
