// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/history/LogHistory.h"

#include "app/history/HistoryCursor.h"
#include "app/logfile/ForeignStamp.h"
#include "app/logfile/LogIndex.h"
#include "support/TestFiles.h"

#include <QTemporaryDir>
#include <QtTest>

#include <sys/stat.h>

using namespace Velocor;

namespace {

QByteArray Lines(LogHistory const& history)
{
    QByteArray text;
    HistoryCursor cursor(history, false);
    while (cursor.Next())
        text += cursor.content() + '\n';
    return text;
}

qint64 KeyOf(QString const& time)
{
    return ForeignStamp::KeyOfEpoch(
        QDateTime::fromString(time, "yyyy-MM-dd hh:mm:ss").toMSecsSinceEpoch());
}

bool SetModified(QString const& path, QString const& time)
{
    QFile file(path);
    return file.open(QIODevice::ReadWrite) &&
           file.setFileTime(QDateTime::fromString(time, "yyyy-MM-dd hh:mm:ss"),
                            QFileDevice::FileModificationTime);
}

} // namespace

class tst_LogHistory : public QObject
{
    Q_OBJECT

private slots:
    void oldestFirst();
    void runs();
    void refused_data();
    void refused();
    void fileWithoutSize();
    void ends();
    void withoutCurrentFile();
    void overwrittenMeanwhile();
    void rotatedMeanwhile();
    void dates_data();
    void dates();
    void filter();
    void timesOfHiddenLines();
    void logWithoutTimes();
    void runWithoutTimes();
    void overwrittenStamps();
    void opensAgain();
    void shares();
    void placesOfLines();
    void wideCharacters();
    void timeAtTheEndOfALongLine();

private:
    QTemporaryDir m_folder;
};

void tst_LogHistory::oldestFirst()
{
    const QString log = m_folder.filePath("order.log");
    QVERIFY(TestFiles::write(log + ".2", "2025-03-01 08:00:00.001 Trace 1\n"
                                         "2025-03-01 08:00:01.1 Trace 2\n"));
    QVERIFY(TestFiles::write(log + ".1", "2025-03-03 08:00:00.001 Trace 5\n"
                                         "rest\n"
                                         "2025-03-02 08:00:00.001 Trace 3\n"
                                         "2025-03-02 08:00:01.1 Trace 4\n"));
    QVERIFY(TestFiles::write(log, "2025-03-05 08:00:00.001 Trace 7\n"
                                  "more of 7\n"
                                  "rest\n"
                                  "2025-03-04 08:00:00.001 Trace 6"));
    LogHistory history;
    QVERIFY(history.ReadLog(log));
    QByteArray messages;
    HistoryCursor cursor(history, true);
    while (cursor.Next())
        messages += cursor.content().right(1);
    QCOMPARE(messages, QByteArray("12t345t677"));
}

void tst_LogHistory::runs()
{
    const QString log = m_folder.filePath("runs.log");
    QVERIFY(TestFiles::write(log, "2025-03-03 09:00:00.001 Trace start\n"
                                  "2025-03-03 09:00:01.1 Warning disk\n"
                                  "nearly full\n"
                                  "tail of an entry\n"
                                  "2025-03-02 08:00:00.001 Error a\n"
                                  "2025-03-02 08:00:05.001 Warning b\n"));
    LogHistory history;
    QVERIFY(history.ReadLog(log));
    QCOMPARE(history.runs().size(), size_t(2));
    history.ReadTimes();
    HistoryRun const& older = history.runs()[0];
    QVERIFY(older.isCut);
    QCOMPARE(older.firstLine, size_t(3));
    QCOMPARE(older.endLine, size_t(6));
    QCOMPARE(older.start, KeyOf("2025-03-02 08:00:00") + 1);
    QCOMPARE(older.end, KeyOf("2025-03-02 08:00:05") + 1);
    QCOMPARE(older.counts[LogEntry::Warning], size_t(1));
    QCOMPARE(older.counts[LogEntry::Error], size_t(1));
    HistoryRun const& newest = history.runs()[1];
    QVERIFY(!newest.isCut);
    QCOMPARE(newest.start, KeyOf("2025-03-03 09:00:00") + 1);
    QCOMPARE(newest.counts[LogEntry::Warning], size_t(1)); // of two lines
    QCOMPARE(newest.counts[LogEntry::Trace], size_t(1));
}

