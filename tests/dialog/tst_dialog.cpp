// The dialog as the user meets it: its start-up report, the form, About and Close, choosing the
// input file (Browse, the command line, a drop) and completing a CIF file with oxidation numbers.
#include "filedrop.h"
#include "testsupport.h"

#include <QMimeData>
#include <QtTest>

namespace {
const QString noOxidation = "WARNING : Imput CIF file does not contain \"_atom_type_oxidation_number \"";
const QString ready = "Ready to import the CIF file then to run MORVEL (Run MORVEL button below) !";
const QString boxA = "WARNING! | Please check the file format !! |  You have choosen \"CIF\" as input format but the "
                     "selected file doesnt appear to be a CIF file !";
const QString boxB = "WARNING! | Please check the file format !! |  You have choosen \"Hand made\" or \"old ICSD\" as "
                     "input format but the selected file seems to be a CIF file instead!";
const QString boxC = "WARNING! | It seems that the selected CIF file does not contain the \"_atom_type_oxidation_number\" "
                     "flag ! | Please edit manually a \"oxidation.dat\" file, in the current working directory, so that "
                     "the imporation procedure can modify accordingly the CIF file.\n\n\"oxidation.dat\" file must "
                     "contain, for each atom, one line : \n_atom_site_label   _atom_site_type_symbol   "
                     "_atom_type_oxidation_number \n\nOnce the \"oxidation.dat\" file is correct, hit OK, otherwise "
                     "Cancel to keep the CIF file unmodified.";

const QByteArray exampleTable = "Fe1 Fe3+ 3\nO1 O2- -2\n";
const QByteArray exampleHead = "data_x\nloop_\n_atom_site_label\n_atom_site_type_symbol\n_atom_site_fract_x\n";
const QByteArray exampleCif = exampleHead + "Fe1   Fe  0.0\nO1    O   0.5\nXx1   Xx  0.1\n";
const QByteArray exampleRewritten = exampleHead + "Fe1 Fe3+ 0.0\nO1 O2- 0.5\nloop_\n_atom_type_symbol\n"
                                                  "_atom_type_oxidation_number\nFe3+ 3\nO2- -2\n\n";
const QStringList exampleLog{"Found file \"oxidation.dat\" in working directory :",
                             "Got the following list of atom symbols and charges :", "Fe1  Fe3+  3", "O1  O2-  -2",
                             "Now identifying pairs atom symbol/atom names :", "Atom Fe1 has symbol Fe3+ and charge 3",
                             "Atom O1 has symbol O2- and charge -2", "WARNING !",
                             "The following atoms do not have any match in \"oxidation.dat\" file :", "Xx1",
                             "The input CIF file has been modified according to \"oxidation.dat\" file info.",
                             "Ready to import the CIF file then to run MORVEL !"};

// One line per object: its class, what the form (or code) sets on it, and where a layout puts it.
QStringList describe(const QObjectList &objects, const QList<QLayout *> &layouts)
{
    QStringList lines;
    for (QObject *o : objects) {
        QString line = o->objectName() + ' ' + o->metaObject()->className();
        for (const char *name : {"text", "title", "toolTip", "alignment", "checked", "readOnly", "minimum", "maximum",
                                 "value", "layoutDirection", "minimumSize", "maximumSize", "textFormat", "openExternalLinks"}) {
            const QVariant v = o->property(name);
            const QSize size = v.toSize();
            const QString text = v.typeId() == QMetaType::QSize ? QString("%1x%2").arg(size.width()).arg(size.height())
                                                                : v.toString().replace('\n', "\\n");
            if (v.isValid() && !(text.isEmpty() && (name == QByteArray("text") || name == QByteArray("toolTip"))))
                line += QString(" %1=%2").arg(name, text);
        }
        if (auto *combo = qobject_cast<QComboBox *>(o))
            for (int i = 0; i < combo->count(); ++i)
                line += " item=" + combo->itemText(i);
        if (auto *w = qobject_cast<QWidget *>(o); w && w->testAttribute(Qt::WA_SetFont))
            line += QString(" font=%1,%2").arg(w->font().pointSize()).arg(w->font().bold());
        for (QLayout *layout : layouts) {
            const int i = qobject_cast<QWidget *>(o) ? layout->indexOf(static_cast<QWidget *>(o))
                                                     : layout->indexOf(qobject_cast<QLayout *>(o));
            int row = i, column = 0, rows = 1, columns = 1;
            if (auto *grid = qobject_cast<QGridLayout *>(layout); grid && i >= 0)
                grid->getItemPosition(i, &row, &column, &rows, &columns);
            if (i >= 0)
                line += QString(" in %1 %2,%3 %4x%5").arg(layout->objectName()).arg(row).arg(column).arg(rows).arg(columns);
        }
        lines.append(line);
    }
    return lines;
}

// Compares lines with the description kept in a file beside this test (MORVEL_WRITE_FORM=1 writes it).
// A title, where given, stands as @TITLE@ in the file.
void compareWithFile(QStringList lines, const QString &file, const QString &title = QString())
{
    const QString path = QStringLiteral(TEST_DIR "/") + file;
    if (!title.isEmpty())
        lines.replaceInStrings(title, "@TITLE@");
    if (qEnvironmentVariableIsSet("MORVEL_WRITE_FORM"))
        writeFile(path, lines.join('\n').toUtf8() + '\n');
    QCOMPARE(lines, QString::fromUtf8(readFile(path)).split('\n', Qt::SkipEmptyParts));
}
} // namespace

