// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/runninglog/LogHealth.h"

#include "app/language/LeftToRight.h"
#include "app/runninglog/InstanceList.h"
#include "app/runninglog/RunningLog.h"
#include "common/log/TorkLog.h"

#include <QCoreApplication>
#include <QFileInfo>
#include <QFileSystemWatcher>
#include <QObject>
#include <QStorageInfo>
#include <QStringList>
#include <QVariant>

namespace Velocor {

LogHealth::LogHealth() = default;

LogHealth::~LogHealth() = default;

QString LogHealth::Check()
{
    QString problem = writingProblem();
    if (problem.isEmpty())
        problem = sharingProblem();
    watch();
    return problem;
}

// A file that was replaced is no longer watched.
void LogHealth::watch()
{
    const QString logFile = RunningLog::FileName();
    const QStringList watched{logFile, QFileInfo(logFile).path(), instancesFolder(logFile)};
    if (!m_watcher) {
        m_watcher = new QFileSystemWatcher(this);
        connect(m_watcher, &QFileSystemWatcher::fileChanged, this, &LogHealth::mayHaveChanged);
        connect(m_watcher, &QFileSystemWatcher::directoryChanged, this, &LogHealth::mayHaveChanged);
    } else if (m_watched != watched) {
        m_watcher->removePaths(m_watcher->files() + m_watcher->directories());
    }
    m_watched = watched;
    const QStringList known = m_watcher->files() + m_watcher->directories();
    for (QString const& path : watched) {
        if (!known.contains(path) && QFileInfo::exists(path))
            m_watcher->addPath(path);
    }
}

QString LogHealth::instancesFolder(QString const& logFile)
{
    return QCoreApplication::instance()->property("DataPath").toString() +
           QLatin1String("running-") + QFileInfo(logFile).fileName();
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
        return QObject::tr("Cannot write the log: %1").arg(LeftToRight(log->errorString()));
    if (file.exists() && !usable)
        return QObject::tr("Cannot write the log: %1 is not writable")
            .arg(LeftToRight(file.filePath()));

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
        m_instances = std::make_unique<InstanceList>(instancesFolder(logFile));
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
