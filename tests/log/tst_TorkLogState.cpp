// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/log/TorkLog.h"
#include "common/log/TorkLogLock_p.h"
#include "common/log/TorkLogStamp_p.h"
#include "log/LogAtATime.h"
#include "log/LogFolder.h"
#include "support/ForkedChild.h"
#include "support/PrivateField.h"
#include "support/TestClock.h"

#include <QtTest>

#include <atomic>
#include <chrono>
#include <dlfcn.h>
#include <fcntl.h>
#include <functional>
#include <sys/syscall.h>
#include <sys/wait.h>
#include <thread>
#include <unistd.h>

// What a log keeps in its members beyond what it returns, and what its operations lock.
class tst_TorkLogState : public QObject
{
    Q_OBJECT

private slots:
    void cleanup();

    void firstLogFindsTheHandlerOfQt();
    void clearEmptiesBuffersAndSwitches();
    void isWritingWhileALineIsWritten();
    void waitsForTheLock_data();
    void waitsForTheLock();
    void stampsWaitForTheirLock_data();
    void stampsWaitForTheirLock();
    void formatChangedWhileTheEntryWaits();
    void prefixChangedWhileTheEntryWaits();
    void settingsChangedWhileTheSaveWaits();
    void loadedSettingsWaitForTheLock();
    void qtIsReadyBeforeTheFirstFork();
    void stampKeptAtMidnight_data();
    void stampKeptAtMidnight();
    void stampsMadeInAMoment_data();
    void stampsMadeInAMoment();
    void copyHasItsPermissionsAndAllBytes();
    void oddNamesAndPruning_data();
    void oddNamesAndPruning();
    void nameOfAFileThatIsContinued();
    void lockOfTheFileEndsWithTheEntry();
    void echoHasNoLineNumber();
    void waitsForTheMessage_data();
    void waitsForTheMessage();
};

PRIVATE_FIELD(FileSpec, TorkLog, QString, m_fileSpec);
PRIVATE_FIELD(LogFileName, TorkLog, QString, m_logFileName);
PRIVATE_FIELD(SeverityName, TorkLog, QString, m_severityName);
PRIVATE_FIELD(ConsoleKey, TorkLog, QString, m_outputToConsoleKey);
PRIVATE_FIELD(Console, TorkLog, bool, m_outputToConsole);
PRIVATE_FIELD(Writing, TorkLog, int, m_writing);
PRIVATE_FIELD(Format, TorkLog, QString, m_dateTimeFormat);
PRIVATE_FIELD(Prefix, TorkLog, QString, m_elapsedTimePrefix);
PRIVATE_FIELD(Mutex, TorkLog, QMutex, m_mutex);
using TextSetter = void(QString const&);
PRIVATE_FIELD(SetFilePrefix, TorkLog, TextSetter, setFilePrefix);

namespace {

int s_installedHandlers = 0;
int s_stampsMade = 0;
int s_categoriesAskedFor = 0;
std::function<void()> s_beforeWriting;

// Something that another thread does while this object lives.
class OtherThread
{
public:
    explicit OtherThread(std::function<void()> const& operation)
        : m_thread([this, operation] {
              m_number = syscall(SYS_gettid);
              operation();
              m_isDone = true;
          })
    {}
    ~OtherThread() { m_thread.join(); }
    Q_DISABLE_COPY(OtherThread)

    // Whether it waits for something that this thread holds, however slow the machine is: returns
    // once it sleeps, several times in a row, or is done.
    bool waits() const
    {
        for (int asleep = 0; asleep < 5 && !m_isDone; asleep = sleeps() ? asleep + 1 : 0)
            std::this_thread::sleep_for(std::chrono::milliseconds(1));
        return !m_isDone;
    }

private:
    bool sleeps() const
    {
        QFile status(QString("/proc/self/task/%1/stat").arg(m_number));
        return status.open(QIODevice::ReadOnly) && status.readAll().contains(") S ");
    }

