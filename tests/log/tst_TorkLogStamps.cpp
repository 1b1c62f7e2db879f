// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/log/TorkLog.h"
#include "log/LogAtATime.h"
#include "log/LogFolder.h"
#include "log/PlainStamp.h"
#include "support/ChildProcess.h"
#include "support/TestClock.h"

#include <QtTest>

#include <ctime>

#ifdef Q_OS_LINUX
#include <sched.h>
#include <sys/mount.h>
#include <unistd.h>
#endif

using namespace LogAtATime;

class tst_TorkLogStamps : public QObject
{
    Q_OBJECT

private slots:
    void init();
    void cleanup();

    void stamp_data();
    void stamp();
    void stampFollowsTheClock_data();
    void stampFollowsTheClock();
    void stampFollowsTheFormat();
    void stampAfterDroppedEntry();
    void stampFollowsTheTimeZone_data();
    void stampFollowsTheTimeZone();
    void longTimeZoneIsNotKept();
    void unsetTimeZoneIsTheSystems_data();
    void unsetTimeZoneIsTheSystems();
    void stampInRepeatedHour_data();
    void stampInRepeatedHour();
    void firstEntryIn1970_data();
    void firstEntryIn1970();
    void stampInTheUsersLanguage_data();
    void stampInTheUsersLanguage();
    void elapsedTime_data();
    void elapsedTime();
    void elapsedTimeBetweenEntries();
    void elapsedTimeFollowsTheTimeZone_data();
    void elapsedTimeFollowsTheTimeZone();
    void elapsedTimeInRepeatedHour();
    void elapsedTimePrefix_data();
    void elapsedTimePrefix();

private:
    QtMessageHandler m_handler = nullptr;
    QByteArray m_zone; // null: TZ is not set
};

namespace {

QDateTime utc(QDate const& date, QTime const& time)
{
    return QDateTime(date, time, Qt::UTC);
}

// The complete date and time, the same in every Qt.
const char stampFormat[] = "yyyy-MM-dd hh:mm:ss.zzz";

} // namespace

void tst_TorkLogStamps::init()
{
    m_zone = qgetenv("TZ");
    m_handler = qInstallMessageHandler(nullptr);
    qInstallMessageHandler(m_handler);
    TestClock::set(now());
}

void tst_TorkLogStamps::cleanup()
{
    TorkLog::shutdown();
    qInstallMessageHandler(m_handler);
    setZone(m_zone);
    tzset();
    TestClock::release();
}

void tst_TorkLogStamps::stamp_data()
{
    QTest::addColumn<QString>("format");
    QTest::addColumn<QDateTime>("time");
    QTest::addColumn<QByteArray>("expected");

    const QDateTime early(QDate(2021, 3, 4), QTime(5, 6, 7, 8));
    const QString usual("yyyy-MM-dd hh:mm:ss.z");
    QTest::newRow("usual") << usual << now() << QByteArray(stampOfNow);
    QTest::newRow("milliseconds as Qt formats them") << usual << early << plainStamp(early, usual);
    QTest::newRow("milliseconds that end in zero, too")
        << usual << early.addMSecs(302) << plainStamp(early.addMSecs(302), usual);
    QTest::newRow("three digits of milliseconds")
        << "yyyy-MM-dd hh:mm:ss.zzz" << early << QByteArray("2021-03-04 05:06:07.008");
    QTest::newRow("before midnight")
        << "dd.MM.yy hh:mm:ss" << QDateTime(QDate(1999, 12, 31), QTime(23, 59, 59, 999))
        << QByteArray("31.12.99 23:59:59");
    QTest::newRow("literal text") << "'at' hh 'o''clock'" << early << QByteArray("at 05 o'clock");
    QTest::newRow("one blank") << " " << early << QByteArray(" ");
    QTest::newRow("markers are text") << "'%1%d'" << early << QByteArray("%1%d");
    QTest::newRow("letters beyond Latin-1")
        << QString::fromUtf8("'ä€'hh") << early << QByteArray("\xE4?05");
    QTest::newRow("long") << "'" + QString(500, 'x') + "'hh" << early
                          << QByteArray(QByteArray(500, 'x') + "05");
}

