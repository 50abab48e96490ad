// Whole demo job benchmark: the dialog against the stand-in programs run directly.
//   dialog: a click on Run to the result shown in the log (the log laid out and painted), on the
//           real dialog in a copy of demo/ with the real stand-ins, input chosen once;
//   direct: the same programs in the same folder started with posix_spawn, one after the other
//           (no shell), and once more through /bin/sh -c "... && ...", as typed in a shell.
// Jobs: nacl.cif ("CIF File": cif_parser then morvel) and quartz.in ("Hand-made": copied to
// morvel.in, then morvel). Measurements of the two ways alternate, so both meet the same load.
// The dialog's overhead is the difference of the medians; it must stay under 20 ms per job.
// Run:  QT_QPA_PLATFORM=offscreen build/bench/e2e/bench_e2e [jobs per way, default 100]
// Cross-check of the direct figure, in a demo copy with the stand-ins and a morvel.par beside it:
//   hyperfine -N --warmup 5 './cif_parser nacl.cif morvel.in' './morvel'
#include "import.h"

#include <QApplication>
#include <QDir>
#include <QElapsedTimer>
#include <QEventLoop>
#include <QTemporaryDir>

#include <algorithm>
#include <cstdio>
#include <filesystem>
#include <vector>

#include <fcntl.h>
#include <spawn.h>
#include <sys/wait.h>

extern char **environ;

namespace {
struct Stats
{
    std::vector<double> ms;
    double median() const { return quantile(0.5); }
    double quantile(double q) const
    {
        std::vector<double> v = ms;
        std::sort(v.begin(), v.end());
        return v.empty() ? 0.0 : v[std::min(v.size() - 1, size_t(q * double(v.size())))];
    }
};

// Starts argv in the current directory, its output to /dev/null, and waits for it; false unless it
// exits with 0.
bool spawnAndWait(std::vector<const char *> argv)
{
    argv.push_back(nullptr);
    posix_spawn_file_actions_t actions;
    posix_spawn_file_actions_init(&actions);
    posix_spawn_file_actions_addopen(&actions, 1, "/dev/null", O_WRONLY, 0);
    posix_spawn_file_actions_addopen(&actions, 2, "/dev/null", O_WRONLY, 0);
    pid_t pid = 0;
    const int rc = posix_spawn(&pid, argv[0], &actions, nullptr, const_cast<char **>(argv.data()), environ);
    posix_spawn_file_actions_destroy(&actions);
    int status = 0;
    return rc == 0 && waitpid(pid, &status, 0) == pid && WIFEXITED(status) && WEXITSTATUS(status) == 0;
}

double msSince(const QElapsedTimer &clock)
{
    return double(clock.nsecsElapsed()) / 1e6;
}

// A copy of demo/ with the two stand-ins linked beside binaries.txt, which names them ./morvel and
// ./cif_parser; it is the current directory, so the dialog reads its configuration there too.
QString demoCopy(const QTemporaryDir &dir)
{
    const QDir demo(QStringLiteral(DEMO_DIR));
    for (const QString &name : demo.entryList(QDir::Files))
        QFile::copy(demo.filePath(name), dir.filePath(name));
    if (!QFile::link(QStringLiteral(CIF_PARSER_PATH), dir.filePath(QStringLiteral("cif_parser")))
        || !QFile::link(QStringLiteral(MORVEL_PATH), dir.filePath(QStringLiteral("morvel"))))
        qFatal("cannot place the stand-ins in %s", qPrintable(dir.path()));
    QDir::setCurrent(dir.path());
    return dir.path();
}

// Earlier results pile up as MORVEL.OUT.oldN and the names end at 100: clear them between jobs,
// outside the timed part. MORVEL.OUT itself stays, so each timed job also keeps the one before.
void dropKeptResults(const QString &folder)
{
    for (const QString &name : QDir(folder).entryList({QStringLiteral("MORVEL.OUT.old*")}, QDir::Files))
        QFile::remove(folder + QLatin1Char('/') + name);
}

class DialogJob
{
public:
    DialogJob(Import &dialog) : dialog(dialog)
    {
        // The dialog's two process objects, the converter's made first. Connected after the
        // dialog's own handlers, so these run once endMorvel has shown the result.
        const QList<QProcess *> processes = dialog.findChildren<QProcess *>();
        QObject::connect(processes.at(1), &QProcess::finished, &loop, [this] { loop.quit(); });
        QObject::connect(processes.at(0), &QProcess::finished, &loop, [this](int code) {
            if (code != 0)
                loop.quit();
        });
    }

