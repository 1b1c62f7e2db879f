// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/logfile/ForeignStamp.h"

#include "app/logfile/AsciiCharacters.h"
#include "app/logfile/DayNumber.h"

#include <QDateTime>

#include <algorithm>
#include <cstring>

namespace Velocor {

namespace {

// Y, y: year of four or two digits; M, D, h, m, s: two digits; d: day of the month, padded with a
// blank or not at all; N, W: English name of month or weekday; f: a fraction of the second, if any;
// z: a time zone, if any; U: seconds since 1970, with a fraction; o, H: month or hour of one or two
// digits; p: AM or PM. Anything else is literal.
constexpr char const* Patterns[] = {
    "Y-M-DTh:m:sfz",   // ISO 8601
    "Y-M-D h:m:sfz",   // most programs
    "Y-M-D  h:m:sfz",  // apt
    "Y-M-D_h:m:sf",    //
    "Y/M/D h:m:sfz",   // nginx, Go
    "Y.M.D h:m:sfz",   //
    "YMDThmsfz",       // ISO 8601, basic
    "YMD h:m:sf",      //
    "D.M.Y h:m:sfz",   //
    "D/N/Y:h:m:s z",   // access logs
    "D-N-Y h:m:sfz",   // PHP
    "W N d h:m:sf Y",  // ctime(), Apache
    "W Y-M-D h:m:sfz", // journalctl --output=short-full
    "W, D N Y h:m:sfz",
    "N d Y h:m:sf", // routers
    "N d h:m:sf",   // RFC 3164
    "d N Y h:m:sf", // Redis
    "h:m:sf",
    "o/d/Y H:m:sf p",  // without p, the day might come first
    "N d, Y H:m:sf p", // java.util.logging
    "U",               // journalctl --output=short-unix
};

// Android; also a plain date without a year.
constexpr char const* WithIds = "M-D h:m:sf";

constexpr char const* AfterLetter[] = {
    "MD h:m:sf", // glog
    "YMD h:m:sf",
    "yMD h:m:sf", // Tornado
};

constexpr char const Months[] = "JanFebMarAprMayJunJulAugSepOctNovDec";
constexpr char const Weekdays[] = "MonTueWedThuFriSatSun";

constexpr char const* Zones[] = {"UTC", "GMT",  "CET", "CEST", "MET", "EST", "EDT", "CST",
                                 "CDT", "MST",  "MDT", "PST",  "PDT", "BST", "WET", "WEST",
                                 "EET", "EEST", "MSK", "IST",  "JST", "KST", "AEST"};

// Reads a pattern's fields from a text. Each method moves on and returns false if the text has
// something else.
class Fields
{
public:
    Fields(char const* text, int length) : m_at(text), m_end(text + length), m_text(text) {}

    bool read(char const* pattern)
    {
        for (char const* field = pattern; *field != '\0'; ++field) {
            if (!readField(*field))
                return false;
        }
        return true;
    }

