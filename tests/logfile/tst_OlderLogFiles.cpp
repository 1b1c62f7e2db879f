// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/logfile/OlderLogFiles.h"

#include "OlderFiles.h"

#include <QTemporaryDir>
#include <QtTest>

using namespace Velocor;

class tst_OlderLogFiles : public QObject
{
    Q_OBJECT

private slots:
    void init();
    void places();
    void noFiles();
    void reads_data();
    void reads();
    void cannotBeRead();

private:
    QByteArray read(qint64 offset, int count) const;

    QTemporaryDir m_folder;
    std::unique_ptr<OlderFiles> m_older;
};

// "abc", without its line end, "de\n", and "fg\n" of a longer file.
void tst_OlderLogFiles::init()
{
    m_older = std::make_unique<OlderFiles>(m_folder.path() + '/');
    m_older->add("abc", "\n");
    m_older->add("de\n");
    m_older->add("fg\nhij\n", QByteArray(), 3);
}

// Up to ten bytes; "(-1)" if they cannot be read. What was not read stays as it was.
QByteArray tst_OlderLogFiles::read(qint64 offset, int count) const
{
    QByteArray bytes(10, '.');
    const qint64 found = m_older->files()->Read(offset, bytes.data(), count);
    if (bytes.mid(int(qMax<qint64>(found, 0))).count('.') != 10 - qMax<qint64>(found, 0))
        return "more than it says";
    return found < 0 ? QByteArray("(-1)") : bytes.left(int(found));
}

void tst_OlderLogFiles::places()
{
    OlderLogFiles const& files = *m_older->files();
    QCOMPARE(files.count(), size_t(3));
    QCOMPARE(files.size(), qint64(10));
    const qint64 starts[] = {0, 4, 7};
    for (size_t file = 0; file < 3; ++file) {
        QCOMPARE(files.start(file), starts[file]);
        QCOMPARE(files.path(file), m_folder.filePath(QString("%1.log").arg(file)));
    }
    const size_t fileOf[] = {0, 0, 0, 0, 1, 1, 1, 2, 2, 2, 3, 3};
    for (qint64 offset = 0; offset < 12; ++offset)
        QCOMPARE(files.FileAt(offset), fileOf[offset]);
}

void tst_OlderLogFiles::noFiles()
{
    const OlderLogFiles files;
    QCOMPARE(files.size(), qint64(0));
    QCOMPARE(files.FileAt(0), size_t(0));
    QCOMPARE(files.FileAt(-2), size_t(0)); // as that of a heading
    QCOMPARE(files.Read(0, nullptr, 0), qint64(0));
}

void tst_OlderLogFiles::reads_data()
{
    QTest::addColumn<int>("offset");
    QTest::addColumn<int>("count");
    QTest::addColumn<QByteArray>("bytes");

    QTest::newRow("a whole file") << 4 << 3 << QByteArray("de\n");
    QTest::newRow("a part") << 1 << 1 << QByteArray("b");
    QTest::newRow("no further than the file") << 1 << 9 << QByteArray("bc");
    QTest::newRow("its line end") << 3 << 9 << QByteArray("\n");
    QTest::newRow("nothing of its line end") << 3 << 0 << QByteArray();
    QTest::newRow("of the last file only what counts") << 7 << 9 << QByteArray("fg\n");
    QTest::newRow("the last byte") << 9 << 9 << QByteArray("\n");
    QTest::newRow("the end") << 10 << 9 << QByteArray();
    QTest::newRow("beyond the end") << 11 << 9 << QByteArray();
}

void tst_OlderLogFiles::reads()
{
    QFETCH(int, offset);
    QFETCH(int, count);
    QFETCH(QByteArray, bytes);
    QCOMPARE(read(offset, count), bytes);
}

void tst_OlderLogFiles::cannotBeRead()
{
    OlderLogFiles files;
    files.Add("gone.log", std::make_shared<QFile>(m_folder.filePath("gone.log")), 5, QByteArray());
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression("not open"));
    char bytes[5];
    QCOMPARE(files.Read(0, bytes, 5), qint64(-1));
}

QTEST_GUILESS_MAIN(tst_OlderLogFiles)
#include "tst_OlderLogFiles.moc"
