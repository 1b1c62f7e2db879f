// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The bytes of a log, compared with a text that holds them all.

#include "app/logfile/LogBytes.h"

#include "app/logfile/OlderLogFiles.h"

#include "OlderFiles.h"

#include <QTemporaryDir>
#include <QtTest>

#include <random>

using namespace Velocor;

namespace {

constexpr qint64 Log = LogSource::LogSize;

} // namespace

class tst_LogBytes : public QObject
{
    Q_OBJECT

private slots:
    void init();
    void oneFile();
    void withOlderFiles();
    void severalLogs();
    void someLogsAreMissing();
    void onlyOlderFiles();
    void cannotBeOpened_data();
    void cannotBeOpened();
    void growsAndShrinks();
    void anotherSource();
    void olderFileThatCannotBeRead();

private:
    QString path(char const* name) const { return m_folder->filePath(name); }
    static void compare(LogBytes& bytes, qint64 first, QByteArray const& expected);

    std::unique_ptr<QTemporaryDir> m_folder;
    QByteArray m_text;
};

void tst_LogBytes::init()
{
    m_folder = std::make_unique<QTemporaryDir>();
    m_text.clear();
    for (int number = 0; number < 200; ++number)
        m_text += QByteArray::number(number) + '\n';
    QVERIFY(TestFiles::write(path("app.log"), m_text));
}

// Parts of a log from any offset on.
void tst_LogBytes::compare(LogBytes& bytes, qint64 first, QByteArray const& expected)
{
    std::mt19937 random(1);
    for (int i = 0; i < 500; ++i) {
        const int at = int(random() % unsigned(expected.size() + 1));
        const int count = int(random() % 300);
        QVERIFY(bytes.Seek(first + at));
        QCOMPARE(bytes.position(), first + at);
        const QByteArray part = bytes.Read(count);
        QCOMPARE(part, expected.mid(at, count));
        QCOMPARE(bytes.position(), first + at + part.size());
        QCOMPARE(bytes.Read(5), expected.mid(at + part.size(), 5)); // what follows
    }
    QVERIFY(bytes.Seek(first + expected.size() + 10));
    QCOMPARE(bytes.Read(5), QByteArray());
    QCOMPARE(bytes.position(), first + expected.size() + 10);
}

void tst_LogBytes::oneFile()
{
    LogBytes bytes;
    QVERIFY(!bytes.isOpen());
    QVERIFY(bytes.Open(path("app.log")));
    QVERIFY(bytes.isOpen());
    QCOMPARE(bytes.position(), qint64(0));
    QCOMPARE(bytes.size(), qint64(m_text.size()));
    compare(bytes, 0, m_text);
    QVERIFY(!bytes.Seek(-1));
    bytes.Close();
    QVERIFY(!bytes.isOpen());
}

void tst_LogBytes::withOlderFiles()
{
    OlderFiles older(m_folder->path() + '/');
    older.add("oldest without end", "\n");
    older.add("");
    older.add("older\n");
    LogBytes bytes;
    QVERIFY(bytes.Open(LogSource(path("app.log"), older.files())));
    const QByteArray all = "oldest without end\nolder\n" + m_text;
    QCOMPARE(bytes.size(), qint64(all.size()));
    compare(bytes, 0, all);
}

void tst_LogBytes::severalLogs()
{
    OlderFiles older(m_folder->path() + '/');
    older.add("older\n");
    QVERIFY(TestFiles::write(path("last.log"), "last\n"));
    LogSource source;
    source.logs = std::make_shared<std::vector<LogSource>>(std::vector<LogSource>{
        LogSource(path("app.log")), LogSource(path("app.log"), older.files()),
        LogSource(path("last.log"))});
    LogBytes bytes;
    QVERIFY(bytes.Open(source));
    QCOMPARE(bytes.size(), 2 * Log + 5);
    compare(bytes, 0, m_text);
    compare(bytes, Log, "older\n" + m_text);
    compare(bytes, 2 * Log, "last\n");
    QVERIFY(bytes.Seek(3 * Log));
    QCOMPARE(bytes.Read(5), QByteArray());
}

