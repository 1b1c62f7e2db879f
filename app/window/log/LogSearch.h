// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/LogFinder.h"

#include <QObject>
#include <QThread>

#include <memory>
#include <vector>

namespace Velocor {

class LogModel;

/// Where a text is in the rows of a model, kept up to date while rows arrive.
///
/// A LogFinder in another thread does the searching. GUI thread.
class LogSearch : public QObject
{
    Q_OBJECT

public:
    /// @param model  not owned
    explicit LogSearch(LogModel* model, QObject* parent = nullptr);
    ~LogSearch() override;

    /// Searches for the text of a filter; without one, there are no hits.
    void SetText(LogFilter const& text);
    LogFilter const& text() const { return m_text; }

    /// The rows found so far, ascending.
    std::shared_ptr<std::vector<int> const> const& hits() const { return m_hits.hits; }

    /// Whether all rows have been searched.
    bool isComplete() const;

    /// How many percent of the rows have been searched.
    int percent() const;

    /// See LogHits::slowLine.
    qint64 slowLine() const { return m_hits.slowLine; }

    /// The position of a row among the hits, starting at 1; 0 if it is none.
    int NumberOf(int row) const;

    enum class Answer {
        None,    ///< there is no hit
        Ahead,   ///< in the requested direction
        Wrapped, ///< from the other end
        Unknown  ///< not searched yet
    };

    /// Finds the next (step 1) or previous (step -1) hit from a row.
    ///
    /// @param hit  set to the row of the hit, if the answer is Ahead or Wrapped
    Answer Next(int row, int step, int& hit) const;

Q_SIGNALS:
    /// Hits, or how far the search has come.
    void changed();

    // To the finder's thread.
    void findRequested(Velocor::LogFindRequest const& request);

private:
    void startFinder();
    void request(bool isCancelling);
    void take(LogHits const& hits);
    void noteRefreshed();

    LogModel* m_model;
    QThread m_thread;
    LogFinder* m_finder = nullptr;
    LogFilter m_text;
    LogHits m_hits;
    int m_number = 0;
    bool m_isSearching = false;
    bool m_isOutdated = false; // the rows have changed since the request
    bool m_wasReset = true;    // and not just a few of them
};

} // namespace Velocor
