// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/logfile/LineTable.h"

#include <algorithm>
#include <cstddef>
#include <cstring>

namespace Velocor {

namespace {

// A length of less than 254 is one byte; others follow such a byte.
constexpr quint8 InTwoBytes = 254;
constexpr quint8 InEightBytes = 255;

template <class T>
void PutBytes(std::vector<quint8>& to, quint8 size, T length)
{
    quint8 bytes[sizeof(T)];
    std::memcpy(bytes, &length, sizeof(T));
    to.push_back(size);
    to.insert(to.end(), std::begin(bytes), std::end(bytes));
}

template <class T>
qint64 TakeBytes(quint8 const*& at)
{
    T length = 0;
    std::memcpy(&length, at, sizeof(T));
    at += sizeof(T);
    return static_cast<qint64>(length);
}

void PutLength(std::vector<quint8>& to, qint64 length)
{
    if (length < InTwoBytes)
        to.push_back(static_cast<quint8>(length));
    else if (length <= 0xffff)
        PutBytes(to, InTwoBytes, static_cast<quint16>(length));
    else
        PutBytes(to, InEightBytes, length);
}

qint64 TakeLength(quint8 const*& at)
{
    const quint8 first = *at++;
    if (first < InTwoBytes)
        return first;
    return first == InTwoBytes ? TakeBytes<quint16>(at) : TakeBytes<qint64>(at);
}

} // namespace

// Also finds where the length of the line is.
qint64 LineTable::Block::start(size_t line, size_t& position) const
{
    Group const& group = groups[line / GroupSize];
    qint64 start = group.start;
    quint8 const* at = lengths.data() + group.position;
    for (size_t left = line % GroupSize; left > 0; --left)
        start += TakeLength(at);
    position = static_cast<size_t>(at - lengths.data());
    return start;
}

size_t LineTable::Block::lineAt(qint64 offset) const
{
    const auto after =
        std::upper_bound(groups.begin(), groups.end(), offset,
                         [](qint64 value, Group const& group) { return value < group.start; });
    const auto group = after == groups.begin() ? after : after - 1;
    const auto first = static_cast<size_t>(group - groups.begin()) * GroupSize;
    const size_t last = std::min(first + GroupSize, checks.size()) - 1;
    qint64 start = group->start;
    quint8 const* at = lengths.data() + group->position;
    for (size_t line = first; line < last; ++line) {
        start += TakeLength(at);
        if (start > offset)
            return line;
    }
    return last;
}

// Whether both have the same lines in a group, if that can be told without a look at each of them.
bool LineTable::Block::hasSame(size_t group, Block const& other) const
{
    if (group + 1 >= groups.size() || group + 1 >= other.groups.size() || !palette.empty() ||
        !other.palette.empty() || groups[group].start != other.groups[group].start)
        return false;
    const auto at = [group](auto const& values) {
        return values.begin() + static_cast<std::ptrdiff_t>(group * GroupSize);
    };
    const auto lengthsAt = [](Block const& block, size_t position) {
        return block.lengths.begin() + static_cast<std::ptrdiff_t>(position);
    };
    return std::equal(lengthsAt(*this, groups[group].position),
                      lengthsAt(*this, groups[group + 1].position),
                      lengthsAt(other, other.groups[group].position),
                      lengthsAt(other, other.groups[group + 1].position)) &&
           std::equal(at(marks), at(marks) + GroupSize, at(other.marks)) &&
           std::equal(at(checks), at(checks) + GroupSize, at(other.checks));
}

// For lines of usual length, so that packing need not move anything but the marks.
void LineTable::Block::reserve()
{
    groups.reserve(BlockSize / GroupSize);
    lengths.reserve(BlockSize - 1);
    marks.reserve(BlockSize);
    checks.reserve(BlockSize);
}

// The block must have the line.
void LineTable::Block::truncate(size_t line)
{
    if (line == 0) {
        *this = Block();
        return;
    }
    size_t position = 0;
    start(line - 1, position);
    groups.resize((line - 1) / GroupSize + 1);
    lengths.resize(position);
    marks.resize(line);
    checks.resize(line);
}

// Half a byte for a mark, for the goal for memory in docs/performance.md; tst_PlainLineTable
// compares. There are few different ones; with too many, it has a byte.
void LineTable::Block::pack()
{
    constexpr quint8 Most = 16;
    quint8 numbers[256]; // of the marks, from 1 on
    std::fill(std::begin(numbers), std::end(numbers), quint8(0));
    std::vector<quint8> found;
    std::vector<quint8> packed((marks.size() + 1) / 2);
    for (size_t line = 0; line < marks.size() && found.size() <= Most; ++line) {
        quint8& number = numbers[marks[line]];
        if (number == 0) {
            found.push_back(marks[line]);
            number = static_cast<quint8>(found.size());
        }
        packed[line / 2] |= static_cast<quint8>((number - 1) << (line % 2 * 4));
    }
    if (found.size() <= Most) {
        palette = std::move(found);
        marks = std::move(packed);
    }
    groups.shrink_to_fit();
    lengths.shrink_to_fit();
    marks.shrink_to_fit();
    palette.shrink_to_fit();
    checks.shrink_to_fit();
}

void LineTable::Block::unpack()
{
    std::vector<quint8> unpacked(checks.size());
    for (size_t line = 0; line < unpacked.size(); ++line)
        unpacked[line] = mark(line);
    marks = std::move(unpacked);
    palette.clear();
}

qint64 LineTable::startInBlocks(size_t number) const
{
    size_t position = 0;
    return m_blocks.at(number).start(number % BlockSize, position);
}

qint64 LineTable::start(size_t line) const
{
    return startInBlocks(m_first + line) - m_offset;
}

void LineTable::Append(qint64 start, quint8 mark, quint16 check)
{
    if (m_blocks.size() > m_first + m_size)
        cut();
    const qint64 shifted = start + m_offset;
    const size_t position = (m_first + m_size) % BlockSize;
    Block& last = m_blocks.Grow();
    if (position > 0)
        PutLength(last.lengths, shifted - m_lastStart);
    if (position % GroupSize == 0)
        last.groups.push_back({shifted, last.lengths.size()});
    last.marks.push_back(mark);
    last.checks.push_back(check);
    m_lastStart = shifted;
    ++m_size;
}

void LineTable::SetMark(size_t line, quint8 mark)
{
    const size_t number = m_first + line;
    m_blocks.Edit(number, [=](Block& block) { block.marks[number % BlockSize] = mark; });
}

void LineTable::Truncate(size_t line)
{
    if (line >= m_size)
        return;
    m_size = line;
    cut();
}

LineTable LineTable::Part(size_t first, size_t end, qint64 offset) const
{
    if (first == end)
        return LineTable();
    LineTable part = *this;
    part.m_first += first;
    part.m_size = end - first;
    part.m_offset += offset;
    return part;
}

// Removes the lines of others after the last one.
void LineTable::cut()
{
    if (m_size == 0) { // a new first line may start before the lines of others
        *this = LineTable();
        return;
    }
    m_blocks.Truncate(m_first + m_size);
    m_lastStart = startInBlocks(m_first + m_size - 1);
}

size_t LineTable::LineAt(qint64 offset) const
{
    // The last block that starts at the offset or before it.
    const qint64 shifted = offset + m_offset;
    size_t position = m_first / BlockSize;
    size_t end = (m_first + m_size - 1) / BlockSize + 1;
    while (end - position > 1) {
        const size_t middle = position + (end - position) / 2;
        if (m_blocks.at(middle * BlockSize).groups.front().start > shifted)
            end = middle;
        else
            position = middle;
    }
    const size_t first = position * BlockSize;
    const size_t number = first + m_blocks.at(first).lineAt(shifted);
    return std::min(std::max(number, m_first) - m_first, m_size - 1);
}

// By groups, for the goal for following in docs/performance.md: the last block is compared for each
// line that is appended. tst_PlainLineTable compares with one line after the other.
size_t LineTable::CountSame(LineTable const& other) const
{
    const size_t end = std::min(size(), other.size());
    const bool isAligned = m_first == other.m_first && m_offset == other.m_offset;
    Reader reader(*this);
    Reader otherReader(other);
    size_t line = 0;
    if (isAligned)
        line = std::max(m_blocks.CountShared(other.m_blocks), m_first) - m_first;
    while (line < end) {
        if (isAligned && (m_first + line) % GroupSize == 0 && hasSameGroup(line, other))
            line += GroupSize;
        else if (mark(line) == other.mark(line) && check(line) == other.check(line) &&
                 reader.start(line) == otherReader.start(line))
            ++line;
        else
            break;
    }
    return std::min(line, end);
}

// Of tables whose first lines are at the same place in the blocks.
bool LineTable::hasSameGroup(size_t line, LineTable const& other) const
{
    const size_t number = m_first + line;
    return m_blocks.at(number).hasSame(number % BlockSize / GroupSize, other.m_blocks.at(number));
}

qint64 LineTable::Reader::start(size_t line)
{
    const size_t number = m_lines->m_first + line;
    if (number - m_first >= m_count) {
        m_first = number - number % GroupSize;
        m_count = std::min(m_lines->m_blocks.size() - m_first, GroupSize);
        Block const& block = m_lines->m_blocks.at(number);
        Group const& group = block.groups[m_first % BlockSize / GroupSize];
        quint8 const* at = block.lengths.data() + group.position;
        m_starts[0] = group.start;
        for (size_t next = 1; next < m_count; ++next)
            m_starts[next] = m_starts[next - 1] + TakeLength(at);
    }
    return m_starts[number - m_first] - m_lines->m_offset;
}

} // namespace Velocor
