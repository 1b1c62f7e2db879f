// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/LogRows.h"

#include <QMetaType>
#include <QString>

#include <memory>

namespace Velocor {

/// What a LogScanner found: all rows, and how they differ from those it told of before.
///
/// A change keeps both ends of the earlier part and all but the last rows of the newest run's, so
/// that views keep their place in the file.
struct LogUpdate
{
    int request = 0;     ///< the request that this answers
    bool isReset = true; ///< nothing is known to be as before; the numbers below mean nothing then
    size_t changeAt = 0; ///< first row of the earlier part that differs
    size_t removed = 0;  ///< rows that were there before
    size_t inserted = 0; ///< rows that are there instead
    size_t changedTail = 0; ///< rows at the former end that read differently now

    std::shared_ptr<LogRows const> rows;
    bool exists = true;
    QString error; ///< why the file could not be read; empty if it could
    size_t lines = 0;
    bool hasElapsed = false;

    /// Works the numbers out from the rows before and after.
    void Compare(LogRows const& before);
};

} // namespace Velocor

Q_DECLARE_METATYPE(Velocor::LogUpdate)
