#include "childprocess.h"

#include <QProcess>

#ifdef Q_OS_UNIX
#include <csignal>
#include <unistd.h>
#endif

void runInOwnProcessGroup(QProcess *process)
{
#ifdef Q_OS_UNIX
    process->setChildProcessModifier([] { ::setpgid(0, 0); });
#else
    Q_UNUSED(process);
#endif
}

void killProgram(QProcess *process)
{
#ifdef Q_OS_UNIX
    // The group has the program's id; the program's own end is still reported by its QProcess.
    const qint64 pid = process->processId();
    if (process->state() != QProcess::NotRunning && pid > 0)
        ::kill(-pid_t(pid), SIGKILL);
#endif
    process->kill();
}
