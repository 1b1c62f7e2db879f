// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/ProgramRuns.h"
#include "support/TestFiles.h"

#include <QTemporaryDir>
#include <QtTest>

#include <csignal>
#include <sys/stat.h>

namespace {

QByteArray const Notes = "2025-03-03 09:00:00.001 Trace start\n"
                         "2025-03-03 09:00:01.001 Warning disk\n"
                         "nearly full\n"
                         "rest\n"
                         "2025-03-02 08:00:00.001 Error a\n"
                         "2025-03-02 08:00:05.001 Notification disk of b, \"x\"\n";
QByteArray const OlderNotes = "2025-03-01 07:00:00.001 Fatal older\n";
QByteArray const Mail = "2025-03-02 10:00:00.001 Trace dT:[12] mail\n"
                        "2025-03-03 09:00:00.501 Error `mail`\n";

QStringList Words(QString const& arguments)
{
    return arguments.isEmpty() ? QStringList() : arguments.split(' ');
}

} // namespace

class tst_VelocorLog : public QObject
{
    Q_OBJECT

private slots:
    void initTestCase();
    void lines_data();
    void lines();
    void formats_data();
    void formats();
    void formatsInAnyLocale_data();
    void formatsInAnyLocale();
    void runs();
    void tables();
    void problems_data();
    void problems();
    void binaryFile();
    void noPrograms();
    void documented_data();
    void documented();
    void report();
    void refusedReport_data();
    void refusedReport();
    void relativeTimes();
    void standardInput();
    void compressedInput();
    void bytesAsInFile_data();
    void bytesAsInFile();
    void terminal();
    void readerThatLeaves();
    void fullDisk();
    void follow();
    void followedFileWithTheSameHeader();
    void followedUntilRotation_data();
    void followedUntilRotation();
    void followedEntry();
    void followedRuns();

private:
    ProgramResult run(QStringList const& arguments) const
    {
        return RunProgram(VELOCOR_LOG, arguments, m_environment);
    }
    QString file(QString const& name) const { return m_folder.filePath(name); }

    QTemporaryDir m_folder;
    QProcessEnvironment m_environment;
};

void tst_VelocorLog::initTestCase()
{
    m_environment = PrivateEnvironment(m_folder.path());
    m_environment.insert("LC_ALL", "C.UTF-8");
    const QString family = file("data/yourorganization/");
    QVERIFY(TestFiles::write(family + "Notes/logs/notes.log", Notes));
    QVERIFY(TestFiles::write(family + "Notes/logs/notes.log.1", OlderNotes));
    QVERIFY(TestFiles::write(family + "Mail/logs/mail.log", Mail));
    QVERIFY(TestFiles::write(file("a.log"), Notes));
    QVERIFY(TestFiles::write(file("a.log.1"), OlderNotes));
    QDir::setCurrent(m_folder.path());
}

// What is printed, as the last letters of the lines.
void tst_VelocorLog::lines_data()
{
    QTest::addColumn<QString>("arguments");
    QTest::addColumn<QByteArray>("ends");
    QTest::addColumn<int>("exitCode");
    const auto row = [](char const* name, char const* arguments, char const* ends,
                        int exitCode = 0) {
        QTest::newRow(name) << QString(arguments) << QByteArray(ends) << exitCode;
    };
    row("a file alone", "a.log", "ta\"tkl");
    row("files in the order of the command line", "a.log a.log.1", "ta\"tklr");
    row("files of one log by age", "--merge a.log a.log.1", "rta\"tkl");
    row("all of a program's log", "notes", "rta\"tkl");
    row("two programs", "Mail notes", "l`rta\"tkl");
    row("by time", "Mail notes --merge", "rta\"lt`kl");
    row("all programs by time", "--merge", "rta\"lt`kl");
    row("one severity", "notes --severity error", "a");
    row("severities", "notes --severity error,fatal", "ra");
    row("a severity and worse", "notes --severity Warning+", "rakl");
    row("lines without a severity", "notes --severity none", "t");
    row("an expression: whole entries", "notes --match (full|older)", "rkl");
    row("an expression is case-sensitive", "notes --match FULL", "", 1);
    row("unless it says otherwise", "notes --match (?i)FULL", "kl");
    row("nothing found", "notes --match nothing", "", 1);
    row("excluded", "notes --exclude disk --exclude older", "tat");
    row("context", "notes --match start --context 1", "tk");
    row("context ends with a run", "a.log --match ^rest --context 1", "ta");
    row("since", "notes --since 2025-03-03", "tkl");
    row("since a moment", "notes --since 2025-03-02T08:00:05", "\"tkl");
    row("until", "notes --until 2025-03-02T08:00:00.001", "rta");
    row("a span", "--merge --since 2025-03-02T08:00:05 --until 2025-03-03T09:00:00.501", "\"lt`");
    row("all programs with a filter", "--match mail", "l`");
}

