// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// A program that logs and saves is killed at a random moment and restarted, over and over. After
// each death the files are compared with what the program had been told was done.
//
//     VELOCOR_KILLS  how often, in total

#include "common/log/TorkLog.h"
#include "log/LogFolder.h"
#include "reliability/Figures.h"
#include "reliability/Victim.h"

#include "common/config/TorkConfigFile.h"

#include <QtTest>

#include <csignal>
#include <memory>
#include <random>
#include <spawn.h>
#include <sys/wait.h>
#include <unistd.h>

extern char** environ; // not in every system's headers

class tst_SuddenDeath : public QObject
{
    Q_OBJECT

private slots:
    void init();
    void cleanup();
    void killed_data();
    void killed();
    void killedWhileReplacing();
    void cleanupTestCase();

private:
    QtMessageHandler m_handler = nullptr;
    bool m_failed = false;
};

namespace {

// Rotation as set in a row's settings file.
struct Rotation
{
    int maxLogFiles;
    int entriesBetween; // after how many the victim closes the file; 0: never
    bool rotates;       // on every opening, or else never

    // How far older files may move up in a run.
    quint64 shifts(quint64 entries) const
    {
        if (!rotates)
            return 0;
        return entriesBetween ? entries / static_cast<quint64>(entriesBetween) + 1 : 1;
    }
};

// The contents of a log file: consecutive entries of one run from its start, then perhaps a part of
// the next one, and then what an older run has left.
struct Stretch
{
    quint64 run = 0;
    quint64 first = 0;
    quint64 last = 0; // of the whole ones
    int part = 0;     // bytes of the one that follows
    QByteArray rest;

    // An older run's entry may begin with the same few bytes; only from the run's number on is it
    // certain which one it belongs to.
    bool endsInHalf() const { return part > Victim::line(run, last + 1).indexOf('.'); }
};

Stretch stretchOf(QByteArray const& content)
{
    static const QRegularExpression start("^T Error <(\\d+)\\.(\\d+) ");
    const QRegularExpressionMatch match = start.match(QString::fromLatin1(content.left(60)));
    Stretch stretch;
    stretch.run = match.captured(1).toULongLong();
    stretch.first = match.captured(2).toULongLong();
    stretch.last = stretch.first - 1;
    if (!match.hasMatch()) {
        stretch.rest = content;
        return stretch;
    }

    int end = 0;
    QByteArray next = Victim::line(stretch.run, stretch.first);
    while (content.mid(end, next.size()) == next) {
        end += next.size();
        next = Victim::line(stretch.run, ++stretch.last + 1);
    }
    while (end + stretch.part < content.size() && stretch.part < next.size() &&
           content[end + stretch.part] == next[stretch.part])
        ++stretch.part;
    stretch.rest = content.mid(end + stretch.part);
    return stretch;
}

// The log files by number; the current one is 0.
using Files = QMap<int, QByteArray>;

Files filesIn(QString const& logs)
{
    Files files;
    const QStringList names = QDir(logs).entryList({"app.log", "app.log.*"}, QDir::Files);
    for (QString const& name : names) {
        if (!name.endsWith(".part"))
            files[name == "app.log" ? 0 : name.section('.', -1).toInt()] =
                TestFiles::read(logs + name);
    }
    return files;
}

// How many named copies were cut short.
int unfinishedCopies(QString const& logs)
{
    return QDir(logs).entryList({"app.log.1.*.part"}, QDir::Files | QDir::Hidden).size();
}

// Whether no other file is left in the log directory. A copy that was cut short has no name; only
// where the file system does not support that it has one, until the next rotation.
bool holdsOnlyTheLog(QString const& logs, bool isNamed)
{
    const QStringList names = QDir(logs).entryList(QDir::Files | QDir::Hidden);
    return unfinishedCopies(logs) <= (isNamed ? 1 : 0) &&
           std::all_of(names.begin(), names.end(), [](QString const& name) {
               return name == "app.log" || name.startsWith("app.log.");
           });
}

// Runs one victim and kills it.
class Victims
{
public:
    explicit Victims(LogFolder const& folder) : m_root(folder.root()), m_file(m_root + "report")
    {
        m_file.open(QIODevice::ReadWrite);
        m_file.resize(sizeof(Victim::Report));
        report = reinterpret_cast<Victim::Report*>(m_file.map(0, sizeof(Victim::Report)));
    }

