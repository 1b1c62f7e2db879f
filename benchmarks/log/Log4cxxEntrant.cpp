// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "log/LogEntrants.h"

#include <log4cxx/fileappender.h>
#include <log4cxx/logger.h>
#include <log4cxx/patternlayout.h>

namespace {

class Log4cxxEntrant : public LogEntrant
{
public:
    explicit Log4cxxEntrant(QString const& folder) : m_logger(log4cxx::Logger::getLogger("bench"))
    {
        const auto layout =
            std::make_shared<log4cxx::PatternLayout>("%d{yyyy-MM-dd HH:mm:ss.SSS} %p %m%n");
        const auto appender = std::make_shared<log4cxx::FileAppender>(
            layout, (folder + "log4cxx.log").toStdString(), false);
        appender->setImmediateFlush(true);
        m_logger->setAdditivity(false);
        m_logger->setLevel(log4cxx::Level::getTrace());
        m_logger->addAppender(appender);
    }

    ~Log4cxxEntrant() override { m_logger->removeAllAppenders(); }

    void write() override { LOG4CXX_INFO(m_logger, LogMessage()); }

private:
    log4cxx::LoggerPtr m_logger;
};

} // namespace

std::unique_ptr<LogEntrant> MakeLog4cxxEntrant(QString const& folder)
{
    return std::make_unique<Log4cxxEntrant>(folder);
}
