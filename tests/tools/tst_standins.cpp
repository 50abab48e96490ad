// The stand-in programs run as the dialog runs them: in a working directory,
// with standard input open and never written to.
#include <QtTest>

#include <cmath>
#include <csignal>
#include <sys/prctl.h>

namespace {

// Exit code (-1: did not start or finish, -2: crashed) and standard output. No time limit of our own
// (CTest's catches a hang, e.g. of a program that waits for input), but no child outlives the test.
QPair<int, QString> runProgram(const QString& program, const QStringList& args, const QString& dir)
{
    QProcess p;
    p.setWorkingDirectory(dir);
    p.setChildProcessModifier([] { ::prctl(PR_SET_PDEATHSIG, SIGKILL); });
    p.start(program, args);
    if (!p.waitForStarted(-1) || !p.waitForFinished(-1))
        return {-1, {}};
    return {p.exitStatus() == QProcess::NormalExit ? p.exitCode() : -2, p.readAllStandardOutput()};
}

void writeFile(const QString& path, const QByteArray& text)
{
    QFile f(path);
    QVERIFY(f.open(QIODevice::WriteOnly) && f.write(text) == text.size());
}

QByteArray readFile(const QString& path)
{
    QFile f(path);
    return f.open(QIODevice::ReadOnly) ? f.readAll() : QByteArray();
}

// morvel.par as the dialog writes it: line 1, then the job text.
QByteArray par(const QString& dmax, int input = 0, int output = 0)
{
    return QString("%1 %2   0 %3   0    10   1.6 3.1   11 .001 0.5\n test job\n")
        .arg(dmax, 4).arg(input, 10).arg(output, 3).toLatin1();
}

// A CIF for the converter or a hand-made morvel.in; a site's header line, the first rows of its distance
// table ("label distance"), all its neighbours to DMAX, every site's multiplicity, some symmetry codes.
struct Structure { bool cif; QByteArray input; QString dmax, site; QStringList rows; int cn; QList<int> mult;
                   QStringList codes; };
struct Refusal { QByteArray par, in; int exitCode; QString reason; }; // par, in empty: no such file

// A refinement program's type loop to which a front-end added the oxidation number as its last
// column: '?' for the neutral symbol that no site uses, a row of its own for the charged one. The
// name, a text field of two lines, becomes part of the one-line title.
const char* const kSilicon =
    "data_si\n_chemical_name_mineral\n;silicon\n(diamond type)\n;\n_cell_length_a 5.431\n_cell_length_b 5.431\n"
    "_cell_length_c 5.431\n_cell_angle_alpha 90\n_cell_angle_beta 90\n_cell_angle_gamma 90\n"
    "_symmetry_space_group_name_H-M 'F d -3 m'\nloop_\n"
    "_atom_type_symbol\n_atom_type_description\n_atom_type_scat_source\n_atom_type_oxidation_number\n"
    "Si 'Si' 'International Tables Vol C' ?\nSi4+ ? ? 4\nloop_\n_atom_site_label\n_atom_site_type_symbol\n"
    "_atom_site_fract_x\n_atom_site_fract_y\n_atom_site_fract_z\n_atom_site_occupancy\nSi1 Si4+ 0 0 0 1\n";

// Demo rutile, its symmetry given twice (operation loop and Hermann-Mauguin name), with oxidation numbers.
const char* const kOps = "_space_group_symop_operation_xyz";
const char* const kName = "_symmetry_space_group_name_H-M";
QByteArray rutile(const char* text = nullptr, const char* replacement = "")
{
    QByteArray cif = readFile(DEMO_DIR "/rutile.cif");
    cif += "loop_\n_atom_type_symbol\n_atom_type_oxidation_number\nTi 4\nO -2\n";
    return text ? cif.replace(text, replacement) : cif;
}

} // namespace