void tst_TorkLogStamps::stamp()
{
    QFETCH(QString, format);
    QFETCH(QDateTime, time);
    QFETCH(QByteArray, expected);
    TestClock::set(time);
    LogFolder folder;
    TorkLog log;
    log.setOutputPath(folder.logs());
    folder.configure(log, {{"dateTimeFormat", format}, {"filePrefix", "app"}});

    log.trace("x");
    QCOMPARE(TestFiles::read(folder.logs() + "app.log"), expected + " Trace x\n");
}

void tst_TorkLogStamps::stampFollowsTheClock_data()
{
    QTest::addColumn<QString>("format");

    QTest::newRow("usual") << "yyyy-MM-dd hh:mm:ss.z";
    QTest::newRow("three digits of milliseconds") << "dd.MM.yyyy HH:mm:ss,zzz";
    QTest::newRow("two letters for milliseconds") << "ss.zz";
    QTest::newRow("without leading zeros") << "d.M.yyyy H:m:s.z";
    QTest::newRow("without separators") << "yyyyMMddhhmmsszzz";
    QTest::newRow("year of two digits") << "yy-MM-dd ss";
    QTest::newRow("year of one, three and five letters") << "y yyy yyyyy ss";
    QTest::newRow("more letters than a number has") << "MMMMM ddddd hhh mmm sss zzzz";
    QTest::newRow("names") << "dddd, MMM d, ss";
    QTest::newRow("half days") << "h:mm:ss.z AP";
    QTest::newRow("half days, small letters") << "hh:ss ap";
    QTest::newRow("zone") << "hh:mm:ss t";
    QTest::newRow("quotes") << "hh 'h' ''ss";
    QTest::newRow("an open quote") << "ss 'ss";
    QTest::newRow("other letters") << "yyyy-MM-ddThh:mm:ss xyz";
    QTest::newRow("other signs") << QString::fromUtf8("hhä%1 %d ss");
    QTest::newRow("no moment at all") << "-";
    QTest::newRow("as long as is kept") << QString(62, '.') + "ss";
    QTest::newRow("longer than is kept") << QString(63, '.') + "ss";
    QTest::newRow("longer only in words") << QString(60, '.') + "zsh";
}

// What is cached between entries equals what Qt would return again.
void tst_TorkLogStamps::stampFollowsTheClock()
{
    QFETCH(QString, format);
    LogFolder folder;
    TorkLog log;
    log.setOutputPath(folder.logs());
    folder.configure(log, {{"dateTimeFormat", format}, {"filePrefix", "app"}});

    QByteArray expected;
    QDateTime time(QDate(2023, 9, 30), QTime(9, 59, 8, 5));
    for (int step : {0, 1, 94, 900, 0, 9000, 40000, 1000, 60000, 3600000, -3600000, 36000000}) {
        time = time.addMSecs(step);
        TestClock::set(time);
        log.trace("x");
        expected += plainStamp(time, format) + " Trace x\n";
    }
    QCOMPARE(TestFiles::read(folder.logs() + "app.log"), expected);
}

// All at the same moment, so that a stamp cached for another format would show.
void tst_TorkLogStamps::stampFollowsTheFormat()
{
    LogFolder folder;
    TorkLog first;
    TorkLog second;
    folder.prepare(first, "first");
    first.trace("1");
    folder.configure(second, {{"filePrefix", "second"}, {"dateTimeFormat", "'S'"}});
    second.setOutputPath(folder.logs());
    second.trace("2");
    first.trace("3");
    folder.configure(first, {{"dateTimeFormat", "'U'"}});
    first.trace("4");
    TestClock::advance(1);
    second.trace("5");
    first.trace("6");

    QCOMPARE(folder.listing(),
             QStringList({"first.log: T Trace 1\nT Trace 3\nU Trace 4\nU Trace 6\n",
                          "second.log: S Trace 2\nS Trace 5\n"}));
}

// A dropped entry updates only the time of the last entry.
void tst_TorkLogStamps::stampAfterDroppedEntry()
{
    LogFolder folder;
    TorkLog log;
    log.setOutputPath(folder.logs());
    folder.configure(log, {{"dateTimeFormat", stampFormat}, {"filePrefix", "app"}});

    log.trace("x");
    TestClock::advance(1);
    log.setEnable(false);
    log.trace("dropped");
    log.setEnable(true);
    log.trace("y");
    QCOMPARE(TestFiles::read(folder.logs() + "app.log"),
             QByteArray("2021-03-04 05:06:07.123 Trace x\n2021-03-04 05:06:07.124 Trace y\n"));
}

