// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Lines that leave the window: copied in other formats, and saved to a file.

#include "WindowParts.h"
#include "WindowTestCase.h"

#include "app/window/log/LineSaver.h"
#include "app/window/widgets/NoticeBar.h"
#include "support/ProcessLimits.h"
#include "support/TestFiles.h"

#include <QClipboard>
#include <QFileDialog>
#include <QLineEdit>

using namespace Velocor;
using namespace WindowParts;

using DemoLog::entry;
using DemoLog::run;

namespace {

void SaveLines(MainWindow& window, QString const& path)
{
    WindowTest::whenShown<QFileDialog>([&](QFileDialog* chooser) {
        auto* name = chooser->findChild<QLineEdit*>("fileNameEdit");
        name->setText(path);
        QTest::keyClick(name, Qt::Key_Return);
    });
    QTest::keyClick(&window, Qt::Key_S, Qt::ControlModifier | Qt::ShiftModifier);
}

} // namespace

class tst_LinesElsewhere : public WindowTestCase
{
    Q_OBJECT

private slots:
    void copiesAsMarkdown_data();
    void copiesAsMarkdown();
    void copiesAsCsv();
    void copiesTheProgramAsCsv();
    void copiesFromTheMenu_data();
    void copiesFromTheMenu();
    void copiesNothingWithoutASelection();
    void savesFilteredLines();
    void savesManyLines();
    void saverKeepsBytes_data();
    void saverKeepsBytes();
    void saverLeavesTheOldFile_data();
    void saverLeavesTheOldFile();
    void wideCharacters();
    void fullDiskLeavesTheOldFile();
    void tellsWhyNothingWasSaved();
};

void tst_LinesElsewhere::copiesAsMarkdown_data()
{
    QTest::addColumn<QString>("message");
    QTest::addColumn<QString>("fence");
    QTest::newRow("plain") << "a *b* <c> | d"
                           << "```";
    QTest::newRow("a fence in the text") << "a ``` b"
                                         << "````";
    QTest::newRow("a longer one") << "`````"
                                  << "``````";
}

void tst_LinesElsewhere::copiesAsMarkdown()
{
    QFETCH(QString, message);
    QFETCH(QString, fence);
    const QByteArray log =
        entry("09:00:00.000", "Trace", message) + entry("09:00:01.000", "Error", "second");
    const WindowTest test(log);
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 2, Patience);
    QTest::keyClick(window.get(), Qt::Key_A, Qt::ControlModifier);
    QTest::keyClick(window.get(), Qt::Key_D, Qt::ControlModifier | Qt::AltModifier);
    QCOMPARE(QGuiApplication::clipboard()->text(),
             fence + "\n" + QString::fromLatin1(log) + fence + "\n");
    QCOMPARE(Status(*window), QString("2 lines copied"));
}

// A line that is shown shortened is copied whole.
void tst_LinesElsewhere::copiesAsCsv()
{
    const QString longText = QString(10000, 'x') + " end";
    const WindowTest test(entry("09:00:00.000", "Trace", "a, \"b\"") +
                          entry("09:00:01.000", "Error", longText) + "no entry\n");
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 3, Patience);
    QTest::keyClick(window.get(), Qt::Key_A, Qt::ControlModifier);
    QTest::keyClick(window.get(), Qt::Key_V, Qt::ControlModifier | Qt::AltModifier);
    const QString expected = "\"Time\",\"Severity\",\"Elapsed\",\"Message\"\r\n"
                             "\"2025-03-03 09:00:00.000\",\"Trace\",\"\",\"a, \"\"b\"\"\"\r\n"
                             "\"2025-03-03 09:00:01.000\",\"Error\",\"\",\"" +
                             longText + "\"\r\n\"\",\"\",\"\",\"no entry\"\r\n";
    // The clipboard may have its own line ends.
    QCOMPARE(QGuiApplication::clipboard()->text().remove('\r'), QString(expected).remove('\r'));
    QCOMPARE(Status(*window), QString("3 lines copied"));
}

void tst_LinesElsewhere::copiesTheProgramAsCsv()
{
    const WindowTest test(entry("09:00:00.000", "Trace", "a"));
    const QString path = test.folder() + "journal.export";
    QVERIFY(TestFiles::write(path, "__CURSOR=s=1\nMESSAGE=hello\nSYSLOG_IDENTIFIER=sshd\n\n"));
    const auto window = WindowTest::show();
    window->OpenFile(path);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 1, Patience);
    QCOMPARE(Panel(*window)->path(), path);
    QTest::keyClick(window.get(), Qt::Key_A, Qt::ControlModifier);
    QTest::keyClick(window.get(), Qt::Key_V, Qt::ControlModifier | Qt::AltModifier);
    const QString copied = QGuiApplication::clipboard()->text();
    QVERIFY2(copied.contains("\"sshd: hello\""), qPrintable(copied));
}

