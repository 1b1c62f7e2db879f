// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QByteArray>
#include <QString>

#include <cstdio>

/// What a proof measured, and how large it was requested to be.
namespace Figures {

/// Prints the one line that reports what was proved: "sudden death: 60 kills, ...".
inline void print(QString const& line)
{
    std::printf("%s\n", qPrintable(line));
    std::fflush(stdout);
}

/// The number of rounds: from this environment variable, or else the usual one.
inline int wanted(char const* variable, int usual)
{
    bool isNumber = false;
    const int number = qgetenv(variable).toInt(&isNumber);
    return isNumber && number > 0 ? number : usual;
}

} // namespace Figures