void tst_LogHistory::refused_data()
{
    QTest::addColumn<QString>("name");
    QTest::addColumn<QString>("error");
    QTest::newRow("no such file") << "none.log"
                                  << "No such file";
    QTest::newRow("folder") << "folder.log"
                            << "Not a regular file";
    QTest::newRow("pipe") << "pipe.log"
                          << "Not a regular file";
    for (char const* tool : {"zcat", "xzcat", "bzcat", "zstdcat"})
        QTest::newRow(tool) << QString(tool) + ".log"
                            << QString("A compressed file. To read it: %1 FILE | velocor-log -")
                                   .arg(QLatin1String(tool));
}

void tst_LogHistory::refused()
{
    QFETCH(QString, name);
    QFETCH(QString, error);
    QDir(m_folder.path()).mkpath("folder.log");
    ::mkfifo(qPrintable(m_folder.filePath("pipe.log")), 0600);
    const QHash<QString, QByteArray> compressed{{"zcat.log", QByteArray("\x1f\x8b\x08\0", 4)},
                                                {"xzcat.log", QByteArray("\xfd"
                                                                         "7zXZ\0",
                                                                         6)},
                                                {"bzcat.log", "BZh91AY&SY"},
                                                {"zstdcat.log", "\x28\xb5\x2f\xfd"}};
    if (compressed.contains(name))
        QVERIFY(TestFiles::write(m_folder.filePath(name), compressed.value(name)));
    const QString good = m_folder.filePath("good.log");
    QVERIFY(TestFiles::write(good, "x\n"));
    LogHistory history;
    QVERIFY(!history.ReadFiles({m_folder.filePath(name), good}));
    QCOMPARE(history.errors(), QStringList(m_folder.filePath(name) + ": " + error));
    QCOMPARE(Lines(history), QByteArray("x\n"));
    QVERIFY(history.ReadFiles({good})); // of before, nothing is left
    QCOMPARE(history.errors(), QStringList());
    QCOMPARE(history.runs().size(), size_t(1));
    QCOMPARE(Lines(history), QByteArray("x\n"));
}

// The system tells such things in files that claim to be empty.
void tst_LogHistory::fileWithoutSize()
{
    QFile file("/proc/version");
    if (!file.open(QIODevice::ReadOnly) || file.size() != 0)
        QSKIP("this system has none");
    LogHistory history;
    QVERIFY(history.ReadFiles({file.fileName()}));
    QCOMPARE(Lines(history), file.readAll());
}

void tst_LogHistory::ends()
{
    const QString log = m_folder.filePath("logs/app.log");
    QVERIFY(TestFiles::write(log, "2025-03-03 09:00:00.001 Trace a\n"));
    QVERIFY(TestFiles::write(m_folder.filePath("ended-app.log"),
                             "2025-03-03T08:59:59.000 2025-03-03T09:30:00.000 normal\n"));
    LogHistory history;
    QVERIFY(history.ReadLog(log));
    history.ReadTimes();
    history.ReadTimes(); // counts nothing twice
    QCOMPARE(history.runs()[0].counts[LogEntry::Trace], size_t(1));
    QCOMPARE(int(history.runs()[0].exit), int(HistoryRun::Unknown));
    history.ReadEnds(log);
    QCOMPARE(int(history.runs()[0].exit), int(HistoryRun::Normal));
}

void tst_LogHistory::withoutCurrentFile()
{
    const QString log = m_folder.filePath("rotated.log");
    QVERIFY(TestFiles::write(log + ".1", "x\n"));
    LogHistory history;
    QVERIFY(history.ReadLog(log));
    QCOMPARE(Lines(history), QByteArray("x\n"));
}

