#ifndef MORVEL_IMPORT_H
#define MORVEL_IMPORT_H

#include <QDialog>
#include <QList>
#include <QProcess>
#include <QString>

#include "oxidationentry.h"
#include "ui_import.h"

class QButtonGroup;
class QFile;

// The one dialog of the program: the job form, the two child processes and the shared job state.
class Import : public QDialog, public Ui::Import
{
    Q_OBJECT

public:
    explicit Import(QWidget *parent = nullptr);
    ~Import() override;

    // Takes fileName as the input file, exactly as if Browse had returned it: for a file given on
    // the command line or dropped on the dialog. Nothing happens while a program runs.
    void takeInputFile(const QString &fileName);

public slots:
    void getInputFile();
    void makeImport();
    void endImport(int exitCode);
    void endMorvel(int exitCode);
    void outputImport();
    void closeDialog();
    void killImport();
    void checkStart();
    void checkStartMorvel();
    void processError(QProcess::ProcessError error);
    void help();
    void openMorvelOut();

private:
    void resetForm();
    void connectSignals();
    void readToolConfiguration();
    void checkOxidationNumbers(QFile &input);
    void readOxidationTable();
    void addOxidationNumbers();
    bool writeParameterFile();
    bool copyInputFile(const QString &inputPath);

    // The job's state decides the buttons, in one place: while a program runs, Run and Browse
    // are off (the run keeps its folder and files until it ends) and Kill is on.
    bool programRuns() const;
    void updateButtons();
    void startChild(QProcess *process, const QString &program, const QStringList &arguments);
    void reportConverterError();

    QButtonGroup *printGroup = nullptr;
    QString parserProgram;
    QString morvelProgram;
    QString workingDir;
    QString inputFile;
    QString stagedInputPath;
    QString inputBaseName;
    QString versionText;
    QProcess *importProcess = nullptr;
    QProcess *morvelProcess = nullptr;
    bool importError = false;
    QByteArray converterOutputTail; // the end of the converter's last output, see outputImport
    QList<OxidationEntry> oxidationTable;
};

#endif
