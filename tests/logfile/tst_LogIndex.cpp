// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/logfile/LogIndex.h"
#include "support/DemoLog.h"

#include <QtTest>

#include <random>

using namespace Velocor;

using DemoLog::entry;
using DemoLog::run;
using DemoLog::writtenOver;

namespace {

// A single pass over a file, in slices of the given size.
void Pass(LogIndex& index, QByteArray const& file, int slice)
{
    qint64 offset = index.Begin();
    while (offset < file.size()) {
        const QByteArray bytes = file.mid(static_cast<int>(offset), slice);
        const bool goesOn = index.Feed(bytes.constData(), bytes.size());
        offset = goesOn ? offset + bytes.size() : index.nextOffset();
    }
    index.End();
}

// A search of the known lines, in slices of the given size.
void Search(LogIndex& index, QByteArray const& file, LogFilter const& filter, int slice)
{
    index.BeginSearch(filter);
    while (index.searchOffset() < index.nextOffset()) {
        const qint64 offset = index.searchOffset();
        const auto length = static_cast<int>(index.SearchEnd(slice) - offset);
        const QByteArray lines = file.mid(static_cast<int>(offset), length);
        index.Search(lines, [] { return true; });
    }
}

// The rows as texts: the lines of the file, and the headings in brackets.
QStringList Texts(LogIndex const& index, QByteArray const& file,
                  LogFilter const& filter = LogFilter())
{
    QStringList texts;
    const LogRows rows = index.Rows(filter);
    for (size_t row = 0; row < rows.size(); ++row) {
        const int start = static_cast<int>(rows.start(row));
        if (start < 0) {
            texts.append(start == LogRows::EarlierHeading ? "[earlier]" : "[newest]");
            continue;
        }
        const int end = file.indexOf('\n', start);
        const QString torn = rows.mark(row) & LogRows::Torn ? "torn: " : "";
        texts.append(torn + QString::fromLatin1(file.mid(start, end < 0 ? -1 : end - start)));
    }
    return texts;
}

QStringList Lines(QByteArray const& text)
{
    QStringList lines = QString::fromLatin1(text).split('\n');
    if (lines.last().isEmpty())
        lines.removeLast();
    return lines;
}

// All that an index tells, with its rows as start, mark and check.
QString State(LogIndex const& index, LogFilter const& filter = LogFilter())
{
    QStringList told;
    const LogRows rows = index.Rows(filter);
    for (size_t row = 0; row < rows.size(); ++row)
        told.append(
            QString("%1:%2:%3").arg(rows.start(row)).arg(rows.mark(row)).arg(rows.check(row)));
    told.append(QString("problems %1, newest %2, lines %3, ends %4 %5 %6")
                    .arg(rows.problems())
                    .arg(rows.newestEnd())
                    .arg(index.size())
                    .arg(index.completeOffset())
                    .arg(index.nextOffset())
                    .arg(index.resumeOffset()));
    for (size_t count : index.counts())
        told.append(QString("count %1").arg(count));
    for (size_t first : index.RunStarts())
        told.append(QString("run %1").arg(first));
    told.append(QString("elapsed %1, times %2, severities %3")
                    .arg(index.hasElapsed())
                    .arg(index.hasTimes())
                    .arg(index.hasSeverities()));
    return told.join('\n');
}

// That of an index that reads the file once.
QString StateOf(QByteArray const& file, LogFilter const& filter = LogFilter(),
                bool isOneRun = false)
{
    LogIndex index(LogLineParser(), filter, isOneRun);
    Pass(index, file, 1 << 20);
    return State(index, filter);
}

LogFilter With(char const* text)
{
    LogFilter filter;
    filter.SetText(text, false, true);
    return filter;
}

QStringList TextsOf(QByteArray const& file, LogLineParser const& parser = LogLineParser())
{
    LogIndex index(parser);
    Pass(index, file, 1 << 20);
    return Texts(index, file);
}

} // namespace

class tst_LogIndex : public QObject
{
    Q_OBJECT

private slots:
    void order_data();
    void order();
    void slices_data();
    void slices();
    void threeRuns();
    void manyRuns();
    void dateFormats_data();
    void dateFormats();
    void filter_data();
    void filter();
    void continuedLinesGoWithTheirEntry();
    void textFilter();
    void anotherText_data();
    void anotherText();
    void partOfASearch();
    void beforeTheFirstPass();
    void awaitsKnownLines();
    void textFilterOfLongLines();
    void lineLimit();
    void searchesALineAtATime();
    void searchEndsAtASlowLine();
    void earlierRunsWithoutAMatch();
    void wholeLinesAreOverwritten();
    void rowsOfAGrowingLog();
    void slowLineAfterOthers();
    void entryUntilItGoesOn();
    void textFilterOfEntries_data();
    void textFilterOfEntries();
    void longEntry();
    void problems();
    void counts_data();
    void counts();
    void columns_data();
    void columns();
    void seams_data();
    void seams();
    void passesOverAWritingRun_data();
    void passesOverAWritingRun();
    void growthAtTheEndMakesOneRun();
    void readsOnlyWhatIsNew();
    void readsSomeLinesAgain_data();
    void readsSomeLinesAgain();
    void incompleteLastLine();
    void checks();
    void incompleteEntryCountsOnce();
    void olderEntryOverATornOne();
    void restartOfARunWithoutTimes();
    void lostSeam();
    void lostRunAtTheEnd();
    void anyBytes();
};

