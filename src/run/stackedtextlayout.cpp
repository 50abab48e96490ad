#include "stackedtextlayout.h"

#include <QFontMetricsF>
#include <QHash>
#include <QPainter>
#include <QTextBlock>
#include <QTextCursor>
#include <QTextDocument>
#include <QTextDocumentFragment>
#include <QTextFrame>

#include <algorithm>
#include <utility>

namespace {

qreal topInset(const QTextDocument *doc)
{
    const QTextFrameFormat format = doc->rootFrame()->frameFormat();
    return format.topMargin() + format.border() + format.padding();
}

qreal bottomInset(const QTextDocument *doc)
{
    const QTextFrameFormat format = doc->rootFrame()->frameFormat();
    return format.bottomMargin() + format.border() + format.padding();
}

bool sameOption(const QTextOption &a, const QTextOption &b)
{
    return a.alignment() == b.alignment() && a.wrapMode() == b.wrapMode() && a.flags() == b.flags()
           && a.textDirection() == b.textDirection() && a.tabStopDistance() == b.tabStopDistance()
           && a.tabArray() == b.tabArray() && a.useDesignMetrics() == b.useDesignMetrics();
}

// A text layout remembers the last glyph engine it used, and engines belong to the thread that
// made them: they are gone with a worker thread that laid the piece out. Setting the layout's
// font (not used for text in a document, which has formats) makes it forget the engine.
void forgetGlyphEngines(QTextDocument *piece)
{
    const QFont font = piece->defaultFont();
    for (QTextBlock block = piece->begin(); block.isValid(); block = block.next())
        block.layout()->setFont(font);
}

const char *const sizeProperty = "stackedTextLayoutSize";

// A piece's paragraphs all look alike: nothing in their format that the size cannot foresee.
bool plainParagraphFormat(const QTextBlockFormat &format)
{
    return format.topMargin() == 0 && format.bottomMargin() == 0 && format.leftMargin() == 0
           && format.rightMargin() == 0 && format.textIndent() == 0 && format.indent() == 0
           && format.alignment() != Qt::AlignJustify && format.tabPositions().isEmpty()
           && !format.hasProperty(QTextFormat::LineHeight)
           && !format.hasProperty(QTextFormat::ObjectIndex)
           && format.marker() == QTextBlockFormat::MarkerType::NoMarker;
}

bool plainCharFormat(const QTextCharFormat &format)
{
    const QFont font = format.font();
    return format.verticalAlignment() == QTextCharFormat::AlignNormal && !format.isAnchor()
           && font.letterSpacing() == 0 && font.wordSpacing() == 0
           && font.capitalization() == QFont::MixedCase;
}

bool isClosingParagraph(const QTextBlock &block)
{
    const QTextBlockFormat format = block.blockFormat();
    return !block.next().isValid() && block.length() == 1
           && format.lineHeightType() == QTextBlockFormat::FixedHeight && format.lineHeight() == 0;
}

// Small documents are laid out at once when the layout starts over; larger ones lazily, as the
// editor does it.
constexpr int layoutAtOnceChars = 256 * 1024;

} // namespace

StackedTextLayout::StackedTextLayout(QTextDocument *doc) : QAbstractTextDocumentLayout(doc) {}

bool StackedTextLayout::prepareWithoutLayout(QTextDocument *piece, PieceSizer &sizer)
{
    const std::optional<QSizeF> size = sizer.sizeOf(piece);
    if (size)
        piece->setProperty(sizeProperty, *size);
    return size.has_value();
}

