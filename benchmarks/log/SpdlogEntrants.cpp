// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "log/LogEntrants.h"

#include <spdlog/sinks/basic_file_sink.h>
#include <spdlog/sinks/rotating_file_sink.h>
#include <spdlog/spdlog.h>

namespace {

class SpdlogEntrant : public LogEntrant
{
public:
    explicit SpdlogEntrant(spdlog::sink_ptr const& sink) : m_logger("bench", sink)
    {
        m_logger.set_pattern("%Y-%m-%d %H:%M:%S.%e %l %v");
        m_logger.flush_on(spdlog::level::trace);
    }

    void write() override { m_logger.info(LogMessage()); }

private:
    spdlog::logger m_logger;
};

} // namespace

std::unique_ptr<LogEntrant> MakeSpdlogBasicEntrant(QString const& folder)
{
    const std::string file = (folder + "spdlog.log").toStdString();
    return std::make_unique<SpdlogEntrant>(
        std::make_shared<spdlog::sinks::basic_file_sink_mt>(file));
}

// With TorkLog's default limits.
std::unique_ptr<LogEntrant> MakeSpdlogRotatingEntrant(QString const& folder)
{
    const std::string file = (folder + "spdlog.log").toStdString();
    return std::make_unique<SpdlogEntrant>(
        std::make_shared<spdlog::sinks::rotating_file_sink_mt>(file, 1000000, 10));
}
