// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Preferences and health of the log, and the other programs that write to it.

#include "app/runninglog/InstanceList.h"
#include "app/runninglog/LogHealth.h"
#include "app/runninglog/LogPreferences.h"
#include "app/runninglog/RunningLog.h"
#include "support/TestRun.h"

#include <QProcess>
#include <QRegularExpression>
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
    void preferencesManyFiles();
    void preferencesCannotBeSaved();
    void preferencesInAnotherFile();
    void fileNameIsTheOpenOne();
    void isKept_data();
    void isKept();
    void instances();
    void instancesLeaveNothing();
    void instanceLeftBehind();
    void locksOfAnotherComputer();
    void health();
    void healthDirectoryInTheWay();
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

// The log's setter takes a number above 100 down to 100 first.
void tst_RunningLog::preferencesManyFiles()
{
    const TestRun test;
    TorkLog::logger()->setMaxLogFiles(500);
    LogPreferences preferences = LogPreferences::Read();
    QCOMPARE(preferences.maxFiles, 500);
    preferences.maxFiles = 30;
    QCOMPARE(preferences.Apply(), QString());
    QCOMPARE(TorkLog::logger()->maxLogFiles(), 30U);
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
}

void tst_RunningLog::isKept()
{
    QFETCH(QString, text);
    QTEST(LogPreferences::IsStorable(text), "expected");
}

void tst_RunningLog::instances()
{
    const TestRun test;
    const InstanceList own(runningFolder(test));
    QCOMPARE(own.Others(), QList<qint64>());

    QProcess other;
    other.start(QCoreApplication::applicationFilePath(), {"--hold", runningFolder(test)});
    QVERIFY(other.waitForReadyRead(20000));
    QCOMPARE(own.Others(), QList<qint64>({other.processId()}));
    LogHealth health;
    const QString told = health.Check();
    QVERIFY2(told.contains(QString::number(other.processId())), qPrintable(told));

    other.closeWriteChannel();
    QVERIFY(other.waitForFinished());
    QCOMPARE(own.Others(), QList<qint64>());
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

void tst_RunningLog::healthDirectoryInTheWay()
{
    const TestRun test;
    QVERIFY(QDir().mkpath(test.logFile()));
    TorkLog::logger()->trace("lost");
    LogHealth health;
    QVERIFY2(health.Check().startsWith("Cannot write the log: "), qPrintable(health.Check()));
    QVERIFY(QDir(test.logFile()).removeRecursively());
    TorkLog::logger()->trace("kept");
    QCOMPARE(health.Check(), QString());
}

// Started with "--hold FILE" this is another program that shares a log, until its input ends.
int main(int argc, char** argv)
{
    QCoreApplication application(argc, argv);
    if (application.arguments().value(1) == "--hold") {
        const InstanceList instances(application.arguments().value(2));
        QTextStream(stdout) << "held\n" << flush;
        QTextStream(stdin).readAll();
        return 0;
    }
    tst_RunningLog test;
    return QTest::qExec(&test, argc, argv);
}
#include "tst_RunningLog.moc"