class TestStandins : public QObject {
    Q_OBJECT

private slots:
    // The distance table of one site against distances worked out by hand.
    void distances_data()
    {
        QTest::addColumn<Structure>("s");
        auto rows = [](const char* label, double d, int n) {
            return QStringList(n, QString("%1 %2").arg(label).arg(d, 0, 'f', 4));
        };
        // Rutile whichever way its symmetry is given; Ti (2a) and O (4f) sit on special positions that the
        // 16 operations must not duplicate. Equatorial O at (1/2-x,1/2+x,1/2), apical O at (x,x,0).
        const double a = 4.5937, c = 2.9587, x = 0.30478;
        const QStringList ti = rows("O1", std::sqrt(2 * a * a * (0.5 - x) * (0.5 - x) + c * c / 4), 4)
            + rows("O1", std::sqrt(2.0) * a * x, 2) + rows("Ti1", c, 2);
        const QByteArray byName = rutile(kOps, "_unused"), byOps = rutile(kName, "_unused");
        const QByteArray hall = QByteArray(byName).replace("_symmetry_space_group_name_H-M 'P 42/m n m'",
                                                           "_space_group_name_Hall '-P 4n 2n'");
        const QByteArray equiv = QByteArray(byOps).replace(kOps, "_symmetry_equiv_pos_as_xyz");
        for (const auto& [tag, cif] : {std::pair("symop loop", byOps), {"equiv_pos loop", equiv}, {"H-M name", byName},
                                       {"Hall symbol", hall}})
            QTest::addRow("rutile, %s", tag) << Structure{true, cif, "3", "Ti1 (Ti, charge +4)", ti, 8, {2, 4}, {}};
        // F d -3 m, origin choice 1 (gemmi's for the bare name): Si at 8a, four neighbours at a*sqrt(3)/4.
        QTest::newRow("silicon, refinement type loop") << Structure{true, kSilicon, "2.4", "Si1 (Si4+, charge +4)",
            rows("Si1", 5.431 * std::sqrt(3.0) / 4, 4), 4, {8}, {}};
        // Lattices. Hexagonal (the atom given by fractions, outside the cell): |a+b| = a, and (2,1,0) at a*sqrt(3)
        // needs two cells along a though a*sqrt(3) < 2a. Cube: the 514 points of Z^3 within radius 5; translations
        // past +-4 written out.
        QTest::newRow("hexagonal lattice") << Structure{false, "CELL 3 3 5 90 90 120\nATOM X1 X 0 1/3 -2/3 1/2\n",
            "5.2", "X1 (X, charge 0)", rows("X1", 3, 6) + rows("X1", 5, 2) + rows("X1", 3 * std::sqrt(3.0), 6), 14, {1},
            {"1_445", "1_455", "1_545", "1_565", "1_655", "1_665", "1_554", "1_556", "1_765", "1_345"}};
        QTest::newRow("cube, five cells") << Structure{false, "CELL 1 1 1 90 90 90\nATOM X1 X 0 0 0 0\n", "5",
            "X1 (X, charge 0)", rows("X1", 1, 6) + rows("X1", std::sqrt(2.0), 12), 514, {1},
            {"1_955", "1_155", "1_(5,0,0)", "1_(0,-5,0)"}};
    }
    void distances()
    {
        QFETCH(Structure, s);
        QTemporaryDir dir;
        writeFile(dir.filePath(s.cif ? "input.cif" : "morvel.in"), s.input);
        const auto [converted, log] = s.cif ? runProgram(CIF_PARSER_PATH, {"input.cif", "morvel.in"}, dir.path())
                                            : QPair<int, QString>();
        QVERIFY2(converted == 0 && !log.contains("ERROR"), qPrintable(log));
        // Plain text at every level but the verbose one: the hand-made rows take the ionic radii level.
        writeFile(dir.filePath("morvel.par"), par(s.dmax, s.cif ? 0 : 1, s.cif ? 0 : -1));
        QCOMPARE(runProgram(MORVEL_PATH, {}, dir.path()).first, 0);
        const QString out = readFile(dir.filePath("MORVEL.OUT")), after = out.section("\n" + s.site + "\n", 1);
        QCOMPARE(out.contains("ionic radii tables: not computed by the stand-in"), !s.cif);
        // Options not computed are echoed as such, the job text too; x,y,z is listed when the input lacks it.
        QVERIFY(out.contains(QRegularExpression("THRESH +3.1 +echoed only")) && out.contains("\ntest job\n"));
        QVERIFY(out.contains(QRegularExpression("\n  \\d+ +x,y,z\n")));
        QStringList rows, codes; // neighbour, symbol, symmetry code, distance
        static const QRegularExpression row("\n +(\\S+) +\\S+ +(\\d+_\\S+) +(\\d+\\.\\d{4})(?=\n)");
        for (const auto& m : row.globalMatch(after.section("  Coordination number", 0, 0)))
            rows << m.captured(1) + " " + m.captured(3), codes << m.captured(2);
        QCOMPARE(rows.mid(0, s.rows.size()), s.rows);
        QCOMPARE(rows.size(), s.cn);
        QCOMPARE(after.section("  Coordination number", 1).section('\n', 0, 0),
                 QString(" (d <= %1 A): %2").arg(s.dmax).arg(s.cn));
        for (const QString& c : s.codes)
            QVERIFY2(codes.contains(c), qPrintable(c));
        QList<int> multiplicity; // the last column of the site table
        for (const QString& l : out.section("Occupancy  Multiplicity\n", 1).section("\n\n", 0, 0).split('\n'))
            multiplicity << l.section(' ', -1).toInt();
        QCOMPARE(multiplicity, s.mult);
    }

