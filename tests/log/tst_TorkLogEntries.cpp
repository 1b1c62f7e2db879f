// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/log/TorkLog.h"
#include "log/LogFolder.h"
#include "log/PlainStamp.h"
#include "support/ChildProcess.h"
#include "support/ProcessLimits.h"
#include "support/TestClock.h"

#include <QDebug>
#include <QTranslator>
#include <QtTest>

#include <csignal>
#include <ctime>

class tst_TorkLogEntries : public QObject
{
    Q_OBJECT

private slots:
    void init();
    void cleanup();

    void loggerIsTheOneLog();
    void entry_data();
    void entry();
    void shorthands();
    void stamp_data();
    void stamp();
    void stampFollowsTheClock_data();
    void stampFollowsTheClock();
    void stampFollowsTheFormat();
    void stampAfterDroppedEntry();
    void stampFollowsTheTimeZone_data();
    void stampFollowsTheTimeZone();
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
    void readyLine_data();
    void readyLine();
    void disabled_data();
    void disabled();
    void opensAtFirstEntry();
    void reachesTheFileAtOnce();

    void severityName_data();
    void severityName();
    void severityNameIsOneBuffer();
    void entriesLeaveTheSeverityNameAlone();
    void severityNameIsTranslated();

    void messageHandler_data();
    void messageHandler();
    void messageHandlerWithoutLog();
    void toolkitMessages_data();
    void toolkitMessages();
    void fatalMessage();

    void echo_data();
    void echo();
    void echoStaysOutOfTheLog();
    void echoInstallsTheMessageHandler();
    void nothingToEcho_data();
    void nothingToEcho();
    void messageUnderTheLock_data();
    void messageUnderTheLock();
    void entryIsBuiltOutsideTheLock();

private:
    QtMessageHandler m_handler = nullptr;
    QByteArray m_zone; // null: TZ is not set
};

namespace {

// Three digits of milliseconds look the same in every Qt, however it formats a single z.
const QDateTime& now()
{
    static const QDateTime time(QDate(2021, 3, 4), QTime(5, 6, 7, 123));
    return time;
}

const char stampOfNow[] = "2021-03-04 05:06:07.123";

QDateTime utc(QDate const& date, QTime const& time)
{
    return QDateTime(date, time, Qt::UTC);
}

// Null: not set. Qt sees it at once; the C library does after tzset() only.
void setZone(QByteArray const& zone)
{
    if (zone.isNull())
        qunsetenv("TZ");
    else
        qputenv("TZ", zone);
}

// The whole moment, the same in every Qt.
const char stampFormat[] = "yyyy-MM-dd hh:mm:ss.zzz";

} // namespace

void tst_TorkLogEntries::init()
{
    m_zone = qgetenv("TZ");
    m_handler = qInstallMessageHandler(nullptr);
    qInstallMessageHandler(m_handler);
    TestClock::set(now());
}

void tst_TorkLogEntries::cleanup()
{
    TorkLog::shutdown();
    qInstallMessageHandler(m_handler);
    setZone(m_zone);
    tzset();
    TestClock::release();
}

void tst_TorkLogEntries::loggerIsTheOneLog()
{
    QVERIFY(!TorkLog::logger());
    LogFolder folder;
    TorkLog* const log = TorkLog::initialize(folder.logs(), "app", QString(), true);
    QVERIFY(log);
    QCOMPARE(TorkLog::logger(), log);
    QCOMPARE(TorkLog::m_gLog, log);
}

