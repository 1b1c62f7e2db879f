// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/runninglog/LogHealth.h"

#include "app/runninglog/InstanceList.h"
#include "app/runninglog/RunningLog.h"
#include "common/log/TorkLog.h"

#include <QCoreApplication>
#include <QFileInfo>
#include <QObject>
#include <QStorageInfo>
#include <QStringList>
#include <QVariant>

namespace Velocor {

LogHealth::LogHealth() = default;

LogHealth::~LogHealth() = default;

QString LogHealth::Check()
{
    const QString problem = writingProblem();
    return problem.isEmpty() ? sharingProblem() : problem;
}

QString LogHealth::writingProblem()
{
    TorkLog* log = TorkLog::logger();
    if (!log)
        return QObject::tr("There is no log");
    if (!log->enabled())
        return QObject::tr("Logging is off");

    // The log keeps the error text of its last failure even after a later success.
    const QFileInfo file(RunningLog::FileName());
    const bool usable = file.isFile() && file.isWritable();
    if (!log->errorString().isEmpty() && !usable)
        return QObject::tr("Cannot write the log: %1").arg(log->errorString());
    if (file.exists() && !usable)
        return QObject::tr("Cannot write the log: %1 is not writable").arg(file.filePath());

    // Where there is no limit, both are 0.
    const QStorageInfo storage(file.path());
    if (storage.bytesTotal() > 0 && storage.bytesAvailable() == 0)
        return QObject::tr("Cannot write the log: the disk is full");
    return QString();
}

QString LogHealth::sharingProblem()
{
    const QString logFile = RunningLog::FileName();
    if (!m_instances || m_logFile != logFile) {
        m_logFile = logFile;
        m_instances = std::make_unique<InstanceList>(
            QCoreApplication::instance()->property("DataPath").toString() +
            QLatin1String("running-") + QFileInfo(logFile).fileName());
    }

    QStringList numbers;
    const QList<qint64> others = m_instances->Others();
    for (qint64 number : others)
        numbers.append(QString::number(number));
    if (numbers.isEmpty())
        return QString();
    const QString text =
        numbers.size() == 1
            ? QObject::tr("Another running program writes to the same log (process %1)")
            : QObject::tr("Other running programs write to the same log (processes %1)");
    return text.arg(numbers.join(QLatin1String(", ")));
}

} // namespace Velocor
