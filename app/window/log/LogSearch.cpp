// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/LogSearch.h"

#include "app/window/log/LogModel.h"

#include <algorithm>

namespace Velocor {

LogSearch::LogSearch(LogModel* model, QObject* parent) : QObject(parent), m_model(model)
{
    m_hits.hits = std::make_shared<std::vector<int>>();
    connect(model, &LogModel::modelReset, this, [this] { m_wasReset = true; });
    connect(model, &LogModel::refreshed, this, &LogSearch::noteRefreshed);
}

LogSearch::~LogSearch()
{
    if (m_finder)
        m_finder->SetCurrentRequest(m_number + 1);
    m_thread.quit();
    m_thread.wait();
}

void LogSearch::startFinder()
{
    if (m_finder)
        return;
    m_finder = new LogFinder;
    m_finder->moveToThread(&m_thread);
    connect(&m_thread, &QThread::finished, m_finder, &QObject::deleteLater);
    connect(this, &LogSearch::findRequested, m_finder, &LogFinder::Find);
    connect(m_finder, &LogFinder::found, this, &LogSearch::take);
    m_thread.start();
}

void LogSearch::SetText(LogFilter const& text)
{
    if (text.HasSameText(m_text))
        return;
    m_text = text;
    m_hits = LogHits();
    m_hits.hits = std::make_shared<std::vector<int>>();
    if (m_finder || text.hasText())
        request(true);
    Q_EMIT changed();
}

// A search that is under way goes on while rows are added: in a log that grows fast, it would
// otherwise never come to its end.
void LogSearch::noteRefreshed()
{
    if (!m_text.hasText())
        return;
    if (m_isSearching && !m_wasReset)
        m_isOutdated = true;
    else
        request(m_wasReset);
}

void LogSearch::request(bool isCancelling)
{
    startFinder();
    LogFindRequest request;
    request.type = m_model->parser().fileType();
    request.number = ++m_number;
    request.source = m_model->source();
    request.text = m_text;
    request.rows = m_text.hasText() ? m_model->state().rows : std::make_shared<LogRows>();
    request.isReset = isCancelling;
    if (isCancelling)
        m_finder->SetCurrentRequest(m_number);
    m_isSearching = true;
    m_isOutdated = false;
    m_wasReset = false;
    Q_EMIT findRequested(request);
}

void LogSearch::take(LogHits const& hits)
{
    if (hits.number != m_number)
        return;
    m_hits = hits;
    m_isSearching = !hits.isComplete;
    if (!m_isSearching && m_isOutdated)
        request(false);
    Q_EMIT changed();
}

bool LogSearch::isComplete() const
{
    return !m_text.hasText() || (m_hits.isComplete && m_hits.rows == m_model->state().rows);
}

int LogSearch::percent() const
{
    const qint64 rows = m_model->logRowCount();
    return rows > 0 ? static_cast<int>(std::min<qint64>(99, m_hits.searched * qint64(100) / rows))
                    : 99;
}

int LogSearch::NumberOf(int row) const
{
    std::vector<int> const& hits = *m_hits.hits;
    const auto found = std::lower_bound(hits.begin(), hits.end(), row);
    return found != hits.end() && *found == row ? static_cast<int>(found - hits.begin()) + 1 : 0;
}

// Rows that were found before the model changed may hold another line now.
LogSearch::Answer LogSearch::Next(int row, int step, int& hit) const
{
    if (!m_text.hasText())
        return Answer::None;
    std::vector<int> const& hits = *m_hits.hits;
    const auto after = std::upper_bound(hits.begin(), hits.end(), row);
    const auto from = std::lower_bound(hits.begin(), hits.end(), row);
    const bool isAhead = step > 0 ? after != hits.end() : from != hits.begin();
    const bool isKnown = isComplete() || (isAhead && row <= m_hits.searched);
    if (!isKnown)
        return Answer::Unknown;
    if (hits.empty())
        return Answer::None;

    int found = 0;
    if (step > 0)
        found = isAhead ? *after : hits.front();
    else
        found = isAhead ? *(from - 1) : hits.back();
    if (!isComplete() && (found >= m_model->logRowCount() ||
                          m_model->LineStart(found) != m_hits.rows->start(size_t(found))))
        return Answer::Unknown;
    hit = found;
    return isAhead ? Answer::Ahead : Answer::Wrapped;
}

} // namespace Velocor