std::optional<QSizeF> PieceSizer::sizeOf(const QTextDocument *piece)
{
    const qreal pageWidth = piece->pageSize().width();
    const QTextBlock first = piece->begin();
    const QTextOption::WrapMode wrap = piece->defaultTextOption().wrapMode();
    if (pageWidth <= 0 || !first.isValid() || wrap == QTextOption::NoWrap || wrap == QTextOption::ManualWrap)
        return std::nullopt;
    const QTextBlockFormat blockFormat = first.blockFormat();
    const QTextCharFormat charFormat = first.charFormat();
    if (!plainParagraphFormat(blockFormat) || !plainCharFormat(charFormat))
        return std::nullopt;

    // A line fits when the sum of its letters' advances, with room to spare for kerning, does.
    const QFont font = charFormat.font();
    const QFontMetricsF metrics(font);
    const QTextFrameFormat frame = piece->rootFrame()->frameFormat();
    const qreal room = pageWidth - frame.leftMargin() - frame.rightMargin() - 2 * (frame.border() + frame.padding());
    const qreal limit = room * 0.9 - 2 * metrics.maxWidth();
    const qreal tab = piece->defaultTextOption().tabStopDistance();
    qreal advance[256];
    for (int c = 0; c < 256; ++c) {
        const QChar ch(c);
        const bool letter = (c >= 0x20 && c < 0x7f) || (c >= 0xa0 && c != 0xad);
        advance[c] = letter && metrics.inFont(ch) ? metrics.horizontalAdvance(ch) : -1;
    }
    advance[int('\t')] = tab;
    // Beyond Latin-1: letters and signs of the font that stand alone (Greek, Cyrillic, symbols);
    // not marks that combine with the letter before, nor what takes another direction.
    QHash<char16_t, qreal> otherAdvance;
    auto advanceOf = [&](char16_t c) -> qreal {
        if (c <= 0xff)
            return advance[c];
        auto it = otherAdvance.constFind(c);
        if (it != otherAdvance.cend())
            return *it;
        const QChar ch(c);
        const QChar::Direction direction = ch.direction();
        const bool alone = !ch.isSurrogate() && !ch.isMark() && ch.isPrint() && c != QChar::ReplacementCharacter
                           && (direction == QChar::DirL || direction == QChar::DirON || direction == QChar::DirEN
                               || direction == QChar::DirET || direction == QChar::DirES || direction == QChar::DirCS);
        const qreal width = alone && metrics.inFont(ch) ? metrics.horizontalAdvance(ch) : -1;
        otherAdvance.insert(c, width);
        return width;
    };

    qsizetype lines = 0;
    for (QTextBlock block = first; block.isValid(); block = block.next()) {
        if (isClosingParagraph(block) && block != first)
            break;
        if (block.blockFormat() != blockFormat || block.charFormat() != charFormat)
            return std::nullopt;
        for (auto it = block.begin(); !it.atEnd(); ++it) {
            if (it.fragment().charFormat() != charFormat)
                return std::nullopt;
        }
        const QString text = block.text();
        if (text.endsWith(QChar::LineSeparator))
            return std::nullopt;
        qreal width = 0;
        for (const QChar ch : text) {
            const char16_t c = ch.unicode();
            if (c == QChar::LineSeparator) {
                ++lines;
                width = 0;
                continue;
            }
            const qreal step = advanceOf(c);
            if (step < 0)
                return std::nullopt;
            width += step;
            if (width > limit)
                return std::nullopt;
        }
        ++lines;
    }

    if (!m_sample || m_sample->font != piece->defaultFont() || !sameOption(m_sample->option, piece->defaultTextOption())
        || m_sample->frame != frame || m_sample->page != piece->pageSize() || m_sample->block != blockFormat
        || m_sample->chars != charFormat) {
        QTextDocument sample;
        sample.setDefaultFont(piece->defaultFont());
        sample.setDefaultTextOption(piece->defaultTextOption());
        sample.setDocumentMargin(piece->documentMargin());
        sample.rootFrame()->setFrameFormat(frame);
        sample.setPageSize(piece->pageSize());
        QTextCursor cursor(&sample);
        cursor.setBlockFormat(blockFormat);
        cursor.setBlockCharFormat(charFormat);
        cursor.setCharFormat(charFormat);
        cursor.insertText(QStringLiteral("x"));
        const QSizeF one = sample.documentLayout()->documentSize();
        cursor.insertText(QString(QChar::LineSeparator) + QStringLiteral("x"));
        const QSizeF two = sample.documentLayout()->documentSize();
        m_sample = Sample{piece->defaultFont(), piece->defaultTextOption(), frame, piece->pageSize(),
                          blockFormat, charFormat, one, two.height() - one.height()};
    }
    return QSizeF(m_sample->oneLine.width(), m_sample->oneLine.height() + m_sample->lineHeight * qreal(lines - 1));
}

void StackedTextLayout::closePiece(QTextDocument *piece)
{
    QTextCursor cursor(piece);
    cursor.movePosition(QTextCursor::End);
    QTextBlockFormat nothing;
    nothing.setLineHeight(0, QTextBlockFormat::FixedHeight);
    cursor.insertBlock(nothing);
}

