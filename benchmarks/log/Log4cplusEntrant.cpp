// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "log/LogEntrants.h"

#include <log4cplus/fileappender.h>
#include <log4cplus/initializer.h>
#include <log4cplus/layout.h>
#include <log4cplus/logger.h>
#include <log4cplus/loggingmacros.h>

namespace {

class Log4cplusEntrant : public LogEntrant
{
public:
    explicit Log4cplusEntrant(QString const& folder)
        : m_logger(log4cplus::Logger::getInstance("bench"))
    {
        log4cplus::SharedAppenderPtr appender(new log4cplus::FileAppender(
            (folder + "log4cplus.log").toStdString(), std::ios_base::trunc, true));
        appender->setLayout(
            std::make_unique<log4cplus::PatternLayout>("%D{%Y-%m-%d %H:%M:%S.%q} %p %m%n"));
        m_logger.setAdditivity(false);
        m_logger.addAppender(appender);
    }

    ~Log4cplusEntrant() override { m_logger.removeAllAppenders(); }

    void write() override { LOG4CPLUS_INFO(m_logger, LogMessage()); }

private:
    log4cplus::Logger m_logger;
};

} // namespace

std::unique_ptr<LogEntrant> MakeLog4cplusEntrant(QString const& folder)
{
    static const log4cplus::Initializer initializer;
    return std::make_unique<Log4cplusEntrant>(folder);
}
