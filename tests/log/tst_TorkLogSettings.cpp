// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/log/TorkLog.h"
#include "log/LogFolder.h"
#include "log/PlainStamp.h"
#include "support/PrivateField.h"
#include "support/TestClock.h"

#include <QtTest>

#include <type_traits>

class tst_TorkLogSettings : public QObject
{
    Q_OBJECT

private slots:
    void cleanup();

    void isAnObjectWithoutParent();
    void defaults();
    void defaultTextsAreEmptyNotNull();
    void defaultEntry();
    void constructorSetsPath();
    void clearRestoresDefaults();
    void clearKeepsFileOpen();
    void clearKeepsTimeOfLastEntry();
    void consoleSwitchIsInert();
    void switches_data();
    void switches();
    void outputPath_data();
    void outputPath();
    void setMaxLogFiles_data();
    void setMaxLogFiles();
    void setMaxLogFileSize_data();
    void setMaxLogFileSize();
    void settersLeaveSettingsFile();
    void enumerationsTakeAnyNumber();
};

PRIVATE_FIELD(Spare, TorkLog, QString, m_spare);
PRIVATE_FIELD(PreferencesFileName, TorkLog, QString, m_preferencesFileName);

void tst_TorkLogSettings::cleanup()
{
    TestClock::release();
}

void tst_TorkLogSettings::isAnObjectWithoutParent()
{
    static_assert(std::is_base_of<QObject, TorkLog>::value, "has a meta object");
    static_assert(std::has_virtual_destructor<TorkLog>::value, "deleted through its base");

    TorkLog log;
    TorkLog logWithPath(QStringLiteral("/x/"));
    QCOMPARE(log.metaObject()->className(), "TorkLog");
    QVERIFY(!log.parent());
    QVERIFY(!logWithPath.parent());
}

void tst_TorkLogSettings::defaults()
{
    TorkLog log;
    QCOMPARE(log.path(), QString());
    QCOMPARE(log.maxLogFiles(), 10u);
    QCOMPARE(log.maxLogFileSize(), 1000000u);
    QCOMPARE(log.enabled(), false);
    QCOMPARE(log.logElapsedTime(), false);
    QCOMPARE(log.logPipeToConsole(), false);
    QCOMPARE(log.errorString(), QString());
    QCOMPARE(log.havePreferencesFile(), false);
    QCOMPARE(log.close(), false);
    // An empty prefix and the extension "log".
    QCOMPARE(log.fileSpec(false), QString(".log"));
}

void tst_TorkLogSettings::defaultTextsAreEmptyNotNull()
{
    TorkLog log;
    QVERIFY(!log.path().isNull());
    QVERIFY(!log.errorString().isNull());
    QVERIFY(!(log.*privateField(Spare())).isNull());
    QCOMPARE(log.*privateField(Spare()), QString(""));
    QVERIFY(!(log.*privateField(PreferencesFileName())).isNull());
    QCOMPARE(log.*privateField(PreferencesFileName()), QString(""));
}

// The date format, the elapsed time's prefix and its switch as they are before any settings file.
void tst_TorkLogSettings::defaultEntry()
{
    const QDateTime time(QDate(2021, 3, 4), QTime(5, 6, 7, 89));
    TestClock::set(time);
    LogFolder folder;
    TorkLog log(folder.logs());
    log.setEnable(true);

    log.trace("first");
    log.setLogElapsedTime(true);
    log.trace("second");

    const QString stamp = plainStamp(time, "yyyy-MM-dd hh:mm:ss.z");
    QCOMPARE(folder.listing(),
             QStringList(".log: " + stamp + " Trace first\n" + stamp + " Trace dT:[0] second\n"));
}

void tst_TorkLogSettings::constructorSetsPath()
{
    TorkLog log(QStringLiteral("/x/logs"));
    QCOMPARE(log.path(), QString("/x/logs"));
    QCOMPARE(log.maxLogFiles(), 10u);
    QCOMPARE(log.maxLogFileSize(), 1000000u);
    QCOMPARE(log.enabled(), false);
}

