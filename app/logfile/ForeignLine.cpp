// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/logfile/ForeignLine.h"

#include "app/logfile/AsciiCharacters.h"
#include "app/logfile/ForeignStamp.h"
#include "app/logfile/LevelNames.h"
#include "app/logfile/LogFields.h"

#include <QDateTime>
#include <QLocale>

#include <algorithm>
#include <cstring>

namespace Velocor {

namespace {

// Stamps and severities further on are part of a message.
constexpr int SearchLimit = 512;
constexpr int MaximumWords = 6;

enum class Part { Time, Severity, Message, Program, None };

struct FieldName
{
    char const* name;
    Part part;
};

// If an entry has several for one part, the first in this list is taken.
constexpr FieldName FieldNames[] = {
    {"__REALTIME_TIMESTAMP", Part::Time},
    {"@timestamp", Part::Time},
    {"timestamp", Part::Time},
    {"time", Part::Time},
    {"ts", Part::Time},
    {"@t", Part::Time},
    {"t", Part::Time},
    {"datetime", Part::Time},
    {"asctime", Part::Time},
    {"date", Part::Time},
    {"PRIORITY", Part::Severity},
    {"level", Part::Severity},
    {"severity", Part::Severity},
    {"lvl", Part::Severity},
    {"log.level", Part::Severity},
    {"levelname", Part::Severity},
    {"level_name", Part::Severity},
    {"loglevel", Part::Severity},
    {"severity_text", Part::Severity},
    {"@l", Part::Severity},
    {"priority", Part::Severity},
    {"s", Part::Severity},
    {"MESSAGE", Part::Message},
    {"message", Part::Message},
    {"msg", Part::Message},
    {"@m", Part::Message},
    {"short_message", Part::Message},
    {"textPayload", Part::Message},
    {"text", Part::Message},
    {"log", Part::Message},
    {"event", Part::Message},
    {"SYSLOG_IDENTIFIER", Part::Program},
    {"_COMM", Part::Program},
    {"", Part::None}, // all others
};

// Around what a program in a container has written.
constexpr char const ContainerField[] = "log";

// In front of a stamp, in logs of the package manager. They tell what happened, so they stay.
constexpr char const* Prefixes[] = {
    "Start-Date: ", "End-Date: ", "Log started: ", "Log ended: ", "update-alternatives "};

constexpr char const* Facilities[] = {"kern", "user", "mail", "daemon", "auth",    "syslog",
                                      "lpr",  "news", "uucp", "cron",   "authpriv"};

bool IsBlank(char c)
{
    return c == ' ' || c == '\t';
}

// The bracket that closes this one; '\0' if it is none.
char ClosingOf(char c)
{
    switch (c) {
    case '[':
        return ']';
    case '(':
        return ')';
    case '<':
        return '>';
    case '{':
        return '}';
    default:
        return '\0';
    }
}

int RankOf(LogField const& field)
{
    const auto length = static_cast<size_t>(field.nameLength);
    const auto isOther = [&](FieldName const& known) {
        return std::strlen(known.name) != length ||
               std::memcmp(known.name, field.name, length) != 0;
    };
    int rank = 0;
    while (FieldNames[rank].part != Part::None && isOther(FieldNames[rank]))
        ++rank;
    return rank;
}

bool IsDigits(char const* text, int length)
{
    return length > 0 && std::all_of(text, text + length, IsAsciiDigit);
}

// Milliseconds since 1970 from a number of seconds, perhaps with a fraction, or of milli-, micro-
// or nanoseconds; -1 if it is none of these.
qint64 EpochOf(char const* number, int length)
{
    char const* const end = number + length;
    char const* const point = std::find(number, end, '.');
    const auto digits = static_cast<int>(point - number);
    if (!IsDigits(number, digits) || (digits != 10 && digits != 13 && digits != 16 && digits != 19))
        return -1;
    qint64 milliseconds = 0;
    char const* at = number;
    for (int count = 0; count < 13; ++count) {
        if (at == point && at != end)
            ++at; // to the fraction
        const bool isDigit = at != end && IsAsciiDigit(*at);
        milliseconds = milliseconds * 10 + (isDigit ? *at - '0' : 0);
        if (isDigit)
            ++at;
    }
    return milliseconds;
}

// The length of the escape sequences at the start of a text that set colors, such as "\x1b[1;31m".
int ColorsLength(char const* text, int length)
{
    int colors = 0;
    for (int at = 0; at + 1 < length && text[at] == '\x1b' && text[at + 1] == '['; at = colors) {
        at += 2;
        while (at < length && (IsAsciiDigit(text[at]) || text[at] == ';'))
            ++at;
        if (at == length || text[at] != 'm')
            break;
        colors = at + 1;
    }
    return colors;
}

// Splits lines that start with a stamp or a severity.
class Words
{
public:
    Words(char const* text, int length, QDate const& latest)
        : m_text(text), m_length(std::min(length, SearchLimit)), m_whole(length), m_latest(latest)
    {}

