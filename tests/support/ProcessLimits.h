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

/// Takes privileges away from the running process. Except for OrdinaryUser this cannot be undone:
/// for child processes only.
namespace ProcessLimits {

/// The user who owns nothing. File permissions do not apply to root.
constexpr unsigned NobodyId = 65534;

/// A process that changed its user cannot be traced, which leak checkers depend on.
inline void allowTracing()
{
#ifdef Q_OS_LINUX
    prctl(PR_SET_DUMPABLE, 1);
#endif
}

/// Makes file permissions apply for the rest of the process: root becomes an unprivileged user.
/// Returns false where that is not possible.
inline bool becomeOrdinaryUser()
{
#ifdef Q_OS_UNIX
    if (geteuid() != 0)
        return true;
    if (setgroups(0, nullptr) != 0 || setgid(NobodyId) != 0 || setuid(NobodyId) != 0)
        return false;
    allowTracing();
    return true;
#else
    return false;
#endif
}

/// Makes file permissions apply while this object lives.
class OrdinaryUser
{
    Q_DISABLE_COPY(OrdinaryUser)

public:
    OrdinaryUser()
    {
#ifdef Q_OS_UNIX
        m_wasAdministrator = geteuid() == 0;
        m_changed = m_wasAdministrator && seteuid(NobodyId) == 0;
        m_isInForce = m_changed || !m_wasAdministrator;
#endif
    }
    ~OrdinaryUser()
    {
#ifdef Q_OS_UNIX
        if (m_changed && seteuid(0) != 0)
            qFatal("cannot become root again");
        allowTracing();
#endif
    }

    /// Whether permissions apply; if not, the test cannot run here.
    bool isInForce() const
    {
        return m_isInForce;
    }

private:
    bool m_wasAdministrator = false;
    bool m_changed = false;
    bool m_isInForce = false;
};

/// Lifts the limit of limitFileSize().
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
/// limit is lifted when the program ends, before a coverage build writes its counters to a file.
inline bool limitFileSize(unsigned long bytes)
{
#ifdef Q_OS_UNIX
    std::atexit([] { unlimitFileSize(); });
    // By default the system would kill this process, as it would any program that does not choose
    // to handle failed writes.
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

/// For processes that are meant to die: no core dump is written.
inline void leaveNoCoreFile()
{
#ifdef Q_OS_UNIX
    const rlimit none = {0, 0};
    setrlimit(RLIMIT_CORE, &none);
#endif
}

} // namespace ProcessLimits
