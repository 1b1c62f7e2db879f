// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Ends programs in ten ways, and asks those that start next what they are told. How each ended is
// known from who ended it.

#include "app/QuitOnSignal.h"
#include "app/history/RunEnds.h"
#include "app/runninglog/RunMark.h"
#include "plain/Rounds.h"
#include "support/LeftMark.h"

#include <QProcess>
#include <QTemporaryDir>
#include <QtTest>

#include <csignal>
#include <cstdio>
#include <cstdlib>
#include <map>
#include <memory>
#include <random>
#include <set>
#include <sys/resource.h>

using namespace Velocor;

namespace {

constexpr int Patience = 60000; // milliseconds
constexpr int MostAtOnce = 5;   // ends between two starts

enum Kind {
    Returned,
    Exited,
    ToldToEnd,
    TerminalClosed,
    Killed,
    InvalidAccess,
    Aborted,
    ProcessIdInUse,
    Restored,
    StillRunning,
    KindCount
};

bool isAbnormal(int kind)
{
    return kind == Killed || kind == InvalidAccess || kind == Aborted || kind == ProcessIdInUse;
}

// What is known of it from then on.
HistoryRun::Exit exitOf(int kind)
{
    if (kind == Restored)
        return HistoryRun::Unknown;
    return isAbnormal(kind) ? HistoryRun::Abnormal : HistoryRun::Normal;
}

void say(QByteArray const& line)
{
    std::puts(line.constData());
    std::fflush(stdout);
}

// A program with a log, which lives until it reads how to end.
int live(int& argc, char** argv)
{
    const rlimit none = {0, 0};
    ::setrlimit(RLIMIT_CORE, &none);
    const QCoreApplication application(argc, argv);
    const QuitOnSignal quitOnSignal;
    RunMark mark(QString::fromLocal8Bit(argv[2]));
    for (RunEnd const& end : mark.CollectOthers())
        say("told " + QByteArray::number(end.start));
    say("started " + QByteArray::number(RunMark::ProgramStart()));
    char how = 0;
    if (std::scanf("%c", &how) != 1)
        return 1;
    switch (how) {
    case 'e':
        std::exit(0);
    case 's':
        ::raise(SIGSEGV);
        break;
    case 'a':
        std::abort();
    case 'w':
        say("waits");
        return QCoreApplication::exec();
    default:
        break;
    }
    return 0;
}

class Life
{
public:
    explicit Life(QString const& log)
    {
        m_process.start(QCoreApplication::applicationFilePath(), {"live", log});
        for (QByteArray line = next(); !line.isEmpty(); line = next()) {
            if (line.startsWith("told "))
                told.insert(line.mid(5).toLongLong());
            else if (line.startsWith("started "))
                start = line.mid(8).toLongLong();
            if (start >= 0)
                break;
        }
    }

    bool End(int kind, QString const& marks)
    {
        QStringList mine;
        switch (kind) {
        case Exited:
            return End("e");
        case InvalidAccess:
            return End("s");
        case Aborted:
            return End("a");
        case ToldToEnd:
        case StillRunning: // until now
            return End(SIGTERM);
        case TerminalClosed:
            return End(SIGHUP);
        case Killed:
        case ProcessIdInUse:
        case Restored:
            mine = QDir(marks).entryList({QString("%1-*.run").arg(start)});
            m_process.kill();
            if (!m_process.waitForFinished(Patience) || mine.size() != 1)
                return false;
            mine[0].prepend(marks + '/');
            return kind == Killed || (kind == Restored ? LeftMark::restore(mine[0])
                                                       : LeftMark::useProcessIdAgain(mine[0]));
        default:
            return End("r");
        }
    }

    qint64 start = -1;
    std::set<qint64> told; // starts of those that did not end normally

private:
    QByteArray next()
    {
        while (!m_process.canReadLine()) {
            if (!m_process.waitForReadyRead(Patience))
                return QByteArray();
        }
        return m_process.readLine().trimmed();
    }