void tst_LogHistory::overwrittenMeanwhile()
{
    const QString log = m_folder.filePath("overwritten.log");
    QVERIFY(TestFiles::write(log, "first\nsecond\nthird\n"));
    LogHistory history;
    QVERIFY(history.ReadLog(log));
    QVERIFY(TestFiles::writeOver(log, "a new run\nnd\nthird\n"));
    QCOMPARE(Lines(history), QByteArray("third\n"));
}

// What has been opened is read, whatever its name is by then.
void tst_LogHistory::rotatedMeanwhile()
{
    const QString log = m_folder.filePath("moved.log");
    QVERIFY(TestFiles::write(log, "old\n"));
    HistoryFile file;
    QVERIFY(file.Open(log));
    QVERIFY(file.IsInPlace());
    QVERIFY(QFile::rename(log, log + ".1"));
    QVERIFY(!file.IsInPlace());
    QVERIFY(TestFiles::write(log, "the next run\nof two lines\n"));
    QVERIFY(!file.IsInPlace());
    QVERIFY(file.Read(LogLineParser(), LogFilter()));
    QCOMPARE(file.rows().lines().size(), size_t(1));
}

void tst_LogHistory::dates_data()
{
    QTest::addColumn<QByteArray>("text");
    QTest::addColumn<QString>("modified");
    QTest::addColumn<QStringList>("times");
    const auto row = [](char const* name, char const* text, char const* modified,
                        QStringList const& times) {
        QTest::newRow(name) << QByteArray(text) << QString(modified) << times;
    };
    row("from the stamps", "2025-03-03 09:00:00 Trace a\nb\n", "2025-04-01 00:00:00",
        {"2025-03-03 09:00:00", "2025-03-03 09:00:00"});
    row("from the file", "09:00:00 Trace a\n09:00:01 Trace b\n", "2025-03-03 09:00:01",
        {"2025-03-03 09:00:00", "2025-03-03 09:00:01"});
    row("written the day before", "23:00:00 Trace a\n", "2025-03-03 09:00:01",
        {"2025-03-02 23:00:00"});
    row("over midnight", "23:59:59 Trace a\n00:00:01 Trace b\n", "2025-03-03 00:00:01",
        {"2025-03-02 23:59:59", "2025-03-03 00:00:01"});
    row("a clock set back over midnight", "00:10:00 Trace a\n23:50:00 Trace b\n",
        "2025-03-02 23:50:00", {"2025-03-03 00:10:00", "2025-03-02 23:50:00"});
    row("from the entry above", "2025-03-03 23:59:00 Trace a\n23:59:01 Trace b\n00:00:00 Trace c\n",
        "2025-05-05 00:00:00",
        {"2025-03-03 23:59:00", "2025-03-03 23:59:01", "2025-03-04 00:00:00"});
    row("from the entry below", "23:59:00 Trace a\n2025-03-03 00:01:00 Trace b\n",
        "2025-05-05 00:00:00", {"2025-03-02 23:59:00", "2025-03-03 00:01:00"});
    row("before the first stamp", "torn\n2025-03-03 09:00:00 Trace a\n", "2025-05-05 00:00:00",
        {"2025-03-03 09:00:00", "2025-03-03 09:00:00"});
    row("at midnight", "torn\n00:00:00 Trace a\n00:00:01 Trace b\n", "2025-03-03 00:00:01",
        {"2025-03-03 00:00:00", "2025-03-03 00:00:00", "2025-03-03 00:00:01"});
    row("an earlier run ended before the next one began",
        "08:00:00 Trace a\n08:00:01 Trace b\nrn\n07:00:00 Trace c\n07:30:00 Trace d\n",
        "2025-03-03 08:00:01",
        {"2025-03-03 07:00:00", "2025-03-03 07:00:00", "2025-03-03 07:30:00", "2025-03-03 08:00:00",
         "2025-03-03 08:00:01"});
}

void tst_LogHistory::dates()
{
    QFETCH(QByteArray, text);
    QFETCH(QString, modified);
    QFETCH(QStringList, times);
    const QString log = m_folder.filePath("dates.log");
    QVERIFY(TestFiles::write(log, text));
    QVERIFY(SetModified(log, modified));
    LogHistory history(LogLineParser({"yyyy-MM-dd hh:mm:ss", "hh:mm:ss"}, {}));
    QVERIFY(history.ReadLog(log));
    HistoryCursor cursor(history, true);
    for (QString const& time : times) {
        QVERIFY(cursor.Next());
        QCOMPARE(cursor.time(), KeyOf(time));
    }
    QVERIFY(!cursor.Next());
}

