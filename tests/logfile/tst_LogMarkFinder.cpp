// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The finder without a thread: Find() returns when the file is read.

#include "app/logfile/LogMarkFinder.h"

#include "support/TestFiles.h"

#include <QTemporaryDir>
#include <QtTest>

using namespace Velocor;

class tst_LogMarkFinder : public QObject
{
    Q_OBJECT

private slots:
    void identities();
    void lineAbove_data();
    void lineAbove();
    void found_data();
    void found();
    void severalMarks();
    void wideCharacters();
    void noFile();
    void obsoleteRequest();

private:
    QVector<LogMark> find(QVector<LogMark> const& marks, int current = 0);

    QTemporaryDir m_folder;
    QString m_file = m_folder.filePath("app.log");
};

QVector<LogMark> tst_LogMarkFinder::find(QVector<LogMark> const& marks, int current)
{
    QVector<LogMark> result;
    LogMarkFinder finder;
    finder.SetCurrentRequest(current);
    connect(&finder, &LogMarkFinder::found, this,
            [&](int, QVector<LogMark> const& found) { result = found; });
    finder.Find(1, m_file, marks);
    return result;
}

void tst_LogMarkFinder::identities()
{
    QVERIFY(TestFiles::write(m_file, "a\nbb\nc"));
    const LogMark first = LogMark::Of(m_file, 0);
    QVERIFY(first.isFound);
    QCOMPARE(first.line, LogMark::IdentityOf("a"));
    QCOMPARE(first.above, QByteArray());
    QCOMPARE(first.below, LogMark::IdentityOf("bb"));
    const LogMark middle = LogMark::Of(m_file, 2);
    QCOMPARE(middle.line, LogMark::IdentityOf("bb"));
    QCOMPARE(middle.above, LogMark::IdentityOf("a"));
    QCOMPARE(middle.below, LogMark::IdentityOf("c"));
    const LogMark last = LogMark::Of(m_file, 5);
    QCOMPARE(last.above, LogMark::IdentityOf("bb"));
    QCOMPARE(last.below, QByteArray());
    QVERIFY(LogMark::IdentityOf("a") != LogMark::IdentityOf("b"));
    QVERIFY(TestFiles::write(m_file, "\nb\n"));
    QCOMPARE(LogMark::Of(m_file, 1).above, LogMark::IdentityOf(""));
}

// A very long one is not read.
void tst_LogMarkFinder::lineAbove_data()
{
    QTest::addColumn<QByteArray>("before");
    QTest::addColumn<int>("length");
    QTest::addColumn<bool>("isKnown");
    const int most = 64 << 10; // that are read, line ends included
    QTest::newRow("first line") << QByteArray() << most - 1 << true;
    QTest::newRow("first line, very long") << QByteArray() << most << false;
    QTest::newRow("other line") << QByteArray("first\n") << most - 2 << true;
    QTest::newRow("other line, very long") << QByteArray("first\n") << most - 1 << false;
}

void tst_LogMarkFinder::lineAbove()
{
    QFETCH(QByteArray, before);
    QFETCH(int, length);
    QFETCH(bool, isKnown);
    const QByteArray line(length, 'x');
    QVERIFY(TestFiles::write(m_file, before + line + "\nb\n"));
    const LogMark mark = LogMark::Of(m_file, before.size() + length + 1);
    QCOMPARE(mark.line, LogMark::IdentityOf("b"));
    QCOMPARE(mark.above, isKnown ? LogMark::IdentityOf(line) : QByteArray());
}