    // The verbose level writes HTML, with the anchor the dialog shows first just before the distances.
    void htmlOutput()
    {
        QTemporaryDir dir;
        writeFile(dir.filePath("morvel.in"), "TITLE Na<Cl & co\nCELL 3 3 5 90 90 120\nATOM X1 X 0 0 0 0\n");
        writeFile(dir.filePath("morvel.par"), par("3.5", 1, 1));
        QCOMPARE(runProgram(MORVEL_PATH, {}, dir.path()).first, 0);
        const QString html = readFile(dir.filePath("MORVEL.OUT"));
        const int anchor = html.indexOf("<a name=\"TITLE\">");
        QVERIFY(html.startsWith("<html>") && html.contains("Na&lt;Cl &amp; co") && anchor > 0);
        QVERIFY(anchor < html.indexOf("Interatomic distances") && html.indexOf("<td>3.0000</td>", anchor) > 0);
    }

    void converterFailures_data()
    {
        QTest::addColumn<QByteArray>("cif"); // "<missing>" / "<directory>": nothing or a folder there
        QTest::addColumn<QString>("reason"); // part of the ERROR line
        const QByteArray noOps = rutile(kOps, "_unused"), noSymmetry = QByteArray(noOps).replace(kName, "_unused_name");
        auto untyped = [](const QString& t) { return "atom type " + t + " (site " + t + "1) has no oxidation number"; };
        QTest::newRow("missing file") << QByteArray("<missing>") << "no such file";
        QTest::newRow("directory") << QByteArray("<directory>") << "not a regular file";
        QTest::newRow("not a CIF") << QByteArray("Hello,\nthis is a letter.\n") << "not a CIF";
        QTest::newRow("empty file") << QByteArray() << "no data block";
        QTest::newRow("no cell length") << rutile("_cell_length_b 4.5937\n") << "missing cell";
        QTest::newRow("unknown cell value") << rutile("_cell_angle_beta 90", "_cell_angle_beta ?") << "missing cell";
        QTest::newRow("impossible cell") << rutile("_cell_angle_gamma 90", "_cell_angle_gamma 200") << "bad cell";
        QTest::newRow("no sites") << rutile("_atom_site_", "_atom_place_") << "missing sites";
        QTest::newRow("no y coordinates") << rutile("_atom_site_fract_y", "_atom_site_frac_y") << "missing sites";
        QTest::newRow("unknown coordinate") << rutile("O1 O 0.30478", "O1 O ?") << "O1 has no fractional coordinate";
        QTest::newRow("occupancy above 1") << readFile(DEMO_DIR "/nacl.cif").replace(".5 1.0", ".5 1.5")
                                           << "site Cl1 has occupancy 1.5";
        QTest::newRow("no oxidation loop") << readFile(DEMO_DIR "/rutile.cif") << untyped("Ti");
        QTest::newRow("type without oxidation") << rutile("O -2\n") << untyped("O");
        QTest::newRow("used type with '?'") << rutile("Ti 4\n", "Ti ?\n") << untyped("Ti");
        QTest::newRow("used type with '?', refinement loop") << QByteArray(kSilicon).replace("Si1 Si4+", "Si1 Si")
                                                              << untyped("Si");
        QTest::newRow("bad operation") << rutile("'-y,-x,z'", "'-y,-x'") << "symmetry operation";
        QTest::newRow("singular operation") << rutile("'-y,-x,z'", "'x,x,z'") << "is not a symmetry operation";
        QTest::newRow("unknown space group") << QByteArray(noOps).replace("P 42/m n m", "Q 9") << "space group 'Q 9'";
        QTest::newRow("no symmetry") << noSymmetry << "no symmetry";
        QTest::newRow("output is a directory") << rutile() << "cannot write";
        QTest::newRow("one argument") << rutile() << "usage";
    }
    void converterFailures()
    {
        QFETCH(QByteArray, cif);
        QFETCH(QString, reason);
        QTemporaryDir dir;
        const QString input = dir.filePath("input.cif"), output = dir.filePath("morvel.in");
        const QByteArray tag = QTest::currentDataTag();
        if (cif == "<directory>" || tag == "output is a directory")
            QVERIFY(QDir().mkdir(cif == "<directory>" ? input : output));
        if (!cif.startsWith('<'))
            writeFile(input, cif);
        const QStringList args = QStringList{input, output}.mid(0, tag == "one argument" ? 1 : 2);
        const auto [code, out] = runProgram(CIF_PARSER_PATH, args, dir.path());
        QVERIFY2(code == 1 && out.startsWith("ERROR: ") && out.contains(reason), qPrintable(out));
        QVERIFY(readFile(dir.filePath("cifparser.log")).contains(out.trimmed().toUtf8()));
        QVERIFY(!QFileInfo(output).isFile() && !QFileInfo::exists(output + ".part"));
    }

