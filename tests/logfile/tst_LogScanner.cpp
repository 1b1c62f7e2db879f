// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The scanner over real files that change between two polls. It runs in the test's own thread, so
// nothing here waits.

#include "app/logfile/LogScanner.h"
#include "support/DemoLog.h"
#include "support/TestFiles.h"

#include <QTemporaryDir>
#include <QThread>
#include <QtTest>

#include <functional>
#include <limits>

#include <cstdio>
#include <sys/stat.h>

using namespace Velocor;

using DemoLog::entry;
using DemoLog::run;
using DemoLog::writtenOver;

namespace {

using Change = std::function<bool(QString const&)>;

// Reads a file and keeps what the scanner reports.
class Reader
{
public:
    explicit Reader(QString const& path) : m_path(path)
    {
        QObject::connect(&scanner, &LogScanner::updated, [this](LogUpdate const& update) {
            updates.append(update);
            scanner.NoteTaken();
        });
        QObject::connect(&scanner, &LogScanner::progressed, [this](int request, int percent) {
            progress.append(qMakePair(request, percent));
            if (onProgress)
                onProgress(percent);
        });
        QObject::connect(&scanner, &LogScanner::polled, [this] { ++polls; });
        scanner.SetPace(1 << 20, std::numeric_limits<int>::max()); // no parts, however slow this is
    }

    void Open(int request, LogFilter const& filter = LogFilter(), bool isCurrent = true)
    {
        if (isCurrent)
            scanner.SetCurrentRequest(request);
        scanner.Open(request, m_path, LogLineParser(), filter);
    }

    void SetFilter(int request, LogFilter const& filter, bool isCurrent = true)
    {
        if (isCurrent)
            scanner.SetCurrentRequest(request);
        scanner.SetFilter(request, filter);
    }

    // The rows of the last update, as the lines of the file that they start at.
    QStringList Rows() const
    {
        QStringList rows;
        const QByteArray file = TestFiles::read(m_path);
        LogRows const& all = *updates.last().rows;
        for (size_t row = 0; row < all.size(); ++row) {
            const int at = static_cast<int>(all.start(row));
            rows.append(at < 0 ? QString("[heading]")
                               : QString(file.mid(at, file.indexOf('\n', at) - at)));
        }
        return rows;
    }

    LogScanner scanner;
    QVector<LogUpdate> updates;
    QVector<QPair<int, int>> progress;
    std::function<void(int)> onProgress;
    int polls = 0;

private:
    QString m_path;
};

QStringList Lines(QByteArray const& text)
{
    QStringList lines = QString(text).split('\n');
    lines.removeLast();
    return lines;
}

bool SetTime(QString const& path, QDateTime const& time)
{
    QFile file(path);
    return file.open(QIODevice::ReadWrite) &&
           file.setFileTime(time, QFileDevice::FileModificationTime);
}

LogFilter With(QString const& text)
{
    LogFilter filter;
    filter.SetText(text, false, true);
    return filter;
}

// Five entries of a run, longer than what the scanner compares at each end of a file.
QByteArray Long(char const* first, char const* middle, char const* last)
{
    const QString padding(300, 'p');
    QByteArray text;
    int second = 0;
    for (char const* word : {first, "b", middle, "d", last})
        text +=
            entry(QTime(9, 0, second++).toString("hh:mm:ss.zzz"), "Trace", word + padding + word);
    return text;
}

} // namespace

Q_DECLARE_METATYPE(Change)
Q_DECLARE_METATYPE(QVector<Change>)

class tst_LogScanner : public QObject
{
    Q_OBJECT

private slots:
    void init();
    void reportsWhatItRead();
    void reportsWhatLinesHave_data();
    void reportsWhatLinesHave();
    void reportsRuns();
    void reportsASlowLine();
    void changes_data();
    void changes();
    void unchangedFiles_data();
    void unchangedFiles();
    void seamLostWithinATick();
    void oneUpdateForManyChanges();
    void typeOfALongFirstLine();
    void typeOfAGrowingFile_data();
    void typeOfAGrowingFile();
    void queuedRequest();
    void missingFiles_data();
    void missingFiles();
    void fileComesBack();
    void noRegularFile_data();
    void noRegularFile();
    void sizeIsUnknown();
    void progress();
    void partsOfALongPass_data();
    void partsOfALongPass();
    void partOfEachSlice();
    void firstPartComesSooner();
    void growsWhileItIsRead();
    void watched_data();
    void watched();
    void watchedWithoutAFolder();
    void watchedWhereTheSystemDoesNotTell();
    void idle();
    void untakenUpdates();
    void obsoleteOpenReadsNothing();
    void pollWithoutAFile();
    void cancelledRead();
    void cancelledSecondRead();
    void cancelledPoll();
    void filters_data();
    void filters();
    void obsoleteFilter_data();
    void obsoleteFilter();
    void sameTextReadsNothing();
    void anotherTextKeepsTheLines();
    void changesBeforeAnotherText_data();
    void changesBeforeAnotherText();
    void changesDuringASearch_data();
    void changesDuringASearch();
    void cancelledSearch();
    void countsOfHiddenEntries();
    void obsoleteFilterOfAMissingFile();

private:
    std::unique_ptr<QTemporaryDir> m_folder;
    QString m_file;
};

void tst_LogScanner::init()
{
    m_folder = std::make_unique<QTemporaryDir>();
    m_file = m_folder->filePath("app.log");
}

void tst_LogScanner::reportsWhatItRead()
{
    const QByteArray text = "2025-03-03 09:02:11.031 Warning dT:[250] hello\nmore\n";
    QVERIFY(TestFiles::write(m_file, text));
    Reader reader(m_file);
    reader.Open(3);
    QCOMPARE(reader.updates.size(), 1);
    LogUpdate const& update = reader.updates.first();
    QCOMPARE(update.request, 3);
    QVERIFY(update.isReset && update.exists && update.hasElapsed);
    QCOMPARE(update.error, QString());
    QCOMPARE(update.lines, size_t(2));
    QCOMPARE(reader.Rows(), Lines(text));
    QCOMPARE(reader.polls, 0);
}