void tst_TorkLogStamps::stampFollowsTheTimeZone_data()
{
    QTest::addColumn<QByteArray>("from");
    QTest::addColumn<QByteArray>("to");
    QTest::addColumn<bool>("tellsTheLibrary");
    QTest::addColumn<QByteArray>("expected");

    const QByteArray berlin("Europe/Berlin");
    const QByteArray tokyo("Asia/Tokyo");
    // Longer than what is cached, and equal up to there.
    const QByteArray longWay(":/usr/share/zoneinfo" + QByteArray("/.").repeated(40));
    const QByteArray inBerlin("2021-03-04 13:00:00.000");
    const QByteArray inTokyo("2021-03-04 21:00:00.000");
    const QByteArray inUtc("2021-03-04 12:00:00.000");
    QTest::newRow("changed") << berlin << tokyo << false << inTokyo;
    QTest::newRow("changed, and tzset() called") << berlin << tokyo << true << inTokyo;
    QTest::newRow("the same length")
        << QByteArray("XXX-1") << QByteArray("XXX-9") << false << inTokyo;
    QTest::newRow("longer by the end") << QByteArray("XXX-1") << QByteArray("XXX-1:30") << false
                                       << QByteArray("2021-03-04 13:30:00.000");
    QTest::newRow("shorter by the end")
        << QByteArray("XXX-1:30") << QByteArray("XXX-1") << false << inBerlin;
    QTest::newRow("from empty") << QByteArray("") << tokyo << false << inTokyo;
    QTest::newRow("to empty") << berlin << QByteArray("") << false << inUtc;
    QTest::newRow("from unset") << QByteArray() << tokyo << false << inTokyo;
    QTest::newRow("long names") << longWay + "/Europe/Berlin" << longWay + "/Asia/Shanghai" << false
                                << QByteArray("2021-03-04 20:00:00.000");
    QTest::newRow("from a long name") << longWay + "/Europe/Berlin" << tokyo << false << inTokyo;
}

void tst_TorkLogStamps::stampFollowsTheTimeZone()
{
    QFETCH(QByteArray, from);
    QFETCH(QByteArray, to);
    QFETCH(bool, tellsTheLibrary);
    QFETCH(QByteArray, expected);
    LogFolder folder;
    TorkLog log;
    log.setOutputPath(folder.logs());
    folder.configure(log, {{"dateTimeFormat", stampFormat}, {"filePrefix", "app"}});
    TestClock::set(utc(QDate(2021, 3, 4), QTime(12, 0)));

    setZone(from);
    log.trace("x");
    setZone(to);
    if (tellsTheLibrary)
        tzset();
    log.trace("y");
    const QByteArray second = TestFiles::read(folder.logs() + "app.log").split('\n').value(1);
    QCOMPARE(second, expected + " Trace y");
}

// One character longer than what is kept. The zones differ in that character only, and it equals
// the first byte of the time of day, which is kept behind the zone.
void tst_TorkLogStamps::longTimeZoneIsNotKept()
{
    LogFolder folder;
    TorkLog log;
    log.setOutputPath(folder.logs());
    folder.configure(log, {{"dateTimeFormat", stampFormat}, {"filePrefix", "app"}});
    const QByteArray name = '<' + QByteArray(61, 'X') + ">-";
    TestClock::set(utc(QDate(2021, 3, 3), QTime(23, 0, 0, '2')));

    setZone(name + '1');
    log.trace("x");
    setZone(name + '2');
    log.trace("y");
    QCOMPARE(TestFiles::read(folder.logs() + "app.log"),
             QByteArray("2021-03-04 00:00:00.050 Trace x\n2021-03-04 01:00:00.050 Trace y\n"));
}

