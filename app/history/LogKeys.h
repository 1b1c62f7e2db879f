// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/history/HistoryClock.h"
#include "app/history/HistoryUpdate.h"
#include "app/logfile/LineTable.h"
#include "app/logfile/LogLineParser.h"
#include "app/logfile/LogSource.h"

#include <QtGlobal>

#include <functional>
#include <vector>

namespace Velocor {

/// The positions of a log's lines among those of other logs, as HistoryCursor::key() has them.
///
/// The times of lines are read once, and again only if the lines have changed. One thread at a
/// time.
///
///     LogKeys keys;
///     keys.Update(update, source, parser, [] { return true; });
///     key = keys.key(line);
class LogKeys
{
public:
    /// Finds the positions of all lines.
    ///
    /// @param update  of a HistoryScanner that reads all of the log
    /// @param parser  knows the type of the files
    /// @param goesOn  called now and then; false stops reading
    /// @return false if it was stopped; the positions are then unknown
    bool Update(HistoryUpdate const& update, LogSource const& source, LogLineParser const& parser,
                std::function<bool()> const& goesOn);

    /// Makes Update() read all times again, as when a file has been replaced.
    void Forget();

    /// The position of a line, by its number in the table of the update.
    qint64 key(size_t line) const { return m_keys[line]; }

private:
    bool readStamps(LineTable const& lines, LogSource const& source, LogLineParser const& parser,
                    std::function<bool()> const& goesOn);
    bool hasTimes() const;
    HistoryClock::Stamp stamp(size_t line) const;
    std::vector<qint64> firstDays(std::vector<HistoryRun> const& runs,
                                  LogSource const& source) const;

    LineTable m_lines;            // whose stamps are known
    std::vector<qint64> m_stamps; // twice the key, and one more with a date; -1 without a stamp
    std::vector<qint64> m_keys;
};

} // namespace Velocor