void tst_LogScanner::reportsWhatLinesHave_data()
{
    QTest::addColumn<QByteArray>("text");
    QTest::addColumn<bool>("hasTimes");
    QTest::addColumn<bool>("hasSeverities");
    QTest::newRow("entries") << run(2, QTime(9, 0), "x") << true << true;
    QTest::newRow("text") << QByteArray("a\nb\n") << false << false;
}

void tst_LogScanner::reportsWhatLinesHave()
{
    QFETCH(QByteArray, text);
    QVERIFY(TestFiles::write(m_file, text));
    Reader reader(m_file);
    reader.Open(1);
    QTEST(reader.updates.last().hasTimes, "hasTimes");
    QTEST(reader.updates.last().hasSeverities, "hasSeverities");
}

void tst_LogScanner::reportsRuns()
{
    QVERIFY(TestFiles::write(
        m_file, writtenOver(run(9, QTime(9, 0), "old", true), run(3, QTime(10, 0), "new"))));
    Reader reader(m_file);
    reader.Open(1);
    QCOMPARE(reader.updates.last().runStarts, (std::vector<size_t>{0, 3}));
}

// Nothing is searched after a line that an expression takes too long for.
void tst_LogScanner::reportsASlowLine()
{
    QVERIFY(TestFiles::write(m_file, entry("09:00:03.000", "Trace", QString(40, 'a') + '-') +
                                         run(3, QTime(10, 0), "x")));
    LogFilter filter;
    QVERIFY(filter.SetText("(a+)+[b-z]$", true, true));
    Reader reader(m_file);
    reader.Open(1, filter);
    QCOMPARE(reader.updates.last().slowLine, size_t(1));
    QCOMPARE(reader.updates.last().rows->size(), size_t(4));
}

void tst_LogScanner::changes_data()
{
    QTest::addColumn<QByteArray>("before");
    QTest::addColumn<QByteArray>("after");
    QTest::addColumn<bool>("isReset");

    const QByteArray five = run(5, QTime(9, 0), "x");
    QTest::newRow("grows") << five << run(8, QTime(9, 0), "x") << false;
    QTest::newRow("an incomplete line is completed")
        << QByteArray(five + "2025-03-03 09:00:05.000 Tra")
        << QByteArray(five + entry("09:00:05.000", "Trace", "x 5")) << false;
    QTest::newRow("another end of an incomplete line")
        << QByteArray(five + "2025-03-03 09:00:05.000 Tra")
        << QByteArray(five + "2025-03-03 09:00:05.000 Error y\n") << false;
    QTest::newRow("shrinks to nothing") << five << QByteArray() << true;
    QTest::newRow("shrinks by a line") << five << run(4, QTime(9, 0), "x") << true;
    QTest::newRow("shrinks by a byte") << five << five.left(five.size() - 1) << true;
    QTest::newRow("another of the same size") << five << run(5, QTime(9, 0), "y") << true;
    QTest::newRow("another that is longer") << five << run(9, QTime(10, 0), "y") << true;
    QTest::newRow("another that begins with the same line")
        << five << QByteArray(run(1, QTime(9, 0), "x") + run(6, QTime(10, 0), "y")) << true;
    QTest::newRow("a line is put in front") << five << QByteArray("first\n" + five) << true;
    QTest::newRow("starts differently and ends the same way")
        << Long("a", "c", "e") << Long("A", "c", "e") + "new\n"
        << true;
    QTest::newRow("starts the same way and ends differently")
        << Long("a", "c", "e") << Long("a", "c", "E") + "new\n"
        << true;
    QTest::newRow("starts with a part of what it was")
        << five << five.left(30) + five.mid(30).toUpper() + "new\n"
        << true;
    const QByteArray older = run(20, QTime(17, 0), "older", true);
    QTest::newRow("a newer run overwrites an older one")
        << writtenOver(older, run(3, QTime(9, 0), "n"))
        << writtenOver(older, run(6, QTime(9, 0), "n")) << false;
    const QByteArray longRun = run(30000, QTime(1, 0), "older", true); // more than one slice
    QTest::newRow("a newer run overwrites a long older one")
        << writtenOver(longRun, run(3, QTime(9, 0), "n"))
        << writtenOver(longRun, run(6, QTime(9, 0), "n")) << false;
    QTest::newRow("a line takes the place of one as long")
        << writtenOver(run(20, QTime(17, 0), "a", true), run(3, QTime(9, 0), "b"))
        << writtenOver(run(20, QTime(17, 0), "a", true), run(4, QTime(9, 0), "b")) << false;
    const QByteArray setBack = run(5, QTime(9, 0), "x") + run(3, QTime(8, 0), "x");
    QTest::newRow("grows after the clock was set back")
        << setBack << QByteArray(setBack + entry("08:00:07.000", "Trace", "x")) << false;
    QTest::newRow("an incomplete line is completed after the clock was set back")
        << setBack.left(setBack.size() - 9) << setBack << false;
    QTest::newRow("an older run loses its end")
        << writtenOver(older, run(3, QTime(9, 0), "n"))
        << writtenOver(older.left(older.size() - 100), run(3, QTime(9, 0), "n")) << true;
}

// Both in place and by putting another file there.
void tst_LogScanner::changes()
{
    QFETCH(QByteArray, before);
    QFETCH(QByteArray, after);
    for (bool byRename : {false, true}) {
        QVERIFY(TestFiles::write(m_file, before));
        Reader reader(m_file);
        reader.Open(1);
        const size_t rowsBefore = reader.updates.last().rows->size();
        if (byRename) {
            QVERIFY(TestFiles::write(m_file + ".new", after));
            QVERIFY(QFile::remove(m_file) && QFile::rename(m_file + ".new", m_file));
        } else {
            QVERIFY(TestFiles::write(m_file, after));
        }
        reader.scanner.Poll();
        QCOMPARE(reader.polls, 1);
        QCOMPARE(reader.updates.size(), 2);
        QTEST(reader.updates.last().isReset, "isReset");
        Reader fresh(m_file);
        fresh.Open(1);
        QCOMPARE(reader.Rows(), fresh.Rows());
        QCOMPARE(reader.updates.last().lines, fresh.updates.last().lines);
        QCOMPARE(reader.updates.last().request, 1);
        if (!reader.updates.last().isReset) {
            LogUpdate const& update = reader.updates.last();
            QVERIFY(update.rows->size() + update.removed >= rowsBefore);
            QVERIFY(update.inserted + update.removed + update.changedTail > 0 ||
                    update.rows->size() > rowsBefore);
        }
    }
}