void tst_LinesElsewhere::copiesFromTheMenu_data()
{
    QTest::addColumn<int>("key");
    QTest::addColumn<QString>("start");
    QTest::newRow("as it is") << int(Qt::Key_C) << "2025-03-03";
    QTest::newRow("Markdown") << int(Qt::Key_K) << "```\n2025";
    QTest::newRow("CSV") << int(Qt::Key_V) << "\"Time\",";
}

void tst_LinesElsewhere::copiesFromTheMenu()
{
    QFETCH(int, key);
    QFETCH(QString, start);
    const WindowTest test(run(3, QTime(9, 0), "x"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 3, Patience);
    View(*window)->GoToRow(1);
    QContextMenuEvent byKey(QContextMenuEvent::Keyboard, QPoint(1, 1));
    QApplication::sendEvent(View(*window)->viewport(), &byKey);
    QWidget* menu = QApplication::activePopupWidget();
    QVERIFY(menu);
    QTest::keyClick(menu, static_cast<Qt::Key>(key));
    QVERIFY2(QGuiApplication::clipboard()->text().startsWith(start),
             qPrintable(QGuiApplication::clipboard()->text()));
    QCOMPARE(window->statusBar()->currentMessage(), QString("1 line copied"));
}

void tst_LinesElsewhere::copiesNothingWithoutASelection()
{
    const WindowTest test(run(3, QTime(9, 0), "x"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 3, Patience);
    QGuiApplication::clipboard()->setText("before");
    QTest::keyClick(window.get(), Qt::Key_V, Qt::ControlModifier | Qt::AltModifier);
    QCOMPARE(QGuiApplication::clipboard()->text(), QString("before"));
    QCOMPARE(Status(*window), QString("No lines selected"));
}

// Without headings, and only what the filter shows.
void tst_LinesElsewhere::savesFilteredLines()
{
    const QByteArray older = run(20, QTime(9, 0), "older line", true);
    const QByteArray newer = run(5, QTime(9, 0), "newer");
    const WindowTest test(DemoLog::writtenOver(older, newer));
    const QString file = test.folder() + "lines.log";
    const auto window = WindowTest::show();
    QTRY_VERIFY_WITH_TIMEOUT(Rows(*window) > 7, Patience);
    QTest::keyClick(window.get(), Qt::Key_L, Qt::ControlModifier);
    QTest::keyClicks(QApplication::focusWidget(), "1");
    QTRY_VERIFY_WITH_TIMEOUT(!Panel(*window)->model()->isReading() &&
                                 Panel(*window)->model()->filter().hasText(),
                             Patience);
    QByteArray expected;
    LogModel const* model = Panel(*window)->model();
    for (int row = 0; row < model->rowCount(); ++row) {
        if (model->LineStart(row) >= 0)
            expected += model->LineText(row, 4096).toLatin1() + '\n';
    }
    QVERIFY(expected.count('\n') > 3 && expected.count('\n') < model->rowCount());
    SaveLines(*window, file);
    QTRY_COMPARE_WITH_TIMEOUT(TestFiles::read(file), expected, Patience);
    QTRY_COMPARE_WITH_TIMEOUT(Status(*window),
                              QString("%1 lines saved to %2").arg(expected.count('\n')).arg(file),
                              Patience);
}

void tst_LinesElsewhere::savesManyLines()
{
    const WindowTest test;
    const QByteArray log = run(80000, QTime(0, 0), "x");
    const QString source = test.folder() + "source.log";
    const QString target = test.folder() + "target.log";
    QVERIFY(TestFiles::write(source, log));
    const auto window = WindowTest::show();
    window->OpenFile(source);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 80000, Patience);
    SaveLines(*window, target);
    QTRY_VERIFY_WITH_TIMEOUT(Status(*window).startsWith("80,000 lines saved"), Patience);
    QCOMPARE(TestFiles::read(target), log);
}

void tst_LinesElsewhere::saverKeepsBytes_data()
{
    QTest::addColumn<QByteArray>("log");
    QTest::addColumn<QVector<qint64>>("starts");
    QTest::addColumn<QByteArray>("expected");
    QTest::newRow("any byte") << QByteArray("\xE4\x00\xFF\x1B\nb\n", 7) << QVector<qint64>{0}
                              << QByteArray("\xE4\x00\xFF\x1B\n", 5);
    QTest::newRow("line ends") << QByteArray("a\r\nb\n") << QVector<qint64>{0, 3}
                               << QByteArray("a\r\nb\n");
    QTest::newRow("in the order given")
        << QByteArray("a\nb\n") << QVector<qint64>{2, 0} << QByteArray("b\na\n");
    QTest::newRow("last line without an end")
        << QByteArray("a\nb") << QVector<qint64>{2, 0} << QByteArray("b\na\n");
    QTest::newRow("empty line") << QByteArray("a\n\nb\n") << QVector<qint64>{2} << QByteArray("\n");
    QTest::newRow("long line") << QByteArray(200000, 'x') + "\ny\n"
                               << QVector<qint64>{0} << QByteArray(200000, 'x') + "\n";
    QTest::newRow("no lines") << QByteArray("a\n") << QVector<qint64>() << QByteArray();
}

void tst_LinesElsewhere::saverKeepsBytes()
{
    QFETCH(QByteArray, log);
    QFETCH(QVector<qint64>, starts);
    const QTemporaryDir folder;
    QVERIFY(TestFiles::write(folder.filePath("log"), log));
    LineSaver saver(folder.filePath("log"), starts, LogFileType(), folder.filePath("saved"));
    saver.start();
    QVERIFY(saver.wait());
    QCOMPARE(saver.error(), QString());
    QTEST(TestFiles::read(folder.filePath("saved")), "expected");
}

void tst_LinesElsewhere::saverLeavesTheOldFile_data()
{
    QTest::addColumn<QString>("source");
    QTest::addColumn<QString>("target");
    QTest::addColumn<qint64>("start");
    QTest::newRow("the log itself") << "log"
                                    << "log" << qint64(0);
    QTest::newRow("a link to the log") << "log"
                                       << "link" << qint64(0);
    QTest::newRow("no log any more") << "gone"
                                     << "old" << qint64(0);
    QTest::newRow("the log is shorter now") << "log"
                                            << "old" << qint64(100);
    QTest::newRow("no such folder") << "log"
                                    << "no/such/folder" << qint64(0);
    QTest::newRow("a folder") << "log"
                              << "folder" << qint64(0);
}

void tst_LinesElsewhere::saverLeavesTheOldFile()
{
    QFETCH(QString, source);
    QFETCH(QString, target);
    QFETCH(qint64, start);
    const QTemporaryDir folder;
    QVERIFY(TestFiles::write(folder.filePath("log"), "a\nb\n"));
    QVERIFY(TestFiles::write(folder.filePath("old"), "old"));
    QVERIFY(QDir(folder.path()).mkdir("folder"));
    QVERIFY(QFile::link(folder.filePath("log"), folder.filePath("link")));
    const QStringList before = QDir(folder.path()).entryList();
    LineSaver saver(folder.filePath(source), {0, start}, LogFileType(), folder.filePath(target));
    saver.start();
    QVERIFY(saver.wait());
    QVERIFY(!saver.error().isEmpty());
    QCOMPARE(TestFiles::read(folder.filePath("log")), QByteArray("a\nb\n"));
    QCOMPARE(TestFiles::read(folder.filePath("old")), QByteArray("old"));
    QCOMPARE(QDir(folder.path()).entryList(), before);
}

// A character with a byte that would be a line feed, across the first bytes that are read.
void tst_LinesElsewhere::wideCharacters()
{
    LogFileType type;
    type.encoding = LogEncoding::Utf16Le;
    const QByteArray end("\n\0", 2);
    const QByteArray first = QByteArray("\n\1", 2).repeated(400) + end;
    const QByteArray last("\n\1", 2);
    const QTemporaryDir folder;
    QVERIFY(TestFiles::write(folder.filePath("log"), first + last));
    LineSaver saver(folder.filePath("log"), {first.size(), 0}, type, folder.filePath("saved"));
    saver.start();
    QVERIFY(saver.wait());
    QCOMPARE(saver.error(), QString());
    QCOMPARE(TestFiles::read(folder.filePath("saved")), last + end + first);
}

void tst_LinesElsewhere::fullDiskLeavesTheOldFile()
{
    const QTemporaryDir folder;
    QVERIFY(TestFiles::write(folder.filePath("log"), QByteArray(100000, 'x') + "\n"));
    QVERIFY(TestFiles::write(folder.filePath("old"), "old"));
    if (!ProcessLimits::limitFileSize(1000))
        QSKIP("the size of files cannot be limited here");
    LineSaver saver(folder.filePath("log"), {0}, LogFileType(), folder.filePath("old"));
    saver.start();
    saver.wait();
    ProcessLimits::unlimitFileSize();
    QVERIFY(!saver.error().isEmpty());
    QCOMPARE(TestFiles::read(folder.filePath("old")), QByteArray("old"));
}

void tst_LinesElsewhere::tellsWhyNothingWasSaved()
{
    const WindowTest test(run(3, QTime(9, 0), "x"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 3, Patience);
    SaveLines(*window, "/proc/lines.log");
    const auto told = [&] {
        const QList<NoticeBar*> bars = window->findChildren<NoticeBar*>();
        return std::any_of(bars.begin(), bars.end(), [](NoticeBar const* bar) {
            return bar->isVisible() &&
                   bar->text().startsWith("Could not save lines to /proc/lines.log: ");
        });
    };
    QTRY_VERIFY_WITH_TIMEOUT(told(), Patience);
}

QTEST_MAIN(tst_LinesElsewhere)

#include "tst_LinesElsewhere.moc"
