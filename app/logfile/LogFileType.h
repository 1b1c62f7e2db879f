// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/LogEncoding.h"

#include <QDate>
#include <QMetaType>

namespace Velocor {

class LogLineParser;

/// How a log file is to be read: whose format it has, and its encoding. A plain value; any thread.
///
/// This is decided once for a file, by its start, so that a line of the log's own that looks like
/// another program's is not split.
struct LogFileType
{
    LogEncoding encoding;   ///< never Automatic
    bool isForeign = false; ///< another program's; see ForeignLine
    bool isJournal = false; ///< a journal export: an empty line ends an entry
    bool isOwn = false;     ///< an entry of the log's own was found
    QDate latest;           ///< see ForeignStamp::Read()

    /// What the file seems to hold; its lines are shown in any case.
    enum Content { Text, Gzip, Xz, Bzip2, Zstd, Binary };
    Content content = Text;

    /// Where lines or, in a journal export, entries end.
    LogLineEnd lineEnd() const;

    /// Whether lines are split and decoded in the same way.
    bool IsLike(LogFileType const& other) const;

    /// Finds out how a file is to be read.
    ///
    /// An entry that has the log's own format and one of its severities decides; then lines that
    /// only another program can have written. A file without either is the log's own, or just text.
    /// An incomplete last line does not count.
    ///
    /// @param head  the first bytes of the file; HeadSize of them if it is longer
    /// @param parser  knows the log's own formats
    /// @param chosen  the encoding if the user chose one; otherwise Automatic, and the log's own
    ///                files are in Latin-1
    /// @param modified  when the file was written last
    static LogFileType Of(QByteArray const& head, LogLineParser const& parser, LogEncoding chosen,
                          QDate const& modified);

    /// What a file seems to hold. Compressed files are told by their first bytes, binary ones by
    /// their control characters.
    ///
    /// @param head  as for Of()
    static Content ContentOf(QByteArray const& head, LogEncoding encoding);

    /// How many bytes are looked at.
    static constexpr int HeadSize = 64 * 1024;
};

} // namespace Velocor

Q_DECLARE_METATYPE(Velocor::LogFileType)
