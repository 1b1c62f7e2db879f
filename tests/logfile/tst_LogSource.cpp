// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/logfile/LogSource.h"

#include "app/logfile/OlderLogFiles.h"

#include "OlderFiles.h"

#include <QTemporaryDir>
#include <QtTest>

using namespace Velocor;

class tst_LogSource : public QObject
{
    Q_OBJECT

private slots:
    void initTestCase();
    void files_data();
    void files();
    void fileAt_data();
    void fileAt();
    void logAt();
    void equality();

private:
    LogSource source(QString const& kind) const;
    static QString text(LogSource::File const& file);

    QTemporaryDir m_folder;
    std::shared_ptr<OlderLogFiles const> m_older;
};

// Two of ten and twenty bytes.
void tst_LogSource::initTestCase()
{
    OlderFiles older(m_folder.path() + '/');
    older.add(QByteArray(10, 'a'));
    older.add(QByteArray(20, 'b'));
    m_older = older.files();
}

LogSource tst_LogSource::source(QString const& kind) const
{
    if (kind == "one file")
        return LogSource("app.log");
    if (kind == "no older ones")
        return LogSource("app.log", std::make_shared<OlderLogFiles>());
    const LogSource all("app.log", m_older);
    if (kind == "with older ones")
        return all;
    LogSource logs;
    logs.logs = std::make_shared<std::vector<LogSource>>(
        std::vector<LogSource>{LogSource("first.log"), all, LogSource("last.log")});
    return logs;
}

// The name of a file and its start, from that of the log it is in.
QString tst_LogSource::text(LogSource::File const& file)
{
    const QString start = QString::number(file.start % LogSource::LogSize);
    return QString("%1.%2 %3")
        .arg(file.start / LogSource::LogSize)
        .arg(start)
        .arg(QFileInfo(file.path).fileName());
}

void tst_LogSource::files_data()
{
    QTest::addColumn<QString>("expected");

    QTest::newRow("one file") << "0.0 app.log";
    QTest::newRow("no older ones") << "0.0 app.log";
    QTest::newRow("with older ones") << "0.0 0.log, 0.10 1.log, 0.30 app.log";
    QTest::newRow("several logs")
        << "0.0 first.log, 1.0 0.log, 1.10 1.log, 1.30 app.log, 2.0 last.log";
}

void tst_LogSource::files()
{
    QFETCH(QString, expected);
    QStringList found;
    for (LogSource::File const& file : source(QTest::currentDataTag()).Files())
        found.append(text(file));
    QCOMPARE(found.join(", "), expected);
}

void tst_LogSource::fileAt_data()
{
    QTest::addColumn<QString>("kind");
    QTest::addColumn<qint64>("offset");
    QTest::addColumn<QString>("expected");

    const auto add = [](char const* kind, qint64 offset, char const* expected) {
        QTest::addRow("%s, %lld", kind, static_cast<long long>(offset))
            << QString(kind) << offset << QString(expected);
    };
    add("one file", 0, "0.0 app.log");
    add("one file", 1000, "0.0 app.log");
    add("no older ones", 0, "0.0 app.log");
    add("no older ones", -2, "0.0 app.log"); // a heading
    add("with older ones", 0, "0.0 0.log");
    add("with older ones", 9, "0.0 0.log");
    add("with older ones", 10, "0.10 1.log");
    add("with older ones", 29, "0.10 1.log");
    add("with older ones", 30, "0.30 app.log");
    const qint64 log = LogSource::LogSize;
    add("several logs", 0, "0.0 first.log");
    add("several logs", log - 1, "0.0 first.log");
    add("several logs", log, "1.0 0.log");
    add("several logs", log + 10, "1.10 1.log");
    add("several logs", log + 30, "1.30 app.log");
    add("several logs", 2 * log, "2.0 last.log");
    add("several logs", 3 * log, "2.0 last.log");
}

void tst_LogSource::fileAt()
{
    QFETCH(QString, kind);
    QFETCH(qint64, offset);
    QFETCH(QString, expected);
    QCOMPARE(text(source(kind).FileAt(offset)), expected);
}

void tst_LogSource::logAt()
{
    const LogSource logs = source("several logs");
    QCOMPARE(logs.LogAt(0), size_t(0));
    QCOMPARE(logs.LogAt(LogSource::LogSize - 1), size_t(0));
    QCOMPARE(logs.LogAt(LogSource::LogSize), size_t(1));
    QCOMPARE(logs.LogAt(2 * LogSource::LogSize), size_t(2));
    QCOMPARE(logs.LogAt(-LogSource::LogSize), size_t(0)); // a heading
    QCOMPARE(source("one file").LogAt(LogSource::LogSize), size_t(0));
}

void tst_LogSource::equality()
{
    const LogSource all = source("with older ones");
    QVERIFY(all == source("with older ones"));
    QVERIFY(all != source("one file"));
    QVERIFY(source("one file") == LogSource("app.log"));
    QVERIFY(source("one file") != LogSource("other.log"));
    const LogSource logs = source("several logs");
    QVERIFY(logs == LogSource(logs));
    QVERIFY(logs != source("several logs")); // others of the same names
}

QTEST_GUILESS_MAIN(tst_LogSource)
#include "tst_LogSource.moc"
