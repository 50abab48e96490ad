#ifndef UI_IMPORT_H
#define UI_IMPORT_H

#include <QtCore/QVariant>
#include <QtWidgets/QApplication>
#include <QtWidgets/QCheckBox>
#include <QtWidgets/QComboBox>
#include <QtWidgets/QDialog>
#include <QtWidgets/QGridLayout>
#include <QtWidgets/QGroupBox>
#include <QtWidgets/QHBoxLayout>
#include <QtWidgets/QLabel>
#include <QtWidgets/QLineEdit>
#include <QtWidgets/QPushButton>
#include <QtWidgets/QRadioButton>
#include <QtWidgets/QSpinBox>
#include <QtWidgets/QTextEdit>
#include <QtWidgets/QVBoxLayout>

QT_BEGIN_NAMESPACE

// The job form: every widget and layout of the dialog, built on the dialog by setupUi.
class Ui_Import
{
public:
    QGridLayout *gridLayout_4;
    QGroupBox *groupBox;
    QGridLayout *gridLayout_2;
    QHBoxLayout *horizontalLayout_6;
    QLabel *label_5;
    QComboBox *InputBox;
    QHBoxLayout *horizontalLayout_4;
    QLabel *label_2;
    QLineEdit *dmaxline;
    QLabel *labeltoto_3;
    QHBoxLayout *horizontalLayout_3;
    QLabel *labeltoto;
    QLineEdit *toleranceline;
    QLabel *labeltoto_5;
    QHBoxLayout *horizontalLayout;
    QLabel *label_8;
    QLineEdit *hbondline;
    QLabel *labeltoto_2;
    QGroupBox *groupBox_2;
    QGridLayout *gridLayout_3;
    QHBoxLayout *horizontalLayout_7;
    QLabel *label_6;
    QComboBox *OutputBox;
    QGridLayout *gridLayout;
    QRadioButton *radioprint1;
    QRadioButton *radioprint2;
    QCheckBox *checkBoxVerbose;
    QLabel *label_4;
    QSpinBox *maxAtoms;
    QVBoxLayout *verticalLayout;
    QLabel *label_3;
    QTextEdit *importlog;
    QHBoxLayout *horizontalLayout_2;
    QLabel *label;
    QLineEdit *inputpath;
    QPushButton *browseinput;
    QHBoxLayout *horizontalLayout_8;
    QPushButton *importButton;
    QPushButton *killbutton;
    QPushButton *helpButton;
    QPushButton *openButton;
    QPushButton *cancelButton;

