// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QByteArray>
#include <QtGlobal>

#include <cstdio>
#include <random>

/// How much a comparison with the plain wording tries, and from which seed.
///
/// `VELOCOR_PLAIN=full` asks for the full size, as ./check does; `VELOCOR_SEED` replays one run.
/// The seed of every run is printed, so that a failure can be repeated.
namespace Rounds {

/// Whether the full size is asked for.
inline bool isFull()
{
    return qgetenv("VELOCOR_PLAIN") == "full";
}

/// How often to try: `usual` takes about a second, `full` is the documented size.
inline int count(int usual, int full)
{
    return isFull() ? full : usual;
}

/// The seed of this process: the one that is asked for, or a new one, which is printed.
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
