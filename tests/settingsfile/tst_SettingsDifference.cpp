// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Single differences; tst_PlainSettingsDifference has random ones.

#include "app/settingsfile/SettingsDifference.h"

#include <QtTest>

using namespace Velocor;

namespace {

// "s: a=1 b=2; t: c=3"
SettingsDocument DocumentOf(QString const& text, QString const& rootName = "Root")
{
    SettingsDocument document;
    document.rootName = rootName;
    for (QString const& part : text.split("; ")) {
        if (part.isEmpty())
            continue;
        document.sections.append({part.section(':', 0, 0), {}});
        for (QString const& item : part.split(' ').mid(1))
            document.sections.last().items.append({item.section('=', 0, 0), item.section('=', 1)});
    }
    return document;
}

QString TextOf(SettingsDocument const& document)
{
    QStringList sections;
    for (auto const& section : document.sections) {
        QStringList items{section.name + ':'};
        for (auto const& item : section.items)
            items.append(item.key + '=' + item.value);
        sections.append(items.join(' '));
    }
    return sections.join("; ");
}

// "=" for a row that both have, "~" if it has moved, "-" and "+" if only one has it.
QString TextOf(SettingsDifference const& difference)
{
    QStringList rows;
    for (SettingsDifference::Row const& row : difference.rows) {
        const char sign = !row.isAfter ? '-' : !row.isBefore ? '+' : row.isMoved ? '~' : '=';
        rows.append(sign + (row.isSection() ? row.section + ':'
                                            : row.key + '=' + row.before + '>' + row.after));
    }
    return rows.join(' ');
}

} // namespace

class tst_SettingsDifference : public QObject
{
    Q_OBJECT

private slots:
    void rows_data();
    void rows();
    void roots();
    void takeOver_data();
    void takeOver();
};

void tst_SettingsDifference::rows_data()
{
    QTest::addColumn<QString>("before");
    QTest::addColumn<QString>("after");
    QTest::addColumn<QString>("rows");
    QTest::addColumn<int>("count"); // of those that differ
    const auto row = [](char const* name, char const* before, char const* after, char const* rows,
                        int count) {
        QTest::newRow(name) << QString(before) << QString(after) << QString(rows) << count;
    };
    row("nothing", "", "", "", 0);
    row("the same", "s: a=1 b=2", "s: a=1 b=2", "=s: =a=1>1 =b=2>2", 0);
    row("another value", "s: a=1 b=2", "s: a=5 b=2", "=s: =a=1>5 =b=2>2", 1);
    row("item added", "s: a=1 c=3", "s: a=1 b=2 c=3", "=s: =a=1>1 +b=>2 =c=3>3", 1);
    row("item removed", "s: a=1 b=2 c=3", "s: a=1 c=3", "=s: =a=1>1 -b=2> =c=3>3", 1);
    row("first item removed", "s: a=1 b=2", "s: b=2", "=s: -a=1> =b=2>2", 1);
    row("last item removed", "s: a=1 b=2", "s: a=1", "=s: =a=1>1 -b=2>", 1);
    row("all items removed", "s: a=1 b=2", "s:", "=s: -a=1> -b=2>", 2);
    row("item without a name", "s: =1", "s: =2", "=s: ==1>2", 1);
    row("moved to the front", "s: a=1 b=2 c=3", "s: c=3 a=1 b=2", "=s: ~c=3>3 =a=1>1 =b=2>2", 1);
    row("moved to the end", "s: a=1 b=2 c=3", "s: b=2 c=3 a=1", "=s: =b=2>2 =c=3>3 ~a=1>1", 1);
    row("swapped", "s: a=1 b=2", "s: b=2 a=1", "=s: ~b=2>2 =a=1>1", 1);
    row("reversed", "s: a=1 b=2 c=3", "s: c=3 b=2 a=1", "=s: ~c=3>3 ~b=2>2 =a=1>1", 2);
    row("as few as possible have moved", "s: a=1 b=2 c=3 d=4 e=5", "s: d=4 a=1 e=5 b=2 c=3",
        "=s: ~d=4>4 =a=1>1 ~e=5>5 =b=2>2 =c=3>3", 2);
    row("moved and another value", "s: a=1 b=2", "s: b=9 a=1", "=s: ~b=2>9 =a=1>1", 1);
    row("removed beside a moved one", "s: a=1 x=7 b=2", "s: b=2 a=1", "=s: ~b=2>2 =a=1>1 -x=7>", 2);
    row("section added", "s: a=1", "r: b=2; s: a=1", "+r: +b=>2 =s: =a=1>1", 2);
    row("section removed", "r: b=2; s: a=1", "s: a=1", "-r: -b=2> =s: =a=1>1", 2);
    row("section moved", "r: b=2; s: a=1; t:", "t:; r: b=2; s: a=1", "~t: =r: =b=2>2 =s: =a=1>1",
        1);
    row("the same key in another section", "s: a=1; t:", "s:; t: a=1", "=s: -a=1> =t: +a=>1", 2);
}

