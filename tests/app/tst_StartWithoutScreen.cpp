// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The program on a machine without a display: its first log, and what it prints.

#include "Installation.h"

#include <QTest>

#include <csignal>
#include <fcntl.h>
#include <unistd.h>

namespace {

QByteArray LogFileLine(QString const& logFile)
{
    return "Log file: " + QFile::encodeName(logFile) + "\n";
}

// In the child, standard output becomes a pipe that nobody reads; empty or with no room left.
void WriteToPipe(bool hasReader, bool isFull)
{
    int ends[2];
    if (pipe(ends) != 0)
        _exit(99);
    fcntl(ends[1], F_SETFL, O_NONBLOCK);
    while (isFull && write(ends[1], "x", 1) == 1) {}
    fcntl(ends[1], F_SETFL, 0);
    dup2(ends[1], STDOUT_FILENO);
    close(ends[1]);
    if (!hasReader)
        close(ends[0]);
}

void CloseStreams()
{
    close(STDIN_FILENO);
    close(STDOUT_FILENO);
    close(STDERR_FILENO);
}

void WriteToFullDisk()
{
    dup2(open("/dev/full", O_WRONLY), STDOUT_FILENO);
}

} // namespace

using ChildSetup = void (*)();
Q_DECLARE_METATYPE(ChildSetup)

class tst_StartWithoutScreen : public QObject
{
    Q_OBJECT

private slots:
    void theFirstLogHoldsTheStartAndNothingElse_data();
    void theFirstLogHoldsTheStartAndNothingElse();
    void endsBySignal_data();
    void endsBySignal();
    void printsTheFileThatIsWritten_data();
    void printsTheFileThatIsWritten();
    void troubleWithOutputKeepsNoEntryFromTheLog_data();
    void troubleWithOutputKeepsNoEntryFromTheLog();
    void noFileTakesThePlaceOfAClosedStream();
};

void tst_StartWithoutScreen::theFirstLogHoldsTheStartAndNothingElse_data()
{
    QTest::addColumn<QString>("platform");

    for (char const* platform : {"offscreen", "minimal", "OffScreen"})
        QTest::newRow(platform) << QString(platform);
}

// No warning before the window is complete, during it, or on close. The window is complete once
// there is something to save.
void tst_StartWithoutScreen::theFirstLogHoldsTheStartAndNothingElse()
{
    QFETCH(QString, platform);
    QByteArray log;
    bool wasComplete = false;
    for (int wait = 200; !wasComplete && wait < 10000; wait *= 2) {
        Installation installation;
        QVERIFY(installation.installed);
        installation.environment.insert("QT_QPA_PLATFORM", platform);
        const QString logFile = installation.LogFolder() + "velocor.log";
        RunningProgram program(installation);
        QVERIFY2(program.WaitForLog(logFile, "[^\\0]*" + StartEntry), TestFiles::read(logFile));
        QTest::qWait(wait);
        program.Send(SIGTERM);
        QCOMPARE(program.ExitCode(), 0);
        log = TestFiles::read(logFile);
        QVERIFY2(Matches(log, StartEntry), log);
        wasComplete = QFile::exists(installation.LogFolder() + "../velocor.cfg");
    }
    QVERIFY(wasComplete);
}

void tst_StartWithoutScreen::endsBySignal_data()
{
    QTest::addColumn<int>("signalNumber");

    QTest::newRow("SIGTERM") << SIGTERM;
    QTest::newRow("SIGINT") << SIGINT;
    QTest::newRow("SIGHUP") << SIGHUP;
}

// With saved window state.
void tst_StartWithoutScreen::endsBySignal()
{
    QFETCH(int, signalNumber);
    bool isSaved = false;
    for (int wait = 200; !isSaved && wait < 10000; wait *= 2) {
        Installation installation;
        QVERIFY(installation.installed);
        installation.environment.insert("QT_QPA_PLATFORM", "offscreen");
        RunningProgram program(installation);
        QVERIFY(program.WaitForLog(installation.LogFolder() + "velocor.log", StartEntry));
        QTest::qWait(wait);
        program.Send(signalNumber);
        QCOMPARE(program.ExitCode(), 0);
        isSaved =
            TestFiles::read(installation.LogFolder() + "../velocor.cfg").contains("<MainWindow>");
    }
    QVERIFY(isSaved);
}

