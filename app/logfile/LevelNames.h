// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/LogEntry.h"

namespace Velocor {

/// The severities of other programs, by name and by number. Pure, any thread.
namespace LevelNames {

/// How a name is found in a line.
enum class Match {
    AnyCase,  ///< "error", "Error", "ERROR"
    UpperCase ///< "ERROR" only, as in front of a message
};

/// The severity with this name; None if it is no name of a severity.
LogEntry::Severity Named(char const* name, int length, Match match = Match::AnyCase);

/// Whether the name is a word of everyday texts as well, such as "note" or "alert".
bool IsEveryday(char const* name, int length);

/// The severity of one letter, as in "E1122 14:03:02.123456"; None for other letters.
LogEntry::Severity OfLetter(char letter);

/// The severity of a symbol that X servers write in parentheses, as in "(EE)"; None for others.
LogEntry::Severity OfSymbol(char const* symbol, int length);

/// The severity of a syslog priority, 0 (emergency) to 7 (debug); None for other numbers.
LogEntry::Severity OfPriority(qint64 priority);

/// The severity of a number in JSON lines: a syslog priority, or 10 (trace) to 60 (fatal).
LogEntry::Severity OfNumber(qint64 number);

} // namespace LevelNames

} // namespace Velocor
