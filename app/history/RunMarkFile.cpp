// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/history/RunMarkFile.h"

#include "app/history/HistoryTime.h"

#include <QDateTime>
#include <QDir>
#include <QFile>
#include <QSysInfo>

#include <cstdlib>
#include <fcntl.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <unistd.h>

namespace Velocor {

namespace {

constexpr qint64 Minute = 60000; // milliseconds

// Between taking the time and writing it. The computer may be busy.
constexpr qint64 LongestWrite = 30000; // milliseconds

QByteArray HostName()
{
    return QSysInfo::machineHostName().toUtf8().simplified().replace(' ', '-');
}

// Unlike other times of a file, nobody can set it. Programs that restore backups cannot, either.
qint64 ChangeTime(struct stat const& status)
{
#ifdef __APPLE__
    timespec const& time = status.st_ctimespec;
#else
    timespec const& time = status.st_ctim;
#endif
    return static_cast<qint64>(time.tv_sec) * 1000 + time.tv_nsec / 1000000;
}

QByteArray FileNumber(struct stat const& status)
{
    return QByteArray::number(static_cast<qulonglong>(status.st_ino));
}

bool IsLocked(int file)
{
    if (::flock(file, LOCK_SH | LOCK_NB) != 0)
        return true;
    ::flock(file, LOCK_UN);
    return false;
}

} // namespace

RunMarkFile::RunMarkFile(QString const& path)
{
    // Opening a pipe would block.
    const int file = ::open(QFile::encodeName(path).constData(), O_RDONLY | O_NONBLOCK | O_CLOEXEC);
    if (file < 0)
        return;
    read(file);
    ::close(file);
}

void RunMarkFile::read(int file)
{
    struct stat status = {};
    if (::fstat(file, &status) != 0 || !S_ISREG(status.st_mode))
        return;
    const qint64 changed = ChangeTime(status);
    m_isNew = std::llabs(QDateTime::currentMSecsSinceEpoch() - changed) < Minute;

    QByteArray text(1024, '\0');
    const ssize_t size = ::read(file, text.data(), static_cast<size_t>(text.size()));
    text.resize(size > 0 ? static_cast<int>(size) : 0);
    const QByteArrayList parts = text.split(' ');
    if (parts.size() != 4 || !text.endsWith('\n'))
        return;
    m_start = HistoryTime::FromText(parts[0]);
    bool isNumber = false;
    const qint64 written = parts[1].toLongLong(&isNumber);
    if (m_start < 0 || !isNumber)
        m_start = -1;
    else if (IsLocked(file))
        m_state = Held;
    else if (parts[2] == FileNumber(status) && parts[3] == HostName() + '\n' &&
             std::llabs(changed - written) < LongestWrite)
        m_state = LeftBehind;
    else
        m_state = Doubtful;
}

QStringList RunMarkFile::NamesIn(QString const& folder)
{
    return QDir(folder).entryList({QStringLiteral("*.run")}, QDir::Files, QDir::Name);
}

QString RunMarkFile::NameFor(qint64 start)
{
    return QStringLiteral("%1-%2.run").arg(start).arg(::getpid());
}

QByteArray RunMarkFile::TextFor(qint64 start, int file)
{
    struct stat status = {};
    ::fstat(file, &status);
    return HistoryTime::Text(start) + ' ' +
           QByteArray::number(QDateTime::currentMSecsSinceEpoch()) + ' ' + FileNumber(status) +
           ' ' + HostName() + '\n';
}

} // namespace Velocor
