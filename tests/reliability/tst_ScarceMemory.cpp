// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Every allocation of the framework fails once, and every one together with all later ones: each in
// a process of its own, which ends as programs end that run out of memory, or goes on. The test
// continues until an operation completes before its shortage occurs.
//
//     VELOCOR_SHORTAGES        1: every allocation; 5: every fifth
//     VELOCOR_START_SHORTAGES  the same for the start of the program

#include "app/LaunchOptionParser.h"
#include "common/config/TorkConfigFile.h"
#include "common/log/TorkLog.h"
#include "common/xml/TorkErrorHandler.h"
#include "common/xml/TorkXmlFile.h"
#include "common/xml/TorkXmlGuard.h"
#include "common/xml/TorkXml_FlushUnknownElement.h"
#include "common/xml/TorkXml_ParseManager_Base.h"
#include "common/xml/TorkXml_ParseState_Base.h"
#include "log/LogFolder.h"
#include "reliability/CrashSite.h"
#include "reliability/Figures.h"
#include "reliability/SampleConfiguration.h"
#include "reliability/ScarceMemory.h"
#include "support/ProcessLimits.h"

#include <QXmlSimpleReader>
#include <QtTest>

#include <atomic>
#include <csignal>
#include <cstdio>
#include <fcntl.h>
#include <numeric>
#include <sys/mman.h>
#include <sys/wait.h>
#include <thread>
#include <unistd.h>

class tst_ScarceMemory : public QObject
{
    Q_OBJECT

private slots:
    void init();
    void cleanup();
    void shortage_data();
    void shortage();
    void start_data();
    void start();
    void cleanupTestCase();

private:
    QtMessageHandler m_handler = nullptr;
    bool m_failed = false;
};

