// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/log/TorkLog.h"
#include "log/LogFolder.h"
#include "support/ChildProcess.h"

#include <QDebug>
#include <QMap>
#include <QRegularExpression>
#include <QtTest>

#include <algorithm>
#include <atomic>
#include <functional>
#include <thread>
#include <vector>

/// Eight threads write at the same time: every entry is whole and none is lost. Built for
/// ThreadSanitizer, the program also fails on every data race;
/// tests/support/ThreadSanitizerMutex.cpp makes Qt's mutexes known to it.
class tst_TorkLogThreads : public QObject
{
    Q_OBJECT

private slots:
    void init();
    void cleanup();

    void entries_data();
    void entries();
    void rotationUnderWay();
    void settingsChangedMeanwhile();
    void everythingElseMeanwhile();
    void oneOperationMeanwhile_data();
    void oneOperationMeanwhile();
    void logsOfTheirOwn();
    void severitiesAreNotExchanged();
    void echo();
    void shutdownMeanwhile();

private:
    QtMessageHandler m_handler;
};

namespace {

const int threadCount = 8;
const int entriesEach = 500;

// Starts all threads at once and waits for them; each is given its number.
void inThreads(std::function<void(int)> const& work)
{
    std::atomic<int> ready{0};
    std::vector<std::thread> threads;
    for (int number = 0; number < threadCount; ++number) {
        threads.emplace_back([&, number] {
            for (++ready; ready < threadCount;)
                std::this_thread::yield();
            work(number);
        });
    }
    for (std::thread& thread : threads)
        thread.join();
}

QString text(int thread, int entry)
{
    // Different lengths, so that torn entries do not fit together by accident.
    return QString("<%1.%2 %3>").arg(thread).arg(entry).arg(QString(thread * 7 + entry % 5, 'x'));
}

QStringList allTexts()
{
    QStringList texts;
    for (int thread = 0; thread < threadCount; ++thread) {
        for (int entry = 0; entry < entriesEach; ++entry)
            texts.append(text(thread, entry));
    }
    texts.sort();
    return texts;
}

// The messages of the entries; the text before each has to match `start`.
QStringList messages(QByteArray const& entries, QString const& start)
{
    const QRegularExpression whole("^" + start + " (<[^<>]*>)$");
    QStringList found;
    QStringList lines = QString::fromLatin1(entries).split('\n');
    if (!lines.takeLast().isEmpty())
        return QStringList("(the last line has no end)");
    for (QString const& line : lines) {
        const QRegularExpressionMatch match = whole.match(line);
        found.append(match.hasMatch() ? match.captured(1) : "(broken) " + line);
    }
    found.sort();
    return found;
}

} // namespace

void tst_TorkLogThreads::init()
{
    m_handler = qInstallMessageHandler(nullptr);
    qInstallMessageHandler(m_handler);
}

void tst_TorkLogThreads::cleanup()
{
    TorkLog::shutdown();
    qInstallMessageHandler(m_handler);
}

void tst_TorkLogThreads::entries_data()
{
    QTest::addColumn<QString>("kind");
    QTest::addColumn<bool>("elapsedTime");
    QTest::addColumn<QString>("start");

    const QString stamp = "\\d{4}-\\d\\d-\\d\\d \\d\\d:\\d\\d:\\d\\d\\.\\d+ ";
    QTest::newRow("entries") << "entry" << false << stamp + "Error";
    QTest::newRow("entries with elapsed time")
        << "entry" << true << stamp + "Error dT:\\[-?\\d+\\]";
    QTest::newRow("ready lines") << "line" << false << "ready";
    QTest::newRow("Qt messages") << "message" << false << stamp + "Warning";
    QTest::newRow("debug streams") << "stream" << true << stamp + "Trace dT:\\[-?\\d+\\]";
}

void tst_TorkLogThreads::entries()
{
    QFETCH(QString, kind);
    QFETCH(bool, elapsedTime);
    QFETCH(QString, start);
    LogFolder folder;
    TorkLog* const log = TorkLog::initialize(folder.logs(), "app", QString(), true);
    log->setLogElapsedTime(elapsedTime);

    inThreads([&](int thread) {
        for (int entry = 0; entry < entriesEach; ++entry) {
            if (kind == "entry")
                log->error(text(thread, entry));
            else if (kind == "line")
                log->write("ready " + text(thread, entry) + '\n');
            else if (kind == "message")
                qWarning("%s", qPrintable(text(thread, entry)));
            else
                qDebug().noquote() << text(thread, entry);
        }
    });
    QCOMPARE(messages(TestFiles::read(folder.logs() + "app.log"), start), allTexts());
}

