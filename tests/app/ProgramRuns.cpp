// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "ProgramRuns.h"

#include <QDir>
#include <QFile>
#include <QProcess>

#include <csignal>

bool CopyProgram(QString const& program, QString const& folder, QString const& name)
{
    return QDir().mkpath(folder) && QFile::copy(program, folder + "/" + name);
}

QProcessEnvironment PrivateEnvironment(QString const& folder)
{
    QProcessEnvironment environment = QProcessEnvironment::systemEnvironment();
    const struct
    {
        char const* variable;
        char const* name;
    } folders[] = {{"HOME", "home"},
                   {"XDG_DATA_HOME", "data"},
                   {"XDG_CONFIG_HOME", "config"},
                   {"XDG_RUNTIME_DIR", "run"}};
    for (auto const& entry : folders) {
        const QString path = folder + "/" + entry.name;
        QDir().mkpath(path);
        environment.insert(entry.variable, path);
    }
    // Qt warns about a runtime folder that other users may enter.
    QFile::setPermissions(folder + "/run", QFile::ReadOwner | QFile::WriteOwner | QFile::ExeOwner);
    environment.insert("LC_ALL", "C.UTF-8");
    // What the platform plug-in says about the desktop is not part of the test.
    environment.insert("QT_LOGGING_RULES", "qt.qpa.*=false");
    // Some releases of Qt complain about this name.
    environment.remove("QT_LOGGING_TO_CONSOLE");
    return environment;
}

ProgramResult RunProgram(QString const& program, QStringList const& arguments,
                         QProcessEnvironment const& environment)
{
    QProcess process;
    process.setProcessEnvironment(environment);
    process.start(program, arguments);

    ProgramResult result;
    const bool ended = process.waitForFinished(60000);
    result.finished = ended && process.exitStatus() == QProcess::NormalExit;
    result.exitCode = process.exitCode();
    result.output = process.readAllStandardOutput();
    result.errors = process.readAllStandardError();
    return result;
}

// Tests that run in the background, or under nohup, ignore some of these signals, and so would the
// program.
PreparedProcess::PreparedProcess()
{
#if QT_VERSION >= QT_VERSION_CHECK(6, 0, 0)
    setChildProcessModifier([this] { prepare(); });
#endif
}

void PreparedProcess::prepare() const
{
    for (int signalNumber : {SIGHUP, SIGINT, SIGTERM})
        std::signal(signalNumber, SIG_DFL);
    if (inChild)
        inChild();
}

QByteArray NextLine(QProcess& process)
{
    process.setReadChannel(QProcess::StandardOutput);
    while (!process.canReadLine() && process.waitForReadyRead(30000)) {}
    return process.readLine();
}
