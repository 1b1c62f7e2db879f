// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The model over real files that change while it is in use.

#include "app/window/log/LogModel.h"

#include "app/logfile/LogIndex.h"
#include "app/logfile/LogScanner.h"
#include "common/log/TorkLog.h"
#include "support/DemoLog.h"
#include "support/TestFiles.h"

#include <QTemporaryDir>
#include <QtTest>

using namespace Velocor;

using DemoLog::entry;
using DemoLog::run;
using DemoLog::writtenOver;

namespace {

constexpr int Patience = 20000; // milliseconds

QStringList Messages(LogModel const& model)
{
    QStringList messages;
    for (int row = 0; row < model.rowCount(); ++row) {
        const QModelIndex heading = model.index(row, LogModel::TimeColumn);
        const QModelIndex message = model.index(row, LogModel::MessageColumn);
        const bool isHeading = heading.data(LogModel::HeadingRole).toBool();
        messages.append((isHeading ? heading : message).data().toString());
    }
    return messages;
}

// None while the file is empty.
QString LastMessage(LogModel const& model)
{
    const QStringList messages = Messages(model);
    return messages.isEmpty() ? QString() : messages.last();
}

QStringList Numbered(char const* what, int first, int count)
{
    QStringList texts;
    for (int i = first; i < first + count; ++i)
        texts.append(QString("%1 %2").arg(what).arg(i));
    return texts;
}

// Writes a part of a file in place, as the log does.
bool WriteAt(QString const& path, qint64 offset, QByteArray const& bytes)
{
    QFile file(path);
    return file.open(QIODevice::ReadWrite) && file.seek(offset) &&
           file.write(bytes) == bytes.size();
}

// Tracks independently what the model announces, as a view does.
class RowCounter : public QObject
{
public:
    explicit RowCounter(LogModel& model) : rows(model.rowCount())
    {
        connect(&model, &LogModel::modelReset, this, [&] {
            rows = model.rowCount();
            ++resets;
        });
        connect(&model, &LogModel::rowsInserted, this,
                [&](QModelIndex const&, int first, int last) {
                    rows += last - first + 1;
                    right = right && rows == model.rowCount();
                });
        connect(&model, &LogModel::rowsRemoved, this, [&](QModelIndex const&, int first, int last) {
            rows -= last - first + 1;
            right = right && rows == model.rowCount();
        });
    }

    int rows;
    int resets = 0;
    bool right = true;
};

} // namespace

class tst_LogModel : public QObject
{
    Q_OBJECT

private slots:
    void init();
    void columns();
    void details();
    void headings();
    void nothingOpen();
    void grows();
    void newestRunWritesOverTheOlder();
    void clockSetBack();
    void clockSetBackOverOlderEntries();
    void hiddenLinesCount();
    void changes_data();
    void changes();
    void missingFile();
    void unreadableFile();
    void directory();
    void filter();
    void earlierRuns();
    void findProblem();
    void entries();
    void pause();
    void updateAfterThePause();
    void updateThatThePauseHeldBack();
    void overwritten_data();
    void overwritten();
    void rotatedWhilePaused();
    void heading_data();
    void heading();
    void longLines_data();
    void longLines();
    void controlCharacters();
    void withTheLogItself();
    void millionLines();

private:
    void open(LogModel& model, QByteArray const& content);

    std::unique_ptr<QTemporaryDir> m_folder;
    QString m_file;
};

void tst_LogModel::init()
{
    m_folder = std::make_unique<QTemporaryDir>();
    m_file = m_folder->filePath("app.log");
}

void tst_LogModel::open(LogModel& model, QByteArray const& content)
{
    QVERIFY(TestFiles::write(m_file, content));
    QSignalSpy refreshed(&model, &LogModel::refreshed);
    model.Open(m_file, LogLineParser(), true);
    QTRY_VERIFY_WITH_TIMEOUT(refreshed.count() > 0 && !model.isReading(), Patience);
}

