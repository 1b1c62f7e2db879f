// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Preferences and health of the log, and the other programs that write to it.

#include "app/runninglog/InstanceList.h"
#include "app/runninglog/LogHealth.h"
#include "app/runninglog/LogPreferences.h"
#include "app/runninglog/RunningLog.h"
#include "support/ProcessLimits.h"
#include "support/SmallDisk.h"
#include "support/TestRun.h"

#include <QFileSystemWatcher>
#include <QProcess>
#include <QRegularExpression>
#include <QStorageInfo>
#include <QTextStream>
#include <QtTest>

#include <ctime>
#include <fcntl.h>
#include <sys/stat.h>

using namespace Velocor;

class tst_RunningLog : public QObject
{
    Q_OBJECT

private slots:
    void preferences();
    void preferencesInEffect();
    void numberOfFiles_data();
    void numberOfFiles();
    void preferencesCannotBeSaved();
    void preferencesThatDoNotReadBack();
    void pipeInPlaceOfPreferences();
    void withoutALog();
    void preferencesInAnotherFile();
    void fileNameIsTheOpenOne();
    void isKept_data();
    void isKept();
    void filePrefix_data();
    void filePrefix();
    void instances();
    void instanceStays();
    void instancesOfAnotherLog();
    void instancesAreLocksOnly();
    void instancesLeaveNothing();
    void instanceLeftBehind();
    void locksOfAnotherComputer();
    void health();
    void healthDirectoryInTheWay();
    void healthReadOnly();
    void healthFullDisk();
    void healthWithoutALimit();
    void healthTellsOfChanges_data();
    void healthTellsOfChanges();
    void healthFollowsTheLog();
};

// Where the window looks for other programs.
static QString runningFolder(TestRun const& test)
{
    return test.folder() + "data/running-app.log";
}

static bool makeWeeksOld(QString const& path)
{
    const timespec weeksAgo = {time(nullptr) - 30 * 24 * 3600, 0};
    const timespec times[] = {weeksAgo, weeksAgo};
    return utimensat(AT_FDCWD, QFile::encodeName(path).constData(), times, 0) == 0;
}

void tst_RunningLog::preferences()
{
    const TestRun test;
    LogPreferences preferences = LogPreferences::Read();
    QCOMPARE(preferences.dateFormat, QString("yyyy-MM-dd hh:mm:ss.z"));
    QCOMPARE(preferences.filePrefix, QString("app"));
    QCOMPARE(preferences.maxFiles, 10);

    preferences.elapsedTime = true;
    preferences.maxFiles = 7;
    preferences.dateFormat = "hh:mm";
    preferences.elapsedPrefix = "t=";
    preferences.filePrefix = "other";
    QCOMPARE(preferences.Apply(), QString());

    // The first two take effect immediately, the others at the next start.
    QCOMPARE(RunningLog::DateFormat(), QString("yyyy-MM-dd hh:mm:ss.z"));
    QCOMPARE(RunningLog::ElapsedPrefix(), QString("dT:"));
    TorkLog::logger()->trace("x");
    const QByteArray line = TestFiles::read(test.logFile());
    QVERIFY2(line.contains("Trace dT:[") && line.startsWith("20"), line);
    QCOMPARE(TorkLog::logger()->maxLogFiles(), 7U);
    QCOMPARE(LogPreferences::Read().filePrefix, QString("other"));

    // The log opens its file before it knows the other name, and the window follows the file.
    TorkLog::shutdown();
    QVERIFY(QFile::remove(test.logFile()));
    TorkLog::initialize(test.folder() + "data/logs/", "app", QString(), true);
    TorkLog::logger()->trace("x");
    const QByteArray next = TestFiles::read(test.logFile()).split('\n').value(1);
    QVERIFY2(QRegularExpression("\\A\\d\\d:\\d\\d Trace t=\\[").match(QString(next)).hasMatch(),
             next);
    QCOMPARE(RunningLog::FileName(), test.logFile());
    QCOMPARE(RunningLog::DateFormat(), QString("hh:mm"));
    QCOMPARE(RunningLog::ElapsedPrefix(), QString("t="));
}

