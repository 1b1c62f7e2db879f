// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/AppUtils.h"

#include <QListWidget>
#include <QMenu>
#include <QSignalSpy>
#include <QTest>

#include <climits>

namespace {

constexpr int Many = 100000;

// "e1|e2|...|eN"
QString Numbered(int count)
{
    QStringList entries;
    for (int i = 1; i <= count; ++i)
        entries.append(QString("e%1").arg(i));
    return entries.join('|');
}

QStringList Texts(QMenu const& menu)
{
    QStringList texts;
    for (QAction const* action : menu.actions())
        texts.append(action->text());
    return texts;
}

QStringList Texts(QListWidget const& widget)
{
    QStringList texts;
    for (int row = 0; row < widget.count(); ++row)
        texts.append(widget.item(row)->text());
    return texts;
}

void AddStoredLists()
{
    QTest::addColumn<QString>("list");
    QTest::addColumn<QStringList>("entries");

    QTest::newRow("three entries in order") << "c|b|a" << QStringList({"c", "b", "a"});
    QTest::newRow("one entry") << "a" << QStringList({"a"});
    QTest::newRow("empty: one blank entry") << "" << QStringList({""});
    QTest::newRow("null: one blank entry") << QString() << QStringList({""});
    QTest::newRow("separator at the end") << "a|" << QStringList({"a", ""});
    QTest::newRow("separator at the start") << "|a" << QStringList({"", "a"});
    QTest::newRow("separator alone") << "|" << QStringList({"", ""});
    QTest::newRow("two separators") << "a||b" << QStringList({"a", "", "b"});
    QTest::newRow("doubles are kept") << "a|b|a" << QStringList({"a", "b", "a"});
    QTest::newRow("other case is another entry") << "a|A" << QStringList({"a", "A"});
    QTest::newRow("blanks are kept") << " a | b " << QStringList({" a ", " b "});
    QTest::newRow("the mark of a shortcut is text") << "a&b|&c" << QStringList({"a&b", "&c"});
    QTest::newRow("tab is text") << "a\tb" << QStringList({"a\tb"});
    QTest::newRow("paths") << "/a/b c.txt|C:\\d.txt" << QStringList({"/a/b c.txt", "C:\\d.txt"});
    QTest::newRow("letters beyond ASCII") << QString::fromUtf8("/Gr\xC3\xBC\xC3\x9F"
                                                               "e|/\xF0\x9F\x9A\x80")
                                          << QStringList({QString::fromUtf8("/Gr\xC3\xBC\xC3\x9F"
                                                                            "e"),
                                                          QString::fromUtf8("/\xF0\x9F\x9A\x80")});
    QTest::newRow("no other separator counts") << "a;b,c\nd" << QStringList({"a;b,c\nd"});
}

} // namespace

class tst_MruLists : public QObject
{
    Q_OBJECT

private slots:
    void operationCodes();
    void menu_data();
    void menu();
    void menuIsCleared();
    void menuIsEnabled();
    void menuActionsCarryTheTextOnly();
    void menuTellsThePath();
    void menuOfManyEntries();
    void listWidget_data();
    void listWidget();
    void listWidgetIsCleared();
    void listWidgetIsEnabled();
    void listWidgetOfManyEntries();
    void add_data();
    void add();
    void remove_data();
    void remove();
    void update_data();
    void update();
    void unchangedOnFailure_data();
    void unchangedOnFailure();
    void removingTheLastEntryLeavesATextThatCanBeStored();
    void addStepByStep();
    void addInTurn();
    void entryWithSeparatorIsReadBackAsTwo();
    void oneObjectForBoth_data();
    void oneObjectForBoth();
    void oneObjectForBothWhenRemoving();
    void manyEntries_data();
    void manyEntries();
};

void tst_MruLists::operationCodes()
{
    QCOMPARE(static_cast<int>(AppUtils::MRUAdd), 0);
    QCOMPARE(static_cast<int>(AppUtils::MRURemove), 1);
}

void tst_MruLists::menu_data()
{
    AddStoredLists();
}

