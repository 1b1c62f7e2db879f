// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QByteArray>
#include <QString>
#include <QStringList>

#include <chrono>
#include <mutex>
#include <thread>
#include <vector>

/// A log to which whole lines are appended; exits if that fails.
class AppendedLog
{
public:
    explicit AppendedLog(QString const& fileName);
    ~AppendedLog();
    AppendedLog(AppendedLog const&) = delete;
    AppendedLog& operator=(AppendedLog const&) = delete;

    void Append(QByteArray const& text) const;

private:
    int m_file;
};

/// Writes a line now and then, each to one of several logs, and takes the time until each of them
/// has arrived somewhere. Writes in a thread of its own.
class TimedLines
{
public:
    /// @param lines  how many the logs have, at most: the times of the new ones follow from it
    TimedLines(QStringList const& fileNames, qint64 lines, int count);
    ~TimedLines();
    TimedLines(TimedLines const&) = delete;
    TimedLines& operator=(TimedLines const&) = delete;

    /// So many lines have arrived by now.
    void NoteArrived(size_t lines);

    bool isOver() const { return m_times.size() >= size_t(m_count); }

    /// Of each line, in nanoseconds.
    std::vector<double> const& times() const { return m_times; }

private:
    int m_count;
    std::mutex m_mutex;
    std::vector<std::chrono::steady_clock::time_point> m_written;
    std::vector<double> m_times;
    std::thread m_thread; // the last one: it uses the others
};
