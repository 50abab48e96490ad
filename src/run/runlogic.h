#ifndef MORVEL_RUNLOGIC_H
#define MORVEL_RUNLOGIC_H

#include <QByteArray>
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

// A real number as the job files and the log show it: C locale, %g with six significant digits.
QString realText(float value);

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

// True when the name of the chosen file, lower-cased and trimmed, is the staged input's name.
bool isStagedInputName(const QString &inputFile);

// True when the file name ends in ".cif", in any mix of cases.
bool hasCifSuffix(const QString &inputFile);

// "/MORVEL.OUT.old" followed by n: the name an earlier result is kept under.
QString keptResultName(int n);

// Tries the kept-result names in turn (numbers 1 to 100) with tryRename until one succeeds and
// returns that name; returns an empty string when every try failed.
QString takeKeptResultName(const std::function<bool(const QString &name)> &tryRename);

// The five banner lines above the result file in the log.
QStringList resultBanner();

// Where a program path given relative to the binaries directory really lies. The child runs in
// the working directory, so a relative path must not be left for the child to resolve.
QString resolvedProgramPath(const QString &program, const QString &binariesDir);

// The text editor for the result file: notepad where Windows has it, otherwise xdg-open from
// PATH; empty when there is none.
QString textEditorProgram();

#endif
