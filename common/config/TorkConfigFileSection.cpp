// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/config/TorkConfigFileSection.h"

#include "common/config/TorkOrderedHash_p.h"

TorkConfigFileSection::TorkConfigFileSection(char const* name)
    : m_name(QString::fromUtf8(name ? name : "UnknownSection")),
      m_values(new TorkOrderedHash<QString>)
{}

TorkConfigFileSection::~TorkConfigFileSection() = default;

bool TorkConfigFileSection::IsCalled(QString const& name) const
{
    return m_name == name;
}

bool TorkConfigFileSection::AddValue(QString const& key, QString const& value)
{
    m_values->insert(key, value);
    return true;
}

bool TorkConfigFileSection::FindValue(QString const& key, QString& value)
{
    QString const* stored = m_values->find(key);
    if (!stored)
        return false;

    value = *stored;
    return true;
}

QStringList TorkConfigFileSection::keyList() const
{
    QStringList keys;
    keys.reserve(static_cast<int>(m_values->size()));
    for (auto const& entry : *m_values)
        keys.append(entry.key);
    return keys;
}

QVector<TorkConfigFileSection::Item> TorkConfigFileSection::values() const
{
    QVector<Item> items;
    items.reserve(static_cast<int>(m_values->size()));
    for (auto const& entry : *m_values)
        items.append({entry.key, entry.value});
    return items;
}

void TorkConfigFileSection::Clear()
{
    m_values->clear();
}
