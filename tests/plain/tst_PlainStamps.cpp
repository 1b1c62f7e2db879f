// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/log/TorkLog.h"
#include "common/log/TorkLogStamp_p.h"
#include "log/LogFolder.h"
#include "log/PlainStamp.h"
#include "plain/Rounds.h"
#include "support/ChildProcess.h"
#include "support/TestClock.h"

#include <QDateTime>
#include <QSemaphore>
#include <QTimeZone>
#include <QtTest>

#include <atomic>
#include <cstdio>
#include <ctime>
#include <random>
#include <thread>

/// Compares time stamps and elapsed times with QDateTime::toString() of the moment itself, and with
/// the fields that the C library computes for it.
class tst_PlainStamps : public QObject
{
    Q_OBJECT

private slots:
    void init();
    void cleanup();
    void cleanupTestCase();

    void millisecondsOfAMinute_data();
    void millisecondsOfAMinute();
    void entriesOfTwoThreads_data();
    void entriesOfTwoThreads();
    void clockChanges_data();
    void clockChanges();
    void changesOfAllZones();
    void formatZoneAndMomentAtRandom();
    void languages_data();
    void languages();

private:
    QByteArray m_zone;
};

namespace {

std::atomic<qint64> g_stamps{0};

const char zoneFormat[] = "d.M.yy H:m:s,z t";

const char* const formats[] = {
    "yyyy-MM-dd hh:mm:ss.z",
    "yyyy-MM-dd hh:mm:ss.zzz",
    zoneFormat,
    "ddd MMM d hh:mm:ss.zzz yyyy",
    "dddd, d. MMMM yyyy h:mm:ss ap",
    "hh:mm:ss.z AP",
    "'hh' yyyyMMddhhmmsszzz 'o''clock'",
    "zz z zzzz ss.s mmm",
    "''",
    "'no moment at all'",
    "",
    "[ %1 %2 %d ]",
    "'a long one, beyond what is kept from entry to entry: ' yyyy-MM-dd hh:mm:ss.zzz",
};

void setZone(QByteArray const& zone)
{
    if (zone.isNull())
        qunsetenv("TZ");
    else
        qputenv("TZ", zone);
}

QByteArray plain(qint64 moment, QString const& format)
{
    return plainStamp(QDateTime::fromMSecsSinceEpoch(moment), format);
}

// The fields as the C library computes them, for moments after 1970.
tm libraryTime(qint64 moment)
{
    tzset();
    const time_t seconds = moment / 1000;
    tm fields = {};
    localtime_r(&seconds, &fields);
    return fields;
}

QByteArray libraryStamp(qint64 moment)
{
    const tm time = libraryTime(moment);
    return QString::asprintf("%04d-%02d-%02d %02d:%02d:%02d.%03d", time.tm_year + 1900,
                             time.tm_mon + 1, time.tm_mday, time.tm_hour, time.tm_min, time.tm_sec,
                             static_cast<int>(moment % 1000))
        .toLatin1();
}

int libraryTimeOfDay(qint64 moment)
{
    const tm time = libraryTime(moment);
    return ((time.tm_hour * 60 + time.tm_min) * 60 + time.tm_sec) * 1000 +
           static_cast<int>(moment % 1000);
}

QByteArray latin1(TorkLogLine const& line)
{
    return QString::fromUtf16(line.constData(), line.size()).toLatin1();
}

// A stamp and the time of day, as the log requests them.
QByteArray asked(qint64 moment, QString const& format, quint64 generation)
{
    ++g_stamps;
    TorkLogLine line;
    int timeOfDay = TorkLogStamp::Append(line, moment, generation);
    if (timeOfDay < 0)
        timeOfDay = TorkLogStamp::Make(line, moment, format, generation);
    return latin1(line) + " | " + QByteArray::number(timeOfDay);
}

// Empty if the log's stamp equals the plain one both times; otherwise all of them.
QByteArray differenceInStamp(qint64 moment, QString const& format, quint64 generation)
{
    const QByteArray first = asked(moment, format, generation);
    const QByteArray second = asked(moment, format, generation);
    const QDateTime time = QDateTime::fromMSecsSinceEpoch(moment);
    const QByteArray expected =
        plainStamp(time, format) + " | " + QByteArray::number(time.time().msecsSinceStartOfDay());
    if (first == expected && second == expected)
        return QByteArray();
    return QByteArray::number(moment) + " as \"" + format.toUtf8() + "\": " + first + ", " +
           second + "; expected " + expected;
}

// A log whose entries have the number of the moment as their message. The clock is set in UTC
// because a local time can be ambiguous.
class Log
{
public:
    explicit Log(QByteArray const& format, bool elapsedTime = false) : log(m_folder.logs())
    {
        m_folder.configure(log, {{"filePrefix", "app"},
                                 {"dateTimeFormat", QString::fromUtf8(format)},
                                 {"logElapsedTime", elapsedTime ? "yes" : "no"},
                                 {"maxLogFileSize", "2147483647"}});
    }

