// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QtGlobal>

#ifdef Q_OS_UNIX
#include <csignal>
#include <cstdlib>
#include <grp.h>
#include <sys/resource.h>
#include <unistd.h>
#endif
#ifdef Q_OS_LINUX
#include <sys/prctl.h>
#endif

/// Takes rights away from the running process. There is no way back: for child processes only.
namespace ProcessLimits {

/// Makes the permissions of files hold: the administrator, to whom they mean nothing, becomes the
/// user without rights. Returns false where that is not possible.
inline bool becomeOrdinaryUser()
{
#ifdef Q_OS_UNIX
    if (geteuid() != 0)
        return true;

    const unsigned nobody = 65534;
    if (setgroups(0, nullptr) != 0 || setgid(nobody) != 0 || setuid(nobody) != 0)
        return false;
#ifdef Q_OS_LINUX
    // A process that changed its user is closed to tracing, which leak checkers depend on.
    prctl(PR_SET_DUMPABLE, 1);
#endif
    return true;
#else
    return false;
#endif
}

/// Lifts the limit of limitFileSize() again.
inline bool unlimitFileSize()
{
#ifdef Q_OS_UNIX
    rlimit limit = {};
    if (getrlimit(RLIMIT_FSIZE, &limit) != 0)
        return false;
    limit.rlim_cur = limit.rlim_max;
    return setrlimit(RLIMIT_FSIZE, &limit) == 0;
#else
    return false;
#endif
}

/// From now on no file grows beyond this number of bytes: writing fails as on a full disk. The
/// limit ends with the program, before a build that measures coverage adds its counts to a file.
inline bool limitFileSize(unsigned long bytes)
{
#ifdef Q_OS_UNIX
    std::atexit([] { unlimitFileSize(); });
    // By default the system would kill this process, as it would any program that does not ask for
    // failed writes.
    std::signal(SIGXFSZ, SIG_IGN);
    rlimit limit = {};
    if (getrlimit(RLIMIT_FSIZE, &limit) != 0)
        return false;
    limit.rlim_cur = bytes;
    return setrlimit(RLIMIT_FSIZE, &limit) == 0;
#else
    Q_UNUSED(bytes)
    return false;
#endif
}

/// For processes that are meant to die: no memory image is left behind.
inline void leaveNoCoreFile()
{
#ifdef Q_OS_UNIX
    const rlimit none = {0, 0};
    setrlimit(RLIMIT_CORE, &none);
#endif
}

} // namespace ProcessLimits
