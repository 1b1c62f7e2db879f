// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/log/TorkLog.h"
#include "log/LogFileTest.h"
#include "log/LogFolder.h"
#include "support/ChildProcess.h"
#include "support/TestFiles.h"

#include <QRegularExpression>
#include <QtTest>

#include <atomic>
#include <fcntl.h>
#include <sys/wait.h>
#include <thread>
#include <unistd.h>

using namespace LogFileTest;

class tst_TorkLogSharing : public QObject
{
    Q_OBJECT

private slots:
    void init();
    void cleanup();

    void handedOutFileIsKept_data();
    void handedOutFileIsKept();
    void forkedProcesses_data();
    void forkedProcesses();
    void forkWhileOtherThreadsLog();
    void childOfAChild();
    void cutDownByAnotherLog();
    void twoProcesses();
    void anotherProgramAtWork();

private:
    QString m_workingDirectory;
};

void tst_TorkLogSharing::init()
{
    m_workingDirectory = QDir::currentPath();
}

void tst_TorkLogSharing::cleanup()
{
    QDir::setCurrent(m_workingDirectory);
}

// Whoever was given the file object seeks and writes with it, whenever that was.
void tst_TorkLogSharing::handedOutFileIsKept_data()
{
    QTest::addColumn<bool>("reopens");

    QTest::newRow("while it stays open") << false;
    QTest::newRow("over close() and the next opening") << true;
}

void tst_TorkLogSharing::handedOutFileIsKept()
{
    QFETCH(bool, reopens);
    LogFolder folder;
    TorkLog log;
    folder.prepare(log, "app");
    log.write(QStringLiteral("0123456789\n"));
    QFile* const file = log.locateLogFile("x");
    if (reopens) {
        QVERIFY(log.close());
        log.write(QStringLiteral("0123456789\n"));
    }

    QCOMPARE(file->pos(), 11);
    QVERIFY(file->seek(3));
    log.write(QStringLiteral("abc"));
    QCOMPARE(file->pos(), 6);
    QCOMPARE(TestFiles::read(folder.logs() + "app.log"), QByteArray("012abc6789\n"));

    QCOMPARE(file->read(2), QByteArray("67"));
    log.write(QStringLiteral("X"));
    QCOMPARE(TestFiles::read(folder.logs() + "app.log"), QByteArray("012abc67X9\n"));

    // A gap that its holder asks for is his.
    QVERIFY(file->seek(13));
    log.write(QStringLiteral("z\n"));
    QCOMPARE(TestFiles::read(folder.logs() + "app.log"), QByteArray("012abc67X9\n\0\0z\n", 15));
}

