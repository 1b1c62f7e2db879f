// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// A program's own definitions take precedence over those of the C library, so Qt and the framework
// call these.

#include "reliability/DiskRecorder.h"
#include "support/NextFunction.h"

#include <QFile>

#include <algorithm>
#include <cerrno>
#include <climits>
#include <csignal>
#include <cstdarg>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <fcntl.h>
#include <sys/mman.h>
#include <sys/stat.h>
#include <sys/syscall.h>
#include <unistd.h>

namespace {

using DiskRecorder::Kind;

// In memory that all processes share: a header and the operations one after the other.
struct Record
{
    size_t used;
    int count;
    int killAt;
    int killBytes;
    qint64 room;
    bool hasUnnamedFiles;
    bool isComplete; // or it became too long
};

struct Header
{
    Kind kind;
    quint64 file;
    int flags;
    qint64 offset;
    int pathLength;
    int targetLength;
    int byteCount;
};

constexpr size_t Capacity = size_t(64) << 20U;
Record* s_record = nullptr;
char s_folder[PATH_MAX];
bool s_isOn = false;

constexpr int Descriptors = 1024;
bool s_isWatched[Descriptors];

// The path below the folder; null for others.
char const* Below(char const* path)
{
    const size_t length = std::strlen(s_folder);
    if (!s_isOn || !path)
        return nullptr;
    if (std::strncmp(path, s_folder, length) == 0)
        return path + length;
    // The folder itself, without the slash.
    const bool isFolder =
        std::strlen(path) == length - 1 && std::strncmp(path, s_folder, length - 1) == 0;
    return isFolder ? "" : nullptr;
}

bool IsWatched(int descriptor)
{
    return s_isOn && descriptor >= 0 && descriptor < Descriptors && s_isWatched[descriptor];
}

quint64 FileOf(int descriptor)
{
    return (static_cast<quint64>(getpid()) << 32U) + static_cast<quint64>(descriptor) + 1;
}

void Append(Kind kind, quint64 file, int flags, qint64 offset, char const* path, char const* target,
            void const* bytes, size_t count)
{
    Header header = {};
    header.kind = kind;
    header.file = file;
    header.flags = flags;
    header.offset = offset;
    header.pathLength = static_cast<int>(std::strlen(path));
    header.targetLength = static_cast<int>(std::strlen(target));
    header.byteCount = static_cast<int>(count);
    char* to = reinterpret_cast<char*>(s_record + 1) + s_record->used;
    const size_t length = sizeof header + static_cast<size_t>(header.pathLength) +
                          static_cast<size_t>(header.targetLength) + count;
    if (sizeof(Record) + s_record->used + length > Capacity) {
        s_record->isComplete = false;
        return;
    }
    std::memcpy(to, &header, sizeof header);
    to += sizeof header;
    to = std::copy_n(path, header.pathLength, to);
    to = std::copy_n(target, header.targetLength, to);
    std::copy_n(static_cast<char const*>(bytes), count, to);
    s_record->used += length;
    ++s_record->count;
}

// Whether the process is to be killed at this operation.
bool IsLast()
{
    return s_record->killAt > 0 && --s_record->killAt == 0;
}

void Die()
{
    raise(SIGKILL);
}

void DieIfLast()
{
    if (IsLast())
        Die();
}

mode_t ModeOf(int flags, va_list arguments)
{
    const bool creates = (flags & O_CREAT) || (flags & O_TMPFILE) == O_TMPFILE;
    return creates ? va_arg(arguments, mode_t) : 0;
}

bool Changes(int flags)
{
    return (flags & (O_CREAT | O_TRUNC)) || (flags & O_TMPFILE) == O_TMPFILE;
}

// If so, errno is set.
bool IsRefused(int flags)
{
    const bool isUnnamed = (flags & O_TMPFILE) == O_TMPFILE;
    if (isUnnamed && !s_record->hasUnnamedFiles)
        errno = EOPNOTSUPP;
    return isUnnamed && !s_record->hasUnnamedFiles;
}

void NoteOpen(int descriptor, char const* path, int flags)
{
    if (descriptor < 0 || descriptor >= Descriptors)
        return;
    s_isWatched[descriptor] = true;
    const bool isUnnamed = (flags & O_TMPFILE) == O_TMPFILE;
    Append(DiskRecorder::Open, FileOf(descriptor), flags, 0, isUnnamed ? "" : path, "", "", 0);
}

ssize_t RawWrite(int descriptor, void const* bytes, size_t length)
{
    const ssize_t written = syscall(SYS_write, descriptor, bytes, length);
    const int error = errno;
    if (written > 0) {
        const qint64 end = syscall(SYS_lseek, descriptor, 0, SEEK_CUR);
        Append(DiskRecorder::Write, FileOf(descriptor), 0, end - written, "", "", bytes,
               static_cast<size_t>(written));
    }
    errno = error;
    return written;
}

// Nothing here is expected to use these on a recorded file.
void Refuse(char const* call)
{
    std::fprintf(stderr, "%s is not recorded\n", call);
    std::abort();
}

} // namespace

