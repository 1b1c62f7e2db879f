// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Failing writes, in processes that would otherwise be killed by them.

#include "Installation.h"

#include "app/FailedWrites.h"
#include "support/ChildProcess.h"

#include <cerrno>
#include <csignal>
#include <cstdio>
#include <fcntl.h>
#include <sys/resource.h>
#include <unistd.h>

namespace {

bool SetFileSizeLimit(rlim_t bytes)
{
    rlimit limit = {};
    getrlimit(RLIMIT_FSIZE, &limit);
    limit.rlim_cur = bytes;
    return setrlimit(RLIMIT_FSIZE, &limit) == 0;
}

// A coverage build writes files on exit.
void LiftFileSizeLimit(pid_t process)
{
    rlimit limit = {};
    prlimit(process, RLIMIT_FSIZE, nullptr, &limit);
    limit.rlim_cur = limit.rlim_max;
    prlimit(process, RLIMIT_FSIZE, &limit, nullptr);
}

// In the child, standard error becomes a pipe that nobody reads.
void LoseReaderOfErrors()
{
    int ends[2];
    if (pipe(ends) != 0)
        _exit(99);
    close(ends[0]);
    dup2(ends[1], STDERR_FILENO);
    close(ends[1]);
}

void (*EffectOf(int signalNumber))(int)
{
    struct sigaction action = {};
    sigaction(signalNumber, nullptr, &action);
    return action.sa_handler;
}

int WriteToPipeWithoutReader(QStringList const&)
{
    SurviveFailedWrites();
    LoseReaderOfErrors();
    return write(STDERR_FILENO, "x", 1) == -1 && errno == EPIPE ? 0 : 1;
}

int WritePastTheLimit(QStringList const& arguments)
{
    SurviveFailedWrites();
    const int file = open(qPrintable(arguments.first()), O_CREAT | O_WRONLY, 0600);
    SetFileSizeLimit(1);
    const bool fits = write(file, "x", 1) == 1;
    const bool fails = write(file, "x", 1) == -1 && errno == EFBIG;
    LiftFileSizeLimit(0);
    return fits && fails ? 0 : 1;
}

// Not by QProcess, which resets SIGPIPE in the child.
int StartProgram(QStringList const&)
{
    SurviveFailedWrites();
    execl("/bin/cat", "cat", "/proc/self/status", static_cast<char*>(nullptr));
    return 1;
}

void OwnHandler(int) {}

int KeepOwnEffects(QStringList const&)
{
    std::signal(SIGPIPE, OwnHandler);
    std::signal(SIGXFSZ, SIG_IGN);
    SurviveFailedWrites();
    return EffectOf(SIGPIPE) == OwnHandler && EffectOf(SIGXFSZ) == SIG_IGN ? 0 : 1;
}

} // namespace

class tst_FailedWrites : public QObject
{
    Q_OBJECT

private slots:
    void failWithAnError_data();
    void failWithAnError();
    void programsStartedFromHereInheritNothing();
    void programStartsWithAFileSizeLimit_data();
    void programStartsWithAFileSizeLimit();
    void programLogsAndEchoesWithoutAReader();
};

void tst_FailedWrites::failWithAnError_data()
{
    QTest::addColumn<QString>("name");

    QTest::newRow("pipe without a reader") << "pipe";
    QTest::newRow("file at its limit") << "limit";
    QTest::newRow("effects that somebody chose are left alone") << "own";
}

void tst_FailedWrites::failWithAnError()
{
    QFETCH(QString, name);
    const QTemporaryDir folder;
    const ChildProcess::Result child = ChildProcess::run(name, {folder.filePath("file")});
    QVERIFY2(child.ended(), child.report());
}

void tst_FailedWrites::programsStartedFromHereInheritNothing()
{
    const ChildProcess::Result child = ChildProcess::run("exec");
    QVERIFY2(child.ended(), child.report());
    for (char const* mask : {"SigIgn", "SigCgt"}) {
        const QRegularExpression pattern(QString(mask) + ":\\s*([0-9a-f]+)");
        const QRegularExpressionMatch match = pattern.match(QString::fromLatin1(child.output));
        QVERIFY2(match.hasMatch(), child.output);
        const quint64 bits = match.captured(1).toULongLong(nullptr, 16);
        QCOMPARE((bits >> (SIGPIPE - 1)) & 1, quint64(0));
        QCOMPARE((bits >> (SIGXFSZ - 1)) & 1, quint64(0));
    }
}

void tst_FailedWrites::programStartsWithAFileSizeLimit_data()
{
    QTest::addColumn<int>("bytes");

    QTest::newRow("no file may hold anything") << 0;
    QTest::newRow("a part of the settings fits") << 20;
}

// The log and the settings are cut off; the program keeps running. The log's own tests check what
// is left of them.
void tst_FailedWrites::programStartsWithAFileSizeLimit()
{
    QFETCH(int, bytes);
    Installation installation;
    QVERIFY(installation.installed);
    installation.environment.insert("QT_QPA_PLATFORM", "offscreen");
    const rlim_t limit = static_cast<rlim_t>(bytes);
    RunningProgram program(installation, {}, [limit] { SetFileSizeLimit(limit); });
    const QByteArray line = program.NextLine(); // printed just before the event loop
    QCOMPARE(line, "Log file: " + QFile::encodeName(installation.LogFolder()) + "velocor.log\n");
    QVERIFY(QFileInfo(installation.LogFolder() + "logsettings.cfg").size() <= bytes);
    LiftFileSizeLimit(program.Id());
    program.Send(SIGTERM);
    QCOMPARE(program.ExitCode(), 0);
}

void tst_FailedWrites::programLogsAndEchoesWithoutAReader()
{
    Installation installation;
    QVERIFY(installation.installed);
    installation.environment.insert("QT_QPA_PLATFORM", "offscreen");
    installation.environment.insert("QT_FORCE_STDERR_LOGGING", "1");
    const QString settings = installation.LogFolder() + "logsettings.cfg";
    QVERIFY(TestFiles::write(settings, "<LogSettings>\n<config>\n"
                                       "<logPipeToConsole>yes</logPipeToConsole>\n"
                                       "<filePrefix>velocor</filePrefix>\n"
                                       "</config>\n</LogSettings>\n"));
    RunningProgram program(installation, {}, LoseReaderOfErrors);
    const QString logFile = installation.LogFolder() + "velocor.log";
    const QString log = Entry("Trace", "Loading configuration from " + settings) + StartEntry;
    QVERIFY2(program.WaitForLog(logFile, log), TestFiles::read(logFile));
    QCOMPARE(program.NextLine(), "Log file: " + QFile::encodeName(logFile) + "\n");
    program.Send(SIGTERM);
    QCOMPARE(program.ExitCode(), 0);
}

int main(int argc, char** argv)
{
    return ChildProcess::main<tst_FailedWrites>(argc, argv,
                                                {{"pipe", WriteToPipeWithoutReader},
                                                 {"limit", WritePastTheLimit},
                                                 {"own", KeepOwnEffects},
                                                 {"exec", StartProgram}});
}
#include "tst_FailedWrites.moc"
