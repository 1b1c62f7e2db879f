// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QHash>
#include <QString>

#include <vector>

/// A hash table with text keys that is enumerated in the order in which its keys first came in.
///
/// Lookups cost one hash lookup; walking through the entries walks an array. A saved file thus
/// keeps the order in which it was read, so that two saved files differ only where values differ.
/// Keys match exactly and are unique. One thread at a time.
///
///     TorkOrderedHash<int> wheels;
///     wheels.insert("car", 4);
///     wheels.insert("bicycle", 2);
///     for (auto const& entry : wheels)
///         qDebug() << entry.key << entry.value; // the car first
template <class Value>
class TorkOrderedHash
{
public:
    struct Entry
    {
        QString key;
        Value value;
    };

    /// The value under `key`, owned by the table and valid until the next insert() or clear();
    /// null if there is none.
    Value const* find(QString const& key) const
    {
        const auto position = m_positions.constFind(key);
        return position == m_positions.constEnd() ? nullptr : &m_entries[*position].value;
    }

    Value* find(QString const& key)
    {
        return const_cast<Value*>(static_cast<TorkOrderedHash const*>(this)->find(key));
    }

    /// Stores `value` under `key`. An earlier value of that key is replaced at its old place.
    void insert(QString const& key, Value const& value)
    {
        size_t& position = m_positions[key]; // one search for both cases: a new key comes out as 0
        if (size_t(m_positions.size()) == m_entries.size()) {
            m_entries[position].value = value;
            return;
        }
        position = m_entries.size();
        m_entries.push_back({key, value});
    }

    void clear()
    {
        m_positions.clear();
        m_entries.clear();
    }

    size_t size() const { return m_entries.size(); }
    typename std::vector<Entry>::const_iterator begin() const { return m_entries.begin(); }
    typename std::vector<Entry>::const_iterator end() const { return m_entries.end(); }

private:
    std::vector<Entry> m_entries;
    QHash<QString, size_t> m_positions;
};