void tst_LogIndex::order_data()
{
    QTest::addColumn<QByteArray>("file");
    QTest::addColumn<QStringList>("rows");

    const QByteArray older = run(6, QTime(17, 0), "older", true);
    const QByteArray newer = run(3, QTime(9, 0), "newer");
    QTest::newRow("empty file") << QByteArray() << QStringList();
    QTest::newRow("one line") << newer.left(newer.indexOf('\n') + 1)
                              << QStringList(Lines(newer).first());
    QTest::newRow("one run") << newer << Lines(newer);
    QTest::newRow("one run without its last line end")
        << newer.left(newer.size() - 1) << Lines(newer);
    QTest::newRow("no entries at all")
        << QByteArray("a\nb\n\nc") << QStringList({"a", "b", "", "c"});

    QByteArray file = newer + older.mid(older.indexOf('\n') + 1);
    QTest::newRow("seam between two lines") << file
                                            << QStringList({"[earlier]"}) + Lines(older).mid(1) +
                                                   QStringList("[newest]") + Lines(newer);

    file = newer + "er 0\n" + older.mid(older.indexOf('\n') + 1);
    QTest::newRow("torn line at the seam")
        << file
        << QStringList({"[earlier]", "torn: er 0"}) + Lines(older).mid(1) +
               QStringList("[newest]") + Lines(newer);

    file = newer + "17:00:00.000 Error older\n" + older.mid(older.indexOf('\n') + 1);
    QTest::newRow("torn line that looks like an entry")
        << file
        << QStringList({"[earlier]", "torn: 17:00:00.000 Error older"}) + Lines(older).mid(1) +
               QStringList("[newest]") + Lines(newer);

    file = newer + "continued\n" + "er 0\n" + older.mid(older.indexOf('\n') + 1);
    QTest::newRow("a line that continues the newest entry stays with it")
        << file
        << QStringList({"[earlier]", "torn: er 0"}) + Lines(older).mid(1) +
               QStringList("[newest]") + Lines(newer) + QStringList("continued");

    QTest::newRow("nothing but a torn line after the run")
        << QByteArray(newer + "er 0\n") << Lines(newer) + QStringList("er 0");

    // In an hour that is repeated, entries are older than the ones before, but not than the first.
    const QByteArray back =
        entry("01:00:00.000", "Trace", "start") + entry("02:59:59.000", "Trace", "summer") +
        entry("02:00:01.000", "Trace", "winter") + entry("02:30:00.000", "Trace", "on");
    QTest::newRow("a clock that is set back is no seam") << back << Lines(back);

    const QByteArray shortRun =
        entry("03:10:00.000", "Trace", "summer") + entry("02:10:01.000", "Error", "winter");
    QTest::newRow("a short run whose clock is set back an hour is no seam")
        << shortRun << Lines(shortRun);

    const QByteArray threads = entry("09:00:00.010", "Trace", "a") +
                               entry("09:00:00.012", "Trace", "b") +
                               entry("09:00:00.009", "Trace", "c");
    QTest::newRow("entries of threads that overtake each other are no seam")
        << threads << Lines(threads);

    const QByteArray minute = entry("09:01:00.000", "Trace", "a") +
                              entry("09:01:00.005", "Trace", "b") +
                              entry("09:00:59.990", "Trace", "c");
    QTest::newRow("nor are they at a full minute") << minute << Lines(minute);
}

void tst_LogIndex::order()
{
    QFETCH(QByteArray, file);
    QFETCH(QStringList, rows);
    QCOMPARE(TextsOf(file), rows);
}

void tst_LogIndex::slices_data()
{
    QTest::addColumn<int>("slice");
    for (int slice : {1, 2, 3, 7, 64, 1000})
        QTest::newRow(qPrintable(QString("%1 bytes").arg(slice))) << slice;
}

// However the file is sliced, the rows are the same.
void tst_LogIndex::slices()
{
    QFETCH(int, slice);
    const QByteArray file =
        writtenOver(run(30, QTime(17, 0), "older", true), run(11, QTime(9, 0), "newer")) +
        "no line end";
    LogIndex index;
    Pass(index, file, slice);
    QCOMPARE(Texts(index, file), TextsOf(file));
}

void tst_LogIndex::threeRuns()
{
    const QByteArray first = run(9, QTime(7, 0), "first");
    const QByteArray second = run(6, QTime(8, 0), "second");
    const QByteArray third = run(2, QTime(9, 0), "third");
    const QByteArray file = writtenOver(writtenOver(first, second), third);
    const QStringList rows = TextsOf(file);
    QCOMPARE(rows.first(), QString("[earlier]"));
    QCOMPARE(rows.mid(rows.indexOf("[newest]") + 1), Lines(third));
    // The rest of the first run comes before the rest of the second.
    QVERIFY(rows.indexOf(Lines(first).last()) < rows.indexOf(Lines(second).last()));
    QVERIFY(rows.indexOf(Lines(first).last()) > 0);
}

// Lines after the 64th run count as part of it, and every line is still there.
void tst_LogIndex::manyRuns()
{
    QByteArray file;
    for (int i = 1000; i > 0; --i)
        file += "rest\n" + entry(QTime(0, 0).addSecs(i * 60).toString("hh:mm:ss.zzz"), "Trace",
                                 QString::number(i));
    LogIndex index;
    Pass(index, file, 4096);
    QCOMPARE(index.size(), size_t(2000));
    const QStringList rows = Texts(index, file).replaceInStrings("torn: ", "");
    QCOMPARE(rows.size(), 2002);
    QCOMPARE(rows.mid(1, 2000 - 2 * 63), Lines(file).mid(2 * 63));
}

void tst_LogIndex::dateFormats_data()
{
    QTest::addColumn<QString>("format");
    QTest::addColumn<QByteArray>("newer");
    QTest::addColumn<QByteArray>("older");

    QTest::newRow("with a date")
        << "dd.MM.yyyy hh:mm" << QByteArray("02.04.2025 09:00 Trace a\n02.04.2025 09:01 Trace b\n")
        << QByteArray("03.03.2025 09:00 Trace c\n03.03.2025 09:01 Trace d\n");
    QTest::newRow("time of day only") << "hh:mm" << QByteArray("09:00 Trace a\n09:01 Trace b\n")
                                      << QByteArray("07:00 Trace c\n07:01 Trace d\n");
    QTest::newRow("the first entry is still in the default format")
        << "hh:mm" << QByteArray("2025-03-03 09:00:00.000 Trace a\n09:01 Trace b\n09:02 Trace x\n")
        << QByteArray("07:00 Trace c\n07:01 Trace d\n");
    QTest::newRow("the older run wrote dates")
        << "hh:mm" << QByteArray("09:00 Trace a\n09:01 Trace b\n")
        << QByteArray("2025-03-03 10:00:00.000 Trace c\n2025-03-03 10:00:01.000 Trace d\n");
}

