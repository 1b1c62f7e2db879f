// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/log/TorkLog.h"
#include "log/LogFolder.h"
#include "support/ChildProcess.h"
#include "support/MessageCapture.h"
#include "support/PrivateField.h"
#include "support/ProcessLimits.h"
#include "support/TestClock.h"

#include <QStandardPaths>
#include <QtTest>

#include <algorithm>
#include <cstdio>

class tst_TorkLogPreferences : public QObject
{
    Q_OBJECT

private slots:
    void init();
    void cleanup();

    void preferencesFileName_data();
    void preferencesFileName();
    void preferencesFileNameTouchesNothing();
    void havePreferencesFile();

    void save_data();
    void save();
    void saveReplacesTheFile();
    void saveFails_data();
    void saveFails();
    void load_data();
    void load();
    void textsInForce();
    void loadedTexts();
    void loadOfMissingFile();
    void loadOfMalformedFile_data();
    void loadOfMalformedFile();
    void loadOfTruncatedFile();
    void loadOfEntityBomb();
    void saveAndLoad();
    void unknownOperation_data();
    void unknownOperation();

    void firstStart_data();
    void firstStart();
    void firstStartSaves_data();
    void firstStartSaves();
    void firstStartInDefaultDirectory_data();
    void firstStartInDefaultDirectory();
    void fileInPlaceOfDirectory();
    void initializeInstallsTheMessageHandler();
    void initializeKeepsThePath_data();
    void initializeKeepsThePath();
    void initializeTwice();
    void initializeWithShortForm();
    void laterStart_data();
    void laterStart();
    void loadingIsTraced();
    void loadingOpensTheFileUnderThePrefixGiven();
    void loadingOpensTheFileUnderTheLimitInForce();
    void loadingIsNotTracedByDisabledLog();
    void malformedSettingsAtStart();
    void settersAreKeptInMemory();
    void withoutPermission_data();
    void withoutPermission();

    void shutdown();
    void shutdownWithoutLog();
    void shutdownClosesTheFile();
    void shutdownClearsThePointerFirst();
    void messagesAfterShutdown();
    void startAfterShutdown();

private:
    QtMessageHandler m_handler;
    QString m_workingDirectory;
};

struct PreferencesFileName
{
    using Field = QString TorkLog::*;
    friend Field privateField(PreferencesFileName);
};
template struct PrivateField<PreferencesFileName, &TorkLog::m_preferencesFileName>;

namespace {

const char stampOfNow[] = "2021-03-04 05:06:07.123";

QByteArray stamped(QByteArray const& text)
{
    return QByteArray(stampOfNow) + ' ' + text;
}

// The names that TestFiles::listing() shows.
QStringList names(QString const& folder)
{
    QStringList result = TestFiles::listing(folder);
    for (QString& entry : result) {
        const int colon = entry.indexOf(": ");
        if (colon != -1)
            entry.truncate(colon);
    }
    return result;
}

// A settings file with its items in alphabetical order: nobody promises theirs.
QByteArray inOrder(QByteArray const& text)
{
    const QByteArray start = "<LogSettings>\n<config>\n";
    const QByteArray end = "</config>\n</LogSettings>\n";
    if (!text.startsWith(start) || !text.endsWith(end))
        return text;

    QByteArray items = text.mid(start.size(), text.size() - start.size() - end.size());
    if (!items.endsWith('\n'))
        return text;
    items.chop(1);
    QList<QByteArray> lines = items.split('\n');
    std::sort(lines.begin(), lines.end());
    return start + lines.join('\n') + '\n' + end;
}

QByteArray saved(const char* maxLogFiles, const char* maxLogFileSize, const char* enabled,
                 const char* elapsed, QByteArray const& format, QByteArray const& elapsedPrefix,
                 QByteArray const& prefix, const char* pipe)
{
    return QByteArray("<LogSettings>\n<config>\n"
                      "<dateTimeFormat>") +
           format + "</dateTimeFormat>\n<elapsedTimePrefix>" + elapsedPrefix +
           "</elapsedTimePrefix>\n<filePrefix>" + prefix + "</filePrefix>\n<logElapsedTime>" +
           elapsed + "</logElapsedTime>\n<logPipeToConsole>" + pipe +
           "</logPipeToConsole>\n<loggingEnabled>" + enabled +
           "</loggingEnabled>\n<maxLogFileSize>" + maxLogFileSize +
           "</maxLogFileSize>\n<maxLogFiles>" + maxLogFiles +
           "</maxLogFiles>\n</config>\n</LogSettings>\n";
}

QByteArray savedByStart(const char* enabled, QByteArray const& prefix)
{
    return saved("10", "1000000", enabled, "no", "yyyy-MM-dd hh:mm:ss.z", "dT:", prefix, "no");
}

QByteArray config(QByteArray const& items)
{
    return "<LogSettings>\n<config>\n" + items + "</config>\n</LogSettings>\n";
}

// What the getters and the file name tell of the settings.
QString described(TorkLog& log)
{
    const auto onOff = [](bool on) {
        return QString(on ? "on" : "off");
    };
    return QStringList({QString::number(log.maxLogFiles()), QString::number(log.maxLogFileSize()),
                        onOff(log.enabled()), onOff(log.logElapsedTime()),
                        onOff(log.logPipeToConsole()), log.fileSpec(false)})
        .join(' ');
}

const char loadDefaults[] = "10 1000000 on off off logdata.log";

} // namespace

void tst_TorkLogPreferences::init()
{
    m_handler = qInstallMessageHandler(nullptr);
    qInstallMessageHandler(m_handler);
    m_workingDirectory = QDir::currentPath();
    TestClock::set(QDateTime(QDate(2021, 3, 4), QTime(5, 6, 7, 123)));
}

void tst_TorkLogPreferences::cleanup()
{
    TorkLog::shutdown();
    qInstallMessageHandler(m_handler);
    QDir::setCurrent(m_workingDirectory);
    TestClock::release();
}

