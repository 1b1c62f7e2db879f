// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/logfile/ForeignStamp.h"

#include "app/logfile/LogTimeReader.h"
#include "support/GuardedBytes.h"

#include <QtTest>

using namespace Velocor;

namespace {

const QDate Latest(2026, 11, 25);

using Read = ForeignStamp (*)(char const*, int, QDate const&);

ForeignStamp Seconds(char const* text, int length, QDate const&)
{
    return ForeignStamp::ReadSeconds(text, length);
}

ForeignStamp ReadGuarded(Read read, QByteArray const& text, QDate const& latest = Latest)
{
    GuardedBytes guarded;
    return read(guarded.Put(text, true), text.size(), latest);
}

// The key of "yyyy-MM-dd hh:mm:ss.zzz", without milliseconds or date if there are none.
qint64 KeyOf(QByteArray const& time)
{
    const QByteArray whole = time.contains('.') ? time : time + ".000";
    const LogTimeReader reader(time.contains('-') ? "yyyy-MM-dd hh:mm:ss.zzz" : "hh:mm:ss.zzz");
    return reader.Read(whole.constData(), whole.size()).key;
}

// What is read in the first bytes of a text; its length is that of the text if all is read.
void Compare(ForeignStamp const& stamp, int length, QByteArray const& time)
{
    QCOMPARE(stamp.length, length);
    QCOMPARE(stamp.key, KeyOf(time));
    QCOMPARE(stamp.hasDate, time.contains('-'));
    QCOMPARE(stamp.resolution, time.contains('.') ? 1 : 1000);
}

bool IsSame(ForeignStamp const& one, ForeignStamp const& other)
{
    return one.length == other.length && one.key == other.key && one.hasDate == other.hasDate &&
           one.resolution == other.resolution && one.isFollowedByIds == other.isFollowedByIds;
}

// Whether each beginning of a text is read in the same way, whatever follows.
bool IsTextCutAnywhere(Read read, QByteArray const& text)
{
    for (int length = 0; length <= text.size(); ++length) {
        const ForeignStamp alone = ReadGuarded(read, text.left(length));
        for (QByteArray const& next :
             {text.mid(length), QByteArray("0000"), QByteArray("    "), QByteArray(".0.0"),
              QByteArray("+0+0"), QByteArray("MMMM")}) {
            const QByteArray followed = text.left(length) + next;
            if (!IsSame(read(followed.constData(), length, Latest), alone)) {
                qWarning("%d bytes, followed by %s", length, next.constData());
                return false;
            }
        }
    }
    return true;
}

} // namespace

class tst_ForeignStamp : public QObject
{
    Q_OBJECT

private slots:
    void stamps_data();
    void stamps();
    void noStamps_data();
    void noStamps();
    void months();
    void weekdays();
    void zones_data();
    void zones();
    void guessedYear_data();
    void guessedYear();
    void afterLetter_data();
    void afterLetter();
    void seconds_data();
    void seconds();
    void epochs();
};

