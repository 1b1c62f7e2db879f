// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/LogFileType.h"
#include "app/logfile/LogFilter.h"
#include "app/logfile/LogRows.h"
#include "app/logfile/LogSource.h"

#include <QMetaType>
#include <QObject>
#include <QString>

#include <atomic>
#include <memory>
#include <vector>

namespace Velocor {

class LogLineReader;

/// What a LogFinder is to find, and where.
struct LogFindRequest
{
    int number = 0;
    LogSource source;
    LogFileType type;
    LogFilter text; ///< only its text counts
    std::shared_ptr<LogRows const> rows;
    bool isReset = true; ///< whether the file may be another one than at the previous request
};

/// What a LogFinder has found so far.
struct LogHits
{
    int number = 0; ///< that of the request
    std::shared_ptr<LogRows const> rows;
    std::shared_ptr<std::vector<int> const> hits; ///< rows that match, ascending
    int searched = 0;                             ///< rows searched, from the first
    bool isComplete = false;
    qint64 slowLine = 0; ///< number of the line, starting at 1, that the expression takes too long
                         ///< for; 0 if there is none. With it, there are no hits.
};

/// Searches the rows of a log view for a text, in its own thread and with its own file handle.
///
/// If only a few rows have changed since the previous request, only those are searched. Requests
/// are numbered; SetCurrentRequest() with a later number cancels work on an earlier one, and may be
/// called from any thread, everything else only from the finder's.
class LogFinder : public QObject
{
    Q_OBJECT

public:
    explicit LogFinder(QObject* parent = nullptr);

    /// Makes earlier requests obsolete.
    void SetCurrentRequest(int request) { m_currentRequest = request; }

public Q_SLOTS:
    /// Searches, and emits found() several times a second until everything is searched.
    void Find(Velocor::LogFindRequest const& request);

Q_SIGNALS:
    void found(Velocor::LogHits const& hits);

private:
    bool isCancelled() const { return m_currentRequest > m_request.number; }
    bool isSameText(LogFindRequest const& request) const;
    void findAll(LogLineReader& reader);
    bool findChanged(LogLineReader& reader, LogHits const& before);
    bool search(LogLineReader& reader, size_t from, size_t to, bool isReported);
    void keep(std::vector<int> const& before, size_t from, size_t to, qint64 offset);
    void report(size_t searched, bool isComplete);
    qint64 numberOfLine(qint64 start) const;

    std::atomic<int> m_currentRequest{0};
    LogFindRequest m_request;
    std::vector<int> m_found;
    qint64 m_slowStart = -1;
    LogHits m_complete; // the last result that was complete
};

} // namespace Velocor

Q_DECLARE_METATYPE(Velocor::LogFindRequest)
Q_DECLARE_METATYPE(Velocor::LogHits)