namespace {

// What the process that runs out of memory has done, in memory that outlives it.
struct Progress
{
    std::atomic<int> returned;   // calls of writeEntry()
    std::atomic<bool> isRefused; // the log reported that it cannot open its file
    std::atomic<bool> isOver;
    std::atomic<bool> isReached;
    std::atomic<bool> isCrashOfQt;
    char wrong[1000];
};

Progress* s_progress = nullptr;
int s_shortages = 0;
int s_aborts = 0;
int s_crashes = 0;

// Called in the process that runs out of memory. The last text is the one reported.
void require(bool isTrue, char const* what)
{
    if (!isTrue)
        std::snprintf(s_progress->wrong, sizeof s_progress->wrong, "%s", what);
}

#define REQUIRE(condition) require(condition, #condition)

void startShortage(int step, bool lasts)
{
    ScarceMemory::failAt(step, lasts ? ScarceMemory::FromThereOn : ScarceMemory::Once);
}

void endShortage()
{
    ScarceMemory::mend();
}

// The settings of every log here.
void configure(LogFolder const& folder, TorkLog& log)
{
    folder.configure(log, {{"filePrefix", "app"}, {"maxLogFileSize", "100"}, {"maxLogFiles", "3"}});
}

void prepare(LogFolder const& folder, TorkLog& log)
{
    log.setOutputPath(folder.logs());
    configure(folder, log);
}

QByteArray entry(int number)
{
    return "T Error <entry " + QByteArray::number(number) + ' ' + QByteArray(10 * number, 'e') +
           ">\n";
}

// Of the line of an entry, the message.
QString message(int number)
{
    return QString::fromLatin1(entry(number).mid(8).chopped(1));
}

// Writes the next entry and notes that the call returned.
void writeEntry(TorkLog& log)
{
    const int number = s_progress->returned + 1;
    log.error(message(number));
    if (!log.errorString().isEmpty())
        s_progress->isRefused = true;
    s_progress->returned = number;
}

// The same as a message of Qt.
void writeMessage()
{
    const int number = s_progress->returned + 1;
    qCritical("%s", qPrintable(message(number)));
    s_progress->returned = number;
}

const QByteArray full = "full\n" + QByteArray(120, 'c') + '\n';
const QByteArrayList older = {"first\n", "second\n", "third\n"};

void makeOlderFiles(LogFolder const& folder)
{
    TestFiles::write(folder.logs() + "app.log", full);
    for (int i = 0; i < older.size(); ++i)
        TestFiles::write(folder.logs() + "app.log." + QString::number(i + 1), older[i]);
}

QString configurationFile(LogFolder const& folder)
{
    return folder.root() + "viewer.cfg";
}

void makeConfiguration(LogFolder const& folder)
{
    TestFiles::write(configurationFile(folder), SampleConfiguration::oldBytes);
}

// A document and the states that read it.
const QByteArray document = "<?xml version=\"1.0\"?>\n<!DOCTYPE shelf [<!ENTITY e \"echo\">]>\n"
                            "<shelf xmlns:x=\"urn:x\">\n<book x:href=\"one\">text &e;</book>\n"
                            "<other><deep>skipped</deep></other>\n</shelf>\n";

class ShelfState : public TorkXml_ParseState_Base
{
public:
    ShelfState(QString const& element, TorkXml_ParseManager_Base* manager, QString* read)
        : TorkXml_ParseState_Base(element, manager), m_manager(manager), m_read(read)
    {}
    TorkXml_ParseState_Base* GetNextState(QString const& name) override
    {
        if (name == "book")
            return new ShelfState(name, m_manager, m_read);
        return new TorkXml_FlushUnknownElement(name, m_manager);
    }
    bool ProcessContent(QString const& name, QString const& value) override
    {
        *m_read += name + '=' + value.trimmed() + ' ';
        return true;
    }

private:
    TorkXml_ParseManager_Base* m_manager;
    QString* m_read;
};

class ShelfReader : public TorkXml_ParseManager_Base
{
public:
    TorkXml_ParseState_Base* GetFirstState(QString const& name) override
    {
        return new ShelfState(name, this, &read);
    }
    QString read;
};

QString readShelf(QByteArray const& bytes)
{
    QBuffer device;
    device.setData(bytes);
    TorkXmlGuard source(&device);
    QXmlSimpleReader reader;
    source.Watch(reader);
    ShelfReader manager;
    TorkErrorHandler errors(nullptr);
    reader.setContentHandler(&manager);
    reader.setErrorHandler(&errors);
    const bool isRead = reader.parse(source);
    QString report;
    manager.FormatErrors(report);
    return (isRead ? QString("read: ") : QString("failed: ")) + manager.read;
}

void writeDocument(QString const& path)
{
    TorkXmlFile writer(path);
    if (!writer.open(QIODevice::WriteOnly))
        return;
    writer.WriteElementStart("library", 1);
    writer.WriteElement("title", "Research & development");
    writer.WriteElementOpen("shelf", 1);
    writer.WriteAttribute("id", "7");
    writer.WriteElementCloseAndEnd("shelf", 1);
    writer.WriteElementEnd("library", 1);
    writer.close();
}

const QByteArray writtenDocument =
    "<library>\n  <title><![CDATA[Research & development]]></title>\n"
    "  <shelf  id=\"7\"/>\n</library>\n";

// What allocates, in a process of its own. Everything before startShortage() and after
// endShortage() has memory.
using Operation = void (*)(LogFolder const& folder, int step, bool lasts);

void entriesInOpenFile(LogFolder const& folder, int step, bool lasts)
{
    TorkLog log;
    prepare(folder, log);
    writeEntry(log);
    startShortage(step, lasts);
    writeEntry(log);
    log.write("a raw line that is longer than what fits on the stack: " + QString(600, 'r') + '\n');
    writeEntry(log);
    endShortage();
    writeEntry(log);
}

void firstEntry(LogFolder const& folder, int step, bool lasts)
{
    TorkLog log;
    log.setOutputPath(folder.root() + "new/folder/");
    configure(folder, log);
    startShortage(step, lasts);
    writeEntry(log);
    endShortage();
    writeEntry(log);
}

void entryThatRotates(LogFolder const& folder, int step, bool lasts)
{
    TorkLog log;
    prepare(folder, log);
    startShortage(step, lasts);
    writeEntry(log);
    endShortage();
    writeEntry(log);
}

void entryThatTrims(LogFolder const& folder, int step, bool lasts)
{
    TestFiles::write(folder.logs() + "app.log",
                     QByteArray(40, 'a') + '\n' + QByteArray(28, 'b') + '\n');
    TorkLog log;
    prepare(folder, log);
    writeEntry(log);
    startShortage(step, lasts);
    writeEntry(log);
    endShortage();
    writeEntry(log);
}

void closing(LogFolder const& folder, int step, bool lasts)
{
    TorkLog log;
    prepare(folder, log);
    writeEntry(log);
    writeEntry(log);
    startShortage(step, lasts);
    log.close();
    log.currentLogFile();
    log.newLogFileName();
    endShortage();
}

void messagesOfQt(LogFolder const& folder, int step, bool lasts)
{
    TestFiles::write(folder.settingsFile(),
                     LogFolder::settingsText({{"filePrefix", "app"}, {"dateTimeFormat", "'T'"}}));
    TorkLog::initialize(folder.logs(), "app", folder.settingsFile(), false);
    writeMessage();
    startShortage(step, lasts);
    writeMessage();
    qDebug() << "list" << QStringList({"a", "b"});
    qWarning() << QSize(1, 2);
    writeMessage();
    endShortage();
    writeMessage();
}

// Programs end like this by themselves, too.
void fatalMessage(LogFolder const& folder, int step, bool lasts)
{
    prepare(folder, *TorkLog::initialize(folder.logs(), "app", folder.settingsFile(), false));
    writeMessage();
    startShortage(step, lasts);
    qFatal("the end");
}

void firstStart(LogFolder const& folder, int step, bool lasts)
{
    startShortage(step, lasts);
    TorkLog* const log = TorkLog::initialize(folder.root() + "new/", "app", QString(), true);
    qDebug("started");
    endShortage();
    REQUIRE(log->preferencesFileName().endsWith("new/logsettings.cfg"));
    TorkLog::shutdown();
    REQUIRE(TestFiles::read(folder.root() + "new/logsettings.cfg").endsWith("</LogSettings>\n"));
    REQUIRE(TestFiles::read(folder.root() + "new/app.log").contains("Trace started\n"));
}

void laterStart(LogFolder const& folder, int step, bool lasts)
{
    TestFiles::write(folder.settingsFile(),
                     LogFolder::settingsText(
                         {{"filePrefix", "app"}, {"dateTimeFormat", "'T'"}, {"maxLogFiles", "3"}}));
    startShortage(step, lasts);
    TorkLog* const log = TorkLog::initialize(folder.logs(), "app", folder.settingsFile(), false);
    writeEntry(*log);
    TorkLog::shutdown();
    endShortage();
    REQUIRE(log);
}

void settingsSaved(LogFolder const& folder, int step, bool lasts)
{
    TorkLog log;
    prepare(folder, log);
    log.setMaxLogFiles(7);
    startShortage(step, lasts);
    log.savePreferences();
    endShortage();
    REQUIRE(TestFiles::read(folder.settingsFile()).contains("<maxLogFiles>7</maxLogFiles>"));
}

void settingsLoaded(LogFolder const& folder, int step, bool lasts)
{
    TorkLog log;
    log.setOutputPath(folder.logs());
    TestFiles::write(folder.settingsFile(),
                     LogFolder::settingsText({{"filePrefix", "app"},
                                              {"dateTimeFormat", "'T'"},
                                              {"maxLogFiles", "7"},
                                              {"elapsedTimePrefix", "after "}}));
    log.setPreferencesFileName(folder.settingsFile());
    startShortage(step, lasts);
    const bool isLoaded = log.loadPreferences();
    endShortage();
    REQUIRE(isLoaded);
    REQUIRE(log.maxLogFiles() == 7);
    REQUIRE(log.elapsedTimePrefix() == "after ");
    writeEntry(log);
}

void configurationLoaded(LogFolder const& folder, int step, bool lasts)
{
    TestFiles::write(configurationFile(folder), SampleConfiguration::newBytes);
    TorkConfigFile configuration(configurationFile(folder));
    startShortage(step, lasts);
    const bool isLoaded = configuration.Load();
    endShortage();
    REQUIRE(isLoaded);
    REQUIRE(SampleConfiguration::value(configuration, "b") == "2");
    REQUIRE(SampleConfiguration::value(configuration, "c") == "x & y");
}

// A file that does not parse is not taken for an empty one, nor for one that does.
void damagedConfigurationLoaded(LogFolder const& folder, int step, bool lasts)
{
    TestFiles::write(configurationFile(folder), SampleConfiguration::newBytes.left(50));
    TorkConfigFile configuration(configurationFile(folder));
    startShortage(step, lasts);
    const bool isLoaded = configuration.Load();
    endShortage();
    REQUIRE(!isLoaded);
    REQUIRE(configuration.m_lastError == "ConfigFile - Could not parse the input file.");
}

void configurationSaved(LogFolder const& folder, int step, bool lasts)
{
    TorkConfigFile configuration(configurationFile(folder));
    startShortage(step, lasts);
    SampleConfiguration::fill(configuration);
    configuration.Save();
    endShortage();
    REQUIRE(TestFiles::read(configurationFile(folder)) == SampleConfiguration::newBytes);
}

void configurationReplaced(LogFolder const& folder, int step, bool lasts)
{
    TorkConfigFile configuration(configurationFile(folder));
    SampleConfiguration::fill(configuration);
    startShortage(step, lasts);
    const bool isSaved = configuration.SaveAtomically();
    endShortage();
    REQUIRE(isSaved);
    REQUIRE(TestFiles::read(configurationFile(folder)) == SampleConfiguration::newBytes);
}

QString s_readDocument; // with enough memory

void documentRead(LogFolder const&, int step, bool lasts)
{
    startShortage(step, lasts);
    const QString read = readShelf(document);
    endShortage();
    REQUIRE(read == s_readDocument);
}

void damagedDocumentRead(LogFolder const&, int step, bool lasts)
{
    startShortage(step, lasts);
    const QString read = readShelf(document.left(140));
    endShortage();
    REQUIRE(read.startsWith("failed: shelf= xlink:href=one "));
}

void documentWritten(LogFolder const& folder, int step, bool lasts)
{
    startShortage(step, lasts);
    writeDocument(configurationFile(folder));
    endShortage();
    REQUIRE(TestFiles::read(configurationFile(folder)) == writtenDocument);
}

void launchDataRead(LogFolder const&, int step, bool lasts)
{
    startShortage(step, lasts);
    LaunchOptionParser parser;
    parser.AddOption(new LaunchOption("product", "product", "p", 1, "default"));
    QString text = "<appdata><product><arg>Library</arg></product></appdata>";
    const bool isRead = parser.ParseOptions(text);
    endShortage();
    REQUIRE(isRead);
    REQUIRE(parser.errorText.isEmpty());
}

// What the files must look like in the end; an empty text if they do.
using Check = QString (*)(LogFolder const& folder);

QByteArray allEntries(LogFolder const& folder)
{
    QByteArray content;
    for (QString const& logs :
         {folder.logs(), folder.root() + "new/", folder.root() + "new/folder/"}) {
        for (int number = 9; number >= 0; --number) {
            const QString name = logs + "app.log" + (number ? '.' + QString::number(number) : "");
            if (QFile::exists(name))
                content += TestFiles::read(name);
        }
    }
    return content;
}

// Every entry whose call returned is there once, unless the log could not open its file.
QString entriesAreThere(LogFolder const& folder, int first)
{
    const QByteArray content = allEntries(folder);
    for (int number = first; number <= s_progress->returned; ++number) {
        const int found = content.count(entry(number));
        if (found != 1 && !(found == 0 && s_progress->isRefused))
            return QString("entry %1 of %2 is there %3 times:\n%4")
                .arg(number)
                .arg(s_progress->returned)
                .arg(found)
                .arg(QString::fromLatin1(content));
    }
    return QString();
}

QString entriesAreThere(LogFolder const& folder)
{
    return entriesAreThere(folder, 1);
}

// Trimming drops all that the file held before.
QString laterEntriesAreThere(LogFolder const& folder)
{
    return entriesAreThere(folder, 2);
}

// The file that was rotated and the older ones, but for the oldest above the limit, are whole.
QString olderFilesAreThere(LogFolder const& folder)
{
    const QByteArray content = allEntries(folder);
    if (!content.contains(full))
        return "the rotated file is lost";
    if (!content.contains(older[1] + older[0]))
        return "an older file is lost";
    return entriesAreThere(folder);
}

// The old file, or as much of the new one as was written.
QString beginsAsSaved(LogFolder const& folder)
{
    const QByteArray left = TestFiles::read(configurationFile(folder));
    return left == SampleConfiguration::oldBytes || SampleConfiguration::newBytes.startsWith(left)
               ? QString()
               : "neither old nor new: " + QString::fromLatin1(left);
}

QString isOldOrNew(LogFolder const& folder)
{
    const QByteArray left = TestFiles::read(configurationFile(folder));
    TorkConfigFile configuration(configurationFile(folder));
    SampleConfiguration::fill(configuration);
    if (left != SampleConfiguration::oldBytes && left != SampleConfiguration::newBytes)
        return "neither old nor new: " + QString::fromLatin1(left);
    return configuration.SaveAtomically() ? QString() : configuration.m_lastError;
}

QString isAnything(LogFolder const&)
{
    return QString();
}

// Everything below the folder but for what a scene may create.
QStringList namesBelow(LogFolder const& folder)
{
    static const QRegularExpression mayBeCreated(
        "^(logs/app\\.log(\\.\\d)?|viewer\\.cfg(\\.saving)?|settings\\.cfg|"
        "new/|new/folder/|new/(folder/)?(app\\.log|logsettings\\.cfg))$");
    QStringList names = TestFiles::listing(folder.root());
    for (QString& name : names)
        name = name.section(": ", 0, 0);
    for (int i = names.size() - 1; i >= 0; --i) {
        if (mayBeCreated.match(names[i]).hasMatch())
            names.removeAt(i);
    }
    return names;
}

void makeOthers(LogFolder const& folder)
{
    TestFiles::write(folder.logs() + "app.log.old", "not numbered\n");
    TestFiles::write(folder.logs() + "application.log.1", "of another log\n");
    TestFiles::write(folder.root() + "notes.txt", "of the user\n");
    QDir(folder.root()).mkdir("temp");
}

bool othersAreUntouched(LogFolder const& folder)
{
    return TestFiles::read(folder.logs() + "app.log.old") == "not numbered\n" &&
           TestFiles::read(folder.logs() + "application.log.1") == "of another log\n" &&
           TestFiles::read(folder.root() + "notes.txt") == "of the user\n" &&
           namesBelow(folder) == QStringList({"logs/", "logs/app.log.old", "logs/application.log.1",
                                              "notes.txt", "temp/"});
}

// In a few places Qt does not check what it allocates, and crashes. Nobody else may.
void noteCrash(int signal)
{
    ScarceMemory::mend();
    s_progress->isCrashOfQt = QByteArray(CrashSite::file()).startsWith("libQt");
    std::signal(signal, SIG_DFL);
    std::raise(signal);
}

// Runs an operation in a process of its own.
//
// @return the status of the process
int runStarved(Operation operation, LogFolder const& folder, int step, bool lasts)
{
    new (s_progress) Progress{};
    const pid_t process = fork();
    if (process == 0) {
        ProcessLimits::leaveNoCoreFile();
        alarm(60); // ends one that hangs
        qputenv("TMPDIR", QFile::encodeName(folder.root() + "temp"));
        const int nowhere = open("/dev/null", O_WRONLY);
        dup2(nowhere, STDERR_FILENO);
        std::signal(SIGSEGV, noteCrash);
        std::signal(SIGABRT, [](int) { s_progress->isReached = ScarceMemory::reached(); });
        // In a thread, so that nobody catches anything: QtTest would.
        std::thread([&] {
            QThread::currentThread(); // as if Qt had started the thread
            operation(folder, step, lasts);
            s_progress->isReached = ScarceMemory::reached();
            s_progress->isOver = true;
            _exit(0);
        }).join();
    }
    int status = -1;
    waitpid(process, &status, 0);
    return status;
}

// A new program finds nothing in its way.
bool logsAgain(LogFolder const& folder)
{
    TorkLog log;
    prepare(folder, log);
    log.error("again");
    return TestFiles::read(folder.logs() + "app.log").contains("T Error again\n");
}

void dropMessage(QtMsgType, QMessageLogContext const&, QString const&) {}

} // namespace