class TestDialog : public QObject
{
    Q_OBJECT

private slots:
    void startupReport_data()
    {
        QTest::addColumn<QByteArray>("binaries"); // null: no file; "<dir>": a directory in its place
        QTest::addColumn<QByteArray>("version");
        QTest::addColumn<QStringList>("lines");
        QTest::addColumn<QString>("about"); // the version the About window shows
        const QStringList noBinaries{"The file ./binaries.txt does not exist in the binaries directory!",
                                     "Default binaries names will be used"};
        const QStringList defaults{
            "The MORVEL binary file given in ./binaries.txt does not exist in the binaries directory!",
            "Default MORVEL program name will be used",
            "The CIF converter binary file given in ./binaries.txt does not exist in the binaries directory!",
            "Default CIF converter program name will be used", "Using programs :"};
        QTest::newRow("nothing there") << QByteArray() << QByteArray()
            << noBinaries + QStringList{"The version.txt file does not exist in the binaries directory!"} + defaults
                   + QStringList{"Morvel = ./morvel.exe version unknown", "Cif Parser = ./cif_parser.exe"}
            << "version unknown";
        QTest::newRow("both programs, version") << QByteArray("PARSER   ./p \r\nMORVEL ./m\n") << QByteArray("Version : 2015.3\nx\n")
                                                << QStringList{"Using programs :", "Morvel = ./m 2015.3", "Cif Parser = ./p"} << "2015.3";
        QTest::newRow("key on the third line, short version")
            << QByteArray("MORVEL ./m\n\nPARSER ./p\n") << QByteArray("v1\n")
            << defaults.mid(2) + QStringList{"Morvel = ./m", "Cif Parser = ./cif_parser.exe"} << "";
        QTest::newRow("binaries.txt unreadable") << QByteArray("<dir>") << QByteArray("0123456789ab")
            << noBinaries + defaults + QStringList{"Morvel = ./morvel.exe ab", "Cif Parser = ./cif_parser.exe"} << "ab";
        QTest::newRow("version.txt unreadable") << QByteArray("MORVEL ./nothing") << QByteArray("<dir>")
                                                << QStringList{"Something went wrong while opening \"version.txt\" file!"} << "";
    }
    void startupReport()
    {
        QFETCH(QByteArray, binaries);
        QFETCH(QByteArray, version);
        QTemporaryDir dir;
        const QString previous = QDir::currentPath();
        QDir::setCurrent(dir.path());
        writeFile("m", "");
        writeFile("p", "");
        for (const auto &[name, bytes] : {std::pair{"binaries.txt", binaries}, std::pair{"version.txt", version}}) {
            if (bytes == "<dir>")
                QDir().mkdir(name);
            else if (!bytes.isNull())
                writeFile(name, bytes);
        }
        Import dialog;
        QDir::setCurrent(previous);
        QTEST(logLines(dialog.importlog), "lines");
        QCOMPARE(dialog.importlog->toHtml().contains("#ff3300"), version == "<dir>");

        // About shows the version after its label; Escape closes it.
        QStringList window;
        QTimer::singleShot(0, [&] {
            QWidget *about = QApplication::activeModalWidget();
            window = QStringList{about->windowTitle()} + describe(about->children(), about->findChildren<QLayout *>());
            QTest::keyClick(about, Qt::Key_Escape);
        });
        dialog.helpButton->click();
        QFETCH(QString, about);
        compareWithFile(window, "about.txt", "<b>Morvel2015 </b>" + about);
    }

