// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The locator without a thread: Locate() returns when the place is found.

#include "app/logfile/LogLocator.h"

#include "app/logfile/LogIndex.h"
#include "support/DemoLog.h"
#include "support/TestFiles.h"

#include <QTemporaryDir>
#include <QtTest>

using namespace Velocor;

using DemoLog::entry;

namespace {

// Rows 0 to 5: two days, a line that continues an entry, and a clock that is set back a little.
QByteArray TwoDays()
{
    return entry("22:00:00.000", "Trace", "first", true) +
           entry("23:00:00.000", "Trace", "second", true) +
           entry("09:00:00.000", "Error", "third") + "continued\n" +
           entry("10:00:00.000", "Trace", "fourth") + entry("09:59:00.000", "Trace", "fifth");
}

} // namespace

class tst_LogLocator : public QObject
{
    Q_OBJECT

private slots:
    void places_data();
    void places();
    void withoutDates();
    void withoutTimes();
    void withoutRows();
    void withoutAFile();
    void beforeTheFirstEntry();
    void linesWithoutTimesAtTheEnds();
    void secondsSinceTheStart_data();
    void secondsSinceTheStart();
    void timeAtTheEndOfALongLine();
    void wideCharacters();
    void hiddenLine();
    void severalSlices();
    void obsoleteRequest();
    void tellsHowFarItIs();

private:
    LogLocation locate(QByteArray const& log, char const* place, int current,
                       LogFilter const& filter = LogFilter(),
                       LogLineParser const& parser = LogLineParser());

    QTemporaryDir m_folder;
    int m_current = 0;
    QList<int> m_percents;
};

LogLocation tst_LogLocator::locate(QByteArray const& log, char const* place, int current,
                                   LogFilter const& filter, LogLineParser const& parser)
{
    const QString path = m_folder.filePath("app.log");
    TestFiles::write(path, log);
    LogIndex index(parser, LogFilter(), true);
    index.Begin();
    index.Feed(log.constData(), log.size());
    index.End();
    LogLocateRequest request;
    request.number = 1;
    request.source = path;
    request.parser = parser;
    request.place = LogPlace::Parse(place);
    request.rows = std::make_shared<LogRows>(index.Rows(filter));
    request.currentRow = current;
    LogLocation found;
    LogLocator locator;
    locator.SetCurrentRequest(m_current);
    m_percents.clear();
    connect(&locator, &LogLocator::progressed, this, [&](int number, int percent) {
        QCOMPARE(number, 1);
        m_percents.append(percent);
    });
    connect(&locator, &LogLocator::located, this,
            [&](LogLocation const& location) { found = location; });
    locator.Locate(request);
    return found;
}

void tst_LogLocator::places_data()
{
    QTest::addColumn<QByteArray>("place");
    QTest::addColumn<int>("current");
    QTest::addColumn<int>("answer");
    QTest::addColumn<int>("row");
    const auto row = [](char const* name, char const* place, int current,
                        LogLocation::Answer answer, int found) {
        QTest::newRow(name) << QByteArray(place) << current << int(answer) << found;
    };
    row("first line", "1", -1, LogLocation::Found, 0);
    row("line", "4", -1, LogLocation::Found, 3);
    row("last line", "6", -1, LogLocation::Found, 5);
    row("one line too many", "7", -1, LogLocation::NoSuchLine, -1);
    row("time on the last day", "09:00", -1, LogLocation::Found, 2);
    row("next entry after the time", "9:00:00.001", -1, LogLocation::Found, 4);
    row("time on the day of the current entry", "22:30", 0, LogLocation::Found, 1);
    row("no more on that day", "23:30", 0, LogLocation::Found, 2);
    row("of a continued entry", "9:00", 3, LogLocation::Found, 2);
    row("after the end", "11:00", -1, LogLocation::Beyond, 5);
    row("date", "2025-03-03", 0, LogLocation::Found, 2);
    row("date and time", "2025-03-02 22:30", -1, LogLocation::Found, 1);
    row("before the start", "2020-01-01", -1, LogLocation::Found, 0);
    row("forward", "+1h", 0, LogLocation::Found, 1);
    row("forward over a gap", "+61m", 0, LogLocation::Found, 2);
    row("forward from a continued entry", "+1h", 3, LogLocation::Found, 4);
    row("forward, after the end", "+2h", 3, LogLocation::Beyond, 5);
    row("forward, not to the current row", "+0s", 0, LogLocation::Found, 1);
    row("back", "-10h", 2, LogLocation::Found, 1);
    row("back a little", "-1s", 2, LogLocation::Found, 1);
    row("back from a clock set back", "-1m", 4, LogLocation::Found, 2);
    row("forward, without a current row", "+0s", -1, LogLocation::Beyond, 5);
    row("back by a millisecond", "-1ms", 4, LogLocation::Found, 2);
    row("back, before the start", "-2d", 4, LogLocation::Beyond, 0);
    row("forward, after the end, from a continued entry", "+10d", 3, LogLocation::Beyond, 5);
}

