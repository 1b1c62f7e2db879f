// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/window/log/ProblemBlocks.h"

#include <QTimer>
#include <QWidget>

#include <memory>
#include <vector>

namespace Velocor {

class LogModel;
class LogView;

/// Where problems, lines found and marks are in all rows of a log view: a strip beside its scroll
/// bar, with a lane for each. A click goes to the nearest tick or, if none is near, to the row that
/// is there; the tool tip tells what it is.
///
/// It looks at the rows in portions, and only at those that are new or have changed, so the window
/// stays responsive with many millions of them. GUI thread.
class LogOverview : public QWidget
{
    Q_OBJECT

public:
    /// @param model  not owned
    /// @param view   not owned; shows the model
    LogOverview(LogModel* model, LogView* view, QWidget* parent = nullptr);

    /// Rows in ascending order.
    using Rows = std::shared_ptr<std::vector<int> const>;

    /// Sets the rows with the text to find.
    void SetFound(Rows const& rows);

    /// Sets the rows that the user has marked.
    void SetMarked(Rows const& rows);

    QSize sizeHint() const override;

protected:
    bool event(QEvent* event) override;
    bool eventFilter(QObject* watched, QEvent* event) override;
    void paintEvent(QPaintEvent* event) override;
    void mousePressEvent(QMouseEvent* event) override;
    void wheelEvent(QWheelEvent* event) override;

private:
    enum Lane { Problems, Found, Marked, LaneCount };

    // What is at a height; the rows are -1 where a lane has nothing.
    struct Place
    {
        int rows[LaneCount] = {-1, -1, -1};
    };

    quint8 markAt(size_t tableRow) const;
    ProblemBlocks::Marks marks() const;
    void setRows(Lane lane, Rows const& rows);
    void reset();
    void look();
    QRect ground() const;
    int partCount() const;
    int firstTableRow(int part) const;
    void updateParts();
    bool hasTick(Lane lane, int part) const;
    int tickIn(Lane lane, int part) const;
    Place placeAt(int y) const;
    int rowAt(QPoint const& position) const;
    QString textOf(Place const& place) const;
    QString lineOf(int row) const;

    LogModel* m_model;
    LogView* m_view;
    ProblemBlocks m_problems;
    Rows m_rows[LaneCount];                  // not of Problems
    std::vector<LogEntry::Severity> m_worst; // of each part
    bool m_isOutdated = true;                // m_worst
    bool m_isReset = true;                   // since it was shown
    QTimer m_lookTimer;
    QTimer m_showTimer;
};

} // namespace Velocor
