// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/settings/SettingsModel.h"

#include "app/settingsfile/CaselessText.h"
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
    setRows(shownRows());
    endResetModel();
}

// The same rows need not be laid out again, which takes longer than finding them: with 100,000
// values, a key press is to be answered within 16 ms.
bool SettingsModel::SetFilter(SettingsFilter const& filter)
{
    m_filter = filter;
    SettingsFilter::Shown shown = shownRows();
    if (hasRows(shown))
        return false;
    beginResetModel();
    setRows(std::move(shown));
    endResetModel();
    return true;
}

SettingsFilter::Shown SettingsModel::shownRows() const
{
    return m_filter.Of(m_document, m_filter.onlyChanged ? m_saved.AllValues() : SettingsValues(),
                       m_defaults);
}

bool SettingsModel::hasRows(SettingsFilter::Shown const& shown) const
{
    return m_shownSections.numbers() == shown.sections &&
           std::equal(m_rows.begin(), m_rows.end(), shown.items.begin(), shown.items.end(),
                      [](std::unique_ptr<SectionRows> const& rows, std::vector<int> const& items) {
                          return rows->items.numbers() == items;
                      });
}

void SettingsModel::setRows(SettingsFilter::Shown shown)
{
    m_shownSections = SettingsRows(std::move(shown.sections));
    m_rows.clear();
    for (std::vector<int>& items : shown.items)
        m_rows.push_back(std::make_unique<SectionRows>(
            SectionRows{static_cast<int>(m_rows.size()), SettingsRows(std::move(items))}));
}

int SettingsModel::shownCount() const
{
    int count = 0;
    for (int row = 0; row < m_shownSections.count(); ++row)
        count += itemCount(row);
    return count;
}

void SettingsModel::SetDefaults(SettingsValues const& defaults)
{
    m_defaults = defaults;
    for (int row = 0; row < m_shownSections.count(); ++row) {
        const QModelIndex section = index(row, NameColumn);
        if (itemCount(row) > 0)
            Q_EMIT dataChanged(index(0, ValueColumn, section),
                               index(itemCount(row) - 1, ValueColumn, section));
    }
}

QString SettingsModel::DefaultOf(Place place) const
{
    if (place.item < 0 || m_defaults.isEmpty())
        return QString();
    SettingsDocument::Section const& section = m_document.sections.at(place.section);
    return m_defaults.value({section.name, section.items.at(place.item).key});
}

bool SettingsModel::DiffersFromDefault(Place place) const
{
    const QString byDefault = DefaultOf(place);
    return !byDefault.isNull() &&
           byDefault != m_document.sections.at(place.section).items.at(place.item).value;
}

bool SettingsModel::HidesItemsOf(int section) const
{
    return m_rows[static_cast<std::size_t>(section)]->items.count() <
           m_document.sections.at(section).items.size();
}

QVector<SettingsModel::Place> SettingsModel::ShownItemsOf(int section) const
{
    QVector<Place> places;
    SettingsRows const& items = m_rows[static_cast<std::size_t>(section)]->items;
    for (int row = 0; row < items.count(); ++row)
        places.append(Place{section, items.at(row)});
    return places;
}

void SettingsModel::renumber()
{
    int number = 0;
    for (auto const& rows : m_rows)
        rows->section = number++;
}

// The rows among which an edit adds, removes or moves one.
SettingsRows& SettingsModel::shownBeside(SettingsEdit const& edit)
{
    return edit.isOfSection() ? m_shownSections
                              : m_rows[static_cast<std::size_t>(edit.section)]->items;
}

// Adds the row of a place, if it is hidden.
void SettingsModel::show(Place place)
{
    if (m_shownSections.RowOf(place.section) < 0) {
        const int row = m_shownSections.RowFor(place.section);
        beginInsertRows(QModelIndex(), row, row);
        m_shownSections.Show(place.section);
        endInsertRows();
    }
    SettingsRows& items = m_rows[static_cast<std::size_t>(place.section)]->items;
    if (place.item >= 0 && items.RowOf(place.item) < 0) {
        const int row = items.RowFor(place.item);
        beginInsertRows(IndexOf({place.section, -1}), row, row);
        items.Show(place.item);
        endInsertRows();
    }
}

