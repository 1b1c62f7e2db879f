// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/log/TorkLogLock.h"

namespace {

thread_local bool t_holdsLock = false;

} // namespace

TorkLogLock::TorkLogLock(QMutex& mutex) : m_mutex(mutex)
{
    m_mutex.lock();
    t_holdsLock = true;
}

TorkLogLock::~TorkLogLock()
{
    t_holdsLock = false;
    m_mutex.unlock();
}

bool TorkLogLock::isHeldHere()
{
    return t_holdsLock;
}

QtMessageHandler TorkLog_DefaultMessageHandler()
{
    // Installing a handler returns the one before it, and behind no handler is the default one.
    static const QtMessageHandler handler = [] {
        const QtMessageHandler installed = qInstallMessageHandler(nullptr);
        return qInstallMessageHandler(installed);
    }();
    return handler;
}
