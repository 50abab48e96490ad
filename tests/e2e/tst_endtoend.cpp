#include "../input/modaldriver.h"
#include "demofolder.h"
#include "import.h"
#include "resultdisplay.h"

#include <QRegularExpression>
#include <QScrollBar>
#include <QAbstractTextDocumentLayout>
#include <QTextBlock>
#include <QTextDocument>
#include <QSignalSpy>
#include <QtMath>
#include <QtTest>

namespace {
const int cifFormat = 0;
const int handMadeFormat = 1;
const int jobTimeoutMs = 60000;

const QString importFailed = QStringLiteral("Something went wrong with Import procedure !");
const QString checkLog = QStringLiteral("Please check cifparser.log file.");

// One neighbour line of a site's distance table: label and distance as printed.
struct Neighbour
{
    QString label;
    QString distance;
};

// What the result in the log says about one site of the asymmetric unit.
struct SiteReport
{
    QString heading; // "Na1 (Na1+, charge +1)"
    QList<Neighbour> neighbours;
    int coordination = -1;

    QStringList distancesTo(const QString &label) const
    {
        QStringList found;
        for (const Neighbour &n : neighbours)
            if (n.label == label)
                found.append(n.distance);
        return found;
    }
};

// Reads a site's table from the log as the user sees it. The plain result has one neighbour per
// line, the verbose (HTML) one a table cell per line; either way a distance is the fourth word
// of its row: label, symbol, symmetry code, distance.
SiteReport siteReport(const QString &logText, const QString &site)
{
    SiteReport report;
    const QStringList lines = logText.split(QLatin1Char('\n'));
    qsizetype i = 0;
    while (i < lines.size() && !lines.at(i).trimmed().startsWith(site + QLatin1String(" (")))
        ++i;
    if (i == lines.size())
        return report;
    report.heading = lines.at(i).trimmed();
    QStringList words;
    for (++i; i < lines.size() && !lines.at(i).contains(QLatin1String("Coordination number")); ++i)
        words += lines.at(i).split(QRegularExpression(QStringLiteral("\\s+")), Qt::SkipEmptyParts);
    if (i < lines.size())
        report.coordination = lines.at(i).section(QLatin1Char(':'), -1).trimmed().toInt();
    static const QRegularExpression distance(QStringLiteral("^\\d+\\.\\d{4}$"));
    for (qsizetype w = 3; w < words.size(); ++w)
        if (distance.match(words.at(w)).hasMatch())
            report.neighbours.append({words.at(w - 3), words.at(w)});
    return report;
}

QString fourDecimals(double value)
{
    return QString::number(value, 'f', 4);
}

// The first number after `tag` in a CIF or hand-made file: the test takes cell and coordinates
// from the demo file itself and works out the distances by hand from them.
double numberAfter(const QByteArray &text, const QString &tag)
{
    const QRegularExpression re(QStringLiteral("(?:^|\\n)\\s*") + QRegularExpression::escape(tag)
                                + QStringLiteral("\\s+([-0-9.]+)"));
    const QRegularExpressionMatch m = re.match(QString::fromLatin1(text));
    return m.hasMatch() ? m.captured(1).toDouble() : qQNaN();
}

// The blank-separated fields of the first record of a hand-made input that starts with `key`.
QList<QByteArray> recordFields(const QByteArray &text, const QByteArray &key)
{
    for (const QByteArray &line : text.split('\n')) {
        const QList<QByteArray> fields = line.simplified().split(' ');
        if (fields.first() == key)
            return fields;
    }
    return {};
}

QStringList repeated(const QString &value, int n)
{
    QStringList list;
    for (int i = 0; i < n; ++i)
        list.append(value);
    return list;
}

QStringList nonEmptyLines(const QTextEdit *log)
{
    QStringList lines;
    for (const QString &line : log->toPlainText().split(QLatin1Char('\n')))
        if (!line.trimmed().isEmpty())
            lines.append(line.trimmed());
    return lines;
}

bool hasRedLine(const QTextEdit *log)
{
    return log->toHtml().contains(QLatin1String("#ff3300"), Qt::CaseInsensitive);
}
} // namespace

