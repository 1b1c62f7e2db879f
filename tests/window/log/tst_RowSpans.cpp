// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The times between the rows of real files.

#include "app/window/log/RowSpans.h"

#include "app/window/log/LogModel.h"
#include "support/DemoLog.h"
#include "support/TestFiles.h"

#include <QTemporaryDir>
#include <QtTest>

using namespace Velocor;

using DemoLog::entry;

namespace {

constexpr int Patience = 20000; // milliseconds

// In a date format without a date.
QByteArray Undated(char const* time)
{
    return QByteArray(time) + " Trace text\n";
}

} // namespace

class tst_RowSpans : public QObject
{
    Q_OBJECT

private slots:
    void init();
    void above_data();
    void above();
    void fromAnEntry();
    void fromALineThatContinues();
    void fromNoTime();
    void otherFile();
    void filtered();
    void farAbove();
    void gaps_data();
    void gaps();

private:
    void open(QByteArray const& content, QString const& name = "app.log");
    QStringList sinces();

    std::unique_ptr<QTemporaryDir> m_folder;
    std::unique_ptr<LogModel> m_model;
};

void tst_RowSpans::init()
{
    m_folder = std::make_unique<QTemporaryDir>();
    m_model = std::make_unique<LogModel>();
}

void tst_RowSpans::open(QByteArray const& content, QString const& name)
{
    QVERIFY(TestFiles::write(m_folder->filePath(name), content));
    QSignalSpy refreshed(m_model.get(), &LogModel::refreshed);
    m_model->Open(m_folder->filePath(name), LogLineParser({"hh:mm:ss.z"}, {}), true);
    QTRY_VERIFY_WITH_TIMEOUT(refreshed.count() > 0 && !m_model->isReading(), Patience);
}

QStringList tst_RowSpans::sinces()
{
    QStringList texts;
    for (int row = 0; row < m_model->rowCount(); ++row)
        texts.append(m_model->index(row, LogModel::SinceColumn).data().toString());
    return texts;
}

void tst_RowSpans::above_data()
{
    QTest::addColumn<QByteArray>("log");
    QTest::addColumn<QStringList>("since");

    QTest::newRow("each since the one above")
        << entry("09:00:00.000", "Trace", "a") + entry("09:00:00.250", "Trace", "b") +
               entry("09:00:02.000", "Trace", "c")
        << QStringList({"", "250 ms", "1.750 s"});
    QTest::newRow("lines that continue an entry have none")
        << entry("09:00:00.000", "Trace", "a") + "more\n" + entry("09:00:01.000", "Trace", "b")
        << QStringList({"", "", "1 s"});
    QTest::newRow("threads that overtake each other")
        << entry("09:00:00.010", "Trace", "a") + entry("09:00:00.005", "Trace", "b")
        << QStringList({"", "-5 ms"});
    QTest::newRow("over midnight")
        << entry("23:59:59.000", "Trace", "a", true) + entry("00:00:01.000", "Trace", "b")
        << QStringList({"", "2 s"});
    QTest::newRow("over midnight without dates")
        << Undated("23:59:59.000") + Undated("00:00:01.000") << QStringList({"", "2 s"});
    QTest::newRow("a clock set back over midnight without dates")
        << Undated("00:00:01.000") + Undated("23:59:59.000") << QStringList({"", "-2 s"});
    QTest::newRow("a run after another, which are apart")
        << DemoLog::writtenOver(entry("09:00:00.000", "Trace", "old", true) +
                                    entry("09:00:02.000", "Trace", "long old one", true) +
                                    entry("09:00:03.000", "Trace", "old", true),
                                entry("09:00:00.000", "Trace", "new and longer"))
        << QStringList({"", "", "", "", ""});
}

void tst_RowSpans::above()
{
    QFETCH(QByteArray, log);
    QFETCH(QStringList, since);
    open(log);
    QCOMPARE(sinces(), since);
}

void tst_RowSpans::fromAnEntry()
{
    open(entry("09:00:00.000", "Trace", "a") + entry("09:00:01.000", "Trace", "b") +
         entry("09:01:01.500", "Trace", "c"));
    const auto header = [this](int role) {
        return m_model->headerData(LogModel::SinceColumn, Qt::Horizontal, role).toString();
    };
    const QString usual = header(Qt::DisplayRole);
    QVERIFY(m_model->spans().MeasureFrom(1));
    QCOMPARE(sinces(), QStringList({"-1 s", "0 ms", "1 min 00 s"}));
    QVERIFY(header(Qt::DisplayRole) != usual);
    QVERIFY(header(Qt::ToolTipRole).contains("2025-03-03 09:00:01.000"));
    m_model->spans().MeasureFromAbove();
    QCOMPARE(sinces(), QStringList({"", "1 s", "1 min 00 s"}));
    QCOMPARE(header(Qt::DisplayRole), usual);
}

