// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/history/HistoryBytes.h"

#include "support/TestFiles.h"

#include <QTemporaryDir>
#include <QtTest>

#include <random>

using namespace Velocor;

namespace {

// No two parts of it are the same.
QByteArray Numbers(int count)
{
    QByteArray bytes;
    for (int number = 0; number < count; ++number)
        bytes += QByteArray::number(number) + ' ';
    return bytes;
}

} // namespace

class tst_HistoryBytes : public QObject
{
    Q_OBJECT

private slots:
    void init();
    void anyParts();
    void atTheEnd();
    void notOpen();

private:
    QTemporaryDir m_folder;
    std::shared_ptr<QFile> m_file;
};

void tst_HistoryBytes::init()
{
    m_file = std::make_shared<QFile>(m_folder.filePath("app.log"));
}

void tst_HistoryBytes::anyParts()
{
    const QByteArray bytes = Numbers(200000);
    QVERIFY(TestFiles::write(m_file->fileName(), bytes));
    QVERIFY(m_file->open(QIODevice::ReadOnly | QIODevice::Unbuffered));
    HistoryBytes parts(m_file);
    std::mt19937 random(1);
    int start = 0;
    for (int part = 0; part < 2000; ++part) {
        // Mostly onward, as the lines of a file are read.
        start = random() % 4 ? start + int(random() % 2000) : int(random() % bytes.size());
        start = start > bytes.size() ? 0 : start;
        const int size = random() % 50 ? int(random() % 9000) : int(random() % 600000);
        QCOMPARE(parts.At(start, size), bytes.mid(start, size));
    }
}

void tst_HistoryBytes::atTheEnd()
{
    const QByteArray bytes("0123456789");
    QVERIFY(TestFiles::write(m_file->fileName(), bytes));
    QVERIFY(m_file->open(QIODevice::ReadOnly | QIODevice::Unbuffered));
    HistoryBytes parts(m_file);
    QCOMPARE(parts.At(4, 100), QByteArray("456789"));
    QCOMPARE(parts.At(9, 2), QByteArray("9"));
    QCOMPARE(parts.At(10, 1), QByteArray());
    QCOMPARE(parts.At(20, 5), QByteArray());
    QCOMPARE(parts.At(0, 10), bytes);
}

void tst_HistoryBytes::notOpen()
{
    QVERIFY(TestFiles::write(m_file->fileName(), "0123456789"));
    HistoryBytes parts(m_file);
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression("not open"));
    QCOMPARE(parts.At(0, 5), QByteArray());
}

QTEST_GUILESS_MAIN(tst_HistoryBytes)
#include "tst_HistoryBytes.moc"