void tst_LogScanner::unchangedFiles_data()
{
    QTest::addColumn<int>("secondsAgo");
    QTest::addColumn<int>("later");
    QTest::addColumn<bool>("isShorter");
    QTest::addColumn<bool>("isNoticed");

    QTest::newRow("changed again within the same tick of the clock") << 0 << 0 << false << true;
    QTest::newRow("by its size and time the same, long ago") << 3600 << 0 << false << false;
    QTest::newRow("by its size and time the same, in the future") << -3600 << 0 << false << false;
    QTest::newRow("of another time, long ago") << 3600 << 60 << false << true;
    QTest::newRow("of an earlier time") << 3600 << -60 << false << true;
    QTest::newRow("of another size, long ago") << 3600 << 0 << true << true;
}

// A file is read again if its size or time is another, or if its time is too recent to tell.
void tst_LogScanner::unchangedFiles()
{
    QFETCH(int, secondsAgo);
    QFETCH(int, later);
    QFETCH(bool, isShorter);
    QFETCH(bool, isNoticed);
    const QDateTime time = QDateTime::currentDateTime().addSecs(-secondsAgo);
    QVERIFY(TestFiles::write(m_file, run(5, QTime(9, 0), "x")));
    QVERIFY(SetTime(m_file, time));
    Reader reader(m_file);
    reader.Open(1);
    reader.scanner.Poll();
    QCOMPARE(reader.updates.size(), 1);

    const QByteArray after = run(isShorter ? 4 : 5, QTime(9, 0), "y");
    QVERIFY(TestFiles::write(m_file, after));
    QVERIFY(SetTime(m_file, time.addSecs(later)));
    reader.scanner.Poll();
    QCOMPARE(reader.polls, 2);
    QCOMPARE(reader.updates.size(), isNoticed ? 2 : 1);
    if (isNoticed)
        QCOMPARE(reader.Rows(), Lines(after));
}

// The newest run ends exactly where an entry begins that was the end of a line before. Neither size
// nor time of the file tell.
void tst_LogScanner::seamLostWithinATick()
{
    const QByteArray newer = run(2, QTime(9, 0), "n");
    const QByteArray older = run(20, QTime(17, 0), "older", true);
    const QDateTime time = QDateTime::currentDateTime();
    QVERIFY(TestFiles::write(m_file, newer + "rest\nend of " + older));
    QVERIFY(SetTime(m_file, time));
    Reader reader(m_file);
    reader.Open(1);
    QVERIFY(TestFiles::write(m_file, newer + "going on\nok\n" + older));
    QVERIFY(SetTime(m_file, time));
    reader.scanner.Poll();
    QCOMPARE(reader.updates.size(), 2);
    QCOMPARE(reader.Rows(), QStringList({"[heading]", "ok"}) + Lines(older) +
                                QStringList("[heading]") + Lines(newer) + QStringList("going on"));
}

void tst_LogScanner::oneUpdateForManyChanges()
{
    QVERIFY(TestFiles::write(m_file, run(2, QTime(9, 0), "x")));
    Reader reader(m_file);
    reader.Open(1);
    for (int i = 3; i < 9; ++i)
        QVERIFY(TestFiles::write(m_file, run(i, QTime(9, 0), "x")));
    for (int i = 0; i < 3; ++i)
        reader.scanner.Poll();
    QCOMPARE(reader.updates.size(), 2);
    QCOMPARE(reader.polls, 3);
    QCOMPARE(reader.Rows(), Lines(run(8, QTime(9, 0), "x")));
}

// As much of a long first line as there may be is looked at.
void tst_LogScanner::typeOfALongFirstLine()
{
    const QByteArray json("{\"level\":\"info\",\"a\":\"");
    QVERIFY(TestFiles::write(m_file, json.leftJustified(LogFileType::HeadSize + 10, 'x')));
    Reader reader(m_file);
    reader.Open(1);
    QVERIFY(reader.updates.last().type.isForeign);
}

void tst_LogScanner::typeOfAGrowingFile_data()
{
    QTest::addColumn<QByteArray>("before");
    QTest::addColumn<QByteArray>("more");
    QTest::addColumn<bool>("isForeign");
    QTest::addColumn<bool>("isReset"); // because the lines are split in another way
    const QByteArray foreign = QByteArray("Nov 22 14:03:02 host app[7]: x\n").repeated(3);
    QTest::newRow("not known before") << QByteArray("a\n") << foreign << true << true;
    QTest::newRow("known before") << foreign << foreign << true << false;
    QTest::newRow("own log") << run(3, QTime(9, 0), "x") << run(2, QTime(9, 1), "y") << false
                             << false;
    QTest::newRow("not known yet") << QByteArray("a\n") << QByteArray("b\n") << false << false;
}

// The first lines may not have said whose it is.
void tst_LogScanner::typeOfAGrowingFile()
{
    QFETCH(QByteArray, before);
    QFETCH(QByteArray, more);
    QVERIFY(TestFiles::write(m_file, before));
    Reader reader(m_file);
    reader.Open(1);
    QVERIFY(TestFiles::writeOver(m_file, before + more));
    reader.scanner.Poll();
    QCOMPARE(reader.updates.size(), 2);
    QTEST(reader.updates.last().type.isForeign, "isForeign");
    QTEST(reader.updates.last().isReset, "isReset");
    QCOMPARE(reader.Rows(), Lines(before + more));
}

// A request from another thread comes as an event.
void tst_LogScanner::queuedRequest()
{
    QVERIFY(TestFiles::write(m_file, run(5, QTime(9, 0), "x")));
    Reader reader(m_file);
    reader.scanner.SetCurrentRequest(1);
    QVERIFY(QMetaObject::invokeMethod(
        &reader.scanner, "Open", Qt::QueuedConnection, Q_ARG(int, 1), Q_ARG(QString, m_file),
        Q_ARG(Velocor::LogLineParser, LogLineParser()), Q_ARG(Velocor::LogFilter, LogFilter())));
    QCOMPARE(reader.updates.size(), 0);
    QCoreApplication::processEvents();
    QCOMPARE(reader.updates.size(), 1);
    QCOMPARE(reader.updates.last().lines, size_t(5));
}

