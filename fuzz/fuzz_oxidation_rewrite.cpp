// Fuzzes the reading of oxidation.dat and the rewriting of a CIF text with the table read.
// The input is the table text, a NUL byte, then the CIF text (no NUL: the CIF text is empty).
// Build and run: see fuzz/CMakeLists.txt.
#include "cifrewrite.h"
#include "oxidationtable.h"
#include "require.h"

#include <cstdint>
#include <cstring>

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size)
{
    const char *bytes = reinterpret_cast<const char *>(data);
    const void *nul = std::memchr(bytes, 0, size);
    const size_t tableSize = nul ? size_t(static_cast<const char *>(nul) - bytes) : size;
    const QString tableText = QString::fromLatin1(bytes, qsizetype(tableSize));
    const QString cifText = nul ? QString::fromLatin1(bytes + tableSize + 1, qsizetype(size - tableSize - 1)) : QString();

    const OxidationTableRead table = parseOxidationTable(tableText);
    require(table.complete ? table.log.size() == 2 && table.log.at(1).size() == table.entries.size()
                           : table.log.size() == 1 && table.log.at(0).size() == 3);

    // The index finds the first entry of each name and of each symbol, as a plain scan does.
    const OxidationIndex index(table.entries);
    for (const OxidationEntry &entry : table.entries) {
        const OxidationEntry found = index.entryForName(entry.name.trimmed());
        for (const OxidationEntry &first : table.entries) {
            if (first.name.trimmed() == entry.name.trimmed()) {
                require(found.name == first.name && found.symbol == first.symbol);
                break;
            }
        }
    }

    const CifRewrite rewrite = rewriteCifText(cifText, index);
    if (rewrite.outcome != CifRewrite::Outcome::Rewritten) {
        require(rewrite.text.isEmpty());
        return 0;
    }

    // The written text is Latin-1 again with LF line ends only. Without atom-type items, every line
    // of the head, and of what follows the atom rows, comes out unchanged.
    require(rewrite.text.endsWith(QLatin1Char('\n')));
    require(QString::fromLatin1(rewrite.text.toLatin1()) == rewrite.text);
    if (cifText.contains(QLatin1String("_atom_type_"), Qt::CaseInsensitive))
        return 0;
    const CifSections sections = splitCifText(cifText);
    require(sections.status == CifSections::Status::Complete);
    QStringList written = rewrite.text.split(QLatin1Char('\n'));
    written.removeLast();
    require(written.mid(0, sections.head.size()) == sections.head);
    require(written.mid(written.size() - sections.rest.size()) == sections.rest);
    return 0;
}
