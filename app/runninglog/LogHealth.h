// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QObject>
#include <QString>
#include <QStringList>

#include <memory>

class QFileSystemWatcher;

namespace Velocor {

class InstanceList;

/// Checks whether the log is reliable: enabled, writable, and not shared with other programs.
///
///     LogHealth health;
///     statusLabel->setText(health.Check());
class LogHealth : public QObject
{
    Q_OBJECT

public:
    LogHealth();
    ~LogHealth() override;

    /// The current problem, in one sentence; empty if there is none. Accesses the disk. From then
    /// on, mayHaveChanged() is sent; needs an event loop for that.
    QString Check();

Q_SIGNALS:
    /// The log file, its folder or the list of programs has changed. Nothing tells of a disk that
    /// fills up, of a program that was killed, and of a log that is switched off.
    void mayHaveChanged();

private:
    void watch();
    static QString writingProblem();
    static QString instancesFolder(QString const& logFile);
    QString sharingProblem();

    std::unique_ptr<InstanceList> m_instances;
    QString m_logFile;
    QStringList m_watched;
    QFileSystemWatcher* m_watcher = nullptr;
};

} // namespace Velocor
