// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/LogFileType.h"
#include "app/logfile/LogRows.h"

#include <QMetaType>
#include <QString>

#include <memory>
#include <vector>

namespace Velocor {

/// What a LogScanner found: all rows, and how they differ from those of its previous update.
///
/// A change keeps both ends of the earlier runs, and all but the last rows of the newest run, so
/// that views can keep their position.
struct LogUpdate
{
    int request = 0;        ///< the request that this update answers
    bool isReset = true;    ///< all rows may have changed; the numbers below are meaningless
    size_t changeAt = 0;    ///< first row of the earlier runs that differs
    size_t removed = 0;     ///< number of rows removed there
    size_t inserted = 0;    ///< number of rows inserted there
    size_t changedTail = 0; ///< changed rows at the former end

    bool isPartial = false; ///< the file is still being read; another update will follow

    std::shared_ptr<LogRows const> rows;
    bool exists = true;
    QString error; ///< why the file could not be read; empty if it could
    size_t lines = 0;
    LogCounts counts{};  ///< of the whole file, whatever the filter; see LogIndex::counts()
    size_t slowLine = 0; ///< see LogIndex::slowLine()
    bool hasElapsed = false;
    bool hasTimes = false;
    bool hasSeverities = false;
    LogFileType type;              ///< how to read the lines
    std::vector<size_t> runStarts; ///< see LogIndex::RunStarts()

    /// Computes the numbers from the rows before and after.
    void Compare(LogRows const& before);
};

} // namespace Velocor

Q_DECLARE_METATYPE(Velocor::LogUpdate)
