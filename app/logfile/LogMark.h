// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/LogFileType.h"
#include "app/logfile/LogSource.h"

#include <QByteArray>
#include <QMetaType>
#include <QString>
#include <QVector>

namespace Velocor {

/// A mark on a line of a log file, with a note.
///
/// The line is known by its content, not by its number or place: the log writes over its file from
/// the start. Of equal lines, the one between the same neighbors is meant, or else the one nearest
/// to the former place. A plain value.
struct LogMark
{
    QByteArray line;  ///< the identity of the line, see IdentityOf()
    QByteArray above; ///< that of the line above; empty if there is none
    QByteArray below; ///< that of the line below; empty if there is none
    qint64 start = 0; ///< where the line starts in the file, or started
    bool isFound = false;
    QString note;

    /// What distinguishes a line from others: its length and a checksum.
    static QByteArray IdentityOf(QByteArray const& line);

    /// The mark of the line that starts there, in a regular file; of an empty line if the file
    /// cannot be read.
    static LogMark Of(LogSource const& source, qint64 start,
                      LogFileType const& type = LogFileType());

    /// How many characters of a note are kept.
    static constexpr int MaximumNote = 1000;

    /// How many marks a file may have.
    static constexpr int MaximumMarks = 200;
};

} // namespace Velocor

Q_DECLARE_METATYPE(Velocor::LogMark)