void tst_VelocorLog::lines()
{
    QFETCH(QString, arguments);
    QFETCH(QByteArray, ends);
    QFETCH(int, exitCode);
    const ProgramResult result = run(Words(arguments));
    QVERIFY(result.finished);
    QCOMPARE(result.errors, QByteArray());
    QByteArray found;
    for (QByteArray const& line : result.output.split('\n'))
        found += line.right(1);
    QCOMPARE(found, ends);
    QCOMPARE(result.exitCode, exitCode);
}

void tst_VelocorLog::formats_data()
{
    QTest::addColumn<QString>("arguments");
    QTest::addColumn<QByteArray>("output");
    const QByteArray path = QFile::encodeName(m_folder.path());
    const QByteArray mail = path + "/data/yourorganization/Mail/logs/mail.log";
    const QByteArray notes = path + "/data/yourorganization/Notes/logs/notes.log";
    QTest::newRow("text, as in the files") << "mail" << Mail;
    QTest::newRow("a column of programs")
        << "mail notes --program --severity error --merge"
        << QByteArray("Notes  2025-03-02 08:00:00.001 Error a\n"
                      "Mail   2025-03-03 09:00:00.501 Error `mail`\n");
    QTest::newRow("Markdown") << "mail --severity error --format markdown"
                              << QByteArray("```\n2025-03-03 09:00:00.501 Error `mail`\n```\n");
    QTest::newRow("CSV")
        << "mail notes --match (Trace|x) --format csv"
        << "\"program\",\"file\",\"line\",\"time\",\"severity\",\"elapsed\",\"message\"\r\n"
           "\"Mail\",\"" +
               mail +
               "\",\"1\",\"2025-03-02T10:00:00.001\",\"Trace\",\"12\",\"mail\"\r\n"
               "\"Notes\",\"" +
               notes +
               "\",\"6\",\"2025-03-02T08:00:05.001\",\"Notification\",\"\",\"disk of b, "
               "\"\"x\"\"\"\r\n"
               "\"Notes\",\"" +
               notes + "\",\"1\",\"2025-03-03T09:00:00.001\",\"Trace\",\"\",\"start\"\r\n";
    QTest::newRow("JSON") << "mail notes --match (dT|full) --format json"
                          << "{\"program\":\"Mail\",\"file\":\"" + mail +
                                 "\",\"line\":1,\"time\":\"2025-03-02T10:00:00.001\","
                                 "\"severity\":\"Trace\",\"elapsed\":12,\"message\":\"mail\"}\n"
                                 "{\"program\":\"Notes\",\"file\":\"" +
                                 notes +
                                 "\",\"line\":2,\"time\":\"2025-03-03T09:00:01.001\","
                                 "\"severity\":\"Warning\",\"message\":\"disk\"}\n"
                                 "{\"program\":\"Notes\",\"file\":\"" +
                                 notes +
                                 "\",\"line\":3,\"time\":\"2025-03-03T09:00:01.001\","
                                 "\"message\":\"nearly full\"}\n";
}

void tst_VelocorLog::formats()
{
    QFETCH(QString, arguments);
    QFETCH(QByteArray, output);
    const ProgramResult result = run(Words(arguments));
    QCOMPARE(result.output, output);
    QCOMPARE(result.exitCode, 0);
}

void tst_VelocorLog::formatsInAnyLocale_data()
{
    QTest::addColumn<QString>("locale");
    for (char const* locale : {"fa_IR.UTF-8", "ar_EG.UTF-8", "de_DE.UTF-8"})
        QTest::newRow(locale) << locale;
}

// Other programs read them, so the digits are always Western.
void tst_VelocorLog::formatsInAnyLocale()
{
    QFETCH(QString, locale);
    QProcessEnvironment environment = m_environment;
    environment.insert("LC_ALL", locale);
    for (char const* arguments :
         {"mail notes --format csv", "mail notes --format json", "--runs", "notes --patterns"}) {
        const QByteArray output = run(Words(arguments)).output;
        QVERIFY(!output.isEmpty());
        QCOMPARE(RunProgram(VELOCOR_LOG, Words(arguments), environment).output, output);
    }
}

