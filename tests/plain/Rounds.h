// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QByteArray>
#include <QtGlobal>

#include <cstdio>
#include <random>

/// How many rounds a comparison with the plain version runs, and from which seed.
///
/// `VELOCOR_PLAIN=full` selects the full size, as ./check does; `VELOCOR_SEED` replays one run.
/// Every run prints its seed, so that a failure can be reproduced.
namespace Rounds {

/// Whether the full size was requested.
inline bool isFull()
{
    return qgetenv("VELOCOR_PLAIN") == "full";
}

/// The number of rounds: `usual` takes about a second, `full` is the documented size.
inline int count(int usual, int full)
{
    return isFull() ? full : usual;
}

/// The seed of this process: the one requested, or a new one, which is printed.
inline quint32 seed()
{
    static const quint32 chosen = [] {
        bool isNumber = false;
        const quint32 asked = qgetenv("VELOCOR_SEED").toUInt(&isNumber);
        const quint32 seed = isNumber ? asked : std::random_device()();
        std::printf("seed: VELOCOR_SEED=%u\n", seed);
        std::fflush(stdout);
        return seed;
    }();
    return chosen;
}

} // namespace Rounds
