// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/settings/SettingsModel.h"

#include "app/window/settings/ValueDialog.h"
#include "app/window/settings/ValueEditing.h"
#include "app/window/settings/ValueIcons.h"
#include "app/window/widgets/PlainText.h"

#include <QFont>
#include <QGuiApplication>
#include <QPalette>

#include <algorithm>

namespace Velocor {

namespace {

constexpr int ShortenedLength = 200;

} // namespace

void SettingsModel::SetDocument(SettingsDocument const& document)
{
    beginResetModel();
    m_document = document;
    m_chosenKinds.clear();
    m_rows.clear();
    for (int i = 0; i < document.sections.size(); ++i)
        m_rows.push_back(std::make_unique<int>(i));
    endResetModel();
}

void SettingsModel::SetDefaults(SettingsValues const& defaults)
{
    m_defaults = defaults;
    for (int i = 0; i < m_document.sections.size(); ++i) {
        const int last = m_document.sections.at(i).items.size() - 1;
        if (last >= 0)
            Q_EMIT dataChanged(IndexOf({i, 0}, ValueColumn), IndexOf({i, last}, ValueColumn));
    }
}

QString SettingsModel::DefaultOf(QModelIndex const& index) const
{
    const Place place = PlaceOf(index);
    if (place.item < 0 || m_defaults.isEmpty())
        return QString();
    SettingsDocument::Section const& section = m_document.sections.at(place.section);
    return m_defaults.value({section.name, section.items.at(place.item).key});
}

bool SettingsModel::DiffersFromDefault(QModelIndex const& index) const
{
    const QString byDefault = DefaultOf(index);
    return !byDefault.isNull() && byDefault != FullText(index.sibling(index.row(), ValueColumn));
}

void SettingsModel::renumber()
{
    int row = 0;
    for (auto const& entry : m_rows)
        *entry = row++;
}

SettingsEdit SettingsModel::Apply(SettingsEdit const& edit)
{
    SettingsEdit back;
    const QModelIndex parent = edit.isOfSection() ? QModelIndex() : IndexOf({edit.section, -1});
    const int row = edit.isOfSection() ? edit.section : edit.item;
    switch (edit.kind) {
    case SettingsEdit::InsertSection:
    case SettingsEdit::InsertItem:
        beginInsertRows(parent, row, row);
        back = edit.Apply(m_document);
        if (edit.isOfSection())
            m_rows.insert(m_rows.begin() + row, std::make_unique<int>(row));
        renumber();
        endInsertRows();
        break;
    case SettingsEdit::RemoveSection:
    case SettingsEdit::RemoveItem:
        beginRemoveRows(parent, row, row);
        back = edit.Apply(m_document);
        if (edit.isOfSection())
            m_rows.erase(m_rows.begin() + row);
        renumber();
        endRemoveRows();
        break;
    case SettingsEdit::MoveSection:
    case SettingsEdit::MoveItem:
        return applyMove(edit);
    default:
        return applyText(edit);
    }
    const int left = rowCount(parent);
    Q_EMIT applied(left > 0 ? index(std::min(row, left - 1), NameColumn, parent) : parent);
    return back;
}

SettingsEdit SettingsModel::applyMove(SettingsEdit const& edit)
{
    const QModelIndex parent = edit.isOfSection() ? QModelIndex() : IndexOf({edit.section, -1});
    const int from = edit.isOfSection() ? edit.section : edit.item;
    const int to = edit.target;
    beginMoveRows(parent, from, from, parent, to > from ? to + 1 : to);
    const SettingsEdit back = edit.Apply(m_document);
    if (edit.isOfSection()) {
        const auto start = m_rows.begin();
        if (to > from)
            std::rotate(start + from, start + from + 1, start + to + 1);
        else
            std::rotate(start + to, start + from, start + from + 1);
        renumber();
    }
    endMoveRows();
    Q_EMIT applied(index(to, NameColumn, parent));
    return back;
}

SettingsEdit SettingsModel::applyText(SettingsEdit const& edit)
{
    const SettingsEdit back = edit.Apply(m_document);
    const QModelIndex cell =
        IndexOf({edit.section, edit.isOfSection() ? -1 : edit.item},
                edit.kind == SettingsEdit::SetValue ? ValueColumn : NameColumn);
    Q_EMIT dataChanged(cell, cell);
    Q_EMIT applied(cell);
    return back;
}

QModelIndex SettingsModel::IndexOf(Place place, Column column) const
{
    const QModelIndex section = index(place.section, place.item < 0 ? int(column) : 0);
    return place.item < 0 || !section.isValid() ? section : index(place.item, column, section);
}

QModelIndex SettingsModel::ItemBeside(Place place, int step) const
{
    auto const& sections = m_document.sections;
    int section = place.section;
    int item = place.item + step;
    while (section >= 0 && section < sections.size()) {
        const int count = sections.at(section).items.size();
        if (item >= 0 && item < count)
            return IndexOf({section, item});
        section += step;
        item = 0;
        if (step < 0 && section >= 0)
            item = sections.at(section).items.size() - 1;
    }
    return QModelIndex();
}

// In the order of the tree, around its end.
SettingsModel::Place SettingsModel::rowBeside(Place place, int step) const
{
    auto const& sections = m_document.sections;
    if (step > 0) {
        if (place.item + 1 < sections.at(place.section).items.size())
            return Place{place.section, place.item + 1};
        return Place{(place.section + 1) % int(sections.size()), -1};
    }
    if (place.item >= 0)
        return Place{place.section, place.item - 1};
    const int count = sections.size();
    const int section = (place.section + count - 1) % count;
    return Place{section, int(sections.at(section).items.size()) - 1};
}

QModelIndex SettingsModel::matchIn(Place place, QString const& text) const
{
    SettingsDocument::Section const& section = m_document.sections.at(place.section);
    QString const& name = place.item < 0 ? section.name : section.items.at(place.item).key;
    if (name.contains(text, Qt::CaseInsensitive))
        return IndexOf(place, NameColumn);
    if (place.item >= 0 && section.items.at(place.item).value.contains(text, Qt::CaseInsensitive))
        return IndexOf(place, ValueColumn);
    return QModelIndex();
}

QModelIndex SettingsModel::Find(QString const& text, Place from, int step, bool withFrom) const
{
    if (m_document.sections.isEmpty())
        return QModelIndex();
    const Place start = from.section < 0 ? Place{0, -1} : from;
    Place place = withFrom ? start : rowBeside(start, step);
    const Place last = withFrom ? rowBeside(start, -step) : start;
    for (;; place = rowBeside(place, step)) {
        const QModelIndex match = matchIn(place, text);
        if (match.isValid() || (place.section == last.section && place.item == last.item))
            return match;
    }
}

SettingsModel::Place SettingsModel::PlaceOf(QModelIndex const& index)
{
    if (!index.isValid())
        return Place();
    if (IsSection(index))
        return Place{index.row(), -1};
    return Place{*static_cast<int const*>(index.internalPointer()), index.row()};
}

bool SettingsModel::IsSection(QModelIndex const& index)
{
    return index.isValid() && !index.internalPointer();
}

QString SettingsModel::FullText(QModelIndex const& index)
{
    return index.data(Qt::EditRole).toString();
}

bool SettingsModel::IsLong(QModelIndex const& index)
{
    return FullText(index).size() > MaximumCellLength;
}

ValueKind SettingsModel::KindOf(QModelIndex const& index)
{
    return static_cast<ValueKind>(index.data(KindRole).toInt());
}

bool SettingsModel::HasDialog(QModelIndex const& index)
{
    const QModelIndex cell = index.sibling(index.row(), ValueColumn);
    if (HasValueDialog(KindOf(cell)) || IsLong(cell))
        return true;
    // A field in the cell loses line feeds that are typed, but keeps the breaks that are there.
    const QString text = FullText(cell);
    return text.contains(QLatin1Char('\n')) && ValueDialog::CanEdit(text);
}

QPair<QString, QString> SettingsModel::namesOf(QModelIndex const& index) const
{
    const Place place = PlaceOf(index);
    if (place.item < 0)
        return {};
    SettingsDocument::Section const& section = m_document.sections.at(place.section);
    return {section.name, section.items.at(place.item).key};
}

void SettingsModel::ChooseKind(QModelIndex const& index, ValueKind kind)
{
    m_chosenKinds.insert(namesOf(index), kind);
    const QModelIndex cell = index.sibling(index.row(), ValueColumn);
    Q_EMIT dataChanged(cell, cell);
}

void SettingsModel::GuessKind(QModelIndex const& index)
{
    m_chosenKinds.remove(namesOf(index));
    const QModelIndex cell = index.sibling(index.row(), ValueColumn);
    Q_EMIT dataChanged(cell, cell);
}

bool SettingsModel::HasChosenKind(QModelIndex const& index) const
{
    return m_chosenKinds.contains(namesOf(index));
}

ValueKind SettingsModel::kind(Place place) const
{
    if (place.item < 0)
        return ValueKind::Text;
    SettingsDocument::Section const& section = m_document.sections.at(place.section);
    SettingsDocument::Item const& item = section.items.at(place.item);
    const auto chosen = m_chosenKinds.constFind({section.name, item.key});
    return chosen != m_chosenKinds.constEnd() ? chosen.value()
                                              : TypedText::Guess(section.name, item.value);
}

// What the cell of a value shows besides its text: a check box, or the icon of its kind.
QVariant SettingsModel::valueData(Place place, int role) const
{
    const ValueKind valueKind = kind(place);
    QString const& value = m_document.sections.at(place.section).items.at(place.item).value;
    if (role == Qt::CheckStateRole && valueKind == ValueKind::YesNo)
        return TypedText::ToYesNo(value) ? Qt::Checked : Qt::Unchecked;
    if (role == Qt::DecorationRole && valueKind != ValueKind::YesNo)
        return ValueIcon(valueKind, value, QGuiApplication::palette());
    if (role == Qt::AccessibleDescriptionRole)
        return ValueKindName(valueKind);
    return QVariant();
}

QModelIndex SettingsModel::index(int row, int column, QModelIndex const& parent) const
{
    if (row < 0 || row >= rowCount(parent) || column < 0 || column >= ColumnCount)
        return QModelIndex();
    int* section =
        parent.isValid() ? m_rows[static_cast<std::size_t>(parent.row())].get() : nullptr;
    return createIndex(row, column, section);
}

QModelIndex SettingsModel::parent(QModelIndex const& index) const
{
    if (!index.isValid() || IsSection(index))
        return QModelIndex();
    return createIndex(PlaceOf(index).section, NameColumn, nullptr);
}

int SettingsModel::rowCount(QModelIndex const& parent) const
{
    if (!parent.isValid())
        return m_document.sections.size();
    const bool hasItems = IsSection(parent) && parent.column() == NameColumn;
    return hasItems ? m_document.sections.at(parent.row()).items.size() : 0;
}

int SettingsModel::columnCount(QModelIndex const&) const
{
    return ColumnCount;
}

QString SettingsModel::text(QModelIndex const& index) const
{
    const Place place = PlaceOf(index);
    SettingsDocument::Section const& section = m_document.sections.at(place.section);
    const bool isName = index.column() == NameColumn;
    if (place.item < 0)
        return isName ? section.name : QString();
    SettingsDocument::Item const& item = section.items.at(place.item);
    return isName ? item.key : item.value;
}

QVariant SettingsModel::data(QModelIndex const& index, int role) const
{
    if (!index.isValid())
        return QVariant();
    if (role == Qt::EditRole)
        return text(index);
    if (role == Qt::DisplayRole) {
        const QString full = text(index);
        return full.size() > MaximumCellLength ? Shortened(full, ShortenedLength) : full;
    }
    if (role == KindRole)
        return static_cast<int>(kind(PlaceOf(index)));
    const QVariant look = lookOf(index, role);
    if (IsSection(index) || index.column() != ValueColumn)
        return look;
    const QVariant value = valueData(PlaceOf(index), role);
    if (role == Qt::AccessibleDescriptionRole && look.isValid())
        return tr("%1. %2").arg(value.toString(), look.toString());
    return look.isValid() ? look : value;
}

// A difference is not only bold, which a screen reader does not tell.
QVariant SettingsModel::lookOf(QModelIndex const& index, int role) const
{
    const bool isValue = index.column() == ValueColumn;
    const bool isBold = IsSection(index) || (isValue && DiffersFromDefault(index));
    if (role == Qt::FontRole && isBold) {
        QFont bold;
        bold.setBold(true);
        return bold;
    }
    const bool isText = role == Qt::ToolTipRole || role == Qt::AccessibleDescriptionRole;
    if (!isText || !isValue || !DiffersFromDefault(index))
        return QVariant();
    const QString text = tr("Default: %1").arg(Shortened(DefaultOf(index), ShortenedLength));
    return role == Qt::ToolTipRole ? PlainToolTip(text) : text;
}

QVariant SettingsModel::headerData(int section, Qt::Orientation orientation, int role) const
{
    if (orientation != Qt::Horizontal || role != Qt::DisplayRole)
        return QVariant();
    return section == NameColumn ? tr("Section / key") : tr("Value");
}

Qt::ItemFlags SettingsModel::flags(QModelIndex const& index) const
{
    if (!index.isValid())
        return Qt::NoItemFlags;
    const Qt::ItemFlags usual = Qt::ItemIsEnabled | Qt::ItemIsSelectable;
    return IsSection(index) && index.column() == ValueColumn ? usual : usual | Qt::ItemIsEditable;
}

} // namespace Velocor