class TestEndToEnd : public QObject
{
    Q_OBJECT

private slots:
    void rockSalt_data();
    void rockSalt();
    void cifCompletedFromOxidationTable();
    void handMadeInput();
    void refusedCif_data();
    void refusedCif();
    void laterRunsKeepEarlierResults();

private:
    // Browse with the given input format: the real file dialog gets `name` from the demo copy,
    // and each message box that follows gets the next answer.
    static void browse(Import &dialog, const DemoFolder &demo, int format, const QString &name,
                       const QList<QMessageBox::StandardButton> &answers = {})
    {
        dialog.InputBox->setCurrentIndex(format);
        ModalDriver driver;
        driver.chooseFile(demo.file(name));
        for (QMessageBox::StandardButton answer : answers)
            driver.answerBox(answer);
        dialog.browseinput->click();
        QVERIFY2(driver.allAnswered(), qPrintable(driver.problems.join(QLatin1String(", "))));
        QCOMPARE(dialog.inputpath->text(), demo.file(name));
    }

    // Presses Run and waits until the job is over and its result is in the log: the program
    // that ends the job must have finished, and the form must be ready for the next run.
    static void run(Import &dialog, QProcess *lastProgram)
    {
        QSignalSpy ended(lastProgram, &QProcess::finished);
        QVERIFY(dialog.importButton->isEnabled());
        dialog.importButton->click();
        QTRY_VERIFY_WITH_TIMEOUT(ended.count() == 1 && dialog.importButton->isEnabled()
                                     && !dialog.killbutton->isEnabled()
                                     && dialog.importProcess->state() == QProcess::NotRunning
                                     && dialog.morvelProcess->state() == QProcess::NotRunning
                                     && !resultDisplayBusy(dialog.importlog),
                                 jobTimeoutMs);
    }

    static QString demoDir() { return QStringLiteral(DEMO_DIR); }
};

#define DEMO_FOLDER(demo)                                                                          \
    DemoFolder demo(demoDir(), QStringLiteral(CIF_PARSER_PATH), QStringLiteral(MORVEL_PATH));     \
    QVERIFY2(demo.error().isEmpty(), qPrintable(demo.error()))

void TestEndToEnd::rockSalt_data()
{
    QTest::addColumn<int>("outputIndex");
    QTest::newRow("normal output, plain text") << 0;
    QTest::newRow("verbose output, HTML") << 1;
}

