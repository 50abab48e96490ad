#include "cifrewrite.h"
#include "atomtypes.h"
#include "numbertext.h"

#include <QSet>
#include <QIODevice>
#include <QTextStream>

namespace {
// A tag compared the way the rewriting compares them: white space folded and trimmed.
bool isTag(const QString &line, QLatin1String tag)
{
    return line.simplified() == tag;
}

bool endsAtomRows(const QString &line)
{
    const QString t = line.trimmed();
    return t.isEmpty() || t == QLatin1String("loop_") || t.startsWith(QLatin1Char('_'))
        || t.startsWith(QLatin1Char('#'));
}

// The atom rows with the table's symbols in place of the type symbols, and what the user is told.
struct AtomRows
{
    QStringList rows;
    QStringList symbols; // in order of first use, each once
    QStringList said;    // one line per kept row; two per incorrect row
    QStringList unmatchedLabels;
};

AtomRows rewriteAtomRows(const QStringList &atomRows, const OxidationIndex &index)
{
    AtomRows r;
    QSet<QString> known;
    for (const QString &row : atomRows) {
        // Single spaces separate, runs count as one; tabs do not separate.
        const QList<QStringView> fields = QStringView(row).split(QLatin1Char(' '), Qt::SkipEmptyParts);
        if (fields.size() < 2) {
            r.said.append(QStringLiteral("<br><b> The following atom line is probably incorrect : </b>"));
            r.said.append(row);
            continue;
        }
        // By label first, then by the type symbol taken as a name.
        OxidationEntry entry = index.entryForName(fields.at(0).trimmed().toString());
        if (entry.charge > noMatchAbove)
            entry = index.entryForName(fields.at(1).trimmed().toString());
        if (entry.charge > noMatchAbove) {
            r.unmatchedLabels.append(fields.at(0).toString());
            continue;
        }
        const QString label = fields.at(0).toString();
        r.said.append(QLatin1String(" Atom ") + label + QLatin1String(" has symbol ") + entry.symbol
                      + QLatin1String(" and charge ") + realText(entry.charge));
        // The row again, its fields one space apart, with the table's symbol as the second.
        QString rewritten = label + QLatin1Char(' ') + entry.symbol;
        for (qsizetype i = 2; i < fields.size(); ++i) {
            rewritten += QLatin1Char(' ');
            rewritten += fields.at(i);
        }
        r.rows.append(rewritten);
        if (!known.contains(entry.symbol)) {
            known.insert(entry.symbol);
            r.symbols.append(entry.symbol);
        }
    }
    return r;
}

QString leftUnchanged(const QString &why)
{
    return LogStyle::error(QLatin1Char(' ') + why + QStringLiteral(" The input file is left unchanged. "));
}
} // namespace

CifSections splitCifText(const QString &text)
{
    CifSections s;
    QString source = text;
    QTextStream in(&source, QIODevice::ReadOnly);

    for (;;) {
        if (in.atEnd()) {
            // Without the atom-site loop there is nothing to complete.
            s.status = CifSections::Status::NoAtomSiteLabel;
            return s;
        }
        s.head.append(in.readLine());
        if (isTag(s.head.constLast(), QLatin1String("_atom_site_label")))
            break;
    }
    s.labelLine = s.head.size() - 1;

    s.head.append(in.readLine());
    if (!isTag(s.head.constLast(), QLatin1String("_atom_site_type_symbol"))) {
        s.status = CifSections::Status::NoTypeSymbol;
        return s;
    }

    QString line = in.readLine();
    while (line.trimmed().startsWith(QLatin1Char('_'))) {
        s.head.append(line);
        line = in.readLine();
    }
    // The first line after the tags is a row whatever it holds.
    s.atomRows.append(line);

    while (!in.atEnd()) {
        line = in.readLine();
        if (endsAtomRows(line)) {
            s.hasEndLine = true;
            s.endLine = line;
            break;
        }
        s.atomRows.append(line);
    }

    // At least one read: with nothing left this adds one empty line.
    do {
        s.rest.append(in.readLine());
    } while (!in.atEnd());
    return s;
}

