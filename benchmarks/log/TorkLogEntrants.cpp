// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "log/LogEntrants.h"

#include "common/config/TorkConfigFile.h"
#include "common/log/TorkLog.h"

#include <QDebug>
#include <QMessageLogger>

namespace {

// The process's only log, and the previous message handler.
class TorkLogEntrant : public LogEntrant
{
public:
    explicit TorkLogEntrant(QString const& folder)
        : m_handler(qInstallMessageHandler(nullptr)),
          m_message(QString::fromStdString(LogMessage()))
    {
        TorkLog::initialize(folder, "bench", QString(), true);
    }

    ~TorkLogEntrant() override
    {
        TorkLog::shutdown();
        qInstallMessageHandler(m_handler);
    }

    void write() override { TorkLog::m_gLog->write(TorkLog::Notification, m_message); }
    void reopen() override { TorkLog::m_gLog->close(); }

private:
    QtMessageHandler m_handler;

protected:
    QString m_message;
};

class TorkLogByQtMessagesEntrant : public TorkLogEntrant
{
public:
    using TorkLogEntrant::TorkLogEntrant;
    void write() override { QMessageLogger().info().noquote() << m_message; }
};

void SetLimit(QString const& folder, int bytes)
{
    TorkConfigFile settings(folder + "logsettings.cfg", "LogSettings");
    settings.WriteItem("config", "maxLogFileSize", bytes);
    settings.Save();
}

} // namespace

std::unique_ptr<LogEntrant> MakeTorkLogEntrant(QString const& folder)
{
    return std::make_unique<TorkLogEntrant>(folder);
}

std::unique_ptr<LogEntrant> MakeTorkLogBelowLimitEntrant(QString const& folder)
{
    SetLimit(folder, 2000000000);
    return MakeTorkLogEntrant(folder);
}

std::unique_ptr<LogEntrant> MakeTorkLogSmallEntrant(QString const& folder)
{
    SetLimit(folder, 100000);
    return MakeTorkLogEntrant(folder);
}

std::unique_ptr<LogEntrant> MakeTorkLogByQtMessagesEntrant(QString const& folder)
{
    return std::make_unique<TorkLogByQtMessagesEntrant>(folder);
}
