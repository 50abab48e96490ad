#include "resultdisplay.h"
#include "resultdisplaytext.h"
#include "stackedtextlayout.h"

#include <QAbstractTextDocumentLayout>
#include <QCoreApplication>
#include <QElapsedTimer>
#include <QFile>
#include <QFontMetricsF>
#include <QPointer>
#include <QScrollBar>
#include <QSemaphore>
#include <QTextBlock>
#include <QTextCursor>
#include <QTextDocument>
#include <QTextEdit>
#include <QTextFrame>
#include <QThread>
#include <QTimer>

#include <algorithm>
#include <utility>

using namespace ResultText;

namespace {

const QString titleAnchor = QStringLiteral("TITLE");

// The result file's first bytes and what is known of the rest.
struct ResultSource
{
    QString path;
    qint64 fileSize = 0;
    QByteArray bytes;
    bool complete = true; // bytes hold the whole file
};

// The formats a new paragraph of the log gets: those of the editor's cursor, as in its append.
struct AppendFormats
{
    QTextBlockFormat block;
    QTextCharFormat chars;
};

// Where the view goes after the append: QTextEdit keeps a read-only log at its bottom when it was
// there, an editable one when its cursor was at the end.
bool logAtBottom(QTextEdit *log)
{
    const QScrollBar *bar = log->verticalScrollBar();
    return log->isReadOnly() ? bar->value() >= bar->maximum() : log->textCursor().atEnd();
}

LogGeometry geometryOf(QTextEdit *log)
{
    const QTextDocument *doc = log->document();
    const QFontMetricsF metrics(doc->defaultFont());
    LogGeometry geometry;
    geometry.averageCharWidth = std::max(1.0, metrics.averageCharWidth());
    geometry.lineHeight = std::max(1.0, metrics.lineSpacing());
    double width = doc->pageSize().width();
    if (width < 0)
        width = log->viewport()->width();
    if (width > 0)
        width = std::max(geometry.averageCharWidth, width - 2 * doc->documentMargin());
    geometry.textWidth = width;
    return geometry;
}

// One entry appended the way QTextEdit::append does it: in one edit block, a new paragraph with
// the editor's formats unless the document is empty, then the text as HTML or as plain text.
int beginAppend(QTextCursor &cursor, const AppendFormats &formats)
{
    QTextDocument *doc = cursor.document();
    cursor.movePosition(QTextCursor::End);
    if (!doc->isEmpty())
        cursor.insertBlock(formats.block, formats.chars);
    else
        cursor.setCharFormat(formats.chars);
    return cursor.position();
}

void appendHtml(QTextDocument *doc, const AppendFormats &formats, const QString &html)
{
    QTextCursor cursor(doc);
    cursor.beginEditBlock();
    beginAppend(cursor, formats);
    cursor.insertHtml(html);
    cursor.endEditBlock();
}

// Where a rich text from `start` on has to end for the log to lay it out in time: the position
// of the first paragraph that is too long or that goes past the height the log keeps, or -1.
// The cut never goes through a table or frame: it falls before the outermost one around it.
int richCutPosition(QTextDocument *doc, int start, const LogGeometry &geometry)
{
    double height = 0.0;
    int cut = -1;
    for (QTextBlock block = doc->findBlock(start); block.isValid(); block = block.next()) {
        const QString text = block.text();
        if (text.size() > maxParagraphChars) {
            cut = block.position() + maxParagraphChars;
            if (text.at(maxParagraphChars).isLowSurrogate())
                --cut;
            break;
        }
        const QTextBlockFormat format = block.blockFormat();
        height += paragraphHeight(text.size(), text.count(QChar::LineSeparator), geometry)
                  + format.topMargin() + format.bottomMargin();
        if (height > maxLogHeight) {
            cut = block.position();
            break;
        }
    }
    // A table or frame is laid out in one piece too.
    QTextFrame *root = doc->rootFrame();
    for (QTextFrame *frame : root->childFrames()) {
        if (frame->firstPosition() < start || (cut >= 0 && frame->firstPosition() > cut))
            continue;
        if (frame->lastPosition() - frame->firstPosition() > 2 * maxParagraphChars) {
            cut = frame->firstPosition() - 1;
            break;
        }
    }
    if (cut < 0)
        return -1;
    QTextFrame *frame = doc->frameAt(cut);
    while (frame && frame != root && frame->parentFrame() != root)
        frame = frame->parentFrame();
    if (frame && frame != root)
        cut = frame->firstPosition() - 1;
    return std::max(cut, start);
}

// Whether lines joined into one paragraph look as they do in paragraphs of their own with this
// format: nothing that applies once a paragraph may differ.
bool linesMayShareParagraphs(const QTextBlockFormat &format)
{
    return format.topMargin() == 0 && format.bottomMargin() == 0 && format.textIndent() == 0
           && format.marker() == QTextBlockFormat::MarkerType::NoMarker
           && !format.hasProperty(QTextFormat::ObjectIndex);
}

// A result's text as the log will show it.
struct PreparedResult
{
    QString text;
    bool rich = false;
    bool whole = true; // false: the log shows only the first part
};

// Lines are joined into paragraphs (joinLines) only for a large result, where it saves most of
// the time; a small one keeps a paragraph a line, exactly as one append makes it.
enum class Lines { AsAppended, Joined };

PreparedResult prepareResult(const ResultSource &source, const AppendFormats &formats,
                             const LogGeometry &geometry, Lines lines)
{
    PreparedResult result;
    result.text = decodeResult(source.bytes, source.complete);
    result.whole = source.complete;
    result.rich = Qt::mightBeRichText(result.text);
    if (!result.rich) {
        const qsizetype shown = plainShownLength(result.text, geometry);
        if (shown < result.text.size()) {
            result.text.truncate(shown);
            result.whole = false;
        }
        if (lines == Lines::Joined && linesMayShareParagraphs(formats.block))
            joinLines(result.text);
    }
    return result;
}

QString tooLargeLineFor(const ResultSource &source)
{
    return tooLargeLine(source.path, std::max<qint64>(source.fileSize, source.bytes.size()));
}

// Appends the result to `doc` as one append of its whole text would, shortened to what the log
// can take; a shortened result is followed by the line that says so.
void appendPrepared(QTextDocument *doc, const AppendFormats &formats, PreparedResult &result,
                    const ResultSource &source, const LogGeometry &geometry)
{
    QTextCursor cursor(doc);
    cursor.beginEditBlock();
    const int start = beginAppend(cursor, formats);
    if (result.rich)
        cursor.insertHtml(result.text);
    else
        cursor.insertText(result.text);
    cursor.endEditBlock();

    if (result.rich) {
        const int cut = richCutPosition(doc, start, geometry);
        if (cut >= 0) {
            QTextCursor tail(doc);
            tail.setPosition(cut);
            tail.movePosition(QTextCursor::End, QTextCursor::KeepAnchor);
            tail.removeSelectedText();
            result.whole = false;
        }
    }
    if (!result.whole)
        appendHtml(doc, formats, tooLargeLineFor(source));
}

void appendResult(QTextDocument *doc, const AppendFormats &formats, const ResultSource &source,
                  const LogGeometry &geometry)
{
    PreparedResult result = prepareResult(source, formats, geometry, Lines::AsAppended);
    appendPrepared(doc, formats, result, source, geometry);
}

// A plain result is shown in pieces of about this many characters: laid out when first shown,
// each takes a few dozen milliseconds.
constexpr qsizetype pieceChars = 128 * 1024;

// An empty document that lays text out as `doc` does.
QTextDocument *emptyLike(const QTextDocument *doc)
{
    auto *piece = new QTextDocument;
    piece->setUndoRedoEnabled(false);
    piece->setDefaultFont(doc->defaultFont());
    piece->setDefaultTextOption(doc->defaultTextOption());
    piece->setIndentWidth(doc->indentWidth());
    piece->setDocumentMargin(doc->documentMargin());
    piece->rootFrame()->setFrameFormat(doc->rootFrame()->frameFormat());
    piece->setBaseUrl(doc->baseUrl());
    return piece;
}

// The width the editor will lay its text out at once it shows the result: with a vertical scroll
// bar, which a result this large needs.
qreal shownPageWidth(QTextEdit *log)
{
    int width = log->viewport()->width();
    const QScrollBar *bar = log->verticalScrollBar();
    if (!bar->isVisibleTo(log) && log->verticalScrollBarPolicy() != Qt::ScrollBarAlwaysOff)
        width -= bar->sizeHint().width();
    return std::max(width, 1);
}

// Lays a document out on a worker thread. The layout ends by starting a timer to report its size;
// letting it fire here leaves no timer to move with the document to the GUI thread (Qt loses the
// bookkeeping of a moved timer when the document is deleted before the GUI thread takes it over).
void layOut(QTextDocument *doc, qreal pageWidth)
{
    doc->setPageSize(QSizeF(pageWidth, -1));
    doc->documentLayout()->documentSize();
    QCoreApplication::processEvents();
}

// Lets the scroll bars follow a layout finished outside the event loop (the layout itself would
// tell the editor only on its next timer).
void publishDocumentSize(QTextDocument *doc)
{
    QAbstractTextDocumentLayout *layout = doc->documentLayout();
    emit layout->documentSizeChanged(layout->documentSize());
}

bool definesAnchor(const QTextDocument *doc, const QString &name)
{
    auto names = [&name](const QTextCharFormat &format) {
        return format.isAnchor() && format.anchorNames().contains(name);
    };
    for (QTextBlock block = doc->begin(); block.isValid(); block = block.next()) {
        if (names(block.charFormat()))
            return true;
        for (auto it = block.begin(); !it.atEnd(); ++it) {
            if (names(it.fragment().charFormat()))
                return true;
        }
    }
    return false;
}

void scrollAfterAppend(QTextEdit *log, bool atBottom)
{
    if (atBottom) {
        QScrollBar *bar = log->verticalScrollBar();
        bar->setValue(bar->maximum());
    }
    // QTextEdit scrolls to the top for an anchor it does not find; a result without one stays
    // where the append left the view.
    if (definesAnchor(log->document(), titleAnchor))
        log->scrollToAnchor(titleAnchor);
}

// A small result, shown before returning.
void showNow(QTextEdit *log, const ResultSource &source)
{
    QTextDocument *doc = log->document();
    const bool atBottom = logAtBottom(log);
    const QTextCursor editorCursor = log->textCursor();
    const QTextCharFormat editorCharFormat = editorCursor.charFormat();
    const AppendFormats formats{editorCursor.blockFormat(), editorCharFormat};

    // Laid out in one pass after the insertion: the editor lays out an insertion at once, which
    // gets very slow for tall texts; a null page size defers it, and restoring the page size makes
    // the layout start over lazily from the top.
    const QSizeF pageSize = doc->pageSize();
    doc->setPageSize(QSizeF(0, 0));
    appendResult(doc, formats, source, geometryOf(log));
    doc->setPageSize(pageSize);

    if (!log->textCursor().hasSelection())
        log->setCurrentCharFormat(editorCharFormat);
    publishDocumentSize(doc);
    scrollAfterAppend(log, atBottom);
}

// A larger result: the log's text with the result appended is built in a copy of the log's
// document on a worker thread; the copy then replaces the log's document. A plain result is
// shown in pieces (see StackedTextLayout), made on a second worker at the same time: the first,
// with the log's earlier text, laid out there, the others laid out when they come into view. A
// rich result is laid out in slices from the event loop. Lives as a child of the log, so it never
// outlives it.
class ResultDisplayJob : public QObject
{
public:
    ResultDisplayJob(QTextEdit *log, ResultSource source);
    ~ResultDisplayJob() override;