void DiskRecorder::start(QString const& folder, bool hasUnnamedFiles)
{
    if (!s_record) {
        void* const memory = mmap(nullptr, Capacity, PROT_READ | PROT_WRITE,
                                  MAP_SHARED | MAP_ANONYMOUS | MAP_NORESERVE, -1, 0);
        if (memory == MAP_FAILED)
            qFatal("no memory for the record");
        s_record = static_cast<Record*>(memory);
    }
    *s_record = Record{0, 0, 0, 0, -1, hasUnnamedFiles, true};
    std::snprintf(s_folder, sizeof s_folder, "%s", QFile::encodeName(folder).constData());
    s_isOn = true;
}

QVector<DiskRecorder::Operation> DiskRecorder::stop()
{
    s_isOn = false;
    QVector<Operation> operations;
    char const* from = reinterpret_cast<char const*>(s_record + 1);
    for (int i = 0; i < s_record->count; ++i) {
        Header header = {};
        std::memcpy(&header, from, sizeof header);
        from += sizeof header;
        Operation operation;
        operation.kind = header.kind;
        operation.file = header.file;
        operation.flags = header.flags;
        operation.offset = header.offset;
        const auto take = [&from](int length) {
            const QByteArray taken(from, length);
            from += length;
            return taken;
        };
        operation.path = take(header.pathLength);
        operation.target = take(header.targetLength);
        operation.bytes = take(header.byteCount);
        operations.append(operation);
    }
    if (!s_record->isComplete)
        qFatal("the record is too long");
    return operations;
}

int DiskRecorder::mark(int number)
{
    const int before = s_record->count;
    Append(Mark, 0, 0, number, "", "", "", 0);
    return before;
}

void DiskRecorder::killAt(int operation, int bytes)
{
    s_record->killBytes = bytes;
    s_record->killAt = operation;
}

void DiskRecorder::limitBytes(qint64 bytes)
{
    s_record->room = bytes;
}

