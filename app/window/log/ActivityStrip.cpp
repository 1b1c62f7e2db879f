// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/ActivityStrip.h"

#include "app/logfile/DayNumber.h"
#include "app/logfile/Milliseconds.h"
#include "app/window/log/LogModel.h"
#include "app/window/log/LogView.h"
#include "app/window/widgets/BlendedColor.h"
#include "app/window/widgets/Contrast.h"
#include "app/window/widgets/PlainText.h"
#include "app/window/widgets/SeverityIcons.h"

#include <QDateTime>
#include <QHelpEvent>
#include <QKeyEvent>
#include <QLocale>
#include <QPainter>
#include <QWheelEvent>

#include <algorithm>
#include <cmath>

namespace Velocor {

namespace {

constexpr int BarWidth = 4; // pixels with the gap after it, as are the next ones
constexpr int BarHeight = 40;
constexpr int Frame = 1;
constexpr int LeastProblem = 2; // height

// In a log that is followed, new entries hardly change the bars.
constexpr int FirstCountDelay = 50;  // milliseconds
constexpr int NextCountDelay = 1000; // milliseconds

constexpr double ZoomStep = 0.75; // of the span, for a step of the wheel
constexpr int WheelStep = 120;    // as Qt counts

// A grey with a contrast of more than 3:1.
constexpr qreal EntryStrength = 0.5;

// A local time, in UTC: those that a change of clocks skips exist there, too.
QDateTime DateTimeOf(qint64 time)
{
    const qint64 days = time / Milliseconds::Day - DayNumber(2000, 1, 1);
    return QDateTime(QDate(2000, 1, 1).addDays(days),
                     QTime::fromMSecsSinceStartOfDay(static_cast<int>(time % Milliseconds::Day)),
                     Qt::UTC);
}

} // namespace

ActivityStrip::ActivityStrip(LogModel* model, LogView* view, QWidget* parent)
    : QWidget(parent), m_model(model), m_view(view)
{
    setAccessibleName(tr("Activity"));
    setLayoutDirection(Qt::LeftToRight); // as are the bars: the end of the log is on the right
    setFocusPolicy(Qt::StrongFocus);
    setSizePolicy(QSizePolicy::Expanding, QSizePolicy::Fixed);
    hide();
    m_timer.setSingleShot(true);
    connect(&m_timer, &QTimer::timeout, this, &ActivityStrip::count);
    connect(model, &LogModel::refreshed, this, [this] {
        m_isOutdated = true;
        countSoon();
    });
}

ActivityStrip::~ActivityStrip()
{
    if (m_counter)
        m_counter->SetCurrentRequest(m_number + 1);
    m_thread.quit();
    m_thread.wait();
}

void ActivityStrip::SetShown(bool shown)
{
    setVisible(shown);
    countSoon();
}

QSize ActivityStrip::sizeHint() const
{
    return QSize(0, BarHeight + 2 * Frame + fontMetrics().height());
}

void ActivityStrip::startCounter()
{
    if (m_counter)
        return;
    m_counter = new ActivityCounter;
    m_counter->moveToThread(&m_thread);
    connect(&m_thread, &QThread::finished, m_counter, &QObject::deleteLater);
    connect(this, &ActivityStrip::countRequested, m_counter, &ActivityCounter::Count);
    connect(m_counter, &ActivityCounter::counted, this, &ActivityStrip::take);
    m_thread.start();
}

// Not while a request is under way, or a log that grows fast would cancel each.
void ActivityStrip::countSoon()
{
    if (!m_isOutdated || m_isCounting || m_timer.isActive() || isHidden())
        return;
    const bool isOther = m_path != m_model->path() || m_activity.state != Activity::Known;
    m_timer.start(isOther || m_model->state().isReset ? FirstCountDelay : NextCountDelay);
}

void ActivityStrip::count()
{
    if (isHidden())
        return;
    if (m_path != m_model->path()) {
        m_path = m_model->path();
        m_from = -1;
        m_to = -1;
        m_chosen = -1;
    }
    startCounter();
    ActivityRequest request;
    request.number = ++m_number;
    request.source = m_model->source();
    request.parser = m_model->parser();
    request.rows = m_model->state().rows;
    request.from = m_from;
    request.to = m_to;
    request.parts = partCount();
    m_isCounting = true;
    m_isOutdated = false;
    m_counter->SetCurrentRequest(m_number);
    Q_EMIT countRequested(request);
}

void ActivityStrip::take(Activity const& activity)
{
    if (activity.number != m_number)
        return;
    m_isCounting = false;
    m_activity = activity;
    m_chosen = std::min(m_chosen, barCount() - 1);
    m_anchor = std::min(m_anchor, barCount() - 1);
    describe();
    update();
    countSoon();
    Q_EMIT shown();
}

void ActivityStrip::describe()
{
    if (m_activity.state != Activity::Known) {
        setAccessibleDescription(placeholder());
        return;
    }
    size_t entries = 0;
    size_t problems = 0;
    for (Activity::Bar const& bar : m_activity.bars) {
        entries += bar.entries();
        problems += bar.problems();
    }
    setAccessibleDescription(tr("%1 to %2: %L3 entries, %L4 problems")
                                 .arg(timeText(m_activity.from), timeText(m_activity.to))
                                 .arg(static_cast<qulonglong>(entries))
                                 .arg(static_cast<qulonglong>(problems)));
}

QRect ActivityStrip::ground() const
{
    return QRect(Frame, Frame, width() - 2 * Frame, BarHeight);
}

int ActivityStrip::partCount() const
{
    return std::max(1, ground().width() / BarWidth);
}

QRect ActivityStrip::BarRect(int bar) const
{
    return QRect(ground().left() + bar * BarWidth, ground().top(), BarWidth - 1, BarHeight);
}

int ActivityStrip::barAt(int x) const
{
    return qBound(0, (x - ground().left()) / BarWidth, std::max(0, barCount() - 1));
}

QString ActivityStrip::placeholder() const
{
    return m_activity.state == Activity::NoDates ? tr("The times in this log have no dates")
                                                 : tr("No times");
}

// With milliseconds where bars are shorter than a second.
QString ActivityStrip::timeText(qint64 time) const
{
    const bool isShort = m_activity.to - m_activity.from < Milliseconds::Second * barCount();
    return DateTimeOf(time).toString(isShort ? QStringLiteral("yyyy-MM-dd HH:mm:ss.zzz")
                                             : QStringLiteral("yyyy-MM-dd HH:mm:ss"));
}

QString ActivityStrip::textOf(int bar) const
{
    Activity::Bar const& counted = m_activity.bars[static_cast<size_t>(bar)];
    return tr("%1: %L2 entries, %L3 problems")
        .arg(timeText(m_activity.TimeOf(bar)))
        .arg(static_cast<qulonglong>(counted.entries()))
        .arg(static_cast<qulonglong>(counted.problems()));
}

// Problems at the bottom, the worst first, and high enough to be seen among many entries.
void ActivityStrip::paintBar(QPainter& painter, int bar, size_t most) const
{
    Activity::Bar const& counted = m_activity.bars[static_cast<size_t>(bar)];
    if (counted.entries() == 0)
        return;
    const QRect area = BarRect(bar);
    const auto heightOf = [most](size_t count) {
        return static_cast<int>((count * BarHeight + most - 1) / most);
    };
    const int top = area.bottom() + 1 - heightOf(counted.entries());
    painter.fillRect(
        area.left(), top, area.width(), area.bottom() + 1 - top,
        Blended(palette().color(QPalette::Base), palette().color(QPalette::Text), EntryStrength));
    int bottom = area.bottom() + 1;
    for (const LogEntry::Severity severity :
         {LogEntry::Fatal, LogEntry::Error, LogEntry::Warning}) {
        const size_t count = counted.counts[severity];
        if (count == 0)
            continue;
        const int height = std::max(LeastProblem, heightOf(count));
        bottom -= height;
        painter.fillRect(area.left(), std::max(area.top(), bottom), area.width(), height,
                         SeverityIcons::Color(severity, palette()));
    }
}

void ActivityStrip::paintTimes(QPainter& painter) const
{
    const QRect area(Frame, ground().bottom() + 1, ground().width(), fontMetrics().height());
    painter.setPen(palette().color(QPalette::WindowText));
    painter.drawText(area, Qt::AlignLeft | Qt::AlignVCenter, timeText(m_activity.from));
    painter.drawText(area, Qt::AlignRight | Qt::AlignVCenter, timeText(m_activity.to));
    if (m_chosen >= 0)
        painter.drawText(area, Qt::AlignHCenter | Qt::AlignVCenter, textOf(m_chosen));
}

void ActivityStrip::paintEvent(QPaintEvent* /*event*/)
{
    QPainter painter(this);
    painter.setLayoutDirection(layoutDirection()); // the painter has that of the application
    const QRect frame = ground().adjusted(-Frame, -Frame, Frame, Frame);
    const bool isFocused = hasFocus();
    const QColor base = palette().color(QPalette::Base);
    painter.fillRect(
        frame, isFocused ? WithContrast(palette().color(QPalette::Highlight), base, PartContrast)
                         : Blended(palette().color(QPalette::Window),
                                   palette().color(QPalette::WindowText), 0.3));
    painter.fillRect(isFocused ? ground().adjusted(Frame, Frame, -Frame, -Frame) : ground(), base);
    if (m_activity.state != Activity::Known) {
        painter.setPen(palette().color(QPalette::Text));
        painter.drawText(ground(), Qt::AlignCenter, placeholder());
        return;
    }
    QColor marked = palette().color(QPalette::Highlight);
    marked.setAlphaF(0.3);
    if (m_pressed >= 0 && m_dragged >= 0)
        painter.fillRect(BarRect(m_pressed) | BarRect(m_dragged), marked);
    else if (m_chosen >= 0)
        painter.fillRect(BarRect(m_chosen) | BarRect(m_anchor < 0 ? m_chosen : m_anchor), marked);
    size_t most = 1;
    for (Activity::Bar const& bar : m_activity.bars)
        most = std::max(most, bar.entries());
    for (int bar = 0; bar < barCount(); ++bar)
        paintBar(painter, bar, most);
    paintTimes(painter);
}

void ActivityStrip::resizeEvent(QResizeEvent* event)
{
    QWidget::resizeEvent(event);
    if (partCount() == barCount())
        return;
    m_isOutdated = true;
    m_timer.stop();
    countSoon();
}

bool ActivityStrip::event(QEvent* event)
{
    if (event->type() != QEvent::ToolTip)
        return QWidget::event(event);
    auto const* help = static_cast<QHelpEvent*>(event);
    ShowPlainToolTip(help->globalPos(), barCount() > 0 ? textOf(barAt(help->pos().x())) : QString(),
                     this);
    return true;
}

// To the first entry of a bar or, if it has none, of the next one that has.
bool ActivityStrip::goTo(int bar)
{
    for (int next = bar; next >= 0 && next < barCount(); ++next) {
        const qint64 start = m_activity.bars[static_cast<size_t>(next)].start;
        const int row = start >= 0 ? m_model->RowNear(start) : -1;
        if (row < 0)
            continue;
        m_view->GoToRow(row);
        return true;
    }
    return false;
}

void ActivityStrip::choose(int bar)
{
    m_chosen = bar;
    m_anchor = -1;
    update();
    if (bar >= 0)
        Q_EMIT messageReported(textOf(bar));
}

void ActivityStrip::mousePressEvent(QMouseEvent* event)
{
    if (event->button() != Qt::LeftButton || barCount() == 0)
        return;
    m_pressed = barAt(event->pos().x());
    m_dragged = -1;
}

// A click that trembles is no drag.
void ActivityStrip::mouseMoveEvent(QMouseEvent* event)
{
    const int bar = barAt(event->pos().x());
    if (m_pressed < 0 || (m_dragged < 0 && std::abs(bar - m_pressed) < 2))
        return;
    m_dragged = bar;
    update();
}

void ActivityStrip::mouseReleaseEvent(QMouseEvent* event)
{
    if (event->button() != Qt::LeftButton || m_pressed < 0)
        return;
    const int first = std::min(m_pressed, m_dragged);
    const int last = std::max(m_pressed, m_dragged);
    const bool isClick = m_dragged < 0;
    m_pressed = -1;
    m_dragged = -1;
    if (last >= barCount()) // counted again meanwhile
        return;
    if (!isClick) {
        chooseSpan(first, last);
    } else {
        choose(-1);
        if (goTo(last))
            m_view->setFocus();
    }
}

// All times if the span has them all.
void ActivityStrip::show(qint64 from, qint64 to)
{
    const qint64 least = std::max<qint64>(1, barCount()); // a millisecond for each bar
    if (to - from < least)
        to = from + least;
    const bool isAll = from <= m_activity.first && to > m_activity.last;
    m_from = isAll ? -1 : from;
    m_to = isAll ? -1 : to;
    m_chosen = -1;
    m_anchor = -1;
    m_timer.stop();
    count();
    update();
}

// The time at the bar stays where it is.
void ActivityStrip::zoom(int bar, double factor)
{
    const auto span = static_cast<double>(m_activity.to - m_activity.from);
    const auto whole = static_cast<double>(m_activity.last + 1 - m_activity.first);
    const double wanted = std::min(span * factor, whole);
    const double share = (bar + 0.5) / barCount();
    const double from = static_cast<double>(m_activity.from) + (span - wanted) * share;
    const double latest = static_cast<double>(m_activity.last + 1) - wanted;
    const auto begin = static_cast<qint64>(
        std::max(static_cast<double>(m_activity.first), std::min(from, latest)));
    show(begin, begin + static_cast<qint64>(std::ceil(wanted)));
}

void ActivityStrip::wheelEvent(QWheelEvent* event)
{
    if (m_activity.state != Activity::Known || event->angleDelta().y() == 0)
        return;
    const double steps = static_cast<double>(event->angleDelta().y()) / WheelStep;
    const int x = mapFromGlobal(QCursor::pos()).x();
    zoom(barAt(x), std::pow(ZoomStep, steps));
    event->accept();
}

// Chooses the bar beside; at an end, half of the times shown move on.
bool ActivityStrip::moveOn(int step)
{
    const int bar = m_chosen < 0 ? (step > 0 ? 0 : barCount() - 1) : m_chosen + step;
    if (bar >= 0 && bar < barCount()) {
        choose(bar);
        return true;
    }
    const qint64 span = m_activity.to - m_activity.from;
    const qint64 latest = m_activity.last + 1 - span;
    const qint64 from = qBound(m_activity.first, m_activity.from + step * (span / 2),
                               std::max(m_activity.first, latest));
    if (from == m_activity.from)
        return false;
    show(from, from + span);
    return true;
}

// The last moment of the last bar is the one before the next bar.
void ActivityStrip::chooseSpan(int one, int other)
{
    const LogSpan span{m_activity.TimeOf(std::min(one, other)),
                       m_activity.TimeOf(std::max(one, other) + 1) - 1};
    m_chosen = -1;
    m_anchor = -1;
    m_from = -1;
    m_to = -1;
    Q_EMIT spanChosen(span);
}

void ActivityStrip::extendTo(int bar)
{
    m_anchor = m_anchor >= 0 ? m_anchor : m_chosen >= 0 ? m_chosen : bar;
    m_chosen = bar;
    update();
    Q_EMIT messageReported(
        tr("%1 to %2")
            .arg(timeText(m_activity.TimeOf(std::min(m_anchor, m_chosen))),
                 timeText(m_activity.TimeOf(std::max(m_anchor, m_chosen) + 1) - 1)));
}

// With Shift; returns false if the key chooses no bar.
bool ActivityStrip::extend(int key)
{
    const int last = barCount() - 1;
    if (key == Qt::Key_Left)
        extendTo(m_chosen < 0 ? last : std::max(0, m_chosen - 1));
    else if (key == Qt::Key_Right)
        extendTo(std::min(last, m_chosen + 1));
    else if (key == Qt::Key_Home)
        extendTo(0);
    else if (key == Qt::Key_End)
        extendTo(last);
    else
        return false;
    return true;
}

// One step back for each call, in the end to the table.
void ActivityStrip::leave()
{
    if (m_anchor >= 0)
        choose(-1);
    else if (m_from >= 0)
        show(m_activity.first, m_activity.last + 1);
    else if (m_model->filter().span().isLimited())
        Q_EMIT spanChosen(LogSpan());
    else
        m_view->setFocus();
}

void ActivityStrip::keyPressEvent(QKeyEvent* event)
{
    if (m_activity.state != Activity::Known || barCount() == 0) {
        if (event->key() == Qt::Key_Escape && m_model->filter().span().isLimited())
            Q_EMIT spanChosen(LogSpan()); // the span may have left nothing
        else
            QWidget::keyPressEvent(event);
        return;
    }
    if ((event->modifiers() & Qt::ShiftModifier) && extend(event->key()))
        return;
    const int bar = m_chosen < 0 ? barCount() / 2 : m_chosen;
    switch (event->key()) {
    case Qt::Key_Left:
        moveOn(-1);
        break;
    case Qt::Key_Right:
        moveOn(1);
        break;
    case Qt::Key_Home:
        choose(0);
        break;
    case Qt::Key_End:
        choose(barCount() - 1);
        break;
    case Qt::Key_Return:
    case Qt::Key_Enter:
        if (m_anchor >= 0)
            chooseSpan(m_anchor, m_chosen);
        else
            goTo(m_chosen < 0 ? 0 : m_chosen);
        break;
    case Qt::Key_Plus:
    case Qt::Key_Equal:
        zoom(bar, ZoomStep);
        break;
    case Qt::Key_Minus:
        zoom(bar, 1 / ZoomStep);
        break;
    case Qt::Key_Escape:
        leave();
        break;
    default:
        QWidget::keyPressEvent(event);
    }
}

} // namespace Velocor
