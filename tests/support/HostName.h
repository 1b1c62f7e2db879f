// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QByteArray>
#include <QtGlobal>

#ifdef Q_OS_LINUX
#include <sched.h>
#include <unistd.h>
#endif

/// The name of the computer as a test sees it.
namespace HostName {

/// Gives this process alone another one, until it ends. Only an administrator may, and only on
/// Linux.
inline bool set(QByteArray const& name)
{
#ifdef Q_OS_LINUX
    return unshare(CLONE_NEWUTS) == 0 &&
           sethostname(name.constData(), static_cast<size_t>(name.size())) == 0;
#else
    Q_UNUSED(name);
    return false;
#endif
}

} // namespace HostName
