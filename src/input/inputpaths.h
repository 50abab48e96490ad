#ifndef MORVEL_INPUTPATHS_H
#define MORVEL_INPUTPATHS_H

#include <QString>

// The paths every later stage derives from the chosen input file.
struct InputPaths
{
    QString workingDir;      // the file's directory, forward slashes, no trailing slash
    QString stagedInputPath; // workingDir + "/morvel.in"
    QString baseName;        // the file name up to its first dot
};

InputPaths inputPathsFor(const QString &inputFile);

// The three ways the dialog asks whether a file name looks like a CIF file, each lower-cased:
// - CompleteSuffixContains: all after the first dot contains "cif" (a.cif.txt, a.tar.cif): a file
//   that fails it gets the format warning when "CIF File" is chosen, one that passes it gets the
//   other warning when another format is chosen;
// - CompleteSuffixIs: all after the first dot is "cif" (a.cif, not a.b.cif): only such a file gets
//   the oxidation-number check;
// - SuffixIs: all after the last dot is "cif" (a.b.cif too): Run asks before converting any other.
enum class CifSuffix { CompleteSuffixContains, CompleteSuffixIs, SuffixIs };
bool hasCifSuffix(const QString &fileName, CifSuffix test);

// The name, without directory, of the n-th copy of a CIF file kept before it is rewritten:
// <base name>_old.cif, then <base name>_old2.cif, _old3.cif, ...
QString backupFileName(const QString &baseName, int n = 1);

// True when the name of the chosen file, lower-cased and trimmed, is the staged input's name.
bool isStagedInputName(const QString &inputFile);

#endif
