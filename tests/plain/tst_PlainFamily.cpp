// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The logs of several programs as one, as the window follows them, compared with what
// HistoryMerge makes of the same files read at once: random lives, which write over their logs,
// rotate them and set clocks back, with filters, and with programs switched off and on.

#include "app/history/FamilyScanner.h"
#include "app/history/HistoryMerge.h"
#include "app/logfile/LogLineReader.h"

#include "ProgramLife.h"
#include "Rounds.h"

#include <QTemporaryDir>
#include <QtTest>

#include <memory>

using namespace Velocor;

namespace {

using Lines = QList<QByteArray>;

QByteArray Copy(QByteArray const& line)
{
    return QByteArray(line.constData(), line.size());
}

Lines Sorted(Lines lines)
{
    std::sort(lines.begin(), lines.end());
    return lines;
}

} // namespace

class tst_PlainFamily : public QObject
{
    Q_OBJECT

private slots:
    void initTestCase();
    void randomFamilies();
    void cleanupTestCase();

private:
    void live(quint32 seed);
    void note(HistoryUpdate const& update);
    void compare();
    Lines shown(HistoryUpdate const& update) const;
    Lines merged() const;
    bool hasOtherRuns(Lines const& found, Lines const& expected) const;
    bool mayHaveHiddenRuns() const;

    QTemporaryDir m_folder{QFileInfo("/dev/shm").isWritable() ? "/dev/shm/tst_PlainFamily-XXXXXX"
                                                              : "tst_PlainFamily-XXXXXX"};
    LogLineParser m_parser;
    std::vector<std::unique_ptr<ProgramLife>> m_lives;
    QSet<QString> m_hidden;
    LogFilter m_filter;
    HistoryUpdate m_update;
    Lines m_rows; // as a view has them, which is told only of changes
    qint64 m_merges = 0;
    qint64 m_lines = 0;
    qint64 m_changes = 0;
    qint64 m_guesses = 0;
};

void tst_PlainFamily::initTestCase()
{
    qputenv("TZ", "Europe/Berlin");
    ::tzset();
    m_parser = LogLineParser({"yyyy-MM-dd hh:mm:ss.zzz", "hh:mm:ss.zzz"}, {});
    m_parser.SetOwn(true); // a torn line may look like another program's
}

Lines tst_PlainFamily::shown(HistoryUpdate const& update) const
{
    Lines lines;
    LogSource source;
    source.logs = update.logs;
    LogLineReader reader;
    reader.Open(source, update.type);
    for (size_t row = 0; row < update.rows->size(); ++row)
        lines.append(Copy(reader.Line(update.rows->start(row))));
    return lines;
}

Lines tst_PlainFamily::merged() const
{
    std::vector<LogHistory> histories;
    for (auto const& life : m_lives) {
        if (!m_hidden.contains(life->path())) {
            histories.emplace_back(m_parser, m_filter);
            histories.back().ReadLog(life->path());
        }
    }
    std::vector<HistoryCursor> cursors;
    for (LogHistory const& history : histories)
        cursors.emplace_back(history, true);
    HistoryMerge merge(std::move(cursors));
    Lines lines;
    while (merge.Next())
        lines.append(Copy(merge.cursor().content()));
    return lines;
}

// Whether the runs of one of the logs, alone, are in another order: where runs begin in a file that
// is followed is seen better than in one that is read at once.
bool tst_PlainFamily::hasOtherRuns(Lines const& found, Lines const& expected) const
{
    const auto linesOf = [](Lines const& all, QByteArray const& program) {
        Lines lines;
        std::copy_if(all.begin(), all.end(), std::back_inserter(lines),
                     [&](QByteArray const& line) { return line.contains(program); });
        return lines;
    };
    for (size_t life = 0; life < m_lives.size(); ++life) {
        const QByteArray program = 'P' + QByteArray::number(int(life)) + " L";
        if (linesOf(found, program) != linesOf(expected, program))
            return true;
    }
    return false;
}

// Whether the filter may hide that runs of one of the logs are in another order.
bool tst_PlainFamily::mayHaveHiddenRuns() const
{
    const bool isFiltered = m_filter.hasText() || !m_filter.Shows(LogEntry::Trace);
    return isFiltered && std::any_of(m_lives.begin(), m_lives.end(),
                                     [](auto const& life) { return !life->isClear(); });
}