Q_DECLARE_METATYPE(Operation)
Q_DECLARE_METATYPE(Check)

void tst_ScarceMemory::init()
{
    m_handler = qInstallMessageHandler(dropMessage);
    s_readDocument = readShelf(document);
    QVERIFY(s_readDocument.startsWith("read: ") && s_readDocument.contains("echo"));
    if (!s_progress)
        s_progress = static_cast<Progress*>(mmap(nullptr, sizeof(Progress), PROT_READ | PROT_WRITE,
                                                 MAP_SHARED | MAP_ANONYMOUS, -1, 0));
}

void tst_ScarceMemory::cleanup()
{
    qInstallMessageHandler(m_handler);
    m_failed = m_failed || QTest::currentTestFailed();
}

void tst_ScarceMemory::shortage_data()
{
    QTest::addColumn<Operation>("operation");
    QTest::addColumn<Check>("check");
    QTest::addColumn<int>("least"); // allocations
    QTest::addColumn<bool>("lasts");

    const auto rows = [](char const* name, Operation operation, Check check, int least) {
        QTest::newRow(name) << operation << check << least << false;
        QTest::addRow("%s, for good", name) << operation << check << least << true;
    };
    rows("entries in the open file", entriesInOpenFile, entriesAreThere, 10);
    rows("first entry", firstEntry, entriesAreThere, 10);
    rows("entry that rotates", entryThatRotates, olderFilesAreThere, 10);
    rows("entry that trims", entryThatTrims, laterEntriesAreThere, 10);
    rows("closing", closing, entriesAreThere, 1);
    rows("messages of Qt", messagesOfQt, entriesAreThere, 10);
    rows("fatal message", fatalMessage, entriesAreThere, 2);
    rows("first start", firstStart, entriesAreThere, 10);
    rows("later start", laterStart, entriesAreThere, 10);
    rows("settings saved", settingsSaved, entriesAreThere, 10);
    rows("settings loaded", settingsLoaded, entriesAreThere, 10);
    rows("configuration loaded", configurationLoaded, isAnything, 10);
    rows("damaged configuration loaded", damagedConfigurationLoaded, isAnything, 10);
    rows("configuration saved", configurationSaved, beginsAsSaved, 10);
    rows("configuration replaced", configurationReplaced, isOldOrNew, 10);
    rows("document read", documentRead, isAnything, 10);
    rows("damaged document read", damagedDocumentRead, isAnything, 10);
    rows("document written", documentWritten, isAnything, 10);
    rows("launch data read", launchDataRead, isAnything, 5);
}