void tst_TorkLogPreferences::preferencesFileName_data()
{
    QTest::addColumn<QString>("path");
    QTest::addColumn<QString>("name");
    QTest::addColumn<QString>("expected");

    QTest::newRow("empty") << "/a/logs/"
                           << ""
                           << "/a/logs/logsettings.cfg";
    QTest::newRow("null") << "/a/logs/" << QString() << "/a/logs/logsettings.cfg";
    QTest::newRow("empty, path without a final slash") << "/a/logs"
                                                       << ""
                                                       << "/a/logs/logsettings.cfg";
    QTest::newRow("empty, empty path") << ""
                                       << ""
                                       << "logsettings.cfg";
    QTest::newRow("empty, root directory") << "/"
                                           << ""
                                           << "/logsettings.cfg";
    QTest::newRow("bare name") << "/a/logs/"
                               << "my.cfg"
                               << "/a/logs/my.cfg";
    QTest::newRow("bare name, path without a final slash") << "/a/logs"
                                                           << "my.cfg"
                                                           << "/a/logs/my.cfg";
    QTest::newRow("bare name, empty path") << ""
                                           << "my.cfg"
                                           << "my.cfg";
    QTest::newRow("bare name, relative path") << "a"
                                              << "my.cfg"
                                              << "a/my.cfg";
    QTest::newRow("a backslash is no slash") << "/a/"
                                             << "b\\c"
                                             << "/a/b\\c";
    QTest::newRow("blank") << "/a/"
                           << " "
                           << "/a/ ";
    QTest::newRow("markers are text") << "/%1/"
                                      << "%2%1"
                                      << "/%1/%2%1";
    QTest::newRow("name with a slash") << "/a/logs/"
                                       << "sub/x.cfg"
                                       << "sub/x.cfg";
    QTest::newRow("whole path") << "/a/logs/"
                                << "/b/x.cfg"
                                << "/b/x.cfg";
    QTest::newRow("slash at the end") << "/a/logs/"
                                      << "b/"
                                      << "b/";
    QTest::newRow("not cleaned") << "/a//./"
                                 << ""
                                 << "/a//./logsettings.cfg";
}

void tst_TorkLogPreferences::preferencesFileName()
{
    QFETCH(QString, path);
    QFETCH(QString, name);
    TorkLog log(path);
    QCOMPARE(log.setPreferencesFileName(name), true);
    QTEST(log.*privateField(PreferencesFileName()), "expected");
    QTEST(log.preferencesFileName(), "expected");
}

void tst_TorkLogPreferences::preferencesFileNameTouchesNothing()
{
    LogFolder folder;
    TestFiles::write(folder.settingsFile(), config("<maxLogFiles>3</maxLogFiles>\n"));
    TorkLog log(folder.root() + "new/");
    QVERIFY(log.setPreferencesFileName(QString()));
    QVERIFY(log.setPreferencesFileName(folder.settingsFile()));
    QCOMPARE(log.maxLogFiles(), 10u);
    QCOMPARE(names(folder.root()), QStringList({"logs/", "settings.cfg"}));
}

void tst_TorkLogPreferences::havePreferencesFile()
{
    LogFolder folder;
    TorkLog log(folder.logs());
    QCOMPARE(log.havePreferencesFile(), false);
    log.setPreferencesFileName(QString());
    QCOMPARE(log.havePreferencesFile(), false);
    QVERIFY(TestFiles::write(folder.logs() + "logsettings.cfg", ""));
    QCOMPARE(log.havePreferencesFile(), true);
}

void tst_TorkLogPreferences::save_data()
{
    QTest::addColumn<LogFolder::Settings>("settings");
    QTest::addColumn<QByteArray>("expected");

    const QByteArray usual = "yyyy-MM-dd hh:mm:ss.z";
    QTest::newRow("defaults of a new log")
        << LogFolder::Settings() << saved("10", "1000000", "no", "no", usual, "dT:", "", "no");
    QTest::newRow("all other") << LogFolder::Settings({{"maxLogFiles", "3"},
                                                       {"maxLogFileSize", "77"},
                                                       {"loggingEnabled", "yes"},
                                                       {"logElapsedTime", "yes"},
                                                       {"dateTimeFormat", "hh:mm"},
                                                       {"elapsedTimePrefix", "+"},
                                                       {"filePrefix", "my app"},
                                                       {"logPipeToConsole", "yes"},
                                                       {"outputToConsole", "yes"}})
                               << saved("3", "77", "yes", "yes", "hh:mm", "+", "my app", "yes");
    QTest::newRow("numbers beyond int")
        << LogFolder::Settings(
               {{"maxLogFiles", "-1"}, {"maxLogFileSize", "-2147483648"}, {"filePrefix", "a"}})
        << saved("4294967295", "2147483648", "yes", "no", usual, "dT:", "a", "no");
    QTest::newRow("markup is wrapped")
        << LogFolder::Settings({{"dateTimeFormat", "'at' hh"}, {"filePrefix", "a&b"}})
        << saved("10", "1000000", "yes", "no", "<![CDATA['at' hh]]>", "dT:", "<![CDATA[a&b]]>",
                 "no");
    QTest::newRow("Latin-1 and beyond")
        << LogFolder::Settings({{"filePrefix", QString::fromUtf8("ä€")}})
        << saved("10", "1000000", "yes", "no", usual, "dT:", "\xE4?", "no");
}

void tst_TorkLogPreferences::save()
{
    QFETCH(LogFolder::Settings, settings);
    LogFolder folder;
    TorkLog log;
    if (!settings.isEmpty()) {
        QVERIFY(TestFiles::write(folder.root() + "from.cfg", LogFolder::settingsText(settings)));
        log.setPreferencesFileName(folder.root() + "from.cfg");
        QVERIFY(log.loadPreferences());
    }

    log.setPreferencesFileName(folder.settingsFile());
    QCOMPARE(log.savePreferences(), true);
    QTEST(inOrder(TestFiles::read(folder.settingsFile())), "expected");
}

void tst_TorkLogPreferences::saveReplacesTheFile()
{
    LogFolder folder;
    QVERIFY(TestFiles::write(folder.settingsFile(), QByteArray(5000, 'x')));
    TorkLog log;
    log.setPreferencesFileName(folder.settingsFile());
    QCOMPARE(log.processPreferences(TorkLog::PreferencesSave), true);
    QCOMPARE(inOrder(TestFiles::read(folder.settingsFile())), savedByStart("no", ""));
}

