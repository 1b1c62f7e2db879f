// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The difference of two random settings documents: applied to the first, it gives the second, shows
// nothing that is the same, and takes over exactly what is chosen.

#include "app/settingsfile/SettingsDifference.h"
#include "plain/Rounds.h"

#include <QtTest>

#include <cstdio>
#include <random>

using namespace Velocor;

namespace {

class Pairs
{
public:
    explicit Pairs(quint32 seed) : m_random(seed) {}

    SettingsDocument document()
    {
        SettingsDocument document;
        document.rootName = below(20) == 0 ? "Other" : "Root";
        const QStringList names = shuffled(5);
        for (QString const& name : names) {
            document.sections.append({name, {}});
            const QStringList keys = shuffled(7);
            for (QString const& key : keys)
                document.sections.last().items.append({key, value()});
        }
        return document;
    }

    // Mostly like another one.
    SettingsDocument changed(SettingsDocument document)
    {
        for (int i = below(4); i >= 0; --i) {
            if (document.sections.isEmpty())
                break;
            const int at = below(document.sections.size());
            auto& items = document.sections[at].items;
            switch (below(5)) {
            case 0:
                document.sections.move(at, below(document.sections.size()));
                break;
            case 1:
                document.sections.remove(at);
                break;
            case 2:
                if (!items.isEmpty())
                    items.move(below(items.size()), below(items.size()));
                break;
            case 3:
                if (!items.isEmpty())
                    items.remove(below(items.size()));
                break;
            default:
                document.SetValue(document.sections.at(at).name, QString("new%1").arg(below(3)),
                                  value());
                break;
            }
        }
        return document;
    }

    QSet<int> chosen(int count)
    {
        QSet<int> chosen;
        for (int i = 0; i < count; ++i) {
            if (below(3) == 0)
                chosen.insert(i);
        }
        return chosen;
    }

    int below(int limit) { return static_cast<int>(m_random() % static_cast<unsigned>(limit)); }

private:
    // Some of the first names, in any order.
    QStringList shuffled(int count)
    {
        QStringList names;
        for (int i = 0; i < count; ++i) {
            if (below(3) != 0)
                names.insert(below(names.size() + 1), QString("n%1").arg(i));
        }
        return names;
    }

    QString value() { return QString::number(below(3)); }

    std::mt19937 m_random;
};

// Everything in a document, in its order.
QString Plain(SettingsDocument const& document)
{
    QString text = document.rootName + '\n';
    for (auto const& section : document.sections) {
        text += '[' + section.name + "]\n";
        for (auto const& item : section.items)
            text += item.key + '=' + item.value + '\n';
    }
    return text;
}

QStringList SectionNames(SettingsDocument const& document)
{
    QStringList names;
    for (auto const& section : document.sections)
        names.append(section.name);
    return names;
}

QStringList Keys(SettingsDocument const& document, QString const& name)
{
    QStringList keys;
    for (auto const& section : document.sections) {
        for (auto const& item : section.items) {
            if (section.name == name)
                keys.append(item.key);
        }
    }
    return keys;
}

// The length of the longest sequence that is in both lists, in the same order; no name twice.
int LongestCommon(QStringList const& left, QStringList const& right)
{
    QVector<QVector<int>> best(left.size() + 1, QVector<int>(right.size() + 1, 0));
    for (int i = 1; i <= left.size(); ++i) {
        for (int j = 1; j <= right.size(); ++j)
            best[i][j] = left.at(i - 1) == right.at(j - 1)
                             ? best[i - 1][j - 1] + 1
                             : std::max(best[i - 1][j], best[i][j - 1]);
    }
    return best[left.size()][right.size()];
}

// Rows that are in both and not moved, of the items of a section or, with a null name, the
// sections.
int Unmoved(SettingsDifference const& difference, QString const& section)
{
    int count = 0;
    for (auto const& row : difference.rows) {
        const bool isMeant =
            section.isNull() ? row.isSection() : !row.isSection() && row.section == section;
        if (isMeant && row.isBefore && row.isAfter && !row.isMoved)
            ++count;
    }
    return count;
}

// What a document has after some rows were taken over, without any order.
QMap<QString, QString> ExpectedValues(SettingsDifference const& difference, QSet<int> const& chosen)
{
    QMap<QString, QString> values;
    bool isSectionChosen = false;
    for (int i = 0; i < difference.rows.size(); ++i) {
        auto const& row = difference.rows.at(i);
        if (row.isSection()) {
            isSectionChosen = chosen.contains(i);
            const bool isThere = isSectionChosen ? row.isAfter : row.isBefore;
            bool hasChosenItem = false; // which brings its section along
            for (int j = i + 1; j < difference.rows.size() && !difference.rows.at(j).isSection();
                 ++j)
                hasChosenItem = hasChosenItem || chosen.contains(j);
            if (isThere || (hasChosenItem && row.isAfter))
                values.insert('[' + row.section + ']', QString());
            continue;
        }
        const bool isChosen = isSectionChosen || chosen.contains(i);
        if (isChosen ? row.isAfter : row.isBefore)
            values.insert(row.section + '/' + row.key, isChosen ? row.after : row.before);
    }
    return values;
}

QMap<QString, QString> Values(SettingsDocument const& document)
{
    QMap<QString, QString> values;
    for (auto const& section : document.sections) {
        values.insert('[' + section.name + ']', QString());
        for (auto const& item : section.items)
            values.insert(section.name + '/' + item.key, item.value);
    }
    return values;
}

} // namespace

