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
/// hash waits for each word of the line before it takes the next. Here, each word is added to a sum
/// and that to another one, as in Fletcher's checksum, so that the order of words matters, too. For
/// the goal "opening" in docs/performance.md; tst_PlainLineCheck.
inline quint16 LineCheck(char const* line, size_t length)
{
    constexpr quint64 Factor = 0x9E3779B97F4A7C15; // odd, and without a pattern
    constexpr size_t WordSize = sizeof(quint64);
    constexpr size_t BlockSize = 4 * WordSize;
    quint64 sum = length;
    quint64 sumOfSums = 0;
    const auto add = [&](char const* at, size_t size) {
        quint64 word = 0;
        std::memcpy(&word, at, size);
        sum += word;
        sumOfSums += sum;
    };
    const auto addBlock = [&](char const* at) {
        for (size_t i = 0; i < BlockSize; i += WordSize)
            add(at + i, WordSize);
    };

    if (length >= BlockSize) {
        char const* const last = line + length - BlockSize;
        for (char const* at = line; at < last; at += BlockSize)
            addBlock(at);
        addBlock(last); // overlaps the one before it
    } else {
        for (size_t at = 0; at < length; at += WordSize)
            add(line + at, std::min(WordSize, length - at));
    }
    // A product tells most in its high bits.
    const quint64 product = sum * Factor;
    const quint64 all = ((product << 29 | product >> 35) ^ sumOfSums) * Factor;
    return static_cast<quint16>((all ^ all >> 32) * Factor >> 48);
}

} // namespace Velocor
