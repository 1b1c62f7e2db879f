// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/log/TorkLogPlace_p.h"

#ifdef Q_OS_UNIX

#include <QFile>

#include <cerrno>
#include <fcntl.h>
#include <sys/ioctl.h>
#include <sys/stat.h>
#include <unistd.h>

namespace {

bool IsLogType(struct stat const& status)
{
    // A directory is left to QFile, whose error text says what is wrong.
    return S_ISREG(status.st_mode) || S_ISCHR(status.st_mode) || S_ISDIR(status.st_mode);
}

// Locks of this kind belong to the process, so that they also work between parent and child.
bool SetLock(QFileDevice const& file, short type)
{
    struct flock whole = {};
    whole.l_type = type;
    whole.l_whence = SEEK_SET;
    return ::fcntl(file.handle(), F_SETLK, &whole) == 0 || (errno != EAGAIN && errno != EACCES);
}

} // namespace

bool TorkLogPlace::MayBeLog(QString const& fileName)
{
    struct stat status = {};
    return ::stat(QFile::encodeName(fileName).constData(), &status) != 0 || IsLogType(status);
}

bool TorkLogPlace::MayBeLog(QFileDevice const& file)
{
    struct stat status = {};
    return ::fstat(file.handle(), &status) != 0 || IsLogType(status);
}

bool TorkLogPlace::IsRegular(QFileDevice const& file)
{
    struct stat status = {};
    return ::fstat(file.handle(), &status) == 0 && S_ISREG(status.st_mode);
}

void TorkLogPlace::SetAppending(QFileDevice const& file, bool appends)
{
    const int flags = ::fcntl(file.handle(), F_GETFL);
    const int wanted = appends ? flags | O_APPEND : flags & ~O_APPEND;
    if (flags != -1 && wanted != flags)
        ::fcntl(file.handle(), F_SETFL, wanted);
}

qint64 TorkLogPlace::Size(QFileDevice const& file)
{
#ifdef STATX_SIZE
    struct statx some = {};
    if (::statx(file.handle(), "", AT_EMPTY_PATH, STATX_SIZE, &some) == 0)
        return static_cast<qint64>(some.stx_size);
#endif
    struct stat status = {};
    return ::fstat(file.handle(), &status) == 0 ? qint64(status.st_size) : 0;
}

int TorkLogPlace::Write(QFileDevice const& file, char const* bytes, int length)
{
    const auto written = ::write(file.handle(), bytes, static_cast<size_t>(length));
    return written < 0 ? 0 : static_cast<int>(written);
}

bool TorkLogPlace::IsAtEnd(QFileDevice const& file)
{
#ifdef Q_OS_LINUX
    // How many bytes follow the position, in one call that moves nothing.
    int following = 0;
    if (::ioctl(file.handle(), FIONREAD, &following) == 0)
        return following == 0;
#endif
    return Position(file) == Size(file);
}

qint64 TorkLogPlace::Position(QFileDevice const& file)
{
    return ::lseek(file.handle(), 0, SEEK_CUR);
}

bool TorkLogPlace::KeepOthersOut(QFileDevice const& file)
{
    return SetLock(file, F_WRLCK);
}

void TorkLogPlace::LetOthersIn(QFileDevice const& file)
{
    SetLock(file, F_UNLCK);
}

#else

bool TorkLogPlace::MayBeLog(QString const&)
{
    return true;
}

bool TorkLogPlace::MayBeLog(QFileDevice const&)
{
    return true;
}

bool TorkLogPlace::IsRegular(QFileDevice const&)
{
    return false; // there entries are not placed among those of other programs
}

void TorkLogPlace::SetAppending(QFileDevice const&, bool) {}

int TorkLogPlace::Write(QFileDevice const&, char const*, int)
{
    return 0;
}

qint64 TorkLogPlace::Size(QFileDevice const& file)
{
    return file.size();
}

bool TorkLogPlace::IsAtEnd(QFileDevice const&)
{
    return false;
}

qint64 TorkLogPlace::Position(QFileDevice const&)
{
    return -1;
}

bool TorkLogPlace::KeepOthersOut(QFileDevice const&)
{
    return true;
}

void TorkLogPlace::LetOthersIn(QFileDevice const&) {}

#endif
