// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Entries that repeat the one above, folded and opened with keys and the mouse on a real screen.

#include "WindowParts.h"
#include "WindowTestCase.h"

#include "app/window/log/GoToDialog.h"
#include "app/window/log/LineNumberMargin.h"
#include "app/window/log/LogDelegate.h"

#include <QClipboard>
#include <QLabel>
#include <QScrollBar>

using namespace Velocor;
using namespace WindowParts;

using DemoLog::entry;

namespace {

constexpr int Retries = 5;
constexpr int Group = 1; // the row of the retries while they are folded

QByteArray Retry(int number)
{
    return entry(QString("09:00:0%1.000").arg(number).toLatin1(), "Warning",
                 QString("retry %1 of \"page %1\"").arg(number));
}

// A row, five that repeat each other, and two more.
QByteArray Log()
{
    QByteArray log = entry("09:00:00.000", "Trace", "start");
    for (int number = 1; number <= Retries; ++number)
        log += Retry(number);
    return log + entry("09:00:08.000", "Error", "gave up") + entry("09:00:09.000", "Trace", "end");
}

constexpr int AllRows = 3 + Retries;
constexpr int FoldedRowCount = 4;

void ToggleRepeats(MainWindow& window)
{
    QTest::keyClick(&window, Qt::Key_R, Qt::ControlModifier | Qt::AltModifier);
}

void Fold(MainWindow& window)
{
    QTRY_COMPARE_WITH_TIMEOUT(Rows(window), AllRows, Patience);
    ToggleRepeats(window);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(window), FoldedRowCount, Patience);
    View(window)->setFocus();
}

QVariant Data(MainWindow& window, int row, int column, int role = Qt::DisplayRole)
{
    return View(window)->model()->index(row, column).data(role);
}

QString Message(MainWindow& window, int row)
{
    return Data(window, row, LogModel::MessageColumn).toString();
}

QString Repeats(MainWindow& window, int row)
{
    return Data(window, row, LogModel::MessageColumn, LogModel::RepeatsRole).toString();
}

QStringList Messages(MainWindow& window)
{
    QStringList messages;
    for (int row = 0; row < Rows(window); ++row)
        messages.append(Message(window, row));
    return messages;
}

QRect MessageCell(LogView* view, int row)
{
    return view->visualRect(view->model()->index(row, LogModel::MessageColumn));
}

void ClickRow(LogView* view, int row, int x)
{
    const QRect cell = MessageCell(view, row);
    QTest::mouseClick(view->viewport(), Qt::LeftButton, Qt::NoModifier,
                      QPoint(cell.left() + x, cell.center().y()));
}

// Read and compared in parts, for a while. Nothing in it is repeated.
QByteArray LargeLog()
{
    QByteArray large;
    for (int i = 0; i < 100000; ++i)
        large += entry("09:00:00.000", "Trace", i % 2 ? "a page" : "a sheet");
    for (int i = 0; i < 3; ++i)
        large += large;
    return large;
}

constexpr int LargeRows = 800000;

bool Append(WindowTest const& test, QByteArray const& lines)
{
    return TestFiles::writeOver(test.logFile(), TestFiles::read(test.logFile()) + lines);
}

int TableRow(MainWindow& window)
{
    return View(window)->currentIndex().row();
}

} // namespace

class tst_RepeatsInWindow : public WindowTestCase
{
    Q_OBJECT

private slots:
    void foldsAndUnfolds();
    void opensWithKeys();
    void closesFromWithin();
    void opensWithTheMouse();
    void twoQuickClicks();
    void opensAtTheEnd();
    void grows();
    void keepsWhatIsOpen();
    void keepsTheCurrentLine();
    void keepsWhatIsInView_data();
    void keepsWhatIsInView();
    void whilePaused();
    void foundAmongHiddenRows();
    void problems();
    void marks();
    void marksBelowAGroup();
    void copiesAllRows();
    void savesAllRows();
    void filters();
    void timesBetweenEntries();
    void lineNumbers();
    void goesToAHiddenLine();
    void inWords();
    void numberIsNotMirrored();
    void ticksBesideTheScrollBar();
    void wrapped();
    void wrappedBesideTheNumber();
    void runsHaveTheirOwn();
    void goesToALineOfTheNewestFile();
    void whatWasOpenInAnotherFile();
    void whileALargeFileIsRead();
    void whileALargeFileGrows();
    void changesOfMind();
    void kept();
};