    // One click on Run to the result painted in the log; negative when the job failed.
    double run()
    {
        QElapsedTimer clock;
        clock.start();
        dialog.importButton->click();
        loop.exec();
        dialog.importlog->viewport()->repaint();
        const double ms = msSince(clock);
        const QString log = dialog.importlog->toPlainText();
        if (!dialog.importButton->isEnabled() || !log.contains(QLatin1String("Normal end.")))
            return -1.0;
        return ms;
    }

private:
    Import &dialog;
    QEventLoop loop;
};

void choose(Import &dialog, int format, const QString &path)
{
    dialog.InputBox->setCurrentIndex(format);
    dialog.takeInputFile(path);
    if (dialog.inputpath->text() != path)
        qFatal("could not choose %s", qPrintable(path));
}

void report(const char *job, const Stats &dialog, const Stats &direct, const Stats &shell)
{
    std::printf("%s (%zu jobs each way)\n", job, dialog.ms.size());
    std::printf("  dialog, click to result shown : median %7.2f ms   p90 %7.2f ms\n", dialog.median(),
                dialog.quantile(0.9));
    std::printf("  direct, posix_spawn           : median %7.2f ms   p90 %7.2f ms\n", direct.median(),
                direct.quantile(0.9));
    if (!shell.ms.empty())
        std::printf("  direct, through /bin/sh -c    : median %7.2f ms   p90 %7.2f ms\n", shell.median(),
                    shell.quantile(0.9));
    const double overhead = dialog.median() - direct.median();
    std::printf("  dialog overhead per job       : %7.2f ms (limit 20 ms: %s)\n", overhead,
                overhead < 20.0 ? "met" : "EXCEEDED");
}
} // namespace

int main(int argc, char *argv[])
{
    QApplication app(argc, argv);
    const int jobs = argc > 1 ? std::max(1, atoi(argv[1])) : 100;

    const QTemporaryDir dir;
    const QString demo = demoCopy(dir);
    std::printf("demo copy: %s\n", qPrintable(demo));

    Import dialog;
    dialog.show();
    DialogJob dialogJob(dialog);
    bool allSucceeded = true;

    // CIF file: the converter, then MORVEL.
    {
        choose(dialog, 0, demo + QStringLiteral("/nacl.cif"));
        Stats viaDialog, direct, shell;
        for (int i = -3; i < jobs; ++i) { // three warm-up rounds
            dropKeptResults(demo);
            const double d = dialogJob.run();
            QElapsedTimer clock;
            clock.start();
            const bool ok = spawnAndWait({"./cif_parser", "nacl.cif", "morvel.in"}) && spawnAndWait({"./morvel"});
            const double t = msSince(clock);
            clock.start();
            const bool shellOk = spawnAndWait({"/bin/sh", "-c", "./cif_parser nacl.cif morvel.in && ./morvel"});
            const double s = msSince(clock);
            allSucceeded = allSucceeded && d >= 0 && ok && shellOk;
            if (i >= 0) {
                viaDialog.ms.push_back(d);
                direct.ms.push_back(t);
                shell.ms.push_back(s);
            }
        }
        report("nacl.cif, CIF File", viaDialog, direct, shell);
    }

    // Hand-made: the dialog copies the file to morvel.in; directly that is one file copy.
    {
        choose(dialog, 1, demo + QStringLiteral("/quartz.in"));
        Stats viaDialog, direct, none;
        for (int i = -3; i < jobs; ++i) {
            dropKeptResults(demo);
            const double d = dialogJob.run();
            QElapsedTimer clock;
            clock.start();
            std::error_code error;
            const bool copied = std::filesystem::copy_file(
                "quartz.in", "morvel.in", std::filesystem::copy_options::overwrite_existing, error);
            const bool ok = copied && spawnAndWait({"./morvel"});
            const double t = msSince(clock);
            allSucceeded = allSucceeded && d >= 0 && ok;
            if (i >= 0) {
                viaDialog.ms.push_back(d);
                direct.ms.push_back(t);
            }
        }
        report("quartz.in, Hand-made", viaDialog, direct, none);
    }

    if (!allSucceeded) {
        std::printf("some jobs failed: the figures above do not count\n");
        return 1;
    }
    return 0;
}
