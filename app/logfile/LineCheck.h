// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QtGlobal>

#include <algorithm>
#include <cstddef>
#include <cstring>

namespace Velocor {

/// A number that differs for different lines, except for one pair in 65,536. Pure, any thread;
/// another kind of processor may find other numbers.
///
/// It covers every byte, because a line that was written over may differ in just one digit. Qt's
/// hash waits for each word of the line before it takes the next; here, four can be on their way
/// at the same time. For the goal "opening" in docs/performance.md; tst_PlainLineCheck.
inline quint16 LineCheck(char const* line, size_t length)
{
    constexpr quint64 Factor = 0x9E3779B97F4A7C15; // odd, and without a pattern
    constexpr size_t WordSize = sizeof(quint64);
    const auto mixed = [](quint64 state, quint64 word) {
        const quint64 product = (state ^ word) * Factor;
        return product << 29 | product >> 35; // a product tells most in its high bits
    };
    const auto wordAt = [](char const* at, size_t size) {
        quint64 word = 0;
        std::memcpy(&word, at, size);
        return word;
    };

    quint64 states[] = {length, ~Factor, Factor >> 1, Factor << 1};
    const auto addFourWords = [&](char const* at) {
        for (size_t i = 0; i < 4; ++i)
            states[i] = mixed(states[i], wordAt(at + i * WordSize, WordSize));
    };
    constexpr size_t BlockSize = 4 * WordSize;
    size_t at = 0;
    for (; at + BlockSize < length; at += BlockSize)
        addFourWords(line + at);
    if (length >= BlockSize) {
        addFourWords(line + length - BlockSize); // overlaps the words before it
    } else {
        for (; at < length; at += WordSize)
            states[0] = mixed(states[0], wordAt(line + at, std::min(WordSize, length - at)));
    }
    const quint64 all = mixed(mixed(mixed(states[0], states[1]), states[2]), states[3]);
    return static_cast<quint16>((all ^ all >> 32) * Factor >> 48);
}

} // namespace Velocor