namespace {

// The lines of a file that are no line of these writers, and those of theirs that are missing.
QStringList wrongLines(QByteArray const& content, QByteArray const& writers)
{
    QStringList wrong;
    QStringList lines = QString::fromLatin1(content).split('\n');
    if (!lines.takeLast().isEmpty())
        wrong.append("(the last line has no end)");
    QMap<QString, int> counts;
    for (QString const& line : lines)
        ++counts[line + '\n'];
    for (char writer : writers) {
        for (int i = 0; i < linesEach; ++i) {
            if (counts.take(lineOf(writer, i)) != 1)
                wrong.append("(missing or twice) " + lineOf(writer, i));
        }
    }
    return wrong + QStringList(counts.keys());
}

// Parent and child write to the file that the parent has opened.
int writesInParentAndChild(QStringList const& arguments)
{
    TorkLog log(arguments.at(0));
    log.setEnable(true);
    if (arguments.at(1) == "small limit")
        log.setMaxLogFileSize(0);
    if (arguments.at(2) == "handed out")
        log.locateLogFile(QString());
    log.write(QString());

    const pid_t child = fork();
    const char writer = child == 0 ? 'c' : 'p';
    for (int i = 0; i < linesEach; ++i)
        log.write(lineOf(writer, i));
    if (child == 0)
        _exit(0);
    int status = 0;
    return child > 0 && waitpid(child, &status, 0) == child && status == 0 ? 0 : 1;
}

constexpr int forkCount = 200;

// The alarm kills a child that waits for a lock which nobody releases; on a busy machine it may
// also wait long for its turn.
void logInChild(int number)
{
    alarm(60);
    TorkLog::m_gLog->trace(QString("<child %1 entry>").arg(number));
    qDebug("<child %d message>", number);
    TorkLog::shutdown();
    _exit(0);
}

int forksWhileOtherThreadsLog(QStringList const& arguments)
{
    TorkLog::initialize(arguments.at(0), "app", QString(), true);
    // Opens the file, which children can share only then, and lets Qt set its messages up.
    qDebug("<parent>");
    std::atomic<bool> isOver{false};
    std::thread one([&] {
        while (!isOver)
            TorkLog::m_gLog->trace(QStringLiteral("<parent>"));
    });
    std::thread two([&] {
        while (!isOver)
            qDebug("<parent>");
    });

    int failed = 0;
    for (int number = 0; number < forkCount && failed == 0; ++number) {
        const pid_t child = fork();
        if (child == 0)
            logInChild(number);
        int status = 0;
        if (child < 0 || waitpid(child, &status, 0) != child || status != 0)
            ++failed;
    }

    isOver = true;
    one.join();
    two.join();
    TorkLog::shutdown();
    return failed;
}

int forksTwice(QStringList const& arguments)
{
    TorkLog::initialize(arguments.at(0), "app", QString(), true);
    qDebug("<parent>");
    const pid_t child = fork();
    if (child == 0) {
        const pid_t grandchild = fork();
        if (grandchild == 0)
            logInChild(2);
        int status = 0;
        if (waitpid(grandchild, &status, 0) != grandchild || status != 0)
            _exit(1);
        logInChild(1);
    }
    int status = 0;
    const bool isWell = waitpid(child, &status, 0) == child && status == 0;
    TorkLog::shutdown();
    return isWell ? 0 : 1;
}

int writesAlone(QStringList const& arguments)
{
    TorkLog log(arguments.at(0));
    log.setEnable(true);
    log.setMaxLogFileSize(0);
    const char writer = arguments.at(1).at(0).toLatin1();
    for (int i = 0; i < 40 * linesEach; ++i)
        log.write(lineOf(writer, i % linesEach));
    return 0;
}

int writesOnce(QStringList const& arguments)
{
    TorkLog log(arguments.at(0));
    log.setEnable(true);
    log.write(QStringLiteral("x\n"));
    return 0;
}

} // namespace

void tst_TorkLogSharing::forkedProcesses_data()
{
    QTest::addColumn<QString>("limit");
    QTest::addColumn<QString>("handedOut");

    QTest::newRow("usual limit") << "usual limit"
                                 << "kept";
    QTest::newRow("small limit") << "small limit"
                                 << "kept";
    QTest::newRow("usual limit, file handed out") << "usual limit"
                                                  << "handed out";
    QTest::newRow("small limit, file handed out") << "small limit"
                                                  << "handed out";
}

void tst_TorkLogSharing::forkedProcesses()
{
    QFETCH(QString, limit);
    QFETCH(QString, handedOut);
    LogFolder folder;
    const ChildProcess::Result child =
        ChildProcess::run("parent and child", {folder.logs(), limit, handedOut});
    QVERIFY2(child.ended(), child.report());
    QCOMPARE(wrongLines(TestFiles::read(folder.logs() + ".log"), "pc"), QStringList());
}

// The first child's locks are new, and may be locked and released again.
void tst_TorkLogSharing::childOfAChild()
{
    LogFolder folder;
    const ChildProcess::Result child = ChildProcess::run("forks twice", {folder.logs()});
    QVERIFY2(child.ended(), child.report());
    const QByteArray log = TestFiles::read(folder.logs() + "app.log");
    for (char const* entry : {"<parent>", "<child 2 entry>", "<child 2 message>", "<child 1 entry>",
                              "<child 1 message>"})
        QCOMPARE(log.count(entry), 1);
}