void tst_ScarceMemory::shortage()
{
    QFETCH(Operation, operation);
    QFETCH(Check, check);
    QFETCH(int, least);
    QFETCH(bool, lasts);
    const int stride = Figures::wanted("VELOCOR_SHORTAGES", 5);

    int shortages = 0;
    for (int step = 1;; step += stride, ++shortages) {
        LogFolder folder;
        makeOthers(folder);
        makeConfiguration(folder);
        if (operation == entryThatRotates)
            makeOlderFiles(folder);
        const int status = runStarved(operation, folder, step, lasts);
        const bool isAborted = WIFSIGNALED(status) && WTERMSIG(status) == SIGABRT;
        const bool isOver = s_progress->isOver && WIFEXITED(status) && WEXITSTATUS(status) == 0;
        const QString where = QString("allocation %1, status %2: ").arg(step).arg(status);

        const bool isCrashOfQt = WIFSIGNALED(status) && s_progress->isCrashOfQt;
        QVERIFY2(isAborted || isCrashOfQt || isOver,
                 qPrintable(where + "neither ended nor went on"));
        QVERIFY2(!isAborted || s_progress->isReached || operation == fatalMessage,
                 qPrintable(where + "ended without a shortage"));
        QVERIFY2(!s_progress->wrong[0], qPrintable(where + s_progress->wrong));
        QVERIFY2(othersAreUntouched(folder),
                 qPrintable(where + TestFiles::listing(folder.root()).join('\n')));
        const QString wrong = check(folder);
        QVERIFY2(wrong.isEmpty(), qPrintable(where + wrong));
        QVERIFY2(logsAgain(folder), qPrintable(where + "the next start does not log"));
        s_aborts += isAborted;
        s_crashes += isCrashOfQt;
        if (!s_progress->isReached && !isCrashOfQt)
            break;
    }
    QVERIFY2(shortages * stride >= least, qPrintable(QString::number(shortages)));
    s_shortages += shortages;
}

