// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/history/RunHeading.h"
#include "app/logfile/LogUpdate.h"
#include "app/logfile/OlderLogFiles.h"

#include <QMetaType>
#include <QStringList>

#include <memory>
#include <vector>

namespace Velocor {

/// What a HistoryScanner found.
///
/// If it reads all of a log, the lines are those of the older files, followed by those of the
/// current one, and so are the offsets. Each run has a heading: LogRows::NewestHeading that of the
/// last one, LogRows::FirstRunHeading minus its number those of the others.
struct HistoryUpdate : LogUpdate
{
    std::shared_ptr<OlderLogFiles const> older;          ///< null if only one file is read
    std::shared_ptr<std::vector<RunHeading> const> runs; ///< oldest first; null likewise
    QStringList unreadable; ///< paths of older files that cannot be read
    bool isFolding = false; ///< follows HistoryScanner::SetFolded(), not a change of the log
};

} // namespace Velocor

Q_DECLARE_METATYPE(Velocor::HistoryUpdate)
