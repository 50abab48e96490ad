#include "filereplace.h"
#include "import.h"
#include "logstyle.h"
#include "runlogic.h"

#include <QButtonGroup>
#include <QFile>

bool Import::writeParameterFile()
{
    importlog->append(QStringLiteral("<br><b> Writing morvel.par file: </b><br>"));

    JobOptions options;
    // The fields take numbers in the C locale (see the constructor), and QString reads them so.
    options.dmax = dmaxline->text().toFloat();
    options.tolerance = toleranceline->text().toFloat();
    options.hbondThreshold = hbondline->text().toFloat();
    options.maxVAtoms = maxAtoms->value();
    options.inputFormat = InputBox->currentIndex();
    options.outputLevel = outputLevelForIndex(OutputBox->currentIndex());
    options.polyhedraDetails = checkBoxVerbose->isChecked() ? 1 : 0;
    options.printType = printGroup->checkedId();

    QByteArray content = parameterLine(options).toLatin1() + '\n';
    // The part file goes into the parameter file as it lies on disk, whatever its encoding.
    QFile partText(QStringLiteral("./morvelpartxt.txt"));
    const bool partRead = partText.open(QIODevice::ReadOnly);
    const QByteArray part = partRead ? partText.readAll() : QByteArray();
    if (partRead)
        content += ' ' + part + '\n';

    const QString path = workingDir + QStringLiteral("/morvel.par");
    const WriteResult written = writeNewFile(path, content);
    if (written == WriteResult::CannotOpen) {
        importlog->append(LogStyle::error(QStringLiteral(" Something went wrong while opening a new \"morvel.par\" file! ")));
        return false;
    }
    if (partRead)
        importlog->append(QString::fromLocal8Bit(part));
    else
        importlog->append(LogStyle::error(QStringLiteral(" Something went wrong while opening \"morvelpartxt.txt\" file! ")));
    if (written == WriteResult::CannotWrite) {
        importlog->append(LogStyle::error(QStringLiteral(" \"morvel.par\" could not be written in full! ")));
        return false;
    }

    for (const QString &line : jobOptionsEcho(options))
        importlog->append(line);
    return true;
}