namespace {

// The program's files, of a product that has been used before and of another.
class Program
{
public:
    Program()
    {
        const QStringList folders = {"home", "data", "config", "run", "temp"};
        for (QString const& name : folders)
            QDir(m_folder.root()).mkdir(name);
        QFile::setPermissions(m_folder.root() + "run",
                              QFile::ReadOwner | QFile::WriteOwner | QFile::ExeOwner);
        TestFiles::write(data() + "velocor.cfg", SampleConfiguration::oldBytes);
        TestFiles::write(
            data() + "logs/logsettings.cfg",
            LogFolder::settingsText({{"filePrefix", "velocor"}, {"maxLogFileSize", "100"}}));
        // Beyond the limit that holds before the settings are loaded, so that it is rotated.
        TestFiles::write(data() + "logs/velocor.log", full + QByteArray(1000000, 'c'));
        TestFiles::write(data() + "logs/velocor.log.1", older[0]);
        TestFiles::write(m_folder.root() + "data/other/other.cfg", SampleConfiguration::oldBytes);
    }

    // The status of the process; -1 if it hangs.
    int run(long step, bool lasts)
    {
        QProcessEnvironment environment = QProcessEnvironment::systemEnvironment();
        const QString top = m_folder.root();
        environment.insert("LD_PRELOAD", SCARCE_START);
        environment.insert("SCARCE_STEP", QString::number(step));
        environment.insert("SCARCE_REPORT", top + "report");
        if (lasts)
            environment.insert("SCARCE_LASTS", "1");
        environment.insert("HOME", top + "home");
        environment.insert("XDG_DATA_HOME", top + "data");
        environment.insert("XDG_CONFIG_HOME", top + "config");
        environment.insert("XDG_CACHE_HOME", s_cache->path());
        environment.insert("XDG_RUNTIME_DIR", top + "run");
        environment.insert("TMPDIR", top + "temp");
        environment.insert("QT_QPA_PLATFORM", "offscreen");

        QProcess process;
        process.setProcessEnvironment(environment);
        process.setProcessChannelMode(QProcess::MergedChannels);
        process.start(VELOCOR_PROGRAM, QStringList());
        const bool isOver = process.waitForFinished(60000);
        output = process.readAll();
        report = QFile::exists(top + "report") ? TestFiles::read(top + "report") : QByteArray();
        if (!isOver)
            return -1;
        return process.exitStatus() == QProcess::CrashExit ? CrashExit + process.exitCode()
                                                           : process.exitCode();
    }

