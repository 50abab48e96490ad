#include "import.h"
#include "testsupport.h"

#include <QButtonGroup>
#include <QDoubleValidator>
#include <QGridLayout>
#include <QMetaMethod>
#include <QTextDocument>
#include <QtTest>

class TestForm : public QObject
{
    Q_OBJECT

private slots:
    void initialState();
    void numberValidators_data();
    void numberValidators();
    void maxAtomsBounds_data();
    void maxAtomsBounds();
    void slotsInDeclaredOrder();
    void layoutTree();
    void tooltips();
    void retranslateRefillsCombos();
    void keepsExistingObjectName();
};

void TestForm::initialState()
{
    CurrentDirScope cwd;
    Import dialog;
    QCOMPARE(dialog.objectName(), QStringLiteral("Import"));
    QCOMPARE(dialog.windowTitle(), QStringLiteral("MorvelGUI"));
    QCOMPARE(dialog.size(), QSize(599, 597));
    QCOMPARE(dialog.InputBox->currentIndex(), 0);
    QCOMPARE(dialog.InputBox->currentText(), QStringLiteral("CIF File"));
    QCOMPARE(dialog.InputBox->count(), 3);
    QCOMPARE(dialog.InputBox->itemText(1), QStringLiteral("Hand-made"));
    QCOMPARE(dialog.InputBox->itemText(2), QStringLiteral("old ICSD"));
    QCOMPARE(dialog.OutputBox->currentText(), QStringLiteral("Normal output"));
    QCOMPARE(dialog.OutputBox->itemText(1), QStringLiteral("Verbose output"));
    QCOMPARE(dialog.OutputBox->itemText(2), QStringLiteral("Ionic radii tables"));
    QVERIFY(dialog.radioprint1->isChecked());
    QVERIFY(!dialog.radioprint2->isChecked());
    QCOMPARE(dialog.printGroup->checkedId(), 0);
    QCOMPARE(dialog.printGroup->id(dialog.radioprint2), 1);
    QVERIFY(!dialog.checkBoxVerbose->isChecked());
    QCOMPARE(dialog.maxAtoms->value(), 11);
    QCOMPARE(dialog.dmaxline->text(), QStringLiteral("4.0"));
    QCOMPARE(dialog.toleranceline->text(), QStringLiteral("10.0"));
    QCOMPARE(dialog.hbondline->text(), QStringLiteral("3.1"));
    QVERIFY(dialog.importButton->isEnabled());
    QVERIFY(!dialog.killbutton->isEnabled());
    QVERIFY(dialog.inputpath->text().isEmpty());
    QVERIFY(dialog.inputpath->isReadOnly());
    QVERIFY(!dialog.importlog->isReadOnly());
    QVERIFY(!dialog.importError);
    QVERIFY(dialog.inputFile.isEmpty() && dialog.workingDir.isEmpty());
    QVERIFY(dialog.oxidationTable.isEmpty());
    QCOMPARE(dialog.importButton->text(), QStringLiteral("Run MORVEL "));
    QCOMPARE(dialog.killbutton->text(), QStringLiteral("Kill MORVEL Process"));
    QCOMPARE(dialog.label_3->text(), QStringLiteral("MORVEL.OUT"));
    QCOMPARE(dialog.label_3->font().pointSize(), 9);
    QVERIFY(dialog.label_3->font().bold());
    QVERIFY(dialog.importButton->font().bold());
    QVERIFY(dialog.killbutton->font().bold());
    QVERIFY(!dialog.groupBox->font().bold());
    QCOMPARE(dialog.radioprint1->layoutDirection(), Qt::RightToLeft);
    QCOMPARE(dialog.label_4->layoutDirection(), Qt::LeftToRight);
    QCOMPARE(dialog.browseinput->minimumSize(), QSize(71, 28));
    QCOMPARE(dialog.browseinput->maximumSize(), QSize(71, 28));
    // The process objects and the button group belong to the dialog.
    QCOMPARE(dialog.importProcess->parent(), &dialog);
    QCOMPARE(dialog.morvelProcess->parent(), &dialog);
    QCOMPARE(dialog.printGroup->parent(), &dialog);
    QCOMPARE(dialog.metaObject()->className(), "Import");
    QVERIFY(dialog.qt_metacast("Ui::Import") != nullptr);
}

void TestForm::numberValidators_data()
{
    QTest::addColumn<QString>("text");
    QTest::addColumn<bool>("accepted");
    QTest::newRow("plain") << "4.0" << true;
    QTest::newRow("three decimals") << "3.125" << true;
    QTest::newRow("largest") << "999" << true;
    QTest::newRow("minus sign") << "-1" << false;
    QTest::newRow("fourth decimal") << "3.1254" << false;
    QTest::newRow("letters") << "abc" << false;
}

void TestForm::numberValidators()
{
    QFETCH(QString, text);
    QFETCH(bool, accepted);
    CurrentDirScope cwd;
    Import dialog;
    for (QLineEdit *edit : {dialog.dmaxline, dialog.toleranceline, dialog.hbondline}) {
        const auto *validator = qobject_cast<const QDoubleValidator *>(edit->validator());
        QVERIFY(validator);
        QCOMPARE(validator->parent(), edit);
        edit->clear();
        QTest::keyClicks(edit, text);
        QCOMPARE(edit->text() == text, accepted);
    }
}

void TestForm::maxAtomsBounds_data()
{
    QTest::addColumn<int>("requested");
    QTest::addColumn<int>("shown");
    QTest::newRow("below") << 0 << 1;
    QTest::newRow("lowest") << 1 << 1;
    QTest::newRow("highest") << 20 << 20;
    QTest::newRow("above") << 21 << 20;
}

