// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The arguments of the program itself, run as a process, and the class that reads them.

#include "Installation.h"
#include "ProgramRuns.h"

#include "app/CommandLine_p.h"

#include <QDir>
#include <QJsonArray>
#include <QTest>

#include <csignal>
#include <fcntl.h>
#include <unistd.h>

using namespace Velocor;

namespace {

QByteArray const Version("velocor " VELOCOR_VERSION "\n");

QByteArray SavedState(Installation const& installation)
{
    return TestFiles::read(installation.LogFolder() + "../velocor.cfg");
}

} // namespace

class tst_CommandLine : public QObject
{
    Q_OBJECT

private slots:
    void reads_data();
    void reads();
    void complaintsAreLimited();
    void answers_data();
    void answers();
    void answersTakeEveryStepOfTheStart();
    void answersLeaveTheStateOfTheWindow();
    void answersToAFullPipe();
    void tellsUnknownOptions();
    void opensFiles();
    void readsStandardInput();
};

void tst_CommandLine::reads_data()
{
    QTest::addColumn<QStringList>("arguments");
    QTest::addColumn<QStringList>("files");
    QTest::addColumn<QByteArray>("complaints");
    QTest::addColumn<QByteArray>("answer");

    const auto row = [](char const* name, QStringList const& arguments, QStringList const& files,
                        QByteArray const& unknown = QByteArray(),
                        QByteArray const& answer = QByteArray()) {
        const QByteArray complaint =
            unknown.isEmpty() ? unknown
                              : "velocor: unknown option \"" + unknown + "\" is ignored\n";
        QTest::newRow(name) << arguments << files << complaint << answer;
    };
    const QString here = QDir::currentPath() + "/";
    row("nothing", {}, {});
    row("absolute", {"/a/b.log"}, {"/a/b.log"});
    row("relative", {"b.log"}, {here + "b.log"});
    row("in the order given", {"/z", "/a"}, {"/z", "/a"});
    row("standard input", {"-"}, {"-"});
    row("standard input once", {"-", "/a", "-"}, {"-", "/a"});
    row("a file called like standard input", {"./-"}, {here + "-"});
    row("a file called like an option", {"--", "--help"}, {here + "--help"});
    row("unknown option", {"--colour", "/a"}, {"/a"}, "colour");
    row("unknown option with a value", {"--colour=red"}, {}, "colour");
    row("unknown word", {"-colour"}, {}, "colour");
    row("version", {"--version"}, {}, {}, Version);
    row("short version", {"-v"}, {}, {}, Version);
    row("version among others", {"/a", "--version", "--x"}, {"/a"}, "x", Version);
}

void tst_CommandLine::reads()
{
    QFETCH(QStringList, arguments);
    const CommandLine commandLine(QStringList("velocor") + arguments);
    QTEST(commandLine.files(), "files");
    QTEST(commandLine.complaints(), "complaints");
    QTEST(commandLine.answer(), "answer");
}

void tst_CommandLine::complaintsAreLimited()
{
    QStringList arguments("velocor");
    for (int i = 0; i < 1000; ++i)
        arguments.append("--" + QString::number(i) + QString(1000, 'x'));
    QVERIFY(CommandLine(arguments).complaints().size() < 4000);
}

void tst_CommandLine::answers_data()
{
    QTest::addColumn<QString>("argument");
    QTest::addColumn<QString>("expected");

    const QString help("\\AUsage: [^\\n]*velocor \\[options\\] \\[FILE\\.\\.\\.\\]\\n[\\s\\S]*"
                       "--help [\\s\\S]*--version [\\s\\S]*\\n\\z");
    const QString version("\\A" + QRegularExpression::escape(Version) + "\\z");
    QTest::newRow("--help") << "--help" << help;
    QTest::newRow("-h") << "-h" << help;
    QTest::newRow("--version") << "--version" << version;
}

// The event loop ends it, after the entry that every start logs.
void tst_CommandLine::answers()
{
    QFETCH(QString, argument);
    QFETCH(QString, expected);
    const Installation installation;
    QVERIFY(installation.installed);
    const ProgramResult result =
        RunProgram(installation.program, {argument}, installation.environment);
    QVERIFY(result.finished);
    QCOMPARE(result.exitCode, 0);
    QCOMPARE(result.errors, QByteArray());
    QVERIFY2(QRegularExpression(expected).match(result.output).hasMatch(), result.output);
    const QByteArray log = TestFiles::read(installation.LogFolder() + "velocor.log");
    QVERIFY2(Matches(log, StartEntry), log);
}

void tst_CommandLine::answersTakeEveryStepOfTheStart()
{
    Installation installation;
    QVERIFY(installation.installed);
    installation.AddSpy("0");
    const ProgramResult result =
        RunProgram(installation.program, {"--version"}, installation.environment);
    QCOMPARE(result.exitCode, 0);
    QCOMPARE(installation.Report().value("steps").toArray(),
             QJsonArray({"RootPath", "organization", "product", "DataPath", "DocPath", "caption",
                         "show", "exec"}));
}

