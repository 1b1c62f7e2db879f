// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QList>
#include <QString>

namespace Velocor {

/// A file of a report. A plain record.
struct ReportFile
{
    QString name; ///< within the report, with "/"
    QString text;
};

/// What can be in a report or not: a section of its main file, and further files. A plain record.
struct ReportPart
{
    QString title;
    QString text; ///< lines
    QList<ReportFile> files;
};

} // namespace Velocor
