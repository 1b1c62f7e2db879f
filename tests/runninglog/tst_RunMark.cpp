// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Marks of this process; tst_RunExits has those of programs that ended.

#include "app/runninglog/RunMark.h"

#include "app/history/HistoryTime.h"
#include "app/history/RunEnds.h"
#include "app/history/RunMarkFile.h"
#include "support/OpenFiles.h"
#include "support/ProcessLimits.h"
#include "support/Sanitizers.h"
#include "support/TestFiles.h"

#include <QTemporaryDir>
#include <QtTest>

#include <cstdlib>
#include <fcntl.h>
#include <memory>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

using namespace Velocor;

namespace {

// Deleted last when the program exits, because it is made first.
std::unique_ptr<RunMark> s_lastMark;

// As one that a program left behind that began then.
bool LeaveBehind(QString const& path, qint64 start)
{
    QDir().mkpath(QFileInfo(path).path());
    const int file = ::open(QFile::encodeName(path).constData(), O_WRONLY | O_CREAT, 0666);
    const QByteArray text = RunMarkFile::TextFor(start, file);
    const bool isWritten = ::write(file, text.constData(), size_t(text.size())) == text.size();
    ::close(file);
    return isWritten;
}

} // namespace

class tst_RunMark : public QObject
{
    Q_OBJECT

private slots:
    void init();
    void oneLife();
    void longLife();
    void everybodyMayReadAndWrite();
    void withoutStandardInput();
    void endsOnceAtExit_data();
    void endsOnceAtExit();
    void markThatCannotBeWritten();
    void noLog();
    void noFolder();
    void secondMark();
    void othersAreUsingTheFolder();
    void collects_data();
    void collects();
    void collectsInTheirOrder();
    void recordThatCannotBeWritten_data();
    void recordThatCannotBeWritten();
    void recordIsShortened_data();
    void recordIsShortened();

private:
    QString folder() const { return RunEnds::MarkFolderOf(m_log); }
    QString record() const { return RunEnds::RecordFileOf(m_log); }

    std::unique_ptr<QTemporaryDir> m_folder;
    QString m_log;
};

void tst_RunMark::init()
{
    m_folder = std::make_unique<QTemporaryDir>();
    m_log = m_folder->filePath("logs/app.log");
}

void tst_RunMark::oneLife()
{
    const int before = openFileCount();
    {
        const RunMark mark(m_log);
        const QStringList names = RunMarkFile::NamesIn(folder());
        QCOMPARE(names, QStringList(RunMarkFile::NameFor(RunMark::ProgramStart())));
        const RunMarkFile file(folder() + '/' + names[0]);
        QCOMPARE(file.state(), RunMarkFile::Held);
        QCOMPARE(file.start(), RunMark::ProgramStart());
        QVERIFY(!QFile::exists(record()));
        QCOMPARE(openFileCount(), before + 1);
    }
    QCOMPARE(openFileCount(), before);
    QVERIFY(!QFile::exists(folder()));
    const std::vector<RunEnd> ends = RunEnds::Of(m_log);
    QCOMPARE(ends.size(), size_t(1));
    QCOMPARE(ends[0].exit, HistoryRun::Normal);
    QCOMPARE(ends[0].start, RunMark::ProgramStart());
    QVERIFY(ends[0].end >= ends[0].start && ends[0].end <= HistoryTime::Now());
    const qint64 now = HistoryTime::Now();
    QVERIFY(RunMark::ProgramStart() <= now && RunMark::ProgramStart() > now - 3600 * 1000);
}

void tst_RunMark::longLife()
{
    const int before = openFileCount();
    {
        const RunMark mark(m_log);
        mark.NoteLongLife();
        const QString path = folder() + '/' + RunMarkFile::NamesIn(folder())[0];
        QCOMPARE(TestFiles::read(path + ".long"), QByteArray(""));
        QVERIFY(QFile::exists(path + ".long"));
        QCOMPARE(openFileCount(), before + 1);
    }
    QVERIFY(!QFile::exists(folder()));
}

// As far as their umask allows; several users may share a log.
void tst_RunMark::everybodyMayReadAndWrite()
{
    const mode_t mask = umask(0);
    const auto rightsOf = [](QString const& path) {
        struct stat status = {};
        return stat(QFile::encodeName(path).constData(), &status) == 0 ? status.st_mode & 07777 : 0;
    };
    {
        const RunMark mark(m_log);
        mark.NoteLongLife();
        const QString path = folder() + '/' + RunMarkFile::NamesIn(folder())[0];
        QCOMPARE(rightsOf(path), mode_t(0666));
        QCOMPARE(rightsOf(path + ".long"), mode_t(0666));
    }
    QCOMPARE(rightsOf(record()), mode_t(0666));
    umask(mask);
}

