// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// A program's own definitions take precedence over those of the C library, so Qt calls these for
// its file operations. Each one either fails as requested or forwards the call.

#include "reliability/FaultyFiles.h"
#include "support/NextFunction.h"

#include <QFile>

#include <array>
#include <atomic>
#include <cerrno>
#include <climits>
#include <cstdarg>
#include <cstdio>
#include <cstring>
#include <dirent.h>
#include <fcntl.h>
#include <sys/file.h>
#include <sys/ioctl.h>
#include <sys/sendfile.h>
#include <sys/stat.h>
#include <sys/syscall.h>
#include <unistd.h>

namespace {

enum class Fault { None, Error, CutShort, DiskFull };

// Plain data without constructors: the calls begin before this program's static objects are
// constructed.
char s_folder[PATH_MAX];
std::atomic<Fault> s_fault{Fault::None};
int s_step;
int s_count;
bool s_lasts;
int s_error;
char const* s_name; // null: calls of any name
qint64 s_room;
char const* s_awaited;
int s_toAwait;
std::function<void()>* s_action;
bool s_reached;
bool s_strayed;
char const* s_call = "";
char s_path[PATH_MAX];

// The path below the folder, by its descriptor; empty for others.
constexpr int Descriptors = 4096;
std::array<std::array<char, 256>, Descriptors> s_open;

bool Concerns(char const* path)
{
    return s_folder[0] && path && std::strncmp(path, s_folder, std::strlen(s_folder)) == 0;
}

bool Concerns(int descriptor)
{
    return descriptor >= 0 && descriptor < Descriptors && s_open[descriptor][0];
}

char const* PathOf(int descriptor)
{
    return s_open[descriptor].data();
}

void Remember(int descriptor, char const* path)
{
    if (descriptor >= 0 && descriptor < Descriptors && Concerns(path))
        std::snprintf(s_open[descriptor].data(), s_open[descriptor].size(), "%s", path);
}

void Note(char const* call, char const* path)
{
    if (s_reached)
        return;
    s_reached = true;
    s_call = call;
    std::snprintf(s_path, sizeof s_path, "%s", path);
}

bool IsDue()
{
    ++s_count;
    return s_count == s_step || (s_lasts && s_count > s_step);
}

void ActBefore(char const* call)
{
    if (!s_awaited || std::strcmp(call, s_awaited) != 0 || --s_toAwait > 0)
        return;
    s_awaited = nullptr;
    const Fault fault = s_fault.exchange(Fault::None);
    (*s_action)();
    s_fault = fault;
}

// Whether the call is to fail; if so, errno is set.
bool Fails(char const* call, char const* path)
{
    if (!Concerns(path))
        return false;
    ActBefore(call);
    if (s_fault != Fault::Error || (s_name && std::strcmp(call, s_name) != 0) || !IsDue())
        return false;
    Note(call, path);
    errno = s_error;
    return true;
}

bool Fails(char const* call, int descriptor)
{
    return Concerns(descriptor) && Fails(call, PathOf(descriptor));
}

// How many of `length` bytes a call may write; -1 if it is to fail, in which case errno is set.
ssize_t Allowed(char const* call, int descriptor, size_t length)
{
    if (Fails(call, descriptor))
        return -1;

    const Fault fault = s_fault;
    if (!Concerns(descriptor) || length == 0)
        return static_cast<ssize_t>(length);
    if (fault == Fault::CutShort && length > 1 && IsDue()) {
        Note(call, PathOf(descriptor));
        return static_cast<ssize_t>(length / 2);
    }
    if (fault == Fault::DiskFull && static_cast<qint64>(length) > s_room) {
        Note(call, PathOf(descriptor));
        const qint64 room = s_room;
        s_room = 0;
        errno = ENOSPC;
        return room > 0 ? static_cast<ssize_t>(room) : -1;
    }
    if (fault == Fault::DiskFull)
        s_room -= static_cast<qint64>(length);
    return static_cast<ssize_t>(length);
}

void NoteStray(char const* path, int flags)
{
    if (s_fault != Fault::None && !Concerns(path) && (flags & O_ACCMODE) != O_RDONLY)
        s_strayed = true;
}

mode_t ModeOf(int flags, va_list arguments)
{
    const bool creates = (flags & O_CREAT) || (flags & O_TMPFILE) == O_TMPFILE;
    return creates ? va_arg(arguments, mode_t) : 0;
}

void Start(Fault fault, int step, bool lasts, int error, char const* name = nullptr)
{
    s_name = name;
    s_step = step;
    s_lasts = lasts;
    s_error = error;
    s_count = 0;
    s_reached = false;
    s_strayed = false;
    s_call = "";
    s_path[0] = '\0';
    s_fault = fault;
}

} // namespace

FaultyFiles::FaultyFiles(QString const& folder)
{
    std::snprintf(s_folder, sizeof s_folder, "%s", QFile::encodeName(folder).constData());
    Start(Fault::None, 0, false, 0);
}