// Saving succeeds in every case, as far as its result tells.
void tst_TorkLogPreferences::saveFails_data()
{
    QTest::addColumn<QString>("name");

    QTest::newRow("directory is missing") << "missing/x.cfg";
    QTest::newRow("a directory of that name") << "./logs";
    QTest::newRow("one letter is too short a name") << "a";
}

void tst_TorkLogPreferences::saveFails()
{
    QFETCH(QString, name);
    LogFolder folder;
    QVERIFY(QDir::setCurrent(folder.root()));
    TorkLog log;
    log.setPreferencesFileName(name);
    QCOMPARE(log.savePreferences(), true);
    QCOMPARE(TestFiles::listing(folder.root()), QStringList("logs/"));
}

// Before each load 33 files of 2048 bytes are set: what a number that is none leaves.
void tst_TorkLogPreferences::load_data()
{
    QTest::addColumn<QByteArray>("text");
    QTest::addColumn<QString>("expected");

    const auto items = [](const char* name, QByteArray const& text, const char* expected) {
        QTest::newRow(name) << config(text) << QString::fromUtf8(expected);
    };
    items("no items", "", loadDefaults);
    items("all items",
          "<maxLogFiles>3</maxLogFiles>\n<maxLogFileSize>77</maxLogFileSize>\n"
          "<loggingEnabled>no</loggingEnabled>\n<logElapsedTime>yes</logElapsedTime>\n"
          "<filePrefix>app</filePrefix>\n<logPipeToConsole>yes</logPipeToConsole>\n",
          "3 77 off on on app.log");
    QTest::newRow("no section") << QByteArray("<LogSettings></LogSettings>")
                                << QString(loadDefaults);
    QTest::newRow("another section")
        << QByteArray("<LogSettings><Config><maxLogFiles>3</maxLogFiles></Config></LogSettings>")
        << QString(loadDefaults);
    QTest::newRow("another root element")
        << QByteArray("<Other><config><maxLogFiles>3</maxLogFiles></config></Other>")
        << QString("3 1000000 on off off logdata.log");
    QTest::newRow("section in two pieces")
        << QByteArray("<LogSettings><config><maxLogFiles>3</maxLogFiles></config>"
                      "<config><filePrefix>app</filePrefix></config></LogSettings>")
        << QString("3 1000000 on off off app.log");
    items("an item twice, the later counts",
          "<maxLogFiles>3</maxLogFiles><maxLogFiles>4</maxLogFiles>",
          "4 1000000 on off off logdata.log");
    items("keys in other letter case", "<MAXLOGFILES>3</MAXLOGFILES><FilePrefix>x</FilePrefix>",
          loadDefaults);
    items("unknown keys", "<outputToConsole>yes</outputToConsole><x>y</x>", loadDefaults);
    items("items without text",
          "<maxLogFiles></maxLogFiles><maxLogFileSize/><filePrefix/><loggingEnabled/>",
          loadDefaults);

    items("limits are not checked",
          "<maxLogFiles>500</maxLogFiles><maxLogFileSize>5</maxLogFileSize>",
          "500 5 on off off logdata.log");
    items("numbers of 0", "<maxLogFiles>0</maxLogFiles><maxLogFileSize>0</maxLogFileSize>",
          "0 0 on off off logdata.log");
    items("negative numbers wrap",
          "<maxLogFiles>-1</maxLogFiles><maxLogFileSize>-2147483648</maxLogFileSize>",
          "4294967295 2147483648 on off off logdata.log");
    items("highest int",
          "<maxLogFiles>2147483647</maxLogFiles><maxLogFileSize>2147483647</maxLogFileSize>",
          "2147483647 2147483647 on off off logdata.log");
    items("beyond int",
          "<maxLogFiles>2147483648</maxLogFiles><maxLogFileSize>4294967295</maxLogFileSize>",
          "33 2048 on off off logdata.log");
    items("far beyond",
          "<maxLogFiles>99999999999999999999</maxLogFiles>"
          "<maxLogFileSize>-99999999999</maxLogFileSize>",
          "33 2048 on off off logdata.log");
    items("no numbers", "<maxLogFiles>many</maxLogFiles><maxLogFileSize>1e3</maxLogFileSize>",
          "33 2048 on off off logdata.log");
    items("not decimal", "<maxLogFiles>0x10</maxLogFiles><maxLogFileSize>1.5</maxLogFileSize>",
          "33 2048 on off off logdata.log");
    items("leading zeros and sign",
          "<maxLogFiles>007</maxLogFiles><maxLogFileSize>+5</maxLogFileSize>",
          "7 5 on off off logdata.log");

    const QByteArray on[] = {"1", "y", "yes", "t", "true", "YES", "T", "True"};
    for (QByteArray const& word : on)
        items(("switch " + word).constData(),
              "<loggingEnabled>" + word + "</loggingEnabled><logElapsedTime>" + word +
                  "</logElapsedTime><logPipeToConsole>" + word + "</logPipeToConsole>",
              "10 1000000 on on on logdata.log");
    const QByteArray off[] = {"no", "0", "on", " yes", "yes ", "2", "wahr"};
    for (QByteArray const& word : off)
        items(("switch " + word).constData(),
              "<loggingEnabled>" + word + "</loggingEnabled><logElapsedTime>" + word +
                  "</logElapsedTime><logPipeToConsole>" + word + "</logPipeToConsole>",
              "10 1000000 off off off logdata.log");

    items("prefix with blanks", "<filePrefix> my app </filePrefix>",
          "10 1000000 on off off  my app .log");
    items("prefix with markup", "<filePrefix><![CDATA[<a&b>]]></filePrefix>",
          "10 1000000 on off off <a&b>.log");
    items("prefix with markers", "<filePrefix>%1%2</filePrefix>", "10 1000000 on off off %1%2.log");
}

