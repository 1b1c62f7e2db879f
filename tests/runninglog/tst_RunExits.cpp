// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// What velocor-log says about how runs of the program ended. The program is ended for real.

#include "app/Installation.h"
#include "app/history/RunEnds.h"
#include "app/runninglog/RunMark.h"
#include "support/LeftMark.h"
#include "support/TestFiles.h"

#include <QJsonArray>
#include <QTemporaryDir>
#include <QtTest>

#include <csignal>
#include <cstdlib>
#include <sys/wait.h>
#include <unistd.h>

using namespace Velocor;

namespace {

// Of the user of an installation.
QString LogOf(Installation const& installation)
{
    return installation.LogFolder() + "velocor.log";
}

// The exits of the log's runs, oldest first.
QByteArrayList Exits(Installation const& installation, QString const& log)
{
    const ProgramResult result =
        RunProgram(VELOCOR_LOG, {log, log + ".1", "--merge", "--runs", "--format", "json"},
                   installation.environment);
    QByteArrayList exits;
    for (QByteArray const& line : result.output.split('\n')) {
        if (!line.isEmpty())
            exits.append(QJsonDocument::fromJson(line).object().value("exit").toString().toUtf8());
    }
    return exits;
}

QStringList Marks(Installation const& installation)
{
    const QDir folder(RunEnds::MarkFolderOf(LogOf(installation)));
    QStringList marks;
    for (QString const& name : folder.entryList({"*.run"}))
        marks.append(folder.filePath(name));
    return marks;
}

// An entry at the start of a second may come from a log with stamps in seconds. Which of two runs
// in that second it belongs to would be unknown.
void WaitForNextSecond()
{
    const qint64 second = QDateTime::currentSecsSinceEpoch();
    while (QDateTime::currentSecsSinceEpoch() == second)
        QTest::qWait(10);
}

QByteArrayList DistinctOf(QByteArrayList list)
{
    std::sort(list.begin(), list.end());
    list.erase(std::unique(list.begin(), list.end()), list.end());
    return list;
}

// Whether a window that starts now, and is closed, tells that an earlier one did not end normally.
// It has a spy.
bool SaysAbnormal(Installation const& installation)
{
    QFile::remove(installation.top + "report.json");
    RunningProgram program(installation);
    if (program.ExitCode() != 0)
        qWarning("the window did not close");
    const QString texts = QJsonDocument(installation.Report()["texts"].toArray()).toJson();
    if (!texts.contains("Aa"))
        qWarning("no texts");
    return texts.contains("did not end normally");
}

// What the last spied window showed.
bool Says(Installation const& installation, QString const& text)
{
    return QString(QJsonDocument(installation.Report()["texts"].toArray()).toJson()).contains(text);
}

QStringList Words(QString const& text)
{
    return text.isEmpty() ? QStringList() : text.split(' ');
}

std::vector<RunEnd> EndsOf(QString const& texts)
{
    const QString letters = "UNAR";
    std::vector<RunEnd> ends;
    for (QString const& text : Words(texts)) {
        RunEnd end;
        end.start = text.section('-', 0, 0).toLongLong();
        end.end = text.section('-', 1).chopped(1).toLongLong();
        end.exit = static_cast<HistoryRun::Exit>(letters.indexOf(text.right(1)));
        ends.push_back(end);
    }
    return ends;
}

bool CopyFolder(QString const& from, QString const& to)
{
    return QProcess::execute("cp", {"-a", from, to}) == 0;
}

} // namespace

class tst_RunExits : public QObject
{
    Q_OBJECT

private slots:
    void exits_data();
    void exits();
    void toldAtTheNextStart_data();
    void toldAtTheNextStart();
    void endOfTheSession();
    void secondWindow();
    void copiedFolder();
    void markOfAForkedChild();
    void killedAfterItsRecord();
    void shortRuns_data();
    void shortRuns();
    void longLife();
    void offersDefaultsAfterThreeShortRuns();
    void longRecord();

private:
    static void endLike(Installation const& installation, RunningProgram& program,
                        QString const& how);
    static void compareAfterNextStart(Installation const& installation, QByteArray const& expected);
};

void tst_RunExits::exits_data()
{
    QTest::addColumn<QString>("how");
    QTest::addColumn<QByteArray>("expected");
    const auto row = [](char const* how, char const* expected) {
        QTest::newRow(how) << how << QByteArray(expected);
    };
    row("still running", "running");
    row("closed", "normal");
    row("told to end", "normal");
    row("terminal closed", "normal");
    row("killed", "abnormal");
    row("invalid memory access", "abnormal");
    row("aborted", "abnormal");
    row("killed, and its process ID used again", "abnormal");
    row("restored from a backup", "unknown");
    row("mark of another computer", "unknown");
    row("mark removed", "unknown");
}