    ForeignStamp stamp(QDate const& latest) const
    {
        ForeignStamp result;
        const bool isWhole = m_at == m_end || (!IsAsciiDigit(*m_at) && !IsAsciiLetter(*m_at));
        if (!isWhole || !isPlausible())
            return result;
        result.length = static_cast<int>(m_at - m_text);
        result.hasDate = m_month > 0 || m_epoch >= 0;
        result.resolution = m_hasFraction ? 1 : 1000;
        if (m_epoch >= 0) {
            result.key = ForeignStamp::KeyOfEpoch(m_epoch * 1000 + m_milliseconds);
            return result;
        }
        const int year = m_year < 0 && m_month > 0 ? guessedYear(latest) : std::max(m_year, 0);
        result.key = DayNumber(year, m_month, m_day);
        result.key = (result.key * 24 + m_hour) * 60 + m_minute;
        result.key = (result.key * 60 + m_second) * 1000 + m_milliseconds;
        return result;
    }

private:
    bool readField(char field)
    {
        switch (field) {
        case 'Y':
            return readNumber(4, m_year) && m_year > 0;
        case 'y':
            if (!readNumber(2, m_year))
                return false;
            m_year += 2000;
            return true;
        case 'M':
            return readNumber(2, m_month) && m_month > 0;
        case 'D':
            return readNumber(2, m_day);
        case 'd':
            return readDay();
        case 'h':
            return readNumber(2, m_hour);
        case 'm':
            return readNumber(2, m_minute);
        case 's':
            return readNumber(2, m_second);
        case 'o':
            return readNumber(std::max(1, digits(2)), m_month) && m_month > 0;
        case 'H':
            return readNumber(std::max(1, digits(2)), m_hour) && m_hour >= 1 && m_hour <= 12;
        case 'p':
            return readHalfOfDay();
        case 'N':
            return readName(Months, m_month);
        case 'W':
            return readName(Weekdays, m_weekday);
        case 'f':
            readFraction();
            return true;
        case 'z':
            readZone();
            return true;
        case 'U':
            return readEpoch();
        default:
            return readLiteral(field);
        }
    }

    bool readLiteral(char c)
    {
        if (m_at == m_end || *m_at != c)
            return false;
        ++m_at;
        return true;
    }

    int digits(int maximum) const
    {
        int count = 0;
        while (count < maximum && m_at + count != m_end && IsAsciiDigit(m_at[count]))
            ++count;
        return count;
    }

    bool readNumber(int count, int& number)
    {
        if (digits(count) < count)
            return false;
        number = 0;
        for (; count > 0; --count)
            number = number * 10 + (*m_at++ - '0');
        return true;
    }

    bool readDay()
    {
        if (m_at != m_end && *m_at == ' ')
            ++m_at;
        return readNumber(std::max(1, digits(2)), m_day);
    }

    bool readHalfOfDay()
    {
        if (m_end - m_at < 2 || (*m_at != 'A' && *m_at != 'P') || m_at[1] != 'M')
            return false;
        m_hour = m_hour % 12 + (*m_at == 'P' ? 12 : 0);
        m_at += 2;
        return true;
    }

    bool readName(char const* names, int& number)
    {
        if (m_end - m_at < 3)
            return false;
        for (int i = 0; names[3 * i] != '\0'; ++i) {
            if (std::memcmp(m_at, names + 3 * i, 3) != 0)
                continue;
            m_at += 3;
            number = i + 1;
            return true;
        }
        return false;
    }

    void readFraction()
    {
        if (m_end - m_at < 2 || (*m_at != '.' && *m_at != ',') || !IsAsciiDigit(m_at[1]))
            return;
        ++m_at;
        m_hasFraction = true;
        for (int unit = 100; m_at != m_end && IsAsciiDigit(*m_at); ++m_at, unit /= 10)
            m_milliseconds += (*m_at - '0') * unit;
    }

    // "Z", "+0100", "+01:00" or "-01", or one of the names after a blank.
    void readZone()
    {
        if (m_at == m_end)
            return;
        if (*m_at == 'Z') {
            ++m_at;
            return;
        }
        char const* const start = m_at;
        const bool isApart = *m_at == ' ';
        if (isApart)
            ++m_at;
        if (!readOffset() && !(isApart && readZoneName()))
            m_at = start;
    }

    bool readOffset()
    {
        if (m_at == m_end || (*m_at != '+' && *m_at != '-'))
            return false;
        ++m_at;
        int ignored = 0;
        if (!readNumber(2, ignored))
            return false;
        char const* const minutes = m_at;
        if (m_at != m_end && *m_at == ':')
            ++m_at;
        if (!readNumber(2, ignored))
            m_at = minutes; // the colon belongs to what follows
        return true;
    }

    bool readZoneName()
    {
        for (char const* zone : Zones) {
            const auto length = static_cast<int>(std::strlen(zone));
            if (m_end - m_at < length || std::memcmp(m_at, zone, static_cast<size_t>(length)) != 0)
                continue;
            if (m_end - m_at > length && IsAsciiLetter(m_at[length]))
                continue;
            m_at += length;
            return true;
        }
        return false;
    }

