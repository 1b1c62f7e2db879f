// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Finding lines, driven with keys and mouse on a real screen.

#include "WindowParts.h"
#include "WindowTestCase.h"

#include "app/window/log/GoToDialog.h"
#include "app/window/log/LogFindBar.h"
#include "app/window/log/LogGoTo.h"
#include "app/window/log/LogModel.h"
#include "app/window/log/LogSearch.h"
#include "app/window/log/LogView.h"

#include <QCheckBox>
#include <QDialogButtonBox>
#include <QLabel>
#include <QLineEdit>
#include <QPushButton>
#include <QToolButton>

using namespace Velocor;
using namespace WindowParts;

using DemoLog::entry;
using DemoLog::run;

namespace {

QColor const FoundColor(0x74, 0xe0, 0xef);

QLineEdit* Field(MainWindow& window)
{
    return Child<QLineEdit>(&window, "Find text");
}

QString Count(MainWindow& window)
{
    return Child<QLabel>(&window, "Lines found")->text();
}

// Opens the bar and types.
void Type(MainWindow& window, char const* text)
{
    QTest::keyClick(&window, Qt::Key_F, Qt::ControlModifier);
    QTest::keyClicks(QApplication::focusWidget(), text);
}

void GoTo(MainWindow& window, char const* place)
{
    WindowTest::whenShown<GoToDialog>([place](GoToDialog* dialog) {
        auto* field = Child<QLineEdit>(dialog, "Line or time");
        QTest::keyClicks(field, place);
        QTest::keyClick(field, Qt::Key_Return);
    });
    QTest::keyClick(&window, Qt::Key_G, Qt::ControlModifier);
    QVERIFY(WindowTest::activate(&window)); // no window manager does it
}

// `count` entries, every hundredth of which has the word "needle".
QByteArray Needles(int count)
{
    QByteArray log;
    for (int i = 0; i < count; ++i)
        log += entry(QTime(9, 0).addMSecs(100 * i).toString("hh:mm:ss.zzz"), "Trace",
                     QString(i % 100 == 50 ? "needle %1" : "straw %1").arg(i));
    return log;
}

} // namespace

class tst_FindInWindow : public WindowTestCase
{
    Q_OBJECT

private slots:
    void amongTheOtherLines();
    void withTheKeyboardFromTheTable();
    void startsAtTheCurrentRow();
    void withTheMouse();
    void options();
    void marksInTheTable();
    void marksBesideThoseOfTheFilter();
    void ticksBesideTheScrollBar();
    void closes();
    void newLinesAreFound();
    void inTheRowsShown();
    void invalidExpression();
    void slowExpression();
    void notFound();
    void outsideOfTheGuiThread();
    void jumpsWhenFound();
    void goesToALine();
    void goesToATime();
    void saysThatItLooksForATime();
    void goToSaysWhatIsWrong();
};

// The lines between the hits stay, one row is selected, and it comes with context.
void tst_FindInWindow::amongTheOtherLines()
{
    const WindowTest test(Needles(300));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 300, Patience);
    LogView* view = View(*window);
    QTest::keyClick(view, Qt::Key_Home, Qt::ControlModifier);
    view->setCurrentIndex(QModelIndex());
    view->clearSelection();
    Type(*window, "needle");
    QVERIFY(Field(*window)->hasFocus());
    QTRY_COMPARE_WITH_TIMEOUT(Count(*window), QString("3 lines"), Patience);
    QVERIFY(!view->currentIndex().isValid());
    for (int hit : {0, 1, 2, 0}) {
        QTest::keyClick(Field(*window), Qt::Key_Return);
        QCOMPARE(view->currentIndex().row(), 50 + 100 * hit);
        QCOMPARE(view->selectionModel()->selectedRows().size(), 1);
        QCOMPARE(Count(*window), QString("%1 of 3").arg(hit + 1));
        QVERIFY(view->rowAt(0) < 50 + 100 * hit - 2);
        QVERIFY(view->rowAt(view->viewport()->height() - 1) > 50 + 100 * hit + 2);
        QVERIFY(Field(*window)->hasFocus());
    }
    QCOMPARE(Status(*window), QString("Continued from the top"));
    QCOMPARE(Rows(*window), 300);
    QVERIFY(!view->isFollowing());
    QTest::keyClick(Field(*window), Qt::Key_Return, Qt::ShiftModifier);
    QCOMPARE(view->currentIndex().row(), 250);
    QCOMPARE(Status(*window), QString("Continued from the bottom"));
    QTest::keyClick(Field(*window), Qt::Key_Enter, Qt::ShiftModifier | Qt::KeypadModifier);
    QCOMPARE(view->currentIndex().row(), 150);
    QCOMPARE(Status(*window), QString());
}