void tst_LogScanner::missingFiles_data()
{
    QTest::addColumn<bool>("existsFirst");
    QTest::newRow("missing from the start") << false;
    QTest::newRow("removed") << true;
}

void tst_LogScanner::missingFiles()
{
    QFETCH(bool, existsFirst);
    if (existsFirst)
        QVERIFY(TestFiles::write(m_file, run(5, QTime(9, 0), "old")));
    Reader reader(m_file);
    reader.Open(7);
    QFile::remove(m_file);
    reader.scanner.Poll();
    QCOMPARE(reader.updates.size(), existsFirst ? 2 : 1);
    QVERIFY(reader.updates.last().isReset && !reader.updates.last().exists);
    QCOMPARE(reader.updates.last().rows->size(), size_t(0));
    QCOMPARE(reader.updates.last().lines, size_t(0));
    QCOMPARE(reader.updates.last().error, QString()); // a missing file is none
    QCOMPARE(reader.updates.last().request, 7);

    // That is told once, and the file when it is there again.
    const int before = reader.updates.size();
    reader.scanner.Poll();
    QCOMPARE(reader.updates.size(), before);
    const QByteArray text = run(2, QTime(9, 0), "new");
    QVERIFY(TestFiles::write(m_file, text));
    QVERIFY(SetTime(m_file, QDateTime::currentDateTime().addSecs(-3600)));
    reader.scanner.Poll();
    QCOMPARE(reader.updates.size(), before + 1);
    QVERIFY(reader.updates.last().isReset && reader.updates.last().exists);
    QCOMPARE(reader.Rows(), Lines(text));
    QCOMPARE(reader.polls, 3);
}

// By its size and time it is what was read, but that is no longer known.
void tst_LogScanner::fileComesBack()
{
    QVERIFY(TestFiles::write(m_file, run(5, QTime(9, 0), "x")));
    QVERIFY(SetTime(m_file, QDateTime::currentDateTime().addSecs(-3600)));
    Reader reader(m_file);
    reader.Open(1);
    QVERIFY(QFile::rename(m_file, m_file + ".away"));
    reader.scanner.Poll();
    QCOMPARE(reader.updates.last().rows->size(), size_t(0));
    QVERIFY(QFile::rename(m_file + ".away", m_file));
    reader.scanner.Poll();
    QCOMPARE(reader.updates.size(), 3);
    QCOMPARE(reader.updates.last().rows->size(), size_t(5));
}

void tst_LogScanner::noRegularFile_data()
{
    QTest::addColumn<Change>("put");

    QTest::newRow("a pipe") << Change(
        [](QString const& path) { return mkfifo(QFile::encodeName(path).constData(), 0600) == 0; });
    QTest::newRow("a folder") << Change([](QString const& path) { return QDir().mkpath(path); });
    QTest::newRow("a device") << Change(
        [](QString const& path) { return QFile::link("/dev/zero", path); });
}

// Opened, or put in the place of a file that is open. Opening a pipe would wait for a writer.
void tst_LogScanner::noRegularFile()
{
    QFETCH(Change, put);
    QVERIFY(put(m_file));
    Reader reader(m_file);
    reader.Open(1);
    QCOMPARE(reader.updates.size(), 1);
    QVERIFY(!reader.updates.last().exists);
    QCOMPARE(reader.updates.last().error, QString("Not a regular file"));

    const QString other = m_folder->filePath("other.log");
    QVERIFY(TestFiles::write(other, run(5, QTime(9, 0), "x")));
    Reader second(other);
    second.Open(1);
    QVERIFY(QFile::remove(other) && put(other));
    second.scanner.Poll();
    QCOMPARE(second.updates.size(), 2);
    QVERIFY(!second.updates.last().exists);
    QCOMPARE(second.updates.last().error, QString("Not a regular file"));
    QCOMPARE(second.updates.last().rows->size(), size_t(0));

    // The error is gone with its cause.
    QVERIFY(QFile::remove(other) || QDir().rmdir(other));
    QVERIFY(TestFiles::write(other, run(3, QTime(9, 0), "x")));
    second.scanner.Poll();
    QCOMPARE(second.updates.last().error, QString());
    QCOMPARE(second.updates.last().rows->size(), size_t(3));
}

// Files of the system are regular files without a size.
void tst_LogScanner::sizeIsUnknown()
{
    const QString path = "/proc/self/status";
    if (QFileInfo(path).size() != 0 || !QFileInfo(path).isFile())
        QSKIP("no such file here");
    Reader reader(path);
    reader.Open(1);
    QVERIFY(reader.updates.last().exists);
    QVERIFY(reader.updates.last().lines > 5);
}

void tst_LogScanner::progress()
{
    // Twenty slices and one byte: progress is reported from ten percent to ten percent.
    QVERIFY(TestFiles::write(m_file, QByteArray((20 << 20) + 1, 'x')));
    Reader reader(m_file);
    reader.Open(4);
    QVector<QPair<int, int>> expected;
    for (int percent : {14, 24, 34, 44, 54, 64, 74, 84, 94})
        expected.append(qMakePair(4, percent));
    QCOMPARE(reader.progress, expected);
    QCOMPARE(reader.updates.last().lines, size_t(1));
}

void tst_LogScanner::partsOfALongPass_data()
{
    QTest::addColumn<QString>("text");
    QTest::addColumn<bool>("isOpen"); // and its filter is changed
    QTest::newRow("all lines are opened") << "" << false;
    QTest::newRow("lines with a text are opened") << "7" << false;
    QTest::newRow("a filter is set") << "7" << true;
}