// Closing makes the next entry reopen the file. Whatever is in it leaves no room for an entry, so
// the file is rotated and each entry is still in one of the files.
void tst_TorkLogThreads::rotationUnderWay()
{
    LogFolder folder;
    TorkLog log;
    log.setOutputPath(folder.logs());
    folder.configure(
        log, {{"filePrefix", "app"}, {"maxLogFileSize", "1"}, {"maxLogFiles", "2147483647"}});

    inThreads([&](int thread) {
        for (int entry = 0; entry < entriesEach; ++entry) {
            log.error(text(thread, entry));
            if (entry % 100 == 99)
                log.close();
        }
    });

    const QStringList files = QDir(folder.logs()).entryList(QDir::Files);
    QVERIFY(files.size() > 1);
    QVERIFY(files.size() <= threadCount * entriesEach / 100 + 1);
    QByteArray entries;
    for (QString const& file : files)
        entries += TestFiles::read(folder.logs() + file);
    QCOMPARE(messages(entries, "T Error"), allTexts());
}

void tst_TorkLogThreads::settingsChangedMeanwhile()
{
    LogFolder folder;
    TorkLog* const log = TorkLog::initialize(folder.logs(), "app", QString(), true);

    inThreads([&](int thread) {
        for (int entry = 0; entry < entriesEach; ++entry) {
            if (thread == 0) {
                log->setLogElapsedTime(entry % 2);
                log->setMaxLogFiles(1 + entry % 9);
                log->setMaxLogFileSize(4000000000u);
            }
            log->error(text(thread, entry));
        }
    });
    QCOMPARE(messages(TestFiles::read(folder.logs() + "app.log"),
                      "[-0-9]+ [:.0-9]+ Error(?: dT:\\[-?\\d+\\])?"),
             allTexts());
}

// Half of the threads write; each of the others keeps calling one of the other operations.
void tst_TorkLogThreads::everythingElseMeanwhile()
{
    LogFolder folder;
    TorkLog* const log = TorkLog::initialize(folder.logs(), "app", QString(), true);
    QVERIFY(log->savePreferences());

    QStringList expected;
    for (int thread = 4; thread < threadCount; ++thread) {
        for (int entry = 0; entry < entriesEach; ++entry)
            expected.append(text(thread, entry));
    }
    std::atomic<int> writers{threadCount - 4};
    inThreads([&](int thread) {
        for (int entry = 0; thread >= 4 && entry < entriesEach; ++entry)
            log->error(text(thread, entry));
        if (thread >= 4)
            --writers;
        while (thread < 4 && writers > 0) {
            if (thread == 0) {
                log->setPreferencesFileName(folder.logs() + "logsettings.cfg");
                log->havePreferencesFile();
                log->setOutputPath(folder.logs());
            } else if (thread == 1) {
                log->errorString();
                log->path();
                log->maxLogFiles();
                log->maxLogFileSize();
            } else if (thread == 2) {
                log->setLogPipeToConsole(false);
                log->setLogElapsedTime(false);
                log->setEnable(true);
                log->enabled();
            } else {
                log->savePreferences();
                log->loadPreferences();
            }
        }
    });

    QStringList found;
    const QStringList lines =
        QString::fromLatin1(TestFiles::read(folder.logs() + "app.log")).split('\n');
    for (QString const& line : lines) {
        if (line.contains(" Error <"))
            found.append(line.mid(line.indexOf('<')));
    }
    found.sort();
    expected.sort();
    QCOMPARE(found, expected);
}

namespace {

// Longer than a stamp that is kept, so that every entry reads the format.
QString longFormat(QChar letter)
{
    return "'" + QString(80, letter) + "'";
}

QString prefixOf(LogFolder const& folder, QChar letter)
{
    return folder.root() + letter + '/';
}

LogFolder::Settings settingsOf(QChar letter)
{
    return {{"dateTimeFormat", longFormat(letter)},
            {"elapsedTimePrefix", QString(80, letter)},
            {"filePrefix", QString(80, letter)},
            {"logElapsedTime", "yes"},
            {"maxLogFiles", letter == 'a' ? "3" : "4"},
            {"maxLogFileSize", letter == 'a' ? "3000" : "4000"}};
}

void dropMessage(QtMsgType, QMessageLogContext const&, QString const&) {}

} // namespace