void tst_RepeatsInWindow::foldsAndUnfolds()
{
    const WindowTest test(Log());
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), AllRows, Patience);
    const QStringList all = Messages(*window);
    Fold(*window);
    QCOMPARE(Messages(*window), QStringList({"start", "retry 1 of \"page 1\"", "gave up", "end"}));
    QCOMPARE(Repeats(*window, Group), QString("\u25b8 5\u00d7"));
    QVERIFY(Repeats(*window, 0).isEmpty());
    QVERIFY(Repeats(*window, 2).isEmpty());
    QCOMPARE(Data(*window, Group, LogModel::TimeColumn).toString(),
             QString("2025-03-03 09:00:01.000"));
    // The lines are all there.
    QVERIFY2(Panel(*window)->summary().startsWith("8 lines"),
             qPrintable(Panel(*window)->summary()));
    ToggleRepeats(*window);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), AllRows, Patience);
    QCOMPARE(Messages(*window), all);
    QVERIFY(Repeats(*window, Group).isEmpty());
}

void tst_RepeatsInWindow::opensWithKeys()
{
    const WindowTest test(Log());
    const auto window = WindowTest::show();
    Fold(*window);
    QTest::keyClick(View(*window), Qt::Key_Home);
    QTest::keyClick(View(*window), Qt::Key_Right); // nothing to open
    QCOMPARE(Rows(*window), FoldedRowCount);
    QTest::keyClick(View(*window), Qt::Key_Down);
    QTest::keyClick(View(*window), Qt::Key_Left); // nothing to close
    QCOMPARE(Rows(*window), FoldedRowCount);
    QTest::keyClick(View(*window), Qt::Key_Right);
    QCOMPARE(Rows(*window), AllRows);
    QCOMPARE(TableRow(*window), Group);
    QCOMPARE(Repeats(*window, Group), QString("\u25be 5\u00d7"));
    QCOMPARE(Message(*window, Group + 1), QString("retry 2 of \"page 2\""));
    QTest::keyClick(View(*window), Qt::Key_Right);
    QCOMPARE(Rows(*window), AllRows);
    QTest::keyClick(View(*window), Qt::Key_Left);
    QCOMPARE(Rows(*window), FoldedRowCount);
    QCOMPARE(TableRow(*window), Group);
}

void tst_RepeatsInWindow::closesFromWithin()
{
    const WindowTest test(Log());
    const auto window = WindowTest::show();
    Fold(*window);
    View(*window)->GoToRow(Group);
    QTest::keyClick(View(*window), Qt::Key_Right);
    QTest::keyClick(View(*window), Qt::Key_Down);
    QTest::keyClick(View(*window), Qt::Key_Down);
    QCOMPARE(TableRow(*window), Group + 2);
    QTest::keyClick(View(*window), Qt::Key_Left);
    QCOMPARE(Rows(*window), FoldedRowCount);
    QCOMPARE(TableRow(*window), Group);
    QCOMPARE(View(*window)->selectionModel()->selectedRows().size(), 1);
    // From another row below, nothing is closed.
    QTest::keyClick(View(*window), Qt::Key_Right);
    QTest::keyClick(View(*window), Qt::Key_End);
    QTest::keyClick(View(*window), Qt::Key_Left);
    QCOMPARE(Rows(*window), AllRows);
}

void tst_RepeatsInWindow::opensWithTheMouse()
{
    const WindowTest test(Log());
    const auto window = WindowTest::show();
    Fold(*window);
    LogView* view = View(*window);
    const int width =
        LogDelegate::RepeatsArea(Repeats(*window, Group), view->font(), MessageCell(view, Group))
            .width();
    QVERIFY(width > 20);
    ClickRow(view, Group, width + 10); // on the message
    QCOMPARE(Rows(*window), FoldedRowCount);
    QCOMPARE(TableRow(*window), Group);
    ClickRow(view, Group + 1, 10); // where nothing is repeated
    QCOMPARE(Rows(*window), FoldedRowCount);
    ClickRow(view, Group, width / 2);
    QCOMPARE(Rows(*window), AllRows);
    QCOMPARE(TableRow(*window), Group);
    ClickRow(view, Group, width / 2);
    QCOMPARE(Rows(*window), FoldedRowCount);
}