void tst_TorkLogSettings::clearRestoresDefaults()
{
    const QDateTime time(QDate(2021, 3, 4), QTime(5, 6, 7, 89));
    TestClock::set(time);
    LogFolder folder;
    TorkLog log(folder.root() + "nowhere");
    folder.configure(log, {{"filePrefix", "other"},
                           {"maxLogFiles", "3"},
                           {"maxLogFileSize", "77"},
                           {"elapsedTimePrefix", "+"},
                           {"logElapsedTime", "yes"},
                           {"logPipeToConsole", "yes"}});
    QVERIFY(log.enabled());
    QVERIFY(!log.open(folder.root() + "nowhere/x.log"));
    QVERIFY(!log.errorString().isEmpty());

    log.clear();
    QCOMPARE(log.path(), QString());
    QCOMPARE(log.maxLogFiles(), 10u);
    QCOMPARE(log.maxLogFileSize(), 1000000u);
    QCOMPARE(log.enabled(), false);
    QCOMPARE(log.logElapsedTime(), false);
    QCOMPARE(log.logPipeToConsole(), false);
    QCOMPARE(log.errorString(), QString());
    QCOMPARE(log.havePreferencesFile(), false);
    QCOMPARE(log.fileSpec(false), QString(".log"));

    log.setOutputPath(folder.logs());
    log.setEnable(true);
    log.setLogElapsedTime(true);
    log.trace("x");
    QCOMPARE(folder.listing(), QStringList(".log: " + plainStamp(time, "yyyy-MM-dd hh:mm:ss.z") +
                                           " Trace dT:[0] x\n"));
}

void tst_TorkLogSettings::clearKeepsFileOpen()
{
    LogFolder folder;
    TorkLog log;
    QVERIFY(log.open(folder.logs() + "open.log"));

    log.clear();
    log.setEnable(true);
    log.write(QStringLiteral("still here\n"));
    QCOMPARE(folder.listing(), QStringList("open.log: still here\n"));
    QVERIFY(log.close());
}

void tst_TorkLogSettings::clearKeepsTimeOfLastEntry()
{
    TestClock::set(QDateTime(QDate(2021, 3, 4), QTime(5, 6, 7)));
    LogFolder folder;
    TorkLog log;
    TestClock::advance(40);

    log.clear();
    folder.prepare(log, "app");
    log.setLogElapsedTime(true);
    log.trace("x");
    QCOMPARE(folder.listing(), QStringList("app.log: T Trace dT:[40] x\n"));
}

// The key is known, but it is neither loaded nor saved, and produces no console output.
void tst_TorkLogSettings::consoleSwitchIsInert()
{
    LogFolder folder;
    TorkLog log;
    folder.configure(log, {{"outputToConsole", "yes"}, {"filePrefix", "app"}});
    QCOMPARE(log.logPipeToConsole(), false);

    QVERIFY(log.savePreferences());
    QVERIFY(!TestFiles::read(folder.settingsFile()).contains("outputToConsole"));
}

void tst_TorkLogSettings::switches_data()
{
    QTest::addColumn<QString>("changed");

    QTest::newRow("logging") << "enabled";
    QTest::newRow("elapsed time") << "elapsed";
    QTest::newRow("echo") << "pipe";
}

void tst_TorkLogSettings::switches()
{
    QFETCH(QString, changed);
    TorkLog log;
    const auto set = [&](bool on) {
        if (changed == "enabled")
            log.setEnable(on);
        else if (changed == "elapsed")
            log.setLogElapsedTime(on);
        else
            log.setLogPipeToConsole(on);
    };

    set(true);
    QCOMPARE(log.enabled(), changed == "enabled");
    QCOMPARE(log.logElapsedTime(), changed == "elapsed");
    QCOMPARE(log.logPipeToConsole(), changed == "pipe");

    set(false);
    QCOMPARE(log.enabled(), false);
    QCOMPARE(log.logElapsedTime(), false);
    QCOMPARE(log.logPipeToConsole(), false);
}

void tst_TorkLogSettings::outputPath_data()
{
    QTest::addColumn<QString>("path");

    QTest::newRow("with a final slash") << "/x/logs/";
    QTest::newRow("without one") << "/x/logs";
    QTest::newRow("empty") << "";
    QTest::newRow("not cleaned") << "/x/../y//./";
    QTest::newRow("blanks and letters beyond ASCII") << QString::fromUtf8("/mein Büro/日誌/");
}

void tst_TorkLogSettings::outputPath()
{
    QFETCH(QString, path);
    TorkLog log(QStringLiteral("/before/"));
    log.setOutputPath(path);
    QCOMPARE(log.path(), path);
}

