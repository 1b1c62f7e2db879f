// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Where the reader of a log is, and how he gets elsewhere, with keys and mouse.

#include "WindowParts.h"
#include "WindowTestCase.h"

#include "app/window/log/LineNumberMargin.h"
#include "app/window/log/LogModel.h"
#include "app/window/log/LogView.h"

#include <QFileDialog>
#include <QHeaderView>
#include <QLabel>
#include <QLineEdit>
#include <QPlainTextEdit>
#include <QScrollBar>

#include <cstdio>

using namespace Velocor;
using namespace WindowParts;

using DemoLog::entry;
using DemoLog::run;
using DemoLog::writtenOver;

namespace {

QString SummaryOf(MainWindow& window)
{
    return Child<QLabel>(&window, "Lines shown")->text();
}

QPoint CenterOf(LogView* view, int row)
{
    return view->visualRect(view->model()->index(row, LogModel::MessageColumn)).center();
}

void ClickRow(LogView* view, int row)
{
    QTest::mouseClick(view->viewport(), Qt::LeftButton, Qt::NoModifier, CenterOf(view, row));
}

// Whether a part of a widget has any of its text color.
bool HasInk(QWidget* widget, QRect const& part)
{
    const QImage image = widget->grab(part).toImage();
    const QColor background = image.pixelColor(0, 0);
    for (int y = 0; y < image.height(); ++y) {
        for (int x = 0; x < image.width(); ++x) {
            if (image.pixelColor(x, y) != background)
                return true;
        }
    }
    return false;
}

} // namespace

class tst_NavigationInWindow : public WindowTestCase
{
    Q_OBJECT

private slots:
    void numbersBesideTheRows();
    void numbersOfFilteredLines();
    void clickOnANumber();
    void numbersAreKept();
    void statusBarHasTheLine();
    void focusAfterClosingATab();
    void goesFromPaneToPane();
    void homeShowsTheHeading();
    void goesDownWithoutGoingSideways();
    void opensInTheFolderOfTheFile();
    void reloadKeepsFollowing_data();
    void reloadKeepsFollowing();
    void lineOfAReplacedFile_data();
    void lineOfAReplacedFile();
};

void tst_NavigationInWindow::numbersBesideTheRows()
{
    const WindowTest test(
        writtenOver(run(9, QTime(17, 0), "older", true), run(4, QTime(9, 0), "newer")));
    const auto window = WindowTest::show();
    QTRY_VERIFY_WITH_TIMEOUT(Rows(*window) > 6, Patience);
    LogView* view = View(*window);
    auto* margin = view->findChild<LineNumberMargin*>();
    QVERIFY(!margin->isVisible());
    const int left = view->viewport()->x();

    QTest::keyClick(window.get(), Qt::Key_N, Qt::ControlModifier | Qt::AltModifier);
    QVERIFY(margin->isVisible());
    QVERIFY(view->viewport()->x() > left);
    QCOMPARE(margin->geometry().right() + 1, view->viewport()->x());
    QCOMPARE(margin->y(), view->viewport()->y());
    // The newest run is the start of the file and follows the earlier ones.
    QCOMPARE(margin->TextOf(0), QString());
    QCOMPARE(margin->TextOf(1), QString("5"));
    QCOMPARE(margin->TextOf(Rows(*window) - 1), QString("4"));
    QCOMPARE(margin->TextOf(Rows(*window)), QString());
    const QRect beside(0, view->visualRect(view->FirstCell(1)).top(), margin->width(),
                       view->rowHeight());
    QVERIFY(HasInk(margin, beside));
    QVERIFY(!HasInk(margin, beside.translated(0, -view->rowHeight())));

    QTest::keyClick(window.get(), Qt::Key_N, Qt::ControlModifier | Qt::AltModifier);
    QVERIFY(!margin->isVisible());
    QCOMPARE(view->viewport()->x(), left);
}