void tst_LogMarkFinder::found_data()
{
    QTest::addColumn<QByteArray>("before");
    QTest::addColumn<int>("start");
    QTest::addColumn<QByteArray>("after");
    QTest::addColumn<int>("found");
    const auto row = [](char const* name, char const* before, int start, char const* after,
                        int found) {
        QTest::newRow(name) << QByteArray(before) << start << QByteArray(after) << found;
    };
    row("unchanged", "a\nb\nc\n", 2, "a\nb\nc\n", 2);
    row("first line", "a\nb\n", 0, "a\nb\n", 0);
    row("moved down", "a\nb\nc\n", 2, "new\na\nb\nc\n", 6);
    row("gone", "a\nb\nc\n", 2, "a\nx\nc\n", -1);
    row("another line of its length and place", "a\nb\nc\n", 2, "a\nB\nc\n", -1);
    row("grown", "a\nb\n", 2, "a\nb\nc\n", 2);
    row("between its neighbors", "a\nx\nb\nx\nc\n", 6, "x\na\nx\nb\nx\nc\n", 8);
    row("below the same line", "a\nx\nb\nx\nc\n", 6, "x\nb\nx\ny\nx\n", 4);
    row("above the same line", "a\nx\nb\nx\nc\n", 6, "x\ny\nx\nc\n", 4);
    row("equal neighbors, same place", "x\nx\nx\nx\nx\n", 4, "x\nx\nx\nx\nx\n", 4);
    row("below the same line, farther away", "a\nx\nbbb\n", 2, "qq\nx\nq\nx\nbbb\n", 7);
    row("first line, and a line like it", "x\nb\nx\nc\n", 0, "x\nb\nx\nc\n", 0);
    row("only the line above is the same, farther away", "a\nx\nb\n", 2, "x\nb\na\nx\n", 0);
    row("only the line below is the same, farther away", "a\nx\nb\n", 2, "a\nx\nq\nx\nb\n", 2);
    row("equally far away", "a\nx\nb\n", 2, "x\nq\nx\n", 0);
    row("empty line", "a\n\nb\n", 2, "new\na\n\nb\n", 6);
    row("without a line end", "a\nb", 2, "a\nb", 2);
    row("other line ends", "a\nb\nc\n", 2, "a\r\nb\r\nc\r\n", 3);
    row("file emptied", "a\nb\nc\n", 2, "", -1);
}

void tst_LogMarkFinder::found()
{
    QFETCH(QByteArray, before);
    QFETCH(int, start);
    QFETCH(QByteArray, after);
    QFETCH(int, found);
    QVERIFY(TestFiles::write(m_file, before));
    LogMark mark = LogMark::Of(m_file, start);
    mark.isFound = false;
    mark.note = "why";
    QVERIFY(TestFiles::write(m_file, after));
    const QVector<LogMark> marks = find({mark});
    QCOMPARE(marks.size(), 1);
    QCOMPARE(marks[0].isFound, found >= 0);
    QCOMPARE(marks[0].start, qint64(found >= 0 ? found : start));
    QCOMPARE(marks[0].note, QString("why"));
}

void tst_LogMarkFinder::wideCharacters()
{
    LogFileType type;
    type.encoding = LogEncoding::Utf16Le;
    const QByteArray line("\n\1b\0", 4); // no line feed
    const QByteArray end("\r\0\n\0", 4);
    const QByteArray other("o\0", 2);
    QVERIFY(TestFiles::write(m_file, other + end + line + end + other));
    const LogMark mark = LogMark::Of(m_file, 6, type);
    QCOMPARE(mark.line, LogMark::IdentityOf(line));
    QCOMPARE(mark.above, LogMark::IdentityOf(other));
    QCOMPARE(mark.below, LogMark::IdentityOf(other));

    QVERIFY(TestFiles::write(m_file, line + end + other + end + line + end + other));
    QVector<LogMark> result;
    LogMarkFinder finder;
    connect(&finder, &LogMarkFinder::found, this,
            [&](int, QVector<LogMark> const& found) { result = found; });
    finder.Find(1, m_file, {mark}, type);
    QCOMPARE(result.size(), 1);
    QVERIFY(result.first().isFound);
    QCOMPARE(result.first().start, qint64(14));
}

void tst_LogMarkFinder::severalMarks()
{
    QVERIFY(TestFiles::write(m_file, "a\nb\nc\nb\n"));
    const QVector<LogMark> marks{LogMark::Of(m_file, 6), LogMark::Of(m_file, 0),
                                 LogMark::Of(m_file, 2)};
    QVERIFY(TestFiles::write(m_file, "0\na\nb\nc\nb\n"));
    const QVector<LogMark> found = find(marks);
    QCOMPARE(found.size(), 3);
    QCOMPARE(found[0].start, qint64(8));
    QCOMPARE(found[1].start, qint64(2));
    QCOMPARE(found[2].start, qint64(4));
}

void tst_LogMarkFinder::noFile()
{
    QVERIFY(TestFiles::write(m_file, "a\n"));
    const LogMark mark = LogMark::Of(m_file, 0);
    QVERIFY(QFile::remove(m_file));
    const QVector<LogMark> found = find({mark});
    QCOMPARE(found.size(), 1);
    QVERIFY(!found[0].isFound);
}

void tst_LogMarkFinder::obsoleteRequest()
{
    QVERIFY(TestFiles::write(m_file, "a\n"));
    const LogMark mark = LogMark::Of(m_file, 0);
    QCOMPARE(find({mark}, 2).size(), 0);
    const QVector<LogMark> current = find({mark}, 1);
    QVERIFY(current.size() == 1 && current[0].isFound);
}

QTEST_GUILESS_MAIN(tst_LogMarkFinder)

#include "tst_LogMarkFinder.moc"