void tst_RunExits::endLike(Installation const& installation, RunningProgram& program,
                           QString const& how)
{
    static const QMap<QString, int> signalsOf = {{"told to end", SIGTERM},
                                                 {"terminal closed", SIGHUP},
                                                 {"invalid memory access", SIGSEGV},
                                                 {"aborted", SIGABRT}};
    program.Send(signalsOf.value(how, SIGKILL));
    program.ExitCode();
    const QStringList marks = Marks(installation);
    if (how.startsWith("killed, ")) {
        QVERIFY(LeftMark::useProcessIdAgain(marks.value(0)));
    } else if (how == "restored from a backup") {
        QVERIFY(LeftMark::restore(marks.value(0)));
    } else if (how == "mark of another computer") {
        QVERIFY(LeftMark::moveToAnotherComputer(marks.value(0)));
    } else if (how == "mark removed") {
        QVERIFY(QFile::remove(marks.value(0)));
    }
}

void tst_RunExits::exits()
{
    QFETCH(QString, how);
    QFETCH(QByteArray, expected);
    Installation installation;
    if (how == "closed")
        installation.AddSpy("close");
    RunningProgram program(installation);
    if (how == "closed") {
        QCOMPARE(program.ExitCode(), 0);
    } else {
        QTRY_COMPARE_WITH_TIMEOUT(Exits(installation, LogOf(installation)),
                                  QByteArrayList({"running"}), Patience);
        if (how != "still running")
            endLike(installation, program, how);
    }
    QCOMPARE(Exits(installation, LogOf(installation)), QByteArrayList({expected}));
    installation.environment.remove("QT_QPA_GENERIC_PLUGINS");
    if (how != "still running")
        compareAfterNextStart(installation, expected);
}

// The next start removes the marks that tell something, and keeps what they told.
void tst_RunExits::compareAfterNextStart(Installation const& installation,
                                         QByteArray const& expected)
{
    const QString log = LogOf(installation);
    const int doubtful = expected == "unknown" ? Marks(installation).size() : 0;
    QVERIFY(QFile::rename(log, log + ".1"));
    WaitForNextSecond();
    RunningProgram program(installation);
    QTRY_COMPARE_WITH_TIMEOUT(Exits(installation, log), QByteArrayList({expected, "running"}),
                              Patience);
    QTRY_COMPARE_WITH_TIMEOUT(Marks(installation).size(), 1 + doubtful, Patience);
    QCOMPARE(Exits(installation, log), QByteArrayList({expected, "running"}));
    program.Send(SIGTERM);
    program.ExitCode();
    QCOMPARE(Exits(installation, log), QByteArrayList({expected, "normal"}));
}

void tst_RunExits::toldAtTheNextStart_data()
{
    exits_data();
}

// Once, by the next window; never if another one is running, nor if nothing is known.
void tst_RunExits::toldAtTheNextStart()
{
    QFETCH(QString, how);
    QFETCH(QByteArray, expected);
    Installation installation;
    if (how == "closed")
        installation.AddSpy("close");
    RunningProgram program(installation);
    if (how == "closed") {
        QCOMPARE(program.ExitCode(), 0);
    } else {
        QTRY_COMPARE_WITH_TIMEOUT(Exits(installation, LogOf(installation)),
                                  QByteArrayList({"running"}), Patience);
        if (how != "still running")
            endLike(installation, program, how);
    }
    installation.AddSpy("close");
    installation.environment.insert("SPY_AWAIT", "Aa"); // made with the notices
    QCOMPARE(SaysAbnormal(installation), expected == "abnormal");
    QVERIFY(!SaysAbnormal(installation));
}

// The display goes away, and the program exits without returning to main().
void tst_RunExits::endOfTheSession()
{
    if (QStandardPaths::findExecutable("Xvfb").isEmpty())
        QSKIP("no Xvfb");
    QProcess display;
    display.start("Xvfb", {"-displayfd", "1", "-screen", "0", "800x600x24", "-nolisten", "tcp"});
    const QByteArray number = NextLine(display).trimmed();
    QVERIFY(!number.isEmpty());
    Installation installation;
    installation.environment.insert("DISPLAY", ":" + number);
    installation.environment.insert("QT_QPA_PLATFORM", "xcb");
    RunningProgram program(installation);
    QTRY_COMPARE_WITH_TIMEOUT(Exits(installation, LogOf(installation)), QByteArrayList({"running"}),
                              Patience);
    display.terminate();
    QVERIFY(display.waitForFinished(Patience));
    QVERIFY(program.ExitCode() > 0);
    QCOMPARE(Exits(installation, LogOf(installation)), QByteArrayList({"normal"}));
    QCOMPARE(Marks(installation), QStringList());
}

