// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/log/TorkLog.h"
#include "log/LogFileTest.h"
#include "log/LogFolder.h"
#include "support/MessageCapture.h"
#include "support/OpenFiles.h"
#include "support/PrivateField.h"
#include "support/TestFiles.h"

#include <QRegularExpression>
#include <QtTest>

#include <unistd.h>

using namespace LogFileTest;

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
    void locateMakesRoomInTheOpenFile();
    void locateReturnsNullWithoutFile();
    void sizeLimitOnOpening_data();
    void sizeLimitOnOpening();
    void openEmptyFileTakesAnything();
    void growsWhileOpen();
    void closedFileIsRotatedOnReopening();
    void trimming_data();
    void trimming();

private:
    QString m_workingDirectory;
};

PRIVATE_FIELD(Extension, TorkLog, QString, m_fileExtension);

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

// A missing directory is created, after the last character of its path, whatever it is, has been
// removed.
void tst_TorkLogFiles::directory_data()
{
    QTest::addColumn<QString>("path"); // %1 is replaced with the test's folder
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

// No directory can be created from an empty path, which Qt complains about, but the file can.
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

    // Now the file exists, and the directory is not needed.
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

    // Anyone who holds it may use it again.
    log.write(QStringLiteral("7\n"));
    QCOMPARE(file->pos(), 11);
    file->write("8\n");
    log.write(QStringLiteral("9\n"));
    QCOMPARE(TestFiles::read(folder.logs() + "app.log"), QByteArray("12\n34\n56\n7\n8\n9\n"));
}

void tst_TorkLogFiles::locateMakesRoomInTheOpenFile()
{
    LogFolder folder;
    const QString path = folder.logs() + "app.log";
    QVERIFY(TestFiles::write(path, "aaaaaaaa\nbbbb\n"));
    TorkLog log;
    folder.prepare(log, "app", 10);
    QVERIFY(log.open(path));

    QFile* file = log.locateLogFile("123456789");
    QVERIFY(file);
    QCOMPARE(TestFiles::read(path), QByteArray("bbbb"));
    QCOMPARE(file->pos(), 4);
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

    // Truncated by another program: the entry goes to the end, without a gap of NULs before it.
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

// Every line that is read truncates the file and rewrites everything kept so far.
void tst_TorkLogFiles::trimming_data()
{
    QTest::addColumn<unsigned int>("limit");
    QTest::addColumn<QByteArray>("before");
    QTest::addColumn<QStringList>("lines");
    QTest::addColumn<QByteArray>("after");

    QTest::newRow("keeps reading after the last entry")
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

QTEST_GUILESS_MAIN(tst_TorkLogFiles)

#include "tst_TorkLogFiles.moc"
