// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/log/TorkLogLock.h"

namespace {

thread_local bool t_holdsLock = false;

// An entry holds the lock for about a microsecond, much less than a thread needs to fall asleep
// and wake up again: trying for a moment first makes two writing threads nearly twice as fast.
constexpr int Attempts = 1000;

bool TryForAMoment(QMutex& mutex)
{
    for (int i = 0; i < Attempts; ++i) {
        if (mutex.tryLock())
            return true;
    }
    return false;
}

} // namespace

TorkLogLock::TorkLogLock(QMutex& mutex) : m_mutex(mutex)
{
    if (!TryForAMoment(m_mutex))
        m_mutex.lock();
    t_holdsLock = true;
}

TorkLogLock::~TorkLogLock()
{
    t_holdsLock = false;
    m_mutex.unlock();
}

bool TorkLogLock::isHeldHere()
{
    return t_holdsLock;
}

QtMessageHandler TorkLog_DefaultMessageHandler()
{
    // Installing a handler returns the one before it, and behind no handler is the default one.
    static const QtMessageHandler handler = [] {
        const QtMessageHandler installed = qInstallMessageHandler(nullptr);
        return qInstallMessageHandler(installed);
    }();
    return handler;
}
