// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/logfile/LogTimeReader.h"

#include <QDateTime>
#include <QtTest>

using namespace Velocor;

class tst_LogTimeReader : public QObject
{
    Q_OBJECT

private slots:
    void length_data();
    void length();
    void readsWhatQtWrites_data();
    void readsWhatQtWrites();
    void order_data();
    void order();
    void tenMilliseconds_data();
    void tenMilliseconds();
    void hasDate_data();
    void hasDate();
};

void tst_LogTimeReader::length_data()
{
    QTest::addColumn<QString>("format");
    QTest::addColumn<QByteArray>("text");
    QTest::addColumn<int>("length");
    QTest::addColumn<bool>("tellsTime");

    const QString byDefault("yyyy-MM-dd hh:mm:ss.z");
    QTest::newRow("default") << byDefault << QByteArray("2025-03-03 09:02:11.031 Trace x") << 23
                             << true;
    QTest::newRow("one digit of milliseconds")
        << byDefault << QByteArray("2025-03-03 09:02:11.5 Trace x") << 21 << true;
    QTest::newRow("cut at the front")
        << byDefault << QByteArray("03-03 09:02:11.031 Trace x") << -1 << false;
    QTest::newRow("cut at the end") << byDefault << QByteArray("2025-03-03 09:02:1") << -1 << false;
    QTest::newRow("empty line") << byDefault << QByteArray("") << -1 << false;
    QTest::newRow("letters for digits")
        << byDefault << QByteArray("2025-0x-03 09:02:11.031 Trace x") << -1 << false;
    QTest::newRow("quoted text alone")
        << QString("'now'") << QByteArray("now Trace x") << 3 << false;
    QTest::newRow("two quotes mean one") << QString("hh''mm") << QByteArray("09'30 x") << 5 << true;
    QTest::newRow("a quote that is never closed")
        << QString("'at ") << QByteArray("at x") << 3 << false;
    QTest::newRow("empty format") << QString("") << QByteArray("x") << 0 << false;
    QTest::newRow("12 hours") << QString("h:mm ap") << QByteArray("9:30 pm x") << 7 << true;
    QTest::newRow("time zone") << QString("hh:mm t") << QByteArray("09:30 CET x") << 9 << true;
    QTest::newRow("half of the day in one letter")
        << QString("h:mm a") << QByteArray("9:30 pm x") << 7 << true;
    QTest::newRow("half of the day at the end of a line")
        << QString("h:mm ap") << QByteArray("9:30 pm") << 7 << true;
    QTest::newRow("a one-letter year is literal")
        << QString("y hh:mm") << QByteArray("y 09:30 x") << 7 << true;
    QTest::newRow("two names of the month")
        << QString("MMM MMMM hh:mm") << QByteArray("May May 09:30 x") << 13 << true;
    QTest::newRow("a month cut off") << QString("MMM") << QByteArray("Ma") << -1 << false;
    QTest::newRow("minutes without hours") << QString("mm") << QByteArray("30 x") << 2 << false;
    QTest::newRow("hours without minutes") << QString("hh") << QByteArray("09 x") << 2 << false;
    QTest::newRow("nothing between two quotes")
        << QString("hh'':mm") << QByteArray("09':30 x") << 6 << true;
    QTest::newRow("a word of any letters")
        << QString("hh:mm t") << QByteArray("09:30 azAZ\x80\xFF x") << 12 << true;
    for (char const c : {'`', '{', '@', '[', '\x7F'})
        QTest::newRow(qPrintable(QString("no word: %1").arg(uint(c))))
            << QString("hh:mm t") << (QByteArray("09:30 ") + c + " x") << -1 << false;
    QTest::newRow("another character between numbers")
        << byDefault << QByteArray("2025/03-03 09:02:11.031 Trace x") << -1 << false;
    QTest::newRow("another text") << QString("'at' hh:mm") << QByteArray("as 09:30 x") << -1
                                  << false;
    QTest::newRow("a month at the end of a line")
        << QString("MMM") << QByteArray("May") << 3 << false;
    QTest::newRow("unknown month") << QString("MMM d") << QByteArray("Foo 3") << -1 << false;
}

void tst_LogTimeReader::length()
{
    QFETCH(QString, format);
    QFETCH(QByteArray, text);
    QFETCH(bool, tellsTime);
    const LogTimeReader::Stamp stamp = LogTimeReader(format).Read(text.constData(), text.size());
    QTEST(stamp.length, "length");
    QCOMPARE(stamp.key >= 0, tellsTime);
}

void tst_LogTimeReader::readsWhatQtWrites_data()
{
    QTest::addColumn<QString>("format");

    for (char const* format :
         {"yyyy-MM-dd hh:mm:ss.z", "yyyy-MM-dd hh:mm:ss.zzz", "yy-M-d h:m:s.z",
          "dd.MM.yyyy HH:mm:ss", "ddd MMM d yyyy hh:mm:ss", "dddd, d MMMM yyyy h:mm:ss AP",
          "hh:mm:ss.zzz", "'at' hh 'o''clock' mm", "yyyyMMddhhmmsszzz", "yyyy-MM-ddThh:mm:ss"})
        QTest::newRow(format) << QString(format);
}

