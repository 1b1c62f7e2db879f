// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/LogBytes.h"
#include "app/logfile/LogFileType.h"

#include <QString>
#include <QThread>
#include <QVector>

class QFileInfo;
class QSaveFile;

namespace Velocor {

/// Saves lines of a log to another file, byte by byte, in a thread of its own.
///
/// The other file is replaced only when all lines have been written; if that fails, it is left
/// unchanged. The destructor cancels and waits.
///
///     auto* saver = new LineSaver(log, starts, parser.fileType(), target, this);
///     connect(saver, &QThread::finished, this, [saver] { show(saver->error()); });
///     saver->start();
class LineSaver : public QThread
{
    Q_OBJECT

public:
    /// @param starts  where the lines start in the file, in the order in which they are saved
    /// @param type  how lines end
    LineSaver(LogSource const& source, QVector<qint64> const& starts, LogFileType const& type,
              QString const& target, QObject* parent = nullptr);
    ~LineSaver() override;

    QString const& target() const { return m_target; }

    /// The number of lines saved, once the thread has finished.
    int count() const { return m_starts.size(); }

    /// Why nothing was saved, once the thread has finished; empty on success.
    QString const& error() const { return m_error; }

Q_SIGNALS:
    /// At most a hundred times.
    void progressed(int percent);

protected:
    void run() override;

private:
    QString save();
    bool isSource(QFileInfo const& target) const;
    QString copyLine(LogBytes& from, qint64 start, QSaveFile& to) const;

    LogSource m_source;
    QString m_target;
    QVector<qint64> m_starts;
    LogLineEnd m_lineEnd;
    QString m_error;
};

} // namespace Velocor
