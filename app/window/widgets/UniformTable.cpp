// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/widgets/UniformTable.h"

#include <QAbstractButton>
#include <QCursor>
#include <QHeaderView>
#include <QPaintEvent>
#include <QPainter>
#include <QScopedValueRollback>
#include <QScrollBar>

#include <algorithm>
#include <limits>

namespace Velocor {

namespace {

// As many as QTableView measures.
constexpr int MeasuredRows = 1000;

// A vertical header without rows, whatever the model has: it would keep a record of each.
class HeaderWithoutRows : public QHeaderView
{
public:
    explicit HeaderWithoutRows(QWidget* parent) : QHeaderView(Qt::Vertical, parent) { hide(); }

    void setModel(QAbstractItemModel* /*model*/) override {}
    void setSelectionModel(QItemSelectionModel* /*selectionModel*/) override {}
    void setRootIndex(QModelIndex const& /*index*/) override {}
};

} // namespace

UniformTable::UniformTable(QWidget* parent) : QTableView(parent)
{
    setVerticalHeader(new HeaderWithoutRows(this));
    verticalHeader()->hide();
    setShowGrid(false);
    setVerticalScrollMode(ScrollPerItem);
    setHorizontalScrollMode(ScrollPerPixel);
    if (auto* corner = findChild<QAbstractButton*>())
        corner->hide();
}

void UniformTable::setModel(QAbstractItemModel* newModel)
{
    for (QMetaObject::Connection const& connection : qAsConst(m_connections))
        disconnect(connection);
    m_connections.clear();
    QTableView::setModel(newModel);
    if (!newModel)
        return;
    // Usually, the vertical header does so.
    m_connections.append(
        connect(newModel, &QAbstractItemModel::rowsRemoved, this, &UniformTable::layOutAgain));
    m_connections.append(
        connect(newModel, &QAbstractItemModel::modelReset, this, &UniformTable::layOutAgain));
}

// What is painted may have to be painted again before the layout is due: until then, scrolling
// would move it.
void UniformTable::layOutAgain()
{
    viewport()->update();
    scheduleDelayedItemsLayout();
}

void UniformTable::rowsInserted(QModelIndex const& parent, int first, int last)
{
    QTableView::rowsInserted(parent, first, last);
    if (last + 1 < rowCount()) {
        layOutAgain();
        return;
    }
    m_firstNew = m_firstNew < 0 ? first : std::min(m_firstNew, first);
    updateGeometries();
    movePainted();
}

void UniformTable::SetRowHeight(int height)
{
    m_rowHeight = std::max(1, height);
    layOutAgain();
}

void UniformTable::SetLeftMargin(int width)
{
    if (width == m_leftMargin)
        return;
    m_leftMargin = width;
    updateGeometries();
}

int UniformTable::rowHeight(int row) const
{
    return heightOf(row);
}

int UniformTable::heightOf(int /*row*/) const
{
    return m_rowHeight;
}

int UniformTable::rowCount() const
{
    return model() ? model()->rowCount(rootIndex()) : 0;
}

// Whole ones.
int UniformTable::rowsInView() const
{
    return rowsThatFit(viewport()->height());
}

int UniformTable::rowsThatFit(int height) const
{
    return std::max(1, height / m_rowHeight);
}

bool UniformTable::isSpanning(int /*row*/) const
{
    return false;
}

bool UniformTable::isIndexHidden(QModelIndex const& index) const
{
    return isSpanning(index.row()) ? index.column() > 0 : isColumnHidden(index.column());
}

int UniformTable::verticalOffset() const
{
    return -topOf(0);
}

// Where a row starts in the viewport. At the end of the table, the last row ends with it; before,
// the first row in view starts with it.
int UniformTable::topOf(int row) const
{
    QScrollBar const* const bar = verticalScrollBar();
    const bool isAtEnd = bar->maximum() > 0 && bar->value() == bar->maximum();
    const qint64 rest = viewport()->height() - heightOfRows(rowCount() - bar->value());
    const qint64 shift = isAtEnd && rest > 0 && rest < m_rowHeight ? rest : 0;
    return withinInt(heightOfRows(row - bar->value()) + shift);
}

qint64 UniformTable::heightOfRows(int count) const
{
    return qint64(count) * m_rowHeight;
}

// A hundred million rows are higher than an int can tell. Far outside the viewport, it does not
// matter how far.
int UniformTable::withinInt(qint64 y)
{
    constexpr qint64 FarOutside = std::numeric_limits<int>::max() / 2;
    return static_cast<int>(qBound(-FarOutside, y, FarOutside));
}

// The row that would be there if there were rows without end.
int UniformTable::rowPast(int y) const
{
    const int first = verticalScrollBar()->value();
    const int below = y - topOf(first);
    return first + (below >= 0 ? below / m_rowHeight : -((m_rowHeight - 1 - below) / m_rowHeight));
}

int UniformTable::rowAt(int y) const
{
    const int row = rowPast(y);
    return row >= 0 && row < rowCount() ? row : -1;
}

QRect UniformTable::visualRect(QModelIndex const& index) const
{
    if (!index.isValid() || index.model() != model())
        return QRect();
    if (!isSpanning(index.row()) && isColumnHidden(index.column()))
        return QRect();
    const int y = topOf(index.row());
    const auto rectOf = [&](int column) {
        return QRect(columnViewportPosition(column), y, columnWidth(column), heightOf(index.row()));
    };
    return isSpanning(index.row()) ? rectOf(edgeColumn(1)) | rectOf(edgeColumn(-1))
                                   : rectOf(index.column());
}

QModelIndex UniformTable::indexAt(QPoint const& position) const
{
    const int row = rowAt(position.y());
    const int column = columnAt(position.x());
    if (row < 0 || column < 0)
        return QModelIndex();
    return model()->index(row, isSpanning(row) ? 0 : column, rootIndex());
}

void UniformTable::scrollTo(QModelIndex const& index, ScrollHint hint)
{
    if (!index.isValid() || index.model() != model() || isIndexHidden(index))
        return;
    const QSize view = viewport()->size();
    QScrollBar* const across = horizontalScrollBar();
    const int left = horizontalHeader()->sectionPosition(index.column());
    const int width = visualRect(index).width();
    if (hint == PositionAtCenter)
        across->setValue(left - (view.width() - width) / 2);
    else if (left < across->value() || width > view.width())
        across->setValue(left);
    else if (left + width > across->value() + view.width())
        across->setValue(left + width - view.width());

    verticalScrollBar()->setValue(topFor(index.row(), hint));
    update(index);
}

int UniformTable::topFor(int row, ScrollHint hint) const
{
    const int top = verticalScrollBar()->value();
    if (hint == PositionAtTop || (hint == EnsureVisible && row < top))
        return row;
    if (hint == PositionAtBottom || (hint == EnsureVisible && row >= top + rowsInView()))
        return row - rowsInView() + 1;
    if (hint == PositionAtCenter)
        return row - std::max(1, viewport()->height() / 2 / m_rowHeight) + 1;
    return top;
}

void UniformTable::scrollContentsBy(int dx, int /*dy*/)
{
    if (dx != 0) {
        horizontalHeader()->setOffset(horizontalScrollBar()->value());
        viewport()->update();
    }
    movePainted();
}

void UniformTable::moveOnceAfter(std::function<void()> const& change)
{
    {
        const QScopedValueRollback<bool> guard(m_isMovingLater, true);
        change();
    }
    movePainted();
}

// For the goal for following in docs/performance.md: painting is most of what a new line costs.
// tst_PlainPainting compares with painting everything.
void UniformTable::movePainted()
{
    if (m_isMovingLater || m_isUpdatingGeometries)
        return;
    const int distance = topOf(m_paintedRow) - m_paintedTop;
    m_paintedRow = verticalScrollBar()->value();
    m_paintedTop = topOf(m_paintedRow);
    if (qAbs(distance) >= viewport()->height()) {
        viewport()->update();
    } else if (distance != 0) {
        viewport()->scroll(0, distance);
        updateHovered();
    }
    if (m_firstNew >= 0)
        updateBetween(topOf(m_firstNew), viewport()->height());
    m_firstNew = -1;
}

// The row that was below the mouse when it was painted, and the one that is there now.
void UniformTable::updateHovered()
{
    const bool isHovered = viewport()->testAttribute(Qt::WA_Hover) && viewport()->underMouse();
    const int row = isHovered ? rowPast(viewport()->mapFromGlobal(QCursor::pos()).y()) : -1;
    if (row == m_hoveredRow)
        return;
    for (const int changed : {m_hoveredRow, row}) {
        if (changed >= 0)
            updateBetween(topOf(changed), topOf(changed + 1));
    }
    m_hoveredRow = row;
}

// Qt only knows the cell that was below the mouse when the mouse moved last.
bool UniformTable::viewportEvent(QEvent* event)
{
    const bool result = QTableView::viewportEvent(event);
    if (event->type() == QEvent::HoverMove || event->type() == QEvent::HoverLeave)
        updateHovered();
    return result;
}

// What is painted between two heights has changed.
void UniformTable::updateBetween(int top, int bottom)
{
    const QRect area(0, top, viewport()->width(), bottom - top);
    viewport()->update(area & viewport()->rect());
}

void UniformTable::updateGeometries()
{
    if (m_isUpdatingGeometries)
        return;
    {
        const QScopedValueRollback<bool> guard(m_isUpdatingGeometries, true);
        placeHeaderAndBars();
    }
    movePainted();
}

void UniformTable::placeHeaderAndBars()
{
    QHeaderView* const header = horizontalHeader();
    int height = 0;
    if (!header->isHidden())
        height = std::min(std::max(header->minimumHeight(), header->sizeHint().height()),
                          header->maximumHeight());
    setViewportMargins(m_leftMargin, height, 0, 0);
    updateScrollBars();
    const QRect view = viewport()->geometry();
    header->setGeometry(view.left(), view.top() - height, view.width(), height);
    updateScrollBars(); // the last column takes the width that is left
    header->setOffset(horizontalScrollBar()->value());
    // Not that of QTableView, which asks the vertical header.
    QAbstractItemView::updateGeometries(); // NOLINT(bugprone-parent-virtual-call)
}

// A scroll bar that appears may take away the space that made the other one needless.
void UniformTable::updateScrollBars()
{
    const int length = horizontalHeader()->length();
    const QSize most = maximumViewportSize();
    const bool fitsAll = most.width() >= length && rowsThatFit(most.height()) >= rowCount();
    const int width = fitsAll ? most.width() : viewport()->width();
    horizontalScrollBar()->setPageStep(width);
    horizontalScrollBar()->setRange(0, std::max(0, length - width));
    horizontalScrollBar()->setSingleStep(
        std::max(2, width / std::max(1, horizontalHeader()->count() + 1)));

    const int rows = std::min(fitsAll ? rowCount() : rowsInView(), rowCount());
    verticalScrollBar()->setPageStep(rows);
    verticalScrollBar()->setRange(0, std::max(0, rowCount() - rows));
    verticalScrollBar()->setSingleStep(1);
}

// Qt 6 has renamed the virtual function.
QStyleOptionViewItem UniformTable::cellOptions() const
{
#if QT_VERSION < QT_VERSION_CHECK(6, 0, 0)
    return viewOptions();
#else
    QStyleOptionViewItem option;
    initViewItemOption(&option);
    return option;
#endif
}

int UniformTable::sizeHintForColumn(int column) const
{
    ensurePolished();
    const QStyleOptionViewItem option = cellOptions();
    // Those in view, and as many before as after them.
    const int before = (MeasuredRows - rowsInView()) / 2;
    const int first =
        std::max(0, std::min(verticalScrollBar()->value() - before, rowCount() - MeasuredRows));
    const int end = std::min(rowCount(), first + MeasuredRows);
    int width = 0;
    for (int row = first; row < end; ++row) {
        const QModelIndex index = model()->index(row, column, rootIndex());
        if (!isSpanning(row))
            width = std::max(width, itemDelegate(index)->sizeHint(option, index).width());
    }
    return width;
}

int UniformTable::neighborColumn(int column, int step) const
{
    const int count = horizontalHeader()->count();
    for (int next = column + step; next >= 0 && next < count; next += step) {
        if (!isColumnHidden(next))
            return next;
    }
    return column;
}

// The first (step 1) or last (step -1) column that is shown.
int UniformTable::edgeColumn(int step) const
{
    return step > 0 ? neighborColumn(-1, 1) : neighborColumn(horizontalHeader()->count(), -1);
}

int UniformTable::pageFrom(int row, int step) const
{
    return qBound(0, row + step * rowsInView(), rowCount() - 1);
}

QModelIndex UniformTable::moveCursor(CursorAction action, Qt::KeyboardModifiers modifiers)
{
    const int last = rowCount() - 1;
    if (last < 0 || edgeColumn(1) < 0)
        return QModelIndex();
    const QModelIndex current = currentIndex();
    if (!current.isValid())
        return model()->index(0, edgeColumn(1), rootIndex());

    int row = current.row();
    int column = current.column();
    if (isColumnHidden(column))
        column = neighborColumn(column, -1);
    const int forward = isRightToLeft() ? -1 : 1;
    switch (action) {
    case MoveUp:
        row = std::max(0, row - 1);
        break;
    case MoveDown:
        row = std::min(last, row + 1);
        break;
    case MovePageUp:
        row = pageFrom(row, -1);
        break;
    case MovePageDown:
        row = pageFrom(row, 1);
        break;
    case MovePrevious:
    case MoveLeft:
        column = neighborColumn(column, -forward);
        break;
    case MoveNext:
    case MoveRight:
        column = neighborColumn(column, forward);
        break;
    case MoveHome:
        column = edgeColumn(1);
        if (modifiers & Qt::ControlModifier)
            row = 0;
        break;
    case MoveEnd:
        column = edgeColumn(-1);
        if (modifiers & Qt::ControlModifier)
            row = last;
        break;
    }
    return model()->index(row, isSpanning(row) ? 0 : column, rootIndex());
}

void UniformTable::setSelection(QRect const& rect, QItemSelectionModel::SelectionFlags command)
{
    // From one corner to the other. QRect::normalized() of Qt 6 leaves the corners out.
    const auto [left, right] = std::minmax({rect.left(), rect.right()});
    const auto [top, bottom] = std::minmax({rect.top(), rect.bottom()});
    const QModelIndex first = indexAt(QPoint(left, top));
    const QModelIndex last = indexAt(QPoint(right, bottom));
    if (!selectionModel() || !first.isValid() || !last.isValid())
        return;
    selectionModel()->select(QItemSelection(first, last), command);
}

QRegion UniformTable::visualRegionForSelection(QItemSelection const& selection) const
{
    QRegion region;
    for (QItemSelectionRange const& range : selection) {
        const int first = std::max(rowPast(0), range.top());
        const int last = std::min(rowPast(viewport()->height()), range.bottom());
        if (first <= last)
            region += QRect(0, topOf(first), viewport()->width(),
                            topOf(last) + heightOf(last) - topOf(first));
    }
    return region;
}

void UniformTable::paintEvent(QPaintEvent* event)
{
    if (rowCount() == 0 || horizontalHeader()->count() == 0)
        return;
    const bool isHovered = viewport()->testAttribute(Qt::WA_Hover) && viewport()->underMouse();
    m_hovered = isHovered ? indexAt(viewport()->mapFromGlobal(QCursor::pos())) : QModelIndex();
    QPainter painter(viewport());
    const QStyleOptionViewItem option = cellOptions();
    const QRect area = event->rect();
    const int first = std::max(0, rowPast(area.top()));
    const int last = std::min(rowCount() - 1, rowPast(area.bottom()));
    for (int row = first; row <= last; ++row) {
        if (event->region().intersects(QRect(0, topOf(row), area.right() + 1, heightOf(row))))
            paintRow(painter, option, row);
    }
    if (area == viewport()->rect())
        m_hoveredRow = m_hovered.row();
    m_hovered = QModelIndex();
}

void UniformTable::paintRow(QPainter& painter, QStyleOptionViewItem const& option, int row)
{
    QStyleOptionViewItem cell = option;
    if (alternatingRowColors() && row % 2 == 1)
        cell.features |= QStyleOptionViewItem::Alternate;
    const int columns = isSpanning(row) ? 1 : horizontalHeader()->count();
    for (int column = 0; column < columns; ++column) {
        const QModelIndex index = model()->index(row, column, rootIndex());
        cell.rect = visualRect(index);
        if (cell.rect.intersects(viewport()->rect()))
            paintCell(painter, cell, index);
    }
}

// As QTableView does it.
void UniformTable::paintCell(QPainter& painter, QStyleOptionViewItem option,
                             QModelIndex const& index)
{
    if (selectionModel() && selectionModel()->isSelected(index))
        option.state |= QStyle::State_Selected;
    if (index == m_hovered)
        option.state |= QStyle::State_MouseOver;
    if (option.state & QStyle::State_Enabled) {
        const bool isEnabled = model()->flags(index) & Qt::ItemIsEnabled;
        option.state.setFlag(QStyle::State_Enabled, isEnabled);
        option.palette.setCurrentColorGroup(isEnabled ? QPalette::Normal : QPalette::Disabled);
    }
    if (index == currentIndex() && (hasFocus() || viewport()->hasFocus()))
        option.state |= QStyle::State_HasFocus;
    style()->drawPrimitive(QStyle::PE_PanelItemViewRow, &option, &painter, this);
    itemDelegate(index)->paint(&painter, option, index);
}

} // namespace Velocor
