// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Many threads write at full speed in every possible way, and one writes for a day.
//
//     VELOCOR_ENTRIES      entries of each of the 16 threads
//     VELOCOR_DAY_ENTRIES  entries of the day

#include "common/config/TorkConfigFile.h"
#include "common/log/TorkLog.h"
#include "log/LogFolder.h"
#include "reliability/Figures.h"
#include "support/Sanitizers.h"

#include <QDebug>
#include <QtTest>

#include <algorithm>
#include <array>
#include <atomic>
#include <thread>
#include <vector>

#ifdef __GLIBC__
#include <malloc.h>
#endif

class tst_Load : public QObject
{
    Q_OBJECT

private slots:
    void init();
    void cleanup();

    void threads_data();
    void threads();
    void aDayLeaksNothing();
    void cleanupTestCase();

private:
    QtMessageHandler m_handler = nullptr;
    bool m_failed = false;
};

namespace {

const int threadCount = 16;

quint64 s_written = 0;
int s_rotations = 0;

int entriesEach()
{
    return Figures::wanted("VELOCOR_ENTRIES", 1000);
}

// A log that writes the letter T for the time stamp.
TorkLog* startLog(LogFolder const& folder, QString const& maxLogFileSize)
{
    const LogFolder::Settings settings = {{"filePrefix", "app"},
                                          {"dateTimeFormat", "'T'"},
                                          {"maxLogFiles", "100000"},
                                          {"maxLogFileSize", maxLogFileSize}};
    TestFiles::write(folder.settingsFile(), LogFolder::settingsText(settings));
    // Off until the settings are loaded, so that loading them is not traced into the file.
    return TorkLog::initialize(folder.logs(), "app", folder.settingsFile(), false);
}

// Different lengths, so that torn entries do not fit together by accident.
QByteArray text(int thread, int entry)
{
    return '<' + QByteArray::number(thread) + '.' + QByteArray::number(entry) + ' ' +
           QByteArray((thread * 7 + entry * 3) % 90, static_cast<char>('a' + thread)) + '>';
}

QByteArray line(int thread, int entry)
{
    static const std::array<QByteArray, 4> starts = {"T Error ", "ready ", "T Warning ",
                                                     "T Trace "};
    return starts[static_cast<size_t>(entry) % 4] + text(thread, entry) + '\n';
}

void write(TorkLog& log, int thread, int entry)
{
    const QByteArray message = text(thread, entry);
    switch (entry % 4) {
    case 0:
        log.error(QString::fromLatin1(message));
        break;
    case 1:
        log.write("ready " + QString::fromLatin1(message) + '\n');
        break;
    case 2:
        qWarning("%s", message.constData());
        break;
    default:
        qDebug().noquote() << QString::fromLatin1(message);
    }
}

// Starts all threads at once and waits for them.
void inThreads(TorkLog& log, int reopenings)
{
    const int entries = entriesEach();
    const int between = reopenings ? std::max(1, entries / reopenings) : entries;
    std::atomic<int> ready{0};
    std::vector<std::thread> threads;
    for (int thread = 0; thread < threadCount; ++thread) {
        threads.emplace_back([&, thread] {
            for (++ready; ready < threadCount;)
                std::this_thread::yield();
            for (int entry = 0; entry < entries; ++entry) {
                write(log, thread, entry);
                if (thread == 0 && reopenings && entry % between == between - 1)
                    log.close();
            }
        });
    }
    for (std::thread& thread : threads)
        thread.join();
}

// The log files, oldest first.
QStringList filesIn(QString const& logs)
{
    QList<int> numbers;
    const QStringList names = QDir(logs).entryList({"app.log.*"}, QDir::Files);
    for (QString const& name : names)
        numbers.append(name.section('.', -1).toInt());
    std::sort(numbers.begin(), numbers.end(), std::greater<int>());

    QStringList files;
    for (int number : numbers)
        files.append(logs + "app.log." + QString::number(number));
    return files << logs + "app.log";
}

// Every line is a whole entry, and the next one of its thread, so none is lost and none is
// duplicated.
class Counter
{
public:
    // False at the first line that is not.
    bool take(QString const& path)
    {
        QFile file(path);
        if (!file.open(QIODevice::ReadOnly))
            return false;
        while (!file.atEnd()) {
            last = file.readLine();
            const int start = last.indexOf('<');
            const int dot = last.indexOf('.', start);
            const int thread = last.mid(start + 1, dot - start - 1).toInt();
            if (start < 0 || thread < 0 || thread >= threadCount)
                return false;
            int& entry = next[static_cast<size_t>(thread)];
            if (last != line(thread, entry))
                return false;
            ++entry;
        }
        return true;
    }