void tst_LogIndex::dateFormats()
{
    QFETCH(QString, format);
    QFETCH(QByteArray, newer);
    QFETCH(QByteArray, older);
    QCOMPARE(TextsOf(newer + older, LogLineParser({format}, {})),
             QStringList("[earlier]") + Lines(older) + QStringList("[newest]") + Lines(newer));

    // The settings are logged in the default format, before the one from the settings is in force.
    const QByteArray switched = QByteArray("2025-03-03 09:00:35.310 Trace a\n"
                                           "2025-03-03 09:00:35.311 Trace b\n") +
                                newer;
    QCOMPARE(TextsOf(switched, LogLineParser({format}, {})), Lines(switched));

    const QByteArray midnight("23:59 Trace a\n00:00 Trace b\n00:01 Trace c\n");
    QCOMPARE(TextsOf(midnight, LogLineParser({"hh:mm"}, {})), Lines(midnight));
}

void tst_LogIndex::filter_data()
{
    QTest::addColumn<QList<int>>("hidden");
    QTest::addColumn<QStringList>("rows");

    QTest::newRow("all shown") << QList<int>()
                               << QStringList({"a", "b", "c", "d", "e", "more", "?"});
    QTest::newRow("no traces") << QList<int>({LogEntry::Trace})
                               << QStringList({"b", "c", "d", "e", "more", "?"});
    QTest::newRow("all but what has no severity")
        << QList<int>({LogEntry::None}) << QStringList({"a", "b", "c", "d", "e", "more"});
    QTest::newRow("problems only")
        << QList<int>({LogEntry::Trace, LogEntry::Notification, LogEntry::None})
        << QStringList({"c", "d", "e", "more"});
    QTest::newRow("only what has no severity") << QList<int>({0, 1, 2, 3, 4}) << QStringList("?");
    QTest::newRow("none") << QList<int>({0, 1, 2, 3, 4, 5}) << QStringList();
}

void tst_LogIndex::filter()
{
    QFETCH(QList<int>, hidden);
    QFETCH(QStringList, rows);
    const QByteArray file =
        entry("09:00:00.000", "Trace", "a") + entry("09:00:01.000", "Notification", "b") +
        entry("09:00:02.000", "Warning", "c") + entry("09:00:03.000", "Error", "d") +
        entry("09:00:04.000", "Fatal", "e") + "more\n" + entry("09:00:05.000", "", "?");
    LogIndex index;
    Pass(index, file, 4096);
    LogFilter filter;
    for (int severity : hidden)
        filter.SetSeverity(static_cast<LogEntry::Severity>(severity), false);

    QStringList messages;
    const QStringList texts = Texts(index, file, filter);
    for (QString const& text : texts)
        messages.append(text.section(' ', -1));
    QCOMPARE(messages, rows);
}

void tst_LogIndex::continuedLinesGoWithTheirEntry()
{
    const QByteArray file = entry("09:00:00.000", "Error", "first") + "second\nthird\n" +
                            entry("09:00:01.000", "Trace", "x");
    LogIndex index;
    Pass(index, file, 4096);
    const LogRows rows = index.Rows(LogFilter());
    for (size_t row = 0; row < 3; ++row)
        QCOMPARE(rows.severity(row), LogEntry::Error);
    QCOMPARE(rows.mark(0) & LogRows::Continued, 0);
    QVERIFY(rows.mark(1) & LogRows::Continued);
    QCOMPARE(rows.problems(), size_t(1));
}

void tst_LogIndex::textFilter()
{
    const QByteArray file = run(30, QTime(9, 0), "newer");
    LogFilter filter;
    QVERIFY(filter.SetText("NEWER 2", false, false));
    LogIndex index{LogLineParser(), filter};
    Pass(index, file, 100);
    QCOMPARE(Texts(index, file, filter).size(), 11);
}

void tst_LogIndex::anotherText_data()
{
    QTest::addColumn<QByteArray>("file");
    QTest::addColumn<QString>("before");
    QTest::addColumn<QString>("text");
    QTest::addColumn<bool>("isExpression");
    const auto row = [](char const* name, QByteArray const& file, char const* before,
                        char const* text, bool isExpression = false) {
        QTest::newRow(name) << file << QString(before) << QString(text) << isExpression;
    };
    const QByteArray file = run(30, QTime(9, 0), "newer");
    row("found", file, "", "newer 2");
    row("found, other than before", file, "newer 1", "newer 2");
    row("not found", file, "newer 1", "absent");
    row("no text any more", file, "newer 1", "");
    row("expression", file, "newer 1", "r [12]", true);
    row("expression without a text", file, "newer 1", "\\d{2}$", true);
    row("the last line", file, "", "newer 29");
    row("an incomplete last line", file + "end", "", "end");
    row("runs", writtenOver(run(30, QTime(8, 0), "older"), run(10, QTime(9, 0), "newer")), "newer",
        "r 2");
    row("entries of several lines", entry("09:00:00.000", "Error", "a") + "stack\ntrace\n" + file,
        "newer", "stack");
    row("an expression that takes too long",
        file + entry("10:00:00.000", "Trace", QString(200, 'a') + "1") + file, "newer",
        "(a+)+[b-z]$", true);
    row("an expression that took too long",
        file + entry("10:00:00.000", "Trace", QString(200, 'a') + "1") + file, "(a+)+[b-z]$",
        "newer 2");
    row("no line", "", "", "a");
}

// Another text is found in the lines that are known, as if they were read again.
void tst_LogIndex::anotherText()
{
    QFETCH(QByteArray, file);
    QFETCH(QString, before);
    QFETCH(QString, text);
    QFETCH(bool, isExpression);
    LogFilter filter;
    QVERIFY(filter.SetText(text, isExpression, true));
    LogFilter filterBefore;
    QVERIFY(filterBefore.SetText(before, before.startsWith('('), true));
    LogIndex fresh{LogLineParser(), filter};
    Pass(fresh, file, 1000);
    for (int slice : {1, 100, 1000000}) {
        LogIndex index{LogLineParser(), filterBefore};
        Pass(index, file, 1000);
        Search(index, file, filter, slice);
        QCOMPARE(Texts(index, file, filter), Texts(fresh, file, filter));
        QCOMPARE(index.slowLine(), fresh.slowLine());
        QCOMPARE(index.slowLine(), size_t(text.startsWith('(') ? 31 : 0));
        QCOMPARE(index.searchedLines(), fresh.size());

        // Later lines are searched for it, too.
        const QByteArray more = file + entry("11:00:00.000", "Trace", "newer 2");
        Pass(index, more, 1000);
        Pass(fresh, more, 1000);
        QCOMPARE(Texts(index, more, filter), Texts(fresh, more, filter));
        fresh = LogIndex(LogLineParser(), filter);
        Pass(fresh, file, 1000);
    }
}

