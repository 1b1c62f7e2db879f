// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/OlderLogFiles.h"

#include <QMetaType>
#include <QString>

#include <memory>
#include <utility>
#include <vector>

namespace Velocor {

/// Where the bytes of a log are: in a file, which may be preceded by older ones, or in several such
/// logs. A plain value.
///
/// Of several logs, each has LogSize offsets of its own, so that its lines keep theirs while other
/// logs grow. Between two logs, there are offsets without bytes.
struct LogSource
{
    /// A file of a log, and where it starts among all bytes.
    struct File
    {
        QString path;
        qint64 start = 0;
    };

    /// The number of offsets for each of several logs.
    static constexpr qint64 LogSize = qint64(1) << 44;

    LogSource() = default;

    /// Implicit, because most logs are read from one file.
    // cppcheck-suppress noExplicitConstructor
    LogSource(QString file) : path(std::move(file)) {} // NOLINT(google-explicit-constructor)

    LogSource(QString file, std::shared_ptr<OlderLogFiles const> files)
        : path(std::move(file)), older(std::move(files))
    {}

    QString path;
    std::shared_ptr<OlderLogFiles const> older; ///< null if there are none

    /// Several logs instead of these files; null if there is only one.
    std::shared_ptr<std::vector<LogSource> const> logs;

    /// Where the file itself starts among all bytes.
    qint64 start() const { return older ? older->size() : 0; }

    /// Which of several logs has this offset; 0 if there is only one.
    size_t LogAt(qint64 offset) const
    {
        return logs && offset >= 0 ? static_cast<size_t>(offset / LogSize) : 0;
    }

    /// All files, in the order of their bytes.
    std::vector<File> Files() const;

    /// The file that has this byte.
    File FileAt(qint64 offset) const;

    bool operator==(LogSource const& other) const
    {
        return path == other.path && older == other.older && logs == other.logs;
    }
    bool operator!=(LogSource const& other) const { return !(*this == other); }
};

} // namespace Velocor

Q_DECLARE_METATYPE(Velocor::LogSource)
