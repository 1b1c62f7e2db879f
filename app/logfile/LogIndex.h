// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/CandidateSearch.h"
#include "app/logfile/LineTable.h"
#include "app/logfile/LogEntry.h"
#include "app/logfile/LogFilter.h"
#include "app/logfile/LogLineParser.h"
#include "app/logfile/LogRows.h"

#include <QByteArray>

#include <algorithm>
#include <functional>
#include <limits>
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
/// A seam is where an entry is older than both the previous entry and the first entry of its run,
/// and follows the rest of a torn entry; or where it is so much older that no change of clocks
/// explains it. That is a guess: a clock may be set back after an entry of several lines. It
/// decides only the order of the runs. Every line of the file is indexed, wherever seams are.
///
/// As the newest run writes more entries, its seam moves; Begin() returns to the last entry before
/// it, and Feed() skips the lines that are known to follow it. If the file grows at its end while
/// the seam stays, it was none: the log writes at the end.
///
/// Pure: the caller supplies the bytes. One thread at a time.
///
///     file.seek(index.Begin());
///     while ((count = file.read(bytes, size)) > 0) {
///         if (!index.Feed(bytes, count))
///             file.seek(index.nextOffset());
///     }
///     index.End();
///     LogRows rows = index.Rows(filter);
class LogIndex
{
public:
    /// @param isOneRun  whether all lines are known to be of one run, so that no seam is looked
    /// for;
    ///                  so it is in other programs' files
    explicit LogIndex(LogLineParser const& parser = LogLineParser(),
                      LogFilter const& filter = LogFilter(), bool isOneRun = false);

    /// Starts a pass over the file.
    ///
    /// @return the offset to read the file from: 0 in the first pass
    qint64 Begin();

    /// Processes the next bytes of the file.
    ///
    /// @return false if the lines before nextOffset() are known from the previous pass, and reading
    ///         must go on there
    bool Feed(char const* bytes, int count);

    /// The offset of the next bytes to feed; after End(), where the file ended.
    qint64 nextOffset() const { return m_position; }

    /// Ends the pass at the end of the file; a last line without a line end counts as a line.
    void End();

    /// Starts to search the known lines for the text of another filter, which Rows() then needs.
    ///
    /// Only between two passes. The bytes from searchOffset() on have to be fed to Search(), until
    /// it is nextOffset(). Rows() lacks the lines that have not been searched, as it lacks those
    /// that have not been read in a first pass.
    ///
    ///     index.BeginSearch(filter);
    ///     while (index.searchOffset() < index.nextOffset()) {
    ///         lines = bytesOfFile(index.searchOffset(), index.SearchEnd(1 << 20));
    ///         index.Search(lines, [] { return true; });
    ///     }
    void BeginSearch(LogFilter const& filter);

    /// The offset of the first line that has not been searched; nextOffset() if there is none or
    /// slowLine() is known.
    qint64 searchOffset() const;

    /// How many lines have been searched: all, if no search is under way.
    size_t searchedLines() const { return std::min(m_searched, size()); }

    /// The end of the bytes to search next: of whole lines of up to `size` bytes together, or of
    /// one line if that is longer. What follows LineLimit in such a line is left out.
    qint64 SearchEnd(qint64 size) const;

    /// Searches the next lines.
    ///
    /// @param lines  the bytes of the file from searchOffset() to SearchEnd()
    /// @param goesOn  called after each line that the filter was asked about; false stops the
    /// search
    void Search(QByteArray const& lines, std::function<bool()> const& goesOn);

    /// Where the last complete line ends; after it the file may still change.
    qint64 completeOffset() const;

    /// The lines that match a filter, whose text must be that of the filter the index was made
    /// with. An entry is shown with all of its lines if one of them matches. Lines beyond
    /// MaximumEntryLines, and lines that continue no entry, are shown or not by themselves.
    LogRows Rows(LogFilter const& filter) const;

    /// The same, but without looking again at lines that were there before. While there is only one
    /// run, this takes as long as the number of new lines demands.
    ///
    /// @param before  rows of this index with the same filter, of any moment, or none
    LogRows Rows(LogFilter const& filter, LogRows const& before) const;

    /// Where the next pass will begin. Everything before it is final.
    qint64 resumeOffset() const;

    /// The number of lines in the file.
    size_t size() const { return m_lines.size(); }

    /// Takes a table with the same lines instead of its own, because it shares memory with others.
    void TakeLines(LineTable const& lines) { m_lines = lines; }

    /// The numbers of entries in the file. None stands for entries without a severity and for other
    /// lines that do not continue an entry; see LogRows::Continued.
    LogCounts const& counts() const { return m_counts; }

    /// The first line of each run, in the order of the file: the newest run first.
    std::vector<size_t> RunStarts() const;

    /// Whether the file was seen growing at its end, so that all of its lines are of one run.
    bool isOneRun() const { return m_isOneRun; }

    /// Whether the last pass found the seam in another place, or that it was none.
    bool hasMoved() const { return m_hasMoved; }

    /// Whether lines that were found after the seam have not been reached in this pass. Until they
    /// are, Rows() lacks them.
    bool awaitsKnownLines() const { return hasKnownLines() && m_runs.size() == 1; }