// nacl.cif has its oxidation numbers: Browse, Run, and the log lists for each ion six neighbours
// of the other kind at a/2 and twelve of its own kind at a/sqrt(2), nothing else below DMAX 4.
void TestEndToEnd::rockSalt()
{
    QFETCH(int, outputIndex);
    DEMO_FOLDER(demo);
    Import dialog;
    dialog.show();
    QVERIFY(QTest::qWaitForWindowExposed(&dialog));
    dialog.OutputBox->setCurrentIndex(outputIndex);
    browse(dialog, demo, cifFormat, QStringLiteral("nacl.cif"));
    QVERIFY(!QTest::currentTestFailed());
    run(dialog, dialog.morvelProcess);
    QVERIFY(!QTest::currentTestFailed());
    // Where the view is left: at the distance table of a verbose result (its anchor "TITLE"),
    // at the bottom of the log for a plain one, which has no such anchor.
    QTest::qWait(100); // the log's late layout, so that the scroll range is final
    const QScrollBar *bar = dialog.importlog->verticalScrollBar();
    QVERIFY(bar->maximum() > 0);
    if (outputIndex == 1) {
        QTextDocument *doc = dialog.importlog->document();
        const QTextBlock table =
            doc->find(QStringLiteral("Interatomic distances up to DMAX"), 0, QTextDocument::FindCaseSensitively).block();
        QVERIFY(table.isValid());
        const int tableTop = int(doc->documentLayout()->blockBoundingRect(table).top());
        QCOMPARE(bar->value(), qMin(tableTop, bar->maximum()));
    } else {
        QCOMPARE(bar->value(), bar->maximum());
    }

    const QString log = dialog.importlog->toPlainText();
    QVERIFY2(!hasRedLine(dialog.importlog), qPrintable(log));
    QVERIFY(log.contains(QLatin1String("DONE !!!")));
    QVERIFY(QFileInfo(demo.file("morvel.in")).size() > 0);
    QCOMPARE(demo.bytes("MORVEL.OUT").startsWith("<html>"), outputIndex == 1);

    const double a = numberAfter(demo.bytes("nacl.cif"), "_cell_length_a");
    QVERIFY(a > 0);
    const QString unlike = fourDecimals(a / 2);
    const QString like = fourDecimals(a / qSqrt(2.0));
    for (const auto &[site, other] : {std::pair<QString, QString>{"Na1", "Cl1"}, {"Cl1", "Na1"}}) {
        const SiteReport report = siteReport(log, site);
        QVERIFY2(!report.heading.isEmpty(), qPrintable(site + " missing in the log:\n" + log));
        QCOMPARE(report.distancesTo(other), repeated(unlike, 6));
        QCOMPARE(report.distancesTo(site), repeated(like, 12));
        QCOMPARE(report.neighbours.size(), 18);
        QCOMPARE(report.coordination, 18);
    }
}

// rutile.cif has no oxidation numbers: OK in the question box completes it from oxidation.dat
// (the original kept as rutile_old.cif), and Run then gives Ti its six oxygens: two along
// [110] at u*a*sqrt(2) and four at sqrt(2((1/2-u)a)^2 + (c/2)^2).
void TestEndToEnd::cifCompletedFromOxidationTable()
{
    DEMO_FOLDER(demo);
    const QByteArray original = demo.bytes("rutile.cif");
    QVERIFY(!original.contains("_atom_type_oxidation_number"));
    Import dialog;
    browse(dialog, demo, cifFormat, QStringLiteral("rutile.cif"), {QMessageBox::Ok});
    QVERIFY(!QTest::currentTestFailed());
    QCOMPARE(demo.bytes("rutile_old.cif"), original);
    QVERIFY(demo.bytes("rutile.cif").contains("_atom_type_oxidation_number"));
    // The warning that the numbers were missing is the only red word.
    const QString completed = dialog.importlog->toHtml();
    QVERIFY2(completed.count(QLatin1String("#ff3300"), Qt::CaseInsensitive) == 1, qPrintable(completed));
    QVERIFY(dialog.importlog->toPlainText().contains(
        QLatin1String("The input CIF file has been modified according to \"oxidation.dat\" file info.")));

    // Once completed, choosing it again asks nothing and keeps the first backup.
    browse(dialog, demo, cifFormat, QStringLiteral("rutile.cif"));
    QVERIFY(!QTest::currentTestFailed());
    QCOMPARE(demo.bytes("rutile_old.cif"), original);

    run(dialog, dialog.morvelProcess);
    QVERIFY(!QTest::currentTestFailed());
    const QString log = dialog.importlog->toPlainText();
    QVERIFY2(!hasRedLine(dialog.importlog), qPrintable(log));

    const double a = numberAfter(original, "_cell_length_a");
    const double c = numberAfter(original, "_cell_length_c");
    const double u = numberAfter(original, "O1 O");
    QVERIFY(a > 0 && c > 0 && u > 0);
    const QString apical = fourDecimals(u * a * qSqrt(2.0));
    const QString equatorial = fourDecimals(qSqrt(2 * qPow((0.5 - u) * a, 2) + qPow(c / 2, 2)));

    const SiteReport titanium = siteReport(log, "Ti1");
    QVERIFY2(titanium.heading.contains(QLatin1String("charge +4")), qPrintable(log));
    QStringList oxygens = titanium.distancesTo("O1").mid(0, 6);
    QCOMPARE(oxygens, repeated(equatorial, 4) + repeated(apical, 2));
    // The nearest titaniums are the two along c.
    QCOMPARE(titanium.distancesTo("Ti1").mid(0, 3), repeated(fourDecimals(c), 2) + QStringList{fourDecimals(
                                                        qSqrt(2 * qPow(a / 2, 2) + qPow(c / 2, 2)))});
    QVERIFY(siteReport(log, "O1").heading.contains(QLatin1String("charge -2")));
}