// Both write to the same file, so it may not be known whose run it is. It did not crash, though.
void tst_RunExits::secondWindow()
{
    Installation const installation;
    const QString log = LogOf(installation);
    RunningProgram first(installation);
    QTRY_COMPARE_WITH_TIMEOUT(Exits(installation, log), QByteArrayList({"running"}), Patience);
    RunningProgram second(installation);
    QTRY_COMPARE_WITH_TIMEOUT(Marks(installation).size(), 2, Patience);
    QTRY_COMPARE_WITH_TIMEOUT(Exits(installation, log).last(), QByteArray("running"), Patience);
    second.Send(SIGTERM);
    QCOMPARE(second.ExitCode(), 0);
    QVERIFY(!Exits(installation, log).contains("abnormal"));
    QCOMPARE(Marks(installation).size(), 1);
    first.Send(SIGTERM);
    QCOMPARE(first.ExitCode(), 0);
    QCOMPARE(DistinctOf(Exits(installation, log)), QByteArrayList({"normal"}));
    QVERIFY(!QFile::exists(RunEnds::MarkFolderOf(log)));
}

// The copy of a running program's mark is held by nobody.
void tst_RunExits::copiedFolder()
{
    Installation const installation;
    RunningProgram program(installation);
    QTRY_COMPARE_WITH_TIMEOUT(Exits(installation, LogOf(installation)), QByteArrayList({"running"}),
                              Patience);
    const QString copy = installation.top + "copy";
    QVERIFY(CopyFolder(installation.LogFolder() + "..", copy));
    QVERIFY(QFile::exists(copy + "/logs/velocor.log"));
    QCOMPARE(Exits(installation, copy + "/logs/velocor.log"), QByteArrayList({"unknown"}));
    program.Send(SIGTERM);
    program.ExitCode();
    QVERIFY(CopyFolder(installation.LogFolder() + "..", copy + "2"));
    QCOMPARE(Exits(installation, copy + "2/logs/velocor.log"), QByteArrayList({"normal"}));
}

// It may exit without having started another program.
void tst_RunExits::markOfAForkedChild()
{
    const QTemporaryDir folder;
    const QString log = folder.filePath("logs/app.log");
    {
        const RunMark mark(log);
        const pid_t child = fork();
        if (child == 0)
            std::exit(0);
        int status = 0;
        QCOMPARE(waitpid(child, &status, 0), child);
        QVERIFY(!QFile::exists(RunEnds::RecordFileOf(log)));
        QCOMPARE(RunEnds::Of(log).size(), size_t(1));
        QCOMPARE(RunEnds::Of(log)[0].exit, HistoryRun::Running);
    }
    QCOMPARE(RunEnds::Of(log).size(), size_t(1));
    QCOMPARE(RunEnds::Of(log)[0].exit, HistoryRun::Normal);
    QCOMPARE(RunEnds::Of(log)[0].start, RunMark::ProgramStart());
}

// Its record counts, so nobody is told.
void tst_RunExits::killedAfterItsRecord()
{
    const QTemporaryDir folder;
    const QString log = folder.filePath("logs/app.log");
    const qint64 start = RunMark::ProgramStart() - 60000;
    QVERIFY(!LeftMark::make(log, start).isEmpty());
    QVERIFY(!LeftMark::make(log, start - 1).isEmpty());
    QVERIFY(TestFiles::write(RunEnds::RecordFileOf(log),
                             RunEnds::Line({start, start + 5, HistoryRun::Normal})));
    RunMark mark(log);
    const std::vector<RunEnd> ends = mark.CollectOthers();
    QCOMPARE(ends.size(), size_t(1));
    QCOMPARE(ends[0].start, start - 1);
    QVERIFY(mark.CollectOthers().empty());
}

