// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/StandardStreams_p.h"

#include <QByteArray>

#include <fcntl.h>
#include <poll.h>
#include <unistd.h>

namespace Velocor {

void OpenMissingStandardStreams()
{
    // open() returns the lowest free descriptor, so in this order each stream gets the right one.
    for (int stream : {STDIN_FILENO, STDOUT_FILENO, STDERR_FILENO}) {
        if (fcntl(stream, F_GETFD) == -1)
            open("/dev/null", O_RDWR);
    }
}

void PrintWithoutWaiting(QByteArray const& text, int stream)
{
    if (text.isEmpty())
        return;
    pollfd output = {stream, POLLOUT, 0};
    if (poll(&output, 1, 0) != 1 || !(output.revents & POLLOUT))
        return;
    const ssize_t written = write(stream, text.constData(), static_cast<size_t>(text.size()));
    static_cast<void>(written); // there is nowhere to report a failure
}

} // namespace Velocor
