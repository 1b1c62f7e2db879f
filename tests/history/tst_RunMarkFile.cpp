// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Marks of this process; tst_RunExits has those of programs that ended.

#include "app/history/RunMarkFile.h"

#include "app/history/HistoryTime.h"
#include "support/HostName.h"
#include "support/TestFiles.h"

#include <QTemporaryDir>
#include <QtTest>

#include <fcntl.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <unistd.h>

using namespace Velocor;

namespace {

constexpr qint64 Start = qint64(740000) * 24 * 60 * 60 * 1000 + 7;

// A file that stays open, and locked if asked for.
class Mark
{
public:
    explicit Mark(QString const& path)
        : m_file(::open(QFile::encodeName(path).constData(), O_RDWR | O_CREAT | O_TRUNC, 0666))
    {}
    ~Mark() { ::close(m_file); }
    Q_DISABLE_COPY(Mark)

    QByteArray Text() const { return RunMarkFile::TextFor(Start, m_file); }
    bool Lock(int how) { return ::flock(m_file, how) == 0; }
    bool Write(QByteArray const& text)
    {
        return ::ftruncate(m_file, 0) == 0 &&
               ::pwrite(m_file, text.constData(), size_t(text.size()), 0) == text.size();
    }

private:
    int m_file;
};

} // namespace

class tst_RunMarkFile : public QObject
{
    Q_OBJECT

private slots:
    void states();
    void changedTexts_data();
    void changedTexts();
    void noMarks();
    void names();
    void nameOfTheComputer();
    void descriptors();

private:
    QTemporaryDir m_folder;
    QString m_path = m_folder.filePath("a.run");
};

void tst_RunMarkFile::states()
{
    Mark mark(m_path);
    QCOMPARE(RunMarkFile(m_path).state(), RunMarkFile::Damaged); // nothing written yet
    QCOMPARE(RunMarkFile(m_path).start(), qint64(-1));
    QVERIFY(RunMarkFile(m_path).isNew());
    QVERIFY(mark.Lock(LOCK_EX));
    QVERIFY(mark.Write(mark.Text()));
    for (int time = 0; time < 2; ++time) { // reading it leaves the lock alone
        const RunMarkFile held(m_path);
        QCOMPARE(held.state(), RunMarkFile::Held);
        QCOMPARE(held.start(), Start);
    }
    QVERIFY(mark.Lock(LOCK_UN));
    const RunMarkFile left(m_path);
    QCOMPARE(left.state(), RunMarkFile::LeftBehind);
    QCOMPARE(left.start(), Start);
    QVERIFY(left.isNew());
    QVERIFY(mark.Lock(LOCK_EX | LOCK_NB)); // nobody holds it now

    const QString copy = m_folder.filePath("copy.run");
    QVERIFY(QFile::copy(m_path, copy));
    QCOMPARE(RunMarkFile(copy).state(), RunMarkFile::Doubtful);
    QCOMPARE(RunMarkFile(copy).start(), Start);
}

// Parts of the text: the start, when it was written, the number of the file, and the computer.
void tst_RunMarkFile::changedTexts_data()
{
    QTest::addColumn<int>("part");
    QTest::addColumn<QByteArray>("text"); // a number of milliseconds for the second part
    QTest::addColumn<int>("state");
    const auto row = [](char const* name, int part, char const* text, RunMarkFile::State state) {
        QTest::newRow(name) << part << QByteArray(text) << int(state);
    };
    row("no start", 0, "x", RunMarkFile::Damaged);
    row("no time", 1, "x", RunMarkFile::Damaged);
    row("written 20 seconds before", 1, "-20000", RunMarkFile::LeftBehind);
    row("written 20 seconds after", 1, "20000", RunMarkFile::LeftBehind);
    row("written 40 seconds before", 1, "-40000", RunMarkFile::Doubtful);
    row("written 40 seconds after", 1, "40000", RunMarkFile::Doubtful);
    row("another file", 2, "1", RunMarkFile::Doubtful);
    row("another computer", 3, "x\n", RunMarkFile::Doubtful);
    row("no line end", 3, "x", RunMarkFile::Damaged);
    row("a part too many", 3, "x y\n", RunMarkFile::Damaged);
}

void tst_RunMarkFile::changedTexts()
{
    QFETCH(int, part);
    QFETCH(QByteArray, text);
    QFETCH(int, state);
    Mark mark(m_path);
    QByteArrayList parts = mark.Text().split(' ');
    QCOMPARE(parts.size(), 4);
    const bool isDifference = part == 1 && text != "x";
    parts[part] = isDifference ? QByteArray::number(parts[1].toLongLong() + text.toInt()) : text;
    QVERIFY(mark.Write(parts.join(' ')));
    QCOMPARE(int(RunMarkFile(m_path).state()), state);
    QCOMPARE(RunMarkFile(m_path).start(), state == RunMarkFile::Damaged ? qint64(-1) : Start);
    QVERIFY(mark.Lock(LOCK_EX));
    QCOMPARE(int(RunMarkFile(m_path).state()),
             int(state == RunMarkFile::Damaged ? RunMarkFile::Damaged : RunMarkFile::Held));
    parts.removeLast();
    QVERIFY(mark.Write(parts.join(' ') + '\n'));
    QCOMPARE(RunMarkFile(m_path).state(), RunMarkFile::Damaged);
}

void tst_RunMarkFile::noMarks()
{
    const QString pipe = m_folder.filePath("pipe.run");
    QCOMPARE(::mkfifo(QFile::encodeName(pipe).constData(), 0666), 0);
    for (QString const& path : {m_folder.filePath("none.run"), m_folder.path(), pipe}) {
        const RunMarkFile mark(path);
        QCOMPARE(mark.state(), RunMarkFile::Damaged);
        QCOMPARE(mark.start(), qint64(-1));
        QVERIFY(!mark.isNew());
    }
}

void tst_RunMarkFile::names()
{
    const QTemporaryDir folder;
    for (char const* name : {"b.run", "a.run", "c.runs", "run"})
        QVERIFY(TestFiles::write(folder.filePath(name), "x"));
    QVERIFY(QDir(folder.path()).mkdir("d.run"));
    QCOMPARE(RunMarkFile::NamesIn(folder.path()), QStringList({"a.run", "b.run"}));
    QCOMPARE(RunMarkFile::NamesIn(folder.filePath("none")), QStringList());
    QCOMPARE(RunMarkFile::NameFor(7), QString("7-%1.run").arg(QCoreApplication::applicationPid()));
}

void tst_RunMarkFile::nameOfTheComputer()
{
    if (!HostName::set("my lab-7"))
        QSKIP("only the administrator can give this process another name of the computer");
    Mark mark(m_path);
    QVERIFY2(mark.Text().endsWith(" my-lab-7\n"), mark.Text());
    QVERIFY(mark.Write(mark.Text()));
    QCOMPARE(RunMarkFile(m_path).state(), RunMarkFile::LeftBehind);
}

// Also of a program that has no standard input, so that the file gets its number.
void tst_RunMarkFile::descriptors()
{
    Mark mark(m_path);
    QVERIFY(mark.Write(mark.Text()));
    const int input = ::dup(0);
    ::close(0);
    const RunMarkFile read(m_path);
    const int free = ::open("/dev/null", O_RDONLY);
    ::dup2(input, 0);
    ::close(input);
    QCOMPARE(read.state(), RunMarkFile::LeftBehind);
    QCOMPARE(free, 0); // again: the mark is closed
}

QTEST_GUILESS_MAIN(tst_RunMarkFile)
#include "tst_RunMarkFile.moc"
