// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "log/LogEntrants.h"

#include "support/ScratchFolder.h"

#include <QDir>

namespace {

void Check(LogEntrantDescription const& entrant)
{
    const ScratchFolder folder;
    const std::unique_ptr<LogEntrant> log = entrant.make(folder.path());
    for (int written = 1; written <= 3; ++written) {
        log->write();
        Require(EntriesIn(folder.path()) == written,
                QStringLiteral("%1: an entry is not in the file").arg(QLatin1String(entrant.name)));
    }
}

} // namespace

int EntriesIn(QString const& folder)
{
    int most = 0;
    const QByteArray message = QByteArray::fromStdString(LogMessage());
    const QStringList files = QDir(folder).entryList(QDir::Files);
    for (QString const& file : files)
        most = qMax(most, ReadAll(folder + file).count(message));
    return most;
}

std::vector<LogEntrantDescription> CheckedLogEntrants()
{
    const std::vector<LogEntrantDescription> entrants = {
        {"floor: write(2) of the ready line", MakeFloorEntrant},
        {"the fixed parts and write(2)", MakeFixedPartsEntrant},
        {"TorkLog", MakeTorkLogEntrant},
        {"TorkLog, size limit not reached", MakeTorkLogBelowLimitEntrant},
        {"TorkLog, through qInfo()", MakeTorkLogByQtMessagesEntrant},
        {"spdlog basic_file_sink_mt", MakeSpdlogBasicEntrant},
        {"spdlog rotating_file_sink_mt", MakeSpdlogRotatingEntrant},
        {"log4cplus", MakeLog4cplusEntrant},
        {"log4cxx", MakeLog4cxxEntrant},
        {"Boost.Log", MakeBoostLogEntrant},
        {"glog", MakeGlogEntrant},
        {"Qt message handler, text stream", MakeQtHandlerEntrant},
    };
    Require(LogMessage().size() == 100, QStringLiteral("the message does not have 100 characters"));
    for (LogEntrantDescription const& entrant : entrants)
        Check(entrant);
    return entrants;
}

std::string const& LogMessage()
{
    static const std::string message = "The index of the bookmarks was brought up to date after "
                                       "1234 changes, which took 56 milliseconds now";
    return message;
}
