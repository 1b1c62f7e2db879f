// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// What there is to count, and how it is read; tst_PlainActivity compares the counts with a look at
// the time of every row. The counter has no thread here: Count() returns when it is done.

#include "app/logfile/ActivityCounter.h"
#include "app/logfile/LogIndex.h"
#include "support/DemoLog.h"
#include "support/OpenFiles.h"
#include "support/TestFiles.h"

#include <QTemporaryDir>
#include <QtTest>

#include <algorithm>
#include <limits>
#include <memory>

using namespace Velocor;

using DemoLog::entry;

class tst_ActivityCounter : public QObject
{
    Q_OBJECT

private slots:
    void init();
    void states_data();
    void states();
    void limits_data();
    void limits();
    void entriesOfABar();
    void linesWithoutTimesAtTheStart();
    void stampsAtTheirLimits_data();
    void stampsAtTheirLimits();
    void wideCharacters();
    void blocksOfRows_data();
    void blocksOfRows();
    void lineThatGrows();
    void anotherFile();
    void fileThatShrank();
    void earlierRuns_data();
    void earlierRuns();
    void headings();
    void obsoleteRequest();

private:
    QString write(QByteArray const& log, char const* name = "app.log") const;
    void index(QByteArray const& log);
    Activity const& count();

    std::unique_ptr<QTemporaryDir> m_folder;
    std::unique_ptr<ActivityCounter> m_counter;
    ActivityRequest m_request;
    Activity m_activity;
};

namespace {

LogLineParser ForeignParser(LogEncoding::Kind encoding = LogEncoding::Utf8)
{
    LogFileType type;
    type.isForeign = true;
    type.encoding = encoding;
    LogLineParser parser;
    parser.SetFileType(type);
    return parser;
}

// One entry a second; the severities tell the rows apart.
QByteArray Seconds(int count, char const* severity = "Trace")
{
    QByteArray log;
    for (int i = 0; i < count; ++i)
        log += entry(QTime(9, 0).addSecs(i).toString("HH:mm:ss.zzz"), severity, "x");
    return log;
}

} // namespace

void tst_ActivityCounter::init()
{
    m_folder = std::make_unique<QTemporaryDir>();
    m_counter = std::make_unique<ActivityCounter>();
    connect(m_counter.get(), &ActivityCounter::counted, this,
            [this](Activity const& activity) { m_activity = activity; });
    m_request = ActivityRequest();
    m_activity = Activity();
}

QString tst_ActivityCounter::write(QByteArray const& log, char const* name) const
{
    const QString path = m_folder->filePath(name);
    return TestFiles::write(path, log) ? path : QString();
}

void tst_ActivityCounter::index(QByteArray const& log)
{
    m_request.source = write(log);
    LogIndex index(m_request.parser, LogFilter(), true);
    index.Begin();
    index.Feed(log.constData(), log.size());
    index.End();
    m_request.rows = std::make_shared<LogRows>(index.Rows(LogFilter()));
}

Activity const& tst_ActivityCounter::count()
{
    ++m_request.number;
    m_counter->SetCurrentRequest(m_request.number);
    m_activity = Activity();
    m_counter->Count(m_request);
    return m_activity;
}

void tst_ActivityCounter::states_data()
{
    QTest::addColumn<QByteArray>("log");
    QTest::addColumn<int>("state");
    const QByteArray dated("2026-11-22 14:03:02 a\n");
    const QByteArray timed("14:03:02 a\n");
    QTest::newRow("empty") << QByteArray() << int(Activity::NoTimes);
    QTest::newRow("no times") << QByteArray("a\nb\n") << int(Activity::NoTimes);
    QTest::newRow("no dates") << timed + timed << int(Activity::NoDates);
    QTest::newRow("at first no date") << timed + dated << int(Activity::NoDates);
    QTest::newRow("at last no date") << dated + timed << int(Activity::NoDates);
    QTest::newRow("the start of a system")
        << QByteArray("[    0.000000] a\n") << int(Activity::NoDates);
    QTest::newRow("dates") << dated + dated << int(Activity::Known);
}

void tst_ActivityCounter::states()
{
    QFETCH(QByteArray, log);
    m_request.parser = ForeignParser();
    index(log);
    const int before = openFileCount();
    QTEST(int(count().state), "state");
    QCOMPARE(m_activity.number, m_request.number);
    QCOMPARE(openFileCount(), before);
}

