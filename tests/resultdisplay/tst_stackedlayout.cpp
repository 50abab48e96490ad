// A log laid out as stacked pieces must look and answer exactly as the same log laid out whole.
#include "logstyle.h"
#include "stackedtextlayout.h"

#include <QAbstractTextDocumentLayout>
#include <QImage>
#include <QScrollBar>
#include <QTextBlock>
#include <QTextCursor>
#include <QTextEdit>
#include <QtTest>

namespace {

// A log like the dialog's: styled entries, then a plain result in paragraphs of joined lines.
void fillLog(QTextEdit &log)
{
    log.append(QStringLiteral("<br>-->  Starting Morvel ..."));
    log.append(LogStyle::error(QStringLiteral(" Something went wrong with morvel program ! ")));
    log.append(LogStyle::heading(QStringLiteral("MORVEL.OUT")));
    QString result;
    for (int i = 0; i < 3000; ++i) {
        result += QStringLiteral("  Fe1   - O2      2.0135(3)  x2   %1").arg(i);
        if (i >= 1000 && i < 1200 && i % 20 == 5)
            result += QStringLiteral(" and a long remark that has to wrap in the log because it goes on and on");
        result += i % 16 == 15 || i == 2999 ? QChar(u'\n') : QChar(QChar::LineSeparator);
    }
    log.append(result);
}

// A copy of the blocks [first, end) of `doc`, laid out at `width` as the editor would.
QTextDocument *pieceOf(const QTextDocument *doc, int first, int end, qreal width)
{
    QTextDocument *piece = doc->clone();
    QTextCursor cursor(piece);
    if (end < doc->blockCount()) {
        cursor.setPosition(doc->findBlockByNumber(end).position() - 1);
        cursor.movePosition(QTextCursor::End, QTextCursor::KeepAnchor);
        cursor.removeSelectedText();
    }
    if (first > 0) {
        const QTextBlock block = doc->findBlockByNumber(first);
        cursor.setPosition(0);
        cursor.setPosition(block.position(), QTextCursor::KeepAnchor);
        cursor.removeSelectedText();
        cursor.setBlockFormat(block.blockFormat());
        cursor.setBlockCharFormat(block.charFormat());
    }
    if (end < doc->blockCount())
        StackedTextLayout::closePiece(piece);
    piece->setPageSize(QSizeF(width, -1));
    return piece;
}

void prepare(QTextEdit &log)
{
    log.setReadOnly(true);
    log.resize(600, 300);
    log.show();
}

// Until both layouts have laid everything out and the scroll bars have followed.
void settle(QTextEdit &a, QTextEdit &b)
{
    for (int round = 0; round < 100; ++round) {
        for (QTextEdit *log : {&a, &b}) {
            QTextDocument *doc = log->document();
            for (QTextBlock block = doc->begin(); block.isValid(); block = block.next())
                doc->documentLayout()->blockBoundingRect(block);
        }
        QTest::qWait(20);
        if (a.verticalScrollBar()->maximum() == b.verticalScrollBar()->maximum()
            && a.document()->documentLayout()->documentSize() == b.document()->documentLayout()->documentSize())
            return;
    }
}

QImage view(QTextEdit &log, int scroll)
{
    log.verticalScrollBar()->setValue(scroll);
    return log.viewport()->grab().toImage();
}

// Where the second piece starts in the document, in pixels.
qreal seamY(const QTextEdit &log, int block)
{
    return log.document()->documentLayout()->blockBoundingRect(log.document()->findBlockByNumber(block)).top();
}

} // namespace

class TestStackedLayout : public QObject
{
    Q_OBJECT

private slots:
    void init();
    void cleanup();
    void looksAsOneLayout();
    void followsAppendsAndWidth();
    void waitingPiecesFollowWidth();
    void startsOverWhenCleared();
    void refusesPiecesThatDoNotAddUp();

private:
    void compare(int line);

    QTextEdit *m_reference = nullptr;
    QTextEdit *m_stacked = nullptr;
    StackedTextLayout *m_layout = nullptr;
    int m_seamBlock = 0;
    int m_prepared = 0; // pieces that waited for their layout
};

