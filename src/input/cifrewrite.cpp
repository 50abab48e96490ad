#include "cifrewrite.h"
#include "linereader.h"
#include "logstyle.h"

#include "stringindex.h"

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

// Atom row fields: single spaces separate, runs count as one; tabs do not separate.
QList<QStringView> rowFields(const QString &row)
{
    return QStringView(row).split(QLatin1Char(' '), Qt::SkipEmptyParts, Qt::CaseSensitive);
}

const float noMatchAbove = 100.0f;
} // namespace

CifSections splitCifText(const QString &text)
{
    CifSections s;
    LineReader in(text);

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

    for (;;) {
        if (in.atEnd())
            break;
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

AtomRowRewrite rewriteAtomRows(const QStringList &atomRows, const OxidationIndex &index)
{
    AtomRowRewrite r;
    r.rows.reserve(atomRows.size());
    r.log.reserve(atomRows.size() + 1);
    r.log.append(QStringLiteral("<br><b> Now identifying pairs atom symbol/atom names : </b>"));
    StringIndex known;

    ChargeTexts charges;
    for (const QString &row : atomRows) {
        const QList<QStringView> fields = rowFields(row);
        if (fields.size() < 2) {
            r.log.append(QStringLiteral("<br><b> The following atom line is probably incorrect : </b>"));
            r.log.append(row);
            continue;
        }
        // By label first, then by the type symbol taken as a name.
        OxidationEntry entry = index.entryForName(fields.at(0).trimmed());
        if (entry.charge > noMatchAbove)
            entry = index.entryForName(fields.at(1).trimmed());
        if (entry.charge > noMatchAbove) {
            r.unmatchedLabels.append(fields.at(0).toString());
            continue;
        }
        QString said = QStringLiteral(" Atom ");
        said += fields.at(0);
        said += QLatin1String(" has symbol ") + entry.symbol + QLatin1String(" and charge ") + charges.text(entry.charge);
        r.log.append(said);
        // The row again, its fields one space apart, with the table's symbol as the second.
        QString rewritten;
        rewritten.reserve(row.size() + entry.symbol.size());
        rewritten += fields.at(0);
        rewritten += QLatin1Char(' ');
        rewritten += entry.symbol;
        for (qsizetype i = 2; i < fields.size(); ++i) {
            rewritten += QLatin1Char(' ');
            rewritten += fields.at(i);
        }
        r.rows.append(rewritten);
        if (known.insert(entry.symbol, 0))
            r.symbols.append(entry.symbol);
    }

    if (!r.unmatchedLabels.isEmpty()) {
        r.log.append(QStringLiteral("<br><b><font color=#FF3300> WARNING ! </font></b>"));
        r.log.append(QStringLiteral("<b>The following atoms do not have any match in \"oxidation.dat\" file : </b>"));
        r.log.append(r.unmatchedLabels);
    }
    return r;
}

QString composeCifText(const CifSections &sections, const AtomRowRewrite &rows, const OxidationIndex &index)
{
    QStringList symbolRows;
    symbolRows.reserve(rows.symbols.size());
    ChargeTexts charges;
    for (const QString &symbol : rows.symbols)
        symbolRows.append(symbol + QLatin1Char(' ') + charges.text(index.chargeForSymbol(symbol)));
    const QStringList inserted{QStringLiteral("loop_"), QStringLiteral("_atom_type_symbol"),
                               QStringLiteral("_atom_type_oxidation_number")};

    const QStringList *parts[] = {&sections.head, &rows.rows, &inserted, &symbolRows, &sections.rest};
    qsizetype size = sections.endLine.size() + 1;
    for (const QStringList *part : parts) {
        for (const QString &line : *part)
            size += line.size() + 1;
    }

    QString text;
    text.reserve(size);
    auto put = [&text](const QStringList &lines) {
        for (const QString &line : lines) {
            text += line;
            text += QLatin1Char('\n');
        }
    };
    put(sections.head);
    put(rows.rows);
    put(inserted);
    put(symbolRows);
    if (sections.hasEndLine) {
        text += sections.endLine;
        text += QLatin1Char('\n');
    }
    put(sections.rest);
    return text;
}

CifRewrite rewriteCifText(const QString &text, const OxidationIndex &index)
{
    CifRewrite result;
    const CifSections sections = splitCifText(text);
    switch (sections.status) {
    case CifSections::Status::NoAtomSiteLabel:
        result.outcome = CifRewrite::Outcome::NoAtomSiteLabel;
        result.log.append(LogStyle::error(
            QStringLiteral(" The CIF file does not contain the flag \"_atom_site_label\" ! The input file is left unchanged. ")));
        return result;
    case CifSections::Status::NoTypeSymbol:
        result.outcome = CifRewrite::Outcome::NoTypeSymbol;
        // Shown as it always was: this line has no closing tags.
        result.log.append(QStringLiteral(
            "<br><b><font color=#FF3300> The CIF file must at least contain the flag \"_atom_site_type_symbol\" !"));
        return result;
    case CifSections::Status::Complete:
        break;
    }

    AtomRowRewrite rows = rewriteAtomRows(sections.atomRows, index);
    result.log = std::move(rows.log);
    if (rows.rows.isEmpty()) {
        // Writing now would drop every atom of the structure.
        result.outcome = CifRewrite::Outcome::NoAtomKept;
        result.log.append(LogStyle::error(
            QStringLiteral(" No atom line matches \"oxidation.dat\" file ! The input file is left unchanged. ")));
        return result;
    }
    result.text = composeCifText(sections, rows, index);
    return result;
}
