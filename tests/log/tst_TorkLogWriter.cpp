// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/log/TorkLogWriter_p.h"
#include "log/LockHolder.h"
#include "reliability/FaultyFiles.h"
#include "support/ForkedChild.h"
#include "support/MessageCapture.h"
#include "support/TestFiles.h"

#include <QTemporaryDir>
#include <QtTest>

#include <cerrno>
#include <fcntl.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

// Where each entry goes in the file, call by call: what the failure of one means, and what another
// program may do between two of them.
class tst_TorkLogWriter : public QObject
{
    Q_OBJECT

private slots:
    void init();

    void fits_data();
    void fits();
    void closesTheFileBefore();
    void pipeInTheFilesPlace();
    void callsOfAnEntryAtTheEnd_data();
    void callsOfAnEntryAtTheEnd();
    void otherAppendsMeanwhile_data();
    void otherAppendsMeanwhile();
    void overwritesOldText_data();
    void overwritesOldText();
    void overwritesOldTextOnAnOlderSystem();
    void appendsWhileAnotherKeepsItOut();
    void makesRoom_data();
    void makesRoom();
    void otherAppendsWhileItMakesRoom_data();
    void otherAppendsWhileItMakesRoom();
    void otherAppendsToAFullFile();
    void keptLinesWaitForTheDisk_data();
    void keptLinesWaitForTheDisk();
    void waitingTextKeepsItsPlace();
    void waitingTextCountsInThePosition();
    void handedOutAfterClosing();
    void emptyEntryFlushesTheHandedOutFile();
    void handedOutFileAfterFork();

private:
    QString path(QString const& name = "app.log") const { return m_folder->filePath(name); }

    QScopedPointer<QTemporaryDir> m_folder;
};

namespace {

const qint64 NoLimit = TorkLogWriter::NoLimit;

void write(TorkLogWriter& writer, QByteArray const& entry, qint64 limit = NoLimit)
{
    writer.write(entry.constData(), entry.size(), limit);
}

// As another program does.
void append(QString const& path, QByteArray const& text)
{
    const int file = ::open(QFile::encodeName(path), O_WRONLY | O_APPEND);
    if (::write(file, text.constData(), static_cast<size_t>(text.size())) != text.size())
        qWarning("%s: %s", qPrintable(path), qPrintable(qt_error_string(errno)));
    ::close(file);
}

template <class Action>
bool doInChild(Action action)
{
    const pid_t child = fork();
    if (child == 0) {
        action();
        endForkedChild(0);
    }
    int status = -1;
    return waitpid(child, &status, 0) == child && status == 0;
}

} // namespace

void tst_TorkLogWriter::init()
{
    m_folder.reset(new QTemporaryDir);
    QVERIFY2(m_folder->isValid(), qPrintable(m_folder->errorString()));
}

void tst_TorkLogWriter::fits_data()
{
    QTest::addColumn<qint64>("size");
    QTest::addColumn<qint64>("limit");
    QTest::addColumn<bool>("result");

    QTest::newRow("empty file") << qint64(0) << qint64(1) << true;
    QTest::newRow("one byte is old text") << qint64(1) << qint64(1) << false;
    QTest::newRow("just fits") << qint64(1) << qint64(11) << true;
    QTest::newRow("one byte too much") << qint64(2) << qint64(11) << false;
}

void tst_TorkLogWriter::fits()
{
    QFETCH(qint64, size);
    QFETCH(qint64, limit);
    QTEST(TorkLogWriter::fits(size, 10, limit), "result");
}

// Qt would close it as well, but complain.
void tst_TorkLogWriter::closesTheFileBefore()
{
    const MessageCapture messages;
    TorkLogWriter writer;
    QCOMPARE(writer.open(path("first")), QString());
    write(writer, "1\n");
    QCOMPARE(writer.open(path("second")), QString());
    write(writer, "2\n");
    QCOMPARE(messages.texts(), QStringList());
    QCOMPARE(TestFiles::listing(m_folder->path()), QStringList({"first: 1\n", "second: 2\n"}));
}

