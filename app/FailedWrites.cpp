// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/FailedWrites.h"

#include <csignal>

namespace {

extern "C" {
// Static, because a namespace does not hide the name of a C function from other files.
static void DoNothing(int) {}
}

void ReplaceDefault(int signalNumber)
{
    struct sigaction action = {};
    if (sigaction(signalNumber, nullptr, &action) != 0 || action.sa_handler != SIG_DFL)
        return;

    action = {};
    action.sa_handler = DoNothing;
    sigemptyset(&action.sa_mask);
    action.sa_flags = SA_RESTART;
    sigaction(signalNumber, &action, nullptr);
}

} // namespace

void SurviveFailedWrites()
{
    ReplaceDefault(SIGPIPE);
    ReplaceDefault(SIGXFSZ);
}
