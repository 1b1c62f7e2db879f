// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Every file call of the log and of the configuration store fails once, and every one together with
// all later ones: the test continues until an operation completes before its fault occurs.

#include "common/config/TorkConfigFile.h"
#include "common/log/TorkLog.h"
#include "log/LogFolder.h"
#include "reliability/FaultyFiles.h"
#include "reliability/Figures.h"
#include "reliability/SampleConfiguration.h"

#include <QtTest>

#include <cerrno>
#include <memory>

class tst_Faults : public QObject
{
    Q_OBJECT

private slots:
    void init();
    void cleanup();
    void cleanupTestCase();

    void firstEntry_data() { faults(Writing); }
    void firstEntry();
    void entryIntoOpenFile_data() { faults(Writing); }
    void entryIntoOpenFile();
    void entryThatRotates_data() { faults(Writing); }
    void entryThatRotates();
    void entryThatTrims_data() { faults(Writing); }
    void entryThatTrims();
    void closing_data() { faults(Other); }
    void closing();
    void firstStart_data() { faults(Writing); }
    void firstStart();
    void settingsSaved_data() { faults(Writing); }
    void settingsSaved();
    void settingsLoaded_data() { faults(Other); }
    void settingsLoaded();
    void configurationSaved_data() { faults(Writing); }
    void configurationSaved();
    void configurationReplaced_data() { faults(Writing); }
    void configurationReplaced();
    void configurationLoaded_data() { faults(Other); }
    void configurationLoaded();

    void diskFullAtEveryByteOfASave();
    void diskFullAtEveryByteOfAReplacement();
    void diskFullAtEveryByteOfARotation();
    void diskFullAtEveryByteOfAnEntry();
    void diskFullForLong();

private:
    enum Operation { Writing, Other };
    static void faults(Operation operation);

    QStringList missing(QStringList const& least) const;

    QtMessageHandler m_handler = nullptr;
    bool m_failed = false;
    QStringList m_calls; // which call failed in each step, so all calls in their order
};

namespace {

int s_steps = 0;
int s_bytes = 0;

// The log and a configuration file among unrelated files.
class Scene
{
public:
    Scene() : files(folder.root())
    {
        folder.prepare(log, "app", 100);
        TestFiles::write(folder.logs() + "app.log.old", "not numbered\n");
        TestFiles::write(folder.logs() + "application.log.1", "of another log\n");
        TestFiles::write(folder.root() + "notes.txt", "of the user\n");
    }

    bool othersAreUntouched() const
    {
        return !files.strayed() &&
               TestFiles::read(folder.logs() + "app.log.old") == "not numbered\n" &&
               TestFiles::read(folder.logs() + "application.log.1") == "of another log\n" &&
               TestFiles::read(folder.root() + "notes.txt") == "of the user\n";
    }

    QString current() const { return folder.logs() + "app.log"; }
    QString configuration() const { return folder.root() + "viewer.cfg"; }

    // Sets the fault of this row.
    void failAt(int step)
    {
        QFETCH(int, error);
        QFETCH(bool, lasts);
        if (error)
            files.failAt(step, lasts ? FaultyFiles::FromThereOn : FaultyFiles::Once, error);
        else
            files.cutShortAt(step);
    }

    LogFolder folder;
    FaultyFiles files;
    TorkLog log;
};

// For the message of a failed check.
QByteArray where(Scene const& scene, int step)
{
    return "step " + QByteArray::number(step) + ": " + scene.files.call().toLatin1() + " of " +
           scene.files.path().toLocal8Bit() + "\nlogs:\n    " +
           scene.folder.listing().join("    ").toLocal8Bit();
}

#define CHECK(condition) QVERIFY2(condition, where(scene, step).constData())

const QByteArray before = "written before\n";
const QByteArray during = "written meanwhile\n";
const QByteArray after = "written afterwards\n";

void write(TorkLog& log, QByteArray const& line)
{
    log.write(QString::fromLatin1(line));
}

// The entry is there, once and whole, or the log reports that it found no file to write it to.
bool tellsWhatBecameOfIt(Scene const& scene, QByteArray const& content)
{
    return content.count(during) == 1 ||
           (content.count("meanwhile") == 0 && !scene.log.errorString().isEmpty());
}

} // namespace

