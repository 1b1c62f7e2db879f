// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QString>
#include <QtGlobal>

namespace Velocor {

class LogModel;

/// What a log view says about its rows. GUI thread.
class LogStateText
{
public:
    /// A short summary of the rows, for the status bar.
    ///
    /// @param percent  how much of the file has been read
    /// @param row  the current row; -1 if there is none
    /// @param current  the number of its line in its file; 0 if there is none
    static QString Summary(LogModel const& model, int percent, int row, qulonglong current);

    /// Says that the file is not text, and how to read it; empty if it seems to be.
    static QString ContentNotice(LogModel const& model);

    /// What to show while there are no rows.
    ///
    /// @param percent  how much of the file has been read
    static QString Placeholder(LogModel const& model, int percent);
};

} // namespace Velocor
