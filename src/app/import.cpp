#include "import.h"
#include "childprocess.h"
#include "filedrop.h"
#include "logwindow.h"

#include <QButtonGroup>
#include <QDoubleValidator>

Import::Import(QWidget *parent)
    : QDialog(parent)
{
    setupUi(this);

    importProcess = new QProcess(this);
    morvelProcess = new QProcess(this);

    // morvel.par is read in the C locale: the fields take numbers in it too, whatever the
    // desktop's locale, so that what a field shows is what the file gets.
    QLocale numbers = QLocale::c();
    numbers.setNumberOptions(QLocale::OmitGroupSeparator | QLocale::RejectGroupSeparator);
    for (QLineEdit *edit : {dmaxline, toleranceline, hbondline}) {
        auto *validator = new QDoubleValidator(0.0, 999.0, 3, edit);
        validator->setLocale(numbers);
        edit->setValidator(validator);
    }

    printGroup = new QButtonGroup(this);
    printGroup->addButton(radioprint1, 0);
    printGroup->addButton(radioprint2, 1);

    guardLogResources(importlog);
    new FileDrop(this);

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
    // Qt reports the end of a child with its exit status. A killed or crashed child is failed
    // whatever its exit code, 0 included.
    auto judged = [](int code, QProcess::ExitStatus status) {
        return status == QProcess::CrashExit && code == 0 ? 1 : code;
    };
    connect(browseinput, &QPushButton::clicked, this, &Import::getInputFile);
    connect(cancelButton, &QPushButton::clicked, this, &Import::closeDialog);
    connect(importButton, &QPushButton::clicked, this, &Import::makeImport);
    connect(importProcess, &QProcess::finished, this,
            [this, judged](int code, QProcess::ExitStatus status) { endImport(judged(code, status)); });
    connect(morvelProcess, &QProcess::finished, this,
            [this, judged](int code, QProcess::ExitStatus status) { endMorvel(judged(code, status)); });
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

bool Import::programRuns() const
{
    return importProcess->state() != QProcess::NotRunning || morvelProcess->state() != QProcess::NotRunning;
}

void Import::updateButtons()
{
    const bool busy = programRuns();
    importButton->setEnabled(!busy);
    browseinput->setEnabled(!busy);
    killbutton->setEnabled(busy);
}
