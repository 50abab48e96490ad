// Fuzzes the reading of oxidation.dat and the rewriting of a CIF text with the table read.
// The input is the table text, a NUL byte, then the CIF text (no NUL: the CIF text is empty).
// Build and run: see fuzz/CMakeLists.txt.
#include "cifrewrite.h"
#include "oxidationtable.h"

#include <cstdint>
#include <cstdlib>
#include <cstring>

namespace {
void require(bool condition)
{
    if (!condition)
        std::abort();
}

// The text as the rewriting reads it: lines without their LF or CR LF ends.
QStringList linesOf(const QString &text)
{
    QStringList lines = text.split(QLatin1Char('\n'));
    if (text.endsWith(QLatin1Char('\n')))
        lines.removeLast();
    for (QString &line : lines) {
        if (line.endsWith(QLatin1Char('\r')))
            line.chop(1);
    }
    return lines;
}
} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size)
{
    const char *bytes = reinterpret_cast<const char *>(data);
    const void *nul = std::memchr(bytes, 0, size);
    const size_t tableSize = nul ? size_t(static_cast<const char *>(nul) - bytes) : size;
    const QString tableText = QString::fromLatin1(bytes, qsizetype(tableSize));
    const QString cifText = nul ? QString::fromLatin1(bytes + tableSize + 1, qsizetype(size - tableSize - 1)) : QString();

    const OxidationTableRead table = parseOxidationTable(tableText);
    require(table.complete ? table.log.size() == table.entries.size() + 1 : table.log.size() == 3);

    const OxidationIndex index(table.entries);
    for (const OxidationEntry &entry : table.entries) {
        // The index finds what the plain scan finds.
        const OxidationEntry a = index.entryForName(entry.name);
        const OxidationEntry b = firstEntryForName(table.entries, entry.name);
        require(a.name == b.name && a.symbol == b.symbol);
        const float ca = index.chargeForSymbol(entry.symbol);
        const float cb = firstChargeForSymbol(table.entries, entry.symbol);
        require(ca == cb || (ca != ca && cb != cb));
    }

    const CifRewrite rewrite = rewriteCifText(cifText, index);
    if (rewrite.outcome != CifRewrite::Outcome::Rewritten) {
        require(rewrite.text.isEmpty());
        return 0;
    }

    // Every line of the head, and of what follows the atom rows, comes out unchanged, and the
    // written text is Latin-1 again with LF line ends only.
    const CifSections sections = splitCifText(cifText);
    require(sections.status == CifSections::Status::Complete);
    require(rewrite.text.endsWith(QLatin1Char('\n')));
    QStringList written = rewrite.text.split(QLatin1Char('\n'));
    written.removeLast();
    require(written.mid(0, sections.head.size()) == sections.head);
    require(written.mid(written.size() - sections.rest.size()) == sections.rest);
    require(QString::fromLatin1(rewrite.text.toLatin1()) == rewrite.text);
    const QStringList input = linesOf(cifText);
    require(input.mid(0, sections.head.size()) == sections.head);
    return 0;
}