namespace {

// Two entries of one moment, with TZ unset before or after it is empty, in a system in Tokyo.
int changesToOrFromUnset(QStringList const& arguments)
{
#ifdef Q_OS_LINUX
    // A folder that only this process sees.
    if (unshare(CLONE_NEWNS) != 0 ||
        mount("none", "/", nullptr, MS_REC | MS_PRIVATE, nullptr) != 0 ||
        mount("tmpfs", "/etc", "tmpfs", 0, nullptr) != 0 ||
        symlink("/usr/share/zoneinfo/Asia/Tokyo", "/etc/localtime") != 0)
        return ChildProcess::skipped;

    TorkLog log;
    log.setOutputPath(arguments.at(0));
    log.setPreferencesFileName(arguments.at(1));
    log.loadPreferences();
    TestClock::set(utc(QDate(2021, 3, 4), QTime(12, 0)));
    const bool isUnsetFirst = arguments.at(2) == "from unset";
    setZone(isUnsetFirst ? QByteArray() : QByteArray(""));
    log.trace("x");
    setZone(isUnsetFirst ? QByteArray("") : QByteArray());
    log.trace("y");
    return 0;
#else
    Q_UNUSED(arguments)
    return ChildProcess::skipped;
#endif
}

} // namespace

// An empty TZ is UTC, wherever the system is.
void tst_TorkLogStamps::unsetTimeZoneIsTheSystems_data()
{
    QTest::addColumn<QByteArray>("expected");

    const QByteArray inTokyo("2021-03-04 21:00:00.000 Trace ");
    const QByteArray inUtc("2021-03-04 12:00:00.000 Trace ");
    QTest::newRow("from unset") << inTokyo + "x\n" + inUtc + "y\n";
    QTest::newRow("to unset") << inUtc + "x\n" + inTokyo + "y\n";
}

void tst_TorkLogStamps::unsetTimeZoneIsTheSystems()
{
    LogFolder folder;
    QVERIFY(TestFiles::write(
        folder.settingsFile(),
        LogFolder::settingsText({{"dateTimeFormat", stampFormat}, {"filePrefix", "app"}})));
    const ChildProcess::Result child =
        ChildProcess::run("unset", {folder.logs(), folder.settingsFile(), QTest::currentDataTag()});
    if (child.wasSkipped())
        QSKIP("This process cannot have a system of its own.");
    QVERIFY2(child.ended(), child.report());
    QTEST(TestFiles::read(folder.logs() + "app.log"), "expected");
}

void tst_TorkLogStamps::stampInRepeatedHour_data()
{
    QTest::addColumn<QByteArray>("zone");
    QTest::addColumn<QDateTime>("change");
    QTest::addColumn<QByteArray>("expected");

    // Standard time itself steps back, so both hours have the same zone name.
    QTest::newRow("Kazakhstan 2024")
        << QByteArray("Asia/Almaty") << utc(QDate(2024, 2, 29), QTime(18, 0))
        << QByteArray("23:59:59 23:00:00 23:30:00 23:59:59 00:00:00");
    QTest::newRow("Russia 2014") << QByteArray("Europe/Moscow")
                                 << utc(QDate(2014, 10, 25), QTime(22, 0))
                                 << QByteArray("01:59:59 01:00:00 01:30:00 01:59:59 02:00:00");
    QTest::newRow("Sudan 2017") << QByteArray("Africa/Khartoum")
                                << utc(QDate(2017, 10, 31), QTime(21, 0))
                                << QByteArray("23:59:59 23:00:00 23:30:00 23:59:59 00:00:00");
    QTest::newRow("South Sudan 2021")
        << QByteArray("Africa/Juba") << utc(QDate(2021, 1, 31), QTime(21, 0))
        << QByteArray("23:59:59 23:00:00 23:30:00 23:59:59 00:00:00");
    QTest::newRow("end of daylight saving time")
        << QByteArray("Europe/Berlin") << utc(QDate(2023, 10, 29), QTime(1, 0))
        << QByteArray("02:59:59 02:00:00 02:30:00 02:59:59 03:00:00");
}

