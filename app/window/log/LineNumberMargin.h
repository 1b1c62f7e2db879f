// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QWidget>

namespace Velocor {

class LogView;

/// The numbers of the lines in the file, beside the rows of a log view. Hidden until it is switched
/// on. A click on a number selects its row.
///
/// A margin instead of a column: it stays where it is when the table is scrolled sideways. GUI
/// thread.
class LineNumberMargin : public QWidget
{
    Q_OBJECT

public:
    /// @param view  the parent; with a model
    explicit LineNumberMargin(LogView* view);

    void SetShown(bool shown);

    /// The number that is shown beside a row; empty for a heading.
    QString TextOf(int tableRow) const;

protected:
    bool eventFilter(QObject* watched, QEvent* event) override;
    void changeEvent(QEvent* event) override;
    void paintEvent(QPaintEvent* event) override;
    void mousePressEvent(QMouseEvent* event) override;

private:
    void fit();
    void paintRow(QPainter& painter, int row) const;

    LogView* m_view;
    bool m_isShown = false;
};

} // namespace Velocor
