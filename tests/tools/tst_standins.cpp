// The stand-in programs run as the dialog runs them: in a working directory,
// with standard input open and never written to.
#include <QtTest>

#include <QDir>
#include <QFile>
#include <QProcess>
#include <QRegularExpression>
#include <QTemporaryDir>
#include <cmath>

namespace {

struct Run {
    int exitCode = -1;
    QString out;
};

Run runProgram(const QString& program, const QStringList& args, const QString& dir)
{
    QProcess p;
    p.setWorkingDirectory(dir);
    p.start(program, args);
    Run r;
    // A program that waited for input would hang here: the channel stays open.
    if (!p.waitForStarted(10000) || !p.waitForFinished(30000)) {
        p.kill();
        p.waitForFinished();
        return r;
    }
    r.exitCode = p.exitStatus() == QProcess::NormalExit ? p.exitCode() : -2;
    r.out = QString::fromLocal8Bit(p.readAllStandardOutput());
    return r;
}

void writeFile(const QString& path, const QByteArray& text)
{
    QFile f(path);
    QVERIFY(f.open(QIODevice::WriteOnly | QIODevice::Truncate));
    f.write(text);
}

QByteArray readFile(const QString& path)
{
    QFile f(path);
    return f.open(QIODevice::ReadOnly) ? f.readAll() : QByteArray();
}

// Line 1 of morvel.par as the dialog writes it.
QByteArray parLine(const QString& dmax, int input = 0, int output = 0)
{
    return QString("%1 %2   0 %3   0    10   1.6 3.1   11 .001 0.5\n")
        .arg(dmax, 4).arg(input, 10).arg(output, 3).toLatin1();
}

struct Neighbour {
    QString label;
    QString code;
    double distance;
};

// The distance table of one site in a plain-text MORVEL.OUT, and its coordination number.
QList<Neighbour> neighboursOf(const QString& out, const QString& label, int* cn = nullptr)
{
    QList<Neighbour> list;
    int start = out.indexOf(QRegularExpression("\\n" + QRegularExpression::escape(label) + " \\("));
    if (start < 0)
        return list;
    const QStringList lines = out.mid(start + 1).split('\n');
    static const QRegularExpression row("^\\s+(\\S+)\\s+\\S+\\s+(\\d+_\\S+)\\s+(\\d+\\.\\d{4})$");
    static const QRegularExpression count("Coordination number .*: (\\d+)$");
    for (const QString& l : lines) {
        auto m = row.match(l);
        if (m.hasMatch())
            list.append({m.captured(1), m.captured(2), m.captured(3).toDouble()});
        auto c = count.match(l);
        if (c.hasMatch()) {
            if (cn)
                *cn = c.captured(1).toInt();
            break;
        }
    }
    return list;
}

int countNear(const QList<Neighbour>& list, const QString& label, double d)
{
    int n = 0;
    for (const Neighbour& x : list)
        if (x.label == label && std::fabs(x.distance - d) <= 0.00006)
            ++n;
    return n;
}

// Multiplicity column of the site table.
int multiplicityOf(const QString& out, const QString& label)
{
    QRegularExpression re("\\n  " + QRegularExpression::escape(label) + "\\s.*\\s(\\d+)\\n");
    auto m = re.match(out);
    return m.hasMatch() ? m.captured(1).toInt() : -1;
}

const char* const kRutileSites =
    "loop_\n_atom_site_label\n_atom_site_type_symbol\n_atom_site_fract_x\n_atom_site_fract_y\n"
    "_atom_site_fract_z\nTi1 Ti 0.00000 0.00000 0.00000\nO1 O 0.30478 0.30478 0.00000\n";
const char* const kRutileTypes = "loop_\n_atom_type_symbol\n_atom_type_oxidation_number\nTi 4\nO -2\n";
const char* const kRutileCell = "data_rutile\n_cell_length_a 4.5937\n_cell_length_b 4.5937\n"
                                "_cell_length_c 2.9587\n_cell_angle_alpha 90\n_cell_angle_beta 90\n"
                                "_cell_angle_gamma 90\n";
const char* const kRutileOps[16] = {"x,y,z", "-y,-x,z", "y,x,-z", "1/2+y,1/2-x,1/2-z", "1/2-y,1/2+x,1/2+z",
                                    "1/2+x,1/2-y,1/2+z", "1/2-x,1/2+y,1/2-z", "x,y,-z", "-x,-y,z", "y,x,z",
                                    "-y,-x,-z", "1/2-y,1/2+x,1/2-z", "1/2+y,1/2-x,1/2+z", "1/2-x,1/2+y,1/2+z",
                                    "1/2+x,1/2-y,1/2-z", "-x,-y,-z"};

QByteArray rutileOpsLoop(const char* tag)
{
    QByteArray s = QByteArray("loop_\n") + tag + "\n";
    for (const char* op : kRutileOps)
        s += QByteArray("'") + op + "'\n";
    return s;
}

} // namespace