StackedTextLayout *StackedTextLayout::install(QTextDocument *doc, QList<QTextDocument *> pieces)
{
    // Where two pieces meet, the document has a paragraph separator; the first piece has it too,
    // followed by the paragraph closePiece added.
    int characters = 0;
    int blocks = 0;
    for (const QTextDocument *piece : std::as_const(pieces)) {
        const int closing = piece == pieces.last() ? 0 : 1;
        characters += piece->characterCount() - closing;
        blocks += piece->blockCount() - closing;
    }
    if (pieces.isEmpty() || characters != doc->characterCount() || blocks != doc->blockCount()) {
        qDeleteAll(pieces);
        return nullptr;
    }
    auto *layout = new StackedTextLayout(doc);
    for (QTextDocument *piece : std::as_const(pieces)) {
        const QVariant known = piece->property(sizeProperty);
        piece->setProperty(sizeProperty, QVariant());
        if (known.isValid()) {
            layout->adopt(piece, known.toSizeF(), false);
        } else {
            forgetGlyphEngines(piece);
            layout->adopt(piece, piece->documentLayout()->documentSize(), true);
        }
    }
    layout->restack();
    doc->setDocumentLayout(layout);
    // Only from now on: installing announces the whole text as new.
    connect(doc, &QTextDocument::contentsChange, layout, [layout] { layout->m_editPending = true; });
    return layout;
}

void StackedTextLayout::adopt(QTextDocument *piece, const QSizeF &size, bool laidOut)
{
    Piece entry;
    entry.doc = piece;
    entry.size = size;
    entry.laidOut = laidOut;
    if (!m_pieces.isEmpty()) {
        const Piece &before = m_pieces.last();
        entry.position = before.position + before.doc->characterCount() - 1;
        entry.block = before.block + before.doc->blockCount() - 1;
    }
    piece->setParent(this);
    m_pieces.append(entry);
    if (laidOut)
        follow(piece);
}

// Passes on what a piece's own layout says: its size as it lays out, and what to draw again.
void StackedTextLayout::follow(QTextDocument *piece)
{
    QAbstractTextDocumentLayout *layout = piece->documentLayout();
    connect(layout, &QAbstractTextDocumentLayout::documentSizeChanged, this, [this, piece](const QSizeF &newSize) {
        for (Piece &p : m_pieces) {
            if (p.doc == piece && p.size != newSize) {
                p.size = newSize;
                restack();
                emit documentSizeChanged(documentSize());
            }
        }
    });
    connect(layout, &QAbstractTextDocumentLayout::update, this, [this, piece](const QRectF &rect) {
        for (const Piece &p : std::as_const(m_pieces)) {
            if (p.doc == piece)
                emit update(rect.translated(0, p.top));
        }
    });
    connect(layout, &QAbstractTextDocumentLayout::updateBlock, this, [this, piece](const QTextBlock &block) {
        for (const Piece &p : std::as_const(m_pieces)) {
            if (p.doc == piece)
                emit updateBlock(document()->findBlockByNumber(p.block + block.blockNumber()));
        }
    });
}

// Piece k, laid out now if it was waiting to be shown. Its size was known exactly; should it
// differ all the same, the pieces after it move and the editor hears of it.
const StackedTextLayout::Piece &StackedTextLayout::laidOutPiece(int k) const
{
    Piece &piece = m_pieces[k];
    if (!piece.laidOut) {
        piece.laidOut = true;
        auto *self = const_cast<StackedTextLayout *>(this);
        self->follow(piece.doc);
        const QSizeF size = piece.doc->documentLayout()->documentSize();
        if (size != piece.size) {
            piece.size = size;
            self->restack();
            if (!m_sizeNewsPending) {
                // Not from inside a paint or a question about a position: from the event loop.
                m_sizeNewsPending = true;
                QMetaObject::invokeMethod(self, [self] {
                    self->m_sizeNewsPending = false;
                    emit self->documentSizeChanged(self->documentSize());
                    emit self->update();
                }, Qt::QueuedConnection);
            }
        }
    }
    return piece;
}

int StackedTextLayout::piecesLaidOut() const
{
    return int(std::count_if(m_pieces.cbegin(), m_pieces.cend(), [](const Piece &p) { return p.laidOut; }));
}

void StackedTextLayout::restack()
{
    for (qsizetype k = 1; k < m_pieces.size(); ++k) {
        const Piece &before = m_pieces.at(k - 1);
        m_pieces[k].top = before.top + before.size.height() - bottomInset(before.doc)
                          - topInset(m_pieces.at(k).doc);
    }
}

