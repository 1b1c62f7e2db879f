// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/log/TorkLog.h"
#include "log/LogAtATime.h"
#include "log/LogFolder.h"
#include "support/ChildProcess.h"
#include "support/ProcessLimits.h"
#include "support/TestClock.h"

#include <QTranslator>
#include <QtTest>

#include <csignal>
#include <ctime>

using namespace LogAtATime;

class tst_TorkLogMessages : public QObject
{
    Q_OBJECT

private slots:
    void init();
    void cleanup();

    void messageHandler_data();
    void messageHandler();
    void messageHandlerWithoutLog();
    void qtMessages_data();
    void qtMessages();
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

void tst_TorkLogMessages::init()
{
    m_zone = qgetenv("TZ");
    m_handler = qInstallMessageHandler(nullptr);
    qInstallMessageHandler(m_handler);
    TestClock::set(now());
}

void tst_TorkLogMessages::cleanup()
{
    TorkLog::shutdown();
    qInstallMessageHandler(m_handler);
    setZone(m_zone);
    tzset();
    TestClock::release();
}

void tst_TorkLogMessages::messageHandler_data()
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

// Whatever the context: it is ignored.
void tst_TorkLogMessages::messageHandler()
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

void tst_TorkLogMessages::messageHandlerWithoutLog()
{
    LogFolder folder;
    QVERIFY(QDir::setCurrent(folder.root()));
    TorkLog_MessageHandler(QtWarningMsg, QMessageLogContext(), QStringLiteral("lost"));
    QCOMPARE(TestFiles::listing(folder.root()), QStringList("logs/"));
    QVERIFY(QDir::setCurrent("/"));
}

void tst_TorkLogMessages::qtMessages_data()
{
    QTest::addColumn<int>("type");
    QTest::addColumn<QByteArray>("expected");

    QTest::newRow("debug stream") << 0 << QByteArray("Trace a \"b\\n\" 3");
    QTest::newRow("debug text") << 1 << QByteArray("Trace a 3");
    QTest::newRow("info") << 2 << QByteArray("Trace a");
    QTest::newRow("warning") << 3 << QByteArray("Warning a");
    QTest::newRow("critical") << 4 << QByteArray("Error a");
    QTest::newRow("Qt's own") << 5 << QByteArray("Warning QDir::mkpath: Empty or null file name");
}

void tst_TorkLogMessages::qtMessages()
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

TorkLog* startLog(QString const& path)
{
    TestClock::set(now());
    return TorkLog::initialize(path, QStringLiteral("app"), QString(), true);
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

// Qt complains about the empty path while the log's own lock is held.
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

void tst_TorkLogMessages::fatalMessage()
{
    LogFolder folder;
    const ChildProcess::Result child = ChildProcess::run("fatal", {folder.logs()});
    QVERIFY2(child.inTime && child.crashed, child.report());
    QCOMPARE(child.exitCode, SIGABRT);
    QCOMPARE(TestFiles::read(folder.logs() + "app.log"), stamped("Fatal the end\n"));
}

void tst_TorkLogMessages::echo_data()
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

void tst_TorkLogMessages::echo()
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

void tst_TorkLogMessages::echoStaysOutOfTheLog()
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

// Also where it was not installed before: that is how Qt messages reach the log again.
void tst_TorkLogMessages::echoInstallsTheMessageHandler()
{
    LogFolder folder;
    const ChildProcess::Result child = ChildProcess::run("echo of another log", {folder.logs()});
    QVERIFY2(child.ended(), child.report());
    QCOMPARE(child.errors, QByteArray("\"x\\n\"\n"));
}

void tst_TorkLogMessages::nothingToEcho_data()
{
    QTest::addColumn<QString>("reason");

    QTest::newRow("switched off") << "switched off";
    QTest::newRow("log off") << "log off";
    QTest::newRow("no file") << "no file";
}

void tst_TorkLogMessages::nothingToEcho()
{
    QFETCH(QString, reason);
    LogFolder folder;
    const ChildProcess::Result child = ChildProcess::run("no echo", {folder.logs(), reason});
    QVERIFY2(child.ended(), child.report());
    QCOMPARE(child.errors, QByteArray());
    QCOMPARE(child.output, QByteArray());
}

void tst_TorkLogMessages::messageUnderTheLock_data()
{
    QTest::addColumn<QString>("kind");
    QTest::addColumn<QByteArray>("errors");

    const QByteArray complaint = "QDir::mkpath: Empty or null file name\n";
    QTest::newRow("entry") << "entry" << complaint;
    QTest::newRow("message") << "message" << complaint;
    QTest::newRow("entry with echo") << "echo" << complaint + '"' + stamped("Warning x\\n\"\n");
}

// It goes to Qt's default output, once, and the entry is written.
void tst_TorkLogMessages::messageUnderTheLock()
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

// A message that is raised there is an ordinary entry.
void tst_TorkLogMessages::entryIsBuiltOutsideTheLock()
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
    return ChildProcess::main<tst_TorkLogMessages>(
        argc, argv,
        {{"fatal", endsFatally},
         {"echo", echoes},
         {"echo of messages", echoesMessages},
         {"echo of another log", echoesOfAnotherLog},
         {"no echo", echoesNothing},
         {"message under the lock", warnsUnderTheLock},
         {"message of a translator", talksWhileAnEntryIsBuilt}});
}

#include "tst_TorkLogMessages.moc"
