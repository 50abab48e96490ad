// 200 whole jobs, one after the other, in one dialog with the reference stand-ins. Nothing may
// pile up (file descriptors, child processes, memory) and every earlier result must be kept
// under a number of its own.
#include "testsupport.h"

#include <QRegularExpression>
#include <QtTest>

namespace {
int openDescriptors()
{
    return QDir("/proc/self/fd").entryList(QDir::AllEntries | QDir::System | QDir::NoDotAndDotDot).size();
}

QByteArray childProcesses()
{
    QByteArray children;
    for (const QString &task : QDir("/proc/self/task").entryList(QDir::Dirs | QDir::NoDotAndDotDot))
        children += readFile("/proc/self/task/" + task + "/children");
    return children.trimmed();
}

qint64 residentKiB()
{
    const QRegularExpressionMatch m = QRegularExpression("VmRSS:\\s+(\\d+)").match(readFile("/proc/self/status"));
    return m.captured(1).toLongLong();
}

// The job whose result this is: each job's text in morvelpartxt.txt reaches its MORVEL.OUT.
int jobOf(const QByteArray &result)
{
    const QRegularExpressionMatch m = QRegularExpression("load job (\\d+);").match(QString::fromLatin1(result));
    return m.hasMatch() ? m.captured(1).toInt() : 0;
}
} // namespace

class TestLoad : public QObject
{
    Q_OBJECT

private slots:
    void twoHundredJobs()
    {
        Job job(CIF_PARSER_PATH, MORVEL_PATH);
        job.choose("nacl.cif", readFile(DEMO_DIR "/nacl.cif"), 0);
        QDir(job.bin.path()).mkdir("aside");
        int firstKept = 1; // the job whose result MORVEL.OUT.old1 holds
        int descriptors = 0;
        qint64 memory = 0;
        for (int n = 1; n <= 200; ++n) {
            writeFile(job.file("morvelpartxt.txt", job.bin.path()), "load job " + QByteArray::number(n) + ";");
            job.dlg->importButton->click();
            QTRY_VERIFY_WITH_TIMEOUT(job.idle(), 60000);
            QCOMPARE(jobOf(job.bytes("MORVEL.OUT")), n);
            QVERIFY2(job.text().contains("Normal end.") && !job.shownRed(), qPrintable(job.text().right(500)));
            if (n > 1)
                QVERIFY(job.lines().contains("It has been renamed as : /MORVEL.OUT.old" + QString::number(n - firstKept)));
            QCOMPARE(childProcesses(), QByteArray());
            if (n == 2) { // the first job that keeps a result has opened all there is to open
                descriptors = openDescriptors();
                memory = residentKiB();
            }
            if (n % 50 == 0) { // each kept result under its own number; then moved aside to make room
                for (int kept = 1; kept <= n - firstKept; ++kept) {
                    const QString name = "MORVEL.OUT.old" + QString::number(kept);
                    QCOMPARE(jobOf(job.bytes(name)), firstKept + kept - 1);
                    QVERIFY(QFile::rename(job.file(name), job.bin.path() + "/aside/" + QString::number(firstKept + kept - 1)));
                }
                firstKept = n;
            }
        }
        QCOMPARE(openDescriptors(), descriptors);
        const qint64 growth = residentKiB() - memory;
        qInfo("memory growth over 198 jobs: %lld KiB", growth);
#if !defined(__SANITIZE_ADDRESS__)
        QVERIFY2(growth < 5 * 1024, qPrintable(QString::number(growth))); // AddressSanitizer keeps freed memory
#endif
        QCOMPARE(QDir(job.bin.path() + "/aside").entryList(QDir::Files).size(), 199);
    }
};

QTEST_MAIN(TestLoad)
#include "tst_load.moc"
