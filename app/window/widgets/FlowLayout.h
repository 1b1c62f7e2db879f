// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QLayout>
#include <QList>

namespace Velocor {

/// Lays out widgets in one row or, if that is too narrow for them, in further rows below. Large
/// text and long languages need more room than a small screen has side by side.
///
/// Widgets that expand share what is left of their row; before another row is begun, they shrink to
/// three fifths of their usual width. The order is that of the language.
class FlowLayout : public QLayout
{
    Q_OBJECT

public:
    /// @param spacing  between widgets, in both directions, in pixels
    explicit FlowLayout(int spacing, QWidget* parent = nullptr);
    ~FlowLayout() override;

    /// Adds room that has nothing else to share it with.
    void AddStretch();

    void addItem(QLayoutItem* item) override;
    int count() const override { return static_cast<int>(m_items.size()); }
    QLayoutItem* itemAt(int index) const override { return m_items.value(index); }
    QLayoutItem* takeAt(int index) override;

    Qt::Orientations expandingDirections() const override { return Qt::Horizontal; }
    bool hasHeightForWidth() const override { return true; }
    int heightForWidth(int width) const override;
    QSize sizeHint() const override;

    /// As high as the rows in the width that it has: a splitter does not ask what a width needs.
    QSize minimumSize() const override;
    void setGeometry(QRect const& rect) override;

private:
    using Row = QList<QLayoutItem*>;

    QList<Row> rowsFor(int width) const;
    int leastWidth(Row const& row) const;
    void layOutRow(Row const& row, QRect const& place) const;
    static int heightOf(Row const& row);

    QList<QLayoutItem*> m_items;
    int m_height = 0; // of all rows
};

} // namespace Velocor
