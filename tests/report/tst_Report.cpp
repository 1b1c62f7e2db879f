// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/history/RunEnds.h"
#include "app/report/Report.h"
#include "app/report/ReportReader.h"
#include "app/report/ZipArchive.h"
#include "support/TestFiles.h"

#include <QProcess>
#include <QStandardPaths>
#include <QTemporaryDir>
#include <QtTest>

using namespace Velocor;

namespace {

// Entries of one run, a second apart, some of them problems.
QByteArray Run(int hour, int count, QList<int> const& problems)
{
    QByteArray run;
    for (int i = 0; i < count; ++i)
        run += QString("2026-11-20 %1:%2:%3.001 %4 entry %5\n")
                   .arg(hour, 2, 10, QChar('0'))
                   .arg(i / 60, 2, 10, QChar('0'))
                   .arg(i % 60, 2, 10, QChar('0'))
                   .arg(problems.contains(i) ? "Warning" : "Trace")
                   .arg(i)
                   .toLatin1();
    return run;
}

QStringList Split(QString const& text, char separator)
{
    QStringList parts = text.split(separator);
    parts.removeAll("");
    return parts;
}

// The numbers of the entries in a text, and "|" for each gap.
QString Numbers(QString const& text)
{
    QStringList numbers;
    for (QString const& line : Split(text, '\n'))
        numbers.append(line == "..." ? QString("|") : line.section(' ', -1));
    return numbers.join(' ');
}

QString Range(int first, int last)
{
    QStringList numbers;
    for (int i = first; i <= last; ++i)
        numbers.append(QString::number(i));
    return numbers.join(' ');
}

} // namespace

class tst_Report : public QObject
{
    Q_OBJECT

private slots:
    void archive();
    void secretValues_data();
    void secretValues();
    void settings();
    void problems_data();
    void problems();
    void problemsOfOtherRuns();
    void runs();
    void endOfAbnormalRun();
    void longRun();
    void noLog();
    void entriesOfManyLines();
    void longEntries();
    void manyEntries();
    void gapBetweenRuns();
    void unreadableFile();
    void logWithoutTimes();
    void longSettings();
    void versionsAndPlaces();
    void savedFolder();
    void savedArchive();
    void codeBlocks();
};

// By somebody else's reader.
void tst_Report::archive()
{
    if (QStandardPaths::findExecutable("python3").isEmpty())
        QSKIP("no python3");
    const QTemporaryDir folder;
    ZipArchive archive;
    archive.Add("report.md", "text\n");
    archive.Add(QString::fromUtf8("ö/empty"), "");
    archive.Add("zeros", QByteArray(100000, '\0'));
    QVERIFY(archive.Bytes().size() < 1000);
    QVERIFY(TestFiles::write(folder.filePath("a.zip"), archive.Bytes()));
    QProcess reader;
    reader.start(
        "python3",
        {"-c",
         "import struct, sys, zipfile, zlib\n"
         "archive = zipfile.ZipFile(sys.argv[1])\n"
         "assert archive.testzip() is None\n"
         "for name in archive.namelist():\n"
         "    print(ascii(name), len(archive.read(name)), sorted(set(archive.read(name))))\n"
         "bytes = open(sys.argv[1], 'rb').read()\n"
         "for file in archive.infolist():\n"
         "    assert file.date_time == (1980, 1, 1, 0, 0, 0), file.date_time\n"
         "    assert (file.volume, file.internal_attr, file.external_attr) == (0, 0, 0)\n"
         "    start = file.header_offset + 30 + len(file.filename.encode())\n"
         "    data = bytes[start:start + file.compress_size]\n"
         "    inflate = zlib.decompressobj(-15)\n"
         "    inflate.decompress(data)\n"
         "    assert inflate.eof and not inflate.unused_data, file\n"
         "end = struct.unpack('<LHHHHLLH', bytes[-22:])\n"
         "assert end[1:5] == (0, 0, 3, 3) and end[7] == 0, end\n",
         folder.filePath("a.zip")});
    QVERIFY(reader.waitForFinished(60000));
    QCOMPARE(
        QString(reader.readAllStandardOutput() + reader.readAllStandardError()),
        QString("'report.md' 5 [10, 101, 116, 120]\n'\\xf6/empty' 0 []\n'zeros' 100000 [0]\n"));
}

