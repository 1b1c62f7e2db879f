// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Long messages in several lines, driven with keys on a real screen.

#include "WindowParts.h"

#include "app/window/log/WrappingTable.h"
#include "app/window/widgets/RowHeight.h"

#include <QLoggingCategory>
#include <QScrollBar>

using namespace Velocor;
using namespace WindowParts;

using DemoLog::entry;

namespace {

// Messages of very different lengths, up to some ten lines.
QByteArray Uneven(int count)
{
    QByteArray log;
    for (int i = 0; i < count; ++i) {
        const QByteArray text = QByteArray("word ").repeated(1 + i * 37 % 90 * (i % 3));
        const QTime time = QTime(9, 0).addSecs(i);
        log += entry(time.toString("HH:mm:ss.zzz").toLatin1().constData(), "Trace",
                     QByteArray::number(i) + ' ' + text);
    }
    return log;
}

void ToggleWrap(MainWindow& window)
{
    QTest::keyClick(&window, Qt::Key_W, Qt::ControlModifier | Qt::AltModifier);
}

int UsualHeight(LogView* view)
{
    return RowHeight(view->fontMetrics());
}

int TopOf(LogView* view, int row)
{
    return view->visualRect(view->model()->index(row, LogModel::MessageColumn)).top();
}

// Whether all of a row is in view.
bool IsInView(LogView* view, int row)
{
    const QRect rect = view->visualRect(view->model()->index(row, LogModel::MessageColumn));
    return rect.height() > 0 && rect.top() >= 0 && rect.bottom() < view->viewport()->height();
}

int YellowPixels(LogView* view, int row)
{
    const QRect cell = view->visualRect(view->model()->index(row, LogModel::MessageColumn));
    const QImage image = view->viewport()->grab(cell).toImage();
    int count = 0;
    for (int y = 0; y < image.height(); ++y) {
        for (int x = 0; x < image.width(); ++x)
            count += image.pixelColor(x, y) == QColor(0xff, 0xe0, 0x66) ? 1 : 0;
    }
    return count;
}

} // namespace

class tst_WrapInWindow : public QObject
{
    Q_OBJECT

private slots:
    void initTestCase();
    void cleanup();

    void longMessagesAreHigh();
    void endOfAMessageIsShown();
    void heightIsBounded();
    void narrowerIsHigher();
    void largerTextIsHigher();
    void goesToRows();
    void everyRowByKeys();
    void pagesSkipNothing();
    void following();
    void keepsThePlace();
    void keepsThePlaceWhileGrowing();
    void currentLineStaysWithAFilter();
    void headingsStay();
    void onlyRowsNearTheView();
    void kept();
};

void tst_WrapInWindow::initTestCase()
{
    // The X11 plug-in warns when a window disappears while it is being queried, which would end up
    // in a test's log. The environment would be too late: it was read with the application object.
    QLoggingCategory::setFilterRules("qt.qpa.*=false");
}

void tst_WrapInWindow::cleanup()
{
    const QWidgetList windows = QApplication::topLevelWidgets();
    for (QWidget* window : windows)
        window->hide();
}

void tst_WrapInWindow::longMessagesAreHigh()
{
    const WindowTest test(entry("09:00:00.000", "Trace", "short") +
                          entry("09:00:01.000", "Error", QByteArray("word ").repeated(100)) +
                          entry("09:00:02.000", "Trace", QByteArray(500, 'x')));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 3, Patience);
    LogView* view = View(*window);
    const int usual = UsualHeight(view);
    for (int row = 0; row < 3; ++row)
        QCOMPARE(view->rowHeight(row), usual);
    ToggleWrap(*window);
    QCOMPARE(view->rowHeight(0), usual);
    QVERIFY(view->rowHeight(1) > 2 * usual);
    QVERIFY(view->rowHeight(2) > 2 * usual); // without a blank to break at
    ToggleWrap(*window);
    for (int row = 0; row < 3; ++row)
        QCOMPARE(view->rowHeight(row), usual);
}