    ForeignLine read()
    {
        if (m_length == 0 || readPrefixed() || readProcess() || readAccess())
            return m_line;
        readPriority();
        readFacility();
        if (readStamp())
            readSeverity();
        else if (m_line.severity == LogEntry::None && !readSeverityFirst())
            return m_line;
        m_line.isEntry = true;
        m_line.message = {m_at, m_whole - m_at};
        return m_line;
    }

private:
    bool isAt(char c) const { return m_at < m_length && m_text[m_at] == c; }

    bool startsWith(char const* prefix) const
    {
        const auto length = static_cast<int>(std::strlen(prefix));
        return m_length - m_at >= length &&
               std::memcmp(m_text + m_at, prefix, static_cast<size_t>(length)) == 0;
    }

    void take(ForeignStamp const& stamp)
    {
        m_line.isSure = true;
        m_line.time = {m_at, stamp.length};
        m_line.timeKey = stamp.key;
        m_line.hasDate = stamp.hasDate;
        m_line.resolution = stamp.resolution;
        m_at += stamp.length;
    }

    bool takeStamp()
    {
        const ForeignStamp stamp = ForeignStamp::Read(m_text + m_at, m_length - m_at, m_latest);
        if (stamp.length == 0)
            return false;
        m_hasIds = stamp.isFollowedByIds;
        take(stamp);
        return true;
    }

    // "Start-Date: 2026-11-22  14:03:02"; the message is the whole line.
    bool readPrefixed()
    {
        for (char const* prefix : Prefixes) {
            if (!startsWith(prefix))
                continue;
            return readStampWithin(static_cast<int>(std::strlen(prefix)));
        }
        return false;
    }

    // "1234:M 22 Nov 2026 14:03:02.123 * Ready"
    bool readProcess()
    {
        int digits = 0;
        while (digits < m_length && IsAsciiDigit(m_text[digits]))
            ++digits;
        return digits > 0 && m_length - digits > 3 && m_text[digits] == ':' &&
               IsAsciiLetter(m_text[digits + 1]) && m_text[digits + 2] == ' ' &&
               readStampWithin(digits + 3);
    }

    // "127.0.0.1 - - [22/Nov/2026:14:03:02 +0000] ...". Other stamps in brackets may be part of a
    // message.
    bool readAccess()
    {
        // Not std::memchr(): gcc warns in a release build, because the length is an int.
        char const* const end = m_text + m_length;
        char const* const bracket = std::find(m_text, end, '[');
        const auto at = static_cast<int>((bracket != end ? bracket + 1 : m_text) - m_text);
        return at > 1 && m_length - at > 12 && m_text[at + 2] == '/' && m_text[at + 6] == '/' &&
               readStampWithin(at);
    }

    // A stamp in the middle of what is the message.
    bool readStampWithin(int at)
    {
        m_at = at;
        m_line.isEntry = takeStamp();
        m_line.message = {0, m_whole};
        m_at = 0;
        return m_line.isEntry;
    }

    // "<34>" or, with a version, "<34>1 ".
    void readPriority()
    {
        if (!isAt('<'))
            return;
        int digits = 1;
        int priority = 0;
        for (; digits < m_length && digits < 4 && IsAsciiDigit(m_text[digits]); ++digits)
            priority = priority * 10 + (m_text[digits] - '0');
        if (digits == 1 || digits == m_length || m_text[digits] != '>' || priority > 191)
            return;
        m_line.severity = LevelNames::OfPriority(priority % 8);
        m_at = digits + 1;
        if (m_length - m_at > 2 && IsAsciiDigit(m_text[m_at]) && m_text[m_at + 1] == ' ')
            m_at += 2;
    }

    // "kern  :warn  : ", as `dmesg --decode` writes it.
    void readFacility()
    {
        for (char const* facility : Facilities) {
            if (!startsWith(facility))
                continue;
            int at = m_at + static_cast<int>(std::strlen(facility));
            const auto skipTo = [&](char c) {
                while (at < m_length && IsBlank(m_text[at]))
                    ++at;
                return at < m_length && m_text[at++] == c;
            };
            if (!skipTo(':'))
                continue;
            const int name = at;
            while (at < m_length && IsAsciiLetter(m_text[at]))
                ++at;
            const LogEntry::Severity severity = LevelNames::Named(m_text + name, at - name);
            if (severity == LogEntry::None || !skipTo(':'))
                continue;
            m_line.severity = severity;
            m_at = at;
            skipBlanks();
            return;
        }
    }

