// Whole demo jobs through the dialog with the reference stand-ins as the two programs; and 200 of
// them, one after the other, in one dialog: nothing may pile up (file descriptors, child
// processes, memory) and every earlier result must be kept under a number of its own.
#include "testsupport.h"

#include <QRegularExpression>
#include <QtTest>

namespace {
const QByteArray silicon = "data_Si\n_cell_length_a 5.4310\n_cell_length_b 5.4310\n_cell_length_c 5.4310\n_cell_angle_alpha 90\n"
                           "_cell_angle_beta 90\n_cell_angle_gamma 90\n_symmetry_space_group_name_H-M 'F d -3 m'\n"
                           "loop_\n_atom_type_symbol\n_atom_type_description\n_atom_type_scat_source\n"
                           "Si Si 'International Tables Vol C Tables 4.2.6.8 and 6.1.1.4'\nloop_\n_atom_site_label\n"
                           "_atom_site_type_symbol\n_atom_site_fract_x\n_atom_site_fract_y\n_atom_site_fract_z\nSi1 Si 0 0 0\n";
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

class TestEndToEnd : public QObject
{
    Q_OBJECT

private slots:
    // CIF files without oxidation numbers, completed from oxidation.dat, converted and computed.
    void demoJob_data()
    {
        QTest::addColumn<QString>("name");
        QTest::addColumn<QByteArray>("table");  // oxidation.dat
        QTest::addColumn<QString>("distance");  // the shortest distance of the first site
        QTest::newRow("rutile") << "rutile.cif" << QByteArray("Ti1 Ti 4\nO1 O -2\n") << "O       4_454     1.9486";
        // A refinement program's atom-type loop gets the numbers; the converter reads the result.
        QTest::newRow("silicon with an atom-type loop") << "si.cif" << QByteArray("Si1 Si4+ 4\n") << "Si4+    2_555     2.3517";
    }
    void demoJob()
    {
        QFETCH(QString, name);
        QFETCH(QByteArray, table);
        Job job(CIF_PARSER_PATH, MORVEL_PATH);
        const QByteArray input = name == "si.cif" ? silicon : readFile(DEMO_DIR "/" + name);
        writeFile(job.file("oxidation.dat"), table);
        ModalDriver driver;
        driver.answerBox(QMessageBox::Ok);
        job.choose(name, input, 0);
        QVERIFY2(driver.allAnswered(), qPrintable(driver.problems.join(", ")));
        job.dlg->importButton->click();
        QTRY_VERIFY_WITH_TIMEOUT(job.idle(), 60000);
        const QString result = QString::fromUtf8(job.bytes("MORVEL.OUT"));
        QVERIFY2(result.trimmed().endsWith("Normal end.") && job.text().contains("DONE !!!") && !job.shownRed(),
                 qPrintable(job.text()));
        QFETCH(QString, distance);
        QVERIFY2(result.contains(distance) && job.text().contains(distance), qPrintable(result));
    }

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

QTEST_MAIN(TestEndToEnd)
#include "tst_endtoend.moc"
