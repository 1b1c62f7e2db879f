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
    /// A code block, fenced so that no line ends it.
    static QString Markdown(LogModel const& model, QList<int> const& rows);

    /// RFC 4180, with the names of the columns in the first line.
    static QString Csv(LogModel const& model, QList<int> const& rows);
};

} // namespace Velocor
