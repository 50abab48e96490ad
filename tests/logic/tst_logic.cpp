// The plain functions behind the dialog: the oxidation table, the CIF rewriting, the job files'
// text, the result text, the guarded markup resources.
#include "cifrewrite.h"
#include "filedrop.h"
#include "filereplace.h"
#include "inputpaths.h"
#include "logwindow.h"
#include "runlogic.h"
#include "testsupport.h"
#include "toolconfiguration.h"

#include <QBuffer>
#include <QImage>
#include <QMimeData>
#include <QPainter>
#include <QTextEdit>
#include <QtTest>

#include <csignal>
#include <sys/resource.h>
#include <sys/stat.h>

namespace {
QStringList flat(const LogGroups &groups)
{
    QStringList lines;
    for (const QStringList &group : groups)
        lines += group;
    return lines;
}

// Entries written "name|symbol|charge".
QString described(const QList<OxidationEntry> &entries)
{
    QStringList out;
    for (const OxidationEntry &e : entries)
        out.append(e.name + '|' + e.symbol + '|' + QString::number(double(e.charge)));
    return out.join('\n');
}

const QByteArray tags = "loop_\n_atom_site_label\n_atom_site_type_symbol\n";
const QByteArray typeLoop = "loop_\n_atom_type_symbol\n_atom_type_oxidation_number\n";
const QString pairing = "<br><b> Now identifying pairs atom symbol/atom names : </b>";
const QString incorrect = "<br><b> The following atom line is probably incorrect : </b>";
const QStringList noMatch{"<br><b><font color=#FF3300> WARNING ! </font></b>",
                          "<b>The following atoms do not have any match in \"oxidation.dat\" file : </b>"};
const QString unchanged = " The input file is left unchanged. </font></b><br>";

// Writing to a file stops after limit bytes, as on a full disk, while the object lives.
struct FileSizeLimit
{
    rlimit previous{};
    explicit FileSizeLimit(rlim_t limit)
    {
        std::signal(SIGXFSZ, SIG_IGN);
        getrlimit(RLIMIT_FSIZE, &previous);
        rlimit low = previous;
        low.rlim_cur = limit;
        setrlimit(RLIMIT_FSIZE, &low);
    }
    ~FileSizeLimit() { setrlimit(RLIMIT_FSIZE, &previous); }
};
} // namespace

Q_DECLARE_METATYPE(CifRewrite::Outcome)

class TestLogic : public QObject
{
    Q_OBJECT

private slots:
    void oxidationTable_data()
    {
        QTest::addColumn<QString>("text");
        QTest::addColumn<QString>("entries");
        QTest::addColumn<QStringList>("log");
        const QString got = "<b>Got the following list of atom symbols and charges :  </b>";
        const QString invalid = "<br><b><font color=#FF3300> Invalid line in \"oxidation.dat\" file! </font></b><br>";
        const QString shouldBe = "<b> should be of type :  atom_names atom_symbol atom_charge </b><br>";
        QTest::newRow("several names") << "Fe1 Fe2 Fe 3\nO1 O -2\n" << "Fe1|Fe|3\nFe2|Fe|3\nO1|O|-2"
                                       << QStringList{got, "Fe1  Fe  3", "Fe2  Fe  3", "O1  O  -2"};
        QTest::newRow("commas, tabs, CR LF, no last line end")
            << "O1,O2,O,-2\r\n\tFe1 ,,\tFe \t 2.5" << "O1|O|-2\nO2|O|-2\nFe1|Fe|2.5"
            << QStringList{got, "O1  O  -2", "O2  O  -2", "Fe1  Fe  2.5"};
        QTest::newRow("not a number, six digits") << "Fe1,Fe,three\nSi1 Si 1.23456789\n" << "Fe1|Fe|0\nSi1|Si|1.23457"
                                                  << QStringList{got, "Fe1  Fe  0", "Si1  Si  1.23457"};
        QTest::newRow("two fields stop") << "Fe1 Fe 3\nFe   3\nO1 O -2\n" << "Fe1|Fe|3"
                                         << QStringList{invalid, "Fe 3", shouldBe};
        QTest::newRow("extra empty last line") << "Fe1 Fe 3\nO1 O -2\n\n" << "Fe1|Fe|3\nO1|O|-2"
                                               << QStringList{invalid, "", shouldBe};
        QTest::newRow("empty file") << "" << "" << QStringList{invalid, "", shouldBe};
    }
    void oxidationTable()
    {
        QFETCH(QString, text);
        const OxidationTableRead read = parseOxidationTable(text);
        QTEST(described(read.entries), "entries");
        QTEST(flat(read.log), "log");
    }