    /// Whether the last pass found no seam, although there had been one. Either the newest run has
    /// overwritten all earlier ones, or it has changed what follows it in a way that a pass over
    /// the new lines cannot recognize: the file should be read from the start by a new index. The
    /// same is true if the seam before an incomplete last line may be lost.
    bool hasLostSeam() const { return m_hasLostSeam; }

    /// The number of the first line, starting at 1, that the filter's expression takes too long
    /// for; 0 if there is none. With such a line the text is no longer searched for, and all lines
    /// match.
    size_t slowLine() const { return m_slowLine; }

    /// Whether any entry has an elapsed time.
    bool hasElapsed() const { return m_hasElapsed; }

    /// Whether any entry has a time stamp.
    bool hasTimes() const { return m_hasTimes; }

    /// Whether any entry has a severity.
    bool hasSeverities() const { return m_hasSeverities; }

    /// How many lines are shown or hidden together.
    static constexpr size_t MaximumEntryLines = 1000;

    /// How far into a line the text filter looks, in bytes. Whoever shows or copies a line may
    /// stop there, too: such a file is hardly a log.
    static constexpr int LineLimit = 64 * 1024 * 1024;

    /// How far into a line of another program times and severities are looked for, in bytes.
    static constexpr int PartsLimit = 64 * 1024;

private:
    static constexpr size_t AllLines = std::numeric_limits<size_t>::max();

    struct Run
    {
        size_t firstLine = 0;
        size_t timedLines = 0;
        qint64 firstTime = -1;
        bool hasDate = false;
    };

    // Lines that are not among the rows yet.
    struct Rest
    {
        size_t from;       // the first line to decide about
        size_t end;        // and the line after the last one
        size_t next;       // the first line that can still be shown as context
        size_t contextEnd; // up to here, lines follow a hit
    };

    bool isEntryMatched(size_t first, size_t end) const;
    size_t firstLineOfEntry(size_t line) const;
    size_t entryEndBefore(size_t line) const;
    size_t endOfRun(size_t number) const;
    void addRest(Rest rest, LogFilter const& filter, LogRows& rows) const;
    void addRun(size_t number, LogFilter const& filter, LogRows& rows) const;
    size_t countProblems() const;
    void count(quint8 mark, int step);
    void setMark(size_t line, quint8 mark);
    bool hasKnownLines() const { return m_known.size() > m_knownFirst; }
    size_t knownLineAt(qint64 start) const;
    size_t resumeLine() const;
    void forgetFrom(size_t line);
    bool addLine(char const* line, int length, bool complete);
    quint8 markOf(LogLineParser::Parts const& parts);
    int contentLength(char const* line, int length, bool complete) const;
    void findCandidate(char const* at, char const* end);
    LogFilter::Match matchOf(char const* line, int length, size_t index);
    qint64 endOf(size_t line) const;
    void searchLine(char const* line, qint64 length);
    bool isSeam(LogLineParser::Parts const& parts, qint64 end) const;
    bool isOlder(LogLineParser::Parts const& parts) const;
    bool isKnown(LogLineParser::Parts const& parts, qint64 end) const;
    void keepKnownLines();
    void forgetKnownLines();
    void joinRuns();
    void beginRun(LogLineParser::Parts const& parts);
    bool joinKnownLines(qint64 start);
    void noteTime(LogLineParser::Parts const& parts);

    LogLineParser m_parser;
    LogFilter m_filter;
    CandidateSearch m_search;
    size_t m_searched = AllLines;
    LogLineEnd m_lineEnd;
    LogLineParser::Beginnings m_beginnings;

    LineTable m_lines;
    std::vector<quint8> m_matches; // a LogFilter::Match for each line; empty without a text
    LogCounts m_counts{};
    size_t m_entryEnd = 0;   // lines from here on do not belong to the entry above
    std::vector<Run> m_runs; // newest first, as in the file
    bool m_hasElapsed = false;
    bool m_hasTimes = false;
    bool m_hasSeverities = false;
    size_t m_slowLine = 0;
    bool m_lastIsComplete = true;

    // The newest run's last entry with a time: the next pass begins after it.
    bool m_newestIsTimed = false;
    size_t m_newestLastTimed = 0;
    qint64 m_newestLastTime = -1;

    bool m_isOneRun = false;
    bool m_hasMoved = false;
    bool m_hasLostSeam = false;

    // The current pass.
    qint64 m_seamLimit = 0; // no seam from here on
    qint64 m_position = 0;
    qint64 m_candidate = -1; // the next in the bytes being fed; -1 if it is not known
    qint64 m_lineStart = 0;
    QByteArray m_partialLine;
    bool m_lineIsPartial = false;
    char m_lastByte = '\0'; // of a partial line
    bool m_runHasTimed = false;
    size_t m_lastTimed = 0;
    qint64 m_lastTime = -1;

    // What the previous pass found: the end of the file, and the complete lines after the seam.
    qint64 m_formerEnd = 0;
    qint64 m_knownEnd = 0;
    qint64 m_knownSeam = -1; // -1: there was none
    bool m_hasLostRun = false;
    bool m_isSeamUnchanged = false;
    LineTable m_known;       // from m_knownFirst on
    size_t m_knownFirst = 0; // the first line after the seam
    std::vector<quint8> m_knownMatches;
    std::vector<Run> m_knownRuns;
};

} // namespace Velocor
