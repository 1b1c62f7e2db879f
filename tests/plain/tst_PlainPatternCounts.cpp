// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Compares the message patterns that the window lists of random logs, filtered and not, of one file
// and of all, with what velocor-log prints of the same files.

#include "app/ProgramRuns.h"
#include "app/history/HistoryTime.h"
#include "app/logfile/LogSeverities.h"
#include "app/window/log/LogModel.h"
#include "app/window/log/PatternCounter.h"

#include "ProgramLife.h"
#include "Rounds.h"

#include <QJsonDocument>
#include <QJsonObject>
#include <QTemporaryDir>
#include <QtTest>

#include <memory>

using namespace Velocor;

namespace {

constexpr int Patience = 60000; // milliseconds

QString Listed(qint64 count, QString const& severity, QString const& first, QString const& last,
               QString const& pattern)
{
    return QStringList({QString::number(count), severity, first, last, pattern}).join('|');
}

// Patterns that are equally frequent may be in another order.
QStringList Sorted(QStringList list)
{
    list.sort();
    return list;
}

} // namespace

class tst_PlainPatternCounts : public QObject
{
    Q_OBJECT

private slots:
    void randomLogs();
    void cleanupTestCase();

private:
    void compare(QStringList const& files, QString const& format, QString const& match);
    CountedPatterns counted(QStringList const& files, QString const& format, QString const& match);

    QTemporaryDir m_folder{QFileInfo("/dev/shm").isWritable()
                               ? "/dev/shm/tst_PlainPatternCounts-XXXXXX"
                               : "tst_PlainPatternCounts-XXXXXX"};
    int m_lists = 0;
    int m_dated = 0;
    size_t m_patterns = 0;
    size_t m_entries = 0;
};

CountedPatterns tst_PlainPatternCounts::counted(QStringList const& files, QString const& format,
                                                QString const& match)
{
    LogModel model;
    LogFilter filter;
    filter.SetText(match, true, true);
    model.SetFilter(filter);
    model.Open(files.first(), LogLineParser({format}, {}), false, files.size() > 1);
    [&] {
        QTRY_VERIFY_WITH_TIMEOUT(!model.isReading(), Patience);
    }();
    PatternCounter counter(model.source(), model.parser(), model.state().rows);
    CountedPatterns result;
    connect(&counter, &PatternCounter::counted, this,
            [&](std::shared_ptr<CountedPatterns const> const& last) { result = *last; });
    counter.Count();
    return result;
}

void tst_PlainPatternCounts::compare(QStringList const& files, QString const& format,
                                     QString const& match)
{
    const CountedPatterns window = counted(files, format, match);
    QVERIFY(window.isComplete);
    // With a filter, an entry without a time has that of the row above, not of the line.
    const bool hasTimes = window.isDated && match.isEmpty();
    const auto text = [&](qint64 time) {
        return hasTimes && time >= 0 ? QString::fromLatin1(HistoryTime::Text(time)) : QString();
    };
    QStringList viewed;
    for (PatternList::Pattern const& pattern : window.patterns) {
        viewed.append(Listed(static_cast<qint64>(pattern.count),
                             LogSeverities::LoggedName(pattern.severity), text(pattern.first),
                             text(pattern.last), pattern.text));
        m_entries += pattern.count;
    }

    QStringList arguments = files + QStringList({"--patterns", "--format", "json"});
    if (!match.isEmpty())
        arguments << "--match" << match;
    const ProgramResult result =
        RunProgram(VELOCOR_LOG, arguments, PrivateEnvironment(m_folder.path()));
    QStringList printed;
    const QList<QByteArray> lines = result.output.split('\n');
    for (QByteArray const& line : lines) {
        const QJsonObject row = QJsonDocument::fromJson(line).object();
        if (!line.isEmpty())
            printed.append(Listed(row["count"].toInt(), row["severity"].toString(),
                                  hasTimes ? row["first"].toString() : QString(),
                                  hasTimes ? row["last"].toString() : QString(),
                                  row["pattern"].toString()));
    }
    QCOMPARE(Sorted(viewed), Sorted(printed));
    QCOMPARE(result.errors, QByteArray());
    ++m_lists;
    m_dated += hasTimes;
    m_patterns += window.patterns.size();
}

void tst_PlainPatternCounts::randomLogs()
{
    static const QStringList matches = {QString(), QString(), "L[0-9]*5",
                                        "mmm|cc",  "nowhere", "Error"};
    std::mt19937 random(Rounds::seed());
    const int count = Rounds::count(30, 1000, 10000);
    while (m_lists < count) {
        const quint32 seed = random();
        const QString path = m_folder.filePath("program.log");
        ProgramLife life(path, 0, 1741000000000 + seed % 100000000, seed + 1);
        for (quint32 step = seed % 40 + 1; step > 0; --step)
            life.step();
        life.save();
        QFile settings(m_folder.filePath("logsettings.cfg"));
        QVERIFY(settings.open(QIODevice::WriteOnly));
        settings.write("<LogSettings><config><dateTimeFormat>" + life.formats()[0].toLatin1() +
                       "</dateTimeFormat></config></LogSettings>\n");
        settings.close();
        QStringList files; // the current one first
        for (QString const& name :
             QDir(m_folder.path()).entryList({"program.log*"}, QDir::Files, QDir::Name))
            files.append(m_folder.filePath(name));
        const QString match = matches[static_cast<int>(random() % quint32(matches.size()))];
        compare(files.mid(0, 1), life.formats()[0], match);
        if (!QTest::currentTestFailed())
            compare(files, life.formats()[0], match);
        if (QTest::currentTestFailed()) {
            qWarning("list %d, of seed %u, match \"%s\"", m_lists, seed, qPrintable(match));
            return;
        }
        for (QString const& file : files)
            QFile::remove(file);
    }
    QVERIFY(m_dated > 0);
    QVERIFY(m_entries > size_t(count));
}

void tst_PlainPatternCounts::cleanupTestCase()
{
    std::printf("plain pattern counts: %d lists, %d with dates, %zu patterns, %zu entries\n",
                m_lists, m_dated, m_patterns, m_entries);
    std::fflush(stdout);
}

QTEST_MAIN(tst_PlainPatternCounts)
#include "tst_PlainPatternCounts.moc"
