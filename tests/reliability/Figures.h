// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QByteArray>
#include <QString>

#include <cstdio>

/// What a proof measured, and how much of it is asked for.
namespace Figures {

/// Prints the one line that tells what was proved: "sudden death: 60 kills, ...".
inline void print(QString const& line)
{
    std::printf("%s\n", qPrintable(line));
    std::fflush(stdout);
}

/// How often to try: the number in this environment variable, or else the usual one.
inline int wanted(char const* variable, int usual)
{
    bool isNumber = false;
    const int number = qgetenv(variable).toInt(&isNumber);
    return isNumber && number > 0 ? number : usual;
}

} // namespace Figures