void tst_Report::secretValues_data()
{
    QTest::addColumn<QString>("text");
    QTest::addColumn<QString>("expected");
    const auto row = [](char const* name, char const* text, char const* expected) {
        QTest::newRow(name) << QString(text) << QString(expected);
    };
    row("element", "<a><password>x</password><b>y</b></a>",
        "<a><password>(left out)</password><b>y</b></a>");
    row("CDATA", "<apiKey><![CDATA[x<]]></apiKey>y", "<apiKey>(left out)</apiKey>y");
    row("section", "<token>\n<a>x</a>\n</token>y", "<token>(left out)</token>y");
    row("attribute", "<arg key=\"password\">x</arg><arg key=\"product\">y</arg>",
        "<arg key=\"password\">(left out)</arg><arg key=\"product\">y</arg>");
    row("without its end", "<a><pwd>x</pw></a>", "<a><pwd>(left out)");
    row("empty element", "<password/><b>y</b>", "<password/><b>y</b>");
    row("two", "<pwd>x</pwd><pwd>y</pwd>", "<pwd>(left out)</pwd><pwd>(left out)</pwd>");
    row("none", "<columns>1,2</columns> < & >", "<columns>1,2</columns> < & >");
}

void tst_Report::secretValues()
{
    QFETCH(QString, text);
    QTEST(ReportReader::WithoutSecretValues(text), "expected");
}

void tst_Report::settings()
{
    const QTemporaryDir folder;
    QVERIFY(TestFiles::write(folder.filePath("a.cfg"), "<x><pwd>1</pwd>\xe4</x>"));
    const ReportPart part = ReportReader::Settings(
        "T", {folder.filePath("a.cfg"), folder.filePath("none.cfg"), folder.path()});
    QCOMPARE(part.title, QString("T"));
    QCOMPARE(part.text, QString("settings/a.cfg: 20 bytes\n"));
    QCOMPARE(part.files.size(), 1);
    QCOMPARE(part.files[0].name, QString("settings/a.cfg"));
    QCOMPARE(part.files[0].text, QString::fromUtf8("<x><pwd>(left out)</pwd>ä</x>"));
    QCOMPARE(ReportReader::Settings("T", {}).text, QString("There are none.\n"));
}

void tst_Report::problems_data()
{
    QTest::addColumn<QString>("problems");
    QTest::addColumn<QString>("expected");
    QTest::newRow("none") << ""
                          << "None.";
    QTest::newRow("in the middle") << "50" << Range(40, 60);
    QTest::newRow("first") << "0" << Range(0, 10);
    QTest::newRow("last") << "99" << Range(89, 99);
    QTest::newRow("close to each other") << "20 40" << Range(10, 50);
    QTest::newRow("neighbors meet") << "20 41" << Range(10, 51);
    QTest::newRow("a gap") << "20 42" << Range(10, 30) + " | " + Range(32, 52);
}

void tst_Report::problems()
{
    QFETCH(QString, problems);
    QList<int> numbers;
    for (QString const& number : Split(problems, ' '))
        numbers.append(number.toInt());
    const QTemporaryDir folder;
    const QString log = folder.filePath("app.log");
    QVERIFY(TestFiles::write(log, Run(9, 100, numbers)));
    QTEST(Numbers(ReportReader::Log(log).at(1).text), "expected");
}

// Their neighbors are of the same run; only the last ones are in the report; an entry has all
// lines.
void tst_Report::problemsOfOtherRuns()
{
    const QTemporaryDir folder;
    const QString log = folder.filePath("app.log");
    QVERIFY(TestFiles::write(log + ".1", Run(7, 20, {19})));
    QVERIFY(TestFiles::write(log, Run(9, 20, {}) + "second line\n"));
    QCOMPARE(Numbers(ReportReader::Log(log).at(1).text), Range(9, 19));
    QVERIFY(TestFiles::write(log, Run(9, 20, {0}) + "second line\n"));
    QCOMPARE(Numbers(ReportReader::Log(log).at(1).text), Range(9, 19) + " | " + Range(0, 10));
    QVERIFY(TestFiles::write(log, Run(9, 20, {19}) + "second line\n"));
    QVERIFY(ReportReader::Log(log).at(1).text.endsWith("entry 19\nsecond line\n"));

    QList<int> many;
    for (int i = 0; i < ReportReader::MaximumProblems + 1; ++i)
        many.append(30 * i);
    QVERIFY(QFile::remove(log + ".1"));
    QVERIFY(TestFiles::write(log, Run(9, 3000, many)));
    QVERIFY(Numbers(ReportReader::Log(log).at(1).text).startsWith("20 21 "));
}