void tst_VelocorLog::runs()
{
    for (QStringList const& arguments : {QStringList(), QStringList("--runs")}) {
        const ProgramResult result = run(arguments);
        QCOMPARE(result.exitCode, 0);
        const QByteArrayList rows = result.output.split('\n');
        QCOMPARE(rows.size(), 6);
        QVERIFY(rows[0].startsWith("program  start "));
        QVERIFY(rows[1].startsWith("Mail     2025-03-02 10:00:00.001  2025-03-03 09:00:00.501  "
                                   "unknown         0       1      2                     /"));
        QVERIFY(rows[2].startsWith("Notes    2025-03-01 07:00:00.001 "));
        QVERIFY(rows[2].endsWith("notes.log.1"));
        QVERIFY(rows[3].startsWith("Notes    2025-03-02 08:00:00.001  2025-03-02 08:00:05.001  "
                                   "unknown         0       1      3  start overwritten  /"));
        QVERIFY(rows[4].startsWith("Notes    2025-03-03 09:00:00.001  2025-03-03 09:00:01.001  "
                                   "unknown         1       0      3                     /"));
    }
    const ProgramResult merged = run({"--runs", "--merge", "--format", "csv", "mail", "notes"});
    QByteArray order;
    for (QByteArray const& row : merged.output.split('\n'))
        order += row.mid(1, 1);
    QCOMPARE(order, QByteArray("pNNMN"));
    QCOMPARE(run({"--runs", "nosuch.log"}).exitCode, 2);
}

void tst_VelocorLog::tables()
{
    QVERIFY(TestFiles::write("pages.log", "2025-03-03 09:00:00.001 Trace page 1 of \"a|b\"\n"
                                          "2025-03-03 09:00:00.002 Warning disk\n"
                                          "page 7\n"
                                          "2025-03-03 09:00:00.003 Trace page 22 of \"c\"\n"));
    QCOMPARE(
        run({"pages.log", "--patterns"}).output,
        QByteArray("count  first                    last                     severity  pattern\n"
                   "    2  2025-03-03 09:00:00.001  2025-03-03 09:00:00.003  Trace     page # of "
                   "\"\u2026\"\n"
                   "    1  2025-03-03 09:00:00.002  2025-03-03 09:00:00.002  Warning   disk\n"));
    QCOMPARE(
        run({"pages.log", "--patterns", "--format", "markdown", "--match", "k$"}).output,
        QByteArray("| count | first | last | severity | pattern |\n"
                   "| ---: | --- | --- | --- | --- |\n"
                   "| 1 | 2025-03-03 09:00:00.002 | 2025-03-03 09:00:00.002 | Warning | disk |\n"));
    QCOMPARE(run({"pages.log", "--patterns", "--format", "json", "--since",
                  "2025-03-03 09:00:00.002", "--severity", "trace"})
                 .output,
             QByteArray("{\"count\":1,\"first\":\"2025-03-03T09:00:00.003\",\"last\":"
                        "\"2025-03-03T09:00:00.003\",\"severity\":\"Trace\",\"pattern\":"
                        "\"page # of \\\"\u2026\\\"\"}\n"));
    QCOMPARE(run({"pages.log", "--patterns", "--match", "nothing"}).exitCode, 1);
    const QByteArray csv = run({"pages.log", "--runs", "--format", "csv"}).output;
    QCOMPARE(
        csv,
        QByteArray(
            "\"program\",\"start\",\"end\",\"exit\",\"warnings\",\"errors\",\"lines\","
            "\"note\",\"file\"\r\n\"pages.log\",\"2025-03-03T09:00:00.001\","
            "\"2025-03-03T09:00:00.003\",\"unknown\",\"1\",\"0\",\"4\",\"\",\"pages.log\"\r\n"));
    QCOMPARE(run({"pages.log", "--runs", "--format", "json"}).output,
             QByteArray("{\"program\":\"pages.log\",\"start\":\"2025-03-03T09:00:00.001\",\"end\":"
                        "\"2025-03-03T09:00:00.003\",\"exit\":\"unknown\",\"warnings\":1,"
                        "\"errors\":0,\"lines\":4,"
                        "\"file\":\"pages.log\"}\n"));
}

