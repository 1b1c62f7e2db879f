// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QTableView>

namespace Velocor {

class LogDelegate;
class LogModel;

/// The table of a log: keeps its place while rows come and go, follows the newest on request.
///
/// Following ends when the user scrolls away from the end and begins when he scrolls back to it.
class LogView : public QTableView
{
    Q_OBJECT

public:
    /// @param model  shown from the start; not owned
    explicit LogView(LogModel* model, QWidget* parent = nullptr);

    /// Keeps the newest row in view, or stays where it is.
    void SetFollowing(bool following);
    bool isFollowing() const { return m_following; }

    /// Goes to the next (step 1) or previous (step -1) warning or worse.
    ///
    /// @return false if there is none
    bool GoToProblem(int step);

    /// Copies the selected lines as they stand in the file.
    ///
    /// @return how many lines were copied
    int CopySelected();

    /// What the empty table tells instead of rows; empty: nothing.
    void SetPlaceholder(QString const& text);

    /// Marks what the model's filter finds.
    void UpdateMarks();

    /// Column widths that suit the font.
    void SetDefaultWidths();

    /// The most lines that are copied.
    static constexpr int MostCopied = 100000;

Q_SIGNALS:
    void followingChanged(bool following);

protected:
    void paintEvent(QPaintEvent* event) override;
    void changeEvent(QEvent* event) override;
    void rowsInserted(QModelIndex const& parent, int first, int last) override;
    void rowsAboutToBeRemoved(QModelIndex const& parent, int first, int last) override;

private:
    void setUp();
    void noteScrolled(int value);
    void afterRefresh();
    void setRowHeight();
    void updateHeadings();
    QList<int> selectedRowNumbers() const;

    LogModel* m_model;
    LogDelegate* m_delegate;
    QString m_placeholder;
    bool m_following = true;
    bool m_scrollingItself = false;
    int m_earlierRows = -1;
};

} // namespace Velocor
