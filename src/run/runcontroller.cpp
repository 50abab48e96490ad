#include "childprocess.h"
#include "import.h"
#include "logstyle.h"
#include "resultdisplay.h"
#include "runlogic.h"

#include <QDir>
#include <QFile>
#include <QFileInfo>
#include <QMessageBox>

namespace {
// The code outputImport passes on when the converter has printed "ERROR"; never an exit code.
const int converterReportedError = -1000;

QString failureLine()
{
    return LogStyle::error(QStringLiteral(" Something went wrong with Import procedure ! "));
}
} // namespace

void Import::updateRunButtons()
{
    // No new run may mix with a program of the last one that still runs, and Kill must reach it.
    const bool busy = programRuns();
    importButton->setEnabled(!busy);
    killbutton->setEnabled(busy);
}

void Import::startChild(QProcess *process, const QString &program, const QStringList &arguments)
{
    process->setWorkingDirectory(QFileInfo(stagedInputPath).path());
    process->setProgram(resolvedProgramPath(program, QDir::currentPath()));
    process->setArguments(arguments);
    runInOwnProcessGroup(process);
    process->start();
    // The child's start, or its failure, is reported here and not later from the event loop, so
    // that the slots reporting it run before the caller's next log line.
    process->waitForStarted();
}

bool Import::programRuns() const
{
    return importProcess->state() != QProcess::NotRunning
           || morvelProcess->state() != QProcess::NotRunning;
}

void Import::makeImport()
{
    // Run is disabled while a program runs; this also holds for a click that reaches the slot
    // some other way.
    if (programRuns()) {
        updateRunButtons();
        return;
    }
    if (inputFile.isEmpty()) {
        importlog->append(LogStyle::error(QStringLiteral(" Please set Input file before starting ! ")));
        updateRunButtons();
        return;
    }

    cancelResultDisplay(importlog);
    importlog->clear();
    importError = false;
    converterOutputTail.clear();

    writeParameterFile();

    const int format = InputBox->currentIndex();
    if (format == 0) {
        if (!hasCifSuffix(inputFile)) {
            QMessageBox box;
            box.setWindowTitle(QStringLiteral("WARNING!"));
            box.setText(QStringLiteral("The selected file does not have the \".cif\" suffix !"));
            box.setInformativeText(QStringLiteral("Continue anyway?"));
            box.setIcon(QMessageBox::Warning);
            box.setStandardButtons(QMessageBox::Yes | QMessageBox::Cancel);
            box.setDefaultButton(QMessageBox::Yes);
            if (box.exec() == QMessageBox::Cancel)
                return;
        }

        importButton->setEnabled(false);
        killbutton->setEnabled(true);
        importlog->append(QStringLiteral("<br><b> Running CIF parser tool ...</b><br>"));

        // Its standard error is not read; discarding it keeps it from piling up in memory.
        importProcess->setStandardErrorFile(QProcess::nullDevice());
        // The converter gets its two paths as separate arguments, so spaces and quotes in them
        // reach it intact; the log still shows the command as one quoted line.
        startChild(importProcess, parserProgram, {inputFile, stagedInputPath});
        importlog->append(converterCommand(parserProgram, inputFile, stagedInputPath));
        updateRunButtons();
        return;
    }

    if (format == 1 || format == 2) {
        // On a file system that tells case apart, Morvel.In beside morvel.in is another file and
        // has to be copied all the same.
        const bool isStagedFile = isStagedInputName(inputFile)
                                  && QFileInfo(inputFile) == QFileInfo(stagedInputPath);
        if (isStagedFile) {
            importlog->append(QStringLiteral("<br><b> Input as \"morvel.in\" file </b>"));
        } else {
            importlog->append(QStringLiteral("<br><b>  Copying input file as \"morvel.in\" file </b>"));
            copyInputFile(inputFile);
        }
        endImport(0);
    }
}

void Import::checkStart()
{
    importlog->append(QStringLiteral("-->  Starting CIF parser ..."));
}

void Import::outputImport()
{
    // A flood of output arrives in many deliveries; the word may be cut between two of them.
    if (outputReportsError(importProcess->readAllStandardOutput(), converterOutputTail)) {
        importError = true;
        endImport(converterReportedError);
    }
}

void Import::processError(QProcess::ProcessError error)
{
    importlog->append(QStringLiteral(" error occured : ") + QString::number(int(error)));
    if (!importError)
        importlog->append(failureLine());
    updateRunButtons();
}

void Import::endImport(int exitCode)
{
    if (exitCode == converterReportedError) {
        importlog->append(QStringLiteral(
            "<br><b><font color=#FF3300> Something went wrong with Import procedure ! </font></b>"));
        importlog->append(
            QStringLiteral("<b><font color=#FF3300> Please check cifparser.log file.</font></b><br>"));
        updateRunButtons();
        return;
    }
    if (importError) {
        updateRunButtons();
        return;
    }
    if (exitCode != 0) {
        importlog->append(failureLine());
        updateRunButtons();
        return;
    }

    importlog->append(QStringLiteral("<br><b> DONE !!!  </b><br>"));

    const QString resultPath = workingDir + QStringLiteral("/MORVEL.OUT");
    if (QFile::exists(resultPath)) {
        importlog->append(
            QStringLiteral("<br><b>A \"MORVEL.OUT\" file already exists in the working directory !</b>"));
        // QFile::rename never replaces an existing file, so the first free number is taken.
        const QString keptName = takeKeptResultName(
            [&](const QString &name) { return QFile::rename(resultPath, workingDir + name); });
        if (keptName.isEmpty()) {
            // Starting now would overwrite the earlier result that could not be kept.
            importlog->append(LogStyle::error(QStringLiteral(
                " The earlier \"MORVEL.OUT\" could not be renamed as \"MORVEL.OUT.old1\" to "
                "\"MORVEL.OUT.old100\": MORVEL has not been started ! ")));
            updateRunButtons();
            return;
        }
        importlog->append(QStringLiteral("<b>It has been renamed as :</b>  ") + keptName);
    }

    // Nothing reads the computation program's output; discarding it keeps it from piling up.
    morvelProcess->setStandardOutputFile(QProcess::nullDevice());
    morvelProcess->setStandardErrorFile(QProcess::nullDevice());
    // The whole value is the program's path, spaces included; the program takes no arguments.
    startChild(morvelProcess, morvelProgram, {});
    if (morvelProcess->state() == QProcess::NotRunning) {
        endMorvel(1);
        return;
    }
    updateRunButtons();
}

void Import::killImport()
{
    importlog->append(QStringLiteral("<b>Killing Import program process</b>"));
    killProgram(importProcess);
    importlog->append(QStringLiteral("<b>Killing Morvel program process</b>"));
    killProgram(morvelProcess);
    // A killed program reports its end through the event loop; the idle state waits for that.
    updateRunButtons();
}