void tst_CommandLine::answersLeaveTheStateOfTheWindow()
{
    const Installation installation;
    QVERIFY(installation.installed);
    const QString file = installation.LogFolder() + "../velocor.cfg";
    const QByteArray state("<VelocorSettings>\n<x>\n<y>z</y>\n</x>\n</VelocorSettings>\n");
    QVERIFY(TestFiles::write(file, state));
    QCOMPARE(RunProgram(installation.program, {"--help"}, installation.environment).exitCode, 0);
    QCOMPARE(TestFiles::read(file), state);
}

// The text is lost, but the program ends.
void tst_CommandLine::answersToAFullPipe()
{
    const Installation installation;
    QVERIFY(installation.installed);
    RunningProgram program(installation, {"--help"}, [] {
        int ends[2] = {-1, -1};
        if (pipe(ends) != 0)
            return;
        fcntl(ends[1], F_SETFL, O_NONBLOCK);
        static char const bytes[4096] = {}; // Qt 6 gives this a small stack within its own
        while (write(ends[1], bytes, sizeof(bytes)) > 0) {}
        fcntl(ends[1], F_SETFL, 0);
        dup2(ends[1], STDOUT_FILENO);
    });
    QCOMPARE(program.ExitCode(), 0);
}

void tst_CommandLine::tellsUnknownOptions()
{
    Installation installation;
    QVERIFY(installation.installed);
    installation.AddSpy("0");
    const ProgramResult result = RunProgram(installation.program, {"--unknown", "-style", "fusion"},
                                            installation.environment);
    QVERIFY(result.finished);
    QCOMPARE(result.exitCode, 0);
    QCOMPARE(result.errors, QByteArray("velocor: unknown option \"unknown\" is ignored\n"));
    const QByteArray log = TestFiles::read(installation.LogFolder() + "velocor.log");
    QVERIFY2(Matches(log, StartEntry), log);
}

// Also relative ones. A pipe and a folder are skipped.
void tst_CommandLine::opensFiles()
{
    const Installation installation;
    QVERIFY(installation.installed);
    const QString folder = installation.top + "some logs/";
    const QString other = installation.top + QString::fromUtf8("K\xC3\xB6ln.log");
    QVERIFY(TestFiles::write(folder + "first.log", "2025-03-03 09:00:00.000 Trace x\n"));
    QVERIFY(TestFiles::write(other, "y\n"));
    const QByteArray workingFolder = QFile::encodeName(folder);
    RunningProgram program(
        installation, {"first.log", "missing.log", ".", "/dev/zero", other},
        [workingFolder] { static_cast<void>(chdir(workingFolder.constData()) == 0); });
    QVERIFY(program.WaitForLog(installation.LogFolder() + "velocor.log", StartEntry));
    // The file that is opened last is being read.
    QTRY_VERIFY_WITH_TIMEOUT(program.HasOpen(other), Patience);
    QVERIFY(!program.HasOpen("/dev/zero"));
    program.Send(SIGTERM);
    QCOMPARE(program.ExitCode(), 0);
    const QByteArray state = SavedState(installation);
    QVERIFY2(state.contains("some logs/first.log"), state);
    QVERIFY2(!state.contains("missing.log"), state);
}

// As it arrives; the copy is gone when the program is.
void tst_CommandLine::readsStandardInput()
{
    Installation installation;
    QVERIFY(installation.installed);
    const QString temporary = installation.top + "tmp";
    QVERIFY(QDir().mkpath(temporary));
    installation.environment.insert("TMPDIR", temporary);
    RunningProgram program(installation, {"-"});
    QVERIFY(program.WaitForLog(installation.LogFolder() + "velocor.log", StartEntry));
    QString copy;
    const auto hasCopy = [&] {
        const QStringList folders = QDir(temporary).entryList({"velocor-*"}, QDir::Dirs);
        copy = temporary + "/" + folders.value(0) + "/Standard input";
        return folders.size() == 1 && QFile::exists(copy);
    };
    QTRY_VERIFY_WITH_TIMEOUT(hasCopy(), Patience);
    program.Write("one\n");
    QTRY_COMPARE_WITH_TIMEOUT(TestFiles::read(copy), QByteArray("one\n"), Patience);
    program.Write("two\n");
    QTRY_COMPARE_WITH_TIMEOUT(TestFiles::read(copy), QByteArray("one\ntwo\n"), Patience);
    program.Send(SIGTERM);
    QCOMPARE(program.ExitCode(), 0);
    QCOMPARE(QDir(temporary).entryList(QDir::AllEntries | QDir::NoDotAndDotDot), QStringList());
    const QByteArray state = SavedState(installation);
    QVERIFY2(!state.isEmpty() && !state.contains("Standard"), state);
}

QTEST_GUILESS_MAIN(tst_CommandLine)
#include "tst_CommandLine.moc"
