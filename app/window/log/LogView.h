// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/window/log/WrappingTable.h"

#include <memory>

namespace Velocor {

class HighlightRules;
class LogDelegate;
class LogFilter;
class LogModel;
class SteadyScrollBar;

/// The table of a log: keeps its position while rows change, or follows the newest entry.
///
/// Following stops when the user scrolls away from the end and resumes on scrolling back to it. The
/// current line stays current when the file is read again, wherever it is then, and when the filter
/// changes; if it is filtered out, the nearest one takes its place. If it was in view, it stays so,
/// even if that ends following.
///
/// Rows are those of the log, as the functions of LogModel have them, also if repeats are folded. A
/// key and a click open such a group and close it. Going to a row that it hides opens it.
class LogView : public WrappingTable
{
    Q_OBJECT

public:
    /// @param model  shown from the start; not owned
    explicit LogView(LogModel* model, QWidget* parent = nullptr);

    /// Shows long messages in several lines, at most WrappedRows::MaximumLines. The rest is elided.
    void SetLineWrap(bool wrapped);

    /// Shows the column with the time since another entry, if entries have times.
    void SetSince(bool shown);

    /// Shows where at least this much time passed between two entries, in milliseconds; 0 for
    /// nowhere.
    void SetLeastGap(qint64 span);

    /// Measures the time since the entry of a row or, with -1, since the entry above each.
    ///
    /// @return false, with nothing changed, if that entry has no time
    bool MeasureFrom(int row);

    /// Whether to keep the newest row in view.
    void SetFollowing(bool following);
    bool isFollowing() const { return m_following; }

    enum class Jump {
        None,   ///< there is nothing to go to
        Ahead,  ///< in the requested direction
        Wrapped ///< from the other end
    };

    /// Goes to the next (step 1) or previous (step -1) warning or worse, from the current row or,
    /// without one, from the rows in view.
    Jump GoToProblem(int step);

    /// Makes a row the only selected and the current one, and centers it. Unless it is the last
    /// one, the view no longer follows the newest entry.
    void GoToRow(int row);

    /// The current row; -1 if there is none.
    int CurrentRow() const;

    /// The row to search from in a direction: the current one or, without one, the one outside of
    /// the rows in view.
    int StartRow(int step) const;

    /// The row of the log that a table row shows.
    int LogRowOf(int tableRow) const;

    /// The first cell of a table row that is shown.
    QModelIndex FirstCell(int tableRow) const;

    /// The number of a row's line in its file, starting at 1; 0 for a heading and if there is no
    /// such row.
    qulonglong LineNumber(int row) const;

    /// How many lines the file has.
    qulonglong LineCount() const;

    /// Highlights the matches of a text to find.
    void SetFound(LogFilter const& found);

    /// Sets the rules that highlight lines.
    void SetHighlightRules(std::shared_ptr<HighlightRules> const& rules);

    /// The numbers of the selected rows in ascending order, at most MaximumCopiedLines; with those
    /// that they hide.
    QList<int> SelectedRows() const;

    /// Rows are selected as a whole, so going from row to row does not scroll sideways; the Left
    /// and Right keys do.
    void scrollTo(QModelIndex const& index, ScrollHint hint = EnsureVisible) override;

    /// The text that is shown while the table is empty.
    void SetPlaceholder(QString const& text);

    /// Updates the highlighting to the model's filter.
    void UpdateMarks();

    /// Sets column widths that match the font and the language.
    void SetDefaultWidths();

    /// The maximum number of lines copied.
    static constexpr int MaximumCopiedLines = 100000;

Q_SIGNALS:
    void followingChanged(bool following);

    /// The menu of the table is wanted at a global position.
    ///
    /// @param cell  what was clicked on, or the current message if the menu key was pressed; may be
    ///              invalid
    void menuRequested(QPoint const& position, QModelIndex const& cell);

protected:
    bool isSpanning(int row) const override;
    int topFor(int row, ScrollHint hint) const override;
    void paintEvent(QPaintEvent* event) override;
    void contextMenuEvent(QContextMenuEvent* event) override;
    void mousePressEvent(QMouseEvent* event) override;
    void mouseDoubleClickEvent(QMouseEvent* event) override;
    void changeEvent(QEvent* event) override;
    void resizeEvent(QResizeEvent* event) override;
    void focusInEvent(QFocusEvent* event) override;
    void currentChanged(QModelIndex const& current, QModelIndex const& previous) override;
    void keyPressEvent(QKeyEvent* event) override;
    QModelIndex moveCursor(CursorAction action, Qt::KeyboardModifiers modifiers) override;
    void rowsInserted(QModelIndex const& parent, int first, int last) override;
    void rowsAboutToBeRemoved(QModelIndex const& parent, int first, int last) override;
    void dataChanged(QModelIndex const& topLeft, QModelIndex const& bottomRight,
                     QVector<int> const& roles = QVector<int>()) override;

private:
    LogDelegate* cells() const;
    void setUp();
    void noteScrolled(int value);
    void goToEnd();
    void afterRefresh();
    void noteCurrent();
    void fold(int row, bool folded);
    bool foldByKey(bool folded);
    void setRepeatsOpen(int row, bool open);
    void foldOrGoToEnd(int heading, bool folded);
    bool goToHeading();
    int repeatsClicked(QMouseEvent const& event) const;
    int keptRow(qint64 start) const;
    void restoreCurrent();
    void restoreTop();
    int firstColumn() const;
    int lastRowInView() const;
    void select(QModelIndex const& index);
    void setRowHeight();
    void fitTimes();

    LogModel* m_model;
    SteadyScrollBar* m_bar;
    QString m_placeholder;
    QString m_fittedPath;
    bool m_following = true;
    bool m_scrollingItself = false;
    bool m_goesSideways = false;
    bool m_showsSince = false;
    bool m_hasOtherRows = true; // since the last refresh, not only more of them

    QString m_currentText;

    // The current line and its distance from the top, while the rows are replaced.
    QString m_keptPath;
    QString m_keptText;
    qint64 m_keptStart = -1;
    qint64 m_topStart = -1;      // of the first row in view, unless the current one is kept there
    bool m_keepsHeading = false; // of the newest run
    quint16 m_keptCheck = 0;
    int m_keptDistance = 0;
    bool m_wasInView = false;
};

} // namespace Velocor