void tst_RowSpans::fromALineThatContinues()
{
    open(entry("09:00:00.000", "Trace", "a") + "more\n" + entry("09:00:01.000", "Trace", "b"));
    QVERIFY(m_model->spans().MeasureFrom(1));
    QCOMPARE(sinces(), QStringList({"0 ms", "", "1 s"}));
}

void tst_RowSpans::fromNoTime()
{
    open("no time\n" + entry("09:00:00.000", "Trace", "a") + entry("09:00:01.000", "Trace", "b"));
    QVERIFY(m_model->spans().MeasureFrom(1));
    for (const int row : {0, -1, 3})
        QVERIFY(!m_model->spans().MeasureFrom(row));
    QCOMPARE(sinces(), QStringList({"", "0 ms", "1 s"}));
}

// The entry that was chosen is not in it.
void tst_RowSpans::otherFile()
{
    open(entry("09:00:00.000", "Trace", "a") + entry("09:00:01.000", "Trace", "b"));
    QVERIFY(m_model->spans().MeasureFrom(0));
    open(entry("10:00:00.000", "Trace", "a") + entry("10:00:02.000", "Trace", "b"), "other.log");
    QCOMPARE(sinces(), QStringList({"", "2 s"}));
}

// The entry above is the one that is shown; the one chosen need not be.
void tst_RowSpans::filtered()
{
    open(entry("09:00:00.000", "Trace", "a") + entry("09:00:01.000", "Error", "b") +
         entry("09:00:03.000", "Trace", "a"));
    QVERIFY(m_model->spans().MeasureFrom(1));
    LogFilter filter;
    filter.SetSeverity(LogEntry::Error, false);
    m_model->SetFilter(filter);
    QTRY_COMPARE_WITH_TIMEOUT(m_model->rowCount(), 2, Patience);
    QCOMPARE(sinces(), QStringList({"-1 s", "2 s"}));
    m_model->spans().MeasureFromAbove();
    QCOMPARE(sinces(), QStringList({"", "3 s"}));
}

void tst_RowSpans::farAbove()
{
    const auto log = [](int lines) {
        return entry("09:00:00.000", "Trace", "a") + QByteArray("more\n").repeated(lines) +
               entry("09:00:01.000", "Trace", "b");
    };
    open(log(RowSpans::MostAbove - 1));
    QCOMPARE(sinces().last(), QString("1 s"));
    open(log(RowSpans::MostAbove));
    QCOMPARE(sinces().last(), QString());
}

void tst_RowSpans::gaps_data()
{
    QTest::addColumn<qint64>("least");
    QTest::addColumn<QStringList>("gaps");

    QTest::newRow("none wanted") << qint64(0) << QStringList({"", "", "", ""});
    QTest::newRow("from a second on")
        << qint64(1000) << QStringList({"", "1 second", "59 seconds", ""});
    QTest::newRow("from just more on") << qint64(1001) << QStringList({"", "", "59 seconds", ""});
    QTest::newRow("all are shorter") << qint64(60000) << QStringList({"", "", "", ""});
}

void tst_RowSpans::gaps()
{
    QFETCH(qint64, least);
    QFETCH(QStringList, gaps);
    open(entry("09:00:00.000", "Trace", "a") + entry("09:00:01.000", "Trace", "b") +
         entry("09:01:00.000", "Trace", "c") + entry("09:00:00.000", "Trace", "clock set back"));
    m_model->spans().SetLeastGap(least);
    m_model->spans().MeasureFrom(0); // gaps remain those to the entry above
    for (int row = 0; row < gaps.size(); ++row) {
        const QModelIndex cell = m_model->index(row, LogModel::TimeColumn);
        QString const& gap = gaps.at(row);
        QCOMPARE(cell.data(LogModel::GapRole).toString(), gap);
        QCOMPARE(cell.data(Qt::AccessibleDescriptionRole).toString(),
                 gap.isEmpty() ? QString() : gap + " after the entry above");
    }
}

QTEST_MAIN(tst_RowSpans)
#include "tst_RowSpans.moc"