// One past the last document position that piece k shows.
int StackedTextLayout::pieceEnd(int k) const
{
    const Piece &piece = m_pieces.at(k);
    return k + 1 < m_pieces.size() ? m_pieces.at(k + 1).position : piece.position + piece.doc->characterCount();
}

int StackedTextLayout::pieceAtPosition(int position) const
{
    int k = int(m_pieces.size()) - 1;
    while (k > 0 && m_pieces.at(k).position > position)
        --k;
    return k;
}

int StackedTextLayout::pieceAtBlock(int blockNumber) const
{
    int k = int(m_pieces.size()) - 1;
    while (k > 0 && m_pieces.at(k).block > blockNumber)
        --k;
    return k;
}

int StackedTextLayout::pieceAtY(qreal y) const
{
    int k = int(m_pieces.size()) - 1;
    while (k > 0 && m_pieces.at(k).top + topInset(m_pieces.at(k).doc) > y)
        --k;
    return k;
}

void StackedTextLayout::draw(QPainter *painter, const PaintContext &context)
{
    const QVariant cursorWidth = property("cursorWidth");
    for (int k = 0; k < m_pieces.size(); ++k) {
        const QRectF area(0, m_pieces.at(k).top, 1e9, m_pieces.at(k).size.height());
        if (context.clip.isValid() && !context.clip.intersects(area))
            continue;
        const Piece &piece = laidOutPiece(k);
        const int length = piece.doc->characterCount();
        const int shown = pieceEnd(k) - piece.position;
        PaintContext local;
        local.palette = context.palette;
        local.clip = context.clip.isValid() ? context.clip.translated(0, -piece.top) : context.clip;
        const int cursor = context.cursorPosition - piece.position;
        local.cursorPosition = context.cursorPosition >= 0 && cursor >= 0 && cursor < shown ? cursor : -1;
        for (const Selection &selection : context.selections) {
            // Clamped to the piece; a selection that goes on into the next piece covers the
            // closing paragraph's separator, as in the document.
            const int start = selection.cursor.selectionStart() - piece.position;
            const int end = selection.cursor.selectionEnd() - piece.position;
            if (end < 0 || start >= shown)
                continue;
            QTextCursor mapped(piece.doc);
            mapped.setPosition(std::clamp(selection.cursor.anchor() - piece.position, 0, length - 1));
            mapped.setPosition(std::clamp(selection.cursor.position() - piece.position, 0, length - 1),
                               QTextCursor::KeepAnchor);
            local.selections.append({mapped, selection.format});
        }
        QAbstractTextDocumentLayout *layout = piece.doc->documentLayout();
        if (cursorWidth.isValid())
            layout->setProperty("cursorWidth", cursorWidth);
        painter->save();
        painter->translate(0, piece.top);
        layout->draw(painter, local);
        painter->restore();
    }
}

int StackedTextLayout::hitTest(const QPointF &point, Qt::HitTestAccuracy accuracy) const
{
    const Piece &piece = laidOutPiece(pieceAtY(point.y()));
    const int position = piece.doc->documentLayout()->hitTest(point - QPointF(0, piece.top), accuracy);
    return position < 0 ? -1 : piece.position + position;
}

int StackedTextLayout::pageCount() const
{
    return 1;
}

QSizeF StackedTextLayout::documentSize() const
{
    qreal width = 0;
    for (const Piece &piece : m_pieces)
        width = std::max(width, piece.size.width());
    const Piece &last = m_pieces.last();
    return QSizeF(width, last.top + last.size.height());
}

QRectF StackedTextLayout::frameBoundingRect(QTextFrame *frame) const
{
    if (!frame || frame == document()->rootFrame())
        return QRectF(QPointF(0, 0), documentSize());
    const Piece &piece = laidOutPiece(pieceAtPosition(frame->firstPosition()));
    const int first = frame->firstPosition() - piece.position;
    QTextFrame *inPiece = piece.doc->frameAt(first);
    while (inPiece && inPiece->firstPosition() != first)
        inPiece = inPiece->parentFrame();
    if (!inPiece)
        return QRectF();
    return piece.doc->documentLayout()->frameBoundingRect(inPiece).translated(0, piece.top);
}

