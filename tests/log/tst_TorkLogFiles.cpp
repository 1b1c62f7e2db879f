// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/log/TorkLog.h"
#include "log/LogFolder.h"
#include "support/ChildProcess.h"
#include "support/MessageCapture.h"
#include "support/PrivateField.h"
#include "support/ProcessLimits.h"
#include "support/TestFiles.h"

#include <QRegularExpression>
#include <QtTest>

#include <cstdio>
#include <fcntl.h>
#include <sys/socket.h>
#include <sys/stat.h>
#include <sys/un.h>
#include <sys/wait.h>
#include <thread>
#include <unistd.h>

class tst_TorkLogFiles : public QObject
{
    Q_OBJECT

private slots:
    void init();
    void cleanup();

    void names_data();
    void names();
    void namesWithoutPrefix();
    void namesWithoutExtension();
    void nameBuffersAreOverwritten();
    void currentLogFileIsTheOpenOne();

    void openCreatesTheFile();
    void openWritesOverTheStart();
    void openClosesTheFileBefore();
    void openFails_data();
    void openFails();
    void openKeepsTheLastReason();
    void closeTellsWhetherOpen();
    void destructorClosesTheFile();

    void directory_data();
    void directory();
    void emptyPathIsTheWorkingDirectory();
    void locateReturnsTheCurrentFile_data();
    void locateReturnsTheCurrentFile();
    void locateReturnsTheFileWhereEntriesEnd();
    void locateReturnsNullWithoutFile();
    void sizeLimitOnOpening_data();
    void sizeLimitOnOpening();
    void openEmptyFileTakesAnything();
    void growsWhileOpen();
    void closedFileIsRotatedOnReopening();
    void trimming_data();
    void trimming();

    void rotation_data();
    void rotation();
    void rotationWithoutFinalSlash_data();
    void rotationWithoutFinalSlash();
    void rotationInOddDirectories_data();
    void rotationInOddDirectories();
    void onlyOwnFiles_data();
    void onlyOwnFiles();
    void neighboursAloneAreNotTheLog_data();
    void neighboursAloneAreNotTheLog();

    void hiddenNames_data();
    void hiddenNames();
    void pruningGoesByName_data();
    void pruningGoesByName();
    void unfinishedCopies_data();
    void unfinishedCopies();

    void handedOutFileIsKept_data();
    void handedOutFileIsKept();
    void forkedProcesses_data();
    void forkedProcesses();
    void cutDownByAnotherLog();
    void twoProcesses();
    void anotherProgramAtWork();
    void notAFile_data();
    void notAFile();
    void pipesInPlaceOfFiles_data();
    void pipesInPlaceOfFiles();
    void nullDevice();

    void fileInPlaceOfDirectory();
    void directoryInPlaceOfFile();
    void directoryRemovedWhileOpen();
    void triesAgainAfterFailure();
    void withoutPermission_data();
    void withoutPermission();
    void diskFull_data();
    void diskFull();
    void fullFileSystem();

private:
    QString m_workingDirectory;
};

struct Extension
{
    using Field = QString TorkLog::*;
    friend Field privateField(Extension);
};
template struct PrivateField<Extension, &TorkLog::m_fileExtension>;

namespace {

// Makes what TestFiles::listing() would show.
void populate(QString const& folder, QStringList const& entries)
{
    for (QString const& entry : entries) {
        const int colon = entry.indexOf(": ");
        if (colon == -1)
            QVERIFY2(QDir().mkpath(folder + entry), qPrintable(entry));
        else
            QVERIFY2(TestFiles::write(folder + entry.left(colon), entry.mid(colon + 2).toLatin1()),
                     qPrintable(entry));
    }
}

// The reason that the toolkit itself gives.
QString reasonNotToOpen(QString const& path)
{
    QFile file(path);
    const bool opened = file.open(QIODevice::ReadWrite | QIODevice::Text);
    return opened ? QString() : file.errorString();
}

int openFileCount()
{
    return QDir("/proc/self/fd").entryList(QDir::AllEntries | QDir::System).size();
}

// A limit that every current file is beyond.
const unsigned int tight = 1;

} // namespace

void tst_TorkLogFiles::init()
{
    m_workingDirectory = QDir::currentPath();
}

void tst_TorkLogFiles::cleanup()
{
    QDir::setCurrent(m_workingDirectory);
}

void tst_TorkLogFiles::names_data()
{
    QTest::addColumn<QString>("path");
    QTest::addColumn<QString>("prefix");
    QTest::addColumn<QString>("current");
    QTest::addColumn<QString>("older");
    QTest::addColumn<QString>("full");

    QTest::newRow("path with a final slash") << "/x/logs/"
                                             << "logdata"
                                             << "logdata.log"
                                             << "logdata.log.*"
                                             << "/x/logs/logdata.log";
    QTest::newRow("path without one gets it") << "/x/logs"
                                              << "logdata"
                                              << "logdata.log"
                                              << "logdata.log.*"
                                              << "/x/logs/logdata.log";
    QTest::newRow("empty path gets none") << ""
                                          << "logdata"
                                          << "logdata.log"
                                          << "logdata.log.*"
                                          << "logdata.log";
    QTest::newRow("root directory") << "/"
                                    << "app"
                                    << "app.log"
                                    << "app.log.*"
                                    << "/app.log";
    QTest::newRow("relative path") << "x"
                                   << "app"
                                   << "app.log"
                                   << "app.log.*"
                                   << "x/app.log";
    QTest::newRow("path is not cleaned") << "/x//../y/./"
                                         << "app"
                                         << "app.log"
                                         << "app.log.*"
                                         << "/x//../y/./app.log";
    QTest::newRow("prefix with a dot") << "/x/"
                                       << "app.v2"
                                       << "app.v2.log"
                                       << "app.v2.log.*"
                                       << "/x/app.v2.log";
    QTest::newRow("prefix with a blank") << "/x/"
                                         << "my app"
                                         << "my app.log"
                                         << "my app.log.*"
                                         << "/x/my app.log";
    QTest::newRow("prefix with a marker") << "/x/"
                                          << "100%1"
                                          << "100%1.log"
                                          << "100%1.log.*"
                                          << "/x/100%1.log";
    QTest::newRow("path with a marker") << "/a%1b/"
                                        << "app"
                                        << "app.log"
                                        << "app.log.*"
                                        << "/a%1b/app.log";
    QTest::newRow("letters beyond ASCII")
        << QString::fromUtf8("/日誌/") << QString::fromUtf8("Büro") << QString::fromUtf8("Büro.log")
        << QString::fromUtf8("Büro.log.*") << QString::fromUtf8("/日誌/Büro.log");
}

void tst_TorkLogFiles::names()
{
    QFETCH(QString, path);
    QFETCH(QString, prefix);
    LogFolder folder;
    TorkLog log;
    folder.prepare(log, prefix);
    log.setOutputPath(path);

    QTEST(log.fileSpec(false), "current");
    QTEST(log.fileSpec(true), "older");
    QTEST(log.newLogFileName(), "full");
}

void tst_TorkLogFiles::namesWithoutPrefix()
{
    TorkLog log(QStringLiteral("/x/"));
    QCOMPARE(log.fileSpec(false), QString(".log"));
    QCOMPARE(log.fileSpec(true), QString(".log.*"));
    QCOMPARE(log.newLogFileName(), QString("/x/.log"));
}

