#include "runlogic.h"
#include "testsupport.h"

#include <QtTest>

class TestRunLogic : public QObject
{
    Q_OBJECT

private slots:
    void parameterLine_data();
    void parameterLine();
    void keptResultName();
    void programPath();
};

void TestRunLogic::parameterLine_data()
{
    QTest::addColumn<float>("dmax");
    QTest::addColumn<int>("format");
    QTest::addColumn<int>("outputIndex");
    QTest::addColumn<int>("details");
    QTest::addColumn<int>("print");
    QTest::addColumn<int>("atoms");
    QTest::addColumn<QString>("line");
    QTest::addColumn<QString>("echoedDmax");
    QTest::newRow("start-up form") << 4.0f << 0 << 0 << 0 << 0 << 11
        << "   4          0   0   0   0    10   1.6 3.1   11 .001 0.5" << "4";
    QTest::newRow("old ICSD, ionic radii") << 4.0f << 2 << 2 << 1 << 1 << 11
        << "   4          2   1  -1   1    10   1.6 3.1   11 .001 0.5" << "4";
    QTest::newRow("empty DMAX, 20 atoms") << QString().toFloat() << 0 << 1 << 0 << 0 << 20
        << "   0          0   0   1   0    10   1.6 3.1   20 .001 0.5" << "0";
    QTest::newRow("too long, shifts") << QStringLiteral("123.456").toFloat() << 1 << 0 << 0 << 0 << 11
        << "123.456          1   0   0   0    10   1.6 3.1   11 .001 0.5" << "123.456";
    QTest::newRow("exponent form") << 1.0e6f << 0 << 0 << 0 << 0 << 11
        << "1e+06          0   0   0   0    10   1.6 3.1   11 .001 0.5" << "1e+06";
}

void TestRunLogic::parameterLine()
{
    QFETCH(float, dmax);
    QFETCH(int, format);
    QFETCH(int, outputIndex);
    JobOptions o;
    o.dmax = dmax;
    o.tolerance = 10.0f;
    o.hbondThreshold = QStringLiteral("3.1").toFloat();
    o.inputFormat = format;
    o.outputLevel = outputLevelForIndex(outputIndex);
    QFETCH(int, details);
    QFETCH(int, print);
    QFETCH(int, atoms);
    o.polyhedraDetails = details;
    o.printType = print;
    o.maxVAtoms = atoms;
    QFETCH(QString, line);
    QCOMPARE(::parameterLine(o), line);
    const QStringList echo = jobOptionsEcho(o);
    QCOMPARE(echo.size(), 10);
    QFETCH(QString, echoedDmax);
    QCOMPARE(echo.at(2), QStringLiteral(" DMAX       \t= ") + echoedDmax);
    QCOMPARE(echo.at(4), QStringLiteral(" THRESH     \t= 3.1"));
    QCOMPARE(echo.at(6), QStringLiteral(" OUTPUT     \t= ") + QString::number(outputIndex == 2 ? -1 : outputIndex));
}

void TestRunLogic::keptResultName()
{
    // The first number whose rename succeeds is taken; none at all gives no name.
    QStringList tried;
    QCOMPARE(takeKeptResultName([&](const QString &n) { tried << n; return tried.size() == 3; }),
             QStringLiteral("/MORVEL.OUT.old3"));
    QCOMPARE(tried.first(), QStringLiteral("/MORVEL.OUT.old1"));
    tried.clear();
    QVERIFY(takeKeptResultName([&](const QString &n) { tried << n; return false; }).isEmpty());
    QCOMPARE(tried.size(), 100);
    QCOMPARE(tried.last(), QStringLiteral("/MORVEL.OUT.old100"));
}

void TestRunLogic::programPath()
{
    CurrentDirScope cwd;
    writeFile(cwd.file("morvel"), "");
    QCOMPARE(resolvedProgramPath("./morvel.exe", cwd.path()), cwd.file("morvel.exe"));
    QCOMPARE(resolvedProgramPath("morvel", cwd.path()), cwd.file("morvel"));
    QCOMPARE(resolvedProgramPath("sh", cwd.path()), QStringLiteral("sh"));
    QCOMPARE(resolvedProgramPath("/opt/my tools/morvel", cwd.path()), QStringLiteral("/opt/my tools/morvel"));
}

QTEST_GUILESS_MAIN(TestRunLogic)
#include "tst_runlogic.moc"