void tst_VelocorLog::problems_data()
{
    QTest::addColumn<QString>("arguments");
    QTest::addColumn<QByteArray>("error");
    const auto row = [](char const* name, char const* arguments, char const* error) {
        QTest::newRow(name) << QString(arguments) << QByteArray(error);
    };
    row("neither a file nor a program", "calendar", "calendar: No such file or program");
    row("no such file", "./calendar", "./calendar: No such file");
    row("pipe", "pipe", "pipe: Not a regular file");
    row("folder", "data", "data: Not a regular file");
    row("unknown option", "--what", "Unknown option 'what'.");
    row("severity", "--severity loud", "Not a list of severities: loud");
    row("expression", "--match (a", "Not a regular expression: ");
    row("two expressions", "--match a --match b",
        "--match can be given only once. Use \"(this|that)\".");
    row("context", "--context x", "Not a number of lines: x");
    row("negative context", "--context=-1", "Not a number of lines: -1");
    row("format", "--format xml", "Not a format: xml");
    row("time", "--since someday",
        "Not a time: someday. Times are such as 2026-11-20, 14:03, \"2026-11-20 14:03\" or, until "
        "now, -2h, -30m and -1d.");
    row("control characters", "a\033[2Jb\n", "a\u241b[2Jb\u240a: No such file or program");
    row("directions of text", "a\u202eb\u2066c\u2028d",
        "a\ufffdb\ufffdc\ufffdd: No such file or program");
    row("control characters of an option", "--severity=\033c", "Not a list of severities: \u241bc");
    row("gzip", "old.log.gz",
        "old.log.gz: A compressed file. To read it: zcat FILE | velocor-log -");
    row("xz", "old.log.xz",
        "old.log.xz: A compressed file. To read it: xzcat FILE | velocor-log -");
    row("bzip2", "old.bz2", "old.bz2: A compressed file. To read it: bzcat FILE | velocor-log -");
    row("zstd", "old.zst", "old.zst: A compressed file. To read it: zstdcat FILE | velocor-log -");
    row("a table that goes on", "--follow --patterns",
        "--follow prints lines, so there is no end of a table.");
    row("a code block that goes on", "--follow --format markdown",
        "--follow prints lines, so there is no end of a code block.");
    row("standard input that goes on", "--follow -", "Standard input cannot be followed.");
    row("runs and patterns", "--runs --patterns", "Either --runs or --patterns.");
    row("lines of runs", "--runs --match x",
        "--runs lists whole runs, so no lines can be selected.");
}

void tst_VelocorLog::problems()
{
    QFETCH(QString, arguments);
    QFETCH(QByteArray, error);
    ::mkfifo("pipe", 0600);
    QVERIFY(TestFiles::write("old.log.gz", QByteArray("\x1f\x8b\x08\0\0\0\0", 7)));
    QVERIFY(TestFiles::write("old.log.xz", QByteArray("\xfd"
                                                      "7zXZ\0\n",
                                                      7)));
    QVERIFY(TestFiles::write("old.bz2", "BZh91AY&SY"));
    QVERIFY(TestFiles::write("old.zst", "\x28\xb5\x2f\xfd\n"));
    const ProgramResult result = run(Words(arguments));
    QVERIFY(result.finished);
    // Qt's library words what is wrong with an expression.
    const bool isWhole = !error.endsWith(' ');
    QCOMPARE(isWhole ? result.errors : result.errors.left(error.size() + 13),
             "velocor-log: " + error + (isWhole ? "\n" : ""));
    QCOMPARE(result.errors.count('\n'), 1);
    QCOMPARE(result.output, QByteArray());
    QCOMPARE(result.exitCode, 2);
    // What can be read is printed all the same.
    if (!arguments.startsWith("--"))
        QCOMPARE(run({arguments, "mail"}).output, Mail);
}

// Something may be found in it all the same.
void tst_VelocorLog::binaryFile()
{
    const QByteArray bytes = QByteArray("\1\2\3\4\5\6\7", 7).repeated(20) + "\nfound\n";
    QVERIFY(TestFiles::write("program.bin", bytes));
    const ProgramResult result = run({"program.bin"});
    QCOMPARE(result.output, bytes);
    QCOMPARE(result.errors,
             QByteArray("velocor-log: program.bin: A binary file, printed as if it were text\n"));
    QCOMPARE(result.exitCode, 2);
    QCOMPARE(run({"program.bin", "--match", "fo"}).output, QByteArray("found\n"));
}