void tst_LogLocator::places()
{
    QFETCH(QByteArray, place);
    QFETCH(int, current);
    QFETCH(int, answer);
    QFETCH(int, row);
    const LogLocation location = locate(TwoDays(), place.constData(), current);
    QCOMPARE(int(location.answer), answer);
    QCOMPARE(location.row, row);
    QCOMPARE(location.number, 1);
    QCOMPARE(location.start >= 0, row >= 0);
}

void tst_LogLocator::withoutDates()
{
    const LogLineParser parser({"hh:mm:ss"}, {});
    const QByteArray log = "09:00:00 Trace a\n10:00:00 Trace b\n11:00:00 Trace c\n";
    QCOMPARE(locate(log, "10:00", -1, LogFilter(), parser).row, 1);
    QCOMPARE(locate(log, "+90m", 0, LogFilter(), parser).row, 2);
    const LogLocation date = locate(log, "2025-03-03 10:00", -1, LogFilter(), parser);
    QCOMPARE(date.answer, LogLocation::NoDates);
    QCOMPARE(date.row, -1);
}

void tst_LogLocator::withoutTimes()
{
    QCOMPARE(locate("a\nb\n", "10:00", -1).answer, LogLocation::NoTimes);
    QCOMPARE(locate("a\nb\n", "2", -1).row, 1);
    const LogLocation nowhere = locate("", "10:00", -1);
    QCOMPARE(nowhere.answer, LogLocation::NoTimes);
    QCOMPARE(nowhere.row, -1);
}

void tst_LogLocator::withoutRows()
{
    const LogLocation location = locate("", "1", -1);
    QCOMPARE(location.answer, LogLocation::Found);
    QCOMPARE(location.row, -1);
}

void tst_LogLocator::withoutAFile()
{
    LogLocateRequest request;
    request.source = m_folder.filePath("none.log");
    request.rows = std::make_shared<LogRows>();
    LogLocation found;
    LogLocator locator;
    connect(&locator, &LogLocator::located, this,
            [&](LogLocation const& location) { found = location; });
    request.place = LogPlace::Parse("2");
    locator.Locate(request);
    QCOMPARE(found.answer, LogLocation::NoSuchLine);
    request.place = LogPlace::Parse("10:00");
    locator.Locate(request);
    QCOMPARE(found.answer, LogLocation::NoTimes);
}

// The lines above the first entry have its time.
void tst_LogLocator::beforeTheFirstEntry()
{
    const QByteArray log = "a\n" + TwoDays();
    QCOMPARE(locate(log, "22:00", 0).row, 1);
    QCOMPARE(locate(log, "22:30", 0).row, 2);
    QCOMPARE(locate("a\n" + log, "22:00", 0).row, 2);
}

// They are not the end of the log, but belong to the entries next to them.
void tst_LogLocator::linesWithoutTimesAtTheEnds()
{
    const LogLocation end = locate(TwoDays() + "a\n", "11:00", 4);
    QCOMPARE(end.answer, LogLocation::Beyond);
    QCOMPARE(end.row, 5);
    const LogLocation start = locate("a\n" + TwoDays(), "-2d", 5);
    QCOMPARE(start.answer, LogLocation::Beyond);
    QCOMPARE(start.row, 1);
}

// The first entry of a system that starts has the time 0.
void tst_LogLocator::secondsSinceTheStart_data()
{
    QTest::addColumn<QByteArray>("log");
    QTest::addColumn<QByteArray>("place");
    QTest::addColumn<int>("current");
    QTest::addColumn<int>("answer");
    QTest::addColumn<int>("row");
    const auto row = [](char const* name, QByteArray const& log, char const* place, int current,
                        LogLocation::Answer answer, int found) {
        QTest::newRow(name) << log << QByteArray(place) << current << int(answer) << found;
    };
    const QByteArray first("[    0.000000] first\n");
    const QByteArray two = first + "[    1.000000] second\n";
    row("from the first entry", two, "+1s", 0, LogLocation::Found, 1);
    row("from a line above it", "a\n" + two, "+1s", 0, LogLocation::Found, 2);
    row("back to the first entry", two, "-1s", 1, LogLocation::Found, 0);
    row("back, before the first entry", two, "-5s", 1, LogLocation::Beyond, 0);
    row("after the first entry, which is the last", first, "12:00", -1, LogLocation::Beyond, 0);
}

