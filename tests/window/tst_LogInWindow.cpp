// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The window on a real screen, driven with keys and mouse.

#include "WindowParts.h"
#include "WindowTestCase.h"

#include "app/logfile/LogScanner.h"
#include "app/window/log/LogModel.h"
#include "app/window/log/LogSettingsDialog.h"
#include "app/window/log/LogView.h"
#include "app/window/widgets/LongText.h"
#include "support/WheelTurn.h"

#include <QAbstractButton>
#include <QCheckBox>
#include <QClipboard>
#include <QComboBox>
#include <QDialogButtonBox>
#include <QHeaderView>
#include <QLabel>
#include <QLineEdit>
#include <QMenuBar>
#include <QPlainTextEdit>
#include <QPushButton>
#include <QScrollBar>
#include <QSpinBox>
#include <QTextBlock>
#include <QToolButton>
#include <QTreeView>

using namespace Velocor;
using namespace WindowParts;

using DemoLog::entry;
using DemoLog::run;
using DemoLog::writtenOver;

namespace {

QPoint RowCentre(LogView* view, int row)
{
    return view->visualRect(view->model()->index(row, LogModel::MessageColumn)).center();
}

// QTest has keys only for ASCII.
void Type(QWidget* widget, QString const& text)
{
    QKeyEvent press(QEvent::KeyPress, Qt::Key_unknown, Qt::NoModifier, text);
    QApplication::sendEvent(widget, &press);
}

} // namespace

class tst_LogInWindow : public WindowTestCase
{
    Q_OBJECT

private slots:
    void showsTheLog();
    void followsTheLog();
    void followsUntilScrolled();
    void followsWhileResized();
    void firstProblemIsFound();
    void filterByText();
    void filterByExpression();
    void filterBySeverity();
    void otherPrograms();
    void journalExport();
    void wideCharacters();
    void choosesEncoding();
    void emptyColumns_data();
    void emptyColumns();
    void longStamps();
    void becomesForeign();
    void pauses();
    void overwrittenWhilePaused();
    void entriesOfSeveralLines();
    void copiesLines();
    void copiesFromTheMenu();
    void problems();
    void noProblems();
    void problemsStartInView();
    void firstKey_data();
    void firstKey();
    void firstKeyInTheMiddle();
    void homeAndEnd();
    void selectionStartsAtTheJump();
    void currentLineStays();
    void slowExpression();
    void currentLine();
    void olderFiles();
    void earlierRuns();
    void keepsItsPlace();

    void logSettings();
    void logSettingsRefused();

    void logSwitchedOff();
    void stateOfTheLogCanBeDismissed();
    void rowsAreAlikeEverywhere();
    void emptyTableSaysWhatToDo();
    void compressedFile();
    void textSize();
    void wheelZooms();
    void monospacedFont();
};

void tst_LogInWindow::showsTheLog()
{
    const WindowTest test(
        writtenOver(run(9, QTime(17, 0), "older", true), run(4, QTime(9, 0), "newer")));
    const auto window = WindowTest::show();
    QTRY_VERIFY_WITH_TIMEOUT(Rows(*window) > 4, Patience);
    LogModel* model = Panel(*window)->model();
    QCOMPARE(model->index(0, 0).data().toString(), QString("Earlier"));
    QCOMPARE(model->index(model->rowCount() - 5, 0).data().toString(), QString("This run"));
    QCOMPARE(model->index(model->rowCount() - 1, LogModel::MessageColumn).data().toString(),
             QString("newer 3"));
    QCOMPARE(View(*window)->visualRect(model->index(0, 0)).width(),
             View(*window)->horizontalHeader()->length());
    QVERIFY(View(*window)->isColumnHidden(LogModel::ElapsedColumn));
}

void tst_LogInWindow::followsTheLog()
{
    const WindowTest test(run(200, QTime(9, 0), "x"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 200, Patience);
    LogView* view = View(*window);
    QTRY_COMPARE_WITH_TIMEOUT(view->verticalScrollBar()->value(),
                              view->verticalScrollBar()->maximum(), Patience);
    QVERIFY(TestFiles::writeOver(test.logFile(), run(300, QTime(9, 0), "x")));
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 300, Patience);
    QCOMPARE(view->verticalScrollBar()->value(), view->verticalScrollBar()->maximum());
    QVERIFY(view->visualRect(view->model()->index(299, 0)).isValid());
}

void tst_LogInWindow::followsUntilScrolled()
{
    const WindowTest test(run(200, QTime(9, 0), "x"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 200, Patience);
    LogView* view = View(*window);
    view->setFocus();
    QTest::keyClick(view, Qt::Key_Home, Qt::ControlModifier);
    QVERIFY(!Panel(*window)->isFollowing());
    QVERIFY(!Action(*window, "Follow Newest")->isChecked());
    const int place = view->verticalScrollBar()->value();
    QVERIFY(TestFiles::writeOver(test.logFile(), run(300, QTime(9, 0), "x")));
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 300, Patience);
    QCOMPARE(view->verticalScrollBar()->value(), place);

    QTest::keyClick(view, Qt::Key_End, Qt::ControlModifier);
    QVERIFY(Panel(*window)->isFollowing());
    QTest::keyClick(view, Qt::Key_Home, Qt::ControlModifier);
    QTest::keyClick(window.get(), Qt::Key_N, Qt::ControlModifier | Qt::ShiftModifier);
    QVERIFY(Panel(*window)->isFollowing());
    QCOMPARE(view->verticalScrollBar()->value(), view->verticalScrollBar()->maximum());
}

