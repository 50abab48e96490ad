#include "import.h"
#include "resultdisplay.h"
#include "resultdisplaytext.h"
#include "resultfiles.h"
#include "stackedtextlayout.h"
#include "testsupport.h"

#include <QAbstractTextDocumentLayout>
#include <QElapsedTimer>
#include <QFileInfo>
#include <QScrollBar>
#include <QTextStream>
#include <QTimer>
#include <QtTest>

namespace {
// A log as the dialog has it: read-only, visible, a few entries in it already.
void prepareLog(QTextEdit &log)
{
    log.setReadOnly(true);
    log.resize(600, 300);
    log.show();
    log.append(QStringLiteral("<br>-->  Starting Morvel ..."));
    log.append(QStringLiteral(" "));
    log.append(QString(61, QLatin1Char('#')) + QStringLiteral("<br>"));
    log.document()->documentLayout()->documentSize();
}

// Lets a log finish its layout and its scroll bars follow: the editor's scroll range is only an
// estimate while it lays out lazily.
void settle(QTextEdit &log)
{
    for (int round = 0; round < 50; ++round) {
        const int maximum = log.verticalScrollBar()->maximum();
        const QSize viewport = log.viewport()->size();
        log.document()->documentLayout()->documentSize();
        QTest::qWait(20);
        if (maximum == log.verticalScrollBar()->maximum() && viewport == log.viewport()->size())
            return;
    }
}

// The longest time the event loop did not run, seen by a 10 ms timer, until `done` holds.
qint64 longestStallUntil(const std::function<bool()> &done, int timeoutMs)
{
    QElapsedTimer clock, sinceTick;
    clock.start();
    sinceTick.start();
    qint64 longest = 0;
    QTimer tick;
    QObject::connect(&tick, &QTimer::timeout, [&] {
        longest = std::max(longest, sinceTick.restart());
    });
    tick.start(10);
    while (!done() && clock.elapsed() < timeoutMs)
        QCoreApplication::processEvents(QEventLoop::WaitForMoreEvents, 50);
    longest = std::max(longest, sinceTick.elapsed());
    return longest;
}
} // namespace

class TestResultDisplay : public QObject
{
    Q_OBJECT

private slots:
    void decoding_data();
    void decoding();
    void shownLengthOfPlainText();
    void joiningLines_data();
    void joiningLines();
    void looksLikeOneAppend_data();
    void looksLikeOneAppend();
    void hugeResultEndsWithSizeLine();
    void unopenableResult();
    void clearingOrClosingStopsDisplay();
};

void TestResultDisplay::decoding_data()
{
    QTest::addColumn<QByteArray>("bytes");
    QTest::addColumn<bool>("complete");
    QTest::addColumn<QString>("text");
    const QString umlaut = QString::fromUtf8("\xc3\xa4");
    QTest::newRow("utf-8") << QByteArray("a\xc3\xa4\n") << true << QStringLiteral("a") + umlaut + '\n';
    QTest::newRow("utf-8 mark") << QByteArray("\xef\xbb\xbf" "ab") << true << QStringLiteral("ab");
    QTest::newRow("utf-16 mark") << QByteArray("\xff\xfe" "a\0b\0", 6) << true << QStringLiteral("ab");
    QTest::newRow("nul bytes") << QByteArray("a\0\0b", 4) << true << QStringLiteral("a\ufffd\ufffdb");
    QTest::newRow("invalid byte") << QByteArray("a\xff" "b") << true << QStringLiteral("a\ufffdb");
    QTest::newRow("cut at file end") << QByteArray("a\xc3") << true << QStringLiteral("a\ufffd");
    QTest::newRow("cut at limit") << QByteArray("a\xc3") << false << QStringLiteral("a");
}

void TestResultDisplay::decoding()
{
    QFETCH(QByteArray, bytes);
    QFETCH(bool, complete);
    QFETCH(QString, text);
    QCOMPARE(ResultText::decodeResult(bytes, complete), text);
}