    // A stamp, perhaps in brackets and after a severity's letter: "E1122 14:03:02.123",
    // "[E 2026-11-22 14:03:02", "I, [2026-11-22T14:03:02".
    bool readStamp()
    {
        const int start = m_at;
        const LogEntry::Severity severity = m_line.severity;
        if (m_length - m_at > 4 && m_text[m_at + 1] == ',' && m_text[m_at + 3] == '[') {
            m_line.severity = LevelNames::OfLetter(m_text[m_at]);
            m_at += 3;
        }
        const bool isBracketed = isAt('[') || isAt('(');
        if (isBracketed)
            ++m_at;
        if (readStampInBrackets(isBracketed)) {
            if (isBracketed && (isAt(']') || isAt(')')))
                ++m_at;
            skipSeparators();
            return true;
        }
        m_at = start;
        m_line.severity = severity;
        return false;
    }

    bool readStampInBrackets(bool isBracketed)
    {
        if (takeStamp())
            return true;
        char const* const text = m_text + m_at;
        const int length = m_length - m_at;
        const ForeignStamp seconds =
            isBracketed ? ForeignStamp::ReadSeconds(text, length) : ForeignStamp();
        if (seconds.length > 0 && seconds.length < length && text[seconds.length] == ']') {
            take(seconds);
            while (m_line.time.length > 0 && m_text[m_line.time.start] == ' ') {
                ++m_line.time.start;
                --m_line.time.length;
            }
            return true;
        }
        const LogEntry::Severity severity =
            length > 2 ? LevelNames::OfLetter(*text) : LogEntry::None;
        if (severity == LogEntry::None)
            return false;
        m_at += text[1] == ' ' ? 2 : 1;
        const ForeignStamp stamp =
            ForeignStamp::ReadAfterLetter(m_text + m_at, m_length - m_at, m_latest);
        if (stamp.length > 0)
            take(stamp);
        else if (text[1] != ' ' || !isBracketed || !takeStamp())
            return false;
        m_line.severity = severity;
        return true;
    }

    void skipBlanks()
    {
        while (m_at < m_length && IsBlank(m_text[m_at]))
            ++m_at;
    }

    // What is between a stamp, a severity and a message.
    void skipSeparators()
    {
        while (m_at < m_length) {
            const int colors = ColorsLength(m_text + m_at, m_length - m_at);
            m_at += colors;
            if (colors > 0)
                continue;
            const bool isApart = m_at + 1 == m_length || IsBlank(m_text[m_at + 1]);
            const char c = m_text[m_at];
            if (!IsBlank(c) && c != ',' && c != '|' && c != ':' && !(c == '-' && isApart))
                return;
            ++m_at;
        }
    }

    // The severity of what is in brackets: "[error]", "[core:error]", "[INFO/Main]", "(EE)", "[W]".
    LogEntry::Severity severityIn(int start, int end) const
    {
        while (start < end && IsBlank(m_text[start]))
            ++start;
        while (start < end && IsBlank(m_text[end - 1]))
            --end;
        if (m_text[start - 1] == '(')
            return LevelNames::OfSymbol(m_text + start, end - start);
        if (end - start == 1)
            return LevelNames::OfLetter(m_text[start]);
        char const* const first = m_text + start;
        char const* const last = m_text + end;
        char const* const colon = std::find(first, last, ':');
        const LogEntry::Severity after =
            colon == last ? LogEntry::None
                          : LevelNames::Named(colon + 1, static_cast<int>(last - colon - 1));
        if (after != LogEntry::None)
            return after;
        char const* const slash = std::find(first, last, '/');
        return LevelNames::Named(first, static_cast<int>(slash - first));
    }

