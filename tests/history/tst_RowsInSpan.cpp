// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Compares what the log view shows of random logs and spans of time, while they grow, are written
// over and rotate, with what velocor-log prints: the lines of a cursor whose time is in the span.

#include "app/history/HistoryCursor.h"
#include "app/history/HistoryScanner.h"
#include "app/history/HistoryTime.h"
#include "app/logfile/LogLineReader.h"
#include "app/logfile/Milliseconds.h"
#include "support/TestFiles.h"

#include <QTemporaryDir>
#include <QtTest>

#include <random>

using namespace Velocor;

namespace {

class Generator
{
public:
    explicit Generator(quint32 seed) : m_random(seed), m_isDated(!chance(4))
    {
        // Without a date, entries are as old as their file.
        m_start = m_isDated ? HistoryTime::FromText("2025-03-03T20:00")
                            : HistoryTime::Now() - Milliseconds::Day;
        m_time = m_start;
    }

    int below(int limit) { return static_cast<int>(m_random() % static_cast<unsigned>(limit)); }
    bool chance(int oneIn) { return below(oneIn) == 0; }

    // Lines with and without stamps; the clock steps back now and then.
    QByteArray lines()
    {
        QByteArray text;
        for (int line = below(12); line >= 0; --line) {
            m_time += chance(12) ? -below(3600000) : below(chance(10) ? 30000000 : 60000);
            QByteArray stamp = HistoryTime::Text(m_time);
            stamp = m_isDated ? stamp.replace('T', ' ') : stamp.mid(11);
            const QByteArray severity = chance(3) ? " Error " : " Trace ";
            if (!chance(3))
                text += stamp + severity;
            text += "L" + QByteArray::number(m_number++) + '\n';
        }
        return text;
    }

    LogSpan span()
    {
        const qint64 start = m_start - 3600000;
        const qint64 length = m_time - start + 3600000;
        const auto some = [&] {
            return chance(4) ? -1 : start + static_cast<qint64>(m_random()) % length;
        };
        const qint64 since = some();
        return {since, some()};
    }

private:
    std::mt19937 m_random;
    bool m_isDated;
    qint64 m_start = 0;
    qint64 m_time = 0;
    int m_number = 0;
};

QByteArrayList Shown(QString const& path, HistoryUpdate const& update)
{
    QByteArrayList lines;
    LogLineReader reader;
    reader.Open({path, update.older}, update.type);
    for (size_t row = 0; row < update.rows->size(); ++row) {
        if (!update.rows->isHeading(row)) {
            const QByteArray line = reader.Line(update.rows->start(row));
            lines.append(QByteArray(line.constData(), line.size()));
        }
    }
    return lines;
}

QByteArrayList Printed(QString const& path, LogFilter const& filter, bool isAll)
{
    LogHistory history{LogLineParser(), filter};
    if (isAll)
        history.ReadLog(path);
    else
        history.ReadFiles({path});
    QByteArrayList lines;
    HistoryCursor cursor(history, true);
    while (cursor.Next()) {
        if (filter.span().Contains(cursor.time()))
            lines.append(QByteArray(cursor.content().constData(), cursor.content().size()));
    }
    return lines;
}

// Writes over the log, rotates it, or appends to it.
bool Change(QString const& path, int change, QByteArray const& lines)
{
    if (change == 0)
        return TestFiles::writeOver(path, lines);
    if (change == 1) {
        QFile::remove(path + ".1");
        return QFile::rename(path, path + ".1") && TestFiles::write(path, lines);
    }
    QFile file(path);
    return file.open(QIODevice::Append) && file.write(lines) == lines.size();
}

} // namespace

class tst_RowsInSpan : public QObject
{
    Q_OBJECT

private slots:
    void sameAsPrinted_data();
    void sameAsPrinted();
    void headings_data();
    void headings();
    void changes();
    void cleanupTestCase();

private:
    int m_logs = 0;
    int m_compared = 0;
};

void tst_RowsInSpan::sameAsPrinted_data()
{
    QTest::addColumn<int>("seed");

    for (int seed = 0; seed < 300; ++seed)
        QTest::addRow("%d", seed) << seed;
}

