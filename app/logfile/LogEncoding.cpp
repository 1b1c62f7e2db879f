// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/logfile/LogEncoding.h"

#include <algorithm>
#include <cstring>

namespace Velocor {

namespace {

char const Utf8Mark[] = "\xEF\xBB\xBF";
constexpr int Utf8MarkLength = 3;

// Whether a byte may be the second one of a UTF-8 sequence: which then is not too long, no
// surrogate and not above U+10FFFF.
bool MayFollow(unsigned lead, unsigned byte)
{
    switch (lead) {
    case 0xE0:
        return byte >= 0xA0 && byte <= 0xBF;
    case 0xED:
        return byte >= 0x80 && byte <= 0x9F;
    case 0xF0:
        return byte >= 0x90 && byte <= 0xBF;
    case 0xF4:
        return byte >= 0x80 && byte <= 0x8F;
    default:
        return byte >= 0x80 && byte <= 0xBF;
    }
}

// How many bytes the UTF-8 sequence at `at` has; 0 if it is not valid, -1 if the text ends in it.
int SequenceLength(char const* at, char const* end)
{
    const unsigned lead = static_cast<unsigned char>(*at);
    if (lead < 0x80)
        return 1;
    const int length = lead >= 0xF0 ? 4 : lead >= 0xE0 ? 3 : 2;
    if (lead < 0xC2 || lead > 0xF4)
        return 0;
    for (int i = 1; i < length; ++i) {
        if (at + i == end)
            return -1;
        const unsigned byte = static_cast<unsigned char>(at[i]);
        if (!MayFollow(i == 1 ? lead : 0, byte))
            return 0;
    }
    return length;
}

bool IsUtf8(QByteArray const& text)
{
    char const* at = text.constData();
    char const* const end = at + text.size();
    while (at != end) {
        const int length = SequenceLength(at, end);
        if (length <= 0)
            return length < 0;
        at += length;
    }
    return true;
}

// Text that is mostly ASCII has a zero in every second byte, and none in the others.
LogEncoding::Kind WideWithoutMark(QByteArray const& head)
{
    int zeros[2] = {};
    for (int i = 0; i < head.size(); ++i)
        zeros[i % 2] += head.at(i) == '\0' ? 1 : 0;
    const int units = head.size() / 2;
    const auto isHigh = [&](int high) {
        return units > 1 && zeros[high] > units / 2 && zeros[1 - high] <= units / 100;
    };
    return isHigh(1)   ? LogEncoding::Utf16Le
           : isHigh(0) ? LogEncoding::Utf16Be
                       : LogEncoding::Automatic;
}

} // namespace

LogEncoding LogEncoding::Declared(QByteArray const& head)
{
    if (head.startsWith(Utf8Mark))
        return Utf8;
    if (head.startsWith("\xFF\xFE"))
        return Utf16Le;
    if (head.startsWith("\xFE\xFF"))
        return Utf16Be;
    return WideWithoutMark(head);
}

LogEncoding LogEncoding::Detect(QByteArray const& head)
{
    const LogEncoding declared = Declared(head);
    if (declared != Automatic)
        return declared;
    return IsUtf8(head) ? Utf8 : Latin1;
}

QString LogEncoding::decodeWide(char const* bytes, int length) const
{
    QString text(length / 2, Qt::Uninitialized);
    const int high = m_kind == Utf16Le ? 1 : 0;
    for (int i = 0; i < text.size(); ++i)
        text[i] = QChar(static_cast<uchar>(bytes[2 * i + 1 - high]),
                        static_cast<uchar>(bytes[2 * i + high]));
    for (int i = 0; i < text.size(); ++i) {
        const bool isPair =
            text.at(i).isHighSurrogate() && i + 1 < text.size() && text.at(i + 1).isLowSurrogate();
        if (isPair)
            ++i;
        else if (text.at(i).isSurrogate())
            text[i] = QChar::ReplacementCharacter;
    }
    if (length % 2 != 0)
        text += QChar(QChar::ReplacementCharacter);
    return text;
}

QString LogEncoding::Decode(char const* bytes, int length) const
{
    if (m_kind == Automatic || m_kind == Latin1)
        return QString::fromLatin1(bytes, length);
    if (m_kind == Utf8)
        return QString::fromUtf8(bytes, length); // removes the mark itself
    QString text = decodeWide(bytes, length);
    if (text.startsWith(QChar(QChar::ByteOrderMark)))
        text.remove(0, 1);
    return text;
}

void LogEncoding::narrowUnicode(char const*& line, int& length, QByteArray& buffer) const
{
    if (isWide()) {
        buffer = Decode(line, length).toUtf8();
        line = buffer.constData();
        length = buffer.size();
    } else if (length >= Utf8MarkLength && std::memcmp(line, Utf8Mark, Utf8MarkLength) == 0) {
        line += Utf8MarkLength;
        length -= Utf8MarkLength;
    }
}

char const* LogLineEnd::findPair(char const* at, char const* end, qint64 offset, char before) const
{
    char const* const start = at;
    while (at != end) {
        char const* const last = findLast(at, end);
        if (!last)
            return nullptr;
        const char first = last == start ? before : last[-1];
        if (first == m_first && (offset + (last - start) - 1) % m_unit == 0)
            return last;
        at = last + 1;
    }
    return nullptr;
}

} // namespace Velocor
