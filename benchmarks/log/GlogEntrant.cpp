// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "log/LogEntrants.h"

#include <glog/logging.h>

namespace {

class GlogEntrant : public LogEntrant
{
public:
    explicit GlogEntrant(QString const& folder)
    {
        FLAGS_log_dir = folder.toStdString();
        FLAGS_logbuflevel = -1; // every entry is flushed
        FLAGS_log_year_in_prefix = true;
        google::InitGoogleLogging("bench");
    }

    ~GlogEntrant() override { google::ShutdownGoogleLogging(); }

    void write() override { LOG(INFO) << LogMessage(); }
};

} // namespace

std::unique_ptr<LogEntrant> MakeGlogEntrant(QString const& folder)
{
    return std::make_unique<GlogEntrant>(folder);
}
