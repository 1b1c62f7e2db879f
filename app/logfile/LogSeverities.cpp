// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/logfile/LogSeverities.h"

#include <QObject>

#include <iterator>

namespace Velocor {

namespace {

// In the order of LogEntry::Severity. The context is the one that the log uses for translation.
constexpr char const* Names[] = {
    QT_TRANSLATE_NOOP("QObject", "Trace"),   QT_TRANSLATE_NOOP("QObject", "Notification"),
    QT_TRANSLATE_NOOP("QObject", "Warning"), QT_TRANSLATE_NOOP("QObject", "Error"),
    QT_TRANSLATE_NOOP("QObject", "Fatal"),   "",
};
static_assert(std::size(Names) == LogEntry::None + 1, "a name for each severity");

} // namespace

char const* LogSeverities::LoggedName(LogEntry::Severity severity)
{
    return Names[severity];
}

QString LogSeverities::Name(LogEntry::Severity severity)
{
    return severity == LogEntry::None ? QString() : QObject::tr(LoggedName(severity));
}

} // namespace Velocor