namespace {

// Most loads here end with an error of the XML reader.
void dropMessage(QtMsgType, QMessageLogContext const&, QString const&) {}

} // namespace

void tst_Faults::init()
{
    m_handler = qInstallMessageHandler(dropMessage);
    m_calls.clear();
}

void tst_Faults::cleanup()
{
    TorkLog::shutdown();
    qInstallMessageHandler(m_handler);
    m_failed = m_failed || QTest::currentTestFailed();
}

void tst_Faults::cleanupTestCase()
{
    if (!m_failed)
        Figures::print(QString("faults: %1 failing steps and %2 full disks, no crash, no hang, no "
                               "other file touched, and it went on each time")
                           .arg(s_steps)
                           .arg(s_bytes));
}

void tst_Faults::faults(Operation operation)
{
    QTest::addColumn<int>("error"); // 0: writes only part of the data
    QTest::addColumn<bool>("lasts");

    QTest::newRow("device error") << EIO << false;
    QTest::newRow("device error for a while") << EIO << true;
    QTest::newRow("disk full") << ENOSPC << false;
    QTest::newRow("disk full for a while") << ENOSPC << true;
    QTest::newRow("permission denied") << EACCES << false;
    QTest::newRow("permission denied for a while") << EACCES << true;
    QTest::newRow("too many open files for a while") << EMFILE << true;
    QTest::newRow("read-only file system for a while") << EROFS << true;
    QTest::newRow("interrupted") << EINTR << false;
    if (operation == Writing)
        QTest::newRow("only half written") << 0 << false;
}

// Which of these calls did not fail, although the operation makes them: then the row has proved
// nothing about them. Where only writing fails, the others are not expected to.
QStringList tst_Faults::missing(QStringList const& least) const
{
    QFETCH(int, error);
    QStringList none;
    for (QString const& call : least) {
        if (!m_calls.contains(call) && (error != 0 || call == "write"))
            none.append(call);
    }
    return none;
}

void tst_Faults::firstEntry()
{
    for (int step = 1;; ++step, ++s_steps) {
        Scene scene;
        scene.log.setOutputPath(scene.folder.root() + "new/folder/");
        const QString file = scene.folder.root() + "new/folder/app.log";

        scene.failAt(step);
        write(scene.log, during);
        scene.files.mend();
        write(scene.log, after);

        const QByteArray content = TestFiles::read(file);
        CHECK(content == during + after || content == after);
        CHECK(tellsWhatBecameOfIt(scene, content));
        CHECK(scene.othersAreUntouched());
        m_calls.append(scene.files.call());
        if (!scene.files.reached())
            break;
    }
    QCOMPARE(missing({"mkdir", "stat", "open", "fcntl", "write"}), QStringList());
}

void tst_Faults::entryIntoOpenFile()
{
    for (int step = 1;; ++step, ++s_steps) {
        Scene scene;
        write(scene.log, before);

        scene.failAt(step);
        write(scene.log, during);
        scene.files.mend();
        write(scene.log, after);

        CHECK(TestFiles::read(scene.current()) == before + during + after);
        CHECK(scene.othersAreUntouched());
        m_calls.append(scene.files.call());
        if (!scene.files.reached())
            break;
    }
    QCOMPARE(missing({"ioctl", "write"}), QStringList());
}

namespace {

// The older files before the rotation, and the only contents that a number may have.
const QByteArray full(120, 'c');
const QByteArrayList older = {"first\n", "second\n", "third\n"};

void makeOlderFiles(Scene const& scene)
{
    TestFiles::write(scene.current(), full);
    for (int i = 0; i < older.size(); ++i)
        TestFiles::write(scene.current() + '.' + QString::number(i + 1), older[i]);
}

// The contents of the numbered files.
QByteArrayList numbered(Scene const& scene)
{
    QByteArrayList contents;
    for (int i = 1; i < 6; ++i) {
        const QString name = scene.current() + '.' + QString::number(i);
        if (QFile::exists(name))
            contents.append(TestFiles::read(name));
    }
    return contents;
}

// All older files are still there, each whole and once, except for the oldest above the limit.
bool olderFilesAreKept(Scene const& scene)
{
    QByteArrayList contents = numbered(scene);
    contents.removeOne(full);
    contents.removeOne(older[2]);
    return contents == older.mid(0, 2);
}

} // namespace