// A program that was started without one may get its descriptor for any file.
void tst_RunMark::withoutStandardInput()
{
    const int before = openFileCount();
    const int input = ::dup(0);
    ::close(0);
    {
        const RunMark mark(m_log);
        QCOMPARE(RunMarkFile::NamesIn(folder()).size(), 1);
        QVERIFY(::fcntl(0, F_GETFD) >= 0);
    }
    const bool isClosed = ::fcntl(0, F_GETFD) < 0;
    QCOMPARE(RunEnds::Of(m_log).size(), size_t(1));
    {
        const int file = ::open("/dev/null", O_RDONLY); // so that the next ones get it
        const RunMark mark(m_log);
        ::close(file);
        mark.NoteLongLife();
    }
    const bool isStillClosed = ::fcntl(0, F_GETFD) < 0;
    ::dup2(input, 0);
    ::close(input);
    QVERIFY(isClosed && isStillClosed);
    QCOMPARE(RunEnds::Of(m_log).size(), size_t(2));
    QCOMPARE(openFileCount(), before);
}

void tst_RunMark::endsOnceAtExit_data()
{
    QTest::addColumn<bool>("isDeleted");
    QTest::newRow("never deleted") << false;
    QTest::newRow("deleted after all marks were told to end") << true;
}

void tst_RunMark::endsOnceAtExit()
{
    QFETCH(bool, isDeleted);
    const pid_t child = fork();
    if (child == 0) {
        auto mark = std::make_unique<RunMark>(m_log);
        RunMark(m_folder->filePath("logs/other.log")); // does not matter any more
        if (isDeleted)
            s_lastMark = std::move(mark);
        else
            static_cast<void>(mark.release());
        std::exit(0);
    }
    int status = 0;
    QCOMPARE(waitpid(child, &status, 0), child);
#ifndef TEST_UNDER_ADDRESS_SANITIZER // a forked child that never returns to main() leaks
    QCOMPARE(status, 0);
#endif
    QCOMPARE(TestFiles::read(record()).count('\n'), 1);
    QVERIFY(!QFile::exists(folder()));
}

void tst_RunMark::markThatCannotBeWritten()
{
    const int before = openFileCount();
    if (!ProcessLimits::limitFileSize(10))
        QSKIP("the size of files cannot be limited here");
    {
        const RunMark mark(m_log);
        ProcessLimits::unlimitFileSize();
        mark.NoteLongLife();
        QCOMPARE(openFileCount(), before);
        QCOMPARE(QDir(folder()).entryList(QDir::AllEntries | QDir::NoDotAndDotDot), QStringList());
    }
    QVERIFY(!QFile::exists(record()));
}

void tst_RunMark::noLog()
{
    RunMark(QString()).CollectOthers();
    RunMark(m_folder->filePath("app.log")).CollectOthers(); // in no folder "logs"
    QCOMPARE(TestFiles::listing(m_folder->path()), QStringList());
}

void tst_RunMark::noFolder()
{
    QVERIFY(TestFiles::write(folder(), "x"));
    RunMark(m_log).CollectOthers();
    QCOMPARE(TestFiles::listing(m_folder->path()), QStringList("running-app.log: x"));
}

// There is one run, however many marks are asked for.
void tst_RunMark::secondMark()
{
    const int before = openFileCount();
    {
        const RunMark first(m_log);
        {
            const RunMark second(m_log);
            QCOMPARE(RunMarkFile::NamesIn(folder()).size(), 1);
        }
        QCOMPARE(RunMarkFile::NamesIn(folder()).size(), 1);
        QVERIFY(!QFile::exists(record()));
    }
    QCOMPARE(RunEnds::Of(m_log).size(), size_t(1));
    QCOMPARE(openFileCount(), before);
}

void tst_RunMark::othersAreUsingTheFolder()
{
    QVERIFY(LeaveBehind(folder() + "/other.run", RunMark::ProgramStart()));
    {
        const RunMark mark(m_log);
    }
    QCOMPARE(RunMarkFile::NamesIn(folder()), QStringList("other.run"));
}

