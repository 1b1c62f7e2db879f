// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// How a configuration file is replaced in one step.
//
//     viewer.cfg          the old file
//     viewer.cfg.saving   the new one, while it is written; renamed over the old one once it is
//                         complete and on disk
//
// QSaveFile would do most of it, but changes the file's owner, does not sync the folder, and leaves
// another randomly named file each time the program is killed. One fixed name avoids that, and a
// lock on it distinguishes a leftover from a save in progress.

#include "common/config/TorkConfigFile.h"

#include "common/log/TorkEmptyText_p.h"

#include <QDeadlineTimer>
#include <QFile>
#include <QObject>
#include <QSaveFile>
#include <QThread>

#ifdef Q_OS_UNIX
#include <cerrno>
#include <cstdio>
#include <fcntl.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <unistd.h>
#endif

namespace {

struct Outcome
{
    QString failure;        // empty on success
    QString inPlaceBecause; // empty if the file was replaced
};

#ifdef Q_OS_UNIX

// Why a step failed: its errno, or 0 on success.
using Failure = int;

constexpr Failure Done = 0;

// Retries while a signal interrupts the call.
template <class Call>
auto Uninterrupted(Call call)
{
    auto result = call();
    while (result == -1 && errno == EINTR)
        result = call();
    return result;
}

Failure FailureOf(int result)
{
    return result == -1 ? errno : Done;
}

class Descriptor
{
public:
    Descriptor() = default;
    ~Descriptor() { Close(); }
    Descriptor(Descriptor const&) = delete;
    Descriptor& operator=(Descriptor const&) = delete;

    Failure Open(QByteArray const& path, int flags, mode_t mode = 0)
    {
        Close();
        m_descriptor = Uninterrupted([&] { return ::open(path, flags | O_CLOEXEC, mode); });
        return FailureOf(m_descriptor);
    }

    // False if another process or thread holds the lock. Without lock support in the file system,
    // it always succeeds.
    bool Lock() const
    {
        return FailureOf(Uninterrupted([&] { return ::flock(m_descriptor, LOCK_EX | LOCK_NB); })) !=
               EWOULDBLOCK;
    }

    int Number() const { return m_descriptor; }

private:
    void Close() const
    {
        if (m_descriptor != -1)
            ::close(m_descriptor);
    }

