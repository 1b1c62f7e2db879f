// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "ProgramRuns.h"

#include "support/TestFiles.h"

#include <QDir>
#include <QElapsedTimer>
#include <QFileInfo>
#include <QJsonDocument>
#include <QJsonObject>
#include <QProcess>
#include <QRegularExpression>
#include <QTemporaryDir>

#include <algorithm>
#include <csignal>
#include <functional>
#include <sys/types.h>

// The program itself in its own installation tree, run as a process. Needs VELOCOR_PROGRAM, and
// SPY_PLUGINS for AddSpy().

inline constexpr int Patience = 60000;

inline QString const Stamp("\\d{4}-\\d\\d-\\d\\d \\d\\d:\\d\\d:\\d\\d\\.\\d{1,3}");

inline QByteArray Option(char const* key, QByteArray const& text)
{
    return QByteArray("<arg key=\"") + key + "\">" + text + "</arg>\n";
}

// The pattern of one complete log entry.
inline QString Entry(QString const& severity, QString const& message)
{
    return Stamp + " " + severity + " " + QRegularExpression::escape(message) + "\n";
}

inline QRegularExpression Whole(QString const& pattern)
{
    return QRegularExpression("\\A" + pattern + "\\z");
}

inline QString const StartEntry = Entry("Trace", "app.exec() starting");

// Log files are Latin-1.
inline bool Matches(QByteArray const& log, QString const& pattern)
{
    return Whole(pattern).match(QString::fromLatin1(log)).hasMatch();
}

// An installation in a temporary tree, and a user whose folders are in the same tree.
class Installation
{
public:
    explicit Installation(QString const& folder = "tool/bin", QString const& rootFolder = "tool")
        : top(QFileInfo(m_tree.path()).canonicalFilePath() + "/"),
          program(top + folder + "/velocor"), root(top + rootFolder),
          environment(PrivateEnvironment(QFileInfo(top).path()))
    {
        installed = m_tree.isValid() && CopyProgram(VELOCOR_PROGRAM, top + folder, "velocor");
    }

    bool WriteLaunchData(QByteArray const& bytes) const
    {
        return TestFiles::write(root + "/appdata.cfg", bytes);
    }

    QString LogFolder(QString const& names = "yourorganization/yourproduct") const
    {
        return top + "data/" + names + "/logs/";
    }

    // Loads the spy into the program. See StartupSpy.cpp. Uses a copy, because another user may not
    // have access to the build folder.
    void AddSpy(QString const& end)
    {
        const QString folder = top + "plugins/generic/";
        QDir().mkpath(folder);
        const QDir built(QStringLiteral(SPY_PLUGINS) + "/generic");
        for (QString const& file : built.entryList(QDir::Files))
            QFile::copy(built.filePath(file), folder + file);
        environment.insert("QT_PLUGIN_PATH", top + "plugins");
        environment.insert("QT_QPA_GENERIC_PLUGINS", "startupspy");
        environment.insert("SPY_REPORT", top + "report.json");
        environment.insert("SPY_END", end);
    }

    QJsonObject Report() const
    {
        return QJsonDocument::fromJson(TestFiles::read(top + "report.json")).object();
    }

private:
    QTemporaryDir m_tree; // first: the paths below are made from it

public:
    QString top; ///< ends in "/", like every folder of the program
    QString program;
    QString root;
    QProcessEnvironment environment;
    bool installed = false;
};

// A running program that gets signals once its log says that it has started.
class RunningProgram
{
public:
    // inChild: run in the new process before the program, for limits, signals and descriptors.
    explicit RunningProgram(Installation const& installation, QStringList const& arguments = {},
                            std::function<void()> const& inChild = {})
    {
        m_process.inChild = inChild;
        m_process.setProcessEnvironment(installation.environment);
        m_process.start(installation.program, arguments);
    }

    // Whether the log matches the pattern before the timeout.
    bool WaitForLog(QString const& logFile, QString const& pattern)
    {
        QElapsedTimer time;
        time.start();
        while (!Matches(TestFiles::read(logFile), pattern)) {
            if (m_process.waitForFinished(20) || time.elapsed() > Patience)
                return false;
        }
        return true;
    }

    pid_t Id() const { return static_cast<pid_t>(m_process.processId()); }

    void Send(int signalNumber) const { ::kill(Id(), signalNumber); }

    // Whether the program has a file open.
    bool HasOpen(QString const& path) const
    {
        const QDir folder(QString("/proc/%1/fd").arg(Id()));
        const QFileInfoList files = folder.entryInfoList(QDir::AllEntries | QDir::System);
        return std::any_of(files.begin(), files.end(),
                           [&](QFileInfo const& file) { return file.symLinkTarget() == path; });
    }

    // To standard input, which stays open.
    void Write(QByteArray const& text)
    {
        m_process.write(text);
        m_process.waitForBytesWritten(Patience);
    }

    // The exit code, or -1 if the program did not exit normally.
    int ExitCode()
    {
        m_process.waitForFinished(Patience);
        const bool normal = m_process.state() == QProcess::NotRunning &&
                            m_process.exitStatus() == QProcess::NormalExit;
        return normal ? m_process.exitCode() : -1;
    }

    QByteArray Output() { return m_process.readAllStandardOutput(); }

    // The next line that the program prints, including its line feed; whatever there is if it ends
    // first.
    QByteArray NextLine() { return ::NextLine(m_process); }

private:
    PreparedProcess m_process;
};