    void form()
    {
        Job job;
        Import &d = *job.dlg;
        QCOMPARE(d.windowTitle() + ' ' + QString::number(d.width()) + 'x' + QString::number(d.height()), "MorvelGUI 599x597");
        // Every widget and layout as the form builds it.
        QObjectList named = d.findChildren<QObject *>();
        named.removeIf([](QObject *o) { return o->objectName().isEmpty() || o->objectName().startsWith("qt_"); });
        compareWithFile(describe(named, d.findChildren<QLayout *>()), "form.txt");
        QVERIFY(job.idle() && d.browseinput->isEnabled() && d.InputBox->currentIndex() == 0);
        d.InputBox->setCurrentIndex(2);
        d.retranslateUi(&d); // refills both combo boxes: back to their first item
        QVERIFY(d.InputBox->currentIndex() == 0 && d.InputBox->count() + d.OutputBox->count() == 6);

        const QMetaObject *meta = d.metaObject();
        QStringList slotNames;
        for (int i = meta->methodOffset(); i < meta->methodCount(); ++i)
            slotNames.append(meta->method(i).methodSignature());
        QCOMPARE(slotNames, QStringList({"getInputFile()", "makeImport()", "endImport(int)", "endMorvel(int)",
                                         "outputImport()", "closeDialog()", "killImport()", "checkStart()",
                                         "checkStartMorvel()", "processError(QProcess::ProcessError)", "help()",
                                         "openMorvelOut()"}));

        // Close clears the path and the log and closes the window.
        job.choose("a.dat", "x", 1);
        d.show();
        QCOMPARE(d.inputpath->text(), job.file("a.dat"));
        d.cancelButton->click();
        QVERIFY(!d.isVisible() && d.inputpath->text().isEmpty() && d.importlog->toPlainText().isEmpty());
        d.show();
        QTest::keyClick(&d, Qt::Key_Escape);
        QVERIFY(!d.isVisible());
    }

    // What a field shows is what morvel.par gets, whatever the desktop's locale.
    void numbersInAnyLocale()
    {
        for (const auto &[locale, typed, shown] : {std::tuple{"de_DE", "4,5", "45"}, {"fr_FR", "4.5", "4.5"},
                                                    {"C", "-3.1254", "3.125"}}) { // no minus, three decimals
            const QLocale previous;
            QLocale::setDefault(QLocale(locale));
            Job job;
            QLocale::setDefault(previous);
            job.choose("a.dat", "x", 1);
            job.dlg->dmaxline->clear();
            QTest::keyClicks(job.dlg->dmaxline, typed);
            QCOMPARE(job.dlg->dmaxline->text(), shown);
            job.dlg->importButton->click();
            QTRY_VERIFY(job.idle());
            QCOMPARE(job.bytes("morvel.par").simplified().split(' ').value(0), QByteArray(shown));
        }
    }

    void browse()
    {
        Job job;
        writeFile(job.file("a.cif"), cifWithNumbers);
        ModalDriver driver;
        driver.chooseFile(job.file("a.cif"));
        job.dlg->browseinput->click();
        driver.chooseFile(QString()); // cancelled: nothing changes
        job.dlg->browseinput->click();
        job.dlg->InputBox->setCurrentIndex(2);
        driver.chooseFile(QString());
        job.dlg->browseinput->click();
        QVERIFY2(driver.allAnswered(), qPrintable(driver.problems.join(", ")));
        QCOMPARE(driver.seen.value(0).section(" | ", 0, 1), "Select an input CIF file | CIF files (*.cif);;All files (*)");
        QCOMPARE(driver.seen.value(1).section(" | ", 2), QFileInfo(job.work).absoluteFilePath());
        QCOMPARE(driver.seen.value(2).section(" | ", 0, 1), "Select an input file | All files (*)");
        QCOMPARE(job.dlg->inputpath->text(), job.file("a.cif"));
        QCOMPARE(job.lines(), QStringList{ready});
    }

