// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QByteArray>

#include <unistd.h>

/// Ends a forked child with an exit code from 0 to 125, by way of another program: in the child
/// itself, memcheck would take what belongs to the parent's other threads for lost, and replace the
/// code by its own.
[[noreturn]] inline void endForkedChild(int code)
{
    const QByteArray command = "exit " + QByteArray::number(code);
    ::execl("/bin/sh", "sh", "-c", command.constData(), static_cast<char*>(nullptr));
    ::_exit(127);
}