// Between the question for the kind of file and its opening.
void tst_TorkLogWriter::pipeInTheFilesPlace()
{
    QVERIFY(TestFiles::write(path(), "old\n"));
    FaultyFiles files(m_folder->path());
    files.before("open", 1, [this] {
        ::unlink(QFile::encodeName(path()));
        ::mkfifo(QFile::encodeName(path()), 0600);
    });
    TorkLogWriter writer;
    QCOMPARE(writer.open(path()), QString("Not a regular file"));
    QVERIFY(!writer.isOpen());
}

// Usual entries take as few calls as possible.
void tst_TorkLogWriter::callsOfAnEntryAtTheEnd_data()
{
    QTest::addColumn<QByteArray>("call");
    QTest::addColumn<bool>("isMade");

    QTest::newRow("ioctl") << QByteArray("ioctl") << true;
    QTest::newRow("write") << QByteArray("write") << true;
    for (char const* call : {"fcntl", "stat", "lseek", "read", "fsync"})
        QTest::newRow(call) << QByteArray(call) << false;
}

void tst_TorkLogWriter::callsOfAnEntryAtTheEnd()
{
    QFETCH(QByteArray, call);
    FaultyFiles files(m_folder->path());
    TorkLogWriter writer;
    QCOMPARE(writer.open(path()), QString());
    write(writer, "1\n");

    bool isMade = false;
    files.before(call, 1, [&isMade] { isMade = true; });
    write(writer, "2\n");
    QTEST(isMade, "isMade");
    QCOMPARE(TestFiles::read(path()), QByteArray("1\n2\n"));
}

// Right before the entry is written, when the writer has seen that nothing follows.
void tst_TorkLogWriter::otherAppendsMeanwhile_data()
{
    QTest::addColumn<QByteArray>("before"); // entries of its own
    QTest::newRow("before the first entry") << QByteArray();
    QTest::newRow("before a later entry") << QByteArray("first\n");
}

void tst_TorkLogWriter::otherAppendsMeanwhile()
{
    QFETCH(QByteArray, before);
    FaultyFiles files(m_folder->path());
    TorkLogWriter writer;
    QCOMPARE(writer.open(path("of another day")), QString());
    write(writer, "appended\n");
    QCOMPARE(writer.open(path()), QString());
    if (!before.isEmpty())
        write(writer, before);

    files.before("write", 1, [this] { append(path(), "other\n"); });
    write(writer, "entry\n");
    QCOMPARE(TestFiles::read(path()), before + "other\nentry\n");
}

// Entries go to the file's start, whatever was there, until they reach its end.
void tst_TorkLogWriter::overwritesOldText_data()
{
    QTest::addColumn<int>("calls"); // 1: each entry is written at once, 2: in two halves
    QTest::newRow("at once") << 1;
    QTest::newRow("in two halves") << 2;
}

void tst_TorkLogWriter::overwritesOldText()
{
    QFETCH(int, calls);
    const QByteArray old = QByteArray(20, '-') + '\n';
    QVERIFY(TestFiles::write(path(), old));
    FaultyFiles files(m_folder->path());
    TorkLogWriter writer;
    QCOMPARE(writer.open(path()), QString());
    QByteArray expected;
    for (int i = 0; i < 4; ++i) {
        if (calls == 2)
            files.cutShortAt(1);
        write(writer, "entry" + QByteArray::number(i) + '\n');
        expected += "entry" + QByteArray::number(i) + '\n';
        QCOMPARE(files.reached(), calls == 2);
        QCOMPARE(TestFiles::read(path()), expected + old.mid(expected.size()));
    }
    // Another program's text is old text, too.
    append(path(), "other, longer\n");
    write(writer, "entry4\n");
    QCOMPARE(TestFiles::read(path()), expected + "entry4\nlonger\n");
}