void tst_LogInWindow::followsWhileResized()
{
    const WindowTest test(run(60, QTime(9, 0), "x"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 60, Patience);
    LogView* view = View(*window);
    const auto newest = [&] {
        return view->visualRect(view->model()->index(59, LogModel::MessageColumn));
    };
    QTRY_VERIFY_WITH_TIMEOUT(view->viewport()->rect().contains(newest().center()), Patience);
    for (int height : {450, 560}) {
        window->resize(700, height);
        QTRY_COMPARE_WITH_TIMEOUT(window->height(), height, Patience);
        QVERIFY(view->isFollowing());
        QVERIFY(view->viewport()->rect().contains(newest().center()));
    }
    view->SetFollowing(false);
    const int position = view->verticalScrollBar()->value();
    window->resize(700, 450);
    QTRY_COMPARE_WITH_TIMEOUT(window->height(), 450, Patience);
    QCOMPARE(view->verticalScrollBar()->value(), position);
}

// Getting the focus makes no line the current one, so the search starts before the first line.
void tst_LogInWindow::firstProblemIsFound()
{
    const WindowTest test(entry("09:00:00.000", "Error", "a") +
                          entry("09:00:01.000", "Trace", "b"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 2, Patience);
    LogView* view = View(*window);
    Child<QLineEdit>(window.get(), "Filter by text")->setFocus();
    view->setFocus();
    QTRY_VERIFY_WITH_TIMEOUT(view->hasFocus(), Patience);
    QVERIFY(!view->currentIndex().isValid());
    QCOMPARE(Child<QPlainTextEdit>(window.get(), "Full text of the current line")->toPlainText(),
             QString());
    QTest::keyClick(window.get(), Qt::Key_F8);
    QCOMPARE(view->currentIndex().row(), 0);
}

void tst_LogInWindow::filterByText()
{
    const WindowTest test(run(30, QTime(9, 0), "Entry"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 30, Patience);
    QTest::keyClick(window.get(), Qt::Key_L, Qt::ControlModifier);
    QVERIFY(Child<QLineEdit>(window.get(), "Filter by text")->hasFocus());
    QTest::keyClicks(QApplication::focusWidget(), "entry 2");
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 11, Patience);
    auto const* summary = Child<QLabel>(window.get(), "Lines shown");
    QTRY_VERIFY2_WITH_TIMEOUT(summary->text().startsWith("11 of 30 lines"),
                              qPrintable(summary->text()), Patience);

    ClickBox(Child<QCheckBox>(window.get(), "Match case"));
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 0, Patience);
    QTest::keyClick(window.get(), Qt::Key_F, Qt::ControlModifier | Qt::ShiftModifier);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 30, Patience);

    // Marks are drawn in a color that is used nowhere else.
    QTest::keyClick(window.get(), Qt::Key_L, Qt::ControlModifier);
    QTest::keyClicks(QApplication::focusWidget(), "Entry 7");
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 1, Patience);
    LogView* view = View(*window);
    const QColor yellow(0xff, 0xe0, 0x66);
    QTRY_VERIFY_WITH_TIMEOUT(Pixels(view->viewport(), yellow) > 50, Patience);
    Panel(*window)->ClearFilter();
    QTRY_COMPARE_WITH_TIMEOUT(Pixels(view->viewport(), yellow), 0, Patience);
}

void tst_LogInWindow::filterByExpression()
{
    const WindowTest test(run(30, QTime(9, 0), "x"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 30, Patience);
    ClickBox(Child<QCheckBox>(window.get(), "Regular expression"));
    QTest::keyClick(window.get(), Qt::Key_L, Qt::ControlModifier);
    QTest::keyClicks(QApplication::focusWidget(), "x (3|4)$");
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 2, Patience);

    auto const* error = Child<QLabel>(window.get(), "Filter error");
    QVERIFY(!error->isVisible());
    QTest::keyClicks(QApplication::focusWidget(), "(");
    QTRY_VERIFY_WITH_TIMEOUT(error->isVisible(), Patience);
    QVERIFY2(error->text().contains("at character"), qPrintable(error->text()));
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 30, Patience);
    QTest::keyClick(QApplication::focusWidget(), Qt::Key_Backspace);
    QTRY_VERIFY_WITH_TIMEOUT(!error->isVisible(), Patience);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 2, Patience);
}

void tst_LogInWindow::filterBySeverity()
{
    const WindowTest test(entry("09:00:00.000", "Trace", "a") +
                          entry("09:00:01.000", "Error", "b") + entry("09:00:02.000", "", "c"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 3, Patience);
    Click(Child<QToolButton>(window.get(), "Show Trace"));
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 2, Patience); // the line without one stays
    QTest::keyClick(window.get(), Qt::Key_6, Qt::ControlModifier);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 1, Patience);
    QCOMPARE(View(*window)->model()->index(0, LogModel::MessageColumn).data().toString(),
             QString("b"));
    QTest::keyClick(window.get(), Qt::Key_4, Qt::ControlModifier);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 0, Patience);
    QTest::keyClick(window.get(), Qt::Key_1, Qt::ControlModifier);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 1, Patience);
}

// With its times and severities, as one run; problems are found and lines copied as in any log.
void tst_LogInWindow::otherPrograms()
{
    const WindowTest test(run(1, QTime(9, 0), "x"));
    const QString path = test.folder() + "syslog";
    QVERIFY(TestFiles::write(path, "Nov 22 14:03:02 host cron[7]: caf\xC3\xA9\n"
                                   "Nov 22 14:03:03 host app[8]: ERROR disk full\n"
                                   "    more about it\n"
                                   "Jan  1 14:03:04 host cron[7]: x\n"));
    const auto window = WindowTest::show();
    window->OpenFile(path);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 4, Patience);
    LogView* view = View(*window);
    const auto text = [&](int row, int column) {
        return view->model()->index(row, column).data().toString();
    };
    QCOMPARE(text(0, LogModel::TimeColumn), QString("Nov 22 14:03:02"));
    QCOMPARE(text(0, LogModel::MessageColumn), QString("host cron[7]: caf\u00e9"));
    QCOMPARE(text(1, LogModel::SeverityColumn), QString("Error"));
    QVERIFY(!view->isColumnHidden(LogModel::TimeColumn));
    QVERIFY(!view->isColumnHidden(LogModel::SeverityColumn));
    QVERIFY(Child<QLabel>(window.get(), "Lines shown")->text().endsWith("1 problem"));

    QTest::keyClick(window.get(), Qt::Key_F8);
    QCOMPARE(view->currentIndex().row(), 1);
    QTest::keyClick(window.get(), Qt::Key_6, Qt::ControlModifier);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 2, Patience); // the error and what follows it
    QTest::keyClick(window.get(), Qt::Key_6, Qt::ControlModifier);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 4, Patience);
    QTest::keyClick(window.get(), Qt::Key_L, Qt::ControlModifier);
    Type(QApplication::focusWidget(), "caf\u00e9");
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 1, Patience);
}

// One row for an entry, which has many lines in the file.
void tst_LogInWindow::journalExport()
{
    const WindowTest test(run(1, QTime(9, 0), "x"));
    const QString path = test.folder() + "journal.export";
    const QByteArray first("__CURSOR=s=1\n__REALTIME_TIMESTAMP=1795442582000000\nPRIORITY=3\n"
                           "MESSAGE=disk full\n_PID=7");
    QVERIFY(TestFiles::write(path, first + "\n\n__CURSOR=s=2\nMESSAGE=more\nPRIORITY=6\n_COMM=x\n"
                                           "SYSLOG_IDENTIFIER=sshd\n\n"));
    const auto window = WindowTest::show();
    window->OpenFile(path);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 2, Patience);
    LogView* view = View(*window);
    const auto text = [&](int row, int column) {
        return view->model()->index(row, column).data().toString();
    };
    const QDateTime time = QDateTime::fromMSecsSinceEpoch(1795442582000);
    QCOMPARE(text(0, LogModel::TimeColumn), time.toString("yyyy-MM-dd hh:mm:ss.zzz"));
    QCOMPARE(text(0, LogModel::SeverityColumn), QString("Error"));
    QCOMPARE(text(0, LogModel::MessageColumn), QString("disk full"));
    QCOMPARE(text(1, LogModel::MessageColumn), QString("sshd: more"));
    QCOMPARE(Panel(*window)->model()->MessageText(1), QString("more"));
    QTest::keyClick(window.get(), Qt::Key_F8);
    QCOMPARE(Child<QPlainTextEdit>(Panel(*window), "Full text of the current line")->toPlainText(),
             QString(first));
}