void TestForm::maxAtomsBounds()
{
    QFETCH(int, requested);
    QFETCH(int, shown);
    CurrentDirScope cwd;
    Import dialog;
    dialog.maxAtoms->setValue(requested);
    QCOMPARE(dialog.maxAtoms->value(), shown);
}

void TestForm::slotsInDeclaredOrder()
{
    const QMetaObject &meta = Import::staticMetaObject;
    const QStringList expected = {"getInputFile()", "makeImport()", "endImport(int)", "endMorvel(int)",
                                  "outputImport()", "closeDialog()", "killImport()", "checkStart()",
                                  "checkStartMorvel()", "processError(QProcess::ProcessError)", "help()",
                                  "openMorvelOut()"};
    QCOMPARE(meta.methodCount() - meta.methodOffset(), int(expected.size()));
    for (int i = 0; i < expected.size(); ++i) {
        const QMetaMethod method = meta.method(meta.methodOffset() + i);
        QCOMPARE(QString::fromLatin1(method.methodSignature()), expected.at(i));
        QCOMPARE(method.methodType(), QMetaMethod::Slot);
        QCOMPARE(method.access(), QMetaMethod::Public);
    }
}

void TestForm::layoutTree()
{
    CurrentDirScope cwd;
    Import dialog;
    QCOMPARE(dialog.layout(), dialog.gridLayout_4);
    auto cellOf = [](QGridLayout *grid, QObject *thing) {
        for (int i = 0; i < grid->count(); ++i) {
            QLayoutItem *item = grid->itemAt(i);
            if (item->widget() == thing || item->layout() == thing) {
                int row, column, rows, columns;
                grid->getItemPosition(i, &row, &column, &rows, &columns);
                return QList<int>{row, column, rows, columns};
            }
        }
        return QList<int>();
    };
    QCOMPARE(cellOf(dialog.gridLayout_4, dialog.horizontalLayout_2), (QList<int>{0, 0, 1, 2}));
    QCOMPARE(cellOf(dialog.gridLayout_4, dialog.groupBox), (QList<int>{1, 0, 1, 1}));
    QCOMPARE(cellOf(dialog.gridLayout_4, dialog.groupBox_2), (QList<int>{1, 1, 1, 1}));
    QCOMPARE(cellOf(dialog.gridLayout_4, dialog.verticalLayout), (QList<int>{2, 0, 1, 2}));
    QCOMPARE(cellOf(dialog.gridLayout_4, dialog.horizontalLayout_8), (QList<int>{3, 0, 1, 2}));
    QCOMPARE(cellOf(dialog.gridLayout, dialog.label_4), (QList<int>{3, 0, 2, 1}));
    QCOMPARE(cellOf(dialog.gridLayout, dialog.maxAtoms), (QList<int>{3, 1, 2, 1}));
    QCOMPARE(cellOf(dialog.gridLayout, dialog.checkBoxVerbose), (QList<int>{2, 0, 1, 2}));
    QCOMPARE(dialog.horizontalLayout_8->count(), 5);
    QCOMPARE(dialog.horizontalLayout_8->itemAt(0)->widget(), dialog.importButton);
    QCOMPARE(dialog.horizontalLayout_8->itemAt(4)->widget(), dialog.cancelButton);
    QCOMPARE(dialog.verticalLayout->itemAt(1)->widget(), dialog.importlog);
    QCOMPARE(dialog.dmaxline->parentWidget(), dialog.groupBox);
    QCOMPARE(dialog.maxAtoms->parentWidget(), dialog.groupBox_2);
    QCOMPARE(dialog.importlog->parentWidget(), &dialog);
}

void TestForm::tooltips()
{
    CurrentDirScope cwd;
    Import dialog;
    auto visible = [](const QString &tip) {
        QTextDocument doc;
        doc.setHtml(tip);
        return doc.toPlainText();
    };
    QCOMPARE(dialog.InputBox->toolTip(),
             QStringLiteral("Choose here the type of input file. Be carefull choosing a CIF file below if the "
                            "\"CIF file\" option is selected. "));
    QCOMPARE(visible(dialog.toleranceline->toolTip()),
             QStringLiteral("Tolerance (%) on atomic size for sites with isomorphic substitution"));
    QCOMPARE(visible(dialog.checkBoxVerbose->toolTip()),
             QStringLiteral("Check this for more detailled information about the CIF file parsing in the log "
                            "window below. \nNote that the output of MORVEL program will in any case be printed "
                            "out in the log window. "));
    QCOMPARE(dialog.importButton->toolTip(),
             QStringLiteral("Execute MORVEL from here. The MORVEL.exe binary file must be located at the same "
                            "place than the MorvelGUI.exe program. "));
    QVERIFY(dialog.killbutton->toolTip().isEmpty());
    QVERIFY(dialog.maxAtoms->toolTip().isEmpty());
}

void TestForm::retranslateRefillsCombos()
{
    CurrentDirScope cwd;
    Import dialog;
    dialog.InputBox->setCurrentIndex(2);
    dialog.OutputBox->setCurrentIndex(1);
    dialog.retranslateUi(&dialog);
    QCOMPARE(dialog.InputBox->currentIndex(), 0);
    QCOMPARE(dialog.OutputBox->currentIndex(), 0);
    QCOMPARE(dialog.InputBox->count(), 3);
}

void TestForm::keepsExistingObjectName()
{
    QDialog named;
    named.setObjectName(QStringLiteral("Custom"));
    Ui::Import form;
    form.setupUi(&named);
    QCOMPARE(named.objectName(), QStringLiteral("Custom"));
}

QTEST_MAIN(TestForm)
#include "tst_form.moc"