// Lines that have not been searched are not shown.
void tst_LogIndex::partOfASearch()
{
    const QByteArray file = run(30, QTime(9, 0), "newer");
    LogIndex index;
    Pass(index, file, 1000);
    LogFilter filter;
    QVERIFY(filter.SetText("newer", false, true));
    index.BeginSearch(filter);
    QCOMPARE(index.searchedLines(), size_t(0));
    QCOMPARE(Texts(index, file, filter), QStringList());
    const QByteArray first = file.left(static_cast<int>(index.SearchEnd(500)));
    QVERIFY(first.size() <= 500 && first.endsWith('\n'));
    index.Search(first, [] { return true; });
    QCOMPARE(Texts(index, file, filter), Lines(first));
    QCOMPARE(index.searchedLines(), size_t(Lines(first).size()));
    QCOMPARE(index.searchOffset(), qint64(first.size()));
    QCOMPARE(index.size(), size_t(30));

    // It can be stopped after each line that matches.
    QVERIFY(filter.SetText("newer 2", false, true));
    index.BeginSearch(filter);
    index.Search(file, [] { return false; });
    QCOMPARE(index.searchedLines(), size_t(3));
    index.Search(file.mid(static_cast<int>(index.searchOffset())), [] { return true; });
    QCOMPARE(index.searchedLines(), size_t(30));
    QCOMPARE(Texts(index, file, filter).size(), 11);

    // A pass ends it.
    index.BeginSearch(filter);
    index.Begin();
    QCOMPARE(index.searchedLines(), size_t(30));
    index.End();
}

void tst_LogIndex::beforeTheFirstPass()
{
    const LogIndex index;
    QCOMPARE(index.RunStarts(), std::vector<size_t>{0});
    QCOMPARE(index.size(), size_t(0));
    QCOMPARE(index.nextOffset(), qint64(0));
    QCOMPARE(index.completeOffset(), qint64(0));
    QCOMPARE(index.resumeOffset(), qint64(0));
    QCOMPARE(index.searchedLines(), size_t(0));
    QCOMPARE(index.slowLine(), size_t(0));
    QVERIFY(!index.isOneRun() && !index.hasMoved() && !index.hasLostSeam());
    QVERIFY(!index.awaitsKnownLines());
    QCOMPARE(index.Rows(LogFilter()).size(), size_t(0));
    QCOMPARE(State(index), StateOf(QByteArray()));
}

// While the newest run is read again, lines after its seam are known, but not reached.
void tst_LogIndex::awaitsKnownLines()
{
    const QByteArray newer = run(3, QTime(9, 0), "n");
    const QByteArray file = writtenOver(run(20, QTime(17, 0), "older", true), newer);
    LogIndex index;
    Pass(index, newer, 4096);
    index.Begin();
    QVERIFY(!index.awaitsKnownLines()); // one run only
    index.End();

    index = LogIndex();
    index.Begin();
    QVERIFY(!index.awaitsKnownLines());
    index.Feed(file.constData(), file.size());
    QVERIFY(!index.awaitsKnownLines());
    index.End();
    const auto offset = static_cast<int>(index.Begin());
    QVERIFY(index.awaitsKnownLines());
    QVERIFY(!index.Feed(file.constData() + offset, file.size() - offset));
    QVERIFY(!index.awaitsKnownLines());
    index.End();
    QVERIFY(!index.awaitsKnownLines());
    QCOMPARE(State(index), StateOf(file));
}

// Read in many pieces, and searched as a whole.
void tst_LogIndex::textFilterOfLongLines()
{
    const QString text(3000000, 'x');
    const QByteArray file = entry("09:00:00.000", "Trace", text + "needle") +
                            entry("09:00:01.000", "Trace", text) +
                            entry("09:00:02.000", "Trace", "needle" + text + "needle").trimmed();
    LogFilter filter;
    QVERIFY(filter.SetText("xneedle", false, true));
    LogIndex index{LogLineParser(), filter};
    Pass(index, file, 4099);
    QCOMPARE(index.size(), size_t(3));
    const LogRows rows = index.Rows(filter);
    QCOMPARE(rows.size(), size_t(2));
    QCOMPARE(rows.start(1), qint64(file.lastIndexOf('\n') + 1));

    LogIndex again;
    Pass(again, file, 4099);
    Search(again, file, filter, 4099);
    const LogRows rowsAgain = again.Rows(filter);
    QCOMPARE(rowsAgain.size(), size_t(2));
    QCOMPARE(rowsAgain.start(1), rows.start(1));
}

// From then on all lines match, also those that did not.
// The text filter looks at so many bytes of a line, no more and no less.
void tst_LogIndex::lineLimit()
{
    QByteArray file(LogIndex::LineLimit + 2, 'x');
    file[LogIndex::LineLimit - 1] = 'a';
    file[LogIndex::LineLimit] = 'b';
    file[LogIndex::LineLimit + 1] = '\n';
    for (char const* text : {"a", "b"}) {
        const size_t expected = *text == 'a' ? 1 : 0;
        const LogFilter filter = With(text);
        for (int slice : {1 << 25, 1 << 27}) {
            LogIndex index(LogLineParser(), filter);
            Pass(index, file, slice);
            QCOMPARE(index.Rows(filter).size(), expected);
        }
        LogIndex again;
        Pass(again, file, 1 << 27);
        Search(again, file, filter, 1 << 27);
        QCOMPARE(again.Rows(filter).size(), expected);
    }
}

void tst_LogIndex::searchesALineAtATime()
{
    const QByteArray file = QByteArray(100, 'a') + "\nb\n";
    LogIndex index;
    Pass(index, file, 4096);
    index.BeginSearch(With("b"));
    QCOMPARE(index.SearchEnd(10), qint64(101)); // of a line that is longer, all
    QCOMPARE(index.SearchEnd(101), qint64(101));
    QCOMPARE(index.SearchEnd(1000), qint64(file.size()));
}