    void write(qint64 moment)
    {
        TestClock::set(QDateTime::fromMSecsSinceEpoch(moment, Qt::UTC));
        log.trace(QString::number(moment));
        ++g_stamps;
    }

    QList<QByteArray> lines()
    {
        QList<QByteArray> lines = TestFiles::read(m_folder.logs() + "app.log").split('\n');
        lines.removeLast();
        return lines;
    }

private:
    LogFolder m_folder;

public:
    TorkLog log;
};

QByteArray entry(QByteArray const& stamp, qint64 moment)
{
    return stamp + " Trace " + QByteArray::number(moment);
}

// Rows of a zone and a moment at which its clocks change.
void addClockChanges()
{
    const auto add = [](const char* name, const char* zone, QDate const& date, QTime const& time) {
        QTest::newRow(name) << QByteArray(zone)
                            << QDateTime(date, time, Qt::UTC).toMSecsSinceEpoch();
    };
    add("into daylight saving time", "Europe/Berlin", QDate(2023, 3, 26), QTime(1, 0));
    add("out of daylight saving time", "Europe/Berlin", QDate(2023, 10, 29), QTime(1, 0));
    add("into daylight saving time, west", "America/New_York", QDate(2023, 3, 12), QTime(7, 0));
    add("out of daylight saving time, west", "America/New_York", QDate(2023, 11, 5), QTime(6, 0));
    add("half an hour", "Australia/Lord_Howe", QDate(2023, 4, 1), QTime(15, 0));
    add("negative daylight saving time", "Europe/Dublin", QDate(2023, 10, 29), QTime(1, 0));
    add("standard time back: Kazakhstan", "Asia/Almaty", QDate(2024, 2, 29), QTime(18, 0));
    add("standard time back: Russia", "Europe/Moscow", QDate(2014, 10, 25), QTime(22, 0));
    add("standard time back: Sudan", "Africa/Khartoum", QDate(2017, 10, 31), QTime(21, 0));
    add("standard time back: South Sudan", "Africa/Juba", QDate(2021, 1, 31), QTime(21, 0));
    add("standard time back by half an hour", "America/Caracas", QDate(2007, 12, 9), QTime(7, 0));
    add("a day left out", "Pacific/Apia", QDate(2011, 12, 30), QTime(10, 0));
    add("not by whole minutes", "Africa/Monrovia", QDate(1972, 1, 7), QTime(0, 44, 30));
    add("midnight, and the year ends", "Asia/Kathmandu", QDate(2023, 12, 31), QTime(18, 15));
}

} // namespace

void tst_PlainStamps::init()
{
    m_zone = qgetenv("TZ");
}

void tst_PlainStamps::cleanup()
{
    setZone(m_zone);
    tzset();
    TestClock::release();
}

void tst_PlainStamps::cleanupTestCase()
{
    std::printf("plain stamps: %lld stamps, all as Qt formats them\n",
                static_cast<long long>(g_stamps));
}

void tst_PlainStamps::millisecondsOfAMinute_data()
{
    QTest::addColumn<QByteArray>("zone");
    QTest::addColumn<qint64>("minute");

    const qint64 minute = QDateTime(QDate(2023, 9, 30), QTime(9, 59), Qt::UTC).toMSecsSinceEpoch();
    QTest::newRow("unset") << QByteArray() << minute;
    QTest::newRow("Berlin") << QByteArray("Europe/Berlin") << minute;
    QTest::newRow("New York") << QByteArray("America/New_York") << minute;
    QTest::newRow("Kathmandu") << QByteArray("Asia/Kathmandu") << minute;
    QTest::newRow("Apia") << QByteArray("Pacific/Apia") << minute;
    QTest::newRow("the first minute of 1970") << QByteArray("Asia/Tokyo") << qint64(0);
}

// One thread goes through the minute forward, the other backward. The milliseconds that a thread
// happens to see first must not decide how it formats the others. The zone's name ("t") is left
// out: Qt reads it from the C library while the other thread may be setting it.
void tst_PlainStamps::millisecondsOfAMinute()
{
    QFETCH(QByteArray, zone);
    QFETCH(qint64, minute);
    setZone(zone);

    // A prime, so that each format gets different milliseconds.
    const int step = Rounds::isFull() ? 1 : 499;
    const auto walk = [&](bool backwards, QByteArray& difference) {
        quint64 generation = 0;
        int first = 0;
        for (const char* each : formats) {
            if (each == zoneFormat)
                continue;
            const QString format = QString::fromUtf8(each);
            ++generation;
            first = (first + 31) % step;
            for (int past = first; past < 60000 && difference.isEmpty(); past += step) {
                const qint64 moment = minute + (backwards ? 59999 - past : past);
                difference = differenceInStamp(moment, format, generation);
            }
        }
    };
    QByteArray differences[2];
    std::thread other(walk, true, std::ref(differences[1]));
    walk(false, differences[0]);
    other.join();
    QCOMPARE(differences[0], QByteArray());
    QCOMPARE(differences[1], QByteArray());
}