// What has been found is reported while reading goes on; only the first report is a new beginning.
void tst_LogScanner::partsOfALongPass()
{
    QFETCH(QString, text);
    QFETCH(bool, isOpen);
    QVERIFY(TestFiles::write(m_file, run(300, QTime(9, 0), "x")));
    Reader whole(m_file);
    whole.Open(1, With(text));
    QCOMPARE(whole.updates.size(), 1);
    QVERIFY(!whole.updates.first().isPartial);

    Reader reader(m_file);
    if (isOpen)
        reader.Open(1);
    reader.updates.clear();
    reader.scanner.SetPace(1000, 0);
    if (isOpen)
        reader.SetFilter(2, With(text));
    else
        reader.Open(2, With(text));
    QVERIFY(reader.updates.size() > 8);
    size_t lines = 0;
    for (LogUpdate const& update : qAsConst(reader.updates)) {
        const bool isLast = update.lines == 300;
        QCOMPARE(update.isPartial, !isLast);
        QCOMPARE(update.isReset, lines == 0);
        QVERIFY(update.lines > lines);
        lines = update.lines;
    }
    QCOMPARE(lines, size_t(300));
    QCOMPARE(reader.Rows(), whole.Rows());

    // The same pass when new lines are added.
    reader.updates.clear();
    QVERIFY(TestFiles::write(m_file, run(600, QTime(9, 0), "x")));
    reader.scanner.Poll();
    QVERIFY(reader.updates.size() > 8);
    for (LogUpdate const& update : qAsConst(reader.updates))
        QVERIFY(!update.isReset);
    QVERIFY(reader.updates.first().isPartial && !reader.updates.last().isPartial);
    QCOMPARE(reader.updates.last().lines, size_t(600));
}

// If it is asked for each slice, however long its receiver takes.
void tst_LogScanner::partOfEachSlice()
{
    const QByteArray file = run(100, QTime(9, 0), "x");
    QVERIFY(TestFiles::write(m_file, file));
    Reader reader(m_file);
    reader.scanner.SetPace(1000, 0);
    QObject::connect(&reader.scanner, &LogScanner::updated, [] { QThread::msleep(5); });
    reader.Open(1);
    QCOMPARE(reader.updates.size(), (file.size() + 999) / 1000);
}

// Nobody has seen the file yet; reading it again should not change what is shown more than once.
void tst_LogScanner::firstPartComesSooner()
{
    QVERIFY(TestFiles::write(m_file, run(300, QTime(9, 0), "x")));
    Reader reader(m_file);
    reader.scanner.SetPace(1000, std::numeric_limits<int>::max(), 0);
    reader.Open(1);
    QCOMPARE(reader.updates.size(), 2);
    QVERIFY(reader.updates[0].isPartial);
    QVERIFY(reader.updates[0].lines > 0);
    QVERIFY(!reader.updates[1].isPartial);
    QCOMPARE(reader.updates[1].lines, size_t(300));

    reader.Open(2);
    QCOMPARE(reader.updates.size(), 3);
    reader.SetFilter(3, With("9"));
    QCOMPARE(reader.updates.size(), 4);
}

// However fast that is, a pass ends, and the next one goes on from there.
void tst_LogScanner::growsWhileItIsRead()
{
    const QByteArray line = entry("09:00:00.000", "Trace", "x");
    QVERIFY(TestFiles::write(m_file, line.repeated(100)));
    Reader reader(m_file);
    reader.scanner.SetPace(100, 1000000);
    int added = 0;
    reader.onProgress = [&](int) {
        QFile file(m_file);
        if (added < 100 && file.open(QIODevice::Append) && file.write(line.repeated(20)) > 0)
            ++added;
    };
    reader.Open(1, With("x"));
    QVERIFY(added > 5);
    QCOMPARE(reader.updates.size(), 1);
    QCOMPARE(reader.updates.last().lines, size_t(100));

    reader.onProgress = nullptr;
    reader.scanner.Poll();
    QCOMPARE(reader.updates.size(), 2);
    QVERIFY(!reader.updates.last().isReset);
    QCOMPARE(reader.updates.last().lines, size_t(100 + 20 * added));
    reader.scanner.Poll(); // that was all
    QCOMPARE(reader.updates.size(), 2);
}

void tst_LogScanner::watched_data()
{
    QTest::addColumn<bool>("isLink");
    QTest::addColumn<QVector<Change>>("changes");

    const auto append = [](QString const& path) {
        QFile file(path);
        return file.open(QIODevice::Append) && file.write("2025-03-03 10:00:00.000 Trace a\n") > 0;
    };
    const auto overwrite = [](QString const& path) {
        QFile file(path);
        return file.open(QIODevice::ReadWrite) && file.write(run(2, QTime(11, 0), "w")) > 0;
    };
    const auto cut = [](QString const& path) {
        return QFile::resize(path, 10);
    };
    const auto remove = [](QString const& path) {
        return QFile::remove(path);
    };
    const auto create = [](QString const& path) {
        return TestFiles::write(path, run(3, QTime(10, 0), "new"));
    };
    const auto rotate = [](QString const& path) {
        QFile::remove(path + ".1");
        return QFile::rename(path, path + ".1");
    };
    const auto replace = [](QString const& path) {
        return TestFiles::write(path + ".new", run(4, QTime(10, 0), "other")) &&
               ::rename(QFile::encodeName(path + ".new").constData(),
                        QFile::encodeName(path).constData()) == 0;
    };
    const auto row = [](char const* name, QVector<Change> const& changes) {
        QTest::newRow(name) << false << changes;
        QTest::newRow(qPrintable(QString("%1, through a link").arg(name))) << true << changes;
    };
    row("appended to", {append, append, append});
    row("overwritten", {overwrite});
    row("cut short", {cut, append});
    row("removed and created", {remove, create, append});
    row("rotated", {rotate, create, append, rotate, create, append});
    row("replaced", {replace, append, replace, append});
}

// Each change is seen without a Poll().
void tst_LogScanner::watched()
{
    QFETCH(bool, isLink);
    QFETCH(QVector<Change>, changes);
    QString file = m_file;
    if (isLink) {
        file = m_folder->filePath("elsewhere/target.log");
        QVERIFY(QDir().mkpath(QFileInfo(file).path()));
        QVERIFY(QFile::link(file, m_file));
    }
    QVERIFY(TestFiles::write(file, run(5, QTime(9, 0), "x")));
    Reader reader(m_file);
    reader.scanner.SetWatched(true);
    reader.Open(1);
    for (Change const& change : changes) {
        QVERIFY(change(file));
        const auto lines = [&] {
            QFile now(file);
            return size_t(now.open(QIODevice::ReadOnly) ? now.readAll().count('\n') : 0);
        };
        const size_t expected = lines() + (QFileInfo(file).size() == 10 ? 1 : 0);
        QTRY_COMPARE_WITH_TIMEOUT(reader.updates.last().lines, expected, 5000);
        QCOMPARE(reader.updates.last().exists, QFileInfo(file).exists());
        Reader fresh(m_file);
        fresh.Open(1);
        QTRY_COMPARE_WITH_TIMEOUT(reader.Rows(), fresh.Rows(), 5000);
    }

    reader.scanner.SetWatched(false);
    const int updates = reader.updates.size();
    QVERIFY(TestFiles::write(file, run(50, QTime(12, 0), "x")));
    QTest::qWait(2 * LogScanner::PollInterval);
    QCOMPARE(reader.updates.size(), updates);
    reader.scanner.SetWatched(true); // also tells what happened before
    QTRY_COMPARE_WITH_TIMEOUT(reader.updates.last().lines, size_t(50), 20000);
    QVERIFY(TestFiles::writeOver(file, run(60, QTime(12, 0), "x")));
    QTRY_COMPARE_WITH_TIMEOUT(reader.updates.last().lines, size_t(60), 20000);
}

