// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

class QByteArray;

namespace Velocor {

/// Opens /dev/null for each of standard input, output and error that the parent process closed.
///
/// Otherwise the next file or socket that is opened takes the free number, and what is printed goes
/// there: into the log, or into the connection to the display. Call it first in main(), before
/// there are other threads; uses the C library only.
void OpenMissingStandardStreams();

/// Writes to standard output without ever waiting for a reader.
///
/// What standard output has no room for is dropped; failures are ignored. Needs
/// SurviveFailedWrites() for an output whose reader has gone.
///
/// @param text  bytes to write, line end included; at most a few kilobytes
void PrintWithoutWaiting(QByteArray const& text);

} // namespace Velocor