void tst_ActivityCounter::limits_data()
{
    QTest::addColumn<qint64>("from");
    QTest::addColumn<qint64>("to");
    QTest::addColumn<bool>("isAll");
    QTest::newRow("none") << qint64(-1) << qint64(-1) << true;
    QTest::newRow("from the beginning of time") << qint64(0) << qint64(1000) << false;
    QTest::newRow("no beginning") << qint64(-1) << qint64(1000) << true;
    QTest::newRow("no length") << qint64(1000) << qint64(1000) << true;
    QTest::newRow("a millisecond") << qint64(1000) << qint64(1001) << false;
    QTest::newRow("end before the beginning") << qint64(1000) << qint64(500) << true;
}

void tst_ActivityCounter::limits()
{
    QFETCH(qint64, from);
    QFETCH(qint64, to);
    QFETCH(bool, isAll);
    index(Seconds(3));
    m_request.from = from;
    m_request.to = to;
    Activity const& activity = count();
    QCOMPARE(activity.state, Activity::Known);
    QCOMPARE(activity.last - activity.first, qint64(2000));
    QCOMPARE(activity.from, isAll ? activity.first : from);
    QCOMPARE(activity.to, isAll ? activity.last + 1 : to);
}

void tst_ActivityCounter::entriesOfABar()
{
    index(Seconds(3) + Seconds(1, "Error") + Seconds(1, "Warning"));
    m_request.from = 0; // they are not in the order of their times
    m_request.to = std::numeric_limits<qint64>::max() / 16;
    Activity const& all = count();
    QCOMPARE(all.bars.size(), size_t(1));
    QCOMPARE(all.bars[0].entries(), size_t(5));
    QCOMPARE(all.bars[0].problems(), size_t(2));
}

// They belong to the first entry.
void tst_ActivityCounter::linesWithoutTimesAtTheStart()
{
    const QByteArray first = "a\nb\n" + entry("09:00:00.000", "Trace", "x");
    index(first + entry("10:00:00.000", "Trace", "x"));
    m_request.parts = 2;
    Activity const& activity = count();
    QCOMPARE(activity.bars[0].start, qint64(0));
    QCOMPARE(activity.bars[1].start, qint64(first.size()));
}

void tst_ActivityCounter::stampsAtTheirLimits_data()
{
    QTest::addColumn<QByteArray>("log");
    QTest::addColumn<int>("state");
    const QByteArray stamp("2026-11-22 14:03:02");
    const QByteArray start("{\"a\":\"");
    const QByteArray end("\",\"time\":\"" + stamp + '"');
    const QByteArray filling(1024 - start.size() - end.size(), 'x');
    QTest::newRow("nothing else in the line") << stamp + '\n' << int(Activity::Known);
    QTest::newRow("only a carriage return") << stamp + "\r\n" << int(Activity::Known);
    QTest::newRow("a long line") << stamp + QByteArray(2000, ' ') + "x\n" << int(Activity::Known);
    QTest::newRow("at the end of what is read") << start + filling + end + "}\n"
                                                << int(Activity::Known);
    QTest::newRow("one byte after it") << start + filling + 'x' + end + "}\n"
                                       << int(Activity::NoTimes);
}

void tst_ActivityCounter::stampsAtTheirLimits()
{
    QFETCH(QByteArray, log);
    m_request.parser = ForeignParser();
    index(log);
    QTEST(int(count().state), "state");
}

void tst_ActivityCounter::wideCharacters()
{
    LogFileType type;
    type.encoding = LogEncoding::Utf16Be;
    m_request.parser.SetFileType(type);
    QByteArray log;
    for (const char character : Seconds(4))
        log.append('\0').append(character);
    index(log);
    m_request.parts = 2;
    Activity const& activity = count();
    QCOMPARE(activity.state, Activity::Known);
    QCOMPARE(activity.bars[0].entries(), size_t(2));
    QCOMPARE(activity.bars[1].start, qint64(log.size() / 2));
}

void tst_ActivityCounter::blocksOfRows_data()
{
    QTest::addColumn<int>("rows");
    for (const int rows : {1023, 1024, 1025, 2047, 2048, 2100})
        QTest::newRow(QByteArray::number(rows).constData()) << rows;
}

// Bars that begin next to where a sum of rows ends.
void tst_ActivityCounter::blocksOfRows()
{
    QFETCH(int, rows);
    index(Seconds(rows));
    m_request.from = count().first;
    for (const int begin : {1022, 1023, 1024, 1025, 2047}) {
        m_request.to = m_request.from + 2 * begin * 1000;
        m_request.parts = 2;
        Activity const& activity = count();
        QCOMPARE(activity.bars[0].entries(), size_t(std::min(begin, rows)));
        QCOMPARE(activity.bars[1].entries(), size_t(qBound(0, rows - begin, begin)));
    }
}