void tst_TorkLogEntries::entry_data()
{
    QTest::addColumn<int>("severity");
    QTest::addColumn<QString>("message");
    QTest::addColumn<bool>("elapsedTime");
    QTest::addColumn<QByteArray>("expected");

    QTest::newRow("trace") << 0 << "x" << false << QByteArray("T Trace x\n");
    QTest::newRow("notification") << 1 << "x" << false << QByteArray("T Notification x\n");
    QTest::newRow("warning") << 2 << "x" << false << QByteArray("T Warning x\n");
    QTest::newRow("error") << 3 << "x" << false << QByteArray("T Error x\n");
    QTest::newRow("fatal") << 4 << "x" << false << QByteArray("T Fatal x\n");
    QTest::newRow("unknown severity has no name") << 7 << "x" << false << QByteArray("T  x\n");
    QTest::newRow("just behind the last severity") << 5 << "x" << false << QByteArray("T  x\n");
    QTest::newRow("negative severity") << -1 << "x" << false << QByteArray("T  x\n");
    QTest::newRow("elapsed time") << 2 << "x" << true << QByteArray("T Warning dT:[0] x\n");
    QTest::newRow("elapsed time, unknown severity")
        << 7 << "x" << true << QByteArray("T  dT:[0] x\n");
    QTest::newRow("empty message") << 0 << "" << false << QByteArray("T Trace \n");
    QTest::newRow("null message") << 0 << QString() << false << QByteArray("T Trace \n");
    QTest::newRow("empty message, elapsed time")
        << 0 << "" << true << QByteArray("T Trace dT:[0] \n");
    QTest::newRow("blanks are kept") << 0 << "  x  " << false << QByteArray("T Trace   x  \n");
    QTest::newRow("line ends are kept") << 0 << "a\nb\r\n"
                                        << false << QByteArray("T Trace a\nb\r\n\n");
    QTest::newRow("null character")
        << 0 << QString::fromLatin1("a\0b", 3) << false << QByteArray("T Trace a\0b\n", 12);
    QTest::newRow("markers are text")
        << 0 << "%1 %2 %d %s %n%%" << true << QByteArray("T Trace dT:[0] %1 %2 %d %s %n%%\n");
    QTest::newRow("Latin-1 letters")
        << 0 << QString::fromUtf8("Äöü ÿ") << false << QByteArray("T Trace \xC4\xF6\xFC \xFF\n");
    QTest::newRow("letters beyond Latin-1")
        << 0 << QString::fromUtf8("Ā€日 x") << false << QByteArray("T Trace ??? x\n");
    QTest::newRow("beyond the first plane, one for each half")
        << 0 << QString::fromUtf8("😀") << false << QByteArray("T Trace ??\n");
    QTest::newRow("long") << 0 << QString(100000, 'x') << false
                          << QByteArray("T Trace " + QByteArray(100000, 'x') + '\n');
}

void tst_TorkLogEntries::entry()
{
    QFETCH(int, severity);
    QFETCH(QString, message);
    QFETCH(bool, elapsedTime);
    LogFolder folder;
    TorkLog log;
    folder.prepare(log, "app");
    log.setLogElapsedTime(elapsedTime);

    log.write(severity, message);
    QTEST(TestFiles::read(folder.logs() + "app.log"), "expected");
}

void tst_TorkLogEntries::shorthands()
{
    LogFolder folder;
    TorkLog log;
    folder.prepare(log, "app");
    log.trace("a");
    log.warning("b");
    log.error("c");
    log.fatal("d");

    QCOMPARE(TestFiles::read(folder.logs() + "app.log"),
             QByteArray("T Trace a\nT Warning b\nT Error c\nT Fatal d\n"));
}

void tst_TorkLogEntries::stamp_data()
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

void tst_TorkLogEntries::stamp()
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

