// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/LogEntry.h"
#include "app/logfile/LogFileType.h"
#include "app/logfile/LogTimeReader.h"

#include <QByteArray>
#include <QString>
#include <QStringList>

#include <array>
#include <vector>

namespace Velocor {

/// Splits the lines of a log file: time stamp, severity name, elapsed time, message.
///
/// The date format is a setting that may have changed while the file was being written, so the
/// given formats are tried first; after that, any text with a digit counts as a time stamp if a
/// severity name follows it. In a file that is another program's, ForeignLine comes first.
/// Pure; any thread. File format: docs/log-file.md.
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

    /// Sets the encoding that the user chose; Automatic, the default, leaves it to the file.
    void SetChosenEncoding(LogEncoding encoding) { m_chosenEncoding = encoding; }
    LogEncoding chosenEncoding() const { return m_chosenEncoding; }

    /// Says that the file is known to be the log's own, whatever its lines look like.
    void SetOwn(bool isOwn) { m_isOwn = isOwn; }
    bool isOwn() const { return m_isOwn; }

    /// Sets how the file is read. By default, lines are the log's own, in Latin-1.
    void SetFileType(LogFileType const& type) { m_type = type; }
    LogFileType const& fileType() const { return m_type; }

    /// Finds the parts of one line.
    ///
    /// @param line  as from LogEncoding::Narrow(), without its line end; for very long lines of the
    ///              log's own the start is enough
    Parts Find(char const* line, int length) const;

    /// How the last stamps began, by format. For one parser, and for one thread at a time.
    using Beginnings = std::vector<LogTimeReader::Beginning>;

    /// The same, faster for many lines, one after the other.
    ///
    /// @param last  empty before the first line
    Parts Find(char const* line, int length, Beginnings& last) const;

    /// Finds the parts of a line of the log's own, whatever the file is.
    Parts FindOwn(char const* line, int length) const;

    /// Parses one line, as stored in the file.
    LogEntry Parse(QByteArray const& line) const;

    /// The text of one line, as stored in the file.
    QString Text(QByteArray const& line) const;

    /// The maximum length of the log's own lines that Find() examines, in bytes.
    static constexpr int SearchLimit = 512;

private:
    class Name
    {
    public:
        Name(QByteArray const& name, LogEntry::Severity ofSeverity);
        bool IsAt(char const* at, int length) const;

        QByteArray text;
        LogEntry::Severity severity;

    private:
        using Words = std::array<quint64, 2>;

        // With the blank after it; zero if the name is longer.
        Words m_bytes = {};
        Words m_mask = {};
    };

    Name const* nameAt(char const* text, int length) const;
    Parts find(char const* line, int length, Beginnings* last) const;
    void findOwn(char const* line, int length, Beginnings* last, Parts& parts) const;
    bool findForeign(char const* line, int length, Parts& parts) const;
    bool findByFormat(char const* line, int length, Beginnings* last, Parts& parts) const;
    bool findByName(char const* line, int length, Parts& parts) const;
    bool mayBeElapsed(char first) const;
    void findElapsed(char const* line, int length, Parts& parts) const;
    bool parseForeign(char const* line, int length, LogEntry& entry) const;

    std::vector<LogTimeReader> m_readers;
    std::vector<QByteArray> m_elapsedPrefixes;
    std::vector<Name> m_names;
    std::array<quint8, 256> m_firstNames = {}; // by first byte: where in m_names to begin
    LogEncoding m_chosenEncoding = LogEncoding::Automatic;
    bool m_isOwn = false;
    LogFileType m_type;
};

} // namespace Velocor