    void chooseFile_data()
    {
        QTest::addColumn<int>("format");
        QTest::addColumn<QString>("name");
        QTest::addColumn<QByteArray>("bytes");
        QTest::addColumn<QStringList>("boxes");
        QTest::addColumn<QStringList>("lines"); // after the choice; empty: the log is not touched
        const QStringList unchanged;
        QTest::newRow("CIF, x.txt") << 0 << "x.txt" << exampleCif << QStringList{boxA} << unchanged;
        QTest::newRow("CIF, x.cif.txt") << 0 << "x.cif.txt" << exampleCif << QStringList() << unchanged;
        QTest::newRow("CIF, x.CIF, Cancel") << 0 << "x.CIF" << exampleCif << QStringList{boxC}
                                            << QStringList{noOxidation, "Keeping unmodified CIF file"};
        QTest::newRow("CIF, tag in a comment") << 0 << "x.cif" << "#_atom_type_oxidation_numbers\n" + exampleCif
                                               << QStringList() << QStringList{ready};
        QTest::newRow("old ICSD, x.tar.CIF") << 2 << "x.tar.CIF" << exampleCif << QStringList{boxB} << unchanged;
        QTest::newRow("Hand-made, a directory") << 1 << "x.dat" << QByteArray() << QStringList()
                                                << QStringList{"+", "Cannot open input file in read-write mode!"};
    }
    void chooseFile()
    {
        QFETCH(QString, name);
        QFETCH(QByteArray, bytes);
        QFETCH(QStringList, boxes);
        QFETCH(QStringList, lines);
        Job job;
        if (bytes.isNull())
            QDir(job.work).mkdir(name);
        const QStringList before = job.lines();
        ModalDriver driver;
        for (const QString &box : boxes)
            driver.answerBox(box == boxC ? QMessageBox::Cancel : QMessageBox::Ok);
        QFETCH(int, format);
        job.choose(name, bytes, format);
        QVERIFY2(driver.allAnswered(), qPrintable(driver.problems.join(", ")));
        QCOMPARE(driver.seen, boxes);
        // "+": appended to the log as it was
        QCOMPARE(job.lines(), lines.isEmpty() ? before : lines.first() == "+" ? before + lines.mid(1) : lines);
        QCOMPARE(job.dlg->inputpath->text(), job.file(name)); // the current input even when refused
        if (!bytes.isNull())
            QCOMPARE(job.bytes(name), bytes);
    }

    // The CIF file is rewritten only while a copy of it, as it is then, exists.
    void completeFromTable()
    {
        Job job;
        writeFile(job.file("oxidation.dat"), exampleTable);
        writeFile(job.file("tmp.cif"), QByteArray(5000, '#')); // longer than the new text
        ModalDriver driver;
        driver.answerBox(QMessageBox::Ok);
        job.choose("x.cif", exampleCif, 0);
        QCOMPARE(job.bytes("x.cif"), exampleRewritten);
        QCOMPARE(job.bytes("x_old.cif"), exampleCif);
        QCOMPARE(job.lines(), QStringList({noOxidation, "Using modified CIF file, charges informations taken from "
                                                        "\"oxidation.dat\" file", "Original CIF file has been saved under x_old.cif"})
                                  + exampleLog);
        QCOMPARE(QDir(job.work).entryList(QDir::Files), QStringList({"oxidation.dat", "x.cif", "x_old.cif"}));

        // Another structure under the same name: the first copy stays, this one is kept beside it.
        const QByteArray other = QByteArray(exampleCif).replace("0.5", "0.25");
        driver.answerBox(QMessageBox::Ok);
        job.choose("x.cif", other, 0);
        QCOMPARE(job.bytes("x_old.cif"), exampleCif);
        QCOMPARE(job.bytes("x_old2.cif"), other);
        QCOMPARE(job.lines().mid(2, 2), QStringList({"Cannot overwrite save file : x_old.cif",
                                                     "Original CIF file has been saved under x_old2.cif"}));
        QCOMPARE(job.bytes("x.cif"), QByteArray(exampleRewritten).replace("0.5", "0.25"));

        // The same bytes again: the copy there counts. No copy possible: the file stays as it is.
        writeFile(job.file("x.cif"), exampleCif);
        driver.answerBox(QMessageBox::Ok);
        job.choose("x.cif", QByteArray(), 0);
        QCOMPARE(job.lines().mid(2, 2), QStringList({"Cannot overwrite save file : x_old.cif", "Found file \"oxidation.dat\" in working directory :"}));
        for (int n = 3; n <= 100; ++n)
            QDir(job.work).mkdir("y_old" + QString::number(n) + ".cif");
        QDir(job.work).mkdir("y_old.cif");
        QDir(job.work).mkdir("y_old2.cif");
        driver.answerBox(QMessageBox::Ok);
        job.choose("y.cif", exampleCif, 0);
        QCOMPARE(job.lines().mid(2), QStringList({"Cannot overwrite save file : y_old.cif",
                                                  "No copy of the CIF file could be kept: it is left unchanged."}));
        QCOMPARE(job.bytes("y.cif"), exampleCif);
        QVERIFY(driver.allAnswered());
    }

