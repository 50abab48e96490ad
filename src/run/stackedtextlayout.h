#ifndef MORVEL_STACKEDTEXTLAYOUT_H
#define MORVEL_STACKEDTEXTLAYOUT_H

#include <QAbstractTextDocumentLayout>
#include <QList>
#include <QSizeF>

#include <QFont>
#include <QTextFormat>
#include <QTextOption>

#include <optional>

// Knows the exact size Qt's layout gives a piece of a log at its page size without laying it out,
// when that can be known: one format throughout, only letters of its font, no line wider than the
// page. Keeps what it measured for the next piece alike.
class PieceSizer
{
public:
    std::optional<QSizeF> sizeOf(const QTextDocument *piece);

private:
    // The height of one line and of the rest, measured on a sample laid out as the piece would be.
    struct Sample
    {
        QFont font;
        QTextOption option;
        QTextFrameFormat frame;
        QSizeF page;
        QTextBlockFormat block;
        QTextCharFormat chars;
        QSizeF oneLine;
        qreal lineHeight = 0;
    };
    std::optional<Sample> m_sample;
};

// Lays a document out as a stack of pieces: copies of consecutive parts of its text, each laid out
// by Qt's own document layout in a document of its own. Pieces can be laid out on several threads
// at once before they are stacked, which is what makes a very long log quick to show; what the
// editor draws is what Qt's layout draws for each piece.
//
// Every piece after the first starts at a paragraph start of the document, and where two pieces
// meet the paragraphs have no margins, so that stacking them gives the heights one layout would.
// New text added at the end goes into the last piece; any other change of the text makes the
// layout start over with one piece, a copy of the whole document.
class StackedTextLayout : public QAbstractTextDocumentLayout
{
    Q_OBJECT

public:
    // Ends a piece that another piece follows, before it is laid out: with a paragraph of no
    // height after its text, so that a selection can go on over the end of its last paragraph.
    static void closePiece(QTextDocument *piece);

    // Lets a piece wait with its layout until it is shown, when the sizer knows its size without
    // it. Returns false, changing nothing, when not: the piece must then be laid out.
    static bool prepareWithoutLayout(QTextDocument *piece, PieceSizer &sizer);

    // Installs the layout on `doc` when the pieces hold its text, taking them over, and returns it;
    // returns nullptr (and deletes the pieces) when they do not. Every piece but the last must be
    // closed, and laid out or prepared to be laid out when shown. The pieces must live in doc's
    // thread now; they may have been laid out on other threads, which may have ended.
    static StackedTextLayout *install(QTextDocument *doc, QList<QTextDocument *> pieces);

    void draw(QPainter *painter, const PaintContext &context) override;
    int hitTest(const QPointF &point, Qt::HitTestAccuracy accuracy) const override;
    int pageCount() const override;
    QSizeF documentSize() const override;
    QRectF frameBoundingRect(QTextFrame *frame) const override;
    QRectF blockBoundingRect(const QTextBlock &block) const override;

    int pieceCount() const { return int(m_pieces.size()); }
    int piecesLaidOut() const;

protected:
    void documentChanged(int from, int charsRemoved, int charsAdded) override;

private:
    struct Piece
    {
        QTextDocument *doc = nullptr;
        int position = 0; // of its first character in the document
        int block = 0;    // number of its first block in the document
        QSizeF size;      // as its layout last reported it, or as known without it
        qreal top = 0;    // where its own origin lies in the document
        bool laidOut = false;
        bool sizeKnown = true; // false: a guess until it is laid out
    };

    explicit StackedTextLayout(QTextDocument *doc);
    void adopt(QTextDocument *piece, const QSizeF &size, bool laidOut);
    void follow(QTextDocument *piece);
    const Piece &laidOutPiece(int k) const;
    void restack();
    void startOver();
    bool appendToLastPiece(int from, int charsAdded);
    void scheduleFollowSettings();
    void followSettings();
    void layOutUnknownPiece();
    int pieceEnd(int k) const;
    int pieceAtPosition(int position) const;
    int pieceAtBlock(int blockNumber) const;
    int pieceAtY(qreal y) const;

    mutable QList<Piece> m_pieces; // laid out when first shown
    mutable bool m_sizeNewsPending = false;
    bool m_editPending = false;   // the document announced a change of its text
    bool m_followPending = false; // a change of page size or font is still to be passed on
    PieceSizer m_sizer;
};

#endif
