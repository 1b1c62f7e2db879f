// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/logfile/LogPlace.h"

#include "app/logfile/LogTimeReader.h"

#include <QtTest>

using namespace Velocor;

namespace {

constexpr qint64 Minute = 60 * 1000; // milliseconds
constexpr qint64 Hour = 60 * Minute;
constexpr qint64 Day = 24 * Hour;

} // namespace

class tst_LogPlace : public QObject
{
    Q_OBJECT

private slots:
    void places_data();
    void places();
    void dates_data();
    void dates();
    void dateWithoutYear();
    void errors_data();
    void errors();
};

void tst_LogPlace::places_data()
{
    QTest::addColumn<QString>("text");
    QTest::addColumn<int>("kind");
    QTest::addColumn<qint64>("value");
    const auto row = [](char const* text, LogPlace::Kind kind, qint64 value) {
        QTest::newRow(text) << QString(text) << int(kind) << value;
    };
    row("", LogPlace::Invalid, 0);
    row("  ", LogPlace::Invalid, 0);
    row("1", LogPlace::Line, 1);
    row(" 214 ", LogPlace::Line, 214);
    row("1403", LogPlace::Line, 1403);
    row("999999999", LogPlace::Line, 999999999);
    row("14:03", LogPlace::Time, 14 * Hour + 3 * Minute);
    row("0:00", LogPlace::Time, 0);
    row("9:05", LogPlace::Time, 9 * Hour + 5 * Minute);
    row("23:59:59", LogPlace::Time, Day - 1000);
    row("14:03:02", LogPlace::Time, 14 * Hour + 3 * Minute + 2000);
    row("00:00:00.5", LogPlace::Time, 500);
    row("00:00:00,25", LogPlace::Time, 250);
    row("00:00:00.0019", LogPlace::Time, 1);
    row("+5m", LogPlace::Interval, 5 * Minute);
    row("-30s", LogPlace::Interval, -30 * 1000);
    row("+2h", LogPlace::Interval, 2 * Hour);
    row("-1d", LogPlace::Interval, -Day);
    row("+ 5 m", LogPlace::Interval, 5 * Minute);
    row("-500ms", LogPlace::Interval, -500);
    row("+0s", LogPlace::Interval, 0);
    row("+999999999s", LogPlace::Interval, 999999999000);
}

void tst_LogPlace::places()
{
    QFETCH(QString, text);
    QFETCH(int, kind);
    QFETCH(qint64, value);
    const LogPlace place = LogPlace::Parse(text);
    QCOMPARE(int(place.kind), kind);
    QCOMPARE(place.value, value);
    QCOMPARE(place.error, QString());
}

void tst_LogPlace::dates_data()
{
    QTest::addColumn<QString>("text");
    QTest::addColumn<QByteArray>("stamp");
    const auto row = [](char const* text, char const* stamp) {
        QTest::newRow(text) << QString(text) << QByteArray(stamp);
    };
    row("2026-11-20", "2026-11-20 00:00:00.000");
    row("2026-11-20 14:03", "2026-11-20 14:03:00.000");
    row("2026-11-20  14:03:02", "2026-11-20 14:03:02.000");
    row("2026-11-20T14:03:02.5", "2026-11-20 14:03:02.500");
    row("2024-02-29 23:59", "2024-02-29 23:59:00.000");
    // As other programs' logs have them.
    row("2026/11/20 14:03:02", "2026-11-20 14:03:02.000");
    row("20.11.2026 14:03:02,5", "2026-11-20 14:03:02.500");
    row("20/Nov/2026:14:03:02 +0100", "2026-11-20 14:03:02.000");
    row("2026-11-20T14:03:02.5Z", "2026-11-20 14:03:02.500");
    row("Fri Nov 20 14:03:02.123456 2026", "2026-11-20 14:03:02.123");
    row("Nov 20, 2026 2:03:02 PM", "2026-11-20 14:03:02.000");
}

// The same instant as in an entry of the log.
void tst_LogPlace::dates()
{
    QFETCH(QString, text);
    QFETCH(QByteArray, stamp);
    const LogTimeReader reader("yyyy-MM-dd hh:mm:ss.zzz");
    const LogPlace place = LogPlace::Parse(text);
    QCOMPARE(int(place.kind), int(LogPlace::DateTime));
    QCOMPARE(place.value, reader.Read(stamp.constData(), stamp.size()).key);
}

// The latest such day; a few days ahead, since the newest entries may be newer than the clock.
void tst_LogPlace::dateWithoutYear()
{
    const LogTimeReader reader("yyyy-MM-dd hh:mm:ss");
    const QLocale english(QLocale::C);
    const QDate today = QDate::currentDate();
    for (int days : {0, 1, 100, 300}) {
        const QDate day = today.addDays(-days);
        if (day.day() == 29 && day.month() == 2)
            continue; // the year before may have no such day
        const LogPlace place = LogPlace::Parse(english.toString(day, "MMM dd 14:03:02"));
        const QByteArray stamp = day.toString("yyyy-MM-dd 14:03:02").toLatin1();
        QCOMPARE(int(place.kind), int(LogPlace::DateTime));
        QCOMPARE(place.value, reader.Read(stamp.constData(), stamp.size()).key);
    }
}

void tst_LogPlace::errors_data()
{
    QTest::addColumn<QString>("text");
    QTest::addColumn<QString>("error");
    const auto row = [](char const* text, char const* error) {
        QTest::newRow(text) << QString(text) << QString(error);
    };
    row("0", "The first line is 1.");
    row("1234567890", "No file has so many lines.");
    row("24:00", "The hours go up to 23.");
    row("14:60", "The minutes go up to 59.");
    row("14:03:60", "The seconds go up to 59.");
    row("2026-11-20 14:61", "The minutes go up to 59.");
    row("2026-02-29", "There is no such day.");
    row("2026-13-01 14:03", "There is no such day.");
    row("+5", "Add a unit: +5s, +5m, +5h or +5d.");
    row("+1234567890s", "The interval is too long.");
    for (char const* text : {"x", "14:", "14:3", "14:03:", "14:03:02.", "+", "+5y", "5m", "1,000",
                             "2026-11-20 x", "2026-11-2", "-", "Nov 20 14:03:02 x", "Nov 20",
                             "2026-11-32T14:03:02Z", "14:03\n15:04", "\xD9\xA1"})
        row(text, "Neither a line number nor a time.");
}

void tst_LogPlace::errors()
{
    QFETCH(QString, text);
    QFETCH(QString, error);
    const LogPlace place = LogPlace::Parse(text);
    QCOMPARE(int(place.kind), int(LogPlace::Invalid));
    QCOMPARE(place.error, error);
}

QTEST_GUILESS_MAIN(tst_LogPlace)

#include "tst_LogPlace.moc"
