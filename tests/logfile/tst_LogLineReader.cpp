// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/logfile/LogLineReader.h"

#include "support/MessageCapture.h"
#include "support/TestFiles.h"

#include <QTemporaryDir>
#include <QtTest>

using namespace Velocor;

namespace {

constexpr int Slice = 64 << 10; // bytes that are read at once

LogFileType Wide(LogEncoding const& encoding)
{
    LogFileType type;
    type.encoding = encoding;
    return type;
}

LogFileType Journal()
{
    LogFileType type;
    type.isForeign = true;
    type.isJournal = true;
    return type;
}

// ASCII in the encoding of a file.
QByteArray Encoded(QByteArray const& text, LogFileType const& type)
{
    const QByteArray end = type.lineEnd().bytes();
    if (type.isJournal || end.size() == 1)
        return text;
    QByteArray bytes;
    for (char c : text) {
        if (end.startsWith('\0'))
            bytes.append('\0').append(c);
        else
            bytes.append(c).append('\0');
    }
    return bytes;
}

} // namespace

class tst_LogLineReader : public QObject
{
    Q_OBJECT

private slots:
    void notOpen();
    void openedAgain();
    void longestLine();
    void endsBetweenSlices_data();
    void endsBetweenSlices();
    void carriageReturns();
    void growingFile_data();
    void growingFile();

private:
    QTemporaryDir m_folder;
    QString m_file = m_folder.filePath("app.log");
};

void tst_LogLineReader::notOpen()
{
    LogLineReader reader;
    QVERIFY(!reader.Open(m_folder.filePath("none")));
    QCOMPARE(reader.Line(0), QByteArray());
    QCOMPARE(reader.nextStart(), qint64(0));
}

void tst_LogLineReader::openedAgain()
{
    const QString other = m_folder.filePath("other.log");
    QVERIFY(TestFiles::write(m_file, "one\ntwo\nthree\n"));
    QVERIFY(TestFiles::write(other, "1\n2\n3\n4\n5\n"));
    const MessageCapture messages;
    LogLineReader reader;
    for (qint64 before : {0, 4}) {
        QVERIFY(reader.Open(m_file));
        QVERIFY(!reader.Line(before).isEmpty());
        QVERIFY(reader.Open(other));
        QCOMPARE(reader.Line(4), QByteArray("3"));
        QCOMPARE(reader.Line(0), QByteArray("1"));
    }
    QCOMPARE(messages.texts(), QStringList());
}

// Not all of it is read, at any place in the file; what remains is taken for another line.
void tst_LogLineReader::longestLine()
{
    QVERIFY(TestFiles::write(m_file, '\n' + QByteArray(LogLineReader::LineLimit + 9 * Slice, 'x')));
    LogLineReader reader;
    QVERIFY(reader.Open(m_file));
    for (qint64 start : {1, 2, 3}) {
        QCOMPARE(reader.Line(0), QByteArray());
        const int length = reader.Line(start).size();
        QVERIFY(length >= LogLineReader::LineLimit);
        QVERIFY(length < LogLineReader::LineLimit + Slice);
        QCOMPARE(reader.nextStart(), start + length);
    }
    QVERIFY(reader.Open(m_file));
    QCOMPARE(reader.Line(Slice).size(), LogLineReader::LineLimit);
}

void tst_LogLineReader::endsBetweenSlices_data()
{
    QTest::addColumn<LogFileType>("type");
    QTest::newRow("bytes") << LogFileType();
    QTest::newRow("UTF-16, low byte first") << Wide(LogEncoding::Utf16Le);
    QTest::newRow("UTF-16, high byte first") << Wide(LogEncoding::Utf16Be);
    QTest::newRow("empty lines") << Journal();
}

void tst_LogLineReader::endsBetweenSlices()
{
    QFETCH(LogFileType, type);
    const QByteArray end = type.lineEnd().bytes();
    const QByteArray b = Encoded("b", type);
    for (int length = Slice - 8; length < Slice + 8; length += b.size()) {
        // One line feed alone ends no entry of a journal.
        for (int feed = 1; feed < (type.isJournal ? 8 : 2); ++feed) {
            QByteArray line = Encoded(QByteArray(length / b.size(), 'x'), type);
            if (feed > 1)
                line[length - feed] = '\n';
            QVERIFY(TestFiles::write(m_file, line + end + b + end + end));
            LogLineReader reader;
            QVERIFY(reader.Open(m_file, type));
            QCOMPARE(reader.Line(0), line);
            QCOMPARE(reader.nextStart(), qint64(line.size() + end.size()));
            QCOMPARE(reader.Line(reader.nextStart()), b);
            QCOMPARE(reader.Line(reader.nextStart()), QByteArray());
        }
    }
}

void tst_LogLineReader::growingFile_data()
{
    endsBetweenSlices_data();
}

// An incomplete line may still get another character after its carriage return.
void tst_LogLineReader::carriageReturns()
{
    QVERIFY(TestFiles::write(m_file, "ab\r\ncd\r"));
    LogLineReader reader;
    QVERIFY(reader.Open(m_file));
    QCOMPARE(reader.Line(0), QByteArray("ab"));
    QCOMPARE(reader.nextStart(), qint64(4));
    QCOMPARE(reader.Line(4), QByteArray("cd\r"));
    QCOMPARE(reader.nextStart(), qint64(7));

    const LogFileType type = Wide(LogEncoding::Utf16Le);
    QVERIFY(TestFiles::write(m_file, Encoded("ab\r\ncd\r", type)));
    QVERIFY(reader.Open(m_file, type));
    QCOMPARE(reader.Line(0), Encoded("ab", type));
    QCOMPARE(reader.nextStart(), qint64(8));
    QCOMPARE(reader.Line(8), Encoded("cd\r", type));
}

// Read whenever there is another byte.
void tst_LogLineReader::growingFile()
{
    QFETCH(LogFileType, type);
    const QByteArray end = type.lineEnd().bytes();
    const QByteArray line = Encoded("ab", type);
    const QByteArray all = line + end + line;
    QVERIFY(TestFiles::write(m_file, QByteArray()));
    LogLineReader reader;
    QVERIFY(reader.Open(m_file, type));
    for (int size = 1; size <= all.size(); ++size) {
        QVERIFY(TestFiles::writeOver(m_file, all.left(size)));
        const bool hasEnd = size >= line.size() + end.size();
        QCOMPARE(reader.Line(0), hasEnd ? line : all.left(size));
        QCOMPARE(reader.nextStart(), qint64(hasEnd ? line.size() + end.size() : size));
    }
    QCOMPARE(reader.Line(reader.nextStart()), line);
}

QTEST_GUILESS_MAIN(tst_LogLineReader)
#include "tst_LogLineReader.moc"