// Older systems do not have the call that asks for the size alone.
void tst_TorkLogWriter::overwritesOldTextOnAnOlderSystem()
{
    QVERIFY(TestFiles::write(path(), "old text\n"));
    FaultyFiles files(m_folder->path());
    TorkLogWriter writer;
    QCOMPARE(writer.open(path()), QString());

    files.failAt(1, FaultyFiles::Once, ENOSYS, "stat");
    write(writer, "entry\n");
    files.mend();
    QVERIFY(files.reached());
    QCOMPARE(TestFiles::read(path()), QByteArray("entry\nxt\n"));
}

// The other one may cut the file down, so no place in it is safe but its end.
void tst_TorkLogWriter::appendsWhileAnotherKeepsItOut()
{
    QVERIFY(TestFiles::write(path(), "old text\n"));
    TorkLogWriter writer;
    QCOMPARE(writer.open(path()), QString());
    const LockHolder other(path());
    QVERIFY(other.holds());
    write(writer, "entry\n", 10);
    QCOMPARE(TestFiles::read(path()), QByteArray("old text\nentry\n"));
}

// Old lines after the last entry: they lose their line ends, and each that stays is followed by all
// that stay so far. With the file handed out just the same.
void tst_TorkLogWriter::makesRoom_data()
{
    QTest::addColumn<QByteArray>("old");
    QTest::addColumn<int>("limit");
    QTest::addColumn<QByteArray>("expected");

    const auto row = [](char const* name, QByteArray const& old, int limit,
                        QByteArray const& expected) {
        QTest::newRow(name) << old << limit << expected;
    };
    row("enough", "--\nold1\nold2\n", 100, "1\n22\nd1\nold2\n");
    row("not enough", "--\nold1\nold2\n", 10, "old1old1old222\n");
    row("nothing left", "--\nol\n", 5, "22\n");
    row("looks like UTF-16", "--\xff\xfe\nold2\n", 8, "old222\n");
    row("looks like big-endian UTF-16", "--\xfe\xff\nold2\n", 8, "old222\n");
}

void tst_TorkLogWriter::makesRoom()
{
    QFETCH(QByteArray, old);
    QFETCH(int, limit);
    for (bool handsOut : {false, true}) {
        QVERIFY(TestFiles::write(path(), old));
        TorkLogWriter writer;
        if (handsOut)
            writer.handOut();
        QCOMPARE(writer.open(path()), QString());
        write(writer, "1\n");
        write(writer, "22\n", limit);
        QTEST(TestFiles::read(path()), "expected");
    }
}

void tst_TorkLogWriter::otherAppendsWhileItMakesRoom_data()
{
    QTest::addColumn<int>("step");
    QTest::addColumn<QByteArray>("expected");
    QTest::newRow("before the kept lines") << 1 << QByteArray("other\nold1old1old222\n");
    QTest::newRow("before the entry") << 2 << QByteArray("old1old1old2other\n22\n");
}

void tst_TorkLogWriter::otherAppendsWhileItMakesRoom()
{
    QFETCH(int, step);
    QVERIFY(TestFiles::write(path(), "--\nold1\nold2\n"));
    FaultyFiles files(m_folder->path());
    TorkLogWriter writer;
    QCOMPARE(writer.open(path()), QString());
    write(writer, "1\n");

    files.before("write", step, [this] { append(path(), "other\n"); });
    write(writer, "22\n", 10);
    QTEST(TestFiles::read(path()), "expected");
}

// That is no old text, although nothing fits any more.
void tst_TorkLogWriter::otherAppendsToAFullFile()
{
    QVERIFY(TestFiles::write(path(), "old\n"));
    FaultyFiles files(m_folder->path());
    TorkLogWriter writer;
    QCOMPARE(writer.open(path()), QString());
    write(writer, "new\n");

    bool isAppended = false;
    files.before("lseek", 1, [&] {
        append(path(), "other\n");
        isAppended = true;
    });
    write(writer, "entry\n", 5);
    QVERIFY(isAppended);
    QCOMPARE(TestFiles::read(path()), QByteArray("new\nother\nentry\n"));
}

