// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Random lives of several programs and their rotating logs, compared with what they wrote: every
// line that is in the files once, in the order in which it was written, and merged by time. What
// the window shows as all of a log is compared with that.

#include "app/history/HistoryMerge.h"
#include "app/history/HistoryScanner.h"
#include "app/logfile/LogLineReader.h"

#include "ProgramLife.h"
#include "Rounds.h"

#include <QTemporaryDir>
#include <QtTest>

#include <memory>

using namespace Velocor;

class tst_HistoryLives : public QObject
{
    Q_OBJECT

private slots:
    void initTestCase();
    void randomLives();
    void cleanupTestCase();

private:
    void live(quint32 seed);
    void look(std::vector<std::unique_ptr<ProgramLife>>& lives);
    void compareLines(ProgramLife const& life, QList<QByteArray> const& shown);
    void compareOrder(ProgramLife const& life, QList<QByteArray> const& shown);
    void compareTimes(ProgramLife const& life, LogHistory const& history);
    void compareMerged(std::vector<std::unique_ptr<ProgramLife>> const& lives,
                       std::vector<LogHistory> const& histories,
                       QList<QList<QByteArray>> const& alone);
    void compareInWindow(ProgramLife const& life, LogLineParser const& parser,
                         LogHistory const& history);

    QTemporaryDir m_folder{QFileInfo("/dev/shm").isWritable() ? "/dev/shm/tst_HistoryLives-XXXXXX"
                                                              : "tst_HistoryLives-XXXXXX"};
    int m_lives = 0;
    int m_views = 0;
    int m_clearViews = 0;
    int m_clearMerges = 0;
    int m_guesses = 0;
    qint64 m_lines = 0;
    qint64 m_times = 0;
    quint64 m_rows = 0;
};

// Where clocks change twice a year.
void tst_HistoryLives::initTestCase()
{
    qputenv("TZ", "Europe/Berlin");
    ::tzset();
}

void tst_HistoryLives::compareLines(ProgramLife const& life, QList<QByteArray> const& shown)
{
    QList<QByteArray> expected = life.lines();
    QList<QByteArray> found = shown;
    std::sort(expected.begin(), expected.end());
    std::sort(found.begin(), found.end());
    QCOMPARE(found, expected);
    m_lines += found.size();
    ++m_views;
}

void tst_HistoryLives::compareOrder(ProgramLife const& life, QList<QByteArray> const& shown)
{
    QSet<int> entries;
    for (QByteArray const& line : shown) {
        ProgramLife::Line const* written = life.written(line);
        if (written && written->hasStamp)
            entries.insert(written->number);
    }
    QVector<int> last(life.runs(), -1);
    int newest = -1;
    int above = -1;
    int entry = -1;
    bool isGuessedWrongly = false;
    for (QByteArray const& line : shown) {
        ProgramLife::Line const* written = life.written(line);
        const int number = written ? written->number : -1;
        const bool isBelow = number >= 0 && number == above + 1;
        above = number;
        // Of what is left of an entry without its stamp, nobody can tell how old it is.
        if (!written || (!written->hasStamp && !entries.contains(written->entry)))
            continue;
        if (!written->hasStamp) {
            QVERIFY2((isBelow && written->entry == entry) || !life.hasWholeEntries(),
                     "the lines of an entry are torn apart");
            continue;
        }
        entry = number;
        if (number < last[written->run]) {
            QVERIFY2(life.wentBack(written->run), "the lines of a run are not in their order");
            isGuessedWrongly = true;
        }
        last[written->run] = number;
        if (life.isClear())
            QVERIFY2(number > newest, "an older line comes after a newer one");
        newest = number;
    }
    m_clearViews += life.isClear();
    m_guesses += isGuessedWrongly;
}

// Of those runs whose times did not go back: their entries' times are known even without dates.
void tst_HistoryLives::compareTimes(ProgramLife const& life, LogHistory const& history)
{
    HistoryCursor cursor(history, true);
    qint64 difference = -1;
    while (cursor.Next()) {
        ProgramLife::Line const* written = life.written(cursor.content());
        const bool isNewest = written && written->run == life.runs() - 1;
        if (!written || !written->hasStamp || !life.isClear() || !(life.isDated() || isNewest))
            continue;
        if (difference < 0)
            difference = written->time - cursor.time(); // the days are counted from another one
        QCOMPARE(written->time - cursor.time(), difference);
        ++m_times;
    }
}

void tst_HistoryLives::compareMerged(std::vector<std::unique_ptr<ProgramLife>> const& lives,
                                     std::vector<LogHistory> const& histories,
                                     QList<QList<QByteArray>> const& alone)
{
    std::vector<HistoryCursor> cursors;
    bool isClear = true;
    for (size_t i = 0; i < lives.size(); ++i) {
        cursors.emplace_back(histories[i], true);
        isClear = isClear && lives[i]->isClear();
    }
    QList<QList<QByteArray>> parts;
    for (size_t i = 0; i < lives.size(); ++i)
        parts.append(QList<QByteArray>());
    HistoryMerge merge(std::move(cursors));
    qint64 lastKey = -1;
    qint64 lastTime = 0;
    size_t lastLog = 0;
    while (merge.Next()) {
        QVERIFY2(merge.cursor().key() >= lastKey, "the order is not that of the keys");
        lastKey = merge.cursor().key();
        parts[static_cast<int>(merge.log())].append(
            QByteArray(merge.cursor().content().constData(), merge.cursor().content().size()));
        ProgramLife::Line const* written = lives[merge.log()]->written(merge.cursor().content());
        if (!written || !isClear || !written->hasStamp)
            continue;
        QVERIFY2(written->time >= lastTime, "an earlier line comes after a later one");
        QVERIFY2(written->time > lastTime || merge.log() >= lastLog,
                 "logs with the same time are not in their order");
        lastTime = written->time;
        lastLog = merge.log();
    }
    QCOMPARE(parts, alone);
    m_clearMerges += isClear;
}