    std::atomic<long> m_number{0};
    std::atomic<bool> m_isDone{false};
    std::thread m_thread;
};

// Whether an operation in another thread waits while this one holds the lock.
bool waits(QMutex& mutex, std::function<void()> const& operation)
{
    mutex.lock();
    const OtherThread other(operation);
    const bool waited = other.waits();
    mutex.unlock();
    return waited;
}

} // namespace

// In place of the C library's: what a log looks like while it writes.
extern "C" ssize_t write(int file, void const* bytes, size_t count)
{
    if (s_beforeWriting)
        s_beforeWriting();
    return syscall(SYS_write, file, bytes, count);
}

// In place of Qt's, which it calls: how often a handler is installed.
QtMessageHandler qInstallMessageHandler(QtMessageHandler handler)
{
    using Install = QtMessageHandler (*)(QtMessageHandler);
    static const auto install = reinterpret_cast<Install>(dlsym(
        RTLD_NEXT, "_Z22qInstallMessageHandlerPFv9QtMsgTypeRK18QMessageLogContextRK7QStringE"));
    ++s_installedHandlers;
    return install(handler);
}

// In place of Qt's, which it calls: how often a stamp is made.
#if QT_VERSION < QT_VERSION_CHECK(6, 0, 0)
QString QDateTime::toString(QString const& format) const
{
    using ToString = QString (*)(QDateTime const*, QString const&);
    static const auto original =
        reinterpret_cast<ToString>(dlsym(RTLD_NEXT, "_ZNK9QDateTime8toStringERK7QString"));
    ++s_stampsMade;
    return original(this, format);
}
#else
QString QLocale::toString(QDateTime const& time, QStringView format) const
{
    using ToString = QString (*)(QLocale const*, QDateTime const&, QStringView);
    static const auto original = reinterpret_cast<ToString>(
        dlsym(RTLD_NEXT, "_ZNK7QLocale8toStringERK9QDateTime11QStringView"));
    ++s_stampsMade;
    return original(this, time, format);
}
#endif

// In place of Qt's, which it calls: how often the category of usual messages is asked for.
QLoggingCategory* QLoggingCategory::defaultCategory()
{
    using Category = QLoggingCategory* (*)();
    static const auto original =
        reinterpret_cast<Category>(dlsym(RTLD_NEXT, "_ZN16QLoggingCategory15defaultCategoryEv"));
    ++s_categoriesAskedFor;
    return original();
}

void tst_TorkLogState::cleanup()
{
    s_beforeWriting = nullptr;
    TestClock::release();
}

// Later other threads may run, whose messages would miss the handler for a moment.
void tst_TorkLogState::firstLogFindsTheHandlerOfQt()
{
    s_installedHandlers = 0;
    TorkLog log(QStringLiteral("/x/"));
    QCOMPARE(s_installedHandlers, 2);
    TorkLog_DefaultMessageHandler();
    QCOMPARE(s_installedHandlers, 2);
}

void tst_TorkLogState::clearEmptiesBuffersAndSwitches()
{
    TorkLog log;
    QCOMPARE(log.*privateField(Console()), false);
    QCOMPARE(log.*privateField(ConsoleKey()), QString("outputToConsole"));
    QCOMPARE(log.*privateField(Writing()), 0);

    log.*privateField(FileSpec()) = "x";
    log.*privateField(LogFileName()) = "x";
    log.*privateField(SeverityName()) = "x";
    log.*privateField(ConsoleKey()) = "x";
    log.*privateField(Console()) = true;
    log.*privateField(Writing()) = 2;
    log.clear();

    for (QString const& text : {log.*privateField(FileSpec()), log.*privateField(LogFileName()),
                                log.*privateField(SeverityName())}) {
        QVERIFY(text.isEmpty());
        QVERIFY(!text.isNull());
    }
    QCOMPARE(log.*privateField(ConsoleKey()), QString("outputToConsole"));
    QCOMPARE(log.*privateField(Console()), false);
    QCOMPARE(log.*privateField(Writing()), 0);
}