    void dropAndCommandLine()
    {
        Job job;
        writeFile(job.file("a.cif"), cifWithNumbers);
        writeFile(job.file("b.dat"), "x");
        const QString before = job.dlg->importlog->toPlainText();
        const auto drop = [&](const QList<QUrl> &urls) {
            QMimeData data;
            data.setUrls(urls);
            // As a drag does it: the drop only reaches a window that took the drag as it entered.
            QDragEnterEvent enter(QPoint(5, 5), Qt::CopyAction, &data, Qt::LeftButton, Qt::NoModifier);
            QApplication::sendEvent(job.dlg.get(), &enter);
            QDropEvent drop(QPointF(5, 5), Qt::CopyAction, &data, Qt::LeftButton, Qt::NoModifier);
            QApplication::sendEvent(job.dlg.get(), &drop);
            QCoreApplication::processEvents();
            return enter.isAccepted() && drop.isAccepted();
        };
        // A folder, two files, a remote file: refused without a word.
        QVERIFY(!drop({QUrl::fromLocalFile(job.work)}) && !drop({QUrl("https://example.org/a.cif")})
                && !drop({QUrl::fromLocalFile(job.file("a.cif")), QUrl::fromLocalFile(job.file("b.dat"))}));
        QVERIFY(job.dlg->inputpath->text().isEmpty() && job.dlg->importlog->toPlainText() == before);
        QVERIFY(drop({QUrl::fromLocalFile(job.file("a.cif"))}));
        QTRY_COMPARE(job.dlg->inputpath->text(), job.file("a.cif"));
        QCOMPARE(job.lines(), QStringList{ready});

        // While a program runs, no drop and no command-line file is taken.
        job.script("morvel", "exec sleep 30");
        job.choose("b.dat", QByteArray(), 1);
        job.dlg->importButton->click();
        QVERIFY(!job.dlg->browseinput->isEnabled());
        QVERIFY(!drop({QUrl::fromLocalFile(job.file("a.cif"))}));
        takeStartupFiles(*job.dlg, {job.file("a.cif")});
        QCoreApplication::processEvents();
        QCOMPARE(job.dlg->inputpath->text(), job.file("b.dat"));
        job.dlg->killbutton->click();
        QTRY_VERIFY(job.dlg->browseinput->isEnabled());

        // A relative name is taken against the current directory; more names are only listed.
        QDir::setCurrent(job.work);
        job.dlg->InputBox->setCurrentIndex(0);
        ModalDriver driver;
        driver.answerBox(QMessageBox::Cancel);
        writeFile("c.cif", exampleCif);
        takeStartupFiles(*job.dlg, {"c.cif", "d.cif", "e"});
        QVERIFY(driver.allAnswered());
        QCOMPARE(driver.seen, QStringList{boxC});
        QCOMPARE(job.dlg->inputpath->text(), job.file("c.cif"));
        QCOMPARE(job.lines().constLast(), "Only the first file given on the command line is taken; left: d.cif e");
    }
};

QTEST_MAIN(TestDialog)
#include "tst_dialog.moc"
