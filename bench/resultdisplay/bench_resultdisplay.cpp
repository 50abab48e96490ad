// Result display benchmark: for results of several sizes, the time from the end of the
// computation program (Import::endMorvel) until the result is shown in the log, and the longest
// stretch in which the event loop did not run meanwhile, as a 10 ms timer sees it. Then, with the
// result shown: the longest of 20 jumps of the view to places spread over the log (each drawn at
// once), and the longest stall while the log follows a narrower dialog.
// Run:  QT_QPA_PLATFORM=offscreen build/bench/resultdisplay/bench_resultdisplay [--rich] [MB...]
//       (defaults: plain text; 1 10 50 200 MB)
#include "import.h"
#include "resultdisplay.h"
#include "resultfiles.h"

#include <QApplication>
#include <QElapsedTimer>
#include <QFile>
#include <QScrollBar>
#include <QTemporaryDir>
#include <QTimer>

#include <algorithm>
#include <cstdio>

int main(int argc, char **argv)
{
    QApplication app(argc, argv);
    bool rich = false;
    QList<double> sizes;
    for (int i = 1; i < argc; ++i) {
        if (QByteArray(argv[i]) == "--rich")
            rich = true;
        else
            sizes.append(QByteArray(argv[i]).toDouble());
    }
    if (sizes.isEmpty())
        sizes = {1, 10, 50, 200};

    std::printf("%-8s %-6s %12s %14s %10s %13s %12s  %s\n", "size MB", "kind", "shown (ms)",
                "longest stall", "jump (ms)", "resize stall", "log lines", "end of the log");
    for (double mb : sizes) {
        QTemporaryDir dir;
        const QString path = dir.path() + QStringLiteral("/MORVEL.OUT");
        {
            const qint64 bytes = qint64(mb * 1e6);
            QFile file(path);
            if (!file.open(QIODevice::WriteOnly))
                qFatal("cannot write %s", qPrintable(path));
            file.write(rich ? richResult(bytes) : plainResult(bytes));
        }

        Import dialog;
        dialog.workingDir = dir.path();
        dialog.show();
        QCoreApplication::processEvents();

        QElapsedTimer clock, sinceTick;
        qint64 longest = 0;
        QTimer tick;
        QObject::connect(&tick, &QTimer::timeout, [&] { longest = std::max(longest, sinceTick.restart()); });
        tick.start(10);
        clock.start();
        sinceTick.start();
        dialog.endMorvel(0);
        while (resultDisplayBusy(dialog.importlog))
            QCoreApplication::processEvents(QEventLoop::WaitForMoreEvents, 50);
        const qint64 shown = clock.elapsed();
        longest = std::max(longest, sinceTick.elapsed());
        tick.stop();

        // Jumps through the log, each painted before the next.
        QScrollBar *bar = dialog.importlog->verticalScrollBar();
        qint64 jump = 0;
        for (int step = 0; step < 20; ++step) {
            QElapsedTimer one;
            one.start();
            bar->setValue(int(qint64(bar->maximum()) * step / 19));
            dialog.importlog->viewport()->repaint();
            jump = std::max(jump, one.elapsed());
        }

        // A narrower log: it lays its text out again at the new width.
        QCoreApplication::processEvents();
        qint64 resizeStall = 0;
        QTimer resizeTick;
        QObject::connect(&resizeTick, &QTimer::timeout, [&] { resizeStall = std::max(resizeStall, sinceTick.restart()); });
        const int widthBefore = dialog.importlog->viewport()->width();
        resizeTick.start(10);
        sinceTick.restart();
        dialog.importlog->setFixedWidth(dialog.importlog->width() - 60);
        QElapsedTimer settle;
        settle.start();
        int lastMaximum = -1;
        QElapsedTimer stable;
        stable.start();
        while (settle.elapsed() < 30000 && stable.elapsed() < 500) {
            QCoreApplication::processEvents(QEventLoop::WaitForMoreEvents, 20);
            if (bar->maximum() != lastMaximum) {
                lastMaximum = bar->maximum();
                stable.restart();
            }
        }
        resizeStall = std::max(resizeStall, sinceTick.elapsed());
        resizeTick.stop();
        if (dialog.importlog->viewport()->width() >= widthBefore)
            qFatal("the log did not get narrower");

        const QString text = dialog.importlog->toPlainText();
        QStringList lines = text.split(QLatin1Char('\n'));
        lines.removeAll(QString());
        const QString last = lines.isEmpty() ? QString() : lines.last().left(60);
        std::printf("%-8g %-6s %12lld %14lld %10lld %13lld %12lld  %s\n", mb, rich ? "rich" : "plain", shown,
                    longest, jump, resizeStall, qint64(text.count(QLatin1Char('\n')) + 1), qPrintable(last));
        std::fflush(stdout);
    }
    return 0;
}
