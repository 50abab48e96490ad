// Child programs that misbehave: floods and binary output of the converter, programs that never
// end (Kill, Close), and results that are binary, huge, missing or pulled away under MORVEL.

#include "import.h"
#include "jobsupport.h"
#include "processprobe.h"
#include "resultdisplay.h"
#include "resultfiles.h"

#include <QApplication>
#include <QRandomGenerator>
#include <QtTest>

namespace {
// How long the dialog may stop answering, and how much memory a fault may cost it at its peak.
// Sanitized builds run several times slower; the limits are loose enough for a busy machine: they
// catch a dialog that stops for seconds, not jitter.
constexpr qint64 longestStopMs = MORVEL_TEST_SANITIZED ? 3000 : 1000;
constexpr qint64 peakGrowthKiB = 96 * 1024;

// Bytes of every value, NUL included, in a fixed pseudo-random order; no "E", so never "ERROR".
QByteArray binaryBytes(qint64 size, quint32 seed)
{
    QRandomGenerator random(seed);
    QByteArray bytes(size, Qt::Uninitialized);
    for (char &b : bytes) {
        b = char(random.bounded(256));
        if (b == 'E')
            b = '\0';
    }
    return bytes;
}

QString quoted(const QString &path)
{
    return QLatin1Char('\'') + path + QLatin1Char('\'');
}

// Runs the event loop until no program of the job runs and its result is on show.
bool waitForJobEnd(Job &job, int timeoutMs = 60000)
{
    return runLoopUntil([&] { return job.idle() && !resultDisplayBusy(job.dlg->importlog); }, timeoutMs);
}

struct JobCost
{
    bool ended = false;
    qint64 longestStopMs = 0;
    qint64 peakGrowthKiB = 0;
};

// Presses Run and waits for the job's end, measuring the longest stop of the event loop and the
// growth of the peak memory meanwhile.
JobCost runMeasured(Job &job)
{
    LoopGapMeter meter;
    resetPeakMemory();
    const qint64 before = statusKiB("VmRSS");
    job.dlg->importButton->click();
    JobCost cost;
    cost.ended = waitForJobEnd(job);
    cost.peakGrowthKiB = statusKiB("VmHWM") - before;
    cost.longestStopMs = meter.longestGapMs();
    qInfo("longest stop %lld ms, peak memory growth %lld KiB", cost.longestStopMs, cost.peakGrowthKiB);
    return cost;
}

// The run's lines up to the converter's start, as the log shows them.
QStringList converterHead(const Job &job)
{
    return {running, starting, QString("\"./conv\" \"%1/in.cif\" \"%1/morvel.in\"").arg(job.work)};
}
} // namespace

class TestChildFaults : public QObject
{
    Q_OBJECT

private slots:
    void initTestCase() { becomeSubreaper(); }
    void cleanup()
    {
        QCOMPARE(childProcesses(), QList<qint64>());
        reapAdoptedOrphans();
    }

    void converterOutput_data();
    void converterOutput();
    void neverEnding_data();
    void neverEnding();
    void closeDuringRun_data();
    void closeDuringRun();
    void morvelResult_data();
    void morvelResult();
    void morvelInputPulledAway();
};

void TestChildFaults::converterOutput_data()
{
    QTest::addColumn<QByteArray>("body"); // the converter; $OUT is a file of test bytes
    QTest::addColumn<QByteArray>("bytes");
    QTest::addColumn<bool>("reportsError");

    const QByteArray flood = "yes 'Fe1 Fe 0.0 0.0 0.0 converter output line' | head -c 104857600; ";
    QTest::newRow("100 MB of text") << flood + "cp \"$1\" \"$2\"" << QByteArray() << false;
    QTest::newRow("100 MB of text, then ERROR") << flood + "printf ERROR; cp \"$1\" \"$2\"" << QByteArray() << true;
    QTest::newRow("100 MB of text, then ERROR, exit 3") << flood + "echo ERROR; exit 3" << QByteArray() << true;
    QTest::newRow("10 MB of binary bytes") << QByteArray("cat \"$OUT\"; cp \"$1\" \"$2\"")
                                           << binaryBytes(10 << 20, 1) << false;
    QTest::newRow("ERROR between NUL bytes") << QByteArray("cat \"$OUT\"; cp \"$1\" \"$2\"")
                                             << binaryBytes(1 << 20, 2) + QByteArray("\0\0ERROR\0", 8) + binaryBytes(1 << 20, 3)
                                             << true;
    // Written in two pieces, the word reaches the dialog in two deliveries.
    QTest::newRow("ERROR split between deliveries")
        << QByteArray("printf 'line 1\\nERR'; sleep 0.3; printf 'OR\\n'; cp \"$1\" \"$2\"") << QByteArray() << true;
}