void tst_LogBytes::someLogsAreMissing()
{
    LogSource source;
    source.logs = std::make_shared<std::vector<LogSource>>(std::vector<LogSource>{
        LogSource(path("gone.log")), LogSource(path("app.log")), LogSource(path("gone.log"))});
    LogBytes bytes;
    QVERIFY(bytes.Open(source));
    compare(bytes, Log, m_text);
    QVERIFY(bytes.Seek(0));
    QCOMPARE(bytes.Read(5), QByteArray());

    source.logs = std::make_shared<std::vector<LogSource>>(2, LogSource(path("gone.log")));
    QVERIFY(!bytes.Open(source));
    QVERIFY(!bytes.isOpen());
}

// As after a rotation, before the program writes again.
void tst_LogBytes::onlyOlderFiles()
{
    OlderFiles older(m_folder->path() + '/');
    older.add("x");
    LogBytes bytes;
    QVERIFY(bytes.Open(LogSource(path("gone.log"), older.files())));
    compare(bytes, 0, "x");
}

void tst_LogBytes::cannotBeOpened_data()
{
    QTest::addColumn<QString>("name");

    QTest::newRow("no such file") << "gone.log";
    QTest::newRow("a folder") << ".";
}

void tst_LogBytes::cannotBeOpened()
{
    QFETCH(QString, name);
    LogBytes bytes;
    QVERIFY(!bytes.Open(path(qPrintable(name))));
    QVERIFY(!bytes.isOpen());
    QVERIFY(!bytes.Open(LogSource(path(qPrintable(name)),
                                  std::make_shared<OlderLogFiles>()))); // without older ones
}

void tst_LogBytes::growsAndShrinks()
{
    LogBytes bytes;
    QVERIFY(bytes.Open(path("app.log")));
    QVERIFY(bytes.Seek(m_text.size()));
    QCOMPARE(bytes.Read(5), QByteArray());
    QVERIFY(TestFiles::writeOver(path("app.log"), m_text + "more"));
    QCOMPARE(bytes.Read(100), QByteArray("more"));
    QVERIFY(QFile::resize(path("app.log"), 3));
    QCOMPARE(bytes.size(), qint64(3));
    QCOMPARE(bytes.Read(5), QByteArray());
    QVERIFY(bytes.Seek(1));
    QCOMPARE(bytes.Read(5), m_text.mid(1, 2));
}

// Nothing is left of the one before.
void tst_LogBytes::anotherSource()
{
    OlderFiles older(m_folder->path() + '/');
    older.add("older\n");
    LogBytes bytes;
    QVERIFY(bytes.Open(LogSource(path("app.log"), older.files())));
    QVERIFY(bytes.Seek(3));
    QVERIFY(bytes.Open(path("app.log")));
    QCOMPARE(bytes.position(), qint64(0));
    compare(bytes, 0, m_text);
    QVERIFY(!bytes.Open(path("gone.log")));
    QCOMPARE(bytes.size(), qint64(0));
}

// What could be read before it is not lost.
void tst_LogBytes::olderFileThatCannotBeRead()
{
    auto older = std::make_shared<OlderLogFiles>();
    auto file = std::make_shared<QFile>(path("app.log"));
    QVERIFY(file->open(QIODevice::ReadOnly | QIODevice::Unbuffered));
    older->Add(path("app.log"), file, 4, QByteArray());
    older->Add(path("gone.log"), std::make_shared<QFile>(path("gone.log")), 4, QByteArray());
    LogBytes bytes;
    QVERIFY(bytes.Open(LogSource(path("app.log"), older)));
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression("not open"));
    QCOMPARE(bytes.Read(20), m_text.left(4));
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression("not open"));
    char data[20];
    QCOMPARE(bytes.Read(data, 20), qint64(-1));
    QCOMPARE(bytes.position(), qint64(4));
}

QTEST_GUILESS_MAIN(tst_LogBytes)
#include "tst_LogBytes.moc"