void tst_Report::runs()
{
    const QTemporaryDir folder;
    const QString log = folder.filePath("logs/app.log");
    QVERIFY(TestFiles::write(log + ".2", Run(7, 5, {})));
    QVERIFY(TestFiles::write(log + ".1", Run(8, 4, {1, 2})));
    QVERIFY(TestFiles::write(log, Run(9, 3, {})));
    QVERIFY(TestFiles::write(RunEnds::RecordFileOf(log),
                             "2026-11-20T07:59:59.000 2026-11-20T08:30:00.000 abnormal\n"
                             "2026-11-20T08:59:59.000 2026-11-20T09:30:00.000 normal\n"));
    const ReportPart part = ReportReader::Log(log).at(0);
    QCOMPARE(part.title, QString("This run and the one before"));
    QCOMPARE(part.text,
             QString("The last run (last-run.log): from 2026-11-20T09:00:00.001 to "
                     "2026-11-20T09:00:02.001, 3 lines, problems: 0; it ended normally\n"
                     "The run before (run-before.log): from 2026-11-20T08:00:00.001 to "
                     "2026-11-20T08:00:03.001, 4 lines, problems: 2; it was killed or crashed\n"));
    QCOMPARE(part.files.size(), 2);
    QCOMPARE(part.files[0].text, QString(Run(9, 3, {})));
    QCOMPARE(part.files[1].name, QString("run-before.log"));
    QCOMPARE(part.files[1].text, QString(Run(8, 4, {1, 2})));
}

// Whichever files they are in; without records, the run before the last one.
void tst_Report::endOfAbnormalRun()
{
    const QTemporaryDir folder;
    const QString log = folder.filePath("logs/app.log");
    QVERIFY(TestFiles::write(log + ".2", Run(7, 300, {})));
    QVERIFY(TestFiles::write(log + ".1", Run(8, 4, {})));
    QVERIFY(TestFiles::write(log, Run(9, 3, {})));
    QCOMPARE(ReportReader::EndOfAbnormalRun(log), QString(Run(8, 4, {})));
    const QString records = RunEnds::RecordFileOf(log);
    const QByteArray first = "2026-11-20T06:59:59.000 2026-11-20T07:30:00.000 abnormal\n";
    QVERIFY(TestFiles::write(records, first));
    QCOMPARE(Numbers(ReportReader::EndOfAbnormalRun(log)), Range(100, 299));
    QVERIFY(TestFiles::write(records,
                             first + "2026-11-20T07:59:59.000 2026-11-20T08:30:00.000 abnormal\n"));
    QCOMPARE(ReportReader::EndOfAbnormalRun(log), QString(Run(8, 4, {})));
    QVERIFY(QFile::remove(records) && QFile::remove(log + ".2"));
    QCOMPARE(ReportReader::EndOfAbnormalRun(log), QString(Run(8, 4, {})));
    QVERIFY(QFile::remove(log + ".1"));
    QCOMPARE(ReportReader::EndOfAbnormalRun(log), QString());
    QCOMPARE(ReportReader::EndOfAbnormalRun(folder.filePath("logs/none.log")), QString());
}

void tst_Report::longRun()
{
    const QTemporaryDir folder;
    const QString log = folder.filePath("app.log");
    const QByteArray longLine =
        "2026-11-20 12:00:00.001 Trace " + QByteArray(2 * ReportReader::LineLimit, 'x') + "\n";
    QVERIFY(TestFiles::write(log, Run(9, ReportReader::MaximumRunLines, {}) + longLine));
    const QString text = ReportReader::Log(log).at(0).files[0].text;
    QCOMPARE(text.count('\n'), int(ReportReader::MaximumRunLines));
    QVERIFY(text.startsWith("2026-11-20 09:00:01.001"));
    QCOMPARE(text.section('\n', -2, -2),
             QString(longLine.left(ReportReader::LineLimit)) + QChar(0x2026));
}

