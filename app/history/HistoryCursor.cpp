// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/history/HistoryCursor.h"

#include <algorithm>

namespace Velocor {

HistoryCursor::HistoryCursor(LogHistory const& history, bool withTimes)
    : m_history(&history), m_withTimes(withTimes)
{
    const bool hasTimes =
        std::any_of(history.files().begin(), history.files().end(), [](HistoryFile const& file) {
            LineTable const& lines = file.rows().lines();
            for (size_t line = 0; line < lines.size(); ++line) {
                if (lines.mark(line) & LogRows::Timed)
                    return true;
            }
            return false;
        });
    if (!hasTimes && !history.files().empty())
        m_key = history.files().front().modified();
}

bool HistoryCursor::enterRun()
{
    if (m_run == m_history->runs().size())
        return false;
    HistoryFile const& file = m_history->files()[run().file];
    if (!m_lines || &m_lines->file() != &file) {
        m_lines.emplace(file);
        m_row = 0;
    }
    m_isInRun = true;
    m_timed = run().firstLine;
    if (m_withTimes)
        findFirstTime();
    return true;
}

// For the lines before the first stamp.
void HistoryCursor::findFirstTime()
{
    m_clock = HistoryClock(m_history->FirstDay(m_run));
    m_time = -1;
    for (size_t line = run().firstLine; line < run().endLine && m_time < 0; ++line) {
        if (m_lines->mark(line) & LogRows::Timed) {
            HistoryClock clock = m_clock;
            const LogLineParser::Parts parts = m_lines->Parts(m_lines->Content(line));
            m_time = parts.timeKey < 0 ? -1 : clock.Read(parts.timeKey, parts.hasDate);
        }
    }
    m_key = std::max(m_key, m_time);
}

void HistoryCursor::noteTime(size_t line, QByteArray const& content)
{
    if (!(m_lines->mark(line) & LogRows::Timed))
        return;
    const LogLineParser::Parts parts = m_lines->Parts(content);
    if (parts.timeKey < 0)
        return;
    m_time = m_clock.Read(parts.timeKey, parts.hasDate);
    m_key = std::max(m_key, m_time);
}

// Of the current run; its end if there is none. Rows are in the order of the runs.
size_t HistoryCursor::nextShownLine()
{
    LogRows const& rows = file().rows();
    while (m_row < rows.size() && rows.isHeading(m_row))
        ++m_row;
    if (m_row == rows.size())
        return run().endLine;
    const size_t line = rows.line(m_row);
    return line >= run().firstLine ? std::min(line, run().endLine) : run().endLine;
}

bool HistoryCursor::Next()
{
    while (m_isInRun || enterRun()) {
        const size_t line = nextShownLine();
        if (m_withTimes) {
            for (; m_timed < line; ++m_timed)
                noteTime(m_timed, m_lines->Content(m_timed));
        }
        if (line == run().endLine) {
            m_isInRun = false;
            ++m_run;
            continue;
        }
        m_line = line;
        ++m_row;
        if (!m_lines->IsSame(line, m_lines->Content(line)))
            continue;
        if (m_withTimes) {
            noteTime(line, content());
            m_timed = line + 1;
        }
        return true;
    }
    return false;
}

} // namespace Velocor