// quartz.in is hand-made: it is copied to morvel.in as it is and MORVEL runs on it. Si sits on
// the twofold axis, so its four oxygens come in two pairs; the nearer pair is the O1 given in the
// file, whose distance follows from the hexagonal metric.
void TestEndToEnd::handMadeInput()
{
    DEMO_FOLDER(demo);
    Import dialog;
    browse(dialog, demo, handMadeFormat, QStringLiteral("quartz.in"));
    QVERIFY(!QTest::currentTestFailed());
    run(dialog, dialog.morvelProcess);
    QVERIFY(!QTest::currentTestFailed());

    const QString log = dialog.importlog->toPlainText();
    QVERIFY2(!hasRedLine(dialog.importlog), qPrintable(log));
    QVERIFY(log.contains(QLatin1String("Copying input file as \"morvel.in\" file")));
    QVERIFY(!log.contains(QLatin1String("Running CIF parser tool")));
    QCOMPARE(demo.bytes("morvel.in"), demo.bytes("quartz.in"));

    const QByteArray input = demo.bytes("quartz.in");
    const QList<QByteArray> cell = recordFields(input, "CELL");
    const QList<QByteArray> si = recordFields(input, "ATOM");
    QList<QByteArray> o;
    for (const QByteArray &line : input.split('\n'))
        if (line.simplified().startsWith("ATOM O1 "))
            o = line.simplified().split(' ');
    QVERIFY(cell.size() == 7 && si.value(1) == "Si1" && o.size() >= 7);
    const double a = cell[1].toDouble();
    const double c = cell[3].toDouble();
    QVERIFY(a > 0 && c > 0 && cell[6].toDouble() == 120);
    const double dx = o[4].toDouble() - si[4].toDouble();
    const double dy = o[5].toDouble() - si[5].toDouble();
    const double dz = o[6].toDouble() - si[6].toDouble();
    // gamma = 120 degrees: |r|^2 = a^2 (dx^2 + dy^2 - dx dy) + c^2 dz^2
    const QString given = fourDecimals(qSqrt(a * a * (dx * dx + dy * dy - dx * dy) + c * c * dz * dz));

    const SiteReport silicon = siteReport(log, "Si1");
    QStringList bonds;
    for (const Neighbour &n : silicon.neighbours)
        if (n.distance.toDouble() < 1.8)
            bonds.append(n.label + ' ' + n.distance);
    QCOMPARE(bonds.size(), 4);
    QCOMPARE(bonds.mid(0, 2), repeated("O1 " + given, 2));
    QCOMPARE(bonds.at(2), bonds.at(3));
    QVERIFY(bonds.at(2) != bonds.at(0));
}

void TestEndToEnd::refusedCif_data()
{
    QTest::addColumn<QByteArray>("cif");
    QTest::addColumn<bool>("earlierResult"); // a MORVEL.OUT from before, which must stay as it is
    const auto without = [](const QByteArray &line) {
        QFile f(QStringLiteral(DEMO_DIR "/nacl.cif"));
        if (!f.open(QIODevice::ReadOnly))
            return QByteArray();
        QByteArray text = f.readAll();
        return text.contains(line) ? text.replace(line, "") : QByteArray();
    };
    QTest::newRow("no cell length a") << without("_cell_length_a                   5.62\n") << false;
    QTest::newRow("type without oxidation number") << without("Cl1- -1.000\n") << true;
    QTest::newRow("not a CIF, oxidation tag in its text")
        << QByteArray("words only, _atom_type_oxidation_number among them\n") << true;
}