void tst_LogInWindow::wideCharacters()
{
    const WindowTest test(run(1, QTime(9, 0), "x"));
    const QString path = test.folder() + "wide.log";
    const QString text = "\ufeff2026-11-22 14:03:02 ERROR caf\u00e9 \u20ac\r\n"
                         "2026-11-22 14:03:03 INFO \u0a0a\r\n";
    const QByteArray bytes(reinterpret_cast<char const*>(text.utf16()), 2 * text.size());
    QVERIFY(TestFiles::write(path, bytes));
    const auto window = WindowTest::show();
    window->OpenFile(path);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 2, Patience);
    LogView* view = View(*window);
    const auto cell = [&](int row, int column) {
        return view->model()->index(row, column).data().toString();
    };
    QCOMPARE(cell(0, LogModel::TimeColumn), QString("2026-11-22 14:03:02"));
    QCOMPARE(cell(0, LogModel::SeverityColumn), QString("Error"));
    QCOMPARE(cell(0, LogModel::MessageColumn), QString("caf\u00e9 \u20ac"));
    QCOMPARE(cell(1, LogModel::MessageColumn), QString("\u0a0a"));

    view->setFocus();
    QTest::mouseClick(view->viewport(), Qt::LeftButton, Qt::NoModifier, RowCentre(view, 0));
    QCOMPARE(Child<QPlainTextEdit>(Panel(*window), "Full text of the current line")->toPlainText(),
             QString("2026-11-22 14:03:02 ERROR caf\u00e9 \u20ac"));
    QTest::keyClick(view, Qt::Key_C, Qt::ControlModifier);
    QCOMPARE(QGuiApplication::clipboard()->text(),
             QString("2026-11-22 14:03:02 ERROR caf\u00e9 \u20ac\n"));
    QTest::keyClick(window.get(), Qt::Key_L, Qt::ControlModifier);
    Type(QApplication::focusWidget(), "caf\u00e9");
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 1, Patience);
}

void tst_LogInWindow::choosesEncoding()
{
    const WindowTest test(entry("09:00:00.000", "Trace", "caf\u00e9"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 1, Patience);
    const auto message = [&] {
        return View(*window)->model()->index(0, LogModel::MessageColumn).data().toString();
    };
    QCOMPARE(message(), QString("caf\u00e9"));
    QVERIFY(Action(*window, "Automatic")->isChecked());
    Action(*window, "UTF-8")->trigger();
    QTRY_COMPARE_WITH_TIMEOUT(message(), "caf" + QString(QChar::ReplacementCharacter), Patience);
    QVERIFY(Action(*window, "UTF-8")->isChecked() && !Action(*window, "Automatic")->isChecked());
    for (char const* name : {"UTF-16 LE", "UTF-16 BE"}) {
        Action(*window, name)->trigger();
        QTRY_VERIFY_WITH_TIMEOUT(!message().contains("caf"), Patience);
    }
    Action(*window, "Latin-1")->trigger();
    QTRY_COMPARE_WITH_TIMEOUT(message(), QString("caf\u00e9"), Patience);

    // Each tab has its own.
    const QString path = test.folder() + "other.log";
    QVERIFY(TestFiles::write(path, "x\n"));
    window->OpenFile(path);
    QVERIFY(Action(*window, "Automatic")->isChecked() && !Action(*window, "Latin-1")->isChecked());
}

void tst_LogInWindow::emptyColumns_data()
{
    QTest::addColumn<QByteArray>("file");
    QTest::addColumn<bool>("hasTimes");
    QTest::addColumn<bool>("hasSeverities");
    QTest::newRow("nothing at all") << QByteArray() << true << true;
    QTest::newRow("text") << QByteArray("a\nb\n") << false << false;
    QTest::newRow("times") << QByteArray("2026-11-22 14:03:02 a\n2026-11-22 14:03:03 b\n") << true
                           << false;
    QTest::newRow("severities") << QByteArray("[ERROR] a\n[INFO] b\n") << false << true;
}

// The current line can be reached with keys whichever columns are shown.
void tst_LogInWindow::emptyColumns()
{
    QFETCH(QByteArray, file);
    QFETCH(bool, hasTimes);
    QFETCH(bool, hasSeverities);
    const WindowTest test(run(1, QTime(9, 0), "x"));
    const QString path = test.folder() + "other.log";
    QByteArray more;
    for (int i = 0; i < 100; ++i)
        more += file;
    QVERIFY(TestFiles::write(path, more));
    const auto window = WindowTest::show();
    window->OpenFile(path);
    LogView* view = View(*window);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), more.count('\n'), Patience);
    QTRY_COMPARE_WITH_TIMEOUT(!view->isColumnHidden(LogModel::TimeColumn), hasTimes, Patience);
    QCOMPARE(!view->isColumnHidden(LogModel::SeverityColumn), hasSeverities);
    QVERIFY(!view->isColumnHidden(LogModel::MessageColumn));
    if (!hasSeverities)
        return;
    QTest::keyClick(view, Qt::Key_Home, Qt::ControlModifier);
    for (int i = 0; i < 60; ++i)
        QTest::keyClick(window.get(), Qt::Key_F8);
    const QModelIndex current = view->currentIndex();
    QCOMPARE(current.isValid(), !file.isEmpty());
    if (current.isValid())
        QVERIFY(view->viewport()->rect().intersects(view->visualRect(current)));
}

// Wide enough to be read; and as narrow as users make it.
void tst_LogInWindow::longStamps()
{
    const WindowTest test(run(1, QTime(9, 0), "x"));
    const QString path = test.folder() + "error.log";
    const QByteArray line("[Sun Nov 22 14:03:02.123456 2026] [core:error] [pid 7] x\n");
    QVERIFY(TestFiles::write(path, line));
    const auto window = WindowTest::show();
    window->OpenFile(path);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 1, Patience);
    LogView* view = View(*window);
    const QString stamp("Sun Nov 22 14:03:02.123456 2026");
    const int needed = view->fontMetrics().boundingRect(stamp).width();
    QTRY_VERIFY_WITH_TIMEOUT(view->columnWidth(LogModel::TimeColumn) > needed, Patience);
    view->setColumnWidth(LogModel::TimeColumn, 50);
    QVERIFY(TestFiles::writeOver(path, line + line));
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 2, Patience);
    QCOMPARE(view->columnWidth(LogModel::TimeColumn), 50);
}

