// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QTableView>
#include <QVector>

#include <functional>

namespace Velocor {

/// A table for any number of rows, all of the same height unless a subclass overrides heightOf()
/// and what depends on it.
///
/// QTableView keeps the position of each row, and computes all of them again when a row is added.
/// This table computes them when they are needed: rows take neither memory nor time, for the goals
/// for the log view in docs/performance.md. tst_PlainUniformTable compares the two. Rows can be
/// neither hidden, moved, nor resized; there is no vertical header and no grid, and columns scroll
/// by pixels, rows by rows. A row may span all columns.
///
/// rowAt() and rowHeight() are not virtual in QTableView: call them on this class.
class UniformTable : public QTableView
{
    Q_OBJECT

public:
    explicit UniformTable(QWidget* parent = nullptr);

    void setModel(QAbstractItemModel* newModel) override;

    /// Sets the height of all rows, in pixels.
    void SetRowHeight(int height);

    /// Leaves room beside the rows, in pixels.
    void SetLeftMargin(int width);

    /// The height of a row.
    int rowHeight(int row = 0) const;

    /// The row at a position in the viewport; -1 if there is none.
    int rowAt(int y) const;

    QRect visualRect(QModelIndex const& index) const override;
    void scrollTo(QModelIndex const& index, ScrollHint hint = EnsureVisible) override;
    QModelIndex indexAt(QPoint const& position) const override;

protected:
    /// Whether the first cell of a row spans all columns. The others are not shown.
    virtual bool isSpanning(int row) const;

    // A table whose rows differ in height overrides the following ones.

    /// The height of a row, in pixels; by default that of all rows.
    virtual int heightOf(int row) const;

    /// Where a row starts in the viewport.
    virtual int topOf(int row) const;

    /// The row at a position in the viewport, or the one that would be there if there were rows
    /// without end.
    virtual int rowPast(int y) const;

    /// How many of the last rows fit into a height, but at least one.
    virtual int rowsThatFit(int height) const;

    /// The row at the top that shows a row where scrollTo() wants it.
    virtual int topFor(int row, ScrollHint hint) const;

    /// The row a page below (step 1) or above (step -1) a row.
    virtual int pageFrom(int row, int step) const;

    int rowCount() const;

    /// The height that SetRowHeight() was given.
    int usualHeight() const { return m_rowHeight; }

    /// The height of so many rows of usual height; negative for a negative number.
    qint64 heightOfRows(int count) const;

    /// A position as a widget takes it. Positions far outside are moved nearer.
    static int withinInt(qint64 y);

    /// Does what changes where rows are, and moves what is painted only once, at the end.
    void moveOnceAfter(std::function<void()> const& change);

    void paintEvent(QPaintEvent* event) override;
    bool viewportEvent(QEvent* event) override;
    void updateGeometries() override;
    void scrollContentsBy(int dx, int dy) override;
    void rowsInserted(QModelIndex const& parent, int first, int last) override;
    int verticalOffset() const override;
    int sizeHintForColumn(int column) const override;
    QModelIndex moveCursor(CursorAction action, Qt::KeyboardModifiers modifiers) override;
    void setSelection(QRect const& rect, QItemSelectionModel::SelectionFlags command) override;
    QRegion visualRegionForSelection(QItemSelection const& selection) const override;
    bool isIndexHidden(QModelIndex const& index) const override;

private:
    QStyleOptionViewItem cellOptions() const;
    int rowsInView() const;
    void placeHeaderAndBars();
    void updateScrollBars();
    void updateBetween(int top, int bottom);
    void updateHovered();
    void movePainted();
    void layOutAgain();
    int neighborColumn(int column, int step) const;
    int edgeColumn(int step) const;
    void paintRow(QPainter& painter, QStyleOptionViewItem const& option, int row);
    void paintCell(QPainter& painter, QStyleOptionViewItem option, QModelIndex const& index);

    QVector<QMetaObject::Connection> m_connections; // to the model
    int m_rowHeight = 20;
    int m_leftMargin = 0;
    bool m_isUpdatingGeometries = false;
    bool m_isMovingLater = false;
    QModelIndex m_hovered; // while painting
    int m_hoveredRow = -1; // as painted

    // Where a row is in what is painted, and the first of the rows that are not.
    int m_paintedRow = 0;
    int m_paintedTop = 0;
    int m_firstNew = -1;
};

} // namespace Velocor
