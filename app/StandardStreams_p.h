// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

class QByteArray;

namespace Velocor {

/// Opens /dev/null for each of standard input, output and error that the parent process closed.
///
/// Otherwise the next file or socket that is opened gets the free descriptor, and program output
/// ends up in the log file or the display connection. Call it first in main(), before other
/// threads start; uses the C library only.
void OpenMissingStandardStreams();

/// Writes to standard output, or to standard error, without ever blocking.
///
/// Text that does not fit into the output buffer is dropped; failures are ignored. Needs
/// SurviveFailedWrites() in case the stream is a pipe without a reader.
///
/// @param text  bytes to write, including the line end; at most a few kilobytes
/// @param stream  the descriptor: 1 is standard output, 2 is standard error
void PrintWithoutWaiting(QByteArray const& text, int stream = 1);

} // namespace Velocor
