#ifndef MORVEL_CIFREWRITE_H
#define MORVEL_CIFREWRITE_H

#include "logstyle.h"
#include "oxidationtable.h"

#include <QStringList>

// A CIF text cut into the four parts the rewriting works on, in file order. Lines carry no line
// ends. The cut relies on fixed positions: "_atom_site_label" followed at once by
// "_atom_site_type_symbol"; it is no CIF parser.
struct CifSections
{
    enum class Status { Complete, NoAtomSiteLabel, NoTypeSymbol };

    Status status = Status::Complete;
    QStringList head;     // up to and including the last tag line of the atom-site loop
    qsizetype labelLine = -1; // the "_atom_site_label" line, in head
    QStringList atomRows; // the loop's data lines, untrimmed
    bool hasEndLine = false;
    QString endLine;      // the line that ended the atom rows, if they did not run to the end
    QStringList rest;     // everything after it; at least one (maybe empty) line
};

CifSections splitCifText(const QString &text);

// The whole rewriting of a CIF text: the atom rows get the table's symbols (rows without a match
// are left out), and the block gets the oxidation number of each symbol, in a new atom-type loop
// after the atom rows or, where the block has an atom-type loop already, in a new column of it.
// Only a Rewritten outcome carries a text to write, every line ended by a single LF; any other
// outcome means the file must stay as it is.
struct CifRewrite
{
    enum class Outcome { Rewritten, NoAtomSiteLabel, NoTypeSymbol, NoAtomKept, AtomTypesNotUnderstood };

    Outcome outcome = Outcome::Rewritten;
    LogGroups log;
    QString text;
};

CifRewrite rewriteCifText(const QString &text, const OxidationIndex &index);

#endif