void tst_FindInWindow::withTheKeyboardFromTheTable()
{
    const WindowTest test(Needles(300));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 300, Patience);
    LogView* view = View(*window);
    QTest::keyClick(window.get(), Qt::Key_F3); // nothing to find yet
    QVERIFY(Field(*window)->isVisible() && Field(*window)->hasFocus());
    QTest::keyClicks(Field(*window), "needle");
    view->setFocus();
    QTest::keyClick(view, Qt::Key_Home, Qt::ControlModifier);
    QTest::keyClick(window.get(), Qt::Key_F3);
    QTRY_COMPARE_WITH_TIMEOUT(view->currentIndex().row(), 50, Patience);
    QVERIFY(view->hasFocus());
    QTest::keyClick(window.get(), Qt::Key_F3, Qt::ShiftModifier); // would extend the selection
    QTRY_COMPARE_WITH_TIMEOUT(view->currentIndex().row(), 250,
                              Patience); // only a search that is over starts again
    QCOMPARE(view->selectionModel()->selectedRows().size(), 1);

    // F3 goes on with the former text after the bar was closed.
    QTest::keyClick(view, Qt::Key_Escape);
    QVERIFY(!Field(*window)->isVisible());
    QTest::keyClick(window.get(), Qt::Key_F3, Qt::ShiftModifier);
    QTRY_COMPARE_WITH_TIMEOUT(view->currentIndex().row(), 150, Patience);
    QVERIFY(Field(*window)->isVisible());
}

void tst_FindInWindow::startsAtTheCurrentRow()
{
    const WindowTest test(Needles(600));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 600, Patience);
    LogView* view = View(*window);
    view->GoToRow(300);
    Type(*window, "needle");
    QTest::keyClick(Field(*window), Qt::Key_Return);
    QTRY_COMPARE_WITH_TIMEOUT(view->currentIndex().row(), 350, Patience);
    view->GoToRow(300);
    QTest::keyClick(Field(*window), Qt::Key_Return, Qt::ShiftModifier);
    QTRY_COMPARE_WITH_TIMEOUT(view->currentIndex().row(), 250, Patience);
    QTRY_COMPARE_WITH_TIMEOUT(Count(*window), QString("3 of 6"), Patience);
    view->GoToRow(300);
    QCOMPARE(Count(*window), QString("6 lines"));
}

void tst_FindInWindow::withTheMouse()
{
    const WindowTest test(Needles(300));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 300, Patience);
    View(*window)->GoToRow(100);
    Type(*window, "needle");
    QTRY_COMPARE_WITH_TIMEOUT(Count(*window), QString("3 lines"), Patience);
    Click(Child<QToolButton>(window.get(), "Find next"));
    QCOMPARE(View(*window)->currentIndex().row(), 150);
    Click(Child<QToolButton>(window.get(), "Find previous"));
    QCOMPARE(View(*window)->currentIndex().row(), 50);
    Click(Child<QToolButton>(window.get(), "Close find bar"));
    QVERIFY(!Field(*window)->isVisible());
    QVERIFY(View(*window)->hasFocus());
}

void tst_FindInWindow::options()
{
    const WindowTest test(entry("09:00:00.000", "Trace", "Disk 1") +
                          entry("09:00:01.000", "Trace", "disk 2") +
                          entry("09:00:02.000", "Trace", "d.sk 3"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 3, Patience);
    Type(*window, "d.sk");
    QTRY_COMPARE_WITH_TIMEOUT(Count(*window), QString("1 line"), Patience);
    ClickBox(Child<QCheckBox>(window.get(), "Find a regular expression"));
    QTRY_COMPARE_WITH_TIMEOUT(Count(*window), QString("3 lines"), Patience);
    ClickBox(Child<QCheckBox>(window.get(), "Match case when finding"));
    QTRY_COMPARE_WITH_TIMEOUT(Count(*window), QString("2 lines"), Patience);
}

void tst_FindInWindow::marksInTheTable()
{
    const WindowTest test(Needles(300));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 300, Patience);
    LogView* view = View(*window);
    Type(*window, "straw 29");
    QTRY_VERIFY_WITH_TIMEOUT(Pixels(view->viewport(), FoundColor) > 500, Patience);
    QTest::keyClick(Field(*window), Qt::Key_Escape);
    QTRY_COMPARE_WITH_TIMEOUT(Pixels(view->viewport(), FoundColor), 0, Patience);
}

