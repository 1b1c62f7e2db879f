// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The search without a thread: Find() returns when everything is searched.

#include "app/logfile/LogFinder.h"

#include "app/logfile/LogIndex.h"
#include "app/logfile/LogLineReader.h"
#include "support/DemoLog.h"
#include "support/TestFiles.h"

#include <QTemporaryDir>
#include <QtTest>

#include <random>

using namespace Velocor;

using DemoLog::entry;
using DemoLog::run;
using DemoLog::writtenOver;

namespace {

LogFilter Text(QString const& text, bool isExpression = false, bool caseSensitive = false)
{
    LogFilter filter;
    filter.SetText(text, isExpression, caseSensitive);
    return filter;
}

// All lines, or those without a severity that is hidden.
std::shared_ptr<LogRows const> RowsOf(LogIndex const& index, LogFilter const& filter = LogFilter())
{
    return std::make_shared<LogRows>(index.Rows(filter));
}

LogIndex IndexOf(QByteArray const& log)
{
    LogIndex index;
    index.Begin();
    index.Feed(log.constData(), log.size());
    index.End();
    return index;
}

// Some of the characters have a byte that would be a line feed.
QByteArray Wide(QString const& text)
{
    QByteArray bytes;
    for (QChar character : text)
        bytes.append(char(character.cell())).append(char(character.row()));
    return bytes;
}

} // namespace

class tst_LogFinder : public QObject
{
    Q_OBJECT

private slots:
    void init();
    void lines_data();
    void lines();
    void finds_data();
    void finds();
    void onlyRowsShown();
    void headingsAreNoLines();
    void longLines();
    void wideCharacters();
    void slowExpression();
    void slowFirstLine();
    void noFile();
    void obsoleteRequest();
    void anotherFile();
    void incompleteLine();
    void sameCheck();
    void emptyBefore();
    void onlyChangedRowsAreSearched();
    void findsBeforeItIsDone();
    void changedRows();

private:
    LogHits find(LogFinder& finder, LogFilter const& text, std::shared_ptr<LogRows const> rows,
                 bool isReset = true);

    std::unique_ptr<QTemporaryDir> m_folder;
    QString m_file;
    int m_number = 0;
};

void tst_LogFinder::init()
{
    m_folder = std::make_unique<QTemporaryDir>();
    m_file = m_folder->filePath("app.log");
}

LogHits tst_LogFinder::find(LogFinder& finder, LogFilter const& text,
                            std::shared_ptr<LogRows const> rows, bool isReset)
{
    LogHits last;
    const auto connection =
        connect(&finder, &LogFinder::found, this, [&](LogHits const& hits) { last = hits; });
    LogFindRequest request;
    request.number = ++m_number;
    request.source = m_file;
    request.text = text;
    request.rows = std::move(rows);
    request.isReset = isReset;
    finder.Find(request);
    disconnect(connection);
    return last;
}

void tst_LogFinder::lines_data()
{
    QTest::addColumn<QByteArray>("content");
    QTest::addColumn<int>("start");
    QTest::addColumn<QByteArray>("line");
    QTest::addColumn<int>("next");
    const QByteArray longer(200000, 'x');
    QTest::newRow("first") << QByteArray("ab\ncd\n") << 0 << QByteArray("ab") << 3;
    QTest::newRow("last") << QByteArray("ab\ncd\n") << 3 << QByteArray("cd") << 6;
    QTest::newRow("without a line end") << QByteArray("ab\ncd") << 3 << QByteArray("cd") << 5;
    QTest::newRow("carriage return") << QByteArray("ab\r\ncd") << 0 << QByteArray("ab") << 4;
    QTest::newRow("empty") << QByteArray("\n\n") << 1 << QByteArray() << 2;
    QTest::newRow("at the end") << QByteArray("ab\n") << 3 << QByteArray() << 3;
    QTest::newRow("longer than a slice") << "a\n" + longer + "\nb\n"
                                         << 2 << longer << longer.size() + 3;
    QTest::newRow("after a long one") << longer + "\nb\n"
                                      << longer.size() + 1 << QByteArray("b") << longer.size() + 3;
}