void tst_LogModel::columns()
{
    LogModel model;
    open(model, "2025-03-03 09:02:11.031 Warning dT:[250] hello\nmore\n");
    QCOMPARE(model.columnCount(), 6);
    QCOMPARE(model.rowCount(), 2);
    QCOMPARE(model.index(0, 0).data().toString(), QString("2025-03-03 09:02:11.031"));
    QCOMPARE(model.index(0, 1).data().toString(), QString("Warning"));
    QCOMPARE(model.index(0, 2).data().toString(), QString("250 ms"));
    QCOMPARE(model.index(0, LogModel::MessageColumn).data().toString(), QString("hello"));
    QCOMPARE(model.LineText(0, LogIndex::LineLimit),
             QString("2025-03-03 09:02:11.031 Warning dT:[250] hello"));
    QCOMPARE(model.index(1, 0).data().toString(), QString());
    QCOMPARE(model.index(1, LogModel::MessageColumn).data().toString(), QString("more"));
    QVERIFY(model.state().hasElapsed);
    QVERIFY(!model.index(2, 0).data().isValid());
    QStringList titles;
    for (int column = 0; column < model.columnCount(); ++column)
        titles.append(model.headerData(column, Qt::Horizontal, Qt::DisplayRole).toString());
    QCOMPARE(titles, QStringList({"Time", "Severity", "Elapsed", "Since", "Program", "Message"}));
}

void tst_LogModel::details()
{
    LogModel model;
    open(model, "2025-03-03 09:02:11.031 Warning dT:[250] a < b\nmore\n");
    const auto of = [&](int row, int column, int role) {
        return model.index(row, column).data(role);
    };

    QCOMPARE(of(0, LogModel::MessageColumn, Qt::ToolTipRole).toString(), QString("a < b"));
    QCOMPARE(of(0, LogModel::TimeColumn, Qt::ToolTipRole).toString(), QString());
    QVERIFY(!of(0, LogModel::SeverityColumn, Qt::DecorationRole).value<QIcon>().isNull());
    QVERIFY(!of(1, LogModel::SeverityColumn, Qt::DecorationRole).isValid());
    QVERIFY(!of(0, LogModel::MessageColumn, Qt::DecorationRole).isValid());
    QCOMPARE(of(0, LogModel::SeverityColumn, LogModel::SeverityRole).toInt(),
             int(LogEntry::Warning));
    QCOMPARE(of(0, LogModel::ElapsedColumn, Qt::TextAlignmentRole).toInt(),
             int(Qt::AlignRight | Qt::AlignVCenter));
    QCOMPARE(of(0, LogModel::TimeColumn, Qt::TextAlignmentRole).toInt(),
             int(Qt::AlignLeft | Qt::AlignVCenter));
    QVERIFY(!of(0, LogModel::EarlierRole, LogModel::EarlierRole).toBool());
    QVERIFY(!of(0, LogModel::TimeColumn, Qt::FontRole).isValid());

    QVERIFY(model.flags(model.index(0, 0)) & Qt::ItemIsSelectable);
    QCOMPARE(model.flags(QModelIndex()), Qt::ItemFlags(Qt::NoItemFlags));
    QCOMPARE(model.rowCount(model.index(0, 0)), 0);
    QCOMPARE(model.columnCount(model.index(0, 0)), 0);
    QCOMPARE(model.LineText(-1, 100), QString());
    QCOMPARE(model.LineText(2, 100), QString());
    QCOMPARE(model.LineText(1, 2), QString("mo"));

    QStringList titles;
    for (int column = 0; column < model.columnCount(); ++column)
        titles.append(model.headerData(column, Qt::Horizontal, Qt::DisplayRole).toString());
    QCOMPARE(titles, QStringList({"Time", "Severity", "Elapsed", "Since", "Program", "Message"}));
    QVERIFY(!model.headerData(0, Qt::Vertical, Qt::DisplayRole).isValid());
    QVERIFY(!model.headerData(0, Qt::Horizontal, Qt::FontRole).isValid());
}

// What an earlier run left is under a heading, which is not a line of the file.
void tst_LogModel::headings()
{
    const QByteArray older = run(8, QTime(17, 0), "older", true);
    const QByteArray newer = run(3, QTime(9, 0), "new"); // ends in the middle of an older entry
    LogModel model;
    open(model, writtenOver(older, newer));

    const QModelIndex heading = model.index(0, LogModel::TimeColumn);
    QVERIFY(heading.data(LogModel::HeadingRole).toBool());
    QCOMPARE(heading.data().toString(), QString("Earlier"));
    QVERIFY(heading.data(LogModel::EarlierRole).toBool());
    QCOMPARE(heading.data(Qt::ToolTipRole).toString(), QString());
    QVERIFY(!(model.flags(heading) & Qt::ItemIsSelectable));
    QCOMPARE(model.index(0, LogModel::MessageColumn).data().toString(), QString());
    QCOMPARE(model.LineText(0, 100), QString());

    const QModelIndex torn = model.index(1, LogModel::MessageColumn);
    QCOMPARE(torn.data(Qt::ToolTipRole).toString(),
             QString("Remainder of an entry that a later run overwrote"));
    QVERIFY(!torn.sibling(1, LogModel::SeverityColumn).data(Qt::DecorationRole).isValid());
}