void tst_TorkLogEntries::stampFollowsTheClock_data()
{
    QTest::addColumn<QString>("format");

    QTest::newRow("usual") << "yyyy-MM-dd hh:mm:ss.z";
    QTest::newRow("three digits of milliseconds") << "dd.MM.yyyy HH:mm:ss,zzz";
    QTest::newRow("two digits of milliseconds are none") << "ss.zz";
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

// What is kept from one entry to the next is what Qt would say again.
void tst_TorkLogEntries::stampFollowsTheClock()
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

// At one and the same moment, lest a stamp that was made for another format is used again.
void tst_TorkLogEntries::stampFollowsTheFormat()
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

// A dropped entry moves the time of the last entry only.
void tst_TorkLogEntries::stampAfterDroppedEntry()
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

void tst_TorkLogEntries::stampFollowsTheTimeZone_data()
{
    QTest::addColumn<QByteArray>("from");
    QTest::addColumn<QByteArray>("to");
    QTest::addColumn<bool>("tellsTheLibrary");
    QTest::addColumn<QByteArray>("expected");

    const QByteArray berlin("Europe/Berlin");
    const QByteArray tokyo("Asia/Tokyo");
    // Longer than what is kept, and the same up to there.
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

void tst_TorkLogEntries::stampFollowsTheTimeZone()
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

void tst_TorkLogEntries::stampInRepeatedHour_data()
{
    QTest::addColumn<QByteArray>("zone");
    QTest::addColumn<QDateTime>("change");
    QTest::addColumn<QByteArray>("expected");

    // Standard time itself steps back, so that both hours are called the same.
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

void tst_TorkLogEntries::stampInRepeatedHour()
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

void tst_TorkLogEntries::firstEntryIn1970_data()
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
void tst_TorkLogEntries::firstEntryIn1970()
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

void tst_TorkLogEntries::stampInTheUsersLanguage_data()
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
    QTest::newRow("no moment in the format")
        << QByteArray("fa_IR") << "'at'" << QByteArray("at|at");
}

void tst_TorkLogEntries::stampInTheUsersLanguage()
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

// From time of day to time of day, whatever the dates.
void tst_TorkLogEntries::elapsedTime_data()
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
    QTest::newRow("the clock was put back")
        << from << from.addSecs(-60) << QByteArray("T Trace dT:[-60000] x\n");
}

void tst_TorkLogEntries::elapsedTime()
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

// Every entry restarts the count, also one that was not written; a ready line is none.
void tst_TorkLogEntries::elapsedTimeBetweenEntries()
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

    // "d" was written over the start, as the file was opened anew.
    QCOMPARE(TestFiles::read(folder.logs() + "app.log"), QByteArray("T Trace dT:[128] d\ne off\n"
                                                                    "T Trace dT:[2] a\n"
                                                                    "T Trace dT:[8] b\n"
                                                                    "ready\n"
                                                                    "T Trace dT:[48] c\n"));
}

void tst_TorkLogEntries::elapsedTimeFollowsTheTimeZone_data()
{
    QTest::addColumn<bool>("enabled"); // while the entry before is written

    QTest::newRow("from entry to entry") << true;
    QTest::newRow("from an entry that is dropped") << false;
}

// Each time of day is that of the zone in force then.
void tst_TorkLogEntries::elapsedTimeFollowsTheTimeZone()
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
void tst_TorkLogEntries::elapsedTimeInRepeatedHour()
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

void tst_TorkLogEntries::elapsedTimePrefix_data()
{
    QTest::addColumn<QString>("prefix");
    QTest::addColumn<QByteArray>("expected");

    QTest::newRow("text") << "after " << QByteArray("T Trace after [5] x\n");
    QTest::newRow("one blank") << " " << QByteArray("T Trace  [5] x\n");
    QTest::newRow("markers are text") << "%1%d%2" << QByteArray("T Trace %1%d%2[5] x\n");
    QTest::newRow("letters beyond Latin-1")
        << QString::fromUtf8("Δä") << QByteArray("T Trace ?\xE4[5] x\n");
}

void tst_TorkLogEntries::elapsedTimePrefix()
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

void tst_TorkLogEntries::readyLine_data()
{
    QTest::addColumn<QString>("line");
    QTest::addColumn<QByteArray>("expected");

    QTest::newRow("as it is") << "any text\n" << QByteArray("any text\n");
    QTest::newRow("without its end") << "any text" << QByteArray("any text");
    QTest::newRow("empty") << "" << QByteArray();
    QTest::newRow("beyond Latin-1") << QString::fromUtf8("ä€😀\n") << QByteArray("\xE4???\n");
}

void tst_TorkLogEntries::readyLine()
{
    QFETCH(QString, line);
    LogFolder folder;
    TorkLog log;
    folder.prepare(log, "app");

    log.write(line);
    QTEST(TestFiles::read(folder.logs() + "app.log"), "expected");
}

void tst_TorkLogEntries::disabled_data()
{
    QTest::addColumn<bool>("ready");

    QTest::newRow("entry") << false;
    QTest::newRow("ready line") << true;
}