void tst_TorkLogState::isWritingWhileALineIsWritten()
{
    LogFolder folder;
    TorkLog log;
    folder.prepare(log, "app");
    log.write("first\n");

    QList<int> seen;
    s_beforeWriting = [&] {
        seen.append(log.*privateField(Writing()));
    };
    log.write("second\n");
    s_beforeWriting = nullptr;

    QCOMPARE(seen, QList<int>{1});
    QCOMPARE(log.*privateField(Writing()), 0);
}

// Whoever needs the lock waits while another thread has it.
void tst_TorkLogState::waitsForTheLock_data()
{
    using Operation = std::function<void(TorkLog&)>;
    QTest::addColumn<Operation>("operation");

    const auto row = [](char const* name, Operation const& operation) {
        QTest::newRow(name) << operation;
    };
    row("clear", [](TorkLog& log) { log.clear(); });
    row("setOutputPath", [](TorkLog& log) { log.setOutputPath("/x/"); });
    row("path", [](TorkLog& log) { log.path(); });
    row("errorString", [](TorkLog& log) { log.errorString(); });
    row("fileSpec", [](TorkLog& log) { log.fileSpec(true); });
    row("newLogFileName", [](TorkLog& log) { log.newLogFileName(); });
    row("currentLogFile", [](TorkLog& log) { log.currentLogFile(); });
    row("open", [](TorkLog& log) { log.open("/"); });
    row("close", [](TorkLog& log) { log.close(); });
    row("entry", [](TorkLog& log) { log.trace("entry"); });
    row("ready line", [](TorkLog& log) { log.write("line\n"); });
    row("setPreferencesFileName", [](TorkLog& log) { log.setPreferencesFileName("/x/y"); });
    row("preferencesFileName", [](TorkLog& log) { log.preferencesFileName(); });
    row("dateTimeFormat", [](TorkLog& log) { log.dateTimeFormat(); });
    row("elapsedTimePrefix", [](TorkLog& log) { log.elapsedTimePrefix(); });
    row("filePrefix", [](TorkLog& log) { log.filePrefix(); });
    row("setFilePrefix", [](TorkLog& log) { (log.*privateField(SetFilePrefix()))("x"); });
}
Q_DECLARE_METATYPE(std::function<void(TorkLog&)>)

void tst_TorkLogState::waitsForTheLock()
{
    QFETCH(std::function<void(TorkLog&)>, operation);
    LogFolder folder;
    TorkLog log;
    folder.prepare(log, "app");

    QVERIFY(waits(log.*privateField(Mutex()), [&] { operation(log); }));
}

// Qt's environment has a lock of its own, which no entry may hold while a process forks.
void tst_TorkLogState::stampsWaitForTheirLock_data()
{
    using Operation = std::function<void(TorkLogLine&)>;
    QTest::addColumn<Operation>("operation");

    const auto row = [](char const* name, Operation const& operation) {
        QTest::newRow(name) << operation;
    };
    row("time of day", [](TorkLogLine&) { TorkLogStamp::TimeOfDay(1); });
    row("kept stamp", [](TorkLogLine& line) { TorkLogStamp::Append(line, 1, 1); });
    row("new stamp", [](TorkLogLine& line) { TorkLogStamp::Make(line, 1, "ss", 1); });
}
Q_DECLARE_METATYPE(std::function<void(TorkLogLine&)>)

void tst_TorkLogState::stampsWaitForTheirLock()
{
    QFETCH(std::function<void(TorkLogLine&)>, operation);
    TorkLogLine line;
    QVERIFY(waits(TorkLogStamp::Mutex(), [&] { operation(line); }));
}

// A thread that has no stamp yet waits for the format.
void tst_TorkLogState::formatChangedWhileTheEntryWaits()
{
    LogFolder folder;
    TorkLog log;
    folder.prepare(log, "app");

    QMutex& mutex = log.*privateField(Mutex());
    mutex.lock();
    {
        const OtherThread other([&log] { log.trace("entry"); });
        other.waits();
        log.*privateField(Format()) = "'later'";
        mutex.unlock();
    }
    QCOMPARE(TestFiles::read(folder.logs() + "app.log"), QByteArray("later Trace entry\n"));
}