QRectF StackedTextLayout::blockBoundingRect(const QTextBlock &block) const
{
    if (!block.isValid())
        return QRectF();
    const Piece &piece = laidOutPiece(pieceAtBlock(block.blockNumber()));
    const QTextBlock inPiece = piece.doc->findBlockByNumber(block.blockNumber() - piece.block);
    if (!inPiece.isValid())
        return QRectF();
    return piece.doc->documentLayout()->blockBoundingRect(inPiece).translated(0, piece.top);
}

void StackedTextLayout::documentChanged(int from, int charsRemoved, int charsAdded)
{
    const Piece &last = m_pieces.last();
    const bool textChanged = std::exchange(m_editPending, false)
                             || last.position + last.doc->characterCount() != document()->characterCount();
    if (!textChanged) {
        scheduleFollowSettings();
        return;
    }
    if (charsRemoved > 0 || !appendToLastPiece(from, charsAdded))
        startOver();
    restack();
    emit documentSizeChanged(documentSize());
    emit update();
}

bool StackedTextLayout::appendToLastPiece(int from, int charsAdded)
{
    laidOutPiece(int(m_pieces.size()) - 1);
    Piece &last = m_pieces.last();
    QTextDocument *doc = document();
    if (from < last.position || from - last.position >= last.doc->characterCount())
        return false;
    QTextCursor source(doc);
    source.setPosition(from);
    source.setPosition(from + charsAdded, QTextCursor::KeepAnchor);
    QTextCursor target(last.doc);
    target.setPosition(from - last.position);
    target.insertFragment(QTextDocumentFragment(source));
    if (last.position + last.doc->characterCount() != doc->characterCount()
        || last.block + last.doc->blockCount() != doc->blockCount())
        return false;
    // The piece has laid the new text out already; its size is known without waiting.
    last.size = last.doc->documentLayout()->documentSize();
    return true;
}

void StackedTextLayout::startOver()
{
    // Copying asks this layout about the document; the old pieces answer until the copy is made.
    QTextDocument *copy = document()->clone();
    QList<Piece> old = std::exchange(m_pieces, {});
    const bool now = copy->characterCount() <= layoutAtOnceChars;
    adopt(copy, now ? copy->documentLayout()->documentSize() : QSizeF(0, 0), true);
    for (const Piece &piece : old)
        delete piece.doc;
}

void StackedTextLayout::scheduleFollowSettings()
{
    // The editor tries out widths while it decides about its scroll bars; only the last one counts.
    if (!m_followPending) {
        m_followPending = true;
        QMetaObject::invokeMethod(this, [this] {
            m_followPending = false;
            followSettings();
        }, Qt::QueuedConnection);
    }
}

void StackedTextLayout::followSettings()
{
    const QTextDocument *doc = document();
    bool changed = false;
    for (const Piece &piece : std::as_const(m_pieces)) {
        QTextDocument *p = piece.doc;
        if (p->defaultFont() != doc->defaultFont()) {
            p->setDefaultFont(doc->defaultFont());
            changed = true;
        }
        if (!sameOption(p->defaultTextOption(), doc->defaultTextOption())) {
            p->setDefaultTextOption(doc->defaultTextOption());
            changed = true;
        }
        if (p->indentWidth() != doc->indentWidth()) {
            p->setIndentWidth(doc->indentWidth());
            changed = true;
        }
        if (p->pageSize() != doc->pageSize()) {
            p->setPageSize(doc->pageSize());
            changed = true;
        }
    }
    if (!changed)
        return;
    // A piece still waiting to be shown knows its new size without a layout, or gets laid out
    // in the background, one piece per turn of the event loop.
    bool unknown = false;
    for (Piece &piece : m_pieces) {
        if (piece.laidOut)
            continue;
        const std::optional<QSizeF> size = m_sizer.sizeOf(piece.doc);
        piece.sizeKnown = size.has_value();
        if (size)
            piece.size = *size;
        unknown = unknown || !size;
    }
    if (unknown)
        QMetaObject::invokeMethod(this, &StackedTextLayout::layOutUnknownPiece, Qt::QueuedConnection);
    restack();
    emit documentSizeChanged(documentSize());
}

void StackedTextLayout::layOutUnknownPiece()
{
    for (int k = 0; k < m_pieces.size(); ++k) {
        if (!m_pieces.at(k).laidOut && !m_pieces.at(k).sizeKnown) {
            laidOutPiece(k);
            QMetaObject::invokeMethod(this, &StackedTextLayout::layOutUnknownPiece, Qt::QueuedConnection);
            return;
        }
    }
}
