// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/history/HistoryUpdate.h"
#include "app/history/LogKeys.h"
#include "app/history/ProgramLogs.h"
#include "app/history/RepeatGroups.h"
#include "app/logfile/LogFilter.h"
#include "app/logfile/LogLineParser.h"
#include "app/logfile/LogScanner.h" // for signals to another thread, which need the types it declares

#include <QList>
#include <QMutex>
#include <QObject>
#include <QSet>
#include <QString>

#include <atomic>
#include <memory>
#include <vector>

class QTimer;

namespace Velocor {

class HistoryScanner;
struct FamilyLines;

/// Reads one log for a view of it or several logs, each with its older files, as one by time.
///
/// A HistoryScanner reads and follows each log; of a single one, its updates are passed on. The
/// lines of several logs are in the order of HistoryMerge: by LogKeys, at the same time in the
/// order of the logs. They have no headings, and the offsets of a LogSource with several logs.
///
/// Works as a HistoryScanner does: in a thread of its own, with numbered requests.
/// SetCurrentRequest(), NoteTaken() and SetFindsRepeats() may be called from any thread, everything
/// else only from the scanner's.
class FamilyScanner : public QObject
{
    Q_OBJECT

public:
    explicit FamilyScanner(QObject* parent = nullptr);
    ~FamilyScanner() override;

    /// Makes earlier requests obsolete.
    void SetCurrentRequest(int request);

    /// See LogScanner::NoteTaken().
    void NoteTaken();

    /// Whether updates tell which rows repeat each other. All rows are then read; false stops that.
    void SetFindsRepeats(bool finds);

public Q_SLOTS:
    /// Reads one log; see HistoryScanner::Open().
    void Open(int request, QString const& path, Velocor::LogLineParser const& parser,
              Velocor::LogFilter const& filter, bool isAll);

    /// Reads several logs. They are reported when all of them have been read. Logs whose lines are
    /// read in another way than those of the first one that has lines are left out.
    ///
    /// @param hidden  paths of those that are not to be shown
    void OpenFamily(int request, QList<Velocor::ProgramLog> const& logs,
                    Velocor::LogLineParser const& parser, Velocor::LogFilter const& filter,
                    QSet<QString> const& hidden);

    /// Shows or hides logs. Until others are opened.
    void SetHidden(QSet<QString> const& hidden);

    /// Follows changes or stops to do so. Needs an event loop.
    void SetWatched(bool watched);

    /// Checks for changes, reads and reports them.
    void Poll();

    /// Reports the rows of the same logs that match another filter.
    void SetFilter(int request, Velocor::LogFilter const& filter);

    /// See HistoryScanner::SetFolded(). Several logs have no runs to fold.
    void SetFolded(quint64 run, bool folded);

Q_SIGNALS:
    void updated(Velocor::HistoryUpdate const& update);
    void progressed(int request, int percent);

private Q_SLOTS:
    void reportPending();
    void updateRepeats();

private:
    struct Log;

    bool isCurrentRequest() const { return m_currentRequest == m_request; }
    void close();
    void add(ProgramLog const& log);
    void take(Log& log, HistoryUpdate const& update);
    void reportProgress(int percent);
    bool updateKeys();
    void report(bool isFolding);
    void makeSource();
    void appendLines();
    void mergeRows(LogRows& rows) const;
    std::vector<FamilyLines> linesOfLogs() const;
    HistoryUpdate summary() const;
    void send(HistoryUpdate update);
    void findRepeats(HistoryUpdate& update);

    std::atomic<int> m_currentRequest{0};
    std::atomic<bool> m_isTaken{true};
    mutable QMutex m_mutex; // for m_logs, which only this thread changes
    std::vector<std::unique_ptr<Log>> m_logs;
    int m_request = 0;
    bool m_isFamily = false;
    bool m_isWatched = false;
    bool m_isAsking = false; // all logs, one after the other
    size_t m_asked = 0;      // how many of them have answered
    bool m_isPending = false;
    bool m_isReset = true;
    LogLineParser m_parser;
    QTimer* m_reportTimer = nullptr;

    std::shared_ptr<std::vector<LogSource> const> m_sources;
    LineTable m_lines; // of all logs, one after the other
    std::shared_ptr<LogRows const> m_rows;

    std::atomic<bool> m_findsRepeats{false};
    RepeatGroups m_repeats;
    HistoryUpdate m_sent; // last
};

} // namespace Velocor

Q_DECLARE_METATYPE(Velocor::ProgramLog)
