// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QByteArray>
#include <QString>
#include <QStringList>

#include <sys/types.h>

/// The processor time of this process so far, in nanoseconds.
double OwnProcessorTime();

/// The memory of this process in KiB, without what has already been freed.
double OwnMemoryKiB();

/// The memory that is free on this machine, or could be, in KiB.
double AvailableMemoryKiB();

/// What a process needed from its start to its end.
struct ProcessCost
{
    double processorTime = 0; ///< in nanoseconds
    qint64 lines = 0;         ///< of its output, which goes to a pipe
    QByteArray output;        ///< its start
};

/// Runs a program to its end; exits if it fails.
ProcessCost RunToEnd(QStringList const& command);

/// A program that runs until the object is deleted.
class RunningProcess
{
public:
    enum Output { Dropped, ToPipe };

    /// Exits if the program does not start.
    explicit RunningProcess(QStringList const& command, Output output = Dropped);
    ~RunningProcess();
    RunningProcess(RunningProcess const&) = delete;
    RunningProcess& operator=(RunningProcess const&) = delete;

    /// Waits until it has used no processor for a second; exits if it ends.
    void WaitUntilIdle() const;

    /// Waits until it has ended; exits if it failed.
    ///
    /// @return the most memory that it was seen to have, in KiB
    double WaitUntilEnded();

    /// Its processor time so far, in nanoseconds.
    double processorTime() const;

    /// The memory that it has now.
    double memoryKiB() const;

    /// The times that its threads gave up the processor by themselves: each is followed by a
    /// wake-up.
    int wakeUps() const;

    /// Where its output can be read; -1 if it is dropped.
    int output() const { return m_output; }

private:
    QString folder() const;

    QString m_name;
    int m_output = -1; // before the process: its start sets it
    pid_t m_process = -1;
};
