#ifndef MORVEL_TOOLCONFIGURATION_H
#define MORVEL_TOOLCONFIGURATION_H

#include <QString>

// The program paths named by binaries.txt. A key that is not found leaves its path empty.
struct BinariesPaths
{
    QString morvel;
    QString parser;
};

// Applies one line of binaries.txt: "MORVEL <path>" or "PARSER <path>" at the very start of
// the line (case-sensitive); the value has its white space folded. Other lines are ignored.
void applyBinariesLine(const QString &line, BinariesPaths &paths);

// The part of the version text that is shown: everything after its ten-character label.
QString shownVersion(const QString &versionText);

#endif