void tst_Report::noLog()
{
    QCOMPARE(ReportReader::Log("").at(0).text, QString("The log is empty.\n"));
    QCOMPARE(ReportReader::Log("").at(0).files.size(), 0);
    QCOMPARE(ReportReader::Log("").at(1).text, QString("None.\n"));
}

// However many lines they have, they count once; what another run left belongs to none.
void tst_Report::entriesOfManyLines()
{
    const QTemporaryDir folder;
    const QString log = folder.filePath("app.log");
    const QByteArray lines = QByteArray("more\n").repeated(2 * ReportReader::EntriesAround);
    QVERIFY(TestFiles::write(log, Run(8, 1, {0}) + lines + Run(9, 100, {})));
    QCOMPARE(ReportReader::Log(log).at(1).text,
             QString(Run(8, 1, {0}) + lines + Run(9, ReportReader::EntriesAround, {})));

    QVERIFY(TestFiles::write(log + ".1", Run(7, 3, {2})));
    QVERIFY(TestFiles::write(log, "torn\n" + Run(9, 3, {})));
    QCOMPARE(ReportReader::Log(log).at(1).text, QString(Run(7, 3, {2})));
}

// Lines are added to an entry until it is long.
void tst_Report::longEntries()
{
    const QTemporaryDir folder;
    const QString log = folder.filePath("app.log");
    const QByteArray start = "2026-11-20 12:00:00.001 Error ";
    const auto problems = [&](int length) { // of an entry with this line
        const QByteArray line = start + QByteArray(length - start.size(), 'x');
        TestFiles::write(log, line + "\nmore\n");
        return ReportReader::Log(log).at(1).text;
    };
    const int limit = ReportReader::LineLimit;
    QCOMPARE(problems(limit - 2).right(7), QString("x\nmore\n"));
    QCOMPARE(problems(limit - 1).right(3), QString("xx\n"));
    QCOMPARE(problems(limit).right(3), QString("xx\n"));
    QCOMPARE(problems(limit + 1).right(3), QString("x") + QChar(0x2026) + '\n');
}

void tst_Report::manyEntries()
{
    const QTemporaryDir folder;
    const QString log = folder.filePath("app.log");
    const QByteArray problem = "2026-11-20 09:00:00.001 Error x\n";
    const QByteArray others = QByteArray("2026-11-20 09:00:00.001 Trace x\n").repeated(99999);
    QVERIFY(TestFiles::write(log, problem + others));
    QVERIFY(ReportReader::Log(log).at(1).text.startsWith(problem));
    QVERIFY(TestFiles::write(log, problem + problem.left(24) + "Trace x\n" + others));
    QCOMPARE(ReportReader::Log(log).at(1).text, QString("None.\n"));
}

void tst_Report::gapBetweenRuns()
{
    const QTemporaryDir folder;
    const QString log = folder.filePath("app.log");
    QVERIFY(TestFiles::write(log + ".1", Run(7, 1, {0})));
    QVERIFY(TestFiles::write(log, Run(9, 1, {0})));
    QCOMPARE(ReportReader::Log(log).at(1).text, QString(Run(7, 1, {0}) + "...\n" + Run(9, 1, {0})));
}

void tst_Report::unreadableFile()
{
    const QTemporaryDir folder;
    const QString log = folder.filePath("app.log");
    QVERIFY(TestFiles::write(log + ".1", QByteArray("\x1f\x8b\x08\0", 4)));
    QVERIFY(TestFiles::write(log, Run(9, 1, {})));
    const QString text = ReportReader::Log(log).at(0).text;
    QVERIFY2(text.contains("\n" + log + ".1: "), qPrintable(text));
    QVERIFY2(text.endsWith("velocor-log -\n"), qPrintable(text));
}

