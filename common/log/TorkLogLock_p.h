// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QMutex>
#include <QtGlobal>

/// Holds a log's lock for a scope. For the log's own sources.
///
/// The lock is not recursive, and Qt itself logs warnings in some file operations; while this
/// thread holds the lock, TorkLog_MessageHandler() keeps such messages out of the log.
class TorkLogLock
{
public:
    explicit TorkLogLock(QMutex& mutex);
    ~TorkLogLock();

    TorkLogLock(TorkLogLock const&) = delete;
    TorkLogLock& operator=(TorkLogLock const&) = delete;

    /// Whether the calling thread holds the lock of some log.
    static bool isHeldHere();

private:
    QMutex& m_mutex;
};

/// The message handler that Qt uses if no other is installed. Any thread.
QtMessageHandler TorkLog_DefaultMessageHandler();