// Those of the running log, whatever the settings file says.
void tst_RunningLog::preferencesInEffect()
{
    const TestRun test;
    TorkLog* log = TorkLog::logger();
    LogPreferences preferences = LogPreferences::Read();
    QCOMPARE(preferences.enabled, true);
    QCOMPARE(preferences.elapsedTime, false);
    QCOMPARE(preferences.echo, false);

    QVERIFY(log->savePreferences());
    log->setMaxLogFileSize(0); // takes 2048
    log->setEnable(false);
    log->setLogElapsedTime(true);
    log->setLogPipeToConsole(true);
    preferences = LogPreferences::Read();
    QCOMPARE(preferences.enabled, false);
    QCOMPARE(preferences.elapsedTime, true);
    QCOMPARE(preferences.echo, true);
    QCOMPARE(preferences.Apply(), QString());
    log->setEnable(true);
    log->setLogElapsedTime(false);
    log->setLogPipeToConsole(false);
    QVERIFY(log->loadPreferences());
    QCOMPARE(log->maxLogFileSize(), 2048U);
    QCOMPARE(log->enabled(), false);
    QCOMPARE(log->logElapsedTime(), true);
    QCOMPARE(log->logPipeToConsole(), true);

    preferences.enabled = true;
    preferences.elapsedTime = false;
    preferences.echo = false;
    QCOMPARE(preferences.Apply(), QString());
    QCOMPARE(log->enabled(), true);
    QCOMPARE(log->logElapsedTime(), false);
    QCOMPARE(log->logPipeToConsole(), false);
}

void tst_RunningLog::numberOfFiles_data()
{
    QTest::addColumn<uint>("inEffect");
    QTest::addColumn<int>("shown");
    QTest::addColumn<int>("chosen");
    QTest::addColumn<uint>("expected");
    QTest::newRow("more than the setter takes at once") << 500U << 500 << 30 << 30U;
    QTest::newRow("one more than the setter takes") << 101U << 101 << 99 << 99U;
    QTest::newRow("more than are shown") << 4294967295U << 1000000 << 2 << 2U;
    QTest::newRow("as many as are shown") << 1000000U << 1000000 << 2 << 2U;
    QTest::newRow("one less than are shown") << 999999U << 999999 << 2 << 2U;
    QTest::newRow("one") << 10U << 10 << 1 << 1U;
    QTest::newRow("none is one") << 10U << 10 << 0 << 1U;
    QTest::newRow("less than none is one") << 10U << 10 << -1 << 1U;
}

// The log's setter takes a number above 100 down to 100 first.
void tst_RunningLog::numberOfFiles()
{
    QFETCH(uint, inEffect);
    QFETCH(int, chosen);
    const TestRun test;
    TorkLog::logger()->setMaxLogFiles(inEffect);
    LogPreferences preferences = LogPreferences::Read();
    QTEST(preferences.maxFiles, "shown");
    preferences.maxFiles = chosen;
    QCOMPARE(preferences.Apply(), QString());
    QTEST(TorkLog::logger()->maxLogFiles(), "expected");
    QVERIFY(TorkLog::logger()->loadPreferences());
    QTEST(TorkLog::logger()->maxLogFiles(), "expected");
}

void tst_RunningLog::preferencesCannotBeSaved()
{
    const TestRun test;
    LogPreferences preferences = LogPreferences::Read();
    const QString file = LogPreferences::FileName();
    QFile::remove(file);
    QVERIFY(QDir().mkpath(file + "/in the way"));
    preferences.enabled = false;
    preferences.elapsedTime = true;
    preferences.echo = true;
    preferences.maxFiles = 7;
    QCOMPARE(preferences.Apply(), "Unable to save " + file + ": Is a directory");

    // The running log is unchanged.
    TorkLog const* log = TorkLog::logger();
    QCOMPARE(log->enabled(), true);
    QCOMPARE(log->logElapsedTime(), false);
    QCOMPARE(log->logPipeToConsole(), false);
    QCOMPARE(log->maxLogFiles(), 10U);
}