    void lookups()
    {
        // The first entry wins, by trimmed name (the key is not trimmed) and by trimmed symbol.
        const OxidationIndex index({{"Fe1", "Fe", 2}, {" Fe1 ", "Fe3+", 3}, {"Fe2", " Fe ", 5}, {"O1", "O", -2}});
        QCOMPARE(described({index.entryForName("Fe1")}), "Fe1|Fe|2");
        QCOMPARE(described({index.entryForName("Fe2")}), "Fe2| Fe |5");
        QCOMPARE(described({index.entryForName(" Fe1")}), "||1000");
        QCOMPARE(described({index.entryForName("fe1")}), "||1000");
        QCOMPARE(index.chargeForSymbol(" Fe "), 2.0f);
        QCOMPARE(index.chargeForSymbol("Fe3+"), 3.0f);
        QCOMPARE(index.chargeForSymbol("FE"), 1000.0f);
    }

    void rewrite_data()
    {
        QTest::addColumn<QByteArray>("table");
        QTest::addColumn<QByteArray>("cif");
        QTest::addColumn<CifRewrite::Outcome>("outcome");
        QTest::addColumn<QByteArray>("written");
        QTest::addColumn<QStringList>("log");
        const auto ok = CifRewrite::Outcome::Rewritten;
        const QByteArray exampleHead = "data_x\nloop_\n_atom_site_label\n_atom_site_type_symbol\n_atom_site_fract_x\n";
        QTest::newRow("worked example")
            << QByteArray("Fe1 Fe3+ 3\nO1 O2- -2\n")
            << exampleHead + "Fe1   Fe  0.0 0.0 0.0\nO1    O   0.5 0.5 0.5\nXx1   Xx  0.1 0.1 0.1\nloop_\n_atom_site_aniso_label\n"
            << ok
            << exampleHead + "Fe1 Fe3+ 0.0 0.0 0.0\nO1 O2- 0.5 0.5 0.5\n" + typeLoop + "Fe3+ 3\nO2- -2\nloop_\n_atom_site_aniso_label\n"
            << QStringList{pairing, " Atom Fe1 has symbol Fe3+ and charge 3", " Atom O1 has symbol O2- and charge -2"}
                   + noMatch + QStringList{"Xx1"};
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
        QTest::newRow("CR LF read, LF written; folded tags; bytes outside ASCII kept")
            << QByteArray("Fe\xe9 Fe\xb3 3")
            << QByteArray("# _atom_site_label\r\n _atom_site_label \r\n\t_atom_site_type_symbol\r\nFe\xe9 Fe 1\xff\r\nloop_\r\n")
            << ok
            << "# _atom_site_label\n _atom_site_label \n\t_atom_site_type_symbol\nFe\xe9 Fe\xb3 1\xff\n" + typeLoop
                   + "Fe\xb3 3\nloop_\n\n"
            << QStringList{pairing, QString::fromLatin1(" Atom Fe\xe9 has symbol Fe\xb3 and charge 3")};

        // A block that has an atom-type loop already gets a column in it, not a second loop.
        const QByteArray sites = tags + "_atom_site_fract_x\nSi1 Si 0.125\nO1 O 0.5\n";
        QTest::newRow("atom-type loop before the sites")
            << QByteArray("Si1 Si4+ 4\nO1 O -2")
            << "data_si\nloop_\n_atom_type_symbol\n_atom_type_description\n_atom_type_scat_source\n"
               "Si Si 'International Tables Vol C'\nO O 'Int Tables'\n" + sites
            << ok
            << "data_si\nloop_\n_atom_type_symbol\n_atom_type_description\n_atom_type_scat_source\n"
               "_atom_type_oxidation_number\nSi Si 'International Tables Vol C' ?\nO O 'Int Tables' -2\nSi4+ ? ? 4\n"
               + tags + "_atom_site_fract_x\nSi1 Si4+ 0.125\nO1 O 0.5\n\n"
            << QStringList{pairing, " Atom Si1 has symbol Si4+ and charge 4", " Atom O1 has symbol O and charge -2"};
        QTest::newRow("atom-type loop after: comments, two rows a line, quotes, a text field")
            << QByteArray("Fe1 Fe 3")
            << tags + "Fe1 Fe\nloop_\n_atom_type_symbol # types\n_atom_type_scat_source\n'Fe' 'it's' Mn x # two\nO\n;\ntext\n;\n"
            << ok
            << tags + "Fe1 Fe\nloop_\n_atom_type_symbol # types\n_atom_type_scat_source\n_atom_type_oxidation_number\n"
                      "'Fe' 'it's' 3 Mn x ? # two\nO\n;\ntext\n; ?\n"
            << QStringList{pairing, " Atom Fe1 has symbol Fe and charge 3"};
        QTest::newRow("atom-type loop of another block")
            << QByteArray("Fe1 Fe 3") << "data_a\nloop_\n_atom_type_symbol\n_atom_type_radius\nFe 1\ndata_b\n" + tags + "Fe1 Fe\n"
            << ok << "data_a\nloop_\n_atom_type_symbol\n_atom_type_radius\nFe 1\ndata_b\n" + tags + "Fe1 Fe\n" + typeLoop + "Fe 3\n\n"
            << QStringList{pairing, " Atom Fe1 has symbol Fe and charge 3"};

        // The input must stay as it is.
        const auto notLoop = CifRewrite::Outcome::AtomTypesNotUnderstood;
        const QString notOneLoop = "<br><b><font color=#FF3300> The \"_atom_type_\" items of the CIF file are not one "
                                   "loop that oxidation numbers can be added to !" + unchanged;
        const QStringList fe1{pairing, " Atom Fe1 has symbol Fe and charge 3", notOneLoop};
        QTest::newRow("atom-type item outside a loop") << QByteArray("Fe1 Fe 3") << "_atom_type_symbol Fe\n" + tags + "Fe1 Fe\n"
                                                       << notLoop << QByteArray() << fe1;
        QTest::newRow("atom-type rows that do not add up")
            << QByteArray("Fe1 Fe 3") << "loop_\n_atom_type_symbol\n_atom_type_radius\nFe\n" + tags + "Fe1 Fe\n" << notLoop
            << QByteArray() << fe1;
        QTest::newRow("no _atom_site_label")
            << QByteArray("Fe1 Fe 3") << QByteArray("data_x\n_atom_site_type_symbol\nFe1 Fe\n")
            << CifRewrite::Outcome::NoAtomSiteLabel << QByteArray()
            << QStringList{"<br><b><font color=#FF3300> The CIF file does not contain the flag \"_atom_site_label\" !" + unchanged};
        QTest::newRow("other tag after label")
            << QByteArray("Fe1 Fe 3") << QByteArray("_atom_site_label\n_atom_site_x\n_atom_site_type_symbol\n")
            << CifRewrite::Outcome::NoTypeSymbol << QByteArray()
            << QStringList{"<br><b><font color=#FF3300> The CIF file must at least contain the flag \"_atom_site_type_symbol\" !"};
        QTest::newRow("no row kept") << QByteArray("Fe1 Fe 3") << tags + "Fe1\nO1 O 0\n" << CifRewrite::Outcome::NoAtomKept
            << QByteArray()
            << QStringList{pairing, incorrect, "Fe1"} + noMatch
                   + QStringList{"O1", "<br><b><font color=#FF3300> No atom line matches \"oxidation.dat\" file !" + unchanged};
    }
    void rewrite()
    {
        QFETCH(QByteArray, table);
        QFETCH(QByteArray, cif);
        const CifRewrite r = rewriteCifText(QString::fromLatin1(cif), OxidationIndex(parseOxidationTable(QString::fromLatin1(table)).entries));
        QTEST(r.outcome, "outcome");
        QTEST(r.text.toLatin1(), "written");
        QTEST(flat(r.log), "log");
    }