// Where the current file could not be removed the entry overwrites its start, and the next one
// trims it: that is how the log treats any old content.
void tst_Faults::entryThatRotates()
{
    QFETCH(bool, lasts);
    for (int step = 1;; ++step, ++s_steps) {
        Scene scene;
        scene.log.setMaxLogFiles(3);
        makeOlderFiles(scene);

        scene.failAt(step);
        write(scene.log, during);
        scene.files.mend();
        CHECK(olderFilesAreKept(scene));
        QByteArray content = TestFiles::read(scene.current());
        // A folder that cannot be listed is rotated by name.
        CHECK(lasts || scene.files.call() != "opendir" || numbered(scene).value(0) == full);
        write(scene.log, after);
        content += TestFiles::read(scene.current());

        CHECK(content.count(after) == 1);
        CHECK(content.contains(during) || tellsWhatBecameOfIt(scene, content));
        CHECK(scene.othersAreUntouched());
        m_calls.append(scene.files.call());
        if (!scene.files.reached()) {
            CHECK(content == during + during + after);
            CHECK(numbered(scene) == QByteArrayList({full}) + older.mid(0, 2));
            break;
        }
    }
    QCOMPARE(missing({"stat", "opendir", "readdir", "rename", "unlink", "open", "read", "write",
                      "fchmod", "fsync", "link", "close"}),
             QStringList());
    // What has a name is complete, on the disk and no more readable than before.
    QFETCH(int, error);
    QVERIFY(error == 0 || m_calls.indexOf("fsync") < m_calls.indexOf("link"));
    QVERIFY(error == 0 || m_calls.lastIndexOf("fchmod") < m_calls.indexOf("link"));
}

// The open file is over its limit and has old lines after the last entry. Trimming drops what the
// file held, so an entry that a fault kept from the disk may go with it; the later one never.
void tst_Faults::entryThatTrims()
{
    for (int step = 1;; ++step, ++s_steps) {
        Scene scene;
        TestFiles::write(scene.current(), QByteArray(60, 'a') + '\n' + QByteArray(30, 'b') + '\n');
        write(scene.log, "x\n");

        scene.failAt(step);
        write(scene.log, during);
        scene.files.mend();
        write(scene.log, after);

        const QByteArray content = TestFiles::read(scene.current());
        CHECK(content.count(after) == 1);
        CHECK(scene.othersAreUntouched());
        m_calls.append(scene.files.call());
        if (!scene.files.reached()) {
            CHECK(content.count(during) == 1);
            break;
        }
    }
    QCOMPARE(missing({"stat", "fcntl", "lseek", "read", "ftruncate", "write"}), QStringList());
}

void tst_Faults::closing()
{
    for (int step = 1;; ++step, ++s_steps) {
        Scene scene;
        write(scene.log, before);

        scene.failAt(step);
        const bool closed = scene.log.close();
        scene.files.mend();

        CHECK(closed);
        CHECK(TestFiles::read(scene.current()) == before);
        CHECK(!scene.log.close());
        write(scene.log, after);
        CHECK(TestFiles::read(scene.current()) == after);
        CHECK(scene.othersAreUntouched());
        m_calls.append(scene.files.call());
        if (!scene.files.reached())
            break;
    }
    QCOMPARE(missing({"close"}), QStringList());
}

// Creates the log directory, the settings file and the first entries.
void tst_Faults::firstStart()
{
    for (int step = 1;; ++step, ++s_steps) {
        Scene scene;
        const QString logs = scene.folder.root() + "new/";

        scene.failAt(step);
        TorkLog* const log = TorkLog::initialize(logs, "app", QString(), true);
        write(*log, during);
        scene.files.mend();
        write(*log, after);
        CHECK(log->savePreferences());
        TorkLog::shutdown();

        CHECK(TestFiles::read(logs + "app.log").endsWith(after));
        const QByteArray settings = TestFiles::read(logs + "logsettings.cfg");
        CHECK(settings.startsWith("<LogSettings>\n") && settings.endsWith("</LogSettings>\n"));
        CHECK(scene.othersAreUntouched());
        m_calls.append(scene.files.call());
        if (!scene.files.reached())
            break;
    }
    QCOMPARE(missing({"mkdir", "stat", "open", "write", "close"}), QStringList());
}