void tst_FindInWindow::marksBesideThoseOfTheFilter()
{
    const WindowTest test(Needles(300));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 300, Patience);
    LogView* view = View(*window);
    QTest::keyClick(window.get(), Qt::Key_L, Qt::ControlModifier);
    QTest::keyClicks(QApplication::focusWidget(), "needle");
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 3, Patience);
    Type(*window, "250");
    QTRY_COMPARE_WITH_TIMEOUT(Count(*window), QString("1 line"), Patience);
    QTRY_VERIFY_WITH_TIMEOUT(Pixels(view->viewport(), FoundColor) > 20, Patience);
    QTRY_VERIFY_WITH_TIMEOUT(Pixels(view->viewport(), QColor(0xff, 0xe0, 0x66)) > 100, Patience);
}

// As many ticks as hits, each where its row is, in light and in dark.
void tst_FindInWindow::ticksBesideTheScrollBar()
{
    const WindowTest test(Needles(300));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 300, Patience);
    const QPalette light = window->palette();
    QPalette dark = light;
    dark.setColor(QPalette::Base, QColor(0x1e, 0x1f, 0x22));
    auto* overview = Child<QWidget>(window.get(), "Overview");
    const auto tickTops = [&](QColor const& color) {
        const QImage image = overview->grab().toImage();
        QVector<int> tops;
        for (int y = 1; y < image.height(); ++y) {
            const int x = image.width() / 2;
            if (image.pixelColor(x, y) == color && image.pixelColor(x, y - 1) != color)
                tops.append(y);
        }
        return tops;
    };
    QCOMPARE(tickTops(QColor(0, 0x7a, 0x8c)).size(), 0);
    Type(*window, "needle");
    QTRY_COMPARE_WITH_TIMEOUT(tickTops(QColor(0, 0x7a, 0x8c)).size(), 3, Patience);
    const QVector<int> tops = tickTops(QColor(0, 0x7a, 0x8c));
    const double height = tops[2] - tops[0]; // two thirds of the strip
    QVERIFY(height > overview->height() * qApp->devicePixelRatio() / 2);
    QVERIFY(qAbs(tops[1] - tops[0] - height / 2) <= 2 * qApp->devicePixelRatio());
    overview->setPalette(dark);
    QTRY_COMPARE_WITH_TIMEOUT(tickTops(QColor(0x5f, 0xd9, 0xe8)).size(), 3, Patience);
    overview->setPalette(light);
    QTest::keyClick(Field(*window), Qt::Key_Escape);
    QTRY_COMPARE_WITH_TIMEOUT(tickTops(QColor(0, 0x7a, 0x8c)).size(), 0, Patience);
}

void tst_FindInWindow::closes()
{
    const WindowTest test(Needles(300));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 300, Patience);
    QVERIFY(!Child<LogFindBar>(window.get(), "Find")->isVisible());
    Type(*window, "needle");
    QTRY_COMPARE_WITH_TIMEOUT(Count(*window), QString("3 lines"), Patience);
    QTest::keyClick(Field(*window), Qt::Key_Escape);
    QVERIFY(!Field(*window)->isVisible());
    QVERIFY(View(*window)->hasFocus());
    QTest::keyClick(window.get(), Qt::Key_F, Qt::ControlModifier);
    QCOMPARE(Field(*window)->selectedText(), QString("needle"));
    QTRY_COMPARE_WITH_TIMEOUT(Count(*window), QString("3 lines"), Patience);
}

void tst_FindInWindow::newLinesAreFound()
{
    const WindowTest test(Needles(300));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 300, Patience);
    View(*window)->GoToRow(250);
    Type(*window, "needle");
    QTRY_COMPARE_WITH_TIMEOUT(Count(*window), QString("3 of 3"), Patience);
    QVERIFY(TestFiles::writeOver(test.logFile(), Needles(500)));
    QTRY_COMPARE_WITH_TIMEOUT(Count(*window), QString("3 of 5"), Patience);
    QCOMPARE(View(*window)->currentIndex().row(), 250);
    QTest::keyClick(window.get(), Qt::Key_F3);
    QCOMPARE(View(*window)->currentIndex().row(), 350);
}

