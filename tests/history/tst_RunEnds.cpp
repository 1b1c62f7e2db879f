// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Records and marks that are made here; tst_RunExits has those of programs that ended.

#include "app/history/RunEnds.h"

#include "app/history/RunMarkFile.h"
#include "support/TestFiles.h"

#include <QTemporaryDir>
#include <QtTest>

#include <fcntl.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <unistd.h>

using namespace Velocor;

namespace {

QStringList Words(QString const& text)
{
    return text.isEmpty() ? QStringList() : text.split(' ');
}

const QString Letters = QStringLiteral("UNAR"); // of the exits

// Of texts such as "10000-20001N 30000-40001A".
std::vector<RunEnd> Ends(QString const& texts)
{
    std::vector<RunEnd> ends;
    for (QString const& text : Words(texts)) {
        RunEnd end;
        end.start = text.section('-', 0, 0).toLongLong();
        end.end = text.section('-', 1).chopped(1).toLongLong();
        end.exit = static_cast<HistoryRun::Exit>(Letters.indexOf(text.right(1)));
        ends.push_back(end);
    }
    return ends;
}

} // namespace

class tst_RunEnds : public QObject
{
    Q_OBJECT

private slots:
    void assigned_data();
    void assigned();
    void damagedRecords();
    void recordsAndMarks();
    void noRecords();
    void copiedMark();
    void shortRuns_data();
    void shortRuns();
};

void tst_RunEnds::assigned_data()
{
    QTest::addColumn<QString>("ends"); // start-end and first letter of the exit
    QTest::addColumn<QString>("runs"); // start; "c": its own start has been overwritten
    QTest::addColumn<QString>("expected");
    const auto row = [](char const* name, char const* ends, char const* runs,
                        char const* expected) {
        QTest::newRow(name) << QString(ends) << QString(runs) << QString(expected);
    };
    row("nothing known", "", "10001", "U");
    row("run without times", "5001-90001N", "-1", "U");
    row("one run", "10000-20001N", "10001", "N");
    row("entry at the start of the program", "10001-20001N", "10001", "N");
    row("entry before the program", "10002-20001N", "10001", "U");
    row("entry at its end", "10000-20001N", "20001", "N");
    row("entry after its end", "10000-20001N", "20002", "U");
    row("stamps in seconds", "10999-20001N", "10000", "N");
    row("stamps in seconds, too early", "11000-20001N", "10000", "U");
    row("stamps in minutes", "119999-200001N", "60000", "N");
    row("stamps in minutes, too early", "120000-200001N", "60000", "U");
    row("each its own", "10000-20001N 30000-40001A", "10001 30001", "NA");
    row("run without a mark between", "10000-20001N 30000-40001A", "10001 25001 30001", "NUA");
    row("run without a mark after a killed one", "10000-40001A", "10001 25001", "AU");
    row("run without a mark after one with its start", "10001-40001A", "10001 25001", "AU");
    row("at the first moment of all", "0-5N", "0", "N");
    row("in two parts, because a clock was set back", "10000-40001N", "10001 25001", "NN");
    row("later one overwrote the start", "10000-20001N 30000-40001A", "15001c 30001", "NA");
    row("two at once, both normal", "10000-90001N 30000-80001N", "31001c", "N");
    row("two at once, one killed", "10000-90001N 30000-80001A", "31001c", "U");
    row("two at once, start of the second", "10000-90001A 30000-80001N", "30001", "N");
    row("two at once, killed second", "10000-90001N 30000-80001A", "30001", "A");
    row("started together", "29000-90001N 30000-80001A", "30001", "U");
    row("hardly together", "28000-90001N 30000-80001A", "30001", "U");
    row("not quite together", "27999-90001N 30000-80001A", "30001", "A");
    row("record and mark", "10000-90001A 10000-20001N", "10001", "N");
    row("mark and record", "10000-20001N 10000-90001A", "10001", "N");
}

void tst_RunEnds::assigned()
{
    QFETCH(QString, ends);
    QFETCH(QString, runs);
    std::vector<HistoryRun> all;
    for (QString const& text : runs.split(' ')) {
        HistoryRun run;
        run.isCut = text.endsWith('c');
        run.start = QString(text).remove('c').toLongLong();
        all.push_back(run);
    }
    RunEnds::Assign(Ends(ends), all);
    QString found;
    for (HistoryRun const& run : all)
        found += Letters.at(run.exit);
    QTEST(found, "expected");
}

void tst_RunEnds::damagedRecords()
{
    const QTemporaryDir folder;
    const QString log = folder.filePath("logs/app.log");
    const QByteArray good = "2026-11-20T14:03:02.007 2026-11-20T14:03:03.100 abnormal\n";
    QVERIFY(TestFiles::write(RunEnds::RecordFileOf(log),
                             "2026-11-20T14:03 \n2026-11-20T14:03:02.007 2026-11-20T1" + good +
                                 "2026-11-20T14:03:02.007 x normal\n"
                                 "2026-11-20T14:03:02.007 2026-11-20T14:03:02.007 unknown\n\n" +
                                 good));
    const std::vector<RunEnd> ends = RunEnds::Of(log);
    QCOMPARE(ends.size(), size_t(1));
    QCOMPARE(RunEnds::Line(ends[0]), good);
    QCOMPARE(ends[0].exit, HistoryRun::Abnormal);
    QCOMPARE(ends[0].end - ends[0].start, qint64(1093));
    QCOMPARE(RunEnds::RecordFileOf(folder.filePath("app.log")), QString());
    QCOMPARE(RunEnds::Of(folder.filePath("app.log")).size(), size_t(0));
}