class tst_PlainSettingsDifference : public QObject
{
    Q_OBJECT

private slots:
    void appliedGivesTheSecond();
    void takesOverWhatIsChosen();
};

void tst_PlainSettingsDifference::appliedGivesTheSecond()
{
    Pairs pairs(Rounds::seed());
    const int count = Rounds::count(5000, 100000);
    int same = 0;
    int rows = 0;
    for (int i = 0; i < count && !QTest::currentTestFailed(); ++i) {
        const SettingsDocument before = pairs.document();
        const SettingsDocument after =
            pairs.below(2) == 0 ? pairs.changed(before) : pairs.document();
        const auto difference = SettingsDifference::Between(before, after);
        QCOMPARE(Plain(difference.Apply(before)), Plain(after));
        QCOMPARE(difference.isEmpty(), Plain(before) == Plain(after));
        for (auto const& row : difference.rows) {
            QCOMPARE(row.before, before.Value(row.section, row.key));
            QCOMPARE(row.after, after.Value(row.section, row.key));
        }
        const QStringList names = SectionNames(before);
        QCOMPARE(Unmoved(difference, QString()), LongestCommon(names, SectionNames(after)));
        for (QString const& name : names)
            QCOMPARE(Unmoved(difference, name),
                     LongestCommon(Keys(before, name), Keys(after, name)));
        same += difference.isEmpty() ? 1 : 0;
        rows += difference.count();
    }
    QVERIFY(same > 0);
    std::printf("plain settings differences: %d pairs, %d of them the same, %d rows that differ\n",
                count, same, rows);
    std::fflush(stdout);
}

void tst_PlainSettingsDifference::takesOverWhatIsChosen()
{
    Pairs pairs(Rounds::seed() + 1);
    const int count = Rounds::count(5000, 100000);
    for (int i = 0; i < count && !QTest::currentTestFailed(); ++i) {
        const SettingsDocument before = pairs.document();
        const SettingsDocument after =
            pairs.below(2) == 0 ? pairs.changed(before) : pairs.document();
        const auto difference = SettingsDifference::Between(before, after);
        const QSet<int> chosen = pairs.chosen(difference.rows.size());
        const SettingsDocument result = difference.TakeOver(before, chosen);
        QCOMPARE(Values(result), ExpectedValues(difference, chosen));
        QCOMPARE(result.rootName, before.rootName);
        QCOMPARE(Plain(difference.TakeOver(before, {})), Plain(before));

        QSet<int> all;
        for (int row = 0; row < difference.rows.size(); ++row)
            all.insert(row);
        SettingsDocument second = difference.TakeOver(before, all);
        second.rootName = after.rootName;
        QCOMPARE(Plain(second), Plain(after));

        // What stays, stays in its order, unless it was moved.
        QStringList names = SectionNames(before);
        for (int row : chosen) {
            if (difference.rows.at(row).isSection() && difference.rows.at(row).isMoved)
                names.removeOne(difference.rows.at(row).section);
        }
        const QStringList left = SectionNames(result);
        int both = 0;
        for (QString const& name : names)
            both += left.contains(name) ? 1 : 0;
        QCOMPARE(LongestCommon(names, left), both);
    }
    std::printf("plain settings differences: %d random choices taken over\n", count);
    std::fflush(stdout);
}

QTEST_GUILESS_MAIN(tst_PlainSettingsDifference)
#include "tst_PlainSettingsDifference.moc"