    // Reads one word or bracketed text from m_at on. Returns its end; `next` is where the next
    // begins.
    LogEntry::Severity readWord(bool isFirst, int& next, bool& endsTag) const
    {
        const char closing = ClosingOf(m_text[m_at]);
        char const* const end = m_text + m_length;
        char const* const close = closing == '\0' ? end : std::find(m_text + m_at, end, closing);
        if (close != end) {
            next = static_cast<int>(close - m_text) + 1;
            return severityIn(m_at + 1, next - 1);
        }
        int at = m_at;
        while (at < m_length &&
               (IsAsciiLetter(m_text[at]) || (at > m_at && IsAsciiDigit(m_text[at]))))
            ++at;
        next = at;
        while (next < m_length && !IsBlank(m_text[next]))
            ++next;
        endsTag = next > m_at && m_text[next - 1] == ':';
        const char after = at < m_length ? m_text[at] : ' ';
        const int length = at - m_at;
        if (after == ':')
            return LevelNames::Named(m_text + m_at, length);
        if (!IsBlank(after) && after != '|' && after != ']' && after != ',' && after != '\x1b')
            return LogEntry::None;
        const bool anyCase = isFirst && !LevelNames::IsEveryday(m_text + m_at, length);
        return LevelNames::Named(m_text + m_at, length,
                                 anyCase ? LevelNames::Match::AnyCase
                                         : LevelNames::Match::UpperCase);
    }

    // Looks at the first words after the stamp. A severity that follows the stamp is not part of
    // the message; one further on is, with what precedes it.
    void readSeverity()
    {
        if (m_line.severity != LogEntry::None)
            return;
        const int start = m_at;
        bool isAfterTag = false;
        for (int word = 0; word < MaximumWords && m_at < m_length; ++word) {
            int next = m_at;
            bool endsTag = false;
            const LogEntry::Severity severity = readWord(word == 0, next, endsTag);
            m_line.severity = severity;
            if (severity != LogEntry::None && word == 0) {
                m_at = afterSeverity();
                return;
            }
            if (severity != LogEntry::None || isAfterTag)
                break;
            isAfterTag = endsTag; // "host program[12]: error: ..."
            if (m_hasIds && next - m_at == 1)
                m_line.severity = LevelNames::OfLetter(m_text[m_at]);
            if (m_line.severity != LogEntry::None)
                break;
            m_at = std::max(next, m_at + 1);
            skipSeparators();
        }
        m_at = start;
    }

    // Where the message starts after a severity at m_at.
    int afterSeverity()
    {
        const char closing = ClosingOf(m_text[m_at]);
        const auto isInside = [&](char c) {
            return closing != '\0' ? c != closing : IsAsciiLetter(c) || IsAsciiDigit(c);
        };
        while (m_at < m_length && isInside(m_text[m_at]))
            ++m_at;
        if (m_at < m_length && (closing != '\0' || m_text[m_at] == ']'))
            ++m_at;
        skipSeparators();
        return m_at;
    }

    // "[ERROR] text", "WARNING:name:text", "INFO 2026-11-22 14:03:02 text". In small letters only
    // with a colon: "error: text".
    bool readSeverityFirst()
    {
        if (m_at == m_length || (!IsAsciiLetter(m_text[m_at]) && m_text[m_at] != '['))
            return false;
        int next = m_at;
        bool endsTag = false;
        const bool isBracketed = m_text[m_at] == '[';
        if (isBracketed && m_length - m_at > 2 && m_text[m_at + 2] == ']')
            return false; // "[1]" and "[x]" are lists
        const LogEntry::Severity severity = readWord(false, next, endsTag);
        if (severity == LogEntry::None)
            return false;
        m_line.severity = severity;
        m_at = isBracketed ? next : m_at;
        if (isBracketed)
            skipSeparators();
        else
            m_at = afterSeverity();
        const int message = m_at;
        if (!readStamp())
            m_at = message;
        m_line.severity = severity;
        return true;
    }

    char const* m_text;
    int m_length;
    int m_whole;
    QDate m_latest;
    int m_at = 0;
    bool m_hasIds = false;
    ForeignLine m_line;
};

ForeignLine ReadWords(char const* line, int length, QDate const& latest)
{
    const int colors = ColorsLength(line, std::min(length, SearchLimit));
    ForeignLine result = Words(line + colors, length - colors, latest).read();
    result.time.start += colors;
    result.message.start += colors;
    return result;
}

// "D1" to "D5".
bool IsDebugLevel(char const* text, int length)
{
    return length == 2 && text[0] == 'D' && IsAsciiDigit(text[1]);
}

// Splits entries whose parts have names.
class Named
{
public:
    Named(char const* text, int length, QDate const& latest) : m_text(text), m_latest(latest)
    {
        m_line.message = {0, length};
    }