// A CIF that the converter refuses ends the job with the two red lines; MORVEL is not started,
// no morvel.in is left, an earlier result is untouched, and the reason is in cifparser.log.
void TestEndToEnd::refusedCif()
{
    QFETCH(QByteArray, cif);
    QFETCH(bool, earlierResult);
    QVERIFY(!cif.isEmpty());
    DEMO_FOLDER(demo);
    QFile bad(demo.file("bad.cif"));
    QVERIFY(bad.open(QIODevice::WriteOnly) && bad.write(cif) == cif.size());
    bad.close();
    const QByteArray earlier = "earlier result\n";
    if (earlierResult) {
        QFile out(demo.file("MORVEL.OUT"));
        QVERIFY(out.open(QIODevice::WriteOnly) && out.write(earlier) == earlier.size());
    }

    Import dialog;
    browse(dialog, demo, cifFormat, QStringLiteral("bad.cif"));
    QVERIFY(!QTest::currentTestFailed());
    run(dialog, dialog.importProcess);
    QVERIFY(!QTest::currentTestFailed());
    QTest::qWait(100); // nothing else may follow

    const QStringList lines = nonEmptyLines(dialog.importlog);
    QCOMPARE(lines.mid(lines.size() - 2), (QStringList{importFailed, checkLog}));
    const QString html = dialog.importlog->toHtml();
    QCOMPARE(html.count(QLatin1String("#ff3300"), Qt::CaseInsensitive), 2);
    QVERIFY(!lines.join('\n').contains(QLatin1String("Starting Morvel")));
    QVERIFY(!QFile::exists(demo.file("morvel.in")));
    QVERIFY(demo.bytes("cifparser.log").contains("ERROR"));
    QCOMPARE(demo.bytes("MORVEL.OUT"), earlierResult ? earlier : QByteArray("<unreadable>"));
    QVERIFY(!QFile::exists(demo.file("MORVEL.OUT.old1")));
}

// Each run keeps the result before it: the first as MORVEL.OUT.old1, the second as old2. The
// runs differ in DMAX, so each kept file is known to be the right one.
void TestEndToEnd::laterRunsKeepEarlierResults()
{
    DEMO_FOLDER(demo);
    Import dialog;
    browse(dialog, demo, cifFormat, QStringLiteral("nacl.cif"));
    QVERIFY(!QTest::currentTestFailed());

    const QStringList dmaxValues{"4", "3", "2.9"};
    const QList<int> coordination{18, 6, 6};
    QList<QByteArray> results;
    for (int i = 0; i < dmaxValues.size(); ++i) {
        dialog.dmaxline->setText(dmaxValues.at(i));
        run(dialog, dialog.morvelProcess);
        QVERIFY(!QTest::currentTestFailed());
        const QString log = dialog.importlog->toPlainText();
        QVERIFY2(!hasRedLine(dialog.importlog), qPrintable(log));
        QCOMPARE(siteReport(log, "Na1").coordination, coordination.at(i));
        results.append(demo.bytes("MORVEL.OUT"));
        QVERIFY(results.last().contains("DMAX = " + dmaxValues.at(i).toLatin1() + " A"));
        for (int kept = 1; kept <= i; ++kept)
            QCOMPARE(demo.bytes("MORVEL.OUT.old" + QString::number(kept)), results.at(kept - 1));
        QCOMPARE(QFile::exists(demo.file("MORVEL.OUT.old" + QString::number(i + 1))), false);
        if (i > 0)
            QVERIFY(log.simplified().contains("It has been renamed as : /MORVEL.OUT.old" + QString::number(i)));
        else
            QVERIFY(!log.contains(QLatin1String("already exists")));
    }
}

QTEST_MAIN(TestEndToEnd)
#include "tst_endtoend.moc"
