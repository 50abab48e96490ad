#include "childprocess.h"
#include "import.h"
#include "processexit.h"

#include <QButtonGroup>
#include <QDoubleValidator>

Import::Import(QWidget *parent)
    : QDialog(parent)
{
    setupUi(this);

    importProcess = new QProcess(this);
    morvelProcess = new QProcess(this);

    for (QLineEdit *edit : {dmaxline, toleranceline, hbondline}) {
        auto *validator = new QDoubleValidator(0.0, 999.0, 3, edit);
        edit->setValidator(validator);
    }

    printGroup = new QButtonGroup(this);
    printGroup->addButton(radioprint1, 0);
    printGroup->addButton(radioprint2, 1);

    resetForm();
    connectSignals();
    readToolConfiguration();
}

Import::~Import()
{
    // A child still running is killed when its process object goes; its last signals must not
    // reach a dialog that is half destroyed.
    importProcess->disconnect(this);
    morvelProcess->disconnect(this);
    killProgram(importProcess);
    killProgram(morvelProcess);
    importProcess->waitForFinished();
    morvelProcess->waitForFinished();
    delete importProcess;
    delete printGroup;
}

void Import::resetForm()
{
    checkBoxVerbose->setChecked(false);
    radioprint1->setChecked(true);
    InputBox->setCurrentIndex(0);
    OutputBox->setCurrentIndex(0);
    inputpath->clear();
    killbutton->setEnabled(false);
    importButton->setEnabled(true);
    maxAtoms->setValue(11);
    importError = false;
}

void Import::connectSignals()
{
    connect(browseinput, &QPushButton::clicked, this, &Import::getInputFile);
    connect(cancelButton, &QPushButton::clicked, this, &Import::closeDialog);
    connect(importButton, &QPushButton::clicked, this, &Import::makeImport);
    // Qt 6 reports the end of a child with its exit status; a killed or crashed child is failed.
    connect(importProcess, &QProcess::finished, this, [this](int code, QProcess::ExitStatus status) {
        endImport(judgedExitCode(code, status == QProcess::CrashExit));
    });
    connect(morvelProcess, &QProcess::finished, this, [this](int code, QProcess::ExitStatus status) {
        endMorvel(judgedExitCode(code, status == QProcess::CrashExit));
    });
    connect(importProcess, &QProcess::started, this, &Import::checkStart);
    connect(morvelProcess, &QProcess::started, this, &Import::checkStartMorvel);
    connect(importProcess, &QProcess::errorOccurred, this, &Import::processError);
    connect(importProcess, &QProcess::readyReadStandardOutput, this, &Import::outputImport);
    connect(killbutton, &QPushButton::clicked, this, &Import::killImport);
    connect(helpButton, &QPushButton::clicked, this, &Import::help);
    connect(openButton, &QPushButton::clicked, this, &Import::openMorvelOut);
}

void Import::closeDialog()
{
    inputpath->clear();
    importlog->clear();
    close();
}
