// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QStandardItemModel>

/// A model whose cells all have different texts, for comparisons of tables.
class NumberedModel : public QStandardItemModel
{
public:
    using QStandardItemModel::QStandardItemModel;

    /// Inserts rows with texts that no cell had before.
    void InsertNumbered(int at, int count)
    {
        for (int i = 0; i < count; ++i) {
            QList<QStandardItem*> items;
            ++m_row;
            for (int column = 0; column < columnCount(); ++column)
                items.append(new QStandardItem(QString("%1 in %2").arg(m_row).arg(column)));
            insertRow(at + i, items);
        }
    }

private:
    int m_row = 0;
};
