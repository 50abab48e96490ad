#ifndef MORVEL_PROCESSEXIT_H
#define MORVEL_PROCESSEXIT_H

// A child that was killed or crashed must never be judged a success. Qt reports such an end as a
// crash exit whose exit code may be anything, 0 included; this gives the code the slots judge by.
inline int judgedExitCode(int exitCode, bool crashed)
{
    if (crashed && exitCode == 0)
        return 1;
    return exitCode;
}

#endif
