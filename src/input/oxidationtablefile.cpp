#include "import.h"
#include "logwindow.h"
#include "oxidationtable.h"

#include <QFile>

void Import::readOxidationTable()
{
    QFile file(workingDir + QLatin1String("/oxidation.dat"));
    // Read-write like every file of the program: a missing table is created empty.
    if (!file.open(QIODevice::ReadWrite)) {
        importlog->append(LogStyle::error(QStringLiteral(" Cannot open \"oxidation.dat\" file in read-write mode! ")));
        return;
    }
    importlog->append(QStringLiteral("<br><b>Found file \"oxidation.dat\" in working directory : </b>"));
    // Latin-1 keeps every byte, so names match the CIF labels byte for byte.
    OxidationTableRead read = parseOxidationTable(QString::fromLatin1(file.readAll()));
    oxidationTable = std::move(read.entries);
    appendLogGroups(importlog, read.log);
}
