// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/log/TorkLog.h"
#include "log/LogFolder.h"
#include "log/SavedSettings.h"
#include "support/ChildProcess.h"
#include "support/OpenFiles.h"
#include "support/ProcessLimits.h"
#include "support/TestClock.h"

#include <QStandardPaths>
#include <QtTest>

#include <cstdio>

using namespace SavedSettings;

class tst_TorkLogLifetime : public QObject
{
    Q_OBJECT

private slots:
    void init();
    void cleanup();

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

void tst_TorkLogLifetime::init()
{
    m_handler = qInstallMessageHandler(nullptr);
    qInstallMessageHandler(m_handler);
    m_workingDirectory = QDir::currentPath();
    TestClock::set(QDateTime(QDate(2021, 3, 4), QTime(5, 6, 7, 123)));
}

void tst_TorkLogLifetime::cleanup()
{
    TorkLog::shutdown();
    qInstallMessageHandler(m_handler);
    QDir::setCurrent(m_workingDirectory);
    TestClock::release();
}

// The log directory is created before the settings are saved into it, and then for the first entry.
void tst_TorkLogLifetime::firstStart_data()
{
    QTest::addColumn<QString>("path"); // %1 is replaced with the test's folder
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

void tst_TorkLogLifetime::firstStart()
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

void tst_TorkLogLifetime::firstStartSaves_data()
{
    QTest::addColumn<QString>("prefix");
    QTest::addColumn<bool>("enable");
    QTest::addColumn<QByteArray>("expected");

    QTest::newRow("on") << "app" << true << savedByStart("yes", "app");
    QTest::newRow("off") << "app" << false << savedByStart("no", "app");
    QTest::newRow("empty prefix") << "" << true << savedByStart("yes", "");
    QTest::newRow("prefix with a blank") << "my app" << true << savedByStart("yes", "my app");
}

void tst_TorkLogLifetime::firstStartSaves()
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

void tst_TorkLogLifetime::firstStartInDefaultDirectory_data()
{
    QTest::addColumn<bool>("shortForm");
    QTest::addColumn<QString>("path");

    QTest::newRow("empty path") << false << "";
    QTest::newRow("null path") << false << QString();
    QTest::newRow("only a prefix") << true << QString();
}

void tst_TorkLogLifetime::firstStartInDefaultDirectory()
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
    const QString location = QStandardPaths::writableLocation(QStandardPaths::AppLocalDataLocation);
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

void tst_TorkLogLifetime::fileInPlaceOfDirectory()
{
    LogFolder folder;
    QVERIFY(TestFiles::write(folder.root() + "file", "x"));
    TorkLog* const log = TorkLog::initialize(folder.root() + "file/", "app", QString(), true);
    QVERIFY(log);
    log->trace("lost");
    QVERIFY(!log->errorString().isEmpty());
    QCOMPARE(TestFiles::listing(folder.root()), QStringList({"file: x", "logs/"}));
}

void tst_TorkLogLifetime::initializeInstallsTheMessageHandler()
{
    LogFolder folder;
    TorkLog::initialize(folder.logs(), "app", QString(), true);
    const QtMessageHandler installed = qInstallMessageHandler(nullptr);
    QVERIFY(installed == TorkLog_MessageHandler);
}

void tst_TorkLogLifetime::initializeKeepsThePath_data()
{
    QTest::addColumn<QString>("end");

    QTest::newRow("with a final slash") << "logs/";
    QTest::newRow("without one") << "logs";
    QTest::newRow("not cleaned") << "./logs//";
}

void tst_TorkLogLifetime::initializeKeepsThePath()
{
    QFETCH(QString, end);
    LogFolder folder;
    TorkLog* const log = TorkLog::initialize(folder.root() + end, "app", QString(), true);
    QCOMPARE(log->path(), folder.root() + end);
    QCOMPARE(names(folder.logs()), QStringList("logsettings.cfg"));
}

void tst_TorkLogLifetime::initializeTwice()
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

// Existing settings take precedence over the arguments of the start.
void tst_TorkLogLifetime::laterStart_data()
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

void tst_TorkLogLifetime::laterStart()
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

void tst_TorkLogLifetime::initializeWithShortForm()
{
    LogFolder folder;
    struct Environment
    {
        QByteArray before = qgetenv("XDG_DATA_HOME");
        ~Environment() { qputenv("XDG_DATA_HOME", before); }
    } environment;
    qputenv("XDG_DATA_HOME", QFile::encodeName(folder.root() + "data"));
    const QString location = QStandardPaths::writableLocation(QStandardPaths::AppLocalDataLocation);
    if (!location.startsWith(folder.root()))
        QSKIP("The data location cannot be moved on this system.");

    QVERIFY(TestFiles::write(location + "/logs/logsettings.cfg",
                             config("<filePrefix>other</filePrefix>")));
    TorkLog* const log = TorkLog::initialize("app");
    QCOMPARE(described(*log), QString("10 1000000 on off off other.log"));
}

void tst_TorkLogLifetime::loadingIsTraced()
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
void tst_TorkLogLifetime::loadingOpensTheFileUnderThePrefixGiven()
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

void tst_TorkLogLifetime::loadingOpensTheFileUnderTheLimitInForce()
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

void tst_TorkLogLifetime::loadingIsNotTracedByDisabledLog()
{
    LogFolder folder;
    QVERIFY(TestFiles::write(folder.settingsFile(), config("<filePrefix>other</filePrefix>")));
    TorkLog* const log = TorkLog::initialize(folder.logs(), "app", folder.settingsFile(), false);
    QCOMPARE(folder.listing(), QStringList());
    log->trace("x");
    QCOMPARE(folder.listing(), QStringList("other.log: " + stamped("Trace x\n")));
}

void tst_TorkLogLifetime::malformedSettingsAtStart()
{
    LogFolder folder;
    const QString settings = folder.logs() + "logsettings.cfg";
    const QByteArray text = "<LogSettings><config><maxLogFiles>3</maxLogFiles></other>";
    QVERIFY(TestFiles::write(settings, text));

    TorkLog* const log = TorkLog::initialize(folder.logs(), "app", QString(), true);
    QCOMPARE(described(*log), QString("3 1000000 on off off logdata.log"));
    QCOMPARE(TestFiles::read(settings), text);

    // What happened is reported in three entries of one line each.
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

namespace {

const QFileDevice::Permissions readOnly = QFileDevice::ReadOwner | QFileDevice::ExeOwner;

// Starts and writes with the settings file or the log directory closed; prints the resulting
// settings and the final contents of the directory.
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

void tst_TorkLogLifetime::withoutPermission_data()
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

void tst_TorkLogLifetime::withoutPermission()
{
    QFETCH(QString, closed);
    const ChildProcess::Result child = ChildProcess::run("without permission", {closed});
    if (child.wasSkipped())
        QSKIP("This process cannot become an ordinary user.");

    QVERIFY2(child.ended(), child.report());
    QTEST(child.output, "output");
    QCOMPARE(child.errors, QByteArray());
}

void tst_TorkLogLifetime::shutdown()
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

void tst_TorkLogLifetime::shutdownWithoutLog()
{
    TorkLog::shutdown();
    QVERIFY(!TorkLog::logger());
    TorkLog::shutdown();
    QVERIFY(!TorkLog::logger());
    const QtMessageHandler installed = qInstallMessageHandler(m_handler);
    QVERIFY(installed == m_handler);
}

void tst_TorkLogLifetime::shutdownClosesTheFile()
{
    if (!QFile::exists("/proc/self/fd"))
        QSKIP("No list of open files on this system.");

    LogFolder folder;
    const int before = openFileCount();
    TorkLog::initialize(folder.logs(), "app", QString(), true)->trace("x");
    QCOMPARE(openFileCount(), before + 1);
    TorkLog::shutdown();
    QCOMPARE(openFileCount(), before);
}

// Code that is notified of the end, or logs during it, no longer finds a log.
void tst_TorkLogLifetime::shutdownClearsThePointerFirst()
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

void tst_TorkLogLifetime::messagesAfterShutdown()
{
    LogFolder folder;
    const ChildProcess::Result child = ChildProcess::run("after shutdown", {folder.logs()});
    QVERIFY2(child.ended(), child.report());
    QCOMPARE(child.errors, QByteArray());
    QCOMPARE(names(folder.logs()), QStringList("logsettings.cfg"));
}

void tst_TorkLogLifetime::startAfterShutdown()
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
    return ChildProcess::main<tst_TorkLogLifetime>(
        argc, argv,
        {{"without permission", startsWithoutPermission}, {"after shutdown", warnsAfterShutdown}});
}

#include "tst_TorkLogLifetime.moc"
