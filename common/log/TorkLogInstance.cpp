// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The one log of a program, from its making to its end, and Qt's messages, which go to it.

#include "common/log/TorkLog.h"

#include "common/log/TorkLogLock_p.h"
#include "common/log/TorkLogStamp_p.h"

#include <QLoggingCategory>
#include <QStandardPaths>

#include <mutex>
#include <new>
#include <optional>
#include <shared_mutex>
#include <utility>

#ifdef Q_OS_UNIX
#include <pthread.h>
#endif

TorkLog* TorkLog::m_gLog = nullptr;

namespace {

// Held for reading while the message handler uses the log, so that shutdown() cannot delete the
// log under a message of another thread.
std::shared_mutex s_lifetime;

#ifdef Q_OS_UNIX
// What a thread holds while it forks, in the order in which everybody takes these locks. It holds
// none of them before, because nothing that runs under one forks.
struct ForkLocks
{
    std::shared_lock<std::shared_mutex> lifetime;
    std::optional<TorkLogLock> log;
    std::optional<TorkLogLock> stamps;
};
thread_local ForkLocks t_forkLocks;
#endif

int SeverityOf(QtMsgType type)
{
    switch (type) {
    case QtWarningMsg:
        return TorkLog::Warning;
    case QtCriticalMsg:
        return TorkLog::Error;
    case QtFatalMsg:
        return TorkLog::Fatal;
    default:
        return TorkLog::Trace;
    }
}

} // namespace

void TorkLog_MessageHandler(QtMsgType type, QMessageLogContext const& context,
                            QString const& message)
{
    if (TorkLogLock::isHeldHere()) {
        TorkLog_DefaultMessageHandler()(type, context, message);
        return;
    }

    std::shared_lock<std::shared_mutex> lock(s_lifetime);
    if (TorkLog* log = TorkLog::m_gLog)
        log->write(SeverityOf(type), message);
}

// A child has only the thread that forked it. Without these handlers it would inherit the locks
// that other threads hold just then, and nobody there would release them.
void TorkLog::registerForkHandlers()
{
#ifdef Q_OS_UNIX
    const auto prepare = [] {
        t_forkLocks.lifetime = std::shared_lock<std::shared_mutex>(s_lifetime);
        if (m_gLog)
            t_forkLocks.log.emplace(m_gLog->m_mutex);
        t_forkLocks.stamps.emplace(TorkLogStamp::Mutex());
    };
    const auto inParent = [] {
        t_forkLocks.stamps.reset();
        t_forkLocks.log.reset();
        t_forkLocks.lifetime.unlock();
    };
    const auto inChild = [] {
        t_forkLocks.stamps.reset();
        t_forkLocks.log.reset();
        // Counts readers that are not in the child, so it cannot be unlocked, only replaced.
        t_forkLocks.lifetime.release();
        new (&s_lifetime) std::shared_mutex;
    };
    static const int registered = ::pthread_atfork(prepare, inParent, inChild);
    Q_UNUSED(registered)
#endif
}

TorkLog* TorkLog::initialize(QString const& path, QString const& prefix,
                             QString const& preferencesFileName, bool enable)
{
    registerForkHandlers();
    QLoggingCategory::defaultCategory(); // made under a lock of Qt's, which a child would inherit
    {
        std::unique_lock<std::shared_mutex> lock(s_lifetime);
        if (m_gLog)
            return m_gLog;
        m_gLog = new TorkLog(path);
    }

    const QString dataLocation =
        QStandardPaths::writableLocation(QStandardPaths::AppLocalDataLocation);
    m_gLog->setOutputPath(path.isEmpty() ? dataLocation + QLatin1String("/logs/") : path);

    qInstallMessageHandler(TorkLog_MessageHandler);

    m_gLog->setFilePrefix(prefix); // before other threads' messages open the file
    m_gLog->setEnable(enable);
    m_gLog->setPreferencesFileName(preferencesFileName);
    if (m_gLog->havePreferencesFile())
        m_gLog->loadPreferences();
    else
        m_gLog->savePreferences();
    return m_gLog;
}

TorkLog* TorkLog::initialize(QString const& prefix)
{
    return initialize(QString(), prefix, QString(), true);
}

void TorkLog::shutdown()
{
    TorkLog* log = nullptr;
    {
        std::unique_lock<std::shared_mutex> lock(s_lifetime);
        std::swap(log, m_gLog);
    }
    delete log;
}