// The second one opens and closes, too.
void tst_RepeatsInWindow::twoQuickClicks()
{
    const WindowTest test(Log());
    const auto window = WindowTest::show();
    Fold(*window);
    LogView* view = View(*window);
    constexpr int InNumber = 10;
    ClickRow(view, Group, InNumber);
    QCOMPARE(Rows(*window), AllRows);
    const QRect cell = MessageCell(view, Group);
    const QPoint place(cell.left() + InNumber, cell.center().y());
    const auto clickAgain = [&] {
        QMouseEvent second(QEvent::MouseButtonDblClick, place, view->viewport()->mapToGlobal(place),
                           Qt::LeftButton, Qt::LeftButton, Qt::NoModifier);
        QApplication::sendEvent(view->viewport(), &second);
        QTest::mouseRelease(view->viewport(), Qt::LeftButton, Qt::NoModifier, place);
    };
    clickAgain();
    QCOMPARE(Rows(*window), FoldedRowCount);
    clickAgain();
    QCOMPARE(Rows(*window), AllRows);
    QCOMPARE(TableRow(*window), Group);
}

// What was opened stays in view, although the view followed the newest entry.
void tst_RepeatsInWindow::opensAtTheEnd()
{
    QByteArray log = entry("09:00:00.000", "Trace", "start");
    for (int number = 0; number < 500; ++number)
        log += Retry(number % 10);
    const WindowTest test(log);
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 501, Patience);
    ToggleRepeats(*window);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 2, Patience);
    LogView* view = View(*window);
    view->setFocus();
    QTest::keyClick(view, Qt::Key_End);
    QTest::keyClick(view, Qt::Key_Right);
    QCOMPARE(Rows(*window), 501);
    QCOMPARE(view->rowAt(0), 0);
    QVERIFY(!view->isFollowing());
}

void tst_RepeatsInWindow::grows()
{
    const WindowTest test(entry("09:00:00.000", "Trace", "start") + Retry(1));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 2, Patience);
    ToggleRepeats(*window);
    QTest::qWait(50);
    QVERIFY(Repeats(*window, Group).isEmpty());
    QVERIFY(Append(test, Retry(2)));
    QTRY_COMPARE_WITH_TIMEOUT(Repeats(*window, Group), QString("\u25b8 2\u00d7"), Patience);
    QCOMPARE(Rows(*window), 2);
    QVERIFY(Append(test, Retry(3) + Retry(4)));
    QTRY_COMPARE_WITH_TIMEOUT(Repeats(*window, Group), QString("\u25b8 4\u00d7"), Patience);
    QCOMPARE(Rows(*window), 2);
    QVERIFY(Append(test, entry("09:00:08.000", "Error", "gave up") + Retry(9) + Retry(9)));
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 4, Patience);
    QCOMPARE(Repeats(*window, 3), QString("\u25b8 2\u00d7"));
    QCOMPARE(Message(*window, 2), QString("gave up"));
}

void tst_RepeatsInWindow::keepsWhatIsOpen()
{
    const WindowTest test(Log() + Retry(6) + Retry(7));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), AllRows + 2, Patience);
    ToggleRepeats(*window);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), FoldedRowCount + 1, Patience);
    View(*window)->setFocus();
    View(*window)->GoToRow(Group);
    QTest::keyClick(View(*window), Qt::Key_Right);
    QCOMPARE(Rows(*window), AllRows + 1);
    QVERIFY(Append(test, Retry(8)));
    QTRY_COMPARE_WITH_TIMEOUT(Repeats(*window, AllRows), QString("\u25b8 3\u00d7"), Patience);
    QCOMPARE(Rows(*window), AllRows + 1);
    QTest::keyClick(window.get(), Qt::Key_F5);
    QTest::qWait(50);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), AllRows + 1, Patience);
    QCOMPARE(TableRow(*window), Group);
}

// The row of its group stands for the line that was current; unfolded, it is current again.
void tst_RepeatsInWindow::keepsTheCurrentLine()
{
    const WindowTest test(Log());
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), AllRows, Patience);
    View(*window)->GoToRow(AllRows - 1);
    ToggleRepeats(*window);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), FoldedRowCount, Patience);
    QCOMPARE(TableRow(*window), FoldedRowCount - 1);
    ToggleRepeats(*window);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), AllRows, Patience);
    QCOMPARE(TableRow(*window), AllRows - 1);
    View(*window)->GoToRow(3);
    ToggleRepeats(*window);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), FoldedRowCount, Patience);
    QCOMPARE(TableRow(*window), Group);
}