void tst_LogFinder::lines()
{
    QFETCH(QByteArray, content);
    QFETCH(int, start);
    QFETCH(QByteArray, line);
    QFETCH(int, next);
    QVERIFY(TestFiles::write(m_file, content));
    LogLineReader reader;
    QVERIFY(reader.Open(m_file));
    for (int before : {-1, 0, start}) { // whatever was read before
        if (before >= 0)
            reader.Line(before);
        QCOMPARE(reader.Line(start), line);
        QCOMPARE(reader.nextStart(), qint64(next));
    }
    QVERIFY(!reader.Open(m_folder->path()));
}

void tst_LogFinder::finds_data()
{
    QTest::addColumn<QString>("text");
    QTest::addColumn<bool>("isExpression");
    QTest::addColumn<bool>("caseSensitive");
    QTest::addColumn<QVector<int>>("rows");
    const auto row = [](char const* name, char const* text, bool isExpression, bool caseSensitive,
                        QVector<int> const& rows) {
        QTest::newRow(name) << QString(text) << isExpression << caseSensitive << rows;
    };
    row("text", "disk", false, false, {0, 2});
    row("case", "disk", false, true, {2});
    row("expression", "^\\S+ \\S+ E.*[dD]isk", true, true, {2});
    row("in the time", "09:00:01", false, false, {1});
    row("nowhere", "tape", false, false, {});
    row("no text", "", false, false, {});
}

void tst_LogFinder::finds()
{
    QFETCH(QString, text);
    QFETCH(bool, isExpression);
    QFETCH(bool, caseSensitive);
    QFETCH(QVector<int>, rows);
    const QByteArray log = entry("09:00:00.000", "Trace", "Disk full") +
                           entry("09:00:01.000", "Trace", "network") +
                           entry("09:00:02.000", "Error", "disk gone");
    QVERIFY(TestFiles::write(m_file, log));
    LogFinder finder;
    const LogHits hits =
        find(finder, Text(text, isExpression, caseSensitive), RowsOf(IndexOf(log)));
    QVERIFY(hits.isComplete);
    QCOMPARE(hits.searched, 3);
    QVector<int> found;
    for (int row : *hits.hits)
        found.append(row);
    QCOMPARE(found, rows);
}

void tst_LogFinder::onlyRowsShown()
{
    const QByteArray log = entry("09:00:00.000", "Trace", "a") +
                           entry("09:00:01.000", "Error", "a") +
                           entry("09:00:02.000", "Trace", "a");
    QVERIFY(TestFiles::write(m_file, log));
    LogFilter filter;
    filter.SetSeverity(LogEntry::Error, false);
    LogFinder finder;
    const LogHits hits = find(finder, Text("a"), RowsOf(IndexOf(log), filter));
    QCOMPARE(*hits.hits, std::vector<int>({0, 1}));
}

void tst_LogFinder::headingsAreNoLines()
{
    const QByteArray log =
        writtenOver(run(9, QTime(17, 0), "older", true), run(4, QTime(9, 0), "newer"));
    QVERIFY(TestFiles::write(m_file, log));
    const LogIndex index = IndexOf(log);
    LogFinder finder;
    const LogHits hits = find(finder, Text(".?", true), RowsOf(index));
    QCOMPARE(hits.rows->size(), index.size() + 2);
    QCOMPARE(hits.hits->size(), index.size());
    QVERIFY(hits.hits->front() == 1);
}

