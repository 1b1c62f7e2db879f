// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/LogMarks.h"

#include "app/logfile/LogLineReader.h"
#include "app/logfile/LogMarkFinder.h"
#include "app/window/log/LogMarkStore.h"
#include "app/window/log/LogModel.h"

#include <algorithm>

namespace Velocor {

LogMarks::LogMarks(LogModel* model, QObject* parent)
    : QObject(parent), m_model(model), m_rows(std::make_shared<std::vector<int>>())
{
    connect(model, &LogModel::modelReset, this, [this] { m_wasReset = true; });
    connect(model, &LogModel::rowsRemoved, this, [this] { m_haveMoved = true; });
    connect(model, &LogModel::dataChanged, this, [this] { m_haveMoved = true; });
    connect(model, &LogModel::rowsInserted, this, [this](QModelIndex const&, int first) {
        m_haveMoved = m_haveMoved || first < m_rowCount;
    });
    connect(model, &LogModel::refreshed, this, &LogMarks::noteRefreshed);
}

LogMarks::~LogMarks()
{
    if (m_finder)
        m_finder->SetCurrentRequest(m_request + 1);
    m_thread.quit();
    m_thread.wait();
}

void LogMarks::Load()
{
    m_source = LogSource(m_model->path());
    load();
}

// The files are known only when they have been read; each has marks of its own.
void LogMarks::load()
{
    m_marks.clear();
    for (LogSource::File const& file : m_source.Files()) {
        QVector<LogMark> marks = m_store ? m_store->Marks(file.path) : QVector<LogMark>();
        for (LogMark& mark : marks)
            mark.start += file.start;
        m_marks += marks;
    }
    ++m_request;
    update();
}

void LogMarks::noteRefreshed()
{
    if (m_model->source() != m_source && m_model->path() == m_source.path) {
        m_source = m_model->source();
        load();
        m_wasReset = true;
    }
    if (m_wasReset || (m_haveMoved && dropOverwritten()))
        find();
    if (m_wasReset || m_haveMoved) {
        update();
    } else if (m_model->logRowCount() > m_rowCount && !m_marks.isEmpty()) {
        auto rows = std::make_shared<std::vector<int>>(*m_rows);
        addRows(*rows, m_rowCount);
        m_rows = rows;
        m_model->SetMarkedRows(m_rows);
        Q_EMIT changed();
    }
    m_rowCount = m_model->logRowCount();
    m_wasReset = false;
    m_haveMoved = false;
}

// Another line may start exactly where a marked one did.
bool LogMarks::dropOverwritten()
{
    bool isDropped = false;
    LogLineReader reader;
    const bool isOpen = !m_marks.isEmpty() && reader.Open(m_source, m_model->parser().fileType());
    for (LogMark& mark : m_marks) {
        if (!mark.isFound || (isOpen && LogMark::IdentityOf(reader.Line(mark.start)) == mark.line))
            continue;
        mark.isFound = false;
        isDropped = true;
    }
    return isDropped;
}

void LogMarks::find()
{
    if (m_marks.isEmpty())
        return;
    if (!m_finder) {
        m_finder = new LogMarkFinder;
        m_finder->moveToThread(&m_thread);
        connect(&m_thread, &QThread::finished, m_finder, &QObject::deleteLater);
        connect(this, &LogMarks::findRequested, m_finder, &LogMarkFinder::Find);
        connect(m_finder, &LogMarkFinder::found, this, &LogMarks::take);
        m_thread.start();
    }
    m_finder->SetCurrentRequest(++m_request);
    Q_EMIT findRequested(m_request, m_source, m_marks, m_model->parser().fileType());
}

void LogMarks::take(int request, QVector<LogMark> const& marks)
{
    if (request != m_request)
        return;
    m_marks = marks;
    update();
}

void LogMarks::update()
{
    QHash<qint64, QString> notes;
    for (LogMark const& mark : qAsConst(m_marks)) {
        if (mark.isFound)
            notes.insert(mark.start, mark.note);
    }
    m_model->SetMarks(notes);
    auto rows = std::make_shared<std::vector<int>>();
    if (!notes.isEmpty())
        addRows(*rows, 0);
    m_rows = rows;
    m_model->SetMarkedRows(m_rows);
    m_rowCount = m_model->logRowCount();
    Q_EMIT changed();
}

// Adds the rows of marked lines from this row on.
void LogMarks::addRows(std::vector<int>& rows, int from) const
{
    std::vector<int> added;
    for (LogMark const& mark : m_marks) {
        const int row = mark.isFound ? m_model->RowNear(mark.start) : -1;
        if (row >= from && m_model->LineStart(row) == mark.start)
            added.push_back(row);
    }
    std::sort(added.begin(), added.end());
    added.erase(std::unique(added.begin(), added.end()), added.end());
    rows.insert(rows.end(), added.begin(), added.end());
}

int LogMarks::indexOf(int row) const
{
    if (row < 0 || row >= m_model->logRowCount())
        return -1;
    const qint64 start = m_model->LineStart(row);
    for (int i = 0; i < m_marks.size(); ++i) {
        if (m_marks.at(i).isFound && m_marks.at(i).start == start)
            return i;
    }
    return -1;
}

QString LogMarks::NoteOf(int row) const
{
    const int at = indexOf(row);
    return at < 0 ? QString() : m_marks.at(at).note;
}

QString LogMarks::Toggle(int row)
{
    const int at = indexOf(row);
    if (at < 0)
        return SetNote(row, QString());
    m_marks.removeAt(at);
    return save();
}

QString LogMarks::SetNote(int row, QString const& note)
{
    if (row < 0 || row >= m_model->logRowCount() || m_model->LineStart(row) < 0)
        return tr("Select a line first");
    int at = indexOf(row);
    if (at < 0) {
        if (m_marks.size() >= LogMark::MaximumMarks)
            return tr("A file can have %1 marks").arg(LogMark::MaximumMarks);
        at = m_marks.size();
        m_marks.append(
            LogMark::Of(m_source, m_model->LineStart(row), m_model->parser().fileType()));
    }
    m_marks[at].note = note.simplified().left(LogMark::MaximumNote);
    return save();
}

// A search that is under way would bring back the former marks.
QString LogMarks::save()
{
    ++m_request;
    update();
    if (!m_store)
        return QString();
    return m_source.older || m_source.logs ? saveAll() : m_store->SetMarks(m_source.path, m_marks);
}

// Each mark with the file in which its line is, also if that has been renamed.
QString LogMarks::saveAll()
{
    QString problem;
    for (LogSource::File const& file : m_source.Files()) {
        QVector<LogMark> marks;
        for (LogMark mark : qAsConst(m_marks)) {
            if (m_source.FileAt(mark.start).start != file.start)
                continue;
            mark.start -= file.start;
            marks.append(mark);
        }
        if (!marks.isEmpty() || !m_store->Marks(file.path).isEmpty())
            problem = m_store->SetMarks(file.path, marks);
    }
    return problem;
}

} // namespace Velocor