// Its row was the last one of a sum.
void tst_ActivityCounter::lineThatGrows()
{
    const QByteArray first = Seconds(1023) + "2025-03-03 10:00:00.000 Warn";
    const QByteArray all = first + "ing x\n" + entry("10:00:01.000", "Trace", "x");
    LogIndex index(LogLineParser(), LogFilter(), true);
    index.Begin();
    m_request.source = write(all);
    index.Feed(first.constData(), first.size());
    index.End();
    m_request.rows = std::make_shared<LogRows>(index.Rows(LogFilter()));
    QCOMPARE(m_request.rows->size(), size_t(1024));
    QCOMPARE(count().bars[0].problems(), size_t(0));
    for (qint64 at = index.Begin(); at < all.size(); at = index.nextOffset())
        index.Feed(all.constData() + at, all.size() - static_cast<int>(at));
    index.End();
    m_request.rows = std::make_shared<LogRows>(index.Rows(LogFilter(), *m_request.rows));
    QCOMPARE(m_request.rows->size(), size_t(1025));
    QCOMPARE(m_request.rows->problems(), size_t(1));
    Activity const& activity = count();
    QCOMPARE(activity.bars[0].problems(), size_t(1));
    QCOMPARE(activity.bars[0].entries(), size_t(1025));
}

// The times that are known are those of the file before.
void tst_ActivityCounter::anotherFile()
{
    m_request.parts = 2;
    index(Seconds(4));
    QCOMPARE(count().bars[0].entries(), size_t(2));
    m_request.source = write(Seconds(1).repeated(3) + Seconds(4).right(Seconds(1).size()), "b.log");
    QCOMPARE(count().bars[0].entries(), size_t(3));
    QCOMPARE(m_activity.bars[1].entries(), size_t(1));
}

// The last line that is left has the last time.
void tst_ActivityCounter::fileThatShrank()
{
    index(Seconds(4));
    write(Seconds(3));
    QCOMPARE(count().state, Activity::Known);
    QCOMPARE(m_activity.last - m_activity.first, qint64(2000));
}

void tst_ActivityCounter::earlierRuns_data()
{
    QTest::addColumn<bool>("isShownFirst");
    QTest::newRow("shown, then hidden") << true;
    QTest::newRow("hidden, then shown") << false;
}

// Rows of the newest run have other numbers then.
void tst_ActivityCounter::earlierRuns()
{
    QFETCH(bool, isShownFirst);
    const QByteArray newest = Seconds(4);
    index(newest + entry("09:00:00.000", "Trace", "x", true).repeated(4));
    const LineTable lines = m_request.rows->lines();
    LogRows only(lines);
    only.AddLines(0, 4);
    LogRows all(lines);
    all.AddHeading(LogRows::EarlierHeading);
    all.AddLines(4, 8);
    all.EndEarlier();
    all.AddLines(0, 4);
    m_request.parts = 2;
    for (const bool isShown : {isShownFirst, !isShownFirst}) {
        m_request.rows = std::make_shared<LogRows>(isShown ? all : only);
        Activity const& activity = count();
        QCOMPARE(activity.bars[0].entries(), size_t(isShown ? 4 : 2));
        QCOMPARE(activity.bars[1].entries(), size_t(isShown ? 4 : 2));
        QCOMPARE(activity.bars[0].start, qint64(isShown ? newest.size() : 0));
    }
}

// A heading has no place in the file.
void tst_ActivityCounter::headings()
{
    const QByteArray log = DemoLog::lifelike();
    m_request.source = write(log);
    LogIndex index(LogLineParser(), LogFilter(), false);
    index.Begin();
    index.Feed(log.constData(), log.size());
    index.End();
    m_request.rows = std::make_shared<LogRows>(index.Rows(LogFilter()));
    QVERIFY(m_request.rows->isHeading(0));
    m_request.from = 1;
    m_request.to = std::numeric_limits<qint64>::max() / 16;
    QCOMPARE(count().bars[0].start, m_request.rows->start(1));
}

void tst_ActivityCounter::obsoleteRequest()
{
    index(Seconds(3));
    m_request.number = 1;
    m_counter->SetCurrentRequest(2);
    m_counter->Count(m_request);
    QCOMPARE(m_activity.number, 0);
    QCOMPARE(count().number, 2);
}

QTEST_GUILESS_MAIN(tst_ActivityCounter)

#include "tst_ActivityCounter.moc"