void tst_RepeatsInWindow::keepsWhatIsInView_data()
{
    QTest::addColumn<bool>("hasCurrent");
    QTest::newRow("no line is current") << false;
    QTest::newRow("the current line is not in view") << true;
}

void tst_RepeatsInWindow::keepsWhatIsInView()
{
    QFETCH(const bool, hasCurrent);
    constexpr int Groups = 40;
    constexpr int Top = 25;
    QByteArray log;
    for (int i = 0; i < Groups; ++i)
        log += Log();
    const WindowTest test(log);
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), Groups * AllRows, Patience);
    LogView* view = View(*window);
    if (hasCurrent)
        view->GoToRow(0);
    view->verticalScrollBar()->setValue(Top * AllRows);
    QCOMPARE(view->rowAt(0), Top * AllRows);
    ToggleRepeats(*window);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), Groups * FoldedRowCount, Patience);
    QCOMPARE(view->rowAt(0), Top * FoldedRowCount);
    ToggleRepeats(*window);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), Groups * AllRows, Patience);
    QCOMPARE(view->rowAt(0), Top * AllRows);
    QCOMPARE(TableRow(*window), hasCurrent ? 0 : -1);
}

void tst_RepeatsInWindow::whilePaused()
{
    const WindowTest test(Log());
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), AllRows, Patience);
    QTest::keyClick(window.get(), Qt::Key_P, Qt::ControlModifier | Qt::ShiftModifier);
    QVERIFY(Panel(*window)->isPaused());
    Fold(*window);
    QVERIFY(Append(test, Retry(9)));
    ToggleRepeats(*window);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), AllRows, Patience);
}

void tst_RepeatsInWindow::foundAmongHiddenRows()
{
    const WindowTest test(Log());
    const auto window = WindowTest::show();
    Fold(*window);
    QTest::keyClick(View(*window), Qt::Key_Home);
    QTest::keyClick(window.get(), Qt::Key_F, Qt::ControlModifier);
    QTest::keyClicks(QApplication::focusWidget(), "page 3");
    QTest::keyClick(QApplication::focusWidget(), Qt::Key_Return);
    QTRY_COMPARE_WITH_TIMEOUT(TableRow(*window), 3, Patience);
    QCOMPARE(Rows(*window), AllRows);
    QCOMPARE(Message(*window, 3), QString("retry 3 of \"page 3\""));
    QCOMPARE(Child<QLabel>(window.get(), "Lines found")->text(), QString("1 of 1"));
}

// Of those that repeat each other, the first one is enough.
void tst_RepeatsInWindow::problems()
{
    const WindowTest test(Log());
    const auto window = WindowTest::show();
    Fold(*window);
    QTest::keyClick(View(*window), Qt::Key_Home);
    QTest::keyClick(window.get(), Qt::Key_F8);
    QCOMPARE(TableRow(*window), Group);
    QTest::keyClick(window.get(), Qt::Key_F8);
    QCOMPARE(Message(*window, TableRow(*window)), QString("gave up"));
    QTest::keyClick(window.get(), Qt::Key_F8, Qt::ShiftModifier);
    QCOMPARE(TableRow(*window), Group);
    QTest::keyClick(window.get(), Qt::Key_F8, Qt::ShiftModifier);
    QCOMPARE(Message(*window, TableRow(*window)), QString("gave up"));
    QCOMPARE(Rows(*window), FoldedRowCount);
    QVERIFY(Panel(*window)->summary().contains("6 problems"));
}

void tst_RepeatsInWindow::marks()
{
    const WindowTest test(Log());
    const auto window = WindowTest::show();
    Fold(*window);
    View(*window)->GoToRow(3); // opens the group
    QCOMPARE(Rows(*window), AllRows);
    QTest::keyClick(window.get(), Qt::Key_M, Qt::ControlModifier);
    QVERIFY(!Data(*window, Group, LogModel::TimeColumn, LogModel::MarkedRole).toBool());
    QVERIFY(Data(*window, 3, LogModel::TimeColumn, LogModel::MarkedRole).toBool());
    QTest::keyClick(View(*window), Qt::Key_Left);
    QCOMPARE(Rows(*window), FoldedRowCount);
    QVERIFY(Data(*window, Group, LogModel::TimeColumn, LogModel::MarkedRole).toBool());
    QVERIFY(!Data(*window, Group + 1, LogModel::TimeColumn, LogModel::MarkedRole).toBool());
    QTest::keyClick(View(*window), Qt::Key_End);
    QTest::keyClick(window.get(), Qt::Key_F2, Qt::ShiftModifier);
    QCOMPARE(Rows(*window), AllRows);
    QCOMPARE(TableRow(*window), 3);
}

