// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/history/LogHistory.h"

#include "app/history/HistoryClock.h"
#include "app/history/HistoryLines.h"
#include "app/history/RunEnds.h"
#include "app/logfile/LogFileList.h"

#include <QFileInfo>

#include <algorithm>
#include <utility>

namespace Velocor {

namespace {

// A log rotates at the start of its program, so twice in a row is rare.
constexpr int MaximumTries = 10;

QStringList OldestFirst(QStringList paths)
{
    std::reverse(paths.begin(), paths.end());
    return paths;
}

} // namespace

LogHistory::LogHistory(LogLineParser parser, LogFilter filter)
    : m_parser(std::move(parser)), m_filter(std::move(filter))
{}

bool LogHistory::ReadLog(QString const& path)
{
    const auto list = [&path] {
        QStringList paths = LogFileList::FilesOf(path);
        if (paths.size() > 1 && !QFileInfo::exists(path))
            paths.removeOne(path); // its program has not written since it was rotated
        return OldestFirst(paths);
    };
    QStringList paths = list();
    for (int i = 0; i < MaximumTries; ++i) {
        open(paths);
        const QStringList before = std::exchange(paths, list());
        if (paths == before && isInPlace())
            break;
    }
    return readOpenFiles();
}

bool LogHistory::ReadFiles(QStringList const& paths)
{
    open(paths);
    return readOpenFiles();
}

void LogHistory::open(QStringList const& paths)
{
    m_files.clear();
    for (QString const& path : paths) {
        m_files.emplace_back();
        m_files.back().Open(path);
    }
}

bool LogHistory::isInPlace() const
{
    return std::all_of(m_files.begin(), m_files.end(), [](HistoryFile const& file) {
        return !file.error().isEmpty() || file.IsInPlace();
    });
}

bool LogHistory::readOpenFiles()
{
    m_errors.clear();
    m_runs.clear();
    for (HistoryFile& file : m_files) {
        if (!file.error().isEmpty() || !file.Read(m_parser, m_filter))
            m_errors.append(file.path() + QLatin1String(": ") + file.error());
    }
    const auto end = std::remove_if(m_files.begin(), m_files.end(), [](HistoryFile const& file) {
        return !file.error().isEmpty();
    });
    m_files.erase(end, m_files.end());
    for (size_t file = 0; file < m_files.size(); ++file)
        addRuns(file);
    findFirstDays();
    return m_errors.isEmpty();
}

void LogHistory::addRuns(size_t file)
{
    std::vector<size_t> const& starts = m_files[file].runStarts();
    size_t end = m_files[file].rows().lines().size();
    for (size_t number = starts.size(); number > 0; --number) {
        HistoryRun run;
        run.file = file;
        run.firstLine = starts[number - 1];
        run.endLine = end;
        run.isCut = number > 1;
        end = run.firstLine;
        if (run.firstLine < run.endLine)
            m_runs.push_back(run);
    }
}

// Newest first: a run ended before the next one began.
void LogHistory::findFirstDays()
{
    m_firstDays.assign(m_runs.size(), 0);
    qint64 latest = -1;
    for (size_t run = m_runs.size(); run > 0; --run) {
        const qint64 modified = m_files[m_runs[run - 1].file].modified();
        latest = latest < 0 ? modified : std::min(latest, modified);
        m_firstDays[run - 1] = findFirstDay(run - 1, latest);
    }
}

// @param latest  as HistoryClock::FirstDay()
qint64 LogHistory::findFirstDay(size_t run, qint64& latest) const
{
    HistoryLines lines(m_files[m_runs[run].file]);
    size_t line = m_runs[run].firstLine;
    const auto next = [&](LogLineParser::Parts& parts) {
        for (; line < m_runs[run].endLine; ++line) {
            if (!(lines.mark(line) & LogRows::Timed))
                continue;
            parts = lines.Parts(lines.Content(line));
            if (parts.timeKey < 0)
                continue;
            ++line;
            return true;
        }
        return false;
    };
    return HistoryClock::FindFirstDay(next, latest);
}

void LogHistory::ReadTimes()
{
    for (HistoryRun& run : m_runs) {
        LineTable const& lines = m_files[run.file].rows().lines();
        run.counts = LogCounts();
        for (size_t line = run.firstLine; line < run.endLine; ++line) {
            const quint8 mark = lines.mark(line);
            if (!(mark & LogRows::Continued))
                ++run.counts[mark & LogRows::SeverityMask];
        }
    }
    for (size_t number = 0; number < m_runs.size(); ++number) {
        HistoryRun& run = m_runs[number];
        HistoryClock clock(FirstDay(number));
        HistoryLines lines(m_files[run.file]);
        for (size_t line = run.firstLine; line < run.endLine; ++line) {
            if (!(lines.mark(line) & LogRows::Timed))
                continue;
            const LogLineParser::Parts parts = lines.Parts(lines.Content(line));
            if (parts.timeKey < 0)
                continue;
            run.end = clock.Read(parts.timeKey, parts.hasDate);
            run.start = run.start < 0 ? run.end : run.start;
        }
    }
}

void LogHistory::ReadEnds(QString const& path)
{
    RunEnds::Assign(RunEnds::Of(path), m_runs);
}

} // namespace Velocor