void tst_TorkLogPreferences::load()
{
    QFETCH(QByteArray, text);
    LogFolder folder;
    QVERIFY(TestFiles::write(folder.settingsFile(), text));
    TorkLog log;
    log.setMaxLogFiles(33);
    log.setMaxLogFileSize(0);
    log.setPreferencesFileName(folder.settingsFile());

    QCOMPARE(log.loadPreferences(), true);
    QTEST(described(log), "expected");
    QCOMPARE(TestFiles::read(folder.settingsFile()), text);
    QCOMPARE(folder.listing(), QStringList());
}

void tst_TorkLogPreferences::textsInForce()
{
    LogFolder folder;
    TorkLog log(folder.logs());
    QCOMPARE(log.preferencesFileName(), QString());
    QCOMPARE(log.dateTimeFormat(), QString("yyyy-MM-dd hh:mm:ss.z"));
    QCOMPARE(log.elapsedTimePrefix(), QString("dT:"));
    QCOMPARE(log.filePrefix(), QString());

    log.setPreferencesFileName(folder.settingsFile());
    QVERIFY(TestFiles::write(folder.settingsFile(),
                             config("<dateTimeFormat>yy</dateTimeFormat>"
                                    "<elapsedTimePrefix>since</elapsedTimePrefix>"
                                    "<filePrefix>my</filePrefix>")));
    QVERIFY(log.loadPreferences());
    QCOMPARE(log.dateTimeFormat(), QString("yy"));
    QCOMPARE(log.elapsedTimePrefix(), QString("since"));
    QCOMPARE(log.filePrefix(), QString("my"));
}

// Entries show what is in force.
void tst_TorkLogPreferences::loadedTexts()
{
    LogFolder folder;
    TorkLog log(folder.logs());
    log.setPreferencesFileName(folder.settingsFile());
    QVERIFY(TestFiles::write(folder.settingsFile(),
                             config("<dateTimeFormat>yy</dateTimeFormat>"
                                    "<elapsedTimePrefix>since</elapsedTimePrefix>"
                                    "<logElapsedTime>yes</logElapsedTime>")));
    QVERIFY(log.loadPreferences());
    log.trace("a");
    QVERIFY(
        TestFiles::write(folder.settingsFile(), config("<logElapsedTime>yes</logElapsedTime>")));
    QVERIFY(log.loadPreferences());
    log.trace("b");

    QCOMPARE(TestFiles::read(folder.logs() + "logdata.log"),
             "21 Trace since[0] a\n" + stamped("Trace dT:[0] b\n"));
}

void tst_TorkLogPreferences::loadOfMissingFile()
{
    LogFolder folder;
    TorkLog log(folder.logs());
    log.setMaxLogFiles(33);
    log.setMaxLogFileSize(0);
    log.setLogElapsedTime(true);
    log.setPreferencesFileName(folder.settingsFile());

    QCOMPARE(log.loadPreferences(), false);
    QCOMPARE(described(log), QString("33 2048 off on off .log"));
    QCOMPARE(TestFiles::listing(folder.root()), QStringList("logs/"));
}

// What was read before the fault counts, the rest has its defaults.
void tst_TorkLogPreferences::loadOfMalformedFile_data()
{
    QTest::addColumn<QByteArray>("text");
    QTest::addColumn<QString>("expected");

    const auto row = [](const char* name, QByteArray const& text, const char* expected) {
        QTest::newRow(name) << text << QString(expected);
    };
    row("empty", "", loadDefaults);
    row("blanks", "  \n \n", loadDefaults);
    row("no markup", "maxLogFiles=3\n", loadDefaults);
    row("null characters", QByteArray(100, '\0'), loadDefaults);
    row("bytes of all values", QByteArray("\x7f\xff\xfe\x80\x01\x1b\xc3\x28", 8), loadDefaults);
    row("element not closed", "<LogSettings><config>", loadDefaults);
    row("wrong end element",
        "<LogSettings><config><maxLogFiles>3</maxLogFiles></other></LogSettings>",
        "3 1000000 on off off logdata.log");
    row("items before the fault",
        "<LogSettings><config><filePrefix>app</filePrefix><loggingEnabled>no</loggingEnabled>"
        "<maxLogFiles>3<</config></LogSettings>",
        "3 1000000 off off off app.log");
    row("second root element", "<LogSettings></LogSettings><x/>", loadDefaults);
    row("text behind the root element", "<LogSettings></LogSettings>x", loadDefaults);
    row("bare ampersand",
        "<LogSettings><config><maxLogFiles>3</maxLogFiles><x>a & b</x></config></LogSettings>",
        "3 1000000 on off off logdata.log");
}

void tst_TorkLogPreferences::loadOfMalformedFile()
{
    QFETCH(QByteArray, text);
    LogFolder folder;
    QVERIFY(TestFiles::write(folder.settingsFile(), text));
    TorkLog log;
    log.setMaxLogFiles(33);
    log.setPreferencesFileName(folder.settingsFile());

    MessageCapture messages;
    QCOMPARE(log.loadPreferences(), false);
    QTEST(described(log), "expected");
    QCOMPARE(messages.texts().size(), 1);
    QVERIFY2(messages.texts().at(0).startsWith(
                 "critical: TorkErrorHandler::fatalError:  \"Xml Parse Failure.\\n"),
             qPrintable(messages.texts().at(0)));
    QCOMPARE(TestFiles::read(folder.settingsFile()), text);
}

void tst_TorkLogPreferences::loadOfTruncatedFile()
{
    const QByteArray whole =
        saved("3", "77", "no", "yes", "<![CDATA['T']]>", "+", "<![CDATA[a&b]]>", "no");
    LogFolder folder;
    MessageCapture messages;
    for (int length = 0; length <= whole.size() - 2; ++length) { // without its last line end: whole
        QVERIFY(TestFiles::write(folder.settingsFile(), whole.left(length)));
        TorkLog log;
        log.setPreferencesFileName(folder.settingsFile());
        QVERIFY2(!log.loadPreferences(), qPrintable(QString::number(length)));
    }
    QCOMPARE(messages.texts().size(), whole.size() - 1);
}