SettingsEdit SettingsModel::Apply(SettingsEdit const& edit)
{
    switch (edit.kind) {
    case SettingsEdit::InsertSection:
    case SettingsEdit::InsertItem:
        return applyInsertion(edit);
    case SettingsEdit::RemoveSection:
    case SettingsEdit::RemoveItem:
        return applyRemoval(edit);
    case SettingsEdit::MoveSection:
    case SettingsEdit::MoveItem:
        return applyMove(edit);
    default:
        return applyText(edit);
    }
}

SettingsEdit SettingsModel::applyInsertion(SettingsEdit const& edit)
{
    if (!edit.isOfSection())
        show({edit.section, -1});
    const QModelIndex parent = edit.isOfSection() ? QModelIndex() : IndexOf({edit.section, -1});
    const int number = edit.isOfSection() ? edit.section : edit.item;
    SettingsRows& shown = shownBeside(edit);
    const int row = shown.RowFor(number);
    beginInsertRows(parent, row, row);
    const SettingsEdit back = edit.Apply(m_document);
    shown.Insert(number);
    if (edit.isOfSection())
        m_rows.insert(m_rows.begin() + number,
                      std::make_unique<SectionRows>(
                          SectionRows{number, SettingsRows::All(edit.addedSection.items.size())}));
    renumber();
    endInsertRows();
    Q_EMIT applied(index(row, NameColumn, parent));
    return back;
}

SettingsEdit SettingsModel::applyRemoval(SettingsEdit const& edit)
{
    if (!edit.isOfSection())
        show({edit.section, -1});
    const QModelIndex parent = edit.isOfSection() ? QModelIndex() : IndexOf({edit.section, -1});
    const int number = edit.isOfSection() ? edit.section : edit.item;
    SettingsRows& shown = shownBeside(edit);
    const bool isShown = shown.RowOf(number) >= 0;
    const int row = shown.RowFor(number);
    if (isShown)
        beginRemoveRows(parent, row, row);
    const SettingsEdit back = edit.Apply(m_document);
    shown.Remove(number);
    if (edit.isOfSection())
        m_rows.erase(m_rows.begin() + number);
    renumber();
    if (isShown)
        endRemoveRows();
    const int left = rowCount(parent);
    Q_EMIT applied(left > 0 ? index(std::min(row, left - 1), NameColumn, parent) : parent);
    return back;
}

SettingsEdit SettingsModel::applyMove(SettingsEdit const& edit)
{
    const int from = edit.isOfSection() ? edit.section : edit.item;
    const int to = edit.target;
    show({edit.section, edit.isOfSection() ? -1 : from});
    const QModelIndex parent = edit.isOfSection() ? QModelIndex() : IndexOf({edit.section, -1});
    SettingsRows& shown = shownBeside(edit);
    const int row = shown.RowOf(from);
    const int rowAfter = shown.RowAfterMove(from, to);
    if (rowAfter != row)
        beginMoveRows(parent, row, row, parent, rowAfter > row ? rowAfter + 1 : rowAfter);
    const SettingsEdit back = edit.Apply(m_document);
    shown.Move(from, to);
    if (edit.isOfSection()) {
        const auto start = m_rows.begin();
        if (to > from)
            std::rotate(start + from, start + from + 1, start + to + 1);
        else
            std::rotate(start + to, start + from, start + from + 1);
        renumber();
    }
    if (rowAfter != row)
        endMoveRows();
    Q_EMIT applied(index(rowAfter, NameColumn, parent));
    return back;
}

SettingsEdit SettingsModel::applyText(SettingsEdit const& edit)
{
    show({edit.section, edit.isOfSection() ? -1 : edit.item});
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
    const int sectionRow = m_shownSections.RowOf(place.section);
    const QModelIndex section = index(sectionRow, place.item < 0 ? int(column) : 0);
    if (place.item < 0 || !section.isValid())
        return section;
    const int row = m_rows[static_cast<std::size_t>(place.section)]->items.RowOf(place.item);
    return index(row, column, section);
}

