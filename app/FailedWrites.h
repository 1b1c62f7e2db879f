// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

/// Makes a failed write return an error instead of killing the program.
///
/// By default the system kills a program that writes to a pipe without a reader (SIGPIPE) or
/// past the limit set by `ulimit -f` (SIGXFSZ). After this call such a write fails with EPIPE or
/// EFBIG, and log, settings and XML writers handle it like any other failed write.
///
/// Only signals that still have their default action are changed. They get an empty handler instead
/// of SIG_IGN, because child processes would inherit SIG_IGN.
///
/// Call it first in main(), before other threads start. Uses the C library only, so it may run
/// before the application object exists.
///
///     SurviveFailedWrites();
///     QApplication app(argc, argv);
void SurviveFailedWrites();