// The whole line is searched, however long it is.
void tst_LogFinder::wideCharacters()
{
    const QString other = QString(QChar(0x010a)) + QChar(0x0a00) + "x";
    QString text;
    for (int i = 0; i < 9999; ++i)
        text += other.repeated(1 + i % 7) + (i % 1000 == 5 ? QString(QChar(0x20ac)) : "") + "\r\n";
    const QByteArray log = Wide(text + QChar(0x20ac));
    QVERIFY(TestFiles::write(m_file, log));

    LogFindRequest request;
    request.type.encoding = LogEncoding::Utf16Le;
    LogLineParser parser;
    parser.SetFileType(request.type);
    LogIndex index(parser);
    index.Begin();
    index.Feed(log.constData(), log.size());
    index.End();
    QCOMPARE(index.size(), size_t(10000));

    LogFinder finder;
    LogHits last;
    connect(&finder, &LogFinder::found, this, [&](LogHits const& hits) { last = hits; });
    request.number = 1;
    request.source = m_file;
    request.rows = RowsOf(index);
    request.text = Text(QChar(0x20ac));
    finder.Find(request);
    QCOMPARE(*last.hits,
             std::vector<int>({5, 1005, 2005, 3005, 4005, 5005, 6005, 7005, 8005, 9005, 9999}));
    request.text = Text(other + "$", true);
    finder.Find(request);
    QCOMPARE(last.hits->size(), size_t(9989));

    LogLineReader reader;
    QVERIFY(reader.Open(m_file, request.type));
    for (size_t line : {size_t(9998), size_t(3), size_t(9999), size_t(0)}) {
        const qint64 start = request.rows->start(line);
        const QByteArray bytes = reader.Line(start);
        QCOMPARE(bytes, Wide(text.split("\r\n")[int(line)] +
                             (line == 9999 ? QString(QChar(0x20ac)) : "")));
        const qint64 next = line == 9999 ? log.size() : request.rows->start(line + 1);
        QCOMPARE(reader.nextStart(), next);
    }
}

void tst_LogFinder::longLines()
{
    const QByteArray log = entry("09:00:00.000", "Trace", QString(300000, 'x') + "needle") +
                           entry("09:00:01.000", "Trace", "b");
    QVERIFY(TestFiles::write(m_file, log));
    LogFinder finder;
    QCOMPARE(*find(finder, Text("needle"), RowsOf(IndexOf(log))).hits, std::vector<int>({0}));
}

void tst_LogFinder::slowExpression()
{
    const QByteArray log = run(40, QTime(9, 0), "x") +
                           entry("09:10:00.000", "Trace", QString(3000, 'a')) +
                           run(3, QTime(10, 0), "x");
    QVERIFY(TestFiles::write(m_file, log));
    LogFilter onlyTraces;
    onlyTraces.SetSeverity(LogEntry::Warning, false); // rows and lines differ
    LogFinder finder;
    const LogHits hits =
        find(finder, Text("(a+)+[b-z]$|x", true), RowsOf(IndexOf(log), onlyTraces));
    QVERIFY(hits.isComplete);
    QCOMPARE(hits.slowLine, qint64(41));
    QVERIFY(hits.hits->empty());
}

// Again when the rows are the same, instead of what was found without it.
void tst_LogFinder::slowFirstLine()
{
    const QByteArray log =
        entry("09:00:00.000", "Trace", QString(3000, 'a')) + run(9, QTime(10, 0), "x");
    QVERIFY(TestFiles::write(m_file, log));
    LogFinder finder;
    for (bool isReset : {true, false}) {
        const LogHits hits =
            find(finder, Text("(a+)+[b-z]$|x", true), RowsOf(IndexOf(log)), isReset);
        QVERIFY(hits.isComplete);
        QCOMPARE(hits.slowLine, qint64(1));
        QVERIFY(hits.hits->empty());
    }
    const LogHits other = find(finder, Text("x"), RowsOf(IndexOf(log)), false);
    QCOMPARE(other.slowLine, qint64(0));
    QCOMPARE(other.hits->size(), size_t(9));
}

void tst_LogFinder::noFile()
{
    LogFinder finder;
    const LogHits hits = find(finder, Text("a"), RowsOf(IndexOf(run(3, QTime(9, 0), "a"))));
    QVERIFY(hits.isComplete);
    QVERIFY(hits.hits->empty());
}

void tst_LogFinder::obsoleteRequest()
{
    const QByteArray log = run(3, QTime(9, 0), "a");
    QVERIFY(TestFiles::write(m_file, log));
    LogFinder finder;
    finder.SetCurrentRequest(m_number + 2);
    QVERIFY(!find(finder, Text("a"), RowsOf(IndexOf(log))).rows);
    QVERIFY(find(finder, Text("a"), RowsOf(IndexOf(log)), false).isComplete);

    // What was found before a request that was canceled is not kept for it.
    finder.SetCurrentRequest(m_number + 2);
    QVERIFY(!find(finder, Text("a 1"), RowsOf(IndexOf(log)), false).rows);
    const LogHits hits = find(finder, Text("a 1"), RowsOf(IndexOf(log)), false);
    QCOMPARE(*hits.hits, std::vector<int>({1}));
}