void tst_VelocorLog::noPrograms()
{
    const QTemporaryDir empty;
    QProcessEnvironment environment = m_environment;
    environment.insert("XDG_DATA_HOME", empty.path());
    for (QStringList const& arguments : {QStringList(), QStringList({"--merge"})}) {
        const ProgramResult result = RunProgram(VELOCOR_LOG, arguments, environment);
        QCOMPARE(result.output, QByteArray());
        QCOMPARE(result.errors, "velocor-log: No logs of programs in " +
                                    QFile::encodeName(empty.path()) + "/yourorganization\n");
        QCOMPARE(result.exitCode, 1);
    }
}

void tst_VelocorLog::documented_data()
{
    QTest::addColumn<QString>("file");
    for (char const* name : {"velocor-log.1", "velocor-log.bash", "_velocor-log"})
        QTest::newRow(name) << QString(PACKAGING "/linux/") + name;
}

// All options of --help, and no others.
void tst_VelocorLog::documented()
{
    QFETCH(QString, file);
    const auto options = [](QByteArray text) {
        static const QRegularExpression option("--[a-z]+");
        QSet<QString> all;
        const QString plain = QString::fromUtf8(text.replace("\\-", "-"));
        for (auto match = option.globalMatch(plain); match.hasNext();)
            all.insert(match.next().captured());
        return all;
    };
    const QSet<QString> known = options(run({"--help"}).output + run({"report", "--help"}).output);
    QVERIFY(known.contains("--merge") && known.contains("--hide"));
    QCOMPARE(options(TestFiles::read(file)), known);
}

// Of the window's program, which need not be able to start, without a display.
void tst_VelocorLog::report()
{
    QTemporaryDir folder;
    QProcessEnvironment environment = PrivateEnvironment(folder.path());
    environment.insert("USER", "quentin");
    const QString data = folder.filePath("data/yourorganization/yourproduct/");
    QVERIFY(TestFiles::write(data + "logs/velocor.log",
                             "2026-11-20 09:00:00.001 Error quentin in " +
                                 folder.filePath("home").toUtf8() + " by a@x.org, secretly\n"));
    QVERIFY(TestFiles::write(data + "logs/logsettings.cfg", "<LogSettings></LogSettings>"));
    QVERIFY(TestFiles::write(data + "velocor.cfg", "damaged <password>hunter2"));
    const QString path = folder.filePath("report");
    const ProgramResult result =
        RunProgram(VELOCOR_LOG, {"report", path, "--hide", "secretly"}, environment);
    QCOMPARE(result.errors, QByteArray());
    QCOMPARE(result.exitCode, 0);
    QCOMPARE(result.output, path.toLocal8Bit() + "\n");
    const QByteArray line =
        "2026-11-20 09:00:00.001 Error <user-1> in <home> by <mail-1>, <word-1>\n";
    QCOMPARE(TestFiles::read(path + "/last-run.log"), line);
    QCOMPARE(TestFiles::read(path + "/settings/velocor.cfg"),
             QByteArray("damaged <password>(left out)"));
    QVERIFY(QFile::exists(path + "/settings/logsettings.cfg"));
    const QByteArray text = TestFiles::read(path + "/report.md");
    for (QByteArray const& part :
         {QByteArray("\nProgram: Velocor "), QByteArray("\nProduct: yourproduct\n"),
          "## Problems\n\n```text\n" + line + "```\n", QByteArray("| names of users | 1 | ")})
        QVERIFY2(text.contains(part), text);

    const QString lesser = folder.filePath("lesser");
    QCOMPARE(RunProgram(VELOCOR_LOG, {"report", lesser, "--without", "runs,settings"}, environment)
                 .exitCode,
             0);
    QCOMPARE(QDir(lesser).entryList(QDir::AllEntries | QDir::NoDotAndDotDot),
             QStringList({"report.md", "settings"}));
    QVERIFY(!QFile::exists(lesser + "/settings/velocor.cfg"));
}

void tst_VelocorLog::refusedReport_data()
{
    QTest::addColumn<QString>("arguments");
    QTest::addColumn<QString>("error");
    QTest::newRow("existing folder") << "report /"
                                     << "Could not save /: It exists";
    QTest::newRow("unknown part") << "report --without x"
                                  << "Not a part of a report: x";
    QTest::newRow("two") << "report a b"
                         << "Only one report at a time.";
    QTest::newRow("unknown option") << "report --merge"
                                    << "Unknown option 'merge'.";
}

void tst_VelocorLog::refusedReport()
{
    QFETCH(QString, arguments);
    QFETCH(QString, error);
    const ProgramResult result = run(Words(arguments));
    QCOMPARE(result.exitCode, 2);
    QCOMPARE(QString(result.errors), "velocor-log: " + error + "\n");
}