class TestStandins : public QObject {
    Q_OBJECT

private:
    // Converts cif (written as input.cif) and runs morvel on it; returns MORVEL.OUT.
    QString convertAndRun(const QTemporaryDir& dir, const QByteArray& cif, const QString& dmax, int output = 0)
    {
        const QString path = dir.filePath("input.cif");
        writeFile(path, cif);
        Run conv = runProgram(CIF_PARSER_PATH, {path, dir.filePath("morvel.in")}, dir.path());
        if (conv.exitCode != 0 || conv.out.contains("ERROR"))
            return "converter failed: " + conv.out;
        writeFile(dir.filePath("morvel.par"), parLine(dmax, 0, output) + " test job\n");
        Run m = runProgram(MORVEL_PATH, {}, dir.path());
        if (m.exitCode != 0)
            return "morvel failed with " + QString::number(m.exitCode);
        return QString::fromUtf8(readFile(dir.filePath("MORVEL.OUT")));
    }

private slots:
    void rockSaltFromDemo()
    {
        QTemporaryDir dir;
        const QString out = convertAndRun(dir, readFile(DEMO_DIR "/nacl.cif"), "4");
        const double a = 5.62; // cell of demo/nacl.cif
        int cn = 0;
        const QList<Neighbour> na = neighboursOf(out, "Na1", &cn);
        QCOMPARE(countNear(na, "Cl1", a / 2), 6);
        QCOMPARE(countNear(na, "Na1", a / std::sqrt(2.0)), 12);
        QCOMPARE(na.size(), 18);
        QCOMPARE(cn, 18);
        QCOMPARE(multiplicityOf(out, "Na1"), 4);
        QCOMPARE(multiplicityOf(out, "Cl1"), 4);
        // The converter names its log in the working directory.
        QVERIFY(readFile(dir.filePath("cifparser.log")).contains("oxidation number -1"));
    }

    // The same rutile structure whichever way its symmetry is given; the sites on
    // special positions (Ti 2a, O 4f) must not be duplicated by the 16 operations.
    void rutileSymmetrySources_data()
    {
        QTest::addColumn<QByteArray>("symmetry");
        QTest::newRow("space_group_symop loop") << rutileOpsLoop("_space_group_symop_operation_xyz");
        QTest::newRow("symmetry_equiv_pos loop") << rutileOpsLoop("_symmetry_equiv_pos_as_xyz");
        QTest::newRow("Hermann-Mauguin name") << QByteArray("_symmetry_space_group_name_H-M 'P 42/m n m'\n");
        QTest::newRow("Hall symbol") << QByteArray("_space_group_name_Hall '-P 4n 2n'\n");
    }
    void rutileSymmetrySources()
    {
        QFETCH(QByteArray, symmetry);
        QTemporaryDir dir;
        const QString out =
            convertAndRun(dir, QByteArray(kRutileCell) + symmetry + kRutileSites + kRutileTypes, "3.0");
        const double a = 4.5937, c = 2.9587, x = 0.30478;
        int cn = 0;
        const QList<Neighbour> ti = neighboursOf(out, "Ti1", &cn);
        // Apical O at (x,x,0); equatorial O at (1/2-x, 1/2+x, 1/2) less a lattice vector.
        QCOMPARE(countNear(ti, "O1", std::sqrt(2.0) * a * x), 2);
        QCOMPARE(countNear(ti, "O1", std::sqrt(2 * a * a * (0.5 - x) * (0.5 - x) + c * c / 4)), 4);
        QCOMPARE(countNear(ti, "Ti1", c), 2);
        QCOMPARE(cn, 8);
        QCOMPARE(multiplicityOf(out, "Ti1"), 2);
        QCOMPARE(multiplicityOf(out, "O1"), 4);
    }

