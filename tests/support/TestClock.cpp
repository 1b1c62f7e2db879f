// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "support/TestClock.h"

#include <chrono>

namespace {

bool s_isSet = false;
qint64 s_time = 0; // milliseconds since the epoch

} // namespace

void TestClock::set(QDateTime const& now)
{
    s_isSet = true;
    s_time = now.toMSecsSinceEpoch();
}

void TestClock::advance(qint64 milliseconds)
{
    s_time += milliseconds;
}

void TestClock::release()
{
    s_isSet = false;
}

// A program's own definitions take precedence over Qt's, so every caller in it ends up here.

qint64 QDateTime::currentMSecsSinceEpoch() noexcept
{
    using namespace std::chrono;
    if (s_isSet)
        return s_time;
    return duration_cast<milliseconds>(system_clock::now().time_since_epoch()).count();
}

QDateTime QDateTime::currentDateTime()
{
    return fromMSecsSinceEpoch(currentMSecsSinceEpoch());
}