void tst_NavigationInWindow::numbersOfFilteredLines()
{
    const WindowTest test(run(300, QTime(9, 0), "x"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 300, Patience);
    QTest::keyClick(window.get(), Qt::Key_N, Qt::ControlModifier | Qt::AltModifier);
    auto* field = Child<QLineEdit>(window.get(), "Filter by text");
    field->setFocus();
    QTest::keyClicks(field, "x 299");
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 1, Patience);
    QCOMPARE(View(*window)->findChild<LineNumberMargin*>()->TextOf(0), QString("300"));
    ClickRow(View(*window), 0);
    QVERIFY2(SummaryOf(*window).startsWith("Line 300 of 300"), qPrintable(SummaryOf(*window)));
    QVERIFY2(SummaryOf(*window).endsWith("1 shown"), qPrintable(SummaryOf(*window)));
}

void tst_NavigationInWindow::clickOnANumber()
{
    const WindowTest test(run(9, QTime(9, 0), "x"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 9, Patience);
    QTest::keyClick(window.get(), Qt::Key_N, Qt::ControlModifier | Qt::AltModifier);
    LogView* view = View(*window);
    auto* margin = view->findChild<LineNumberMargin*>();
    const auto beside = [&](int row) {
        return QPoint(5, CenterOf(view, row).y());
    };
    QTest::mouseClick(margin, Qt::LeftButton, Qt::NoModifier, beside(3));
    QCOMPARE(view->SelectedRows(), QList<int>({3}));
    QTest::mouseClick(margin, Qt::LeftButton, Qt::ShiftModifier, beside(5));
    QCOMPARE(view->SelectedRows(), QList<int>({3, 4, 5}));
}

void tst_NavigationInWindow::numbersAreKept()
{
    const WindowTest test(run(9, QTime(9, 0), "x"));
    {
        const auto window = WindowTest::show();
        QTest::keyClick(window.get(), Qt::Key_N, Qt::ControlModifier | Qt::AltModifier);
        window->close();
    }
    const auto window = WindowTest::show();
    QVERIFY(View(*window)->findChild<LineNumberMargin*>()->isVisible());
    QVERIFY(Action(*window, "Line Numbers")->isChecked());
}

void tst_NavigationInWindow::statusBarHasTheLine()
{
    const WindowTest test(run(1234, QTime(9, 0), "x"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 1234, Patience);
    const QLocale locale;
    QTRY_VERIFY_WITH_TIMEOUT(SummaryOf(*window).startsWith(locale.toString(1234) + " lines"),
                             Patience);
    QTest::keyClick(View(*window), Qt::Key_Home);
    QVERIFY2(SummaryOf(*window).startsWith("Line 1 of " + locale.toString(1234)),
             qPrintable(SummaryOf(*window)));
    QTest::keyClick(View(*window), Qt::Key_Down);
    QVERIFY2(SummaryOf(*window).startsWith("Line 2 of " + locale.toString(1234)),
             qPrintable(SummaryOf(*window)));
    QVERIFY(TestFiles::writeOver(test.logFile(), run(1240, QTime(9, 0), "x")));
    QTRY_VERIFY_WITH_TIMEOUT(SummaryOf(*window).startsWith("Line 2 of " + locale.toString(1240)),
                             Patience);
}

void tst_NavigationInWindow::focusAfterClosingATab()
{
    const WindowTest test(run(9, QTime(9, 0), "x"));
    const QString other = test.folder() + "other.log";
    QVERIFY(TestFiles::write(other, run(5, QTime(9, 0), "y")));
    const auto window = WindowTest::show();
    window->OpenFile(other);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 5, Patience);
    QCOMPARE(QApplication::focusWidget(), View(*window));
    QTest::keyClick(window.get(), Qt::Key_W, Qt::ControlModifier);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 9, Patience);
    QCOMPARE(QApplication::focusWidget(), View(*window));
}