    // The dialog completes a CIF from oxidation.dat by writing an _atom_type_ loop
    // after the sites, with the symbols it chose (here charged ones).
    void rewrittenCifSymbols()
    {
        QTemporaryDir dir;
        QByteArray cif = readFile(DEMO_DIR "/rutile.cif");
        cif.replace("Ti1 Ti ", "Ti1 Ti4+ ").replace("O1 O ", "O1 O2- ");
        cif += "loop_\n_atom_type_symbol\n_atom_type_oxidation_number\nTi4+ 4\nO2- -2\n";
        const QString out = convertAndRun(dir, cif, "2.5");
        QVERIFY2(out.contains("Ti1    Ti4+    +4"), qPrintable(out.left(300)));
        QCOMPARE(neighboursOf(out, "Ti1").size(), 6);
    }

    // Hexagonal cells: a P1 lattice (six neighbours at a, since |a+b| = a for
    // gamma = 120, two at c) and the demo's alpha-quartz (hand-made format).
    void hexagonalLattice()
    {
        QTemporaryDir dir;
        writeFile(dir.filePath("morvel.in"), "CELL 3 3 5 90 90 120\nATOM X1 X 0 0 0 0\n");
        writeFile(dir.filePath("morvel.par"), parLine("5.05", 1));
        QCOMPARE(runProgram(MORVEL_PATH, {}, dir.path()).exitCode, 0);
        const QList<Neighbour> n = neighboursOf(QString::fromUtf8(readFile(dir.filePath("MORVEL.OUT"))), "X1");
        QCOMPARE(countNear(n, "X1", 3.0), 6);
        QCOMPARE(countNear(n, "X1", 5.0), 2);
        QCOMPARE(n.size(), 8);
        QStringList codes;
        for (int i = 0; i < 6; ++i)
            codes << n[i].code;
        codes.sort();
        QCOMPARE(codes, QStringList({"1_445", "1_455", "1_545", "1_565", "1_655", "1_665"}));

        // A sphere three cells wide: every translation must still be reached
        // (m^2 + n^2 - mn = 9 has six solutions, none with a c component).
        writeFile(dir.filePath("morvel.par"), parLine("9.05", 1));
        QCOMPARE(runProgram(MORVEL_PATH, {}, dir.path()).exitCode, 0);
        const QList<Neighbour> far = neighboursOf(QString::fromUtf8(readFile(dir.filePath("MORVEL.OUT"))), "X1");
        QCOMPARE(countNear(far, "X1", 3.0), 6);
        QCOMPARE(countNear(far, "X1", 9.0), 6);
        QCOMPARE(countNear(far, "X1", std::sqrt(9.0 * 3 + 25)), 12); // (1,-1) or (1,2)-type plus one c
    }

    void quartzHandMade()
    {
        QTemporaryDir dir;
        QVERIFY(QFile::copy(DEMO_DIR "/quartz.in", dir.filePath("morvel.in")));
        writeFile(dir.filePath("morvel.par"), parLine("1.7", 1));
        QCOMPARE(runProgram(MORVEL_PATH, {}, dir.path()).exitCode, 0);
        const QString out = QString::fromUtf8(readFile(dir.filePath("MORVEL.OUT")));
        // Hexagonal metric: d^2 = a^2 (u^2 + v^2 - u v) + c^2 w^2.
        const double a = 4.916, c = 5.4054;
        auto hexDistance = [&](double u, double v, double w) {
            return std::sqrt(a * a * (u * u + v * v - u * v) + c * c * w * w);
        };
        // Si1 (0.4697,0,0) to O1 (0.4135,0.2669,0.1191), and to O1 under
        // -y,x-y,2/3+z shifted by (1,0,-1): (0.7331,0.1466,-0.21423).
        const double d1 = hexDistance(0.4135 - 0.4697, 0.2669, 0.1191);
        const double d2 = hexDistance(0.7331 - 0.4697, 0.1466, 2.0 / 3 + 0.1191 - 1);
        int cn = 0;
        const QList<Neighbour> si = neighboursOf(out, "Si1", &cn);
        QCOMPARE(countNear(si, "O1", d1), 2);
        QCOMPARE(countNear(si, "O1", d2), 2);
        QCOMPARE(cn, 4);
        // Si on the twofold axis (Wyckoff 3a) is one of three, O one of six.
        QCOMPARE(multiplicityOf(out, "Si1"), 3);
        QCOMPARE(multiplicityOf(out, "O1"), 6);
    }