void tst_TorkLogFiles::namesWithoutExtension()
{
    LogFolder folder;
    TorkLog log;
    folder.prepare(log, "logdata");
    log.setOutputPath(QStringLiteral("/x/logs/"));
    log.*privateField(Extension()) = QString();

    QCOMPARE(log.fileSpec(false), QString("logdata"));
    QCOMPARE(log.fileSpec(true), QString("logdata.*"));
    QCOMPARE(log.newLogFileName(), QString("/x/logs/logdata"));
}

void tst_TorkLogFiles::nameBuffersAreOverwritten()
{
    LogFolder folder;
    TorkLog log;
    folder.prepare(log, "app");

    QString& buffer = log.fileSpec(false);
    QCOMPARE(&log.fileSpec(true), &buffer);
    QCOMPARE(buffer, QString("app.log.*"));

    QString& name = log.newLogFileName();
    log.setOutputPath(QStringLiteral("/y/"));
    QCOMPARE(&log.newLogFileName(), &name);
    QCOMPARE(name, QString("/y/app.log"));
    QCOMPARE(folder.listing(), QStringList());
}

void tst_TorkLogFiles::currentLogFileIsTheOpenOne()
{
    LogFolder folder;
    TorkLog log;
    folder.prepare(log, "app");
    const QString first = log.newLogFileName();
    QCOMPARE(log.currentLogFile(), first);
    QCOMPARE(folder.listing(), QStringList());

    log.write("a\n");
    log.setOutputPath(log.path() + "later/");
    QCOMPARE(log.currentLogFile(), first);
    QVERIFY(TestFiles::read(first).startsWith("a\n"));

    log.close();
    QCOMPARE(log.currentLogFile(), log.newLogFileName());
    QVERIFY(log.currentLogFile() != first);
}

void tst_TorkLogFiles::openCreatesTheFile()
{
    LogFolder folder;
    TorkLog log;
    QVERIFY(log.open(folder.logs() + "new.log"));
    QCOMPARE(folder.listing(), QStringList("new.log: "));
    QCOMPARE(log.errorString(), QString());

    QFile* file = log.locateLogFile("x");
    QVERIFY(file);
    QCOMPARE(file->fileName(), folder.logs() + "new.log");
    QCOMPARE(file->openMode(), QIODevice::ReadWrite | QIODevice::Text);
}

// Neither appending nor truncating.
void tst_TorkLogFiles::openWritesOverTheStart()
{
    LogFolder folder;
    populate(folder.logs(), {"app.log: old old old\nold\n"});
    TorkLog log;
    folder.prepare(log, "app");

    log.write(QStringLiteral("new\n"));
    QCOMPARE(folder.listing(), QStringList("app.log: new\nold old\nold\n"));
}

void tst_TorkLogFiles::openClosesTheFileBefore()
{
    LogFolder folder;
    TorkLog log;
    folder.prepare(log, "app");
    QVERIFY(log.open(folder.logs() + "a.log"));
    log.write(QStringLiteral("1\n"));
    QVERIFY(log.open(folder.logs() + "b.log"));
    log.write(QStringLiteral("2\n"));

    QCOMPARE(folder.listing(), QStringList({"a.log: 1\n", "b.log: 2\n"}));
}

void tst_TorkLogFiles::openFails_data()
{
    QTest::addColumn<QString>("name");

    QTest::newRow("directory is missing") << "missing/app.log";
    QTest::newRow("a directory of that name") << "folder";
    QTest::newRow("below a file") << "file/app.log";
}

void tst_TorkLogFiles::openFails()
{
    QFETCH(QString, name);
    LogFolder folder;
    populate(folder.logs(), {"folder/", "file: x"});
    TorkLog log;
    QVERIFY(log.open(folder.logs() + "before.log"));

    QVERIFY(!log.open(folder.logs() + name));
    QVERIFY(!log.errorString().isEmpty());
    QCOMPARE(log.errorString(), reasonNotToOpen(folder.logs() + name));
    QCOMPARE(log.close(), false);
    QCOMPARE(folder.listing(), QStringList({"before.log: ", "file: x", "folder/"}));
}

void tst_TorkLogFiles::openKeepsTheLastReason()
{
    LogFolder folder;
    TorkLog log;
    QVERIFY(!log.open(folder.logs() + "missing/app.log"));
    const QString reason = log.errorString();

    QVERIFY(log.open(folder.logs() + "app.log"));
    QCOMPARE(log.errorString(), reason);
}

void tst_TorkLogFiles::closeTellsWhetherOpen()
{
    LogFolder folder;
    TorkLog log;
    QCOMPARE(log.close(), false);
    QVERIFY(log.open(folder.logs() + "app.log"));
    QCOMPARE(log.close(), true);
    QCOMPARE(log.close(), false);
}

void tst_TorkLogFiles::destructorClosesTheFile()
{
    if (!QFile::exists("/proc/self/fd"))
        QSKIP("No list of open files on this system.");

    LogFolder folder;
    const int before = openFileCount();
    {
        TorkLog log;
        folder.prepare(log, "app");
        log.write(QStringLiteral("x\n"));
        QCOMPARE(openFileCount(), before + 1);
    }
    QCOMPARE(openFileCount(), before);
    QCOMPARE(folder.listing(), QStringList("app.log: x\n"));
}

// A missing directory is made, after its path has lost the last character, whatever that is.
void tst_TorkLogFiles::directory_data()
{
    QTest::addColumn<QString>("path"); // %1 stands for the folder of the test
    QTest::addColumn<QStringList>("expected");

    QTest::newRow("there") << "%1there/" << QStringList({"there/", "there/app.log: x\n"});
    QTest::newRow("there, no final slash")
        << "%1there" << QStringList({"ther/", "there/", "there/app.log: x\n"});
    QTest::newRow("missing") << "%1new/" << QStringList({"new/", "new/app.log: x\n", "there/"});
    QTest::newRow("several missing")
        << "%1a/b/c/" << QStringList({"a/", "a/b/", "a/b/c/", "a/b/c/app.log: x\n", "there/"});
    QTest::newRow("missing, no final slash") << "%1new" << QStringList({"ne/", "there/"});
    QTest::newRow("missing, two final slashes")
        << "%1new//" << QStringList({"new/", "new/app.log: x\n", "there/"});
    QTest::newRow("one letter is not cut off")
        << "d" << QStringList({"d/", "d/app.log: x\n", "there/"});
    QTest::newRow("of two letters one is") << "dd" << QStringList({"d/", "there/"});
    QTest::newRow("one letter and a slash")
        << "d/" << QStringList({"d/", "d/app.log: x\n", "there/"});
    QTest::newRow("blanks") << "%1my logs/"
                            << QStringList({"my logs/", "my logs/app.log: x\n", "there/"});
    QTest::newRow("letters beyond ASCII")
        << QString::fromUtf8("%1Büro 日誌/")
        << TestFiles::sorted({QString::fromUtf8("Büro 日誌/"),
                              QString::fromUtf8("Büro 日誌/app.log: x\n"), "there/"});
    QTest::newRow("wildcards") << "%1[x]*?/"
                               << QStringList({"[x]*?/", "[x]*?/app.log: x\n", "there/"});
}

void tst_TorkLogFiles::directory()
{
    QFETCH(QString, path);
    LogFolder folder;
    const QString work = folder.root() + "work/";
    QVERIFY(QDir().mkpath(work + "there"));
    QVERIFY(QDir::setCurrent(work));
    TorkLog log;
    folder.prepare(log, "app");
    log.setOutputPath(path.replace("%1", work));

    log.write(QStringLiteral("x\n"));
    QTEST(TestFiles::listing(work), "expected");
}

