// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// A library to be preloaded into an unchanged program (LD_PRELOAD): it records every file that the
// program opens for writing, creates, moves or removes, and every program that it starts.
// tst_FileRecorder checks each of its calls.
//
//     FILE_RECORDER  the file to record it in, a line "CALL PATH" each

#include "support/NextFunction.h"

#include <array>
#include <cerrno>
#include <climits>
#include <cstdarg>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <fcntl.h>
#include <spawn.h>
#include <sys/stat.h>
#include <sys/syscall.h>
#include <unistd.h>

namespace {

void Note(char const* call, char const* path)
{
    char const* report = std::getenv("FILE_RECORDER");
    if (!report)
        return;

    const int kept = errno;
    char folder[PATH_MAX] = "";
    const bool isPath = std::strcmp(call, "search") != 0 && std::strcmp(call, "shell") != 0;
    if (isPath && path[0] != '/' && getcwd(folder, sizeof folder - 1))
        std::strcat(folder, "/");
    char line[2 * PATH_MAX + 32];
    const int length = std::snprintf(line, sizeof line, "%s %s%s\n", call, folder, path);
    // With raw system calls, which are not intercepted.
    const long file = syscall(SYS_openat, AT_FDCWD, report, O_WRONLY | O_APPEND | O_CREAT, 0666);
    if (file >= 0) {
        syscall(SYS_write, file, line, length);
        syscall(SYS_close, file);
    }
    errno = kept;
}

// A name without a slash is searched for in PATH.
void NoteProgram(char const* file)
{
    if (std::strchr(file, '/'))
        Note("start", file);
    else
        Note("search", file);
}

void NoteIfWriting(char const* path, int flags)
{
    if ((flags & O_ACCMODE) != O_RDONLY || (flags & (O_CREAT | O_TRUNC)))
        Note("open", path);
}

void NoteIfWriting(char const* path, char const* mode)
{
    if (std::strpbrk(mode, "wa+"))
        Note("open", path);
}

mode_t ModeOf(int flags, va_list arguments)
{
    const bool creates = (flags & O_CREAT) || (flags & O_TMPFILE) == O_TMPFILE;
    return creates ? va_arg(arguments, mode_t) : 0;
}

} // namespace

