// 200 whole jobs, one after the other, in one dialog with the reference stand-ins: Browse, Run,
// the converter, MORVEL and the result display. Nothing may pile up (file descriptors, child
// processes, memory) and every earlier result must be kept under its own number.

#include "import.h"
#include "inputtestsupport.h"
#include "jobsupport.h"
#include "modaldriver.h"
#include "processprobe.h"
#include "resultdisplay.h"

#include <QtTest>

namespace {
// As the log shows it: the rich text collapses the two blanks after the colon.
const QString renamed = QStringLiteral("It has been renamed as : /MORVEL.OUT.old");

// The binaries directory with the stand-ins, and a working directory holding the rock salt.
struct LoadJob : Job
{
    QString input;

    LoadJob()
    {
        dlg->parserProgram = QStringLiteral(CIF_PARSER_PATH);
        dlg->morvelProgram = QStringLiteral(MORVEL_PATH);
        input = work + QStringLiteral("/nacl.cif");
        writeFile(input, fileBytes(QStringLiteral(DEMO_DIR "/nacl.cif")));
    }

    // One whole job whose result names it: its text goes into morvel.par and MORVEL echoes it.
    bool run(int number)
    {
        writeFile(bin.file("morvelpartxt.txt"), name(number));
        ModalDriver driver;
        driver.chooseFile(input);
        dlg->browseinput->click();
        if (!driver.allAnswered())
            return false;
        dlg->importButton->click();
        return runLoopUntil([&] { return idle() && !resultDisplayBusy(dlg->importlog); }, 30000);
    }

    static QByteArray name(int number) { return "load job " + QByteArray::number(number) + ";"; }

    // The number the last run kept the earlier result under; 0 when it kept none.
    int keptNumber() const
    {
        for (const QString &line : shownLines(dlg->importlog))
            if (line.startsWith(renamed))
                return line.mid(renamed.size()).toInt();
        return 0;
    }

    // The job whose result this file is; 0 when it is none of them.
    static int jobOf(const QByteArray &result)
    {
        const qsizetype at = result.indexOf("load job ");
        return at < 0 ? 0 : result.mid(at + 9, result.indexOf(';', at) - at - 9).toInt();
    }
};
} // namespace

class TestLoad : public QObject
{
    Q_OBJECT

private slots:
    void initTestCase() { becomeSubreaper(); }

    void twoHundredJobs()
    {
        LoadJob job;
        QDir(job.bin.path()).mkdir("aside");
        int firstKept = 1; // the job whose result the number 1 holds
        int descriptors = 0;
        qint64 memory = 0;
        QElapsedTimer clock;
        clock.start();
        for (int n = 1; n <= 200; ++n) {
            QVERIFY2(job.run(n), qPrintable(QString("job %1: %2").arg(n).arg(job.text().right(300))));
            QCOMPARE(LoadJob::jobOf(job.file("MORVEL.OUT")), n);
            QVERIFY2(job.text().contains("DONE !!!") && !job.log().contains("#ff3300"), qPrintable(job.text()));
            QCOMPARE(job.keptNumber(), n == 1 ? 0 : n - firstKept);
            QCOMPARE(childProcesses(), QList<qint64>());
            if (n == 2) { // the first job that keeps a result has opened all there is to open
                descriptors = openDescriptors();
                memory = statusKiB("VmRSS");
            }
            if (n % 50 == 0) {
                // Each kept result under its own number; then moved aside to make room.
                for (int kept = 1; kept < n - firstKept + 1; ++kept) {
                    const QString path = job.work + "/MORVEL.OUT.old" + QString::number(kept);
                    QCOMPARE(LoadJob::jobOf(job.file("MORVEL.OUT.old" + QString::number(kept))), firstKept + kept - 1);
                    QVERIFY(QFile::rename(path, job.bin.file("aside/result" + QString::number(firstKept + kept - 1))));
                }
                QVERIFY(!QFile::exists(job.work + "/MORVEL.OUT.old1"));
                firstKept = n;
            }
        }
        const qint64 growth = statusKiB("VmRSS") - memory;
        qInfo("200 jobs in %lld ms; descriptors %d -> %d; memory growth %lld KiB", clock.elapsed(), descriptors,
              openDescriptors(), growth);
        QCOMPARE(openDescriptors(), descriptors);
        if (memoryFiguresHold)
            QVERIFY2(growth < 5 * 1024, qPrintable(QString::number(growth)));

        // Every earlier result is there, each once.
        const QStringList aside = QDir(job.bin.file("aside")).entryList(QDir::Files);
        QCOMPARE(aside.size(), 199);
        for (const QString &name : aside)
            QCOMPARE(QString::number(LoadJob::jobOf(fileBytes(job.bin.file("aside/" + name)))), name.mid(6));
    }

    void allNumbersTaken()
    {
        LoadJob job;
        for (int n = 1; n <= 99; ++n)
            writeFile(job.work + "/MORVEL.OUT.old" + QString::number(n), LoadJob::name(1000 + n));
        QVERIFY(job.run(1));
        QVERIFY(job.run(2));
        QCOMPARE(job.keptNumber(), 100);
        QCOMPARE(LoadJob::jobOf(job.file("MORVEL.OUT.old100")), 1);

        // No number is left: the job stops before MORVEL would overwrite the result of job 2.
        QVERIFY(job.run(3));
        const QStringList lines = shownLines(job.dlg->importlog);
        QCOMPARE(lines.mid(lines.size() - 2),
                 QStringList({"A \"MORVEL.OUT\" file already exists in the working directory !",
                              "The earlier \"MORVEL.OUT\" could not be renamed as \"MORVEL.OUT.old1\" to "
                              "\"MORVEL.OUT.old100\": MORVEL has not been started !"}));
        QVERIFY(!job.text().contains("Starting Morvel"));
        QCOMPARE(LoadJob::jobOf(job.file("MORVEL.OUT")), 2);
        for (int n = 1; n <= 99; ++n)
            QCOMPARE(LoadJob::jobOf(job.file("MORVEL.OUT.old" + QString::number(n))), 1000 + n);
        QCOMPARE(LoadJob::jobOf(job.file("MORVEL.OUT.old100")), 1);

        // Once a number is free again, the next job runs and keeps job 2's result there.
        QVERIFY(QFile::remove(job.work + "/MORVEL.OUT.old50"));
        QVERIFY(job.run(4));
        QCOMPARE(job.keptNumber(), 50);
        QCOMPARE(LoadJob::jobOf(job.file("MORVEL.OUT.old50")), 2);
        QCOMPARE(LoadJob::jobOf(job.file("MORVEL.OUT")), 4);
    }
};

QTEST_MAIN(TestLoad)
#include "tst_load.moc"