void tst_Faults::settingsSaved()
{
    for (int step = 1;; ++step, ++s_steps) {
        Scene scene;
        const QByteArray old = TestFiles::read(scene.folder.settingsFile());
        scene.log.setMaxLogFiles(7);

        scene.failAt(step);
        CHECK(scene.log.savePreferences());
        scene.files.mend();
        const QByteArray left = TestFiles::read(scene.folder.settingsFile());
        CHECK(scene.log.savePreferences());
        const QByteArray whole = TestFiles::read(scene.folder.settingsFile());

        CHECK(whole.contains("<maxLogFiles>7</maxLogFiles>"));
        CHECK(left == old || whole.startsWith(left));
        write(scene.log, after);
        CHECK(TestFiles::read(scene.current()) == after);
        CHECK(scene.othersAreUntouched());
        m_calls.append(scene.files.call());
        if (!scene.files.reached()) {
            CHECK(left == whole);
            break;
        }
    }
    QCOMPARE(missing({"open", "write", "close"}), QStringList());
}

// Every value is the stored one or the default for a missing key.
void tst_Faults::settingsLoaded()
{
    for (int step = 1;; ++step, ++s_steps) {
        Scene scene;
        TestFiles::write(
            scene.folder.settingsFile(),
            LogFolder::settingsText(
                {{"filePrefix", "other"}, {"maxLogFiles", "7"}, {"maxLogFileSize", "3000"}}));

        scene.failAt(step);
        const bool loaded = scene.log.loadPreferences();
        const bool attempted = scene.log.maxLogFileSize() != 100;
        const unsigned int files = scene.log.maxLogFiles();
        scene.files.mend();

        CHECK(!loaded || files == 7);
        CHECK(!attempted || files == 7 || files == 10);
        CHECK(scene.log.loadPreferences());
        CHECK(scene.log.maxLogFiles() == 7 && scene.log.maxLogFileSize() == 3000);
        scene.log.write(QString::fromLatin1(after));
        CHECK(TestFiles::read(scene.folder.logs() + "other.log") == after);
        CHECK(scene.othersAreUntouched());
        m_calls.append(scene.files.call());
        if (!scene.files.reached()) {
            CHECK(loaded);
            break;
        }
    }
    QCOMPARE(missing({"access", "open", "read", "stat"}), QStringList());
}

void tst_Faults::configurationSaved()
{
    for (int step = 1;; ++step, ++s_steps) {
        Scene scene;
        TestFiles::write(scene.configuration(), SampleConfiguration::oldBytes);
        TorkConfigFile configuration(scene.configuration());
        SampleConfiguration::fill(configuration);

        scene.failAt(step);
        CHECK(configuration.Save());
        scene.files.mend();

        const QByteArray left = TestFiles::read(scene.configuration());
        if (configuration.m_lastError.isEmpty()) {
            CHECK(SampleConfiguration::newBytes.startsWith(left));
        } else {
            CHECK(configuration.m_lastError == "Unable to open file: " + scene.configuration());
            CHECK(scene.files.reached());
        }
        CHECK(configuration.Save());
        CHECK(TestFiles::read(scene.configuration()) == SampleConfiguration::newBytes);
        CHECK(scene.othersAreUntouched());
        m_calls.append(scene.files.call());
        if (!scene.files.reached()) {
            CHECK(left == SampleConfiguration::newBytes);
            break;
        }
    }
    QCOMPARE(missing({"open", "write", "close"}), QStringList());
}