    int m_descriptor = -1;
};

// The folder that a path is in, with its slash; empty for the current one.
QByteArray FolderOf(QByteArray const& path)
{
    return path.left(path.lastIndexOf('/') + 1);
}

// Resolves all symbolic links. The links themselves are kept; the target of a dangling one is
// created later.
Failure Follow(QByteArray& path)
{
    const int maximum = 40; // as in the Linux kernel
    for (int links = 0; links <= maximum; ++links) {
        char target[4096];
        const ssize_t length = ::readlink(path, target, sizeof target);
        if (length == -1) // not a link, or missing
            return errno == EINVAL || errno == ENOENT ? Done : errno;
        if (length == sizeof target)
            return ENAMETOOLONG;
        const QByteArray next(target, static_cast<int>(length));
        path = next.startsWith('/') ? next : FolderOf(path) + next;
    }
    return ELOOP;
}

// Whether the name still refers to this file.
bool HasName(int descriptor, QByteArray const& path)
{
    struct stat file = {};
    struct stat named = {};
    return ::fstat(descriptor, &file) == 0 && ::lstat(path, &named) == 0 &&
           file.st_dev == named.st_dev && file.st_ino == named.st_ino;
}

// Syncs to disk. What cannot be synced, such as a device, is not an error.
Failure Sync(int descriptor)
{
#ifdef F_FULLFSYNC
    if (::fcntl(descriptor, F_FULLFSYNC) == 0)
        return Done;
#endif
    const Failure failure = FailureOf(Uninterrupted([descriptor] { return ::fsync(descriptor); }));
    return failure == EINVAL || failure == ENOTSUP ? Done : failure;
}

Failure Write(int descriptor, QByteArray const& bytes)
{
    int written = 0;
    while (written < bytes.size()) {
        const ssize_t more = Uninterrupted([&] {
            return ::write(descriptor, bytes.constData() + written,
                           static_cast<size_t>(bytes.size() - written));
        });
        if (more == -1)
            return errno;
        written += static_cast<int>(more);
    }
    return Sync(descriptor);
}

// Owner and group are kept if this user may give files to them. If the group cannot be kept, the
// new group gets no more rights than others have.
Failure KeepRights(int descriptor, struct stat const& old)
{
    struct stat file = {};
    if (::fstat(descriptor, &file) == -1)
        return errno;

    mode_t mode = old.st_mode & 0777U;
    const gid_t anyGroup = static_cast<gid_t>(-1);
    const uid_t anyUser = static_cast<uid_t>(-1);
    if (file.st_gid != old.st_gid && ::fchown(descriptor, anyUser, old.st_gid) == -1)
        mode &= ~static_cast<mode_t>(S_IRWXG) | ((mode & S_IRWXO) << 3U);
    if (file.st_uid != old.st_uid) // if that fails, this user owns the file from now on
        FailureOf(::fchown(descriptor, old.st_uid, anyGroup));
    return FailureOf(::fchmod(descriptor, mode));
}

// Removes the leftover of a save that was killed.
//
// @return EEXIST if another save is still writing it, ENOENT if it is gone by now
Failure RemoveLeftover(QByteArray const& path)
{
    struct stat status = {};
    if (::lstat(path, &status) == -1)
        return errno;

    Descriptor leftover; // locked until it is removed
    if (S_ISREG(status.st_mode)) {
        const Failure failure = leftover.Open(path, O_RDONLY | O_NOFOLLOW | O_NONBLOCK);
        if (failure)
            return failure;
        if (!leftover.Lock() || !HasName(leftover.Number(), path))
            return EEXIST;
    }
    return FailureOf(::unlink(path));
}

// Creates a file of this name and locks it. Waits a second for another save of the same file.
Failure Create(Descriptor& file, QByteArray const& path, mode_t mode)
{
    const QDeadlineTimer end(1000);
    while (!end.hasExpired()) {
        Failure failure = file.Open(path, O_WRONLY | O_CREAT | O_EXCL | O_NOFOLLOW, mode);
        // Before it is locked, another save may take it for a leftover.
        if (!failure && file.Lock() && HasName(file.Number(), path))
            return Done;
        if (failure && failure != EEXIST)
            return failure;

        failure = RemoveLeftover(path);
        if (failure && failure != EEXIST && failure != ENOENT)
            return failure;
        QThread::msleep(10);
    }
    return EAGAIN;
}

// A power failure leaves the old file or the new one in any case, so failing to sync the folder is
// not an error.
void SyncFolderOf(QByteArray const& path)
{
    Descriptor folder;
    if (!folder.Open(FolderOf(path) + ".", O_RDONLY | O_DIRECTORY))
        Sync(folder.Number());
}

// @param old  status of the existing file; null if there is none
Failure Replace(QByteArray const& path, QByteArray const& bytes, struct stat const* old)
{
    const QByteArray newPath = path + ".saving";
    Descriptor file;
    Failure failure = Create(file, newPath, old ? 0600 : 0666);
    if (failure)
        return failure;

    failure = Write(file.Number(), bytes);
    if (!failure && old)
        failure = KeepRights(file.Number(), *old);
    if (!failure)
        failure = FailureOf(::rename(newPath, path));
    if (failure)
        ::unlink(newPath);
    else
        SyncFolderOf(path);
    return failure;
}

// Whether the location prevents replacing the file: a folder that is not writable, has the sticky
// bit, or has a directory under the new file's name; a file that is itself a mount point; a name
// too long to append to.
bool IsAboutLocation(Failure failure)
{
    switch (failure) {
    case EACCES:
    case EPERM:
    case EROFS:
    case EBUSY:
    case EXDEV:
    case EISDIR:
    case ENAMETOOLONG:
        return true;
    default:
        return false;
    }
}

Failure WriteOver(int descriptor, QByteArray const& bytes)
{
    const Failure failure = FailureOf(Uninterrupted([&] { return ::ftruncate(descriptor, 0); }));
    return failure && failure != EINVAL ? failure : Write(descriptor, bytes);
}

// The outcome of a save that failed, or that had to write in place.
Outcome MakeOutcome(Failure failure, Failure inPlaceBecause = Done)
{
    return {failure ? qt_error_string(failure) : QString(),
            inPlaceBecause ? qt_error_string(inPlaceBecause) : QString()};
}

Outcome Save(QString const& fileName, QByteArray const& bytes)
{
    if (fileName.contains(QChar::Null))
        return MakeOutcome(EINVAL);
    QByteArray path = QFile::encodeName(fileName);
    Failure failure = Follow(path);
    if (failure)
        return MakeOutcome(failure);

    struct stat old = {};
    if (::stat(path, &old) == -1)
        return MakeOutcome(errno == ENOENT ? Replace(path, bytes, nullptr) : errno);

    // Opening a FIFO would block until it has a reader.
    if (!S_ISREG(old.st_mode) && !S_ISCHR(old.st_mode))
        return MakeOutcome(S_ISDIR(old.st_mode) ? EISDIR : EINVAL);

    // A file that may not be written is left untouched, even if its folder would allow replacing
    // it.
    Descriptor file;
    failure = file.Open(path, O_WRONLY | O_NONBLOCK);
    if (failure)
        return MakeOutcome(failure);

    const bool isDevice = S_ISCHR(old.st_mode);
    failure = isDevice ? ENODEV : Replace(path, bytes, &old);
    if (isDevice || IsAboutLocation(failure))
        return MakeOutcome(WriteOver(file.Number(), bytes), failure);
    return MakeOutcome(failure);
}

#else

Outcome Save(QString const& fileName, QByteArray const& bytes)
{
    QSaveFile file(fileName);
    const bool saved =
        file.open(QIODevice::WriteOnly) && file.write(bytes) == bytes.size() && file.commit();
    return {saved ? QString() : file.errorString(), QString()};
}

#endif

} // namespace

bool TorkConfigFile::SaveAtomically()
{
    if (m_fileName.length() < 2) // as in Save()
        return true;

    const Outcome outcome = ::Save(m_fileName, ToXml());
    if (!outcome.failure.isEmpty())
        m_lastError = QObject::tr("Unable to save %1: %2").arg(m_fileName, outcome.failure);
    else if (!outcome.inPlaceBecause.isEmpty())
        m_lastError = QObject::tr("%1 was written in place, as it cannot be replaced: %2")
                          .arg(m_fileName, outcome.inPlaceBecause);
    else
        m_lastError = TorkEmptyText();
    return outcome.failure.isEmpty();
}
