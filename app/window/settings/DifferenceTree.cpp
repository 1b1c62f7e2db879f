// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/settings/DifferenceTree.h"

#include "app/window/settings/SettingsModel.h"
#include "app/window/widgets/BlendedColor.h"
#include "app/window/widgets/PlainText.h"

#include <QHeaderView>

#include <algorithm>

namespace Velocor {

namespace {

using Row = SettingsDifference::Row;

constexpr int PositionRole = Qt::UserRole;
constexpr int ShownLength = 200;       // of a long value, in characters
constexpr qreal DifferenceTint = 0.22; // of the color in the background

QString ShownValue(QString const& value)
{
    return value.size() > SettingsModel::MaximumCellLength ? Shortened(value, ShownLength) : value;
}

} // namespace

DifferenceTree::DifferenceTree(QWidget* parent) : QTreeWidget(parent)
{
    setAccessibleName(tr("Differences"));
    setLayoutDirection(Qt::LeftToRight); // as the settings
    header()->setAccessibleName(tr("Columns of the differences"));
    KeepLeftToRight(header());
    setColumnCount(ColumnCount);
    setSelectionMode(ExtendedSelection);
    setUniformRowHeights(true);
    setAllColumnsShowFocus(true);
    setTextElideMode(Qt::ElideMiddle); // a long value ends in its size
}

void DifferenceTree::SetTitles(QString const& left, QString const& right)
{
    setHeaderLabels({tr("Section / key"), tr("Difference"), left, right, tr("Lost in saving")});
}

void DifferenceTree::SetDifference(SettingsDifference const& difference,
                                   QVector<SettingsDocument::Loss> const& losses)
{
    m_difference = difference;
    m_losses = losses;
    fill();
}

void DifferenceTree::ShowOnlyDifferences(bool on)
{
    m_onlyDifferences = on;
    fill();
}

int DifferenceTree::positionOf(QTreeWidgetItem const* item) const
{
    const QVariant position = item ? item->data(NameColumn, PositionRole) : QVariant();
    return position.isValid() ? position.toInt() : -1;
}

void DifferenceTree::fill()
{
    QTreeWidgetItem const* current = currentItem();
    const QString section = current && current->parent()
                                ? current->parent()->text(NameColumn)
                                : (current ? current->text(NameColumn) : QString());
    const QString key = current && current->parent() ? current->text(NameColumn) : QString();

    clear();
    Losses losses;
    for (SettingsDocument::Loss const& loss : qAsConst(m_losses))
        losses.insert({loss.section, loss.key}, loss.text);
    addFileRow(losses);
    for (int i = 0; i < m_difference.rows.size(); ++i) {
        if (m_difference.rows.at(i).isSection())
            m_section = nullptr;
        addRow(i, losses);
    }
    expandAll();
    setColumnHidden(LossColumn, m_losses.isEmpty());
    goTo(section, key);
}

// Of the root element, and of losses that are in no other row.
void DifferenceTree::addFileRow(Losses const& losses)
{
    QSet<QPair<QString, QString>> places;
    for (Row const& row : qAsConst(m_difference.rows))
        places.insert({row.section, row.key});
    QStringList texts;
    for (auto loss = losses.constBegin(); loss != losses.constEnd(); ++loss) {
        if (!places.contains(loss.key()))
            texts.append(loss.value());
    }
    texts.sort();
    const bool isChanged = m_difference.rootBefore != m_difference.rootAfter;
    if (texts.isEmpty() && !isChanged)
        return;
    auto* item = new QTreeWidgetItem(this);
    item->setText(NameColumn, tr("(whole file)"));
    setLosses(item, texts);
    if (!isChanged)
        return;
    item->setText(StateColumn, tr("Other root element"));
    item->setText(LeftColumn, ShownValue(m_difference.rootBefore));
    item->setText(RightColumn, ShownValue(m_difference.rootAfter));
}

void DifferenceTree::addRow(int position, Losses const& losses)
{
    Row const& row = m_difference.rows.at(position);
    QStringList lost = losses.values({row.section, row.key});
    if (m_onlyDifferences && row.isSame() && lost.isEmpty())
        return;
    if (!m_section) {
        int start = position;
        while (!m_difference.rows.at(start).isSection())
            --start;
        m_section = new QTreeWidgetItem(this);
        m_section->setText(NameColumn, ShownValue(row.section));
        m_section->setData(NameColumn, PositionRole, start);
        QFont bold = font();
        bold.setBold(true);
        m_section->setFont(NameColumn, bold);
        setLook(m_section, m_difference.rows.at(start));
    }
    QTreeWidgetItem* item = m_section;
    if (!row.isSection()) {
        item = new QTreeWidgetItem(m_section);
        item->setText(NameColumn, ShownValue(row.key));
        item->setData(NameColumn, PositionRole, position);
        item->setText(LeftColumn, ShownValue(row.before));
        item->setText(RightColumn, ShownValue(row.after));
        setLook(item, row);
    }
    std::reverse(lost.begin(), lost.end()); // the last one that was inserted comes first
    setLosses(item, lost);
}

void DifferenceTree::setLosses(QTreeWidgetItem* item, QStringList const& texts)
{
    const QString text = texts.join(QLatin1String("; "));
    item->setText(LossColumn, text);
    item->setToolTip(LossColumn, PlainToolTip(text));
}

void DifferenceTree::setLook(QTreeWidgetItem* item, Row const& row)
{
    if (row.isSame())
        return;
    QString state = tr("Moved");
    QColor color(0x30, 0x70, 0xd0);
    if (!row.isAfter) {
        state = tr("Only left");
        color = QColor(0xd0, 0x30, 0x30);
    } else if (!row.isBefore) {
        state = tr("Only right");
        color = QColor(0x30, 0xa0, 0x40);
    } else if (row.before != row.after) {
        state = row.isMoved ? tr("Changed, moved") : tr("Changed");
        color = QColor(0xe0, 0x90, 0x00);
    }
    item->setText(StateColumn, state);
    const QColor background = Blended(palette().color(QPalette::Base), color, DifferenceTint);
    for (int column = 0; column < ColumnCount; ++column)
        item->setBackground(column, background);
}

// Or to the first row, if there is none like this any more.
void DifferenceTree::goTo(QString const& section, QString const& key)
{
    QTreeWidgetItem* target = topLevelItem(0);
    for (int i = 0; i < topLevelItemCount(); ++i) {
        QTreeWidgetItem* parent = topLevelItem(i);
        if (parent->text(NameColumn) != section)
            continue;
        target = parent;
        for (int j = 0; j < parent->childCount(); ++j) {
            if (parent->child(j)->text(NameColumn) == key)
                target = parent->child(j);
        }
    }
    if (target)
        setCurrentItem(target);
}

QSet<int> DifferenceTree::selectedRows() const
{
    QSet<int> rows;
    const QList<QTreeWidgetItem*> items = selectedItems();
    for (QTreeWidgetItem const* item : items) {
        if (positionOf(item) >= 0)
            rows.insert(positionOf(item));
    }
    return rows;
}

bool DifferenceTree::hasSelectedValues() const
{
    const QSet<int> selected = selectedRows();
    bool isSectionSelected = false;
    for (int i = 0; i < m_difference.rows.size(); ++i) {
        Row const& row = m_difference.rows.at(i);
        const bool isSelected = selected.contains(i);
        if (row.isSection())
            isSectionSelected = isSelected;
        if (!row.isSame() && (isSelected || isSectionSelected))
            return true;
    }
    return false;
}

} // namespace Velocor
