// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "log/LogEntrants.h"

#include <boost/log/core.hpp>
#include <boost/log/expressions.hpp>
#include <boost/log/sinks/sync_frontend.hpp>
#include <boost/log/sinks/text_file_backend.hpp>
#include <boost/log/sources/severity_logger.hpp>
#include <boost/log/support/date_time.hpp>
#include <boost/log/trivial.hpp>
#include <boost/log/utility/setup/common_attributes.hpp>

namespace {

namespace expressions = boost::log::expressions;
namespace sinks = boost::log::sinks;
using boost::log::trivial::severity_level;

class BoostLogEntrant : public LogEntrant
{
public:
    explicit BoostLogEntrant(QString const& folder)
    {
        const auto backend = boost::make_shared<sinks::text_file_backend>(
            boost::log::keywords::file_name = (folder + "boost.log").toStdString());
        backend->auto_flush(true);
        m_sink = boost::make_shared<Sink>(backend);
        m_sink->set_formatter(expressions::stream
                              << expressions::format_date_time<boost::posix_time::ptime>(
                                     "TimeStamp", "%Y-%m-%d %H:%M:%S.%f")
                              << ' ' << expressions::attr<severity_level>("Severity") << ' '
                              << expressions::smessage);
        boost::log::core::get()->add_sink(m_sink);
    }

    ~BoostLogEntrant() override { boost::log::core::get()->remove_sink(m_sink); }

    void write() override { BOOST_LOG_SEV(m_logger, severity_level::info) << LogMessage(); }

private:
    using Sink = sinks::synchronous_sink<sinks::text_file_backend>;
    boost::shared_ptr<Sink> m_sink;
    boost::log::sources::severity_logger_mt<severity_level> m_logger;
};

} // namespace

std::unique_ptr<LogEntrant> MakeBoostLogEntrant(QString const& folder)
{
    static const bool attributesAdded = [] {
        boost::log::add_common_attributes();
        return true;
    }();
    return attributesAdded ? std::make_unique<BoostLogEntrant>(folder) : nullptr;
}