void tst_LogLocator::secondsSinceTheStart()
{
    QFETCH(QByteArray, log);
    QFETCH(QByteArray, place);
    QFETCH(int, current);
    QFETCH(int, answer);
    QFETCH(int, row);
    LogFileType type;
    type.isForeign = true;
    LogLineParser parser;
    parser.SetFileType(type);
    const LogLocation location = locate(log, place.constData(), current, LogFilter(), parser);
    QCOMPARE(int(location.answer), answer);
    QCOMPARE(location.row, row);
}

// As much of a line is looked at as the index does.
void tst_LogLocator::timeAtTheEndOfALongLine()
{
    LogFileType type;
    type.isForeign = true;
    LogLineParser parser;
    parser.SetFileType(type);
    const QByteArray start("{\"a\":\"");
    const QByteArray end("\",\"time\":\"14:03:02\"");
    const QByteArray filling(LogIndex::PartsLimit - start.size() - end.size(), 'x');
    QCOMPARE(locate(start + filling + end + "}\n", "14:00", -1, LogFilter(), parser).row, 0);
    const LogLocation cut =
        locate(start + filling + 'x' + end + "}\n", "14:00", -1, LogFilter(), parser);
    QCOMPARE(cut.answer, LogLocation::NoTimes);
}

// Lines are those of the file, whatever is shown of it.
void tst_LogLocator::wideCharacters()
{
    LogFileType type;
    type.encoding = LogEncoding::Utf16Be;
    LogLineParser parser;
    parser.SetFileType(type);
    QByteArray log;
    for (char character : TwoDays())
        log.append('\0').append(character);
    log.replace(QByteArray("\0c\0o", 4), QByteArray("\1\n\n\1", 4)); // no line feeds
    QCOMPARE(locate(log, "4", -1, LogFilter(), parser).row, 3);
    QCOMPARE(locate(log, "6", -1, LogFilter(), parser).row, 5);
    QCOMPARE(locate(log, "7", -1, LogFilter(), parser).answer, LogLocation::NoSuchLine);
    QCOMPARE(locate(log, "2025-03-02 22:30", -1, LogFilter(), parser).row, 1);
    QCOMPARE(locate(log, "+1h", 3, LogFilter(), parser).row, 4);
}

void tst_LogLocator::hiddenLine()
{
    LogFilter filter;
    filter.SetSeverity(LogEntry::Error, false);
    const LogLocation hidden = locate(TwoDays(), "3", -1, filter);
    QCOMPARE(hidden.answer, LogLocation::Nearest);
    QVERIFY(hidden.row == 1 || hidden.row == 2);
    const LogLocation shown = locate(TwoDays(), "5", -1, filter);
    QCOMPARE(shown.answer, LogLocation::Found);
    QCOMPARE(shown.row, 2);

    const QByteArray hiddenEnds =
        entry("09:00:00.000", "Error", "a") + entry("10:00:00.000", "Trace", "b") +
        entry("11:00:00.000", "Trace", "c") + entry("12:00:00.000", "Error", "d");
    const LogLocation first = locate(hiddenEnds, "1", -1, filter);
    QCOMPARE(first.answer, LogLocation::Nearest);
    QCOMPARE(first.row, 0);
    const LogLocation last = locate(hiddenEnds, "12:00", -1, filter);
    QCOMPARE(last.answer, LogLocation::Beyond);
    QCOMPARE(last.row, 1);
}

void tst_LogLocator::severalSlices()
{
    QByteArray log;
    for (int i = 0; i < 60000; ++i)
        log += entry("09:00:00.000", "Trace", QString("line %1").arg(i));
    QCOMPARE(locate(log, "59999", -1).row, 59998);
    QCOMPARE(locate(log, "25000", -1).row, 24999);
}

void tst_LogLocator::obsoleteRequest()
{
    m_current = 2;
    QCOMPARE(locate(TwoDays(), "4", -1).row, -1);
    m_current = 1;
    QCOMPARE(locate(TwoDays(), "4", -1).row, 3);
}

// After every 100,000 rows.
void tst_LogLocator::tellsHowFarItIs()
{
    const int others = 303028;
    QByteArray log = QByteArray("2025-03-03 09:00:00.000 Trace x\n").repeated(others);
    log += "2025-03-03 10:00:00.000 Trace x\n";
    QCOMPARE(locate(log, "10:00", -1).row, others);
    QCOMPARE(m_percents, QList<int>({32, 65, 99}));
    QCOMPARE(locate(log, "9:00", -1).row, 0);
    QVERIFY(m_percents.isEmpty());
}

QTEST_GUILESS_MAIN(tst_LogLocator)

#include "tst_LogLocator.moc"