// The entry does not go ahead of them.
void tst_TorkLogWriter::keptLinesWaitForTheDisk_data()
{
    QTest::addColumn<int>("failures");
    QTest::newRow("until they are written again") << 1;
    QTest::newRow("until the entry is written") << 2;
}

void tst_TorkLogWriter::keptLinesWaitForTheDisk()
{
    QFETCH(int, failures);
    QVERIFY(TestFiles::write(path(), "--\nold1\nold2\n"));
    FaultyFiles files(m_folder->path());
    TorkLogWriter writer;
    QCOMPARE(writer.open(path()), QString());
    write(writer, "1\n");

    files.failAt(1, FaultyFiles::Once, EIO, "write");
    bool failsAgain = false;
    files.before("write", 2, [&] {
        failsAgain = failures == 2;
        if (failsAgain)
            files.failAt(1, FaultyFiles::Once, EIO, "write");
    });
    write(writer, "22\n", 10);
    files.mend();
    QVERIFY(files.reached());
    QCOMPARE(failsAgain, failures == 2);
    QCOMPARE(TestFiles::read(path()), QByteArray("old1old1old222\n"));
}

// Who gets the file object then continues after it.
void tst_TorkLogWriter::waitingTextKeepsItsPlace()
{
    FaultyFiles files(m_folder->path());
    TorkLogWriter writer;
    QCOMPARE(writer.open(path()), QString());
    write(writer, "1\n");
    files.limitBytes(0);
    write(writer, "waits\n");
    files.mend();
    QCOMPARE(TestFiles::read(path()), QByteArray("1\n"));

    QFile* const file = writer.handOut();
    QCOMPARE(file->write("2\n"), qint64(2));
    write(writer, "3\n");
    QCOMPARE(TestFiles::read(path()), QByteArray("1\nwaits\n2\n3\n"));
}

void tst_TorkLogWriter::waitingTextCountsInThePosition()
{
    FaultyFiles files(m_folder->path());
    TorkLogWriter writer;
    QCOMPARE(writer.open(path()), QString());
    write(writer, "1\n");
    files.limitBytes(0);
    write(writer, "waits\n");

    QCOMPARE(writer.handOut()->pos(), qint64(8));
}

void tst_TorkLogWriter::handedOutAfterClosing()
{
    const MessageCapture messages;
    TorkLogWriter writer;
    QCOMPARE(writer.open(path()), QString());
    write(writer, "1\n");
    QVERIFY(writer.close());
    QVERIFY(!writer.handOut()->isOpen());
    QCOMPARE(messages.texts(), QStringList());
}

void tst_TorkLogWriter::emptyEntryFlushesTheHandedOutFile()
{
    TorkLogWriter writer;
    QFile* const file = writer.handOut();
    QCOMPARE(writer.open(path()), QString());
    QCOMPARE(file->write("text"), qint64(4));
    QCOMPARE(TestFiles::read(path()), QByteArray());
    write(writer, "");
    QCOMPARE(TestFiles::read(path()), QByteArray("text"));
}

// Both processes have one position.
void tst_TorkLogWriter::handedOutFileAfterFork()
{
    QVERIFY(TestFiles::write(path("before"), "old\n"));
    TorkLogWriter writer;
    writer.handOut();
    QCOMPARE(writer.open(path("before")), QString());
    write(writer, "entry\n");
    QCOMPARE(writer.open(path()), QString());
    QVERIFY(doInChild([&writer] { write(writer, "child\n"); }));
    write(writer, "parent\n");
    QCOMPARE(TestFiles::read(path()), QByteArray("child\nparent\n"));
}

QTEST_GUILESS_MAIN(tst_TorkLogWriter)

#include "tst_TorkLogWriter.moc"