    void longListsKeepTheirHeadings()
    {
        // Each group is shortened on its own: headings and closing lines all stay.
        QStringList known, unknown;
        for (int i = 0; i < 7000; ++i)
            known.append("known " + QString::number(i));
        for (int i = 0; i < 12000; ++i)
            unknown.append("unknown " + QString::number(i));
        QTextEdit log;
        appendLogGroups(&log, {{"heading"}, known, {"WARNING"}, unknown, {"closing"}});
        const QStringList lines = logLines(&log);
        QCOMPARE(lines.size(), 3 + 7000 + logGroupLimit + 1);
        QCOMPARE(lines.mid(7000, 3), (QStringList{"known 6999", "WARNING", "unknown 0"}));
        QCOMPARE(lines.mid(7002 + 4999, 3),
                 (QStringList{"unknown 4999", "2000 more lines are not shown in the log.", "unknown 7000"}));
        QCOMPARE(lines.mid(lines.size() - 2), (QStringList{"unknown 11999", "closing"}));
    }

    void parameterLine_data()
    {
        QTest::addColumn<float>("dmax");
        QTest::addColumn<int>("format");
        QTest::addColumn<int>("outputIndex");
        QTest::addColumn<int>("choice"); // polyhedra details and print type
        QTest::addColumn<int>("atoms");
        QTest::addColumn<QString>("line");
        QTest::newRow("start-up form") << 4.0f << 0 << 0 << 0 << 11 << "   4          0   0   0   0    10   1.6 3.1   11 .001 0.5";
        QTest::newRow("old ICSD, ionic radii") << 4.0f << 2 << 2 << 1 << 11 << "   4          2   1  -1   1    10   1.6 3.1   11 .001 0.5";
        QTest::newRow("empty DMAX, 20 atoms") << QString().toFloat() << 0 << 1 << 0 << 20
                                              << "   0          0   0   1   0    10   1.6 3.1   20 .001 0.5";
        QTest::newRow("too long, shifts") << QStringLiteral("123.456").toFloat() << 1 << 0 << 0 << 11
                                          << "123.456          1   0   0   0    10   1.6 3.1   11 .001 0.5";
        QTest::newRow("exponent form") << 1.0e6f << 0 << 0 << 0 << 11 << "1e+06          0   0   0   0    10   1.6 3.1   11 .001 0.5";
    }
    void parameterLine()
    {
        QFETCH(float, dmax);
        QFETCH(int, format);
        QFETCH(int, outputIndex);
        QFETCH(int, choice);
        QFETCH(int, atoms);
        QFETCH(QString, line);
        const JobOptions o{dmax, 10.0f, QStringLiteral("3.1").toFloat(), atoms, format, outputLevelForIndex(outputIndex), choice, choice};
        QCOMPARE(::parameterLine(o), line);
        const QStringList echo = jobOptionsEcho(o);
        QCOMPARE(echo.size(), 10);
        QCOMPARE(echo.at(2), " DMAX       \t= " + line.section(' ', 0, 0, QString::SectionSkipEmpty));
        QCOMPARE(echo.mid(5, 3), QStringList({" INPUT      \t= " + QString::number(format),
                                              " OUTPUT     \t= " + QString::number(o.outputLevel),
                                              " PRINT TYPE \t= " + QString::number(choice)}));
        QCOMPARE(echo.at(8), " MAX V-ATOMS\t= " + QString::number(atoms));
    }