// A child has only the thread that forked it: nobody there would release what others had locked.
void tst_TorkLogSharing::forkWhileOtherThreadsLog()
{
    LogFolder folder;
    const ChildProcess::Result child =
        ChildProcess::run("forks", {folder.logs()}, QString(), 240000);
    QVERIFY2(child.ended(), child.report());

    const QRegularExpression whole("^[-0-9]{10} [:0-9]{8}\\.[0-9]+ Trace (<[^<>]*>)$");
    QMap<QString, int> counts;
    QStringList wrong;
    QFile file(folder.logs() + "app.log");
    QVERIFY(file.open(QIODevice::ReadOnly));
    while (!file.atEnd()) {
        const QString line = QString::fromLatin1(file.readLine());
        const QRegularExpressionMatch match = whole.match(line);
        if (!match.hasMatch() || !line.endsWith('\n'))
            wrong.append(line);
        ++counts[match.captured(1)];
    }
    QCOMPARE(wrong, QStringList());
    for (int number = 0; number < forkCount; ++number) {
        QCOMPARE(counts.value(QString("<child %1 entry>").arg(number)), 1);
        QCOMPARE(counts.value(QString("<child %1 message>").arg(number)), 1);
    }
}

// Two logs on one file are no good, but the one that finds the file shorter leaves no gap.
void tst_TorkLogSharing::cutDownByAnotherLog()
{
    LogFolder folder;
    TorkLog one;
    TorkLog two;
    folder.prepare(one, "app", 40);
    folder.prepare(two, "app", 40);
    one.write(QStringLiteral("1\n"));
    for (int i = 0; i < 10; ++i)
        two.write(QStringLiteral("22222222\n"));
    one.write(QString(84, '1') + '\n'); // trims what the other one wrote
    two.write(QStringLiteral("2\n"));

    const QByteArray content = TestFiles::read(folder.logs() + "app.log");
    QCOMPARE(content.count('\0'), 0);
    QCOMPARE(content, QByteArray(84, '1') + "\n2\n");
}

void tst_TorkLogSharing::twoProcesses()
{
    LogFolder folder;
    ChildProcess::Result results[2];
    std::thread other([&] { results[0] = ChildProcess::run("alone", {folder.logs(), "a"}); });
    results[1] = ChildProcess::run("alone", {folder.logs(), "b"});
    other.join();
    for (ChildProcess::Result const& result : results)
        QVERIFY2(result.ended(), result.report());

    QByteArray content = TestFiles::read(folder.logs() + ".log");
    QVERIFY(content.size() > 2048);
    QCOMPARE(content.count('\0'), 0);
}

// Nobody waits for the one that writes over the old content, or trims it, and nobody takes the file
// away under it.
void tst_TorkLogSharing::anotherProgramAtWork()
{
    LogFolder folder;
    const QString name = folder.logs() + ".log";
    populate(folder.logs(), {".log: old\nold\n"});
    QFile file(name);
    QVERIFY(file.open(QIODevice::ReadWrite));
    struct flock whole = {};
    whole.l_type = F_WRLCK;
    QCOMPARE(fcntl(file.handle(), F_SETLK, &whole), 0);

    const ChildProcess::Result during = ChildProcess::run("once", {folder.logs()});
    QVERIFY2(during.ended(), during.report());
    QCOMPARE(file.readAll(), QByteArray("old\nold\nx\n"));

    file.close();
    const ChildProcess::Result after = ChildProcess::run("once", {folder.logs()});
    QVERIFY2(after.ended(), after.report());
    QCOMPARE(TestFiles::read(name), QByteArray("x\nd\nold\nx\n"));
}

int main(int argc, char** argv)
{
    return ChildProcess::main<tst_TorkLogSharing>(argc, argv,
                                                  {{"parent and child", writesInParentAndChild},
                                                   {"forks", forksWhileOtherThreadsLog},
                                                   {"forks twice", forksTwice},
                                                   {"alone", writesAlone},
                                                   {"once", writesOnce}});
}

#include "tst_TorkLogSharing.moc"