// Nobody tells of it before the folder exists.
void tst_LogScanner::watchedWithoutAFolder()
{
    const QString file = m_folder->filePath("later/app.log");
    Reader reader(file);
    reader.scanner.SetWatched(true);
    reader.Open(1);
    QTest::qWait(50);
    QVERIFY(!reader.updates.last().exists);
    for (int i = 1; i <= 2; ++i) {
        QVERIFY(TestFiles::write(file, run(3, QTime(9, 0), "x")));
        QTRY_COMPARE_WITH_TIMEOUT(reader.updates.last().lines, size_t(3), 20000);
        QVERIFY(QDir(QFileInfo(file).path()).removeRecursively());
        QTRY_VERIFY_WITH_TIMEOUT(!reader.updates.last().exists, 20000);
    }
}

void tst_LogScanner::watchedWhereTheSystemDoesNotTell()
{
    if (!QFileInfo("/proc/self/status").isFile())
        QSKIP("no such file here");
    Reader reader("/proc/self/status");
    reader.scanner.SetWatched(true);
    reader.Open(1);
    QTRY_VERIFY_WITH_TIMEOUT(reader.polls > 3, 20000);
}

// Nothing happens until something changes.
void tst_LogScanner::idle()
{
    QVERIFY(TestFiles::write(m_file, run(5, QTime(9, 0), "x")));
    Reader reader(m_file);
    reader.scanner.SetWatched(true);
    reader.Open(1);
    QTRY_VERIFY_WITH_TIMEOUT(reader.polls > 0, 20000);
    QTest::qWait(100);
    const int polls = reader.polls;
    QTest::qWait(4 * LogScanner::PollInterval);
    QCOMPARE(reader.polls, polls);
    QVERIFY(TestFiles::write(m_file, run(6, QTime(9, 0), "x")));
    QTRY_VERIFY_WITH_TIMEOUT(reader.polls > polls, 20000);
}

// Whoever is slow gets one update for many changes.
void tst_LogScanner::untakenUpdates()
{
    QVERIFY(TestFiles::write(m_file, run(1, QTime(9, 0), "x")));
    LogScanner scanner;
    QSignalSpy updated(&scanner, &LogScanner::updated);
    scanner.SetCurrentRequest(1);
    scanner.SetWatched(true);
    scanner.Open(1, m_file, LogLineParser(), LogFilter());
    for (int lines = 2; lines < 10; ++lines) {
        QVERIFY(TestFiles::write(m_file, run(lines, QTime(9, 0), "x")));
        QTest::qWait(30);
    }
    QCOMPARE(updated.count(), 1);
    scanner.NoteTaken();
    QTRY_COMPARE_WITH_TIMEOUT(updated.count(), 2, 20000);
    QCOMPARE(updated.last().first().value<LogUpdate>().lines, size_t(9));
}

void tst_LogScanner::obsoleteOpenReadsNothing()
{
    QVERIFY(TestFiles::write(m_file, run(5, QTime(9, 0), "x")));
    Reader reader(m_file);
    reader.scanner.SetCurrentRequest(2);
    reader.Open(1, LogFilter(), false);
    QCOMPARE(reader.updates.size(), 0);
    reader.scanner.Poll();
    QCOMPARE(reader.updates.size(), 0);
    QCOMPARE(reader.polls, 1);
    reader.Open(2);
    QCOMPARE(reader.updates.size(), 1);

    QVERIFY(QFile::remove(m_file)); // that is not reported for it either
    reader.scanner.SetCurrentRequest(4);
    reader.Open(3, LogFilter(), false);
    reader.scanner.Poll();
    QCOMPARE(reader.updates.size(), 1);
    QCOMPARE(reader.polls, 2);
}

void tst_LogScanner::pollWithoutAFile()
{
    Reader reader(m_file);
    reader.scanner.Poll();
    QCOMPARE(reader.updates.size(), 0);
    QCOMPARE(reader.polls, 1);
}

// A request that is superseded while its file is read is never answered.
void tst_LogScanner::cancelledRead()
{
    QVERIFY(TestFiles::write(m_file, QByteArray(3 << 20, 'x') + '\n'));
    Reader reader(m_file);
    reader.onProgress = [&](int) {
        reader.scanner.SetCurrentRequest(2);
    };
    reader.Open(1);
    QCOMPARE(reader.progress.size(), 1);
    QCOMPARE(reader.updates.size(), 0);
    reader.onProgress = nullptr;

    // If it becomes current again, the next poll reads the whole file.
    reader.scanner.SetCurrentRequest(1);
    reader.scanner.Poll();
    QCOMPARE(reader.updates.size(), 1);
    QVERIFY(reader.updates.last().isReset);
    QCOMPARE(reader.updates.last().lines, size_t(1));
}

// The file looks unchanged, but not all of it has been read for the later request.
void tst_LogScanner::cancelledSecondRead()
{
    QVERIFY(TestFiles::write(m_file, QByteArray(3 << 20, 'x') + '\n'));
    QVERIFY(SetTime(m_file, QDateTime::currentDateTime().addSecs(-3600)));
    Reader reader(m_file);
    reader.Open(1);
    QCOMPARE(reader.updates.size(), 1);
    reader.onProgress = [&](int) {
        reader.scanner.SetCurrentRequest(3);
    };
    reader.Open(2);
    reader.onProgress = nullptr;
    QCOMPARE(reader.updates.size(), 1);
    reader.scanner.SetCurrentRequest(2);
    reader.scanner.Poll();
    QCOMPARE(reader.updates.size(), 2);
    QCOMPARE(reader.updates.last().lines, size_t(1));
}