// A thread that has its stamp still needs the prefix, and waits for it.
void tst_TorkLogState::prefixChangedWhileTheEntryWaits()
{
    TestClock::set(QDateTime(QDate(2023, 9, 30), QTime(9, 59, 8, 5)));
    LogFolder folder;
    TorkLog log;
    log.setOutputPath(folder.logs());
    folder.configure(log, {{"filePrefix", "app"}, {"logElapsedTime", "yes"}});

    std::atomic<bool> hasStamp{false};
    std::atomic<bool> isLocked{false};
    {
        const OtherThread other([&] {
            log.trace("first");
            hasStamp = true;
            while (!isLocked)
                std::this_thread::yield();
            log.trace("second");
        });
        while (!hasStamp)
            std::this_thread::yield();
        QMutex& mutex = log.*privateField(Mutex());
        mutex.lock();
        isLocked = true;
        other.waits();
        log.*privateField(Prefix()) = "later:";
        mutex.unlock();
    }
    QVERIFY(TestFiles::read(folder.logs() + "app.log").endsWith("T Trace later:[0] second\n"));
}

// A thread that saves the settings waits for them, and not only for the folder's name.
void tst_TorkLogState::settingsChangedWhileTheSaveWaits()
{
    LogFolder folder;
    TorkLog log;
    folder.prepare(log, "app");

    QMutex& mutex = log.*privateField(Mutex());
    mutex.lock();
    {
        const OtherThread other([&log] { log.savePreferences(); });
        other.waits();
        log.*privateField(Prefix()) = "later:";
        mutex.unlock();
    }
    QVERIFY(TestFiles::read(folder.settingsFile()).contains("later:"));
}

// The settings are read without the lock, because that is traced, and set under it.
void tst_TorkLogState::loadedSettingsWaitForTheLock()
{
    LogFolder folder;
    TorkLog::initialize(folder.logs(), "program", folder.settingsFile(), true);
    TorkLog log(folder.logs());
    log.setPreferencesFileName(folder.settingsFile());

    std::atomic<bool> isTracing{false};
    std::atomic<bool> isLocked{false};
    s_beforeWriting = [&] {
        isTracing = true;
        while (!isLocked)
            std::this_thread::yield();
    };
    bool waited = false;
    {
        const OtherThread other([&log] { log.loadPreferences(); });
        while (!isTracing)
            std::this_thread::yield();
        QMutex& mutex = log.*privateField(Mutex());
        mutex.lock();
        isLocked = true;
        waited = other.waits();
        mutex.unlock();
    }
    s_beforeWriting = nullptr;
    TorkLog::shutdown();
    QVERIFY(waited);
    QCOMPARE(log.filePrefix(), QString("program"));
}

// Qt makes it under a lock that a child of fork() would inherit.
void tst_TorkLogState::qtIsReadyBeforeTheFirstFork()
{
    LogFolder folder;
    s_categoriesAskedFor = 0;
    TorkLog::initialize(folder.logs(), "app", folder.settingsFile(), false);
    QVERIFY(s_categoriesAskedFor > 0);
    TorkLog::shutdown();
}

// Midnight is a time of day like any other: a stamp that is kept is written once.
void tst_TorkLogState::stampKeptAtMidnight_data()
{
    QTest::addColumn<QTime>("time");

    QTest::newRow("midnight") << QTime(0, 0, 0, 0);
    QTest::newRow("a millisecond later") << QTime(0, 0, 0, 1);
}

void tst_TorkLogState::stampKeptAtMidnight()
{
    QFETCH(QTime, time);
    TestClock::set(QDateTime(QDate(2021, 3, 4), time));
    LogFolder folder;
    TorkLog log;
    folder.prepare(log, "app");

    log.trace("first");
    log.trace("second");
    log.trace("third");
    QCOMPARE(folder.listing(),
             QStringList("app.log: T Trace first\nT Trace second\nT Trace third\n"));
}