void tst_LogModel::nothingOpen()
{
    LogModel model;
    model.Reload();
    model.SetPaused(true);
    model.SetPaused(false);
    model.SetFilter(LogFilter());
    QCOMPARE(model.rowCount(), 0);
    QVERIFY(!model.isReading());
    QCOMPARE(model.LineText(0, 100), QString());
}

void tst_LogModel::grows()
{
    LogModel model;
    open(model, run(3, QTime(9, 0), "x"));
    RowCounter counter(model);
    const QByteArray whole = run(6, QTime(9, 0), "x");
    QVERIFY(TestFiles::writeOver(m_file, whole.left(whole.size() - 10)));
    QTRY_COMPARE_WITH_TIMEOUT(model.rowCount(), 6, Patience);
    QVERIFY(TestFiles::writeOver(m_file, whole));
    QTRY_COMPARE_WITH_TIMEOUT(Messages(model), Numbered("x", 0, 6), Patience);
    QVERIFY(counter.right);
    QCOMPARE(counter.resets, 0);
}

// The size of the file stays the same throughout.
void tst_LogModel::newestRunWritesOverTheOlder()
{
    LogModel model;
    const QByteArray older = run(20, QTime(17, 0), "x", true);
    const QByteArray newer = run(10, QTime(9, 0), "n");
    const int half = newer.indexOf("n 5") + 4;
    open(model, writtenOver(older, newer.left(half)));
    QStringList messages = Messages(model);
    QCOMPARE(messages.mid(messages.indexOf("This run") + 1), Numbered("n", 0, 6));
    RowCounter counter(model);

    QVERIFY(WriteAt(m_file, half, newer.mid(half)));
    QTRY_COMPARE_WITH_TIMEOUT((messages = Messages(model)).mid(messages.indexOf("This run") + 1),
                              QStringList(Numbered("n", 0, 10)), Patience);
    QCOMPARE(messages.first(), QString("Earlier"));
    QCOMPARE(messages.at(messages.indexOf("This run") - 1), QString("x 19"));
    QCOMPARE(counter.resets, 0);
    QVERIFY(counter.right);
}

// By an hour, as at the end of daylight saving time.
void tst_LogModel::clockSetBack()
{
    LogModel model;
    QByteArray log = run(3, QTime(9, 0), "x") + run(2, QTime(8, 0), "y");
    open(model, log);
    QCOMPARE(model.rowCount(), 5); // without headings
    RowCounter counter(model);
    log += run(3, QTime(8, 0), "y").mid(run(2, QTime(8, 0), "y").size());
    QVERIFY(TestFiles::writeOver(m_file, log));
    QTRY_COMPARE_WITH_TIMEOUT(Messages(model),
                              QStringList(Numbered("x", 0, 3) + Numbered("y", 0, 3)), Patience);
    QVERIFY(counter.right);
    QCOMPARE(counter.resets, 0);
}

// The size of the file and the newest run stay the same.
void tst_LogModel::clockSetBackOverOlderEntries()
{
    LogModel model;
    const QByteArray older = run(6, QTime(17, 0), "x", true);
    const QByteArray start = run(2, QTime(9, 0), "n");
    const QByteArray back = run(3, QTime(8, 0), "n");
    const int first = back.indexOf('\n') + 1;
    open(model, writtenOver(older, start + back.left(first)));
    QVERIFY(WriteAt(m_file, start.size() + first, back.mid(first)));
    QTRY_COMPARE_WITH_TIMEOUT(Messages(model),
                              QStringList({"Earlier", "x 5", "This run"}) + Numbered("n", 0, 2) +
                                  Numbered("n", 0, 3),
                              Patience);
}

