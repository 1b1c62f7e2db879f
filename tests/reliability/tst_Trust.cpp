// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// What the program and the framework do to their user's files: nothing outside their own places, no
// permissions for others, no other target through a link, and no shell.

#include "common/config/TorkConfigFile.h"
#include "common/log/TorkLog.h"
#include "log/LogFolder.h"
#include "reliability/Figures.h"
#include "support/ChildProcess.h"
#include "support/ProcessLimits.h"

#include <QSet>
#include <QtTest>

#include <sys/stat.h>
#include <unistd.h>

class tst_Trust : public QObject
{
    Q_OBJECT

private slots:
    void init();
    void cleanup();

    void programWritesInItsOwnPlaces_data();
    void programWritesInItsOwnPlaces();
    void frameworkWritesWhereItIsTold();

    void rights_data();
    void rights();
    void rotationKeepsTheRights();

    void linkAsCurrentFile();
    void linkToNothingAsCurrentFile();
    void linkAsCurrentFileIsRotated();
    void linksAsOlderFiles();
    void linkToNothingAsNumberOne();
    void linkAsConfiguration();
    void linkOfAnotherUser();

    void namesReachNoShell_data();
    void namesReachNoShell();

    void cleanupTestCase();

private:
    QtMessageHandler m_handler = nullptr;
    bool m_failed = false;
};

namespace {

int s_files = 0;
int s_names = 0;

// Sets the permissions that new files do not get, and restores them.
class Mask
{
public:
    explicit Mask(mode_t mask) : m_before(umask(mask)) {}
    ~Mask() { umask(m_before); }
    Q_DISABLE_COPY(Mask)

private:
    mode_t m_before;
};

int rightsOf(QString const& path)
{
    struct stat status = {};
    return lstat(QFile::encodeName(path).constData(), &status) == 0 ? status.st_mode & 07777 : -1;
}

bool isLink(QString const& path)
{
    return QFileInfo(path).isSymLink();
}

void write(TorkLog& log, QByteArray const& line)
{
    log.write(QString::fromLatin1(line));
}

// The records of FileRecorder.cpp: what was done, and to which file. The counters that a coverage
// build writes are ignored.
struct Note
{
    QString call;
    QString path;
};

bool startsSomething(Note const& note)
{
    return note.call == "start" || note.call == "search" || note.call == "shell";
}

QList<Note> notesIn(QString const& report)
{
    QList<Note> notes;
    const QStringList lines = QString::fromLocal8Bit(TestFiles::read(report)).split('\n');
    for (QString const& line : lines) {
        if (line.contains(' ') && !line.endsWith(".gcda"))
            notes.append({line.section(' ', 0, 0), QDir::cleanPath(line.section(' ', 1))});
    }
    return notes;
}

// The records that concern none of these folders or their contents. Folders on the way there may be
// created.
QStringList strayNotes(QList<Note> const& notes, QStringList const& folders)
{
    QStringList stray;
    for (Note const& note : notes) {
        const bool isInside =
            std::any_of(folders.begin(), folders.end(), [&](QString const& folder) {
                return (note.path + '/').startsWith(folder) ||
                       (note.call == "mkdir" && folder.startsWith(note.path + '/'));
            });
        const bool isFile = !startsSomething(note);
        if (note.path != "/dev/null" && !(isFile && isInside))
            stray.append(note.call + ' ' + note.path);
    }
    return stray;
}

bool contains(QList<Note> const& notes, QString const& call, QString const& path)
{
    return std::any_of(notes.begin(), notes.end(),
                       [&](Note const& note) { return note.call == call && note.path == path; });
}

QProcessEnvironment watched(QString const& report)
{
    QProcessEnvironment environment = QProcessEnvironment::systemEnvironment();
    environment.insert("LD_PRELOAD", FILE_RECORDER);
    environment.insert("FILE_RECORDER", report);
    return environment;
}

// The program in its own home folder, started and ended as its user would from a terminal.
class Program
{
public:
    Program(QString const& top, QString const& platform) : report(top + "report"), m_top(top)
    {
        environment = watched(report);
        const QStringList folders = {"home", "data", "config", "run", "temp"};
        for (QString const& folder : folders)
            QDir().mkpath(top + folder);
        QFile::setPermissions(top + "run", QFile::ReadOwner | QFile::WriteOwner | QFile::ExeOwner);
        environment.insert("HOME", top + "home");
        environment.insert("XDG_DATA_HOME", top + "data");
        environment.insert("XDG_CONFIG_HOME", top + "config");
        environment.insert("XDG_RUNTIME_DIR", top + "run");
        environment.insert("TMPDIR", top + "temp");
        environment.insert("QT_QPA_PLATFORM", platform);
        environment.remove("DBUS_SESSION_BUS_ADDRESS");
    }