void tst_TorkLogPreferences::loadOfEntityBomb()
{
    QByteArray text = "<!DOCTYPE LogSettings [\n<!ENTITY e0 \"0123456789\">\n";
    for (int i = 1; i < 12; ++i) {
        const QByteArray before = "&e" + QByteArray::number(i - 1) + ';';
        text += "<!ENTITY e" + QByteArray::number(i) + " \"" + before.repeated(10) + "\">\n";
    }
    text += "]>\n" + config("<filePrefix>&e11;</filePrefix>\n");
    LogFolder folder;
    QVERIFY(TestFiles::write(folder.settingsFile(), text));
    TorkLog log;
    log.setPreferencesFileName(folder.settingsFile());

    MessageCapture messages;
    QCOMPARE(log.loadPreferences(), false);
    QCOMPARE(described(log), QString(loadDefaults));
}

void tst_TorkLogPreferences::saveAndLoad()
{
    const LogFolder::Settings settings = {{"maxLogFiles", "3"},        {"maxLogFileSize", "77"},
                                          {"loggingEnabled", "no"},    {"logElapsedTime", "yes"},
                                          {"filePrefix", "a <b> & c"}, {"logPipeToConsole", "yes"}};
    LogFolder folder;
    TorkLog first;
    folder.configure(first, settings);
    QVERIFY(first.savePreferences());

    TorkLog second;
    second.setPreferencesFileName(folder.settingsFile());
    QVERIFY(second.loadPreferences());
    QCOMPARE(described(second), QString("3 77 off on on a <b> & c.log"));
}

void tst_TorkLogPreferences::unknownOperation_data()
{
    QTest::addColumn<int>("operation");

    QTest::newRow("behind the last") << 2;
    QTest::newRow("far behind") << 2147483647;
    QTest::newRow("negative") << -1;
}

void tst_TorkLogPreferences::unknownOperation()
{
    QFETCH(int, operation);
    LogFolder folder;
    TorkLog log;
    folder.prepare(log, "app");
    const QByteArray before = TestFiles::read(folder.settingsFile());
    log.setMaxLogFiles(3);

    QCOMPARE(log.processPreferences(static_cast<TorkLog::PreferencesOperation>(operation)), false);
    QCOMPARE(TestFiles::read(folder.settingsFile()), before);
    QCOMPARE(log.maxLogFiles(), 3u);
}

// The log directory is made before the settings are saved into it, and then for the first entry.
void tst_TorkLogPreferences::firstStart_data()
{
    QTest::addColumn<QString>("path"); // %1 stands for the folder of the test
    QTest::addColumn<QString>("settings");
    QTest::addColumn<QStringList>("afterStart");
    QTest::addColumn<QStringList>("afterEntry");

    const auto row = [](const char* name, const char* path, const char* settings,
                        QStringList const& afterStart, QStringList const& more) {
        QTest::newRow(name) << QString::fromUtf8(path) << QString(settings)
                            << TestFiles::sorted(afterStart)
                            << TestFiles::sorted(afterStart + more);
    };
    row("directory is there", "%1there/", "", {"there/", "there/logsettings.cfg"},
        {"there/app.log"});
    row("there, no final slash", "%1there", "", {"there/", "there/logsettings.cfg"},
        {"ther/", "there/app.log"});
    row("missing", "%1new/", "", {"new/", "new/logsettings.cfg", "there/"}, {"new/app.log"});
    row("several missing", "%1a/b/c/", "",
        {"a/", "a/b/", "a/b/c/", "a/b/c/logsettings.cfg", "there/"}, {"a/b/c/app.log"});
    row("missing, no final slash", "%1new", "", {"ne/", "there/"}, {});
    row("missing, two final slashes", "%1new//", "", {"new/", "new/logsettings.cfg", "there/"},
        {"new/app.log"});
    row("missing, not cleaned", "%1there/.././new/", "", {"new/", "new/logsettings.cfg", "there/"},
        {"new/app.log"});
    row("missing, settings with a bare name", "%1new/", "my.cfg", {"new/", "new/my.cfg", "there/"},
        {"new/app.log"});
    row("missing, settings with their whole path", "%1new/", "%1new/my.cfg",
        {"new/", "new/my.cfg", "there/"}, {"new/app.log"});
    row("missing, settings elsewhere", "%1new/", "%1there/my.cfg", {"there/", "there/my.cfg"},
        {"new/", "new/app.log"});
    row("missing, settings in another missing one", "%1new/", "%1other/my.cfg", {"there/"},
        {"new/", "new/app.log"});
    row("one letter", "d", "", {"d/", "d/logsettings.cfg", "there/"}, {"d/app.log"});
    row("blanks and letters beyond ASCII", "%1Büro 日誌/", "",
        {QString::fromUtf8("Büro 日誌/"), QString::fromUtf8("Büro 日誌/logsettings.cfg"), "there/"},
        {QString::fromUtf8("Büro 日誌/app.log")});
}

void tst_TorkLogPreferences::firstStart()
{
    QFETCH(QString, path);
    QFETCH(QString, settings);
    LogFolder folder;
    const QString work = folder.root() + "work/";
    QVERIFY(QDir().mkpath(work + "there"));
    QVERIFY(QDir::setCurrent(work));

    TorkLog* const log =
        TorkLog::initialize(path.replace("%1", work), "app", settings.replace("%1", work), true);
    QVERIFY(log);
    QCOMPARE(TorkLog::logger(), log);
    QTEST(names(work), "afterStart");
    log->trace("x");
    QTEST(names(work), "afterEntry");
}

void tst_TorkLogPreferences::firstStartSaves_data()
{
    QTest::addColumn<QString>("prefix");
    QTest::addColumn<bool>("enable");
    QTest::addColumn<QByteArray>("expected");

    QTest::newRow("on") << "app" << true << savedByStart("yes", "app");
    QTest::newRow("off") << "app" << false << savedByStart("no", "app");
    QTest::newRow("empty prefix") << "" << true << savedByStart("yes", "");
    QTest::newRow("prefix with a blank") << "my app" << true << savedByStart("yes", "my app");
}

