// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/LogGoTo.h"

#include "app/window/log/LogModel.h"

namespace Velocor {

namespace {

QString MessageOf(LogLocation::Answer answer)
{
    switch (answer) {
    case LogLocation::Nearest:
        return LogGoTo::tr("The line is not shown; this is the nearest one");
    case LogLocation::Beyond:
        return LogGoTo::tr("The lines shown end before that");
    case LogLocation::NoTimes:
        return LogGoTo::tr("The lines have no times");
    case LogLocation::NoDates:
        return LogGoTo::tr("The times in this log have no dates");
    case LogLocation::NoSuchLine:
        return LogGoTo::tr("The file does not have so many lines");
    case LogLocation::Found:
        break;
    }
    return QString();
}

} // namespace

LogGoTo::LogGoTo(LogModel* model, QObject* parent) : QObject(parent), m_model(model) {}

LogGoTo::~LogGoTo()
{
    if (m_locator)
        m_locator->SetCurrentRequest(m_number + 1);
    m_thread.quit();
    m_thread.wait();
}

void LogGoTo::startLocator()
{
    if (m_locator)
        return;
    m_locator = new LogLocator;
    m_locator->moveToThread(&m_thread);
    connect(&m_thread, &QThread::finished, m_locator, &QObject::deleteLater);
    connect(this, &LogGoTo::locateRequested, m_locator, &LogLocator::Locate);
    connect(m_locator, &LogLocator::located, this, &LogGoTo::take);
    connect(m_locator, &LogLocator::progressed, this, [this](int request, int percent) {
        if (request == m_number)
            Q_EMIT started(tr("Looking for that time... %1%").arg(percent));
    });
    m_thread.start();
}

void LogGoTo::Find(LogPlace const& place, int currentRow)
{
    startLocator();
    LogLocateRequest request;
    request.number = ++m_number;
    request.source = m_model->source();
    request.parser = m_model->parser();
    request.place = place;
    request.rows = m_model->state().rows;
    request.currentRow = currentRow;
    if (place.kind == LogPlace::Line && m_model->isAll() && m_model->logRowCount() > 0)
        request.place.value += static_cast<qint64>(firstLine(currentRow));
    m_isLong = place.kind != LogPlace::Line && m_model->logRowCount() >= ManyRows;
    if (m_isLong)
        Q_EMIT started(tr("Looking for that time..."));
    m_locator->SetCurrentRequest(m_number);
    Q_EMIT locateRequested(request);
}

// Of all files, a number means a line of the one that the current line is in; without a current
// line, of the newest one.
size_t LogGoTo::firstLine(int currentRow) const
{
    int row = currentRow < 0 ? m_model->logRowCount() - 1 : currentRow;
    if (m_model->LineStart(row) < 0 && row + 1 < m_model->logRowCount())
        ++row; // from a heading to the first line below
    return m_model->FirstLineOfFile(row);
}

// The rows may have moved in the meantime.
void LogGoTo::take(LogLocation const& location)
{
    if (location.number != m_number)
        return;
    int row = location.row;
    if (row >= 0 && (row >= m_model->logRowCount() || m_model->LineStart(row) != location.start))
        row = m_model->RowNear(location.start);
    QString message = MessageOf(location.answer);
    if (message.isEmpty() && m_isLong)
        message = tr("Found"); // instead of what is said at the start
    Q_EMIT arrived(row, message);
}

} // namespace Velocor