void tst_LogModel::hiddenLinesCount()
{
    LogModel model;
    open(model, run(3, QTime(9, 0), "x"));
    LogFilter filter;
    filter.SetText("nowhere", false, false);
    model.SetFilter(filter);
    QTRY_COMPARE_WITH_TIMEOUT(model.rowCount(), 0, Patience);
    QVERIFY(TestFiles::writeOver(m_file, run(5, QTime(9, 0), "x")));
    QTRY_COMPARE_WITH_TIMEOUT(model.state().lines, size_t(5), Patience);
    QCOMPARE(model.rowCount(), 0);
}

void tst_LogModel::changes_data()
{
    QTest::addColumn<QByteArray>("after");
    QTest::addColumn<QStringList>("messages");

    QTest::newRow("cut to nothing") << QByteArray("") << QStringList();
    QTest::newRow("cut short") << run(2, QTime(9, 0), "x") << Numbered("x", 0, 2);
    QTest::newRow("another file of the same size")
        << run(5, QTime(10, 0), "y") << Numbered("y", 0, 5);
    QTest::newRow("a longer file that begins otherwise")
        << run(9, QTime(10, 0), "y") << Numbered("y", 0, 9);
    QTest::newRow("the same beginning, other lines later")
        << QByteArray(run(1, QTime(9, 0), "x") + run(4, QTime(10, 0), "y"))
        << QStringList("x 0") + Numbered("y", 0, 4);
}

// A file that replaces the one that was shown, by a change in place or by a rename.
void tst_LogModel::changes()
{
    QFETCH(QByteArray, after);
    QFETCH(QStringList, messages);
    for (bool byRename : {false, true}) {
        LogModel model;
        open(model, run(5, QTime(9, 0), "x"));
        if (byRename) {
            QVERIFY(TestFiles::write(m_file + ".new", after));
            QVERIFY(QFile::rename(m_file, m_file + ".1"));
            QVERIFY(QFile::rename(m_file + ".new", m_file));
        } else {
            QVERIFY(TestFiles::write(m_file, after));
        }
        QTRY_COMPARE_WITH_TIMEOUT(Messages(model), messages, Patience);
        QFile::remove(m_file + ".1");
    }
}

void tst_LogModel::missingFile()
{
    LogModel model;
    QSignalSpy refreshed(&model, &LogModel::refreshed);
    model.Open(m_file, LogLineParser(), true);
    QTRY_VERIFY_WITH_TIMEOUT(refreshed.count() > 0, Patience);
    QVERIFY(!model.state().exists);

    QVERIFY(TestFiles::write(m_file, run(2, QTime(9, 0), "x")));
    QTRY_COMPARE_WITH_TIMEOUT(model.rowCount(), 2, Patience);
    QVERIFY(model.state().exists);
    QVERIFY(QFile::remove(m_file));
    QTRY_VERIFY_WITH_TIMEOUT(!model.state().exists, Patience);
    QCOMPARE(model.rowCount(), 0);
    QVERIFY(TestFiles::write(m_file, run(3, QTime(9, 0), "x")));
    QTRY_COMPARE_WITH_TIMEOUT(model.rowCount(), 3, Patience);
}

void tst_LogModel::unreadableFile()
{
    QVERIFY(TestFiles::write(m_file, run(2, QTime(9, 0), "x")));
    QVERIFY(QFile::setPermissions(m_file, QFile::WriteOwner));
    QFile probe(m_file);
    if (probe.open(QIODevice::ReadOnly))
        QSKIP("this user may read everything");
    LogModel model;
    model.Open(m_file, LogLineParser(), true);
    QTRY_VERIFY_WITH_TIMEOUT(!model.state().error.isEmpty(), Patience);
    QVERIFY(QFile::setPermissions(m_file, QFile::WriteOwner | QFile::ReadOwner));
    QTRY_COMPARE_WITH_TIMEOUT(model.rowCount(), 2, Patience);
}

void tst_LogModel::directory()
{
    LogModel model;
    QSignalSpy refreshed(&model, &LogModel::refreshed);
    model.Open(m_folder->path(), LogLineParser(), false);
    QTRY_VERIFY_WITH_TIMEOUT(refreshed.count() > 0, Patience);
    QCOMPARE(model.rowCount(), 0);
}