void tst_TorkLogSettings::setMaxLogFiles_data()
{
    QTest::addColumn<QString>("stored");
    QTest::addColumn<unsigned int>("given");
    QTest::addColumn<unsigned int>("expected");

    QTest::newRow("an ordinary number") << "10" << 5u << 5u;
    QTest::newRow("one") << "10" << 1u << 1u;
    QTest::newRow("zero becomes two") << "10" << 0u << 2u;
    QTest::newRow("zero becomes two above the cap too") << "500" << 0u << 2u;
    QTest::newRow("the cap does not look at the new number") << "10" << 500u << 500u;
    QTest::newRow("the highest number") << "10" << 4294967295u << 4294967295u;
    QTest::newRow("the cap looks at the stored number") << "500" << 7u << 100u;
    QTest::newRow("a large number after a large one") << "500" << 600u << 100u;
    QTest::newRow("a hundred stored is not above the cap") << "100" << 500u << 500u;
    QTest::newRow("a hundred and one stored is") << "101" << 5u << 100u;
    QTest::newRow("a wrapped negative number stored is") << "-1" << 5u << 100u;
    QTest::newRow("none stored") << "0" << 8u << 8u;
}

void tst_TorkLogSettings::setMaxLogFiles()
{
    QFETCH(QString, stored);
    QFETCH(unsigned int, given);
    QFETCH(unsigned int, expected);
    LogFolder folder;
    TorkLog log;
    folder.configure(log, {{"maxLogFiles", stored}});

    log.setMaxLogFiles(given);
    QCOMPARE(log.maxLogFiles(), expected);
}

void tst_TorkLogSettings::setMaxLogFileSize_data()
{
    QTest::addColumn<QString>("stored");
    QTest::addColumn<unsigned int>("given");
    QTest::addColumn<unsigned int>("expected");

    QTest::newRow("nothing") << "1000000" << 0u << 2048u;
    QTest::newRow("small") << "1000000" << 100u << 2048u;
    QTest::newRow("just below the bound") << "1000000" << 2047u << 2048u;
    QTest::newRow("at the bound nothing is stored") << "1000000" << 2048u << 1000000u;
    QTest::newRow("above the bound nothing is stored") << "1000000" << 2049u << 1000000u;
    QTest::newRow("large") << "1000000" << 4294967295u << 1000000u;
    QTest::newRow("large over a smaller one") << "5000" << 9000u << 5000u;
    QTest::newRow("large over one below the bound") << "7" << 9000u << 7u;
    QTest::newRow("small over one below the bound") << "7" << 9u << 2048u;
}

void tst_TorkLogSettings::setMaxLogFileSize()
{
    QFETCH(QString, stored);
    QFETCH(unsigned int, given);
    QFETCH(unsigned int, expected);
    LogFolder folder;
    TorkLog log;
    folder.configure(log, {{"maxLogFileSize", stored}});

    log.setMaxLogFileSize(given);
    QCOMPARE(log.maxLogFileSize(), expected);
}

void tst_TorkLogSettings::settersLeaveSettingsFile()
{
    LogFolder folder;
    TorkLog log;
    folder.prepare(log, "app");
    const QByteArray before = TestFiles::read(folder.settingsFile());

    log.setEnable(false);
    log.setLogElapsedTime(true);
    log.setLogPipeToConsole(true);
    log.setMaxLogFiles(3);
    log.setMaxLogFileSize(1);
    log.setOutputPath(folder.root());
    QCOMPARE(TestFiles::read(folder.settingsFile()), before);
}

// Only an enumeration with a fixed underlying type may have a value without a name.
void tst_TorkLogSettings::enumerationsTakeAnyNumber()
{
    const TorkLog::EventSeverity severity{7};
    const TorkLog::PreferencesOperation operation{2};
    QCOMPARE(int(severity), 7);
    QCOMPARE(int(operation), 2);
    QCOMPARE(int(TorkLog::Trace), 0);
    QCOMPARE(int(TorkLog::Notification), 1);
    QCOMPARE(int(TorkLog::Warning), 2);
    QCOMPARE(int(TorkLog::Error), 3);
    QCOMPARE(int(TorkLog::Fatal), 4);
    QCOMPARE(int(TorkLog::PreferencesLoad), 0);
    QCOMPARE(int(TorkLog::PreferencesSave), 1);
}

QTEST_GUILESS_MAIN(tst_TorkLogSettings)
#include "tst_TorkLogSettings.moc"
