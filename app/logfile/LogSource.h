// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/OlderLogFiles.h"

#include <QMetaType>
#include <QString>

#include <memory>
#include <utility>

namespace Velocor {

/// Where the bytes of a log are: in a file, which may be preceded by older ones. A plain value.
struct LogSource
{
    LogSource() = default;

    /// Implicit, because most logs are read from one file.
    // cppcheck-suppress noExplicitConstructor
    LogSource(QString file) : path(std::move(file)) {} // NOLINT(google-explicit-constructor)

    LogSource(QString file, std::shared_ptr<OlderLogFiles const> files)
        : path(std::move(file)), older(std::move(files))
    {}

    QString path;
    std::shared_ptr<OlderLogFiles const> older; ///< null if there are none

    /// Where the file itself starts among all bytes.
    qint64 start() const { return older ? older->size() : 0; }

    bool operator==(LogSource const& other) const
    {
        return path == other.path && older == other.older;
    }
    bool operator!=(LogSource const& other) const { return !(*this == other); }
};

} // namespace Velocor

Q_DECLARE_METATYPE(Velocor::LogSource)