void tst_TorkLogStamps::stampInRepeatedHour()
{
    QFETCH(QByteArray, zone);
    QFETCH(QDateTime, change);
    LogFolder folder;
    TorkLog log;
    log.setOutputPath(folder.logs());
    folder.configure(log, {{"dateTimeFormat", "hh:mm:ss"}, {"filePrefix", "app"}});

    setZone(zone);
    for (int seconds : {-1, 0, 1800, 3599, 3600}) {
        TestClock::set(change.addSecs(seconds));
        log.trace("x");
    }
    QByteArray written = TestFiles::read(folder.logs() + "app.log");
    QTEST(written.replace(" Trace x\n", " ").trimmed(), "expected");
}

void tst_TorkLogStamps::firstEntryIn1970_data()
{
    QTest::addColumn<qint64>("moment");
    QTest::addColumn<QByteArray>("zone");
    QTest::addColumn<QByteArray>("expected");

    QTest::newRow("first moment") << qint64(0) << QByteArray("Asia/Tokyo")
                                  << QByteArray("1970-01-01 09:00:00.000");
    QTest::newRow("first moment in UTC")
        << qint64(0) << QByteArray("") << QByteArray("1970-01-01 00:00:00.000");
    QTest::newRow("first minute") << qint64(59999) << QByteArray("Asia/Tokyo")
                                  << QByteArray("1970-01-01 09:00:59.999");
    QTest::newRow("just before") << qint64(-1) << QByteArray("Asia/Tokyo")
                                 << QByteArray("1970-01-01 08:59:59.999");
    QTest::newRow("the day before")
        << qint64(-86399999) << QByteArray("") << QByteArray("1969-12-31 00:00:00.001");
}

// In a process that has written nothing yet.
void tst_TorkLogStamps::firstEntryIn1970()
{
    QFETCH(qint64, moment);
    QFETCH(QByteArray, zone);
    QFETCH(QByteArray, expected);
    LogFolder folder;
    QVERIFY(TestFiles::write(
        folder.settingsFile(),
        LogFolder::settingsText(
            {{"dateTimeFormat", stampFormat}, {"logElapsedTime", "yes"}, {"filePrefix", "app"}})));
    setZone(zone);
    const ChildProcess::Result child = ChildProcess::run(
        "first entry", {folder.logs(), folder.settingsFile(), QString::number(moment)});
    QVERIFY2(child.ended(), child.report());
    QCOMPARE(TestFiles::read(folder.logs() + "app.log"), expected + " Trace dT:[0] x\n");
}

void tst_TorkLogStamps::stampInTheUsersLanguage_data()
{
    QTest::addColumn<QByteArray>("language");
    QTest::addColumn<QString>("format");
    QTest::addColumn<QByteArray>("expected"); // on a Tuesday in March and one in August

    const QString numbers("yyyy-MM-dd hh:mm:ss.zzz");
    const QString names("dddd d MMMM");
    const QByteArray plain("2021-03-02 05:06:07.008|2021-08-03 05:06:07.008");
    for (const char* language : {"de_DE", "tr_TR", "ar_EG", "fa_IR", "my_MM", "ne_NP", "mr_IN"}) {
        QTest::addRow("numbers in %s", language) << QByteArray(language) << numbers << plain;
    }
    QTest::newRow("letters of Latin-1 stay")
        << QByteArray("de_DE") << names << QByteArray("Dienstag 2 M\xE4rz|Dienstag 3 August");
    QTest::newRow("each stamp by itself")
        << QByteArray("tr_TR") << "d MMMM" << QByteArray("2 Mart|3 August");
    QTest::newRow("with a name beyond Latin-1 all names are those of the C locale")
        << QByteArray("tr_TR") << names << QByteArray("Tuesday 2 March|Tuesday 3 August");
    QTest::newRow("digits and names beyond Latin-1")
        << QByteArray("ar_EG") << names << QByteArray("Tuesday 2 March|Tuesday 3 August");
    QTest::newRow("text beyond Latin-1 in the format")
        << QByteArray("de_DE") << QString::fromUtf8("'€' MMMM") << QByteArray("? March|? August");
    QTest::newRow("last letter of Latin-1") << QByteArray("de_DE") << QString::fromUtf8("'ÿ' MMMM")
                                            << QByteArray("\xFF M\xE4rz|\xFF August");
    QTest::newRow("first letter beyond Latin-1")
        << QByteArray("de_DE") << QString::fromUtf8("'Ā' MMMM") << QByteArray("? March|? August");
    QTest::newRow("no moment in the format")
        << QByteArray("fa_IR") << "'at'" << QByteArray("at|at");
}

