#include "oxidationtable.h"
#include "linereader.h"
#include "logstyle.h"

#include <cstring>

namespace {
const float notFound = 1000.0f;

// Fields of a reduced line: runs of blanks and commas separate, empty parts are skipped.
QStringList tableFields(const QString &reduced)
{
    QStringList fields;
    qsizetype start = 0;
    for (qsizetype i = 0; i <= reduced.size(); ++i) {
        if (i == reduced.size() || reduced.at(i) == QLatin1Char(' ') || reduced.at(i) == QLatin1Char(',')) {
            if (i > start)
                fields.append(reduced.mid(start, i - start));
            start = i + 1;
        }
    }
    return fields;
}

// The echo line of one entry: name, symbol and charge, two spaces apart.
QString echoLine(const OxidationEntry &entry, ChargeTexts &charges)
{
    return entry.name + QLatin1String("  ") + entry.symbol + QLatin1String("  ") + charges.text(entry.charge);
}
} // namespace

QString formatCharge(float charge)
{
    return QString::number(double(charge), 'g', 6);
}

QString ChargeTexts::text(float charge)
{
    quint32 bits;
    std::memcpy(&bits, &charge, sizeof bits);
    for (const auto &k : known) {
        if (k.first == bits)
            return k.second;
    }
    QString t = formatCharge(charge);
    if (known.size() < 32)
        known.emplace_back(bits, t);
    return t;
}

OxidationTableRead parseOxidationTable(const QString &text)
{
    OxidationTableRead read;
    LineReader in(text);
    // The end test follows each line, so an empty text still gives one (empty, invalid) line.
    do {
        const QString reduced = in.readLine().simplified().trimmed();
        const QStringList fields = tableFields(reduced);
        const qsizetype n = fields.size();
        if (n < 3) {
            read.log.append(LogStyle::error(QStringLiteral(" Invalid line in \"oxidation.dat\" file! ")));
            read.log.append(reduced);
            read.log.append(QStringLiteral("<b> should be of type :  atom_names atom_symbol atom_charge </b><br>"));
            return read;
        }
        const QString &symbol = fields.at(n - 2);
        const float charge = fields.at(n - 1).toFloat();
        for (qsizetype i = 0; i < n - 2; ++i)
            read.entries.append(OxidationEntry{fields.at(i), symbol, charge});
    } while (!in.atEnd());

    read.complete = true;
    read.log.reserve(read.entries.size() + 1);
    read.log.append(QStringLiteral("<b>Got the following list of atom symbols and charges :  </b>"));
    ChargeTexts charges;
    for (const OxidationEntry &entry : read.entries)
        read.log.append(echoLine(entry, charges));
    return read;
}

OxidationEntry firstEntryForName(const QList<OxidationEntry> &table, const QString &key)
{
    for (const OxidationEntry &entry : table) {
        if (entry.name.trimmed() == key)
            return entry;
    }
    return OxidationEntry{QString(), QString(), notFound};
}

float firstChargeForSymbol(const QList<OxidationEntry> &table, const QString &symbol)
{
    const QString wanted = symbol.trimmed();
    for (const OxidationEntry &entry : table) {
        if (entry.symbol.trimmed() == wanted)
            return entry.charge;
    }
    return notFound;
}

OxidationIndex::OxidationIndex(const QList<OxidationEntry> &table)
    : table(table)
{
    firstByName.reserve(table.size());
    firstBySymbol.reserve(table.size());
    // insert keeps the value already there: the first entry in table order wins.
    for (qsizetype i = 0; i < table.size(); ++i) {
        firstByName.insert(table.at(i).name.trimmed(), i);
        firstBySymbol.insert(table.at(i).symbol.trimmed(), i);
    }
}

OxidationEntry OxidationIndex::entryForName(QStringView key) const
{
    const qsizetype i = firstByName.value(key);
    return i < 0 ? OxidationEntry{QString(), QString(), notFound} : table.at(i);
}

float OxidationIndex::chargeForSymbol(const QString &symbol) const
{
    const qsizetype i = firstBySymbol.value(symbol.trimmed());
    return i < 0 ? notFound : table.at(i).charge;
}