// In a thread that does nothing else: with a second locked operation it would always be in step
// with the others, and ThreadSanitizer would not see that the first one forgot the lock.
void tst_TorkLogThreads::oneOperationMeanwhile_data()
{
    QTest::addColumn<QString>("operation");

    for (char const* operation :
         {"errorString", "path", "currentLogFile", "preferencesFileName", "dateTimeFormat",
          "elapsedTimePrefix", "filePrefix", "maxLogFiles", "maxLogFileSize", "havePreferencesFile",
          "savePreferences", "setOutputPath", "setPreferencesFileName", "setLogElapsedTime",
          "setEnable", "open", "close", "entry", "ready line"})
        QTest::newRow(operation) << operation;
}

// The settings alternate between those of a and those of b: everything is of one of the two.
void tst_TorkLogThreads::oneOperationMeanwhile()
{
    QFETCH(QString, operation);
    LogFolder folder;
    for (char letter : {'a', 'b'}) {
        QVERIFY(TestFiles::write(prefixOf(folder, letter) + "settings",
                                 LogFolder::settingsText(settingsOf(letter))));
    }
    TorkLog log(prefixOf(folder, 'a'));
    log.setPreferencesFileName(prefixOf(folder, 'a') + "settings");
    QVERIFY(log.loadPreferences());
    const QString notAFile = folder.root();
    QVERIFY(!log.open(notAFile));
    const QString reason = log.errorString();
    QVERIFY(!reason.isEmpty());
    qInstallMessageHandler(dropMessage); // a load tells about itself

    using Operation = std::function<QString()>;
    const auto done = [] {
        return QString();
    };
    const QMap<QString, Operation> operations = {
        {"errorString",
         [&] {
             return log.errorString();
         }},
        {"path",
         [&] {
             return log.path();
         }},
        {"currentLogFile",
         [&] {
             return log.currentLogFile();
         }},
        {"preferencesFileName",
         [&] {
             return log.preferencesFileName();
         }},
        {"dateTimeFormat",
         [&] {
             return log.dateTimeFormat();
         }},
        {"elapsedTimePrefix",
         [&] {
             return log.elapsedTimePrefix();
         }},
        {"filePrefix",
         [&] {
             return log.filePrefix();
         }},
        {"maxLogFiles",
         [&] {
             return QString::number(log.maxLogFiles());
         }},
        {"maxLogFileSize",
         [&] {
             return QString::number(log.maxLogFileSize());
         }},
        {"havePreferencesFile",
         [&] {
             return log.havePreferencesFile() ? QString() : "none";
         }},
        {"savePreferences",
         [&] {
             return log.savePreferences() ? done() : "not saved";
         }},
        {"setOutputPath",
         [&] {
             return log.setOutputPath(prefixOf(folder, 'b')), done();
         }},
        {"setPreferencesFileName",
         [&] {
             log.setPreferencesFileName(prefixOf(folder, 'b') + "settings");
             return done();
         }},
        {"setLogElapsedTime",
         [&] {
             return log.setLogElapsedTime(true), done();
         }},
        {"setEnable",
         [&] {
             return log.setEnable(true), done();
         }},
        {"open",
         [&] {
             return log.open(notAFile) ? "opened" : done();
         }},
        {"close",
         [&] {
             return log.close(), done();
         }},
        {"entry",
         [&] {
             return log.trace("entry"), done();
         }},
        {"ready line",
         [&] {
             return log.write(QStringLiteral("line\n")), done();
         }},
    };
    QStringList expected = {QString(), reason};
    for (char letter : {'a', 'b'}) {
        const QString own = prefixOf(folder, letter);
        const LogFolder::Settings settings = settingsOf(letter);
        for (char file : {'a', 'b'})
            expected << own + settingsOf(file).value("filePrefix") + ".log";
        expected << own << own + "settings";
        expected += settings.values();
    }

    // What one thread lets go of, Qt's own code may free in another, which ThreadSanitizer cannot
    // follow: all results stay until the end.
    QStringList results;
    const int mostRounds = 3000;
    std::atomic<int> rounds{40};
    inThreads([&](int thread) {
        for (int round = 0; rounds > 0 && thread < 6; ++round) {
            if (thread != 1 && round == mostRounds)
                break; // the lock is not fair, and the settings must be loaded
            const char letter = round % 2 ? 'b' : 'a';
            if (thread == 0) {
                results.append(operations[operation]());
            } else if (thread == 1) {
                log.setPreferencesFileName(prefixOf(folder, letter) + "settings");
                log.loadPreferences();
                --rounds;
            } else if (thread == 2) {
                log.setOutputPath(prefixOf(folder, letter));
                log.open(notAFile);
            } else if (thread == 3) {
                log.close();
            } else {
                log.trace(QStringLiteral("entry"));
            }
        }
    });
    results.removeDuplicates();
    for (QString const& result : results)
        QVERIFY2(expected.contains(result), qPrintable(result));
}

