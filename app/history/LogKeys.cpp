// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/history/LogKeys.h"

#include "app/history/HistoryTime.h"
#include "app/logfile/LogIndex.h"
#include "app/logfile/LogLineReader.h"

#include <QDateTime>
#include <QFileInfo>

#include <algorithm>
#include <utility>

namespace Velocor {

namespace {

constexpr size_t LinesBetweenCalls = 1024;

constexpr qint64 NoStamp = -1;

qint64 ModifiedTime(QString const& path)
{
    const QFileInfo file(path);
    return file.exists()
               ? std::max<qint64>(0, HistoryTime::OfEpoch(file.lastModified().toMSecsSinceEpoch()))
               : 0;
}

// Reads the stamps of lines.
class StampReader
{
public:
    StampReader(LogSource const& source, LogLineParser const& parser)
        : m_parser(parser), m_isOpen(m_reader.Open(source, parser.fileType()))
    {}

    // A line that has been overwritten meanwhile has none.
    qint64 Read(qint64 start, quint16 check)
    {
        const QByteArray line = m_isOpen ? m_reader.Line(start) : QByteArray();
        if (!m_isOpen || LogRows::CheckOf(line.constData(), line.size()) != check)
            return NoStamp;
        char const* text = line.constData();
        int length = line.size();
        QByteArray narrow;
        m_parser.fileType().encoding.Narrow(text, length, narrow);
        const LogLineParser::Parts parts =
            m_parser.Find(text, std::min(length, LogIndex::PartsLimit));
        return parts.timeKey < 0 ? NoStamp : parts.timeKey * 2 + (parts.hasDate ? 1 : 0);
    }

private:
    LogLineParser const& m_parser;
    LogLineReader m_reader;
    bool m_isOpen;
};

} // namespace

HistoryClock::Stamp LogKeys::stamp(size_t line) const
{
    HistoryClock::Stamp stamp;
    stamp.key = m_stamps[line] < 0 ? -1 : m_stamps[line] / 2;
    stamp.hasDate = m_stamps[line] >= 0 && m_stamps[line] % 2 != 0;
    return stamp;
}

// Lines that are where they were keep their stamps.
bool LogKeys::readStamps(LineTable const& lines, LogSource const& source,
                         LogLineParser const& parser, std::function<bool()> const& goesOn)
{
    StampReader reader(source, parser);
    LineTable::Reader starts(lines);
    LineTable::Reader knownStarts(m_lines);
    std::vector<qint64> stamps;
    stamps.reserve(lines.size());
    size_t known = 0;
    for (size_t line = 0; line < lines.size(); ++line) {
        if (line % LinesBetweenCalls == 0 && !goesOn())
            return false;
        const qint64 start = starts.start(line);
        while (known < m_lines.size() && knownStarts.start(known) < start)
            ++known;
        const bool isKnown = known < m_lines.size() && knownStarts.start(known) == start &&
                             m_lines.mark(known) == lines.mark(line) &&
                             m_lines.check(known) == lines.check(line);
        if (isKnown)
            stamps.push_back(m_stamps[known]);
        else
            stamps.push_back(lines.mark(line) & LogRows::Timed
                                 ? reader.Read(start, lines.check(line))
                                 : NoStamp);
    }
    m_lines = lines;
    m_stamps = std::move(stamps);
    return true;
}

bool LogKeys::hasTimes() const
{
    for (size_t line = 0; line < m_lines.size(); ++line) {
        if (m_lines.mark(line) & LogRows::Timed)
            return true;
    }
    return false;
}

void LogKeys::Forget()
{
    m_lines = LineTable();
    m_stamps.clear();
    m_keys.clear();
}

// A run ended before the next one began, so the newest one is first.
std::vector<qint64> LogKeys::firstDays(std::vector<HistoryRun> const& runs,
                                       LogSource const& source) const
{
    std::vector<qint64> days(runs.size());
    qint64 latest = -1;
    for (size_t run = runs.size(); run > 0; --run) {
        size_t line = runs[run - 1].firstLine;
        const qint64 modified = ModifiedTime(source.FileAt(m_lines.start(line)).path);
        latest = latest < 0 ? modified : std::min(latest, modified);
        const auto next = [&](LogLineParser::Parts& parts) {
            while (line < runs[run - 1].endLine) {
                const HistoryClock::Stamp found = stamp(line++);
                parts.timeKey = found.key;
                parts.hasDate = found.hasDate;
                if (found.key >= 0)
                    return true;
            }
            return false;
        };
        days[run - 1] = HistoryClock::FindFirstDay(next, latest);
    }
    return days;
}

bool LogKeys::Update(HistoryUpdate const& update, LogSource const& source,
                     LogLineParser const& parser, std::function<bool()> const& goesOn)
{
    LineTable const& lines = update.rows->lines();
    if (!readStamps(lines, source, parser, goesOn))
        return false;

    std::vector<HistoryRun> const& runs = *update.runLines;
    const std::vector<qint64> days = firstDays(runs, source);
    m_keys.assign(lines.size(), -1);
    qint64 key = hasTimes() || lines.isEmpty() ? -1 : ModifiedTime(source.FileAt(0).path);
    for (size_t run = 0; run < runs.size(); ++run) {
        HistoryClock clock(days[run]);
        bool hasTime = false;
        size_t untimed = runs[run].firstLine; // have the time of the first stamp
        for (size_t line = runs[run].firstLine; line < runs[run].endLine; ++line) {
            const HistoryClock::Stamp found = stamp(line);
            if (found.key >= 0)
                key = std::max(key, clock.Read(found.key, found.hasDate));
            for (; found.key >= 0 && !hasTime && untimed < line; ++untimed)
                m_keys[untimed] = key;
            hasTime = hasTime || found.key >= 0;
            m_keys[line] = key;
        }
    }
    return true;
}

} // namespace Velocor