// The first lines of a new file may not say yet what it is.
void tst_LogInWindow::becomesForeign()
{
    const WindowTest test(run(1, QTime(9, 0), "x"));
    const QString path = test.folder() + "other.log";
    QVERIFY(TestFiles::write(path, "starting\n2026-11-22 14:0"));
    const auto window = WindowTest::show();
    window->OpenFile(path);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 2, Patience);
    LogView* view = View(*window);
    QTRY_VERIFY_WITH_TIMEOUT(view->isColumnHidden(LogModel::TimeColumn), Patience);
    QVERIFY(TestFiles::writeOver(path, "starting\n2026-11-22 14:03:02 WARN caf\xC3\xA9\n"));
    QTRY_VERIFY_WITH_TIMEOUT(!view->isColumnHidden(LogModel::TimeColumn), Patience);
    QCOMPARE(view->model()->index(1, LogModel::SeverityColumn).data().toString(),
             QString("Warning"));
    QCOMPARE(view->model()->index(1, LogModel::MessageColumn).data().toString(),
             QString("caf\u00e9"));
}

void tst_LogInWindow::pauses()
{
    const WindowTest test(run(2, QTime(9, 0), "x"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 2, Patience);
    QTest::keyClick(window.get(), Qt::Key_P, Qt::ControlModifier | Qt::ShiftModifier);
    QVERIFY(Child<QLabel>(window.get(), "Lines shown")->text().endsWith("paused"));
    QVERIFY(TestFiles::writeOver(test.logFile(), run(5, QTime(9, 0), "x")));
    QTest::qWait(4 * LogScanner::PollInterval);
    QCOMPARE(Rows(*window), 2);
    QTest::keyClick(window.get(), Qt::Key_P, Qt::ControlModifier | Qt::ShiftModifier);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 5, Patience);
}

// The program is started again, and its log writes over the lines that are shown.
void tst_LogInWindow::overwrittenWhilePaused()
{
    const QByteArray log = run(200, QTime(9, 0), "x");
    const WindowTest test(log);
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 200, Patience);
    LogView* view = View(*window);
    view->setFocus();
    QTest::keyClick(view, Qt::Key_P, Qt::ControlModifier | Qt::ShiftModifier);
    QFile file(test.logFile());
    QVERIFY(file.open(QIODevice::ReadWrite));
    file.write(run(100, QTime(17, 0), "another"));
    file.close();

    auto const* pane = Child<QPlainTextEdit>(window.get(), "Full text of the current line");
    const QStringList lines = QString(log).split('\n');
    const QString gone = "This line is no longer in the file";
    int seen = 0;
    int goneRows = 0;
    QTest::mouseClick(view->viewport(), Qt::LeftButton, Qt::NoModifier, RowCentre(view, 199));
    while (seen < 60 && view->currentIndex().row() != 0) {
        QTest::keyClick(view, Qt::Key_PageUp);
        QTest::qWait(1); // paint
        const int row = view->currentIndex().row();
        QVERIFY(pane->toPlainText() == lines[row] || pane->toPlainText() == gone);
        QTest::keyClick(view, Qt::Key_C, Qt::ControlModifier);
        QCOMPARE(QGuiApplication::clipboard()->text(), pane->toPlainText() + '\n');
        goneRows += pane->toPlainText() == gone;
        ++seen;
    }
    QVERIFY(seen > 5);
    QVERIFY(goneRows > 0 && goneRows < seen);

    QTest::keyClick(view, Qt::Key_P, Qt::ControlModifier | Qt::ShiftModifier);
    QTRY_VERIFY_WITH_TIMEOUT(Rows(*window) != 200, Patience);
    const LogModel* model = Panel(*window)->model();
    QCOMPARE(model->index(Rows(*window) - 1, LogModel::MessageColumn).data().toString(),
             QString("another 99"));
    for (int row = 0; row < Rows(*window); ++row)
        QVERIFY(!model->IsGone(row));
}

// Filter, detail pane, copy and the search for problems work on the entry, not on its line.
void tst_LogInWindow::entriesOfSeveralLines()
{
    const QByteArray first =
        entry("09:00:00.000", "Error", "request failed") + "  at one\n  at two\n";
    const QByteArray second = entry("09:00:02.000", "Error", "once more") + "  at three\n";
    const WindowTest test(first + entry("09:00:01.000", "Trace", "between") + second);
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 6, Patience);
    LogView* view = View(*window);
    auto const* pane = Child<QPlainTextEdit>(window.get(), "Full text of the current line");

    QTest::mouseClick(view->viewport(), Qt::LeftButton, Qt::NoModifier, RowCentre(view, 2));
    QCOMPARE(pane->toPlainText() + '\n', QString(first));
    QTest::keyClick(view, Qt::Key_C, Qt::ControlModifier);
    QCOMPARE(QGuiApplication::clipboard()->text(), QString(first));
    QCOMPARE(Status(*window), QString("3 lines copied"));
    QTest::mouseClick(view->viewport(), Qt::LeftButton, Qt::ShiftModifier, RowCentre(view, 4));
    QTest::keyClick(view, Qt::Key_C, Qt::ControlModifier);
    QCOMPARE(QGuiApplication::clipboard()->text().toLatin1(), TestFiles::read(test.logFile()));

    QTest::keyClick(view, Qt::Key_F8);
    QCOMPARE(view->currentIndex().row(), 0); // from the second error around
    QTest::keyClick(view, Qt::Key_Down);
    QTest::keyClick(view, Qt::Key_F8);
    QCOMPARE(view->currentIndex().row(), 4);
    QTest::keyClick(view, Qt::Key_Down);
    QTest::keyClick(view, Qt::Key_F8, Qt::ShiftModifier);
    QCOMPARE(view->currentIndex().row(), 0);

    auto* field = Child<QLineEdit>(window.get(), "Filter by text");
    field->setFocus();
    QTest::keyClicks(field, "at two");
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 3, Patience);
    QCOMPARE(pane->toPlainText() + '\n', QString(first));
}