void TestChildFaults::converterOutput()
{
    QFETCH(QByteArray, body);
    QFETCH(QByteArray, bytes);
    QFETCH(bool, reportsError);

    Job job;
    writeFile(job.bin.file("out"), bytes);
    job.script("conv", "OUT=" + quoted(job.bin.file("out")).toUtf8() + "\n" + body);
    job.choose("in.cif", "DATA", 0);
    bytes.clear();

    const JobCost cost = runMeasured(job);
    QVERIFY(cost.ended);
    QVERIFY2(cost.longestStopMs < longestStopMs, qPrintable(QString::number(cost.longestStopMs)));
    if (memoryFiguresHold)
        QVERIFY2(cost.peakGrowthKiB < peakGrowthKiB, qPrintable(QString::number(cost.peakGrowthKiB)));
    if (reportsError) {
        QVERIFY2(job.logEndsWith(converterHead(job) + errorSeen), qPrintable(job.text().right(500)));
        QCOMPARE(job.file("MORVEL.OUT"), QByteArray("<none>"));
    } else {
        QVERIFY2(job.logEndsWith(converterHead(job) + QStringList{done, morvelStart} + result("DATA")),
                 qPrintable(job.text().right(500)));
        QCOMPARE(job.file("MORVEL.OUT"), QByteArray("DATA"));
    }
}

void TestChildFaults::neverEnding_data()
{
    QTest::addColumn<int>("format");
    QTest::addColumn<QString>("program");
    QTest::addColumn<QByteArray>("body");
    QTest::addColumn<QStringList>("tail");

    const QByteArray endless = "trap '' TERM INT HUP; exec sleep 1000";
    const QStringList converterKilled = killed + QStringList{" error occured : 1", failure, failure};
    const QStringList morvelKilled = killed + QStringList{morvelFailure} + result("");
    QTest::newRow("converter") << 0 << "conv" << endless << converterKilled;
    QTest::newRow("converter with a helper process")
        << 0 << "conv" << QByteArray("sleep 1000 & echo $! > helper; wait") << converterKilled;
    QTest::newRow("MORVEL after conversion") << 0 << "morvel" << endless << morvelKilled;
    QTest::newRow("MORVEL after copy") << 1 << "morvel" << endless << morvelKilled;
}

void TestChildFaults::neverEnding()
{
    QFETCH(int, format);
    QFETCH(QString, program);
    QFETCH(QByteArray, body);
    QFETCH(QStringList, tail);

    Job job;
    job.script(program, body);
    job.choose("in.cif", "data", format);
    QProcess *process = program == "conv" ? job.dlg->importProcess : job.dlg->morvelProcess;
    job.dlg->importButton->click();
    QVERIFY(runLoopUntil([&] { return process->state() == QProcess::Running; }, 10000));
    const qint64 pid = process->processId();
    const bool helper = body.contains('&');
    QVERIFY(!helper || runLoopUntil([&] { return job.file("helper").endsWith('\n'); }, 5000));
    const qint64 helperPid = helper ? job.file("helper").trimmed().toLongLong() : 0;
    QTest::qWait(100);
    QVERIFY(job.busy());
    QVERIFY(processRuns(pid));
    QVERIFY(!helper || processRuns(helperPid));

    LoopGapMeter meter;
    job.dlg->killbutton->click();
    QVERIFY(waitForJobEnd(job, 10000));
    QVERIFY(meter.longestGapMs() < longestStopMs);
    QVERIFY2(job.text().endsWith(shown(tail, false)), qPrintable(job.text().right(400)));
    QVERIFY(!processRuns(pid));
    // A helper the program started goes with it; orphaned, it would come to this process.
    QVERIFY(runLoopUntil([] { return childProcesses().isEmpty(); }, 3000));
    QVERIFY(!helper || !processRuns(helperPid));
}

void TestChildFaults::closeDuringRun_data()
{
    QTest::addColumn<int>("format");
    QTest::addColumn<QString>("program");
    QTest::newRow("converter") << 0 << "conv";
    QTest::newRow("MORVEL") << 1 << "morvel";
}

void TestChildFaults::closeDuringRun()
{
    QFETCH(int, format);
    QFETCH(QString, program);

    Job job;
    job.script(program, "trap '' TERM INT HUP; exec sleep 1000");
    job.choose("in.cif", "data", format);
    job.dlg->show();
    job.dlg->importButton->click();
    QProcess *process = program == "conv" ? job.dlg->importProcess : job.dlg->morvelProcess;
    QCOMPARE(process->state(), QProcess::Running);
    const qint64 pid = process->processId();

    // As in main: Close ends the event loop, then the dialog goes.
    QTimer::singleShot(100, job.dlg->cancelButton, &QPushButton::click);
    bool loopEnded = true;
    // A timer object of this scope: a pending single shot would fire in a later test.
    QTimer guard;
    guard.setSingleShot(true);
    QObject::connect(&guard, &QTimer::timeout, [&] {
        loopEnded = false;
        QCoreApplication::quit();
    });
    guard.start(10000);
    QApplication::exec();
    QVERIFY(loopEnded);
    QVERIFY(!job.dlg->isVisible());
    QVERIFY(processRuns(pid)); // closing alone does not wait for the program

    QElapsedTimer clock;
    clock.start();
    job.dlg.reset();
    QVERIFY2(clock.elapsed() < 3000, qPrintable(QString::number(clock.elapsed())));
    QVERIFY(!processRuns(pid));
    QCOMPARE(childProcesses(), QList<qint64>());
}

