#include "oxidationtable.h"
#include "numbertext.h"

#include <QIODevice>
#include <QTextStream>

OxidationTableRead parseOxidationTable(const QString &text)
{
    OxidationTableRead read;
    QString source = text;
    QTextStream in(&source, QIODevice::ReadOnly);
    // The end test follows each line, so an empty text still gives one (empty, invalid) line.
    do {
        const QString reduced = in.readLine().simplified().trimmed();
        // Blanks and commas separate; after simplified() the only blank left is the space.
        const QStringList fields = QString(reduced).replace(QLatin1Char(','), QLatin1Char(' '))
                                       .split(QLatin1Char(' '), Qt::SkipEmptyParts);
        const qsizetype n = fields.size();
        if (n < 3) {
            read.log = {{LogStyle::error(QStringLiteral(" Invalid line in \"oxidation.dat\" file! ")), reduced,
                         QStringLiteral("<b> should be of type :  atom_names atom_symbol atom_charge </b><br>")}};
            return read;
        }
        const float charge = fields.at(n - 1).toFloat();
        for (qsizetype i = 0; i < n - 2; ++i)
            read.entries.append(OxidationEntry{fields.at(i), fields.at(n - 2), charge});
    } while (!in.atEnd());

    read.complete = true;
    QStringList echo;
    echo.reserve(read.entries.size());
    for (const OxidationEntry &e : std::as_const(read.entries))
        echo.append(e.name + QLatin1String("  ") + e.symbol + QLatin1String("  ") + realText(e.charge));
    read.log = {{QStringLiteral("<b>Got the following list of atom symbols and charges :  </b>")}, echo};
    return read;
}

OxidationIndex::OxidationIndex(const QList<OxidationEntry> &table)
    : table(table)
{
    firstByName.reserve(table.size());
    firstBySymbol.reserve(table.size());
    // Filled from the end: a key's first entry in table order is inserted last and stays.
    for (qsizetype i = table.size() - 1; i >= 0; --i) {
        firstByName.insert(table.at(i).name.trimmed(), i);
        firstBySymbol.insert(table.at(i).symbol.trimmed(), i);
    }
}

OxidationEntry OxidationIndex::entryForName(const QString &key) const
{
    const qsizetype i = firstByName.value(key, -1);
    return i < 0 ? OxidationEntry() : table.at(i);
}

float OxidationIndex::chargeForSymbol(const QString &symbol) const
{
    const qsizetype i = firstBySymbol.value(symbol.trimmed(), -1);
    return i < 0 ? OxidationEntry().charge : table.at(i).charge;
}