// No directory can be made of an empty path, about which the toolkit complains, but the file can.
void tst_TorkLogFiles::emptyPathIsTheWorkingDirectory()
{
    LogFolder folder;
    QVERIFY(QDir::setCurrent(folder.logs()));
    TorkLog log;
    folder.prepare(log, "app");
    log.setOutputPath(QString());

    QTest::ignoreMessage(QtWarningMsg, QRegularExpression("^QDir::mkpath: .*"));
    log.write(QStringLiteral("1\n"));
    QCOMPARE(folder.listing(), QStringList("app.log: 1\n"));

    // Now the file is there, and the directory is not asked for.
    MessageCapture messages;
    QVERIFY(log.close());
    log.write(QStringLiteral("2\n"));
    QCOMPARE(folder.listing(), QStringList("app.log: 2\n"));
    QCOMPARE(messages.texts(), QStringList());
}

void tst_TorkLogFiles::locateReturnsTheCurrentFile_data()
{
    QTest::addColumn<QStringList>("before");
    QTest::addColumn<QStringList>("after");

    QTest::newRow("new") << QStringList() << QStringList("app.log: ");
    QTest::newRow("with room") << QStringList("app.log: 123") << QStringList("app.log: 123");
    QTest::newRow("full") << QStringList("app.log: 12345678")
                          << QStringList({"app.log: ", "app.log.1: 12345678"});
}

void tst_TorkLogFiles::locateReturnsTheCurrentFile()
{
    QFETCH(QStringList, before);
    LogFolder folder;
    populate(folder.logs(), before);
    TorkLog log;
    folder.prepare(log, "app", 9);

    QFile* file = log.locateLogFile("xx");
    QVERIFY(file);
    QVERIFY(file->isOpen());
    QCOMPARE(file->fileName(), folder.logs() + "app.log");
    QCOMPARE(file->openMode(), QIODevice::ReadWrite | QIODevice::Text);
    QCOMPARE(file->pos(), 0);
    QTEST(folder.listing(), "after");
    QCOMPARE(log.locateLogFile("xx"), file);
}

void tst_TorkLogFiles::locateReturnsTheFileWhereEntriesEnd()
{
    LogFolder folder;
    TorkLog log;
    folder.prepare(log, "app");
    log.write(QStringLiteral("12\n"));
    log.write(QStringLiteral("34\n"));

    QFile* file = log.locateLogFile("x");
    QVERIFY(file);
    QCOMPARE(file->pos(), 6);
    file->write("5");
    log.write(QStringLiteral("6\n"));
    QCOMPARE(TestFiles::read(folder.logs() + "app.log"), QByteArray("12\n34\n56\n"));

    // Whoever has it may use it again.
    log.write(QStringLiteral("7\n"));
    QCOMPARE(file->pos(), 11);
    file->write("8\n");
    log.write(QStringLiteral("9\n"));
    QCOMPARE(TestFiles::read(folder.logs() + "app.log"), QByteArray("12\n34\n56\n7\n8\n9\n"));
}

void tst_TorkLogFiles::locateReturnsNullWithoutFile()
{
    LogFolder folder;
    TorkLog log;
    folder.prepare(log, "app");
    log.setOutputPath(folder.root() + "missing");

    QVERIFY(!log.locateLogFile("x"));
    QCOMPARE(log.errorString(), reasonNotToOpen(folder.root() + "missing/app.log"));
    QCOMPARE(log.close(), false);
}

void tst_TorkLogFiles::sizeLimitOnOpening_data()
{
    QTest::addColumn<QString>("limit");
    QTest::addColumn<QStringList>("before");
    QTest::addColumn<QString>("line");
    QTest::addColumn<QStringList>("after");

    const QStringList ten("app.log: 123456789\n");
    QTest::newRow("no file, line beyond the limit") << "3" << QStringList() << "abcd\n"
                                                    << QStringList("app.log: abcd\n");
    QTest::newRow("empty file, line beyond the limit")
        << "3" << QStringList("app.log: ") << "abcd\n"
        << QStringList("app.log: abcd\n");
    QTest::newRow("room for all but one")
        << "14" << ten << "abcd\n"
        << QStringList({"app.log: abcd\n", "app.log.1: 123456789\n"});
    QTest::newRow("just enough room") << "15" << ten << "abcd\n"
                                      << QStringList("app.log: abcd\n6789\n");
    QTest::newRow("characters count, not their UTF-8 bytes")
        << "15" << ten << QString::fromUtf8("äöüß\n")
        << QStringList(QString::fromLatin1("app.log: \xE4\xF6\xFC\xDF\n6789\n"));
    QTest::newRow("full without the line")
        << "9" << ten << "" << QStringList({"app.log: ", "app.log.1: 123456789\n"});
    QTest::newRow("no limit at all rotates always")
        << "0" << ten << "x\n"
        << QStringList({"app.log: x\n", "app.log.1: 123456789\n"});
    QTest::newRow("a wrapped negative limit is huge") << "-1" << ten << "x\n"
                                                      << QStringList("app.log: x\n3456789\n");
}

void tst_TorkLogFiles::sizeLimitOnOpening()
{
    QFETCH(QString, limit);
    QFETCH(QStringList, before);
    QFETCH(QString, line);
    LogFolder folder;
    populate(folder.logs(), before);
    TorkLog log;
    log.setOutputPath(folder.logs());
    folder.configure(log, {{"filePrefix", "app"}, {"maxLogFileSize", limit}});

    log.write(line);
    QTEST(folder.listing(), "after");
}

void tst_TorkLogFiles::openEmptyFileTakesAnything()
{
    LogFolder folder;
    TorkLog log;
    folder.prepare(log, "app", 10);
    QVERIFY(log.open(folder.logs() + "app.log"));
    log.write(QStringLiteral("beyond the limit\n"));
    QCOMPARE(folder.listing(), QStringList("app.log: beyond the limit\n"));

    // Emptied by somebody else: the entry goes to the end, without a gap of NULs before it.
    QVERIFY(QFile::resize(folder.logs() + "app.log", 0));
    log.write(QStringLiteral("and once more\n"));
    QCOMPARE(TestFiles::read(folder.logs() + "app.log"), QByteArray("and once more\n"));
}

void tst_TorkLogFiles::growsWhileOpen()
{
    LogFolder folder;
    TorkLog log;
    folder.prepare(log, "app", 10);
    for (int i = 0; i < 5; ++i)
        log.write(QStringLiteral("12345678\n"));

    QCOMPARE(folder.listing(), QStringList("app.log: " + QString("12345678\n").repeated(5)));
}

void tst_TorkLogFiles::closedFileIsRotatedOnReopening()
{
    LogFolder folder;
    TorkLog log;
    folder.prepare(log, "app", 10);
    log.write(QStringLiteral("1\n"));
    log.write(QStringLiteral("12345678\n"));
    QVERIFY(log.close());

    log.write(QStringLiteral("2\n"));
    QCOMPARE(folder.listing(), QStringList({"app.log: 2\n", "app.log.1: 1\n12345678\n"}));
}