// There are fewer rows in the table than the number of this one in the log.
void tst_RepeatsInWindow::marksBelowAGroup()
{
    const WindowTest test(Log());
    const auto window = WindowTest::show();
    Fold(*window);
    const int last = FoldedRowCount - 1;
    QTest::keyClick(View(*window), Qt::Key_End);
    QCOMPARE(TableRow(*window), last);
    QTest::keyClick(window.get(), Qt::Key_M, Qt::ControlModifier);
    QVERIFY(Data(*window, last, LogModel::TimeColumn, LogModel::MarkedRole).toBool());
    QTest::keyClick(window.get(), Qt::Key_M, Qt::ControlModifier);
    QVERIFY(!Data(*window, last, LogModel::TimeColumn, LogModel::MarkedRole).toBool());
}

void tst_RepeatsInWindow::copiesAllRows()
{
    const WindowTest test(Log());
    const auto window = WindowTest::show();
    Fold(*window);
    View(*window)->GoToRow(Group);
    QTest::keyClick(View(*window), Qt::Key_Down, Qt::ShiftModifier);
    QTest::keyClick(window.get(), Qt::Key_C, Qt::ControlModifier);
    const QList<QByteArray> lines = Log().split('\n');
    QByteArray expected;
    for (int line = 1; line <= Retries + 1; ++line)
        expected += lines[line] + '\n';
    QCOMPARE(QGuiApplication::clipboard()->text().toLatin1(), expected);
    QTest::keyClick(View(*window), Qt::Key_Home);
    QTest::keyClick(View(*window), Qt::Key_Down);
    QTest::keyClick(window.get(), Qt::Key_V, Qt::ControlModifier | Qt::AltModifier);
    QCOMPARE(QGuiApplication::clipboard()->text().count("retry"), Retries);
}

void tst_RepeatsInWindow::savesAllRows()
{
    const WindowTest test(Log());
    const auto window = WindowTest::show();
    Fold(*window);
    QCOMPARE(Panel(*window)->LineStarts().size(), AllRows);
}

// What the filter leaves is folded by itself.
void tst_RepeatsInWindow::filters()
{
    const WindowTest test(Log());
    const auto window = WindowTest::show();
    Fold(*window);
    QTest::keyClick(window.get(), Qt::Key_K, Qt::ControlModifier | Qt::ShiftModifier);
    QTest::keyClicks(QApplication::focusWidget(), "gave");
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 3, Patience);
    QTest::keyClick(window.get(), Qt::Key_F, Qt::ControlModifier | Qt::ShiftModifier);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), FoldedRowCount, Patience);
    QTest::keyClick(window.get(), Qt::Key_L, Qt::ControlModifier);
    QTest::keyClicks(QApplication::focusWidget(), "page");
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 1, Patience);
    QCOMPARE(Repeats(*window, 0), QString("\u25b8 5\u00d7"));
}

// Below a folded group, the time since its last entry counts.
void tst_RepeatsInWindow::timesBetweenEntries()
{
    const WindowTest test(Log());
    const auto window = WindowTest::show();
    Fold(*window);
    QTest::keyClick(window.get(), Qt::Key_S, Qt::ControlModifier | Qt::AltModifier);
    QCOMPARE(Data(*window, Group, LogModel::SinceColumn).toString(), QString("1 s"));
    QCOMPARE(Data(*window, Group + 1, LogModel::SinceColumn).toString(), QString("3 s"));
}

void tst_RepeatsInWindow::lineNumbers()
{
    const WindowTest test(Log());
    const auto window = WindowTest::show();
    Fold(*window);
    QTest::keyClick(window.get(), Qt::Key_N, Qt::ControlModifier | Qt::AltModifier);
    auto* margin = window->findChild<LineNumberMargin*>();
    QCOMPARE(margin->TextOf(Group), QString("2"));
    QCOMPARE(margin->TextOf(Group + 1), QString("7"));
    QTest::keyClick(View(*window), Qt::Key_End);
    QVERIFY2(Panel(*window)->summary().startsWith("Line 8 of 8"),
             qPrintable(Panel(*window)->summary()));
}