void tst_LogInWindow::copiesLines()
{
    const QByteArray log = run(20, QTime(9, 0), "x");
    const WindowTest test(log);
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 20, Patience);
    LogView* view = View(*window);
    view->setFocus();
    QTest::keyClick(view, Qt::Key_Home, Qt::ControlModifier);
    QTest::mouseClick(view->viewport(), Qt::LeftButton, Qt::NoModifier, RowCentre(view, 1));
    QTest::mouseClick(view->viewport(), Qt::LeftButton, Qt::ShiftModifier, RowCentre(view, 3));
    QTest::keyClick(view, Qt::Key_C, Qt::ControlModifier);
    const QStringList lines = QString(log).split('\n');
    QCOMPARE(QGuiApplication::clipboard()->text(),
             QStringList({lines[1], lines[2], lines[3], ""}).join('\n'));

    QTest::keyClick(view, Qt::Key_A, Qt::ControlModifier);
    QTest::keyClick(view, Qt::Key_C, Qt::ControlModifier);
    QCOMPARE(QGuiApplication::clipboard()->text(), QString(log));
    QCOMPARE(Status(*window), QString("20 lines copied"));
}

// From the menu too, a focused text field takes precedence over the log.
void tst_LogInWindow::copiesFromTheMenu()
{
    const QByteArray log = run(3, QTime(9, 0), "x");
    const WindowTest test(log);
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 3, Patience);
    View(*window)->clearSelection();
    window->setFocus();
    Action(*window, "Copy")->trigger();
    QCOMPARE(Status(*window), QString("No lines selected"));
    Action(*window, "Select All")->trigger();
    Action(*window, "Copy")->trigger();
    QCOMPARE(QGuiApplication::clipboard()->text(), QString(log));

    QLineEdit field("text", window.get());
    field.show();
    field.setFocus();
    Action(*window, "Select All")->trigger();
    Action(*window, "Copy")->trigger();
    QCOMPARE(QGuiApplication::clipboard()->text(), QString("text"));
}

void tst_LogInWindow::problems()
{
    const WindowTest test(
        entry("09:00:00.000", "Trace", "a") + entry("09:00:01.000", "Error", "b") +
        entry("09:00:02.000", "Trace", "c") + entry("09:00:03.000", "Warning", "d"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 4, Patience);
    QTest::keyClick(window.get(), Qt::Key_F8);
    QCOMPARE(View(*window)->currentIndex().row(), 1);
    QTest::keyClick(window.get(), Qt::Key_F8);
    QCOMPARE(View(*window)->currentIndex().row(), 3);
    QTest::keyClick(window.get(), Qt::Key_F8);
    QCOMPARE(View(*window)->currentIndex().row(), 1);
    QCOMPARE(Status(*window), QString("Continued from the top"));
    QTest::keyClick(window.get(), Qt::Key_F8, Qt::ShiftModifier);
    QCOMPARE(View(*window)->currentIndex().row(), 3);
    QCOMPARE(Status(*window), QString("Continued from the bottom"));
    QTest::keyClick(window.get(), Qt::Key_F8, Qt::ShiftModifier);
    QCOMPARE(Status(*window), QString());
    QCOMPARE(View(*window)->selectionModel()->selectedRows().size(), 1);
    QCOMPARE(View(*window)->currentIndex().row(), 1);
}

void tst_LogInWindow::noProblems()
{
    const WindowTest test(run(3, QTime(9, 0), "x"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 3, Patience);
    QTest::keyClick(window.get(), Qt::Key_F8);
    QCOMPARE(Status(*window), QString("No warnings or errors"));
    QVERIFY(!View(*window)->currentIndex().isValid());
}

// Without a current row the search begins with the rows in view, and the hit comes with context.
void tst_LogInWindow::problemsStartInView()
{
    QByteArray log;
    for (int i = 0; i < 300; ++i)
        log += entry(QTime(9, 0).addSecs(i).toString("hh:mm:ss.zzz"), i % 100 ? "Trace" : "Error",
                     QString("line %1").arg(i));
    const WindowTest test(log);
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 300, Patience);
    LogView* view = View(*window);
    view->verticalScrollBar()->setValue(150);
    QTest::keyClick(window.get(), Qt::Key_F8);
    QCOMPARE(view->currentIndex().row(), 200);
    QVERIFY(view->rowAt(0) < 200 - 3);
    QVERIFY(view->rowAt(view->viewport()->height() - 1) > 200 + 3);

    view->clearSelection();
    view->setCurrentIndex(QModelIndex());
    view->verticalScrollBar()->setValue(150);
    QTest::keyClick(window.get(), Qt::Key_F8, Qt::ShiftModifier);
    QCOMPARE(view->currentIndex().row(), 100);
}

// Whatever the filter shows and hides, the line that the user looks at stays where it is.
void tst_LogInWindow::firstKey_data()
{
    QTest::addColumn<Qt::Key>("key");
    QTest::addColumn<int>("least");
    QTest::addColumn<int>("most");
    QTest::newRow("up") << Qt::Key_Up << 499 << 499;
    QTest::newRow("down") << Qt::Key_Down << 499 << 499;
    QTest::newRow("page up") << Qt::Key_PageUp << 400 << 498;
    QTest::newRow("page down") << Qt::Key_PageDown << 499 << 499;
    QTest::newRow("home") << Qt::Key_Home << 0 << 0;
    QTest::newRow("end") << Qt::Key_End << 499 << 499;
}

// Nothing is selected, and the newest line is in view: a key starts from there.
void tst_LogInWindow::firstKey()
{
    QFETCH(Qt::Key, key);
    QFETCH(int, least);
    QFETCH(int, most);
    const WindowTest test(run(500, QTime(9, 0), "x"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 500, Patience);
    LogView* view = View(*window);
    QVERIFY(view->hasFocus());
    QVERIFY(!view->currentIndex().isValid());
    QTest::keyClick(view, key);
    const int row = view->currentIndex().row();
    QVERIFY2(row >= least && row <= most, qPrintable(QString::number(row)));
    QCOMPARE(view->selectionModel()->selectedRows().size(), 1);
    QVERIFY(view->viewport()->rect().contains(RowCentre(view, row)));
}

void tst_LogInWindow::firstKeyInTheMiddle()
{
    const WindowTest test(run(500, QTime(9, 0), "x"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 500, Patience);
    LogView* view = View(*window);
    view->verticalScrollBar()->setValue(200);
    QTest::keyClick(view, Qt::Key_Down);
    QCOMPARE(view->currentIndex().row(), 200);
    view->selectionModel()->clear();
    view->verticalScrollBar()->setValue(200);
    QTest::keyClick(view, Qt::Key_Up);
    const int last = view->currentIndex().row();
    QVERIFY(last > 203 && last < 300);
    QVERIFY(view->visualRect(view->currentIndex()).bottom() < view->viewport()->height());
}

void tst_LogInWindow::homeAndEnd()
{
    const WindowTest test(
        writtenOver(run(90, QTime(17, 0), "older", true), run(40, QTime(9, 0), "newer")));
    const auto window = WindowTest::show();
    QTRY_VERIFY_WITH_TIMEOUT(Rows(*window) > 40, Patience);
    LogView* view = View(*window);
    const int last = Rows(*window) - 1;
    view->GoToRow(50);
    const auto selected = [&] {
        QList<int> rows = view->SelectedRows();
        return rows.size() == 1 ? rows.first() : -1;
    };
    for (Qt::KeyboardModifiers held : {Qt::NoModifier, Qt::ControlModifier}) {
        QTest::keyClick(view, Qt::Key_End, held);
        QCOMPARE(view->currentIndex().row(), last);
        QCOMPARE(selected(), last);
        QTest::keyClick(view, Qt::Key_Home, held);
        QCOMPARE(view->currentIndex().row(), 1); // below the heading
        QCOMPARE(selected(), 1);
    }
    view->GoToRow(last - 4);
    QTest::keyClick(view, Qt::Key_End, Qt::ShiftModifier);
    QCOMPARE(view->SelectedRows().size(), 5);
}

void tst_LogInWindow::selectionStartsAtTheJump()
{
    const WindowTest test(run(200, QTime(9, 0), "x"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 200, Patience);
    LogView* view = View(*window);
    QTest::keyClick(view, Qt::Key_Home);
    QTest::keyClick(window.get(), Qt::Key_F8);
    const int row = view->currentIndex().row();
    QVERIFY(row > 2);
    QTest::keyClick(view, Qt::Key_Up, Qt::ShiftModifier);
    QTest::keyClick(view, Qt::Key_Up, Qt::ShiftModifier);
    QCOMPARE(view->SelectedRows(), QList<int>({row - 2, row - 1, row}));
}

void tst_LogInWindow::currentLineStays()
{
    QByteArray log;
    for (int i = 0; i < 300; ++i)
        log += entry(QTime(9, 0).addSecs(i).toString("hh:mm:ss.zzz"), i % 2 ? "Trace" : "Error",
                     QString("line %1").arg(i));
    const WindowTest test(log);
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 300, Patience);
    LogView* view = View(*window);
    auto* field = Child<QLineEdit>(window.get(), "Filter by text");
    field->setFocus();
    QTest::keyClicks(field, "line 15");
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 11, Patience);
    QTest::mouseClick(view->viewport(), Qt::LeftButton, Qt::NoModifier, RowCentre(view, 4));
    const auto message = [view] {
        const int row = view->currentIndex().row();
        return view->model()->index(row, LogModel::MessageColumn).data().toString();
    };
    QCOMPARE(message(), QString("line 153"));

    field->setFocus();
    QTest::keyClick(field, Qt::Key_A, Qt::ControlModifier);
    QTest::keyClick(field, Qt::Key_Delete);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 300, Patience);
    QCOMPARE(message(), QString("line 153"));
    QVERIFY(view->viewport()->rect().contains(view->visualRect(view->currentIndex()).center()));
    QCOMPARE(view->selectionModel()->selectedRows().size(), 1);
    QVERIFY(!view->isFollowing());

    // Filtered out: the nearest one.
    QTest::keyClick(window.get(), Qt::Key_1, Qt::ControlModifier);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 150, Patience);
    QVERIFY(message() == "line 152" || message() == "line 154");
    QVERIFY(view->viewport()->rect().contains(view->visualRect(view->currentIndex()).center()));
}