void tst_TorkLogEntries::disabled()
{
    QFETCH(bool, ready);
    LogFolder folder;
    TorkLog log;
    folder.prepare(log, "app");
    const auto write = [&](const char* text) {
        if (ready)
            log.write(QString("T Trace %1\n").arg(text));
        else
            log.trace(text);
    };

    log.setEnable(false);
    write("a");
    QCOMPARE(folder.listing(), QStringList());
    log.setEnable(true);
    write("b");
    log.setEnable(false);
    write("c");
    QCOMPARE(folder.listing(), QStringList("app.log: T Trace b\n"));
}

void tst_TorkLogEntries::opensAtFirstEntry()
{
    LogFolder folder;
    TorkLog log;
    folder.prepare(log, "app");
    QCOMPARE(folder.listing(), QStringList());
    QCOMPARE(log.close(), false);
    log.trace("x");
    QCOMPARE(log.close(), true);
}

void tst_TorkLogEntries::reachesTheFileAtOnce()
{
    LogFolder folder;
    TorkLog log;
    folder.prepare(log, "app");
    log.trace("1");
    QCOMPARE(folder.listing(), QStringList("app.log: T Trace 1\n"));
    log.trace("2");
    QCOMPARE(folder.listing(), QStringList("app.log: T Trace 1\nT Trace 2\n"));
}

void tst_TorkLogEntries::severityName_data()
{
    QTest::addColumn<int>("severity");
    QTest::addColumn<QString>("name");

    QTest::newRow("0") << 0 << "Trace";
    QTest::newRow("1") << 1 << "Notification";
    QTest::newRow("2") << 2 << "Warning";
    QTest::newRow("3") << 3 << "Error";
    QTest::newRow("4") << 4 << "Fatal";
    QTest::newRow("behind the last") << 5 << "";
    QTest::newRow("far behind") << 2147483647 << "";
    QTest::newRow("negative") << -1 << "";
}

void tst_TorkLogEntries::severityName()
{
    QFETCH(int, severity);
    TorkLog log;
    QTEST(log.severityName(static_cast<TorkLog::EventSeverity>(severity)), "name");
}

void tst_TorkLogEntries::severityNameIsOneBuffer()
{
    TorkLog log;
    QString& name = log.severityName(TorkLog::Fatal);
    QCOMPARE(name, QString("Fatal"));
    QCOMPARE(&log.severityName(TorkLog::Trace), &name);
    QCOMPARE(name, QString("Trace"));
    log.severityName(TorkLog::EventSeverity(9));
    QCOMPARE(name, QString(""));
}

void tst_TorkLogEntries::entriesLeaveTheSeverityNameAlone()
{
    LogFolder folder;
    TorkLog log;
    folder.prepare(log, "app");
    QString& name = log.severityName(TorkLog::Fatal);

    log.warning("x");
    QCOMPARE(name, QString("Fatal"));
    QCOMPARE(folder.listing(), QStringList("app.log: T Warning x\n"));
}

namespace {

class Translator : public QTranslator
{
public:
    QString translate(const char* context, const char* source, const char* disambiguation,
                      int number) const override
    {
        if (qstrcmp(source, "Warning") != 0)
            return QString();
        asked = QString("%1/%2/%3").arg(context, disambiguation ? "some" : "none").arg(number);
        return QStringLiteral("Achtung");
    }
    bool isEmpty() const override { return false; }

    mutable QString asked;
};

} // namespace

void tst_TorkLogEntries::severityNameIsTranslated()
{
    LogFolder folder;
    TorkLog log;
    folder.prepare(log, "app");
    Translator translator;
    QCoreApplication::installTranslator(&translator);

    QCOMPARE(log.severityName(TorkLog::Warning), QString("Achtung"));
    QCOMPARE(translator.asked, QString("QObject/none/-1"));
    QCOMPARE(log.severityName(TorkLog::Error), QString("Error"));
    log.warning("x");
    QCOMPARE(folder.listing(), QStringList("app.log: T Achtung x\n"));
    QCoreApplication::removeTranslator(&translator);
}

