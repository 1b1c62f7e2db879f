// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/LogMark.h"

#include <QObject>
#include <QString>
#include <QVector>

#include <atomic>

namespace Velocor {

/// Finds marked lines again after their file has changed, in its own thread and with its own file
/// handle.
///
/// SetCurrentRequest() with a later number cancels an earlier request, and may be called from any
/// thread, everything else only from the finder's.
class LogMarkFinder : public QObject
{
    Q_OBJECT

public:
    explicit LogMarkFinder(QObject* parent = nullptr);

    /// Makes earlier requests obsolete.
    void SetCurrentRequest(int request) { m_currentRequest = request; }

public Q_SLOTS:
    /// Reads a file to its end, and emits found() with the same marks in the same order, unless the
    /// request becomes obsolete.
    void Find(int request, Velocor::LogSource const& source, QVector<Velocor::LogMark> const& marks,
              Velocor::LogFileType const& type = Velocor::LogFileType());

Q_SIGNALS:
    void found(int request, QVector<Velocor::LogMark> const& marks);

private:
    std::atomic<int> m_currentRequest{0};
};

} // namespace Velocor