    bool isActive() const { return m_active; }
    void cancel();

private:
    void buildCopy();
    void buildLaterPieces();
    void workerFinished();
    void built();
    void layoutSlice();
    void finish();

    QPointer<QTextEdit> m_log;
    QPointer<QTextDocument> m_logDocument; // the document the copy replaces
    QTextDocument *m_copy = nullptr;       // owned until handed to the log
    QTextDocument *m_firstPiece = nullptr; // a plain result's pieces, owned until handed over
    QTextDocument *m_pieceModel = nullptr; // how the later ones lay text out
    QList<QTextDocument *> m_laterPieces;
    QPointer<QTextDocument> m_shown;       // the copy once it is the log's document
    QThread *m_worker = nullptr;
    QThread *m_secondWorker = nullptr;
    QSemaphore m_prepared;                 // the second worker's text is ready
    QStringList m_laterTexts;              // what the later pieces show
    QString m_endLine;                     // and the line after the last one
    QTimer m_layoutTimer;
    QMetaObject::Connection m_watch;
    ResultSource m_source;
    PreparedResult m_result;
    AppendFormats m_formats;
    LogGeometry m_geometry;
    qreal m_pageWidth = 0;
    QTextCharFormat m_editorCharFormat;
    int m_oldLength = 0;
    int m_cursorAnchor = 0;
    int m_cursorPosition = 0;
    int m_scrollValue = 0;
    int m_layoutPosition = 0;
    int m_workersRunning = 2;
    bool m_atBottom = false;
    bool m_active = true;
};

ResultDisplayJob::ResultDisplayJob(QTextEdit *log, ResultSource source)
    : QObject(log), m_log(log), m_logDocument(log->document()), m_source(std::move(source))
{
    QTextDocument *doc = log->document();
    const QTextCursor editorCursor = log->textCursor();
    m_editorCharFormat = editorCursor.charFormat();
    m_formats = {editorCursor.blockFormat(), m_editorCharFormat};
    m_geometry = geometryOf(log);
    m_pageWidth = shownPageWidth(log);
    m_atBottom = logAtBottom(log);
    m_scrollValue = log->verticalScrollBar()->value();
    m_cursorAnchor = editorCursor.anchor();
    m_cursorPosition = editorCursor.position();
    m_oldLength = doc->characterCount();

    m_copy = doc->clone();
    m_copy->setMaximumBlockCount(doc->maximumBlockCount());
    m_copy->setBaseUrl(doc->baseUrl());
    m_copy->setDefaultCursorMoveStyle(doc->defaultCursorMoveStyle());
    m_copy->setUndoRedoEnabled(false);
    m_firstPiece = doc->clone();
    m_firstPiece->setUndoRedoEnabled(false);
    m_pieceModel = emptyLike(doc);

    // Anyone else changing the log meanwhile makes the copy stale: the display then gives way.
    m_watch = connect(doc, &QTextDocument::contentsChange, this, [this] { cancel(); });

    m_worker = QThread::create([this] { buildCopy(); });
    m_secondWorker = QThread::create([this] { buildLaterPieces(); });
    // Documents get frames and lists from the thread that builds them: they must belong to it.
    m_copy->moveToThread(m_worker);
    m_firstPiece->moveToThread(m_worker);
    m_pieceModel->moveToThread(m_secondWorker);
    for (QThread *worker : {m_worker, m_secondWorker}) {
        connect(worker, &QThread::finished, this, [this] { workerFinished(); });
        worker->start();
    }

    m_layoutTimer.setInterval(0);
    connect(&m_layoutTimer, &QTimer::timeout, this, [this] { layoutSlice(); });
}

ResultDisplayJob::~ResultDisplayJob()
{
    for (QThread *worker : {m_worker, m_secondWorker}) {
        if (worker) {
            worker->wait();
            delete worker;
        }
    }
    delete m_copy;
    delete m_firstPiece;
    delete m_pieceModel;
    qDeleteAll(m_laterPieces);
}

// First worker: the text, then for a plain result the first piece, laid out; then the copy.
void ResultDisplayJob::buildCopy()
{
    QThread *gui = thread();
    m_result = prepareResult(m_source, m_formats, m_geometry, Lines::Joined);
    const bool plain = !m_result.rich;
    // Pieces meet at paragraph breaks; paragraphs with margins would not meet as in one layout.
    const QList<qsizetype> breaks = plain && linesMayShareParagraphs(m_formats.block)
                                        ? pieceBreaks(m_result.text, pieceChars)
                                        : QList<qsizetype>();
    const QString endLine = m_result.whole ? QString() : tooLargeLineFor(m_source);
    for (qsizetype k = 0; k < breaks.size(); ++k) {
        const qsizetype start = breaks.at(k) + (m_result.text.at(breaks.at(k)) == QLatin1Char('\r') ? 2 : 1);
        const qsizetype end = k + 1 < breaks.size() ? breaks.at(k + 1) : m_result.text.size();
        m_laterTexts.append(m_result.text.mid(start, end - start));
    }
    m_endLine = endLine;
    m_prepared.release();

    if (plain) {
        QTextCursor cursor(m_firstPiece);
        cursor.beginEditBlock();
        beginAppend(cursor, m_formats);
        cursor.insertText(breaks.isEmpty() ? m_result.text : m_result.text.left(breaks.first()));
        cursor.endEditBlock();
        if (breaks.isEmpty() && !endLine.isEmpty())
            appendHtml(m_firstPiece, m_formats, endLine);
        if (!breaks.isEmpty())
            StackedTextLayout::closePiece(m_firstPiece);
        layOut(m_firstPiece, m_pageWidth);
        m_firstPiece->moveToThread(gui);
        m_copy->setPageSize(QSizeF(m_pageWidth, -1));
    } else {
        delete m_firstPiece;
        m_firstPiece = nullptr;
    }
    appendPrepared(m_copy, m_formats, m_result, m_source, m_geometry);
    m_result.text = QString();
    m_source.bytes = QByteArray();
    m_copy->moveToThread(gui);
}

// Second worker: the later pieces of a plain result, each laid out or ready to be laid out when
// shown. Uses only what the first worker set before it let this one go, and what nobody changes.
void ResultDisplayJob::buildLaterPieces()
{
    m_prepared.acquire();
    PieceSizer sizer;
    for (qsizetype k = 0; k < m_laterTexts.size(); ++k) {
        const bool last = k + 1 == m_laterTexts.size();
        QTextDocument *piece = emptyLike(m_pieceModel);
        QTextCursor cursor(piece);
        cursor.beginEditBlock();
        // The paragraph a break opens, as typing the break in the copy makes it.
        cursor.setBlockFormat(m_formats.block);
        cursor.setBlockCharFormat(m_formats.chars);
        cursor.setCharFormat(m_formats.chars);
        cursor.insertText(m_laterTexts.at(k));
        cursor.endEditBlock();
        if (!last)
            StackedTextLayout::closePiece(piece);
        else if (!m_endLine.isEmpty())
            appendHtml(piece, m_formats, m_endLine);
        piece->setPageSize(QSizeF(m_pageWidth, -1));
        if (!StackedTextLayout::prepareWithoutLayout(piece, sizer))
            layOut(piece, m_pageWidth);
        piece->moveToThread(thread());
        m_laterPieces.append(piece);
    }
    m_laterTexts.clear();
    delete m_pieceModel;
    m_pieceModel = nullptr;
}

void ResultDisplayJob::workerFinished()
{
    if (--m_workersRunning == 0)
        built();
}

void ResultDisplayJob::cancel()
{
    if (!m_active)
        return;
    m_active = false;
    disconnect(m_watch);
    m_layoutTimer.stop();
    // A worker still running cannot be stopped; built() drops its copy when it is done.
    if (m_workersRunning == 0)
        deleteLater();
}

void ResultDisplayJob::built()
{
    for (QThread **worker : {&m_worker, &m_secondWorker}) {
        (*worker)->wait();
        delete *worker;
        *worker = nullptr;
    }
    if (!m_active || !m_log || !m_logDocument || m_log->document() != m_logDocument) {
        m_active = false;
        deleteLater();
        return;
    }
    disconnect(m_watch);

    QTextDocument *copy = std::exchange(m_copy, nullptr);
    bool laidOut = false;
    if (m_firstPiece) {
        QList<QTextDocument *> pieces{std::exchange(m_firstPiece, nullptr)};
        pieces.append(std::exchange(m_laterPieces, {}));
        // Pieces that do not add up to the copy are dropped: it is then laid out as usual.
        laidOut = StackedTextLayout::install(copy, pieces) != nullptr;
    }
    copy->setUndoRedoEnabled(m_logDocument->isUndoRedoEnabled());
    // Owned as the document it replaces was: the editor deletes that one if it owned it.
    copy->setParent(m_logDocument->parent());
    m_shown = copy;
    m_log->setDocument(copy);
    if (laidOut) {
        // What is shown is laid out already or as it comes into view.
        finish();
        return;
    }

    m_log->verticalScrollBar()->setValue(m_scrollValue);

    // Only clearing or replacing the text stops the layout; later entries just come after it.
    m_watch = connect(copy, &QTextDocument::contentsChange, this, [this](int, int removed, int) {
        if (removed > 0)
            cancel();
    });
    m_layoutTimer.start();
}

void ResultDisplayJob::layoutSlice()
{
    if (!m_active)
        return;
    if (!m_log || !m_shown || m_log->document() != m_shown) {
        cancel();
        return;
    }
    // Lay out up to a position at a time, for about a frame's time per turn of the event loop.
    // (Text laid out on the workers already is only looked up.)
    constexpr int step = 8192;
    constexpr qint64 sliceMs = 40;
    QTextDocument *doc = m_shown;
    QAbstractTextDocumentLayout *layout = doc->documentLayout();
    const int end = doc->characterCount();
    QElapsedTimer clock;
    clock.start();
    while (m_layoutPosition < end && clock.elapsed() < sliceMs) {
        m_layoutPosition = std::min(end, m_layoutPosition + step);
        const QTextBlock block = doc->findBlock(m_layoutPosition - 1);
        layout->blockBoundingRect(block);
        m_layoutPosition = std::max(m_layoutPosition, block.position() + block.length());
    }
    if (m_layoutPosition >= end)
        finish();
}

void ResultDisplayJob::finish()
{
    m_layoutTimer.stop();
    disconnect(m_watch);
    m_active = false;
    publishDocumentSize(m_shown);

    // The editor's cursor goes back where it was, and moves with the end of the text when it was
    // there, as in an append. Only now: placing it makes the editor lay out the text up to it.
    const int changedAt = m_oldLength - 1;
    const int added = m_shown->characterCount() - m_oldLength;
    auto moved = [this, changedAt, added](int position) {
        return std::min(position >= changedAt ? position + added : position,
                        m_shown->characterCount() - 1);
    };
    QTextCursor cursor(m_shown);
    cursor.setPosition(moved(m_cursorAnchor));
    cursor.setPosition(moved(m_cursorPosition), QTextCursor::KeepAnchor);
    m_log->setTextCursor(cursor);
    if (!cursor.hasSelection())
        m_log->setCurrentCharFormat(m_editorCharFormat);
    scrollAfterAppend(m_log, m_atBottom);
    deleteLater();
}

QList<ResultDisplayJob *> activeJobs(QTextEdit *log)
{
    QList<ResultDisplayJob *> jobs;
    if (!log)
        return jobs;
    for (QObject *child : log->children()) {
        auto *job = dynamic_cast<ResultDisplayJob *>(child);
        if (job && job->isActive())
            jobs.append(job);
    }
    return jobs;
}

} // namespace

bool showResultFile(QTextEdit *log, const QString &path)
{
    cancelResultDisplay(log);

    // Read-write like every file the dialog opens: a missing result is created, empty.
    QFile file(path);
    if (!file.open(QIODevice::ReadWrite))
        return false;
    ResultSource source;
    source.path = path;
    source.fileSize = file.size();
    source.bytes = file.read(showLimitBytes);
    source.complete = source.bytes.size() < showLimitBytes || file.atEnd();
    file.close();

    if (source.complete && source.bytes.size() <= resultShownNowBytes)
        showNow(log, source);
    else
        new ResultDisplayJob(log, std::move(source));
    return true;
}

void cancelResultDisplay(QTextEdit *log)
{
    for (ResultDisplayJob *job : activeJobs(log))
        job->cancel();
}

bool resultDisplayBusy(QTextEdit *log)
{
    return !activeJobs(log).isEmpty();
}
