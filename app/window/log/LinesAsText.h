// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QList>
#include <QString>

namespace Velocor {

class LogModel;

/// Lines of a log in formats of other programs. Headings are left out, and a line is whole however
/// long it is shown. GUI thread.
class LinesAsText
{
public:
    /// The entries that rows belong to, as stored in the file.
    ///
    /// @param limit  the maximum number of lines
    /// @param count  set to the number of lines in the text
    static QString Entries(LogModel const& model, QList<int> const& rows, int limit, int& count);

    /// A code block, fenced so that no line ends it.
    static QString Markdown(LogModel const& model, QList<int> const& rows);

    /// RFC 4180, with the names of the columns in the first line.
    static QString Csv(LogModel const& model, QList<int> const& rows);
};

} // namespace Velocor