extern "C" {

#define RECORD_OPEN(name)                                                                          \
    int name(char const* path, int flags, ...)                                                     \
    {                                                                                              \
        ORIGINAL(name);                                                                            \
        va_list arguments;                                                                         \
        va_start(arguments, flags);                                                                \
        const mode_t mode = ModeOf(flags, arguments);                                              \
        va_end(arguments);                                                                         \
        NoteIfWriting(path, flags);                                                                \
        return original(path, flags, mode);                                                        \
    }

RECORD_OPEN(open)
RECORD_OPEN(open64)

#define RECORD_OPENAT(name)                                                                        \
    int name(int folder, char const* path, int flags, ...)                                         \
    {                                                                                              \
        ORIGINAL(name);                                                                            \
        va_list arguments;                                                                         \
        va_start(arguments, flags);                                                                \
        const mode_t mode = ModeOf(flags, arguments);                                              \
        va_end(arguments);                                                                         \
        NoteIfWriting(path, flags);                                                                \
        return original(folder, path, flags, mode);                                                \
    }

RECORD_OPENAT(openat)
RECORD_OPENAT(openat64)

int creat(char const* path, mode_t mode)
{
    ORIGINAL(creat);
    Note("open", path);
    return original(path, mode);
}

FILE* fopen(char const* path, char const* mode)
{
    ORIGINAL(fopen);
    NoteIfWriting(path, mode);
    return original(path, mode);
}

FILE* fopen64(char const* path, char const* mode)
{
    ORIGINAL(fopen64);
    NoteIfWriting(path, mode);
    return original(path, mode);
}

int mkdir(char const* path, mode_t mode) noexcept
{
    ORIGINAL(mkdir);
    Note("mkdir", path);
    return original(path, mode);
}

int mkfifo(char const* path, mode_t mode) noexcept
{
    ORIGINAL(mkfifo);
    Note("open", path);
    return original(path, mode);
}

// What is created gets the rest of its name in the call.
int mkstemp(char* path)
{
    ORIGINAL(mkstemp);
    const int descriptor = original(path);
    Note("open", path);
    return descriptor;
}

int mkstemp64(char* path)
{
    ORIGINAL(mkstemp64);
    const int descriptor = original(path);
    Note("open", path);
    return descriptor;
}

int mkostemp(char* path, int flags)
{
    ORIGINAL(mkostemp);
    const int descriptor = original(path, flags);
    Note("open", path);
    return descriptor;
}

int mkostemp64(char* path, int flags)
{
    ORIGINAL(mkostemp64);
    const int descriptor = original(path, flags);
    Note("open", path);
    return descriptor;
}

char* mkdtemp(char* path) noexcept
{
    ORIGINAL(mkdtemp);
    char* const made = original(path);
    Note("mkdir", path);
    return made;
}

int truncate(char const* path, off_t length) noexcept
{
    ORIGINAL(truncate);
    Note("open", path);
    return original(path, length);
}

int truncate64(char const* path, off64_t length) noexcept
{
    ORIGINAL(truncate64);
    Note("open", path);
    return original(path, length);
}

int rename(char const* from, char const* to) noexcept
{
    ORIGINAL(rename);
    Note("rename", from);
    Note("rename", to);
    return original(from, to);
}

int renameat(int fromFolder, char const* from, int toFolder, char const* to) noexcept
{
    ORIGINAL(renameat);
    Note("rename", from);
    Note("rename", to);
    return original(fromFolder, from, toFolder, to);
}

int renameat2(int fromFolder, char const* from, int toFolder, char const* to,
              unsigned flags) noexcept
{
    ORIGINAL(renameat2);
    Note("rename", from);
    Note("rename", to);
    return original(fromFolder, from, toFolder, to, flags);
}

int link(char const* from, char const* to) noexcept
{
    ORIGINAL(link);
    Note("link", to);
    return original(from, to);
}

int linkat(int fromFolder, char const* from, int toFolder, char const* to, int flags) noexcept
{
    ORIGINAL(linkat);
    Note("link", to);
    return original(fromFolder, from, toFolder, to, flags);
}

int symlink(char const* target, char const* path) noexcept
{
    ORIGINAL(symlink);
    Note("link", path);
    return original(target, path);
}

int unlink(char const* path) noexcept
{
    ORIGINAL(unlink);
    Note("remove", path);
    return original(path);
}

int unlinkat(int folder, char const* path, int flags) noexcept
{
    ORIGINAL(unlinkat);
    Note("remove", path);
    return original(folder, path, flags);
}

int remove(char const* path) noexcept
{
    ORIGINAL(remove);
    Note("remove", path);
    return original(path);
}

int rmdir(char const* path) noexcept
{
    ORIGINAL(rmdir);
    Note("remove", path);
    return original(path);
}

int chmod(char const* path, mode_t mode) noexcept
{
    ORIGINAL(chmod);
    Note("chmod", path);
    return original(path, mode);
}

int chown(char const* path, uid_t user, gid_t group) noexcept
{
    ORIGINAL(chown);
    Note("chmod", path);
    return original(path, user, group);
}

int execve(char const* path, char* const arguments[], char* const environment[]) noexcept
{
    ORIGINAL(execve);
    Note("start", path);
    return original(path, arguments, environment);
}

int execv(char const* path, char* const arguments[]) noexcept
{
    ORIGINAL(execv);
    Note("start", path);
    return original(path, arguments);
}

int execvp(char const* file, char* const arguments[]) noexcept
{
    ORIGINAL(execvp);
    NoteProgram(file);
    return original(file, arguments);
}

int execvpe(char const* file, char* const arguments[], char* const environment[]) noexcept
{
    ORIGINAL(execvpe);
    NoteProgram(file);
    return original(file, arguments, environment);
}

// The lists of arguments end with a null pointer; the C library would start the program past the
// functions above.
#define EXEC_LIST(start)                                                                           \
    std::array<char*, 1000> arguments = {const_cast<char*>(first)};                                \
    va_list list;                                                                                  \
    va_start(list, first);                                                                         \
    for (size_t i = 1; i < arguments.size() && arguments[i - 1]; ++i)                              \
        arguments[i] = va_arg(list, char*);                                                        \
    start;                                                                                         \
    va_end(list);

int execl(char const* path, char const* first, ...) noexcept
{
    EXEC_LIST(execv(path, arguments.data()))
    return -1;
}

int execlp(char const* file, char const* first, ...) noexcept
{
    EXEC_LIST(execvp(file, arguments.data()))
    return -1;
}

int execle(char const* path, char const* first, ...) noexcept
{
    EXEC_LIST(execve(path, arguments.data(), va_arg(list, char* const*)))
    return -1;
}

int posix_spawn(pid_t* process, char const* path, posix_spawn_file_actions_t const* actions,
                posix_spawnattr_t const* attributes, char* const arguments[],
                char* const environment[])
{
    ORIGINAL(posix_spawn);
    Note("start", path);
    return original(process, path, actions, attributes, arguments, environment);
}

int posix_spawnp(pid_t* process, char const* file, posix_spawn_file_actions_t const* actions,
                 posix_spawnattr_t const* attributes, char* const arguments[],
                 char* const environment[])
{
    ORIGINAL(posix_spawnp);
    NoteProgram(file);
    return original(process, file, actions, attributes, arguments, environment);
}

int system(char const* command)
{
    ORIGINAL(system);
    Note("shell", command ? command : "");
    return original(command);
}

FILE* popen(char const* command, char const* mode)
{
    ORIGINAL(popen);
    Note("shell", command);
    return original(command, mode);
}

} // extern "C"
