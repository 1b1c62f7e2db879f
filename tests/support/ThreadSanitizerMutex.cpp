// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// QMutex is part of the Qt library, which is not built for ThreadSanitizer, and it relies on system
// calls that the sanitizer does not know: anything a mutex protects would look like a data race.
// This program's own definitions take precedence over the library's, call them, and tell the
// sanitizer what they did. Without the sanitizer this file is empty.

#include "support/Sanitizers.h"

#ifdef TEST_UNDER_THREAD_SANITIZER

#include <QMutex>

#include <cstdlib>
#include <dlfcn.h>
#include <sanitizer/tsan_interface.h>

namespace {

template <class Function>
Function original(const char* name)
{
    void* found = dlsym(RTLD_NEXT, name);
    if (!found)
        std::abort();
    return reinterpret_cast<Function>(found);
}

} // namespace

// QtTest's own watchdog ends its thread and deletes what the thread used, in an order that relies
// on those same system calls.
extern "C" const char* __tsan_default_suppressions()
{
    return "race:^QWaitCondition::~QWaitCondition\n"
           "race:libQt5Test.so\n";
}

void QMutex::lock() QT_MUTEX_LOCK_NOEXCEPT
{
    static const auto library = original<void (*)(QMutex*)>("_ZN6QMutex4lockEv");
    __tsan_mutex_pre_lock(this, 0);
    library(this);
    __tsan_mutex_post_lock(this, 0, 0);
}

bool QMutex::tryLock(int timeout) QT_MUTEX_LOCK_NOEXCEPT
{
    static const auto library = original<bool (*)(QMutex*, int)>("_ZN6QMutex7tryLockEi");
    __tsan_mutex_pre_lock(this, __tsan_mutex_try_lock);
    const bool locked = library(this, timeout);
    __tsan_mutex_post_lock(this,
                           __tsan_mutex_try_lock | (locked ? 0 : __tsan_mutex_try_lock_failed), 0);
    return locked;
}

void QMutex::unlock() noexcept
{
    static const auto library = original<void (*)(QMutex*)>("_ZN6QMutex6unlockEv");
    __tsan_mutex_pre_unlock(this, 0);
    library(this);
    __tsan_mutex_post_unlock(this, 0);
}

#endif