// Each of several texts follows each stamp in turn.
void tst_ForeignStamp::stamps_data()
{
    QTest::addColumn<QByteArray>("time"); // as for KeyOf()
    const auto row = [](char const* stamp, char const* time) {
        QTest::newRow(stamp) << QByteArray(time);
    };
    row("2026-11-22T14:03:02", "2026-11-22 14:03:02");
    row("2026-11-22T14:03:02.5Z", "2026-11-22 14:03:02.500");
    row("2026-11-22 14:03:02", "2026-11-22 14:03:02");
    row("2026-11-22 14:03:02.123456789 +0100", "2026-11-22 14:03:02.123");
    row("2026-11-22  14:03:02,25", "2026-11-22 14:03:02.250");
    row("2026-11-22_14:03:02.007", "2026-11-22 14:03:02.007");
    row("2026/11/22 14:03:02.1 UTC", "2026-11-22 14:03:02.100");
    row("2026.11.22 14:03:02", "2026-11-22 14:03:02");
    row("20261122T140302.25+01:00", "2026-11-22 14:03:02.250");
    row("20261122 14:03:02.9", "2026-11-22 14:03:02.900");
    row("22.11.2026 14:03:02 CET", "2026-11-22 14:03:02");
    row("22/Nov/2026:14:03:02 -0800", "2026-11-22 14:03:02");
    row("22-Nov-2026 14:03:02 GMT", "2026-11-22 14:03:02");
    row("Sun Nov 22 14:03:02 2026", "2026-11-22 14:03:02");
    row("Sun Nov  2 14:03:02.75 2026", "2026-11-02 14:03:02.750");
    row("Sun 2026-11-22 14:03:02 UTC", "2026-11-22 14:03:02");
    row("Sun, 22 Nov 2026 14:03:02 GMT", "2026-11-22 14:03:02");
    row("Nov 22 2026 14:03:02.5", "2026-11-22 14:03:02.500");
    row("Nov 22 14:03:02", "2026-11-22 14:03:02");
    row("Nov  2 14:03:02.5", "2026-11-02 14:03:02.500");
    row("Nov 2 14:03:02", "2026-11-02 14:03:02");
    row("2 Nov 2026 14:03:02.123", "2026-11-02 14:03:02.123");
    row(" 2 Nov 2026 14:03:02.123", "2026-11-02 14:03:02.123");
    row("14:03:02", "14:03:02");
    row("14:03:02.123", "14:03:02.123");
    row("11/22/2026 2:03:02 PM", "2026-11-22 14:03:02");
    row("1/2/2026 12:03:02.5 AM", "2026-01-02 00:03:02.500");
    row("Nov 2, 2026 11:03:02 AM", "2026-11-02 11:03:02");
    row("Nov 2, 2026 12:03:02 PM", "2026-11-02 12:03:02");
    row("11-22 14:03:02.123", "2026-11-22 14:03:02.123");
    // At the limits.
    row("0001-01-01 00:00:00.000", "0001-01-01 00:00:00.000");
    row("2026-12-31 23:59:59.999", "2026-12-31 23:59:59.999");
    row("2026-11-22 14:03:60", "2026-11-22 14:04:00"); // a leap second
    row("2026-11-22 24:00:00", "2026-11-23 00:00:00");
    row("1/2/2026 1:03:02 PM", "2026-01-02 13:03:02");
}

void tst_ForeignStamp::stamps()
{
    QFETCH(QByteArray, time);
    const QByteArray text(QTest::currentDataTag());
    for (char const* next : {"", " x", ": x", "]"}) {
        const ForeignStamp stamp = ReadGuarded(ForeignStamp::Read, text + next);
        Compare(stamp, text.size(), time);
        QCOMPARE(stamp.isFollowedByIds, text.startsWith("11-22"));
    }
    QVERIFY(IsTextCutAnywhere(ForeignStamp::Read, text + " x"));
}

void tst_ForeignStamp::noStamps_data()
{
    QTest::addColumn<QByteArray>("text");
    for (char const* text : {"",
                             "x",
                             "14:03:0",
                             "14:03:02x",
                             "14:03:021",
                             "14:03:02.123x",
                             " 14:03:02",
                             "[14:03:02]",
                             "14:60:02",
                             "14:03:61",
                             "25:03:02",
                             "14 03 02",
                             "14:03-02",
                             "0000-11-22 14:03:02x",
                             "0000-11-22 14:03:02",
                             "2026-00-22 14:03:02",
                             "2026-13-22 14:03:02",
                             "2026-11-00 14:03:02",
                             "2026-11-32 14:03:02",
                             "2026-11-22",
                             "2026-11-22 x14:03:02",
                             "0/22/2026 2:03:02 PM",
                             "11/22/2026 0:03:02 PM",
                             "11/22/2026 13:03:02 PM",
                             "11/22/2026 2:03:02",
                             "/22/2026 2:03:02 PM",
                             "11/22/2026 2:03:02 XM",
                             "11/22/2026 2:03:02 PX",
                             "Foo 22 14:03:02",
                             "nov 22 14:03:02",
                             "Nov   2 14:03:02",
                             "Nov xx 14:03:02",
                             "Fo, 22 Nov 2026 14:03:02",
                             "1795442582",
                             "012/22/2026 2:03:02 PM",
                             "Nov 022 14:03:02",
                             "1/2/2026 002:03:02 PM",
                             "1795442582.",
                             "1795442582.x",
                             "1795442582,123",
                             "17954425821.123",
                             "179544258.123456",
                             "1122 14:03:02",
                             "261122 14:03:02"})
        QTest::newRow(text) << QByteArray(text);
}

void tst_ForeignStamp::noStamps()
{
    QFETCH(QByteArray, text);
    QVERIFY(IsSame(ReadGuarded(ForeignStamp::Read, text), ForeignStamp()));
    QVERIFY(IsTextCutAnywhere(ForeignStamp::Read, text));
}