void TestStackedLayout::init()
{
    m_reference = new QTextEdit;
    prepare(*m_reference);
    fillLog(*m_reference);

    m_stacked = new QTextEdit;
    prepare(*m_stacked);
    QTextDocument *doc = m_reference->document()->clone();
    // Five pieces: the log's entries with the first result lines, lines with wrapping remarks,
    // and plain lines that need no layout before they are shown.
    const int blocks = doc->blockCount();
    const QList<int> starts{0, blocks / 5, 2 * blocks / 5, 3 * blocks / 5, 4 * blocks / 5, blocks};
    m_seamBlock = starts.at(1);
    const qreal width = m_reference->viewport()->width();
    QList<QTextDocument *> pieces;
    PieceSizer sizer;
    for (int k = 0; k + 1 < starts.size(); ++k) {
        pieces.append(pieceOf(doc, starts.at(k), starts.at(k + 1), width));
        m_prepared += StackedTextLayout::prepareWithoutLayout(pieces.last(), sizer) ? 1 : 0;
    }
    m_layout = StackedTextLayout::install(doc, pieces);
    QVERIFY(m_layout);
    doc->setParent(m_stacked);
    m_stacked->setDocument(doc);
    m_reference->document()->documentLayout()->documentSize();
    QTest::qWait(50);
}

void TestStackedLayout::cleanup()
{
    delete m_reference;
    delete m_stacked;
}

// Same size, same place for every paragraph, same answer for every point, same pixels.
void TestStackedLayout::compare(int line)
{
    const QString where = QStringLiteral("called from line %1").arg(line);
    QTextDocument *ref = m_reference->document();
    QTextDocument *doc = m_stacked->document();
    QCOMPARE(doc->toPlainText(), ref->toPlainText());
    QVERIFY2(doc->documentLayout()->documentSize() == ref->documentLayout()->documentSize(), qPrintable(where));
    for (QTextBlock a = ref->begin(), b = doc->begin(); a.isValid(); a = a.next(), b = b.next()) {
        const QRectF expected = ref->documentLayout()->blockBoundingRect(a);
        const QRectF actual = doc->documentLayout()->blockBoundingRect(b);
        QVERIFY2(actual == expected, qPrintable(QStringLiteral("block %1, %2").arg(a.blockNumber()).arg(where)));
        for (const QPointF &point : {expected.topLeft() + QPointF(30, 3), expected.center(), expected.bottomRight() - QPointF(2, 2)}) {
            QVERIFY2(doc->documentLayout()->hitTest(point, Qt::FuzzyHit) == ref->documentLayout()->hitTest(point, Qt::FuzzyHit),
                     qPrintable(QStringLiteral("point in block %1, %2").arg(a.blockNumber()).arg(where)));
        }
    }
    QCOMPARE(m_stacked->verticalScrollBar()->maximum(), m_reference->verticalScrollBar()->maximum());
    const int seam = int(seamY(*m_stacked, m_seamBlock)) - m_stacked->viewport()->height() / 2;
    for (int scroll : {0, seam, m_reference->verticalScrollBar()->maximum()}) {
        QVERIFY2(view(*m_stacked, scroll) == view(*m_reference, scroll),
                 qPrintable(where + QStringLiteral(", view scrolled to %1").arg(scroll)));
    }
}

