#ifndef MORVEL_OXIDATIONTABLE_H
#define MORVEL_OXIDATIONTABLE_H

#include "oxidationentry.h"
#include "stringindex.h"

#include <QList>
#include <QStringList>

#include <utility>
#include <vector>

// What was understood from the text of oxidation.dat, and the log lines that tell the user so
// (everything after the "Found file" line). An invalid line stops the reading: the entries of
// the lines above it are kept and no echo follows.
struct OxidationTableRead
{
    QList<OxidationEntry> entries;
    QStringList log;
    bool complete = false;
};

OxidationTableRead parseOxidationTable(const QString &text);

// A charge as the log and the job files show it: C locale, 'g' form, six significant digits.
QString formatCharge(float charge);

// formatCharge for many rows: a table holds few distinct charges, so their texts are kept.
class ChargeTexts
{
public:
    QString text(float charge);

private:
    std::vector<std::pair<quint32, QString>> known;
};

// The first entry whose trimmed name equals key (the key itself is not trimmed); the
// not-found entry (empty name and symbol, charge 1000) when none does.
OxidationEntry firstEntryForName(const QList<OxidationEntry> &table, const QString &key);

// The charge of the first entry whose trimmed symbol equals the trimmed symbol; 1000 if none.
float firstChargeForSymbol(const QList<OxidationEntry> &table, const QString &symbol);

// The same two lookups with hash tables, for rewriting files with many atoms: each lookup costs
// the same whatever the size of the table, and still finds the first entry in table order.
class OxidationIndex
{
public:
    explicit OxidationIndex(const QList<OxidationEntry> &table);

    OxidationEntry entryForName(QStringView key) const;
    float chargeForSymbol(const QString &symbol) const;

private:
    QList<OxidationEntry> table;
    StringIndex firstByName;   // trimmed name -> table position
    StringIndex firstBySymbol; // trimmed symbol -> table position
};

#endif
