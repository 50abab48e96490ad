#include "import.h"
#include "inputpaths.h"
#include "logstyle.h"

#include <QFile>
#include <QFileDialog>
#include <QMessageBox>

namespace {
const int cifFormat = 0;

int showWarning(const QString &text, const QString &informativeText, QMessageBox::StandardButtons buttons)
{
    QMessageBox box;
    box.setIcon(QMessageBox::Warning);
    box.setWindowTitle(QStringLiteral("WARNING!"));
    box.setText(text);
    box.setInformativeText(informativeText);
    box.setStandardButtons(buttons);
    box.setDefaultButton(QMessageBox::Ok);
    return box.exec();
}

QString oxidationInstructions()
{
    return QStringLiteral("Please edit manually a \"oxidation.dat\" file, in the current working directory, ")
        + QStringLiteral("so that the imporation procedure can modify accordingly the CIF file.")
        + QStringLiteral("\n\n\"oxidation.dat\" file must contain, for each atom, one line : ")
        + QStringLiteral("\n_atom_site_label   _atom_site_type_symbol   _atom_type_oxidation_number ")
        + QStringLiteral("\n\nOnce the \"oxidation.dat\" file is correct, hit OK, otherwise Cancel to keep the CIF file unmodified.");
}
} // namespace

void Import::getInputFile()
{
    // Browse is off while a program runs; this also holds for a call that comes another way.
    if (programRuns())
        return;
    const bool cifChosen = InputBox->currentIndex() == cifFormat;
    const QString caption = cifChosen ? tr("Select an input CIF file") : tr("Select an input file");
    const QString filter = cifChosen ? tr("CIF files (*.cif);;All files (*)") : tr("All files (*)");

    const QString chosen = QFileDialog::getOpenFileName(this, caption, workingDir, filter);
    if (!chosen.isEmpty())
        takeInputFile(chosen);
}

void Import::takeInputFile(const QString &fileName)
{
    // A run keeps the folder and files it started with until its programs have ended.
    if (programRuns())
        return;
    inputFile = fileName;
    inputpath->setText(inputFile);
    const InputPaths paths = inputPathsFor(inputFile);
    workingDir = paths.workingDir;
    inputBaseName = paths.baseName;
    stagedInputPath = paths.stagedInputPath;

    const QString formatQuestion = QStringLiteral("Please check the file format !!");
    const int format = InputBox->currentIndex();
    const bool mentionsCif = hasCifSuffix(inputFile, CifSuffix::CompleteSuffixContains);
    if (format == cifFormat && !mentionsCif) {
        showWarning(formatQuestion,
                    QStringLiteral(" You have choosen \"CIF\" as input format but the selected file doesnt appear to be a CIF file !"),
                    QMessageBox::Ok);
    } else if (format > cifFormat && mentionsCif) {
        showWarning(formatQuestion,
                    QStringLiteral(" You have choosen \"Hand made\" or \"old ICSD\" as input format but the selected file seems to be a CIF file instead!"),
                    QMessageBox::Ok);
    }

    QFile file(inputFile);
    if (!file.open(QIODevice::ReadWrite)) {
        importlog->append(LogStyle::error(QStringLiteral(" Cannot open input file in read-write mode! ")));
        return;
    }
    if (format == cifFormat && hasCifSuffix(inputFile, CifSuffix::CompleteSuffixIs))
        checkOxidationNumbers(file);
}

void Import::checkOxidationNumbers(QFile &input)
{
    const QString ready = QStringLiteral("<b> Ready to import the CIF file then to run MORVEL (Run MORVEL button below) ! </b><br>");
    importlog->clear();
    if (QString::fromLatin1(input.readAll()).contains(QLatin1String("_atom_type_oxidation_number"))) {
        importlog->append(ready);
        return;
    }

    importlog->append(LogStyle::error(QStringLiteral(" WARNING : "), LogStyle::BreakBefore)
                      + QStringLiteral(" Imput CIF file does not contain \"_atom_type_oxidation_number \""));
    const int answer = showWarning(
        QStringLiteral("It seems that the selected CIF file does not contain the \"_atom_type_oxidation_number\" flag !"),
        oxidationInstructions(), QMessageBox::Ok | QMessageBox::Cancel);
    input.close();
    if (answer == QMessageBox::Cancel) {
        importlog->append(QStringLiteral("<b> Keeping unmodified CIF file </b>"));
    } else if (answer == QMessageBox::Ok) {
        importlog->append(QStringLiteral("<b> Using modified CIF file, charges informations taken from \"oxidation.dat\" file </b>"));
        addOxidationNumbers();
    } else {
        importlog->append(ready);
    }
}
