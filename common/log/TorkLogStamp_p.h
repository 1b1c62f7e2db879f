// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QMutex>
#include <QString>
#include <QVarLengthArray>
#include <QtGlobal>

/// The text of an entry while it is built, on the stack: for the goal "entry, 1 thread" in
/// docs/performance.md. tests/plain/tst_PlainLogFiles.cpp compares entries with plain strings.
using TorkLogLine = QVarLengthArray<ushort, 512>;

/// The local time of an entry, and its time stamp. For the log's own sources.
///
/// Many entries share a millisecond, so each thread keeps what Qt formatted until the millisecond,
/// the format or the time zone (`TZ`) changes. For the goals "entry, 1 thread" and "off" in
/// docs/performance.md; tests/plain/tst_PlainStamps.cpp compares with Qt's formatting of each
/// entry.
///
/// `now` is always what QDateTime::currentMSecsSinceEpoch() returned. Any thread.
///
/// The functions return the local time of day of `now`, in milliseconds since midnight.
namespace TorkLogStamp {

/// The time of day without a stamp, for an entry that is not written.
int TimeOfDay(qint64 now);

/// Appends the stamp that this thread made last, if it is still the right one.
///
/// @param generation  of the format, see Make()
/// @return -1, with nothing appended, if it is not: then Make() is to be called
int Append(TorkLogLine& line, qint64 now, quint64 generation);

/// Appends `now` as QDateTime::toString() formats it, and keeps that for Append().
///
/// A stamp that Latin-1 cannot hold, such as one in Arabic digits, is formatted in the C locale.
///
/// @param generation  unique to this format among all logs, and never 0
int Make(TorkLogLine& line, qint64 now, QString const& format, quint64 generation);

/// Held by each of these functions, as a TorkLogLock: nothing that Qt warns about meanwhile is
/// logged.
///
/// Qt's environment and the C library's time zone have locks of their own; while the caller holds
/// this one, no entry of any log holds those.
QMutex& Mutex();

} // namespace TorkLogStamp