// Nothing is searched after a line that takes too long.
void tst_LogIndex::searchEndsAtASlowLine()
{
    const QByteArray file =
        entry("09:00:03.000", "Trace", QString(40, 'a') + '-') + run(30, QTime(10, 0), "x");
    LogFilter filter;
    QVERIFY(filter.SetText("(a+)+[b-z]$", true, true));
    LogIndex index;
    Pass(index, file, 4096);
    index.BeginSearch(filter);
    index.Search(file, [] { return true; });
    QCOMPARE(index.slowLine(), size_t(1));
    QCOMPARE(index.searchOffset(), index.nextOffset());
    QCOMPARE(index.Rows(filter).size(), size_t(31));
}

// Without a line of theirs, they have no headings.
void tst_LogIndex::earlierRunsWithoutAMatch()
{
    const QByteArray newer = run(3, QTime(9, 0), "newer");
    const QByteArray file = writtenOver(run(20, QTime(17, 0), "older", true), newer);
    LogIndex index(LogLineParser(), With("newer"));
    Pass(index, file, 4096);
    QCOMPARE(Texts(index, file, With("newer")), Lines(newer));
}

// Each new entry takes the place of an older one as long: the seam is always between two lines.
void tst_LogIndex::wholeLinesAreOverwritten()
{
    const QByteArray older = run(10, QTime(17, 0), "older", true);
    LogIndex index;
    for (int count = 1; count < 9; ++count) { // a complete line of the older run is left
        QByteArray file = writtenOver(older, run(count, QTime(9, 0), "newer"));
        file.chop(1); // the last line is not complete
        Pass(index, file, 4096);
        QCOMPARE(State(index), StateOf(file));
        QCOMPARE(index.hasMoved(), count > 1);
        QCOMPARE(index.RunStarts(), (std::vector<size_t>{0, size_t(count)}));
        QCOMPARE(index.resumeOffset(), qint64(run(count, QTime(9, 0), "newer").size()));
        Pass(index, file, 4096);
        QVERIFY(!index.hasMoved() && !index.hasLostSeam());
        QCOMPARE(State(index), StateOf(file));
    }
}

// With context around each hit, derived from the rows before.
void tst_LogIndex::rowsOfAGrowingLog()
{
    const QByteArray file =
        run(60, QTime(9, 0), "x") + "it goes on\n" + entry("10:00:00.000", "Error", "end");
    for (int context : {0, 1, 2, 5}) {
        LogFilter filter;
        filter.SetSeverity(LogEntry::Trace, false);
        filter.SetContext(context);
        LogIndex index(LogLineParser(), filter);
        LogRows before;
        for (int end = 0; end < file.size(); end += 37) {
            Pass(index, file.left(end), 4096);
            const LogRows rows = index.Rows(filter, before);
            const LogRows whole = index.Rows(filter);
            QCOMPARE(rows.size(), whole.size());
            for (size_t row = 0; row < rows.size(); ++row) {
                QCOMPARE(rows.start(row), whole.start(row));
                QCOMPARE(rows.mark(row), whole.mark(row));
            }
            QCOMPARE(rows.newestEnd(), whole.newestEnd());
            QCOMPARE(rows.problems(), whole.problems());
            before = rows;
        }
        QVERIFY(before.size() > 10);
    }
}

void tst_LogIndex::slowLineAfterOthers()
{
    LogFilter filter;
    QVERIFY(filter.SetText("(a+)+[b-z]$", true, true));
    LogIndex index{LogLineParser(), filter};
    QByteArray file = run(3, QTime(9, 0), "X");
    Pass(index, file, 4096);
    const LogRows before = index.Rows(filter);
    QCOMPARE(before.size(), size_t(0));
    file += entry("09:00:03.000", "Trace", QString(40, 'a') + '-');
    Pass(index, file, 4096);
    QCOMPARE(index.slowLine(), size_t(4));
    QCOMPARE(index.Rows(filter, before).size(), size_t(4));
}

// What looks like an entry while its last word is not complete is none, and has no more lines.
void tst_LogIndex::entryUntilItGoesOn()
{
    LogIndex index;
    Pass(index, "a\n5 Error", 4096);
    QCOMPARE(uint(index.Rows(LogFilter()).mark(1)), uint(LogEntry::Error));
    Pass(index, "a\n5 Errorless\nb\n", 4096);
    const LogRows rows = index.Rows(LogFilter());
    const auto alone = uint(LogEntry::None | LogRows::Continued | LogRows::Alone);
    QCOMPARE(uint(rows.mark(1)), alone);
    QCOMPARE(uint(rows.mark(2)), alone);
}

void tst_LogIndex::textFilterOfEntries_data()
{
    QTest::addColumn<QString>("text");
    QTest::addColumn<QStringList>("rows"); // their last words

    const auto row = [](char const* name, char const* text, QStringList const& rows) {
        QTest::newRow(name) << QString(text) << rows;
    };
    row("a line before any entry is on its own", "before", {"before"});
    row("so is a line that continues it", "more", {"more"});
    row("the first line of an entry", "request", {"request", "stack", "trace"});
    row("a line in an entry", "stack", {"request", "stack", "trace"});
    row("the last line of an entry", "trace", {"request", "stack", "trace"});
    row("two lines of an entry", "ac", {"request", "stack", "trace"});
    row("an entry of one line", "single", {"single"});
    row("an entry without a severity", "tail", {"plain", "tail"});
    row("an entry without a time", "after", {"started", "after"});
    row("several entries", "s", {"request", "stack", "trace", "single", "started", "after"});
    row("nothing", "nowhere", {});
}

void tst_LogIndex::textFilterOfEntries()
{
    QFETCH(QString, text);
    QFETCH(QStringList, rows);
    const QByteArray file = "before\nmore\n" + entry("09:00:00.000", "Error", "a request") +
                            " at stack\n trace\n" + entry("09:00:01.000", "Warning", "single") +
                            entry("09:00:02.000", "", "plain") + "tail\n" +
                            "7 Notification started\nafter\n";
    LogFilter filter;
    QVERIFY(filter.SetText(text, false, true));
    LogIndex index{LogLineParser(), filter};
    Pass(index, file, 10);
    QStringList words;
    const QStringList lines = Texts(index, file, filter);
    for (QString const& line : lines)
        words.append(line.section(' ', -1));
    QCOMPARE(words, rows);
}