void tst_TorkLogStamps::stampInTheUsersLanguage()
{
    QFETCH(QByteArray, language);
    QFETCH(QString, format);
    QFETCH(QByteArray, expected);
    LogFolder folder;
    QVERIFY(TestFiles::write(
        folder.settingsFile(),
        LogFolder::settingsText({{"dateTimeFormat", format}, {"filePrefix", "app"}})));

    const QByteArray own = qgetenv("LC_ALL");
    qputenv("LC_ALL", language + ".UTF-8");
    const ChildProcess::Result child =
        ChildProcess::run("user's language", {folder.logs(), folder.settingsFile()});
    qputenv("LC_ALL", own);
    QVERIFY2(child.ended(), child.report());
    QCOMPARE(TestFiles::read(folder.logs() + "app.log"),
             expected.replace("|", " Trace x\n") + " Trace x\n");
}

// From time of day to time of day, ignoring the dates.
void tst_TorkLogStamps::elapsedTime_data()
{
    QTest::addColumn<QDateTime>("from");
    QTest::addColumn<QDateTime>("to");
    QTest::addColumn<QByteArray>("expected");

    const QDate day(2021, 3, 4);
    const QDateTime from(day, QTime(5, 6, 7, 8));
    QTest::newRow("none") << from << from << QByteArray("T Trace dT:[0] x\n");
    QTest::newRow("milliseconds") << from << from.addMSecs(250)
                                  << QByteArray("T Trace dT:[250] x\n");
    QTest::newRow("hours") << from << from.addSecs(7200) << QByteArray("T Trace dT:[7200000] x\n");
    QTest::newRow("across midnight")
        << QDateTime(day, QTime(23, 59, 59, 900)) << QDateTime(day.addDays(1), QTime(0, 0, 0, 100))
        << QByteArray("T Trace dT:[-86399800] x\n");
    QTest::newRow("nearly a whole day back")
        << QDateTime(day, QTime(23, 59, 59, 999)) << QDateTime(day.addDays(1), QTime(0, 0))
        << QByteArray("T Trace dT:[-86399999] x\n");
    QTest::newRow("a day and a second")
        << from << from.addDays(1).addSecs(1) << QByteArray("T Trace dT:[1000] x\n");
    QTest::newRow("the clock was set back")
        << from << from.addSecs(-60) << QByteArray("T Trace dT:[-60000] x\n");
}

void tst_TorkLogStamps::elapsedTime()
{
    QFETCH(QDateTime, from);
    QFETCH(QDateTime, to);
    LogFolder folder;
    TestClock::set(from);
    TorkLog log; // the first entry counts from here
    folder.prepare(log, "app");
    log.setLogElapsedTime(true);

    TestClock::set(to);
    log.trace("x");
    QTEST(TestFiles::read(folder.logs() + "app.log"), "expected");
}

// Every entry restarts the count, even one that was not written; a preformatted line does not.
void tst_TorkLogStamps::elapsedTimeBetweenEntries()
{
    LogFolder folder;
    TorkLog log;
    folder.prepare(log, "app");
    TestClock::advance(1);
    log.trace("elapsed time off");
    log.setLogElapsedTime(true);
    TestClock::advance(2);
    log.trace("a");
    TestClock::advance(4);
    log.setEnable(false);
    log.trace("log off");
    log.setEnable(true);
    TestClock::advance(8);
    log.trace("b");
    TestClock::advance(16);
    log.write(QStringLiteral("ready\n"));
    TestClock::advance(32);
    log.trace("c");
    TestClock::advance(64);
    log.close();
    log.setOutputPath(folder.root() + "missing");
    log.trace("no file");
    log.setOutputPath(folder.logs());
    TestClock::advance(128);
    log.trace("d");

    // "d" overwrote the start, because the file was reopened.
    QCOMPARE(TestFiles::read(folder.logs() + "app.log"), QByteArray("T Trace dT:[128] d\ne off\n"
                                                                    "T Trace dT:[2] a\n"
                                                                    "T Trace dT:[8] b\n"
                                                                    "ready\n"
                                                                    "T Trace dT:[48] c\n"));
}