    template <class Fields>
    ForeignLine read(Fields fields)
    {
        LogField field;
        while (fields.Next(field)) {
            const int rank = RankOf(field);
            switch (FieldNames[rank].part) {
            case Part::Time:
                if (rank < m_timeRank && takeTime(field))
                    m_timeRank = rank;
                break;
            case Part::Severity:
                if (rank < m_severityRank && takeSeverity(field))
                    m_severityRank = rank;
                break;
            case Part::Message:
                if (rank < m_messageRank && field.valueLength > 0)
                    takeMessage(field, rank);
                break;
            case Part::Program:
                if (rank < m_programRank)
                    m_line.program = {field.value, field.valueLength};
                m_programRank = std::min(rank, m_programRank);
                break;
            case Part::None:
                break;
            }
        }
        readContained();
        m_line.isSure = m_hasTime || m_line.severity != LogEntry::None || m_messageRank < Last;
        m_line.isEntry = m_line.isSure;
        return m_line;
    }

private:
    static constexpr int Last = 1000;

    bool takeTime(LogField const& field)
    {
        char const* const text = m_text + field.value;
        const qint64 epoch = EpochOf(text, field.valueLength);
        const ForeignStamp stamp = ForeignStamp::Read(text, field.valueLength, m_latest);
        if (epoch < 0 && stamp.length == 0)
            return false;
        m_hasTime = true;
        m_line.isEpoch = epoch >= 0;
        m_line.time = {field.value, m_line.isEpoch ? field.valueLength : stamp.length};
        m_line.timeKey = m_line.isEpoch ? ForeignStamp::KeyOfEpoch(epoch) : stamp.key;
        m_line.hasDate = m_line.isEpoch || stamp.hasDate;
        m_line.resolution = m_line.isEpoch ? 1 : stamp.resolution;
        return true;
    }

    bool takeSeverity(LogField const& field)
    {
        char const* const text = m_text + field.value;
        LogEntry::Severity severity = LogEntry::None;
        if (field.valueLength <= 3 && IsDigits(text, field.valueLength))
            severity = LevelNames::OfNumber(QByteArray(text, field.valueLength).toInt());
        else if (field.valueLength == 1 || IsDebugLevel(text, field.valueLength))
            severity = LevelNames::OfLetter(*text);
        else
            severity = LevelNames::Named(text, field.valueLength);
        if (severity == LogEntry::None)
            return false;
        m_line.severity = severity;
        return true;
    }

    // What a container has written has no severity but that of the line itself.
    void readContained()
    {
        if (m_isContained && m_line.severity == LogEntry::None)
            m_line.severity =
                ReadWords(m_text + m_line.message.start, m_line.message.length, m_latest).severity;
    }

    void takeMessage(LogField const& field, int rank)
    {
        m_line.message = {field.value, field.valueLength};
        m_line.isEscaped = field.isEscaped;
        m_messageRank = rank;
        m_isContained = std::strcmp(FieldNames[rank].name, ContainerField) == 0;
    }

    char const* m_text;
    QDate m_latest;
    ForeignLine m_line;
    bool m_hasTime = false;
    bool m_isContained = false; // whether the message is what a container has written
    int m_timeRank = Last;
    int m_severityRank = Last;
    int m_messageRank = Last;
    int m_programRank = Last;
};

// Whether the line starts with the name of a known field and an equals sign.
bool IsLogfmt(char const* line, int length)
{
    LogField field;
    LogfmtFields fields(line, std::min(length, SearchLimit));
    return length > 0 && !IsBlank(*line) && fields.Next(field) &&
           FieldNames[RankOf(field)].part != Part::None;
}

} // namespace

ForeignLine ForeignLine::Read(char const* line, int length, QDate const& latest)
{
    ForeignLine result;
    if (length > 0 && *line == '{')
        result = Named(line, length, latest).read(JsonFields(line, length));
    else if (IsJournalExport(line, length))
        result = Named(line, length, latest).read(JournalFields(line, length));
    else if (IsLogfmt(line, length))
        result = Named(line, length, latest).read(LogfmtFields(line, length));
    else
        result = ReadWords(line, length, latest);
    if (result.isEntry)
        return result;
    ForeignLine none;
    none.message = {0, length};
    return none;
}

bool ForeignLine::IsJournalExport(char const* text, int length)
{
    constexpr char const start[] = "__CURSOR=";
    constexpr auto size = static_cast<int>(sizeof start) - 1;
    return length >= size && std::memcmp(text, start, size) == 0;
}

QString ForeignLine::EpochText(char const* number, int length)
{
    const qint64 milliseconds = EpochOf(number, length);
    if (milliseconds < 0)
        return QString();
    return QLocale::c().toString(QDateTime::fromMSecsSinceEpoch(milliseconds),
                                 QStringLiteral("yyyy-MM-dd hh:mm:ss.zzz"));
}

} // namespace Velocor