void tst_TorkLogEntries::messageHandler_data()
{
    QTest::addColumn<int>("type");
    QTest::addColumn<QByteArray>("expected");

    QTest::newRow("debug") << int(QtDebugMsg) << QByteArray("Trace");
    QTest::newRow("info") << int(QtInfoMsg) << QByteArray("Trace");
    QTest::newRow("warning") << int(QtWarningMsg) << QByteArray("Warning");
    QTest::newRow("critical") << int(QtCriticalMsg) << QByteArray("Error");
    QTest::newRow("fatal does not abort by itself") << int(QtFatalMsg) << QByteArray("Fatal");
    QTest::newRow("any other") << 7 << QByteArray("Trace");
}

// Whatever the context: it is not used.
void tst_TorkLogEntries::messageHandler()
{
    QFETCH(int, type);
    QFETCH(QByteArray, expected);
    LogFolder folder;
    TorkLog::initialize(folder.logs(), "app", QString(), true);

    const QMessageLogContext none;
    const QMessageLogContext some("file.cpp", 7, "void f()", "some.category");
    TorkLog_MessageHandler(static_cast<QtMsgType>(type), none, QStringLiteral("x"));
    TorkLog_MessageHandler(static_cast<QtMsgType>(type), some, QStringLiteral("y %1"));
    const QByteArray start = QByteArray(stampOfNow) + ' ' + expected;
    QCOMPARE(TestFiles::read(folder.logs() + "app.log"), start + " x\n" + start + " y %1\n");
}

void tst_TorkLogEntries::messageHandlerWithoutLog()
{
    LogFolder folder;
    QVERIFY(QDir::setCurrent(folder.root()));
    TorkLog_MessageHandler(QtWarningMsg, QMessageLogContext(), QStringLiteral("lost"));
    QCOMPARE(TestFiles::listing(folder.root()), QStringList("logs/"));
    QVERIFY(QDir::setCurrent("/"));
}

void tst_TorkLogEntries::toolkitMessages_data()
{
    QTest::addColumn<int>("type");
    QTest::addColumn<QByteArray>("expected");

    QTest::newRow("debug stream") << 0 << QByteArray("Trace a \"b\\n\" 3");
    QTest::newRow("debug text") << 1 << QByteArray("Trace a 3");
    QTest::newRow("info") << 2 << QByteArray("Trace a");
    QTest::newRow("warning") << 3 << QByteArray("Warning a");
    QTest::newRow("critical") << 4 << QByteArray("Error a");
    QTest::newRow("of the toolkit itself")
        << 5 << QByteArray("Warning QDir::mkpath: Empty or null file name");
}

void tst_TorkLogEntries::toolkitMessages()
{
    QFETCH(int, type);
    QFETCH(QByteArray, expected);
    LogFolder folder;
    TorkLog::initialize(folder.logs(), "app", QString(), true);

    if (type == 0)
        qDebug() << "a" << QString("b\n") << 3;
    else if (type == 1)
        qDebug("a %d", 3);
    else if (type == 2)
        qInfo("a");
    else if (type == 3)
        qWarning("a");
    else if (type == 4)
        qCritical("a");
    else
        QDir().mkpath(QString());
    QCOMPARE(TestFiles::read(folder.logs() + "app.log"),
             QByteArray(stampOfNow) + ' ' + expected + '\n');
}

