// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

/// Makes a failed write return an error instead of killing the program.
///
/// By default the system kills a program that writes to a pipe nobody reads anymore (SIGPIPE) or
/// past the limit set by `ulimit -f` (SIGXFSZ). After this call such a write fails with EPIPE or
/// EFBIG, and what the log, the settings and the XML writers document for a failed write happens.
///
/// Only signals that still have their default effect are changed, and not to "ignored": that would
/// be inherited by every program started from here, while the empty handler used here is not.
///
/// Call it first in main(), before there are other threads. Uses the C library only, so it may run
/// before the application object exists.
///
///     SurviveFailedWrites();
///     QApplication app(argc, argv);
void SurviveFailedWrites();