    // The folder that contains data and log.
    QString data() const { return m_top + "data/yourorganization/yourproduct/"; }

    bool run() const
    {
        QProcess process;
        process.setProcessEnvironment(environment);
        process.setWorkingDirectory(m_top + "home");
        process.start(VELOCOR_PROGRAM, QStringList());
        QElapsedTimer patience;
        patience.start();
        const QString log = data() + "logs/velocor.log";
        while (!TestFiles::read(log).contains("app.exec() starting") &&
               patience.elapsed() < 60000 && process.state() != QProcess::NotRunning)
            process.waitForFinished(20);
        process.terminate();
        return process.waitForFinished(60000) && process.exitStatus() == QProcess::NormalExit;
    }

    QProcessEnvironment environment;
    QString report;

private:
    QString m_top;
};

} // namespace

void tst_Trust::init()
{
    m_handler = qInstallMessageHandler(nullptr);
    qInstallMessageHandler(m_handler);
}

void tst_Trust::cleanup()
{
    TorkLog::shutdown();
    qInstallMessageHandler(m_handler);
    m_failed = m_failed || QTest::currentTestFailed();
}

void tst_Trust::programWritesInItsOwnPlaces_data()
{
    QTest::addColumn<bool>("hasRunBefore");
    QTest::addColumn<QString>("platform");
    QTest::addColumn<bool>("hasSessionBus");

    QTest::newRow("first start") << false << "offscreen" << false;
    QTest::newRow("later start that rotates the log") << true << "offscreen" << false;
    QTest::newRow("first start on a display") << false << "xcb" << true;
    QTest::newRow("later start on a display") << true << "xcb" << true;
    QTest::newRow("display without a session bus") << false << "xcb" << false;
}

// Fonts and the desktop's services are up to Qt; the places where it keeps them are listed
// separately, and so is the program with which it looks for a session bus.
void tst_Trust::programWritesInItsOwnPlaces()
{
    if (QStringLiteral(FILE_RECORDER).isEmpty())
        QSKIP("The sanitizers do not allow a preloaded library.");
    QFETCH(bool, hasRunBefore);
    QFETCH(QString, platform);
    QFETCH(bool, hasSessionBus);
    if (platform == "xcb" && !qEnvironmentVariableIsSet("DISPLAY"))
        QSKIP("There is no display.");
    LogFolder folder;
    Program program(folder.root(), platform);
    if (hasSessionBus)
        program.environment.insert("DBUS_SESSION_BUS_ADDRESS", "unix:path=/nonexistent");
    if (hasRunBefore)
        TestFiles::write(program.data() + "logs/velocor.log", QByteArray(1000000, 'x'));
    QVERIFY(program.run());

    const QList<Note> notes = notesIn(program.report);
    const QStringList qtFolders = {folder.root() + "run/",
                                   folder.root() + "home/.cache/fontconfig/"};
    QStringList stray = strayNotes(notes, qtFolders + QStringList(program.data()));
    if (platform == "xcb" && !hasSessionBus) {
        stray.removeAll("start /usr/bin/dbus-launch");
        stray.removeAll("search dbus-launch");
    }
    QCOMPARE(stray, QStringList());
    QVERIFY(contains(notes, "open", program.data() + "logs/velocor.log"));
    QCOMPARE(contains(notes, "link", program.data() + "logs/velocor.log.1"), hasRunBefore);
    s_files += notes.size();
}