void tst_FindInWindow::inTheRowsShown()
{
    const WindowTest test(run(300, QTime(9, 0), "x"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 300, Patience);
    Type(*window, "x 1");
    QTRY_COMPARE_WITH_TIMEOUT(Count(*window), QString("111 lines"), Patience);
    for (Qt::Key key : {Qt::Key_1, Qt::Key_3}) // of the traces and warnings, only errors remain
        QTest::keyClick(window.get(), key, Qt::ControlModifier);
    QTRY_VERIFY_WITH_TIMEOUT(Rows(*window) < 40, Patience);
    int hits = 0;
    for (int row = 0; row < Rows(*window); ++row)
        hits += View(*window)
                        ->model()
                        ->index(row, LogModel::MessageColumn)
                        .data()
                        .toString()
                        .startsWith("x 1")
                    ? 1
                    : 0;
    QTRY_COMPARE_WITH_TIMEOUT(Count(*window), QString("%1 lines").arg(hits), Patience);
}

void tst_FindInWindow::invalidExpression()
{
    const WindowTest test(Needles(300));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 300, Patience);
    Type(*window, "needle");
    ClickBox(Child<QCheckBox>(window.get(), "Find a regular expression"));
    QTRY_COMPARE_WITH_TIMEOUT(Count(*window), QString("3 lines"), Patience);
    auto const* error = Child<QLabel>(window.get(), "Find error");
    QVERIFY(!error->isVisible());
    QTest::keyClicks(Field(*window), "(");
    QTRY_VERIFY_WITH_TIMEOUT(error->isVisible(), Patience);
    QVERIFY2(error->text().contains("at character"), qPrintable(error->text()));
    QCOMPARE(Count(*window), QString());
    QTest::keyClick(Field(*window), Qt::Key_Return);
    QVERIFY(!View(*window)->currentIndex().isValid());
    QTest::keyClick(Field(*window), Qt::Key_Backspace);
    QTRY_COMPARE_WITH_TIMEOUT(Count(*window), QString("3 lines"), Patience);
    QVERIFY(!error->isVisible());
}

void tst_FindInWindow::slowExpression()
{
    const WindowTest test(run(40, QTime(9, 0), "x") +
                          entry("09:10:00.000", "Trace", QString(3000, 'a')));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 41, Patience);
    QTest::keyClick(window.get(), Qt::Key_F, Qt::ControlModifier);
    ClickBox(Child<QCheckBox>(window.get(), "Find a regular expression"));
    QTest::keyClicks(Field(*window), "(a+)+[b-w]$");
    auto const* error = Child<QLabel>(window.get(), "Find error");
    QTRY_COMPARE_WITH_TIMEOUT(
        error->text(), QString("The regular expression takes too long at line 41."), Patience);
    QTest::keyClick(Field(*window), Qt::Key_Return);
    QVERIFY(error->isVisible());
    Field(*window)->selectAll();
    QTest::keyClicks(Field(*window), "x");
    QTRY_COMPARE_WITH_TIMEOUT(Count(*window), QString("40 lines"), Patience);
    QVERIFY(!error->isVisible());
}

void tst_FindInWindow::notFound()
{
    const WindowTest test(Needles(20));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 20, Patience);
    Type(*window, "haystack");
    QTRY_COMPARE_WITH_TIMEOUT(Count(*window), QString("Not found"), Patience);
    QTest::keyClick(Field(*window), Qt::Key_Return);
    QCOMPARE(Status(*window), QString("Not found"));
    QVERIFY(!View(*window)->currentIndex().isValid());
}

// Nothing is searched before control returns to the event loop, and a search that is no longer
// wanted brings nothing.
void tst_FindInWindow::outsideOfTheGuiThread()
{
    const WindowTest test(Needles(50000));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 50000, Patience);
    LogSearch search(Panel(*window)->model());
    LogFilter text;
    QVERIFY(text.SetText("needle", false, false));
    search.SetText(text);
    QVERIFY(!search.isComplete());
    QVERIFY(search.hits()->empty());
    int row = -1;
    QCOMPARE(search.Next(0, 1, row), LogSearch::Answer::Unknown);
    QTRY_VERIFY_WITH_TIMEOUT(search.isComplete(), Patience);
    QCOMPARE(search.hits()->size(), size_t(500));
    QVERIFY(text.SetText("straw", false, false));
    search.SetText(text);
    search.SetText(LogFilter());
    QTest::qWait(300);
    QVERIFY(search.hits()->empty());
}

// Return does not wait for the search; the row is gone to once it is found.
void tst_FindInWindow::jumpsWhenFound()
{
    const WindowTest test(Needles(100000));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 100000, Patience);
    View(*window)->GoToRow(99998);
    Type(*window, "needle");
    QTest::keyClick(Field(*window), Qt::Key_Return, Qt::ShiftModifier);
    QTRY_COMPARE_WITH_TIMEOUT(View(*window)->currentIndex().row(), 99950, Patience);
    QTRY_COMPARE_WITH_TIMEOUT(Count(*window), QString("1,000 of 1,000"), Patience);
}