// A mark of a program that runs, of one that is gone, and a copy, which tells nothing.
void tst_RunEnds::recordsAndMarks()
{
    const QTemporaryDir folder;
    const QString log = folder.filePath("logs/app.log");
    const QString marks = RunEnds::MarkFolderOf(log);
    QCOMPARE(marks, folder.filePath("running-app.log"));
    QCOMPARE(RunEnds::RecordFileOf(log), folder.filePath("ended-app.log"));
    QVERIFY(QDir().mkpath(marks));
    const QByteArray first = QFile::encodeName(marks + "/1.run");
    const QByteArray second = QFile::encodeName(marks + "/2.run");
    const int running = ::open(first.constData(), O_RDWR | O_CREAT, 0666);
    const int gone = ::open(second.constData(), O_RDWR | O_CREAT, 0666);
    const qint64 start = qint64(740000) * 24 * 60 * 60 * 1000;
    QCOMPARE(::flock(running, LOCK_EX), 0);
    for (int file : {running, gone}) {
        const QByteArray text = RunMarkFile::TextFor(start + file, file);
        QCOMPARE(::write(file, text.constData(), size_t(text.size())), ssize_t(text.size()));
    }
    QVERIFY(QFile::copy(marks + "/2.run", marks + "/3.run"));
    QVERIFY(TestFiles::write(marks + "/4.run", "damaged\n"));
    QVERIFY(TestFiles::write(RunEnds::RecordFileOf(log),
                             RunEnds::Line({start, start + 5, HistoryRun::Normal}) +
                                 RunEnds::Line({start + 1, start + 6, HistoryRun::Abnormal})));
    const std::vector<RunEnd> ends = RunEnds::Of(log);
    ::close(running);
    ::close(gone);
    QCOMPARE(ends.size(), size_t(4));
    const auto compare = [](RunEnd const& end, qint64 from, qint64 to, HistoryRun::Exit exit) {
        QCOMPARE(end.start, from);
        QCOMPARE(end.end, to);
        QCOMPARE(end.exit, exit);
    };
    const qint64 never = std::numeric_limits<qint64>::max();
    compare(ends[0], start + running, never, HistoryRun::Running);
    compare(ends[1], start + gone, never, HistoryRun::Abnormal);
    compare(ends[2], start, start + 5, HistoryRun::Normal);
    compare(ends[3], start + 1, start + 6, HistoryRun::Abnormal);
}

void tst_RunEnds::noRecords()
{
    const QTemporaryDir folder;
    const QString log = folder.filePath("logs/app.log");
    QCOMPARE(RunEnds::Of(log).size(), size_t(0));
    QVERIFY(QDir().mkpath(RunEnds::RecordFileOf(log)));
    QCOMPARE(RunEnds::Of(log).size(), size_t(0));
    QCOMPARE(RunEnds::MarkFolderOf(folder.filePath("app.log")), QString());
}

// It tells nothing, and neither does a pipe instead of the records.
void tst_RunEnds::copiedMark()
{
    const QTemporaryDir folder;
    const QString log = folder.filePath("logs/app.log");
    const QString mark = RunEnds::MarkFolderOf(log) + "/1-1.run";
    const qint64 start = qint64(740000) * 24 * 60 * 60 * 1000;
    QCOMPARE(::mkfifo(QFile::encodeName(RunEnds::RecordFileOf(log)).constData(), 0600), 0);
    QVERIFY(TestFiles::write(mark, ""));
    QFile file(mark);
    QVERIFY(file.open(QIODevice::WriteOnly | QIODevice::Unbuffered));
    QVERIFY(file.write(RunMarkFile::TextFor(start, file.handle())) > 0);
    file.close();
    std::vector<RunEnd> ends = RunEnds::Of(log);
    QCOMPARE(ends.size(), size_t(1));
    QCOMPARE(ends[0].start, start);
    QCOMPARE(ends[0].exit, HistoryRun::Abnormal);

    QVERIFY(QFile::copy(mark, RunEnds::MarkFolderOf(log) + "/2-2.run"));
    QVERIFY(QFile::remove(mark));
    QCOMPARE(RunEnds::Of(log).size(), size_t(0));
}

void tst_RunEnds::shortRuns_data()
{
    QTest::addColumn<QString>("ends");
    QTest::addColumn<int>("start");
    QTest::addColumn<int>("expected");
    const auto row = [](char const* name, char const* ends, int start, int expected) {
        QTest::newRow(name) << QString(ends) << start << expected;
    };
    row("nothing known", "", 50000, 0);
    row("killed", "1000-2000A", 50000, 1);
    row("as long as a short one may be", "1000-11000A", 50000, 1);
    row("longer", "1000-11001A", 50000, 0);
    row("ended normally", "1000-2000N", 50000, 0);
    row("before a normal one", "1000-2000A 3000-4000N", 50000, 0);
    row("after a normal one", "3000-4000A 1000-2000N", 50000, 1);
    row("in any order", "5000-5001A 1000-1001A 3000-3001N 7000-7001A", 50000, 2);
    row("this run", "1000-2000A", 1000, 0);
    row("a later one", "6000-7000A", 5000, 0);
    row("beside one that is running", "1000-2000A 3000-9000R", 50000, 1);
    row("killed right after it ended normally", "1000-2000A 1000-2000N", 50000, 0);
}

void tst_RunEnds::shortRuns()
{
    QFETCH(QString, ends);
    QFETCH(int, start);
    QTEST(RunEnds::ShortRunsBefore(Ends(ends), start), "expected");
}

QTEST_GUILESS_MAIN(tst_RunEnds)
#include "tst_RunEnds.moc"