void tst_VelocorLog::relativeTimes()
{
    const QDateTime now = QDateTime::currentDateTime();
    const auto entry = [&now](int hours) {
        return now.addSecs(hours * 3600).toString("yyyy-MM-dd hh:mm:ss.zzz").toLatin1() +
               " Trace x\n";
    };
    QVERIFY(TestFiles::write("now.log", entry(-5) + entry(-3) + entry(-1)));
    QCOMPARE(run({"now.log", "--since", "-4h"}).output, entry(-3) + entry(-1));
    QCOMPARE(run({"now.log", "--until=-2h"}).output, entry(-5) + entry(-3));
}

void tst_VelocorLog::standardInput()
{
    QProcess process;
    process.setProcessEnvironment(m_environment);
    process.start(VELOCOR_LOG, {"-", "--match", "a$", "--program"});
    process.write("2025-03-03 09:00:00.001 Trace a\nb\n2025-03-03 09:00:00.002 Trace c\n");
    process.closeWriteChannel();
    QVERIFY(process.waitForFinished());
    QCOMPARE(process.readAllStandardOutput(),
             QByteArray("-  2025-03-03 09:00:00.001 Trace a\n-  b\n"));
    QCOMPARE(process.exitCode(), 0);
}

// Nobody has heard of the copy that is read.
void tst_VelocorLog::compressedInput()
{
    QProcess process;
    process.setProcessEnvironment(m_environment);
    process.start(VELOCOR_LOG, {"-"});
    process.write("BZh91AY&SY");
    process.closeWriteChannel();
    QVERIFY(process.waitForFinished());
    QCOMPARE(process.readAllStandardError(),
             QByteArray("velocor-log: -: A compressed file. To read it: bzcat FILE | velocor-log "
                        "-\n"));
    QCOMPARE(process.exitCode(), 2);
}

void tst_VelocorLog::bytesAsInFile_data()
{
    QTest::addColumn<QByteArray>("bytes");
    QTest::addColumn<QByteArray>("output");
    const auto row = [](char const* name, QByteArray const& bytes, QByteArray const& output) {
        QTest::newRow(name) << bytes << output;
    };
    row("carriage returns", "a\r\nb\r\n", "a\r\nb\r\n");
    row("no last line end", "a\nb", "a\nb");
    row("an incomplete line before another one",
        "2025-03-03 09:00:02.001 Trace a\n2025-03-02 09:00:00.001 Trace b",
        "2025-03-02 09:00:00.001 Trace b\n2025-03-03 09:00:02.001 Trace a\n");
    row("Latin-1", "caf\xe9\n", "caf\xe9\n");
    row("UTF-8", "caf\xc3\xa9\n", "caf\xc3\xa9\n");
    row("control characters", "a\033[1m\n", "a\033[1m\n");
    row("zero bytes", QByteArray("a\0b\n", 4), QByteArray("a\0b\n", 4));
    row("UTF-16 becomes UTF-8", QByteArray("\xff\xfe\xe9\0\n\0x\0\r\0\n\0", 12), "\xc3\xa9\nx\n");
    row("empty", "", "");
}

void tst_VelocorLog::bytesAsInFile()
{
    QFETCH(QByteArray, bytes);
    QFETCH(QByteArray, output);
    QVERIFY(TestFiles::write("bytes.log", bytes));
    QCOMPARE(run({"bytes.log"}).output, output);
}

// script gives the program a terminal, which ends lines with a carriage return, too.
void tst_VelocorLog::terminal()
{
    if (QStandardPaths::findExecutable("script").isEmpty())
        QSKIP("no script");
    QVERIFY(TestFiles::write("terminal.log", "2025-03-03 09:00:00.001 Trace a\033[1m caf\xe9\n"
                                             "2025-03-03 09:00:00.002 Warning b\n"
                                             "2025-03-03 09:00:00.003 Error c\n"));
    const auto shown = [this](QString const& name, QString const& value) {
        QProcessEnvironment environment = m_environment;
        environment.insert("TERM", "xterm");
        environment.insert(name, value);
        return RunProgram("script", {"-qec", QString(VELOCOR_LOG) + " terminal.log", "/dev/null"},
                          environment)
            .output;
    };
    const QByteArray first = "2025-03-03 09:00:00.001 Trace a\xe2\x90\x9b[1m caf\xc3\xa9\r\n";
    QCOMPARE(shown("X", "x"), first + "\033[33m2025-03-03 09:00:00.002 Warning b\033[0m\r\n"
                                      "\033[31m2025-03-03 09:00:00.003 Error c\033[0m\r\n");
    const QByteArray plain = first + "2025-03-03 09:00:00.002 Warning b\r\n"
                                     "2025-03-03 09:00:00.003 Error c\r\n";
    QCOMPARE(shown("NO_COLOR", "1"), plain);
    QCOMPARE(shown("TERM", "dumb"), plain);
}