// The dialog refuses such a text. Were it saved, the log would find its settings damaged.
void tst_RunningLog::preferencesThatDoNotReadBack()
{
    const TestRun test;
    LogPreferences preferences = LogPreferences::Read();
    preferences.maxFiles = 7;
    for (char const* text : {"]]>", ""}) {
        preferences.dateFormat = text;
        QCOMPARE(preferences.Apply(), "The settings file " + LogPreferences::FileName() +
                                          " is incomplete after saving.");
        QCOMPARE(TorkLog::logger()->maxLogFiles(), 10U);
    }
}

// Opening it would wait for somebody who writes to it.
void tst_RunningLog::pipeInPlaceOfPreferences()
{
    const TestRun test;
    const QString file = LogPreferences::FileName();
    QFile::remove(file);
    QVERIFY(QDir().mkpath(QFileInfo(file).path()));
    QCOMPARE(mkfifo(QFile::encodeName(file).constData(), 0600), 0);
    QCOMPARE(LogPreferences::Read().filePrefix, QString("app"));
}

void tst_RunningLog::withoutALog()
{
    const TestRun test;
    TorkLog::shutdown();
    QCOMPARE(LogPreferences::FileName(), QString());
    const LogPreferences preferences = LogPreferences::Read();
    QCOMPARE(preferences.enabled, true);
    QCOMPARE(preferences.maxFiles, 10);
    QCOMPARE(preferences.filePrefix, QString());
    QCOMPARE(preferences.dateFormat, QString("yyyy-MM-dd hh:mm:ss.z"));
    QCOMPARE(preferences.elapsedPrefix, QString("dT:"));
    QCOMPARE(preferences.Apply(), QString("There is no log."));
}

void tst_RunningLog::preferencesInAnotherFile()
{
    const TestRun test;
    const QString file = test.folder() + "elsewhere/my.cfg";
    TorkLog::logger()->setPreferencesFileName(file);
    QCOMPARE(LogPreferences::FileName(), file);
    QCOMPARE(LogPreferences::Read().filePrefix, QString("app")); // in effect: no file

    LogPreferences preferences = LogPreferences::Read();
    preferences.maxFiles = 7;
    QCOMPARE(preferences.Apply(), QString());
    TorkLog::logger()->setMaxLogFiles(3);
    QVERIFY(TorkLog::logger()->loadPreferences());
    QCOMPARE(TorkLog::logger()->maxLogFiles(), 7U);
    QCOMPARE(TorkLog::logger()->filePrefix(), QString("app"));
}

// Another log in the folder, newer than the open one, is not mistaken for it.
void tst_RunningLog::fileNameIsTheOpenOne()
{
    const TestRun test;
    TorkLog::logger()->trace("x");
    QVERIFY(QFile::remove(test.logFile()));
    QVERIFY(TestFiles::write(test.folder() + "data/logs/newer.log", "x"));
    QCOMPARE(RunningLog::FileName(), test.logFile());
    TorkLog::shutdown();
    QCOMPARE(RunningLog::FileName(), QString());
}

void tst_RunningLog::isKept_data()
{
    QTest::addColumn<QString>("text");
    QTest::addColumn<bool>("expected");
    QTest::newRow("plain") << "hh:mm" << true;
    QTest::newRow("markup") << "<'x'>" << true;
    QTest::newRow("empty") << "" << false;
    QTest::newRow("end of CDATA") << "]]>" << false;
    QTest::newRow("placeholder") << "%1" << false;
    QTest::newRow("percent") << "%" << true;
    QTest::newRow("umlaut") << QString::fromUtf8("\xC3\xA4") << false;
    QTest::newRow("line feed") << "a\nb" << false;
    QTest::newRow("last control character") << QString(QChar(0x1f)) << false;
    QTest::newRow("blank") << " " << true;
    QTest::newRow("last letter of ASCII") << "~" << true;
    QTest::newRow("delete") << QString(QChar(0x7f)) << false;
}

