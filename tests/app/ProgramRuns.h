// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QByteArray>
#include <QProcess>
#include <QProcessEnvironment>
#include <QString>
#include <QStringList>

#include <functional>

/// Copies a program to @p folder / @p name, so that it runs from there. False if that fails.
bool CopyProgram(QString const& program, QString const& folder, QString const& name);

/// The environment of this process with home, data, configuration and runtime folders below @p
/// folder (home, data, config, run), which are created.
QProcessEnvironment PrivateEnvironment(QString const& folder);

/// The result of a program that ran to its end.
struct ProgramResult
{
    bool finished = false; ///< exited by itself, within the time limit, without a crash
    int exitCode = -1;
    QByteArray output;
    QByteArray errors;
};

/// Runs a program to its end.
ProgramResult RunProgram(QString const& program, QStringList const& arguments,
                         QProcessEnvironment const& environment);

/// A process that runs a function in the child before the program starts there, where signals that
/// end a program have their default effect. Killed with this object if it is still running.
class PreparedProcess : public QProcess
{
public:
    PreparedProcess();

    ~PreparedProcess() override
    {
        kill();
        waitForFinished();
    }

    std::function<void()> inChild; ///< async-signal-safe calls only

#if QT_VERSION < QT_VERSION_CHECK(6, 0, 0)
protected:
    void setupChildProcess() override
    {
        prepare();
    }
#endif

private:
    void prepare() const;
};

/// The next line of a process's standard output, including its line feed. Whatever there is of it
/// if the process ends or the time is up.
QByteArray NextLine(QProcess& process);