    void outputLevels()
    {
        QTemporaryDir dir;
        const QString html = convertAndRun(dir, readFile(DEMO_DIR "/nacl.cif"), "3", 1);
        QVERIFY(html.startsWith("<html>"));
        const int anchor = html.indexOf("<a name=\"TITLE\">");
        QVERIFY(anchor > 0);
        QVERIFY(anchor < html.indexOf("Interatomic distances"));
        QVERIFY(html.indexOf("<td>2.8100</td>", anchor) > anchor);

        QTemporaryDir dir2;
        const QString radii = convertAndRun(dir2, readFile(DEMO_DIR "/nacl.cif"), "3", -1);
        QVERIFY(!radii.contains("<html") && !radii.contains("<table") && !radii.contains("<a name"));
        QVERIFY(radii.contains("ionic radii tables: not computed by the stand-in"));
        QCOMPARE(countNear(neighboursOf(radii, "Na1"), "Cl1", 2.81), 6);
        // Options that the stand-in does not compute are echoed as such.
        QVERIFY(radii.contains(QRegularExpression("THRESH\\s+3.1\\s+echoed only, not computed")));
        QVERIFY(radii.contains("test job"));
    }

    void converterFailures_data()
    {
        QTest::addColumn<QByteArray>("cif");   // "<missing>" / "<directory>": nothing or a folder there
        QTest::addColumn<QString>("reason");   // part of the ERROR line
        const QByteArray cell(kRutileCell);
        const QByteArray ops = rutileOpsLoop("_space_group_symop_operation_xyz");
        const QByteArray ok = cell + ops + kRutileSites + kRutileTypes;
        QTest::newRow("missing file") << QByteArray("<missing>") << "no such file";
        QTest::newRow("directory") << QByteArray("<directory>") << "not a regular file";
        QTest::newRow("not a CIF") << QByteArray("Hello,\nthis is a letter.\n") << "not a CIF";
        QTest::newRow("empty file") << QByteArray() << "no data block";
        QTest::newRow("no cell length") << QByteArray(ok).replace("_cell_length_b 4.5937\n", "")
                                        << "missing cell";
        QTest::newRow("unknown cell value") << QByteArray(ok).replace("_cell_angle_beta 90", "_cell_angle_beta ?")
                                            << "missing cell";
        QTest::newRow("impossible cell") << QByteArray(ok).replace("_cell_angle_gamma 90", "_cell_angle_gamma 200")
                                         << "bad cell";
        QTest::newRow("no sites") << cell + ops + kRutileTypes << "missing sites";
        QTest::newRow("no coordinates") << cell + ops + kRutileTypes +
                                               "loop_\n_atom_site_label\n_atom_site_type_symbol\nTi1 Ti\n"
                                        << "missing sites";
        QTest::newRow("unknown coordinate") << QByteArray(ok).replace("O1 O 0.30478 0.30478", "O1 O ? 0.30478")
                                            << "no fractional coordinate";
        QTest::newRow("no oxidation loop") << cell + ops + kRutileSites << "has no oxidation number";
        QTest::newRow("type without oxidation")
            << QByteArray(ok).replace("O -2\n", "") << "atom type O (site O1) has no oxidation number";
        QTest::newRow("unknown oxidation value") << QByteArray(ok).replace("Ti 4\n", "Ti ?\n")
                                                 << "atom type Ti (site Ti1) has no oxidation number";
        QTest::newRow("bad operation") << QByteArray(ok).replace("'-y,-x,z'", "'-y,-x'") << "symmetry operation";
        QTest::newRow("singular operation") << QByteArray(ok).replace("'-y,-x,z'", "'x,x,z'")
                                            << "is not a symmetry operation";
        QTest::newRow("unknown space group") << cell + "_symmetry_space_group_name_H-M 'Q 9 9'\n" + kRutileSites +
                                                    kRutileTypes
                                             << "unknown space group";
        QTest::newRow("no symmetry") << cell + kRutileSites + kRutileTypes << "no symmetry";
        QTest::newRow("output is a directory") << ok << "cannot write";
        QTest::newRow("one argument") << ok << "usage";
    }
    void converterFailures()
    {
        QFETCH(QByteArray, cif);
        QFETCH(QString, reason);
        QTemporaryDir dir;
        const QString input = dir.filePath("input.cif");
        QString output = dir.filePath("morvel.in");
        if (cif == "<directory>")
            QVERIFY(QDir().mkdir(input));
        else if (cif != "<missing>")
            writeFile(input, cif);
        QStringList args{input, output};
        if (QByteArray(QTest::currentDataTag()) == "output is a directory")
            QVERIFY(QDir().mkdir(output));
        if (QByteArray(QTest::currentDataTag()) == "one argument")
            args = QStringList{input};

        const Run r = runProgram(CIF_PARSER_PATH, args, dir.path());
        QVERIFY2(r.exitCode > 0, qPrintable(QString::number(r.exitCode)));
        QVERIFY2(r.out.contains("ERROR") && r.out.contains(reason, Qt::CaseInsensitive), qPrintable(r.out));
        QVERIFY(readFile(dir.filePath("cifparser.log")).contains("ERROR: "));
        QVERIFY(!QFileInfo(output).isFile());
        QVERIFY(!QFileInfo::exists(output + ".part"));
    }

