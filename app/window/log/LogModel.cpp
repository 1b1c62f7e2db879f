// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/LogModel.h"

#include "app/logfile/LogScanner.h"
#include "app/logfile/LogSeverities.h"
#include "app/window/widgets/PlainText.h"
#include "app/window/widgets/SeverityIcons.h"

#include <QFileInfo>
#include <QGuiApplication>
#include <QPalette>

#include <algorithm>
#include <limits>

namespace Velocor {

namespace {

// Control characters would break rows or be invisible.
QString OnOneLine(QString text)
{
    for (QChar& c : text) {
        if (c.unicode() < 0x20 || c.unicode() == 0x7f)
            c = QLatin1Char(' ');
    }
    return text;
}

} // namespace

LogModel::LogModel(QObject* parent) : QAbstractTableModel(parent), m_entries(1000)
{
    m_state.rows = std::make_shared<LogRows>();
    m_pollTimer.setInterval(PollInterval);
    connect(&m_pollTimer, &QTimer::timeout, this, &LogModel::poll);
}

LogModel::~LogModel()
{
    if (m_scanner)
        m_scanner->SetCurrentRequest(-1);
    m_thread.quit();
    m_thread.wait();
}

// Not in the constructor, because starting a thread slows down startup.
void LogModel::startScanner()
{
    if (m_scanner)
        return;
    m_scanner = new LogScanner;
    m_scanner->moveToThread(&m_thread);
    connect(&m_thread, &QThread::finished, m_scanner, &QObject::deleteLater);
    connect(this, &LogModel::openRequested, m_scanner, &LogScanner::Open);
    connect(this, &LogModel::filterRequested, m_scanner, &LogScanner::SetFilter);
    connect(this, &LogModel::pollRequested, m_scanner, &LogScanner::Poll);
    connect(m_scanner, &LogScanner::updated, this, &LogModel::take);
    connect(m_scanner, &LogScanner::polled, this, [this] { m_polling = false; });
    connect(m_scanner, &LogScanner::progressed, this, [this](int request, int percent) {
        if (request == m_request && m_reading)
            Q_EMIT progressed(percent);
    });
    m_thread.start();
}

void LogModel::Open(QString const& path, LogLineParser const& parser, bool isCurrent)
{
    m_path = path;
    m_parser = parser;
    m_isCurrent = isCurrent;
    Reload();
}

void LogModel::Reload()
{
    if (m_path.isEmpty())
        return;
    startScanner();
    m_reading = true;
    m_scanner->SetCurrentRequest(++m_request);
    Q_EMIT openRequested(m_request, m_path, m_parser, m_filter);
    if (!m_paused)
        m_pollTimer.start();
}

void LogModel::SetFilter(LogFilter const& filter)
{
    m_filter = filter;
    if (!m_scanner)
        return;
    m_reading = true;
    m_scanner->SetCurrentRequest(++m_request);
    Q_EMIT filterRequested(m_request, m_filter);
}

void LogModel::SetPaused(bool paused)
{
    m_paused = paused;
    if (paused) {
        m_pollTimer.stop();
    } else if (m_scanner) {
        m_pollTimer.start();
        poll();
    }
}

void LogModel::poll()
{
    if (m_polling || m_reading)
        return;
    m_polling = true;
    Q_EMIT pollRequested();
}

void LogModel::take(LogUpdate const& update)
{
    if (update.request != m_request)
        return;
    const bool wasReading = m_reading;
    m_reading = false;
    m_entries.clear();
    if (update.isReset || wasReading)
        reset(update);
    else if (!m_paused)
        applyChange(update);
    if (wasReading)
        Q_EMIT progressed(100);
    Q_EMIT refreshed();
}

void LogModel::reset(LogUpdate const& update)
{
    beginResetModel();
    m_file.close();
    m_state = update;
    m_rowCount = static_cast<int>(update.rows->size());
    endResetModel();
}

// First the earlier runs, whose first rows the newest run overwrites, then the new rows at the end.
// In between, views see the new rows except those at the end.
void LogModel::applyChange(LogUpdate const& update)
{
    const int at = static_cast<int>(update.changeAt);
    const int difference = static_cast<int>(update.inserted) - static_cast<int>(update.removed);
    const int changed = static_cast<int>(std::min(update.inserted, update.removed));
    if (difference < 0)
        beginRemoveRows(QModelIndex(), at, at - difference - 1);
    else if (difference > 0)
        beginInsertRows(QModelIndex(), at, at + difference - 1);
    m_state = update;
    m_rowCount += difference;
    if (difference < 0)
        endRemoveRows();
    else if (difference > 0)
        endInsertRows();
    if (changed > 0) {
        const int first = at + std::max(difference, 0);
        Q_EMIT dataChanged(index(first, 0), index(first + changed - 1, ColumnCount - 1));
    }

    const int tail = static_cast<int>(update.changedTail);
    if (tail > 0)
        Q_EMIT dataChanged(index(m_rowCount - tail, 0), index(m_rowCount - 1, ColumnCount - 1));
    const int total = static_cast<int>(update.rows->size());
    if (total > m_rowCount) {
        beginInsertRows(QModelIndex(), m_rowCount, total - 1);
        m_rowCount = total;
        endInsertRows();
    }
}

void LogModel::SetMarks(QHash<qint64, QString> const& marks)
{
    m_marks = marks;
}

int LogModel::FindProblem(int row, int step) const
{
    LogRows const& rows = *m_state.rows;
    for (row += step; row >= 0 && row < m_rowCount; row += step) {
        const auto position = static_cast<size_t>(row);
        if (LogSeverities::IsProblem(rows.severity(position)) &&
            !(rows.marks[position] & LogRows::Continued))
            return row;
    }
    return -1;
}

int LogModel::RowNear(qint64 start) const
{
    std::vector<qint64> const& starts = m_state.rows->starts;
    int nearest = -1;
    qint64 least = std::numeric_limits<qint64>::max();
    for (size_t row = 0; row < starts.size() && least > 0; ++row) {
        const qint64 distance = starts[row] < 0 ? least : qAbs(starts[row] - start);
        if (distance < least) {
            least = distance;
            nearest = static_cast<int>(row);
        }
    }
    return nearest;
}

bool LogModel::isHeading(int row) const
{
    return m_state.rows->starts[static_cast<size_t>(row)] < 0;
}

QString LogModel::LineText(int row, int limit) const
{
    if (row < 0 || row >= m_rowCount || isHeading(row))
        return QString();
    if (!m_file.isOpen()) {
        m_file.setFileName(m_path);
        if (!QFileInfo(m_path).isFile() ||
            !m_file.open(QIODevice::ReadOnly | QIODevice::Unbuffered))
            return QString();
    }
    if (!m_file.seek(m_state.rows->starts[static_cast<size_t>(row)]))
        return QString();

    QByteArray line = m_file.read(std::min(limit, 1024));
    int end = line.indexOf('\n');
    if (end < 0 && line.size() == 1024 && limit > 1024) {
        line += m_file.read(limit - 1024);
        end = line.indexOf('\n');
    }
    if (end >= 0)
        line.truncate(end);
    if (line.endsWith('\r'))
        line.chop(1);
    return QString::fromLatin1(line);
}

LogEntry const& LogModel::entry(int row) const
{
    const qint64 start = m_state.rows->starts[static_cast<size_t>(row)];
    if (LogEntry const* known = m_entries.object(start))
        return *known;

    auto* found = new LogEntry;
    const QString line = LineText(row, ShownLimit);
    if (m_state.rows->marks[static_cast<size_t>(row)] & LogRows::Torn)
        found->message = line;
    else
        *found = m_parser.Parse(line.toLatin1());
    found->message = OnOneLine(found->message);
    m_entries.insert(start, found);
    return *found;
}

QString LogModel::headingText(int row) const
{
    const qint64 start = m_state.rows->starts[static_cast<size_t>(row)];
    if (start == LogRows::EarlierHeading)
        return tr("Earlier");
    return m_isCurrent ? tr("This run") : tr("Latest run in this file");
}

QString LogModel::cellText(int row, int column) const
{
    if (isHeading(row))
        return column == 0 ? headingText(row) : QString();

    switch (column) {
    case TimeColumn:
        return entry(row).time;
    case SeverityColumn:
        return LogSeverities::Name(entry(row).severity);
    case ElapsedColumn:
        return entry(row).elapsed.isEmpty() ? QString() : tr("%1 ms").arg(entry(row).elapsed);
    default:
        return entry(row).message;
    }
}

QString LogModel::toolTip(int row, int column) const
{
    if (isHeading(row))
        return QString();
    const QString note = m_marks.value(LineStart(row));
    if (!note.isEmpty() && column != MessageColumn)
        return tr("Note: %1").arg(note);
    if (m_state.rows->marks[static_cast<size_t>(row)] & LogRows::Torn)
        return tr("Remainder of an entry that a later run overwrote");
    if (column != MessageColumn)
        return QString();
    return cellText(row, column);
}

int LogModel::rowCount(QModelIndex const& parent) const
{
    return parent.isValid() ? 0 : m_rowCount;
}

int LogModel::columnCount(QModelIndex const& parent) const
{
    return parent.isValid() ? 0 : static_cast<int>(ColumnCount);
}

QVariant LogModel::data(QModelIndex const& index, int role) const
{
    const int row = index.row();
    if (!index.isValid() || row >= m_rowCount)
        return QVariant();

    switch (role) {
    case Qt::DisplayRole:
        return cellText(row, index.column());
    case Qt::AccessibleTextRole:
        return index.column() == TimeColumn && m_marks.contains(LineStart(row))
                   ? tr("Marked: %1").arg(cellText(row, TimeColumn))
                   : cellText(row, index.column());
    case Qt::DecorationRole:
        if (index.column() == SeverityColumn && !isHeading(row) && entry(row).isEntry)
            return SeverityIcons::Icon(entry(row).severity, QGuiApplication::palette());
        return QVariant();
    case Qt::ToolTipRole:
        return PlainToolTip(toolTip(row, index.column()));
    case Qt::TextAlignmentRole:
        return index.column() == ElapsedColumn ? int(Qt::AlignRight | Qt::AlignVCenter)
                                               : int(Qt::AlignLeft | Qt::AlignVCenter);
    case SeverityRole:
        return static_cast<int>(m_state.rows->severity(static_cast<size_t>(row)));
    case HeadingRole:
        return isHeading(row);
    case EarlierRole:
        return static_cast<size_t>(row) < m_state.rows->earlier;
    case MarkedRole:
        return m_marks.contains(LineStart(row));
    case ContextRole:
        return bool(m_state.rows->marks[static_cast<size_t>(row)] & LogRows::Context);
    case NoteRole:
        return m_marks.value(LineStart(row));
    default:
        return QVariant();
    }
}

QVariant LogModel::headerData(int section, Qt::Orientation orientation, int role) const
{
    if (orientation != Qt::Horizontal)
        return QVariant();
    if (role == Qt::TextAlignmentRole)
        return int((section == ElapsedColumn ? Qt::AlignRight : Qt::AlignLeft) | Qt::AlignVCenter);
    if (role != Qt::DisplayRole)
        return QVariant();
    switch (section) {
    case TimeColumn:
        return tr("Time");
    case SeverityColumn:
        return tr("Severity");
    case ElapsedColumn:
        return tr("Elapsed");
    default:
        return tr("Message");
    }
}

Qt::ItemFlags LogModel::flags(QModelIndex const& index) const
{
    if (!index.isValid())
        return Qt::NoItemFlags;
    return isHeading(index.row())
               ? Qt::ItemFlags(Qt::ItemIsEnabled)
               : Qt::ItemIsEnabled | Qt::ItemIsSelectable | Qt::ItemNeverHasChildren;
}

} // namespace Velocor
