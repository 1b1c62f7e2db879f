// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/LogOverview.h"

#include "app/logfile/LogSeverities.h"
#include "app/window/log/LogModel.h"
#include "app/window/log/LogView.h"
#include "app/window/log/TickColors.h"
#include "app/window/widgets/PlainText.h"
#include "app/window/widgets/SeverityIcons.h"

#include <QApplication>
#include <QHelpEvent>
#include <QPainter>
#include <QScrollBar>
#include <QStyle>
#include <QStyleOptionSlider>
#include <QWheelEvent>

#include <algorithm>

namespace Velocor {

namespace {

constexpr int LaneWidth = 4; // pixels, as are the next ones
constexpr int EdgeMargin = 1;
constexpr int TickSize = 2;
constexpr int Reach = 3; // of a click, on both sides

// About a millisecond.
constexpr size_t RowsAtOnce = 100 * 1000;

// In a log that is followed, ticks hardly move, but finding them among all rows and painting them
// costs far more than a new row.
constexpr int FirstShowDelay = 200; // milliseconds
constexpr int ShowDelay = 1000;     // milliseconds

constexpr int ToolTipLength = 200; // characters of a line

size_t RowCount(int first, int last)
{
    return static_cast<size_t>(last) - static_cast<size_t>(first) + 1;
}

} // namespace

LogOverview::LogOverview(LogModel* model, LogView* view, QWidget* parent)
    : QWidget(parent), m_model(model), m_view(view)
{
    setAccessibleName(tr("Overview"));
    setAccessibleDescription(tr("Where problems, lines found and marks are among all lines shown"));
    setSizePolicy(QSizePolicy::Fixed, QSizePolicy::Expanding);
    m_lookTimer.setSingleShot(true);
    m_showTimer.setSingleShot(true);
    connect(&m_lookTimer, &QTimer::timeout, this, &LogOverview::look);
    connect(&m_showTimer, &QTimer::timeout, this, QOverload<>::of(&QWidget::update));

    reset();
    connect(model, &LogModel::modelReset, this, &LogOverview::reset);
    connect(model, &LogModel::rowsInserted, this, [this](QModelIndex const&, int first, int last) {
        m_problems.Insert(static_cast<size_t>(first), RowCount(first, last));
        m_isOutdated = true;
        m_lookTimer.start(); // repeats may have been opened
    });
    connect(model, &LogModel::rowsRemoved, this, [this](QModelIndex const&, int first, int last) {
        m_problems.Remove(static_cast<size_t>(first), RowCount(first, last));
        m_isOutdated = true;
        m_lookTimer.start();
    });
    connect(model, &LogModel::dataChanged, this,
            [this](QModelIndex const& first, QModelIndex const& last) {
                m_problems.Change(static_cast<size_t>(first.row()),
                                  RowCount(first.row(), last.row()));
                m_isOutdated = true;
            });
    connect(model, &LogModel::refreshed, this, &LogOverview::look);
    view->verticalScrollBar()->installEventFilter(this);
    view->viewport()->installEventFilter(this);
}

QSize LogOverview::sizeHint() const
{
    return QSize(LaneCount * LaneWidth + 2 * EdgeMargin, 0);
}

void LogOverview::SetFound(Rows const& rows)
{
    setRows(Found, rows);
}

void LogOverview::SetMarked(Rows const& rows)
{
    setRows(Marked, rows);
}

void LogOverview::setRows(Lane lane, Rows const& rows)
{
    if (rows == m_rows[lane])
        return;
    m_rows[lane] = rows;
    update();
}

void LogOverview::reset()
{
    m_problems.Reset(static_cast<size_t>(m_model->rowCount()));
    m_isOutdated = true;
    m_isReset = true;
}

quint8 LogOverview::markAt(size_t tableRow) const
{
    const int row = m_model->RowAt(static_cast<int>(tableRow));
    return m_model->state().rows->mark(static_cast<size_t>(row));
}

ProblemBlocks::Marks LogOverview::marks() const
{
    return [this](size_t tableRow) {
        return markAt(tableRow);
    };
}

// Between two refreshes, the rows of the model are those that the blocks have been told of.
void LogOverview::look()
{
    if (!m_problems.isComplete()) {
        m_problems.Look(marks(), RowsAtOnce);
        m_isOutdated = true;
    }
    if (m_isOutdated && !m_showTimer.isActive()) {
        m_showTimer.start(m_isReset ? FirstShowDelay : ShowDelay);
        m_isReset = false;
    }
    if (!m_problems.isComplete())
        m_lookTimer.start();
}

// What moves the scroll bar moves the ticks.
bool LogOverview::eventFilter(QObject* watched, QEvent* event)
{
    switch (event->type()) {
    case QEvent::Resize:
    case QEvent::Move:
    case QEvent::Show:
    case QEvent::Hide:
        update();
        break;
    default:
        break;
    }
    return QWidget::eventFilter(watched, event);
}

// Where the rows are from top to bottom: beside the groove of the scroll bar, or beside the lines
// if there is none.
QRect LogOverview::ground() const
{
    QWidget const* beside = m_view->viewport();
    QRect rows = beside->rect();
    QScrollBar const* bar = m_view->verticalScrollBar();
    if (bar->isVisible()) {
        QStyleOptionSlider option;
        option.initFrom(bar);
        option.orientation = Qt::Vertical;
        option.subControls = QStyle::SC_All;
        option.minimum = bar->minimum();
        option.maximum = bar->maximum();
        option.pageStep = bar->pageStep();
        rows = bar->style()->subControlRect(QStyle::CC_ScrollBar, &option,
                                            QStyle::SC_ScrollBarGroove, bar);
        beside = bar;
    }
    const int top = mapFromGlobal(beside->mapToGlobal(rows.topLeft())).y();
    return QRect(0, top, width(), rows.height());
}

int LogOverview::partCount() const
{
    return std::max(1, ground().height() - TickSize + 1);
}

// The first table row of a part or of one below; the number of them for the part after the last
// one.
int LogOverview::firstTableRow(int part) const
{
    const auto parts = static_cast<qint64>(m_worst.size());
    return static_cast<int>((qint64(part) * m_model->rowCount() + parts - 1) / parts);
}

// Before anything else that depends on the parts: their number follows the scroll bar's groove,
// which the style has to be asked for.
void LogOverview::updateParts()
{
    const auto parts = static_cast<size_t>(partCount());
    if (!m_isOutdated && parts == m_worst.size())
        return;
    m_worst = m_problems.Worst(marks(), parts);
    m_isOutdated = false;
}

bool LogOverview::hasTick(Lane lane, int part) const
{
    if (lane == Problems) {
        const auto at = static_cast<size_t>(part);
        return at < m_worst.size() && m_worst[at] != ProblemBlocks::NoProblem;
    }
    return tickIn(lane, part) >= 0;
}

// The row of a tick; -1 if there is none.
int LogOverview::tickIn(Lane lane, int part) const
{
    const int firstShown = firstTableRow(part);
    const int endShown = firstTableRow(part + 1);
    if (lane != Problems) {
        if (!m_rows[lane])
            return -1;
        const int first = m_model->RowAt(firstShown);
        const int end = m_model->RowAt(endShown);
        const auto row = std::lower_bound(m_rows[lane]->begin(), m_rows[lane]->end(), first);
        return row != m_rows[lane]->end() && *row < end ? *row : -1;
    }
    LogEntry::Severity worst = ProblemBlocks::NoProblem;
    int found = -1;
    for (int shown = firstShown; shown < endShown; ++shown) {
        const LogEntry::Severity problem =
            ProblemBlocks::ProblemOf(markAt(static_cast<size_t>(shown)));
        if (problem == worst || ProblemBlocks::Worse(problem, worst) == worst)
            continue;
        worst = problem;
        found = m_model->RowAt(shown);
    }
    return found;
}

void LogOverview::paintEvent(QPaintEvent* /*event*/)
{
    updateParts();
    const QRect area = ground();
    QPainter painter(this);
    painter.fillRect(area, palette().color(QPalette::Base));
    if (m_model->rowCount() == 0)
        return;
    const auto parts = static_cast<int>(m_worst.size());
    for (int part = 0; part < parts; ++part) {
        for (int lane = 0; lane < LaneCount; ++lane) {
            if (!hasTick(static_cast<Lane>(lane), part))
                continue;
            QColor color = SeverityIcons::Color(m_worst[static_cast<size_t>(part)], palette());
            if (lane == Found)
                color = TickColors::Found(palette());
            else if (lane == Marked)
                color = TickColors::Marked(palette());
            painter.fillRect(EdgeMargin + lane * LaneWidth, area.top() + part, LaneWidth, TickSize,
                             color);
        }
    }
}

// The nearest tick of each lane.
LogOverview::Place LogOverview::placeAt(int y) const
{
    Place place;
    const int last = static_cast<int>(m_worst.size()) - 1;
    const int at = y - ground().top();
    for (int lane = 0; lane < LaneCount; ++lane) {
        for (int distance = 0; distance <= Reach && place.rows[lane] < 0; ++distance) {
            for (const int part : {at - distance, at + distance}) {
                if (place.rows[lane] < 0 && part >= 0 && part <= last &&
                    hasTick(static_cast<Lane>(lane), part))
                    place.rows[lane] = tickIn(static_cast<Lane>(lane), part);
            }
        }
    }
    return place;
}

// The row that a click goes to. The model must have rows.
int LogOverview::rowAt(QPoint const& position) const
{
    const Place place = placeAt(position.y());
    const int lane = qBound(0, (position.x() - EdgeMargin) / LaneWidth, LaneCount - 1);
    for (const int tick :
         {place.rows[lane], place.rows[Marked], place.rows[Problems], place.rows[Found]}) {
        if (tick >= 0)
            return tick;
    }
    const int last = static_cast<int>(m_worst.size()) - 1;
    const int part = qBound(0, position.y() - ground().top(), last);
    const int row = m_model->RowAt(std::min(firstTableRow(part), m_model->rowCount() - 1));
    if (m_model->LineStart(row) >= 0) // not a heading
        return row;
    return row + 1 < m_model->logRowCount() ? row + 1 : row - 1;
}

QString LogOverview::lineOf(int row) const
{
    const QString text = m_model->CellText(row, LogModel::TimeColumn) + QLatin1Char(' ') +
                         m_model->CellText(row, LogModel::MessageColumn).left(ToolTipLength);
    return text.trimmed();
}

QString LogOverview::textOf(Place const& place) const
{
    QStringList lines;
    const auto add = [&](QString const& what, int row) {
        if (row >= 0)
            lines.append(tr("%1: %2").arg(what, LeftToRight(lineOf(row))));
    };
    if (place.rows[Problems] >= 0) {
        const auto row = static_cast<size_t>(place.rows[Problems]);
        add(LogSeverities::Name(m_model->state().rows->severity(row)), place.rows[Problems]);
    }
    add(tr("Found"), place.rows[Found]);
    add(tr("Marked"), place.rows[Marked]);
    return lines.join(QLatin1Char('\n'));
}

bool LogOverview::event(QEvent* event)
{
    if (event->type() != QEvent::ToolTip)
        return QWidget::event(event);
    updateParts();
    auto const* help = static_cast<QHelpEvent*>(event);
    ShowPlainToolTip(help->globalPos(), textOf(placeAt(help->pos().y())), this);
    return true;
}

void LogOverview::mousePressEvent(QMouseEvent* event)
{
    if (event->button() != Qt::LeftButton || m_model->rowCount() == 0)
        return;
    updateParts();
    m_view->GoToRow(rowAt(event->pos()));
    m_view->setFocus();
}

void LogOverview::wheelEvent(QWheelEvent* event)
{
    QApplication::sendEvent(m_view->verticalScrollBar(), event);
}

} // namespace Velocor