// The rows of the log view, in the same order.
void tst_LogHistory::filter()
{
    const QString log = m_folder.filePath("filter.log");
    QVERIFY(TestFiles::write(log, "2025-03-03 09:00:00.001 Trace disk\n"
                                  "2025-03-03 09:00:01.1 Warning page\n"
                                  "of a disk\n"
                                  "rest\n"
                                  "2025-03-02 08:00:00.001 Error paper\n"
                                  "2025-03-02 08:00:05.001 Warning disk\n"));
    LogFilter disk;
    QVERIFY(disk.SetText("disk", false, true));
    LogHistory history(LogLineParser(), disk);
    QVERIFY(history.ReadLog(log));
    QByteArray lines;
    HistoryCursor cursor(history, true);
    while (cursor.Next())
        lines += QByteArray::number(static_cast<int>(cursor.line()));
    QCOMPARE(lines, QByteArray("5012"));
}

// They count the midnights between those that are shown.
void tst_LogHistory::timesOfHiddenLines()
{
    const QString log = m_folder.filePath("hidden.log");
    QVERIFY(TestFiles::write(log, "23:50:00 Trace disk\n00:10:00 Trace x\n12:05:00 Trace x\n"
                                  "22:00:00 Trace x\n23:55:00 Trace disk\n"
                                  "23:58:00 Trace disk\n"));
    QVERIFY(SetModified(log, "2025-03-03 23:58:00"));
    LogFilter disk;
    QVERIFY(disk.SetText("disk", false, true));
    LogHistory history(LogLineParser({"hh:mm:ss"}, {}), disk);
    QVERIFY(history.ReadLog(log));
    HistoryCursor cursor(history, true);
    for (char const* time : {"2025-03-02 23:50:00", "2025-03-03 23:55:00", "2025-03-03 23:58:00"}) {
        QVERIFY(cursor.Next());
        QCOMPARE(cursor.time(), KeyOf(time));
    }
    QVERIFY(!cursor.Next());
}

// Among others, it is where its file was last written.
void tst_LogHistory::logWithoutTimes()
{
    const QString log = m_folder.filePath("plain.log");
    for (char const* text : {"x\ny\n", "x\n2025-03-03 09:00:00.001 Trace a\n"}) {
        QVERIFY(TestFiles::write(log, text));
        QVERIFY(SetModified(log, "2025-03-03 10:00:00"));
        LogHistory history;
        QVERIFY(history.ReadLog(log));
        HistoryCursor cursor(history, true);
        QVERIFY(cursor.Next());
        QCOMPARE(cursor.key(), QByteArray(text).contains("Trace") ? KeyOf("2025-03-03 09:00:00") + 1
                                                                  : KeyOf("2025-03-03 10:00:00"));
    }
}

void tst_LogHistory::runWithoutTimes()
{
    const QString log = m_folder.filePath("partly.log");
    QVERIFY(TestFiles::write(log + ".1", "2025-03-03 09:00:00.001 Trace a\n"));
    QVERIFY(TestFiles::write(log, "x\n"));
    LogHistory history;
    QVERIFY(history.ReadLog(log));
    HistoryCursor cursor(history, true);
    QVERIFY(cursor.Next());
    QCOMPARE(cursor.time(), KeyOf("2025-03-03 09:00:00") + 1);
    QVERIFY(cursor.Next());
    QCOMPARE(cursor.time(), qint64(-1));
    QVERIFY(!cursor.Next());
}