void tst_TorkLogStamps::elapsedTimeFollowsTheTimeZone_data()
{
    QTest::addColumn<bool>("enabled"); // during the previous entry

    QTest::newRow("from entry to entry") << true;
    QTest::newRow("from an entry that is dropped") << false;
}

// Each time of day is in the zone in effect at that time.
void tst_TorkLogStamps::elapsedTimeFollowsTheTimeZone()
{
    QFETCH(bool, enabled);
    LogFolder folder;
    TorkLog log;
    folder.prepare(log, "app");
    log.setLogElapsedTime(true);
    TestClock::set(utc(QDate(2021, 3, 4), QTime(12, 0)));

    setZone("Europe/Berlin");
    log.setEnable(false);
    log.trace("dropped");
    log.setEnable(enabled);
    log.trace("x");
    log.setEnable(true);
    setZone("Asia/Tokyo");
    log.trace("y");
    QCOMPARE(TestFiles::read(folder.logs() + "app.log"),
             QByteArray(enabled ? "T Trace dT:[0] x\n" : "") + "T Trace dT:[28800000] y\n");
}

// The clocks go back by an hour between the two.
void tst_TorkLogStamps::elapsedTimeInRepeatedHour()
{
    LogFolder folder;
    TorkLog log;
    folder.prepare(log, "app");
    log.setLogElapsedTime(true);
    const QDateTime change = utc(QDate(2024, 2, 29), QTime(18, 0));

    setZone("Asia/Almaty");
    TestClock::set(change.addMSecs(-100));
    log.setEnable(false);
    log.trace("dropped");
    log.setEnable(true);
    TestClock::set(change.addMSecs(100));
    log.trace("x");
    QCOMPARE(TestFiles::read(folder.logs() + "app.log"), QByteArray("T Trace dT:[-3599800] x\n"));
}

void tst_TorkLogStamps::elapsedTimePrefix_data()
{
    QTest::addColumn<QString>("prefix");
    QTest::addColumn<QByteArray>("expected");

    QTest::newRow("text") << "after " << QByteArray("T Trace after [5] x\n");
    QTest::newRow("one blank") << " " << QByteArray("T Trace  [5] x\n");
    QTest::newRow("markers are text") << "%1%d%2" << QByteArray("T Trace %1%d%2[5] x\n");
    QTest::newRow("letters beyond Latin-1")
        << QString::fromUtf8("Δä") << QByteArray("T Trace ?\xE4[5] x\n");
}

void tst_TorkLogStamps::elapsedTimePrefix()
{
    QFETCH(QString, prefix);
    LogFolder folder;
    TorkLog log;
    log.setOutputPath(folder.logs());
    folder.configure(
        log, {{"filePrefix", "app"}, {"elapsedTimePrefix", prefix}, {"logElapsedTime", "yes"}});
    TestClock::advance(5);

    log.trace("x");
    QTEST(TestFiles::read(folder.logs() + "app.log"), "expected");
}

namespace {

// Arguments: log directory, settings file, milliseconds since the epoch.
int writesFirstEntry(QStringList const& arguments)
{
    TestClock::set(QDateTime::fromMSecsSinceEpoch(arguments.at(2).toLongLong(), Qt::UTC));
    TorkLog log(arguments.at(0));
    log.setPreferencesFileName(arguments.at(1));
    log.loadPreferences();
    log.trace("x");
    return 0;
}

// Arguments: log directory, settings file.
int writesInTheUsersLanguage(QStringList const& arguments)
{
    TorkLog log(arguments.at(0));
    log.setPreferencesFileName(arguments.at(1));
    log.loadPreferences();
    for (QDate const& day : {QDate(2021, 3, 2), QDate(2021, 8, 3)}) {
        TestClock::set(QDateTime(day, QTime(5, 6, 7, 8)));
        log.trace("x");
    }
    return 0;
}

} // namespace

int main(int argc, char** argv)
{
    return ChildProcess::main<tst_TorkLogStamps>(argc, argv,
                                                 {{"first entry", writesFirstEntry},
                                                  {"user's language", writesInTheUsersLanguage},
                                                  {"unset", changesToOrFromUnset}});
}

#include "tst_TorkLogStamps.moc"