void tst_WrapInWindow::endOfAMessageIsShown()
{
    const WindowTest test(
        entry("09:00:00.000", "Trace", QByteArray("word ").repeated(120) + "finish"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 1, Patience);
    QTest::keyClick(window.get(), Qt::Key_L, Qt::ControlModifier);
    QTest::keyClicks(QApplication::focusWidget(), "finish");
    QTest::keyClick(QApplication::focusWidget(), Qt::Key_Enter);
    QTest::qWait(50);
    QCOMPARE(YellowPixels(View(*window), 0), 0);
    ToggleWrap(*window);
    QTRY_VERIFY(YellowPixels(View(*window), 0) > 50);
}

// The start of a very long line, with the end elided, and never more than fits.
void tst_WrapInWindow::heightIsBounded()
{
    const WindowTest test(entry("09:00:00.000", "Trace", QByteArray("word ").repeated(100000)) +
                          entry("09:00:01.000", "Trace", "finish"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 2, Patience);
    LogView* view = View(*window);
    ToggleWrap(*window);
    QVERIFY(view->rowHeight(0) > 3 * UsualHeight(view));
    QVERIFY(view->rowHeight(0) <=
            WrappingTable::MaximumLines * view->fontMetrics().height() + UsualHeight(view));
    window->resize(window->width(), window->minimumSizeHint().height());
    QTRY_VERIFY(view->rowHeight(0) <= std::max(UsualHeight(view), view->viewport()->height()));
}

void tst_WrapInWindow::narrowerIsHigher()
{
    const WindowTest test(entry("09:00:00.000", "Trace", QByteArray("word ").repeated(60)));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 1, Patience);
    LogView* view = View(*window);
    const int time = view->columnWidth(LogModel::TimeColumn);
    const int message = view->columnWidth(LogModel::MessageColumn);
    ToggleWrap(*window);
    const int before = view->rowHeight(0);
    view->setColumnWidth(LogModel::TimeColumn, time + message / 3);
    QTRY_VERIFY(view->rowHeight(0) > before);
    view->setColumnWidth(LogModel::TimeColumn, time);
    QTRY_COMPARE(view->rowHeight(0), before);
    window->resize(window->width() + message, window->height());
    QTRY_VERIFY(view->rowHeight(0) < before);
}

void tst_WrapInWindow::largerTextIsHigher()
{
    const WindowTest test(entry("09:00:00.000", "Trace", QByteArray("word ").repeated(60)));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 1, Patience);
    LogView* view = View(*window);
    ToggleWrap(*window);
    const int before = view->rowHeight(0);
    for (int i = 0; i < 3; ++i)
        QTest::keyClick(window.get(), Qt::Key_Plus, Qt::ControlModifier);
    QVERIFY(view->rowHeight(0) > before);
    ToggleWrap(*window);
    QCOMPARE(view->rowHeight(0), UsualHeight(view));
}

void tst_WrapInWindow::goesToRows()
{
    const WindowTest test(Uneven(600));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 600, Patience);
    LogView* view = View(*window);
    ToggleWrap(*window);
    for (int row : {300, 599, 0, 598, 77, 1, 450, 580, 590, 599, 299}) {
        view->GoToRow(row);
        QVERIFY2(IsInView(view, row), qPrintable(QString::number(row)));
    }
    view->GoToRow(300);
    // As near to the center as whole rows allow.
    const int center =
        view->visualRect(view->model()->index(300, LogModel::MessageColumn)).center().y();
    const int middle = view->viewport()->height() / 2;
    QVERIFY(center <= middle + 1);
    QVERIFY(center + view->rowHeight(view->rowAt(0) - 1) >= middle - 1);
}