    void names_data()
    {
        QTest::addColumn<QString>("name");
        QTest::addColumn<QString>("tests"); // contains, complete suffix is, last suffix is, staged input
        QTest::newRow("a.CIF") << "/w/a.CIF" << "yyyn";
        QTest::newRow("a.b.cif") << "/w/a.b.cif" << "ynyn";
        QTest::newRow("a.cif.txt") << "/w/a.cif.txt" << "ynnn";
        QTest::newRow("a") << "/w/a" << "nnnn";
        QTest::newRow(" Morvel.In") << "/w/ Morvel.In" << "nnny";
        QTest::newRow("morvel.inx") << "/w/morvel.inx" << "nnnn";
    }
    void names()
    {
        QFETCH(QString, name);
        const QString got = QString(hasCifSuffix(name, CifSuffix::CompleteSuffixContains) ? 'y' : 'n')
                            + (hasCifSuffix(name, CifSuffix::CompleteSuffixIs) ? 'y' : 'n')
                            + (hasCifSuffix(name, CifSuffix::SuffixIs) ? 'y' : 'n') + (isStagedInputName(name) ? 'y' : 'n');
        QTEST(got, "tests");
        const InputPaths paths = inputPathsFor(name);
        QCOMPARE(paths.workingDir + '|' + paths.stagedInputPath + '|' + paths.baseName,
                 "/w|/w/morvel.in|" + QFileInfo(name).fileName().section('.', 0, 0));
    }

