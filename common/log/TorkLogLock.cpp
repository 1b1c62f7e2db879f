// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/log/TorkLogLock_p.h"

#include <chrono>

namespace {

thread_local bool t_holdsLock = false;

using Clock = std::chrono::steady_clock;
using std::chrono::microseconds;

// An entry holds the lock for about a microsecond, much less than a thread needs to fall asleep
// and wake up again: trying for a moment first halves the cost of an entry with two threads. The
// pauses between the tries leave the lock to whoever has it: without them it changes hands for
// every entry, and all that belongs to the file moves to the other processor each time.
constexpr microseconds Pause(1);
constexpr microseconds Moment(40);

bool TryForAMoment(QMutex& mutex)
{
    if (mutex.tryLock())
        return true;

    Clock::time_point now = Clock::now();
    const Clock::time_point end = now + Moment;
    while (now < end) {
        const Clock::time_point next = now + Pause;
        while (now < next)
            now = Clock::now();
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