    void setupUi(QDialog *Import)
    {
        if (Import->objectName().isEmpty())
            Import->setObjectName("Import");
        Import->resize(599, 597);
        gridLayout_4 = new QGridLayout(Import);
        gridLayout_4->setObjectName("gridLayout_4");
        groupBox = new QGroupBox(Import);
        groupBox->setObjectName("groupBox");
        QFont font;
        font.setBold(false);
        groupBox->setFont(font);
        gridLayout_2 = new QGridLayout(groupBox);
        gridLayout_2->setObjectName("gridLayout_2");
        horizontalLayout_6 = new QHBoxLayout();
        horizontalLayout_6->setObjectName("horizontalLayout_6");
        label_5 = new QLabel(groupBox);
        label_5->setObjectName("label_5");
        label_5->setMinimumSize(QSize(100, 0));
        label_5->setAlignment(Qt::AlignRight|Qt::AlignTrailing|Qt::AlignVCenter);

        horizontalLayout_6->addWidget(label_5);

        InputBox = new QComboBox(groupBox);
        InputBox->setObjectName("InputBox");
        InputBox->setMinimumSize(QSize(150, 0));

        horizontalLayout_6->addWidget(InputBox);


        gridLayout_2->addLayout(horizontalLayout_6, 0, 0, 1, 1);

        horizontalLayout_4 = new QHBoxLayout();
        horizontalLayout_4->setObjectName("horizontalLayout_4");
        label_2 = new QLabel(groupBox);
        label_2->setObjectName("label_2");
        label_2->setMinimumSize(QSize(170, 0));
        label_2->setAlignment(Qt::AlignRight|Qt::AlignTrailing|Qt::AlignVCenter);

        horizontalLayout_4->addWidget(label_2);

        dmaxline = new QLineEdit(groupBox);
        dmaxline->setObjectName("dmaxline");
        dmaxline->setMinimumSize(QSize(50, 25));
        dmaxline->setAlignment(Qt::AlignRight|Qt::AlignTrailing|Qt::AlignVCenter);

        horizontalLayout_4->addWidget(dmaxline);

        labeltoto_3 = new QLabel(groupBox);
        labeltoto_3->setObjectName("labeltoto_3");
        labeltoto_3->setMinimumSize(QSize(15, 0));
        labeltoto_3->setMaximumSize(QSize(15, 16777215));

        horizontalLayout_4->addWidget(labeltoto_3);


        gridLayout_2->addLayout(horizontalLayout_4, 1, 0, 1, 1);

        horizontalLayout_3 = new QHBoxLayout();
        horizontalLayout_3->setObjectName("horizontalLayout_3");
        labeltoto = new QLabel(groupBox);
        labeltoto->setObjectName("labeltoto");
        labeltoto->setMinimumSize(QSize(170, 0));
        labeltoto->setAlignment(Qt::AlignRight|Qt::AlignTrailing|Qt::AlignVCenter);

        horizontalLayout_3->addWidget(labeltoto);

        toleranceline = new QLineEdit(groupBox);
        toleranceline->setObjectName("toleranceline");
        toleranceline->setMinimumSize(QSize(50, 25));
        toleranceline->setAlignment(Qt::AlignRight|Qt::AlignTrailing|Qt::AlignVCenter);

        horizontalLayout_3->addWidget(toleranceline);

        labeltoto_5 = new QLabel(groupBox);
        labeltoto_5->setObjectName("labeltoto_5");
        labeltoto_5->setMinimumSize(QSize(15, 0));
        labeltoto_5->setMaximumSize(QSize(15, 16777215));

        horizontalLayout_3->addWidget(labeltoto_5);


        gridLayout_2->addLayout(horizontalLayout_3, 2, 0, 1, 1);

        horizontalLayout = new QHBoxLayout();
        horizontalLayout->setObjectName("horizontalLayout");
        label_8 = new QLabel(groupBox);
        label_8->setObjectName("label_8");
        label_8->setMinimumSize(QSize(170, 0));
        label_8->setAlignment(Qt::AlignRight|Qt::AlignTrailing|Qt::AlignVCenter);

        horizontalLayout->addWidget(label_8);

        hbondline = new QLineEdit(groupBox);
        hbondline->setObjectName("hbondline");
        hbondline->setMinimumSize(QSize(50, 25));
        hbondline->setAlignment(Qt::AlignRight|Qt::AlignTrailing|Qt::AlignVCenter);

        horizontalLayout->addWidget(hbondline);

        labeltoto_2 = new QLabel(groupBox);
        labeltoto_2->setObjectName("labeltoto_2");
        labeltoto_2->setMinimumSize(QSize(15, 0));
        labeltoto_2->setMaximumSize(QSize(15, 16777215));

        horizontalLayout->addWidget(labeltoto_2);


        gridLayout_2->addLayout(horizontalLayout, 3, 0, 1, 1);


        gridLayout_4->addWidget(groupBox, 1, 0, 1, 1);

        groupBox_2 = new QGroupBox(Import);
        groupBox_2->setObjectName("groupBox_2");
        gridLayout_3 = new QGridLayout(groupBox_2);
        gridLayout_3->setObjectName("gridLayout_3");
        horizontalLayout_7 = new QHBoxLayout();
        horizontalLayout_7->setObjectName("horizontalLayout_7");
        label_6 = new QLabel(groupBox_2);
        label_6->setObjectName("label_6");
        label_6->setMinimumSize(QSize(100, 0));
        label_6->setAlignment(Qt::AlignRight|Qt::AlignTrailing|Qt::AlignVCenter);

        horizontalLayout_7->addWidget(label_6);

        OutputBox = new QComboBox(groupBox_2);
        OutputBox->setObjectName("OutputBox");
        OutputBox->setMinimumSize(QSize(150, 0));

        horizontalLayout_7->addWidget(OutputBox);


        gridLayout_3->addLayout(horizontalLayout_7, 0, 0, 1, 1);

        gridLayout = new QGridLayout();
        gridLayout->setObjectName("gridLayout");
        radioprint1 = new QRadioButton(groupBox_2);
        radioprint1->setObjectName("radioprint1");
        radioprint1->setLayoutDirection(Qt::RightToLeft);
        radioprint1->setChecked(true);

        gridLayout->addWidget(radioprint1, 0, 0, 1, 2);

        radioprint2 = new QRadioButton(groupBox_2);
        radioprint2->setObjectName("radioprint2");
        radioprint2->setLayoutDirection(Qt::RightToLeft);

        gridLayout->addWidget(radioprint2, 1, 0, 1, 2);

        checkBoxVerbose = new QCheckBox(groupBox_2);
        checkBoxVerbose->setObjectName("checkBoxVerbose");
        checkBoxVerbose->setLayoutDirection(Qt::RightToLeft);
        checkBoxVerbose->setChecked(false);

        gridLayout->addWidget(checkBoxVerbose, 2, 0, 1, 2);

        label_4 = new QLabel(groupBox_2);
        label_4->setObjectName("label_4");
        label_4->setLayoutDirection(Qt::LeftToRight);
        label_4->setAlignment(Qt::AlignRight|Qt::AlignTrailing|Qt::AlignVCenter);

        gridLayout->addWidget(label_4, 3, 0, 2, 1);

        maxAtoms = new QSpinBox(groupBox_2);
        maxAtoms->setObjectName("maxAtoms");
        maxAtoms->setMaximumSize(QSize(75, 16777215));
        maxAtoms->setAlignment(Qt::AlignRight|Qt::AlignTrailing|Qt::AlignVCenter);
        maxAtoms->setMinimum(1);
        maxAtoms->setMaximum(20);
        maxAtoms->setValue(11);

        gridLayout->addWidget(maxAtoms, 3, 1, 2, 1);


        gridLayout_3->addLayout(gridLayout, 1, 0, 1, 1);


        gridLayout_4->addWidget(groupBox_2, 1, 1, 1, 1);

        verticalLayout = new QVBoxLayout();
        verticalLayout->setObjectName("verticalLayout");
        label_3 = new QLabel(Import);
        label_3->setObjectName("label_3");
        label_3->setMinimumSize(QSize(0, 20));
        label_3->setMaximumSize(QSize(16777215, 20));
        QFont font1;
        font1.setPointSize(9);
        font1.setBold(true);
        label_3->setFont(font1);
        label_3->setAlignment(Qt::AlignCenter);

        verticalLayout->addWidget(label_3);

        importlog = new QTextEdit(Import);
        importlog->setObjectName("importlog");
        importlog->setMinimumSize(QSize(570, 150));

        verticalLayout->addWidget(importlog);


        gridLayout_4->addLayout(verticalLayout, 2, 0, 1, 2);

        horizontalLayout_2 = new QHBoxLayout();
        horizontalLayout_2->setObjectName("horizontalLayout_2");
        label = new QLabel(Import);
        label->setObjectName("label");
        QFont font2;
        font2.setBold(true);
        label->setFont(font2);

        horizontalLayout_2->addWidget(label);

        inputpath = new QLineEdit(Import);
        inputpath->setObjectName("inputpath");
        inputpath->setReadOnly(true);

        horizontalLayout_2->addWidget(inputpath);

        browseinput = new QPushButton(Import);
        browseinput->setObjectName("browseinput");
        browseinput->setMinimumSize(QSize(71, 28));
        browseinput->setMaximumSize(QSize(71, 28));

        horizontalLayout_2->addWidget(browseinput);


        gridLayout_4->addLayout(horizontalLayout_2, 0, 0, 1, 2);

        horizontalLayout_8 = new QHBoxLayout();
        horizontalLayout_8->setObjectName("horizontalLayout_8");
        importButton = new QPushButton(Import);
        importButton->setObjectName("importButton");
        importButton->setFont(font1);

        horizontalLayout_8->addWidget(importButton);

        killbutton = new QPushButton(Import);
        killbutton->setObjectName("killbutton");
        killbutton->setFont(font2);

        horizontalLayout_8->addWidget(killbutton);

        helpButton = new QPushButton(Import);
        helpButton->setObjectName("helpButton");

        horizontalLayout_8->addWidget(helpButton);

        openButton = new QPushButton(Import);
        openButton->setObjectName("openButton");

        horizontalLayout_8->addWidget(openButton);

        cancelButton = new QPushButton(Import);
        cancelButton->setObjectName("cancelButton");

        horizontalLayout_8->addWidget(cancelButton);


        gridLayout_4->addLayout(horizontalLayout_8, 3, 0, 1, 2);


        retranslateUi(Import);

        QMetaObject::connectSlotsByName(Import);
    } // setupUi