void TestChildFaults::morvelResult_data()
{
    QTest::addColumn<QByteArray>("written"); // null: MORVEL writes none
    QTest::addColumn<int>("code");

    QTest::newRow("1 MB of binary bytes") << binaryBytes(1 << 20, 4) << 0;
    QTest::newRow("50 MB of text") << plainResult(50 << 20) << 0;
    QTest::newRow("no result, exit 0") << QByteArray() << 0;
    QTest::newRow("no result, exit 5") << QByteArray() << 5;
}

void TestChildFaults::morvelResult()
{
    QFETCH(QByteArray, written);
    QFETCH(int, code);

    Job job;
    const QString resultPath = job.bin.file("result");
    if (!written.isNull())
        writeFile(resultPath, written);
    job.script("morvel", (written.isNull() ? QByteArray() : "cat " + quoted(resultPath).toUtf8() + " > MORVEL.OUT; ")
                             + "exit " + QByteArray::number(code));
    writeFile(job.work + "/MORVEL.OUT", "earlier");
    job.choose("in.txt", "input", 1);

    const JobCost cost = runMeasured(job);
    QVERIFY(cost.ended);
    QVERIFY2(cost.longestStopMs < longestStopMs, qPrintable(QString::number(cost.longestStopMs)));
    // The log holds at most 10 MiB of a result; as laid-out text that is some ten times more.
    if (memoryFiguresHold)
        QVERIFY2(cost.peakGrowthKiB < 4 * peakGrowthKiB, qPrintable(QString::number(cost.peakGrowthKiB)));

    QCOMPARE(job.file("MORVEL.OUT.old1"), QByteArray("earlier"));
    QCOMPARE(job.file("MORVEL.OUT"), written.isNull() ? QByteArray("") : written);
    const QString text = job.text();
    QCOMPARE(text.contains("Something went wrong with morvel program !"), code != 0);
    if (written.isNull()) {
        QVERIFY2(text.endsWith(shown(result(""), false)), qPrintable(text.right(300)));
        return;
    }
    const QString banner = shown(result("").mid(2, 5), false);
    QVERIFY(text.contains(banner));
    const QString shownResult = text.mid(text.indexOf(banner) + banner.size() + 1);
    // A NUL byte neither ends the text nor reaches the log.
    QVERIFY(!shownResult.contains(QChar(0)));
    if (written.size() > (10 << 20)) {
        // Shown in part, and a red line that names the file says so.
        QVERIFY(shownResult.size() <= (10 << 20) + 1000);
        QVERIFY(shownResult.startsWith(QString::fromLatin1(written.left(1000))));
        const QString lastLine = text.trimmed().section('\n', -1);
        QVERIFY2(lastLine.contains(job.work + "/MORVEL.OUT"), qPrintable(lastLine));
        QVERIFY(job.log().right(1000).contains("#ff3300"));
    } else {
        QVERIFY(shownResult.size() > written.size() / 2);
    }
}

void TestChildFaults::morvelInputPulledAway()
{
    Job job;
    job.script("morvel", "rm morvel.in; echo \"result of $(date +%N)\" > MORVEL.OUT");
    job.choose("in.txt", "input", 1);
    job.dlg->importButton->click();
    QVERIFY(waitForJobEnd(job));
    QCOMPARE(job.file("morvel.in"), QByteArray("<none>"));
    QCOMPARE(job.file("in.txt"), QByteArray("input"));
    const QByteArray first = job.file("MORVEL.OUT");
    QVERIFY(first.startsWith("result of "));
    QVERIFY(job.text().trimmed().endsWith(QString::fromLatin1(first).trimmed()));

    // The next run stages the input again and keeps the first result.
    job.script("morvel", "cat morvel.in > MORVEL.OUT");
    job.dlg->importButton->click();
    QVERIFY(waitForJobEnd(job));
    QCOMPARE(job.file("MORVEL.OUT"), QByteArray("input"));
    QCOMPARE(job.file("MORVEL.OUT.old1"), first);
    QVERIFY(job.logEndsWith(QStringList{done, exists, "<b>It has been renamed as :</b>  /MORVEL.OUT.old1", morvelStart}
                            + result("input")));
}

QTEST_MAIN(TestChildFaults)
#include "tst_childfaults.moc"