void tst_PlainStamps::entriesOfTwoThreads_data()
{
    QTest::addColumn<QByteArray>("format");

    for (const char* format : formats)
        QTest::addRow("\"%.40s\"", format) << QByteArray(format);
}

// Alternating entry by entry; each moment is formatted by both of them.
void tst_PlainStamps::entriesOfTwoThreads()
{
    QFETCH(QByteArray, format);
    setZone("Europe/Berlin");
    const qint64 minute = QDateTime(QDate(2023, 10, 29), QTime(0, 59)).toMSecsSinceEpoch();
    const int count = Rounds::count(300, 60000);
    const int step = 60000 / count;

    Log log(format);
    QSemaphore turns[2];
    std::thread other([&] {
        for (int each = 0; each < count; ++each) {
            turns[1].acquire();
            log.write(minute + each * step);
            turns[0].release();
        }
    });
    for (int each = 0; each < count; ++each) {
        log.write(minute + each * step);
        turns[1].release();
        turns[0].acquire();
    }
    other.join();

    const QList<QByteArray> lines = log.lines();
    QCOMPARE(lines.size(), 2 * count);
    for (int line = 0; line < lines.size(); ++line) {
        const qint64 moment = minute + line / 2 * step;
        QCOMPARE(lines[line], entry(plain(moment, QString::fromUtf8(format)), moment));
    }
}

void tst_PlainStamps::clockChanges_data()
{
    QTest::addColumn<QByteArray>("zone");
    QTest::addColumn<qint64>("change");

    addClockChanges();
}

// The hours around a change: every second at full size, at a random millisecond.
void tst_PlainStamps::clockChanges()
{
    QFETCH(QByteArray, zone);
    QFETCH(qint64, change);
    std::mt19937 random(Rounds::seed());
    std::uniform_int_distribution<int> millisecond(0, 999);
    const int step = Rounds::isFull() ? 1 : 13;

    setZone(zone);
    Log log("yyyy-MM-dd hh:mm:ss.zzz", true);
    QList<qint64> moments;
    for (int second = -7300; second < 7300; second += step)
        moments.append(change + second * 1000 + millisecond(random));
    for (int offset : {-3600000, -1801000, -1800000, -1001, -1000, -1, 0, 1, 999, 1000, 1799999,
                       1800000, 3599999, 3600000})
        moments.append(change + offset);
    for (qint64 moment : moments)
        log.write(moment);

    const QList<QByteArray> lines = log.lines();
    QCOMPARE(lines.size(), moments.size());
    for (int line = 1; line < lines.size(); ++line) {
        const qint64 moment = moments[line];
        const int elapsed = libraryTimeOfDay(moment) - libraryTimeOfDay(moments[line - 1]);
        QCOMPARE(lines[line], libraryStamp(moment) + " Trace dT:[" + QByteArray::number(elapsed) +
                                  "] " + QByteArray::number(moment));
        QCOMPARE(plain(moment, "yyyy-MM-dd hh:mm:ss.zzz"), libraryStamp(moment));
    }
}

// All changes since 1970 in the system's time zones; a subset of the zones at the usual size.
void tst_PlainStamps::changesOfAllZones()
{
    std::mt19937 random(Rounds::seed());
    const int oneIn = Rounds::count(30, 1);
    const QDateTime begin = QDateTime::fromMSecsSinceEpoch(qint64(24) * 3600000);
    const QDateTime end(QDate(2037, 12, 1), QTime());
    const QString format("yyyy-MM-dd hh:mm:ss.zzz");
    quint64 generation = 0;
    int zones = 0;

    for (QByteArray const& zone : QTimeZone::availableTimeZoneIds()) {
        if (random() % static_cast<unsigned>(oneIn) != 0)
            continue;
        ++zones;
        setZone(zone);
        ++generation;
        for (QTimeZone::OffsetData const& change : QTimeZone(zone).transitions(begin, end)) {
            for (int offset : {-7200000, -3600000, -1, 0, 1799999, 1800000, 3599999, 3600000}) {
                const qint64 moment = change.atUtc.toMSecsSinceEpoch() + offset;
                TorkLogLine line;
                const int timeOfDay = TorkLogStamp::Make(line, moment, format, generation);
                if (latin1(line) != libraryStamp(moment) || timeOfDay != libraryTimeOfDay(moment))
                    QCOMPARE(zone + ' ' + latin1(line), zone + ' ' + libraryStamp(moment));
                ++g_stamps;
            }
        }
    }
    QVERIFY(zones > 0);
}