    void converterOutputAndKeptNames()
    {
        QByteArray carry;
        QList<bool> seen;
        for (const QByteArray delivery : {"NO ERRORS", "ER", "ROR", "ERR", "x", "OR", "ERROR ERROR"})
            seen.append(outputReportsError(delivery, carry));
        QCOMPARE(seen, (QList<bool>{true, false, true, false, false, false, true}));

        QStringList tried;
        QCOMPARE(takeKeptResultName([&](const QString &n) { tried.append(n); return tried.size() == 3; }),
                 "/MORVEL.OUT.old3");
        QCOMPARE(tried.first(), "/MORVEL.OUT.old1");
        tried.clear();
        QCOMPARE(takeKeptResultName([&](const QString &n) { tried.append(n); return false; }), QString());
        QCOMPARE(tried.size(), 100);
        QCOMPARE(tried.last(), "/MORVEL.OUT.old100");
    }

    void binariesLines()
    {
        // The key at the very start, case-sensitive; the second line of a key wins; white space folded.
        BinariesPaths paths;
        for (const char *line : {"MORVEL a", "MORVEL\t./my  \t dir/m  ", "PARSER=./p", " PARSER c", "parser d"})
            applyBinariesLine(line, paths);
        QCOMPARE(paths.morvel + '|' + paths.parser, "./my dir/m|=./p");
    }

    void resultText_data()
    {
        QTest::addColumn<QByteArray>("bytes");
        QTest::addColumn<qint64>("limit");
        QTest::addColumn<QString>("text");
        QTest::addColumn<bool>("whole");
        QTest::newRow("plain, CR LF kept") << QByteArray("a\r\nb\n") << qint64(100) << "a\r\nb\n" << true;
        QTest::newRow("NUL and invalid UTF-8") << QByteArray("a\0b\xff\xc3", 5) << qint64(100) << "a\uFFFDb\uFFFD\uFFFD" << true;
        QTest::newRow("UTF-16 with its mark") << QByteArray("\xff\xfe" "a\0\n\0", 6) << qint64(100) << "a\n" << true;
        QTest::newRow("at the limit, whole") << QByteArray("line one\n") << qint64(9) << "line one\n" << true;
        QTest::newRow("cut at the last line end") << QByteArray("line one\r\nline two\nline three\n") << qint64(22)
                                                  << "line one\r\nline two" << false;
        QTest::newRow("no line end: a cut letter is dropped") << QByteArray("ab\xc3\xa9" "cd") << qint64(3) << "ab" << false;
    }
    void resultText()
    {
        QFETCH(QByteArray, bytes);
        QFETCH(qint64, limit);
        QBuffer file(&bytes);
        QVERIFY(file.open(QIODevice::ReadOnly));
        const ResultText shown = readResultText(file, limit);
        QTEST(shown.text, "text");
        QTEST(shown.whole, "whole");
        QCOMPARE(shown.fileSize, bytes.size());
        QVERIFY(resultTooLargeLine(1234567).contains("1234567 bytes"));
    }

    void jobFiles()
    {
        QTemporaryDir dir;
        const QString path = dir.filePath("morvel.par");
        writeFile(path, QByteArray(500, 'x')); // a longer earlier file leaves nothing behind
        QCOMPARE(writeNewFile(path, "new\n"), WriteResult::Written);
        QCOMPARE(readFile(path), QByteArray("new\n"));
        {
            FileSizeLimit full(2);
            QCOMPARE(writeNewFile(path, "too long\n"), WriteResult::CannotWrite);
            QCOMPARE(replaceFileContent(dir.filePath("tmp.cif"), "too long\n", path), ReplaceResult::CannotWriteTemporary);
        }
        QVERIFY(!QFile::exists(dir.filePath("tmp.cif")));
        QVERIFY(QDir(dir.path()).mkdir("busy"));
        QCOMPARE(writeNewFile(dir.filePath("busy"), "x"), WriteResult::CannotOpen);

        // The target keeps its content until the new one is complete; then it is replaced whole.
        writeFile(dir.filePath("tmp.cif"), QByteArray(5000, '#'));
        QCOMPARE(replaceFileContent(dir.filePath("tmp.cif"), "newer\n", path), ReplaceResult::Replaced);
        QCOMPARE(readFile(path), QByteArray("newer\n"));
        QVERIFY(QDir(dir.path()).mkpath("full/inner"));
        QCOMPARE(replaceFileContent(dir.filePath("tmp.cif"), "x\n", dir.filePath("full")), ReplaceResult::CannotReplace);
    }

