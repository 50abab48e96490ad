#ifndef MORVEL_CHILDPROCESS_H
#define MORVEL_CHILDPROCESS_H

class QProcess;

// A program the dialog starts may start others in turn (a wrapper script and the program it runs,
// or helpers). Where the platform has process groups, the program leads a group of its own, so
// that Kill and the end of the dialog reach all of them and leave no orphan running.
void runInOwnProcessGroup(QProcess *process);

// Kills the running program at once, with every process of its group; nothing when none runs.
void killProgram(QProcess *process);

#endif