void tst_VelocorLog::readerThatLeaves()
{
    QVERIFY(TestFiles::write("long.log", QByteArray("some line\n").repeated(100000)));
    QProcess shell;
    shell.setProcessEnvironment(m_environment);
    shell.start("bash", {"-c", QString(VELOCOR_LOG) + " long.log | head -n 1; "
                                                      "echo ${PIPESTATUS[0]}"});
    QVERIFY(shell.waitForFinished());
    QCOMPARE(shell.readAllStandardOutput(),
             "some line\n" + QByteArray::number(128 + SIGPIPE) + '\n');
    QCOMPARE(shell.readAllStandardError(), QByteArray());
}

void tst_VelocorLog::fullDisk()
{
    if (!QFile::exists("/dev/full"))
        QSKIP("no /dev/full");
    QProcess process;
    process.setProcessEnvironment(m_environment);
    process.setStandardOutputFile("/dev/full");
    process.start(VELOCOR_LOG, {"mail"});
    QVERIFY(process.waitForFinished());
    QCOMPARE(process.readAllStandardError(),
             QByteArray("velocor-log: Standard output cannot be written: No space left on "
                        "device\n"));
    QCOMPARE(process.exitCode(), 2);
}

// A program that follows logs.
class Follower
{
public:
    Follower(QStringList const& arguments, QProcessEnvironment const& environment)
    {
        m_process.setProcessEnvironment(environment);
        m_process.start(VELOCOR_LOG, QStringList("--follow") + arguments);
    }
    ~Follower()
    {
        m_process.kill();
        m_process.waitForFinished();
    }

    // The end of the next line.
    QByteArray next() { return NextLine(m_process).trimmed().right(1); }
    QByteArray next(int lines)
    {
        QByteArray ends;
        for (; lines > 0; --lines)
            ends += next();
        return ends;
    }

    QProcess& process() { return m_process; }

private:
    QProcess m_process;
};

QByteArray const At = "2025-03-03 09:00:00.00";

void tst_VelocorLog::follow()
{
    QByteArray text = At + "1 Trace a\n" + At + "2 Trace b\n" + At + "3 Warn";
    QVERIFY(TestFiles::write("followed.log", text));
    Follower follower({"followed.log", "--program"}, m_environment);
    QCOMPARE(follower.next(2), QByteArray("ab"));
    text += "ing c\n" + At + "4 Trace d\r\n";
    QVERIFY(TestFiles::writeOver("followed.log", text));
    QCOMPARE(NextLine(follower.process()), "followed.log  " + At + "3 Warning c\n");
    QCOMPARE(NextLine(follower.process()), "followed.log  " + At + "4 Trace d\r\n");
    QVERIFY(TestFiles::writeOver("followed.log", text + "e\n"));
    QCOMPARE(follower.next(), QByteArray("e"));
    follower.process().terminate();
    QVERIFY(follower.process().waitForFinished());
    QCOMPARE(follower.process().readAll(), QByteArray());
}

// The lines of a new file are not taken for those of the one before, even if it begins like it.
void tst_VelocorLog::followedFileWithTheSameHeader()
{
    QByteArray const header = "#Fields: h\n";
    QVERIFY(TestFiles::write("followed.log", header + At + "1 Trace a\n" + At + "2 Trace b\n"));
    Follower follower({"followed.log"}, m_environment);
    QCOMPARE(follower.next(3), QByteArray("hab"));
    QVERIFY(QFile::rename("followed.log", "followed.log.1"));
    QVERIFY(TestFiles::write("followed.log", header + At + "3 Trace c\n" + At + "4 Trace d\n"));
    QCOMPARE(follower.next(3), QByteArray("hcd"));
}

void tst_VelocorLog::followedUntilRotation_data()
{
    QTest::addColumn<bool>("isRenamed");
    QTest::addColumn<QString>("expression");
    QTest::addColumn<QByteArray>("expected");
    QTest::newRow("renamed") << true << ".*" << QByteArray("bcdef");
    QTest::newRow("copied and removed") << false << ".*" << QByteArray("bcdef");
    QTest::newRow("with a filter") << false << "[ace]$" << QByteArray("cde"); // an entry whole
}