void tst_Report::logWithoutTimes()
{
    const QTemporaryDir folder;
    const QString log = folder.filePath("app.log");
    QVERIFY(TestFiles::write(log, "x\n"));
    const QString text = ReportReader::Log(log).at(0).text;
    QVERIFY2(text.contains("from unknown to unknown, 1 lines"), qPrintable(text));
}

void tst_Report::longSettings()
{
    const QTemporaryDir folder;
    const QString path = folder.filePath("a.cfg");
    const int most = ReportReader::MaximumFileSize;
    for (int size : {most, most + 1}) {
        QVERIFY(TestFiles::write(path, QByteArray(size, 'x')));
        QCOMPARE(ReportReader::Settings("T", {path}).files[0].text.size(), most);
    }
}

void tst_Report::versionsAndPlaces()
{
    const QStringList versions = ReportReader::Versions().split('\n');
    QCOMPARE(versions.size(), 9); // the last one is empty
    QVERIFY(versions[0].startsWith("Program: Velocor "));
    QCOMPARE(versions[2], QString("Running with Qt: ") + qVersion());

    const QTemporaryDir folder;
    QCoreApplication* app = QCoreApplication::instance();
    app->setProperty("RootPath", folder.path());
    app->setProperty("DataPath", folder.filePath("none"));
    const QStringList places = ReportReader::Places().split('\n');
    QVERIFY(places.contains("Installation: " + folder.path()));
    QVERIFY(places.contains("Data: " + folder.filePath("none") + " (does not exist)"));
}

void tst_Report::savedFolder()
{
    const QTemporaryDir folder;
    Redactor redactor;
    redactor.AddSecret(SecretKind::UserName, "ada");
    const Report report(
        {{"One", "ada a@x.org\n", {{"sub/1.log", "A@x.org b@x.org ada\n"}}}, {"Two", "x\n", {}}},
        redactor);
    const QString path = folder.filePath("report");
    QCOMPARE(report.Save(path), QString());
    QCOMPARE(TestFiles::read(path + "/sub/1.log"), QByteArray("<mail-1> <mail-2> <user-1>\n"));
    const QByteArray text = TestFiles::read(path + "/report.md");
    QVERIFY2(text.startsWith("# Report\n\nCreated 2"), text);
    QVERIFY2(text.endsWith(
                 "Z\n\n## One\n\n```text\n<user-1> <mail-1>\n```\n\n## Two\n\n```text\nx\n```\n"
                 "\n## Replaced by placeholders\n\n"
                 "| what | different | places |\n|---|---|---|\n"
                 "| names of users | 1 | 2 |\n| mail addresses | 2 | 3 |\n"),
             text);
    QCOMPARE(report.Save(path), QString("It exists"));
    QVERIFY(TestFiles::write(folder.filePath("file"), "old"));
    QCOMPARE(report.Save(folder.filePath("file")), QString("It exists"));
    QVERIFY(!report.Save(folder.filePath("file/report")).isEmpty());
    QCOMPARE(TestFiles::read(folder.filePath("file")), QByteArray("old"));

    redactor.SetShown(1, true);
    QCOMPARE(Report::Replaced(Report({{"a@x.org", "", {}}}, redactor).files(), redactor),
             QString("\n## Replaced by placeholders\n\nNothing.\n"));
}

void tst_Report::savedArchive()
{
    const QTemporaryDir folder;
    Redactor redactor;
    const Report report({{"One", "x\n", {}}}, redactor);
    ZipArchive archive;
    archive.Add("report.md", report.files().front().content.text.toUtf8());
    QCOMPARE(report.Save(folder.filePath("r.ZIP")), QString());
    QCOMPARE(TestFiles::read(folder.filePath("r.ZIP")), archive.Bytes());
    QCOMPARE(report.Save(folder.filePath("r.ZIP")), QString());
    QVERIFY(QDir(folder.path()).mkdir("d.zip"));
    QCOMPARE(report.Save(folder.filePath("d.zip")), QString("Not a regular file"));
}

// No text ends its block.
void tst_Report::codeBlocks()
{
    Redactor redactor;
    const Report report({{"One", "a\n```\nb", {}}}, redactor);
    QVERIFY(report.files().front().content.text.contains("\n````text\na\n```\nb\n````\n"));
}

QTEST_GUILESS_MAIN(tst_Report)
#include "tst_Report.moc"
