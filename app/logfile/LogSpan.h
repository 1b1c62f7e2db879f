// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QtGlobal>

namespace Velocor {

/// The times from one moment to another, both included, or all times on one side. A plain value.
struct LogSpan
{
    qint64 since = -1; ///< as LogTimeReader::Stamp::key; -1: no limit
    qint64 until = -1;

    bool isLimited() const { return since >= 0 || until >= 0; }

    /// Whether an entry is shown. One whose time is unknown (-1) only if nothing limits the span.
    bool Contains(qint64 time) const
    {
        return !isLimited() || (time >= 0 && time >= since && (until < 0 || time <= until));
    }
};

inline bool operator==(LogSpan const& one, LogSpan const& other)
{
    return one.since == other.since && one.until == other.until;
}

inline bool operator!=(LogSpan const& one, LogSpan const& other)
{
    return !(one == other);
}

} // namespace Velocor