// Every line that is read empties the file and writes all that is kept so far once more.
void tst_TorkLogFiles::trimming_data()
{
    QTest::addColumn<unsigned int>("limit");
    QTest::addColumn<QByteArray>("before");
    QTest::addColumn<QStringList>("lines");
    QTest::addColumn<QByteArray>("after");

    QTest::newRow("reads on behind the last entry")
        << 40u << QByteArray("0123456789\nabcdefghij\nABCDEFGHIJ\n")
        << QStringList({"xxxx\n", "yyyyyyyy\n"})
        << QByteArray("abcdefghij"
                      "abcdefghijABCDEFGHIJ"
                      "yyyyyyyy\n");
    QTest::newRow("nothing is left to read after that")
        << 40u << QByteArray("0123456789\nabcdefghij\nABCDEFGHIJ\n")
        << QStringList({"xxxx\n", "yyyyyyyy\n", "zz\n"})
        << QByteArray("abcdefghij"
                      "abcdefghijABCDEFGHIJ"
                      "yyyyyyyy\n"
                      "zz\n");
    QTest::newRow("at the end of the file")
        << 12u << QByteArray() << QStringList({"0123456789\n", "0123456789\n"})
        << QByteArray("0123456789\n0123456789\n");
    QTest::newRow("first line just long enough")
        << 10u << QByteArray("aaaaaaaa\nbbbb\n") << QStringList("12345678")
        << QByteArray("aaaaaaaa"
                      "aaaaaaaabbbb"
                      "12345678");
    QTest::newRow("first line one short")
        << 10u << QByteArray("aaaaaaaa\nbbbb\n") << QStringList("123456789")
        << QByteArray("bbbb"
                      "123456789");
    QTest::newRow("lines too short altogether")
        << 5u << QByteArray("aa\nbb\n") << QStringList("123456789\n") << QByteArray("123456789\n");
    QTest::newRow("last line without its end")
        << 5u << QByteArray("aaaaaaaaaa") << QStringList("x\n") << QByteArray("aaaaaaaaaax\n");
    QTest::newRow("empty lines") << 5u << QByteArray("\n\naaaa\n\n") << QStringList("xx\n")
                                 << QByteArray("aaaa"
                                               "aaaa"
                                               "xx\n");
    QTest::newRow("just enough room")
        << 11u << QByteArray("aaaaaaaa\n") << QStringList("x\n") << QByteArray("x\naaaaaa\n");
    QTest::newRow("room for all but one")
        << 10u << QByteArray("aaaaaaaa\n") << QStringList("x\n") << QByteArray("aaaaaaaax\n");
    QTest::newRow("letters beyond ASCII keep their bytes")
        << 5u << QByteArray("\xE4\xF6\xFC\xDF\n") << QStringList("x\n")
        << QByteArray("\xE4\xF6\xFC\xDFx\n");
}

void tst_TorkLogFiles::trimming()
{
    QFETCH(unsigned int, limit);
    QFETCH(QByteArray, before);
    QFETCH(QStringList, lines);
    LogFolder folder;
    const QString file = folder.logs() + "app.log";
    QVERIFY(TestFiles::write(file, before));
    TorkLog log;
    folder.prepare(log, "app", limit);
    QVERIFY(log.open(file));

    for (QString const& line : lines)
        log.write(line);
    QTEST(TestFiles::read(file), "after");
    QCOMPARE(folder.listing().size(), 1);
}

void tst_TorkLogFiles::rotation_data()
{
    QTest::addColumn<QString>("maxLogFiles");
    QTest::addColumn<QStringList>("before");
    QTest::addColumn<QStringList>("after");

    const auto row = [](const char* name, const char* maxLogFiles, QStringList const& before,
                        QStringList const& after) {
        QTest::newRow(name) << maxLogFiles << before << TestFiles::sorted(after);
    };
    const QString current = "app.log: c";
    const QString becameFirst = "app.log.1: c";

    row("first rotation", "10", {current}, {becameFirst});
    row("older files move up", "10", {current, "app.log.1: a", "app.log.2: b"},
        {becameFirst, "app.log.2: a", "app.log.3: b"});
    row("gaps stay gaps", "10", {current, "app.log.1: a", "app.log.4: d"},
        {becameFirst, "app.log.2: a", "app.log.5: d"});
    row("two digits come after one", "20", {current, "app.log.2: b", "app.log.10: j"},
        {becameFirst, "app.log.3: b", "app.log.11: j"});
    row("no current file", "10", {"app.log.1: a"}, {"app.log.2: a"});
    row("nothing there", "10", {}, {});
    row("empty current file", "10", {"app.log: "}, {"app.log.1: "});

    QStringList ten(current);
    QStringList tenShifted(becameFirst);
    for (int i = 1; i <= 10; ++i) {
        ten.append(QString("app.log.%1: %1").arg(i));
        if (i < 10)
            tenShifted.append(QString("app.log.%1: %2").arg(i + 1).arg(i));
    }
    row("the eleventh is removed", "10", ten, tenShifted);
    row("below the limit nothing is removed", "10", {current, "app.log.9: i"},
        {becameFirst, "app.log.10: i"});
    row("all above the limit are removed", "3",
        {current, "app.log.1: a", "app.log.2: b", "app.log.3: c", "app.log.7: g", "app.log.8: h"},
        {becameFirst, "app.log.2: a", "app.log.3: b"});
    row("limit of one", "1", {current, "app.log.1: a"}, {becameFirst});
    row("limit of none", "0", {current, "app.log.1: a", "app.log.2: b"}, {becameFirst});
    row("limit of none, none there", "0", {current}, {becameFirst});
    row("negative limit takes number 0 too", "-1", {current, "app.log.0: z", "app.log.1: a"},
        {becameFirst});

    row("no number", "10", {current, "app.log.old: o", "app.log.: e", "app.log.1x: x"},
        {becameFirst, "app.log.old: o", "app.log.: e", "app.log.1x: x"});
    row("number 0 is never shifted", "10", {current, "app.log.0: z", "app.log.1: a"},
        {becameFirst, "app.log.0: z", "app.log.2: a"});
    row("number 0 alone", "10", {current, "app.log.0: z"}, {becameFirst, "app.log.0: z"});
    row("negative numbers are never shifted", "10",
        {current, "app.log.-1: m", "app.log.-5: n", "app.log.1: a"},
        {becameFirst, "app.log.-1: m", "app.log.-5: n", "app.log.2: a"});
    row("a name between keeps its place", "10", {current, "app.log.old.1: o"},
        {becameFirst, "app.log.old.2: o"});
    row("a name between is not removed", "10", {current, "app.log.old.12: o"},
        {becameFirst, "app.log.old.13: o"});
    // The later name holds the number, so the file numbered 1 stays, and the copy fails.
    row("a name between takes the number away", "10", {current, "app.log.1: a", "app.log.old.1: o"},
        {"app.log.1: a", "app.log.old.2: o"});
    row("plus sign", "10", {current, "app.log.+3: p"}, {becameFirst, "app.log.4: p"});
    row("plus sign yields to the number", "10", {current, "app.log.+3: p", "app.log.3: t"},
        {becameFirst, "app.log.+3: p", "app.log.4: t"});
    row("leading zero", "10", {current, "app.log.03: t"}, {becameFirst, "app.log.4: t"});

    // What stands in the way stays, and so does what should have gone there.
    row("directory in place of number 1", "10", {current, "app.log.1/"}, {"app.log.1/"});
    row("directory in place of number 2", "10", {current, "app.log.1: a", "app.log.2/"},
        {"app.log.1: a", "app.log.2/"});
    row("directory above the limit", "10", {current, "app.log.10: j", "app.log.11/"},
        {becameFirst, "app.log.10: j", "app.log.11/"});

    row("highest number of all", "10", {current, "app.log.5: e", "app.log.2147483647: h"},
        {becameFirst, "app.log.6: e"});
    row("highest number of all at the highest limit", "2147483647",
        {current, "app.log.5: e", "app.log.2147483647: h"}, {becameFirst, "app.log.6: e"});
    row("one below the highest at the highest limit", "2147483647",
        {current, "app.log.2147483646: h"}, {becameFirst, "app.log.2147483647: h"});
    row("beyond all numbers is none", "10",
        {current, "app.log.2147483648: h", "app.log.99999999999: i"},
        {becameFirst, "app.log.2147483648: h", "app.log.99999999999: i"});
}

