// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/history/HistoryScanner.h"

#include "app/logfile/LogBytes.h"
#include "app/logfile/LogLineReader.h"
#include "support/TestFiles.h"

#include <QTemporaryDir>
#include <QtTest>

using namespace Velocor;

namespace {

QByteArray Entry(char const* day, char const* message)
{
    return QByteArray(day) + " 08:00:00.000 Trace " + message + '\n';
}

QByteArray Wide(QByteArray const& text)
{
    QByteArray bytes("\xff\xfe");
    for (char byte : text)
        bytes.append(byte).append('\0');
    return bytes;
}

// A scanner that keeps its last update.
class Scanner
{
public:
    Scanner()
    {
        QObject::connect(&m_scanner, &HistoryScanner::updated, &m_scanner,
                         [this](HistoryUpdate const& now) {
                             update = now;
                             ++updates;
                         });
    }

    void open(QString const& path, LogFilter const& filter = LogFilter())
    {
        m_path = path;
        m_scanner.Open(0, path, LogLineParser(), filter, true);
    }

    // The last characters of the lines, and a bar for each heading.
    QString shown() const
    {
        QString text;
        LogLineParser parser;
        parser.SetFileType(update.type);
        LogLineReader reader;
        reader.Open({m_path, update.older}, update.type);
        for (size_t row = 0; row < update.rows->size(); ++row)
            text += update.rows->isHeading(row)
                        ? QString("|")
                        : parser.Text(reader.Line(update.rows->start(row))).right(1);
        return text;
    }

    HistoryScanner* operator->() { return &m_scanner; }

    HistoryUpdate update;
    int updates = 0;

private:
    HistoryScanner m_scanner;
    QString m_path;
};

} // namespace

class tst_HistoryScanner : public QObject
{
    Q_OBJECT

private slots:
    void joins_data();
    void joins();
    void bytesOfAllFiles();
    void slowLine();
    void counts();
    void isReadAgain();
    void linesAddedToOlderFile();
    void emptyCurrentFile();
    void changesOnlyWhatIsNew();
    void obsoleteRequest();
    void oneFile();

private:
    QString log(char const* name) const { return m_folder.filePath(name); }

    QTemporaryDir m_folder;
};

void tst_HistoryScanner::joins_data()
{
    QTest::addColumn<QByteArray>("older");
    QTest::addColumn<QByteArray>("current");
    QTest::addColumn<QString>("shown");
    const auto row = [](char const* name, QByteArray const& older, QByteArray const& current,
                        char const* shown) {
        QTest::newRow(name) << older << current << shown;
    };
    const QByteArray a = Entry("2025-03-01", "a");
    const QByteArray b = Entry("2025-03-02", "b");
    row("whole lines", a, b, "|a|b");
    row("no line end", a + "c", b, "|ac|b");
    row("empty older file", "", b, "|b");
    row("no entries", "x\ny\n", b, "|xy|b");
    row("UTF-16", Wide(a), Wide(b), "|a|b");
    row("UTF-16 without a line end", Wide(a + "c"), Wide(b), "|ac|b");
    row("UTF-16 cut in a character", Wide(a + "cd").left(2 * a.size() + 5), Wide(b), "|ac|b");
}

void tst_HistoryScanner::joins()
{
    QFETCH(QByteArray, older);
    QFETCH(QByteArray, current);
    QFETCH(QString, shown);
    const QString path = log("joined.log");
    QVERIFY(TestFiles::write(path + ".1", older));
    QVERIFY(TestFiles::write(path, current));
    Scanner scanner;
    scanner.open(path);
    QCOMPARE(scanner.shown(), shown);
}

void tst_HistoryScanner::bytesOfAllFiles()
{
    const QString path = log("bytes.log");
    QVERIFY(TestFiles::write(path + ".2", "ab"));
    QVERIFY(TestFiles::write(path + ".1", "cd\n"));
    QVERIFY(TestFiles::write(path, "ef"));
    Scanner scanner;
    scanner.open(path);
    LogBytes bytes;
    QVERIFY(bytes.Open({path, scanner.update.older}));
    const QByteArray all("ab\ncd\nef");
    QCOMPARE(bytes.size(), qint64(all.size()));
    for (int from = 0; from <= all.size(); ++from) {
        for (int count = 0; count <= all.size(); ++count) {
            QVERIFY(bytes.Seek(from));
            QCOMPARE(bytes.Read(count), all.mid(from, count));
        }
    }
    QFile::remove(path + ".2"); // as when the log is pruned
    QVERIFY(bytes.Seek(0));
    QCOMPARE(bytes.Read(2), QByteArray("ab"));
}

void tst_HistoryScanner::slowLine()
{
    const QString path = log("slow.log");
    const QByteArray slow(5000, 'a');
    QVERIFY(TestFiles::write(path + ".1", Entry("2025-03-01", "x")));
    QVERIFY(TestFiles::write(path, Entry("2025-03-02", "y") + slow + "\n"));
    LogFilter filter;
    QVERIFY(filter.SetText("(a|aa)+$(?<=b)", true, true));
    Scanner scanner;
    scanner.open(path, filter);
    QCOMPARE(scanner.update.slowLine, size_t(3));
}

