#include "childprocess.h"
#include "import.h"
#include "inputpaths.h"
#include "logstyle.h"
#include "runlogic.h"

#include <QDir>
#include <QFile>
#include <QFileInfo>
#include <QMessageBox>

namespace {
// What a caller of endImport passes to say that the converter printed "ERROR"; never an exit code.
const int converterReportedError = -1000;

QString failureLine()
{
    return LogStyle::error(QStringLiteral(" Something went wrong with Import procedure ! "));
}
} // namespace

void Import::startChild(QProcess *process, const QString &program, const QStringList &arguments)
{
    process->setWorkingDirectory(QFileInfo(stagedInputPath).path());
    process->setProgram(resolvedProgramPath(program, QDir::currentPath()));
    process->setArguments(arguments);
    // Nothing reads the program's other output; discarding it keeps it from piling up.
    process->setStandardErrorFile(QProcess::nullDevice());
    runInOwnProcessGroup(process);
    process->start();
    // The child's start, or its failure, is reported here and not later from the event loop, so
    // that the slots reporting it run before the caller's next log line.
    process->waitForStarted();
}

void Import::makeImport()
{
    // Run is off while a program runs; this also holds for a click that reaches the slot some
    // other way.
    if (programRuns()) {
        updateButtons();
        return;
    }
    if (inputFile.isEmpty()) {
        importlog->append(LogStyle::error(QStringLiteral(" Please set Input file before starting ! ")));
        updateButtons();
        return;
    }

    importlog->clear();
    importError = false;
    converterOutputTail.clear();

    // A run never goes on without the job files it needs: no "DONE", no program on stale files.
    if (!writeParameterFile()) {
        updateButtons();
        return;
    }

    const int format = InputBox->currentIndex();
    if (format == 0) {
        if (!hasCifSuffix(inputFile, CifSuffix::SuffixIs)) {
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

        importlog->append(QStringLiteral("<br><b> Running CIF parser tool ...</b><br>"));
        // The converter gets its two paths as separate arguments, so spaces and quotes in them
        // reach it intact; the log still shows the command as one quoted line.
        startChild(importProcess, parserProgram, {inputFile, stagedInputPath});
        importlog->append(converterCommand(parserProgram, inputFile, stagedInputPath));
        updateButtons();
        return;
    }

    if (format == 1 || format == 2) {
        // On a file system that tells case apart, Morvel.In beside morvel.in is another file and
        // has to be copied all the same.
        if (isStagedInputName(inputFile) && QFileInfo(inputFile) == QFileInfo(stagedInputPath)) {
            importlog->append(QStringLiteral("<br><b> Input as \"morvel.in\" file </b>"));
        } else {
            importlog->append(QStringLiteral("<br><b>  Copying input file as \"morvel.in\" file </b>"));
            if (!copyInputFile(inputFile)) {
                updateButtons();
                return;
            }
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
        reportConverterError();
    }
}

void Import::reportConverterError()
{
    importlog->append(LogStyle::error(QStringLiteral(" Something went wrong with Import procedure ! "),
                                      LogStyle::BreakBefore));
    importlog->append(LogStyle::error(QStringLiteral(" Please check cifparser.log file."), LogStyle::BreakAfter));
    // The converter runs on to its own end, which changes nothing more.
    updateButtons();
}

void Import::processError(QProcess::ProcessError error)
{
    importlog->append(QStringLiteral(" error occured : ") + QString::number(int(error)));
    if (!importError)
        importlog->append(failureLine());
    updateButtons();
}

void Import::endImport(int exitCode)
{
    if (exitCode == converterReportedError) {
        reportConverterError();
        return;
    }
    if (importError) {
        updateButtons();
        return;
    }
    if (exitCode != 0) {
        importlog->append(failureLine());
        updateButtons();
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
            updateButtons();
            return;
        }
        importlog->append(QStringLiteral("<b>It has been renamed as :</b>  ") + keptName);
    }

    morvelProcess->setStandardOutputFile(QProcess::nullDevice());
    // The whole value is the program's path, spaces included; the program takes no arguments.
    startChild(morvelProcess, morvelProgram, {});
    if (morvelProcess->state() == QProcess::NotRunning) {
        endMorvel(1);
        return;
    }
    updateButtons();
}

void Import::killImport()
{
    importlog->append(QStringLiteral("<b>Killing Import program process</b>"));
    killProgram(importProcess);
    importlog->append(QStringLiteral("<b>Killing Morvel program process</b>"));
    killProgram(morvelProcess);
    // A killed program reports its end through the event loop; the idle state waits for that.
    updateButtons();
}
