// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Entries that repeat each other, as the window is told of them while it follows logs, compared
// with the patterns of all rows, one after the other: random lives, which write over their logs and
// rotate them, with filters, folded runs, and programs switched off and on.

#include "app/history/FamilyScanner.h"
#include "app/history/MessagePattern.h"
#include "app/logfile/LogLineReader.h"

#include "ProgramLife.h"
#include "Rounds.h"

#include <QTemporaryDir>
#include <QtTest>

#include <memory>

using namespace Velocor;

class tst_PlainRepeats : public QObject
{
    Q_OBJECT

private slots:
    void initTestCase();
    void randomLives();
    void cleanupTestCase();

private:
    void live(quint32 seed);
    void act(FamilyScanner& scanner, std::mt19937& random);
    void compare(HistoryUpdate const& update);
    std::vector<RepeatGroup> repeats(HistoryUpdate const& update) const;

    QTemporaryDir m_folder{QFileInfo("/dev/shm").isWritable() ? "/dev/shm/tst_PlainRepeats-XXXXXX"
                                                              : "tst_PlainRepeats-XXXXXX"};
    LogLineParser m_parser;
    std::vector<std::unique_ptr<ProgramLife>> m_lives;
    LogFilter m_filter;
    HistoryUpdate m_update;
    bool m_isFinding = true;
    qint64 m_groups = 0;
    qint64 m_changes = 0;
};

void tst_PlainRepeats::initTestCase()
{
    m_parser = LogLineParser({"yyyy-MM-dd hh:mm:ss.zzz", "hh:mm:ss.zzz"}, {});
    m_parser.SetOwn(true);
}

std::vector<RepeatGroup> tst_PlainRepeats::repeats(HistoryUpdate const& update) const
{
    LogRows const& rows = *update.rows;
    LogSource source(m_lives.front()->path(), update.older);
    source.logs = update.logs;
    LogLineReader reader;
    reader.Open(source, update.type);
    struct Entry
    {
        size_t first;
        QString pattern;
    };
    std::vector<Entry> entries;
    for (size_t row = 0; row < rows.size(); ++row) {
        const quint8 mark = rows.mark(row);
        const bool continues = (mark & LogRows::Continued) && !(mark & LogRows::Alone);
        QString pattern = QString::number(row); // repeats nothing
        if (!rows.isHeading(row)) {
            const QByteArray line = reader.Line(rows.start(row));
            const bool isThere = LogRows::CheckOf(line.data(), line.size()) == rows.check(row);
            if (isThere && !(mark & LogRows::Torn))
                pattern = MessagePattern::Of(m_parser.Parse(line).message);
        }
        if (continues && row > 0)
            entries.back().pattern += '\n' + pattern;
        else
            entries.push_back({row, QString("%1 %2 %3 ")
                                            .arg(rows.severity(row))
                                            .arg(rows.isContext(row))
                                            .arg(source.LogAt(rows.start(row))) +
                                        pattern});
    }
    std::vector<RepeatGroup> groups;
    for (size_t entry = 0; entry < entries.size();) {
        size_t next = entry + 1;
        while (next < entries.size() && entries[next].pattern == entries[entry].pattern)
            ++next;
        if (next > entry + 1)
            groups.push_back({entries[entry].first,
                              next < entries.size() ? entries[next].first : rows.size(),
                              next - entry});
        entry = next;
    }
    return groups;
}

void tst_PlainRepeats::compare(HistoryUpdate const& update)
{
    if (bool(update.repeats) != bool(m_update.repeats))
        QVERIFY(update.isReset);
    m_update = update;
    m_changes += !update.isReset;
    QVERIFY(update.isPartial || bool(update.repeats) == m_isFinding);
    if (!update.repeats)
        return;
    const std::vector<RepeatGroup> expected = repeats(update);
    QCOMPARE(update.repeats->size(), expected.size());
    for (size_t i = 0; i < expected.size(); ++i) {
        QCOMPARE(update.repeats->at(i).first, expected[i].first);
        QCOMPARE(update.repeats->at(i).end, expected[i].end);
        QCOMPARE(update.repeats->at(i).entries, expected[i].entries);
    }
    m_groups += static_cast<qint64>(expected.size());
}

