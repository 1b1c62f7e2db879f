// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The time between entries and the gaps between them, driven with keys on a real screen.

#include "WindowParts.h"
#include "WindowTestCase.h"

#include <QContextMenuEvent>
#include <QHeaderView>

using namespace Velocor;
using namespace WindowParts;

using DemoLog::entry;

namespace {

QByteArray Log()
{
    return entry("09:00:00.000", "Trace", "a") + entry("09:00:01.500", "Trace", "b") +
           entry("09:03:06.500", "Warning", "c");
}

void ToggleSince(MainWindow& window)
{
    QTest::keyClick(&window, Qt::Key_S, Qt::ControlModifier | Qt::AltModifier);
}

bool ShowsSince(MainWindow& window)
{
    return !View(window)->isColumnHidden(LogModel::SinceColumn);
}

QString Since(MainWindow& window, int row)
{
    return View(window)->model()->index(row, LogModel::SinceColumn).data().toString();
}

// Opens the menu of a row with the menu key and chooses the item with this letter.
void Choose(MainWindow& window, int row, Qt::Key letter)
{
    LogView* view = View(window);
    view->GoToRow(row);
    QContextMenuEvent event(QContextMenuEvent::Keyboard, QPoint(1, 1),
                            view->viewport()->mapToGlobal(QPoint(1, 1)));
    QApplication::sendEvent(view->viewport(), &event);
    QWidget* menu = QApplication::activePopupWidget();
    QVERIFY(menu);
    QTest::keyClick(menu, letter);
}

void ShowGaps(MainWindow& window, char const* least)
{
    Action(window, least)->trigger();
}

QRect MessageCell(LogView* view, int row)
{
    return view->visualRect(view->model()->index(row, LogModel::MessageColumn));
}

// Whether a row begins with a line over the whole width of the table.
bool HasLine(LogView* view, int row)
{
    const QImage image = view->viewport()->grab().toImage();
    const double scale = image.devicePixelRatio();
    const int y = qRound(MessageCell(view, row).top() * scale);
    for (int x = 0; x < image.width(); ++x) {
        if (image.pixelColor(x, y) != image.pixelColor(0, y))
            return false;
    }
    return image.pixelColor(0, y) != image.pixelColor(0, y + qRound(2 * scale));
}

// Whether something is painted at the end of a row, where the short messages are not.
bool HasTextAtTheEnd(LogView* view, int row)
{
    const QRect cell = MessageCell(view, row);
    const QImage image =
        view->viewport()->grab(cell.adjusted(cell.width() / 2, 2, 0, -2)).toImage();
    for (int y = 0; y < image.height(); ++y) {
        for (int x = 0; x < image.width(); ++x) {
            if (image.pixelColor(x, y) != image.pixelColor(0, 0))
                return true;
        }
    }
    return false;
}

} // namespace

class tst_SpansInWindow : public WindowTestCase
{
    Q_OBJECT

private slots:
    void sinceColumn();
    void withoutTimes();
    void measureFromHere();
    void noTimeToMeasureFrom();
    void gaps();
    void wrapped();
    void kept();
    void keptByHand();
};

void tst_SpansInWindow::sinceColumn()
{
    const WindowTest test(Log());
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 3, Patience);
    QVERIFY(!ShowsSince(*window));
    ToggleSince(*window);
    QVERIFY(ShowsSince(*window));
    QVERIFY(View(*window)->columnWidth(LogModel::SinceColumn) > 40);
    QCOMPARE(Since(*window, 1), QString("1.500 s"));
    QCOMPARE(Since(*window, 2), QString("3 min 05 s"));
    // In a log that is opened later, too.
    QVERIFY(TestFiles::write(test.folder() + "other.log", Log()));
    window->OpenFile(test.folder() + "other.log");
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 3, Patience);
    QVERIFY(ShowsSince(*window));
    ToggleSince(*window);
    QVERIFY(!ShowsSince(*window));
}

void tst_SpansInWindow::withoutTimes()
{
    const WindowTest test("one\ntwo\n");
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 2, Patience);
    ToggleSince(*window);
    QVERIFY(!ShowsSince(*window));
}