void tst_HistoryScanner::counts()
{
    const QString path = log("counts.log");
    QVERIFY(TestFiles::write(path + ".1", "2025-03-01 08:00:00.000 Warning a\n"));
    QVERIFY(TestFiles::write(path, "2025-03-03 08:00:00.000 Error b\nrest of an entry\n"
                                   "2025-03-02 08:00:00.000 Warning c\n"
                                   "2025-03-02 08:00:01.000 Fatal d\n"));
    Scanner scanner;
    scanner.open(path);
    QCOMPARE(scanner.update.lines, size_t(5));
    QCOMPARE(scanner.update.counts[LogEntry::Warning], size_t(2));
    std::vector<RunHeading> const& runs = *scanner.update.runs;
    QCOMPARE(runs.size(), size_t(3));
    QCOMPARE(runs[0].warnings, size_t(1));
    QCOMPARE(runs[1].warnings, size_t(1));
    QCOMPARE(runs[1].errors, size_t(1));
    QCOMPARE(runs[2].warnings, size_t(0));
    QCOMPARE(runs[2].errors, size_t(1));
    QCOMPARE(runs[1].end, QString("2025-03-02 08:00:01.000"));
}

void tst_HistoryScanner::isReadAgain()
{
    const QString path = log("again.log");
    QVERIFY(TestFiles::write(path + ".1", Entry("2025-03-01", "a")));
    QVERIFY(TestFiles::write(path, Entry("2025-03-03", "c")));
    Scanner scanner;
    scanner.open(path);
    // By a program that still has it open.
    QVERIFY(TestFiles::writeOver(path + ".1", Entry("2025-03-01", "a") + Entry("2025-03-02", "b")));
    scanner->Poll();
    QCOMPARE(scanner.shown(), QString("|ab|c"));
    const int updates = scanner.updates;
    scanner->Poll();
    QCOMPARE(scanner.updates, updates);
}

// The lines of the current file move back in the table of all lines.
void tst_HistoryScanner::linesAddedToOlderFile()
{
    const QString path = log("added.log");
    const QByteArray a = Entry("2025-03-01", "a");
    QVERIFY(TestFiles::write(path + ".1", a));
    QVERIFY(TestFiles::write(path, Entry("2025-03-02", "b") + Entry("2025-03-02", "long e")));
    Scanner scanner;
    scanner.open(path);
    QCOMPARE(scanner.shown(), QString("|a|be"));
    QVERIFY(TestFiles::write(path + ".1", a + QByteArray(100, 'c') + "\nd\n"));
    scanner->Poll();
    QCOMPARE(scanner.shown(), QString("|acd|be"));
}

void tst_HistoryScanner::emptyCurrentFile()
{
    const QString path = log("empty.log");
    QVERIFY(TestFiles::write(path + ".1", Wide(Entry("2025-03-01", "a"))));
    QVERIFY(TestFiles::write(path, ""));
    Scanner scanner;
    scanner.open(path);
    QCOMPARE(scanner.shown(), QString("|a"));
    QVERIFY(TestFiles::write(path, Wide(Entry("2025-03-02", "b"))));
    scanner->Poll();
    QCOMPARE(scanner.shown(), QString("|a|b"));
}

void tst_HistoryScanner::changesOnlyWhatIsNew()
{
    const QString path = log("new.log");
    const QByteArray b = Entry("2025-03-02", "b");
    QVERIFY(TestFiles::write(path + ".1", Entry("2025-03-01", "a")));
    QVERIFY(TestFiles::write(path, b));
    Scanner scanner;
    scanner.open(path);
    QVERIFY(TestFiles::writeOver(path, b + Entry("2025-03-02", "c")));
    scanner->Poll();
    QCOMPARE(scanner.shown(), QString("|a|bc"));
    QVERIFY(!scanner.update.isReset);
    QCOMPARE(scanner.update.removed + scanner.update.inserted, size_t(0));
    QCOMPARE(scanner.update.changedTail, size_t(0));
    scanner->SetFolded((*scanner.update.runs)[0].id, true);
    QCOMPARE(scanner.shown(), QString("||bc"));
    QVERIFY(!scanner.update.isReset);
    QCOMPARE(scanner.update.changeAt, size_t(1));
    QCOMPARE(scanner.update.removed, size_t(1));
}

void tst_HistoryScanner::obsoleteRequest()
{
    const QString path = log("obsolete.log");
    QVERIFY(TestFiles::write(path + ".1", Entry("2025-03-01", "a")));
    QVERIFY(TestFiles::write(path, Entry("2025-03-02", "b")));
    Scanner scanner;
    scanner->SetCurrentRequest(1);
    scanner.open(path);
    QCOMPARE(scanner.updates, 0);
    LogFilter filter;
    filter.SetText("a\\b", true, true);
    scanner->SetFilter(1, filter); // all that was left out is made up for
    QCOMPARE(scanner.shown(), QString("|a|"));
}

void tst_HistoryScanner::oneFile()
{
    const QString path = log("one.log");
    QVERIFY(TestFiles::write(path + ".1", Entry("2025-03-01", "a")));
    QVERIFY(TestFiles::write(path, Entry("2025-03-02", "b")));
    Scanner scanner;
    scanner.open(path);
    scanner->Open(0, path, LogLineParser(), LogFilter(), false);
    QVERIFY(!scanner.update.older);
    QVERIFY(!scanner.update.runs);
    QCOMPARE(scanner.update.rows->size(), size_t(1));
}

QTEST_GUILESS_MAIN(tst_HistoryScanner)
#include "tst_HistoryScanner.moc"
