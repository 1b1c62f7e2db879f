// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/settings/SettingsCommands.h"

#include "app/window/widgets/PlainText.h"
#include "common/config/TorkConfigText.h"

#include <QSet>
#include <QUndoCommand>

#include <algorithm>

namespace Velocor {

namespace {

using Place = SettingsModel::Place;

// The maximum length of each name in a message, in characters.
constexpr int MaximumNameLength = 40;

// The maximum number of keys that a message about a removal names.
constexpr int MaximumNamedKeys = 10;

// Edits in their order; undone in the reverse one.
class EditCommand : public QUndoCommand
{
public:
    EditCommand(SettingsModel* model, QVector<SettingsEdit> const& edits, QString const& text)
        : QUndoCommand(text), m_model(model), m_edits(edits)
    {}

    void redo() override { swap(); }
    void undo() override { swap(); }

private:
    // What takes the edits back, in the reverse order, takes itself back in the same way.
    void swap()
    {
        for (SettingsEdit& edit : m_edits)
            edit = m_model->Apply(edit);
        std::reverse(m_edits.begin(), m_edits.end());
    }

    SettingsModel* m_model;
    QVector<SettingsEdit> m_edits;
};

SettingsEdit EditAt(SettingsEdit::Kind kind, Place place)
{
    SettingsEdit edit;
    edit.kind = kind;
    edit.section = place.section;
    edit.item = place.item;
    return edit;
}

QString const& NameOf(SettingsDocument::Section const& section)
{
    return section.name;
}

QString const& NameOf(SettingsDocument::Item const& item)
{
    return item.key;
}

template <class Entry>
bool HaveSameNames(QVector<Entry> const& left, QVector<Entry> const& right)
{
    return std::equal(left.begin(), left.end(), right.begin(), right.end(),
                      [](Entry const& a, Entry const& b) { return NameOf(a) == NameOf(b); });
}

SettingsEdit InsertionOf(int position, SettingsDocument::Section const& section)
{
    SettingsEdit edit = EditAt(SettingsEdit::InsertSection, {position, -1});
    edit.addedSection = section;
    return edit;
}

// What makes one section of another with the same name.
QVector<SettingsEdit> EditsOfSection(int position, SettingsDocument::Section const& before,
                                     SettingsDocument::Section const& after)
{
    if (!HaveSameNames(before.items, after.items))
        return {EditAt(SettingsEdit::RemoveSection, {position, -1}), InsertionOf(position, after)};
    QVector<SettingsEdit> edits;
    for (int i = 0; i < after.items.size(); ++i) {
        if (before.items.at(i).value == after.items.at(i).value)
            continue;
        edits.append(EditAt(SettingsEdit::SetValue, {position, i}));
        edits.last().text = after.items.at(i).value;
    }
    return edits;
}

} // namespace

void SettingsCommands::push(Edits const& edits, QString const& text)
{
    m_undo.push(new EditCommand(m_model, edits, text));
}

// The names of the other sections, or of the other keys in the section.
QStringList SettingsCommands::namesBeside(Place place) const
{
    QStringList names;
    auto const& sections = m_model->document().sections;
    if (place.item < 0) {
        for (int i = 0; i < sections.size(); ++i) {
            if (i != place.section)
                names.append(sections.at(i).name);
        }
        return names;
    }
    auto const& items = sections.at(place.section).items;
    for (int i = 0; i < items.size(); ++i) {
        if (i != place.item)
            names.append(items.at(i).key);
    }
    return names;
}

// Of a place that does not exist yet.
QString SettingsCommands::freeName(Place place, QString const& base) const
{
    QSet<QString> taken{m_model->document().rootName};
    const QStringList names = namesBeside(place);
    for (QString const& other : names)
        taken.insert(other);
    QString name = base;
    for (int number = 2; taken.contains(name); ++number)
        name = base + QString::number(number);
    return name;
}

QModelIndex SettingsCommands::AddSection()
{
    const int end = m_model->document().sections.size();
    SettingsEdit edit = EditAt(SettingsEdit::InsertSection, {end, -1});
    edit.addedSection.name = freeName({end, -1}, QStringLiteral("Section"));
    push({edit}, tr("Add Section"));
    return m_model->IndexOf({edit.section, -1});
}

QModelIndex SettingsCommands::AddKey(QModelIndex const& near)
{
    if (!near.isValid())
        return QModelIndex();
    Place place = SettingsModel::PlaceOf(near);
    const int end = m_model->document().sections.at(place.section).items.size();
    place.item = end;
    SettingsEdit edit = EditAt(SettingsEdit::InsertItem, place);
    edit.addedItem = {freeName(place, QStringLiteral("key")), QStringLiteral("value")};
    push({edit}, tr("Add Key"));
    return m_model->IndexOf(place);
}

QModelIndex SettingsCommands::Duplicate(QModelIndex const& index)
{
    if (!index.isValid())
        return QModelIndex();
    Place place = SettingsModel::PlaceOf(index);
    auto const& sections = m_model->document().sections;
    if (place.item < 0) {
        SettingsEdit edit = EditAt(SettingsEdit::InsertSection, {place.section + 1, -1});
        edit.addedSection = sections.at(place.section);
        edit.addedSection.name = freeName({int(sections.size()), -1}, edit.addedSection.name);
        push({edit}, tr("Duplicate Section"));
        return m_model->IndexOf({place.section + 1, -1});
    }
    auto const& items = sections.at(place.section).items;
    SettingsEdit edit = EditAt(SettingsEdit::InsertItem, {place.section, place.item + 1});
    edit.addedItem = items.at(place.item);
    edit.addedItem.key = freeName({place.section, int(items.size())}, edit.addedItem.key);
    push({edit}, tr("Duplicate Key"));
    return m_model->IndexOf({place.section, place.item + 1});
}

// From the end of the document to its start, each row once, and no item of a removed section.
QVector<Place> SettingsCommands::placesToRemove(QModelIndexList const& indexes) const
{
    QVector<Place> places;
    for (QModelIndex const& index : indexes) {
        if (!index.isValid() || index.column() != SettingsModel::NameColumn)
            continue;
        const Place place = SettingsModel::PlaceOf(index);
        const bool isPart = place.item < 0 && m_model->HidesItemsOf(place.section);
        if (isPart)
            places += m_model->ShownItemsOf(place.section);
        else
            places.append(place);
    }
    const auto before = [](Place a, Place b) {
        return a.section != b.section ? a.section < b.section : a.item < b.item;
    };
    std::sort(places.begin(), places.end(), before);
    QVector<Place> result;
    for (Place place : qAsConst(places)) {
        const Place last = result.isEmpty() ? Place() : result.last();
        const bool isCovered = last.item < 0 || last.item == place.item;
        if (last.section != place.section || !isCovered)
            result.append(place);
    }
    std::reverse(result.begin(), result.end());
    return result;
}

void SettingsCommands::Remove(QModelIndexList const& indexes)
{
    Edits edits;
    const QVector<Place> places = placesToRemove(indexes);
    for (Place place : places)
        edits.append(
            EditAt(place.item < 0 ? SettingsEdit::RemoveSection : SettingsEdit::RemoveItem, place));
    if (edits.isEmpty())
        return;
    const QString text = removalText(edits);
    if (edits.size() > 1)
        push(edits, tr("Remove %1 Items").arg(edits.size()));
    else if (edits.first().isOfSection())
        push(edits, tr("Remove Section"));
    else
        push(edits, tr("Remove Key"));
    if (!text.isEmpty())
        Q_EMIT removed(text);
}

// Empty for a single key, or a section with at most one.
QString SettingsCommands::removalText(Edits const& removals) const
{
    QStringList names;
    QStringList sectionNames;
    int keys = 0;
    const auto add = [&](SettingsDocument::Item const& item) {
        if (++keys <= MaximumNamedKeys)
            names.append(Shortened(item.key, MaximumNameLength));
    };
    for (auto edit = removals.rbegin(); edit != removals.rend(); ++edit) { // in document order
        SettingsDocument::Section const& section = m_model->document().sections.at(edit->section);
        if (!edit->isOfSection()) {
            add(section.items.at(edit->item));
            continue;
        }
        sectionNames.append(Shortened(section.name, MaximumNameLength));
        std::for_each(section.items.begin(), section.items.end(), add);
    }
    if (keys < 2)
        return QString();
    if (keys > MaximumNamedKeys)
        names.append(tr("and %1 more").arg(keys - MaximumNamedKeys));
    const QString list = names.join(QLatin1String(", "));
    if (sectionNames.isEmpty())
        return tr("Removed %Ln key(s): ", nullptr, keys) + list;
    const QString of = sectionNames.size() == 1
                           ? tr("section ") + sectionNames.first()
                           : tr("%Ln section(s)", nullptr, sectionNames.size());
    return tr("Removed ") + of + tr(", with %Ln key(s): ", nullptr, keys) + list;
}

void SettingsCommands::backToDefault(QVector<Place> const& items)
{
    Edits edits;
    for (Place place : items) {
        if (!m_model->DiffersFromDefault(place))
            continue;
        edits.append(EditAt(SettingsEdit::SetValue, place));
        edits.last().text = m_model->DefaultOf(place);
    }
    if (!edits.isEmpty())
        push(edits, tr("Back to Default"));
}

void SettingsCommands::BackToDefault(QModelIndexList const& indexes)
{
    QVector<Place> items;
    for (QModelIndex const& index : indexes) {
        if (SettingsModel::IsSection(index))
            items += m_model->ShownItemsOf(SettingsModel::PlaceOf(index).section);
        else
            items.append(SettingsModel::PlaceOf(index));
    }
    backToDefault(items);
}

void SettingsCommands::AllBackToDefault()
{
    QVector<Place> items;
    auto const& sections = m_model->document().sections;
    for (int section = 0; section < sections.size(); ++section) {
        for (int item = 0; item < sections.at(section).items.size(); ++item)
            items.append(Place{section, item});
    }
    backToDefault(items);
}

// Rows that stay keep their place on the screen.
SettingsCommands::Edits SettingsCommands::editsTo(SettingsDocument const& document) const
{
    auto const& old = m_model->document().sections;
    auto const& sections = document.sections;
    Edits edits;
    if (HaveSameNames(old, sections)) {
        for (int i = 0; i < sections.size(); ++i)
            edits += EditsOfSection(i, old.at(i), sections.at(i));
        return edits;
    }
    for (int i = old.size() - 1; i >= 0; --i)
        edits.append(EditAt(SettingsEdit::RemoveSection, {i, -1}));
    for (int i = 0; i < sections.size(); ++i)
        edits.append(InsertionOf(i, sections.at(i)));
    return edits;
}

void SettingsCommands::Replace(SettingsDocument const& document, QString const& text)
{
    const Edits edits = editsTo(document);
    if (!edits.isEmpty())
        push(edits, text);
}

void SettingsCommands::Move(QModelIndex const& index, int step)
{
    if (!index.isValid())
        return;
    const QModelIndex beside = index.sibling(index.row() + step, SettingsModel::NameColumn);
    if (!beside.isValid())
        return;
    const Place place = SettingsModel::PlaceOf(index);
    const Place target = SettingsModel::PlaceOf(beside);
    const bool isSection = place.item < 0;
    SettingsEdit edit =
        EditAt(isSection ? SettingsEdit::MoveSection : SettingsEdit::MoveItem, place);
    edit.target = isSection ? target.section : target.item;
    push({edit}, isSection ? tr("Move Section") : tr("Move Key"));
}

void SettingsCommands::Toggle(QModelIndex const& index)
{
    if (SettingsModel::KindOf(index) != ValueKind::YesNo)
        return;
    const QModelIndex cell = index.sibling(index.row(), SettingsModel::ValueColumn);
    const bool isYes = TypedText::ToYesNo(SettingsModel::FullText(cell));
    SetText(cell, TypedText::FromYesNo(!isYes));
}

SettingsCommands::NameProblem SettingsCommands::CheckName(QModelIndex const& index,
                                                          QString const& name) const
{
    const QString shown = Shortened(name, MaximumNameLength);
    if (!TorkConfigText::IsPlainName(name))
        return {tr("\"%1\" is not a valid section or key name").arg(shown),
                tr("Use letters, digits, \"_\", \"-\" and \".\"; start with a letter or \"_\"")};
    if (name == m_model->document().rootName)
        return {tr("\"%1\" is the name of the root element").arg(shown), QString()};
    if (namesBeside(SettingsModel::PlaceOf(index)).contains(name))
        return {tr("There is already a \"%1\" here").arg(shown), QString()};
    return NameProblem();
}

QString SettingsCommands::SetText(QModelIndex const& index, QString const& text)
{
    const Place place = SettingsModel::PlaceOf(index);
    const QString old = SettingsModel::FullText(index);
    const bool isValue = index.column() == SettingsModel::ValueColumn;
    SettingsEdit edit = EditAt(SettingsEdit::SetValue, place);
    edit.text = text;
    if (!isValue) {
        edit.text.remove(QLatin1Char(' '));
        edit.kind = place.item < 0 ? SettingsEdit::RenameSection : SettingsEdit::RenameItem;
    }
    if (edit.text == old)
        return QString();
    if (isValue) {
        push({edit}, tr("Change Value"));
        return QString();
    }
    const NameProblem problem = CheckName(index, edit.text);
    if (!problem.reason.isEmpty())
        return problem.reason + tr(", so \"%1\" is kept. ").arg(Shortened(old, MaximumNameLength)) +
               problem.hint;
    push({edit}, place.item < 0 ? tr("Rename Section") : tr("Rename Key"));
    return QString();
}

} // namespace Velocor