    // What is wrong with the files; empty: nothing.
    QString wrong() const
    {
        const auto has = [this](QString const& name, QByteArray const& content) {
            const QString path = data() + "logs/" + name;
            return QFile::exists(path) && TestFiles::read(path).contains(content);
        };
        if (!has("velocor.log", full) && !has("velocor.log.1", full))
            return "the entries of the run before are lost";
        if (!has("velocor.log.1", older[0]) && !has("velocor.log.2", older[0]))
            return "an older log file is lost";
        TorkConfigFile settings(data() + "velocor.cfg");
        if (!settings.Load() || SampleConfiguration::value(settings, "b") != "1")
            return "the settings are lost: " + settings.m_lastError;
        if (TestFiles::read(m_folder.root() + "data/other/other.cfg") !=
            SampleConfiguration::oldBytes)
            return "settings of another program are changed";

        static const QRegularExpression mayBeThere(
            "^(home/|data/|config/|temp/|run/.*|report|logs/|data/other/(other\\.cfg)?|"
            "data/yourorganization/(yourproduct/(velocor\\.cfg(\\.saving)?|"
            "(running|ended)-velocor\\.log(/.*)?|logs/"
            "(logsettings\\.cfg|velocor\\.log(\\.[12])?)?)?)?)$");
        const QStringList entries = TestFiles::listing(m_folder.root());
        for (QString const& entry : entries) {
            if (!mayBeThere.match(entry.section(": ", 0, 0)).hasMatch())
                return "a file that nobody asked for: " + entry.left(200);
        }
        return QString();
    }