    void backupCopies()
    {
        QTemporaryDir dir;
        BackupCopy c = keepBackupCopy(dir.path(), "a", "one");
        QCOMPARE(c.name + (c.madeNow ? "+" : ""), "a_old.cif+");
        c = keepBackupCopy(dir.path(), "a", "one"); // the same bytes: the copy there counts
        QCOMPARE(c.name + (c.madeNow ? "+" : ""), "a_old.cif");
        QVERIFY(QDir(dir.path()).mkdir("a_old2.cif"));
        c = keepBackupCopy(dir.path(), "a", "two"); // other bytes: the next free name
        QCOMPARE(c.name + (c.madeNow ? "+" : ""), "a_old3.cif+");
        QCOMPARE(readFile(dir.filePath("a_old.cif")) + readFile(dir.filePath("a_old3.cif")), QByteArray("onetwo"));
        for (int n = 4; n <= 100; ++n)
            QVERIFY(QDir(dir.path()).mkdir(backupFileName("a", n)));
        QCOMPARE(keepBackupCopy(dir.path(), "a", "three").name, QString());
    }

    void markupResources()
    {
        QTemporaryDir dir;
        QImage image(7, 3, QImage::Format_RGB32);
        image.fill(Qt::red);
        QVERIFY(image.save(dir.filePath("small.png")));
        QVERIFY(::mkfifo(QFile::encodeName(dir.filePath("fifo")).constData(), 0600) == 0);
        writeFile(dir.filePath("large.png"), QByteArray(markupFileLimit + 1, 'x'));
        const auto blank = [](const QUrl &url) {
            return QImage::fromData(logResource(QTextDocument::ImageResource, url).toByteArray()).size() == QSize(1, 1);
        };
        QCOMPARE(logResource(QTextDocument::ImageResource, QUrl::fromLocalFile(dir.filePath("small.png"))).toByteArray(),
                 readFile(dir.filePath("small.png")));
        QVERIFY(blank(QUrl("/dev/zero")));
        QVERIFY(blank(QUrl::fromLocalFile(dir.filePath("fifo"))));
        QVERIFY(blank(QUrl::fromLocalFile(dir.filePath("large.png"))));
        QVERIFY(blank(QUrl("http://example.org/a.png")));
        QCOMPARE(logResource(QTextDocument::StyleSheetResource, QUrl("/dev/zero")).toByteArray(), QByteArray());

        // In the log: a device and a FIFO neither end the program nor stop it; the image is drawn.
        QTextEdit log;
        guardLogResources(&log);
        log.resize(300, 200);
        log.show(); // laid out at its width, the images are loaded
        log.append("<img src=\"/dev/zero\"><img src=\"" + dir.filePath("fifo") + "\"><link rel=stylesheet href=\"/dev/zero\">");
        log.append("<img src=\"" + dir.filePath("small.png") + "\">");
        QImage shot(200, 100, QImage::Format_RGB32);
        shot.fill(Qt::white);
        QPainter painter(&shot);
        log.document()->drawContents(&painter);
        painter.end();
        int red = 0;
        for (int y = 0; y < shot.height(); ++y)
            for (int x = 0; x < shot.width(); ++x)
                red += shot.pixelColor(x, y) == Qt::red;
        QCOMPARE(red, 7 * 3);
    }

    void droppedFiles()
    {
        QTemporaryDir dir;
        writeFile(dir.filePath("a.cif"), "x");
        const auto dropped = [](const QList<QUrl> &urls) {
            QMimeData data;
            data.setUrls(urls);
            return droppedFile(&data);
        };
        QCOMPARE(dropped({QUrl::fromLocalFile(dir.filePath("a.cif"))}), dir.filePath("a.cif"));
        QCOMPARE(dropped({QUrl::fromLocalFile(dir.path())}), QString());
        QCOMPARE(dropped({QUrl::fromLocalFile(dir.filePath("a.cif")), QUrl::fromLocalFile(dir.filePath("a.cif"))}), QString());
        QCOMPARE(dropped({QUrl("https://example.org/a.cif")}), QString());
    }
};

QTEST_MAIN(TestLogic)
#include "tst_logic.moc"
