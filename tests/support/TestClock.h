// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QDateTime>

/// The clock behind QDateTime::currentDateTime() and QDateTime::currentMSecsSinceEpoch() in
/// programs that are built with TestClock.cpp.
///
/// It runs with the system's until it is set; then it stands still. Set it while no other thread
/// asks for the time.
namespace TestClock {

void set(QDateTime const& now);
void advance(qint64 milliseconds);
void release();

} // namespace TestClock