    // False if it did not start or ended by itself.
    //
    // @param task  the victim's last argument, except for "named"
    bool runAndKill(quint64 run, QByteArray const& task, bool isNamed = false)
    {
        new (report) Victim::Report{};
        const QByteArray program = VICTIM;
        const QByteArray root = QFile::encodeName(m_root);
        const QByteArray number = QByteArray::number(run);
        char* arguments[] = {const_cast<char*>(program.data()),
                             const_cast<char*>(root.data()),
                             const_cast<char*>(number.data()),
                             const_cast<char*>(task.data()),
                             isNamed ? const_cast<char*>("named") : nullptr,
                             nullptr};
        pid_t process = 0;
        if (posix_spawn(&process, program.constData(), nullptr, nullptr, arguments, environ) != 0)
            return false;

        // One in eight dies before it runs.
        const bool early = m_random() % 8 == 0;
        QElapsedTimer patience;
        patience.start();
        while (!early && !report->running && patience.elapsed() < 60000)
            usleep(200);
        const bool lives = early || report->running;
        usleep(m_random() % 20000);
        kill(process, SIGKILL);
        int status = 0;
        waitpid(process, &status, 0);
        return lives && WIFSIGNALED(status) && WTERMSIG(status) == SIGKILL;
    }

    Victim::Report* report = nullptr;

private:
    QString m_root;
    QFile m_file;
    std::mt19937 m_random{std::random_device()()};
};

// Errors are reported as a text; empty: none.

QString wrongInEntries(Files const& files, quint64 run, Victim::Report const& report,
                       Rotation const& rotation)
{
    quint64 next = 0; // entry of this run
    bool isOver = false;
    QList<int> numbers = files.keys();
    std::sort(numbers.begin(), numbers.end(), std::greater<int>());
    for (int number : numbers) {
        QByteArray const& content = files[number];
        const bool isCopied = number == 0 && content == files.value(1);
        if (content.isEmpty() || isCopied)
            continue;
        const Stretch stretch = stretchOf(content);
        const QString where = QString("file %1: run %2, entries %3 to %4, %5 bytes of the next: ")
                                  .arg(number)
                                  .arg(stretch.run)
                                  .arg(stretch.first)
                                  .arg(stretch.last)
                                  .arg(stretch.part);
        if (rotation.rotates && !stretch.rest.isEmpty())
            return where + "something else after them";
        if (stretch.run != run)
            continue;

        if (stretch.rest.contains('<' + QByteArray::number(run) + '.'))
            return where + "entries of the same run after half an entry";
        if (isOver)
            return where + "entries of the same run after half an entry in the file before";
        isOver = stretch.endsInHalf();
        if (next == 0 && stretch.first != 1 && files.lastKey() < rotation.maxLogFiles)
            return where + "those before are lost";
        if (next != 0 && stretch.first != next)
            return where + QString("begins with another than %1").arg(next);
        next = stretch.last + 1;
        if (isOver && next != report.entryBegun)
            return where + "half an entry that was not the last begun";
    }

    if (next == 0 ? report.entryReturned > 0 : next <= report.entryReturned)
        return QString("entry %1 had returned, the next in the files is %2")
            .arg(report.entryReturned)
            .arg(next);
    if (next > report.entryBegun + 1)
        return "entries that were never written";
    return QString();
}

// Every older file is still there, whole, under some number, unless it may have been pruned.
QString wrongInOlderFiles(Files const& before, Files const& after, quint64 shifts,
                          Rotation const& rotation)
{
    for (auto file = before.begin(); file != before.end(); ++file) {
        const bool mayBePruned =
            static_cast<quint64>(file.key()) + shifts > static_cast<quint64>(rotation.maxLogFiles);
        const bool isOverwritten = file.key() == 0 && !rotation.rotates;
        const bool isKept = file->isEmpty() || after.values().contains(*file);
        if (!isKept && !mayBePruned && !isOverwritten)
            return QString("file %1 is lost or changed").arg(file.key());
    }
    return QString();
}

// The last save that returned is there, or as much of the next one as was written.
QString wrongInConfiguration(QByteArray const& before, QByteArray const& after, quint64 run,
                             Victim::Report const& report)
{
    const QByteArray saved =
        report.saveReturned ? Victim::configuration(run, report.saveReturned) : before;
    const bool isUnderWay = report.saveBegun > report.saveReturned;
    if (after == saved ||
        (isUnderWay && Victim::configuration(run, report.saveBegun).startsWith(after)))
        return QString();
    return QString("configuration of %1 bytes after save %2 returned and %3 began")
        .arg(after.size())
        .arg(report.saveReturned)
        .arg(report.saveBegun);
}

quint64 s_kills = 0;
quint64 s_entries = 0;
quint64 s_saves = 0;
quint64 s_halfEntries = 0;
quint64 s_cutSaves = 0;
quint64 s_replacingKills = 0;
quint64 s_replacements = 0;
quint64 s_leftovers = 0;

} // namespace

