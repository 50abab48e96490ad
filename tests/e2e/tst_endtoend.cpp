// Whole demo jobs through the dialog with the reference stand-ins as the two programs.
#include "testsupport.h"

#include <QtTest>

namespace {
const QByteArray silicon = "data_Si\n_cell_length_a 5.4310\n_cell_length_b 5.4310\n_cell_length_c 5.4310\n"
                           "_cell_angle_alpha 90\n_cell_angle_beta 90\n_cell_angle_gamma 90\n"
                           "_symmetry_space_group_name_H-M 'F d -3 m'\n"
                           "loop_\n_atom_type_symbol\n_atom_type_description\n_atom_type_scat_source\n"
                           "Si Si 'International Tables Vol C Tables 4.2.6.8 and 6.1.1.4'\n"
                           "loop_\n_atom_site_label\n_atom_site_type_symbol\n_atom_site_fract_x\n_atom_site_fract_y\n"
                           "_atom_site_fract_z\nSi1 Si 0 0 0\n";
} // namespace

class TestEndToEnd : public QObject
{
    Q_OBJECT

private slots:
    void demoJob_data()
    {
        QTest::addColumn<QString>("name");
        QTest::addColumn<int>("format");
        QTest::addColumn<QByteArray>("table"); // oxidation.dat; null: the file has its numbers
        QTest::addColumn<QString>("distance");  // the shortest distance of the first site
        QTest::newRow("rock salt") << "nacl.cif" << 0 << QByteArray() << "Cl1-    49_444    2.8100";
        QTest::newRow("rutile, completed from oxidation.dat") << "rutile.cif" << 0 << QByteArray("Ti1 Ti 4\nO1 O -2\n")
                                                              << "O       4_454     1.9486";
        // A refinement program's atom-type loop gets the numbers; the converter reads the result.
        QTest::newRow("silicon with an atom-type loop") << "si.cif" << 0 << QByteArray("Si1 Si4+ 4\n")
                                                        << "Si4+    2_555     2.3517";
        QTest::newRow("quartz, hand-made") << "quartz.in" << 1 << QByteArray() << "O       1_555     1.6046";
    }
    void demoJob()
    {
        QFETCH(QString, name);
        QFETCH(int, format);
        QFETCH(QByteArray, table);
        Job job(CIF_PARSER_PATH, MORVEL_PATH);
        const QByteArray input = name == "si.cif" ? silicon : readFile(DEMO_DIR "/" + name);
        if (!table.isNull())
            writeFile(job.file("oxidation.dat"), table);
        ModalDriver driver;
        if (!table.isNull())
            driver.answerBox(QMessageBox::Ok);
        job.choose(name, input, format);
        QVERIFY2(driver.allAnswered(), qPrintable(driver.problems.join(", ")));
        QCOMPARE(job.bytes(name.section('.', 0, 0) + "_old.cif"), table.isNull() ? QByteArray("<none>") : input);
        job.dlg->importButton->click();
        QTRY_VERIFY_WITH_TIMEOUT(job.idle(), 60000);
        const QString result = QString::fromUtf8(job.bytes("MORVEL.OUT"));
        QVERIFY2(result.trimmed().endsWith("Normal end.") && job.text().contains("DONE !!!") && !job.shownRed(),
                 qPrintable(job.text()));
        QFETCH(QString, distance);
        QVERIFY2(result.contains(distance), qPrintable(result));
        QVERIFY(job.text().contains(distance));
    }

    void converterRefusesFile()
    {
        Job job(CIF_PARSER_PATH, MORVEL_PATH);
        job.choose("nacl.cif", readFile(DEMO_DIR "/nacl.cif").replace("_cell_length_a", "_cell_length_q"), 0);
        job.dlg->importButton->click();
        QTRY_VERIFY_WITH_TIMEOUT(job.idle(), 60000);
        QVERIFY(job.lines().endsWith("Please check cifparser.log file."));
        QVERIFY(readFile(job.file("cifparser.log")).contains("ERROR"));
        QVERIFY(!QFile::exists(job.file("MORVEL.OUT")));
    }
};

QTEST_MAIN(TestEndToEnd)
#include "tst_endtoend.moc"
