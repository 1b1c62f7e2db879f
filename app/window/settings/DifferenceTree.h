// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/settingsfile/SettingsDifference.h"

#include <QTreeWidget>

namespace Velocor {

/// Shows a SettingsDifference: sections and keys, with both values side by side and, in words and
/// color, how they differ. Read-only. GUI thread only.
class DifferenceTree : public QTreeWidget
{
    Q_OBJECT

public:
    enum Column { NameColumn, StateColumn, LeftColumn, RightColumn, LossColumn, ColumnCount };

    explicit DifferenceTree(QWidget* parent = nullptr);

    /// Names the columns of the two documents.
    void SetTitles(QString const& left, QString const& right);

    /// Shows another difference. The current row stays, if it is still there.
    ///
    /// @param losses  what saving loses, shown in its place; those without one, in a row for the
    /// whole file
    void SetDifference(SettingsDifference const& difference,
                       QVector<SettingsDocument::Loss> const& losses);
    SettingsDifference const& difference() const { return m_difference; }

    /// Whether to leave out rows that neither differ nor lose anything; at first, they are.
    void ShowOnlyDifferences(bool on);

    /// The positions of the selected rows in the difference.
    QSet<int> selectedRows() const;

    /// Whether taking over the selected rows changes a value or the order.
    bool hasSelectedValues() const;

private:
    using Losses = QMultiHash<QPair<QString, QString>, QString>;

    void fill();
    void addFileRow(Losses const& losses);
    void addRow(int position, Losses const& losses);
    void setLosses(QTreeWidgetItem* item, QStringList const& texts);
    void setLook(QTreeWidgetItem* item, SettingsDifference::Row const& row);
    void goTo(QString const& section, QString const& key);
    int positionOf(QTreeWidgetItem const* item) const;

    SettingsDifference m_difference;
    QVector<SettingsDocument::Loss> m_losses;
    bool m_onlyDifferences = true;
    QTreeWidgetItem* m_section = nullptr; ///< of the rows being added; null until it is needed
};

} // namespace Velocor
