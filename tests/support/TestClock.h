// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QDateTime>

/// The clock that QDateTime::currentDateTime() and QDateTime::currentMSecsSinceEpoch() read in
/// programs that are built with TestClock.cpp.
///
/// It follows the system clock until it is set; then it stops. Set it only while no other thread
/// reads the time.
namespace TestClock {

void set(QDateTime const& now);
void advance(qint64 milliseconds);
void release();

} // namespace TestClock
