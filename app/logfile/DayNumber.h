// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QtGlobal>

namespace Velocor {

/// Numbers the days so that consecutive ones have consecutive numbers, never negative. Any of the
/// fields may be missing and then is 0. Pure, any thread.
constexpr qint64 DayNumber(int year, int month, int day)
{
    // The year starts in March, so that its last month is the one whose length varies.
    const bool isBeforeMarch = month <= 2;
    const qint64 years = year + (isBeforeMarch ? 0 : 1);
    const int months = month + (isBeforeMarch ? 9 : -3);
    const qint64 leapDays = (years + 399) / 4 - (years + 399) / 100 + (years + 399) / 400;
    return 365 * years + leapDays + (153 * months + 2) / 5 + day;
}

} // namespace Velocor