void tst_WrapInWindow::everyRowByKeys()
{
    const WindowTest test(Uneven(150));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 150, Patience);
    LogView* view = View(*window);
    ToggleWrap(*window);
    view->GoToRow(0);
    for (int row = 1; row < 150; ++row) {
        QTest::keyClick(view, Qt::Key_Down);
        QCOMPARE(view->currentIndex().row(), row);
        QVERIFY2(IsInView(view, row), qPrintable(QString::number(row)));
    }
    for (int row = 148; row >= 0; --row) {
        QTest::keyClick(view, Qt::Key_Up);
        QCOMPARE(view->currentIndex().row(), row);
        QVERIFY2(IsInView(view, row), qPrintable(QString::number(row)));
    }
    QTest::keyClick(view, Qt::Key_End, Qt::ControlModifier);
    QCOMPARE(view->currentIndex().row(), 149);
    QVERIFY(IsInView(view, 149));
    QTest::keyClick(view, Qt::Key_Home, Qt::ControlModifier);
    QCOMPARE(view->currentIndex().row(), 0);
    QVERIFY(IsInView(view, 0));
}

// The first row after a step was at most the one below the last row before it.
void tst_WrapInWindow::pagesSkipNothing()
{
    const WindowTest test(Uneven(300));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 300, Patience);
    LogView* view = View(*window);
    ToggleWrap(*window);
    view->GoToRow(0);
    const auto lastRow = [&] {
        int row = view->rowAt(view->viewport()->height() - 1);
        return row < 0 ? 299 : row;
    };
    int steps = 0;
    while (view->currentIndex().row() < 299 && ++steps < 300) {
        const int before = lastRow();
        QTest::keyClick(view, Qt::Key_PageDown);
        QVERIFY(view->rowAt(0) <= before + 1);
        QVERIFY(IsInView(view, view->currentIndex().row()));
    }
    QVERIFY(steps > 5 && steps < 300);
    steps = 0;
    while (view->currentIndex().row() > 0 && ++steps < 300) {
        const int before = view->rowAt(0);
        QTest::keyClick(view, Qt::Key_PageUp);
        QVERIFY(lastRow() >= before - 1);
        QVERIFY(IsInView(view, view->currentIndex().row()));
    }
    QVERIFY(steps > 5 && steps < 300);
}

void tst_WrapInWindow::following()
{
    const WindowTest test(Uneven(200));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 200, Patience);
    LogView* view = View(*window);
    QVERIFY(view->isFollowing());
    ToggleWrap(*window);
    QVERIFY(view->isFollowing());
    QVERIFY(IsInView(view, 199));
    QVERIFY(TestFiles::writeOver(test.logFile(), Uneven(260)));
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 260, Patience);
    QVERIFY(view->isFollowing());
    QVERIFY(IsInView(view, 259));
    QTest::keyClick(view, Qt::Key_PageUp);
    view->verticalScrollBar()->triggerAction(QAbstractSlider::SliderSingleStepSub);
    QVERIFY(!view->isFollowing());
    view->verticalScrollBar()->triggerAction(QAbstractSlider::SliderToMaximum);
    QVERIFY(view->isFollowing());
    QVERIFY(IsInView(view, 259));
    ToggleWrap(*window);
    QVERIFY(IsInView(view, 259));
}

void tst_WrapInWindow::keepsThePlace()
{
    const WindowTest test(Uneven(600));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 600, Patience);
    LogView* view = View(*window);
    view->verticalScrollBar()->setValue(250);
    QCOMPARE(view->rowAt(0), 250);
    ToggleWrap(*window);
    QCOMPARE(view->rowAt(0), 250);
    for (int step = 0; step < 20; ++step) { // a step is a row, whatever its height
        view->verticalScrollBar()->triggerAction(QAbstractSlider::SliderSingleStepSub);
        QCOMPARE(view->rowAt(0), 249 - step);
        QCOMPARE(TopOf(view, 249 - step), 0);
    }
    window->resize(window->width() - 100, window->height() - 50);
    QTest::qWait(50);
    QCOMPARE(view->rowAt(0), 230);
    ToggleWrap(*window);
    QCOMPARE(view->rowAt(0), 230);
}