// An expression that takes too long is stopped and filters nothing.
void tst_LogInWindow::slowExpression()
{
    const WindowTest test(run(3, QTime(9, 0), "x") +
                          entry("10:00:00.000", "Trace", QString(200, 'a') + "1"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 4, Patience);
    ClickBox(Child<QCheckBox>(window.get(), "Regular expression"));
    auto* field = Child<QLineEdit>(window.get(), "Filter by text");
    field->setFocus();
    QTest::keyClicks(field, "(a+)+[b-z]$");
    auto* error = Child<QLabel>(window.get(), "Filter error");
    QTRY_COMPARE_WITH_TIMEOUT(
        error->text(),
        QString("The regular expression takes too long at line 4, nothing is filtered."), Patience);
    QVERIFY(error->isVisible());
    QCOMPARE(Rows(*window), 4);

    field->setFocus();
    QTest::keyClick(field, Qt::Key_A, Qt::ControlModifier);
    QTest::keyClicks(field, "x [12]");
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 2, Patience);
    QVERIFY(!error->isVisible());
}

// However long it is, and without a blank, all of it is in the pane and copied, from both.
void tst_LogInWindow::currentLine()
{
    QString message;
    while (message.size() < 8000000)
        message += QString::number(message.size()) + 'y';
    const QByteArray log = entry("09:00:00.000", "Trace", message) + "end\n";
    const WindowTest test(log);
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 2, Patience);
    LogView* view = View(*window);
    QTest::mouseClick(view->viewport(), Qt::LeftButton, Qt::NoModifier, RowCentre(view, 0));
    auto* line = Child<LongText>(window.get(), "Full text of the current line");
    QVERIFY(line->text() + '\n' == QString(log));
    QTest::keyClick(view, Qt::Key_C, Qt::ControlModifier);
    QVERIFY(QGuiApplication::clipboard()->text() == QString(log));

    // Line by line, because a paragraph would take Qt minutes.
    QVERIFY(line->document()->firstBlock().length() <= LongText::MaximumPart + 1);
    line->setFocus();
    QTest::keyClick(line, Qt::Key_A, Qt::ControlModifier);
    QTest::keyClick(line, Qt::Key_C, Qt::ControlModifier);
    QVERIFY(QGuiApplication::clipboard()->text() + '\n' == QString(log));
    QTextCursor part(line->document());
    part.setPosition(LongText::MaximumPart - 3);
    part.setPosition(LongText::MaximumPart + 4, QTextCursor::KeepAnchor);
    line->setTextCursor(part);
    QCOMPARE(line->SelectedText(), QString(log).mid(LongText::MaximumPart - 3, 6));
    part.setPosition(LongText::MaximumPart + 1);
    part.setPosition(LongText::MaximumPart + 4, QTextCursor::KeepAnchor);
    line->setTextCursor(part);
    QCOMPARE(line->SelectedText(), QString(log).mid(LongText::MaximumPart, 3));
}

void tst_LogInWindow::olderFiles()
{
    const WindowTest test(run(2, QTime(9, 0), "x"));
    QVERIFY(TestFiles::write(test.logFile() + ".1", run(7, QTime(8, 0), "one")));
    QVERIFY(TestFiles::write(test.logFile() + ".2", run(9, QTime(7, 0), "two")));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 2, Patience);
    auto* files = Child<QComboBox>(window.get(), "Log file");
    QVERIFY(files);
    files->showPopup();
    QCOMPARE(files->count(), 5); // and all of them, and the whole family
    QVERIFY2(files->itemText(1).startsWith("app.log.1 ("), qPrintable(files->itemText(1)));
    QWidget* list = files->view();
    QTest::keyClick(list, Qt::Key_Down);
    QTest::keyClick(list, Qt::Key_Down);
    QTest::keyClick(list, Qt::Key_Return);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 9, Patience);
    QCOMPARE(Panel(*window)->path(), test.logFile() + ".2");
    files->showPopup();
    QTest::keyClick(list, Qt::Key_Home);
    QTest::keyClick(list, Qt::Key_Return);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 2, Patience);
}

