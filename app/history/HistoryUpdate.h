// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/history/HistoryRun.h"
#include "app/history/RepeatGroup.h"
#include "app/history/RunHeading.h"
#include "app/logfile/LogSource.h"
#include "app/logfile/LogUpdate.h"
#include "app/logfile/OlderLogFiles.h"

#include <QMetaType>
#include <QStringList>

#include <memory>
#include <vector>

namespace Velocor {

/// One of several logs that are shown as one.
struct FamilyLog
{
    QString name;         ///< as ProgramLog::name
    bool isShown = true;  ///< false if the user has switched it off
    bool isOther = false; ///< left out, because its lines are read in another way than the others'
    qint64 complete = 0;  ///< as LogRows::complete() and LogRows::end(), among all offsets
    qint64 end = 0;
};

/// What a HistoryScanner or a FamilyScanner found.
///
/// If it reads all of a log, the lines are those of the older files, followed by those of the
/// current one, and so are the offsets. Each run has a heading: LogRows::NewestHeading that of the
/// last one, LogRows::FirstRunHeading minus its number those of the others.
struct HistoryUpdate : LogUpdate
{
    std::shared_ptr<OlderLogFiles const> older;              ///< null if only one file is read
    std::shared_ptr<std::vector<RunHeading> const> runs;     ///< oldest first; null likewise
    std::shared_ptr<std::vector<HistoryRun> const> runLines; ///< of these runs, in the same order
    QStringList unreadable; ///< paths of older files that cannot be read
    bool isFolding = false; ///< follows a wish to fold or unfold, not a change of the log

    /// The rows that repeat each other, by their first rows; null if that is not known,
    /// because nobody has asked or not all rows have been compared yet.
    std::shared_ptr<std::vector<RepeatGroup> const> repeats;

    // If several logs are shown as one: their bytes, and what they are. The rows have no headings.
    std::shared_ptr<std::vector<LogSource> const> logs; ///< null otherwise
    std::shared_ptr<std::vector<FamilyLog> const> family;
};

} // namespace Velocor

Q_DECLARE_METATYPE(Velocor::HistoryUpdate)