void tst_SettingsDifference::rows()
{
    QFETCH(QString, before);
    QFETCH(QString, after);
    QFETCH(int, count);
    const SettingsDocument first = DocumentOf(before);
    const SettingsDifference difference = SettingsDifference::Between(first, DocumentOf(after));
    QTEST(TextOf(difference), "rows");
    QCOMPARE(difference.count(), count);
    QCOMPARE(difference.isEmpty(), count == 0);
    QCOMPARE(TextOf(difference.Apply(first)), after);
    QCOMPARE(TextOf(difference.TakeOver(first, {})), before);
    QString section;
    for (SettingsDifference::Row const& row : difference.rows) {
        section = row.isSection() ? row.section : section;
        QCOMPARE(row.section, section);
        QVERIFY(!row.isMoved || (row.isBefore && row.isAfter));
    }
}

void tst_SettingsDifference::roots()
{
    const SettingsDocument first = DocumentOf("s: a=1", "One");
    const auto difference = SettingsDifference::Between(first, DocumentOf("s: a=1", "Other"));
    QVERIFY(!difference.isEmpty());
    QCOMPARE(difference.count(), 0);
    QCOMPARE(difference.rootBefore, QString("One"));
    QCOMPARE(difference.rootAfter, QString("Other"));
    QCOMPARE(difference.Apply(first).rootName, QString("Other"));
    QCOMPARE(difference.TakeOver(first, {0}).rootName, QString("One"));
}

void tst_SettingsDifference::takeOver_data()
{
    QTest::addColumn<QString>("before");
    QTest::addColumn<QString>("after");
    QTest::addColumn<QSet<int>>("chosen"); // rows
    QTest::addColumn<QString>("result");
    const auto row = [](char const* name, char const* before, char const* after,
                        QSet<int> const& chosen, char const* result) {
        QTest::newRow(name) << QString(before) << QString(after) << chosen << QString(result);
    };
    row("one value", "s: a=1 b=2", "s: a=5 b=6", {1}, "s: a=5 b=2");
    row("all of a section", "s: a=1 b=2", "s: a=5 b=6", {0}, "s: a=5 b=6");
    row("one section of two", "s: a=1; t: a=2", "s: a=5; t: a=6", {2}, "s: a=1; t: a=6");
    row("removed item", "s: a=1 b=2", "s: a=1", {2}, "s: a=1");
    row("another than the removed item", "s: a=1 b=2", "s: a=5", {1}, "s: a=5 b=2");
    row("item added in front", "s: a=1", "s: x=9 a=1", {1}, "s: x=9 a=1");
    row("items added within", "s: a=1 b=2", "s: a=1 x=9 y=8 b=2", {2, 3}, "s: a=1 x=9 y=8 b=2");
    row("one of two added items", "s: a=1 b=2", "s: a=1 x=9 y=8 b=2", {3}, "s: a=1 y=8 b=2");
    row("added beside one that is removed", "s: a=1 b=2", "s: x=9 b=2", {1, 2}, "s: x=9 b=2");
    row("moved items", "s: a=1 b=2", "s: b=6 a=1", {0}, "s: b=6 a=1");
    row("added before an item that was below", "s: a=1 b=2", "s: b=2 x=9 a=1", {2},
        "s: x=9 a=1 b=2");
    row("added section", "s: a=1", "r: b=2 c=3; s: a=1", {0}, "r: b=2 c=3; s: a=1");
    row("added section without items", "s: a=1", "s: a=1; t:", {2}, "s: a=1; t:");
    row("item of an added section", "s: a=1", "s: a=1; t: b=2 c=3", {4}, "s: a=1; t: c=3");
    row("nothing of an added section", "s: a=1", "s: a=5; t: b=2", {1}, "s: a=5");
    row("removed section", "s: a=1; t: b=2", "s: a=1", {2}, "s: a=1");
    row("item of a removed section", "s: a=1; t: b=2 c=3", "s: a=1", {3}, "s: a=1; t: c=3");
    row("moved section", "s: a=1; t: b=2", "t: b=6; s: a=1", {0}, "t: b=6; s: a=1");
}

void tst_SettingsDifference::takeOver()
{
    QFETCH(QString, before);
    QFETCH(QString, after);
    QFETCH(QSet<int>, chosen);
    const SettingsDocument first = DocumentOf(before);
    const SettingsDifference difference = SettingsDifference::Between(first, DocumentOf(after));
    QTEST(TextOf(difference.TakeOver(first, chosen)), "result");
}

QTEST_APPLESS_MAIN(tst_SettingsDifference)
#include "tst_SettingsDifference.moc"
