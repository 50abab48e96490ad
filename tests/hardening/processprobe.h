#ifndef MORVEL_PROCESSPROBE_H
#define MORVEL_PROCESSPROBE_H

// What a fault or load test measures of its own process: the longest stop of the event loop,
// memory, open file descriptors and child processes (Linux /proc).

#include <QCoreApplication>
#include <QDir>
#include <QElapsedTimer>
#include <QEventLoop>
#include <QFile>
#include <QProcess>
#include <QTimer>

#include <csignal>
#include <functional>

#include <grp.h>
#include <pwd.h>
#include <sys/prctl.h>
#include <sys/wait.h>
#include <unistd.h>

#if defined(__SANITIZE_ADDRESS__)
#define MORVEL_TEST_SANITIZED 1
#elif defined(__has_feature)
#if __has_feature(address_sanitizer)
#define MORVEL_TEST_SANITIZED 1
#endif
#endif
#ifndef MORVEL_TEST_SANITIZED
#define MORVEL_TEST_SANITIZED 0
#endif

// AddressSanitizer keeps freed memory in quarantine, so memory figures mean nothing there.
constexpr bool memoryFiguresHold = !MORVEL_TEST_SANITIZED;

// The longest time between two ticks of a 10 ms timer: how long the dialog stopped answering.
class LoopGapMeter
{
public:
    LoopGapMeter()
    {
        QObject::connect(&timer, &QTimer::timeout, [this] {
            longest = std::max(longest, clock.restart());
        });
        timer.start(10);
        clock.start();
    }
    void restart()
    {
        longest = 0;
        clock.restart();
    }
    qint64 longestGapMs() const { return std::max(longest, clock.elapsed()); }

private:
    QTimer timer;
    QElapsedTimer clock;
    qint64 longest = 0;
};

// Runs the event loop, as the application does, until done() holds or timeoutMs have passed.
inline bool runLoopUntil(const std::function<bool()> &done, int timeoutMs)
{
    QElapsedTimer clock;
    clock.start();
    QEventLoop loop;
    QTimer poll;
    QObject::connect(&poll, &QTimer::timeout, [&] {
        if (done() || clock.elapsed() > timeoutMs)
            loop.quit();
    });
    poll.start(5);
    if (!done())
        loop.exec();
    return done();
}

// A field of /proc/self/status in KiB (VmRSS, VmHWM), -1 when there is none.
inline qint64 statusKiB(const char *field)
{
    QFile status(QStringLiteral("/proc/self/status"));
    if (!status.open(QIODevice::ReadOnly))
        return -1;
    const QByteArray key = QByteArray(field) + ':';
    for (const QByteArray &line : status.readAll().split('\n'))
        if (line.startsWith(key))
            return line.mid(key.size()).trimmed().split(' ').value(0).toLongLong();
    return -1;
}

// Starts a new peak of the resident set size: VmHWM drops to the present VmRSS.
inline void resetPeakMemory()
{
    QFile clear(QStringLiteral("/proc/self/clear_refs"));
    if (clear.open(QIODevice::WriteOnly))
        clear.write("5");
}

inline int openDescriptors()
{
    return int(QDir(QStringLiteral("/proc/self/fd")).entryList(QDir::NoDotAndDotDot | QDir::AllEntries).size());
}

// The state letter of a process (R, S, Z...), 0 when there is no such process.
inline char processState(qint64 pid)
{
    QFile stat(QStringLiteral("/proc/%1/stat").arg(pid));
    if (pid <= 0 || !stat.open(QIODevice::ReadOnly))
        return 0;
    const QByteArray line = stat.readAll();
    return line.mid(line.lastIndexOf(')') + 2, 1).at(0);
}

// True while a process with this id runs; an ended one that has not been waited for does not.
inline bool processRuns(qint64 pid)
{
    return pid > 0 && ::kill(pid_t(pid), 0) == 0 && processState(pid) != 'Z';
}

// The ids of the running processes whose parent is this process. The test process is made a
// subreaper, so a grandchild orphaned by a killed child is counted here too.
inline QList<qint64> childProcesses()
{
    QList<qint64> children;
    const QByteArray self = QByteArray::number(qint64(::getpid()));
    for (const QString &entry : QDir(QStringLiteral("/proc")).entryList(QDir::Dirs | QDir::NoDotAndDotDot)) {
        bool number = false;
        const qint64 pid = entry.toLongLong(&number);
        if (!number)
            continue;
        QFile stat(QStringLiteral("/proc/%1/stat").arg(entry));
        if (!stat.open(QIODevice::ReadOnly))
            continue;
        const QByteArray line = stat.readAll();
        // pid (comm) state ppid ...; comm may hold blanks and parentheses.
        const QList<QByteArray> fields = line.mid(line.lastIndexOf(')') + 2).split(' ');
        if (fields.value(1) == self && fields.value(0) != "Z")
            children.append(pid);
    }
    return children;
}

inline void becomeSubreaper()
{
    ::prctl(PR_SET_CHILD_SUBREAPER, 1);
}

// Waits for the ended orphans this process adopted. Only when no QProcess exists: their ended
// children must be left to them.
inline void reapAdoptedOrphans()
{
    while (::waitpid(-1, nullptr, WNOHANG) > 0) {
    }
}

// Root opens and renames what file modes forbid. A case that needs an ordinary user runs, when
// the tests run as root, in a copy of this test program started as "nobody"; the variables in
// environment go along. Returns false when the caller is not root and must do the work itself;
// otherwise the case has run and *report holds the child's output (empty when it passed).
inline bool ranAsNobody(const QString &testFunction, const QStringList &environment, QString *report)
{
    if (::geteuid() != 0)
        return false;
    const passwd *user = ::getpwnam("nobody");
    if (!user) {
        *report = QStringLiteral("there is no user \"nobody\"");
        return true;
    }
    const uid_t uid = user->pw_uid;
    const gid_t gid = user->pw_gid;
    QProcess child;
    QProcessEnvironment env = QProcessEnvironment::systemEnvironment();
    env.remove(QStringLiteral("XDG_RUNTIME_DIR"));
    env.insert(QStringLiteral("HOME"), QDir::tempPath());
    for (const QString &assignment : environment)
        env.insert(assignment.section(QLatin1Char('='), 0, 0), assignment.section(QLatin1Char('='), 1));
    child.setProcessEnvironment(env);
    child.setWorkingDirectory(QDir::tempPath());
    child.setProcessChannelMode(QProcess::MergedChannels);
    child.setChildProcessModifier([uid, gid] {
        if (::setgroups(0, nullptr) != 0 || ::setgid(gid) != 0 || ::setuid(uid) != 0)
            ::_exit(97);
    });
    child.start(QCoreApplication::applicationFilePath(), {testFunction});
    const bool ended = child.waitForFinished(120000);
    const QByteArray output = child.readAll();
    if (!ended || child.exitStatus() != QProcess::NormalExit || child.exitCode() != 0)
        *report = QStringLiteral("as nobody, exit %1:\n%2").arg(child.exitCode()).arg(QString::fromLocal8Bit(output));
    else
        report->clear();
    return true;
}

#endif