    static constexpr int CrashExit = 1000; // plus the signal
    QByteArray output;
    QByteArray report;
    static QTemporaryDir* s_cache; // of fonts, shared so that it is filled only once

private:
    QString data() const { return m_folder.root() + "data/yourorganization/yourproduct/"; }

    LogFolder m_folder;
};

QTemporaryDir* Program::s_cache = nullptr;

int s_starts = 0;
int s_endedStarts = 0;
QMap<QString, int> s_crashedStarts; // by library

} // namespace

void tst_ScarceMemory::start_data()
{
    QTest::addColumn<bool>("lasts");

    QTest::newRow("once") << false;
    QTest::newRow("for good") << true;
}

// Of the libraries that Qt uses some do not look at what they have allocated either, and the one
// for fonts tries forever.
void tst_ScarceMemory::start()
{
    QFETCH(bool, lasts);
    QTemporaryDir cache;
    Program::s_cache = &cache;
    Program plentiful;
    QCOMPARE(plentiful.run(0, false), 0);
    QCOMPARE(plentiful.wrong(), QString());
    QVERIFY2(plentiful.report.startsWith("count "), plentiful.report.constData());
    const long count = plentiful.report.mid(6).trimmed().toLong();
    QVERIFY2(count > 10000, plentiful.report.constData());

    const int stride = Figures::wanted("VELOCOR_START_SHORTAGES", 8001);
    int failed = 0;
    for (long step = 1; step <= count; step += stride) {
        Program program;
        const int status = program.run(step, lasts);
        const QByteArray where = "allocation " + QByteArray::number(qlonglong(step)) + ", status " +
                                 QByteArray::number(status) + "\n" + program.report +
                                 program.output;
        QVERIFY2(status != -1, ("hung: " + where).constData());
        static const QRegularExpression crash("(?:crash|endless) (\\S+)");
        const QString library = crash.match(QString::fromLocal8Bit(program.report)).captured(1);
        QVERIFY2(library != "velocor" && library != "?", where.constData());
        QVERIFY2(status == 0 || status == Program::CrashExit + SIGABRT || !library.isEmpty(),
                 where.constData());
        const QString wrong = program.wrong();
        QVERIFY2(wrong.isEmpty(), qPrintable(QString::fromLocal8Bit(where) + wrong));
        failed += status != 0 || program.report.startsWith("reached ");
        ++s_starts;
        s_endedStarts += status != 0;
        if (!library.isEmpty())
            ++s_crashedStarts[library];
    }
    QVERIFY(failed > count / stride / 2);
}