    void morvelFailures_data()
    {
        QTest::addColumn<Refusal>("r");
        const QByteArray cell = "CELL 4 4 4 90 90 90\n", in = cell + "ATOM A1 A 1 0 0 0\n", hand = par("4", 1);
        QTest::newRow("fraction over 0") << Refusal{hand, cell + "ATOM A1 A 1 1/0 0 0\n", 3, "coordinate '1/0' is not"};
        QTest::newRow("no morvel.par") << Refusal{{}, in, 1, "morvel.par: the file does not exist"};
        QTest::newRow("ten fields") << Refusal{"   4   0   0   0   0  10 1.6 3.1 11 .001\n", in, 1, "has 10 fields"};
        QTest::newRow("DMAX not a number") << Refusal{par("four"), in, 1, "DMAX = 'four' is not a number"};
        QTest::newRow("DMAX zero") << Refusal{par("0"), in, 1, "must be greater than 0"};
        QTest::newRow("OUTPUT out of range") << Refusal{par("4", 0, 5), in, 1, "OUTPUT = 5"};
        QTest::newRow("old ICSD") << Refusal{par("4", 2), in, 2, "old ICSD input format is not supported"};
        QTest::newRow("no morvel.in") << Refusal{hand, {}, 3, "morvel.in: the file does not exist"};
        QTest::newRow("no cell") << Refusal{hand, "ATOM A1 A 1 0 0 0\n", 3, "no CELL line"};
        QTest::newRow("no atoms") << Refusal{hand, cell, 3, "no ATOM line"};
        QTest::newRow("short atom") << Refusal{hand, cell + "ATOM A1 A 1 0 0\n", 3, "line 2: ATOM needs"};
        QTest::newRow("bad symop") << Refusal{hand, cell + "SYMOP x,y\n", 3, "line 2: symmetry operation"};
        QTest::newRow("unknown record") << Refusal{hand, cell + "ATM A1\n", 3, "unknown record 'ATM'"};
        QTest::newRow("flat cell") << Refusal{hand, "CELL 4 4 4 90 90 180\nATOM A1 A 1 0 0 0\n", 3, "cell angle 180"};
        QTest::newRow("DMAX too large") << Refusal{par("100000", 1), in, 3, "too large for this cell"};
    }
    void morvelFailures()
    {
        QFETCH(Refusal, r);
        QTemporaryDir dir;
        if (!r.par.isEmpty())
            writeFile(dir.filePath("morvel.par"), r.par);
        if (!r.in.isEmpty())
            writeFile(dir.filePath("morvel.in"), r.in);
        QCOMPARE(runProgram(MORVEL_PATH, {}, dir.path()).first, r.exitCode);
        const QString out = readFile(dir.filePath("MORVEL.OUT"));
        // The reason is the last line, in place of the normal end.
        QVERIFY2(out.trimmed().section('\n', -1).startsWith("ERROR: ") && out.contains(r.reason), qPrintable(out));
    }
};

QTEST_GUILESS_MAIN(TestStandins)
#include "tst_standins.moc"
