#ifndef MORVEL_RUNLOGIC_H
#define MORVEL_RUNLOGIC_H

#include <QByteArray>
#include <QIODevice>
#include <QString>
#include <QStringList>

#include <functional>

// The job options as the form gives them, in the units the computation program reads.
struct JobOptions
{
    float dmax = 0.0f;
    float tolerance = 0.0f;
    float hbondThreshold = 0.0f;
    int maxVAtoms = 0;
    int inputFormat = 0;
    int outputLevel = 0;
    int polyhedraDetails = 0;
    int printType = 0;
};

// OUTPUT as the computation program wants it: the third choice (ionic radii tables) is -1.
int outputLevelForIndex(int index);

// Line 1 of morvel.par, without its line end: eleven right-aligned fields, never cut.
QString parameterLine(const JobOptions &options);

// The log entries that echo the options, from " Job options : " to the closing "Done." line.
QStringList jobOptionsEcho(const JobOptions &options);

// The command line of the CIF converter as the log shows it: three quoted paths.
QString converterCommand(const QString &parserProgram, const QString &inputFile,
                         const QString &stagedInputPath);

// Whether this delivery of the converter's output holds the word "ERROR". carry keeps the last
// bytes of the previous delivery of the same run (empty at its start), so that a word split
// between two deliveries is seen too, and a word is never counted twice.
bool outputReportsError(const QByteArray &delivery, QByteArray &carry);

// "/MORVEL.OUT.old" followed by n: the name an earlier result is kept under.
QString keptResultName(int n);

// Tries the kept-result names in turn (numbers 1 to 100) with tryRename until one succeeds and
// returns that name; returns an empty string when every try failed.
QString takeKeptResultName(const std::function<bool(const QString &name)> &tryRename);

// The five banner lines above the result file in the log.
QStringList resultBanner();

// Of a result file larger than this, the log shows only the beginning: one append of a larger
// text keeps the window from answering for too long (bench/resultdisplay measures it).
constexpr qint64 resultLogLimit = 512 * 1024;

// A result file's text as the log shows it. The bytes are read as a text stream reads them:
// UTF-8 unless a byte-order mark names another Unicode encoding (the mark itself is dropped), and
// invalid sequences and NUL bytes become U+FFFD, so that binary bytes neither end the text nor
// reach the log as control characters. Of a file larger than limit, only the beginning, cut at
// the end of its last whole line.
struct ResultText
{
    QString text;
    qint64 fileSize = 0;
    bool whole = true;
};

ResultText readResultText(QIODevice &file, qint64 limit = resultLogLimit);

// The log line that follows a result shown only in part.
QString resultTooLargeLine(qint64 fileSize);

// Where a program path given relative to the binaries directory really lies. The child runs in
// the working directory, so a relative path must not be left for the child to resolve.
QString resolvedProgramPath(const QString &program, const QString &binariesDir);

// The text editor for the result file: notepad where Windows has it, otherwise xdg-open from
// PATH; empty when there is none.
QString textEditorProgram();

#endif
