// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/runninglog/InstanceList.h"

#include <QCoreApplication>
#include <QDir>
#include <QFileInfo>
#include <QLockFile>
#include <QStringList>

namespace Velocor {

namespace {

QString OwnName()
{
    return QString::number(QCoreApplication::applicationPid()) + QLatin1String(".lock");
}

} // namespace

InstanceList::InstanceList(QString const& folder) : m_folder(folder), m_ownName(OwnName())
{
    QDir().mkpath(m_folder);
    m_lock = std::make_unique<QLockFile>(m_folder + QLatin1Char('/') + m_ownName);
    m_lock->setStaleLockTime(0); // never stale: a program may run for weeks
    m_lock->tryLock(0);
}

InstanceList::~InstanceList()
{
    m_lock.reset();
    QDir().rmdir(m_folder); // fails if others are still using it
}

QList<qint64> InstanceList::Others() const
{
    QList<qint64> others;
    const QStringList names =
        QDir(m_folder).entryList({QStringLiteral("*.lock")}, QDir::Files, QDir::Name);
    for (QString const& name : names) {
        if (name == m_ownName || !QFileInfo(m_folder + QLatin1Char('/') + name).isFile())
            continue;
        QLockFile lock(m_folder + QLatin1Char('/') + name);
        lock.setStaleLockTime(0);
        if (lock.tryLock(0))
            continue; // stale; unlocking removes it
        if (lock.error() == QLockFile::LockFailedError)
            others.append(QFileInfo(name).completeBaseName().toLongLong());
    }
    return others;
}

} // namespace Velocor