namespace {

// The XML reader complains about a truncated save.
void dropMessage(QtMsgType, QMessageLogContext const&, QString const&) {}

} // namespace

void tst_SuddenDeath::init()
{
    m_handler = qInstallMessageHandler(dropMessage);
}

void tst_SuddenDeath::cleanup()
{
    qInstallMessageHandler(m_handler);
    m_failed = m_failed || QTest::currentTestFailed();
}

void tst_SuddenDeath::killed_data()
{
    QTest::addColumn<int>("maxLogFiles");
    QTest::addColumn<int>("entriesBetween");
    QTest::addColumn<bool>("rotates");
    QTest::addColumn<bool>("isNamed"); // the file system does not support unnamed files

    QTest::newRow("each run writes over the one before") << 10 << 0 << false << false;
    QTest::newRow("each start rotates") << 6 << 0 << true << false;
    QTest::newRow("rotates while it runs") << 6 << 25 << true << false;
    QTest::newRow("rotates while it runs, no unnamed files") << 6 << 25 << true << true;
}

void tst_SuddenDeath::killed()
{
    QFETCH(int, maxLogFiles);
    QFETCH(int, entriesBetween);
    QFETCH(bool, rotates);
    QFETCH(bool, isNamed);
    const Rotation rotation{maxLogFiles, entriesBetween, rotates};
    LogFolder folder;
    const LogFolder::Settings settings = {{"filePrefix", "app"},
                                          {"dateTimeFormat", "'T'"},
                                          {"maxLogFiles", QString::number(maxLogFiles)},
                                          {"maxLogFileSize", rotates ? "1" : "2000000000"}};
    QVERIFY(TestFiles::write(folder.settingsFile(), LogFolder::settingsText(settings)));
    const QString configurationFile = folder.root() + "app.cfg";
    QVERIFY(TestFiles::write(configurationFile, Victim::configuration(0, 1)));
    Victims victims(folder);
    QVERIFY(victims.report);

    const quint64 kills = static_cast<quint64>(Figures::wanted("VELOCOR_KILLS", 60) + 3) / 4;
    for (quint64 run = 1; run <= kills; ++run) {
        const Files before = filesIn(folder.logs());
        const QByteArray configuration = TestFiles::read(configurationFile);
        QVERIFY(victims.runAndKill(run, QByteArray::number(entriesBetween), isNamed));
        const Files after = filesIn(folder.logs());
        const QByteArray left = TestFiles::read(configurationFile);
        QVERIFY(holdsOnlyTheLog(folder.logs(), isNamed));
        Victim::Report const& report = *victims.report;

        const QString wrong =
            wrongInEntries(after, run, report, rotation) +
            wrongInOlderFiles(before, after, rotation.shifts(report.entryBegun), rotation) +
            wrongInConfiguration(configuration, left, run, report);
        QVERIFY2(wrong.isEmpty(), qPrintable(QString("run %1: %2").arg(run).arg(wrong)));

        ++s_kills;
        s_entries += report.entryReturned;
        s_saves += report.saveReturned;
        for (QByteArray const& content : after)
            s_halfEntries += stretchOf(content).run == run && stretchOf(content).endsInHalf();
        TorkConfigFile loaded(configurationFile);
        const bool isWhole = left.endsWith("</VelocorSettings>\n");
        QCOMPARE(loaded.Load(), isWhole);
        s_cutSaves += !isWhole;
    }

    if (isNamed) {
        TorkLog log;
        folder.prepare(log, "app", 1);
        log.deleteOldFiles();
        QCOMPARE(unfinishedCopies(folder.logs()), 0);
    }
}

