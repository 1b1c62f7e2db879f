// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/terminal/OutputBuffer.h"

#include <cerrno>
#include <fcntl.h>
#include <poll.h>
#include <unistd.h>

namespace Velocor {

namespace {

constexpr int BufferSize = 256 << 10;

// Standard output may be a terminal or pipe that another program has made non-blocking.
void WaitForRoom()
{
    pollfd output = {STDOUT_FILENO, POLLOUT, 0};
    poll(&output, 1, -1);
}

} // namespace

// A pipe usually takes less than the buffer has, and whoever writes would have to wait for the
// reader again and again. For the goal "merge logs in a terminal" in docs/performance.md. What is
// no pipe refuses, and so does a pipe of a user who has too many; both work as they are.
OutputBuffer::OutputBuffer()
{
#ifdef F_SETPIPE_SZ
    constexpr int PipeSize = 1 << 20; // the most that a user may ask for
    if (fcntl(STDOUT_FILENO, F_GETPIPE_SZ) < PipeSize)
        fcntl(STDOUT_FILENO, F_SETPIPE_SZ, PipeSize);
#endif
}

void OutputBuffer::Write(char const* bytes, int size)
{
    m_bytes.append(bytes, size);
    if (m_bytes.size() >= BufferSize)
        Flush();
}

bool OutputBuffer::Flush()
{
    char const* at = m_bytes.constData();
    auto left = static_cast<size_t>(m_bytes.size());
    while (left > 0 && m_error == 0) {
        const ssize_t written = write(STDOUT_FILENO, at, left);
        if (written >= 0) {
            at += written;
            left -= static_cast<size_t>(written);
        } else if (errno == EAGAIN) {
            WaitForRoom();
        } else if (errno != EINTR) {
            m_error = errno;
        }
    }
    m_bytes.resize(0); // keeps the memory
    return m_error == 0;
}

} // namespace Velocor