void tst_LogModel::filter()
{
    LogModel model;
    open(model, run(30, QTime(9, 0), "x"));
    LogFilter filter;
    QVERIFY(filter.SetText("x [12]$", true, false));
    model.SetFilter(filter);
    QTRY_COMPARE_WITH_TIMEOUT(Messages(model), QStringList({"x 1", "x 2"}), Patience);

    // Lines added later are filtered too.
    QVERIFY(TestFiles::writeOver(m_file, run(30, QTime(9, 0), "x") +
                                             entry("10:00:00.000", "Trace", "a x 1") +
                                             entry("10:00:01.000", "Trace", "no")));
    QTRY_COMPARE_WITH_TIMEOUT(Messages(model), QStringList({"x 1", "x 2", "a x 1"}), Patience);

    filter.SetSeverity(LogEntry::Trace, false);
    model.SetFilter(filter);
    QTRY_COMPARE_WITH_TIMEOUT(model.rowCount(), 0, Patience);
    model.SetFilter(LogFilter());
    QTRY_COMPARE_WITH_TIMEOUT(model.rowCount(), 32, Patience);
}

void tst_LogModel::earlierRuns()
{
    LogModel model;
    open(model, writtenOver(run(9, QTime(17, 0), "older", true), run(4, QTime(9, 0), "n")));
    QVERIFY(model.rowCount() > 4);
    QVERIFY(model.index(1, 0).data(LogModel::EarlierRole).toBool());
    LogFilter filter;
    filter.SetEarlierRuns(false);
    model.SetFilter(filter);
    QTRY_COMPARE_WITH_TIMEOUT(Messages(model), Numbered("n", 0, 4), Patience);
    QVERIFY(!model.index(1, 0).data(LogModel::EarlierRole).toBool());
}

void tst_LogModel::findProblem()
{
    LogModel model;
    open(model, entry("09:00:00.000", "Trace", "a") + entry("09:00:01.000", "Warning", "b") +
                    "more of b\n" + entry("09:00:02.000", "Notification", "c") +
                    entry("09:00:03.000", "Fatal", "d"));
    QCOMPARE(model.FindProblem(-1, 1), 1);
    QCOMPARE(model.FindProblem(1, 1), 4);
    QCOMPARE(model.FindProblem(4, 1), -1);
    QCOMPARE(model.FindProblem(5, -1), 4);
    QCOMPARE(model.FindProblem(4, -1), 1);
    QCOMPARE(model.FindProblem(1, -1), -1);
}

void tst_LogModel::entries()
{
    LogModel model;
    open(model, "before\nmore\n" + entry("09:00:00.000", "Error", "request") + "stack\ntrace\n" +
                    entry("09:00:01.000", "Error", "single") + "tail");
    const QList<QPair<int, int>> expected = {{0, 0}, {1, 1}, {2, 4}, {2, 4},
                                             {2, 4}, {5, 6}, {5, 6}};
    for (int row = 0; row < model.rowCount(); ++row)
        QCOMPARE(model.EntryRows(row), expected[row]);
    QCOMPARE(model.EntryText(1, 1000), QString("more"));
    const QString request = "2025-03-03 09:00:00.000 Error request";
    for (int row : {2, 3, 4})
        QCOMPARE(model.EntryText(row, 1000), request + "\nstack\ntrace");
    QCOMPARE(model.EntryText(6, 1000), QString("2025-03-03 09:00:01.000 Error single\ntail"));
    QCOMPARE(model.EntryText(3, request.size() + 4),
             request + "\nsta\n(only the first 41 bytes are shown)");
    QCOMPARE(model.EntryText(3, 3), QString("202\n(only the first 3 bytes are shown)"));
    QCOMPARE(model.EntryText(3, request.size() + 12), request + "\nstack\ntrace");
    QCOMPARE(model.EntryText(7, 1000), QString());
    QCOMPARE(model.EntryText(-1, 1000), QString());

    // From any line of an entry to another one.
    QCOMPARE(model.FindProblem(4, -1), -1);
    QCOMPARE(model.FindProblem(6, -1), 2);
    QCOMPARE(model.FindProblem(3, 1), 5);
}

// A model beside it that is not paused shows the lines, twice, by which time the paused one would
// have looked for them.
void tst_LogModel::pause()
{
    LogModel model;
    open(model, run(2, QTime(9, 0), "x"));
    LogModel running;
    running.Open(m_file, LogLineParser(), true);
    QTRY_COMPARE_WITH_TIMEOUT(running.rowCount(), 2, Patience);
    QSignalSpy polls(&model, &LogModel::pollRequested);
    model.SetPaused(true);
    for (int lines : {3, 4}) {
        QVERIFY(TestFiles::writeOver(m_file, run(lines, QTime(9, 0), "x")));
        QTRY_COMPARE_WITH_TIMEOUT(running.rowCount(), lines, Patience);
    }
    QCOMPARE(polls.count(), 0);
    QCOMPARE(model.rowCount(), 2);
    model.SetPaused(false);
    QTRY_COMPARE_WITH_TIMEOUT(model.rowCount(), 4, Patience);
}