    bool End(char const* how)
    {
        m_process.write(how);
        m_process.closeWriteChannel();
        return m_process.waitForFinished(Patience);
    }

    bool End(int signal)
    {
        m_process.write("w");
        m_process.closeWriteChannel();
        return next() == "waits" &&
               ::kill(static_cast<pid_t>(m_process.processId()), signal) == 0 &&
               m_process.waitForFinished(Patience) &&
               m_process.exitStatus() == QProcess::NormalExit;
    }

    QProcess m_process;
};

} // namespace

class tst_PlainRunEnds : public QObject
{
    Q_OBJECT

private slots:
    void told();

private:
    void endSome(int count);
    void startNext();
    void compareKnown() const;

    QTemporaryDir m_folder;
    QString m_log = m_folder.filePath("logs/app.log");
    std::mt19937 m_random{Rounds::seed()};
    std::map<qint64, int> m_kinds; // of all starts that are over
    std::set<qint64> m_untold;
    std::vector<std::unique_ptr<Life>> m_running;
    unsigned m_ended = 0; // first one of each kind
    int m_counts[KindCount] = {};
};

// Each next start is told all that did not end normally since the last one, and nothing else.
void tst_PlainRunEnds::told()
{
    const int count = Rounds::count(40, 1000);
    for (int done = 0; done < count;) {
        const int some = std::min(count - done, 1 + static_cast<int>(m_random() % MostAtOnce));
        endSome(some);
        if (!QTest::currentTestFailed())
            startNext();
        if (QTest::currentTestFailed())
            return;
        done += some;
    }
    compareKnown();
    std::printf("ends:");
    for (const int ends : m_counts)
        std::printf(" %d", ends);
    std::printf("\n");
}

// They run at the same time. Nobody is told of a program that is running.
void tst_PlainRunEnds::endSome(int count)
{
    std::vector<std::unique_ptr<Life>> lives;
    for (int i = 0; i < count; ++i) {
        lives.push_back(std::make_unique<Life>(m_log));
        QVERIFY(lives.back()->start >= 0);
        QCOMPARE(lives.back()->told, std::set<qint64>());
    }
    for (std::unique_ptr<Life>& life : lives) {
        const auto kind = static_cast<int>(m_ended < KindCount ? m_ended : m_random() % KindCount);
        ++m_ended;
        ++m_counts[kind];
        if (kind == StillRunning) {
            m_running.push_back(std::move(life));
            continue;
        }
        QVERIFY(life->End(kind, RunEnds::MarkFolderOf(m_log)));
        m_kinds[life->start] = kind;
        if (isAbnormal(kind))
            m_untold.insert(life->start);
    }
}

// It is itself an end of the first kind. Those that were running at that time end after it.
void tst_PlainRunEnds::startNext()
{
    Life next(m_log);
    QCOMPARE(next.told, m_untold);
    m_untold.clear();
    QVERIFY(next.End(Returned, QString()));
    m_kinds[next.start] = Returned;
    for (auto const& life : m_running) {
        QVERIFY(life->End(StillRunning, QString()));
        m_kinds[life->start] = StillRunning;
    }
    m_running.clear();
}

void tst_PlainRunEnds::compareKnown() const
{
    std::map<qint64, HistoryRun::Exit> known;
    for (RunEnd const& end : RunEnds::Of(m_log))
        known[end.start] = end.exit;
    for (auto const& [start, kind] : m_kinds) {
        const auto found = known.find(start);
        QCOMPARE(int(found == known.end() ? HistoryRun::Unknown : found->second),
                 int(exitOf(kind)));
    }
}

int main(int argc, char** argv)
{
    if (argc == 3 && qstrcmp(argv[1], "live") == 0)
        return live(argc, argv);
    const QCoreApplication application(argc, argv);
    tst_PlainRunEnds test;
    return QTest::qExec(&test, argc, argv);
}

#include "tst_PlainRunEnds.moc"