// The file is complete each time: that of the last save that returned, or of the one in progress.
// Next to it is at most the new file of that one.
void tst_SuddenDeath::killedWhileReplacing()
{
    const LogFolder folder;
    const QString configurationFile = folder.root() + "app.cfg";
    const QString newFile = configurationFile + ".saving";
    QByteArray saved = Victim::configuration(0, 1);
    QVERIFY(TestFiles::write(configurationFile, saved));
    Victims victims(folder);
    QVERIFY(victims.report);
    const QStringList others = QDir(folder.root()).entryList(QDir::AllEntries | QDir::Hidden);

    const quint64 kills = static_cast<quint64>(Figures::wanted("VELOCOR_KILLS", 60));
    for (quint64 run = 1; run <= kills; ++run) {
        QVERIFY(victims.runAndKill(run, "atomically"));
        Victim::Report const& report = *victims.report;
        const QByteArray left = TestFiles::read(configurationFile);
        if (report.saveReturned)
            saved = Victim::configuration(run, report.saveReturned);
        const bool isUnderWay = report.saveBegun > report.saveReturned;
        const bool isNew = isUnderWay && left == Victim::configuration(run, report.saveBegun);
        QVERIFY2(left == saved || isNew,
                 qPrintable(QString("run %1: %2 bytes after save %3 returned and %4 began")
                                .arg(run)
                                .arg(left.size())
                                .arg(report.saveReturned)
                                .arg(report.saveBegun)));
        saved = left;

        QStringList beside = QDir(folder.root()).entryList(QDir::AllEntries | QDir::Hidden);
        s_leftovers += static_cast<quint64>(beside.removeAll("app.cfg.saving"));
        QCOMPARE(beside, others);
        ++s_replacingKills;
        s_replacements += report.saveReturned;
    }

    TorkConfigFile last(configurationFile);
    QVERIFY(last.Load());
    QVERIFY(last.SaveAtomically());
    QVERIFY(!QFile::exists(newFile));
}

void tst_SuddenDeath::cleanupTestCase()
{
    if (m_failed)
        return;
    // Either may have been requested alone.
    if (s_kills) {
        QVERIFY(s_entries > 0 && s_saves > 0);
        Figures::print(
            QString("sudden death: %1 kills, %2 entries and %3 saves acknowledged, none "
                    "lost, none torn; the entry under way was cut %4 times, the save %5 times")
                .arg(s_kills)
                .arg(s_entries)
                .arg(s_saves)
                .arg(s_halfEntries)
                .arg(s_cutSaves));
    }
    if (s_replacingKills) {
        QVERIFY(s_replacements > 0);
        Figures::print(
            QString("sudden death in an atomic save: %1 kills, %2 saves acknowledged, none lost, "
                    "no file cut; %3 kills left a new file beside it, and never more than one")
                .arg(s_replacingKills)
                .arg(s_replacements)
                .arg(s_leftovers));
    }
}

QTEST_GUILESS_MAIN(tst_SuddenDeath)

#include "tst_SuddenDeath.moc"
