// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/log/TorkLog.h"
#include "log/LogFolder.h"
#include "log/SavedSettings.h"
#include "support/MessageCapture.h"
#include "support/PrivateField.h"
#include "support/TestClock.h"

#include <QtTest>

using namespace SavedSettings;

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

    void settersAreKeptInMemory();

private:
    QtMessageHandler m_handler;
    QString m_workingDirectory;
};

PRIVATE_FIELD(PreferencesFileName, TorkLog, QString, m_preferencesFileName);

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

// Saving succeeds in every case, according to its result.
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

// Before each load 33 files of 2048 bytes are set: what an invalid number leaves unchanged.
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

// Entries show the settings in effect.
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

// What was read before the fault is kept, the rest has its defaults.
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
    row("text after the root element", "<LogSettings></LogSettings>x", loadDefaults);
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

    QTest::newRow("after the last") << 2;
    QTest::newRow("far beyond") << 2147483647;
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

QTEST_GUILESS_MAIN(tst_TorkLogPreferences)

#include "tst_TorkLogPreferences.moc"