void tst_RowsInSpan::sameAsPrinted()
{
    QFETCH(int, seed);
    ++m_logs;
    const QTemporaryDir folder;
    const QString path = folder.path() + "/a.log";
    Generator generator(static_cast<quint32>(seed));
    QVERIFY(TestFiles::write(path, generator.lines() + generator.lines()));
    const bool isAll = generator.chance(2);
    LogFilter filter;
    if (generator.chance(2))
        filter.SetText("3", false, false);
    filter.SetSeverity(LogEntry::Trace, !generator.chance(4));
    filter.SetContext(generator.below(3));
    filter.SetSpan(generator.span());

    LogFilter allTimes = filter;
    allTimes.SetSpan(LogSpan());

    HistoryUpdate update;
    HistoryUpdate all;
    HistoryScanner scanner;
    HistoryScanner scannerOfAll;
    connect(&scanner, &HistoryScanner::updated, this,
            [&](HistoryUpdate const& now) { update = now; });
    connect(&scannerOfAll, &HistoryScanner::updated, this,
            [&](HistoryUpdate const& now) { all = now; });
    scanner.Open(0, path, LogLineParser(), filter, isAll);
    scannerOfAll.Open(0, path, LogLineParser(), allTimes, isAll);
    for (int step = 0; step < 8; ++step) {
        // Who follows a log may know more about its runs than who reads it once.
        if (Shown(path, all) == Printed(path, allTimes, isAll)) {
            QCOMPARE(Shown(path, update), Printed(path, filter, isAll));
            ++m_compared;
        }
        const int change = generator.below(6);
        if (change == 2) {
            filter.SetSpan(generator.span());
            scanner.SetFilter(0, filter);
        } else {
            QVERIFY(Change(path, change, generator.lines()));
        }
        scanner.Poll();
        scannerOfAll.Poll();
    }
}

void tst_RowsInSpan::cleanupTestCase()
{
    // One log alone may be one that cannot be compared.
    QVERIFY2(m_logs < 100 || m_compared > 4 * m_logs, qPrintable(QString::number(m_compared)));
}

void tst_RowsInSpan::headings_data()
{
    QTest::addColumn<QString>("since");
    QTest::addColumn<QString>("until");
    QTest::addColumn<QByteArray>("headings");

    QTest::newRow("all") << ""
                         << "" << QByteArray("|o|n");
    QTest::newRow("only the earlier run") << ""
                                          << "2025-03-03 09:00" << QByteArray("|o|");
    QTest::newRow("only the newest run") << "2025-03-03 09:00"
                                         << "" << QByteArray("n");
    QTest::newRow("neither") << "2025-03-05"
                             << "" << QByteArray();
}

// One file in which the newest run has left something of another.
void tst_RowsInSpan::headings()
{
    QFETCH(QString, since);
    QFETCH(QString, until);
    QFETCH(QByteArray, headings);
    const QTemporaryDir folder;
    const QString path = folder.path() + "/a.log";
    QVERIFY(TestFiles::write(path, "2025-03-04 08:00:00.000 Trace n\n"
                                   "rn\n"
                                   "2025-03-03 08:00:00.000 Trace o\n"));
    LogFilter filter;
    filter.SetText("Trace", false, true);
    filter.SetSpan({HistoryTime::OfUser(since, 0), HistoryTime::OfUser(until, 0)});
    QByteArray shown;
    HistoryScanner scanner;
    connect(&scanner, &HistoryScanner::updated, this, [&](HistoryUpdate const& update) {
        shown.clear();
        LogLineReader reader;
        reader.Open(path, update.type);
        for (size_t row = 0; row < update.rows->size(); ++row) {
            if (update.rows->isHeading(row))
                shown += '|';
            else if (reader.Line(update.rows->start(row)).endsWith(" n"))
                shown += 'n';
            else if (reader.Line(update.rows->start(row)).endsWith(" o"))
                shown += 'o';
        }
    });
    scanner.Open(0, path, LogLineParser(), filter, false);
    QCOMPARE(shown, headings);
}

// Views that apply the changes have the rows of the update.
void tst_RowsInSpan::changes()
{
    const QTemporaryDir folder;
    const QString path = folder.path() + "/a.log";
    QVERIFY(TestFiles::write(path, "2025-03-03 08:00:00.000 Trace a\n"
                                   "2025-03-03 09:00:00.000 Trace b\n"));
    LogFilter filter;
    filter.SetSpan(
        {HistoryTime::OfUser("2025-03-03 08:30", 0), HistoryTime::OfUser("2025-03-03 10:00", 0)});
    QVector<HistoryUpdate> updates;
    HistoryScanner scanner;
    connect(&scanner, &HistoryScanner::updated, this,
            [&](HistoryUpdate const& update) { updates.append(update); });
    scanner.Open(0, path, LogLineParser(), filter, false);
    QCOMPARE(updates.last().rows->size(), size_t(1));
    QFile file(path);
    QVERIFY(file.open(QIODevice::Append));
    file.write("2025-03-03 09:30:00.000 Trace c\nmore\n2025-03-03 11:00:00.000 Trace d\n");
    file.close();
    scanner.Poll();
    QVERIFY(!updates.last().isReset);
    QCOMPARE(updates.last().changedTail, size_t(0));
    QCOMPARE(updates.last().rows->size(), size_t(3));
}

QTEST_MAIN(tst_RowsInSpan)
#include "tst_RowsInSpan.moc"
