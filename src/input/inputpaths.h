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

// The lower-cased complete suffix (all after the first dot of the name) contains "cif": used to
// warn about a file that does not suit the chosen format.
bool suffixMentionsCif(const QString &fileName);

// The lower-cased complete suffix is "cif" exactly: only such files get the oxidation check.
bool suffixIsCif(const QString &fileName);

// The name of the backup copy made before a CIF file is rewritten, without directory.
QString backupFileName(const QString &baseName);

#endif
