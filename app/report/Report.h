// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/report/Redactor.h"
#include "app/report/ReportPart.h"

#include <QList>
#include <QString>

#include <vector>

namespace Velocor {

/// A report with placeholders: `report.md` and its files, as they will be saved. One thread at a
/// time.
///
///     Report report(parts, redactor);
///     const QString error = report.Save("/home/ada/report.zip");
class Report
{
public:
    struct File
    {
        QString name;
        Redactor::Text content;
    };

    /// @param parts  those that the report is to have
    Report(QList<ReportPart> const& parts, Redactor& redactor);

    /// `report.md` first.
    std::vector<File> const& files() const { return m_files; }

    /// How many secrets of each kind have been replaced, and in how many places; not which ones. In
    /// Markdown.
    static QString Replaced(std::vector<File> const& files, Redactor const& redactor);

    /// Writes the report: into one file if the name ends in ".zip", else into a new folder.
    ///
    /// @param path  a file is replaced; a folder must not exist or must be empty
    /// @return the reason for a failure; empty on success
    QString Save(QString const& path) const;

private:
    QString saveFolder(QString const& path) const;

    std::vector<File> m_files;
};

} // namespace Velocor
