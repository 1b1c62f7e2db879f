// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/settingsfile/SettingsDocument.h"

#include <QObject>

namespace Velocor {

SettingsDocument SettingsDocument::WithErrorAsLoss() const
{
    SettingsDocument document = *this;
    if (isParsed)
        return document;
    if (rootName.isEmpty())
        document.rootName = QStringLiteral("VelocorSettings");
    document.losses.prepend(
        {QString(), QString(),
         QObject::tr("Line %1: everything from there on (%2)").arg(line).arg(error)});
    ++document.lossCount;
    document.isParsed = true;
    return document;
}

QStringList SettingsDocument::TextsOf(QVector<Loss> const& losses)
{
    QStringList texts;
    texts.reserve(losses.size());
    for (Loss const& loss : losses)
        texts.append(loss.text);
    return texts;
}

QString SettingsDocument::Value(QString const& section, QString const& key,
                                QString const& byDefault) const
{
    for (Section const& candidate : sections) {
        if (candidate.name != section)
            continue;
        for (Item const& item : candidate.items) {
            if (item.key == key)
                return item.value;
        }
    }
    return byDefault;
}

SettingsValues SettingsDocument::AllValues() const
{
    SettingsValues values;
    for (Section const& section : sections) {
        for (Item const& item : section.items)
            values.insert({section.name, item.key}, item.value);
    }
    return values;
}

void SettingsDocument::SetValue(QString const& section, QString const& key, QString const& value)
{
    int at = 0;
    while (at < sections.size() && sections.at(at).name != section)
        ++at;
    if (at == sections.size())
        sections.append({section, {}});

    QVector<Item>& items = sections[at].items;
    for (Item& item : items) {
        if (item.key == key) {
            item.value = value;
            return;
        }
    }
    items.append({key, value});
}

bool SettingsDocument::HasSameValues(SettingsDocument const& other) const
{
    if (sections.size() != other.sections.size())
        return false;
    for (int i = 0; i < sections.size(); ++i) {
        QVector<Item> const& items = sections.at(i).items;
        QVector<Item> const& others = other.sections.at(i).items;
        if (sections.at(i).name != other.sections.at(i).name || items.size() != others.size())
            return false;
        for (int j = 0; j < items.size(); ++j) {
            if (items.at(j).key != others.at(j).key || items.at(j).value != others.at(j).value)
                return false;
        }
    }
    return true;
}

} // namespace Velocor
