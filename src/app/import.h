#ifndef MORVEL_IMPORT_H
#define MORVEL_IMPORT_H

#include <QDialog>
#include <QList>
#include <QProcess>
#include <QString>

#include "oxidationentry.h"
#include "ui_import.h"

class QButtonGroup;

// The one dialog of the program: the job form, the two child processes and the shared job state.
// Data members and helper operations are public so that tests can inspect a job step by step.
class Import : public QDialog, public Ui::Import
{
    Q_OBJECT

public:
    explicit Import(QWidget *parent = nullptr);
    ~Import() override;

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

public:
    void resetForm();
    void connectSignals();
    void readToolConfiguration();
    void readOxidationTable();
    void addOxidationNumbers();
    OxidationEntry entryForName(const QString &key) const;
    float chargeForSymbol(const QString &symbol) const;
    void writeParameterFile();
    void copyInputFile(const QString &inputPath);

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
    float dmax = 0.0f;
    float tolerance = 0.0f;
    float hbondThreshold = 0.0f;
    int inputFormat = 0;
    int outputLevel = 0;
    int polyhedraDetails = 0;
    int maxVAtoms = 0;
    int printType = 0;
    bool importError = false;
    QByteArray converterOutputTail; // the end of the converter's last output, see outputImport
    QList<OxidationEntry> oxidationTable;

    // --- Job run: state tracking of the two child programs (src/run) ---
private:
    bool programRuns() const;
    void updateRunButtons();
    void startChild(QProcess *process, const QString &program, const QStringList &arguments);
};

#endif
