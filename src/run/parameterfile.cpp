#include "import.h"
#include "logstyle.h"
#include "runlogic.h"

#include <QButtonGroup>
#include <QFile>

void Import::writeParameterFile()
{
    importlog->append(QStringLiteral("<br><b> Writing morvel.par file: </b><br>"));

    const QString path = workingDir + QStringLiteral("/morvel.par");
    if (QFile::exists(path))
        QFile::remove(path);
    QFile par(path);
    // Truncate: where the old file could not be removed (a folder that takes no new files), its
    // longer text must not outlast the new one.
    if (!par.open(QIODevice::ReadWrite | QIODevice::Truncate)) {
        importlog->append(LogStyle::error(
            QStringLiteral(" Something went wrong while opening a new \"morvel.par\" file! ")));
        return;
    }

    dmax = dmaxline->text().toFloat();
    tolerance = toleranceline->text().toFloat();
    hbondThreshold = hbondline->text().toFloat();
    maxVAtoms = maxAtoms->value();
    inputFormat = InputBox->currentIndex();
    outputLevel = outputLevelForIndex(OutputBox->currentIndex());
    polyhedraDetails = checkBoxVerbose->isChecked() ? 1 : 0;
    printType = printGroup->checkedId();

    JobOptions options;
    options.dmax = dmax;
    options.tolerance = tolerance;
    options.hbondThreshold = hbondThreshold;
    options.maxVAtoms = maxVAtoms;
    options.inputFormat = inputFormat;
    options.outputLevel = outputLevel;
    options.polyhedraDetails = polyhedraDetails;
    options.printType = printType;

    par.write(parameterLine(options).toLatin1() + '\n');
    par.flush();

    // The part file goes into the parameter file as it lies on disk, whatever its encoding.
    QFile partText(QStringLiteral("./morvelpartxt.txt"));
    if (!partText.open(QIODevice::ReadOnly)) {
        importlog->append(LogStyle::error(
            QStringLiteral(" Something went wrong while opening \"morvelpartxt.txt\" file! ")));
    } else {
        const QByteArray text = partText.readAll();
        importlog->append(QString::fromLocal8Bit(text));
        par.write(' ' + text + '\n');
        partText.close();
    }
    par.close();

    for (const QString &line : jobOptionsEcho(options))
        importlog->append(line);
}
