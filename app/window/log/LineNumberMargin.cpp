// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/LineNumberMargin.h"

#include "app/window/log/LogModel.h"
#include "app/window/log/LogView.h"
#include "app/window/widgets/BlendedColor.h"
#include "app/window/widgets/RowHeight.h"

#include <QApplication>
#include <QLocale>
#include <QMouseEvent>
#include <QPainter>

#include <algorithm>

namespace Velocor {

namespace {

constexpr int NumberPadding = 8; // pixels on both sides
constexpr qulonglong UsualLines = 999;

// Dimmed, but still with a contrast of more than 4.5:1.
constexpr qreal NumberFade = 0.35;

} // namespace

LineNumberMargin::LineNumberMargin(LogView* view) : QWidget(view), m_view(view)
{
    setAccessibleName(tr("Line numbers"));
    hide();
    view->viewport()->installEventFilter(this);
    connect(view->model(), &QAbstractItemModel::modelReset, this, &LineNumberMargin::fit);
    connect(view->model(), &QAbstractItemModel::rowsInserted, this, &LineNumberMargin::fit);
}

void LineNumberMargin::SetShown(bool shown)
{
    m_isShown = shown;
    setVisible(shown);
    fit();
}

QString LineNumberMargin::TextOf(int tableRow) const
{
    const qulonglong number = m_view->LineNumber(m_view->LogRowOf(tableRow));
    return number > 0 ? QLocale().toString(number) : QString();
}

// As wide as the last number.
void LineNumberMargin::fit()
{
    int width = 0;
    if (m_isShown) {
        const QString widest = QLocale().toString(std::max(UsualLines, m_view->LineCount()));
        width = fontMetrics().boundingRect(widest).width() + 2 * NumberPadding;
    }
    m_view->SetLeftMargin(width);
    const QRect rows = m_view->viewport()->geometry();
    setGeometry(rows.left() - width, rows.top(), width, rows.height());
}

// Whatever makes the rows move paints them.
bool LineNumberMargin::eventFilter(QObject* watched, QEvent* event)
{
    if (m_isShown && event->type() == QEvent::Paint)
        update();
    else if (m_isShown && (event->type() == QEvent::Resize || event->type() == QEvent::Move))
        fit();
    return QWidget::eventFilter(watched, event);
}

void LineNumberMargin::changeEvent(QEvent* event)
{
    QWidget::changeEvent(event);
    if (event->type() == QEvent::FontChange)
        fit();
}

void LineNumberMargin::paintEvent(QPaintEvent* /*event*/)
{
    QPainter painter(this);
    painter.setLayoutDirection(layoutDirection());
    painter.fillRect(rect(), palette().color(QPalette::Window));
    const int first = m_view->rowAt(0);
    for (int row = first; row >= 0 && row < m_view->model()->rowCount(); ++row) {
        if (m_view->visualRect(m_view->FirstCell(row)).top() >= height())
            break;
        paintRow(painter, row);
    }
}

// Beside the first line of a wrapped message.
void LineNumberMargin::paintRow(QPainter& painter, int row) const
{
    QRect place = m_view->visualRect(m_view->FirstCell(row));
    place.setHeight(std::min(place.height(), RowHeight(fontMetrics())));
    place.setLeft(0);
    place.setRight(width() - 1 - NumberPadding);
    const bool isCurrent = row == m_view->currentIndex().row();
    const QColor text = palette().color(QPalette::WindowText);
    painter.setPen(isCurrent ? text : Blended(text, palette().color(QPalette::Window), NumberFade));
    painter.drawText(place, Qt::AlignRight | Qt::AlignVCenter, TextOf(row));
}

// The table does what it does for a click on its first cell, with Shift and Ctrl, too.
void LineNumberMargin::mousePressEvent(QMouseEvent* event)
{
    const QPointF place(1, event->pos().y());
    QMouseEvent click(event->type(), place, event->button(), event->buttons(), event->modifiers());
    QApplication::sendEvent(m_view->viewport(), &click);
    QMouseEvent release(QEvent::MouseButtonRelease, place, event->button(), Qt::NoButton,
                        event->modifiers());
    QApplication::sendEvent(m_view->viewport(), &release);
}

} // namespace Velocor