void tst_LogScanner::cancelledPoll()
{
    const QByteArray start = run(5, QTime(9, 0), "x");
    QVERIFY(TestFiles::write(m_file, start));
    Reader reader(m_file);
    reader.Open(1);
    QVERIFY(TestFiles::write(m_file, start + QByteArray(3 << 20, 'x') + '\n'));
    QVERIFY(SetTime(m_file, QDateTime::currentDateTime().addSecs(-3600)));
    reader.onProgress = [&](int) {
        reader.scanner.SetCurrentRequest(2);
    };
    reader.scanner.Poll();
    QCOMPARE(reader.updates.size(), 1);
    QCOMPARE(reader.polls, 1);
    reader.onProgress = nullptr;

    reader.SetFilter(2, LogFilter());
    QCOMPARE(reader.updates.size(), 2);
    QCOMPARE(reader.updates.last().lines, size_t(6));
    QCOMPARE(reader.updates.last().request, 2);
}

void tst_LogScanner::filters_data()
{
    QTest::addColumn<QString>("first");
    QTest::addColumn<QString>("second");
    QTest::addColumn<bool>("hidesTraces");
    QTest::addColumn<QStringList>("rows");

    const QStringList all = Lines(run(6, QTime(9, 0), "x"));
    QTest::newRow("the same") << ""
                              << "" << false << all;
    QTest::newRow("another text") << ""
                                  << "x 3" << false << QStringList(all.at(3));
    QTest::newRow("no text any more") << "x 3"
                                      << "" << false << all;
    QTest::newRow("another severity") << ""
                                      << "" << true << QStringList(all.at(5));
    QTest::newRow("another severity, same text") << "x 3"
                                                 << "x 3" << true << QStringList();
    QTest::newRow("both") << "x 3"
                          << "x 5" << true << QStringList(all.at(5));
}

// A filter is answered with all rows, even if they are the same, and later lines are filtered too.
void tst_LogScanner::filters()
{
    QFETCH(QString, first);
    QFETCH(QString, second);
    QFETCH(bool, hidesTraces);
    QVERIFY(TestFiles::write(m_file, run(6, QTime(9, 0), "x")));
    Reader reader(m_file);
    reader.Open(1, With(first));
    LogFilter filter = With(second);
    filter.SetSeverity(LogEntry::Trace, !hidesTraces);
    reader.SetFilter(2, filter);
    QCOMPARE(reader.updates.size(), 2);
    QVERIFY(reader.updates.last().isReset);
    QCOMPARE(reader.updates.last().request, 2);
    QTEST(reader.Rows(), "rows");

    QVERIFY(TestFiles::write(m_file, run(6, QTime(9, 0), "x") +
                                         entry("10:00:00.000", "Error", "x 3 x 5 later")));
    reader.scanner.Poll();
    QCOMPARE(reader.updates.size(), 3);
    QVERIFY(!reader.updates.last().isReset);
    QVERIFY(reader.Rows().last().endsWith("later"));
}

void tst_LogScanner::obsoleteFilter_data()
{
    QTest::addColumn<QString>("obsolete");
    QTest::addColumn<QString>("last");
    QTest::addColumn<QStringList>("rows");

    const QStringList all = Lines(run(6, QTime(9, 0), "x"));
    QTest::newRow("its text comes again") << "x 3"
                                          << "x 3" << QStringList(all.at(3));
    QTest::newRow("another text follows") << "x 3"
                                          << "x 4" << QStringList(all.at(4));
    QTest::newRow("the text before it comes again") << "x 3"
                                                    << "" << all;
    QTest::newRow("no text at all") << ""
                                    << "" << all;
}

// Nothing is searched for a filter that is already superseded.
void tst_LogScanner::obsoleteFilter()
{
    QFETCH(QString, obsolete);
    QFETCH(QString, last);
    QVERIFY(TestFiles::write(m_file, run(6, QTime(9, 0), "x")));
    QVERIFY(SetTime(m_file, QDateTime::currentDateTime().addSecs(-3600)));
    Reader reader(m_file);
    reader.Open(1);
    reader.scanner.SetCurrentRequest(3);
    reader.SetFilter(2, With(obsolete), false);
    QCOMPARE(reader.updates.size(), 1);
    reader.SetFilter(3, With(last));
    QCOMPARE(reader.updates.size(), 2);
    QTEST(reader.Rows(), "rows");

    // The next poll makes up for one that is never superseded after all.
    reader.scanner.SetCurrentRequest(5);
    reader.SetFilter(4, With("x 1"), false);
    reader.scanner.SetCurrentRequest(4);
    reader.scanner.Poll();
    QCOMPARE(reader.updates.size(), 3);
    QCOMPARE(reader.Rows(), QStringList(Lines(run(6, QTime(9, 0), "x")).at(1)));
}

// Filters of the same text do without the file, even if one of them is superseded.
void tst_LogScanner::sameTextReadsNothing()
{
    QVERIFY(TestFiles::write(m_file, run(6, QTime(9, 0), "x")));
    Reader reader(m_file);
    reader.Open(1);
    QVERIFY(QFile::remove(m_file));
    LogFilter filter;
    filter.SetSeverity(LogEntry::Trace, false);
    reader.scanner.SetCurrentRequest(3);
    reader.SetFilter(2, filter, false);
    reader.SetFilter(3, filter);
    QCOMPARE(reader.updates.size(), 2);
    QVERIFY(reader.updates.last().exists);
    QCOMPARE(reader.updates.last().rows->size(), size_t(1));
}

// For another text, lines are searched but not looked for again.
void tst_LogScanner::anotherTextKeepsTheLines()
{
    const QByteArray file = run(60, QTime(9, 0), "x");
    QVERIFY(TestFiles::write(m_file, file));
    const QDateTime before = QDateTime::currentDateTime().addSecs(-3600);
    QVERIFY(SetTime(m_file, before));
    Reader reader(m_file);
    reader.Open(1);

    // Nobody can see this change but who reads all of the file.
    QByteArray changed = file;
    const int place = file.indexOf("x 30");
    changed.replace(place, 4, "y\n30");
    QVERIFY(TestFiles::write(m_file, changed));
    QVERIFY(SetTime(m_file, before));
    reader.SetFilter(2, With("y"));
    QCOMPARE(reader.updates.size(), 2);
    QCOMPARE(reader.updates.last().rows->size(), size_t(1));
    QCOMPARE(reader.updates.last().lines, size_t(60));
}