// The file is the old one or the new one whatever fails, and the result says which. A link to it
// remains.
void tst_Faults::configurationReplaced()
{
    QFETCH(int, error);
    QStringList failedSyncs;
    for (int step = 1;; ++step, ++s_steps) {
        Scene scene;
        TestFiles::write(scene.configuration(), SampleConfiguration::oldBytes);
        QFile::setPermissions(scene.configuration(),
                              QFile::ReadOwner | QFile::WriteOwner | QFile::ReadGroup);
        const QString link = scene.folder.root() + "link.cfg";
        CHECK(QFile::link(scene.configuration(), link));
        TorkConfigFile configuration(link);
        SampleConfiguration::fill(configuration);

        scene.failAt(step);
        const bool saved = configuration.SaveAtomically();
        scene.files.mend();

        const QByteArray left = TestFiles::read(scene.configuration());
        CHECK(left == (saved ? SampleConfiguration::newBytes : SampleConfiguration::oldBytes));
        CHECK(saved || configuration.m_lastError.startsWith("Unable to save " + link + ": "));
        const bool isAgain =
            error == EINTR && QStringList({"open", "write", "fsync"}).contains(scene.files.call());
        CHECK(saved || !isAgain);
        if (scene.files.call() == "fsync")
            failedSyncs.append(QFileInfo(scene.files.path()).fileName());
        const bool isNotOnDisk = (error == EIO || error == ENOSPC) &&
                                 scene.files.call() == "fsync" &&
                                 scene.files.path().endsWith(".saving");
        CHECK(!saved || !isNotOnDisk);
        CHECK(QFile::permissions(scene.configuration()).testFlag(QFile::ReadGroup));
        CHECK(QFileInfo(link).isSymLink());
        CHECK(configuration.SaveAtomically());
        CHECK(configuration.m_lastError.isEmpty());
        CHECK(TestFiles::read(scene.configuration()) == SampleConfiguration::newBytes);
        CHECK(!QFile::exists(scene.configuration() + ".saving"));
        CHECK(QFileInfo(link).isSymLink());
        CHECK(scene.othersAreUntouched());
        m_calls.append(scene.files.call());
        if (!scene.files.reached()) {
            CHECK(saved);
            break;
        }
    }
    // It syncs the file and its folder.
    QVERIFY(error == 0 || failedSyncs.contains("viewer.cfg.saving"));
    QVERIFY(error == 0 || failedSyncs.size() >= 2);
    QCOMPARE(missing({"readlink", "stat", "open", "flock", "write", "fsync", "fchmod", "rename",
                      "close"}),
             QStringList());
}

void tst_Faults::configurationLoaded()
{
    const QString notFound = "ConfigFile - File not found.";
    const QString notParsed = "ConfigFile - Could not parse the input file.";
    for (int step = 1;; ++step, ++s_steps) {
        Scene scene;
        TestFiles::write(scene.configuration(), SampleConfiguration::newBytes);
        TorkConfigFile configuration(scene.configuration());
        configuration.WriteItem("a", "b", "unsaved");

        scene.failAt(step);
        const bool loaded = configuration.Load();
        scene.files.mend();

        if (loaded)
            CHECK(SampleConfiguration::value(configuration, "b") == "2" &&
                  SampleConfiguration::value(configuration, "c") == "x & y");
        else if (configuration.m_lastError == notFound)
            CHECK(SampleConfiguration::value(configuration, "b") == "unsaved");
        else
            CHECK(configuration.m_lastError == notParsed);
        CHECK(configuration.Load());
        CHECK(SampleConfiguration::value(configuration, "b") == "2" &&
              SampleConfiguration::value(configuration, "c") == "x & y");
        CHECK(TestFiles::read(scene.configuration()) == SampleConfiguration::newBytes);
        CHECK(scene.othersAreUntouched());
        m_calls.append(scene.files.call());
        if (!scene.files.reached()) {
            CHECK(loaded);
            break;
        }
    }
    QCOMPARE(missing({"access", "open", "read", "stat"}), QStringList());
}

// What fit is there, and nothing is reported: a save reports only a file that does not open.
void tst_Faults::diskFullAtEveryByteOfASave()
{
    for (int step = 0; step <= SampleConfiguration::newBytes.size(); ++step, ++s_bytes) {
        Scene scene;
        TestFiles::write(scene.configuration(), SampleConfiguration::oldBytes);
        TorkConfigFile configuration(scene.configuration());
        SampleConfiguration::fill(configuration);

        scene.files.limitBytes(step);
        CHECK(configuration.Save());
        scene.files.mend();

        CHECK(configuration.m_lastError.isEmpty());
        CHECK(TestFiles::read(scene.configuration()) == SampleConfiguration::newBytes.left(step));
        CHECK(scene.files.reached() == (step < SampleConfiguration::newBytes.size()));

        TorkConfigFile loaded(scene.configuration());
        CHECK(loaded.Load() == (step >= SampleConfiguration::newBytes.size() - 1));
        CHECK(configuration.Save());
        CHECK(loaded.Load());
        CHECK(SampleConfiguration::value(loaded, "c") == "x & y");
        CHECK(scene.othersAreUntouched());
    }
}