// Qt takes long for one. Only unusually long ones and those in unusually long time zones are made
// for each entry.
void tst_TorkLogState::stampsMadeInAMoment_data()
{
    QTest::addColumn<int>("stampLength");
    QTest::addColumn<QByteArray>("zone"); // null: TZ is not set
    QTest::addColumn<int>("made");        // for two entries

    const auto row = [](char const* name, int length, QByteArray const& zone, int made) {
        QTest::newRow(name) << length << zone << made;
    };
    const QByteArray longest = ":" + QByteArray(63, 'x');
    row("usual", 23, QByteArray(), 1);
    row("time zone", 23, "UTC", 1);
    row("empty time zone", 23, "", 1);
    row("longest stamp that is kept", 64, "UTC", 1);
    row("longer stamp", 65, "UTC", 2);
    row("longest time zone that is kept", 23, longest, 1);
    row("longer time zone", 23, longest + 'x', 2);
}

void tst_TorkLogState::stampsMadeInAMoment()
{
    QFETCH(int, stampLength);
    QFETCH(QByteArray, zone);
    QFETCH(int, made);
    const QByteArray before = qgetenv("TZ");
    LogAtATime::setZone(zone);
    TestClock::set(QDateTime(QDate(2023, 9, 30), QTime(9, 59, 8, 5)));
    LogFolder folder;
    TorkLog log;
    log.setOutputPath(folder.logs());
    const QString format = '\'' + QString(stampLength, '.') + '\'';
    folder.configure(log, {{"dateTimeFormat", format}, {"filePrefix", "app"}});

    s_stampsMade = 0;
    log.trace("x");
    log.trace("x");
    LogAtATime::setZone(before);
    QCOMPARE(s_stampsMade, made);
    const QByteArray entry = QByteArray(stampLength, '.') + " Trace x\n";
    QCOMPARE(TestFiles::read(folder.logs() + "app.log"), entry + entry);
}

void tst_TorkLogState::copyHasItsPermissionsAndAllBytes()
{
    LogFolder folder;
    const QString current = folder.logs() + "app.log";
    const QByteArray text = QByteArray(3 << 16, 'x') + "\n";
    QVERIFY(TestFiles::write(current, text));
    const QFileDevice::Permissions odd = QFileDevice::ReadOwner | QFileDevice::ReadUser |
                                         QFileDevice::WriteOwner | QFileDevice::WriteUser |
                                         QFileDevice::ReadGroup;
    QVERIFY(QFile::setPermissions(current, odd));

    TorkLog log;
    folder.prepare(log, "app", 2048);
    log.deleteOldFiles();

    QFile copy(current + ".1");
    QCOMPARE(copy.permissions(), odd);
    QVERIFY(copy.open(QIODevice::ReadOnly));
    QCOMPARE(copy.readAll(), text);
}

// Number 1 is a link without a target here, which is no older file but is pruned like one, up to
// one above the highest number.
void tst_TorkLogState::oddNamesAndPruning_data()
{
    QTest::addColumn<QString>("name");
    QTest::addColumn<QString>("limit");
    QTest::addColumn<QString>("link");
    QTest::addColumn<bool>("linkStays");

    const auto row = [](char const* name, char const* file, char const* limit, char const* link,
                        bool stays) {
        QTest::newRow(name) << QString::fromLatin1(file) << QString::fromLatin1(limit)
                            << QString::fromLatin1(link) << stays;
    };
    row("letters are no number", "app.log.old", "0", "app.log.1", true);
    row("minus one is no number", "app.log.-1", "0", "app.log.1", true);
    row("nor is minus two", "app.log.-2", "0", "app.log.1", true);
    row("zero is one", "app.log.0", "0", "app.log.1", false);
    row("one above the highest", "app.log.1", "1", "app.log.2", false);
    row("two above the highest", "app.log.1", "1", "app.log.3", true);
}