    std::array<int, threadCount> next{};
    QByteArray last;
};

} // namespace

void tst_Load::init()
{
    m_handler = qInstallMessageHandler(nullptr);
    qInstallMessageHandler(m_handler);
}

void tst_Load::cleanup()
{
    TorkLog::shutdown();
    qInstallMessageHandler(m_handler);
    m_failed = m_failed || QTest::currentTestFailed();
}

void tst_Load::threads_data()
{
    QTest::addColumn<QString>("maxLogFileSize");
    QTest::addColumn<int>("reopenings");

    QTest::newRow("large limit") << "2000000000" << 0;
    QTest::newRow("small limit, and the file stays open") << "2048" << 0;
    QTest::newRow("small limit, and the file is reopened") << "1" << 40;
}

void tst_Load::threads()
{
    QFETCH(QString, maxLogFileSize);
    QFETCH(int, reopenings);
    LogFolder folder;
    TorkLog* const log = startLog(folder, maxLogFileSize);
    inThreads(*log, reopenings);
    TorkLog::shutdown();

    Counter counter;
    const QStringList files = filesIn(folder.logs());
    for (QString const& file : files)
        QVERIFY2(counter.take(file), file.toLocal8Bit() + ": " + counter.last);
    for (int entries : counter.next)
        QCOMPARE(entries, entriesEach());
    QVERIFY(reopenings ? files.size() > 1 : files.size() == 1);
    s_written += static_cast<quint64>(threadCount) * static_cast<quint64>(entriesEach());
    s_rotations += files.size() - 1;
}

namespace {

// Bytes in use; -1 where the heap does not report them.
qint64 heapInUse()
{
#if defined(TEST_UNDER_ADDRESS_SANITIZER) || defined(TEST_UNDER_THREAD_SANITIZER)
    return -1;
#elif defined(__GLIBC__) && __GLIBC_PREREQ(2, 33)
    const struct mallinfo2 info = mallinfo2();
    return static_cast<qint64>(info.uordblks + info.hblkhd);
#else
    return -1;
#endif
}

void writeFor(TorkLog& log, TorkConfigFile& configuration, int entries)
{
    for (int entry = 0; entry < entries; ++entry) {
        write(log, entry % 90, entry);
        if (entry % 1000 == 999) {
            configuration.WriteItem("state", "entry", entry);
            configuration.Save();
            configuration.Load();
        }
    }
}

} // namespace

// The first entries are not counted: they allocate the buffers that stay. These may still grow a
// little, but not with the number of entries.
void tst_Load::aDayLeaksNothing()
{
    if (heapInUse() < 0)
        QSKIP("This system does not report heap usage.");

    const int entries = Figures::wanted("VELOCOR_DAY_ENTRIES", 86400);
    LogFolder folder;
    TorkLog* const log = startLog(folder, "1000000");
    TorkConfigFile configuration(folder.root() + "viewer.cfg");
    writeFor(*log, configuration, 2000);

    const qint64 start = heapInUse();
    writeFor(*log, configuration, entries);
    const qint64 end = heapInUse();
    QVERIFY2(end <= start + 4096, qPrintable(QString("%1, then %2").arg(start).arg(end)));
    Figures::print(QString("memory: %1 entries in a row, %2 bytes of the heap in use before, %3 "
                           "after")
                       .arg(entries)
                       .arg(start)
                       .arg(end));
}

void tst_Load::cleanupTestCase()
{
    if (!m_failed && s_written > 0)
        Figures::print(QString("load: %1 threads, %2 entries each, %3 in all with %4 rotations "
                               "meanwhile: every line whole, none lost, none twice, each thread's "
                               "in order")
                           .arg(threadCount)
                           .arg(entriesEach())
                           .arg(s_written)
                           .arg(s_rotations));
}

int main(int argc, char** argv)
{
    // Without a time zone in the environment the C library rereads the system's for every local
    // time, under a lock that ThreadSanitizer does not see.
    qputenv("TZ", "UTC");
    QDateTime::currentDateTime().toString();

    QCoreApplication application(argc, argv);
    tst_Load test;
    return QTest::qExec(&test, argc, argv);
}

#include "tst_Load.moc"