// The program had no chance to look in between.
void tst_VelocorLog::followedUntilRotation()
{
    QFETCH(bool, isRenamed);
    QFETCH(QString, expression);
    QFETCH(QByteArray, expected);
    const QString old = "rotated.log.1";
    QFile::remove(old);
    QByteArray text = "2025-03-02 08:00:00.001 Trace a\n";
    QVERIFY(TestFiles::write("rotated.log", text));
    Follower follower({"rotated.log", "--match", expression}, m_environment);
    QCOMPARE(follower.next(), QByteArray("a"));
    const auto process = static_cast<pid_t>(follower.process().processId());
    ::kill(process, SIGSTOP);
    text += "2025-03-02 08:00:00.002 Trace b\n2025-03-02 08:00:00.003 Trace c\nincomplete d";
    QVERIFY(TestFiles::writeOver("rotated.log", text));
    QVERIFY(isRenamed ? QFile::rename("rotated.log", old)
                      : QFile::copy("rotated.log", old) && QFile::remove("rotated.log"));
    QVERIFY(TestFiles::write("rotated.new", "2025-03-02 08:00:00.004 Trace e\n"));
    QVERIFY(QFile::rename("rotated.new", "rotated.log"));
    ::kill(process, SIGCONT);
    QCOMPARE(follower.next(expected.size() - expected.endsWith('f')),
             expected.left(expected.size() - expected.endsWith('f')));
    QVERIFY(TestFiles::writeOver("rotated.log", "2025-03-02 08:00:00.004 Trace e\n"
                                                "2025-03-02 08:00:00.005 Trace f\n"
                                                "2025-03-02 08:00:00.006 Trace a\n"));
    QCOMPARE(follower.next(expected.endsWith('f') ? 2 : 1),
             QByteArray(expected.endsWith('f') ? "fa" : "a"));
}

// All lines of an entry are printed when one of them matches.
void tst_VelocorLog::followedEntry()
{
    QByteArray text = At + "1 Trace x a\n" + At + "2 Trace b\n";
    QVERIFY(TestFiles::write("entry.log", text));
    Follower follower({"entry.log", "--match", "x"}, m_environment);
    QCOMPARE(follower.next(), QByteArray("a"));
    text += "x c\n";
    QVERIFY(TestFiles::writeOver("entry.log", text));
    QCOMPARE(follower.next(2), QByteArray("bc"));
    text += "d\n" + At + "3 Trace e\n" + At + "4 Trace x f\n";
    QVERIFY(TestFiles::writeOver("entry.log", text));
    QCOMPARE(follower.next(2), QByteArray("df"));
}

// A run that writes over the log, one that rotates it, and a second log.
void tst_VelocorLog::followedRuns()
{
    const QString log = file("data/yourorganization/Calendar/logs/calendar.log");
    const QByteArray old = At + "1 Trace a\n" + At + "2 Trace b\n";
    QVERIFY(TestFiles::write(log, old));
    QVERIFY(TestFiles::write("second.log", old.toUpper()));
    Follower follower({"calendar", "second.log", "--format", "json"}, m_environment);
    for (char const* line : {"Calendar", "Calendar", "second.log", "second.log"})
        QVERIFY(NextLine(follower.process()).contains(line));

    QByteArray text = old;
    const QByteArray restarted = "2025-03-04 08:00:00.001 Trace c\n";
    text.replace(0, restarted.size(), restarted);
    QVERIFY(TestFiles::writeOver(log, text));
    QVERIFY(NextLine(follower.process()).contains("2025-03-04T08:00:00.001"));

    QVERIFY(QFile::rename(log, log + ".1"));
    QVERIFY(TestFiles::write(log + ".new", "2025-03-05 08:00:00.001 Trace d\n"));
    QVERIFY(QFile::rename(log + ".new", log));
    QVERIFY(NextLine(follower.process()).contains("2025-03-05T08:00:00.001"));

    QVERIFY(TestFiles::writeOver("second.log", old.toUpper() + "e\n"));
    QVERIFY(NextLine(follower.process()).contains("\"message\":\"e\""));
    QVERIFY(QFile::remove(log + ".1") && QFile::remove(log));
}

QTEST_GUILESS_MAIN(tst_VelocorLog)
#include "tst_VelocorLog.moc"
