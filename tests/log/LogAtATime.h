// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QtTest>

#include <ctime>

/// A log at a moment set by the test.
namespace LogAtATime {

/// Three digits of milliseconds look the same in every Qt, however it formats a single z.
inline const QDateTime& now()
{
    static const QDateTime time(QDate(2021, 3, 4), QTime(5, 6, 7, 123));
    return time;
}

const char stampOfNow[] = "2021-03-04 05:06:07.123";

/// Null: not set. Qt notices a change immediately; the C library only after tzset().
inline void setZone(QByteArray const& zone)
{
    if (zone.isNull())
        qunsetenv("TZ");
    else
        qputenv("TZ", zone);
}

} // namespace LogAtATime