namespace {

// Cases for a process of their own; the first argument is the log directory.

TorkLog* startLog(QString const& path)
{
    TestClock::set(now());
    return TorkLog::initialize(path, QStringLiteral("app"), QString(), true);
}

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

int endsFatally(QStringList const& arguments)
{
    ProcessLimits::leaveNoCoreFile();
    startLog(arguments.at(0));
    qFatal("the end");
    return 0;
}

int echoes(QStringList const& arguments)
{
    TorkLog* const log = startLog(arguments.at(0));
    log->setLogPipeToConsole(true);
    if (arguments.at(1) == "ready")
        log->write(arguments.at(2));
    else
        log->warning(arguments.at(2));
    return 0;
}

int echoesMessages(QStringList const& arguments)
{
    TorkLog* const log = startLog(arguments.at(0));
    log->setLogPipeToConsole(true);
    log->trace("entry");
    qWarning("message");
    log->setLogPipeToConsole(false);
    qWarning("not echoed");
    return 0;
}

int echoesOfAnotherLog(QStringList const& arguments)
{
    TorkLog log(arguments.at(0));
    log.setEnable(true);
    log.setLogPipeToConsole(true);
    log.write(QStringLiteral("x\n"));
    const QtMessageHandler installed = qInstallMessageHandler(nullptr);
    return installed == TorkLog_MessageHandler ? 0 : 1;
}

int echoesNothing(QStringList const& arguments)
{
    TorkLog* const log = startLog(arguments.at(0));
    if (arguments.at(1) == "switched off") {
        log->setLogPipeToConsole(false);
    } else if (arguments.at(1) == "log off") {
        log->setLogPipeToConsole(true);
        log->setEnable(false);
    } else {
        log->setLogPipeToConsole(true);
        log->setOutputPath(arguments.at(0) + "missing/without/slash");
    }
    log->warning("x");
    return 0;
}

// The toolkit complains about the empty path while the log's own lock is held.
int warnsUnderTheLock(QStringList const& arguments)
{
    TorkLog* const log = startLog(arguments.at(0));
    log->setLogPipeToConsole(arguments.at(1) == "echo");
    log->setOutputPath(QString());
    if (arguments.at(1) == "message")
        qWarning("x");
    else
        log->warning("x");
    log->setLogPipeToConsole(false);
    qWarning("later");
    return 0;
}

class TalkingTranslator : public QTranslator
{
public:
    QString translate(const char*, const char*, const char*, int) const override
    {
        if (!m_asked) {
            m_asked = true;
            qDebug("asked for a translation");
        }
        return QString();
    }
    bool isEmpty() const override { return false; }

private:
    mutable bool m_asked = false;
};

int talksWhileAnEntryIsBuilt(QStringList const& arguments)
{
    TorkLog* const log = startLog(arguments.at(0));
    TalkingTranslator translator;
    QCoreApplication::installTranslator(&translator);
    log->warning("x");
    QCoreApplication::removeTranslator(&translator);
    return 0;
}

QByteArray stamped(const char* text)
{
    return QByteArray(stampOfNow) + ' ' + text;
}

} // namespace

void tst_TorkLogEntries::fatalMessage()
{
    LogFolder folder;
    const ChildProcess::Result child = ChildProcess::run("fatal", {folder.logs()});
    QVERIFY2(child.inTime && child.crashed, child.report());
    QCOMPARE(child.exitCode, SIGABRT);
    QCOMPARE(TestFiles::read(folder.logs() + "app.log"), stamped("Fatal the end\n"));
}

void tst_TorkLogEntries::echo_data()
{
    QTest::addColumn<QString>("kind");
    QTest::addColumn<QString>("text");
    QTest::addColumn<QByteArray>("echoed");
    QTest::addColumn<QByteArray>("written");

    QTest::newRow("entry is quoted, its line end escaped")
        << "entry"
        << "x" << '"' + stamped("Warning x\\n\"\n") << stamped("Warning x\n");
    QTest::newRow("quotes and backslashes are escaped")
        << "entry"
        << "a \"b\" \\" << '"' + stamped("Warning a \\\"b\\\" \\\\\\n\"\n")
        << stamped("Warning a \"b\" \\\n");
    QTest::newRow("letters beyond Latin-1 are echoed")
        << "entry" << QString::fromUtf8("ä€") << '"' + stamped("Warning ä€\\n\"\n")
        << stamped("Warning \xE4?\n");
    QTest::newRow("ready line") << "ready"
                                << "x" << QByteArray("\"x\"\n") << QByteArray("x");
    QTest::newRow("markers are text")
        << "ready"
        << "%1 %{type} %s" << QByteArray("\"%1 %{type} %s\"\n") << QByteArray("%1 %{type} %s");
}