    void retranslateUi(QDialog *Import)
    {
        Import->setWindowTitle(QCoreApplication::translate("Import", "MorvelGUI", nullptr));
        groupBox->setTitle(QCoreApplication::translate("Import", "Job options", nullptr));
        label_5->setText(QCoreApplication::translate("Import", "Input Format", nullptr));
        InputBox->clear();
        InputBox->insertItems(0, QStringList()
         << QCoreApplication::translate("Import", "CIF File", nullptr)
         << QCoreApplication::translate("Import", "Hand-made", nullptr)
         << QCoreApplication::translate("Import", "old ICSD", nullptr)
        );

#if QT_CONFIG(tooltip)
        InputBox->setToolTip(QCoreApplication::translate("Import", "Choose here the type of input file. Be carefull choosing a CIF file below if the \"CIF file\" option is selected. ", nullptr));
#endif // QT_CONFIG(tooltip)
        label_2->setText(QCoreApplication::translate("Import", "DMax :", nullptr));
#if QT_CONFIG(tooltip)
        dmaxline->setToolTip(QCoreApplication::translate("Import", "Radius (in A) of the sphere inside which the bond distances are computed", nullptr));
#endif // QT_CONFIG(tooltip)
        dmaxline->setText(QCoreApplication::translate("Import", "4.0", nullptr));
        labeltoto_3->setText(QCoreApplication::translate("Import", "A", nullptr));
        labeltoto->setText(QCoreApplication::translate("Import", "Tolerance :", nullptr));
#if QT_CONFIG(tooltip)
        toleranceline->setToolTip(QCoreApplication::translate("Import", "<!DOCTYPE HTML PUBLIC \"-//W3C//DTD HTML 4.0//EN\" \"http://www.w3.org/TR/REC-html40/strict.dtd\">\n"
"<html><head><meta name=\"qrichtext\" content=\"1\" /><style type=\"text/css\">\n"
"p, li { white-space: pre-wrap; }\n"
"</style></head><body style=\" font-family:'MS Shell Dlg 2'; font-size:8.25pt; font-weight:400; font-style:normal;\">\n"
"<p style=\" margin-top:0px; margin-bottom:0px; margin-left:0px; margin-right:0px; -qt-block-indent:0; text-indent:0px;\"><span style=\" font-size:8pt;\">Tolerance (%) on atomic size for sites with isomorphic substitution</span></p></body></html>", nullptr));
#endif // QT_CONFIG(tooltip)
        toleranceline->setText(QCoreApplication::translate("Import", "10.0", nullptr));
        labeltoto_5->setText(QCoreApplication::translate("Import", "%", nullptr));
        label_8->setText(QCoreApplication::translate("Import", "Threshold on hydrogen-bonds :", nullptr));
#if QT_CONFIG(tooltip)
        hbondline->setToolTip(QCoreApplication::translate("Import", "Threshold (in A) on the hydrogen bond length.", nullptr));
#endif // QT_CONFIG(tooltip)
        hbondline->setText(QCoreApplication::translate("Import", "3.1", nullptr));
        labeltoto_2->setText(QCoreApplication::translate("Import", "A", nullptr));
        groupBox_2->setTitle(QCoreApplication::translate("Import", "Output options", nullptr));
        label_6->setText(QCoreApplication::translate("Import", "Output Level", nullptr));
        OutputBox->clear();
        OutputBox->insertItems(0, QStringList()
         << QCoreApplication::translate("Import", "Normal output", nullptr)
         << QCoreApplication::translate("Import", "Verbose output", nullptr)
         << QCoreApplication::translate("Import", "Ionic radii tables", nullptr)
        );

#if QT_CONFIG(tooltip)
        OutputBox->setToolTip(QCoreApplication::translate("Import", "Choose the level of output information", nullptr));
#endif // QT_CONFIG(tooltip)
#if QT_CONFIG(tooltip)
        radioprint1->setToolTip(QCoreApplication::translate("Import", "Check this option to print all the distances within DMax", nullptr));
#endif // QT_CONFIG(tooltip)
        radioprint1->setText(QCoreApplication::translate("Import", "Print all distances within DMax", nullptr));
#if QT_CONFIG(tooltip)
        radioprint2->setToolTip(QCoreApplication::translate("Import", "<!DOCTYPE HTML PUBLIC \"-//W3C//DTD HTML 4.0//EN\" \"http://www.w3.org/TR/REC-html40/strict.dtd\">\n"
"<html><head><meta name=\"qrichtext\" content=\"1\" /><style type=\"text/css\">\n"
"p, li { white-space: pre-wrap; }\n"
"</style></head><body style=\" font-family:'MS Shell Dlg 2'; font-size:8.25pt; font-weight:400; font-style:normal;\">\n"
"<p style=\" margin-top:0px; margin-bottom:0px; margin-left:0px; margin-right:0px; -qt-block-indent:0; text-indent:0px;\"><span style=\" font-size:8pt;\">Check this option to print only the distances corresponding to non-zero bond weight.</span></p></body></html>", nullptr));
#endif // QT_CONFIG(tooltip)
        radioprint2->setText(QCoreApplication::translate("Import", "Print only distances with non-zero weight", nullptr));
#if QT_CONFIG(tooltip)
        checkBoxVerbose->setToolTip(QCoreApplication::translate("Import", "<!DOCTYPE HTML PUBLIC \"-//W3C//DTD HTML 4.0//EN\" \"http://www.w3.org/TR/REC-html40/strict.dtd\">\n"
"<html><head><meta name=\"qrichtext\" content=\"1\" /><style type=\"text/css\">\n"
"p, li { white-space: pre-wrap; }\n"
"</style></head><body style=\" font-family:'MS Shell Dlg 2'; font-size:8.25pt; font-weight:400; font-style:normal;\">\n"
"<p style=\" margin-top:0px; margin-bottom:0px; margin-left:0px; margin-right:0px; -qt-block-indent:0; text-indent:0px;\"><span style=\" font-size:8pt;\">Check this for more detailled information about the CIF file parsing in the log window below. </span></p>\n"
"<p style=\" margin-top:0px; margin-bottom:0px; margin-left:0px; margin-right:0px; -qt-block-indent:0; text-indent:0px;\"><span style=\" font-size:8pt;\">Note that the output of MORVEL program will in any case be printed out in the log window. </span></p></body></html>", nullptr));
#endif // QT_CONFIG(tooltip)
        checkBoxVerbose->setText(QCoreApplication::translate("Import", "Print details of the coordination polyhedra", nullptr));
        label_4->setText(QCoreApplication::translate("Import", "Max. V-atoms printed per line :", nullptr));
        label_3->setText(QCoreApplication::translate("Import", "MORVEL.OUT", nullptr));
        label->setText(QCoreApplication::translate("Import", "Input File", nullptr));
#if QT_CONFIG(tooltip)
        browseinput->setToolTip(QCoreApplication::translate("Import", "Browse to select the type of input file, according to the option choosen in the \"Input Format\" box above. ", nullptr));
#endif // QT_CONFIG(tooltip)
        browseinput->setText(QCoreApplication::translate("Import", "Browse", nullptr));
#if QT_CONFIG(tooltip)
        importButton->setToolTip(QCoreApplication::translate("Import", "Execute MORVEL from here. The MORVEL.exe binary file must be located at the same place than the MorvelGUI.exe program. ", nullptr));
#endif // QT_CONFIG(tooltip)
        importButton->setText(QCoreApplication::translate("Import", "Run MORVEL ", nullptr));
        killbutton->setText(QCoreApplication::translate("Import", "Kill MORVEL Process", nullptr));
        helpButton->setText(QCoreApplication::translate("Import", "About", nullptr));
        openButton->setText(QCoreApplication::translate("Import", "Open in editor", nullptr));
        cancelButton->setText(QCoreApplication::translate("Import", "Close", nullptr));
    } // retranslateUi

};

namespace Ui {
    class Import: public Ui_Import {};
} // namespace Ui

QT_END_NAMESPACE

#endif // UI_IMPORT_H