    void morvelFailures_data()
    {
        QTest::addColumn<QByteArray>("par");   // "<missing>": no morvel.par
        QTest::addColumn<QByteArray>("input"); // "<missing>": no morvel.in
        QTest::addColumn<int>("exitCode");
        QTest::addColumn<QString>("reason");
        const QByteArray in = "CELL 4 4 4 90 90 90\nATOM A1 A 1 0 0 0\n";
        QTest::newRow("no morvel.par") << QByteArray("<missing>") << in << 1 << "morvel.par: the file does not exist";
        QTest::newRow("ten fields") << QByteArray("   4   0   0   0   0  10 1.6 3.1 11 .001\n") << in << 1
                                    << "has 10 fields";
        QTest::newRow("DMAX not a number") << parLine("four") << in << 1 << "DMAX = 'four' is not a number";
        QTest::newRow("DMAX empty field") << parLine("0") << in << 1 << "must be greater than 0";
        QTest::newRow("OUTPUT out of range") << parLine("4", 0, 5) << in << 1 << "OUTPUT = 5";
        QTest::newRow("old ICSD") << parLine("4", 2) << in << 2 << "old ICSD input format is not supported";
        QTest::newRow("no morvel.in") << parLine("4", 1) << QByteArray("<missing>") << 3
                                      << "morvel.in: the file does not exist";
        QTest::newRow("no cell") << parLine("4", 1) << QByteArray("ATOM A1 A 1 0 0 0\n") << 3 << "no CELL line";
        QTest::newRow("no atoms") << parLine("4", 1) << QByteArray("CELL 4 4 4 90 90 90\n") << 3 << "no ATOM line";
        QTest::newRow("short atom") << parLine("4", 1) << QByteArray("CELL 4 4 4 90 90 90\nATOM A1 A 1 0 0\n") << 3
                                    << "line 2: ATOM needs";
        QTest::newRow("bad symop") << parLine("4", 1) << QByteArray("CELL 4 4 4 90 90 90\nSYMOP x,y\n") << 3
                                   << "line 2: symmetry operation";
        QTest::newRow("unknown record") << parLine("4", 1) << QByteArray("CELL 4 4 4 90 90 90\nATM A1\n") << 3
                                        << "unknown record 'ATM'";
        QTest::newRow("flat cell") << parLine("4", 1) << QByteArray("CELL 4 4 4 90 90 180\nATOM A1 A 1 0 0 0\n")
                                   << 3 << "cell angle 180";
        QTest::newRow("DMAX too large") << parLine("100000", 1) << in << 3 << "too large for this cell";
    }
    void morvelFailures()
    {
        QFETCH(QByteArray, par);
        QFETCH(QByteArray, input);
        QFETCH(int, exitCode);
        QFETCH(QString, reason);
        QTemporaryDir dir;
        if (par != "<missing>")
            writeFile(dir.filePath("morvel.par"), par);
        if (input != "<missing>")
            writeFile(dir.filePath("morvel.in"), input);
        const Run r = runProgram(MORVEL_PATH, {}, dir.path());
        QCOMPARE(r.exitCode, exitCode);
        const QString out = QString::fromUtf8(readFile(dir.filePath("MORVEL.OUT")));
        QVERIFY2(out.contains("ERROR: ") && out.contains(reason), qPrintable(out.right(400)));
        QVERIFY(!out.contains("Normal end."));
    }
};

QTEST_GUILESS_MAIN(TestStandins)
#include "tst_standins.moc"