void tst_RepeatsInWindow::goesToAHiddenLine()
{
    const WindowTest test(Log());
    const auto window = WindowTest::show();
    Fold(*window);
    WindowTest::whenShown<GoToDialog>([](GoToDialog* dialog) {
        auto* field = Child<QLineEdit>(dialog, "Line or time");
        QTest::keyClicks(field, "5");
        QTest::keyClick(field, Qt::Key_Return);
    });
    QTest::keyClick(window.get(), Qt::Key_G, Qt::ControlModifier);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), AllRows, Patience);
    QTRY_COMPARE_WITH_TIMEOUT(Message(*window, TableRow(*window)), QString("retry 4 of \"page 4\""),
                              Patience);
}

void tst_RepeatsInWindow::inWords()
{
    const WindowTest test(Log());
    const auto window = WindowTest::show();
    Fold(*window);
    const auto description = [&](int row) {
        return Data(*window, row, LogModel::TimeColumn, Qt::AccessibleDescriptionRole).toString();
    };
    QCOMPARE(description(Group),
             QString("5 times, 2025-03-03 09:00:01.000 to 09:00:05.000, folded"));
    QCOMPARE(description(Group + 1), QString());
    QVERIFY(Data(*window, Group, LogModel::MessageColumn, Qt::ToolTipRole)
                .toString()
                .contains("5 times, 2025-03-03 09:00:01.000 to 09:00:05.000"));
    View(*window)->GoToRow(Group);
    QTest::keyClick(View(*window), Qt::Key_Right);
    QCOMPARE(description(Group), QString("5 times, 2025-03-03 09:00:01.000 to 09:00:05.000"));
    QCOMPARE(description(Group + 1), QString());
}

// A tick is where its row is among those that are shown.
// Nor is the rest of the table: lines of a log are in English.
void tst_RepeatsInWindow::numberIsNotMirrored()
{
    const WindowTest test(Log());
    const auto window = WindowTest::show();
    Fold(*window);
    LogView* view = View(*window);
    const auto number = [&] {
        const QRect cell = MessageCell(view, Group);
        return view->viewport()
            ->grab(LogDelegate::RepeatsArea(Repeats(*window, Group), view->font(), cell))
            .toImage();
    };
    const QImage usual = number();
    QApplication::setLayoutDirection(Qt::RightToLeft);
    const QImage mirrored = number();
    QApplication::setLayoutDirection(Qt::LeftToRight);
    QCOMPARE(mirrored, usual);
}

void tst_RepeatsInWindow::ticksBesideTheScrollBar()
{
    QByteArray log;
    for (int number = 0; number < 300; ++number)
        log += Retry(number % 10).replace("Warning", "Trace");
    log += entry("09:00:08.000", "Error", "gave up");
    for (int number = 0; number < 300; ++number)
        log += entry("09:00:09.000", "Trace", QString(1 + number % 50, 'e'));
    const WindowTest test(log);
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 601, Patience);
    auto* overview = Child<QWidget>(window.get(), "Overview");
    const auto topTick = [overview] {
        const QImage image = overview->grab().toImage();
        for (int y = 0; y < image.height(); ++y) {
            const QColor color = image.pixelColor(image.width() / 5, y);
            if (color.red() > color.green() + 60)
                return qRound(y / image.devicePixelRatio());
        }
        return -1;
    };
    QTRY_VERIFY_WITH_TIMEOUT(topTick() > overview->height() / 3, Patience);
    ToggleRepeats(*window);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 302, Patience);
    QTRY_VERIFY_WITH_TIMEOUT(topTick() >= 0 && topTick() < overview->height() / 6, Patience);
    QTest::mouseClick(overview, Qt::LeftButton, Qt::NoModifier, QPoint(3, topTick()));
    QCOMPARE(Message(*window, TableRow(*window)), QString("gave up"));
    View(*window)->GoToRow(0);
    QTest::keyClick(View(*window), Qt::Key_Right);
    QCOMPARE(Rows(*window), 601);
    QTRY_VERIFY_WITH_TIMEOUT(topTick() > overview->height() / 3, Patience);
}

