// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QString>
#include <QVarLengthArray>
#include <QtGlobal>

/// The text of an entry while it is made: on the stack, as asking for memory costs as much as
/// filling it.
using TorkLogLine = QVarLengthArray<ushort, 512>;

/// The local time, and how an entry words it. For the log's own sources.
///
/// Entries come many to a millisecond, and asking for the local time costs more than all the rest
/// of an entry; each thread keeps what it found out last. All times are given in milliseconds since
/// the epoch of QDateTime::currentMSecsSinceEpoch().
namespace TorkLogStamp {

/// The wall clock's time as milliseconds since an epoch of its own.
qint64 wallClock(qint64 now);

/// Appends `now` in the format that this thread has learned as `generation`.
///
/// @return false, with nothing appended, if it has not: then learn() must come first
bool append(TorkLogLine& line, qint64 now, quint64 generation);

/// Appends `now` in the toolkit's words for `format`, which is kept for append().
///
/// @param generation  unique to the format, and never 0
void learn(TorkLogLine& line, qint64 now, QString const& format, quint64 generation);

} // namespace TorkLogStamp
