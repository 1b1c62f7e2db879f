// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "support/ForkedChild.h"

#include <QFile>

#include <fcntl.h>
#include <sys/wait.h>
#include <unistd.h>

/// Another process that keeps the whole of a file locked for writing while this object lives.
class LockHolder
{
public:
    explicit LockHolder(QString const& path)
    {
        int isLocked[2];
        int mayEnd[2];
        if (::pipe(isLocked) != 0 || ::pipe(mayEnd) != 0)
            qFatal("no pipe to the process that holds the lock");
        m_child = ::fork();
        if (m_child == 0) {
            ::close(mayEnd[1]);
            struct flock whole = {};
            whole.l_type = F_WRLCK;
            const int file = ::open(QFile::encodeName(path).constData(), O_RDWR);
            char byte = ::fcntl(file, F_SETLK, &whole) == 0 ? 'y' : 'n';
            const bool isTold = ::write(isLocked[1], &byte, 1) == 1;
            endForkedChild(isTold && ::read(mayEnd[0], &byte, 1) == 0 ? 0 : 1);
        }
        ::close(isLocked[1]);
        ::close(mayEnd[0]);
        char byte = 'n';
        m_holds = ::read(isLocked[0], &byte, 1) == 1 && byte == 'y';
        ::close(isLocked[0]);
        m_mayEnd = mayEnd[1];
    }

    ~LockHolder()
    {
        ::close(m_mayEnd);
        ::waitpid(m_child, nullptr, 0);
    }

    Q_DISABLE_COPY(LockHolder)

    /// Whether the file could be locked.
    bool holds() const { return m_holds; }

private:
    pid_t m_child = -1;
    int m_mayEnd = -1;
    bool m_holds = false;
};