void tst_RunningLog::isKept()
{
    QFETCH(QString, text);
    QTEST(LogPreferences::IsStorable(text), "expected");
}

void tst_RunningLog::filePrefix_data()
{
    QTest::addColumn<QString>("text");
    QTest::addColumn<bool>("expected");
    QTest::newRow("plain") << "app" << true;
    QTest::newRow("hidden") << ".app" << true;
    QTest::newRow("three dots") << "..." << true;
    QTest::newRow("empty") << "" << false;
    QTest::newRow("this folder") << "." << false;
    QTest::newRow("the folder above") << ".." << false;
    QTest::newRow("in a folder") << "a/b" << false;
    QTest::newRow("line feed") << "a\nb" << false;
}

void tst_RunningLog::filePrefix()
{
    QFETCH(QString, text);
    QTEST(LogPreferences::IsValidFilePrefix(text), "expected");
}

void tst_RunningLog::instances()
{
    const TestRun test;
    const InstanceList own(runningFolder(test));
    QCOMPARE(own.Others(), QList<qint64>());

    QProcess first;
    first.start(QCoreApplication::applicationFilePath(), {"--hold", runningFolder(test)});
    QVERIFY(first.waitForReadyRead(20000));
    QCOMPARE(own.Others(), QList<qint64>({first.processId()}));
    LogHealth health;
    QCOMPARE(health.Check(), QString("Another running program writes to the same log (process %1)")
                                 .arg(first.processId()));

    QProcess second;
    second.start(QCoreApplication::applicationFilePath(), {"--hold", runningFolder(test)});
    QVERIFY(second.waitForReadyRead(20000));
    QStringList both = {QString::number(first.processId()), QString::number(second.processId())};
    both.sort();
    QCOMPARE(health.Check(),
             "Other running programs write to the same log (processes " + both.join(", ") + ")");

    for (QProcess* other : {&first, &second}) {
        other->closeWriteChannel();
        QVERIFY(other->waitForFinished());
    }
    QCOMPARE(own.Others(), QList<qint64>());
    QCOMPARE(health.Check(), QString());
}

// However often it looks for others.
void tst_RunningLog::instanceStays()
{
    const TestRun test;
    LogHealth health;
    for (int i = 0; i < 3; ++i) {
        QCOMPARE(health.Check(), QString());
        QCOMPARE(QDir(runningFolder(test)).entryList(QDir::Files),
                 QStringList(QString("%1.lock").arg(QCoreApplication::applicationPid())));
    }
}

// A program whose log gets another name leaves those that share the first one.
void tst_RunningLog::instancesOfAnotherLog()
{
    const TestRun test;
    LogHealth health;
    QCOMPARE(health.Check(), QString());
    QVERIFY(QFile::exists(runningFolder(test)));
    TorkLog::shutdown();
    TorkLog::initialize(test.folder() + "data/logs/", "other", QString(), true);
    QCOMPARE(health.Check(), QString());
    QVERIFY(!QFile::exists(runningFolder(test)));
    QVERIFY(QFile::exists(test.folder() + "data/running-other.log"));
}

void tst_RunningLog::instancesAreLocksOnly()
{
    const TestRun test;
    const InstanceList own(runningFolder(test));
    QVERIFY(TestFiles::write(runningFolder(test) + "/1.txt", "1\nvelocor\nelsewhere\n"));
    QVERIFY(QDir().mkpath(runningFolder(test) + "/2.lock"));
    const QString pipe = runningFolder(test) + "/3.lock"; // opening it would wait
    QCOMPARE(mkfifo(QFile::encodeName(pipe).constData(), 0600), 0);
    QVERIFY(QFile::link("/dev/null", runningFolder(test) + "/4.lock"));
    const QStringList before = QDir(runningFolder(test)).entryList(QDir::AllEntries | QDir::System);
    QCOMPARE(own.Others(), QList<qint64>());
    QCOMPARE(QDir(runningFolder(test)).entryList(QDir::AllEntries | QDir::System), before);
}

