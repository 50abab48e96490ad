#ifndef MORVEL_OXIDATIONENTRY_H
#define MORVEL_OXIDATIONENTRY_H

#include <QString>

// One row of the user's oxidation.dat: an atom name, the symbol to write for it, its charge.
struct OxidationEntry
{
    QString name;
    QString symbol;
    float charge = 1000.0f; // 1000 marks "not found" in the lookups
};

#endif