// There is no room for another file next to it, so it stays the old one.
void tst_Faults::diskFullAtEveryByteOfAReplacement()
{
    for (int step = 0; step <= SampleConfiguration::newBytes.size(); ++step, ++s_bytes) {
        Scene scene;
        TestFiles::write(scene.configuration(), SampleConfiguration::oldBytes);
        TorkConfigFile configuration(scene.configuration());
        SampleConfiguration::fill(configuration);

        scene.files.limitBytes(step);
        const bool saved = configuration.SaveAtomically();
        scene.files.mend();

        CHECK(saved == (step == SampleConfiguration::newBytes.size()));
        CHECK(scene.files.reached() != saved);
        CHECK(configuration.m_lastError.isEmpty() == saved);
        CHECK(TestFiles::read(scene.configuration()) ==
              (saved ? SampleConfiguration::newBytes : SampleConfiguration::oldBytes));
        CHECK(!QFile::exists(scene.configuration() + ".saving"));
        CHECK(scene.othersAreUntouched());
    }
}

// No older file is lost, none is left incomplete; the entries continue when there is room again.
void tst_Faults::diskFullAtEveryByteOfARotation()
{
    const int most = full.size() + during.size();
    for (int step = 0; step <= most; ++step, ++s_bytes) {
        Scene scene;
        scene.log.setMaxLogFiles(3);
        makeOlderFiles(scene);

        scene.files.limitBytes(step);
        write(scene.log, during);
        scene.files.mend();
        const QByteArray whileFull = TestFiles::read(scene.current());
        write(scene.log, after);

        CHECK(during.startsWith(whileFull));
        CHECK(TestFiles::read(scene.current()) == during + after);
        CHECK(olderFilesAreKept(scene));
        if (step >= full.size())
            CHECK(numbered(scene) == QByteArrayList({full}) + older.mid(0, 2));
        CHECK(scene.files.reached() == (step < most));
        CHECK(scene.othersAreUntouched());
    }
}

void tst_Faults::diskFullAtEveryByteOfAnEntry()
{
    for (int step = 0; step <= during.size(); ++step, ++s_bytes) {
        Scene scene;
        write(scene.log, before);

        scene.files.limitBytes(step);
        write(scene.log, during);
        scene.files.mend();
        CHECK(TestFiles::read(scene.current()) == before + during.left(step));
        write(scene.log, after);

        CHECK(TestFiles::read(scene.current()) == before + during + after);
        CHECK(scene.othersAreUntouched());
    }
}

// More than the file's buffer holds: what is lost then is lost in whole entries.
void tst_Faults::diskFullForLong()
{
    const auto entry = [](int i) {
        return QByteArray::number(i) + QByteArray(i * 7 % 90, 'e') + '\n';
    };
    for (int step = 0; step < 3000; step += 101, ++s_bytes) {
        Scene scene;
        scene.files.limitBytes(step);
        for (int i = 0; i < 1000; ++i)
            write(scene.log, entry(i));
        CHECK(scene.files.reached());
        scene.files.mend();
        write(scene.log, after);

        // A short one may still fit where a long one did not.
        QByteArray expected;
        const QByteArray content = TestFiles::read(scene.current());
        for (int i = 0; i < 1000; ++i) {
            if (content.mid(expected.size()).startsWith(entry(i)))
                expected += entry(i);
        }
        CHECK(expected.size() > 10000);
        CHECK(content == expected + after);
        CHECK(scene.othersAreUntouched());
    }
}

int main(int argc, char** argv)
{
    // Hundreds of folders are created and removed: in memory rather than on the disk where
    // possible.
    if (!qEnvironmentVariableIsSet("TMPDIR") && QFileInfo("/dev/shm").isWritable())
        qputenv("TMPDIR", "/dev/shm");

    QCoreApplication application(argc, argv);
    tst_Faults test;
    return QTest::qExec(&test, argc, argv);
}

#include "tst_Faults.moc"
