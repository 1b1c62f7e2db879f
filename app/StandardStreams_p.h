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

/// Writes to standard output without ever blocking.
///
/// Text that does not fit into the output buffer is dropped; failures are ignored. Needs
/// SurviveFailedWrites() in case standard output is a pipe without a reader.
///
/// @param text  bytes to write, including the line end; at most a few kilobytes
void PrintWithoutWaiting(QByteArray const& text);

} // namespace Velocor