// Also where the rows are the same.
void tst_LogFinder::anotherFile()
{
    const QByteArray log = run(3, QTime(9, 0), "a");
    const auto rows = RowsOf(IndexOf(log));
    QVERIFY(TestFiles::write(m_file, log));
    LogFinder finder;
    QCOMPARE(*find(finder, Text("a 1"), rows).hits, std::vector<int>({1}));
    m_file += ".1";
    QVERIFY(TestFiles::write(m_file, QByteArray(log).replace("a 1", "b 1").replace("a 0", "a 1")));
    QCOMPARE(*find(finder, Text("a 1"), rows, false).hits, std::vector<int>({0}));
}

// The last line starts where it started before, but it has got its text only now.
void tst_LogFinder::incompleteLine()
{
    const QByteArray log = run(3, QTime(9, 0), "a");
    const QByteArray half = log.left(log.size() - 2);
    LogFinder finder;
    QVERIFY(TestFiles::write(m_file, half));
    QVERIFY(find(finder, Text("a 2"), RowsOf(IndexOf(half))).hits->empty());
    QVERIFY(TestFiles::write(m_file, log));
    QCOMPARE(*find(finder, Text("a 2"), RowsOf(IndexOf(log)), false).hits, std::vector<int>({2}));
}

// Lines are told apart by a check of few bits. Of two that have the same, the last one is searched
// again all the same.
void tst_LogFinder::sameCheck()
{
    const QByteArray log = run(3, QTime(9, 0), "a");
    const int start = log.lastIndexOf('\n', -2) + 1;
    const QByteArray half = log.mid(start).trimmed();
    const quint16 check = LogRows::CheckOf(half.constData(), half.size());
    QByteArray whole;
    int number = 0;
    do
        whole = half + " more " + QByteArray::number(++number);
    while (LogRows::CheckOf(whole.constData(), whole.size()) != check);

    LogFinder finder;
    const QByteArray before = log.left(start) + half;
    QVERIFY(TestFiles::write(m_file, before));
    QVERIFY(find(finder, Text("more"), RowsOf(IndexOf(before))).hits->empty());
    const QByteArray after = log.left(start) + whole + '\n';
    QVERIFY(TestFiles::write(m_file, after));
    const LogHits hits = find(finder, Text("more"), RowsOf(IndexOf(after)), false);
    QCOMPARE(*hits.hits, std::vector<int>({2}));
}

void tst_LogFinder::emptyBefore()
{
    const QByteArray log = run(3, QTime(9, 0), "a");
    LogFinder finder;
    QVERIFY(TestFiles::write(m_file, QByteArray()));
    QVERIFY(find(finder, Text("a"), RowsOf(IndexOf(QByteArray()))).hits->empty());
    QVERIFY(TestFiles::write(m_file, log));
    const LogHits hits = find(finder, Text("a"), RowsOf(IndexOf(log)), false);
    QCOMPARE(*hits.hits, std::vector<int>({0, 1, 2}));
}

// Seen by other lines that have come in the place of those that were found.
void tst_LogFinder::onlyChangedRowsAreSearched()
{
    const QByteArray log = run(9, QTime(9, 0), "a");
    const auto rows = RowsOf(IndexOf(log));
    const std::vector<int> all{0, 1, 2, 3, 4, 5, 6, 7, 8};
    const auto afterOthers = [&](QString const& next, bool isReset) {
        LogFinder finder;
        TestFiles::write(m_file, log);
        const LogHits before = find(finder, Text("a \\d", true), rows);
        if (*before.hits != all || before.slowLine != 0)
            return std::vector<int>();
        TestFiles::write(m_file, QByteArray(log).replace(" a ", " b "));
        return *find(finder, Text(next, true), rows, isReset).hits;
    };
    QCOMPARE(afterOthers("a \\d", false), std::vector<int>({0, 1, 2, 3, 4, 5, 6, 7}));
    QCOMPARE(afterOthers("a \\d", true), std::vector<int>());
    QCOMPARE(afterOthers("b \\d", false), all);
}