void tst_RunMark::collects_data()
{
    QTest::addColumn<int>("after"); // milliseconds from the start of this program
    QTest::addColumn<QString>("kind");
    QTest::addColumn<bool>("isCollected");
    QTest::newRow("began before") << -5 << "" << true;
    QTest::newRow("began at the same time") << 0 << "" << true;
    QTest::newRow("began later") << 1 << "" << false;
    QTest::newRow("a copy") << -5 << "copy" << false;
    QTest::newRow("not complete yet") << -5 << "damaged" << false;
}

void tst_RunMark::collects()
{
    QFETCH(int, after);
    QFETCH(QString, kind);
    QFETCH(bool, isCollected);
    const QString other = folder() + "/other.run";
    const qint64 start = RunMark::ProgramStart() + after;
    QVERIFY(LeaveBehind(other, start));
    if (kind == "copy") {
        QVERIFY(QFile::copy(other, other + ".copy"));
        QVERIFY(QFile::remove(other));
        QVERIFY(QFile::rename(other + ".copy", other));
    } else if (kind == "damaged") {
        QVERIFY(TestFiles::write(other, "2026"));
    }
    {
        RunMark mark(m_log);
        mark.CollectOthers();
        QCOMPARE(QFile::exists(other), !isCollected);
        QCOMPARE(TestFiles::read(record()).count('\n'), isCollected ? 1 : 0);
        QCOMPARE(RunMarkFile::NamesIn(folder()).size(), isCollected ? 1 : 2);
    }
    if (isCollected) {
        const RunEnd end = RunEnds::FromLine(TestFiles::read(record()).split('\n')[0]);
        QCOMPARE(end.exit, HistoryRun::Abnormal);
        QCOMPARE(end.start, start);
        QCOMPARE(end.end, RunMark::ProgramStart());
    }
}

// That of their starts, not of their names.
void tst_RunMark::collectsInTheirOrder()
{
    const qint64 start = RunMark::ProgramStart() - 60000;
    QVERIFY(LeaveBehind(folder() + "/1.run", start + 2));
    QVERIFY(LeaveBehind(folder() + "/2.run", start));
    QVERIFY(LeaveBehind(folder() + "/3.run", start + 1));
    RunMark mark(m_log);
    const std::vector<RunEnd> ends = mark.CollectOthers();
    QCOMPARE(ends.size(), size_t(3));
    for (int number = 0; number < 3; ++number)
        QCOMPARE(ends[static_cast<size_t>(number)].start, start + number);
}

// What the mark tells is not lost.
void tst_RunMark::recordThatCannotBeWritten_data()
{
    QTest::addColumn<QString>("target"); // of a link; a folder if empty
    QTest::newRow("folder") << "";
    QTest::newRow("device") << "/dev/null";
    QTest::newRow("full disk") << "/dev/full";
}

void tst_RunMark::recordThatCannotBeWritten()
{
    QFETCH(QString, target);
    const int before = openFileCount();
    QVERIFY(LeaveBehind(folder() + "/other.run", RunMark::ProgramStart() - 5));
    QVERIFY(target.isEmpty() ? QDir().mkpath(record()) : QFile::link(target, record()));
    RunMark(m_log).CollectOthers();
    QCOMPARE(RunMarkFile::NamesIn(folder()), QStringList("other.run"));
    QCOMPARE(openFileCount(), before);
}

void tst_RunMark::recordIsShortened_data()
{
    QTest::addColumn<int>("size");
    QTest::addColumn<bool>("isShortened");
    QTest::newRow("at the limit") << (512 << 10) << false;
    QTest::newRow("above the limit") << (512 << 10) + 1 << true;
    QTest::newRow("above the limit, half of it at the end of a line") << (512 << 10) + 63 << true;
}

// To half of it, from a whole line on.
void tst_RunMark::recordIsShortened()
{
    QFETCH(int, size);
    QFETCH(bool, isShortened);
    QByteArray bytes;
    for (int number = 0; bytes.size() < size; ++number)
        bytes += QByteArray::number(number).rightJustified(63, '.') + '\n';
    bytes.truncate(size);
    QVERIFY(TestFiles::write(record(), bytes));
    RunMark mark(m_log);
    mark.CollectOthers();
    const QByteArray kept = TestFiles::read(record());
    const int start = bytes.indexOf('\n', size - (256 << 10)) + 1;
    QCOMPARE(kept, isShortened ? bytes.mid(start) : bytes);
}

QTEST_GUILESS_MAIN(tst_RunMark)
#include "tst_RunMark.moc"
