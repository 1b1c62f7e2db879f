// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QString>

#include <memory>

namespace Velocor {

class InstanceList;

/// Checks whether the log is reliable: enabled, writable, and not shared with other programs.
///
///     LogHealth health;
///     statusLabel->setText(health.Check());
class LogHealth
{
public:
    LogHealth();
    ~LogHealth();

    /// The current problem, in one sentence; empty if there is none. Accesses the disk.
    QString Check();

private:
    static QString writingProblem();
    QString sharingProblem();

    std::unique_ptr<InstanceList> m_instances;
    QString m_logFile;
};

} // namespace Velocor