void tst_RunExits::shortRuns_data()
{
    QTest::addColumn<QString>("ends"); // start-end and first letter of the exit
    QTest::addColumn<int>("expected");
    QTest::newRow("none") << "" << 0;
    QTest::newRow("three") << "1000-11000A 20000-20005A 40000-50000A" << 3;
    QTest::newRow("in any order") << "40000-50000A 1000-11000A 20000-20005A" << 3;
    QTest::newRow("last one too long") << "1000-2000A 20000-30001A" << 0;
    QTest::newRow("one too long") << "1000-2000A 20000-30001A 40000-40001A 60000-60001A" << 2;
    QTest::newRow("a normal one between") << "1000-2000A 20000-20001N 40000-40001A" << 1;
    QTest::newRow("killed after its record") << "1000-2000A 1000-1500N 40000-40001A" << 1;
    QTest::newRow("another one is running") << "1000-2000A 20000-90000R 40000-40001A" << 2;
    QTest::newRow("later ones do not count") << "1000-2000A 100000-100001A" << 1;
}

void tst_RunExits::shortRuns()
{
    QFETCH(QString, ends);
    QTEST(RunEnds::ShortRunsBefore(EndsOf(ends), 100000), "expected");
}

void tst_RunExits::longLife()
{
    const QTemporaryDir folder;
    const QString log = folder.filePath("logs/app.log");
    const qint64 start = RunMark::ProgramStart() - 60000;
    {
        RunMark mark(log);
        const QString note = LeftMark::make(log, start) + ".long";
        QVERIFY(TestFiles::write(note, ""));
        QVERIFY(!LeftMark::make(log, start + 1).isEmpty());
        const std::vector<RunEnd> ends = mark.CollectOthers();
        QCOMPARE(ends.size(), size_t(2));
        QCOMPARE(ends[0].end, RunMark::ProgramStart());
        QCOMPARE(ends[1].end, start + 1 + RunEnds::ShortRun);
        QVERIFY(!QFile::exists(note));

        const QDir marks(RunEnds::MarkFolderOf(log));
        QCOMPARE(marks.entryList(QDir::Files).size(), 1);
        mark.NoteLongLife();
        QCOMPARE(marks.entryList({"*.run.long"}, QDir::Files).size(), 1);
    }
    QVERIFY(!QFile::exists(RunEnds::MarkFolderOf(log)));
}

// Not after two, and not without settings.
void tst_RunExits::offersDefaultsAfterThreeShortRuns()
{
    Installation installation;
    const QString settings = installation.LogFolder() + "../velocor.cfg";
    installation.AddSpy("close");
    installation.environment.insert("SPY_AWAIT", "Aa");
    for (int run = 0; run < 3; ++run)
        LeftMark::make(LogOf(installation), RunMark::ProgramStart() - 60000 + 1000 * run);
    QVERIFY(SaysAbnormal(installation));
    QVERIFY(!Says(installation, "Set Aside"));
    QVERIFY(QFile::exists(settings)); // the spied one has closed normally
    QVERIFY(QFile::remove(RunEnds::RecordFileOf(LogOf(installation))));
    for (int run = 0; run < 2; ++run)
        LeftMark::make(LogOf(installation), RunMark::ProgramStart() - 50000 + 1000 * run);
    QVERIFY(SaysAbnormal(installation));
    QVERIFY(!Says(installation, "Set Aside"));
    QVERIFY(QFile::remove(RunEnds::RecordFileOf(LogOf(installation))));
    for (int run = 0; run < 3; ++run)
        LeftMark::make(LogOf(installation), RunMark::ProgramStart() - 40000 + 1000 * run);
    // Qt shows what is added to a visible widget later.
    installation.environment.insert("SPY_AWAIT", "Set Aside");
    QVERIFY(SaysAbnormal(installation));
    QVERIFY(Says(installation, "Set Aside"));
    QVERIFY(Says(installation, "velocor.cfg"));
}

// The file does not grow forever. The newest stay.
void tst_RunExits::longRecord()
{
    const QTemporaryDir folder;
    const QString log = folder.filePath("logs/app.log");
    const QByteArray old = "2026-11-20T14:03:02.007 2026-11-20T14:03:03.100 abnormal\n";
    const QByteArray last = "2026-11-21T14:03:02.007 2026-11-21T14:03:03.100 abnormal\n";
    QVERIFY(TestFiles::write(RunEnds::RecordFileOf(log), old.repeated(20000) + last));
    RunMark(log).CollectOthers();
    const QByteArray kept = TestFiles::read(RunEnds::RecordFileOf(log));
    QVERIFY(kept.size() < 300000 && kept.size() > 200000);
    QVERIFY(kept.startsWith(old) && kept.contains('\n' + last));
}

QTEST_GUILESS_MAIN(tst_RunExits)
#include "tst_RunExits.moc"
