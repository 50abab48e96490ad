#include "import.h"
#include "logstyle.h"
#include "toolconfiguration.h"

#include <QFile>
#include <QTextStream>

namespace {
const char binariesFile[] = "./binaries.txt";
const char versionFile[] = "./version.txt";
const char defaultMorvel[] = "./morvel.exe";
const char defaultParser[] = "./cif_parser.exe";
} // namespace

void Import::readToolConfiguration()
{
    const QString binaries = QString::fromLatin1(binariesFile);
    bool binariesRead = false;
    if (QFile::exists(binaries)) {
        QFile file(binaries);
        if (file.open(QIODevice::ReadOnly)) {
            QTextStream in(&file);
            BinariesPaths paths{morvelProgram, parserProgram};
            applyBinariesLine(in.readLine(), paths);
            applyBinariesLine(in.readLine(), paths);
            morvelProgram = paths.morvel;
            parserProgram = paths.parser;
            binariesRead = true;
        }
    }
    if (!binariesRead) {
        importlog->append(QStringLiteral("The file ") + binaries
                          + QStringLiteral(" does not exist in the binaries directory!"));
        importlog->append(QStringLiteral("Default binaries names will be used"));
        parserProgram = QString::fromLatin1(defaultParser);
        morvelProgram = QString::fromLatin1(defaultMorvel);
    }

    if (QFile::exists(QString::fromLatin1(versionFile))) {
        QFile file(QString::fromLatin1(versionFile));
        if (!file.open(QIODevice::ReadOnly)) {
            importlog->append(LogStyle::error(
                QStringLiteral(" Something went wrong while opening \"version.txt\" file! ")));
            return;
        }
        QTextStream in(&file);
        versionText = in.readLine();
    } else {
        importlog->append(QStringLiteral("The version.txt file does not exist in the binaries directory!"));
        versionText = QStringLiteral("          version unknown");
    }

    if (!QFile::exists(morvelProgram)) {
        importlog->append(QStringLiteral("The MORVEL binary file given in ") + binaries
                          + QStringLiteral(" does not exist in the binaries directory!"));
        importlog->append(QStringLiteral("Default MORVEL program name will be used"));
        morvelProgram = QString::fromLatin1(defaultMorvel);
    }
    if (!QFile::exists(parserProgram)) {
        importlog->append(QStringLiteral("The CIF converter binary file given in ") + binaries
                          + QStringLiteral(" does not exist in the binaries directory!"));
        importlog->append(QStringLiteral("Default CIF converter program name will be used"));
        parserProgram = QString::fromLatin1(defaultParser);
    }

    importlog->append(QStringLiteral("<b>Using programs :</b>"));
    importlog->append(QStringLiteral("Morvel = ") + morvelProgram + QLatin1Char(' ') + shownVersion(versionText));
    importlog->append(QStringLiteral("Cif Parser = ") + parserProgram);
}