FaultyFiles::~FaultyFiles()
{
    mend();
    s_awaited = nullptr;
    delete s_action;
    s_action = nullptr;
    s_folder[0] = '\0';
}

void FaultyFiles::failAt(int step, Duration duration, int error, char const* call)
{
    Start(Fault::Error, step, duration == FromThereOn, error, call);
}

void FaultyFiles::before(char const* call, int step, std::function<void()> const& action)
{
    delete s_action;
    s_action = new std::function<void()>(action);
    s_toAwait = step;
    s_awaited = call;
}

void FaultyFiles::cutShortAt(int step)
{
    Start(Fault::CutShort, step, false, 0);
}

void FaultyFiles::limitBytes(qint64 bytes)
{
    s_room = bytes;
    Start(Fault::DiskFull, 0, false, ENOSPC);
}

void FaultyFiles::mend()
{
    s_fault = Fault::None;
}

bool FaultyFiles::reached() const
{
    return s_reached;
}

bool FaultyFiles::strayed() const
{
    return s_strayed;
}

QString FaultyFiles::call() const
{
    return QString::fromLatin1(s_call);
}

QString FaultyFiles::path() const
{
    return QFile::decodeName(s_path);
}

extern "C" {

int open(char const* path, int flags, ...)
{
    ORIGINAL(open);
    va_list arguments;
    va_start(arguments, flags);
    const mode_t mode = ModeOf(flags, arguments);
    va_end(arguments);
    NoteStray(path, flags);
    if (Fails("open", path))
        return -1;
    const int descriptor = original(path, flags, mode);
    Remember(descriptor, path);
    return descriptor;
}

int open64(char const* path, int flags, ...)
{
    ORIGINAL(open64);
    va_list arguments;
    va_start(arguments, flags);
    const mode_t mode = ModeOf(flags, arguments);
    va_end(arguments);
    NoteStray(path, flags);
    if (Fails("open", path))
        return -1;
    const int descriptor = original(path, flags, mode);
    Remember(descriptor, path);
    return descriptor;
}

// As on the system, a descriptor is gone even when closing it fails.
int close(int descriptor)
{
    ORIGINAL(close);
    const bool fails = Fails("close", descriptor);
    if (Concerns(descriptor))
        s_open[descriptor][0] = '\0';
    const int result = original(descriptor);
    if (!fails)
        return result;
    errno = s_error;
    return -1;
}

ssize_t read(int descriptor, void* bytes, size_t length)
{
    ORIGINAL(read);
    return Fails("read", descriptor) ? -1 : original(descriptor, bytes, length);
}

ssize_t write(int descriptor, void const* bytes, size_t length)
{
    ORIGINAL(write);
    const ssize_t allowed = Allowed("write", descriptor, length);
    return allowed < 0 ? -1 : original(descriptor, bytes, static_cast<size_t>(allowed));
}

ssize_t sendfile(int to, int from, off_t* offset, size_t length) noexcept
{
    ORIGINAL(sendfile);
    struct stat source = {};
    // The calls of this function itself are not counted.
    const long position = syscall(SYS_lseek, from, 0, SEEK_CUR);
    size_t wanted = length;
    if (Concerns(to) && position >= 0 && syscall(SYS_fstat, from, &source) == 0)
        wanted = static_cast<size_t>(qMax<off_t>(0, source.st_size - position));
    const ssize_t allowed = Allowed("sendfile", to, wanted);
    return allowed < 0 ? -1 : original(to, from, offset, static_cast<size_t>(allowed));
}

off_t lseek(int descriptor, off_t offset, int from) noexcept
{
    ORIGINAL(lseek);
    return Fails("lseek", descriptor) ? -1 : original(descriptor, offset, from);
}

off64_t lseek64(int descriptor, off64_t offset, int from) noexcept
{
    ORIGINAL(lseek64);
    return Fails("lseek", descriptor) ? -1 : original(descriptor, offset, from);
}

// A test's files need not survive a crash of the machine: nothing waits for the disk.
int fsync(int descriptor)
{
    ORIGINAL(fsync);
    if (Concerns(descriptor))
        return Fails("fsync", descriptor) ? -1 : 0;
    return original(descriptor);
}

int fdatasync(int descriptor)
{
    ORIGINAL(fdatasync);
    if (Concerns(descriptor))
        return Fails("fdatasync", descriptor) ? -1 : 0;
    return original(descriptor);
}

int ftruncate(int descriptor, off_t length) noexcept
{
    ORIGINAL(ftruncate);
    return Fails("ftruncate", descriptor) ? -1 : original(descriptor, length);
}

int ftruncate64(int descriptor, off64_t length) noexcept
{
    ORIGINAL(ftruncate64);
    return Fails("ftruncate", descriptor) ? -1 : original(descriptor, length);
}

int rename(char const* from, char const* to) noexcept
{
    ORIGINAL(rename);
    return Fails("rename", from) ? -1 : original(from, to);
}

int renameat2(int fromFolder, char const* from, int toFolder, char const* to,
              unsigned flags) noexcept
{
    ORIGINAL(renameat2);
    return Fails("rename", from) ? -1 : original(fromFolder, from, toFolder, to, flags);
}

int unlink(char const* path) noexcept
{
    ORIGINAL(unlink);
    return Fails("unlink", path) ? -1 : original(path);
}

int link(char const* from, char const* to) noexcept
{
    ORIGINAL(link);
    return Fails("link", to) ? -1 : original(from, to);
}

int linkat(int fromFolder, char const* from, int toFolder, char const* to, int flags) noexcept
{
    ORIGINAL(linkat);
    return Fails("link", to) ? -1 : original(fromFolder, from, toFolder, to, flags);
}

int mkdir(char const* path, mode_t mode) noexcept
{
    ORIGINAL(mkdir);
    return Fails("mkdir", path) ? -1 : original(path, mode);
}

// The C library opens and closes the descriptor of a directory past the calls above.
DIR* opendir(char const* path)
{
    ORIGINAL(opendir);
    if (Fails("opendir", path))
        return nullptr;
    DIR* const directory = original(path);
    if (directory)
        Remember(dirfd(directory), path);
    return directory;
}

int closedir(DIR* directory)
{
    ORIGINAL(closedir);
    const int descriptor = dirfd(directory);
    if (Concerns(descriptor))
        s_open[descriptor][0] = '\0';
    return original(directory);
}

struct dirent* readdir(DIR* directory)
{
    ORIGINAL(readdir);
    return Fails("readdir", dirfd(directory)) ? nullptr : original(directory);
}

struct dirent64* readdir64(DIR* directory)
{
    ORIGINAL(readdir64);
    return Fails("readdir", dirfd(directory)) ? nullptr : original(directory);
}

int chmod(char const* path, mode_t mode) noexcept
{
    ORIGINAL(chmod);
    return Fails("chmod", path) ? -1 : original(path, mode);
}

int fchmod(int descriptor, mode_t mode) noexcept
{
    ORIGINAL(fchmod);
    return Fails("fchmod", descriptor) ? -1 : original(descriptor, mode);
}

int fchown(int descriptor, uid_t user, gid_t group) noexcept
{
    ORIGINAL(fchown);
    return Fails("fchown", descriptor) ? -1 : original(descriptor, user, group);
}

int flock(int descriptor, int operation) noexcept
{
    ORIGINAL(flock);
    return Fails("flock", descriptor) ? -1 : original(descriptor, operation);
}

// The third argument of the next two is a number, a pointer or missing; as a pointer it is passed
// on unchanged in each case.
int fcntl(int descriptor, int command, ...)
{
    ORIGINAL(fcntl);
    va_list arguments;
    va_start(arguments, command);
    void* const argument = va_arg(arguments, void*);
    va_end(arguments);
    return Fails("fcntl", descriptor) ? -1 : original(descriptor, command, argument);
}

int ioctl(int descriptor, unsigned long request, ...) noexcept
{
    ORIGINAL(ioctl);
    va_list arguments;
    va_start(arguments, request);
    void* const argument = va_arg(arguments, void*);
    va_end(arguments);
    return Fails("ioctl", descriptor) ? -1 : original(descriptor, request, argument);
}

int rmdir(char const* path) noexcept
{
    ORIGINAL(rmdir);
    return Fails("rmdir", path) ? -1 : original(path);
}

ssize_t readlink(char const* path, char* target, size_t size) noexcept
{
    ORIGINAL(readlink);
    return Fails("readlink", path) ? -1 : original(path, target, size);
}

int access(char const* path, int mode) noexcept
{
    ORIGINAL(access);
    return Fails("access", path) ? -1 : original(path, mode);
}

int stat(char const* path, struct stat* status) noexcept
{
    ORIGINAL(stat);
    return Fails("stat", path) ? -1 : original(path, status);
}

int lstat(char const* path, struct stat* status) noexcept
{
    ORIGINAL(lstat);
    return Fails("stat", path) ? -1 : original(path, status);
}

int fstat(int descriptor, struct stat* status) noexcept
{
    ORIGINAL(fstat);
    return Fails("stat", descriptor) ? -1 : original(descriptor, status);
}

int stat64(char const* path, struct stat64* status) noexcept
{
    ORIGINAL(stat64);
    return Fails("stat", path) ? -1 : original(path, status);
}

int lstat64(char const* path, struct stat64* status) noexcept
{
    ORIGINAL(lstat64);
    return Fails("stat", path) ? -1 : original(path, status);
}

int fstat64(int descriptor, struct stat64* status) noexcept
{
    ORIGINAL(fstat64);
    return Fails("stat", descriptor) ? -1 : original(descriptor, status);
}

// Qt passes a descriptor with an empty path.
int statx(int folder, char const* path, int flags, unsigned mask, struct statx* status) noexcept
{
    ORIGINAL(statx);
    const bool fails = path[0] ? Fails("stat", path) : Fails("stat", folder);
    return fails ? -1 : original(folder, path, flags, mask, status);
}

} // extern "C"
