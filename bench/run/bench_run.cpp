// Job run benchmark:
//   (a) the dialog's own time for one whole job on the copy path (click on Run to the result shown),
//       less the time the trivial stand-in program itself takes to start, run and be reaped;
//   (b) the time to show a plain-text result file of several sizes, and the longest stretch in which
//       the event loop did not run while it was shown (a result the log cannot take whole is
//       counted as shown when the line saying so appears).
// Run:  QT_QPA_PLATFORM=offscreen build/bench/run/bench_run [jobs] [result sizes in MB...]
//       (defaults: 200 jobs; 1 10 50 MB)
#include "import.h"

#include <QApplication>
#include <QDir>
#include <QElapsedTimer>
#include <QEventLoop>
#include <QFile>
#include <QTemporaryDir>
#include <QTextBlock>
#include <QTimer>

#include <algorithm>
#include <cstdio>
#include <vector>

namespace {
void writeFile(const QString &path, const QByteArray &bytes)
{
    QFile f(path);
    if (!f.open(QIODevice::WriteOnly | QIODevice::Truncate))
        qFatal("cannot write %s", qPrintable(path));
    f.write(bytes);
}

double median(std::vector<double> v)
{
    std::sort(v.begin(), v.end());
    return v.empty() ? 0.0 : v[v.size() / 2];
}

// Runs the event loop until the process has finished; returns the milliseconds from the start.
double runBare(const QString &program, const QString &dir)
{
    QProcess p;
    p.setProgram(program);
    p.setWorkingDirectory(dir);
    QEventLoop loop;
    QObject::connect(&p, &QProcess::finished, &loop, &QEventLoop::quit);
    QElapsedTimer t;
    t.start();
    p.start();
    p.waitForStarted();
    loop.exec();
    return t.nsecsElapsed() / 1e6;
}
} // namespace

int main(int argc, char *argv[])
{
    if (qEnvironmentVariableIsEmpty("QT_QPA_PLATFORM"))
        qputenv("QT_QPA_PLATFORM", "offscreen");
    QApplication app(argc, argv);
    const QStringList args = app.arguments().mid(1);
    const int jobs = args.isEmpty() ? 200 : args.first().toInt();
    QList<int> sizes;
    for (int i = 1; i < args.size(); ++i)
        sizes << args.at(i).toInt();
    if (sizes.isEmpty())
        sizes = {1, 10, 50};

    QTemporaryDir bin;
    QDir::setCurrent(bin.path());
    const QString work = bin.path() + "/work";
    QDir().mkpath(work);
    writeFile("morvelpartxt.txt", "PART");
    writeFile("morvel", "#!/bin/sh\nprintf result > MORVEL.OUT\n");
    QFile("morvel").setPermissions(QFileDevice::ExeOwner | QFileDevice::ReadOwner);
    writeFile(work + "/in.txt", QByteArray("hand-made input line\n").repeated(50));

    Import dlg;
    dlg.morvelProgram = "./morvel";
    dlg.inputFile = work + "/in.txt";
    dlg.workingDir = work;
    dlg.stagedInputPath = work + "/morvel.in";
    dlg.InputBox->setCurrentIndex(1);
    dlg.show();

    // (a) whole jobs, each against the same stand-in run bare.
    std::vector<double> jobMs, bareMs, clickMs;
    for (int i = 0; i < jobs + 5; ++i) {
        QFile::remove(work + "/MORVEL.OUT.old1"); // every job keeps one earlier result
        const double bare = runBare(bin.path() + "/morvel", work);
        QEventLoop loop;
        const auto c = QObject::connect(dlg.morvelProcess, &QProcess::finished, &loop, &QEventLoop::quit,
                                        Qt::QueuedConnection);
        QElapsedTimer t;
        t.start();
        dlg.importButton->click();
        const double clickPart = t.nsecsElapsed() / 1e6;
        loop.exec();
        while (dlg.importlog->document()->lastBlock().text() != QLatin1String("result"))
            QCoreApplication::processEvents();
        const double job = t.nsecsElapsed() / 1e6;
        QObject::disconnect(c);
        if (i >= 5) { // the first jobs warm the caches
            jobMs.push_back(job);
            clickMs.push_back(clickPart);
            bareMs.push_back(bare);
        }
    }
    std::printf("(a) %d jobs on the copy path: job %.2f ms, stand-in alone %.2f ms, overhead %.2f ms (medians);\n"
                "    of the job, the click up to MORVEL started took %.2f ms\n",
                jobs, median(jobMs), median(bareMs), median(jobMs) - median(bareMs), median(clickMs));

    // (b) result files of growing size, shown by the end of the computation program.
    const QByteArray line = "  Fe1    O2     2.0345(3)   0.512   Fe1-O2-Fe1  118.25  polyhedron  6\n";
    for (int mb : sizes) {
        const qint64 bytes = qint64(mb) * 1024 * 1024;
        QByteArray text = line.repeated(int(bytes / line.size()));
        text += "END OF RESULT";
        writeFile(work + "/MORVEL.OUT", text);
        text.clear();
        dlg.importlog->clear();

        QElapsedTimer clock;
        qint64 last = 0, maxGap = 0, shownAt = -1;
        bool whole = false;
        QEventLoop loop;
        QTimer tick;
        tick.setInterval(5);
        QObject::connect(&tick, &QTimer::timeout, [&] {
            const qint64 now = clock.elapsed();
            maxGap = std::max(maxGap, now - last);
            last = now;
            // Done when the last line is shown, or the line saying that only the first part is.
            const QString lastLine = dlg.importlog->document()->lastBlock().text();
            whole = lastLine == QLatin1String("END OF RESULT");
            if (whole || lastLine.contains(work + "/MORVEL.OUT")) {
                shownAt = now;
                loop.quit();
            } else if (now > 300000) {
                loop.quit();
            }
        });
        QTimer::singleShot(0, [&] {
            clock.start();
            tick.start();
            dlg.endMorvel(0);
        });
        loop.exec();
        tick.stop();
        std::printf("(b) %3d MB result: %s in %lld ms, longest event-loop stall %lld ms\n", mb,
                    shownAt < 0 ? "not shown" : whole ? "shown whole" : "first part shown",
                    static_cast<long long>(shownAt), static_cast<long long>(maxGap));
        std::fflush(stdout);
    }
    return 0;
}