void tst_RunningLog::instancesLeaveNothing()
{
    const TestRun test;
    {
        const InstanceList own(runningFolder(test));
        QVERIFY(QFile::exists(runningFolder(test)));
    }
    QVERIFY(!QFile::exists(runningFolder(test)));
}

// A program that was killed is no longer counted.
void tst_RunningLog::instanceLeftBehind()
{
    const TestRun test;
    const InstanceList own(runningFolder(test));
    QProcess other;
    other.start(QCoreApplication::applicationFilePath(), {"--hold", runningFolder(test)});
    QVERIFY(other.waitForReadyRead(20000));
    other.kill();
    other.waitForFinished();
    QCOMPARE(own.Others(), QList<qint64>());
}

// In a home folder on the network. Nobody here can tell whether that program still runs: it may not
// have touched its lock for weeks.
void tst_RunningLog::locksOfAnotherComputer()
{
    const TestRun test;
    const qint64 own = QCoreApplication::applicationPid();
    const QByteArray another = "\nvelocor\nanother-computer\n";
    for (qint64 process : {own, own + 1}) {
        const QString lock = runningFolder(test) + QString("/%1.lock").arg(process);
        QVERIFY(TestFiles::write(lock, QByteArray::number(process) + another));
        QVERIFY(makeWeeksOld(lock));
    }
    const QStringList before = TestFiles::listing(runningFolder(test));
    {
        const InstanceList instances(runningFolder(test));
        QCOMPARE(instances.Others(), QList<qint64>({own + 1}));
    }
    QCOMPARE(TestFiles::listing(runningFolder(test)), before);
}

void tst_RunningLog::health()
{
    const TestRun test;
    LogHealth health;
    QCOMPARE(health.Check(), QString());
    TorkLog::logger()->setEnable(false);
    QCOMPARE(health.Check(), QString("Logging is off"));
    TorkLog::logger()->setEnable(true);
    QCOMPARE(health.Check(), QString());
    TorkLog::shutdown();
    QCOMPARE(health.Check(), QString("There is no log"));
}

void tst_RunningLog::healthTellsOfChanges_data()
{
    QTest::addColumn<QString>("change");
    for (char const* change :
         {"another program", "no log file", "log file", "an entry", "other permissions"})
        QTest::newRow(change) << change;
}

void tst_RunningLog::healthTellsOfChanges()
{
    QFETCH(QString, change);
    const TestRun test;
    LogHealth health;
    if (change != "log file")
        TorkLog::logger()->trace("an entry");
    QCOMPARE(health.Check(), QString());
    QSignalSpy told(&health, &LogHealth::mayHaveChanged);
    if (change == "another program")
        QVERIFY(TestFiles::write(runningFolder(test) + "/1.lock", "1\n"));
    else if (change == "no log file")
        QVERIFY(QFile::remove(test.logFile()));
    else if (change == "log file")
        TorkLog::logger()->trace("the first entry");
    else if (change == "an entry")
        TorkLog::logger()->trace("another entry");
    else
        QVERIFY(QFile::setPermissions(test.logFile(), QFile::ReadOwner));
    QTRY_VERIFY_WITH_TIMEOUT(told.count() > 0, 20000);
}

// Changes of the file that was the log's before are nobody's concern any more.
void tst_RunningLog::healthFollowsTheLog()
{
    const TestRun test;
    LogHealth health;
    const auto isWatched = [&health](QString const& path) {
        auto const* watcher = health.findChild<QFileSystemWatcher*>();
        return (watcher->files() + watcher->directories()).contains(path);
    };
    TorkLog::logger()->trace("an entry");
    QCOMPARE(health.Check(), QString());
    QVERIFY(isWatched(test.logFile()));
    TorkLog::shutdown();
    TorkLog::initialize(test.folder() + "data/logs/", "other", QString(), true);
    TorkLog::logger()->trace("an entry");
    QCOMPARE(health.Check(), QString());
    QVERIFY(isWatched(RunningLog::FileName()));
    QVERIFY(!isWatched(test.logFile()));
}

