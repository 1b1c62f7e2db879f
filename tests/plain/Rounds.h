// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QByteArray>
#include <QTest>

#include <cstdio>
#include <functional>
#include <random>

/// How many rounds a comparison with the plain version runs, and from which seed.
///
/// `VELOCOR_PLAIN=full` selects the full size, as ./check does, with a new seed in every run, and
/// `VELOCOR_PLAIN=long` that of ./check --long. The usual size always has the same seed: a change
/// is judged by what it changes, not by luck. `VELOCOR_SEED` selects a seed, or a new one if it is
/// `new`. Every run prints its seed, so that a failure can be reproduced.
namespace Rounds {

/// Whether the longest size was requested.
inline bool isLong()
{
    return qgetenv("VELOCOR_PLAIN") == "long";
}

/// Whether at least the full size was requested.
inline bool isFull()
{
    return isLong() || qgetenv("VELOCOR_PLAIN") == "full";
}

/// The number of rounds: `usual` takes about a second, `full` is the documented size.
inline int count(int usual, int full)
{
    return isFull() ? full : usual;
}

/// The same with a number of its own for the longest size.
inline int count(int usual, int full, int longest)
{
    return isLong() ? longest : count(usual, full);
}

/// The seed of this process: the one requested or, if there is none, a new one from the full size
/// on and always the same otherwise. It is printed.
inline quint32 seed()
{
    static const quint32 chosen = [] {
        const QByteArray requested = qgetenv("VELOCOR_SEED");
        bool isNumber = false;
        quint32 seed = requested.toUInt(&isNumber);
        if (!isNumber)
            seed = isFull() || requested == "new" ? std::random_device()() : 1;
        std::printf("seed: VELOCOR_SEED=%u\n", seed);
        std::fflush(stdout);
        return seed;
    }();
    return chosen;
}

/// Runs a test so many times, each with a seed of its own, until it fails; then tells which it was.
///
/// @return whether none has failed
inline bool each(char const* what, int count, std::function<void(quint32 seed)> const& test)
{
    std::mt19937 random(seed());
    for (int i = 0; i < count; ++i) {
        const quint32 own = random();
        test(own);
        if (QTest::currentTestFailed()) {
            qWarning("%s %d, of seed %u", what, i, own);
            return false;
        }
    }
    return true;
}

} // namespace Rounds