// The rows of all of a log, first with a filter and then of all lines, as they are read for a view.
void tst_HistoryLives::compareInWindow(ProgramLife const& life, LogLineParser const& parser,
                                       LogHistory const& history)
{
    HistoryScanner scanner;
    HistoryUpdate update;
    connect(&scanner, &HistoryScanner::updated, &scanner,
            [&update](HistoryUpdate const& now) { update = now; });
    const auto shown = [&] {
        QList<QByteArray> lines;
        LogLineReader reader;
        reader.Open({life.path(), update.older}, update.type);
        for (size_t row = 0; row < update.rows->size(); ++row) {
            if (update.rows->isHeading(row))
                continue;
            const QByteArray line = reader.Line(update.rows->start(row));
            lines.append(QByteArray(line.constData(), line.size()));
        }
        return lines;
    };
    const auto expected = [&](LogFilter const& filter) {
        LogHistory filtered(parser, filter);
        filtered.ReadLog(life.path());
        QList<QByteArray> lines;
        HistoryCursor cursor(filtered, false);
        while (cursor.Next())
            lines.append(QByteArray(cursor.content().constData(), cursor.content().size()));
        return lines;
    };
    const auto compare = [&](LogFilter const& filter) {
        QCOMPARE(shown(), expected(filter));
        QCOMPARE(update.runs->size(), history.runs().size());
        m_rows += update.rows->size();
    };
    LogFilter filter;
    filter.SetText(QStringLiteral("7"), false, false);
    scanner.Open(0, life.path(), parser, filter, true);
    compare(filter);
    scanner.SetFilter(0, LogFilter());
    compare(LogFilter());
    LogFilter few;
    few.SetSeverity(LogEntry::Trace, false);
    scanner.SetFilter(0, few);
    compare(few);
    for (char const* text : {"Warning", "m"}) {
        filter.SetText(QString::fromLatin1(text), false, false);
        filter.SetContext(filter.context() + 1);
        scanner.SetFilter(0, filter);
        compare(filter);
    }
}

void tst_HistoryLives::look(std::vector<std::unique_ptr<ProgramLife>>& lives)
{
    std::vector<LogHistory> histories;
    QList<QList<QByteArray>> alone;
    for (std::unique_ptr<ProgramLife>& life : lives) {
        life->save();
        LogLineParser parser(life->formats(), {});
        parser.SetOwn(true); // a torn line may look like another program's
        histories.emplace_back(parser);
        QVERIFY(histories.back().ReadLog(life->path()));
        QList<QByteArray> shown;
        HistoryCursor cursor(histories.back(), false);
        while (cursor.Next())
            shown.append(QByteArray(cursor.content().constData(), cursor.content().size()));
        alone.append(shown);
        compareLines(*life, shown);
        compareOrder(*life, shown);
        compareTimes(*life, histories.back());
        compareInWindow(*life, parser, histories.back());
        if (QTest::currentTestFailed())
            return;
    }
    compareMerged(lives, histories, alone);
}

void tst_HistoryLives::live(quint32 seed)
{
    std::mt19937 random(seed);
    // Some lives begin shortly before the clocks change.
    static const QVector<QDateTime> starts = {
        QDateTime(QDate(2025, 3, 3), QTime(9, 0)), QDateTime(QDate(2025, 10, 26), QTime(0, 30)),
        QDateTime(QDate(2025, 3, 30), QTime(0, 30)), QDateTime(QDate(2024, 12, 31), QTime(22, 0))};
    const qint64 start =
        starts[static_cast<int>(random() % 4)].toMSecsSinceEpoch() + random() % 3600000;
    std::vector<std::unique_ptr<ProgramLife>> lives;
    const size_t count = 1 + random() % 3;
    for (size_t i = 0; i < count; ++i) {
        const QString name = "program" + QString::number(i) + ".log";
        lives.push_back(
            std::make_unique<ProgramLife>(m_folder.filePath(name), int(i), start, random()));
    }
    for (int step = 0; step < 40 && !QTest::currentTestFailed(); ++step) {
        lives[random() % count]->step();
        if (random() % 20 == 0)
            look(lives);
    }
    if (!QTest::currentTestFailed())
        look(lives);
    for (QString const& name : QDir(m_folder.path()).entryList(QDir::Files))
        QFile::remove(m_folder.filePath(name));
    ++m_lives;
}

void tst_HistoryLives::randomLives()
{
    const int count = Rounds::count(300, 10000, 100000);
    if (!Rounds::each("life", count, [this](quint32 seed) { live(seed); }))
        return;
    QVERIFY(m_lines > 20 * count);
    QVERIFY2(m_clearViews > m_views / 10, "the order can hardly ever be checked");
    QVERIFY2(m_clearMerges > count / 20, "the order by time can hardly ever be checked");
    QVERIFY2(m_guesses < m_views / 10, "a clock that is set back is taken for a restart too often");
}

void tst_HistoryLives::cleanupTestCase()
{
    std::printf(
        "plain history: %d lives, %d views of a log with %lld lines, %d with a clear order, "
        "%d in which a clock that was set back was taken for a restart, %d merges of logs "
        "with a clear order, %lld times, %llu rows in the window\n",
        m_lives, m_views, static_cast<long long>(m_lines), m_clearViews, m_guesses, m_clearMerges,
        static_cast<long long>(m_times), static_cast<unsigned long long>(m_rows));
    std::fflush(stdout);
}

QTEST_GUILESS_MAIN(tst_HistoryLives)
#include "tst_HistoryLives.moc"