int SettingsModel::itemCount(int sectionRow) const
{
    return m_rows[static_cast<std::size_t>(m_shownSections.at(sectionRow))]->items.count();
}

QModelIndex SettingsModel::ItemBeside(QModelIndex const& index, int step) const
{
    const bool isSection = IsSection(index);
    int section = isSection ? index.row() : parent(index).row();
    int item = (isSection ? -1 : index.row()) + step;
    while (section >= 0 && section < m_shownSections.count()) {
        if (item >= 0 && item < itemCount(section))
            return this->index(item, NameColumn, this->index(section, NameColumn));
        section += step;
        item = 0;
        if (step < 0 && section >= 0)
            item = itemCount(section) - 1;
    }
    return QModelIndex();
}

std::vector<SettingsModel::Match> SettingsModel::FindAll(QString const& text) const
{
    const CaselessText wanted(text);
    std::vector<Match> matches;
    for (int row = 0; row < m_shownSections.count(); ++row) {
        const int number = m_shownSections.at(row);
        SettingsDocument::Section const& section = m_document.sections.at(number);
        if (wanted.IsIn(section.name))
            matches.push_back({{number, -1}, NameColumn});
        SettingsRows const& items = m_rows[static_cast<std::size_t>(number)]->items;
        for (int i = 0; i < items.count(); ++i) {
            SettingsDocument::Item const& item = section.items.at(items.at(i));
            const bool isName = wanted.IsIn(item.key);
            if (isName || wanted.IsIn(item.value))
                matches.push_back({{number, items.at(i)}, isName ? NameColumn : ValueColumn});
        }
    }
    return matches;
}

SettingsModel::Place SettingsModel::PlaceOf(QModelIndex const& index)
{
    if (!index.isValid())
        return Place();
    if (IsSection(index)) {
        auto const* model = static_cast<SettingsModel const*>(index.model());
        return Place{model->m_shownSections.at(index.row()), -1};
    }
    auto const* rows = static_cast<SectionRows const*>(index.internalPointer());
    return Place{rows->section, rows->items.at(index.row())};
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
    if (!parent.isValid())
        return createIndex(row, column, nullptr);
    const int section = m_shownSections.at(parent.row());
    return createIndex(row, column, m_rows[static_cast<std::size_t>(section)].get());
}

QModelIndex SettingsModel::parent(QModelIndex const& index) const
{
    if (!index.isValid() || IsSection(index))
        return QModelIndex();
    const int section = static_cast<SectionRows const*>(index.internalPointer())->section;
    return createIndex(m_shownSections.RowOf(section), NameColumn, nullptr);
}

int SettingsModel::rowCount(QModelIndex const& parent) const
{
    if (!parent.isValid())
        return m_shownSections.count();
    const bool hasItems = IsSection(parent) && parent.column() == NameColumn;
    return hasItems ? itemCount(parent.row()) : 0;
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
    const bool isDifferent = isValue && DiffersFromDefault(PlaceOf(index));
    const bool isBold = IsSection(index) || isDifferent;
    if (role == Qt::FontRole && isBold) {
        QFont bold;
        bold.setBold(true);
        return bold;
    }
    const bool isText = role == Qt::ToolTipRole || role == Qt::AccessibleDescriptionRole;
    if (!isText || !isDifferent)
        return QVariant();
    const QString text =
        tr("Default: %1").arg(Shortened(DefaultOf(PlaceOf(index)), ShortenedLength));
    return role == Qt::ToolTipRole ? PlainToolTip(LeftToRight(text)) : text;
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
    if (!IsSection(index)) // which spares the tree a persistent index for each item
        return usual | Qt::ItemIsEditable | Qt::ItemNeverHasChildren;
    return index.column() == ValueColumn ? usual : usual | Qt::ItemIsEditable;
}

} // namespace Velocor
