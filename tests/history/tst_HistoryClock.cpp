// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/history/HistoryClock.h"

#include <QtTest>

using namespace Velocor;

namespace {

constexpr qint64 Minute = 60 * 1000; // milliseconds
constexpr qint64 Hour = 60 * Minute;
constexpr qint64 Day = 24 * Hour;

} // namespace

class tst_HistoryClock : public QObject
{
    Q_OBJECT

private slots:
    void reads_data();
    void reads();
    void firstDay_data();
    void firstDay();
};

// The second of two stamps; only the first one may have a date.
void tst_HistoryClock::reads_data()
{
    QTest::addColumn<qint64>("first");
    QTest::addColumn<bool>("hasDate");
    QTest::addColumn<qint64>("second");
    QTest::addColumn<qint64>("time");
    const auto row = [](char const* name, qint64 first, bool hasDate, qint64 second, qint64 time) {
        QTest::newRow(name) << first << hasDate << second << time;
    };
    const qint64 noon = 12 * Hour;
    row("later", 9 * Hour, false, 10 * Hour, 5 * Day + 10 * Hour);
    row("after a date", 7 * Day + 9 * Hour, true, 10 * Hour, 7 * Day + 10 * Hour);
    row("after a date before the first day", 0, true, Hour, Hour);
    row("its day does not count", 9 * Hour, false, 3 * Day + 10 * Hour, 5 * Day + 10 * Hour);
    row("set back a little", 9 * Hour, false, 8 * Hour, 5 * Day + 8 * Hour);
    row("after midnight", 23 * Hour, false, Hour, 6 * Day + Hour);
    row("set back over midnight", Hour, false, 23 * Hour, 4 * Day + 23 * Hour);
    row("twelve hours earlier", noon, false, 0, 5 * Day);
    row("more than twelve hours earlier", noon + 1, false, 0, 6 * Day);
    row("twelve hours later", 0, false, noon, 5 * Day + noon);
    row("more than twelve hours later", 0, false, noon + 1, 4 * Day + noon + 1);
    row("no day before the first one", 0, true, 23 * Hour, 23 * Hour);
}

void tst_HistoryClock::reads()
{
    QFETCH(qint64, first);
    QFETCH(bool, hasDate);
    QFETCH(qint64, second);
    HistoryClock clock(5 * Day);
    QCOMPARE(clock.Read(first, hasDate), hasDate ? first : 5 * Day + first);
    QTEST(clock.Read(second, false), "time");
    QCOMPARE(clock.Read(first, true), first);
}

void tst_HistoryClock::firstDay_data()
{
    QTest::addColumn<qint64>("end");
    QTest::addColumn<qint64>("latest");
    QTest::addColumn<qint64>("day");
    const auto row = [](char const* name, qint64 end, qint64 latest, qint64 day) {
        QTest::newRow(name) << end << latest << day;
    };
    // One hour for the change of clocks, and a minute for stamps without seconds.
    const qint64 most = 61 * Minute;
    row("same day", 9 * Hour, 5 * Day + 10 * Hour, 5 * Day);
    row("the day before", 9 * Hour, 5 * Day + 7 * Hour, 4 * Day);
    row("ends on the day after", Day + 9 * Hour, 5 * Day + 10 * Hour, 4 * Day);
    row("hardly before its end", 9 * Hour, 5 * Day + 9 * Hour - most, 5 * Day);
    row("too long before its end", 9 * Hour, 5 * Day + 9 * Hour - most - 1, 4 * Day);
    row("before the first day", 9 * Hour, 7 * Hour, 0);
    row("days before the first day", 5 * Day, Hour, 0);
}

void tst_HistoryClock::firstDay()
{
    QFETCH(qint64, end);
    QFETCH(qint64, latest);
    QTEST(HistoryClock::FirstDay(end, latest), "day");
}

QTEST_APPLESS_MAIN(tst_HistoryClock)
#include "tst_HistoryClock.moc"