// Applies the change as the model of the window does.
void tst_PlainFamily::note(HistoryUpdate const& update)
{
    const Lines all = shown(update);
    const auto at = static_cast<int>(update.changeAt);
    if (update.isReset) {
        m_rows = all;
    } else {
        QVERIFY(m_rows.size() >= at + int(update.removed));
        for (size_t row = 0; row < update.removed; ++row)
            m_rows.removeAt(at);
        for (int row = 0; row < int(update.inserted); ++row)
            m_rows.insert(at + row, all.at(at + row));
        QVERIFY(m_rows.size() <= all.size());
        m_rows += all.mid(m_rows.size());
        ++m_changes;
    }
    m_update = update;
}

void tst_PlainFamily::compare()
{
    for (int i = 0; i < 4; ++i) // for what has been put off
        QCoreApplication::processEvents();
    const Lines expected = merged();
    const Lines found = shown(m_update);
    QCOMPARE(m_rows, found);
    if (!m_filter.hasText() && m_filter.Shows(LogEntry::Trace))
        QCOMPARE(Sorted(found), Sorted(expected));
    for (size_t row = 0; row < m_update.rows->size(); row += 7)
        QCOMPARE(m_update.rows->RowNear(m_update.rows->start(row)), int(row));
    ++m_merges;
    if (hasOtherRuns(found, expected) || (found != expected && mayHaveHiddenRuns())) {
        ++m_guesses;
        return;
    }
    QCOMPARE(found, expected);
    m_lines += expected.size();
}

void tst_PlainFamily::live(quint32 seed)
{
    std::mt19937 random(seed);
    const qint64 start =
        QDateTime(QDate(2025, 3, 29), QTime(20, 0)).toMSecsSinceEpoch() + random() % 36000000;
    m_lives.clear();
    m_hidden.clear();
    m_filter = LogFilter();
    m_filter.SetEarlierRuns(true);
    QList<ProgramLog> logs;
    for (size_t i = 0, count = 1 + random() % 4; i < count; ++i) {
        const QString path = m_folder.filePath("program" + QString::number(i) + ".log");
        m_lives.push_back(std::make_unique<ProgramLife>(path, int(i), start, random()));
        m_lives.back()->save();
        logs.append({QString::number(i), path});
    }
    FamilyScanner scanner;
    connect(&scanner, &FamilyScanner::updated, &scanner, [&](HistoryUpdate const& update) {
        note(update);
        scanner.NoteTaken();
    });
    scanner.OpenFamily(0, logs, m_parser, m_filter, m_hidden);
    for (int step = 0; step < 30 && !QTest::currentTestFailed(); ++step) {
        for (size_t i = 0, count = 1 + random() % 3; i < count; ++i)
            m_lives[random() % m_lives.size()]->step();
        const int action = int(random() % 6);
        if (action == 0) {
            m_hidden.clear();
            for (auto const& life : m_lives) {
                if (random() % 2)
                    m_hidden.insert(life->path());
            }
            scanner.SetHidden(m_hidden);
        } else if (action == 1) {
            m_filter.SetText(random() % 2 ? "7" : QString(), false, false);
            m_filter.SetContext(int(random() % 3));
            m_filter.SetSeverity(LogEntry::Trace, random() % 2);
            scanner.SetFilter(0, m_filter);
        }
        for (auto const& life : m_lives)
            life->save(step);
        scanner.Poll();
        compare();
    }
    for (QString const& name : QDir(m_folder.path()).entryList(QDir::Files))
        QFile::remove(m_folder.filePath(name));
}

void tst_PlainFamily::randomFamilies()
{
    const int count = Rounds::count(60, 2000, 20000);
    if (!Rounds::each("family", count, [this](quint32 seed) { live(seed); }))
        return;
    QVERIFY(m_lines > 100 * count);
    QVERIFY2(m_guesses < m_merges / 10, "the order can hardly ever be compared");
    QVERIFY2(m_changes > m_merges / 20, "hardly any change is told as such");
}

void tst_PlainFamily::cleanupTestCase()
{
    std::printf("plain family: %lld merges with %lld lines, %lld changes, %lld times runs were "
                "found in another order\n",
                static_cast<long long>(m_merges), static_cast<long long>(m_lines),
                static_cast<long long>(m_changes), static_cast<long long>(m_guesses));
    std::fflush(stdout);
}

QTEST_GUILESS_MAIN(tst_PlainFamily)
#include "tst_PlainFamily.moc"