void tst_LogInWindow::earlierRuns()
{
    const WindowTest test(
        writtenOver(run(9, QTime(17, 0), "older", true), run(4, QTime(9, 0), "newer")));
    const auto window = WindowTest::show();
    QTRY_VERIFY_WITH_TIMEOUT(Rows(*window) > 4, Patience);
    QTest::keyClick(window.get(), Qt::Key_E, Qt::ControlModifier | Qt::ShiftModifier);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 4, Patience);
    QTest::keyClick(window.get(), Qt::Key_E, Qt::ControlModifier | Qt::ShiftModifier);
    QTRY_VERIFY_WITH_TIMEOUT(Rows(*window) > 4, Patience);
}

// The newest run overwrites the first rows of the earlier part; the rows in view and the selection
// do not change.
void tst_LogInWindow::keepsItsPlace()
{
    const QByteArray older = run(400, QTime(17, 0), "older", true);
    const QByteArray newer = run(100, QTime(9, 0), "newer");
    const int half = newer.indexOf("newer 50") + 9;
    const WindowTest test(writtenOver(older, newer.left(half)));
    const auto window = WindowTest::show();
    QTRY_VERIFY_WITH_TIMEOUT(Rows(*window) > 300, Patience);
    LogView* view = View(*window);
    view->verticalScrollBar()->setValue(200);
    QVERIFY(!Panel(*window)->isFollowing());
    QTest::mouseClick(view->viewport(), Qt::LeftButton, Qt::NoModifier,
                      RowCentre(view, view->rowAt(0) + 2));
    const auto texts = [&] {
        return QStringList(
            {view->model()->index(view->rowAt(0), LogModel::MessageColumn).data().toString(),
             view->model()
                 ->index(view->currentIndex().row(), LogModel::MessageColumn)
                 .data()
                 .toString(),
             view->model()
                 ->index(view->selectionModel()->selectedRows().value(0).row(),
                         LogModel::MessageColumn)
                 .data()
                 .toString()});
    };
    const QStringList before = texts();
    QCOMPARE(before[1], before[2]);

    QFile file(test.logFile());
    QVERIFY(file.open(QIODevice::ReadWrite));
    QVERIFY(file.seek(half));
    file.write(newer.mid(half));
    file.close();
    QTRY_COMPARE_WITH_TIMEOUT(
        view->model()->index(Rows(*window) - 1, LogModel::MessageColumn).data().toString(),
        QString("newer 99"), Patience);
    QCOMPARE(texts(), before);
}

void tst_LogInWindow::logSettings()
{
    const WindowTest test(run(1, QTime(9, 0), "x"));
    const auto window = WindowTest::show();
    WindowTest::whenShown<LogSettingsDialog>([&](LogSettingsDialog* dialog) {
        Child<QSpinBox>(dialog, "Older files to keep")->setValue(5);
        const QList<QCheckBox*> boxes = dialog->findChildren<QCheckBox*>();
        for (QCheckBox* box : boxes) {
            if (box->text().contains("time since"))
                ClickBox(box);
        }
        auto* format = Child<QLineEdit>(dialog, "Date format");
        format->selectAll();
        QTest::keyClicks(format, "'at' hh:mm");
        QVERIFY(Child<QLabel>(dialog, "Sample entry")->text().startsWith("at "));
        QVERIFY(Child<QLabel>(dialog, "Sample entry")->text().contains("dT:[250]"));
        QTest::keyClick(format, Qt::Key_Return);
    });
    QTest::keyClick(window.get(), Qt::Key_Comma, Qt::ControlModifier);
    QCOMPARE(TorkLog::logger()->maxLogFiles(), 5U);
    QVERIFY(TorkLog::logger()->logElapsedTime());
    const QByteArray file = TestFiles::read(test.folder() + "data/logs/logsettings.cfg");
    QVERIFY2(file.contains("<dateTimeFormat><![CDATA['at' hh:mm]]></dateTimeFormat>"), file);
    QVERIFY2(file.contains("<maxLogFiles>5</maxLogFiles>"), file);
    QVERIFY2(file.contains("<logElapsedTime>yes</logElapsedTime>"), file);
    QVERIFY2(file.contains("<maxLogFileSize>1000000</maxLogFileSize>"), file);
}

void tst_LogInWindow::logSettingsRefused()
{
    const WindowTest test;
    const QByteArray before = TestFiles::read(test.folder() + "data/logs/logsettings.cfg");
    LogSettingsDialog dialog;
    dialog.show();
    QAbstractButton* ok = dialog.findChild<QDialogButtonBox*>()->button(QDialogButtonBox::Ok);
    QVERIFY(ok->isEnabled());
    for (char const* bad : {"", "a/b", "..", "\xC3\xA4"}) {
        Child<QLineEdit>(&dialog, "Log file name")->setText(QString::fromUtf8(bad));
        QVERIFY2(!ok->isEnabled(), bad);
        dialog.accept();
        QVERIFY(dialog.isVisible());
    }
    QVERIFY(!Child<QLabel>(&dialog, "Settings problem")->text().isEmpty());
    dialog.reject();
    QCOMPARE(TestFiles::read(test.folder() + "data/logs/logsettings.cfg"), before);
}

void tst_LogInWindow::logSwitchedOff()
{
    const WindowTest test;
    TorkLog::logger()->setEnable(false);
    const auto window = WindowTest::show();
    auto const* state = Child<QLabel>(window.get(), "State of the log");
    auto* tabs = window->findChild<FileTabs*>();
    QTRY_COMPARE_WITH_TIMEOUT(state->text(), QString("Logging is off"), Patience);
    QVERIFY(state->isVisible());
    QVERIFY(!tabs->tabIcon(0).isNull());
    QVERIFY(state->mapToGlobal(QPoint()).y() < View(*window)->mapToGlobal(QPoint()).y());
    TorkLog::logger()->setEnable(true);
    QTRY_COMPARE_WITH_TIMEOUT(state->text(), QString(), Patience);
    QVERIFY(!state->isVisible());
    QVERIFY(tabs->tabIcon(0).isNull());
}