// An update that is on its way when the pause begins, and the next one, which only says what has
// changed since.
// The scanner has reported the lines before the pause, and has nothing to add after it.
void tst_LogModel::updateThatThePauseHeldBack()
{
    LogModel model;
    open(model, run(2, QTime(9, 0), "x"));
    QVERIFY(TestFiles::writeOver(m_file, run(5, QTime(9, 0), "x")));
    QThread::msleep(8 * LogScanner::PollInterval); // meanwhile the other thread looks
    model.SetPaused(true);
    QTest::qWait(LogScanner::PollInterval);
    QCOMPARE(model.rowCount(), 2);
    model.SetPaused(false);
    QTRY_COMPARE_WITH_TIMEOUT(model.rowCount(), 5, Patience);
}

void tst_LogModel::updateAfterThePause()
{
    QByteArray newer = run(5, QTime(9, 0), "n");
    LogModel model;
    open(model, writtenOver(run(80, QTime(17, 0), "x", true), newer));
    const int rows = model.rowCount();
    RowCounter counter(model);
    model.SetPaused(true);
    newer += entry("09:01:00.000", "Trace", QString(1000, 'n')); // over many lines
    QVERIFY(WriteAt(m_file, 0, newer));
    model.SetPaused(false); // looks for changes
    model.SetPaused(true);
    QTest::qWait(4 * LogScanner::PollInterval);
    QCOMPARE(model.rowCount(), rows);

    newer += entry("09:01:01.000", "Trace", "last");
    QVERIFY(WriteAt(m_file, 0, newer));
    model.SetPaused(false);
    QTRY_COMPARE_WITH_TIMEOUT(model.state().rows->size(), size_t(model.rowCount()), Patience);
    QTRY_COMPARE_WITH_TIMEOUT(LastMessage(model), QString("last"), Patience);
    const QStringList messages = Messages(model);
    LogModel fresh;
    open(fresh, TestFiles::read(m_file));
    QCOMPARE(messages, Messages(fresh));
    QVERIFY(counter.right);
}

void tst_LogModel::overwritten_data()
{
    QTest::addColumn<QByteArray>("over");
    QTest::addColumn<int>("length"); // of the file, after that

    const QByteArray other = run(30, QTime(10, 0), "another");
    const auto row = [](char const* name, QByteArray const& over, int length) {
        QTest::newRow(name) << over << length;
    };
    row("by lines of other lengths", other, 0);
    row("by lines as long", run(30, QTime(10, 0), "y"), 0);
    row("up to the middle of a line", other.left(other.size() - 9), 0);
    row("up to the end of a line", QByteArray(run(1, QTime(9, 0), "x").size() - 1, 'y'), 0);
    row("by line ends", QByteArray(1000, '\n'), 0);
    row("by a line that goes on", QByteArray(1000, 'y'), 0);
    row("and cut short", other, 1000);
    row("by nothing, but cut in a line", "", 1000);
}

