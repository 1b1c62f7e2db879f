// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QByteArray>
#include <QStringList>

namespace Velocor {

/// The program's own arguments.
///
/// It prints nothing and ends nothing: the exit code is always that of the event loop.
class CommandLine
{
public:
    /// @param arguments  the program's name, and the arguments that Qt has not taken
    explicit CommandLine(QStringList const& arguments);

    /// The files to open, as absolute paths. "-" is standard input; it is listed once at most.
    QStringList const& files() const { return m_files; }

    /// The text that --help or --version asks for, including its line end; otherwise empty.
    QByteArray const& answer() const { return m_answer; }

    /// What is wrong with the arguments, one line each; empty if nothing is. At most a few
    /// kilobytes.
    QByteArray const& complaints() const { return m_complaints; }

private:
    QStringList m_files;
    QByteArray m_answer;
    QByteArray m_complaints;
};

} // namespace Velocor