// Until it changes; it is in nobody's way in between.
void tst_LogInWindow::stateOfTheLogCanBeDismissed()
{
    const WindowTest test;
    TorkLog::logger()->setEnable(false);
    const auto window = WindowTest::show();
    auto const* state = Child<QLabel>(window.get(), "State of the log");
    QTRY_VERIFY_WITH_TIMEOUT(state->isVisible(), Patience);
    Click(Child<QAbstractButton>(window.get(), "Dismiss state of the log"));
    QVERIFY(!state->isVisible());
    QTest::qWait(2500); // it has been checked again
    QVERIFY(!state->isVisible());
    TorkLog::logger()->setEnable(true);
    QTRY_VERIFY_WITH_TIMEOUT(window->findChild<FileTabs*>()->tabIcon(0).isNull(), Patience);
    TorkLog::logger()->setEnable(false);
    QEvent activation(QEvent::WindowActivate); // the user comes back
    QCoreApplication::sendEvent(window.get(), &activation);
    QTRY_VERIFY_WITH_TIMEOUT(state->isVisible(), Patience);
    TorkLog::logger()->setEnable(true);
}

void tst_LogInWindow::rowsAreAlikeEverywhere()
{
    const WindowTest test(run(5, QTime(9, 0), "x"));
    QVERIFY(TestFiles::write(test.folder() + "some.cfg", Settings));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 5, Patience);
    LogView const* view = View(*window);
    window->OpenFile(test.folder() + "some.cfg");
    auto const* tree = Child<QTreeView>(window.get(), "Settings");
    QCOMPARE(tree->visualRect(tree->model()->index(0, 0)).height(), view->rowHeight(0));
    QVERIFY(tree->alternatingRowColors() && view->alternatingRowColors());
}

void tst_LogInWindow::emptyTableSaysWhatToDo()
{
    const WindowTest test(run(5, QTime(9, 0), "x"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 5, Patience);
    QTest::keyClick(window.get(), Qt::Key_L, Qt::ControlModifier);
    QTest::keyClicks(QApplication::focusWidget(), "nowhere");
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 0, Patience);
    QTRY_COMPARE_WITH_TIMEOUT(View(*window)->accessibleDescription(),
                              QString("No lines match the filter.\nClear it with Ctrl+Shift+F."),
                              Patience);
    QTest::keyClick(QApplication::focusWidget(), Qt::Key_F,
                    Qt::ControlModifier | Qt::ShiftModifier);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 5, Patience);
}

// For all logs, also those opened later; the rows fit, the columns keep their text, and the newest
// line stays in view.
void tst_LogInWindow::compressedFile()
{
    const WindowTest test(run(2, QTime(9, 0), "x"));
    const QString path = test.folder() + "other.log.1.gz";
    QVERIFY(TestFiles::write(path, QByteArray("\x1F\x8B\x08\x00", 4) + "\n\x93\xED\n"));
    const auto window = WindowTest::show({path});
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 2, Patience);
    QTRY_VERIFY_WITH_TIMEOUT(Child<QLabel>(window.get(), "Kind of file"), Patience);
    auto const* notice = Child<QLabel>(window.get(), "Kind of file");
    QVERIFY(notice->isVisible());
    QVERIFY2(notice->text().endsWith("zcat other.log.1.gz | velocor -"),
             qPrintable(notice->text()));
    Click(Child<QPushButton>(window.get(), "Dismiss kind of file"));
    QVERIFY(!notice->isVisible());
}

void tst_LogInWindow::textSize()
{
    const WindowTest test(run(300, QTime(9, 0), "x"));
    const QString other = test.folder() + "other.log";
    QVERIFY(TestFiles::write(other, run(5, QTime(9, 0), "y")));
    qreal size = 0;
    int width = 0;
    {
        const auto window = WindowTest::show();
        QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 300, Patience);
        LogView* view = View(*window);
        const qreal before = view->font().pointSizeF();
        const int widthBefore = view->columnWidth(LogModel::TimeColumn);
        for (int i = 0; i < 5; ++i)
            QTest::keyClick(window.get(), Qt::Key_Plus, Qt::ControlModifier);
        size = view->font().pointSizeF();
        width = view->columnWidth(LogModel::TimeColumn);
        QVERIFY(size > 1.5 * before && width > 1.4 * widthBefore);
        QVERIFY(view->rowHeight(0) >= view->fontMetrics().height());
        QVERIFY(view->viewport()->rect().contains(
            view->visualRect(view->model()->index(299, LogModel::TimeColumn)).center()));
        window->OpenFile(other);
        QCOMPARE(View(*window)->font().pointSizeF(), size);
        window->findChild<FileTabs*>()->setCurrentIndex(0);
        window->close();
    }
    const auto window = WindowTest::show();
    QCOMPARE(View(*window)->font().pointSizeF(), size);
    QCOMPARE(View(*window)->columnWidth(LogModel::TimeColumn), width);
    for (int i = 0; i < 100; ++i)
        QTest::keyClick(window.get(), Qt::Key_Minus, Qt::ControlModifier);
    QVERIFY(View(*window)->font().pointSizeF() > 1);
    QTest::keyClick(window.get(), Qt::Key_0, Qt::ControlModifier);
    QCOMPARE(View(*window)->font().pointSizeF(), QApplication::font().pointSizeF());
}

void tst_LogInWindow::wheelZooms()
{
    const WindowTest test(run(300, QTime(9, 0), "x"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 300, Patience);
    auto* line = Child<QPlainTextEdit>(window.get(), "Full text of the current line");
    LogView* view = View(*window);
    const qreal before = view->font().pointSizeF();
    TurnWheel(view->viewport(), 60, Qt::ControlModifier);
    QCOMPARE(view->font().pointSizeF(), before); // half a step
    TurnWheel(view->viewport(), 60, Qt::ControlModifier);
    const qreal larger = view->font().pointSizeF();
    QVERIFY(larger > before);
    QVERIFY(Panel(*window)->isFollowing());
    QCOMPARE(line->font().pointSizeF(), larger);
    TurnWheel(line->viewport(), -120, Qt::ControlModifier);
    QVERIFY(view->font().pointSizeF() < larger);
    QCOMPARE(line->font().pointSizeF(), view->font().pointSizeF());

    TurnWheel(view->viewport(), 120, Qt::NoModifier);
    QVERIFY(!Panel(*window)->isFollowing()); // has scrolled
}

void tst_LogInWindow::monospacedFont()
{
    const WindowTest test(run(5, QTime(9, 0), "x"));
    {
        const auto window = WindowTest::show();
        QVERIFY(!QFontInfo(View(*window)->font()).fixedPitch());
        QTest::keyClick(window.get(), Qt::Key_M, Qt::ControlModifier | Qt::AltModifier);
        QVERIFY(QFontInfo(View(*window)->font()).fixedPitch());
        window->close();
    }
    const auto window = WindowTest::show();
    QVERIFY(QFontInfo(View(*window)->font()).fixedPitch());
    QVERIFY(Action(*window, "Monospaced Font")->isChecked());
}

QTEST_MAIN(tst_LogInWindow)

#include "tst_LogInWindow.moc"
