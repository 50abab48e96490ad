// The plain functions behind the dialog: the oxidation table, the CIF rewriting, the job files'
// text, the result text, the guarded markup resources.
#include "cifrewrite.h"
#include "filereplace.h"
#include "inputpaths.h"
#include "logwindow.h"
#include "runlogic.h"
#include "testsupport.h"
#include "toolconfiguration.h"

#include <QBuffer>
#include <QImage>
#include <QtTest>

#include <csignal>
#include <sys/resource.h>

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

    void rewrite_data()
    {
        QTest::addColumn<QByteArray>("table");
        QTest::addColumn<QByteArray>("cif");
        QTest::addColumn<CifRewrite::Outcome>("outcome");
        QTest::addColumn<QByteArray>("written");
        QTest::addColumn<QStringList>("log");
        const auto ok = CifRewrite::Outcome::Rewritten;
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
        // 7,000 atoms the table knows (by their type symbol) and 12,000 it does not: each list is
        // shortened on its own, and every heading stays.
        QString cif = QString::fromLatin1(tags);
        for (int i = 0; i < 19000; ++i)
            cif += (i < 7000 ? "K" : "U") + QString::number(i) + (i < 7000 ? " K 0\n" : " U 0\n");
        QTextEdit log;
        appendLogGroups(&log, rewriteCifText(cif, OxidationIndex({{"K", "K+", 1}})).log);
        const QStringList lines = logLines(&log);
        QCOMPARE(lines.size(), 1 + 7000 + 2 + logGroupLimit + 1);
        QCOMPARE(lines.mid(7000, 4), QStringList({"Atom K6999 has symbol K+ and charge 1", "WARNING !",
                                                  "The following atoms do not have any match in \"oxidation.dat\" file :", "U7000"}));
        QCOMPARE(lines.mid(7003 + 4999, 3), (QStringList{"U11999", "2000 more lines are not shown in the log.", "U14000"}));
        QCOMPARE(lines.constLast(), "U18999");
    }

    void parameterLine()
    {
        // Options in the order DMAX, TOLERANCE, THRESH, MAX V-ATOMS, INPUT, OUTPUT, polyhedra details, PRINT TYPE.
        const float thresh = QStringLiteral("3.1").toFloat();
        const std::pair<JobOptions, QString> rows[] = {
            {{4.0f, 10.0f, thresh, 11, 0, outputLevelForIndex(0), 0, 0}, "   4          0   0   0   0    10   1.6 3.1   11 .001 0.5"},
            {{4.0f, 10.0f, thresh, 11, 2, outputLevelForIndex(2), 1, 1}, "   4          2   1  -1   1    10   1.6 3.1   11 .001 0.5"},
            {{QString().toFloat(), 10.0f, thresh, 20, 0, outputLevelForIndex(1), 0, 0},
             "   0          0   0   1   0    10   1.6 3.1   20 .001 0.5"},
            {{QStringLiteral("123.456").toFloat(), 10.0f, thresh, 11, 1, 0, 0, 0},
             "123.456          1   0   0   0    10   1.6 3.1   11 .001 0.5"},
            {{1.0e6f, 10.0f, thresh, 11, 0, 0, 0, 0}, "1e+06          0   0   0   0    10   1.6 3.1   11 .001 0.5"}};
        for (const auto &[o, line] : rows) {
            QCOMPARE(::parameterLine(o), line);
            const QStringList echo = jobOptionsEcho(o);
            const QStringList fields = line.split(' ', Qt::SkipEmptyParts);
            QCOMPARE(echo.mid(2, 7), QStringList({" DMAX       \t= " + fields[0], " TOLERANCE   \t= 10", " THRESH     \t= 3.1",
                                                  " INPUT      \t= " + fields[1], " OUTPUT     \t= " + fields[3],
                                                  " PRINT TYPE \t= " + fields[2], " MAX V-ATOMS\t= " + fields[8]}));
        }
    }

    void names()
    {
        // Contains "cif", all after the first dot is "cif", all after the last dot is, the staged input's name.
        for (const auto &[name, tests] : {std::pair{"/w/a.CIF", "yyyn"}, {"/w/a.b.cif", "ynyn"}, {"/w/a.cif.txt", "ynnn"},
                                          {"/w/a", "nnnn"}, {"/w/ Morvel.In", "nnny"}, {"/w/morvel.inx", "nnnn"}}) {
            const QString got = QString(hasCifSuffix(name, CifSuffix::CompleteSuffixContains) ? 'y' : 'n')
                                + (hasCifSuffix(name, CifSuffix::CompleteSuffixIs) ? 'y' : 'n')
                                + (hasCifSuffix(name, CifSuffix::SuffixIs) ? 'y' : 'n') + (isStagedInputName(name) ? 'y' : 'n');
            QCOMPARE(got, tests);
            const InputPaths paths = inputPathsFor(name);
            QCOMPARE(paths.workingDir + '|' + paths.stagedInputPath + '|' + paths.baseName,
                     "/w|/w/morvel.in|" + QFileInfo(name).fileName().section('.', 0, 0));
        }
    }

    void converterOutput()
    {
        // "ERROR" anywhere, also cut between two deliveries, and each time it comes.
        QByteArray carry;
        QList<bool> seen;
        for (const QByteArray delivery : {"NO ERRORS", "ER", "ROR", "ERR", "x", "OR", "ERROR ERROR"})
            seen.append(outputReportsError(delivery, carry));
        QCOMPARE(seen, (QList<bool>{true, false, true, false, false, false, true}));
    }

    void binariesLines()
    {
        // The key at the very start, case-sensitive; the second line of a key wins; white space folded.
        BinariesPaths paths;
        for (const char *line : {"MORVEL a", "MORVEL\t./my  \t dir/m  ", "PARSER=./p", " PARSER c", "parser d"})
            applyBinariesLine(line, paths);
        QCOMPARE(paths.morvel + '|' + paths.parser, "./my dir/m|=./p");
    }

    void resultText()
    {
        struct Row { QByteArray bytes; qint64 limit; QString text; bool whole; };
        const Row rows[] = {{"a\r\nb\n", 100, "a\r\nb\n", true}, // CR LF kept
                            {QByteArray("a\0b\xff\xc3", 5), 100, "a\uFFFDb\uFFFD\uFFFD", true}, // NUL, bad UTF-8
                            {QByteArray("\xff\xfe" "a\0\n\0", 6), 100, "a\n", true}, // UTF-16 and its mark
                            {"line one\n", 9, "line one\n", true}, // at the limit
                            {"line one\r\nline two\nline three\n", 22, "line one\r\nline two", false}, // at a line end
                            {"ab\xc3\xa9" "cd", 3, "ab", false}}; // no line end: a cut letter is dropped
        for (Row row : rows) {
            QBuffer file(&row.bytes);
            QVERIFY(file.open(QIODevice::ReadOnly));
            const ResultText shown = readResultText(file, row.limit);
            QCOMPARE(shown.text, row.text);
            QCOMPARE(shown.whole, row.whole);
            QCOMPARE(shown.fileSize, row.bytes.size());
        }
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

        // The target keeps its content until the new one is complete; then it is replaced whole.
        writeFile(dir.filePath("tmp.cif"), QByteArray(5000, '#'));
        QCOMPARE(replaceFileContent(dir.filePath("tmp.cif"), "newer\n", path), ReplaceResult::Replaced);
        QCOMPARE(readFile(path), QByteArray("newer\n"));
        QVERIFY(QDir(dir.path()).mkpath("full/inner"));
        QCOMPARE(replaceFileContent(dir.filePath("tmp.cif"), "x\n", dir.filePath("full")), ReplaceResult::CannotReplace);
    }

    void markupResources()
    {
        QTemporaryDir dir;
        writeFile(dir.filePath("small.png"), "an ordinary small file");
        writeFile(dir.filePath("large.png"), QByteArray(markupFileLimit + 1, 'x'));
        const auto blank = [](const QUrl &url) {
            return QImage::fromData(logResource(QTextDocument::ImageResource, url).toByteArray()).size() == QSize(1, 1);
        };
        QCOMPARE(logResource(QTextDocument::ImageResource, QUrl::fromLocalFile(dir.filePath("small.png"))).toByteArray(),
                 readFile(dir.filePath("small.png")));
        QVERIFY(blank(QUrl("/dev/zero")));
        QVERIFY(blank(QUrl::fromLocalFile(dir.filePath("large.png"))));
        QVERIFY(blank(QUrl("http://example.org/a.png")));
        QCOMPARE(logResource(QTextDocument::StyleSheetResource, QUrl("/dev/zero")).toByteArray(), QByteArray());
    }
};

QTEST_MAIN(TestLogic)
#include "tst_logic.moc"
