// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QByteArray>
#include <QString>
#include <QStringList>

namespace Velocor {

/// `velocor-log report`: saves a report of the window's program, which need not be able to start.
class ReportCommand
{
public:
    /// Makes the report.
    ///
    /// @param arguments  the first one is "report"
    explicit ReportCommand(QStringList const& arguments);

    /// The path of the report, or the help; with a line feed.
    QByteArray const& answer() const { return m_answer; }

    /// Why there is no report, for users; empty if there is.
    QString const& error() const { return m_error; }

private:
    void save(QString const& path, QStringList const& without, QStringList const& words);

    QByteArray m_answer;
    QString m_error;
};

} // namespace Velocor
