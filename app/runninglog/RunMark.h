// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/history/RunEnds.h"

#include <QByteArray>
#include <QString>

#include <vector>

namespace Velocor {

/// Marks this program as running, and records that it ended normally.
///
/// That is when this object is deleted or the program exits, which it also does when the connection
/// to the display breaks, at the end of a session. A program that is killed, crashes or loses power
/// leaves its mark behind, and the next one records that. GUI thread. Who reads this: RunEnds.
///
///     RunMark mark(RunningLog::FileName());
///     mark.CollectOthers();
class RunMark
{
public:
    /// Makes the mark. If it cannot be written, nobody will know how this run ended.
    ///
    /// @param log  path of the log's current file; empty: there is no log, so do nothing
    explicit RunMark(QString const& log);

    /// Removes the mark, and its folder if nobody else uses it.
    ~RunMark();

    RunMark(RunMark const&) = delete;
    RunMark& operator=(RunMark const&) = delete;

    /// Records the ends of programs that left their marks behind, and removes these.
    ///
    /// @return those that did not end normally, which no other program will be told again; the
    ///         earliest first
    std::vector<RunEnd> CollectOthers();

    /// Notes that the program has been running for a while, so that its end is not one soon after
    /// the start. To be called after RunEnds::ShortRun.
    void NoteLongLife() const;

    /// When this program began, see HistoryCursor::time().
    static qint64 ProgramStart();

private:
    static void endAll();
    void make(QString const& folder);
    void end();
    static qint64 latestEnd(QString const& mark, qint64 start);
    bool addRecord(QByteArray const& line) const;
    void shortenRecord() const;
    std::vector<RunEnd> withoutNormal(std::vector<RunEnd> ends) const;

    QString m_log;
    QByteArray m_recordFile;
    QByteArray m_folder;
    QByteArray m_path; // empty: there is no mark
    int m_file = -1;
    qint64 m_process = 0;
};

} // namespace Velocor
