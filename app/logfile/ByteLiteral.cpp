// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/logfile/ByteLiteral.h"

#include "app/logfile/AsciiCharacters.h"

namespace Velocor {

namespace {

// Upper and lower case of an ASCII letter differ in this bit.
constexpr char CaseBit = 0x20;

// So many places are looked at together, in vector registers.
constexpr int BlockSize = 32;

unsigned char Unsigned(char c)
{
    return static_cast<unsigned char>(c);
}

} // namespace

ByteLiteral::ByteLiteral(QByteArray const& bytes, bool isAnyCase)
    : m_bytes(bytes), m_masks(bytes.size(), '\0'), m_second(bytes.size() - 1)
{
    for (int i = 0; isAnyCase && i < m_bytes.size(); ++i) {
        if (!IsAsciiLetter(m_bytes.at(i)))
            continue;
        m_masks[i] = CaseBit;
        m_bytes[i] = static_cast<char>(m_bytes.at(i) | CaseBit);
    }
}

unsigned ByteLiteral::frequencyOf(int index, Frequencies const& frequencies) const
{
    const auto byte = Unsigned(m_bytes.at(index));
    const auto mask = Unsigned(m_masks.at(index));
    const auto of = [&](unsigned value) {
        return static_cast<unsigned>(frequencies[value]);
    };
    return mask == 0 ? of(byte) : of(byte) + of(byte & ~unsigned(mask));
}

void ByteLiteral::Learn(Frequencies const& frequencies)
{
    const auto isRarer = [&](int index, int than) {
        return frequencyOf(index, frequencies) < frequencyOf(than, frequencies);
    };
    m_first = 0;
    for (int i = 1; i < size(); ++i)
        m_first = isRarer(i, m_first) ? i : m_first;
    m_second = m_first == 0 ? size() - 1 : 0;
    for (int i = 0; i < size(); ++i)
        m_second = i != m_first && isRarer(i, m_second) ? i : m_second;
}

bool ByteLiteral::isAt(char const* text) const
{
    char const* const bytes = m_bytes.constData();
    char const* const masks = m_masks.constData();
    for (int i = 0; i < m_bytes.size(); ++i) {
        if ((text[i] | masks[i]) != bytes[i])
            return false;
    }
    return true;
}

// Whether the text may begin at one of the places of a block. Without branches and early exits, so
// that a compiler makes vector instructions of it. Compared in tst_PlainSearch with findPlainly();
// without it, filters miss their goal.
bool ByteLiteral::mayBeginIn(char const* block) const
{
    char const* const first = block + m_first;
    char const* const second = block + m_second;
    const char firstByte = m_bytes.at(m_first);
    const char firstMask = m_masks.at(m_first);
    const char secondByte = m_bytes.at(m_second);
    const char secondMask = m_masks.at(m_second);
    unsigned char isEqual = 0;
    for (int i = 0; i < BlockSize; ++i) {
        const auto difference = static_cast<unsigned char>(((first[i] | firstMask) ^ firstByte) |
                                                           ((second[i] | secondMask) ^ secondByte));
        isEqual = static_cast<unsigned char>(isEqual | (difference == 0));
    }
    return isEqual != 0;
}

// The first place from `at` on, but before `end`; nullptr if there is none.
char const* ByteLiteral::findPlainly(char const* at, char const* end) const
{
    const char byte = m_bytes.at(m_first);
    const char mask = m_masks.at(m_first);
    for (; at < end; ++at) {
        if ((at[m_first] | mask) == byte && isAt(at))
            return at;
    }
    return nullptr;
}

char const* ByteLiteral::Find(char const* at, char const* end) const
{
    if (end - at < size())
        return end;
    char const* const placesEnd = end - size() + 1;
    while (placesEnd - at >= BlockSize) {
        char const* const found = mayBeginIn(at) ? findPlainly(at, at + BlockSize) : nullptr;
        if (found)
            return found;
        at += BlockSize;
    }
    char const* const found = findPlainly(at, placesEnd);
    return found ? found : end;
}

} // namespace Velocor
