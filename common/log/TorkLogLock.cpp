// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/log/TorkLogLock_p.h"

#include <chrono>

namespace {

thread_local bool t_holdsLock = false;

using Clock = std::chrono::steady_clock;
using std::chrono::microseconds;

// An entry holds the lock for less time than a thread needs to fall asleep and wake up again, so a
// thread tries for a moment before it sleeps. The pauses between the tries leave the lock to its
// owner: without them it would change hands with every entry, and the file's data would move to
// another processor each time. For the goals "entry, 2 and 4 threads" in docs/performance.md; there
// is no result to compare, tests/reliability/tst_Load.cpp checks that no entry is lost.
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
    // Installing a handler returns the previous one, and after nullptr that is the default one.
    static const QtMessageHandler handler = [] {
        const QtMessageHandler installed = qInstallMessageHandler(nullptr);
        return qInstallMessageHandler(installed);
    }();
    return handler;
}