void tst_MruLists::menu()
{
    QFETCH(QString, list);
    QMenu recent;
    QCOMPARE(AppUtils::SetupMRUMenu(&recent, list), true);
    QTEST(Texts(recent), "entries");
    QVERIFY(recent.isEnabled());
}

void tst_MruLists::menuIsCleared()
{
    QMenu recent;
    recent.addAction("old");
    recent.addSeparator();
    recent.addMenu("old submenu");
    QCOMPARE(AppUtils::SetupMRUMenu(&recent, "a|b"), true);
    QCOMPARE(Texts(recent), QStringList({"a", "b"}));
    QCOMPARE(AppUtils::SetupMRUMenu(&recent, "c"), true);
    QCOMPARE(Texts(recent), QStringList({"c"}));
}

void tst_MruLists::menuIsEnabled()
{
    QMenu recent;
    recent.setEnabled(false);
    QCOMPARE(AppUtils::SetupMRUMenu(&recent, ""), true);
    QVERIFY(recent.isEnabled());
}

void tst_MruLists::menuActionsCarryTheTextOnly()
{
    QMenu recent;
    QCOMPARE(AppUtils::SetupMRUMenu(&recent, "/a/b.txt"), true);
    QAction const* action = recent.actions().at(0);
    QVERIFY(action->shortcut().isEmpty());
    QVERIFY(action->icon().isNull());
    QVERIFY(!action->data().isValid());
    QVERIFY(!action->isCheckable());
    QVERIFY(action->isEnabled());
}

void tst_MruLists::menuTellsThePath()
{
    QMenu recent;
    QCOMPARE(AppUtils::SetupMRUMenu(&recent, "/a/&b.txt|/c"), true);
    QString opened;
    connect(&recent, &QMenu::triggered, this,
            [&opened](QAction* action) { opened = action->text(); });
    recent.actions().at(0)->trigger();
    QCOMPARE(opened, QString("/a/&b.txt"));
}

void tst_MruLists::menuOfManyEntries()
{
    // Adding an action searches the existing ones, so a menu gets fewer than a list.
    const QString list = Numbered(Many / 10);
    QMenu recent;
    QCOMPARE(AppUtils::SetupMRUMenu(&recent, list), true);
    QCOMPARE(Texts(recent), list.split('|'));
}

void tst_MruLists::listWidget_data()
{
    AddStoredLists();
}

void tst_MruLists::listWidget()
{
    QFETCH(QString, list);
    QListWidget recent;
    QCOMPARE(AppUtils::SetupMRUListWidget(&recent, list), true);
    QTEST(Texts(recent), "entries");
    QVERIFY(recent.isEnabled());
}

void tst_MruLists::listWidgetIsCleared()
{
    QListWidget recent;
    recent.addItems({"old", "older"});
    recent.setCurrentRow(1);
    QCOMPARE(AppUtils::SetupMRUListWidget(&recent, "a|b"), true);
    QCOMPARE(Texts(recent), QStringList({"a", "b"}));
}

void tst_MruLists::listWidgetIsEnabled()
{
    QListWidget recent;
    recent.setEnabled(false);
    QCOMPARE(AppUtils::SetupMRUListWidget(&recent, ""), true);
    QVERIFY(recent.isEnabled());
}

void tst_MruLists::listWidgetOfManyEntries()
{
    const QString list = Numbered(Many);
    QListWidget recent;
    QCOMPARE(AppUtils::SetupMRUListWidget(&recent, list), true);
    QCOMPARE(Texts(recent), list.split('|'));
}

