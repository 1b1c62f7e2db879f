// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/history/HistoryMerge.h"

#include "support/TestFiles.h"

#include <QTemporaryDir>
#include <QtTest>

#include <random>

using namespace Velocor;

class tst_HistoryMerge : public QObject
{
    Q_OBJECT

private slots:
    void byTime_data();
    void byTime();
    void anyLogs();
};

void tst_HistoryMerge::byTime_data()
{
    QTest::addColumn<QStringList>("logs"); // lines: seconds and a letter, or only a letter
    QTest::addColumn<QString>("merged");
    QTest::newRow("none") << QStringList() << "";
    QTest::newRow("one") << QStringList{"1a 3b 2c"} << "abc";
    QTest::newRow("alternating") << QStringList{"1a 3b 5c", "2d 4e 6f"} << "adbecf";
    QTest::newRow("the same time: in the order of the logs")
        << QStringList{"2a 2b", "1c 2d", "2e"} << "cabde";
    QTest::newRow("lines without a time stay with their entry")
        << QStringList{"1a b c 3d", "2e f"} << "abcefd";
    QTest::newRow("a clock that is set back does not reorder a log")
        << QStringList{"1a 5b 2c 3d 6e", "3f 4g 7h"} << "afgbcdeh";
    QTest::newRow("lines before the first time") << QStringList{"a 3b", "1c 2d"} << "cdab";
    QTest::newRow("an empty log") << QStringList{"", "1a"} << "a";
    QTest::newRow("many") << QStringList{"1a", "7b", "3c", "5d", "2e", "9f", "4g"} << "aecgdbf";
}

void tst_HistoryMerge::byTime()
{
    QFETCH(QStringList, logs);
    QFETCH(QString, merged);
    const QTemporaryDir folder;
    std::vector<LogHistory> histories(static_cast<size_t>(logs.size()));
    std::vector<HistoryCursor> cursors;
    for (int i = 0; i < logs.size(); ++i) {
        QByteArray text;
        for (QString const& line : logs[i].split(' '))
            text += line.isEmpty()     ? QByteArray()
                    : line.size() == 1 ? line.toLatin1() + '\n'
                                       : "2025-03-03 09:00:0" + line.left(1).toLatin1() +
                                             ".0 Trace " + line.right(1).toLatin1() + '\n';
        const QString path = folder.filePath(QString::number(i) + ".log");
        QVERIFY(TestFiles::write(path, text));
        QVERIFY(histories[static_cast<size_t>(i)].ReadLog(path));
        cursors.emplace_back(histories[static_cast<size_t>(i)], true);
    }
    HistoryMerge merge(std::move(cursors));
    QString found;
    while (merge.Next())
        found += QString::fromLatin1(merge.cursor().content().right(1));
    QCOMPARE(found, merged);
    QVERIFY(!merge.Next());
}

// Always the line that is next by its time, or the one of the first log of several.
void tst_HistoryMerge::anyLogs()
{
    std::mt19937 random(1);
    for (int round = 0; round < 60; ++round) {
        const QTemporaryDir folder;
        std::vector<std::vector<int>> seconds(1 + random() % 14);
        std::vector<LogHistory> histories(seconds.size());
        std::vector<HistoryCursor> cursors;
        for (size_t log = 0; log < seconds.size(); ++log) {
            QByteArray text;
            int second = int(random() % 20);
            for (int line = int(random() % 6); line > 0; --line) {
                text += "2025-03-03 09:00:" + QByteArray::number(10 + second) + ".0 Trace x\n";
                seconds[log].push_back(second);
                second += int(random() % 6);
            }
            const QString path = folder.filePath(QString::number(log) + ".log");
            QVERIFY(TestFiles::write(path, text));
            QVERIFY(histories[log].ReadLog(path));
            cursors.emplace_back(histories[log], true);
        }
        HistoryMerge merge(std::move(cursors));
        std::vector<size_t> next(seconds.size());
        while (merge.Next()) {
            size_t first = seconds.size();
            for (size_t log = seconds.size(); log-- > 0;) {
                if (next[log] < seconds[log].size() &&
                    (first == seconds.size() ||
                     seconds[log][next[log]] <= seconds[first][next[first]]))
                    first = log;
            }
            QCOMPARE(merge.log(), first);
            ++next[first];
        }
        for (size_t log = 0; log < seconds.size(); ++log)
            QCOMPARE(next[log], seconds[log].size());
    }
}

QTEST_GUILESS_MAIN(tst_HistoryMerge)
#include "tst_HistoryMerge.moc"