void tst_SpansInWindow::measureFromHere()
{
    const WindowTest test(Log());
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 3, Patience);
    Choose(*window, 1, Qt::Key_R);
    QVERIFY(ShowsSince(*window));
    QVERIFY(Action(*window, "Time Since")->isChecked());
    QCOMPARE(Since(*window, 0), QString("-1.500 s"));
    QCOMPARE(Since(*window, 2), QString("3 min 05 s"));
    Choose(*window, 2, Qt::Key_A);
    QVERIFY(ShowsSince(*window));
    QCOMPARE(Since(*window, 0), QString());
    QCOMPARE(Since(*window, 1), QString("1.500 s"));
}

void tst_SpansInWindow::noTimeToMeasureFrom()
{
    const WindowTest test("no time\n" + Log());
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 4, Patience);
    Choose(*window, 0, Qt::Key_R);
    QCOMPARE(Status(*window), QString("This line has no time"));
    QVERIFY(!ShowsSince(*window));
}

void tst_SpansInWindow::gaps()
{
    const WindowTest test(Log());
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 3, Patience);
    LogView* view = View(*window);
    QVERIFY(!HasLine(view, 2));
    ShowGaps(*window, "1 Minute");
    QTRY_VERIFY_WITH_TIMEOUT(HasLine(view, 2), Patience);
    QVERIFY(HasTextAtTheEnd(view, 2));
    QVERIFY(!HasLine(view, 1));
    QVERIFY(!HasTextAtTheEnd(view, 1));
    QCOMPARE(MessageCell(view, 2).top(), 2 * view->rowHeight()); // it takes no room of its own
    ShowGaps(*window, "1 Second");
    QTRY_VERIFY_WITH_TIMEOUT(HasLine(view, 1), Patience);
    ShowGaps(*window, "None");
    QTRY_VERIFY_WITH_TIMEOUT(!HasLine(view, 2), Patience);
    QVERIFY(!HasTextAtTheEnd(view, 2));
}

// The words beside a message leave it less width.
void tst_SpansInWindow::wrapped()
{
    QByteArray log;
    for (int i = 0; i < 60; ++i)
        log += entry(QTime(9, 0).addSecs(90 * i).toString("HH:mm:ss.zzz"), "Trace",
                     QString(5 * i, 'x'));
    const WindowTest test(log);
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 60, Patience);
    LogView* view = View(*window);
    QTest::keyClick(window.get(), Qt::Key_W, Qt::ControlModifier | Qt::AltModifier);
    const auto height = [view] {
        int sum = 0;
        for (int row = 0; row < 60; ++row)
            sum += view->rowHeight(row);
        return sum;
    };
    const int without = height();
    ShowGaps(*window, "1 Minute");
    QVERIFY(height() > without);
    ShowGaps(*window, "None");
    QCOMPARE(height(), without);
}

void tst_SpansInWindow::kept()
{
    const WindowTest test(Log());
    {
        const auto window = WindowTest::show();
        QVERIFY(Action(*window, "None")->isChecked());
        ToggleSince(*window);
        ShowGaps(*window, "1 Minute");
        window->close();
    }
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 3, Patience);
    QVERIFY(ShowsSince(*window));
    QVERIFY(Action(*window, "Time Since")->isChecked());
    QVERIFY(Action(*window, "1 Minute")->isChecked());
    QVERIFY(HasLine(View(*window), 2));
}

// A span that the menu does not have is none.
void tst_SpansInWindow::keptByHand()
{
    const WindowTest test(Log());
    QVERIFY(TestFiles::write(test.folder() + "velocor.cfg",
                             "<VelocorSettings><MainWindow><leastGap>7</leastGap></MainWindow>"
                             "</VelocorSettings>"));
    const auto window = WindowTest::show();
    QVERIFY(Action(*window, "None")->isChecked());
}

QTEST_MAIN(tst_SpansInWindow)
#include "tst_SpansInWindow.moc"
