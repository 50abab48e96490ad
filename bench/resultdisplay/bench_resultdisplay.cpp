// Result display benchmark. For result files of several sizes, plain text and HTML: the time from
// the end of the computation program (Import::endMorvel, which appends the result to the log) until
// the log has drawn it, and the longest stretch in which the event loop did not run, as a 10 ms
// timer sees it, from that end until two seconds after the drawing. With --whole the result is
// appended without the log's size limit (the text as one append), which is how the limit is chosen.
// Run:  QT_QPA_PLATFORM=offscreen build/bench/resultdisplay/bench_resultdisplay [--whole] [MB...]
//       (default sizes: 0.5 1 2 10 50 200)
#include "import.h"
#include "runlogic.h"

#include <QApplication>
#include <QElapsedTimer>
#include <QFile>
#include <QTemporaryDir>
#include <QTimer>

#include <algorithm>
#include <cstdio>

namespace {
// A result like the computation program's distance tables; numbered lines, no two alike.
QByteArray plainResult(qint64 bytes)
{
    QByteArray out;
    out.reserve(bytes + 64);
    for (qint64 i = 0; out.size() < bytes; ++i)
        out += "  Fe1   - O2      2.0135(3)  x2   " + QByteArray::number(i) + '\n';
    out.truncate(bytes);
    return out;
}

// The same as HTML, with the anchor TITLE a fifth of the way in.
QByteArray richResult(qint64 bytes)
{
    QByteArray out = "<html><body>\n<p>Distances</p>\n";
    out.reserve(bytes + 64);
    bool anchored = false;
    for (qint64 i = 0; out.size() < bytes - 32; ++i) {
        if (!anchored && out.size() > bytes / 5) {
            out += "<h2><a name=\"TITLE\"></a>Bond weights</h2>\n";
            anchored = true;
        }
        if (i % 40 == 0)
            out += "<p><b>Site " + QByteArray::number(i) + "</b>   coordination &amp; weights</p>\n<pre>";
        out += "Fe1   - O2      2.0135(3)  x2   " + QByteArray::number(i) + '\n';
        if (i % 40 == 39)
            out += "</pre>\n";
    }
    return out + "</pre></body></html>\n";
}

struct Measure
{
    qint64 shownMs = 0;
    qint64 longestStopMs = 0;
};

// Runs show() with a 10 ms timer going, then the event loop for two more seconds.
template<typename Show>
Measure measure(Import &dialog, Show show)
{
    Measure m;
    QElapsedTimer clock, sinceTick;
    QTimer tick;
    QObject::connect(&tick, &QTimer::timeout, [&] { m.longestStopMs = std::max(m.longestStopMs, sinceTick.restart()); });
    tick.start(10);
    clock.start();
    sinceTick.start();
    show();
    dialog.importlog->viewport()->repaint();
    m.shownMs = clock.elapsed();
    m.longestStopMs = std::max(m.longestStopMs, sinceTick.elapsed());
    QElapsedTimer after;
    after.start();
    while (after.elapsed() < 2000)
        QCoreApplication::processEvents(QEventLoop::WaitForMoreEvents, 50);
    return m;
}
} // namespace

int main(int argc, char **argv)
{
    QApplication app(argc, argv);
    bool whole = false;
    QList<double> sizes;
    for (int i = 1; i < argc; ++i) {
        if (QByteArray(argv[i]) == "--whole")
            whole = true;
        else
            sizes.append(QByteArray(argv[i]).toDouble());
    }
    if (sizes.isEmpty())
        sizes = {0.5, 1, 2, 10, 50, 200};

    std::printf("log limit %lld bytes%s\n", resultLogLimit, whole ? " (not applied: --whole)" : "");
    std::printf("%-8s %-6s %11s %18s  %s\n", "size MB", "kind", "shown (ms)", "longest stop (ms)", "last line of the log");
    for (double mb : sizes) {
        for (bool rich : {false, true}) {
            QTemporaryDir dir;
            const QByteArray bytes = rich ? richResult(qint64(mb * 1e6)) : plainResult(qint64(mb * 1e6));
            QFile result(dir.filePath(QStringLiteral("MORVEL.OUT")));
            QFile input(dir.filePath(QStringLiteral("job.in")));
            if (!result.open(QIODevice::WriteOnly) || result.write(bytes) != bytes.size() || !input.open(QIODevice::WriteOnly))
                qFatal("cannot write in %s", qPrintable(dir.path()));
            result.close();

            Import dialog;
            dialog.InputBox->setCurrentIndex(1); // a hand-made input: no question about its format
            dialog.takeInputFile(input.fileName());
            dialog.show();
            QCoreApplication::processEvents();
            const Measure m = measure(dialog, [&] {
                if (whole)
                    dialog.importlog->append(QString::fromUtf8(bytes));
                else
                    dialog.endMorvel(0);
            });
            const QStringList lines = dialog.importlog->toPlainText().trimmed().split(QLatin1Char('\n'));
            std::printf("%-8g %-6s %11lld %18lld  %s\n", mb, rich ? "rich" : "plain", m.shownMs, m.longestStopMs,
                        qPrintable(lines.constLast().left(70)));
            std::fflush(stdout);
        }
    }
    return 0;
}
