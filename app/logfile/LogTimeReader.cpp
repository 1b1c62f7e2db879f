// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/logfile/LogTimeReader.h"

#include "app/logfile/AsciiCharacters.h"
#include "app/logfile/DayNumber.h"

#include <QLocale>
#include <QTime>

#include <algorithm>
#include <cstring>

namespace Velocor {

namespace {

constexpr int MinuteLength = 60000; // milliseconds

// What AM or PM says. The hours may be those of the whole day nevertheless.
enum Half { Unknown, Morning, Afternoon };

// Letters of any language: anything above ASCII may be one.
bool IsWordCharacter(char c)
{
    const unsigned char byte = static_cast<unsigned char>(c);
    return (byte >= 'a' && byte <= 'z') || (byte >= 'A' && byte <= 'Z') || byte >= 0x80;
}

// One-digit milliseconds: "5" means half a second in newer Qt versions, 5 ms in older ones.
bool WritesFractions()
{
    return QTime(0, 0, 0, 5).toString(QStringLiteral("z")) == QLatin1String("005");
}

// How many equal letters form one field.
int FieldLength(QChar letter, int count)
{
    switch (letter.toLatin1()) {
    case 'y':
        return count >= 4 ? 4 : std::min(count, 2);
    case 'M':
    case 'd':
        return std::min(count, 4);
    case 'z':
        return count >= 3 ? 3 : 1;
    case 'A':
    case 'a':
    case 't':
        return 1;
    default:
        return std::min(count, 2);
    }
}

int ScaledToMilliseconds(int value, int digits)
{
    for (; digits < 3; ++digits)
        value *= 10;
    return value;
}

} // namespace

struct LogTimeReader::Values
{
    int number[HalfDay + 1] = {};
};

LogTimeReader::LogTimeReader(QString const& format) : m_fractionOfSecond(WritesFractions())
{
    parseFormat(format);

    bool found[HalfDay + 1] = {};
    for (Token const& token : m_tokens)
        found[token.field] = true;
    m_hasDate = (found[Year] || found[ShortYear]) && found[Month] && found[Day];
    m_hasTime = found[Hour] && found[Minute];
    m_resolution = found[Fraction] ? 1 : found[Second] ? 1000 : MinuteLength;
    if (m_hasTime)
        splitSeconds();
    m_pieces[m_parts + 1] = m_tokens.size();
}

// Splits the tokens before the first one for seconds or their fraction, if only those and text
// follow, and numbers and text come before it: whatever follows those, they are read in the same
// way. (A number that is shorter than it may be ends at text, because seconds begin with a digit.)
// And before the fraction, if it is the last number.
void LogTimeReader::splitSeconds()
{
    const auto isFraction = [](Token const& token) {
        return token.field == Fraction;
    };
    const auto isSeconds = [](Token const& token) {
        return token.field == Second || token.field == Fraction;
    };
    const auto isText = [](Token const& token) {
        return token.kind == Exactly;
    };
    const auto first = std::find_if(m_tokens.begin(), m_tokens.end(), isSeconds);
    const bool isLast = std::all_of(first, m_tokens.end(), [&](Token const& token) {
        return isSeconds(token) || isText(token);
    });
    const bool isFixed = std::all_of(m_tokens.begin(), first, [&](Token const& token) {
        return token.kind == Number || isText(token);
    });
    if (first == m_tokens.begin() || first == m_tokens.end() || !isLast || !isFixed)
        return;
    m_pieces[++m_parts] = static_cast<size_t>(first - m_tokens.begin());
    const auto fraction = std::find_if(first + 1, m_tokens.end(), isFraction);
    if (fraction != m_tokens.end() && !isFraction(*first) &&
        std::all_of(fraction + 1, m_tokens.end(), isText))
        m_pieces[++m_parts] = static_cast<size_t>(fraction - m_tokens.begin());
}

void LogTimeReader::parseFormat(QString const& format)
{
    const QString fieldLetters = QStringLiteral("dMyhHmszAat");
    int position = 0;
    while (position < format.length()) {
        const QChar letter = format.at(position);
        if (letter == QLatin1Char('\'')) {
            position = addQuoted(format, position);
            continue;
        }
        int count = 1;
        while (position + count < format.length() && format.at(position + count) == letter)
            ++count;
        if (fieldLetters.contains(letter))
            addFields(letter, count);
        else
            addLiteral(QString(count, letter));
        position += count;
        if ((letter == QLatin1Char('A') || letter == QLatin1Char('a')) &&
            position < format.length() && format.at(position).toLower() == QLatin1Char('p'))
            ++position;
    }
}

// Quoted text is literal, and two quotes in a row are one quote, as in Qt.
int LogTimeReader::addQuoted(QString const& format, int position)
{
    const QLatin1Char quote('\'');
    if (format.mid(position, 2) == QLatin1String("''")) {
        addLiteral(QString(quote));
        return position + 2;
    }

    QString text;
    for (++position; position < format.length(); ++position) {
        if (format.at(position) != quote) {
            text += format.at(position);
        } else if (format.mid(position, 2) == QLatin1String("''")) {
            text += quote;
            ++position;
        } else {
            ++position;
            break;
        }
    }
    addLiteral(text);
    return position;
}

void LogTimeReader::addLiteral(QString const& text)
{
    if (text.isEmpty())
        return;
    if (!m_tokens.empty() && m_tokens.back().kind == Exactly)
        m_tokens.back().text += text.toLatin1();
    else
        m_tokens.push_back({Exactly, Literal, 0, 0, text.toLatin1()});
}

void LogTimeReader::addNumber(Field field, int minimum, int maximum)
{
    m_tokens.push_back({Number, field, minimum, maximum, QByteArray()});
}

// `count` equal letters, which may be more than one field: "yyyyyy" is a long and a short year.
void LogTimeReader::addFields(QChar letter, int count)
{
    while (count > 0) {
        const int length = FieldLength(letter, count);
        addField(letter, length);
        count -= length;
    }
}

void LogTimeReader::addField(QChar letter, int length)
{
    switch (letter.toLatin1()) {
    case 'y':
        if (length == 1)
            addLiteral(QString(letter));
        else
            addNumber(length == 4 ? Year : ShortYear, length, length);
        break;
    case 'M':
        if (length < 3)
            addNumber(Month, length, 2);
        else
            addMonthName();
        break;
    case 'd':
        if (length < 3)
            addNumber(Day, length, 2);
        else
            m_tokens.push_back({Word, Literal, 0, 0, QByteArray()});
        break;
    case 'h':
    case 'H':
        addNumber(Hour, length, 2);
        break;
    case 'm':
        addNumber(Minute, length, 2);
        break;
    case 's':
        addNumber(Second, length, 2);
        break;
    case 'z':
        addNumber(Fraction, length, 3);
        break;
    default: { // AM/PM, time zone
        const Field field = letter == QLatin1Char('t') ? Literal : HalfDay;
        m_tokens.push_back({Word, field, 0, 0, QByteArray()});
    }
    }
}

void LogTimeReader::addMonthName()
{
    m_tokens.push_back({MonthName, Month, 0, 0, QByteArray()});
    if (!m_monthNames.empty())
        return;
    for (QLocale const& locale : {QLocale::system(), QLocale::c()}) {
        for (int month = 1; month <= 12; ++month) {
            for (QLocale::FormatType type : {QLocale::LongFormat, QLocale::ShortFormat}) {
                const QString name = locale.monthName(month, type);
                m_monthNames.push_back(name.toLatin1());
            }
        }
    }
}

qint64 LogTimeReader::keyOf(Values const& values)
{
    int const* number = values.number;
    qint64 key = DayNumber(number[Year] + number[ShortYear], number[Month], number[Day]);
    int hour = number[Hour];
    if (number[HalfDay] == Afternoon && hour < 12)
        hour += 12;
    else if (number[HalfDay] == Morning && hour == 12)
        hour = 0;
    key = key * 24 + hour;
    key = key * 60 + number[Minute];
    return key * MinuteLength + inMinute(values);
}

int LogTimeReader::inMinute(Values const& values)
{
    return values.number[Second] * 1000 + values.number[Fraction];
}

char const* LogTimeReader::readText(Token const& token, char const* at, char const* end)
{
    char const* const text = token.text.constData();
    const int size = token.text.size();
    if (end - at < size)
        return nullptr;
    // Mostly of one character, for which a call would take longer.
    for (int i = 0; i < size; ++i) {
        if (at[i] != text[i])
            return nullptr;
    }
    return at + size;
}

char const* LogTimeReader::readNumber(Token const& token, char const* at, char const* end,
                                      Values& values) const
{
    int value = 0;
    int digits = 0;
    for (; at != end && digits < token.maximum && IsAsciiDigit(*at); ++at, ++digits)
        value = value * 10 + (*at - '0');
    if (digits < token.minimum)
        return nullptr;
    if (token.field == Fraction && m_fractionOfSecond)
        value = ScaledToMilliseconds(value, digits);
    values.number[token.field] = value;
    return at;
}

char const* LogTimeReader::readMonth(char const* at, char const* end, Values& values) const
{
    for (size_t i = 0; i < m_monthNames.size(); ++i) {
        QByteArray const& name = m_monthNames[i];
        if (name.isEmpty() || end - at < name.size() ||
            std::memcmp(at, name.constData(), static_cast<size_t>(name.size())) != 0)
            continue;
        values.number[Month] = static_cast<int>(i / 2 % 12) + 1;
        return at + name.size();
    }
    return nullptr;
}

char const* LogTimeReader::readWord(Token const& token, char const* at, char const* end,
                                    Values& values)
{
    char const* const start = at;
    while (at != end && IsWordCharacter(*at))
        ++at;
    if (at == start)
        return nullptr;
    if (token.field == HalfDay)
        values.number[HalfDay] = *start == 'p' || *start == 'P' ? Afternoon : Morning;
    return at;
}

// Reads what the tokens from `first` to the one before `last` stand for. Returns what follows it;
// nullptr if it is something else.
char const* LogTimeReader::readTokens(size_t first, size_t last, char const* at, char const* end,
                                      Values& values) const
{
    for (size_t i = first; at && i < last; ++i) {
        Token const& token = m_tokens[i];
        at = token.kind == Number      ? readNumber(token, at, end, values)
             : token.kind == Exactly   ? readText(token, at, end)
             : token.kind == MonthName ? readMonth(at, end, values)
                                       : readWord(token, at, end, values);
    }
    return at;
}

LogTimeReader::Stamp LogTimeReader::Read(char const* text, int length) const
{
    Stamp stamp;
    Values values;
    char const* const end = readTokens(0, m_tokens.size(), text, text + length, values);
    if (!end)
        return stamp;
    stamp.length = static_cast<int>(end - text);
    if (m_hasTime)
        stamp.key = keyOf(values);
    return stamp;
}

// For the goal "opening" in docs/performance.md. tst_PlainLineParser compares it with the other.
LogTimeReader::Stamp LogTimeReader::Read(char const* text, int length, Beginning& last) const
{
    const auto isKnown = [&](Beginning::Part const& part) {
        return part.length > 0 && length >= part.length &&
               std::memcmp(text, last.text.data(), static_cast<size_t>(part.length)) == 0;
    };
    size_t known = m_parts;
    while (known > 0 && !isKnown(last.parts[known - 1]))
        --known;
    if (known < m_parts)
        return readAndNote(text, length, known, last);
    if (known == 0)
        return Read(text, length);

    Stamp stamp;
    Values values;
    Beginning::Part const& part = last.parts[known - 1];
    char const* const end =
        readTokens(m_pieces[known], m_tokens.size(), text + part.length, text + length, values);
    if (end) {
        stamp.length = static_cast<int>(end - text);
        stamp.key = part.key + inMinute(values);
    }
    return stamp;
}

// Notes the parts only of what is a stamp: in other text, a number may end where the text does.
//
// @param known  how many parts are known
LogTimeReader::Stamp LogTimeReader::readAndNote(char const* text, int length, size_t known,
                                                Beginning& last) const
{
    Stamp stamp;
    std::array<Beginning::Part, 2> parts = last.parts;
    char const* at = text + (known > 0 ? parts[known - 1].length : 0);
    qint64 key = known > 0 ? parts[known - 1].key : 0;
    for (size_t i = known; i <= m_parts; ++i) {
        Values values;
        at = readTokens(m_pieces[i], m_pieces[i + 1], at, text + length, values);
        if (!at)
            return stamp;
        key += i == 0 ? keyOf(values) : inMinute(values);
        const auto end = static_cast<int>(at - text);
        if (i < m_parts)
            parts[i] = {end <= static_cast<int>(last.text.size()) ? end : 0, key};
    }
    for (Beginning::Part const& part : parts)
        std::copy(text, text + part.length, last.text.begin());
    last.parts = parts;
    stamp.length = static_cast<int>(at - text);
    stamp.key = key;
    return stamp;
}

} // namespace Velocor