void tst_FindInWindow::goesToALine()
{
    const WindowTest test(Needles(300));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 300, Patience);
    GoTo(*window, "120");
    LogView* view = View(*window);
    QTRY_COMPARE_WITH_TIMEOUT(view->currentIndex().row(), 119, Patience);
    QCOMPARE(view->selectionModel()->selectedRows().size(), 1);
    QVERIFY(view->rowAt(0) < 119 - 2);
    QVERIFY(view->rowAt(view->viewport()->height() - 1) > 119 + 2);
    QTRY_VERIFY_WITH_TIMEOUT(view->hasFocus(), Patience);

    // Lines are those of the file, not of the rows.
    QTest::keyClick(window.get(), Qt::Key_L, Qt::ControlModifier);
    QTest::keyClicks(QApplication::focusWidget(), "needle");
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 3, Patience);
    GoTo(*window, "151");
    QTRY_COMPARE_WITH_TIMEOUT(view->currentIndex().row(), 1, Patience);
    GoTo(*window, "290");
    QTRY_COMPARE_WITH_TIMEOUT(view->currentIndex().row(), 2, Patience);
    QVERIFY2(Status(*window).startsWith("The line is not shown"), qPrintable(Status(*window)));
}

void tst_FindInWindow::goesToATime()
{
    const WindowTest test(run(300, QTime(9, 0), "x"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 300, Patience);
    LogView* view = View(*window);
    GoTo(*window, "9:01");
    QTRY_COMPARE_WITH_TIMEOUT(view->currentIndex().row(), 60, Patience);
    GoTo(*window, "+90s");
    QTRY_COMPARE_WITH_TIMEOUT(view->currentIndex().row(), 150, Patience);
    GoTo(*window, "-2m");
    QTRY_COMPARE_WITH_TIMEOUT(view->currentIndex().row(), 30, Patience);
    GoTo(*window, "2025-03-03 09:04:10");
    QTRY_COMPARE_WITH_TIMEOUT(view->currentIndex().row(), 250, Patience);
    GoTo(*window, "10:00");
    QTRY_COMPARE_WITH_TIMEOUT(view->currentIndex().row(), 299, Patience);
    QCOMPARE(Status(*window), QString("The lines shown end before that"));
}

// The times of many rows are read from the file.
void tst_FindInWindow::saysThatItLooksForATime()
{
    const WindowTest test(run(LogGoTo::ManyRows, QTime(0, 0), "x"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), int(LogGoTo::ManyRows), Patience);
    QStringList messages;
    connect(Panel(*window), &LogPanel::messageReported, this,
            [&](QString const& message) { messages.append(message); });
    GoTo(*window, "0:01");
    QTRY_COMPARE_WITH_TIMEOUT(View(*window)->currentIndex().row(), 60, Patience);
    QCOMPARE(messages, QStringList({"Looking for that time...", "Found"}));
    GoTo(*window, "90");
    QTRY_COMPARE_WITH_TIMEOUT(View(*window)->currentIndex().row(), 89, Patience);
    QCOMPARE(messages.size(), 2);
}

void tst_FindInWindow::goToSaysWhatIsWrong()
{
    const WindowTest test(run(3, QTime(9, 0), "x"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 3, Patience);
    WindowTest::whenShown<GoToDialog>([&](GoToDialog* dialog) {
        auto* field = Child<QLineEdit>(dialog, "Line or time");
        auto const* problem = Child<QLabel>(dialog, "Problem");
        QAbstractButton* ok = dialog->findChild<QDialogButtonBox*>()->button(QDialogButtonBox::Ok);
        const auto check = [&](char const* typed, char const* error) {
            field->selectAll();
            QTest::keyClicks(field, typed);
            QCOMPARE(problem->text(), QString(error));
            QCOMPARE(ok->isEnabled(), *error == '\0');
        };
        QVERIFY(!ok->isEnabled());
        QCOMPARE(problem->text(), QString());
        check("14:63", "The minutes go up to 59.");
        check("4", "The file has only 3 lines.");
        check("+5m", "Select an entry first, from which to count.");
        check("3", "");
        check("14:03", "");
        field->clear();
        QVERIFY(!ok->isEnabled());
        QTest::keyClick(field, Qt::Key_Return);
        QVERIFY(dialog->isVisible());
        QTest::keyClick(field, Qt::Key_Escape);
    });
    QTest::keyClick(window.get(), Qt::Key_G, Qt::ControlModifier);
    QVERIFY(!View(*window)->currentIndex().isValid());
}

QTEST_MAIN(tst_FindInWindow)

#include "tst_FindInWindow.moc"
