#ifndef MORVEL_ATOMTYPES_H
#define MORVEL_ATOMTYPES_H

#include <QList>
#include <QStringList>

// A place in a text held as lines: before the character at column of line.
struct TextPosition
{
    qsizetype line = -1;
    qsizetype column = 0;
};

// The _atom_type_ items of one data block, found by reading its lines as CIF tokens (quoted
// values, text fields and comments are skipped as CIF has them). Refinement programs write them
// as one loop of scattering factors, with a row for each type symbol.
struct AtomTypeItems
{
    enum class Kind {
        None,          // the block has no _atom_type_ item
        Loop,          // one loop holds all of them, with _atom_type_symbol and no oxidation number
        NotUnderstood  // anything else: not looped, in two loops, rows that do not add up, ...
    };
    Kind kind = Kind::None;
    TextPosition afterLastTag;
    qsizetype columns = 0;
    qsizetype symbolColumn = -1;
    QList<TextPosition> rowEnds; // just after each row's last value
    QStringList rowSymbols;      // each row's _atom_type_symbol, without quotes
};

// The items of the data block that holds lines.at(lineInBlock).
AtomTypeItems findAtomTypeItems(const QStringList &lines, qsizetype lineInBlock);

// Adds the column _atom_type_oxidation_number to the loop found by findAtomTypeItems: each row
// gets rowValues[i], and newRows (each a whole row, the new column included) follow the loop.
// Only the loop's tag line and the ends of its rows change; new items go on lines of their own
// where the line holds nothing more.
void addOxidationColumn(QStringList &lines, const AtomTypeItems &items, const QStringList &rowValues,
                        const QStringList &newRows);

#endif