void tst_LogHistory::overwrittenStamps()
{
    const QString log = m_folder.filePath("stamps.log");
    const QByteArray first = "2025-03-03 09:00:00.001 Trace a\n";
    const QByteArray second = "2025-03-03 10:00:00.001 Trace b\n";
    QVERIFY(TestFiles::write(log, "torn\n" + first + second));
    LogHistory history;
    QVERIFY(history.ReadLog(log));
    QVERIFY(
        TestFiles::writeOver(log, "torn\n" + QByteArray(first.size() - 1, 'x') + '\n' + second));
    HistoryCursor cursor(history, true);
    QVERIFY(cursor.Next());
    QCOMPARE(cursor.time(), KeyOf("2025-03-03 10:00:00") + 1);
    history.ReadTimes();
    QCOMPARE(history.runs()[0].start, KeyOf("2025-03-03 10:00:00") + 1);
}

void tst_LogHistory::opensAgain()
{
    const QString log = m_folder.filePath("one.log");
    QVERIFY(TestFiles::write(log, "z"));
    HistoryFile file;
    QVERIFY(!file.Open(m_folder.filePath("none.log")));
    QVERIFY(file.Open(log));
    for (int time = 0; time < 2; ++time) {
        QVERIFY(file.Read(LogLineParser(), LogFilter()));
        QCOMPARE(file.rows().lines().size(), size_t(1));
        QCOMPARE(file.error(), QString());
    }
}

// Another history may read what this one has opened.
void tst_LogHistory::shares()
{
    const QString log = m_folder.filePath("shared.log");
    QVERIFY(TestFiles::write(log, "a\nb\n"));
    HistoryFile file;
    QVERIFY(!file.isOpen());
    QVERIFY(file.Open(log));
    QVERIFY(file.isOpen());
    HistoryFile other;
    other.Share(file);
    QCOMPARE(other.path(), log);
    QCOMPARE(other.file(), file.file());
    file.file()->close();
    QVERIFY(!other.isOpen());
}

void tst_LogHistory::placesOfLines()
{
    const QString log = m_folder.filePath("places.log");
    QVERIFY(TestFiles::write(log, "2025-03-03 09:00:00.001 Trace a\nmore\n"));
    LogHistory history;
    QVERIFY(history.ReadLog(log));
    HistoryCursor cursor(history, false);
    QVERIFY(cursor.Next());
    QCOMPARE(cursor.start(), qint64(0));
    QCOMPARE(cursor.end(), qint64(32));
    QCOMPARE(cursor.severity(), LogEntry::Trace);
    QVERIFY(cursor.Next());
    QCOMPARE(cursor.start(), qint64(32));
    QCOMPARE(cursor.end(), qint64(37));
    QCOMPARE(cursor.severity(), LogEntry::Trace);
}

void tst_LogHistory::wideCharacters()
{
    const QString log = m_folder.filePath("wide.log");
    QByteArray wide("\xff\xfe", 2);
    for (char c : QByteArray("2025-03-03 09:00:01 ERROR a\n2025-03-03 09:00:02 INFO b\n"))
        wide.append(c).append('\0');
    QVERIFY(TestFiles::write(log, wide));
    LogHistory history;
    QVERIFY(history.ReadFiles({log}));
    history.ReadTimes();
    QCOMPARE(history.runs().size(), size_t(1));
    QCOMPARE(history.runs()[0].start, KeyOf("2025-03-03 09:00:01"));
    QCOMPARE(history.runs()[0].end, KeyOf("2025-03-03 09:00:02"));
}

// As much of a line is looked at as the index does.
void tst_LogHistory::timeAtTheEndOfALongLine()
{
    const QString log = m_folder.filePath("long.log");
    const QByteArray start("{\"a\":\"");
    const QByteArray end("\",\"time\":\"2025-03-03 09:00:01\"");
    const QByteArray first("{\"level\":\"info\",\"msg\":\"x\"}\n");
    const QByteArray filling(LogIndex::PartsLimit - start.size() - end.size(), 'x');
    QVERIFY(TestFiles::write(log, first + start + filling + end + "}\n"));
    LogHistory history;
    QVERIFY(history.ReadFiles({log}));
    history.ReadTimes();
    QCOMPARE(history.runs().size(), size_t(1));
    QCOMPARE(history.runs()[0].start, KeyOf("2025-03-03 09:00:01"));
}

QTEST_GUILESS_MAIN(tst_LogHistory)
#include "tst_LogHistory.moc"