extern "C" {

#define RECORD_OPEN(name)                                                                          \
    int name(char const* path, int flags, ...)                                                     \
    {                                                                                              \
        ORIGINAL(name);                                                                            \
        va_list arguments;                                                                         \
        va_start(arguments, flags);                                                                \
        const mode_t mode = ModeOf(flags, arguments);                                              \
        va_end(arguments);                                                                         \
        char const* const below = Below(path);                                                     \
        if (below && IsRefused(flags))                                                             \
            return -1;                                                                             \
        if (below && Changes(flags))                                                               \
            DieIfLast();                                                                           \
        const int descriptor = original(path, flags, mode);                                        \
        if (below)                                                                                 \
            NoteOpen(descriptor, below, flags);                                                    \
        return descriptor;                                                                         \
    }

RECORD_OPEN(open)
RECORD_OPEN(open64)

int close(int descriptor)
{
    ORIGINAL(close);
    if (IsWatched(descriptor)) {
        s_isWatched[descriptor] = false;
        Append(DiskRecorder::Close, FileOf(descriptor), 0, 0, "", "", "", 0);
    }
    return original(descriptor);
}

ssize_t write(int descriptor, void const* bytes, size_t length)
{
    ORIGINAL(write);
    if (!IsWatched(descriptor))
        return original(descriptor, bytes, length);
    if (IsLast()) {
        RawWrite(descriptor, bytes, qMin(length, static_cast<size_t>(s_record->killBytes)));
        Die();
    }
    size_t allowed = length;
    if (s_record->room >= 0) {
        allowed = qMin(length, static_cast<size_t>(s_record->room));
        s_record->room -= static_cast<qint64>(allowed);
    }
    if (allowed == 0 && length > 0) {
        errno = ENOSPC;
        return -1;
    }
    return RawWrite(descriptor, bytes, allowed);
}

int fsync(int descriptor)
{
    ORIGINAL(fsync);
    if (!IsWatched(descriptor))
        return original(descriptor);
    DieIfLast();
    Append(DiskRecorder::Sync, FileOf(descriptor), 0, 0, "", "", "", 0);
    return 0; // nothing waits for the real disk
}

int fdatasync(int descriptor)
{
    ORIGINAL(fdatasync);
    return IsWatched(descriptor) ? fsync(descriptor) : original(descriptor);
}

#define RECORD_TRUNCATE(name, type)                                                                \
    int name(int descriptor, type length) noexcept                                                 \
    {                                                                                              \
        ORIGINAL(name);                                                                            \
        if (IsWatched(descriptor)) {                                                               \
            DieIfLast();                                                                           \
            Append(DiskRecorder::Truncate, FileOf(descriptor), 0, length, "", "", "", 0);          \
        }                                                                                          \
        return original(descriptor, length);                                                       \
    }

RECORD_TRUNCATE(ftruncate, off_t)
RECORD_TRUNCATE(ftruncate64, off64_t)

int rename(char const* from, char const* to) noexcept
{
    ORIGINAL(rename);
    if (!Below(from))
        return original(from, to);
    DieIfLast();
    const int result = original(from, to);
    if (result == 0)
        Append(DiskRecorder::Rename, 0, 0, 0, Below(from), Below(to), "", 0);
    return result;
}

int renameat2(int fromFolder, char const* from, int toFolder, char const* to,
              unsigned flags) noexcept
{
    ORIGINAL(renameat2);
    if (!Below(from))
        return original(fromFolder, from, toFolder, to, flags);
    DieIfLast();
    const int result = original(fromFolder, from, toFolder, to, flags);
    if (result == 0)
        Append(DiskRecorder::Rename, 0, 0, 0, Below(from), Below(to), "", 0);
    return result;
}

int link(char const* from, char const* to) noexcept
{
    ORIGINAL(link);
    if (!Below(to))
        return original(from, to);
    DieIfLast();
    const int result = original(from, to);
    if (result == 0)
        Append(DiskRecorder::Link, 0, 0, 0, Below(from), Below(to), "", 0);
    return result;
}

// An unnamed file gets its name through its descriptor.
int linkat(int fromFolder, char const* from, int toFolder, char const* to, int flags) noexcept
{
    ORIGINAL(linkat);
    if (!Below(to))
        return original(fromFolder, from, toFolder, to, flags);
    DieIfLast();
    const int result = original(fromFolder, from, toFolder, to, flags);
    int descriptor = -1;
    const bool isOpen = std::sscanf(from, "/proc/self/fd/%d", &descriptor) == 1;
    if (result == 0)
        Append(DiskRecorder::Link, isOpen ? FileOf(descriptor) : 0, 0, 0, isOpen ? "" : Below(from),
               Below(to), "", 0);
    return result;
}

int unlink(char const* path) noexcept
{
    ORIGINAL(unlink);
    if (!Below(path))
        return original(path);
    DieIfLast();
    const int result = original(path);
    if (result == 0)
        Append(DiskRecorder::Unlink, 0, 0, 0, Below(path), "", "", 0);
    return result;
}

int mkdir(char const* path, mode_t mode) noexcept
{
    ORIGINAL(mkdir);
    if (!Below(path))
        return original(path, mode);
    DieIfLast();
    const int result = original(path, mode);
    if (result == 0)
        Append(DiskRecorder::MakeFolder, 0, 0, 0, Below(path), "", "", 0);
    return result;
}

ssize_t pwrite64(int descriptor, void const* bytes, size_t length, off64_t offset)
{
    ORIGINAL(pwrite64);
    if (IsWatched(descriptor))
        Refuse("pwrite");
    return original(descriptor, bytes, length, offset);
}

ssize_t sendfile(int to, int from, off_t* offset, size_t length) noexcept
{
    ORIGINAL(sendfile);
    if (IsWatched(to))
        Refuse("sendfile");
    return original(to, from, offset, length);
}

int truncate(char const* path, off_t length) noexcept
{
    ORIGINAL(truncate);
    if (Below(path))
        Refuse("truncate");
    return original(path, length);
}

} // extern "C"