// What was cached for the previous entry may be stale, whatever has changed since.
void tst_PlainStamps::formatZoneAndMomentAtRandom()
{
    std::mt19937 random(Rounds::seed());
    const auto oneOf = [&](int count) {
        return static_cast<int>(random() % quint32(count));
    };
    const QByteArray zones[] = {
        QByteArray(),
        "",
        "UTC",
        "Asia/Tokyo",
        "Asia/Seoul",
        "Europe/Berlin",
        "Asia/Almaty",
        "XXX-3",
        "XXX-3:30",
        "XXX-4",
        ":/usr/share/zoneinfo" + QByteArray("/.").repeated(40) + "/Europe/Berlin",
        ":/usr/share/zoneinfo" + QByteArray("/.").repeated(40) + "/Asia/Shanghai"};
    const qint64 repeated =
        QDateTime(QDate(2024, 2, 29), QTime(18, 0), Qt::UTC).toMSecsSinceEpoch();
    const qint64 days[] = {0, -86400000, repeated, repeated - 3600000, 1696067948005};

    qint64 moment = 0;
    int format = 0;
    setZone(zones[0]);
    const int count = Rounds::count(20000, 1000000);
    for (int each = 0; each < count; ++each) {
        switch (oneOf(5)) {
        case 0:
            setZone(zones[oneOf(12)]);
            if (oneOf(2))
                tzset();
            break;
        case 1:
            moment = days[oneOf(5)] + oneOf(2) * 60000 + oneOf(3) * 31;
            break;
        case 2:
            moment += oneOf(2) ? 1 : 60000;
            break;
        case 3:
            format = oneOf(int(sizeof formats / sizeof *formats));
            break;
        default:
            break; // nothing changes
        }
        if (oneOf(8) == 0) { // an entry of a disabled log
            const QTime time = QDateTime::fromMSecsSinceEpoch(moment).time();
            QCOMPARE(TorkLogStamp::TimeOfDay(moment), time.msecsSinceStartOfDay());
        }
        QCOMPARE(differenceInStamp(moment, QString::fromUtf8(formats[format]),
                                   static_cast<quint64>(format) + 1),
                 QByteArray());
    }
}

void tst_PlainStamps::languages_data()
{
    QTest::addColumn<QByteArray>("language");

    for (const char* language :
         {"C", "de_DE", "tr_TR", "ar_EG", "fa_IR", "my_MM", "ne_NP", "mr_IN", "ja_JP", "pl_PL"})
        QTest::newRow(language) << QByteArray(language);
}

namespace {

// Days with all their names, in the morning and in the afternoon; every day of a year at full size.
int writesAYear(QStringList const&)
{
    for (const char* format : formats) {
        Log log(format);
        QList<qint64> moments;
        for (QDate day(2024, 1, 1); day.year() == 2024; day = day.addDays(Rounds::count(9, 1))) {
            const int hour = day.day() % 2 ? 3 : 15;
            moments.append(QDateTime(day, QTime(hour, 4, 5, day.dayOfYear())).toMSecsSinceEpoch());
            log.write(moments.last());
        }
        const QList<QByteArray> lines = log.lines();
        for (int line = 0; line < moments.size(); ++line) {
            const qint64 moment = moments[line];
            const QByteArray expected = entry(plain(moment, QString::fromUtf8(format)), moment);
            if (lines.value(line) != expected || expected.contains('?')) {
                std::fprintf(stderr, "%s; expected %s\n", lines.value(line).constData(),
                             expected.constData());
                return 1;
            }
        }
    }
    std::printf("%lld\n", static_cast<long long>(g_stamps));
    return 0;
}

} // namespace

// Also with digits and names beyond Latin-1, none of which may turn into a question mark.
void tst_PlainStamps::languages()
{
    QFETCH(QByteArray, language);
    const QByteArray own = qgetenv("LC_ALL");
    qputenv("LC_ALL", language + ".UTF-8");
    const ChildProcess::Result child = ChildProcess::run("year");
    qputenv("LC_ALL", own);
    QVERIFY2(child.ended(), child.report());
    g_stamps += child.output.trimmed().toInt();
}

int main(int argc, char** argv)
{
    return ChildProcess::main<tst_PlainStamps>(argc, argv, {{"year", writesAYear}});
}

#include "tst_PlainStamps.moc"
