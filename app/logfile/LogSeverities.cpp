// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/logfile/LogSeverities.h"

#include <QCoreApplication>
#include <QObject>

#include <iterator>

namespace Velocor {

namespace {

// In the order of LogEntry::Severity. Not in the context in which the log translates them: logs of
// all languages read alike, and only what is shown is translated.
constexpr char const* Names[] = {
    QT_TRANSLATE_NOOP("Velocor::LogSeverities", "Trace"),
    QT_TRANSLATE_NOOP("Velocor::LogSeverities", "Notification"),
    QT_TRANSLATE_NOOP("Velocor::LogSeverities", "Warning"),
    QT_TRANSLATE_NOOP("Velocor::LogSeverities", "Error"),
    QT_TRANSLATE_NOOP("Velocor::LogSeverities", "Fatal"),
    "",
};
static_assert(std::size(Names) == LogEntry::None + 1, "a name for each severity");

} // namespace

char const* LogSeverities::LoggedName(LogEntry::Severity severity)
{
    return Names[severity];
}

QString LogSeverities::NameInLog(LogEntry::Severity severity)
{
    return severity == LogEntry::None ? QString() : QObject::tr(LoggedName(severity));
}

QString LogSeverities::Name(LogEntry::Severity severity)
{
    return severity == LogEntry::None
               ? QString()
               : QCoreApplication::translate("Velocor::LogSeverities", LoggedName(severity));
}

} // namespace Velocor
