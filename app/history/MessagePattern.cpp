// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/history/MessagePattern.h"

#include <algorithm>

namespace Velocor {

namespace {

constexpr QLatin1Char NumberSign('#');
constexpr QChar Ellipsis(0x2026);

// Shorter words of these letters are words.
constexpr int ShortestHexWord = 6;

bool IsDigit(QChar c)
{
    return c >= QLatin1Char('0') && c <= QLatin1Char('9');
}

bool IsHexDigit(QChar c)
{
    const QChar lower = c.toLower();
    return IsDigit(c) || (lower >= QLatin1Char('a') && lower <= QLatin1Char('f'));
}

bool IsSeparator(QChar c)
{
    return c == QLatin1Char('.') || c == QLatin1Char(':') || c == QLatin1Char(',') ||
           c == QLatin1Char('-');
}

// Goes through a message once.
class Folder
{
public:
    explicit Folder(QString const& message) : m_message(message) {}

    QString fold()
    {
        while (m_at < m_message.size()) {
            if (!foldQuoted() && !foldWord()) {
                m_pattern += m_message.at(m_at);
                ++m_at;
            }
        }
        return m_pattern;
    }

private:
    bool isWordAt(int at) const
    {
        return at >= 0 && at < m_message.size() && m_message.at(at).isLetterOrNumber();
    }

    bool foldQuoted()
    {
        const QChar quote = m_message.at(m_at);
        const bool isQuote =
            quote == QLatin1Char('"') || quote == QLatin1Char('\'') || quote == QLatin1Char('`');
        if (!isQuote || isWordAt(m_at - 1))
            return false;
        int end = m_message.indexOf(quote, m_at + 1);
        while (end >= 0 && isWordAt(end + 1))
            end = m_message.indexOf(quote, end + 1);
        if (end < 0)
            return false;
        m_pattern += quote + Ellipsis + quote;
        m_at = end + 1;
        return true;
    }

    // The length of a number in hexadecimal digits, perhaps with separators; 0 if there is none.
    int numberLength(int at) const
    {
        int end = at;
        const bool isMarked = at + 2 < m_message.size() && m_message.at(at) == QLatin1Char('0') &&
                              m_message.at(at + 1) == QLatin1Char('x') &&
                              IsHexDigit(m_message.at(at + 2));
        if (isMarked)
            end += 2;
        bool hasDigit = isMarked; // a word of letters is none
        while (end < m_message.size()) {
            if (IsHexDigit(m_message.at(end)))
                hasDigit = hasDigit || IsDigit(m_message.at(end));
            else if (end == at || !IsSeparator(m_message.at(end)) || end + 1 == m_message.size() ||
                     !IsHexDigit(m_message.at(end + 1)))
                break;
            ++end;
        }
        return hasDigit && !isWordAt(end) ? end - at : 0;
    }

    // Only digits, with separators between them.
    int decimalLength(int at) const
    {
        int end = at;
        while (end < m_message.size() &&
               (IsDigit(m_message.at(end)) ||
                (end > at && IsSeparator(m_message.at(end)) && end + 1 < m_message.size() &&
                 IsDigit(m_message.at(end + 1)))))
            ++end;
        return end - at;
    }

    bool foldWord()
    {
        if (!isWordAt(m_at))
            return false;
        const bool isStart = !isWordAt(m_at - 1);
        int length = isStart ? numberLength(m_at) : 0;
        if (length < ShortestHexWord && !IsDigit(m_message.at(m_at)))
            length = 0;
        if (length == 0)
            length = decimalLength(m_at);
        if (length == 0)
            return false;
        m_pattern += NumberSign;
        m_at += length;
        return true;
    }

    QString const& m_message;
    QString m_pattern;
    int m_at = 0;
};

} // namespace

QString MessagePattern::Of(QString const& message)
{
    return Folder(message).fold();
}

QString MessagePattern::Expression(QString const& pattern)
{
    static const QString special = QStringLiteral("\\^$.|?*+()[]{}");
    QString expression;
    for (int at = 0; at < pattern.size(); ++at) {
        const QChar c = pattern.at(at);
        const bool isQuoted = c == Ellipsis && at > 0 && at + 1 < pattern.size() &&
                              pattern.at(at - 1) == pattern.at(at + 1);
        if (c == NumberSign)
            expression += QLatin1String("[#0-9a-fA-Fx.:,-]+");
        else if (isQuoted)
            expression += QLatin1String(".*");
        else if (special.contains(c))
            expression += QLatin1Char('\\') + QString(c);
        else
            expression += c;
    }
    return expression;
}

void PatternList::Add(LogEntry::Severity severity, QString const& message, qint64 time,
                      qint64 place)
{
    QString pattern = MessagePattern::Of(message);
    QString key = QChar(severity) + pattern;
    if (m_numbers.size() >= MaximumPatterns && !m_numbers.contains(key)) {
        severity = LogEntry::None;
        pattern = Ellipsis;
        key = Ellipsis;
    }
    const auto found = m_numbers.constFind(key);
    size_t number = m_patterns.size();
    if (found != m_numbers.constEnd()) {
        number = *found;
    } else {
        m_numbers.insert(key, number);
        m_patterns.emplace_back();
        m_patterns.back().severity = severity;
        m_patterns.back().text = pattern;
    }
    Pattern& counted = m_patterns[number];
    ++counted.count;
    if (counted.count == 1 || (time >= 0 && (counted.first < 0 || time < counted.first))) {
        counted.first = time;
        counted.firstPlace = place;
    }
    if (time >= counted.last) {
        counted.last = time;
        counted.lastPlace = place;
    }
}

bool PatternList::IsRest(Pattern const& pattern)
{
    return pattern.severity == LogEntry::None && pattern.text == QString(Ellipsis);
}

std::vector<PatternList::Pattern> PatternList::Sorted() const
{
    std::vector<Pattern> sorted = m_patterns;
    std::stable_sort(sorted.begin(), sorted.end(),
                     [](Pattern const& a, Pattern const& b) { return a.count > b.count; });
    return sorted;
}

} // namespace Velocor