void tst_TorkLogFiles::rotation()
{
    QFETCH(QString, maxLogFiles);
    QFETCH(QStringList, before);
    LogFolder folder;
    populate(folder.logs(), before);
    TorkLog log;
    log.setOutputPath(folder.logs());
    folder.configure(log, {{"filePrefix", "app"}, {"maxLogFiles", maxLogFiles}});

    MessageCapture messages;
    log.deleteOldFiles();
    QTEST(folder.listing(), "after");
    QCOMPARE(messages.texts(), QStringList());
}

// Directory and name run together, so that nothing is shifted; removing and copying work.
void tst_TorkLogFiles::rotationWithoutFinalSlash_data()
{
    QTest::addColumn<QStringList>("before");
    QTest::addColumn<QStringList>("after");

    QTest::newRow("no older files")
        << QStringList("app.log: old") << QStringList({"app.log: new\n", "app.log.1: old"});
    QTest::newRow("number 1 stays, the current file is gone")
        << QStringList({"app.log: old", "app.log.1: a"})
        << QStringList({"app.log: new\n", "app.log.1: a"});
    QTest::newRow("number 2 stays")
        << QStringList({"app.log: old", "app.log.2: b"})
        << QStringList({"app.log: new\n", "app.log.1: old", "app.log.2: b"});
    QTest::newRow("number 12 is removed") << QStringList({"app.log: old", "app.log.12: l"})
                                          << QStringList({"app.log: new\n", "app.log.1: old"});
}

void tst_TorkLogFiles::rotationWithoutFinalSlash()
{
    QFETCH(QStringList, before);
    LogFolder folder;
    populate(folder.logs(), before);
    TorkLog log;
    folder.prepare(log, "app", tight);
    log.setOutputPath(folder.root() + "logs");

    log.write(QStringLiteral("new\n"));
    QTEST(folder.listing(), "after");
}

void tst_TorkLogFiles::rotationInOddDirectories_data()
{
    QTest::addColumn<QString>("directory");

    QTest::newRow("blank") << "my logs/";
    QTest::newRow("marker") << "100%1/";
    QTest::newRow("two markers") << "%2%1/";
    QTest::newRow("wildcards") << "[x]*?/";
    QTest::newRow("semicolon") << "x;y/";
    QTest::newRow("hidden") << ".logs/";
    QTest::newRow("letters beyond ASCII") << QString::fromUtf8("Büro 日誌/");
    QTest::newRow("two final slashes") << "logs//";
    QTest::newRow("named like the log") << "app.log.1/";
}

void tst_TorkLogFiles::rotationInOddDirectories()
{
    QFETCH(QString, directory);
    LogFolder folder;
    const QString logs = folder.root() + directory;
    populate(logs, {"app.log: old", "app.log.1: a", "app.log.10: j"});
    TorkLog log;
    folder.prepare(log, "app", tight);
    log.setOutputPath(logs);

    log.write(QStringLiteral("new\n"));
    QCOMPARE(TestFiles::listing(logs),
             QStringList({"app.log: new\n", "app.log.1: old", "app.log.2: a"}));
}

// The neighbours are what the toolkit's wildcards would take for the log's own files, and more.
void tst_TorkLogFiles::onlyOwnFiles_data()
{
    QTest::addColumn<QString>("prefix");
    QTest::addColumn<QStringList>("neighbours");

    QTest::newRow("plain") << "app"
                           << QStringList({"app", "app.1", "app.log1", "app.log-1", "app.logx.1",
                                           "appxlog.1", "app.txt.12", "xapp.log", "xapp.log.12",
                                           "app-2.log", "app-2.log.12", "log", ".log.12"});
    QTest::newRow("other letter case")
        << "app" << QStringList({"APP.LOG", "App.log", "APP.LOG.1", "App.log.12", "app.LOG.12"});
    QTest::newRow("upper case") << "APP"
                                << QStringList({"app.log", "App.log", "app.log.1", "app.log.12",
                                                "APP.LOG.12"});
    QTest::newRow("blank") << "my app"
                           << QStringList({"my", "app.log", "app.log.1", "app.log.12", "my.log",
                                           "my.log.12", "myapp.log.12"});
    QTest::newRow("semicolon") << "x;y"
                               << QStringList({"x", "y.log", "y.log.1", "y.log.12", "x.log.12"});
    QTest::newRow("character set") << "a[1]" << QStringList({"a1.log", "a1.log.1", "a1.log.12"});
    QTest::newRow("star") << "a*" << QStringList({"a.log", "ab.log", "ab.log.1", "abc.log.12"});
    QTest::newRow("question mark")
        << "a?" << QStringList({"a.log", "ab.log", "ab.log.1", "ab.log.12"});
    QTest::newRow("backslash") << "a\\b" << QStringList({"ab.log", "ab.log.1", "ab.log.12"});
    QTest::newRow("marker") << "100%1" << QStringList({"1001.log.12", "100.log.12", "100%2.log"});
    QTest::newRow("two markers") << "%2%1" << QStringList({"1.log", "12.log.12"});
    QTest::newRow("dots") << "app.log" << QStringList({"app.log", "app.log.1", "app.log.12"});
    QTest::newRow("letters beyond ASCII")
        << QString::fromUtf8("Büro") << QStringList({"Buro.log", "Buro.log.12"});
}

void tst_TorkLogFiles::onlyOwnFiles()
{
    QFETCH(QString, prefix);
    QFETCH(QStringList, neighbours);
    LogFolder folder;
    const QString name = prefix + ".log";
    const QString full(3000, 'f');
    QStringList untouched;
    for (QString const& neighbour : neighbours)
        untouched.append(neighbour + ": " + full);
    populate(folder.logs(), untouched);
    populate(folder.logs(), {name + ": " + full, name + ".1: a", name + ".10: j"});
    TorkLog log(folder.logs());
    folder.prepare(log, prefix);
    log.setMaxLogFileSize(0);

    if (log.maxLogFileSize() != 2048)
        QFAIL("The files of this test are not beyond the limit.");
    log.write(QStringLiteral("new\n"));
    const QStringList own({name + ": new\n", name + ".1: " + full, name + ".2: a"});
    QCOMPARE(folder.listing(), TestFiles::sorted(own + untouched));
}

void tst_TorkLogFiles::neighboursAloneAreNotTheLog_data()
{
    onlyOwnFiles_data();
}