void TestResultDisplay::shownLengthOfPlainText()
{
    ResultText::LogGeometry geometry;
    geometry.textWidth = 500;
    const QString normal = QStringLiteral("line one\r\nline two\n");
    QCOMPARE(ResultText::plainShownLength(normal, geometry), normal.size());

    // One endless paragraph (binary junk without line ends) stops at the paragraph limit.
    const QString junk = QStringLiteral("ab\n") + QString(ResultText::maxParagraphChars + 10, 'x');
    QCOMPARE(ResultText::plainShownLength(junk, geometry), 3 + ResultText::maxParagraphChars);

    // A text of empty lines taller than the log keeps stops at a paragraph start.
    const QString tall(int(ResultText::maxLogHeight / geometry.lineHeight) + 100, QLatin1Char('\n'));
    const qsizetype shown = ResultText::plainShownLength(tall, geometry);
    QVERIFY(shown < tall.size());
    QVERIFY(shown * geometry.lineHeight <= ResultText::maxLogHeight);
}

void TestResultDisplay::joiningLines_data()
{
    QTest::addColumn<QString>("text");
    QTest::addColumn<int>("paragraphChars");
    QTest::addColumn<QString>("joined");
    const QChar ls = QChar::LineSeparator;
    QTest::newRow("lf") << QStringLiteral("a\nb\nc\n") << 100 << QStringLiteral("a%1b%1c\n").arg(ls);
    QTest::newRow("cr lf is one break") << QStringLiteral("a\r\nb\r\n") << 100 << QStringLiteral("a%1b\r\n").arg(ls);
    QTest::newRow("lone cr, paragraph separator")
        << QStringLiteral("a\rb\u2029c") << 100 << QStringLiteral("a%1b\u2029c").arg(ls);
    QTest::newRow("empty lines") << QStringLiteral("a\n\n\n\nb") << 100 << QStringLiteral("a%1%1%1\nb").arg(ls);
    QTest::newRow("last break stays") << QStringLiteral("a\n\n") << 100 << QStringLiteral("a%1\n").arg(ls);
    QTest::newRow("no break") << QStringLiteral("abc") << 100 << QStringLiteral("abc");
    QTest::newRow("paragraph length") << QStringLiteral("ab\ncd\nef\ngh\nij") << 4
                                      << QStringLiteral("ab%1cd\nef%1gh\nij").arg(ls);
    QTest::newRow("cr lf at paragraph end") << QStringLiteral("abcd\r\nef\r\ngh\r\nij") << 3
                                            << QStringLiteral("abcd\r\nef%1gh\r\nij").arg(ls);
    QTest::newRow("frame marks stay") << QStringLiteral("a\ufdd0b\nc\nd") << 100 << QStringLiteral("a\ufdd0b%1c\nd").arg(ls);
    // Lines that could take another direction stay paragraphs of their own.
    QTest::newRow("hebrew") << QStringLiteral("a\n\u05d0\nb") << 100 << QStringLiteral("a\n\u05d0\nb");
    QTest::newRow("arabic digits") << QStringLiteral("a\n\u0661\nb") << 100 << QStringLiteral("a\n\u0661\nb");
    QTest::newRow("embedding mark") << QStringLiteral("a\u202b\nb") << 100 << QStringLiteral("a\u202b\nb");
    QTest::newRow("isolate mark") << QStringLiteral("a\u2067\nb") << 100 << QStringLiteral("a\u2067\nb");
    QTest::newRow("right-to-left beyond the BMP")
        << QStringLiteral("a\n\U00010800\nb") << 100 << QStringLiteral("a\n\U00010800\nb");
    QTest::newRow("left-to-right beyond Latin")
        << QStringLiteral("\u00c5\n\u4e2d\n\U0001d400\n\ufffd") << 100
        << QStringLiteral("\u00c5%1\u4e2d%1\U0001d400\n\ufffd").arg(ls);
}

void TestResultDisplay::joiningLines()
{
    QFETCH(QString, text);
    QFETCH(int, paragraphChars);
    QFETCH(QString, joined);
    QString result = text;
    QCOMPARE(ResultText::joinLines(result, paragraphChars), joined != text);
    QCOMPARE(result, joined);

    // The log's plain text is the same either way.
    QTextDocument one, other;
    one.setPlainText(text);
    other.setPlainText(result);
    QCOMPARE(other.toPlainText(), one.toPlainText());
}