void tst_MruLists::add_data()
{
    QTest::addColumn<QString>("file");
    QTest::addColumn<QString>("list");
    QTest::addColumn<int>("maxCount");
    QTest::addColumn<QString>("expected");

    QTest::newRow("to the empty list: its empty entry stays") << "a"
                                                              << "" << 5 << "a|";
    QTest::newRow("to the null list") << "a" << QString() << 5 << "a|";
    QTest::newRow("a new entry comes first") << "b"
                                             << "a|" << 5 << "b|a|";
    QTest::newRow("a known entry moves to the front") << "a"
                                                      << "b|a|c" << 5 << "a|b|c";
    QTest::newRow("the first entry stays first") << "a"
                                                 << "a|b" << 5 << "a|b";
    QTest::newRow("the last entry moves") << "c"
                                          << "a|b|c" << 5 << "c|a|b";
    QTest::newRow("case matters") << "A"
                                  << "a|b|c" << 5 << "A|a|b|c";
    QTest::newRow("blanks matter") << " a"
                                   << "a|b" << 5 << " a|a|b";
    QTest::newRow("paths are not normalized") << "/x/../a"
                                              << "/a" << 5 << "/x/../a|/a";
    QTest::newRow("a part is not the whole") << "ab"
                                             << "abc|b" << 5 << "ab|abc|b";
    QTest::newRow("only the first double moves") << "b"
                                                 << "a|b|c|b" << 5 << "b|a|c|b";
    QTest::newRow("the rest of the list may hold empty entries") << "b"
                                                                 << "a||b|" << 9 << "b|a||";
    QTest::newRow("exactly full") << "c"
                                  << "b|a" << 3 << "c|b|a";
    QTest::newRow("one too many: the oldest goes") << "d"
                                                   << "c|b|a" << 3 << "d|c|b";
    QTest::newRow("moving shortens too") << "a"
                                         << "c|b|a" << 2 << "a|c";
    QTest::newRow("12 entries, 10 kept") << "e13" << Numbered(12) << 10 << "e13|" + Numbered(9);
    QTest::newRow("room for one") << "b"
                                  << "a|c" << 1 << "b";
    QTest::newRow("no room") << "b"
                             << "a|c" << 0 << "";
    QTest::newRow("less than no room") << "b"
                                       << "a|c" << -1 << "";
    QTest::newRow("least number") << "b"
                                  << "a|c" << INT_MIN << "";
    QTest::newRow("greatest number") << "b"
                                     << "a|c" << INT_MAX << "b|a|c";
    QTest::newRow("separator in the entry is not escaped") << "x|y"
                                                           << "a" << 5 << "x|y|a";
    QTest::newRow("an entry with a separator is one while counting") << "x|y"
                                                                     << "a|b" << 2 << "x|y|a";
    QTest::newRow("an entry with a separator is never found") << "x|y"
                                                              << "x|y" << 5 << "x|y|x|y";
    QTest::newRow("letters beyond ASCII")
        << QString::fromUtf8("\xC3\xA4") << "a" << 5 << QString::fromUtf8("\xC3\xA4|a");
    QTest::newRow("composed and decomposed letters differ")
        << QString::fromUtf8("\xC3\xA4") << QString::fromUtf8("a\xCC\x88") << 5
        << QString::fromUtf8("\xC3\xA4|a\xCC\x88");
}

void tst_MruLists::add()
{
    QFETCH(QString, file);
    QFETCH(QString, list);
    QFETCH(int, maxCount);

    QString updated = list;
    QCOMPARE(AppUtils::UpdateMRUList(file, updated, maxCount, AppUtils::MRUAdd), true);
    QTEST(updated, "expected");

    QCOMPARE(AppUtils::AddToMRUList(file, list, maxCount), true);
    QTEST(list, "expected");
}

void tst_MruLists::remove_data()
{
    QTest::addColumn<QString>("file");
    QTest::addColumn<QString>("list");
    QTest::addColumn<QString>("expected");

    QTest::newRow("the first") << "a"
                               << "a|b|c"
                               << "b|c";
    QTest::newRow("in the middle") << "b"
                                   << "a|b|c"
                                   << "a|c";
    QTest::newRow("the last") << "c"
                              << "a|b|c"
                              << "a|b";
    QTest::newRow("the only one") << "a"
                                  << "a"
                                  << "";
    QTest::newRow("only the first of two") << "b"
                                           << "a|b|c|b"
                                           << "a|c|b";
    QTest::newRow("leaves an empty entry") << "a"
                                           << "a|"
                                           << "";
    QTest::newRow("between empty entries") << "a"
                                           << "|a|"
                                           << "|";
    QTest::newRow("11 entries: 10 stay")
        << "e5" << Numbered(11) << "e1|e2|e3|e4|e6|e7|e8|e9|e10|e11";
    QTest::newRow("12 entries: cut to 10") << "e12" << Numbered(12) << Numbered(10);
    QTest::newRow("one out of the first ten of many")
        << "e1" << Numbered(100) << "e2|e3|e4|e5|e6|e7|e8|e9|e10|e11";
}