void tst_TorkLogFiles::neighboursAloneAreNotTheLog()
{
    QFETCH(QString, prefix);
    QFETCH(QStringList, neighbours);
    LogFolder folder;
    QStringList untouched;
    for (QString const& neighbour : neighbours)
        untouched.append(neighbour + ": n");
    populate(folder.logs(), untouched);
    TorkLog log(folder.logs());
    folder.prepare(log, prefix);

    log.write(QStringLiteral("new\n"));
    const QStringList own(prefix + ".log: new\n");
    QCOMPARE(folder.listing(), TestFiles::sorted(own + untouched));
}

// A listing without hidden files never shows such a log: nobody looks at its size, and what is
// numbered is none of its own.
void tst_TorkLogFiles::hiddenNames_data()
{
    QTest::addColumn<QString>("prefix");
    QTest::addColumn<bool>("rotates"); // asked for directly
    QTest::addColumn<QStringList>("after");

    QTest::newRow("full, begins with a dot")
        << ".app" << false << QStringList({".app.log: new\n%1", ".app.log.1: a", ".app.log.12: l"});
    QTest::newRow("full, empty prefix")
        << "" << false << QStringList({".log: new\n%1", ".log.1: a", ".log.12: l"});
    QTest::newRow("rotated, begins with a dot")
        << ".app" << true << QStringList({".app.log.1: a", ".app.log.12: l"});
    QTest::newRow("rotated, empty prefix")
        << "" << true << QStringList({".log.1: a", ".log.12: l"});
}

void tst_TorkLogFiles::hiddenNames()
{
    QFETCH(QString, prefix);
    QFETCH(bool, rotates);
    QFETCH(QStringList, after);
    LogFolder folder;
    const QString name = prefix + ".log";
    const QString full(3000, 'f');
    populate(folder.logs(), {name + ": " + full, name + ".1: a", name + ".12: l"});
    TorkLog log(folder.logs());
    log.setEnable(true);
    if (!prefix.isEmpty()) // a log without a settings file has none
        folder.prepare(log, prefix);
    log.setMaxLogFileSize(0);

    if (rotates)
        log.deleteOldFiles();
    else
        log.write(QStringLiteral("new\n"));
    QCOMPARE(folder.listing(), after.replaceInStrings("%1", full.mid(4)));
}

namespace {

// Makes what an entry of the form "name |" (a pipe), "name -> target" or populate()'s says.
void make(QString const& folder, QString const& entry)
{
    const QString path = folder + entry.section(' ', 0, 0);
    if (entry.endsWith(" |"))
        QVERIFY2(mkfifo(QFile::encodeName(path).constData(), 0600) == 0, qPrintable(entry));
    else if (entry.contains(" -> "))
        QVERIFY2(QFile::link(entry.section(" -> ", 1), path), qPrintable(entry));
    else
        populate(folder, {entry});
}

QStringList namesIn(QString const& folder)
{
    return QDir(folder).entryList(
        QDir::AllEntries | QDir::Hidden | QDir::System | QDir::NoDotAndDotDot, QDir::Name);
}

} // namespace

// Whatever lies under a number above the limit goes; only listed files move up, though.
void tst_TorkLogFiles::pruningGoesByName_data()
{
    QTest::addColumn<QStringList>("before");
    QTest::addColumn<QStringList>("after");

    const QStringList common({"app.log: c", "app.log.5: e"});
    const QStringList usual({"app.log.1", "app.log.6"});
    QTest::newRow("pipe above the highest stays")
        << common + QStringList("app.log.12 |")
        << QStringList({"app.log.1", "app.log.12", "app.log.6"});
    QTest::newRow("pipe") << common + QStringList({"app.log.15: o", "app.log.12 |"}) << usual;
    QTest::newRow("pipe just above the highest")
        << common + QStringList({"app.log.15: o", "app.log.16 |"}) << usual;
    QTest::newRow("dangling link")
        << common + QStringList({"app.log.15: o", "app.log.13 -> nowhere"}) << usual;
    QTest::newRow("link to a pipe")
        << common + QStringList({"pipe |", "app.log.15: o", "app.log.13 -> pipe"})
        << usual + QStringList("pipe");
    QTest::newRow("directory stays") << common + QStringList({"app.log.15: o", "app.log.14/"})
                                     << QStringList({"app.log.1", "app.log.14", "app.log.6"});
    QTest::newRow("pipe within the limit is neither moved nor removed")
        << common + QStringList({"app.log.15: o", "app.log.3 |"})
        << QStringList({"app.log.1", "app.log.3", "app.log.6"});
    QTest::newRow("pipe below a huge number")
        << common + QStringList({"app.log.2147483646: h", "app.log.2147483000 |"}) << usual;
    QTest::newRow("pipes without a number of their own stay")
        << common +
               QStringList({"app.log.15: o", "app.log.012 |", "app.log.old.12 |", "app.log.x |"})
        << QStringList({"app.log.012", "app.log.1", "app.log.6", "app.log.old.12", "app.log.x"});
}

void tst_TorkLogFiles::pruningGoesByName()
{
    QFETCH(QStringList, before);
    LogFolder folder;
    for (QString const& entry : before)
        make(folder.logs(), entry);
    TorkLog log;
    folder.prepare(log, "app");

    log.deleteOldFiles();
    QTEST(namesIn(folder.logs()), "after");
}

void tst_TorkLogFiles::unfinishedCopies_data()
{
    QTest::addColumn<QString>("entry");
    QTest::addColumn<bool>("stays");

    QTest::newRow("copy to number 1") << "app.log.1.aBcXyZ.part: half" << false;
    QTest::newRow("name of another kind") << "app.log.1.part: x" << true;
    QTest::newRow("digits") << "app.log.1.aBc1yZ.part: x" << true;
    QTest::newRow("five letters") << "app.log.1.aBcXy.part: x" << true;
    QTest::newRow("seven letters") << "app.log.1.aBcXyZz.part: x" << true;
    QTest::newRow("of another number") << "app.log.2.aBcXyZ.part: x" << true;
    QTest::newRow("of another log") << "app2.log.1.aBcXyZ.part: x" << true;
    QTest::newRow("goes on") << "app.log.1.aBcXyZ.part.gz: x" << true;
    QTest::newRow("other letter case") << "app.log.1.aBcXyZ.PART: x" << true;
    QTest::newRow("link") << "app.log.1.aBcXyZ.part -> app.log" << true;
    QTest::newRow("dangling link") << "app.log.1.aBcXyZ.part -> nowhere" << true;
    QTest::newRow("directory") << "app.log.1.aBcXyZ.part/" << true;
    QTest::newRow("pipe") << "app.log.1.aBcXyZ.part |" << true;
}

void tst_TorkLogFiles::unfinishedCopies()
{
    QFETCH(QString, entry);
    QFETCH(bool, stays);
    LogFolder folder;
    populate(folder.logs(), {"app.log: full"});
    make(folder.logs(), entry);
    TorkLog log;
    folder.prepare(log, "app", tight);

    log.write(QStringLiteral("new\n"));
    QString name = entry.section(QRegularExpression("[: ]"), 0, 0);
    name.remove('/');
    QCOMPARE(namesIn(folder.logs()).contains(name), stays);
    QCOMPARE(TestFiles::read(folder.logs() + "app.log"), QByteArray("new\n"));
    QCOMPARE(TestFiles::read(folder.logs() + "app.log.1"), QByteArray("full"));
}

// Whoever was given the file object seeks and writes with it, whenever that was.
void tst_TorkLogFiles::handedOutFileIsKept_data()
{
    QTest::addColumn<bool>("reopens");

    QTest::newRow("while it stays open") << false;
    QTest::newRow("over close() and the next opening") << true;
}

