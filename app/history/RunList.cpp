// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/history/RunList.h"

#include "app/logfile/LogIndex.h"
#include "app/logfile/LogLineReader.h"

#include <algorithm>

namespace Velocor {

namespace {

// Of the runs in one file, so that identities of runs in different files differ.
constexpr quint64 MostRunsInFile = 256;

// The stamps of the first and the last entry of a run.
class RunTimes
{
public:
    RunTimes(LogSource const& source, LogLineParser const& parser)
        : m_parser(parser), m_isOpen(m_reader.Open(source, parser.fileType()))
    {}

    void Note(LineTable const& lines, HistoryRun& run, RunHeading& heading)
    {
        size_t first = run.firstLine;
        while (first < run.endLine && !(lines.mark(first) & LogRows::Timed))
            ++first;
        if (!m_isOpen || first == run.endLine)
            return;
        size_t last = run.endLine - 1;
        while (!(lines.mark(last) & LogRows::Timed))
            --last;
        const QByteArray line = m_reader.Line(lines.start(first));
        heading.start = m_parser.Parse(line).time;
        run.start = keyOf(line);
        heading.end = m_parser.Parse(m_reader.Line(lines.start(last))).time;
    }

private:
    // Without a date, a stamp does not tell which run it is.
    qint64 keyOf(QByteArray const& line) const
    {
        char const* text = line.constData();
        int length = line.size();
        QByteArray narrow;
        m_parser.fileType().encoding.Narrow(text, length, narrow);
        const LogLineParser::Parts parts =
            m_parser.Find(text, std::min(length, LogIndex::PartsLimit));
        return parts.hasDate ? parts.timeKey : -1;
    }

    LogLineParser const& m_parser;
    LogLineReader m_reader;
    bool m_isOpen;
};

} // namespace

void RunList::Add(std::vector<size_t> const& starts, size_t first, size_t end, quint64 file)
{
    for (size_t number = starts.size(); number > 0; --number) {
        HistoryRun run;
        run.firstLine = first + starts[number - 1];
        run.endLine = number < starts.size() ? first + starts[number] : end;
        run.isCut = number > 1;
        if (run.firstLine == run.endLine)
            continue;
        // What is left of runs is written over from the start, so they are counted from the end.
        RunHeading heading;
        heading.id = file * MostRunsInFile + (run.isCut ? starts.size() - number + 1 : 0);
        m_runs.push_back(run);
        m_headings.push_back(heading);
    }
}

LogCounts RunList::CountsOf(size_t run, LineTable const& lines) const
{
    LogCounts counts{};
    for (size_t line = m_runs[run].firstLine; line < m_runs[run].endLine; ++line) {
        const quint8 mark = lines.mark(line);
        if (!(mark & LogRows::Continued))
            ++counts[mark & LogRows::SeverityMask];
    }
    return counts;
}

void RunList::NoteCounts(size_t run, LogCounts const& counts)
{
    m_headings[run].warnings = counts[LogEntry::Warning];
    m_headings[run].errors = counts[LogEntry::Error] + counts[LogEntry::Fatal];
}

void RunList::NoteTimes(size_t first, LineTable const& lines, LogSource const& source,
                        LogLineParser const& parser)
{
    RunTimes times(source, parser);
    for (size_t run = first; run < m_runs.size(); ++run)
        times.Note(lines, m_runs[run], m_headings[run]);
}

void RunList::AddEarlierRows(size_t& run, LogRows const& from, std::vector<size_t> const& starts,
                             size_t offset, QSet<quint64> const& folded, LogRows& rows) const
{
    size_t row = from.earlier() > 0 ? 1 : 0; // after the heading
    for (size_t number = starts.size(); number > 1; --number) {
        const size_t end = number < starts.size() ? starts[number] : from.lines().size();
        if (starts[number - 1] == end)
            continue;
        size_t next = row;
        size_t last = from.earlier();
        while (next < last) { // to the first row of the run after this one
            const size_t middle = next + (last - next) / 2;
            if (from.line(middle) >= starts[number - 1])
                next = middle + 1;
            else
                last = middle;
        }
        if (next > row) {
            rows.AddHeading(LogRows::FirstRunHeading - static_cast<qint64>(run));
            if (!folded.contains(m_headings[run].id))
                rows.AddRows(from, row, next, offset);
        }
        row = next;
        ++run;
    }
}

void RunList::AddNewestRows(size_t run, LogRows const& from, size_t offset,
                            QSet<quint64> const& folded, LogRows& rows) const
{
    const size_t first = from.earlier() > 0 ? from.earlier() + 1 : 0;
    if (first == from.size())
        return;
    rows.AddHeading(LogRows::FirstRunHeading - static_cast<qint64>(run));
    if (!folded.contains(m_headings[run].id))
        rows.AddRows(from, first, from.size(), offset);
}

} // namespace Velocor