void tst_PlainRepeats::act(FamilyScanner& scanner, std::mt19937& random)
{
    switch (random() % 10) {
    case 0:
        m_isFinding = !m_isFinding;
        scanner.SetFindsRepeats(m_isFinding);
        break;
    case 1:
        m_filter.SetText(random() % 2 ? "7" : QString(), false, false);
        m_filter.SetContext(int(random() % 3));
        m_filter.SetSeverity(LogEntry::Trace, random() % 2);
        m_filter.SetEarlierRuns(random() % 4);
        scanner.SetFilter(0, m_filter);
        break;
    case 2:
        if (m_update.runs && !m_update.runs->empty()) {
            RunHeading const& run = m_update.runs->at(random() % m_update.runs->size());
            scanner.SetFolded(run.id, !run.isFolded);
        } else {
            scanner.SetHidden(random() % 2 ? QSet<QString>() : QSet<QString>{m_lives[0]->path()});
        }
        break;
    default:
        break;
    }
}

void tst_PlainRepeats::live(quint32 seed)
{
    std::mt19937 random(seed);
    const qint64 start = QDateTime(QDate(2025, 3, 29), QTime(20, 0)).toMSecsSinceEpoch();
    const int kind = int(random() % 3);
    m_lives.clear();
    m_filter = LogFilter();
    m_filter.SetEarlierRuns(true);
    QList<ProgramLog> logs;
    for (size_t i = 0, count = kind < 2 ? 1 : 2; i < count; ++i) {
        const QString path = m_folder.filePath("program" + QString::number(i) + ".log");
        m_lives.push_back(std::make_unique<ProgramLife>(path, int(i), start, random()));
        m_lives.back()->setKinds(1 + int(random() % 3));
        m_lives.back()->save();
        logs.append({QString::number(i), path});
    }
    FamilyScanner scanner;
    connect(&scanner, &FamilyScanner::updated, &scanner, [&](HistoryUpdate const& update) {
        compare(update);
        scanner.NoteTaken();
    });
    m_update = HistoryUpdate();
    m_isFinding = true;
    scanner.SetFindsRepeats(true);
    if (kind < 2)
        scanner.Open(0, logs[0].path, m_parser, m_filter, kind == 1);
    else
        scanner.OpenFamily(0, logs, m_parser, m_filter, {});
    for (int step = 0; step < 30 && !QTest::currentTestFailed(); ++step) {
        for (size_t i = 0, count = random() % 3; i < count; ++i)
            m_lives[random() % m_lives.size()]->step();
        act(scanner, random);
        for (auto const& life : m_lives)
            life->save(step);
        scanner.Poll();
        for (int i = 0; i < 4; ++i) // for what has been put off
            QCoreApplication::processEvents();
    }
    for (QString const& name : QDir(m_folder.path()).entryList(QDir::Files))
        QFile::remove(m_folder.filePath(name));
}

void tst_PlainRepeats::randomLives()
{
    const int count = Rounds::count(100, 3000, 30000);
    if (!Rounds::each("life", count, [this](quint32 seed) { live(seed); }))
        return;
    QVERIFY(m_groups > 25 * count);
    QVERIFY(m_changes > 5 * count);
}

void tst_PlainRepeats::cleanupTestCase()
{
    std::printf("plain repeats: %lld groups, %lld updates that tell changes\n",
                static_cast<long long>(m_groups), static_cast<long long>(m_changes));
    std::fflush(stdout);
}

QTEST_GUILESS_MAIN(tst_PlainRepeats)
#include "tst_PlainRepeats.moc"
