// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/settingsfile/SettingsEdit.h"

#include <utility>

namespace Velocor {

SettingsEdit SettingsEdit::Apply(SettingsDocument& document) const
{
    return isOfSection() ? applyToSections(document.sections)
                         : applyToItems(document.sections[section].items);
}

SettingsEdit SettingsEdit::applyToSections(QVector<SettingsDocument::Section>& sections) const
{
    SettingsEdit back;
    back.kind = kind;
    back.section = section;
    switch (kind) {
    case InsertSection:
        sections.insert(section, addedSection);
        back.kind = RemoveSection;
        break;
    case RemoveSection:
        back.kind = InsertSection;
        back.addedSection = sections.takeAt(section);
        break;
    case MoveSection:
        sections.move(section, target);
        back.section = target;
        back.target = section;
        break;
    default:
        back.text = std::exchange(sections[section].name, text);
        break;
    }
    return back;
}

SettingsEdit SettingsEdit::applyToItems(QVector<SettingsDocument::Item>& items) const
{
    SettingsEdit back;
    back.kind = kind;
    back.section = section;
    back.item = item;
    switch (kind) {
    case InsertItem:
        items.insert(item, addedItem);
        back.kind = RemoveItem;
        break;
    case RemoveItem:
        back.kind = InsertItem;
        back.addedItem = items.takeAt(item);
        break;
    case MoveItem:
        items.move(item, target);
        back.item = target;
        back.target = item;
        break;
    case RenameItem:
        back.text = std::exchange(items[item].key, text);
        break;
    default:
        back.text = std::exchange(items[item].value, text);
        break;
    }
    return back;
}

} // namespace Velocor