    bool readEpoch()
    {
        if (digits(11) != 10 || m_end - m_at < 12 || m_at[10] != '.')
            return false;
        m_epoch = 0;
        for (int i = 0; i < 10; ++i)
            m_epoch = m_epoch * 10 + (*m_at++ - '0');
        readFraction();
        return m_hasFraction;
    }

    bool isPlausible() const
    {
        const bool hasDay = m_month > 0 || m_day > 0;
        return m_month <= 12 && (!hasDay || (m_day >= 1 && m_day <= 31)) && m_hour <= 24 &&
               m_minute < 60 && m_second <= 60;
    }

    // The latest that is not in the future, but for a few days: the newest entries may be newer
    // than what is known.
    int guessedYear(QDate const& latest) const
    {
        if (!latest.isValid())
            return 1970;
        const QDate end = latest.addDays(7);
        const int today = end.month() * 32 + end.day();
        return m_month * 32 + m_day <= today ? end.year() : end.year() - 1;
    }

    char const* m_at;
    char const* m_end;
    char const* m_text;
    int m_year = -1;
    int m_month = 0;
    int m_day = 0;
    int m_weekday = 0;
    int m_hour = 0;
    int m_minute = 0;
    int m_second = 0;
    int m_milliseconds = 0;
    bool m_hasFraction = false;
    qint64 m_epoch = -1;
};

ForeignStamp ReadOne(char const* pattern, char const* text, int length, QDate const& latest)
{
    Fields fields(text, length);
    return fields.read(pattern) ? fields.stamp(latest) : ForeignStamp();
}

} // namespace

ForeignStamp ForeignStamp::Read(char const* text, int length, QDate const& latest)
{
    // Most lines without a time stamp end here.
    if (length < 8 || (!IsAsciiDigit(*text) && !IsAsciiLetter(*text) && *text != ' '))
        return ForeignStamp();
    for (char const* pattern : Patterns) {
        const ForeignStamp stamp = ReadOne(pattern, text, length, latest);
        if (stamp.length > 0)
            return stamp;
    }
    ForeignStamp stamp = ReadOne(WithIds, text, length, latest);
    stamp.isFollowedByIds = stamp.length > 0;
    return stamp;
}

ForeignStamp ForeignStamp::ReadAfterLetter(char const* text, int length, QDate const& latest)
{
    for (char const* pattern : AfterLetter) {
        const ForeignStamp stamp = ReadOne(pattern, text, length, latest);
        if (stamp.length > 0)
            return stamp;
    }
    return ForeignStamp();
}

ForeignStamp ForeignStamp::ReadSeconds(char const* text, int length)
{
    ForeignStamp stamp;
    int at = 0;
    while (at < length && text[at] == ' ')
        ++at;
    const int first = at;
    qint64 seconds = 0;
    for (; at < length && at < first + 10 && IsAsciiDigit(text[at]); ++at)
        seconds = seconds * 10 + (text[at] - '0');
    if (at == first || at == length || text[at] != '.')
        return stamp;
    const int point = at;
    int milliseconds = 0;
    int unit = 100;
    for (++at; at < length && IsAsciiDigit(text[at]); ++at, unit /= 10)
        milliseconds += (text[at] - '0') * unit;
    if (at == point + 1)
        return stamp;
    stamp.length = at;
    stamp.key = seconds * 1000 + milliseconds;
    stamp.resolution = 1;
    return stamp;
}

qint64 ForeignStamp::KeyOfEpoch(qint64 milliseconds)
{
    const QDateTime time = QDateTime::fromMSecsSinceEpoch(milliseconds);
    const QDate day = time.date();
    if (!day.isValid() || day.year() < 0)
        return -1;
    return DayNumber(day.year(), day.month(), day.day()) * 24 * 60 * 60 * 1000 +
           time.time().msecsSinceStartOfDay();
}

} // namespace Velocor