// Only its first lines are shown together; a file without any other stamp would be shown as a
// whole.
void tst_LogIndex::longEntry()
{
    const int lines = int(LogIndex::MaximumEntryLines) + 5;
    QByteArray file = entry("09:00:00.000", "Error", "first");
    for (int line = 2; line <= lines; ++line)
        file += QByteArray::number(line) + "th\n";
    LogFilter filter;
    QVERIFY(filter.SetText("999th", false, true));
    LogIndex index{LogLineParser(), filter};
    Pass(index, file, 4096);
    QCOMPARE(index.Rows(filter).size(), LogIndex::MaximumEntryLines);

    QVERIFY(filter.SetText("1001th", false, true));
    LogIndex other{LogLineParser(), filter};
    Pass(other, file, 4096);
    const LogRows rows = other.Rows(filter);
    QCOMPARE(Texts(other, file, filter), QStringList("1001th"));
    QCOMPARE(uint(rows.mark(0)), uint(LogEntry::Error | LogRows::Continued | LogRows::Alone));
    QCOMPARE(rows.problems(), size_t(0));
}

void tst_LogIndex::problems()
{
    const QByteArray file =
        entry("09:00:00.000", "Trace", "a") + entry("09:00:01.000", "Warning", "b") +
        entry("09:00:02.000", "Error", "c") + entry("09:00:03.000", "Fatal", "d") +
        entry("09:00:04.000", "Notification", "e");
    LogIndex index;
    Pass(index, file, 4096);
    QCOMPARE(index.Rows(LogFilter()).problems(), size_t(3));
}

void tst_LogIndex::counts_data()
{
    QTest::addColumn<QByteArray>("file");
    QTest::addColumn<QString>("counts"); // from Trace to Fatal, and None

    const auto row = [](char const* name, QByteArray const& file, char const* counts) {
        QTest::newRow(name) << file << QString(counts);
    };
    const QByteArray error = entry("09:00:00.000", "Error", "a");
    row("an empty file", "", "0 0 0 0 0 0");
    row("each severity", run(20, QTime(9, 0), "x") + error, "16 0 3 2 0 0");
    row("continued lines are not counted", error + "more\nand more\n", "0 0 0 1 0 0");
    row("a line before any entry", "what\n" + error, "0 0 0 1 0 1");
    row("an entry without a severity", entry("09:00:00.000", "", "?"), "0 0 0 0 0 1");
    row("an entry without a line end", error + error.trimmed(), "0 0 0 2 0 0");
    row("earlier runs, and a torn line",
        error + "n entry\n" + entry("06:00:00.000", "Fatal", "b") + "more\n", "0 0 0 1 1 1");
    row("a torn line that looks like an entry",
        error + "5 Warning\n" + entry("06:00:00.000", "Fatal", "b"), "0 0 0 1 1 1");
}

void tst_LogIndex::counts()
{
    QFETCH(QByteArray, file);
    QFETCH(QString, counts);
    LogIndex index;
    Pass(index, file, 4096);
    QStringList found;
    for (size_t count : index.counts())
        found.append(QString::number(count));
    QCOMPARE(found.join(' '), counts);
}

void tst_LogIndex::columns_data()
{
    QTest::addColumn<QString>("format");
    QTest::addColumn<QByteArray>("file");
    QTest::addColumn<bool>("hasElapsed");
    QTest::addColumn<bool>("hasTimes");
    QTest::addColumn<bool>("hasSeverities");
    const auto row = [](char const* name, char const* format, char const* file, bool hasElapsed,
                        bool hasTimes, bool hasSeverities) {
        QTest::newRow(name) << QString(format) << QByteArray(file) << hasElapsed << hasTimes
                            << hasSeverities;
    };
    row("nothing", "hh:mm", "a\n", false, false, false);
    row("a time", "hh:mm", "09:00  a\n", false, true, false);
    row("a time and a severity", "hh:mm", "09:00 Trace a\n", false, true, true);
    row("a time that is not understood", "hh:mm", "1 Trace a\n", false, true, true);
    row("all", "hh:mm", "09:00 Trace dT:[250] a\n", true, true, true);
    row("in one line of many", "hh:mm", "a\n09:00 Trace dT:[250] a\n09:01 b\nc\n", true, true,
        true);
    row("a time of one character", "d", "3 Trace a\n", false, true, true);
}

void tst_LogIndex::columns()
{
    QFETCH(QString, format);
    QFETCH(QByteArray, file);
    LogIndex index(LogLineParser({format}, {}));
    QVERIFY(!index.hasElapsed() && !index.hasTimes() && !index.hasSeverities());
    Pass(index, file, 4096);
    QTEST(index.hasElapsed(), "hasElapsed");
    QTEST(index.hasTimes(), "hasTimes");
    QTEST(index.hasSeverities(), "hasSeverities");
}

void tst_LogIndex::seams_data()
{
    QTest::addColumn<QString>("format");
    QTest::addColumn<QByteArray>("newer");
    QTest::addColumn<QByteArray>("older");
    QTest::addColumn<bool>("isSeam");
    const auto row = [](char const* name, char const* format, char const* newer, char const* older,
                        bool isSeam) {
        QTest::newRow(name) << QString(format) << QByteArray(newer) << QByteArray(older) << isSeam;
    };
    char const* const milliseconds = "yyyy-MM-dd hh:mm:ss.zzz";
    row("older by more than a change of the clock", milliseconds,
        "2025-03-03 10:00:00.000 Trace a\n2025-03-03 10:00:00.000 Trace b\n",
        "2025-03-03 08:58:59.999 Trace c\n", true);
    row("older by a change of the clock", milliseconds,
        "2025-03-03 10:00:00.000 Trace a\n2025-03-03 10:00:00.000 Trace b\n",
        "2025-03-03 08:59:00.000 Trace c\n", false);
    row("older than what threads may do", milliseconds, "2025-03-03 10:00:00.021 Trace a\nrest\n",
        "2025-03-03 10:00:00.000 Trace c\n", true);
    row("older by what threads may do", milliseconds, "2025-03-03 10:00:00.021 Trace a\nrest\n",
        "2025-03-03 10:00:00.001 Trace c\n", false);
    row("without a date, older by half a day", "hh:mm:ss.zzz", "23:00:00.000 Trace a\nrest\n",
        "11:00:00.000 Trace c\n", true);
    row("without a date, the next day", "hh:mm:ss.zzz", "23:00:00.000 Trace a\nrest\n",
        "10:59:59.999 Trace c\n", false);
    row("another format after one entry", "hh:mm", "2025-03-03 10:00:00.000 Trace a\nrest\n",
        "10:01 Trace b\n10:02 Trace c\n", false);
    row("another format after two entries", "hh:mm",
        "2025-03-03 10:00:00.000 Trace a\n2025-03-03 10:00:01.000 Trace b\nrest\n",
        "10:01 Trace b\n10:02 Trace c\n", true);
}