// Rows that were read before keep their lines. Others show their lines or are gone, while paused
// and before the next update. What is in their places is never shown.
void tst_LogModel::overwritten()
{
    QFETCH(QByteArray, over);
    QFETCH(int, length);
    const int lines = 100;
    const int onScreen = 10;
    QByteArray log = run(lines, QTime(9, 0), "x");
    const QStringList before = QString(log).split('\n');
    for (bool isPaused : {true, false}) {
        LogModel model;
        open(model, log);
        QCOMPARE(model.rowCount(), lines);
        for (int row = 0; row < onScreen; ++row)
            QCOMPARE(model.index(row, LogModel::MessageColumn).data().toString(),
                     QString("x %1").arg(row));
        model.SetPaused(isPaused);
        QVERIFY(WriteAt(m_file, 0, over));
        QVERIFY(length == 0 || QFile::resize(m_file, length));
        if (isPaused)
            QTest::qWait(2 * LogScanner::PollInterval);

        const QByteArray file = TestFiles::read(m_file);
        for (int row = 0; row < lines; ++row) {
            const QString line = model.LineText(row, LogIndex::LineLimit);
            const QByteArray now = file.mid(int(model.LineStart(row)));
            const bool isThere = now.startsWith(before[row].toLatin1() + '\n');
            QCOMPARE(model.IsGone(row), row >= onScreen && !isThere);
            const QString gone = "This line is no longer in the file";
            QCOMPARE(line, model.IsGone(row) ? gone : before[row]);
            QCOMPARE(model.index(row, LogModel::MessageColumn).data().toString(),
                     model.IsGone(row) ? gone : QString("x %1").arg(row));
            QCOMPARE(model.index(row, 0).data().toString().isEmpty(), model.IsGone(row));
        }
        QVERIFY(model.IsGone(onScreen) || file.startsWith(before[0].toLatin1().left(9)) ||
                over.size() < 100);
        if (!isPaused)
            continue;
        model.SetPaused(false);
        QTRY_VERIFY_WITH_TIMEOUT(!Messages(model).contains("This line is no longer in the file"),
                                 Patience);
    }
}

// The file that was read has got another name; no row was read before.
void tst_LogModel::rotatedWhilePaused()
{
    LogModel model;
    open(model, run(5, QTime(9, 0), "x"));
    model.SetPaused(true);
    QVERIFY(QFile::rename(m_file, m_file + ".1"));
    QVERIFY(TestFiles::write(m_file, run(3, QTime(10, 0), "y")));
    QCOMPARE(Messages(model), Numbered("x", 0, 5));
    model.SetPaused(false);
    QTRY_COMPARE_WITH_TIMEOUT(Messages(model), Numbered("y", 0, 3), Patience);
}

void tst_LogModel::heading_data()
{
    QTest::addColumn<bool>("isCurrent");
    QTest::addColumn<QString>("expected");
    QTest::newRow("the program's own log") << true << "This run";
    QTest::newRow("another log") << false << "Latest run in this file";
}

void tst_LogModel::heading()
{
    QFETCH(bool, isCurrent);
    QVERIFY(TestFiles::write(m_file, run(1, QTime(9, 0), "n") + run(3, QTime(7, 0), "o")));
    LogModel model;
    model.Open(m_file, LogLineParser(), isCurrent);
    QTRY_COMPARE_WITH_TIMEOUT(model.rowCount(), 6, Patience);
    QTEST(model.index(4, 0).data().toString(), "expected");
    QVERIFY(!(model.flags(model.index(4, 0)) & Qt::ItemIsSelectable));
    QCOMPARE(model.LineText(4, 100), QString());
}

// A row shows the start and says how long the line is; there is no such limit elsewhere.
void tst_LogModel::longLines_data()
{
    QTest::addColumn<int>("length"); // of the line
    QTest::addColumn<QString>("end");

    QTest::newRow("as long as a row shows") << int(LogModel::ShownLimit) << "yz";
    QTest::newRow("one byte more") << LogModel::ShownLimit + 1 << QString("yy\u2026 (4.1 kB)");
    QTest::newRow("longer than a piece of the file") << 300000 << QString("yy\u2026 (300 kB)");
    QTest::newRow("longer than a slice") << 1200000 << QString("yy\u2026 (1.2 MB)");
    QTest::newRow("too long to measure") << 5000000 << QString("yy\u2026 (more than 4.0 MB)");
}

void tst_LogModel::longLines()
{
    QFETCH(int, length);
    QFETCH(QString, end);
    const QByteArray empty = entry("09:00:00.000", "Trace", "");
    const QByteArray line = empty.trimmed() + ' ' + QByteArray(length - empty.size(), 'y') + 'z';
    QCOMPARE(line.size(), length);
    for (QByteArray const& lineEnd : {QByteArray("\n"), QByteArray("\r\n")}) {
        LogModel model;
        open(model, line + lineEnd + entry("09:00:01.000", "Trace", "next") + line);
        QCOMPARE(model.rowCount(), 3);
        for (int row : {0, 2}) {
            const QString shown = model.index(row, LogModel::MessageColumn).data().toString();
            QVERIFY2(shown.endsWith(end), qPrintable(shown.right(20)));
            QVERIFY(shown.size() <= LogModel::ShownLimit);
            QCOMPARE(model.LineText(row, LogIndex::LineLimit), QString(line));
            QCOMPARE(model.EntryText(row, LogIndex::LineLimit), QString(line));
        }
        QCOMPARE(model.index(1, LogModel::MessageColumn).data().toString(), QString("next"));
    }
}

