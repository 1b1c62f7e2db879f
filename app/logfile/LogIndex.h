// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/LogFilter.h"
#include "app/logfile/LogLineParser.h"
#include "app/logfile/LogRows.h"

#include <QByteArray>

#include <vector>

namespace Velocor {

/// An index of a log file: where its lines start, their severities, and which run wrote them.
///
/// The log opens its file without truncating it and writes from the start. After a restart, the
/// newest entries are therefore at the top, followed by older entries, the first of which is
/// usually torn; entries of even earlier runs may follow:
///
///     newest run  |  rest of previous run    |  rest of an earlier one
///                 ^ the seam                 ^ another
///
/// A seam is where an entry is older than both the previous entry and the first entry of its run.
/// As the newest run writes more entries, its seam moves; Begin() returns to the last entry before
/// it, and Feed() stops as soon as it reaches a known line. So all passes must be over one file
/// that only its newest run changes, and that does not grow while older runs are left in it;
/// otherwise use a new index.
///
/// Pure: the caller supplies the bytes. One thread at a time.
///
///     qint64 offset = index.Begin();
///     while (... && index.Feed(bytes, count)) {}
///     index.End();
///     LogRows rows = index.Rows(filter);
class LogIndex
{
public:
    explicit LogIndex(LogLineParser const& parser = LogLineParser(),
                      LogFilter const& filter = LogFilter());

    /// Starts a pass over the file.
    ///
    /// @return the offset to read the file from: 0 in the first pass
    qint64 Begin();

    /// Processes the next bytes of the file.
    ///
    /// @return false if the rest of the file is known from the previous pass; stop reading then
    bool Feed(char const* bytes, int count);

    /// Ends the pass at the end of the file; a last line without a line end counts as a line.
    void End();

    /// The lines that match a filter, whose text must be that of the filter the index was made
    /// with.
    LogRows Rows(LogFilter const& filter) const;

    /// Where the next pass will begin. Everything before it is final.
    qint64 resumeOffset() const;

    /// The number of lines in the file.
    size_t size() const { return m_starts.size(); }

    /// The number of runs with entries in the file, at most 64: later ones are not distinguished.
    size_t runs() const { return m_runs.size(); }

    /// Whether any entry has an elapsed time.
    bool hasElapsed() const { return m_hasElapsed; }

    /// How far into a line the text filter looks, in bytes.
    static constexpr int LineLimit = 64 * 1024;

private:
    struct Run
    {
        size_t firstLine = 0;
        size_t timedLines = 0;
        qint64 firstTime = -1;
        bool hasDate = false;
    };

    size_t resumeLine() const;
    void forgetFrom(size_t line);
    bool addLine(char const* line, int length, bool complete);
    quint8 markOf(LogLineParser::Parts const& parts, char const* line, int length) const;
    bool isOlder(LogLineParser::Parts const& parts) const;
    void beginRun(LogLineParser::Parts const& parts);
    bool joinKnownLines(qint64 start);
    void noteTime(LogLineParser::Parts const& parts);

    LogLineParser m_parser;
    LogFilter m_filter;

    std::vector<qint64> m_starts;
    std::vector<quint8> m_marks;
    std::vector<Run> m_runs; // newest first, as in the file
    bool m_hasElapsed = false;
    bool m_lastIsComplete = true;

    // The newest run's last entry with a time: the next pass begins after it.
    bool m_newestIsTimed = false;
    size_t m_newestLastTimed = 0;
    qint64 m_newestLastTime = -1;

    // The current pass.
    qint64 m_position = 0;
    qint64 m_lineStart = 0;
    QByteArray m_partialLine;
    bool m_lineIsPartial = false;
    bool m_runHasTimed = false;
    size_t m_lastTimed = 0;
    qint64 m_lastTime = -1;

    // What the previous pass found after the seam.
    std::vector<qint64> m_knownStarts;
    std::vector<quint8> m_knownMarks;
    std::vector<Run> m_knownRuns;
};

} // namespace Velocor
