// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/logfile/LevelNames.h"

#include <QByteArray>

#include <cstring>

namespace Velocor {

namespace {

struct Level
{
    char const* name; // upper case
    LogEntry::Severity severity;
    bool isEveryday;
};

constexpr Level Levels[] = {
    {"EMERG", LogEntry::Fatal, false},
    {"EMERGENCY", LogEntry::Fatal, true},
    {"PANIC", LogEntry::Fatal, true},
    {"ALERT", LogEntry::Fatal, true},
    {"CRIT", LogEntry::Fatal, false},
    {"CRITICAL", LogEntry::Fatal, false},
    {"FATAL", LogEntry::Fatal, false},
    {"ERROR", LogEntry::Error, false},
    {"ERR", LogEntry::Error, false},
    {"SEVERE", LogEntry::Error, true},
    {"WARNING", LogEntry::Warning, false},
    {"WARN", LogEntry::Warning, false},
    {"WRN", LogEntry::Warning, false},
    {"NOTIFICATION", LogEntry::Notification, false},
    {"NOTICE", LogEntry::Notification, true},
    {"NOTE", LogEntry::Notification, true},
    {"INFO", LogEntry::Notification, false},
    {"INF", LogEntry::Notification, false},
    {"INFORMATION", LogEntry::Notification, true},
    {"INFORMATIONAL", LogEntry::Notification, false},
    {"LOG", LogEntry::Notification, true},
    {"SUCCESS", LogEntry::Notification, true},
    {"CONFIG", LogEntry::Notification, true},
    {"DEBUG", LogEntry::Trace, false},
    {"DEBUG1", LogEntry::Trace, false},
    {"DEBUG2", LogEntry::Trace, false},
    {"DEBUG3", LogEntry::Trace, false},
    {"DEBUG4", LogEntry::Trace, false},
    {"DEBUG5", LogEntry::Trace, false},
    {"DBG", LogEntry::Trace, false},
    {"TRACE", LogEntry::Trace, false},
    {"TRC", LogEntry::Trace, false},
    {"VERBOSE", LogEntry::Trace, false},
    {"FINE", LogEntry::Trace, true},
    {"FINER", LogEntry::Trace, true},
    {"FINEST", LogEntry::Trace, true},
};

// The letters of several loggers; none of them uses one for something else.
constexpr Level Letters[] = {
    {"F", LogEntry::Fatal, false},        {"A", LogEntry::Fatal, false},
    {"C", LogEntry::Fatal, false},        {"E", LogEntry::Error, false},
    {"W", LogEntry::Warning, false},      {"I", LogEntry::Notification, false},
    {"N", LogEntry::Notification, false}, {"D", LogEntry::Trace, false},
    {"T", LogEntry::Trace, false},        {"V", LogEntry::Trace, false},
};

constexpr Level Symbols[] = {
    {"EE", LogEntry::Error, false},        {"WW", LogEntry::Warning, false},
    {"II", LogEntry::Notification, false}, {"!!", LogEntry::Notification, false},
    {"**", LogEntry::Notification, false}, {"==", LogEntry::Notification, false},
    {"--", LogEntry::Notification, false}, {"++", LogEntry::Notification, false},
    {"NI", LogEntry::Notification, false}, {"\?\?", LogEntry::Notification, false},
};

constexpr LogEntry::Severity Priorities[] = {
    LogEntry::Fatal,   LogEntry::Fatal,        LogEntry::Fatal,        LogEntry::Error,
    LogEntry::Warning, LogEntry::Notification, LogEntry::Notification, LogEntry::Trace,
};

constexpr bool IsLower(char c)
{
    return c >= 'a' && c <= 'z';
}

// Only ASCII, in every locale.
bool IsSame(char const* name, int length, char const* upper, bool anyCase)
{
    for (int i = 0; i < length; ++i) {
        const char c =
            anyCase && IsLower(name[i]) ? static_cast<char>(name[i] - 'a' + 'A') : name[i];
        if (upper[i] != c || c == '\0')
            return false;
    }
    return upper[length] == '\0';
}

template <size_t Count>
Level const* Find(Level const (&levels)[Count], char const* name, int length, bool anyCase)
{
    for (Level const& level : levels) {
        if (IsSame(name, length, level.name, anyCase))
            return &level;
    }
    return nullptr;
}

LogEntry::Severity SeverityOf(Level const* level)
{
    return level ? level->severity : LogEntry::None;
}

} // namespace

LogEntry::Severity LevelNames::Named(char const* name, int length, Match match)
{
    return SeverityOf(Find(Levels, name, length, match == Match::AnyCase));
}

bool LevelNames::IsEveryday(char const* name, int length)
{
    Level const* level = Find(Levels, name, length, true);
    return level && level->isEveryday;
}

LogEntry::Severity LevelNames::OfLetter(char letter)
{
    return SeverityOf(Find(Letters, &letter, 1, false));
}

LogEntry::Severity LevelNames::OfSymbol(char const* symbol, int length)
{
    return SeverityOf(Find(Symbols, symbol, length, false));
}

LogEntry::Severity LevelNames::OfPriority(qint64 priority)
{
    return priority >= 0 && priority <= 7 ? Priorities[priority] : LogEntry::None;
}

LogEntry::Severity LevelNames::OfNumber(qint64 number)
{
    if (number < 10)
        return OfPriority(number);
    constexpr LogEntry::Severity tens[] = {LogEntry::Trace,        LogEntry::Trace,
                                           LogEntry::Notification, LogEntry::Warning,
                                           LogEntry::Error,        LogEntry::Fatal};
    return number < 70 ? tens[number / 10 - 1] : LogEntry::None;
}

} // namespace Velocor
