// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QString>

namespace Velocor {

class LogModel;

/// What a log view says about its rows. GUI thread.
class LogStateText
{
public:
    /// A short summary of the rows, for the status bar.
    ///
    /// @param percent  how much of the file has been read
    static QString Summary(LogModel const& model, int percent);

    /// What to show while there are no rows.
    ///
    /// @param percent  how much of the file has been read
    static QString Placeholder(LogModel const& model, int percent);
};

} // namespace Velocor