void tst_MruLists::remove()
{
    QFETCH(QString, file);
    QFETCH(QString, list);

    QString updated = list;
    QCOMPARE(AppUtils::UpdateMRUList(file, updated, 10, AppUtils::MRURemove), true);
    QTEST(updated, "expected");

    QCOMPARE(AppUtils::RemoveFromMRUList(file, list), true);
    QTEST(list, "expected");
}

void tst_MruLists::update_data()
{
    QTest::addColumn<int>("maxCount");
    QTest::addColumn<QString>("expected");

    QTest::newRow("removal within the limit") << 3 << "a|c";
    QTest::newRow("removal cuts to the limit") << 1 << "a";
    QTest::newRow("removal with limit zero") << 0 << "";
    QTest::newRow("removal with a negative limit") << -7 << "";
}

void tst_MruLists::update()
{
    QFETCH(int, maxCount);
    QString list("a|b|c");
    QCOMPARE(AppUtils::UpdateMRUList("b", list, maxCount, AppUtils::MRURemove), true);
    QTEST(list, "expected");
}

void tst_MruLists::unchangedOnFailure_data()
{
    QTest::addColumn<QString>("file");
    QTest::addColumn<QString>("list");
    QTest::addColumn<int>("op");

    const QString twelve = Numbered(12);
    QTest::newRow("adding the empty entry") << ""
                                            << "a|b" << 0;
    QTest::newRow("adding the null entry") << QString() << "a|b" << 0;
    QTest::newRow("adding the empty entry to the empty list") << ""
                                                              << "" << 0;
    QTest::newRow("removing the empty entry") << ""
                                              << "a||b" << 1;
    QTest::newRow("removing the empty entry from a long list") << "" << twelve << 1;
    QTest::newRow("other code with the empty entry") << ""
                                                     << "a" << 2;
    QTest::newRow("removing an absent entry") << "x"
                                              << "a|b" << 1;
    QTest::newRow("removing from the empty list") << "a"
                                                  << "" << 1;
    QTest::newRow("removing an absent entry from a long list") << "x" << twelve << 1;
    QTest::newRow("removing in another case") << "A"
                                              << "a|b" << 1;
    QTest::newRow("removing an entry with a separator") << "a|b"
                                                        << "a|b" << 1;
    QTest::newRow("code 2, known entry") << "b"
                                         << "a|b" << 2;
    QTest::newRow("code 2, absent entry") << "x"
                                          << "a|b" << 2;
    QTest::newRow("code -1, known entry") << "b" << twelve + "|b" << -1;
    QTest::newRow("code -1, absent entry") << "x" << twelve << -1;
}

void tst_MruLists::unchangedOnFailure()
{
    QFETCH(QString, file);
    QFETCH(QString, list);
    QFETCH(int, op);
    const QString before = list;
    QCOMPARE(AppUtils::UpdateMRUList(file, list, 10, static_cast<AppUtils::MRUOpCode>(op)), false);
    QCOMPARE(list, before);

    if (op == AppUtils::MRUAdd)
        QCOMPARE(AppUtils::AddToMRUList(file, list, 1), false);
    if (op == AppUtils::MRURemove)
        QCOMPARE(AppUtils::RemoveFromMRUList(file, list), false);
    QCOMPARE(list, before);
}

void tst_MruLists::removingTheLastEntryLeavesATextThatCanBeStored()
{
    QString list = QStringLiteral("a");
    QVERIFY(AppUtils::RemoveFromMRUList(QStringLiteral("a"), list));
    QVERIFY(list.isEmpty());
    QVERIFY(!list.isNull()); // settings would reject a null string
}

