// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "log/LogEntrants.h"

#include <spdlog/async.h>
#include <spdlog/sinks/basic_file_sink.h>
#include <spdlog/sinks/rotating_file_sink.h>
#include <spdlog/spdlog.h>

namespace {

class SpdlogEntrant : public LogEntrant
{
public:
    explicit SpdlogEntrant(spdlog::sink_ptr const& sink)
        : SpdlogEntrant(std::make_shared<spdlog::logger>("bench", sink))
    {}

    explicit SpdlogEntrant(std::shared_ptr<spdlog::logger> logger) : m_logger(std::move(logger))
    {
        m_logger->set_pattern("%Y-%m-%d %H:%M:%S.%e %l %v");
        m_logger->flush_on(spdlog::level::trace);
    }

    void write() override { m_logger->info(LogMessage()); }

private:
    std::shared_ptr<spdlog::logger> m_logger;
};

std::unique_ptr<LogEntrant> MakeRotating(QString const& folder, size_t limit)
{
    const std::string file = (folder + "spdlog.log").toStdString();
    return std::make_unique<SpdlogEntrant>(
        std::make_shared<spdlog::sinks::rotating_file_sink_mt>(file, limit, 10));
}

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
    return MakeRotating(folder, 1000000);
}

std::unique_ptr<LogEntrant> MakeSpdlogSmallEntrant(QString const& folder)
{
    return MakeRotating(folder, 100000);
}

std::unique_ptr<LogEntrant> MakeSpdlogAsyncEntrant(QString const& folder)
{
    const std::string file = (folder + "spdlog.log").toStdString();
    spdlog::init_thread_pool(8192, 1); // its usual size
    return std::make_unique<SpdlogEntrant>(std::make_shared<spdlog::async_logger>(
        "bench", std::make_shared<spdlog::sinks::basic_file_sink_mt>(file), spdlog::thread_pool()));
}
