// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/LogView.h"

#include "app/logfile/LogSeverities.h"
#include "app/window/log/HighlightRules.h"
#include "app/window/log/LogDelegate.h"
#include "app/window/log/LogModel.h"
#include "app/window/log/SteadyScrollBar.h"
#include "app/window/widgets/RowHeight.h"

#include <QAbstractButton>
#include <QContextMenuEvent>
#include <QEvent>
#include <QHeaderView>
#include <QPainter>
#include <QScopedValueRollback>
#include <QScrollBar>
#include <QStyle>

#include <algorithm>
#include <utility>

namespace Velocor {

namespace {

// How far the current line is looked for in a file that was replaced, in rows: this takes no longer
// than a frame or two.
constexpr int MaximumMove = 500 * 1000;

// In a log that is followed for days, they would take more and more memory.
constexpr int MostMeasuredRows = 1000;

// The heading above a row, or -1.
int HeadingAbove(LogRows const& rows, int row)
{
    while (row >= 0 && !rows.isHeading(static_cast<size_t>(row)))
        --row;
    return row;
}

} // namespace

LogView::LogView(LogModel* model, QWidget* parent)
    : WrappingTable(new LogDelegate, parent), m_model(model), m_bar(new SteadyScrollBar(this))
{
    setUp();
    setModel(model);
    SetDefaultWidths();
    hideColumn(LogModel::SinceColumn);
    hideColumn(LogModel::ProgramColumn);
    connect(verticalScrollBar(), &QScrollBar::valueChanged, this, &LogView::noteScrolled);
    connect(model, &LogModel::modelAboutToBeReset, this, &LogView::noteCurrent);
    connect(model, &LogModel::refreshed, this, &LogView::afterRefresh);
    connect(this, &LogView::clicked, this, [this](QModelIndex const& index) {
        const int row = m_model->RowAt(index.row());
        if (m_model->IsFoldable(row))
            fold(row, !m_model->IsFolded(row));
    });
}

LogDelegate* LogView::cells() const
{
    return static_cast<LogDelegate*>(itemDelegate());
}

void LogView::setUp()
{
    setAccessibleName(tr("Log entries"));
    setVerticalScrollBar(m_bar);
    setSelectionBehavior(SelectRows);
    setSelectionMode(ExtendedSelection);
    setEditTriggers(NoEditTriggers);
    setWordWrap(false);
    setTabKeyNavigation(false);
    setTextElideMode(Qt::ElideRight);
    setAlternatingRowColors(true);
    horizontalHeader()->setStretchLastSection(true);
    horizontalHeader()->setHighlightSections(false);
    horizontalHeader()->setSectionsMovable(false);
    horizontalHeader()->setAccessibleName(tr("Log columns"));
    verticalHeader()->setAccessibleName(tr("Log rows"));
    if (auto* corner =
            findChild<QAbstractButton*>()) // hidden along with the header, but still exists
        corner->setAccessibleName(tr("Select all rows"));
    setRowHeight();
}

void LogView::setRowHeight()
{
    SetRowHeight(RowHeight(fontMetrics()));
}

void LogView::SetDefaultWidths()
{
    const QFontMetrics metrics = fontMetrics();
    const int padding = 16;
    const int icon = style()->pixelMetric(QStyle::PM_SmallIconSize, nullptr, this) + 8;
    setColumnWidth(LogModel::TimeColumn,
                   metrics.boundingRect(QStringLiteral("2000-00-00 00:00:00.000")).width() +
                       padding);
    int severity = 0;
    for (int i = 0; i < LogEntry::None; ++i) {
        const QString name = LogSeverities::Name(static_cast<LogEntry::Severity>(i));
        severity = std::max(severity, metrics.boundingRect(name).width());
    }
    setColumnWidth(LogModel::SeverityColumn, severity + icon + padding);
    setColumnWidth(LogModel::ElapsedColumn,
                   metrics.boundingRect(QStringLiteral("00000 ms")).width() + padding);
    setColumnWidth(LogModel::SinceColumn,
                   metrics.boundingRect(QStringLiteral("00 min 00 s")).width() + padding);
    setColumnWidth(LogModel::ProgramColumn,
                   metrics.boundingRect(QStringLiteral("Sample Program")).width() + icon + padding);
    for (int column = 0; column < LogModel::MessageColumn; ++column)
        setColumnWidth(column,
                       std::max(columnWidth(column), horizontalHeader()->sectionSizeHint(column)));
}

void LogView::changeEvent(QEvent* event)
{
    WrappingTable::changeEvent(event);
    if (event->type() != QEvent::FontChange && event->type() != QEvent::StyleChange)
        return;
    forgetHeights();
    setRowHeight();
    if (m_following)
        goToEnd();
}

// A lower view would show the same first row, and no longer the newest one.
void LogView::resizeEvent(QResizeEvent* event)
{
    WrappingTable::resizeEvent(event);
    if (m_following)
        goToEnd();
}

// Qt makes the first row the current one, although nobody has selected it: its text would be shown
// as that of the current line, and a search for the next problem would start after it.
void LogView::focusInEvent(QFocusEvent* event)
{
    const bool hadCurrent = currentIndex().isValid();
    WrappingTable::focusInEvent(event);
    if (!hadCurrent)
        selectionModel()->clearCurrentIndex();
}

// With Ctrl, Qt makes the row current without selecting it, so that another one would be copied.
void LogView::keyPressEvent(QKeyEvent* event)
{
    const bool isSideways = event->key() == Qt::Key_Left || event->key() == Qt::Key_Right;
    if (isSideways && foldByKey(event->key() == Qt::Key_Left))
        return;
    if (event->key() == Qt::Key_Left && event->modifiers() == Qt::NoModifier && goToHeading())
        return;
    const QScopedValueRollback<bool> guard(m_goesSideways, isSideways);
    const bool isEnd = event->key() == Qt::Key_Home || event->key() == Qt::Key_End;
    if (!isEnd || !(event->modifiers() & Qt::ControlModifier)) {
        WrappingTable::keyPressEvent(event);
        return;
    }
    QKeyEvent plain(event->type(), event->key(), event->modifiers() & ~Qt::ControlModifier);
    WrappingTable::keyPressEvent(&plain);
    event->setAccepted(plain.isAccepted());
}

void LogView::scrollTo(QModelIndex const& index, ScrollHint hint)
{
    const int across = horizontalScrollBar()->value();
    WrappingTable::scrollTo(index, hint);
    if (!m_goesSideways)
        horizontalScrollBar()->setValue(across);
}

// Home and End go to the first and the last row, not to the ends of a row. While no row is current,
// Qt starts at the first one, however far away that is; the user looks at others.
QModelIndex LogView::moveCursor(CursorAction action, Qt::KeyboardModifiers modifiers)
{
    const int count = m_model->rowCount();
    if (count > 0 && action == MoveHome) {
        const QModelIndex first = m_model->index(0, firstColumn());
        const bool isHeading = !(m_model->flags(first) & Qt::ItemIsSelectable);
        return isHeading && count > 1 ? first.sibling(1, firstColumn()) : first;
    }
    if (count > 0 && action == MoveEnd)
        return m_model->index(count - 1, firstColumn());
    if (count == 0 || currentIndex().isValid())
        return WrappingTable::moveCursor(action, modifiers);
    const bool isDownward = action == MoveDown || action == MoveNext || action == MovePageDown;
    const int row = isDownward && !m_following ? rowAt(0) : lastRowInView();
    const QModelIndex start = m_model->index(row, firstColumn());
    if (action != MovePageUp && action != MovePageDown)
        return start;
    selectionModel()->setCurrentIndex(start, QItemSelectionModel::NoUpdate);
    const QModelIndex target = WrappingTable::moveCursor(action, modifiers);
    selectionModel()->clearCurrentIndex(); // or Qt would not select the start
    return target;
}

// The last row that is in view as a whole.
int LogView::lastRowInView() const
{
    const int row = rowAt(viewport()->height() - 1);
    if (row < 0)
        return m_model->rowCount() - 1;
    const int bottom = visualRect(m_model->index(row, firstColumn())).bottom();
    return bottom >= viewport()->height() && row > rowAt(0) ? row - 1 : row;
}

// The key opens the menu at the current row, not in the middle of the table.
void LogView::contextMenuEvent(QContextMenuEvent* event)
{
    QPoint position = event->globalPos();
    QModelIndex cell = indexAt(event->pos());
    if (event->reason() == QContextMenuEvent::Keyboard && currentIndex().isValid()) {
        position = viewport()->mapToGlobal(visualRect(currentIndex()).bottomLeft());
        cell = m_model->index(currentIndex().row(), LogModel::MessageColumn);
    }
    Q_EMIT menuRequested(position, cell);
}

void LogView::SetFollowing(bool following)
{
    if (following)
        goToEnd();
    if (following == m_following)
        return;
    m_following = following;
    Q_EMIT followingChanged(following);
}

void LogView::goToEnd()
{
    const QScopedValueRollback<bool> guard(m_scrollingItself, true);
    moveOnceAfter([this] {
        updateGeometries(); // updates the scroll bar's range
        scrollToBottom();
    });
}

void LogView::noteScrolled(int value)
{
    if (!m_scrollingItself && m_model->rowCount() > 0)
        SetFollowing(value == verticalScrollBar()->maximum());
}

void LogView::SetLineWrap(bool wrapped)
{
    {
        const QScopedValueRollback<bool> guard(m_scrollingItself, true);
        setWrapped(wrapped);
    }
    if (m_following)
        goToEnd();
    else if (currentIndex().isValid())
        scrollTo(currentIndex());
}

void LogView::SetSince(bool shown)
{
    m_showsSince = shown;
    setColumnHidden(LogModel::SinceColumn, !shown || !m_model->state().hasTimes);
}

void LogView::SetLeastGap(qint64 span)
{
    if (span == m_model->spans().leastGap())
        return;
    m_model->spans().SetLeastGap(span);
    forgetHeights(); // the gap takes some of a message's width
    if (isWrapped())
        updateGeometries();
    viewport()->update();
}

bool LogView::MeasureFrom(int row)
{
    if (row < 0)
        m_model->spans().MeasureFromAbove();
    else if (!m_model->spans().MeasureFrom(row))
        return false;
    viewport()->update();
    horizontalHeader()->viewport()->update();
    const int title = horizontalHeader()->sectionSizeHint(LogModel::SinceColumn);
    setColumnWidth(LogModel::SinceColumn, std::max(columnWidth(LogModel::SinceColumn), title));
    return true;
}

// Compensates for rows inserted above the visible ones.
void LogView::rowsInserted(QModelIndex const& parent, int first, int last)
{
    const QScopedValueRollback<bool> guard(m_scrollingItself, true);
    m_hasOtherRows = m_hasOtherRows || last + 1 < m_model->rowCount();
    if (m_following) {
        m_bar->UpdateOnceAfter([&] {
            moveOnceAfter([&] {
                WrappingTable::rowsInserted(parent, first, last);
                scrollToBottom();
            });
        });
        return;
    }
    const bool above = first < rowAt(0);
    WrappingTable::rowsInserted(parent, first, last);
    if (!above)
        return;
    updateGeometries();
    verticalScrollBar()->setValue(verticalScrollBar()->value() + last - first + 1);
}

void LogView::rowsAboutToBeRemoved(QModelIndex const& parent, int first, int last)
{
    const int top = rowAt(0);
    m_hasOtherRows = true;
    WrappingTable::rowsAboutToBeRemoved(parent, first, last);
    if (m_following || first >= top)
        return;
    const QScopedValueRollback<bool> guard(m_scrollingItself, true);
    verticalScrollBar()->setValue(verticalScrollBar()->value() - (std::min(last + 1, top) - first));
}

void LogView::dataChanged(QModelIndex const& topLeft, QModelIndex const& bottomRight,
                          QVector<int> const& roles)
{
    m_hasOtherRows = true;
    WrappingTable::dataChanged(topLeft, bottomRight, roles);
}

void LogView::afterRefresh()
{
    const QScopedValueRollback<bool> guard(m_scrollingItself, true);
    // An empty log may get anything.
    HistoryUpdate const& state = m_model->state();
    setColumnHidden(LogModel::TimeColumn, !state.hasTimes && state.lines > 0);
    setColumnHidden(LogModel::SeverityColumn, !state.hasSeverities && state.lines > 0);
    setColumnHidden(LogModel::ElapsedColumn, !state.hasElapsed);
    setColumnHidden(LogModel::SinceColumn, !m_showsSince || !state.hasTimes);
    setColumnHidden(LogModel::ProgramColumn, !state.family);
    fitTimes();
    if (m_hasOtherRows || measuredRows() > MostMeasuredRows)
        forgetHeights();
    if (isWrapped() && m_hasOtherRows)
        updateGeometries(); // a last line may have got longer
    restoreCurrent();
    restoreTop();
    if (m_following && m_hasOtherRows)
        goToEnd();
    if (m_hasOtherRows)
        viewport()->update();
    else if (state.runs) // the counts of the newest run
        viewport()->update(visualRect(
            m_model->index(m_model->TableRowOf(static_cast<int>(state.rows->earlier())), 0)));
    m_hasOtherRows = false;
}

// The text as it was when it became current: what was written over cannot be read any more.
void LogView::currentChanged(QModelIndex const& current, QModelIndex const& previous)
{
    WrappingTable::currentChanged(current, previous);
    m_currentText =
        current.isValid() ? m_model->LineText(CurrentRow(), LogModel::ShownLimit) : QString();
}

// The rows under the heading are what the user looks at, not the newest one.
void LogView::fold(int row, bool folded)
{
    if (row < static_cast<int>(m_model->state().rows->earlier()))
        SetFollowing(false);
    m_model->SetFolded(row, folded);
}

// Opens what the current row hides, or closes what it is in. Returns false if there is no such
// thing.
bool LogView::foldByKey(bool folded)
{
    const int row = CurrentRow();
    if (m_model->IsFoldable(row)) {
        foldOrGoToEnd(row, folded);
        return true;
    }
    if (!m_model->RepeatsOf(row) || m_model->AreRepeatsOpen(row) != folded)
        return false;
    setRepeatsOpen(row, !folded);
    return true;
}

// The first row of a group takes the place of those that are hidden.
void LogView::setRepeatsOpen(int row, bool open)
{
    const int first = static_cast<int>(m_model->RepeatsOf(row)->first);
    if (!open && CurrentRow() > first &&
        m_model->RepeatsOf(CurrentRow()) == m_model->RepeatsOf(row))
        select(m_model->index(m_model->TableRowOf(first), firstColumn()));
    if (open)
        SetFollowing(false);
    m_model->SetRepeatsOpen(row, open);
    m_hasOtherRows = false;
    forgetHeights();
    if (isWrapped())
        updateGeometries();
    viewport()->update();
}

// The row whose number of repeats a click is on; -1 if it is elsewhere.
int LogView::repeatsClicked(QMouseEvent const& event) const
{
    const QModelIndex cell = indexAt(event.pos());
    const QString repeats = cell.data(LogModel::RepeatsRole).toString();
    const bool isOnRepeats =
        event.button() == Qt::LeftButton && !event.modifiers() &&
        cell.column() == LogModel::MessageColumn && !repeats.isEmpty() &&
        LogDelegate::RepeatsArea(repeats, font(), visualRect(cell)).contains(event.pos());
    return isOnRepeats ? m_model->RowAt(cell.row()) : -1;
}

// Qt selects the row, whatever was clicked on.
void LogView::mousePressEvent(QMouseEvent* event)
{
    const int row = repeatsClicked(*event);
    WrappingTable::mousePressEvent(event);
    if (row >= 0)
        setRepeatsOpen(row, !m_model->AreRepeatsOpen(row));
}

// Of two quick clicks, this is the second one.
void LogView::mouseDoubleClickEvent(QMouseEvent* event)
{
    const int row = repeatsClicked(*event);
    WrappingTable::mouseDoubleClickEvent(event);
    if (row >= 0)
        setRepeatsOpen(row, !m_model->AreRepeatsOpen(row));
}

// Of a run whose lines are shown already, what it logged last is wanted most.
void LogView::foldOrGoToEnd(int heading, bool folded)
{
    if (folded || m_model->IsFolded(heading)) {
        fold(heading, folded);
        return;
    }
    int last = heading;
    while (last + 1 < m_model->logRowCount() && !m_model->IsFoldable(last + 1))
        ++last;
    if (last > heading)
        GoToRow(m_model->RowAt(m_model->TableRowOf(last))); // without opening repeats
}

// As in a tree, but only where the key has nothing left to scroll. A run may have millions of
// lines, and how it ended is said at its other end.
bool LogView::goToHeading()
{
    QScrollBar const* across = horizontalScrollBar();
    const int leftmost = isRightToLeft() ? across->maximum() : across->minimum();
    if (across->value() != leftmost || m_model->rowCount() == 0)
        return false;
    const int row = currentIndex().isValid() ? CurrentRow() : m_model->RowAt(lastRowInView());
    const int heading = HeadingAbove(*m_model->state().rows, row);
    if (heading < 0)
        return false;
    GoToRow(heading);
    return true;
}

void LogView::noteCurrent()
{
    m_hasOtherRows = true;
    const int top = rowAt(0);
    m_topStart = m_following || top < 0 ? -1 : m_model->LineStart(m_model->RowAt(top));
    const int row = CurrentRow();
    m_keepsHeading = m_model->IsFoldable(row) && m_model->LineStart(row) == LogRows::NewestHeading;
    if (row < 0 || m_model->LineStart(row) < 0)
        return;
    m_keptPath = m_model->path();
    m_keptStart = m_model->LineStart(row);
    m_keptCheck = m_model->state().rows->check(static_cast<size_t>(row));
    m_keptText = m_currentText;
    const int tableRow = currentIndex().row();
    const int visible = viewport()->height() / std::max(1, rowHeight(tableRow)) - 1;
    m_wasInView = tableRow >= top && tableRow <= top + visible;
    m_keptDistance = qBound(0, tableRow - top, std::max(0, visible));
    if (m_wasInView)
        m_topStart = -1;
}

// The row of the line that was current or, if that is filtered out, the nearest one. If the file
// was replaced, the line may be at another place of it; -1 if it is gone.
int LogView::keptRow(qint64 start) const
{
    LogRows const& rows = *m_model->state().rows;
    const int near = m_model->RowNear(start);
    if (near < 0 || rows.lines().isEmpty())
        return -1;
    const size_t line = rows.lines().LineAt(start);
    if (rows.lines().start(line) == start && rows.lines().check(line) == m_keptCheck)
        return near;
    const auto isKept = [&](int row) {
        return row >= 0 && row < m_model->logRowCount() &&
               rows.check(static_cast<size_t>(row)) == m_keptCheck &&
               m_model->LineText(row, LogModel::ShownLimit) == m_keptText;
    };
    for (int distance = 0; distance < MaximumMove; ++distance) {
        if (isKept(near - distance))
            return near - distance;
        if (isKept(near + distance))
            return near + distance;
    }
    return -1;
}

// After the rows were replaced. Another file has its own current line.
void LogView::restoreCurrent()
{
    if (m_keepsHeading && !m_model->isReading()) {
        m_keepsHeading = false;
        const int row = static_cast<int>(m_model->state().rows->earlier());
        if (m_model->IsFoldable(row) && !currentIndex().isValid())
            selectionModel()->setCurrentIndex(m_model->index(m_model->TableRowOf(row), 0),
                                              QItemSelectionModel::NoUpdate);
    }
    if (m_keptStart < 0 || m_model->isReading())
        return;
    const qint64 start = m_keptStart;
    m_keptStart = -1;
    const int row = m_model->path() == m_keptPath ? keptRow(start) : -1;
    if (row < 0 || currentIndex().isValid())
        return;
    const int tableRow = m_model->TableRowOf(row);
    const QModelIndex index = m_model->index(tableRow, firstColumn());
    select(index);
    if (m_following) {
        goToEnd();
        if (!m_wasInView || tableRow >= rowAt(0))
            return;
        SetFollowing(false);
    }
    updateGeometries(); // updates the scroll bar's range
    verticalScrollBar()->setValue(tableRow - m_keptDistance);
    if (isWrapped())
        scrollTo(index); // the rows above it may be higher than before
}

// Folded or not, the lines are the same. Without the current one among those in view, the first of
// these stays in its place.
void LogView::restoreTop()
{
    const qint64 start = std::exchange(m_topStart, -1);
    if (start < 0 || m_following || !m_model->state().isFolding)
        return;
    updateGeometries(); // updates the scroll bar's range
    verticalScrollBar()->setValue(m_model->TableRowOf(m_model->RowNear(start)));
}

// Other programs' stamps may be longer than the log's own. Once for a file, or users could not
// make the column narrow.
void LogView::fitTimes()
{
    LogUpdate const& state = m_model->state();
    if (m_fittedPath == m_model->path() || !state.type.isForeign || !state.hasTimes)
        return;
    m_fittedPath = m_model->path();
    const int width = sizeHintForColumn(LogModel::TimeColumn);
    setColumnWidth(LogModel::TimeColumn, std::max(columnWidth(LogModel::TimeColumn), width));
}

// The headings.
bool LogView::isSpanning(int row) const
{
    return row >= 0 && row < m_model->rowCount() &&
           m_model->state().rows->isHeading(static_cast<size_t>(m_model->RowAt(row)));
}

// The heading cannot be selected, so no key would lead to it.
int LogView::topFor(int row, ScrollHint hint) const
{
    const int top = WrappingTable::topFor(row, hint);
    return top == 1 && row == 1 && isSpanning(0) && hint == EnsureVisible ? 0 : top;
}

int LogView::CurrentRow() const
{
    return currentIndex().isValid() ? m_model->RowAt(currentIndex().row()) : -1;
}

int LogView::LogRowOf(int tableRow) const
{
    return m_model->RowAt(tableRow);
}

int LogView::StartRow(int step) const
{
    if (currentIndex().isValid())
        return CurrentRow();
    if (step > 0)
        return m_model->RowAt(std::max(0, rowAt(0))) - 1;
    const int last = rowAt(viewport()->height() - 1);
    return last < 0 ? m_model->logRowCount() : m_model->RowAt(last + 1);
}

// Qt does not scroll to hidden columns.
int LogView::firstColumn() const
{
    int column = 0;
    while (isColumnHidden(column))
        ++column;
    return column;
}

QModelIndex LogView::FirstCell(int tableRow) const
{
    return m_model->index(tableRow, isSpanning(tableRow) ? 0 : firstColumn());
}

qulonglong LogView::LineNumber(int row) const
{
    if (row < 0 || row >= m_model->logRowCount() || m_model->LineStart(row) < 0)
        return 0;
    return m_model->state().rows->line(static_cast<size_t>(row)) - m_model->FirstLineOfFile(row) +
           1;
}

qulonglong LogView::LineCount() const
{
    return m_model->state().lines;
}

LogView::Jump LogView::GoToProblem(int step)
{
    Jump jump = Jump::Ahead;
    int row = m_model->FindProblem(StartRow(step), step);
    if (row < 0) {
        jump = Jump::Wrapped;
        row = m_model->FindProblem(step > 0 ? -1 : m_model->logRowCount(), step);
    }
    if (row < 0)
        return Jump::None;
    GoToRow(row);
    return jump;
}

// Makes a row current and selects it, whatever keys are held: Shift would extend the selection.
// Shift and an arrow key extend it from here then, which only the view's own method sees to.
void LogView::select(QModelIndex const& index)
{
    const SelectionMode mode = selectionMode();
    setSelectionMode(NoSelection);
    setCurrentIndex(index);
    setSelectionMode(mode);
    selectionModel()->select(index,
                             QItemSelectionModel::ClearAndSelect | QItemSelectionModel::Rows);
}

void LogView::GoToRow(int row)
{
    if (m_model->IsHidden(row))
        setRepeatsOpen(row, true);
    const int tableRow = m_model->TableRowOf(row);
    const QModelIndex index = m_model->index(tableRow, firstColumn());
    select(index);
    scrollTo(index, PositionAtCenter);
    if (tableRow + 1 < m_model->rowCount())
        SetFollowing(false);
}

void LogView::SetFound(LogFilter const& found)
{
    cells()->SetFound(found);
    viewport()->update();
}

void LogView::SetHighlightRules(std::shared_ptr<HighlightRules> const& rules)
{
    cells()->SetRules(rules);
    connect(rules.get(), &HighlightRules::changed, viewport(), QOverload<>::of(&QWidget::update));
}

QList<int> LogView::SelectedRows() const
{
    QList<int> rows;
    const QItemSelection selection = selectionModel()->selection();
    for (QItemSelectionRange const& range : selection) {
        const int end = m_model->RowAt(range.bottom() + 1);
        for (int row = m_model->RowAt(range.top()); row < end && rows.size() < MaximumCopiedLines;
             ++row)
            rows.append(row);
    }
    std::sort(rows.begin(), rows.end());
    rows.erase(std::unique(rows.begin(), rows.end()), rows.end());
    return rows;
}

void LogView::SetPlaceholder(QString const& text)
{
    if (text == m_placeholder)
        return;
    m_placeholder = text;
    viewport()->update();
}

void LogView::UpdateMarks()
{
    cells()->SetFilter(m_model->filter());
    viewport()->update();
}

void LogView::paintEvent(QPaintEvent* event)
{
    WrappingTable::paintEvent(event);
    if (m_placeholder.isEmpty() || m_model->rowCount() > 0)
        return;
    QPainter painter(viewport());
    painter.setPen(palette().color(QPalette::Text));
    const QRect area = viewport()->rect().adjusted(24, 24, -24, -24);
    painter.drawText(area, Qt::AlignCenter | Qt::TextWordWrap, m_placeholder);
}

} // namespace Velocor