void tst_MruLists::addStepByStep()
{
    QString list;
    QCOMPARE(AppUtils::AddToMRUList("a", list, 5), true);
    QCOMPARE(list, QString("a|"));
    QCOMPARE(AppUtils::AddToMRUList("b", list, 5), true);
    QCOMPARE(list, QString("b|a|"));
    QCOMPARE(AppUtils::RemoveFromMRUList("a", list), true);
    QCOMPARE(list, QString("b|"));
    QCOMPARE(AppUtils::RemoveFromMRUList("b", list), true);
    QCOMPARE(list, QString());
}

// The empty entry of the empty list is eventually dropped as the oldest one.
void tst_MruLists::addInTurn()
{
    QString list;
    for (int i = 1; i <= 12; ++i)
        QCOMPARE(AppUtils::AddToMRUList(QString("f%1").arg(i), list, 10), true);
    QCOMPARE(list, QString("f12|f11|f10|f9|f8|f7|f6|f5|f4|f3"));
}

void tst_MruLists::entryWithSeparatorIsReadBackAsTwo()
{
    QString list("a");
    QCOMPARE(AppUtils::AddToMRUList("x|y", list, 5), true);
    QMenu recent;
    QCOMPARE(AppUtils::SetupMRUMenu(&recent, list), true);
    QCOMPARE(Texts(recent), QStringList({"x", "y", "a"}));
}

void tst_MruLists::oneObjectForBoth_data()
{
    QTest::addColumn<QString>("list");
    QTest::addColumn<int>("maxCount");
    QTest::addColumn<bool>("result");
    QTest::addColumn<QString>("expected");

    QTest::newRow("its only entry") << "a" << 5 << true << "a";
    QTest::newRow("two entries, not found as one") << "a|b" << 5 << true << "a|b|a|b";
    QTest::newRow("shortened") << "a|b" << 2 << true << "a|b|a";
    QTest::newRow("limit zero") << "a|b" << 0 << true << "";
    QTest::newRow("empty") << "" << 5 << false << "";
}

void tst_MruLists::oneObjectForBoth()
{
    QFETCH(QString, list);
    QFETCH(int, maxCount);
    QFETCH(bool, result);
    QString updated = list;
    QCOMPARE(AppUtils::UpdateMRUList(updated, updated, maxCount, AppUtils::MRUAdd), result);
    QTEST(updated, "expected");

    QCOMPARE(AppUtils::AddToMRUList(list, list, maxCount), result);
    QTEST(list, "expected");
}

void tst_MruLists::oneObjectForBothWhenRemoving()
{
    QString list("a");
    QCOMPARE(AppUtils::RemoveFromMRUList(list, list), true);
    QCOMPARE(list, QString());
}

void tst_MruLists::manyEntries_data()
{
    QTest::addColumn<QString>("file");
    QTest::addColumn<int>("maxCount");
    QTest::addColumn<int>("op");
    QTest::addColumn<QString>("expected");

    const QString all = Numbered(Many);
    const QString last = QString("e%1").arg(Many);
    QTest::newRow("add a new one, keep all") << "new" << Many + 1 << 0 << "new|" + all;
    QTest::newRow("add a new one, drop the oldest")
        << "new" << Many << 0 << "new|" + Numbered(Many - 1);
    QTest::newRow("move the last to the front")
        << last << Many << 0 << last + "|" + Numbered(Many - 1);
    QTest::newRow("remove the last") << last << Many << 1 << Numbered(Many - 1);
    QTest::newRow("remove the last, cut to ten") << last << 10 << 1 << Numbered(10);
}

void tst_MruLists::manyEntries()
{
    QFETCH(QString, file);
    QFETCH(int, maxCount);
    QFETCH(int, op);
    QString list = Numbered(Many);
    QCOMPARE(AppUtils::UpdateMRUList(file, list, maxCount, static_cast<AppUtils::MRUOpCode>(op)),
             true);
    QTEST(list, "expected");
}

QTEST_MAIN(tst_MruLists)
#include "tst_MruLists.moc"
