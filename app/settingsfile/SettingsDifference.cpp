// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/settingsfile/SettingsDifference.h"

#include <algorithm>

namespace Velocor {

namespace {

using Section = SettingsDocument::Section;
using Item = SettingsDocument::Item;
using Row = SettingsDifference::Row;

QString const& NameOf(Section const& section)
{
    return section.name;
}

QString const& NameOf(Item const& item)
{
    return item.key;
}

template <class Entry>
QHash<QString, int> Positions(QVector<Entry> const& entries)
{
    QHash<QString, int> positions;
    for (int i = 0; i < entries.size(); ++i)
        positions.insert(NameOf(entries.at(i)), i);
    return positions;
}

// Where something is in each of two lists; -1 if it is not there.
struct Pair
{
    int before;
    int after;
    bool isMoved;
};

// Marks all pairs as moved that are not in the longest sequence in which both positions ascend.
// `pairs` ascend by `after`, and each is in both lists.
void MarkMoved(QVector<Pair*> const& pairs)
{
    QVector<int> ends; // of the best sequence of each length, less one
    QVector<int> previous(pairs.size(), -1);
    for (int i = 0; i < pairs.size(); ++i) {
        const auto isBefore = [&](int end, int position) {
            return pairs.at(end)->before < position;
        };
        const auto found =
            std::lower_bound(ends.begin(), ends.end(), pairs.at(i)->before, isBefore);
        const int length = static_cast<int>(found - ends.begin());
        if (length > 0)
            previous[i] = ends.at(length - 1);
        if (length == ends.size())
            ends.append(i);
        else
            ends[length] = i;
        pairs.at(i)->isMoved = true;
    }
    for (int i = ends.isEmpty() ? -1 : ends.last(); i >= 0; i = previous.at(i))
        pairs.at(i)->isMoved = false;
}

// In the order of `after`; what only `before` has comes after what it follows there.
template <class Entry>
QVector<Pair> Align(QVector<Entry> const& before, QVector<Entry> const& after)
{
    const QHash<QString, int> inBefore = Positions(before);
    const QHash<QString, int> inAfter = Positions(after);
    QVector<Pair> kept;
    for (int i = 0; i < after.size(); ++i)
        kept.append({inBefore.value(NameOf(after.at(i)), -1), i, false});
    QVector<Pair*> both;
    for (Pair& pair : kept) {
        if (pair.before >= 0)
            both.append(&pair);
    }
    MarkMoved(both);

    QVector<Pair> all;
    int next = 0;
    const auto addRemoved = [&](int end) {
        for (; next < end; ++next) {
            if (!inAfter.contains(NameOf(before.at(next))))
                all.append({next, -1, false});
        }
    };
    for (Pair const& pair : qAsConst(kept)) {
        if (pair.before >= 0 && !pair.isMoved)
            addRemoved(pair.before);
        all.append(pair);
    }
    addRemoved(before.size());
    return all;
}

void AddSection(QVector<Row>& rows, Pair const& place, SettingsDocument const& before,
                SettingsDocument const& after)
{
    const Section left = before.sections.value(place.before);
    const Section right = after.sections.value(place.after);
    Row row;
    row.section = place.after >= 0 ? right.name : left.name;
    row.isBefore = place.before >= 0;
    row.isAfter = place.after >= 0;
    row.isMoved = place.isMoved;
    rows.append(row);
    const QVector<Pair> pairs = Align(left.items, right.items);
    for (Pair const& pair : pairs) {
        const Item leftItem = left.items.value(pair.before);
        const Item rightItem = right.items.value(pair.after);
        row.key = QLatin1String("") + (pair.after >= 0 ? rightItem.key : leftItem.key);
        row.isBefore = pair.before >= 0;
        row.isAfter = pair.after >= 0;
        row.isMoved = pair.isMoved;
        row.before = leftItem.value;
        row.after = rightItem.value;
        rows.append(row);
    }
}

// Some rows as in the second document, and in its order: the section's row, and those of its items.
struct Group
{
    QVector<Row> items;
    QSet<QString> taken; // keys
    Row section;
    bool isTaken = false; // as a whole
};

QVector<Group> GroupsOf(QVector<Row> const& rows, QSet<int> const& chosen)
{
    QVector<Group> groups;
    for (int i = 0; i < rows.size(); ++i) {
        Row const& row = rows.at(i);
        if (row.isSection()) {
            groups.append(Group());
            groups.last().section = row;
            groups.last().isTaken = chosen.contains(i);
            continue;
        }
        groups.last().items.append(row);
        if (groups.last().isTaken || chosen.contains(i))
            groups.last().taken.insert(row.key);
    }
    return groups;
}

// The entries of the first document that stay where they are, each followed by those that come
// after it in the rows and are new or moved there.
template <class Entry>
class Merge
{
public:
    // In the order of the rows. What the second document has elsewhere says nothing about the place
    // of others.
    void keep(QString const& name, Entry const& entry, bool isElsewhere)
    {
        m_kept.insert(name, entry);
        if (!isElsewhere)
            m_last = name;
    }
    void add(Entry const& entry) { m_new[m_last].append(entry); }

