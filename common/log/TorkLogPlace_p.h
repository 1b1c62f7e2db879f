// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QFileDevice>
#include <QString>

/// What TorkLogWriter asks of the system about the file it writes. For the log's own sources;
/// nothing here does anything on systems other than Unix.
namespace TorkLogPlace {

/// Whether `fileName` may be opened as a log: not a pipe, socket or block device, where opening or
/// writing can block for good. True for what is not there.
bool MayBeLog(QString const& fileName);

/// The same for an open file, which nobody can exchange any more.
bool MayBeLog(QFileDevice const& file);

/// Whether an open file has an end to append to.
bool IsRegular(QFileDevice const& file);

/// From now on writes of this open file go to its end, or to its position; after fork() also those
/// of the other process.
void SetAppending(QFileDevice const& file, bool appends);

/// Hands bytes to the system past the file object, whose buffer must be empty.
///
/// @return how many the system took, from 0 to `length`
int Write(QFileDevice const& file, char const* bytes, int length);

/// Where the system will write next; -1 if it cannot tell. After fork() the other process moves it.
qint64 Position(QFileDevice const& file);

/// Whether the system will write next at the end of this open regular file.
bool IsAtEnd(QFileDevice const& file);

/// The size of this open file, 0 if the system cannot tell. Asks for nothing else: after a request
/// for the times, as in QFile::size(), the next write has to update them. For the goal "entry,
/// 1 thread" in docs/performance.md; tests/plain/tst_PlainLogFiles.cpp compares the files.
qint64 Size(QFileDevice const& file);

/// Makes other programs' calls of this function on the same file fail until LetOthersIn(). Never
/// waits. Returns false if another program is inside; true on file systems without locks.
bool KeepOthersOut(QFileDevice const& file);
void LetOthersIn(QFileDevice const& file);

} // namespace TorkLogPlace
