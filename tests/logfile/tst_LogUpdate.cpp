// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/logfile/LogUpdate.h"

#include <QtTest>

using namespace Velocor;

namespace {

// A line of one byte for each letter.
LineTable Letters(char marked = '\0', quint8 mark = LogEntry::Trace, quint16 check = 0)
{
    LineTable lines;
    for (char letter = 0; letter < 127; ++letter) {
        const bool isMarked = letter == marked;
        lines.Append(letter, isMarked ? mark : quint8(LogEntry::Trace), isMarked ? check : 0);
    }
    return lines;
}

// Rows, one letter each: first those of the earlier part. Rows are identified by where they start;
// here the letter does that.
std::shared_ptr<LogRows> Rows(char const* earlier, char const* newest,
                              LineTable const& lines = Letters())
{
    auto rows = std::make_shared<LogRows>(lines);
    const auto add = [&](char const* letters) {
        for (; *letters; ++letters)
            rows->AddLine(static_cast<size_t>(*letters), false);
    };
    add(earlier);
    rows->EndEarlier();
    add(newest);
    return rows;
}

} // namespace

class tst_LogUpdate : public QObject
{
    Q_OBJECT

private slots:
    void compare_data();
    void compare();
    void marksCount();
    void checksCount();
};

// The numbers are: the position of the change, how many rows were removed and added there, and how
// many rows at the former end have a different text.
void tst_LogUpdate::compare_data()
{
    QTest::addColumn<QByteArray>("earlierBefore");
    QTest::addColumn<QByteArray>("newestBefore");
    QTest::addColumn<QByteArray>("earlierAfter");
    QTest::addColumn<QByteArray>("newestAfter");
    QTest::addColumn<bool>("isReset");
    QTest::addColumn<QList<int>>("numbers");

    const auto row = [](char const* name, char const* earlierBefore, char const* newestBefore,
                        char const* earlierAfter, char const* newestAfter, bool isReset,
                        QList<int> const& numbers) {
        QTest::newRow(name) << QByteArray(earlierBefore) << QByteArray(newestBefore)
                            << QByteArray(earlierAfter) << QByteArray(newestAfter) << isReset
                            << numbers;
    };
    row("nothing new", "ab", "xy", "ab", "xy", false, {2, 0, 0, 0});
    row("nothing at all", "", "", "", "", false, {0, 0, 0, 0});
    row("the newest run grows", "ab", "x", "ab", "xyz", false, {2, 0, 0, 0});
    row("the last row reads differently", "ab", "xy", "ab", "xz", false, {2, 0, 0, 1});
    row("all rows read differently", "", "xy", "", "pqr", false, {0, 0, 0, 2});
    row("the earlier part loses its first rows", "abcd", "x", "cd", "xy", false, {0, 2, 0, 0});
    row("the earlier part loses its last rows", "abcd", "x", "ab", "x", false, {2, 2, 0, 0});
    row("the earlier part loses rows in its middle", "abcd", "x", "ad", "x", false, {1, 2, 0, 0});
    row("the earlier part gains rows", "ad", "x", "abcd", "x", false, {1, 0, 2, 0});
    row("a row of the earlier part is another", "abc", "x", "aec", "x", false, {1, 1, 1, 0});
    row("equal rows are not counted from both ends", "aa", "x", "a", "x", false, {1, 1, 0, 0});
    row("the newest run is shorter", "ab", "xy", "ab", "x", true, {});
    row("the earlier part is gone", "ab", "xy", "", "xy", true, {});
    row("an earlier part appears", "", "xy", "ab", "xy", true, {});
}

void tst_LogUpdate::compare()
{
    QFETCH(QByteArray, earlierBefore);
    QFETCH(QByteArray, newestBefore);
    QFETCH(QByteArray, earlierAfter);
    QFETCH(QByteArray, newestAfter);
    QFETCH(QList<int>, numbers);
    LogUpdate update;
    update.rows = Rows(earlierAfter, newestAfter);
    update.Compare(*Rows(earlierBefore, newestBefore));
    QTEST(update.isReset, "isReset");
    if (!update.isReset)
        QCOMPARE(QList<int>({int(update.changeAt), int(update.removed), int(update.inserted),
                             int(update.changedTail)}),
                 numbers);
}

void tst_LogUpdate::marksCount()
{
    LogUpdate update;
    update.rows = Rows("", "xy", Letters('y', LogRows::Torn));
    update.Compare(*Rows("", "xy"));
    QVERIFY(!update.isReset);
    QCOMPARE(update.changedTail, size_t(1));
}

// A line may take the place of one that is as long.
void tst_LogUpdate::checksCount()
{
    LogUpdate update;
    update.rows = Rows("", "xyz", Letters('y', LogEntry::Trace, 1));
    update.Compare(*Rows("", "xyz"));
    QVERIFY(!update.isReset);
    QCOMPARE(update.changedTail, size_t(2));
}

QTEST_APPLESS_MAIN(tst_LogUpdate)
#include "tst_LogUpdate.moc"
