#include "runlogic.h"

#include <QDir>
#include <QFile>
#include <QFileInfo>
#include <QStandardPaths>

int outputLevelForIndex(int index)
{
    return index == 2 ? -1 : index;
}

QString realText(float value)
{
    // QString::number always writes the C locale, and its 'g' drops trailing zeros like printf.
    return QString::number(double(value), 'g', 6);
}

QString parameterLine(const JobOptions &o)
{
    return QStringLiteral("%1 %2 %3 %4 %5 %6 %7 %8 %9 %10 %11")
        .arg(realText(o.dmax), 4)
        .arg(QString::number(o.inputFormat), 10)
        .arg(QString::number(o.printType), 3)
        .arg(QString::number(o.outputLevel), 3)
        .arg(QString::number(o.polyhedraDetails), 3)
        .arg(realText(o.tolerance), 5)
        .arg(realText(1.6f), 5)
        .arg(realText(o.hbondThreshold), 3)
        .arg(QString::number(o.maxVAtoms), 4)
        .arg(QStringLiteral(".001"), 4)
        .arg(realText(0.5f), 3);
}

QStringList jobOptionsEcho(const JobOptions &o)
{
    return {
        QStringLiteral(" Job options : "),
        QStringLiteral(" ------------------- "),
        QStringLiteral(" DMAX       \t= ") + realText(o.dmax),
        QStringLiteral(" TOLERANCE   \t= ") + realText(o.tolerance),
        QStringLiteral(" THRESH     \t= ") + realText(o.hbondThreshold),
        QStringLiteral(" INPUT      \t= ") + QString::number(o.inputFormat),
        QStringLiteral(" OUTPUT     \t= ") + QString::number(o.outputLevel),
        QStringLiteral(" PRINT TYPE \t= ") + QString::number(o.printType),
        QStringLiteral(" MAX V-ATOMS\t= ") + QString::number(o.maxVAtoms),
        QStringLiteral("<br><b> Done.  </b><br>"),
    };
}

QString converterCommand(const QString &parserProgram, const QString &inputFile,
                         const QString &stagedInputPath)
{
    const QChar q(QLatin1Char('"'));
    return q + parserProgram + q + QLatin1Char(' ') + q + inputFile + q + QLatin1Char(' ') + q
           + stagedInputPath + q;
}

bool outputReportsError(const QByteArray &delivery, QByteArray &carry)
{
    const QByteArray word("ERROR");
    const QByteArray joined = carry + delivery;
    carry = joined.right(word.size() - 1);
    return joined.contains(word);
}

bool isStagedInputName(const QString &inputFile)
{
    return QFileInfo(inputFile).fileName().toLower().trimmed() == QLatin1String("morvel.in");
}

bool hasCifSuffix(const QString &inputFile)
{
    return QFileInfo(inputFile).suffix().toLower() == QLatin1String("cif");
}

QString keptResultName(int n)
{
    return QStringLiteral("/MORVEL.OUT.old") + QString::number(n);
}

QString takeKeptResultName(const std::function<bool(const QString &name)> &tryRename)
{
    for (int n = 1; n <= 100; ++n) {
        const QString name = keptResultName(n);
        if (tryRename(name))
            return name;
    }
    return QString();
}

QStringList resultBanner()
{
    const QString hashes15(15, QLatin1Char('#'));
    const QString middle = hashes15 + QString(33, QLatin1Char(' '));
    return {
        QString(61, QLatin1Char('#')),
        middle,
        hashes15 + QStringLiteral("\t\t") + QString(12, QLatin1Char(' ')) + QStringLiteral("MORVEL.OUT  "),
        middle,
        QString(61, QLatin1Char('#')) + QStringLiteral("<br>"),
    };
}

QString resolvedProgramPath(const QString &program, const QString &binariesDir)
{
    if (program.isEmpty() || QDir::isAbsolutePath(program))
        return program;
    const QString beside = QDir(binariesDir).absoluteFilePath(program);
    // A bare name that does not lie in the binaries directory is left to the PATH search.
    if (!program.contains(QLatin1Char('/')) && !QFileInfo::exists(beside))
        return program;
    return QDir::cleanPath(beside);
}

QString textEditorProgram()
{
    const QString notepad = QStringLiteral("C:/Windows/System32/notepad.exe");
    if (QFileInfo::exists(notepad))
        return notepad;
    return QStandardPaths::findExecutable(QStringLiteral("xdg-open"));
}