void tst_TorkLogPreferences::firstStartSaves()
{
    QFETCH(QString, prefix);
    QFETCH(bool, enable);
    LogFolder folder;
    TorkLog* const log = TorkLog::initialize(folder.logs(), prefix, QString(), enable);

    QTEST(inOrder(TestFiles::read(folder.logs() + "logsettings.cfg")), "expected");
    QCOMPARE(names(folder.logs()), QStringList("logsettings.cfg")); // saving leaves no trace
    QCOMPARE(log->enabled(), enable);
    QCOMPARE(log->fileSpec(false), prefix + ".log");
    QCOMPARE(log->maxLogFiles(), 10u);
    QCOMPARE(log->maxLogFileSize(), 1000000u);
}

void tst_TorkLogPreferences::firstStartInDefaultDirectory_data()
{
    QTest::addColumn<bool>("shortForm");
    QTest::addColumn<QString>("path");

    QTest::newRow("empty path") << false << "";
    QTest::newRow("null path") << false << QString();
    QTest::newRow("only a prefix") << true << QString();
}

void tst_TorkLogPreferences::firstStartInDefaultDirectory()
{
    QFETCH(bool, shortForm);
    QFETCH(QString, path);
    LogFolder folder;
    struct Environment
    {
        QByteArray before = qgetenv("XDG_DATA_HOME");
        ~Environment() { qputenv("XDG_DATA_HOME", before); }
    } environment;
    qputenv("XDG_DATA_HOME", QFile::encodeName(folder.root() + "data"));
    QCoreApplication::setOrganizationName("Some Makers");
    QCoreApplication::setApplicationName("Some Product");
    const QString location = QStandardPaths::writableLocation(QStandardPaths::DataLocation);
    if (!location.startsWith(folder.root()))
        QSKIP("The data location cannot be moved on this system.");

    TorkLog* const log =
        shortForm ? TorkLog::initialize("app") : TorkLog::initialize(path, "app", QString(), true);
    QCOMPARE(log->path(), location + "/logs/");
    log->trace("x");
    QCOMPARE(inOrder(TestFiles::read(location + "/logs/logsettings.cfg")),
             savedByStart("yes", "app"));
    QCOMPARE(TestFiles::read(location + "/logs/app.log"), stamped("Trace x\n"));
    QCOMPARE(names(location), QStringList({"logs/", "logs/app.log", "logs/logsettings.cfg"}));
}

void tst_TorkLogPreferences::fileInPlaceOfDirectory()
{
    LogFolder folder;
    QVERIFY(TestFiles::write(folder.root() + "file", "x"));
    TorkLog* const log = TorkLog::initialize(folder.root() + "file/", "app", QString(), true);
    QVERIFY(log);
    log->trace("lost");
    QVERIFY(!log->errorString().isEmpty());
    QCOMPARE(TestFiles::listing(folder.root()), QStringList({"file: x", "logs/"}));
}

void tst_TorkLogPreferences::initializeInstallsTheMessageHandler()
{
    LogFolder folder;
    TorkLog::initialize(folder.logs(), "app", QString(), true);
    const QtMessageHandler installed = qInstallMessageHandler(nullptr);
    QVERIFY(installed == TorkLog_MessageHandler);
}

void tst_TorkLogPreferences::initializeKeepsThePath_data()
{
    QTest::addColumn<QString>("end");

    QTest::newRow("with a final slash") << "logs/";
    QTest::newRow("without one") << "logs";
    QTest::newRow("not cleaned") << "./logs//";
}

void tst_TorkLogPreferences::initializeKeepsThePath()
{
    QFETCH(QString, end);
    LogFolder folder;
    TorkLog* const log = TorkLog::initialize(folder.root() + end, "app", QString(), true);
    QCOMPARE(log->path(), folder.root() + end);
    QCOMPARE(names(folder.logs()), QStringList("logsettings.cfg"));
}

void tst_TorkLogPreferences::initializeTwice()
{
    LogFolder folder;
    TorkLog* const first = TorkLog::initialize(folder.logs(), "app", QString(), true);
    first->setMaxLogFiles(3);
    const QStringList before = TestFiles::listing(folder.root());
    qInstallMessageHandler(m_handler);

    QCOMPARE(TorkLog::initialize(folder.root() + "other/", "other", "other.cfg", false), first);
    QCOMPARE(TorkLog::initialize("other"), first);
    QCOMPARE(TorkLog::logger(), first);
    QCOMPARE(first->path(), folder.logs());
    QCOMPARE(first->fileSpec(false), QString("app.log"));
    QCOMPARE(first->enabled(), true);
    QCOMPARE(first->maxLogFiles(), 3u);
    QCOMPARE(TestFiles::listing(folder.root()), before);
    const QtMessageHandler installed = qInstallMessageHandler(m_handler);
    QVERIFY(installed == m_handler); // not even the message handler is installed again
}

// Settings that are there win over what the start gives.
void tst_TorkLogPreferences::laterStart_data()
{
    QTest::addColumn<QByteArray>("text");
    QTest::addColumn<bool>("enable");
    QTest::addColumn<QString>("expected");

    QTest::newRow("no items: default prefix and on")
        << config("") << false << QString(loadDefaults);
    QTest::newRow("prefix") << config("<filePrefix>other</filePrefix>") << true
                            << QString("10 1000000 on off off other.log");
    QTest::newRow("no prefix") << config("<maxLogFiles>3</maxLogFiles>") << true
                               << QString("3 1000000 on off off logdata.log");
    QTest::newRow("switched off")
        << config("<loggingEnabled>no</loggingEnabled><filePrefix>app</filePrefix>") << true
        << QString("10 1000000 off off off app.log");
    QTest::newRow("switched on")
        << config("<loggingEnabled>yes</loggingEnabled><filePrefix>app</filePrefix>") << false
        << QString("10 1000000 on off off app.log");
    QTest::newRow("absurd numbers")
        << config("<maxLogFiles>-1</maxLogFiles><maxLogFileSize>9999999999</maxLogFileSize>")
        << true << QString("4294967295 1000000 on off off logdata.log");
}

void tst_TorkLogPreferences::laterStart()
{
    QFETCH(QByteArray, text);
    QFETCH(bool, enable);
    LogFolder folder;
    const QString settings = folder.logs() + "logsettings.cfg";
    QVERIFY(TestFiles::write(settings, text));

    TorkLog* const log = TorkLog::initialize(folder.logs(), "app", QString(), enable);
    QTEST(described(*log), "expected");
    QCOMPARE(TestFiles::read(settings), text);
}

