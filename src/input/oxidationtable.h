#ifndef MORVEL_OXIDATIONTABLE_H
#define MORVEL_OXIDATIONTABLE_H

#include "logstyle.h"
#include "oxidationentry.h"

#include <QHash>
#include <QList>

// What was understood from the text of oxidation.dat, and the log lines that tell the user so
// (everything after the "Found file" line). An invalid line stops the reading: the entries of
// the lines above it are kept and no echo follows.
struct OxidationTableRead
{
    QList<OxidationEntry> entries;
    LogGroups log;
    bool complete = false;
};

OxidationTableRead parseOxidationTable(const QString &text);

// The lookups of the rewriting. Both find the first entry in table order: by its trimmed name
// equal to the key (the key itself is not trimmed), or by its trimmed symbol equal to the
// trimmed symbol. Not found: the entry with empty name and symbol and charge 1000.
class OxidationIndex
{
public:
    explicit OxidationIndex(const QList<OxidationEntry> &table);

    OxidationEntry entryForName(const QString &key) const;
    float chargeForSymbol(const QString &symbol) const;

private:
    QList<OxidationEntry> table;
    QHash<QString, qsizetype> firstByName;
    QHash<QString, qsizetype> firstBySymbol;
};

// A charge above this is no match: the lookups give 1000 for "not found".
constexpr float noMatchAbove = 100.0f;

#endif