void tst_NavigationInWindow::goesFromPaneToPane()
{
    const WindowTest test(run(9, QTime(9, 0), "x"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 9, Patience);
    const auto next = [&] {
        QTest::keyClick(window.get(), Qt::Key_F6);
        return QApplication::focusWidget();
    };
    const auto previous = [&] {
        QTest::keyClick(window.get(), Qt::Key_F6, Qt::ShiftModifier);
        return QApplication::focusWidget();
    };
    QWidget* const lines = View(*window);
    QWidget* const text = Child<QPlainTextEdit>(window.get(), "Full text of the current line");
    QWidget* const filter = Child<QLineEdit>(window.get(), "Filter by text");
    lines->setFocus();
    QCOMPARE(next(), text);
    QCOMPARE(next(), filter);
    QCOMPARE(next(), lines);
    QCOMPARE(previous(), filter);
    QCOMPARE(previous(), text);

    QTest::keyClick(window.get(), Qt::Key_F, Qt::ControlModifier);
    QWidget* const find = Child<QLineEdit>(window.get(), "Find text");
    QTest::keyClick(window.get(), Qt::Key_F9);
    lines->setFocus();
    QCOMPARE(next(), find);
    QCOMPARE(next(), text);
    QCOMPARE(next()->accessibleName(), QString("Copy: Organization"));
    QCOMPARE(next(), filter);
}

void tst_NavigationInWindow::homeShowsTheHeading()
{
    const WindowTest test(
        writtenOver(run(300, QTime(17, 0), "older", true), run(40, QTime(9, 0), "newer")));
    const auto window = WindowTest::show();
    QTRY_VERIFY_WITH_TIMEOUT(Rows(*window) > 100, Patience);
    LogView* view = View(*window);
    QTest::keyClick(view, Qt::Key_End);
    QTRY_VERIFY_WITH_TIMEOUT(view->rowAt(0) > 1, Patience);
    QTest::keyClick(view, Qt::Key_Home);
    QCOMPARE(view->currentIndex().row(), 1);
    QCOMPARE(view->rowAt(0), 0);
}

// A row is selected as a whole, whatever cell of it was clicked.
void tst_NavigationInWindow::goesDownWithoutGoingSideways()
{
    const WindowTest test(run(300, QTime(9, 0), "x"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 300, Patience);
    LogView* view = View(*window);
    view->setColumnWidth(LogModel::TimeColumn, 3 * view->viewport()->width());
    QTRY_VERIFY_WITH_TIMEOUT(view->horizontalScrollBar()->maximum() > 300, Patience);
    view->horizontalScrollBar()->setValue(300);
    QTest::mouseClick(view->viewport(), Qt::LeftButton, Qt::NoModifier,
                      QPoint(20, view->viewport()->height() / 2));
    QCOMPARE(view->horizontalScrollBar()->value(), 300);
    for (Qt::Key key : {Qt::Key_Down, Qt::Key_Up, Qt::Key_PageUp, Qt::Key_End, Qt::Key_Home}) {
        QTest::keyClick(view, key);
        QCOMPARE(view->horizontalScrollBar()->value(), 300);
    }
    QTest::keyClick(view, Qt::Key_Right);
    QVERIFY(view->horizontalScrollBar()->value() > 300);
}

void tst_NavigationInWindow::opensInTheFolderOfTheFile()
{
    const WindowTest test(run(9, QTime(9, 0), "x"));
    const QString folder = test.folder() + "elsewhere";
    QVERIFY(QDir().mkpath(folder));
    QVERIFY(TestFiles::write(folder + "/other.log", run(5, QTime(9, 0), "y")));
    const auto window = WindowTest::show();
    window->OpenFile(folder + "/other.log");
    QString shown;
    QStringList types;
    WindowTest::whenShown<QFileDialog>([&](QFileDialog* dialog) {
        shown = dialog->directory().absolutePath();
        types = dialog->nameFilters();
        QTest::keyClick(dialog, Qt::Key_Escape);
    });
    QTest::keyClick(window.get(), Qt::Key_O, Qt::ControlModifier);
    QCOMPARE(shown, folder);
    QCOMPARE(types.size(), 3);
    QVERIFY2(types.first().contains("*.txt"), qPrintable(types.first()));
}

void tst_NavigationInWindow::reloadKeepsFollowing_data()
{
    QTest::addColumn<int>("fromTheEnd");

    QTest::newRow("the current line is in view") << 3;
    QTest::newRow("the current line was left behind") << 180;
}

void tst_NavigationInWindow::reloadKeepsFollowing()
{
    QFETCH(int, fromTheEnd);
    const WindowTest test(run(200, QTime(9, 0), "x"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 200, Patience);
    LogView* view = View(*window);
    const int row = 199 - fromTheEnd;
    view->GoToRow(row);
    QTest::keyClick(window.get(), Qt::Key_N, Qt::ControlModifier | Qt::ShiftModifier);
    QVERIFY(view->isFollowing());
    QSignalSpy refreshed(view->model(), SIGNAL(refreshed()));
    QTest::keyClick(window.get(), Qt::Key_F5);
    QTRY_VERIFY_WITH_TIMEOUT(!refreshed.isEmpty() && !Panel(*window)->model()->isReading(),
                             Patience);
    QVERIFY(view->isFollowing());
    QVERIFY(Action(*window, "Follow Newest")->isChecked());
    QCOMPARE(view->currentIndex().row(), row);
    QCOMPARE(view->verticalScrollBar()->value(), view->verticalScrollBar()->maximum());
    QVERIFY(TestFiles::writeOver(test.logFile(), run(260, QTime(9, 0), "x")));
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 260, Patience);
    QCOMPARE(view->verticalScrollBar()->value(), view->verticalScrollBar()->maximum());
}

void tst_NavigationInWindow::lineOfAReplacedFile_data()
{
    QTest::addColumn<int>("first");
    QTest::addColumn<bool>("isRenamed");
    QTest::addColumn<int>("row");

    QTest::newRow("lines before it are gone") << 40 << true << 60;
    QTest::newRow("the same, written in place") << 40 << false << 60;
    QTest::newRow("it is gone itself") << 150 << true << -1;
    QTest::newRow("it is gone itself, written in place") << 150 << false << -1;
}

// As when a program trims its log.
void tst_NavigationInWindow::lineOfAReplacedFile()
{
    QFETCH(int, first);
    QFETCH(bool, isRenamed);
    const WindowTest test(run(2, QTime(9, 0), "x"));
    const auto lines = [](int from) {
        QByteArray text;
        for (int i = from; i < 200; ++i)
            text += "2026-11-22 10:00:00 INFO line " + QByteArray::number(i) + '\n';
        return text;
    };
    const QString path = test.folder() + "other.log";
    QVERIFY(TestFiles::write(path, lines(0)));
    const auto window = WindowTest::show({path});
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 200, Patience);
    LogView* view = View(*window);
    view->GoToRow(100);
    QCOMPARE(view->currentIndex().row(), 100);
    if (isRenamed) {
        QVERIFY(TestFiles::write(path + ".new", lines(first)));
        QCOMPARE(std::rename(QFile::encodeName(path + ".new"), QFile::encodeName(path)), 0);
    } else {
        QVERIFY(TestFiles::writeOver(path, lines(first)));
    }
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 200 - first, Patience);
    QTRY_VERIFY_WITH_TIMEOUT(!Panel(*window)->model()->isReading(), Patience);
    QTEST(view->currentIndex().row(), "row");
    if (view->currentIndex().isValid())
        QVERIFY(view->viewport()->rect().contains(view->visualRect(view->currentIndex()).center()));
}

QTEST_MAIN(tst_NavigationInWindow)

#include "tst_NavigationInWindow.moc"