void tst_WrapInWindow::keepsThePlaceWhileGrowing()
{
    const WindowTest test(Uneven(200));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 200, Patience);
    LogView* view = View(*window);
    ToggleWrap(*window);
    view->verticalScrollBar()->setValue(50);
    QVERIFY(TestFiles::writeOver(test.logFile(), Uneven(300)));
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 300, Patience);
    QCOMPARE(view->rowAt(0), 50);
    QCOMPARE(TopOf(view, 50), 0);
}

void tst_WrapInWindow::currentLineStaysWithAFilter()
{
    const WindowTest test(Uneven(600));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 600, Patience);
    LogView* view = View(*window);
    ToggleWrap(*window);
    view->GoToRow(299);
    const QString line =
        view->currentIndex().siblingAtColumn(LogModel::MessageColumn).data().toString();
    QTest::keyClick(window.get(), Qt::Key_L, Qt::ControlModifier);
    QTest::keyClicks(QApplication::focusWidget(), "9 word");
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 60, Patience);
    QTRY_COMPARE(view->currentIndex().siblingAtColumn(LogModel::MessageColumn).data().toString(),
                 line);
    QVERIFY(IsInView(view, view->currentIndex().row()));
    QTest::keyClick(window.get(), Qt::Key_F, Qt::ControlModifier | Qt::ShiftModifier);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 600, Patience);
    QTRY_COMPARE(view->currentIndex().row(), 299);
    QVERIFY(IsInView(view, 299));
}

void tst_WrapInWindow::headingsStay()
{
    const WindowTest test(DemoLog::writtenOver(
        DemoLog::run(30, QTime(17, 0), QByteArray("older ").repeated(50), true),
        DemoLog::run(5, QTime(9, 0), QByteArray("newer ").repeated(50))));
    const auto window = WindowTest::show();
    QTRY_VERIFY_WITH_TIMEOUT(Rows(*window) > 20, Patience);
    LogView* view = View(*window);
    ToggleWrap(*window);
    view->GoToRow(1);
    QVERIFY(view->model()->index(0, 0).data(LogModel::HeadingRole).toBool());
    QCOMPARE(view->rowHeight(0), UsualHeight(view));
    QVERIFY(view->rowHeight(2) > UsualHeight(view));
}

// Millions of rows cannot be measured.
void tst_WrapInWindow::onlyRowsNearTheView()
{
    const WindowTest test(DemoLog::run(20000, QTime(0, 0), QByteArray("word ").repeated(60)));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 20000, Patience);
    LogView* view = View(*window);
    ToggleWrap(*window);
    view->verticalScrollBar()->setValue(10000);
    view->viewport()->grab();
    QVERIFY(view->measuredRows() > 2);
    QVERIFY2(view->measuredRows() < 1000, qPrintable(QString::number(view->measuredRows())));
}

void tst_WrapInWindow::kept()
{
    const WindowTest test(entry("09:00:00.000", "Trace", QByteArray("word ").repeated(100)));
    {
        const auto window = WindowTest::show();
        QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 1, Patience);
        ToggleWrap(*window);
        QVERIFY(window->close());
    }
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 1, Patience);
    QVERIFY(Action(*window, "Line Wrap")->isChecked());
    QTRY_VERIFY(View(*window)->rowHeight(0) > 2 * UsualHeight(View(*window)));
    const QString other = test.folder() + "other.log";
    QVERIFY(TestFiles::write(other, entry("09:00:00.000", "Trace", QByteArray(1000, 'x'))));
    window->OpenFile(other);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 1, Patience);
    QTRY_VERIFY(View(*window)->rowHeight(0) > 2 * UsualHeight(View(*window)));
}

QTEST_MAIN(tst_WrapInWindow)

#include "tst_WrapInWindow.moc"