void tst_ForeignStamp::months()
{
    const QByteArray names("JanFebMarAprMayJunJulAugSepOctNovDec");
    for (int month = 1; month <= 12; ++month) {
        const QByteArray name = names.mid(3 * month - 3, 3);
        const QByteArray number = QByteArray::number(month).rightJustified(2, '0');
        Compare(ReadGuarded(ForeignStamp::Read, name + " 03 2026 14:03:02"), 20,
                "2026-" + number + "-03 14:03:02");
        Compare(ReadGuarded(ForeignStamp::Read, "2026-" + number + "-03 14:03:02"), 19,
                "2026-" + number + "-03 14:03:02");
    }
}

// Whether it is the right one does not matter.
void tst_ForeignStamp::weekdays()
{
    for (char const* day : {"Mon", "Tue", "Wed", "Thu", "Fri", "Sat", "Sun"}) {
        Compare(ReadGuarded(ForeignStamp::Read, QByteArray(day) + " Nov 22 14:03:02 2026"), 24,
                "2026-11-22 14:03:02");
    }
}

void tst_ForeignStamp::zones_data()
{
    QTest::addColumn<QByteArray>("zone");
    QTest::addColumn<int>("length");
    const auto row = [](char const* zone, int length) {
        QTest::newRow(zone) << QByteArray(zone) << length;
    };
    for (char const* zone :
         {"Z",    "+0100", "-0100", "+01:00", "-01",  " +0100", " -01:00", " +01",
          " UTC", " GMT",  " CET",  " CEST",  " MET", " EST",   " EDT",    " CST",
          " CDT", " MST",  " MDT",  " PST",   " PDT", " BST",   " WET",    " WEST",
          " EET", " EEST", " MSK",  " IST",   " JST", " KST",   " AEST"})
        row(zone, static_cast<int>(std::strlen(zone)));
    row(" CETX", 0);
    row(" CE", 0);
    row(" Z", 0);
    row(" UTC+1", 4);
    row(" UTC:", 4);
    row(" +", 0);
    row(" +1", 0);
    row(" x", 0);
    row(" ", 0);
    row("+01:x", 3);
    row("+01:", 3);
    row("+01:0", 3);
    row("+01: 5 o'clock", 3);
    row("+01:5 x", 3);
    row("+01:word", 3);
    row("+", 0);
    row("-x", 0);
    row(":UTC", 0);
}

void tst_ForeignStamp::zones()
{
    QFETCH(QByteArray, zone);
    QFETCH(int, length);
    const QByteArray stamp("2026-11-22 14:03:02");
    Compare(ReadGuarded(ForeignStamp::Read, stamp + zone), stamp.size() + length, stamp);
    if (length == zone.size()) {
        Compare(ReadGuarded(ForeignStamp::Read, stamp + zone + " x"), stamp.size() + length, stamp);
        QVERIFY(ReadGuarded(ForeignStamp::Read, stamp + zone + "x").length < stamp.size() + length);
    }
    QVERIFY(IsTextCutAnywhere(ForeignStamp::Read, stamp + zone + " x"));
}

// The latest such day, up to a week ahead.
void tst_ForeignStamp::guessedYear_data()
{
    QTest::addColumn<QDate>("latest");
    QTest::addColumn<QByteArray>("day");
    QTest::addColumn<int>("year");
    const auto row = [](char const* name, QDate const& latest, char const* day, int year) {
        QTest::newRow(name) << latest << QByteArray(day) << year;
    };
    row("the same day", QDate(2026, 11, 25), "11-25", 2026);
    row("the day before", QDate(2026, 11, 25), "11-24", 2026);
    row("the month before", QDate(2026, 11, 25), "10-31", 2026);
    row("a week ahead", QDate(2026, 11, 10), "11-17", 2026);
    row("a week ahead, in the next month", QDate(2026, 11, 25), "12-02", 2026);
    row("eight days ahead", QDate(2026, 11, 10), "11-18", 2025);
    row("eight days ahead, in the next month", QDate(2026, 11, 25), "12-03", 2025);
    row("a week ahead, in the next year", QDate(2026, 12, 28), "01-04", 2027);
    row("eight days ahead, in the next year", QDate(2026, 12, 28), "01-05", 2026);
    row("last day of the year, in January", QDate(2026, 1, 3), "12-31", 2025);
    row("not known", QDate(), "11-25", 1970);
}

void tst_ForeignStamp::guessedYear()
{
    QFETCH(QDate, latest);
    QFETCH(QByteArray, day);
    QFETCH(int, year);
    const QByteArray text = day + " 14:03:02.5";
    Compare(ReadGuarded(ForeignStamp::Read, text, latest), text.size(),
            QByteArray::number(year) + '-' + text + "00");
    Compare(ReadGuarded(ForeignStamp::Read, "2019-" + text, latest), text.size() + 5,
            "2019-" + text + "00");
}