// How much older an entry has to be to begin an earlier run.
void tst_LogIndex::seams()
{
    QFETCH(QString, format);
    QFETCH(QByteArray, newer);
    QFETCH(QByteArray, older);
    LogIndex index(LogLineParser({format}, {}));
    Pass(index, newer + older, 4096);
    QTEST(index.RunStarts().size() == 2, "isSeam");
}

// Of the oldest run, only the start of a line is left. Passes that read just that line again cannot
// tell that it is older.
void tst_LogIndex::lostRunAtTheEnd()
{
    const QByteArray newest = entry("12:00:00.000", "Trace", "newest");
    QByteArray file =
        newest + entry("09:00:00.000", "Trace", "older") + entry("06:00:00.000", "Trace", "oldest");
    file.chop(3);
    LogIndex index;
    Pass(index, file, 4096);
    QCOMPARE(index.RunStarts(), (std::vector<size_t>{0, 1, 2}));
    QVERIFY(!index.hasLostSeam());
    Pass(index, file, 4096);
    QVERIFY(index.hasLostSeam());

    file += "est\n";
    index = LogIndex();
    for (int pass = 0; pass < 3; ++pass) {
        Pass(index, file, 4096);
        QCOMPARE(index.RunStarts(), (std::vector<size_t>{0, 1, 2}));
        QVERIFY(!index.hasLostSeam());
    }
}

void tst_LogIndex::passesOverAWritingRun_data()
{
    QTest::addColumn<unsigned>("seed");
    for (unsigned seed = 1; seed <= 10; ++seed)
        QTest::newRow(qPrintable(QString("seed %1").arg(seed))) << seed;
}

// A run overwrites older ones entry by entry; after every few entries, a pass from where the last
// one ended finds the same rows as a fresh pass over the whole file.
void tst_LogIndex::passesOverAWritingRun()
{
    QFETCH(unsigned, seed);
    std::mt19937 random(seed);
    const auto upTo = [&](int most) {
        return static_cast<int>(random() % static_cast<unsigned>(most)) + 1;
    };
    QByteArray file =
        writtenOver(run(upTo(60), QTime(6, 0), "first"), run(upTo(40), QTime(7, 0), "second run"));
    if (seed % 2 == 0)
        file.chop(3); // the last line is not complete
    QTime time(9, 0);
    QByteArray newest = entry(time.toString("hh:mm:ss.zzz"), "Trace", "start");
    LogIndex index;
    const LogFilter filter = With("nnnnnnnnnnnn");
    LogIndex filtered(LogLineParser(), filter);
    int lost = 0; // seams, which an index cannot follow to the last, incomplete line
    for (int step = 0; step < 60; ++step) {
        file = writtenOver(file, newest);
        Pass(index, file, upTo(200));
        if (index.hasLostSeam()) {
            ++lost;
            index = LogIndex();
            Pass(index, file, 4096);
        }
        QCOMPARE(Texts(index, file), TextsOf(file));
        QCOMPARE(State(index), StateOf(file));
        Pass(filtered, file, upTo(200));
        if (filtered.hasLostSeam()) {
            filtered = LogIndex(LogLineParser(), filter);
            Pass(filtered, file, 4096);
        }
        QCOMPARE(State(filtered, filter), StateOf(file, filter));
        for (int added = upTo(4); added > 0; --added) {
            time = time.addMSecs(upTo(2000));
            newest += entry(time.toString("hh:mm:ss.zzz"), "Warning", QString(upTo(50), 'n'));
            if (upTo(5) == 1)
                newest += "it goes on\n";
        }
    }
    QVERIFY(lost < 6);
}

// A seam that stays while the file grows behind it was a clock that was set back.
void tst_LogIndex::growthAtTheEndMakesOneRun()
{
    QByteArray file = entry("03:10:00.000", "Trace", "summer") + "continued\n" +
                      entry("02:10:01.000", "Error", "winter");
    LogIndex index;
    Pass(index, file, 4096);
    QCOMPARE(Texts(index, file).first(), QString("[earlier]"));
    file += entry("02:10:02.000", "Trace", "more");
    Pass(index, file, 4096);
    QCOMPARE(Texts(index, file), Lines(file));
    QVERIFY(index.isOneRun() && index.hasMoved() && !index.hasLostSeam());
    QCOMPARE(index.Rows(LogFilter()).mark(1) & LogRows::Torn, 0);
    QCOMPARE(State(index), StateOf(file, LogFilter(), true));
    Pass(index, file, 4096);
    QVERIFY(!index.hasMoved());

    // Nor is another one looked for.
    file += "continued\n" + entry("01:00:00.000", "Trace", "and back again");
    Pass(index, file, 4096);
    QCOMPARE(Texts(index, file), Lines(file));
}