// Logs that know nothing of one another share the stamps that a thread keeps.
void tst_TorkLogThreads::logsOfTheirOwn()
{
    LogFolder folder;
    std::atomic<int> wrong{0};
    inThreads([&](int thread) {
        const QString logs = folder.root() + QString::number(thread) + '/';
        for (int round = 0; round < 50; ++round) {
            TorkLog log(logs);
            log.setEnable(true);
            log.write(QStringLiteral("line\n"));
            if (TestFiles::read(logs + ".log") != "line\n")
                ++wrong;
        }
    });
    QCOMPARE(wrong.load(), 0);
}

void tst_TorkLogThreads::severitiesAreNotExchanged()
{
    const QStringList severities = {"Trace", "Notification", "Warning", "Error", "Fatal"};
    LogFolder folder;
    TorkLog* const log = TorkLog::initialize(folder.logs(), "app", QString(), true);
    inThreads([&](int thread) {
        for (int entry = 0; entry < entriesEach; ++entry)
            log->write(thread % 5, text(thread, entry));
    });

    const QStringList lines =
        QString::fromLatin1(TestFiles::read(folder.logs() + "app.log")).split('\n');
    const QRegularExpression parts("^[-0-9]+ [:.0-9]+ ([A-Z][a-z]+) <(\\d)");
    QCOMPARE(lines.size(), threadCount * entriesEach + 1);
    for (int i = 0; i < lines.size() - 1; ++i) {
        const QRegularExpressionMatch match = parts.match(lines[i]);
        QCOMPARE(match.captured(1), severities.value(match.captured(2).toInt() % 5));
    }
}

namespace {

// Half of the threads write entries that are echoed, half raise messages.
int echoes(QStringList const& arguments)
{
    TorkLog* const log =
        TorkLog::initialize(arguments.at(0), QStringLiteral("app"), QString(), true);
    log->setLogPipeToConsole(true);
    inThreads([&](int thread) {
        for (int entry = 0; entry < entriesEach; ++entry) {
            if (thread % 2)
                log->error(text(thread, entry));
            else
                qWarning("%s", qPrintable(text(thread, entry)));
        }
    });
    return 0;
}

} // namespace

// Nothing is lost between log and console: a message that finds the handler removed goes to the
// console alone.
void tst_TorkLogThreads::echo()
{
    LogFolder folder;
    const ChildProcess::Result child = ChildProcess::run("echo", {folder.logs()});
    QVERIFY2(child.ended(), child.report());

    const QStringList logged =
        messages(TestFiles::read(folder.logs() + "app.log"), "[-0-9]+ [:.0-9]+ (?:Error|Warning)");
    QStringList echoed;
    QStringList alone;
    QStringList lines = QString::fromLocal8Bit(child.errors).split('\n');
    QVERIFY(lines.takeLast().isEmpty());
    const QRegularExpression quoted("^\"[-0-9]+ [:.0-9]+ (?:Error|Warning) (<[^<>]*>)\\\\n\"$");
    for (QString const& line : lines) {
        const QRegularExpressionMatch match = quoted.match(line);
        if (match.hasMatch())
            echoed.append(match.captured(1));
        else
            alone.append(line);
    }
    echoed.sort();
    QCOMPARE(echoed, logged);
    QStringList all = logged + alone;
    all.sort();
    QCOMPARE(all, allTexts());
}

// Messages find the log or no log, nothing in between.
void tst_TorkLogThreads::shutdownMeanwhile()
{
    LogFolder folder;
    TorkLog::initialize(folder.logs(), "app", QString(), true);
    inThreads([&](int thread) {
        for (int entry = 0; entry < entriesEach; ++entry) {
            if (thread == 0 && entry == entriesEach / 2)
                TorkLog::shutdown();
            else
                qWarning("%s", qPrintable(text(thread, entry)));
        }
    });
    QVERIFY(!TorkLog::logger());

    QStringList written =
        messages(TestFiles::read(folder.logs() + "app.log"), "[-0-9]+ [:.0-9]+ Warning");
    QVERIFY(written.size() >= entriesEach / 2);
    const QStringList all = allTexts();
    for (QString const& message : written)
        QVERIFY2(std::binary_search(all.begin(), all.end(), message), qPrintable(message));
    QCOMPARE(written.removeDuplicates(), 0);
}

int main(int argc, char** argv)
{
    // Without a time zone in the environment the C library rereads the system's for every local
    // time, under a lock that ThreadSanitizer does not see.
    qputenv("TZ", "UTC");
    QDateTime::currentDateTime().toString();

    return ChildProcess::main<tst_TorkLogThreads>(argc, argv, {{"echo", echoes}});
}

#include "tst_TorkLogThreads.moc"
