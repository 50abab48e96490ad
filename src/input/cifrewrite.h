#ifndef MORVEL_CIFREWRITE_H
#define MORVEL_CIFREWRITE_H

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
    QStringList atomRows; // the loop's data lines, untrimmed
    bool hasEndLine = false;
    QString endLine;      // the line that ended the atom rows, if they did not run to the end
    QStringList rest;     // everything after it; at least one (maybe empty) line
};

CifSections splitCifText(const QString &text);

// The atom rows with the table's symbols in place of the type symbols, and what the user is
// told about them: the pairing header, one line per kept row, the incorrect rows and the
// warning block about rows without a match.
struct AtomRowRewrite
{
    QStringList rows;
    QStringList unmatchedLabels;
    QStringList symbols; // in order of first use, each once
    QStringList log;
};

AtomRowRewrite rewriteAtomRows(const QStringList &atomRows, const OxidationIndex &index);

// The new file's text: head, rewritten rows, the inserted atom-type loop, end line and rest,
// every line ended by a single LF.
QString composeCifText(const CifSections &sections, const AtomRowRewrite &rows, const OxidationIndex &index);

// The whole rewriting of a CIF text. Only a Rewritten outcome carries a text to write; any other
// outcome means the file must stay as it is. The log lines are in the order they are shown.
struct CifRewrite
{
    enum class Outcome { Rewritten, NoAtomSiteLabel, NoTypeSymbol, NoAtomKept };

    Outcome outcome = Outcome::Rewritten;
    QStringList log;
    QString text;
};

CifRewrite rewriteCifText(const QString &text, const OxidationIndex &index);

#endif
