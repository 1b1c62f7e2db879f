// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QString>

#include <memory>

namespace Velocor {

class InstanceList;

/// Whether the program's log can be relied on: it is on, can be written, and is nobody else's too.
///
///     LogHealth health;
///     statusLabel->setText(health.Check());
class LogHealth
{
public:
    LogHealth();
    ~LogHealth();

    /// What is wrong at the moment, in one sentence; empty if all is well. Looks at the disk.
    QString Check();

private:
    static QString writingProblem();
    QString sharingProblem();

    std::unique_ptr<InstanceList> m_instances;
    QString m_logFile;
};

} // namespace Velocor
