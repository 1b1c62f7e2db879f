// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <cstddef>
#include <cstring>

/// The position of a virtual operation in its class's table, counted from 0; -1 if not virtual.
///
/// Applications of the family are built separately from the framework, so they rely on the order of
/// the slots. Reads the member pointer as the Itanium C++ ABI lays it out (GCC and Clang, on macOS
/// and Linux): the table offset plus one, or, on ARM, the offset with a flag in the second word.
template <class Member>
std::ptrdiff_t VirtualSlot(Member member)
{
    std::ptrdiff_t words[2] = {0, 0};
    static_assert(sizeof(member) == sizeof(words), "a member pointer is two words");
    std::memcpy(words, &member, sizeof(words));

    const std::ptrdiff_t slotSize = sizeof(void*);
#if defined(__arm__) || defined(__aarch64__)
    return (words[1] & 1) ? words[0] / slotSize : -1;
#else
    return (words[0] & 1) ? (words[0] - 1) / slotSize : -1;
#endif
}