void tst_TorkLogPreferences::initializeWithShortForm()
{
    LogFolder folder;
    struct Environment
    {
        QByteArray before = qgetenv("XDG_DATA_HOME");
        ~Environment() { qputenv("XDG_DATA_HOME", before); }
    } environment;
    qputenv("XDG_DATA_HOME", QFile::encodeName(folder.root() + "data"));
    const QString location = QStandardPaths::writableLocation(QStandardPaths::DataLocation);
    if (!location.startsWith(folder.root()))
        QSKIP("The data location cannot be moved on this system.");

    QVERIFY(TestFiles::write(location + "/logs/logsettings.cfg",
                             config("<filePrefix>other</filePrefix>")));
    TorkLog* const log = TorkLog::initialize("app");
    QCOMPARE(described(*log), QString("10 1000000 on off off other.log"));
}

void tst_TorkLogPreferences::loadingIsTraced()
{
    LogFolder folder;
    const QString settings = folder.root() + "my %1.cfg";
    QVERIFY(TestFiles::write(settings, config("<filePrefix>app</filePrefix>")));

    TorkLog* const log = TorkLog::initialize(folder.logs(), "app", settings, true);
    log->trace("x");
    QCOMPARE(folder.listing(),
             QStringList("app.log: " +
                         stamped("Trace Loading configuration from " + settings.toLatin1() + '\n') +
                         stamped("Trace x\n")));
}

// The trace comes before the stored prefix is read, and the file stays open.
void tst_TorkLogPreferences::loadingOpensTheFileUnderThePrefixGiven()
{
    LogFolder folder;
    const QString settings = folder.settingsFile();
    QVERIFY(TestFiles::write(settings, config("<filePrefix>other</filePrefix>")));
    TorkLog* const log = TorkLog::initialize(folder.logs(), "app", settings, true);
    log->trace("x");
    QCOMPARE(folder.listing(),
             QStringList("app.log: " +
                         stamped("Trace Loading configuration from " + settings.toLatin1() + '\n') +
                         stamped("Trace x\n")));

    QVERIFY(log->close());
    log->trace("y");
    QCOMPARE(TestFiles::read(folder.logs() + "other.log"), stamped("Trace y\n"));
}

void tst_TorkLogPreferences::loadingOpensTheFileUnderTheLimitInForce()
{
    LogFolder folder;
    const QString settings = folder.settingsFile();
    const QByteArray trace =
        stamped("Trace Loading configuration from " + settings.toLatin1() + '\n');
    const QByteArray old(3000, 'o');
    QVERIFY(TestFiles::write(folder.logs() + "app.log", old));
    QVERIFY(TestFiles::write(
        settings, config("<filePrefix>app</filePrefix><maxLogFileSize>10</maxLogFileSize>")));

    TorkLog* const log = TorkLog::initialize(folder.logs(), "app", settings, true);
    QCOMPARE(log->maxLogFileSize(), 10u);
    QCOMPARE(folder.listing(), QStringList("app.log: " + trace + old.mid(trace.size())));
}

void tst_TorkLogPreferences::loadingIsNotTracedByDisabledLog()
{
    LogFolder folder;
    QVERIFY(TestFiles::write(folder.settingsFile(), config("<filePrefix>other</filePrefix>")));
    TorkLog* const log = TorkLog::initialize(folder.logs(), "app", folder.settingsFile(), false);
    QCOMPARE(folder.listing(), QStringList());
    log->trace("x");
    QCOMPARE(folder.listing(), QStringList("other.log: " + stamped("Trace x\n")));
}

void tst_TorkLogPreferences::malformedSettingsAtStart()
{
    LogFolder folder;
    const QString settings = folder.logs() + "logsettings.cfg";
    const QByteArray text = "<LogSettings><config><maxLogFiles>3</maxLogFiles></other>";
    QVERIFY(TestFiles::write(settings, text));

    TorkLog* const log = TorkLog::initialize(folder.logs(), "app", QString(), true);
    QCOMPARE(described(*log), QString("3 1000000 on off off logdata.log"));
    QCOMPARE(TestFiles::read(settings), text);

    // What happened is told in three entries of one line each.
    const QList<QByteArray> entries = TestFiles::read(folder.logs() + "app.log").split('\n');
    QCOMPARE(entries.size(), 4);
    QCOMPARE(entries[0], stamped("Trace Loading configuration from " + settings.toLatin1()));
    QVERIFY2(entries[1].startsWith(
                 stamped("Error TorkErrorHandler::fatalError:  \"Xml Parse Failure.\\n")),
             entries[1].constData());
    QVERIFY2(entries[1].contains("\\nPublic ID: , System ID: \\nLine: 1, Column: "),
             entries[1].constData());
    QCOMPARE(entries[2], stamped("Trace ConfigFile - Could not parse the input file."));
    QCOMPARE(entries[3], QByteArray());
}

void tst_TorkLogPreferences::settersAreKeptInMemory()
{
    LogFolder folder;
    const QString settings = folder.logs() + "logsettings.cfg";
    TorkLog* const log = TorkLog::initialize(folder.logs(), "app", QString(), true);
    log->setMaxLogFiles(3);
    log->setMaxLogFileSize(0);
    log->setEnable(false);
    log->setLogElapsedTime(true);
    QCOMPARE(inOrder(TestFiles::read(settings)), savedByStart("yes", "app"));

    QVERIFY(log->savePreferences());
    QCOMPARE(inOrder(TestFiles::read(settings)),
             saved("3", "2048", "no", "yes", "yyyy-MM-dd hh:mm:ss.z", "dT:", "app", "no"));
}