CifRewrite rewriteCifText(const QString &text, const OxidationIndex &index)
{
    CifRewrite result;
    const CifSections sections = splitCifText(text);
    switch (sections.status) {
    case CifSections::Status::NoAtomSiteLabel:
        result.outcome = CifRewrite::Outcome::NoAtomSiteLabel;
        result.log = {{leftUnchanged(QStringLiteral("The CIF file does not contain the flag \"_atom_site_label\" !"))}};
        return result;
    case CifSections::Status::NoTypeSymbol:
        result.outcome = CifRewrite::Outcome::NoTypeSymbol;
        result.log = {{LogStyle::error(
            QStringLiteral(" The CIF file must at least contain the flag \"_atom_site_type_symbol\" !"),
            LogStyle::BreakBefore | LogStyle::Unclosed)}};
        return result;
    case CifSections::Status::Complete:
        break;
    }

    const AtomRows rows = rewriteAtomRows(sections.atomRows, index);
    result.log = {{QStringLiteral("<br><b> Now identifying pairs atom symbol/atom names : </b>")}, rows.said};
    if (!rows.unmatchedLabels.isEmpty()) {
        result.log.append({LogStyle::error(QStringLiteral(" WARNING ! "), LogStyle::BreakBefore),
                           QStringLiteral("<b>The following atoms do not have any match in \"oxidation.dat\" file : </b>")});
        result.log.append(rows.unmatchedLabels);
    }
    if (rows.rows.isEmpty()) {
        // Writing now would drop every atom of the structure.
        result.outcome = CifRewrite::Outcome::NoAtomKept;
        result.log.append({leftUnchanged(QStringLiteral("No atom line matches \"oxidation.dat\" file !"))});
        return result;
    }

    QStringList lines = sections.head + rows.rows;
    const qsizetype afterRows = lines.size();
    if (sections.hasEndLine)
        lines.append(sections.endLine);
    lines += sections.rest;

    const AtomTypeItems items = findAtomTypeItems(lines, sections.labelLine);
    switch (items.kind) {
    case AtomTypeItems::Kind::None: {
        QStringList loop{QStringLiteral("loop_"), QStringLiteral("_atom_type_symbol"),
                         QStringLiteral("_atom_type_oxidation_number")};
        for (const QString &symbol : rows.symbols)
            loop.append(symbol + QLatin1Char(' ') + realText(index.chargeForSymbol(symbol)));
        for (qsizetype i = 0; i < loop.size(); ++i)
            lines.insert(afterRows + i, loop.at(i));
        break;
    }
    case AtomTypeItems::Kind::Loop: {
        // A CIF must not name an item twice: the block's own atom-type loop gets the numbers.
        QStringList rowValues;
        for (const QString &symbol : items.rowSymbols) {
            const float charge = index.chargeForSymbol(symbol);
            rowValues.append(charge > noMatchAbove ? QStringLiteral("?") : realText(charge));
        }
        QStringList newRows;
        for (const QString &symbol : rows.symbols) {
            if (items.rowSymbols.contains(symbol))
                continue;
            QStringList fields(items.columns, QStringLiteral("?"));
            fields[items.symbolColumn] = symbol;
            newRows.append(fields.join(QLatin1Char(' ')) + QLatin1Char(' ')
                           + realText(index.chargeForSymbol(symbol)));
        }
        addOxidationColumn(lines, items, rowValues, newRows);
        break;
    }
    case AtomTypeItems::Kind::NotUnderstood:
        result.outcome = CifRewrite::Outcome::AtomTypesNotUnderstood;
        result.log.append({leftUnchanged(QStringLiteral(
            "The \"_atom_type_\" items of the CIF file are not one loop that oxidation numbers can be added to !"))});
        return result;
    }

    result.text = lines.join(QLatin1Char('\n')) + QLatin1Char('\n');
    return result;
}
