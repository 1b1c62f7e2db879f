// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/LogIndex.h"
#include "app/logfile/LogUpdate.h"

#include <QDateTime>
#include <QElapsedTimer>
#include <QObject>
#include <QString>

#include <atomic>
#include <memory>

class QFile;
class QFileSystemWatcher;
class QTimer;

namespace Velocor {

/// Reads a log file in its own thread and reports the rows for a view of it.
///
/// The file is read in slices through an ordinary handle: with a mapped file, the program would
/// crash if the file were truncated. A pass ends where the file ended when it began, however fast
/// the file grows. During a long one, what has been found so far is reported again and again. The
/// file is identified by its first bytes, by those before the position where reading resumes, and
/// by those of its last complete lines; if any have changed, it is another file or another run and
/// is read from the start. So it is if the file was modified and nothing new is found where it is
/// expected.
///
/// With SetWatched(), changes are read as they happen. The system tells of them; where it does not,
/// as on network file systems or when it has no watches left, the scanner polls.
///
/// Requests are numbered; SetCurrentRequest() with a later number cancels work on an earlier one.
/// SetCurrentRequest() and NoteTaken() may be called from any thread, everything else only from the
/// scanner's.
class LogScanner : public QObject
{
    Q_OBJECT

public:
    explicit LogScanner(QObject* parent = nullptr);

    /// Makes earlier requests obsolete.
    void SetCurrentRequest(int request) { m_currentRequest = request; }

    /// Tells that the last update has been dealt with. Until then, a scanner that is watched does
    /// not look for another one, so that they do not pile up.
    void NoteTaken() { m_isTaken = true; }

    /// How much is read at once, and after how long what has been found is reported while reading
    /// goes on.
    ///
    /// @param sliceSize  in bytes
    /// @param interval  in milliseconds; 0: after each slice
    /// @param firstInterval  for the first part of a file that has not been shown before
    void SetPace(int sliceSize, int interval, int firstInterval);
    void SetPace(int sliceSize, int interval) { SetPace(sliceSize, interval, interval); }

    /// The interval between checks for changes where the system does not tell of them, and the
    /// longest delay where it does, in milliseconds.
    static constexpr int PollInterval = 250;

public Q_SLOTS:
    /// Reads a file from its start.
    void Open(int request, QString const& path, Velocor::LogLineParser const& parser,
              Velocor::LogFilter const& filter);

    /// Follows changes or stops to do so. Needs an event loop.
    void SetWatched(bool watched);

    /// Checks for changes and reads them. Always emits polled() at the end.
    void Poll();

    /// Reports the rows of the same file that match another filter.
    void SetFilter(int request, Velocor::LogFilter const& filter);

Q_SIGNALS:
    void updated(Velocor::LogUpdate const& update);
    void progressed(int request, int percent);
    void polled();

private:
    bool isCurrentRequest() const { return m_currentRequest == m_request; }
    bool isComplete() const { return m_complete && m_isSearched; }
    void readFromStart(bool isOneRun);
    bool searchAgain();
    bool search(QFile& file);
    bool readFrom(QFile& file);
    bool feed(QByteArray const& slice, qint64 count);
    int reportProgress(qint64 offset, qint64 size, int reported);
    void readChanges(QFile& file);
    bool looksUnchanged() const;
    bool isSameFile(QFile& file) const;
    void noteFile(QFile& file);
    void reportMissing();
    void watch();
    void noteChange();
    void look();
    void reportPart();
    void report(bool isPartial = false);
    void startOver(bool isOneRun);
    LogFileType typeOf(QFile& file) const;
    bool hasNewType(QFile& file) const;

    std::atomic<int> m_currentRequest{0};
    std::atomic<bool> m_isTaken{true};
    int m_request = 0;
    QString m_path;
    LogLineParser m_parser;
    LogFilter m_filter;
    LogIndex m_index;
    std::shared_ptr<LogRows const> m_rows;

    int m_sliceSize = 1 << 17; // stays in the processor's cache
    int m_interval = 200;
    int m_firstInterval = 10;
    bool m_isNewFile = false; // nothing of it has been reported
    QElapsedTimer m_sinceReport;
    qint64 m_reportCost = 0;    // milliseconds
    bool m_isReset = true;      // the next update
    bool m_isPartial = false;   // the last update
    bool m_isOtherText = false; // of the filter, than when the last rows were made

    QFileSystemWatcher* m_watcher = nullptr;
    QTimer* m_lookTimer = nullptr;
    bool m_isWatched = false;
    bool m_isPolling = false;
    QString m_folder; // m_isLocal is about this one
    bool m_isLocal = false;
    bool m_isFolderChanged = false;
    int m_lookDelay = 0; // milliseconds
    QElapsedTimer m_sinceLook;

    bool m_exists = false;
    bool m_complete = false;  // the lines of the index
    bool m_isSearched = true; // all of them, for the text of the filter
    QString m_error;
    qint64 m_size = 0;
    QDateTime m_modified;
    QByteArray m_head;
    QByteArray m_anchor;
    qint64 m_anchorEnd = 0;
    QByteArray m_tail;
    size_t m_lines = 0; // as reported
    LogCounts m_counts{};
};

} // namespace Velocor

Q_DECLARE_METATYPE(Velocor::LogFilter)
Q_DECLARE_METATYPE(Velocor::LogLineParser)