void tst_TorkLogEntries::echo()
{
    QFETCH(QString, kind);
    QFETCH(QString, text);
    LogFolder folder;
    const ChildProcess::Result child = ChildProcess::run("echo", {folder.logs(), kind, text});
    QVERIFY2(child.ended(), child.report());
    QTEST(child.errors, "echoed");
    QCOMPARE(child.output, QByteArray());
    QTEST(TestFiles::read(folder.logs() + "app.log"), "written");
}

void tst_TorkLogEntries::echoStaysOutOfTheLog()
{
    LogFolder folder;
    const ChildProcess::Result child = ChildProcess::run("echo of messages", {folder.logs()});
    QVERIFY2(child.ended(), child.report());
    QCOMPARE(child.errors,
             '"' + stamped("Trace entry\\n\"\n") + '"' + stamped("Warning message\\n\"\n"));
    QCOMPARE(TestFiles::read(folder.logs() + "app.log"), stamped("Trace entry\n") +
                                                             stamped("Warning message\n") +
                                                             stamped("Warning not echoed\n"));
}

// Also where it was not installed before: that is how the toolkit's messages find back.
void tst_TorkLogEntries::echoInstallsTheMessageHandler()
{
    LogFolder folder;
    const ChildProcess::Result child = ChildProcess::run("echo of another log", {folder.logs()});
    QVERIFY2(child.ended(), child.report());
    QCOMPARE(child.errors, QByteArray("\"x\\n\"\n"));
}

void tst_TorkLogEntries::nothingToEcho_data()
{
    QTest::addColumn<QString>("reason");

    QTest::newRow("switched off") << "switched off";
    QTest::newRow("log off") << "log off";
    QTest::newRow("no file") << "no file";
}

void tst_TorkLogEntries::nothingToEcho()
{
    QFETCH(QString, reason);
    LogFolder folder;
    const ChildProcess::Result child = ChildProcess::run("no echo", {folder.logs(), reason});
    QVERIFY2(child.ended(), child.report());
    QCOMPARE(child.errors, QByteArray());
    QCOMPARE(child.output, QByteArray());
}

void tst_TorkLogEntries::messageUnderTheLock_data()
{
    QTest::addColumn<QString>("kind");
    QTest::addColumn<QByteArray>("errors");

    const QByteArray complaint = "QDir::mkpath: Empty or null file name\n";
    QTest::newRow("entry") << "entry" << complaint;
    QTest::newRow("message") << "message" << complaint;
    QTest::newRow("entry with echo") << "echo" << complaint + '"' + stamped("Warning x\\n\"\n");
}

// It goes to the toolkit's default output, once, and the entry is written.
void tst_TorkLogEntries::messageUnderTheLock()
{
    QFETCH(QString, kind);
    LogFolder folder;
    QVERIFY(QDir(folder.root()).mkdir("work"));
    const ChildProcess::Result child =
        ChildProcess::run("message under the lock", {folder.logs(), kind}, folder.root() + "work");
    QVERIFY2(child.ended(), child.report());
    QTEST(child.errors, "errors");
    QCOMPARE(TestFiles::listing(folder.root() + "work"),
             QStringList("app.log: " + stamped("Warning x\n") + stamped("Warning later\n")));
}

// A message that is raised there is an entry like any other.
void tst_TorkLogEntries::entryIsBuiltOutsideTheLock()
{
    LogFolder folder;
    const ChildProcess::Result child =
        ChildProcess::run("message of a translator", {folder.logs()});
    QVERIFY2(child.ended(), child.report());
    QCOMPARE(child.errors, QByteArray());
    QCOMPARE(TestFiles::read(folder.logs() + "app.log"),
             stamped("Trace asked for a translation\n") + stamped("Warning x\n"));
}

int main(int argc, char** argv)
{
    return ChildProcess::main<tst_TorkLogEntries>(
        argc, argv,
        {{"first entry", writesFirstEntry},
         {"user's language", writesInTheUsersLanguage},
         {"fatal", endsFatally},
         {"echo", echoes},
         {"echo of messages", echoesMessages},
         {"echo of another log", echoesOfAnotherLog},
         {"no echo", echoesNothing},
         {"message under the lock", warnsUnderTheLock},
         {"message of a translator", talksWhileAnEntryIsBuilt}});
}

#include "tst_TorkLogEntries.moc"