void tst_LogScanner::changesBeforeAnotherText_data()
{
    QTest::addColumn<QByteArray>("after");
    const QByteArray file = Long("a", "c", "e");
    QTest::newRow("none") << file;
    QTest::newRow("lines were added") << file + entry("10:00:00.000", "Trace", "d again");
    QTest::newRow("the last line was completed") << file.left(file.size() - 1);
    QTest::newRow("it was truncated") << file.left(file.size() / 2);
    QTest::newRow("another first line") << Long("d", "c", "e");
    QTest::newRow("another last line") << Long("a", "c", "d");
    QTest::newRow("another file") << entry("08:00:00.000", "Trace", "d").repeated(100);
    QTest::newRow("a new run") << writtenOver(file, entry("11:00:00.000", "Trace", "d again"));
    QTest::newRow("another middle") << Long("a", "d", "e");
}

// The rows are those of the file as it is now.
void tst_LogScanner::changesBeforeAnotherText()
{
    QFETCH(QByteArray, after);
    const QByteArray file = Long("a", "c", "e");
    const bool isCompleted = !after.endsWith('\n') && after.size() + 1 == file.size();
    QVERIFY(TestFiles::write(m_file, isCompleted ? after : file));
    Reader reader(m_file);
    reader.Open(1);
    QVERIFY(TestFiles::write(m_file, isCompleted ? file : after));
    reader.SetFilter(2, With("d"));
    QCOMPARE(reader.updates.size(), 2);
    QVERIFY(reader.updates.last().isReset && !reader.updates.last().isPartial);
    Reader fresh(m_file);
    fresh.Open(1, With("d"));
    QCOMPARE(reader.Rows(), fresh.Rows());
    QCOMPARE(reader.updates.last().lines, fresh.updates.last().lines);
}

void tst_LogScanner::changesDuringASearch_data()
{
    QTest::addColumn<int>("size"); // of a file of 3 MiB
    QTest::newRow("truncated") << 1000;
    QTest::newRow("truncated after what was searched") << (5 << 19);
    QTest::newRow("grown") << (4 << 20);
}

void tst_LogScanner::changesDuringASearch()
{
    QFETCH(int, size);
    const QByteArray line = QByteArray(1023, 'x') + '\n';
    QVERIFY(TestFiles::write(m_file, line.repeated(3 << 10)));
    Reader reader(m_file);
    reader.Open(1);
    bool isChanged = false;
    reader.onProgress = [&](int) {
        isChanged = isChanged || TestFiles::write(m_file, line.repeated(size / 1024));
    };
    reader.SetFilter(2, With("x"));
    QVERIFY(isChanged);
    QCOMPARE(reader.updates.size(), 2);
    reader.scanner.Poll();
    QCOMPARE(reader.updates.last().rows->size(), size_t(size / 1024));
    QCOMPARE(reader.updates.last().lines, size_t(size / 1024));
}

// A text that is superseded while it is searched for is never answered.
void tst_LogScanner::cancelledSearch()
{
    const QByteArray line = QByteArray(1023, 'x') + '\n';
    QVERIFY(TestFiles::write(m_file, line.repeated(3 << 10) + "y\n"));
    QVERIFY(SetTime(m_file, QDateTime::currentDateTime().addSecs(-3600)));
    Reader reader(m_file);
    reader.Open(1);
    reader.progress.clear();
    reader.onProgress = [&](int) {
        reader.scanner.SetCurrentRequest(3);
    };
    reader.SetFilter(2, With("x"));
    QCOMPARE(reader.progress.size(), 1);
    QCOMPARE(reader.updates.size(), 1);
    reader.scanner.Poll(); // not its business
    QCOMPARE(reader.updates.size(), 1);
    reader.onProgress = nullptr;
    reader.SetFilter(3, With("y"));
    QCOMPARE(reader.updates.size(), 2);
    QCOMPARE(reader.Rows(), QStringList("y"));

    // If it becomes current again, the next poll answers it.
    reader.onProgress = [&](int) {
        reader.scanner.SetCurrentRequest(5);
    };
    reader.SetFilter(4, With("x"));
    reader.onProgress = nullptr;
    reader.scanner.SetCurrentRequest(4);
    reader.scanner.Poll();
    QCOMPARE(reader.updates.size(), 3);
    QCOMPARE(reader.updates.last().rows->size(), size_t(3 << 10));
}

// The last line becomes an entry of another severity, which is hidden.
void tst_LogScanner::countsOfHiddenEntries()
{
    const QByteArray first = run(3, QTime(8, 0), "of the log's own");
    const QByteArray error = entry("09:00:00.000", "Error", "a");
    QVERIFY(TestFiles::write(m_file, first + error.left(error.indexOf("Error")) + "Fatal"));
    LogFilter filter;
    filter.SetSeverity(LogEntry::Error, false);
    filter.SetSeverity(LogEntry::Fatal, false);
    Reader reader(m_file);
    reader.Open(1, filter);
    QCOMPARE(reader.updates.last().counts[LogEntry::Fatal], size_t(1));
    QVERIFY(TestFiles::write(m_file, first + error));
    reader.scanner.Poll();
    QCOMPARE(reader.updates.size(), 2);
    QVERIFY(!reader.updates.last().isReset);
    QCOMPARE(reader.updates.last().rows->size(), size_t(3));
    QCOMPARE(reader.updates.last().counts[LogEntry::Fatal], size_t(0));
    QCOMPARE(reader.updates.last().counts[LogEntry::Error], size_t(1));
}

void tst_LogScanner::obsoleteFilterOfAMissingFile()
{
    Reader reader(m_file);
    reader.Open(1);
    reader.scanner.SetCurrentRequest(3);
    reader.SetFilter(2, With("x"), false);
    reader.scanner.SetCurrentRequest(2);
    reader.scanner.Poll();
    QCOMPARE(reader.updates.size(), 2);
    QVERIFY(!reader.updates.last().exists);
    QCOMPARE(reader.updates.last().request, 2);
}

QTEST_GUILESS_MAIN(tst_LogScanner)
#include "tst_LogScanner.moc"
