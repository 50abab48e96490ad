#include "atomtypes.h"

#include <algorithm>

namespace {

struct Token
{
    enum Type { Value, Tag, Loop, Block };
    Type type = Value;
    TextPosition end; // just after the token
    QString word;     // the token as written; empty for a text field
};

bool isBlank(QStringView text)
{
    return text.trimmed().isEmpty();
}

// Reads lines as CIF 1.1 tokens: blanks separate, '#' starts a comment, a quote ends at the same
// quote followed by a blank, and a line starting with ';' opens a text field that the next such
// line closes.
class CifTokens
{
public:
    explicit CifTokens(const QStringList &lines) : lines(lines) {}

    bool next(Token &token)
    {
        while (line < lines.size()) {
            const QString &text = lines.at(line);
            if (column == 0 && text.startsWith(QLatin1Char(';'))) {
                qsizetype close = line + 1;
                while (close < lines.size() && !lines.at(close).startsWith(QLatin1Char(';')))
                    ++close;
                if (close == lines.size()) { // never closed: the field runs to the end
                    token = {Token::Value, {lines.size() - 1, lines.constLast().size()}, QString()};
                    line = lines.size();
                    return true;
                }
                line = close;
                column = 1;
                token = {Token::Value, {line, column}, QString()};
                return true;
            }
            while (column < text.size() && text.at(column).isSpace())
                ++column;
            if (column >= text.size() || text.at(column) == QLatin1Char('#')) {
                ++line;
                column = 0;
                continue;
            }
            const qsizetype start = column;
            const QChar first = text.at(column);
            if (first == QLatin1Char('\'') || first == QLatin1Char('"')) {
                ++column;
                while (column < text.size()
                       && !(text.at(column) == first && (column + 1 == text.size() || text.at(column + 1).isSpace())))
                    ++column;
                column = std::min(column + 1, text.size());
            } else {
                while (column < text.size() && !text.at(column).isSpace())
                    ++column;
            }
            token.word = text.mid(start, column - start);
            token.end = {line, column};
            token.type = Token::Value;
            if (first == QLatin1Char('_'))
                token.type = Token::Tag;
            else if (token.word.compare(QLatin1String("loop_"), Qt::CaseInsensitive) == 0)
                token.type = Token::Loop;
            else if (token.word.startsWith(QLatin1String("data_"), Qt::CaseInsensitive))
                token.type = Token::Block;
            return true;
        }
        return false;
    }

private:
    const QStringList &lines;
    qsizetype line = 0;
    qsizetype column = 0;
};

bool isAtomTypeTag(const QString &word)
{
    return word.startsWith(QLatin1String("_atom_type_"), Qt::CaseInsensitive);
}

QString unquoted(const QString &value)
{
    if (value.size() >= 2 && (value.startsWith(QLatin1Char('\'')) || value.startsWith(QLatin1Char('"')))
        && value.endsWith(value.at(0)))
        return value.mid(1, value.size() - 2);
    return value;
}

struct LoopSeen
{
    QStringList tags;
    TextPosition afterLastTag;
    QList<Token> values;
};

// What a closed loop means for the items found so far.
void takeLoop(const LoopSeen &loop, AtomTypeItems &items)
{
    const auto atomTypeTags = std::count_if(loop.tags.cbegin(), loop.tags.cend(), isAtomTypeTag);
    if (atomTypeTags == 0)
        return;
    const qsizetype columns = loop.tags.size();
    const auto symbol = std::find_if(loop.tags.cbegin(), loop.tags.cend(), [](const QString &tag) {
        return tag.compare(QLatin1String("_atom_type_symbol"), Qt::CaseInsensitive) == 0;
    });
    const bool hasNumbers = std::any_of(loop.tags.cbegin(), loop.tags.cend(), [](const QString &tag) {
        return tag.compare(QLatin1String("_atom_type_oxidation_number"), Qt::CaseInsensitive) == 0;
    });
    if (items.kind != AtomTypeItems::Kind::None || atomTypeTags != columns || symbol == loop.tags.cend()
        || hasNumbers || loop.values.isEmpty() || loop.values.size() % columns != 0) {
        items.kind = AtomTypeItems::Kind::NotUnderstood;
        return;
    }
    items.kind = AtomTypeItems::Kind::Loop;
    items.afterLastTag = loop.afterLastTag;
    items.columns = columns;
    items.symbolColumn = symbol - loop.tags.cbegin();
    for (qsizetype row = 0; row < loop.values.size() / columns; ++row) {
        items.rowEnds.append(loop.values.at((row + 1) * columns - 1).end);
        items.rowSymbols.append(unquoted(loop.values.at(row * columns + items.symbolColumn).word));
    }
}

} // namespace

AtomTypeItems findAtomTypeItems(const QStringList &lines, qsizetype lineInBlock)
{
    AtomTypeItems items;
    CifTokens tokens(lines);
    Token token;
    bool inLoop = false;
    LoopSeen loop;
    auto closeLoop = [&] {
        if (inLoop)
            takeLoop(loop, items);
        inLoop = false;
        loop = LoopSeen();
    };
    while (tokens.next(token)) {
        if (token.type == Token::Block) {
            // The wanted block is the last one begun at or before its line; the next one ends it.
            if (token.end.line > lineInBlock)
                break;
            items = AtomTypeItems();
            inLoop = false;
            loop = LoopSeen();
        } else if (token.type == Token::Loop) {
            closeLoop();
            inLoop = true;
        } else if (token.type == Token::Tag) {
            if (inLoop && loop.values.isEmpty()) {
                loop.tags.append(token.word);
                loop.afterLastTag = token.end;
                continue;
            }
            closeLoop();
            if (isAtomTypeTag(token.word))
                items.kind = AtomTypeItems::Kind::NotUnderstood; // a single item outside a loop
        } else if (inLoop) {
            loop.values.append(token);
        }
    }
    closeLoop();
    if (items.kind != AtomTypeItems::Kind::Loop)
        items = AtomTypeItems{items.kind, {}, 0, -1, {}, {}};
    return items;
}

void addOxidationColumn(QStringList &lines, const AtomTypeItems &items, const QStringList &rowValues,
                        const QStringList &newRows)
{
    struct Insertion
    {
        TextPosition at;
        QStringList text; // several: one line each where they go on lines of their own
        bool ownLines;
    };
    QList<Insertion> insertions;
    insertions.append({items.afterLastTag, {QStringLiteral("_atom_type_oxidation_number")}, true});
    // New rows before the last row's own value: at the same place, they are put in first.
    if (!newRows.isEmpty())
        insertions.append({items.rowEnds.constLast(), newRows, true});
    for (qsizetype i = 0; i < items.rowEnds.size(); ++i)
        insertions.append({items.rowEnds.at(i), {rowValues.at(i)}, false});

    // From the end of the text back, so that the places still to come stay where they were.
    std::stable_sort(insertions.begin(), insertions.end(), [](const Insertion &a, const Insertion &b) {
        return a.at.line != b.at.line ? a.at.line > b.at.line : a.at.column > b.at.column;
    });
    for (const Insertion &insertion : std::as_const(insertions)) {
        QString &line = lines[insertion.at.line];
        if (insertion.ownLines && isBlank(QStringView(line).mid(insertion.at.column))) {
            for (qsizetype i = insertion.text.size() - 1; i >= 0; --i)
                lines.insert(insertion.at.line + 1, insertion.text.at(i));
        } else {
            line.insert(insertion.at.column, QLatin1Char(' ') + insertion.text.join(QLatin1Char(' ')));
        }
    }
}
