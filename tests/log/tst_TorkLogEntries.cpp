// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/log/TorkLog.h"
#include "log/LogAtATime.h"
#include "log/LogFolder.h"
#include "support/TestClock.h"

#include <QTranslator>
#include <QtTest>

#include <ctime>

using namespace LogAtATime;

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

private:
    QtMessageHandler m_handler = nullptr;
    QByteArray m_zone; // null: TZ is not set
};

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
    QTest::newRow("just beyond the last severity") << 5 << "x" << false << QByteArray("T  x\n");
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
    QTest::newRow("after the last") << 5 << "";
    QTest::newRow("far beyond") << 2147483647 << "";
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

namespace {

// Cases that need their own process; the first argument is the log directory.

} // namespace

QTEST_GUILESS_MAIN(tst_TorkLogEntries)

#include "tst_TorkLogEntries.moc"