void tst_StartWithoutScreen::printsTheFileThatIsWritten_data()
{
    QTest::addColumn<QByteArray>("items");
    QTest::addColumn<int>("oldSize");

    QTest::newRow("first start") << QByteArray() << 0;
    QTest::newRow("prefix from the settings")
        << QByteArray("<filePrefix>other</filePrefix>\n") << 0;
    QTest::newRow("no prefix in the settings") << QByteArray("\n") << 0;
    QTest::newRow("log that is rotated at the start")
        << QByteArray("<filePrefix>velocor</filePrefix>\n") << 1000000;
    QTest::newRow("size limit from the settings")
        << QByteArray("<maxLogFileSize>1</maxLogFileSize>\n<filePrefix>velocor</filePrefix>\n")
        << 0;
}

void tst_StartWithoutScreen::printsTheFileThatIsWritten()
{
    QFETCH(QByteArray, items);
    QFETCH(int, oldSize);
    Installation installation;
    QVERIFY(installation.installed);
    installation.environment.insert("QT_QPA_PLATFORM", "offscreen");
    const QString logs = installation.LogFolder();
    if (!items.isEmpty())
        QVERIFY(TestFiles::write(logs + "logsettings.cfg", "<LogSettings>\n<config>\n" + items +
                                                               "</config>\n</LogSettings>\n"));
    if (oldSize > 0)
        QVERIFY(TestFiles::write(logs + "velocor.log", QByteArray(oldSize, 'x')));

    RunningProgram program(installation);
    const QByteArray line = program.NextLine();
    QVERIFY2(line.startsWith("Log file: ") && line.endsWith('\n'), line);
    const QByteArray named = TestFiles::read(QFile::decodeName(line.mid(10).trimmed()));
    QVERIFY2(named.contains(" Trace app.exec() starting\n"), named);
    QCOMPARE(line, LogFileLine(logs + "velocor.log"));
    program.Send(SIGTERM);
    QCOMPARE(program.ExitCode(), 0);
    QCOMPARE(program.Output(), QByteArray());
}

void tst_StartWithoutScreen::troubleWithOutputKeepsNoEntryFromTheLog_data()
{
    QTest::addColumn<ChildSetup>("inChild");

    QTest::newRow("pipe without a reader") << ChildSetup([] { WriteToPipe(false, false); });
    QTest::newRow("full pipe whose reader sleeps") << ChildSetup([] { WriteToPipe(true, true); });
    QTest::newRow("full pipe without a reader") << ChildSetup([] { WriteToPipe(false, true); });
    QTest::newRow("full disk") << ChildSetup(WriteToFullDisk);
    QTest::newRow("standard streams closed") << ChildSetup(CloseStreams);
}

// It does not end the program either, or print into the log.
void tst_StartWithoutScreen::troubleWithOutputKeepsNoEntryFromTheLog()
{
    QFETCH(ChildSetup, inChild);
    Installation installation;
    QVERIFY(installation.installed);
    installation.environment.insert("QT_QPA_PLATFORM", "offscreen");
    const QString logFile = installation.LogFolder() + "velocor.log";
    RunningProgram program(installation, {}, inChild);
    QVERIFY2(program.WaitForLog(logFile, StartEntry), TestFiles::read(logFile));
    QTest::qWait(100);
    program.Send(SIGTERM);
    QCOMPARE(program.ExitCode(), 0);
    QVERIFY2(Matches(TestFiles::read(logFile), StartEntry), TestFiles::read(logFile));
}

void tst_StartWithoutScreen::noFileTakesThePlaceOfAClosedStream()
{
    Installation installation;
    QVERIFY(installation.installed);
    installation.environment.insert("QT_QPA_PLATFORM", "offscreen");
    RunningProgram program(installation, {}, CloseStreams);
    QVERIFY(program.WaitForLog(installation.LogFolder() + "velocor.log", StartEntry));
    for (int stream : {STDIN_FILENO, STDOUT_FILENO, STDERR_FILENO})
        QCOMPARE(QFile::symLinkTarget(QString("/proc/%1/fd/%2").arg(program.Id()).arg(stream)),
                 QString("/dev/null"));
}

QTEST_GUILESS_MAIN(tst_StartWithoutScreen)
#include "tst_StartWithoutScreen.moc"