    QVector<Entry> result(QVector<Entry> const& before) const
    {
        QVector<Entry> all = m_new.value(QString());
        for (Entry const& entry : before) {
            const auto kept = m_kept.constFind(NameOf(entry));
            if (kept == m_kept.constEnd())
                continue;
            all.append(kept.value());
            all += m_new.value(kept.key());
        }
        return all;
    }

private:
    QHash<QString, Entry> m_kept;
    QHash<QString, QVector<Entry>> m_new;
    QString m_last;
};

QVector<Item> MergedItems(Group const& group, QVector<Item> const& before)
{
    Merge<Item> merge;
    for (Row const& row : group.items) {
        const bool isTaken = group.taken.contains(row.key);
        const bool leaves = isTaken && (!row.isAfter || row.isMoved);
        if (row.isBefore && !leaves)
            merge.keep(row.key, {row.key, isTaken ? row.after : row.before}, row.isMoved);
        else if (isTaken && row.isAfter)
            merge.add({row.key, row.after});
    }
    return merge.result(before);
}

} // namespace

SettingsDifference SettingsDifference::Between(SettingsDocument const& before,
                                               SettingsDocument const& after)
{
    SettingsDifference difference;
    difference.rootBefore = before.rootName;
    difference.rootAfter = after.rootName;
    const QVector<Pair> pairs = Align(before.sections, after.sections);
    for (Pair const& pair : pairs)
        AddSection(difference.rows, pair, before, after);
    return difference;
}

bool SettingsDifference::isEmpty() const
{
    return rootBefore == rootAfter && count() == 0;
}

int SettingsDifference::count() const
{
    return static_cast<int>(
        std::count_if(rows.begin(), rows.end(), [](Row const& row) { return !row.isSame(); }));
}

SettingsDocument SettingsDifference::Apply(SettingsDocument const& before) const
{
    const SettingsValues values = before.AllValues();
    SettingsDocument document = before;
    document.rootName = rootAfter;
    document.sections.clear();
    for (Row const& row : rows) {
        if (!row.isAfter)
            continue;
        if (row.isSection())
            document.sections.append({row.section, {}});
        else
            document.sections.last().items.append(
                {row.key, row.hasSameValue() ? values.value({row.section, row.key}) : row.after});
    }
    return document;
}

SettingsDocument SettingsDifference::TakeOver(SettingsDocument const& before,
                                              QSet<int> const& chosen) const
{
    const QHash<QString, int> positions = Positions(before.sections);
    const QVector<Group> groups = GroupsOf(rows, chosen);
    Merge<Section> merge;
    for (Group const& group : groups) {
        QString const& name = group.section.section;
        const bool isRemoved = group.isTaken && !group.section.isAfter;
        if (group.section.isBefore && !isRemoved) {
            Section const& old = before.sections.at(positions.value(name));
            const Section merged{name,
                                 group.taken.isEmpty() ? old.items : MergedItems(group, old.items)};
            if (group.isTaken && group.section.isMoved)
                merge.add(merged);
            else
                merge.keep(name, merged, group.section.isMoved);
        } else if (!isRemoved && (group.isTaken || !group.taken.isEmpty())) {
            merge.add({name, MergedItems(group, {})});
        }
    }
    SettingsDocument document = before;
    document.sections = merge.result(before.sections);
    return document;
}

} // namespace Velocor