void tst_TorkLogFiles::handedOutFileIsKept()
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

const int linesEach = 1000;

QString lineOf(char writer, int number)
{
    return QString("%1 %2 %3\n").arg(QChar(writer)).arg(number).arg(QString(number % 90, writer));
}

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

void tst_TorkLogFiles::forkedProcesses_data()
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

void tst_TorkLogFiles::forkedProcesses()
{
    QFETCH(QString, limit);
    QFETCH(QString, handedOut);
    LogFolder folder;
    const ChildProcess::Result child =
        ChildProcess::run("parent and child", {folder.logs(), limit, handedOut});
    QVERIFY2(child.ended(), child.report());
    QCOMPARE(wrongLines(TestFiles::read(folder.logs() + ".log"), "pc"), QStringList());
}

// Two logs on one file are no good, but the one that finds the file shorter leaves no gap.
void tst_TorkLogFiles::cutDownByAnotherLog()
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

void tst_TorkLogFiles::twoProcesses()
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
void tst_TorkLogFiles::anotherProgramAtWork()
{
    LogFolder folder;
    const QString name = folder.logs() + ".log";
    populate(folder.logs(), {".log: old\nold\n"});
    QFile file(name);
    QVERIFY(file.open(QIODevice::ReadWrite));
    struct flock whole = {};
    whole.l_type = F_WRLCK;
    QCOMPARE(fcntl(file.handle(), F_SETLK, &whole), 0);

    const ChildProcess::Result during =
        ChildProcess::run("once", {folder.logs()}, QString(), 10000);
    QVERIFY2(during.ended(), during.report());
    QCOMPARE(file.readAll(), QByteArray("old\nold\nx\n"));

    file.close();
    const ChildProcess::Result after = ChildProcess::run("once", {folder.logs()}, QString(), 10000);
    QVERIFY2(after.ended(), after.report());
    QCOMPARE(TestFiles::read(name), QByteArray("x\nd\nold\nx\n"));
}

namespace {

// More than a pipe holds; then something that is a file takes its place.
int writesToNoFile(QStringList const& arguments)
{
    TorkLog log(arguments.at(0));
    log.setEnable(true);
    for (int i = 0; i < linesEach; ++i)
        log.write(lineOf('x', 89));
    std::printf("%s\n", qPrintable(log.errorString()));
    QFile::remove(arguments.at(0) + ".log");
    log.write(QStringLiteral("kept\n"));
    return 0;
}

} // namespace

// None of these may block an entry, and the next entry tries again.
void tst_TorkLogFiles::notAFile_data()
{
    QTest::addColumn<QStringList>("entries");

    QTest::newRow("pipe") << QStringList(".log |");
    QTest::newRow("link to a pipe") << QStringList({"pipe |", ".log -> pipe"});
    QTest::newRow("socket") << QStringList(".log =");
}

void tst_TorkLogFiles::notAFile()
{
    QFETCH(QStringList, entries);
    LogFolder folder;
    for (QString const& entry : entries) {
        if (entry.endsWith(" =")) {
            sockaddr_un address = {};
            address.sun_family = AF_UNIX;
            std::snprintf(address.sun_path, sizeof address.sun_path, "%s",
                          qPrintable(folder.logs() + ".log"));
            const int socket = ::socket(AF_UNIX, SOCK_STREAM, 0);
            QCOMPARE(::bind(socket, reinterpret_cast<sockaddr*>(&address), sizeof address), 0);
            ::close(socket);
        } else {
            make(folder.logs(), entry);
        }
    }

    const ChildProcess::Result child =
        ChildProcess::run("no file", {folder.logs()}, QString(), 10000);
    QVERIFY2(child.ended(), child.report());
    QCOMPARE(child.output, QByteArray("Not a regular file\n"));
    QCOMPARE(TestFiles::read(folder.logs() + ".log"), QByteArray("kept\n"));
}

namespace {

int rotates(QStringList const& arguments)
{
    LogFolder settings;
    TorkLog log;
    settings.prepare(log, "app", tight);
    log.setOutputPath(arguments.at(0));
    if (arguments.at(1) == "directly")
        log.deleteOldFiles();
    log.write(QStringLiteral("new\n"));
    return 0;
}

} // namespace

void tst_TorkLogFiles::pipesInPlaceOfFiles_data()
{
    QTest::addColumn<QStringList>("before");
    QTest::addColumn<QString>("how");
    QTest::addColumn<QStringList>("after");

    QTest::newRow("number 1") << QStringList({"app.log: c", "app.log.1 |"}) << "by an entry"
                              << QStringList({"app.log", "app.log.1"});
    QTest::newRow("number 2") << QStringList({"app.log: c", "app.log.1: a", "app.log.2 |"})
                              << "by an entry"
                              << QStringList({"app.log", "app.log.1", "app.log.2"});
    QTest::newRow("the current file") << QStringList({"app.log |", "app.log.1: a"}) << "directly"
                                      << QStringList({"app.log", "app.log.2"});
}

void tst_TorkLogFiles::pipesInPlaceOfFiles()
{
    QFETCH(QStringList, before);
    QFETCH(QString, how);
    LogFolder folder;
    for (QString const& entry : before)
        make(folder.logs(), entry);

    const ChildProcess::Result child =
        ChildProcess::run("rotates", {folder.logs(), how}, QString(), 10000);
    QVERIFY2(child.ended(), child.report());
    QTEST(namesIn(folder.logs()), "after");
    QCOMPARE(TestFiles::read(folder.logs() + "app.log"), QByteArray("new\n"));
}

void tst_TorkLogFiles::nullDevice()
{
    LogFolder folder;
    make(folder.logs(), "app.log -> /dev/null");
    TorkLog log;
    folder.prepare(log, "app", 10);
    for (int i = 0; i < 3; ++i) {
        log.write(QStringLiteral("beyond the limit\n"));
        QVERIFY(i == 1 || log.close());
    }
    QCOMPARE(log.errorString(), QString());
    QCOMPARE(QFileInfo(folder.logs() + "app.log").symLinkTarget(), QString("/dev/null"));
    QCOMPARE(namesIn(folder.logs()), QStringList("app.log"));
}

void tst_TorkLogFiles::fileInPlaceOfDirectory()
{
    LogFolder folder;
    populate(folder.root(), {"file: x"});
    TorkLog log;
    folder.prepare(log, "app");
    log.setOutputPath(folder.root() + "file/");

    MessageCapture messages;
    log.write(QStringLiteral("lost\n"));
    QCOMPARE(log.errorString(), reasonNotToOpen(folder.root() + "file/app.log"));
    QCOMPARE(TestFiles::read(folder.root() + "file"), QByteArray("x"));
    QCOMPARE(messages.texts(), QStringList());
}

void tst_TorkLogFiles::directoryInPlaceOfFile()
{
    LogFolder folder;
    populate(folder.logs(), {"app.log/", "app.log/x: y"});
    TorkLog log;
    folder.prepare(log, "app");

    log.write(QStringLiteral("lost\n"));
    QVERIFY(!log.errorString().isEmpty());
    QCOMPARE(log.errorString(), reasonNotToOpen(folder.logs() + "app.log"));
    QCOMPARE(folder.listing(), QStringList({"app.log/", "app.log/x: y"}));
}

