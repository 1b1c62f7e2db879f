// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/logfile/CandidateSearch.h"

#include "app/logfile/RequiredLiterals.h"

#include <algorithm>

namespace Velocor {

namespace {

// Several texts are looked for in so many bytes before in the next ones, or the rest of a file
// would be searched for a rare one each time that a frequent one is found.
constexpr int WindowSize = 1024;

constexpr int SampleSize = 1 << 16;

// The characters that are not ASCII, but equal an ASCII letter if case does not matter. Those that
// equal another letter are not looked for in bytes. Compared in tst_PlainSearch with all
// characters.
constexpr ushort LongS = 0x017F;
constexpr ushort KelvinSign = 0x212A;

// How many characters from here on can be looked for in bytes: one, two of a pair, or none.
int Usable(QString const& text, int at, bool isAnyCase, LogEncoding const& encoding)
{
    const QChar c = text.at(at);
    if (c == QLatin1Char('\n')) // usually a line end
        return 0;
    if (c.unicode() < 0x80)
        return 1;
    // Invalid bytes become the one, and the other is removed from the start of a line.
    if (isAnyCase || c == QChar::ReplacementCharacter || c == QChar::ByteOrderMark)
        return 0;
    if (encoding.kind() != LogEncoding::Utf8)
        return c.unicode() <= 0xFF ? 1 : 0;
    if (!c.isSurrogate())
        return 1;
    return c.isHighSurrogate() && at + 1 < text.size() && text.at(at + 1).isLowSurrogate() ? 2 : 0;
}

QByteArray Encoded(QString const& text, LogEncoding const& encoding)
{
    return encoding.kind() == LogEncoding::Utf8 ? text.toUtf8() : text.toLatin1();
}

// The longest part of a text that can be looked for in bytes.
QByteArray BytesOf(QString const& text, bool isAnyCase, LogEncoding const& encoding)
{
    QByteArray longest;
    for (int at = 0; at < text.size(); ++at) {
        const int start = at;
        while (at < text.size()) {
            const int count = Usable(text, at, isAnyCase, encoding);
            if (count == 0)
                break;
            at += count;
        }
        const QByteArray bytes = Encoded(text.mid(start, at - start), encoding);
        if (bytes.size() > longest.size())
            longest = bytes;
    }
    return longest;
}

int OccurrencesOf(ByteLiteral const& literal, char const* at, char const* end)
{
    int count = 0;
    for (at = literal.Find(at, end); at != end; at = literal.Find(at + 1, end))
        ++count;
    return count;
}

} // namespace

CandidateSearch::CandidateSearch(LogFilter const& filter, LogEncoding const& encoding)
{
    if (encoding.isWide()) {
        m_isEveryLine = true;
        return;
    }
    for (QStringMatcher const& term : filter.hidden().matchers())
        m_isEveryLine =
            !askAbout(term.pattern(), term.caseSensitivity(), encoding, m_hiding) || m_isEveryLine;

    const Qt::CaseSensitivity sensitivity = filter.caseSensitivity();
    const QStringList texts =
        filter.isExpression() ? RequiredLiterals(filter.text()) : QStringList(filter.text());
    for (QString const& text : texts)
        askAbout(text, sensitivity, encoding, m_required);
    m_isWhole = m_isWhole && (filter.text().isEmpty() || !filter.isExpression());
    for (QStringMatcher const& term : filter.required().matchers())
        askAbout(term.pattern(), term.caseSensitivity(), encoding, m_required);

    const bool isRequiring = !filter.text().isEmpty() || !filter.required().isEmpty();
    m_answer = isRequiring ? LogFilter::No : LogFilter::Yes;
    m_isEveryLine = m_isEveryLine || (isRequiring && m_required.empty());
}

// Returns false if no part of the text can be looked for.
bool CandidateSearch::askAbout(QString const& text, Qt::CaseSensitivity sensitivity,
                               LogEncoding const& encoding, std::vector<ByteLiteral>& literals)
{
    const bool isAnyCase = sensitivity == Qt::CaseInsensitive;
    const QByteArray bytes = BytesOf(text, isAnyCase, encoding);
    m_isWhole = m_isWhole && bytes == Encoded(text, encoding);
    if (bytes.isEmpty())
        return false;
    literals.emplace_back(bytes, isAnyCase);
    if (!isAnyCase || encoding.kind() != LogEncoding::Utf8)
        return true;
    const QByteArray lower = bytes.toLower();
    for (ushort other : {LongS, KelvinSign}) {
        if (lower.contains(other == LongS ? 's' : 'k'))
            m_unclear.emplace_back(QString(QChar(other)).toUtf8(), false);
    }
    return true;
}

std::optional<LogFilter::Match> CandidateSearch::Answer(char const* line, int length) const
{
    const auto isIn = [&](ByteLiteral const& literal) {
        return literal.IsIn(line, length);
    };
    const std::optional<LogFilter::Match> unknown;
    if (m_isEveryLine || std::any_of(m_unclear.begin(), m_unclear.end(), isIn))
        return unknown;
    if (std::any_of(m_hiding.begin(), m_hiding.end(), isIn))
        return m_isWhole ? LogFilter::Hidden : unknown;
    if (m_required.empty() || !std::all_of(m_required.begin(), m_required.end(), isIn))
        return m_answer;
    return m_isWhole ? LogFilter::Yes : unknown;
}

char const* CandidateSearch::Find(char const* at, char const* end) const
{
    if (m_isEveryLine)
        return at;
    while (at != end) {
        char const* const windowEnd = at + std::min<std::ptrdiff_t>(WindowSize, end - at);
        char const* found = windowEnd; // before it
        const auto find = [&](ByteLiteral const& literal) {
            char const* const limit =
                found + std::min<std::ptrdiff_t>(literal.size() - 1, end - found);
            char const* const place = literal.Find(at, limit);
            found = place == limit ? found : place;
        };
        if (!m_required.empty())
            find(m_required.front());
        for (ByteLiteral const& literal : m_hiding)
            find(literal);
        for (ByteLiteral const& literal : m_unclear)
            find(literal);
        if (found != windowEnd)
            return found;
        at = windowEnd;
    }
    return end;
}

void CandidateSearch::Learn(char const* sample, int length)
{
    length = std::min(length, SampleSize);
    ByteLiteral::Frequencies frequencies = {};
    for (int i = 0; i < length; ++i)
        ++frequencies[static_cast<unsigned char>(sample[i])];
    for (std::vector<ByteLiteral>* literals : {&m_hiding, &m_unclear}) {
        for (ByteLiteral& literal : *literals)
            literal.Learn(frequencies);
    }

    std::vector<std::pair<int, ByteLiteral>> counted;
    for (ByteLiteral& literal : m_required) {
        literal.Learn(frequencies);
        counted.emplace_back(OccurrencesOf(literal, sample, sample + length), literal);
    }
    // Of two that are as rare, the longer one.
    std::stable_sort(counted.begin(), counted.end(), [](auto const& a, auto const& b) {
        return a.first != b.first ? a.first < b.first : a.second.size() > b.second.size();
    });
    for (size_t i = 0; i < counted.size(); ++i)
        m_required[i] = counted[i].second;
}

} // namespace Velocor