void TestStackedLayout::looksAsOneLayout()
{
    QCOMPARE(m_layout->pieceCount(), 5);
    // The first piece holds the styled entries, the next two lines that wrap: they are laid out.
    QCOMPARE(m_prepared, 2);
    QVERIFY(m_layout->piecesLaidOut() < m_layout->pieceCount());
    // Sizes known without a layout are exact: the scroll range is right before anything is laid out.
    QCOMPARE(m_stacked->document()->documentLayout()->documentSize(),
             m_reference->document()->documentLayout()->documentSize());
    QCOMPARE(m_stacked->verticalScrollBar()->maximum(), m_reference->verticalScrollBar()->maximum());
    settle(*m_reference, *m_stacked);
    QCOMPARE(m_layout->piecesLaidOut(), m_layout->pieceCount());
    compare(__LINE__);

    // A selection across the seam is drawn as one.
    const int from = m_reference->document()->findBlockByNumber(m_seamBlock - 1).position() + 5;
    const int to = m_reference->document()->findBlockByNumber(m_seamBlock).position() + 40;
    for (QTextEdit *log : {m_reference, m_stacked}) {
        QTextCursor cursor(log->document());
        cursor.setPosition(from);
        cursor.setPosition(to, QTextCursor::KeepAnchor);
        log->setTextCursor(cursor);
    }
    compare(__LINE__);

    // Anchors are found where they are drawn.
    const QRectF first = m_stacked->document()->documentLayout()->blockBoundingRect(m_stacked->document()->begin());
    QCOMPARE(m_stacked->document()->documentLayout()->anchorAt(first.center()),
             m_reference->document()->documentLayout()->anchorAt(first.center()));
}

void TestStackedLayout::followsAppendsAndWidth()
{
    settle(*m_reference, *m_stacked);
    // Entries after the result go into the last piece, which lays them out at once.
    for (QTextEdit *log : {m_reference, m_stacked}) {
        log->verticalScrollBar()->setValue(log->verticalScrollBar()->maximum());
        log->append(QStringLiteral(" "));
        log->append(LogStyle::error(QStringLiteral(" There is no MORVEL.OUT file in the current directory! ")));
        log->append(QStringLiteral("plain words & more"));
    }
    QCOMPARE(m_layout->pieceCount(), 5);
    QCOMPARE(m_stacked->verticalScrollBar()->value(), m_stacked->verticalScrollBar()->maximum());
    settle(*m_reference, *m_stacked);
    compare(__LINE__);

    // A narrower log: every piece is laid out again at the new width.
    m_reference->resize(420, 300);
    m_stacked->resize(420, 300);
    settle(*m_reference, *m_stacked);
    compare(__LINE__);
}

void TestStackedLayout::waitingPiecesFollowWidth()
{
    // Pieces not yet shown know their size at another width without a layout too, as long as
    // their lines still fit; a width too narrow for them gets them laid out.
    for (int width : {500, 300}) {
        m_reference->resize(width, 300);
        m_stacked->resize(width, 300);
        QTest::qWait(50);
        m_reference->document()->documentLayout()->documentSize();
        if (width == 300) // the lines no longer fit: the pieces get laid out, in the background
            QTRY_COMPARE(m_layout->piecesLaidOut(), m_layout->pieceCount());
        else
            QVERIFY(m_layout->piecesLaidOut() < m_layout->pieceCount());
        QTRY_COMPARE(m_stacked->document()->documentLayout()->documentSize(),
                     m_reference->document()->documentLayout()->documentSize());
    }
    settle(*m_reference, *m_stacked);
    compare(__LINE__);
}

void TestStackedLayout::startsOverWhenCleared()
{
    for (QTextEdit *log : {m_reference, m_stacked}) {
        log->clear();
        log->append(QStringLiteral("<br>-->  Starting Morvel ..."));
        log->append(LogStyle::heading(QStringLiteral("next run")));
    }
    QCOMPARE(m_layout->pieceCount(), 1);
    m_seamBlock = 0;
    settle(*m_reference, *m_stacked);
    compare(__LINE__);
}

void TestStackedLayout::refusesPiecesThatDoNotAddUp()
{
    QTextDocument doc;
    doc.setPlainText(QStringLiteral("one\ntwo\nthree"));
    auto *short1 = new QTextDocument;
    short1->setPlainText(QStringLiteral("one"));
    QPointer<QTextDocument> watch(short1);
    QVERIFY(!StackedTextLayout::install(&doc, {short1}));
    QVERIFY(watch.isNull()); // the pieces are not left behind
    QVERIFY(!qobject_cast<StackedTextLayout *>(doc.documentLayout()));
}

QTEST_MAIN(TestStackedLayout)
#include "tst_stackedlayout.moc"
