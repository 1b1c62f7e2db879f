// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/InstanceList.h"

#include <QCoreApplication>
#include <QCryptographicHash>
#include <QDir>
#include <QFileInfo>
#include <QLockFile>
#include <QStringList>

namespace {

QString FolderFor(QString const& logFile)
{
    const QString path = QFileInfo(logFile).absoluteFilePath();
    const QByteArray hash =
        QCryptographicHash::hash(path.toUtf8(), QCryptographicHash::Sha1).toHex().left(20);
    return QDir::tempPath() + QLatin1String("/velocor-") + QString::fromLatin1(hash);
}

QString OwnName()
{
    return QString::number(QCoreApplication::applicationPid()) + QLatin1String(".lock");
}

} // namespace

InstanceList::InstanceList(QString const& logFile)
    : m_folder(FolderFor(logFile)), m_ownName(OwnName())
{
    QDir().mkpath(m_folder);
    m_lock = std::make_unique<QLockFile>(m_folder + QLatin1Char('/') + m_ownName);
    m_lock->setStaleLockTime(0); // a program may run for weeks; only its end frees its lock
    m_lock->tryLock(0);
}

InstanceList::~InstanceList()
{
    m_lock.reset();
    QDir().rmdir(m_folder); // stays if others are in it
}

QList<qint64> InstanceList::Others() const
{
    QList<qint64> others;
    const QStringList names =
        QDir(m_folder).entryList({QStringLiteral("*.lock")}, QDir::Files, QDir::Name);
    for (QString const& name : names) {
        if (name == m_ownName)
            continue;
        QLockFile lock(m_folder + QLatin1Char('/') + name);
        lock.setStaleLockTime(0);
        if (lock.tryLock(0))
            continue; // left behind; unlocking removes it
        if (lock.error() == QLockFile::LockFailedError)
            others.append(QFileInfo(name).completeBaseName().toLongLong());
    }
    return others;
}
