// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QHash>
#include <QString>

#include <cstring>
#include <utility>
#include <vector>

/// A hash table with text keys that iterates in insertion order.
///
/// The plain way is a QHash next to a list, which allocates a node for each key. Here the entries
/// are in one array, and a second array indexes them. For the goals "load, against QSettings" and
/// "typed reads" in docs/performance.md; tests/plain/tst_PlainTable.cpp compares it with the plain
/// way.
///
/// Keys match exactly and are unique. One thread at a time. Not installed: no public header needs
/// it.
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
        const quint32 found = m_slots.empty() ? 0 : slotOf(key, hashOf(key)).number;
        return found ? &m_entries[found - 1].value : nullptr;
    }

    Value* find(QString const& key)
    {
        return const_cast<Value*>(static_cast<TorkOrderedHash const*>(this)->find(key));
    }

    /// Stores `value` under `key`. An earlier value of that key is replaced and keeps its position.
    /// Both may be references into the table itself.
    void insert(QString const& key, Value const& value)
    {
        Entry entry{key, value}; // copied before the table grows, which may move them
        if (m_slots.size() < 2 * (m_entries.size() + 1))
            grow();

        const uint hash = hashOf(entry.key);
        Slot& slot = const_cast<Slot&>(slotOf(entry.key, hash));
        if (slot.number) {
            m_entries[slot.number - 1].value = std::move(entry.value);
            return;
        }
        m_entries.push_back(std::move(entry));
        slot = {hash, static_cast<quint32>(m_entries.size())};
    }

    void clear()
    {
        m_slots.clear();
        m_entries.clear();
    }

    size_t size() const { return m_entries.size(); }
    typename std::vector<Entry>::const_iterator begin() const { return m_entries.begin(); }
    typename std::vector<Entry>::const_iterator end() const { return m_entries.end(); }

private:
    // The 1-based position of an entry; 0 if the slot is free.
    struct Slot
    {
        uint hash;
        quint32 number;
    };

    uint hashOf(QString const& key) const { return qHash(key, m_seed); }

    // Qt's comparison also determines an order, which a lookup, as in "typed reads", does not need.
    static bool isSame(QString const& a, QString const& b)
    {
        const size_t bytes = static_cast<size_t>(a.length()) * sizeof(QChar);
        return a.length() == b.length() && !std::memcmp(a.constData(), b.constData(), bytes);
    }

    // The slot of the entry with this key, or the free slot that ends the search: at least half of
    // the slots are free, so the search does end.
    Slot const& slotOf(QString const& key, uint hash) const
    {
        const size_t mask = m_slots.size() - 1;
        size_t i = hash & mask;
        while (m_slots[i].number &&
               (m_slots[i].hash != hash || !isSame(m_entries[m_slots[i].number - 1].key, key)))
            i = (i + 1) & mask;
        return m_slots[i];
    }

    void grow()
    {
        const std::vector<Slot> before = std::move(m_slots);
        // cppcheck-suppress accessMoved ; assign() works on any moved-from vector
        m_slots.assign(before.empty() ? 8 : 2 * before.size(), Slot{0, 0});
        m_entries.reserve(m_slots.size() / 2);
        const size_t mask = m_slots.size() - 1;
        for (Slot const& slot : before) {
            size_t i = slot.hash & mask;
            while (slot.number && m_slots[i].number)
                i = (i + 1) & mask;
            if (slot.number)
                m_slots[i] = slot;
        }
    }

    std::vector<Entry> m_entries;
    std::vector<Slot> m_slots; // the size is a power of two
    uint m_seed = static_cast<uint>(qGlobalQHashSeed());
};