void tst_RepeatsInWindow::wrapped()
{
    const QString words = QString(" word").repeated(120);
    QByteArray log;
    for (int number = 1; number <= 3; ++number)
        log += entry("09:00:00.000", "Trace", QString::number(number) + words);
    const WindowTest test(log + entry("09:00:08.000", "Error", "gave up"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 4, Patience);
    QTest::keyClick(window.get(), Qt::Key_W, Qt::ControlModifier | Qt::AltModifier);
    LogView* view = View(*window);
    const int high = MessageCell(view, 0).height();
    const int low = MessageCell(view, 3).height();
    QVERIFY(high > low);
    ToggleRepeats(*window);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 2, Patience);
    QVERIFY(MessageCell(view, 0).height() >= high);
    QCOMPARE(MessageCell(view, 1).height(), low);
    view->setFocus();
    view->GoToRow(0);
    QTest::keyClick(view, Qt::Key_Right);
    QCOMPARE(MessageCell(view, 1).height(), high);
    QCOMPARE(MessageCell(view, 3).height(), low);
}

// A heading is between those of one run and those of the next.
void tst_RepeatsInWindow::runsHaveTheirOwn()
{
    const WindowTest test(Retry(1) + Retry(2));
    QVERIFY(TestFiles::write(test.logFile() + ".1", Retry(3) + Retry(4) + Retry(5)));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 2, Patience);
    ToggleRepeats(*window);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 1, Patience);
    QTest::keyClick(window.get(), Qt::Key_A, Qt::ControlModifier | Qt::ShiftModifier);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 4, Patience);
    QCOMPARE(Repeats(*window, 1), QString("\u25b8 3\u00d7"));
    QCOMPARE(Repeats(*window, 3), QString("\u25b8 2\u00d7"));
    View(*window)->setFocus();
    QTest::keyClick(View(*window), Qt::Key_Home);
    View(*window)->GoToRow(1);
    QTest::keyClick(View(*window), Qt::Key_Right);
    QCOMPARE(Rows(*window), 6);
    // The heading of the first run hides them all.
    QTest::keyClick(View(*window), Qt::Key_Up);
    QTest::keyClick(View(*window), Qt::Key_Left);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 3, Patience);
    QTest::keyClick(View(*window), Qt::Key_Right);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 6, Patience);
}

// Without a current line, a number is that of a line of the newest file.
void tst_RepeatsInWindow::goesToALineOfTheNewestFile()
{
    const WindowTest test(Log());
    QVERIFY(TestFiles::write(test.logFile() + ".1", Log() + Log()));
    const auto window = WindowTest::show();
    Fold(*window);
    QTest::keyClick(window.get(), Qt::Key_A, Qt::ControlModifier | Qt::ShiftModifier);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 2 + 3 * FoldedRowCount, Patience);
    View(*window)->setCurrentIndex(QModelIndex());
    WindowTest::whenShown<GoToDialog>([](GoToDialog* dialog) {
        auto* field = Child<QLineEdit>(dialog, "Line or time");
        QTest::keyClicks(field, "7");
        QTest::keyClick(field, Qt::Key_Return);
    });
    QTest::keyClick(window.get(), Qt::Key_G, Qt::ControlModifier);
    QTRY_COMPARE_WITH_TIMEOUT(TableRow(*window), Rows(*window) - 2, Patience);
    QCOMPARE(Message(*window, TableRow(*window)), QString("gave up"));
}

void tst_RepeatsInWindow::whatWasOpenInAnotherFile()
{
    const WindowTest test(Log());
    const auto window = WindowTest::show();
    Fold(*window);
    View(*window)->GoToRow(Group);
    QTest::keyClick(View(*window), Qt::Key_Right);
    QCOMPARE(Rows(*window), AllRows);
    QTest::keyClick(window.get(), Qt::Key_A, Qt::ControlModifier | Qt::ShiftModifier);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 1 + FoldedRowCount, Patience);
}