void tst_ForeignStamp::afterLetter_data()
{
    QTest::addColumn<QByteArray>("time");
    QTest::newRow("1122 14:03:02.123456") << QByteArray("2026-11-22 14:03:02.123");
    QTest::newRow("1122 14:03:02") << QByteArray("2026-11-22 14:03:02");
    QTest::newRow("20261122 14:03:02.5") << QByteArray("2026-11-22 14:03:02.500");
    QTest::newRow("261122 14:03:02") << QByteArray("2026-11-22 14:03:02");
    QTest::newRow("001122 14:03:02") << QByteArray("2000-11-22 14:03:02");
    for (char const* text : {"", "1122", "2026-11-22 14:03:02", "1322 14:03:02", "1122 14:03:02x",
                             "x61122 14:03:02", "2x1122 14:03:02"})
        QTest::newRow(text) << QByteArray();
}

void tst_ForeignStamp::afterLetter()
{
    QFETCH(QByteArray, time);
    const QByteArray text(QTest::currentDataTag());
    const ForeignStamp stamp = ReadGuarded(ForeignStamp::ReadAfterLetter, text);
    if (time.isEmpty())
        QVERIFY(IsSame(stamp, ForeignStamp()));
    else
        Compare(stamp, text.size(), time);
    QVERIFY(IsTextCutAnywhere(ForeignStamp::ReadAfterLetter, text + " x"));
}

void tst_ForeignStamp::seconds_data()
{
    QTest::addColumn<QByteArray>("text");
    QTest::addColumn<int>("length");
    QTest::addColumn<qint64>("key");
    const auto row = [](char const* text, int length, qint64 key) {
        QTest::newRow(text) << QByteArray(text) << length << key;
    };
    row("0.000000", 8, 0);
    row("    1.250000] x", 12, 1250);
    row("12.3", 4, 12300);
    row("12.03", 5, 12030);
    row("12.0079", 7, 12007);
    row("9876543210.5", 12, 9876543210500);
    row("98765432101.5", 0, -1);
    row("", 0, -1);
    row("   ", 0, -1);
    row("12", 0, -1);
    row("12.", 0, -1);
    row("12.x", 0, -1);
    row("12,5", 0, -1);
    row(".5", 0, -1);
    row(" .5", 0, -1);
    row("x", 0, -1);
}

void tst_ForeignStamp::seconds()
{
    QFETCH(QByteArray, text);
    QFETCH(int, length);
    const ForeignStamp stamp = ReadGuarded(Seconds, text);
    QCOMPARE(stamp.length, length);
    QTEST(stamp.key, "key");
    QVERIFY(!stamp.hasDate);
    QCOMPARE(stamp.resolution, length > 0 ? 1 : 1000);
    QVERIFY(IsTextCutAnywhere(Seconds, text));
}

// In local time, as they are shown.
void tst_ForeignStamp::epochs()
{
    for (qint64 time :
         {qint64(0), qint64(1795442582000), qint64(1795442582123), qint64(951782400999)}) {
        const QDateTime local = QDateTime::fromMSecsSinceEpoch(time);
        const QByteArray shown = local.toString("yyyy-MM-dd hh:mm:ss.zzz").toLatin1();
        QCOMPARE(ForeignStamp::KeyOfEpoch(time), KeyOf(shown));
    }
    const QDateTime local = QDateTime::fromMSecsSinceEpoch(1795442582250);
    Compare(ReadGuarded(ForeignStamp::Read, "1795442582.250 x"), 14,
            local.toString("yyyy-MM-dd hh:mm:ss.zzz").toLatin1());
    QVERIFY(IsTextCutAnywhere(ForeignStamp::Read, "1795442582.250 x"));
    const QDateTime first = QDateTime::fromMSecsSinceEpoch(0);
    Compare(ReadGuarded(ForeignStamp::Read, "0000000000.000 x"), 14,
            first.toString("yyyy-MM-dd hh:mm:ss.zzz").toLatin1());

    const qint64 year = qint64(366) * 24 * 60 * 60 * 1000;
    QVERIFY(ForeignStamp::KeyOfEpoch(-1900 * year) > 0);
    QCOMPARE(ForeignStamp::KeyOfEpoch(-2000 * year), qint64(-1));
}

QTEST_GUILESS_MAIN(tst_ForeignStamp)
#include "tst_ForeignStamp.moc"