// A search that takes long tells what it has found so far, and can be stopped then. How many rows
// that takes depends on the machine.
void tst_LogFinder::findsBeforeItIsDone()
{
    const LogFilter text = Text("(x+x+)+y|^$|a$", true);
    bool hasReported = false;
    bool hasStopped = false;
    bool isRemoved = false;
    for (int rows = 1024; !(hasReported && hasStopped && isRemoved) && rows < 1 << 22; rows *= 2) {
        const QByteArray log = (QByteArray(40, 'z') + QByteArray(12, 'x') + "a\n").repeated(rows);
        QVERIFY(TestFiles::write(m_file, log));
        const auto all = RowsOf(IndexOf(log));
        LogFinder finder;
        LogHits last;
        connect(&finder, &LogFinder::found, this, [&](LogHits const& hits) {
            QVERIFY(!last.isComplete);
            QCOMPARE(hits.isComplete, hits.searched == rows);
            QCOMPARE(hits.hits->size(), size_t(hits.searched));
            QVERIFY(hits.searched > last.searched);
            hasReported = hasReported || !hits.isComplete;
            last = hits;
        });
        find(finder, text, all);
        QVERIFY(last.isComplete);

        hasStopped = false;
        LogFinder stopped;
        connect(&stopped, &LogFinder::found, this, [&](LogHits const& hits) {
            QVERIFY(!hasStopped);
            hasStopped = !hits.isComplete;
            if (hasStopped)
                stopped.SetCurrentRequest(hits.number + 1);
        });
        find(stopped, text, all);

        // The line that takes too long has a number only while the file has its name.
        const QByteArray slow = log + QByteArray(3000, 'x') + '\n';
        QVERIFY(TestFiles::write(m_file, slow));
        isRemoved = false;
        LogFinder finderOfRemoved;
        connect(&finderOfRemoved, &LogFinder::found, this, [&](LogHits const& hits) {
            if (!hits.isComplete)
                isRemoved = QFile::remove(m_file) || isRemoved;
            else
                QCOMPARE(hits.slowLine, qint64(isRemoved ? 0 : rows + 1));
        });
        QVERIFY(find(finderOfRemoved, text, RowsOf(IndexOf(slow))).isComplete);
    }
    QVERIFY(isRemoved);
    QVERIFY(hasStopped);
    QVERIFY(hasReported);
}

// Whatever has been kept from the previous search, the result is that of a search of everything.
void tst_LogFinder::changedRows()
{
    std::mt19937 random(1);
    int kept = 0;
    for (int life = 0; life < 40; ++life) {
        const QByteArray older = life % 2 ? run(60, QTime(17, 0), "older", true) : QByteArray();
        const QByteArray newer = run(80, QTime(9, 0), "newer");
        LogFinder finder;
        LogIndex index;
        LogFilter const text = Text("[13579]$", true);
        int length = 0;
        bool isReset = true;
        while (length < newer.size()) {
            length = std::min<int>(newer.size(), length + 1 + random() % 700);
            const QByteArray log = writtenOver(older, newer.left(length));
            QVERIFY(TestFiles::write(m_file, log));
            index.Begin();
            int at = static_cast<int>(index.nextOffset());
            while (at < log.size()) {
                index.Feed(log.constData() + at, log.size() - at);
                at = static_cast<int>(index.nextOffset());
            }
            index.End();
            const auto rows = RowsOf(index);
            LogFinder fresh;
            const LogHits expected = find(fresh, text, rows);
            const LogHits hits = find(finder, text, rows, isReset);
            QVERIFY(hits.isComplete && hits.rows == rows);
            QCOMPARE(*hits.hits, *expected.hits);
            kept += isReset ? 0 : static_cast<int>(hits.hits->size());
            isReset = false;
        }
    }
    QVERIFY(kept > 1000);
}

QTEST_GUILESS_MAIN(tst_LogFinder)

#include "tst_LogFinder.moc"