namespace {

const QFileDevice::Permissions readOnly = QFileDevice::ReadOwner | QFileDevice::ExeOwner;

// Starts and writes with the settings file or the log directory closed; tells on the standard
// output what the settings are then, and what lies in the directory in the end.
int startsWithoutPermission(QStringList const& arguments)
{
    if (!ProcessLimits::becomeOrdinaryUser())
        return ChildProcess::skipped;

    TestClock::set(QDateTime(QDate(2021, 3, 4), QTime(5, 6, 7, 123)));
    LogFolder folder;
    const QString settings = folder.root() + "settings/logsettings.cfg";
    const bool closedDirectory = arguments.at(0) == "directory";
    TestFiles::write(settings, config("<filePrefix>hidden</filePrefix>"));
    if (!closedDirectory)
        QFile::setPermissions(settings, QFileDevice::Permissions());
    else
        QFile::setPermissions(folder.logs(), readOnly);

    TorkLog* const log = TorkLog::initialize(folder.logs(), QStringLiteral("app"),
                                             closedDirectory ? QString() : settings, true);
    log->trace("x");
    std::printf("%s\n%s", qPrintable(described(*log)), qPrintable(names(folder.root()).join(' ')));
    if (!closedDirectory) {
        const QByteArray entries = TestFiles::read(folder.logs() + "app.log");
        std::printf("\n%s", entries.split('\n').value(entries.count('\n') - 1).constData());
    }

    TorkLog::shutdown();
    QFile::setPermissions(folder.logs(), readOnly | QFileDevice::WriteOwner);
    return 0;
}

// After the end of the log, and while there has been none.
int warnsAfterShutdown(QStringList const& arguments)
{
    TorkLog::initialize(arguments.at(0), QStringLiteral("app"), QString(), true);
    TorkLog::shutdown();
    qWarning("lost");
    qDebug("lost");
    qCritical("lost");
    return TorkLog::logger() ? 1 : 0;
}

} // namespace

void tst_TorkLogPreferences::withoutPermission_data()
{
    QTest::addColumn<QString>("closed");
    QTest::addColumn<QByteArray>("output");

    QTest::newRow("settings file")
        << "settings"
        << QByteArray(loadDefaults) + "\nlogs/ logs/app.log settings/ settings/logsettings.cfg\n" +
               stamped("Trace x");
    QTest::newRow("log directory")
        << "directory"
        << QByteArray("10 1000000 on off off app.log\nlogs/ settings/ settings/logsettings.cfg");
}

void tst_TorkLogPreferences::withoutPermission()
{
    QFETCH(QString, closed);
    const ChildProcess::Result child = ChildProcess::run("without permission", {closed});
    if (child.wasSkipped())
        QSKIP("This process cannot become an ordinary user.");

    QVERIFY2(child.ended(), child.report());
    QTEST(child.output, "output");
    QCOMPARE(child.errors, QByteArray());
}

void tst_TorkLogPreferences::shutdown()
{
    LogFolder folder;
    TorkLog::initialize(folder.logs(), "app", QString(), true)->trace("x");
    TorkLog::shutdown();
    QVERIFY(!TorkLog::logger());
    QVERIFY(!TorkLog::m_gLog);
    QCOMPARE(TestFiles::read(folder.logs() + "app.log"), stamped("Trace x\n"));
    const QtMessageHandler installed = qInstallMessageHandler(nullptr);
    QVERIFY(installed == TorkLog_MessageHandler);
}

void tst_TorkLogPreferences::shutdownWithoutLog()
{
    TorkLog::shutdown();
    QVERIFY(!TorkLog::logger());
    TorkLog::shutdown();
    QVERIFY(!TorkLog::logger());
    const QtMessageHandler installed = qInstallMessageHandler(m_handler);
    QVERIFY(installed == m_handler);
}

void tst_TorkLogPreferences::shutdownClosesTheFile()
{
    const QDir openFiles("/proc/self/fd");
    const QDir::Filters all = QDir::AllEntries | QDir::System;
    if (!openFiles.exists())
        QSKIP("No list of open files on this system.");

    LogFolder folder;
    const int before = openFiles.entryList(all).size();
    TorkLog::initialize(folder.logs(), "app", QString(), true)->trace("x");
    QCOMPARE(openFiles.entryList(all).size(), before + 1);
    TorkLog::shutdown();
    QCOMPARE(openFiles.entryList(all).size(), before);
}

// Whoever hears of the end, or logs in it, no longer meets a log.
void tst_TorkLogPreferences::shutdownClearsThePointerFirst()
{
    LogFolder folder;
    TorkLog* const log = TorkLog::initialize(folder.logs(), "app", QString(), true);
    int heard = 0;
    bool hadLog = true;
    QObject listener;
    connect(log, &QObject::destroyed, &listener, [&] {
        ++heard;
        hadLog = TorkLog::logger() != nullptr;
        qWarning("lost");
    });

    TorkLog::shutdown();
    QCOMPARE(heard, 1);
    QCOMPARE(hadLog, false);
    QCOMPARE(names(folder.logs()), QStringList("logsettings.cfg"));
}

void tst_TorkLogPreferences::messagesAfterShutdown()
{
    LogFolder folder;
    const ChildProcess::Result child = ChildProcess::run("after shutdown", {folder.logs()});
    QVERIFY2(child.ended(), child.report());
    QCOMPARE(child.errors, QByteArray());
    QCOMPARE(names(folder.logs()), QStringList("logsettings.cfg"));
}

void tst_TorkLogPreferences::startAfterShutdown()
{
    LogFolder folder;
    TorkLog* log = TorkLog::initialize(folder.logs(), "app", QString(), true);
    log->setMaxLogFiles(3);
    log->setLogElapsedTime(true);
    TorkLog::shutdown();

    log = TorkLog::initialize(folder.logs(), "other", QString(), false);
    QCOMPARE(TorkLog::logger(), log);
    QCOMPARE(described(*log), QString("10 1000000 on off off app.log"));
    TorkLog::shutdown();

    QVERIFY(QFile::remove(folder.logs() + "logsettings.cfg"));
    log = TorkLog::initialize(folder.logs(), "third", QString(), false);
    QCOMPARE(described(*log), QString("10 1000000 off off off third.log"));
}

int main(int argc, char** argv)
{
    return ChildProcess::main<tst_TorkLogPreferences>(
        argc, argv,
        {{"without permission", startsWithoutPermission}, {"after shutdown", warnsAfterShutdown}});
}

#include "tst_TorkLogPreferences.moc"