void tst_LogModel::controlCharacters()
{
    LogModel model;
    open(model, "2025-03-03 09:00:00.000 Trace a\tb\rc\x1b[0m\r\n");
    QCOMPARE(model.index(0, LogModel::MessageColumn).data().toString(), QString("a       b c"));
    QCOMPARE(model.LineText(0, 100), QString("2025-03-03 09:00:00.000 Trace a\tb\rc\x1b[0m"));
}

// The log writes, restarts and rotates; the model follows.
void tst_LogModel::withTheLogItself()
{
    const QString folder = m_folder->path() + "/";
    const QtMessageHandler handler = qInstallMessageHandler(nullptr);
    TorkLog* log = TorkLog::initialize(folder, "app", QString(), true);
    for (int i = 0; i < 20; ++i)
        log->trace(QString("first %1").arg(i));
    LogModel model;
    model.Open(m_file, LogLineParser(), true);
    QTRY_COMPARE_WITH_TIMEOUT(Messages(model), Numbered("first", 0, 20), Patience);
    log->warning("one more");
    QTRY_COMPARE_WITH_TIMEOUT(LastMessage(model), QString("one more"), Patience);

    TorkLog::shutdown();
    QTest::qWait(100); // so that the runs have different times
    log = TorkLog::initialize(folder, "app", QString(), true);
    log->error("second");
    QTRY_COMPARE_WITH_TIMEOUT(LastMessage(model), QString("second"), Patience);
    QCOMPARE(Messages(model).first(), QString("Earlier"));

    TorkLog::shutdown();
    const QByteArray full = run(30000, QTime(1, 0), "full", true);
    QVERIFY(full.size() > 1000000);
    QVERIFY(TestFiles::write(m_file, full));
    QTRY_COMPARE_WITH_TIMEOUT(model.rowCount(), 30000, Patience);
    log = TorkLog::initialize(folder, "app", QString(), true);
    log->trace("after the rotation");
    QTRY_COMPARE_WITH_TIMEOUT(LastMessage(model), QString("after the rotation"), Patience);
    QVERIFY(QFile::exists(m_file + ".1"));
    TorkLog::shutdown();
    qInstallMessageHandler(handler);
}

// The interface stays responsive while a file of 100 MB is read. How long that takes is not tested.
void tst_LogModel::millionLines()
{
    const int lines = 1000000;
    QFile file(m_file);
    QVERIFY(file.open(QIODevice::WriteOnly));
    const QByteArray text(69, 'm');
    for (int i = 0; i < lines; ++i) {
        const QTime time = QTime(0, 0).addMSecs(i * 80);
        file.write("2025-03-03 " + time.toString("hh:mm:ss.zzz").toLatin1() + " Trace " + text +
                   '\n');
    }
    file.close();
    QCOMPARE(QFileInfo(m_file).size(), qint64(100) * lines);

    LogModel model;
    QElapsedTimer time;
    time.start();
    qint64 longestGap = 0;
    RowCounter counter(model);
    model.Open(m_file, LogLineParser(), false);
    while (model.rowCount() < lines && time.elapsed() < 240000) {
        QElapsedTimer gap;
        gap.start();
        QCoreApplication::processEvents(QEventLoop::AllEvents, 5);
        longestGap = qMax(longestGap, gap.elapsed());
    }
    qInfo("%d lines, %.0f MB: read in %lld ms, longest pause of the interface %lld ms", lines,
          static_cast<double>(QFileInfo(m_file).size()) / 1e6, time.elapsed(), longestGap);
    QCOMPARE(model.rowCount(), lines);
    QCOMPARE(model.index(lines - 1, 0).data().toString(), QString("2025-03-03 22:13:19.920"));
    QTRY_VERIFY_WITH_TIMEOUT(!model.isReading(), Patience);
    QCOMPARE(counter.resets, 1);
    QVERIFY(counter.right);
    QVERIFY(WriteAt(m_file, qint64(100) * lines, entry("23:59:59.000", "Trace", "last")));
    QTRY_COMPARE_WITH_TIMEOUT(model.rowCount(), lines + 1, Patience);
}

QTEST_MAIN(tst_LogModel)
#include "tst_LogModel.moc"