// Its first rows are shown before all have been compared.
void tst_RepeatsInWindow::whileALargeFileIsRead()
{
    const WindowTest test(Log());
    const QByteArray large = LargeLog();
    QVERIFY(TestFiles::write(test.folder() + "large.log", Log() + large + Log()));
    const auto window = WindowTest::show();
    Fold(*window);
    bool wasPartial = false;
    bool wasUnfolded = false;
    window->OpenFile(test.folder() + "large.log");
    connect(Panel(*window)->model(), &LogModel::refreshed, this, [&] {
        wasUnfolded = wasUnfolded || Rows(*window) == LargeRows + 2 * AllRows;
        if (!wasPartial && Panel(*window)->model()->state().isPartial)
            View(*window)->GoToRow(AllRows - 1);
        wasPartial = wasPartial || Panel(*window)->model()->state().isPartial;
    });
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), LargeRows + 2 * FoldedRowCount, Patience);
    QVERIFY(wasPartial);
    QVERIFY(wasUnfolded); // all rows, before they have been compared
    QCOMPARE(Message(*window, TableRow(*window)), QString("end"));
    QCOMPARE(TableRow(*window), FoldedRowCount - 1);
    QCOMPARE(Repeats(*window, Group), QString("\u25b8 5\u00d7"));
    QCOMPARE(Message(*window, Rows(*window) - 1), QString("end"));
}

// What is folded stays so, even if what was added is read in parts.
void tst_RepeatsInWindow::whileALargeFileGrows()
{
    const WindowTest test(Log());
    const auto window = WindowTest::show();
    Fold(*window);
    bool wasPartial = false;
    bool wasUnfolded = false;
    LogModel* model = Panel(*window)->model();
    connect(model, &LogModel::refreshed, this, [&] {
        wasPartial = wasPartial || model->state().isPartial;
        wasUnfolded = wasUnfolded || !model->state().repeats;
    });
    QFile log(test.logFile());
    QVERIFY(log.open(QIODevice::Append));
    log.write(LargeLog() + Log());
    log.close();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), LargeRows + 2 * FoldedRowCount, Patience);
    QVERIFY(wasPartial);
    QVERIFY(!wasUnfolded);
}

// Switching it off stops the comparison, so that many changes do not take their number of times.
void tst_RepeatsInWindow::changesOfMind()
{
    const WindowTest test(Log() + LargeLog());
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), LargeRows + AllRows, Patience);
    constexpr int Changes = 21;
    int compared = 0;
    LogModel* model = Panel(*window)->model();
    connect(model, &LogModel::refreshed, this, [&] { compared += bool(model->state().repeats); });
    for (int i = 0; i < Changes; ++i)
        ToggleRepeats(*window);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), LargeRows + FoldedRowCount, Patience);
    ToggleRepeats(*window);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), LargeRows + AllRows, Patience);
    QVERIFY(compared < Changes / 2);
}

// The number takes some of the width of a message.
void tst_RepeatsInWindow::wrappedBesideTheNumber()
{
    QByteArray log;
    for (int length = 100; length < 160; ++length) {
        for (int i = 0; i < 2; ++i)
            log += entry("09:00:00.000", "Trace",
                         QString("words ").repeated(length / 6) + QString(length % 6, 'x'));
    }
    const WindowTest test(log);
    const auto window = WindowTest::show();
    window->resize(700, 700);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 120, Patience);
    LogView* view = View(*window);
    QTest::keyClick(window.get(), Qt::Key_W, Qt::ControlModifier | Qt::AltModifier);
    ToggleRepeats(*window);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 60, Patience);
    int higher = 0;
    for (int row = 0; row < Rows(*window); row += 2) {
        view->GoToRow(row + 1); // opens the group
        const int withNumber = MessageCell(view, row).height();
        const int without = MessageCell(view, row + 1).height();
        QVERIFY(withNumber >= without);
        higher += withNumber > without;
    }
    QVERIFY(higher > 0);
}

void tst_RepeatsInWindow::kept()
{
    const WindowTest test(Log());
    {
        const auto window = WindowTest::show();
        QVERIFY(!Action(*window, "Fold Repeats")->isChecked());
        Fold(*window);
        window->close();
    }
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), FoldedRowCount, Patience);
    QVERIFY(Action(*window, "Fold Repeats")->isChecked());
    // In a log that is opened later, too.
    QVERIFY(TestFiles::write(test.folder() + "other.log", Log()));
    window->OpenFile(test.folder() + "other.log");
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), FoldedRowCount, Patience);
}

QTEST_MAIN(tst_RepeatsInWindow)
#include "tst_RepeatsInWindow.moc"