void tst_LogIndex::readsOnlyWhatIsNew()
{
    QByteArray file = run(5000, QTime(9, 0), "newer");
    LogIndex index;
    Pass(index, file, 4096);
    QCOMPARE(index.resumeOffset(), qint64(file.size()));
    const qint64 end = file.size();
    file += entry("23:00:00.000", "Trace", "new");
    QCOMPARE(index.Begin(), end);
    index.End();

    // After a seam nothing is read twice.
    const int seam = file.lastIndexOf('\n', 1000) + 1;
    const QByteArray overwritten =
        writtenOver(run(5000, QTime(17, 0), "older", true), file.left(seam));
    LogIndex second;
    Pass(second, overwritten, 4096);
    QCOMPARE(second.Begin(), qint64(seam));
    const QByteArray rest = overwritten.mid(seam);
    QVERIFY(!second.Feed(rest.constData(), rest.size()));
    second.End();
    QCOMPARE(Texts(second, overwritten), TextsOf(overwritten));
}

// Lines after the last entry are read again in each pass, unless they are many.
void tst_LogIndex::readsSomeLinesAgain_data()
{
    QTest::addColumn<int>("lines");
    QTest::addColumn<bool>("isReadAgain");
    QTest::newRow("one") << 1 << true;
    QTest::newRow("as many as are read again") << 1000 << true;
    QTest::newRow("one more") << 1001 << false;
}

void tst_LogIndex::readsSomeLinesAgain()
{
    QFETCH(int, lines);
    QFETCH(bool, isReadAgain);
    const QByteArray first = entry("09:00:00.000", "Trace", "a");
    const QByteArray file = first + QByteArray("it goes on\n").repeated(lines);
    LogIndex index;
    Pass(index, file, 4096);
    const qint64 offset = isReadAgain ? first.size() : file.size();
    QCOMPARE(index.resumeOffset(), offset);
    QCOMPARE(index.Begin(), offset);
}

// They cover what a line has in the file, and the last line as far as it was written.
void tst_LogIndex::checks()
{
    const QByteArray longLine(LogRows::CheckedLength, 'x');
    const QByteArray file = "a\nb\r\na\n\n" + longLine + "\r\n" + longLine + "yyy\nc";
    LogIndex index;
    Pass(index, file, 5);
    const LogRows rows = index.Rows(LogFilter());
    QCOMPARE(rows.size(), size_t(7));
    for (size_t row = 0; row < rows.size(); ++row) {
        const QByteArray text = file.mid(int(rows.start(row))).split('\n').first();
        const int length = text.endsWith('\r') ? text.size() - 1 : text.size();
        QCOMPARE(rows.check(row), LogRows::CheckOf(text.constData(), length));
    }
    QCOMPARE(rows.check(0), rows.check(2));
    QVERIFY(rows.check(0) != rows.check(1));
    QVERIFY(rows.check(0) != rows.check(3));
    QCOMPARE(rows.check(4), rows.check(5)); // only the start counts
    QCOMPARE(rows.complete(), qint64(file.size() - 1));
    QCOMPARE(rows.end(), qint64(file.size()));
}

void tst_LogIndex::incompleteLastLine()
{
    const QByteArray whole = run(3, QTime(9, 0), "newer");
    LogIndex index;
    for (int length = 1; length <= whole.size(); ++length) {
        Pass(index, whole.left(length), 4096);
        QCOMPARE(Texts(index, whole.left(length)), TextsOf(whole.left(length)));
    }
}

// An entry without a date, over a stamp with one, shows which entries the run counts.
void tst_LogIndex::incompleteEntryCountsOnce()
{
    const QByteArray start("2025-03-03 09:00:00.000 Trace a\n");
    const LogLineParser parser({"hh:mm"}, {});
    LogIndex index(parser);
    Pass(index, start + "09:01 Trace b", 4096);
    const QByteArray file = start + "2025-03-03 09:01:00.000 Trace c\n";
    Pass(index, file, 4096);
    QCOMPARE(Texts(index, file), Lines(file));
}

// The clock was set back, and the entry begins where the rest of a torn one did.
void tst_LogIndex::olderEntryOverATornOne()
{
    const QByteArray newer = entry("09:00:00.000", "Trace", "a");
    const QByteArray older = entry("17:00:00.000", "Trace", QString(60, 'x'), true) +
                             entry("17:00:01.000", "Trace", "b", true);
    const QByteArray file = writtenOver(older, newer);
    LogIndex index;
    Pass(index, file, 4096);
    const QByteArray after =
        writtenOver(file, newer + entry("08:00:00.000", "Trace", QString(20, 'y')));
    Pass(index, after, 4096);
    QCOMPARE(Texts(index, after), TextsOf(after));
}

// Between two passes over the file it got another run, which begins with the same bytes.
void tst_LogIndex::restartOfARunWithoutTimes()
{
    const QByteArray start("it goes on\n");
    LogIndex index;
    Pass(index, start, 4096);
    const QByteArray file =
        writtenOver(start + run(6, QTime(17, 0), "older", true), start + run(2, QTime(9, 0), "n"));
    Pass(index, file, 4096);
    QCOMPARE(Texts(index, file), TextsOf(file));
    QCOMPARE(Texts(index, file).first(), QString("[earlier]"));
}

// The newest run ends exactly where an entry begins that was in the middle of a line before.
void tst_LogIndex::lostSeam()
{
    const QByteArray newer = run(2, QTime(9, 0), "n");
    const QByteArray older = run(3, QTime(17, 0), "older", true);
    LogIndex whole;
    Pass(whole, newer, 4096);
    QVERIFY(!whole.hasLostSeam()); // there was none
    LogIndex index;
    Pass(index, newer + "rest\nend of " + older, 4096);
    QVERIFY(!index.hasLostSeam());
    Pass(index, newer + "going on\nok\n" + older, 4096);
    QVERIFY(index.hasLostSeam());
}

void tst_LogIndex::anyBytes()
{
    std::mt19937 random(7);
    for (int i = 0; i < 300; ++i) {
        QByteArray file = run(40, QTime(9, 0), "x");
        for (int change = 0; change < 60; ++change)
            file[static_cast<int>(random() % static_cast<unsigned>(file.size()))] =
                change % 3 ? static_cast<char>(random()) : '\n';
        LogIndex index;
        Pass(index, file, 333);
        Pass(index, file, 333);
        QCOMPARE(Texts(index, file), TextsOf(file));
        QCOMPARE(index.size(), size_t(file.count('\n') + (file.endsWith('\n') ? 0 : 1)));
    }
}

QTEST_GUILESS_MAIN(tst_LogIndex)
#include "tst_LogIndex.moc"
