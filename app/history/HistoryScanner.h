// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/history/HistoryUpdate.h"
#include "app/history/OlderHistory.h"
#include "app/history/RowsInSpan.h"
#include "app/history/RunEnds.h"
#include "app/history/RunList.h"
#include "app/logfile/LogFilter.h"
#include "app/logfile/LogLineParser.h"
#include "app/logfile/LogScanner.h"

#include <QElapsedTimer>
#include <QObject>
#include <QSet>
#include <QString>

#include <atomic>
#include <memory>
#include <vector>

class QTimer;

namespace Velocor {

/// Reads a log for a view of it, either one file or all of them as one: the numbered files and what
/// earlier runs left in the current file, oldest first, each run with a heading.
///
/// A LogScanner reads and follows the current file. Its rows come after those of the older files,
/// which are read again only when they have changed, as after a rotation.
///
/// Works as a LogScanner does: in a thread of its own, with numbered requests.
/// SetCurrentRequest() and NoteTaken() may be called from any thread, everything else only from the
/// scanner's.
class HistoryScanner : public QObject
{
    Q_OBJECT

public:
    explicit HistoryScanner(QObject* parent = nullptr);
    ~HistoryScanner() override;

    /// Makes earlier requests obsolete.
    void SetCurrentRequest(int request);

    /// See LogScanner::NoteTaken().
    void NoteTaken() { m_scanner->NoteTaken(); }

public Q_SLOTS:
    /// Reads a log from its start.
    ///
    /// @param path  with `isAll`, the current file, which need not exist
    /// @param isAll  whether to read the older files, too; then the filter shows earlier runs
    void Open(int request, QString const& path, Velocor::LogLineParser const& parser,
              Velocor::LogFilter const& filter, bool isAll);

    /// Follows changes or stops to do so. Needs an event loop.
    void SetWatched(bool watched);

    /// Checks for changes and reads them. Always emits polled() at the end.
    void Poll() { m_scanner->Poll(); }

    /// Reports the rows of the same log that match another filter.
    void SetFilter(int request, Velocor::LogFilter const& filter);

    /// Shows only the heading of a run, or its rows again. Lasts until another log is opened.
    ///
    /// @param run  as RunHeading::id
    void SetFolded(quint64 run, bool folded);

Q_SIGNALS:
    void updated(Velocor::HistoryUpdate const& update);
    void progressed(int request, int percent);
    void polled();

private:
    bool isCurrentRequest() const { return m_currentRequest == m_request; }
    LogFilter wholeFilter(LogFilter filter) const;
    void take(LogUpdate const& update);
    void reportOne();
    std::shared_ptr<LogRows const> rowsInSpan(LogRows const& rows, RunList const& runs);
    void checkOlder();
    void checkEnds();
    void appendCurrentLines();
    RunList makeRuns();
    void report(bool isFolding);

    LogScanner* m_scanner;
    QTimer* m_endTimer = nullptr;
    std::atomic<int> m_currentRequest{0};
    int m_request = 0;
    bool m_isAll = false;
    bool m_isWatched = false;
    QString m_path;
    LogLineParser m_parser;

    OlderHistory m_older;
    LogSpan m_span;
    RowsInSpan m_inSpan;
    std::shared_ptr<OlderLogFiles const> m_files; // whose lines are in m_lines
    LineTable m_lines;                            // of all files
    LineTable m_appended;                         // of the current file, as they are in m_lines
    LogUpdate m_current;
    bool m_hasCurrent = false;
    bool m_isReset = true;
    QSet<quint64> m_folded;
    std::vector<RunEnd> m_ends;
    QElapsedTimer m_sinceEnds;
    HistoryRun::Exit m_newestExit = HistoryRun::Unknown;
    std::shared_ptr<LogRows const> m_rows;
};

} // namespace Velocor