void tst_ScarceMemory::cleanupTestCase()
{
    QStringList libraries;
    for (auto library = s_crashedStarts.begin(); library != s_crashedStarts.end(); ++library)
        libraries.append(QString("%1 (%2)").arg(library.key()).arg(library.value()));
    if (!m_failed && s_starts)
        Figures::print(QString("memory that runs out at the start: %1 starts with a failing "
                               "allocation, %2 ended, of those %3 in a library that does not check "
                               "or tries forever: %4; no other hang, no entry or setting lost, no "
                               "other file touched")
                           .arg(s_starts)
                           .arg(s_endedStarts)
                           .arg(std::accumulate(s_crashedStarts.begin(), s_crashedStarts.end(), 0))
                           .arg(libraries.join(", ")));
    if (!m_failed && s_shortages)
        Figures::print(
            QString("memory that runs out: %1 failing allocations, %2 ended the program, "
                    "%3 more in a crash of Qt, after %4 it went on; no hang, no entry "
                    "lost, no other file touched")
                .arg(s_shortages)
                .arg(s_aborts)
                .arg(s_crashes)
                .arg(s_shortages - s_aborts - s_crashes));
}

int main(int argc, char** argv)
{
    // Thousands of folders are created and removed: in memory rather than on the disk where
    // possible.
    if (!qEnvironmentVariableIsSet("TMPDIR") && QFileInfo("/dev/shm").isWritable())
        qputenv("TMPDIR", "/dev/shm");

    QCoreApplication application(argc, argv);
    tst_ScarceMemory test;
    return QTest::qExec(&test, argc, argv);
}

#include "tst_ScarceMemory.moc"