namespace {

// Logs with rotation, saves and loads; all names contain something for a shell to execute.
int works(QStringList const& arguments)
{
    QString const& root = arguments.at(0);
    TorkLog* const log = TorkLog::initialize(root + "logs/", arguments.at(1), QString(), true);
    for (int i = 0; i < 3; ++i) {
        log->error("$(touch made) `touch made` ; touch made | touch made & \n > made");
        qWarning("$(touch made)");
        log->close();
        log->deleteOldFiles();
    }
    TorkConfigFile configuration(root + arguments.at(1) + ".cfg");
    configuration.WriteItem("state", "command", "$(touch made)`touch made`;touch made");
    configuration.Save();
    configuration.Load();
    return log->savePreferences() ? 0 : 1;
}

ChildProcess::Result runWatched(QString const& report, QStringList const& arguments,
                                QString const& workingFolder)
{
    qputenv("LD_PRELOAD", FILE_RECORDER);
    qputenv("FILE_RECORDER", QFile::encodeName(report));
    const ChildProcess::Result child = ChildProcess::run("works", arguments, workingFolder);
    qunsetenv("LD_PRELOAD");
    qunsetenv("FILE_RECORDER");
    return child;
}

} // namespace

void tst_Trust::frameworkWritesWhereItIsTold()
{
    if (QStringLiteral(FILE_RECORDER).isEmpty())
        QSKIP("The sanitizers do not allow a preloaded library.");
    LogFolder folder;
    LogFolder reports;
    const QString report = reports.root() + "report";
    const ChildProcess::Result child = runWatched(report, {folder.root(), "app"}, reports.root());
    QVERIFY2(child.ended(), child.report());

    const QList<Note> notes = notesIn(report);
    QCOMPARE(strayNotes(notes, {folder.logs(), folder.root() + "app.cfg/"}), QStringList());
    QVERIFY(contains(notes, "open", folder.logs() + "app.log"));
    QVERIFY(contains(notes, "open", folder.root() + "app.cfg"));
    s_files += notes.size();
}

void tst_Trust::rights_data()
{
    QTest::addColumn<int>("mask");

    QTest::newRow("others may read") << 0022;
    QTest::newRow("the group may write") << 0002;
    QTest::newRow("nobody else") << 0077;
    QTest::newRow("everybody") << 0000;
}

// Those that the user gives new files, and no more.
void tst_Trust::rights()
{
    QFETCH(int, mask);
    LogFolder folder;
    const QString logs = folder.root() + "new/logs/";
    {
        const Mask inForce(static_cast<mode_t>(mask));
        TorkLog* const log = TorkLog::initialize(logs, "app", QString(), true);
        write(*log, "entry\n");
        TorkConfigFile(folder.root() + "viewer.cfg").Save();
    }
    QCOMPARE(rightsOf(folder.root() + "new"), 0777 & ~mask);
    QCOMPARE(rightsOf(logs), 0777 & ~mask);
    QCOMPARE(rightsOf(logs + "app.log"), 0666 & ~mask);
    QCOMPARE(rightsOf(logs + "logsettings.cfg"), 0666 & ~mask);
    QCOMPARE(rightsOf(folder.root() + "viewer.cfg"), 0666 & ~mask);
}

void tst_Trust::rotationKeepsTheRights()
{
    const Mask inForce(0022);
    LogFolder folder;
    TorkLog log;
    folder.prepare(log, "app", 10);
    TestFiles::write(folder.logs() + "app.log", "too much for it\n");
    TestFiles::write(folder.logs() + "app.log.1", "older\n");
    QFile::setPermissions(folder.logs() + "app.log", QFile::ReadOwner | QFile::WriteOwner);
    QFile::setPermissions(folder.logs() + "app.log.1", QFile::ReadOwner);
    write(log, "entry\n");

    QCOMPARE(rightsOf(folder.logs() + "app.log"), 0644);
    QCOMPARE(rightsOf(folder.logs() + "app.log.1"), 0600);
    QCOMPARE(rightsOf(folder.logs() + "app.log.2"), 0400);
}