void tst_TorkLogState::oddNamesAndPruning()
{
    QFETCH(QString, name);
    QFETCH(QString, limit);
    QFETCH(QString, link);
    LogFolder folder;
    QVERIFY(TestFiles::write(folder.logs() + name, "odd"));
    QVERIFY(QFile::link("nowhere", folder.logs() + link));
    TorkLog log;
    log.setOutputPath(folder.logs());
    folder.configure(log, {{"filePrefix", "app"}, {"maxLogFiles", limit}});
    log.deleteOldFiles();

    QTEST(QFileInfo(folder.logs() + link).isSymLink(), "linkStays");
}

// Whoever keeps the reference that newLogFileName() returned sees which file is in use.
void tst_TorkLogState::nameOfAFileThatIsContinued()
{
    LogFolder folder;
    QVERIFY(TestFiles::write(folder.logs() + "app.log", "old\n"));
    TorkLog log;
    folder.prepare(log, "app");
    QString const& name = log.newLogFileName();
    log.setOutputPath("/elsewhere/");
    log.newLogFileName();
    log.setOutputPath(folder.logs());
    QCOMPARE(name, QString("/elsewhere/app.log"));

    log.trace("entry");
    QCOMPARE(name, folder.logs() + "app.log");
}

// Another program that writes to the file would otherwise take it for busy from then on.
void tst_TorkLogState::lockOfTheFileEndsWithTheEntry()
{
    LogFolder folder;
    TorkLog log;
    folder.prepare(log, "app");
    log.trace("first");

    const QByteArray name = QFile::encodeName(folder.logs() + "app.log");
    const pid_t other = fork();
    if (other == 0) {
        struct flock wanted = {};
        wanted.l_type = F_WRLCK;
        const bool asked = ::fcntl(::open(name.constData(), O_RDWR), F_GETLK, &wanted) == 0;
        endForkedChild(asked && wanted.l_type == F_UNLCK ? 0 : 1);
    }
    int status = -1;
    QCOMPARE(waitpid(other, &status, 0), other);
    QCOMPARE(status, 0);
}

// A line of the log has no place in a source.
void tst_TorkLogState::echoHasNoLineNumber()
{
    LogFolder folder;
    TorkLog log;
    folder.prepare(log, "app");
    log.setLogPipeToConsole(true);
    QFile output(folder.root() + "output");
    QVERIFY(output.open(QIODevice::ReadWrite));

    qSetMessagePattern("line %{line}");
    const int before = dup(STDERR_FILENO);
    dup2(output.handle(), STDERR_FILENO);
    log.write("text\n");
    dup2(before, STDERR_FILENO);
    ::close(before);
    qSetMessagePattern("%{if-category}%{category}: %{endif}%{message}");
    qInstallMessageHandler(nullptr);

    QFile written(output.fileName());
    QVERIFY(written.open(QIODevice::ReadOnly));
    QCOMPARE(written.readAll(), QByteArray("line 0\n"));
}

// Otherwise the log would be deleted under a message that another thread writes.
void tst_TorkLogState::waitsForTheMessage_data()
{
    QTest::addColumn<bool>("shutsDown");

    QTest::newRow("shutdown") << true;
    QTest::newRow("initialize") << false;
}

void tst_TorkLogState::waitsForTheMessage()
{
    QFETCH(bool, shutsDown);
    LogFolder folder;
    TorkLog::initialize(folder.logs(), "app", folder.settingsFile(), true);
    qWarning("the file is open");

    std::atomic<bool> isWriting{false};
    std::atomic<bool> mayGoOn{false};
    s_beforeWriting = [&] {
        isWriting = true;
        while (!mayGoOn)
            std::this_thread::yield();
    };
    bool waited = false;
    {
        const OtherThread writer([] { qWarning("message"); });
        while (!isWriting)
            std::this_thread::yield();
        const OtherThread other([&] {
            if (shutsDown)
                TorkLog::shutdown();
            else
                TorkLog::initialize(folder.logs(), "app", folder.settingsFile(), true);
        });
        waited = other.waits();
        mayGoOn = true;
    }
    s_beforeWriting = nullptr;
    TorkLog::shutdown();
    QVERIFY(waited);
}

QTEST_GUILESS_MAIN(tst_TorkLogState)

#include "tst_TorkLogState.moc"