void tst_TorkLogFiles::directoryRemovedWhileOpen()
{
    LogFolder folder;
    TorkLog log;
    folder.prepare(log, "app");
    log.write(QStringLiteral("1\n"));

    // The open file lives on without a name.
    QVERIFY(QDir(folder.logs()).removeRecursively());
    log.write(QStringLiteral("2\n"));
    QCOMPARE(log.errorString(), QString());
    QVERIFY(!QFile::exists(folder.logs()));

    // Opened anew, it is made anew.
    QVERIFY(log.close());
    log.write(QStringLiteral("3\n"));
    QCOMPARE(folder.listing(), QStringList("app.log: 3\n"));
}

void tst_TorkLogFiles::triesAgainAfterFailure()
{
    LogFolder folder;
    TorkLog log;
    folder.prepare(log, "app");
    const QString path = folder.root() + "later";
    log.setOutputPath(path);
    log.write(QStringLiteral("lost\n"));
    QVERIFY(!log.errorString().isEmpty());

    QVERIFY(QDir().mkpath(path));
    log.write(QStringLiteral("kept\n"));
    QCOMPARE(TestFiles::listing(path), QStringList("app.log: kept\n"));
}

namespace {

const QFileDevice::Permissions readOnly = QFileDevice::ReadOwner | QFileDevice::ExeOwner;
const QFileDevice::Permissions writable = readOnly | QFileDevice::WriteOwner;

// Writes while the permissions are missing and once more when they are back; tells on the standard
// output the reason of the failure and what lies in the directory each time.
int writesWithoutPermission(QStringList const& arguments)
{
    if (!ProcessLimits::becomeOrdinaryUser())
        return ChildProcess::skipped;

    LogFolder folder;
    populate(folder.logs(), arguments.mid(1));
    const QString protectedPath = folder.logs() + arguments.at(0);
    TorkLog log;
    folder.prepare(log, "app", 9);
    log.setLogPipeToConsole(true);
    QFile::setPermissions(protectedPath, readOnly);

    log.write(QStringLiteral("one\n"));
    std::printf("%s\n%s\n", qPrintable(log.errorString()), qPrintable(folder.listing().join('|')));

    QFile::setPermissions(protectedPath, writable);
    log.write(QStringLiteral("two\n"));
    std::printf("%s\n", qPrintable(folder.listing().join('|')));
    return 0;
}

} // namespace

void tst_TorkLogFiles::withoutPermission_data()
{
    QTest::addColumn<QString>("protectedName");
    QTest::addColumn<QStringList>("before");
    QTest::addColumn<QByteArray>("output");
    QTest::addColumn<QByteArray>("echo");

    QTest::newRow("directory") << "" << QStringList()
                               << QByteArray("Permission denied\n\napp.log: two\n\n")
                               << QByteArray("\"two\\n\"\n");
    QTest::newRow("file") << "app.log" << QStringList("app.log: 1234\n")
                          << QByteArray("Permission denied\napp.log: 1234\n\napp.log: two\n\n\n")
                          << QByteArray("\"two\\n\"\n");
    // Nothing can be moved out of the way, so the old content is written over.
    QTest::newRow("directory with a full file")
        << "" << QStringList({"app.log: 12345678\n", "app.log.1: a"})
        << QByteArray("\napp.log: one\n5678\n|app.log.1: a\n"
                      "app.log: 5678two\n|app.log.1: a\n")
        << QByteArray("\"one\\n\"\n\"two\\n\"\n");
}

void tst_TorkLogFiles::withoutPermission()
{
    QFETCH(QString, protectedName);
    QFETCH(QStringList, before);
    const ChildProcess::Result child =
        ChildProcess::run("without permission", QStringList(protectedName) + before);
    if (child.wasSkipped())
        QSKIP("This process cannot become an ordinary user.");

    QVERIFY2(child.ended(), child.report());
    QTEST(child.output, "output");
    QTEST(child.errors, "echo");
}

namespace {

const int lineCount = 100;

QString longLine(int number)
{
    return QString("line %1 %2\n").arg(number).arg(QString(90, 'x'));
}

QByteArray allLines()
{
    QByteArray lines;
    for (int i = 0; i < lineCount; ++i)
        lines += longLine(i).toLatin1();
    return lines;
}

// Writes more than fits, then makes room and writes once more.
int writesToFullDisk(QStringList const& arguments)
{
    if (!ProcessLimits::limitFileSize(4096))
        return ChildProcess::skipped;

    TorkLog log(arguments.at(0));
    log.setEnable(true);
    for (int i = 0; i < lineCount; ++i)
        log.write(longLine(i));
    std::printf("%lld", static_cast<long long>(QFile(arguments.at(0) + ".log").size()));

    if (arguments.at(1) == "then room" && !ProcessLimits::unlimitFileSize())
        return ChildProcess::skipped;
    log.write(QStringLiteral("last\n"));
    return 0;
}

} // namespace

void tst_TorkLogFiles::diskFull_data()
{
    QTest::addColumn<QString>("then");
    QTest::addColumn<QByteArray>("expected");

    QTest::newRow("for good") << "for good" << allLines().left(4096);
    QTest::newRow("until there is room again") << "then room" << allLines() + "last\n";
}

void tst_TorkLogFiles::diskFull()
{
    QFETCH(QString, then);
    LogFolder folder;
    const ChildProcess::Result child = ChildProcess::run("disk full", {folder.logs(), then});
    if (child.wasSkipped())
        QSKIP("The size of files cannot be limited here.");

    QVERIFY2(child.ended(), child.report());
    QCOMPARE(child.output, QByteArray("4096"));
    QCOMPARE(child.errors, QByteArray());
    QTEST(TestFiles::read(folder.logs() + ".log"), "expected");
}

void tst_TorkLogFiles::fullFileSystem()
{
    LogFolder folder;
    if (QProcess::execute("mount", {"-t", "tmpfs", "-o", "size=64k", "tmpfs", folder.logs()}) != 0)
        QSKIP("No file system can be mounted here.");
    struct Unmount
    {
        QString path;
        ~Unmount() { QProcess::execute("umount", {path}); }
    } unmount{folder.logs()};

    TorkLog log;
    folder.prepare(log, "app");
    log.write(QStringLiteral("before\n"));

    QFile filler(folder.logs() + "filler");
    QVERIFY(filler.open(QIODevice::WriteOnly | QIODevice::Unbuffered));
    while (filler.write(QByteArray(4096, 'f')) == 4096) {}
    QByteArray expected = "before\n";
    for (int i = 0; i < lineCount; ++i) {
        log.write(longLine(i));
        expected += longLine(i).toLatin1();
    }
    const QByteArray whileFull = TestFiles::read(folder.logs() + "app.log");
    QCOMPARE(whileFull, expected.left(4096));

    QVERIFY(filler.remove());
    log.write(QStringLiteral("after\n"));
    QCOMPARE(TestFiles::read(folder.logs() + "app.log"), expected + "after\n");
    QVERIFY(log.close());
}

int main(int argc, char** argv)
{
    return ChildProcess::main<tst_TorkLogFiles>(argc, argv,
                                                {{"without permission", writesWithoutPermission},
                                                 {"disk full", writesToFullDisk},
                                                 {"parent and child", writesInParentAndChild},
                                                 {"alone", writesAlone},
                                                 {"once", writesOnce},
                                                 {"no file", writesToNoFile},
                                                 {"rotates", rotates}});
}

#include "tst_TorkLogFiles.moc"