// The entries go to the target, as with any file that its user replaces by a link.
void tst_Trust::linkAsCurrentFile()
{
    LogFolder folder;
    TorkLog log;
    folder.prepare(log, "app");
    TestFiles::write(folder.root() + "target", "old old old\n");
    QVERIFY(QFile::link(folder.root() + "target", folder.logs() + "app.log"));
    write(log, "entry\n");

    QCOMPARE(TestFiles::read(folder.root() + "target"), QByteArray("entry\nd old\n"));
    QVERIFY(isLink(folder.logs() + "app.log"));
}

void tst_Trust::linkToNothingAsCurrentFile()
{
    LogFolder folder;
    TorkLog log;
    folder.prepare(log, "app");
    QVERIFY(QFile::link(folder.root() + "target", folder.logs() + "app.log"));
    write(log, "entry\n");

    QCOMPARE(TestFiles::read(folder.root() + "target"), QByteArray("entry\n"));
    QVERIFY(isLink(folder.logs() + "app.log"));
}

// The link is removed, its target is unchanged; number 1 is a copy.
void tst_Trust::linkAsCurrentFileIsRotated()
{
    LogFolder folder;
    TorkLog log;
    folder.prepare(log, "app", 10);
    TestFiles::write(folder.root() + "target", "too much for it\n");
    QVERIFY(QFile::link(folder.root() + "target", folder.logs() + "app.log"));
    write(log, "entry\n");

    QCOMPARE(TestFiles::read(folder.root() + "target"), QByteArray("too much for it\n"));
    QVERIFY(!isLink(folder.logs() + "app.log"));
    QVERIFY(!isLink(folder.logs() + "app.log.1"));
    QCOMPARE(folder.listing(), QStringList({"app.log: entry\n", "app.log.1: too much for it\n"}));
}

// The links themselves move up and are pruned.
void tst_Trust::linksAsOlderFiles()
{
    LogFolder folder;
    TorkLog log;
    folder.prepare(log, "app", 10);
    log.setMaxLogFiles(2);
    TestFiles::write(folder.root() + "one", "one\n");
    TestFiles::write(folder.root() + "two", "two\n");
    TestFiles::write(folder.logs() + "app.log", "too much for it\n");
    QVERIFY(QFile::link(folder.root() + "one", folder.logs() + "app.log.1"));
    QVERIFY(QFile::link(folder.root() + "two", folder.logs() + "app.log.2"));
    write(log, "entry\n");

    QCOMPARE(folder.listing(),
             QStringList({"app.log: entry\n", "app.log.1: too much for it\n", "app.log.2: one\n"}));
    QVERIFY(isLink(folder.logs() + "app.log.2"));
    QCOMPARE(TestFiles::read(folder.root() + "one"), QByteArray("one\n"));
    QCOMPARE(TestFiles::read(folder.root() + "two"), QByteArray("two\n"));
}

// It holds nothing, so it makes room, and nothing is created through it.
void tst_Trust::linkToNothingAsNumberOne()
{
    LogFolder folder;
    TorkLog log;
    folder.prepare(log, "app", 10);
    TestFiles::write(folder.logs() + "app.log", "too much for it\n");
    QVERIFY(QFile::link(folder.root() + "target", folder.logs() + "app.log.1"));
    write(log, "entry\n");

    QCOMPARE(folder.listing(), QStringList({"app.log: entry\n", "app.log.1: too much for it\n"}));
    QVERIFY(!QFile::exists(folder.root() + "target"));
    QVERIFY(!isLink(folder.logs() + "app.log.1"));
}

void tst_Trust::linkAsConfiguration()
{
    LogFolder folder;
    TestFiles::write(folder.root() + "target", "old\n");
    QVERIFY(QFile::link(folder.root() + "target", folder.root() + "viewer.cfg"));
    TorkConfigFile(folder.root() + "viewer.cfg").Save();

    QCOMPARE(TestFiles::read(folder.root() + "target"),
             QByteArray("<VelocorSettings>\n</VelocorSettings>\n"));
    QVERIFY(isLink(folder.root() + "viewer.cfg"));
}