void TestResultDisplay::looksLikeOneAppend_data()
{
    QTest::addColumn<QByteArray>("bytes");
    QTest::newRow("empty") << QByteArray();
    QTest::newRow("one line") << QByteArray("  MORVEL result: 12 sites");
    QTest::newRow("some lines") << plainResult(20'000);
    QTest::newRow("nul bytes") << QByteArray("before\0\0after\nnext\xff line\n", 25);
    QTest::newRow("rich, small") << richResult(200 * 1024);
    QTest::newRow("plain, 10 MB") << plainResult(10'000'000);
    // Pieces meet at CR LF too; lines in Hebrew keep a paragraph each and get laid out at once.
    QByteArray crlf = plainResult(2'000'000);
    crlf.replace("\n", "\r\n");
    QTest::newRow("plain, CR LF, 2 MB") << crlf;
    QByteArray hebrew = plainResult(2'000'000);
    hebrew.replace("Fe1", "\xd7\x90\xd7\x91");
    QTest::newRow("plain, right to left, 2 MB") << hebrew;
    // Greek letters and signs of the log's font need no layout before they are shown either.
    QByteArray greek = plainResult(2'000'000);
    greek.replace("x2", "\xce\xb1\xe2\x89\xa4\xc3\x85");
    QTest::newRow("plain, Greek and signs, 2 MB") << greek;
    QTest::newRow("rich, 10 MB") << richResult(10'000'000);
}

void TestResultDisplay::looksLikeOneAppend()
{
    QFETCH(QByteArray, bytes);
    CurrentDirScope dir;
    const QString path = dir.file(QStringLiteral("MORVEL.OUT"));
    writeFile(path, bytes);

    // The reference: the whole text as a text stream reads it, in one append.
    QTextEdit reference;
    prepareLog(reference);
    {
        QFile file(path);
        QVERIFY(file.open(QIODevice::ReadOnly));
        QTextStream in(&file);
        QString text = in.readAll();
        text.replace(QChar(0), QChar::ReplacementCharacter);
        reference.append(text);
        // Scrolling to an anchor that is not there would move the view to the top.
        if (reference.toHtml().contains(QLatin1String("name=\"TITLE\"")))
            reference.scrollToAnchor(QStringLiteral("TITLE"));
    }
    settle(reference); // its own late layout must not count as a stall of the display below

    QTextEdit log;
    prepareLog(log);
    QElapsedTimer clock;
    clock.start();
    QVERIFY(showResultFile(&log, path));
    if (bytes.size() <= resultShownNowBytes) {
        QVERIFY(!resultDisplayBusy(&log));
        // A small result keeps a paragraph a line, as one append makes it.
        QCOMPARE(log.document()->blockCount(), reference.document()->blockCount());
    }
    const qint64 stall = longestStallUntil([&] { return !resultDisplayBusy(&log); }, 120'000);
    QVERIFY(!resultDisplayBusy(&log));
    qInfo("%lld bytes shown in %lld ms, longest stall %lld ms", qint64(bytes.size()),
          clock.elapsed(), stall);
    QVERIFY2(stall < 2000, qPrintable(QString::number(stall)));

    QCOMPARE(log.toPlainText(), reference.toPlainText());
    if (bytes.size() > resultShownNowBytes && !bytes.startsWith("<html>")) {
        // A large plain result takes the fast way: in pieces, most of them laid out only when
        // they come into view (their height is known without it, and compared below).
        auto *stacked = qobject_cast<StackedTextLayout *>(log.document()->documentLayout());
        QVERIFY(stacked);
        QVERIFY(stacked->pieceCount() > 10);
        if (!bytes.contains("\xd7"))
            QVERIFY(stacked->piecesLaidOut() < 5);
    }
    settle(log);
    settle(reference);
    QCOMPARE(log.verticalScrollBar()->maximum(), reference.verticalScrollBar()->maximum());
    if (bytes.contains("TITLE")) {
        QCOMPARE(log.verticalScrollBar()->value(), reference.verticalScrollBar()->value());
        QVERIFY(log.verticalScrollBar()->value() < log.verticalScrollBar()->maximum());
    } else {
        // Without the anchor the view stays at the bottom, where the append leaves it once the
        // whole text is laid out (a single append of a tall text leaves it where its lazy layout
        // had got to).
        QCOMPARE(log.verticalScrollBar()->value(), log.verticalScrollBar()->maximum());
    }
    QCOMPARE(QFileInfo(path).size(), qint64(bytes.size()));

    // And pixel for pixel, where the view is and elsewhere.
    const int maximum = log.verticalScrollBar()->maximum();
    for (int scroll : {log.verticalScrollBar()->value(), maximum / 3, maximum / 2 + 7}) {
        log.verticalScrollBar()->setValue(scroll);
        reference.verticalScrollBar()->setValue(scroll);
        QVERIFY2(log.viewport()->grab().toImage() == reference.viewport()->grab().toImage(),
                 qPrintable(QStringLiteral("view scrolled to %1").arg(scroll)));
    }
}

void TestResultDisplay::hugeResultEndsWithSizeLine()
{
    CurrentDirScope dir;
    const QString path = dir.file(QStringLiteral("MORVEL.OUT"));
    const QByteArray bytes = plainResult(60'000'000);
    writeFile(path, bytes);
    const QDateTime modified = QFileInfo(path).lastModified();

    Import dialog;
    dialog.workingDir = dir.path();
    dialog.show();
    dialog.endMorvel(0);
    const qint64 stall = longestStallUntil([&] { return !resultDisplayBusy(dialog.importlog); }, 120'000);
    QVERIFY(!resultDisplayBusy(dialog.importlog));
    QVERIFY2(stall < 2000, qPrintable(QString::number(stall)));

    QStringList lines = logLines(dialog.importlog);
    lines.removeAll(QString());
    QVERIFY(lines.last().contains(QStringLiteral("larger than the log shows")));
    QVERIFY(lines.last().contains(path));
    QVERIFY(dialog.importlog->toHtml().contains(QStringLiteral("#ff3300")));
    // The first part is there, in order, up to a whole line.
    const QString text = dialog.importlog->toPlainText();
    QVERIFY(text.contains(QStringLiteral("  Fe1   - O2      2.0135(3)  x2   0\n")));
    QVERIFY(text.contains(QStringLiteral("  Fe1   - O2      2.0135(3)  x2   200000\n")));
    QCOMPARE(QFileInfo(path).size(), qint64(bytes.size()));
    QCOMPARE(QFileInfo(path).lastModified(), modified);

    // The dialog answers at once: Run without an input file says so in the log.
    QElapsedTimer clock;
    clock.start();
    QTest::mouseClick(dialog.importButton, Qt::LeftButton);
    lines = logLines(dialog.importlog);
    lines.removeAll(QString());
    QVERIFY(lines.last().contains(QStringLiteral("Please set Input file")));
    QVERIFY(clock.elapsed() < 2000);
}

void TestResultDisplay::unopenableResult()
{
    CurrentDirScope dir;
    QVERIFY(QDir(dir.path()).mkdir(QStringLiteral("MORVEL.OUT")));
    QTextEdit log;
    prepareLog(log);
    const QString before = log.toPlainText();
    QVERIFY(!showResultFile(&log, dir.file(QStringLiteral("MORVEL.OUT"))));
    QCOMPARE(log.toPlainText(), before);

    // A missing file is created, empty, and shown as an empty result.
    const QString missing = dir.file(QStringLiteral("MORVEL2.OUT"));
    QVERIFY(showResultFile(&log, missing));
    QVERIFY(QFileInfo::exists(missing));
    QCOMPARE(log.toPlainText(), before + QLatin1Char('\n'));
}

void TestResultDisplay::clearingOrClosingStopsDisplay()
{
    CurrentDirScope dir;
    const QString path = dir.file(QStringLiteral("MORVEL.OUT"));
    writeFile(path, plainResult(3'000'000));

    // Cleared while the result is prepared, or while it is laid out: nothing of it comes back.
    for (int waitMs : {0, 600}) {
        QTextEdit log;
        prepareLog(log);
        QVERIFY(showResultFile(&log, path));
        QTest::qWait(waitMs);
        log.clear();
        log.append(QStringLiteral("next run"));
        longestStallUntil([&] { return !resultDisplayBusy(&log); }, 30'000);
        QTest::qWait(100);
        QCOMPARE(log.toPlainText(), QStringLiteral("next run"));
    }

    // Cancelled by the run controller, then the log is destroyed while the worker may still run.
    auto *log = new QTextEdit;
    prepareLog(*log);
    QVERIFY(showResultFile(log, path));
    cancelResultDisplay(log);
    QVERIFY(!resultDisplayBusy(log));
    QVERIFY(showResultFile(log, path));
    delete log;
    QTest::qWait(100);
}

QTEST_MAIN(TestResultDisplay)
#include "tst_resultdisplay.moc"
