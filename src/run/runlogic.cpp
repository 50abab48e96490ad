#include "runlogic.h"
#include "logstyle.h"
#include "numbertext.h"

#include <QDir>
#include <QFile>
#include <QFileInfo>
#include <QStandardPaths>
#include <QStringDecoder>

int outputLevelForIndex(int index)
{
    return index == 2 ? -1 : index;
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

ResultText readResultText(QIODevice &file, qint64 limit)
{
    ResultText result;
    result.fileSize = file.size();
    result.whole = result.fileSize <= limit;
    const QByteArray bytes = file.read(limit);
    const auto bom = QStringConverter::encodingForData(bytes);
    // A stateless decoder turns a sequence cut by the end of the file into U+FFFD; a stateful one
    // keeps it back, which is right where the bytes stop at the limit.
    QStringDecoder decoder(bom ? *bom : QStringConverter::Utf8,
                           result.whole ? QStringConverter::Flag::Stateless : QStringConverter::Flag::Default);
    result.text = decoder.decode(bytes);
    result.text.replace(QChar(0), QChar::ReplacementCharacter);
    if (!result.whole) {
        const qsizetype lineEnd = result.text.lastIndexOf(QLatin1Char('\n'));
        if (lineEnd > 0)
            result.text.truncate(result.text.at(lineEnd - 1) == QLatin1Char('\r') ? lineEnd - 1 : lineEnd);
    }
    return result;
}

QString resultTooLargeLine(qint64 fileSize)
{
    return LogStyle::error(QStringLiteral(" The result is larger than the log shows (%1 bytes): open \"MORVEL.OUT\" "
                                          "with \"Open in editor\" to read all of it. ")
                               .arg(fileSize));
}