namespace {

// As an unprivileged user, in a folder where everybody may write.
int writesThroughLinks(QStringList const& arguments)
{
    if (!ProcessLimits::becomeOrdinaryUser())
        return ChildProcess::skipped;
    QString const& root = arguments.at(0);
    TorkLog log(root + "logs/");
    log.setEnable(true);
    log.write(QStringLiteral("entry\n"));
    std::printf("%s\n", qPrintable(log.errorString()));

    TorkConfigFile configuration(root + "logs/viewer.cfg");
    configuration.Save();
    std::printf("%s\n", qPrintable(configuration.m_lastError.section(':', 0, 0)));
    return 0;
}

} // namespace

// A link grants nobody permissions: what the user may not write is not written through it.
void tst_Trust::linkOfAnotherUser()
{
    if (geteuid() != 0)
        QSKIP("Only root has files that another user may not write.");
    LogFolder folder;
    QFile::setPermissions(folder.root(), QFile::Permissions(0x7755));
    QFile::setPermissions(folder.logs(), QFile::Permissions(0x7777));
    TestFiles::write(folder.root() + "target", "of the administrator\n");
    QFile::setPermissions(folder.root() + "target", QFile::Permissions(0x6644));
    QVERIFY(QFile::link(folder.root() + "target", folder.logs() + ".log"));
    QVERIFY(QFile::link(folder.root() + "target", folder.logs() + "viewer.cfg"));

    const ChildProcess::Result child = ChildProcess::run("links", {folder.root()});
    if (child.wasSkipped())
        QSKIP("This process cannot become another user.");
    QVERIFY2(child.ended(), child.report());
    QCOMPARE(child.output, QByteArray("Permission denied\nUnable to open file\n"));
    QCOMPARE(TestFiles::read(folder.root() + "target"), QByteArray("of the administrator\n"));
}

void tst_Trust::namesReachNoShell_data()
{
    QTest::addColumn<QString>("name");

    QTest::newRow("command in parentheses") << "$(touch made)";
    QTest::newRow("command in back quotes") << "`touch made`";
    QTest::newRow("second command") << "a; touch made";
    QTest::newRow("pipe") << "a | touch made";
    QTest::newRow("output") << "a > made";
    QTest::newRow("background") << "a & touch made";
    QTest::newRow("quotation marks") << "a'; touch made; '\"; touch made; \"";
    QTest::newRow("line feed") << "a\ntouch made\n";
    QTest::newRow("option") << "-rf";
    QTest::newRow("variable and home") << "~$HOME";
}

// Folder, log and configuration file have that name; entries and values contain commands anyway.
void tst_Trust::namesReachNoShell()
{
    QFETCH(QString, name);
    LogFolder folder;
    const QString root = folder.root() + name + '/';
    QVERIFY(QDir().mkpath(root + "logs"));
    QVERIFY(QDir().mkpath(folder.root() + "work"));
    const QString report = folder.root() + "report";
    const ChildProcess::Result child = runWatched(report, {root, name}, folder.root() + "work");
    QVERIFY2(child.ended(), child.report());

    QVERIFY(QFile::exists(root + name + ".cfg"));
    QVERIFY(QFile::exists(root + "logs/" + name + ".log.1"));
    QVERIFY(QFile::exists(root + "logs/logsettings.cfg"));
    QCOMPARE(TestFiles::listing(folder.root() + "work"), QStringList());
    const QList<Note> notes = notesIn(report);
    for (Note const& note : notes)
        QVERIFY2(!startsSomething(note), qPrintable(note.path));
    ++s_names;
}

void tst_Trust::cleanupTestCase()
{
    if (!m_failed)
        Figures::print(QString("trust: %1 file calls watched, none outside the data, the log and "
                               "the paths given; %2 names with commands in them, no program and "
                               "no shell started")
                           .arg(s_files)
                           .arg(s_names));
}

int main(int argc, char** argv)
{
    return ChildProcess::main<tst_Trust>(argc, argv,
                                         {{"works", works}, {"links", writesThroughLinks}});
}

#include "tst_Trust.moc"
