// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/LogEntry.h"
#include "app/logfile/LogTimeReader.h"

#include <QByteArray>
#include <QString>
#include <QStringList>

#include <vector>

namespace Velocor {

/// Splits the lines of a log file: time stamp, severity name, elapsed time, message.
///
/// The date format is a setting that may have changed while the file was being written, so the
/// given formats are tried first; after that, any text with a digit counts as a time stamp if a
/// severity name follows it. Pure; any thread. File format: docs/log-file.md.
///
///     LogLineParser parser({"yyyy-MM-dd hh:mm:ss.z"}, {"dT:"});
///     LogEntry entry = parser.Parse(line);
class LogLineParser
{
public:
    /// Where the parts of a line are, in bytes from its start.
    struct Parts
    {
        int timeLength = 0;
        qint64 timeKey = -1; ///< see LogTimeReader::Stamp; -1 if the time is unknown
        bool hasDate = false;
        int resolution = 1; ///< see LogTimeReader::resolution()
        LogEntry::Severity severity = LogEntry::None;
        int elapsed = 0; ///< start of the elapsed milliseconds
        int elapsedLength = 0;
        int message = 0;
        bool isEntry = false;
    };

    /// A parser for the log's own defaults.
    LogLineParser();

    /// @param dateFormats  formats that entries may use, the likeliest first; the default
    ///                     format is always tried
    /// @param elapsedPrefixes  texts before the elapsed milliseconds, in the same way
    LogLineParser(QStringList const& dateFormats, QStringList const& elapsedPrefixes);

    /// Finds the parts of one line.
    ///
    /// @param line  in Latin-1, without its line end; for very long lines the start is enough
    Parts Find(char const* line, int length) const;

    /// Parses one line.
    LogEntry Parse(QByteArray const& line) const;

    /// The maximum length that Find() examines, in bytes.
    static constexpr int SearchLimit = 512;

private:
    struct Name
    {
        QByteArray text;
        LogEntry::Severity severity;
    };

    Name const* nameAt(char const* text, int length) const;
    bool findByFormat(char const* line, int length, Parts& parts) const;
    bool findByName(char const* line, int length, Parts& parts) const;
    void findElapsed(char const* line, int length, Parts& parts) const;

    std::vector<LogTimeReader> m_readers;
    std::vector<QByteArray> m_elapsedPrefixes;
    std::vector<Name> m_names;
};

} // namespace Velocor