// Whatever a format produces for a time is parsed to its end, and the order of times is kept.
void tst_LogTimeReader::readsWhatQtWrites()
{
    QFETCH(QString, format);
    const LogTimeReader reader(format);
    qint64 last = -1;
    for (int minute = 0; minute < 24 * 60; minute += 7) {
        const QDateTime time(QDate(2025, 10, 9), QTime(minute / 60, minute % 60, minute % 60, 120));
        const QByteArray text = time.toString(format).toLatin1();
        const QByteArray line = text + " Trace x";
        const LogTimeReader::Stamp stamp = reader.Read(line.constData(), line.size());
        QVERIFY2(stamp.length == text.size(), line);
        QVERIFY2(stamp.key > last, line);
        last = stamp.key;
    }
}

void tst_LogTimeReader::order_data()
{
    QTest::addColumn<QString>("format");
    QTest::addColumn<QByteArray>("earlier");
    QTest::addColumn<QByteArray>("later");

    const QString byDefault("yyyy-MM-dd hh:mm:ss.z");
    QTest::newRow("years") << byDefault << QByteArray("2024-12-31 23:59:59.999")
                           << QByteArray("2025-01-01 00:00:00.000");
    QTest::newRow("months before days") << byDefault << QByteArray("2025-01-31 00:00:00.000")
                                        << QByteArray("2025-02-01 00:00:00.000");
    QTest::newRow("noon is after eleven")
        << QString("h:mm ap") << QByteArray("11:59 am") << QByteArray("12:00 pm");
    QTest::newRow("midnight is before one")
        << QString("h:mm ap") << QByteArray("12:59 am") << QByteArray("1:00 am");
    QTest::newRow("the half of the day comes first")
        << QString("ap h:mm") << QByteArray("am 12:59") << QByteArray("am 1:00");
    QTest::newRow("hours of the whole day, and the half")
        << QString("yyyy-MM-dd HH:mm AP") << QByteArray("2025-01-01 23:59 PM")
        << QByteArray("2025-01-02 00:00 AM");
    QTest::newRow("half a second is before the next millisecond")
        << QString("hh:mm:ss.z") << QByteArray("09:30:00.5") << QByteArray("09:30:00.501");
    QTest::newRow("two digits of milliseconds")
        << QString("hh:mm:ss.z") << QByteArray("09:30:00.319") << QByteArray("09:30:00.32");
    QTest::newRow("one digit of milliseconds is half a second")
        << QString("hh:mm:ss.z") << QByteArray("09:30:00.031") << QByteArray("09:30:00.5");
    QTest::newRow("names of months")
        << QString("yyyy MMM d hh:mm") << QByteArray("2025 Apr 1 00:00")
        << QByteArray("2025 Aug 1 00:00");
}

void tst_LogTimeReader::order()
{
    QFETCH(QString, format);
    QFETCH(QByteArray, earlier);
    QFETCH(QByteArray, later);
    const LogTimeReader reader(format);
    const qint64 first = reader.Read(earlier.constData(), earlier.size()).key;
    QVERIFY(first >= 0);
    QVERIFY(first < reader.Read(later.constData(), later.size()).key);
}

void tst_LogTimeReader::tenMilliseconds_data()
{
    QTest::addColumn<QByteArray>("later");

    const auto row = [](char const* name, char const* later) {
        QTest::newRow(name) << QByteArray(later);
    };
    row("within a second", "2025-06-05 10:20:30.500");
    row("at a full minute", "2025-06-05 10:21:00.000");
    row("at a full hour", "2025-06-05 11:00:00.000");
    row("at midnight", "2025-06-06 00:00:00.000");
    row("after a month of 30 days", "2025-07-01 00:00:00.000");
    row("after a month of 31 days", "2025-08-01 00:00:00.000");
    row("after February", "2025-03-01 00:00:00.000");
    row("after February of a leap year", "2024-03-01 00:00:00.000");
    row("on a leap day", "2024-02-29 00:00:00.000");
    row("after a year", "2025-01-01 00:00:00.000");
}

// The index allows for threads that overtake each other by some milliseconds, at any time.
void tst_LogTimeReader::tenMilliseconds()
{
    QFETCH(QByteArray, later);
    const QString format("yyyy-MM-dd hh:mm:ss.zzz");
    const QByteArray earlier =
        QDateTime::fromString(later, format).addMSecs(-10).toString(format).toLatin1();
    const LogTimeReader reader(format);
    const qint64 first = reader.Read(earlier.constData(), earlier.size()).key;
    QCOMPARE(reader.Read(later.constData(), later.size()).key - first, qint64(10));
}

void tst_LogTimeReader::hasDate_data()
{
    QTest::addColumn<QString>("format");
    QTest::addColumn<bool>("expected");

    QTest::newRow("default") << QString("yyyy-MM-dd hh:mm:ss.z") << true;
    QTest::newRow("time only") << QString("hh:mm:ss") << false;
    QTest::newRow("no year") << QString("MM-dd hh:mm:ss") << false;
    QTest::newRow("no month") << QString("yyyy dd") << false;
    QTest::newRow("no day") << QString("yyyy-MM") << false;
    QTest::newRow("short year") << QString("d.M.yy") << true;
}

void tst_LogTimeReader::hasDate()
{
    QFETCH(QString, format);
    QTEST(LogTimeReader(format).hasDate(), "expected");
}

QTEST_GUILESS_MAIN(tst_LogTimeReader)
#include "tst_LogTimeReader.moc"
