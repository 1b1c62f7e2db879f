// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/history/HistoryClock.h"
#include "app/history/HistoryFile.h"
#include "app/logfile/LogScanner.h"
#include "app/terminal/LineWriter.h"

#include <functional>
#include <map>

namespace Velocor {

/// Prints what a log gets, from a moment on: lines at the end of its run, and the lines of runs
/// that write over it or rotate it.
///
/// An incomplete line waits for its end. If a line that arrives later makes its entry match, the
/// lines of the entry that have not been printed are. What has been printed stays, even if such a
/// line hides its entry. The file is kept open, so that what it got right before it was rotated is
/// printed, too. Needs an event loop.
class LogFollower
{
public:
    using Print = std::function<void(PrintedLine const&)>;

    /// @param print  called for each line
    /// @param flush  called after the lines of each change
    LogFollower(QString program, QString path, Print print, std::function<void()> flush);

    /// Tells that the lines of this file, except an incomplete one, have been printed.
    void NotePrinted(HistoryFile const& file);

    /// Starts to follow. Prints what the file has got since.
    void Start(LogLineParser const& parser, LogFilter const& filter);

private:
    using Line = std::function<QByteArray(size_t row, QByteArray& lineEnd)>;

    void take(LogUpdate const& update);
    void printRest();
    void restart();
    void open();
    void noteFirstLine(LogRows const& rows);
    void printNew(LogRows const& rows, qint64 end, Line const& read);
    size_t firstCandidate(LogRows const& rows) const;
    void print(LogRows const& rows, size_t row, QByteArray const& content,
               QByteArray const& lineEnd);
    qint64 timeOf(QByteArray const& content);
    void forgetOldLines(LogRows const& rows);

    QString m_program;
    QString m_path;
    Print m_print;
    std::function<void()> m_flush;
    LogScanner m_scanner;
    LogLineParser m_parser;
    LogFilter m_filter;
    int m_request = 0;
    HistoryFile m_held; // the file that is followed, under whatever name

    bool m_hasLines = false;
    quint16 m_firstCheck = 0;            // of the first line of the newest run
    qint64 m_end = 0;                    // what is before has been seen
    std::map<qint64, quint16> m_printed; // lines of entries that may still change: start, check
    HistoryClock m_clock;
    qint64 m_time = -1;
};

} // namespace Velocor