void tst_RunningLog::healthDirectoryInTheWay()
{
    const TestRun test;
    QVERIFY(QDir().mkpath(test.logFile()));
    LogHealth health;
    QCOMPARE(health.Check(), "Cannot write the log: " + test.logFile() + " is not writable");
    TorkLog::logger()->trace("lost");
    const QString error = TorkLog::logger()->errorString();
    QVERIFY(!error.isEmpty());
    QCOMPARE(health.Check(), "Cannot write the log: " + error);
    QVERIFY(QDir(test.logFile()).removeRecursively());
    TorkLog::logger()->trace("kept");
    QVERIFY(!TorkLog::logger()->errorString().isEmpty());
    QCOMPARE(health.Check(), QString());
}

void tst_RunningLog::healthReadOnly()
{
    const TestRun test("old\n");
    const QFile::Permissions forAll = QFile::ReadOwner | QFile::ReadGroup | QFile::ReadOther;
    const QFile::Permissions toEnter = QFile::ExeOwner | QFile::ExeGroup | QFile::ExeOther;
    QVERIFY(QFile::setPermissions(test.logFile(), forAll));
    for (char const* folder : {"", "data", "data/logs"}) {
        QVERIFY(
            QFile::setPermissions(test.folder() + folder, forAll | toEnter | QFile::WriteOwner));
    }
    QProcess other;
    other.start(QCoreApplication::applicationFilePath(), {"--health", test.folder()});
    QVERIFY(other.waitForFinished());
    QCOMPARE(QString(other.readAll()),
             "Cannot write the log: " + test.logFile() + " is not writable");
}

void tst_RunningLog::healthFullDisk()
{
    const TestRun test;
    QVERIFY(QDir().mkpath(test.folder() + "data/logs"));
    const SmallDisk disk(test.folder() + "data/logs/");
    if (!disk.isMounted)
        QSKIP("No file system can be mounted here.");
    LogHealth health;
    QCOMPARE(health.Check(), QString());
    QVERIFY(disk.fill());
    QCOMPARE(health.Check(), QString("Cannot write the log: the disk is full"));
    QVERIFY(disk.makeRoom());
    QCOMPARE(health.Check(), QString());
}

// Not every file system says how large it is; one in memory may have no limit.
void tst_RunningLog::healthWithoutALimit()
{
    const TestRun test;
    TorkLog::shutdown();
    TorkLog::initialize("/proc/", "app", QString(), true);
    if (QStorageInfo("/proc").bytesTotal() != 0)
        QSKIP("This file system has a size.");
    QCOMPARE(RunningLog::FileName(), QString("/proc/app.log"));
    QCOMPARE(LogHealth().Check(), QString());
}

// With "--hold FOLDER", this is another program that shares a log until its input ends; with
// "--health FOLDER" one of an ordinary user, who shows the health of the log there.
int main(int argc, char** argv)
{
    QCoreApplication application(argc, argv);
    const QString folder = application.arguments().value(2);
    if (application.arguments().value(1) == "--hold") {
        const InstanceList instances(folder);
        QTextStream(stdout) << "held\n";
        QTextStream(stdin).readAll();
        return 0;
    }
    if (application.arguments().value(1) == "--health") {
        application.setProperty("DataPath", folder + "data/");
        TorkLog::initialize(folder + "data/logs/", "app", QString(), true);
        if (ProcessLimits::becomeOrdinaryUser())
            QTextStream(stdout) << LogHealth().Check();
        return 0;
    }
    tst_RunningLog test;
    return QTest::qExec(&test, argc, argv);
}
#include "tst_RunningLog.moc"
