// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// What the filter has besides its text, driven with keys and mouse on a real screen.

#include "WindowParts.h"
#include "WindowTestCase.h"

#include "app/window/log/LogModel.h"
#include "app/window/log/LogView.h"

#include <QCheckBox>
#include <QClipboard>
#include <QComboBox>
#include <QLabel>
#include <QLineEdit>
#include <QMenu>
#include <QPlainTextEdit>
#include <QToolButton>

using namespace Velocor;
using namespace WindowParts;

using DemoLog::entry;
using DemoLog::run;

namespace {

QLineEdit* Field(MainWindow& window, char const* name = "Filter by text")
{
    return Child<QLineEdit>(&window, name);
}

QStringList Messages(MainWindow& window)
{
    QStringList messages;
    for (int row = 0; row < Rows(window); ++row)
        messages.append(
            View(window)->model()->index(row, LogModel::MessageColumn).data().toString());
    return messages;
}

void Type(MainWindow& window, char const* text)
{
    QTest::keyClick(&window, Qt::Key_L, Qt::ControlModifier);
    QTest::keyClicks(QApplication::focusWidget(), text);
}

// Opens the menu of a cell and chooses the item with this letter.
void Choose(MainWindow& window, int row, int column, Qt::Key letter)
{
    LogView* view = View(window);
    const QPoint at = view->visualRect(view->model()->index(row, column)).center();
    QTest::mouseClick(view->viewport(), Qt::RightButton, Qt::NoModifier, at);
    QContextMenuEvent event(QContextMenuEvent::Mouse, at, view->viewport()->mapToGlobal(at));
    QApplication::sendEvent(view->viewport(), &event);
    QWidget* menu = QApplication::activePopupWidget();
    QVERIFY(menu);
    QTest::keyClick(menu, letter);
}

// Chooses an item with the keyboard.
void Choose(QComboBox* box, char const* text)
{
    box->setFocus();
    QTest::keyClick(box, Qt::Key_Home);
    for (int i = 0; i < box->count() && box->currentText() != text; ++i)
        QTest::keyClick(box, Qt::Key_Down);
    QCOMPARE(box->currentText(), QString(text));
}

QByteArray Fruit()
{
    return entry("09:00:00.000", "Trace", "red apple") +
           entry("09:00:01.000", "Warning", "green apple") +
           entry("09:00:02.000", "Error", "red \"cherry\" pie") +
           entry("09:00:03.000", "Fatal", "green pear") + entry("09:00:04.000", "Trace", "plum");
}

} // namespace

class tst_FilterInWindow : public WindowTestCase
{
    Q_OBJECT

private slots:
    void cleanupTestCase();

    void moreIsHidden();
    void textIsOneText();
    void hidesTerms();
    void requiresTerms();
    void leastSeverity();
    void context();
    void contextIsDimmed();
    void clears();
    void escapeGoesToTheTable();
    void filterByThis();
    void hideThis();
    void severityOfTheMenu();
    void severityCounts();
    void selectionOfTheCurrentLine();
    void keysOfTheSecondRow();
    void cellWithATab();
    void matchThatBeginsBeforeTheMessage_data();
    void matchThatBeginsBeforeTheMessage();
    void history();
    void historyIsShared();
};

// Qt frees the animation of a clear button when it ends, even if the button is gone by then.
void tst_FilterInWindow::cleanupTestCase()
{
    QTest::qWait(300);
}

void tst_FilterInWindow::moreIsHidden()
{
    const WindowTest test(Fruit());
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 5, Patience);
    QVERIFY(!Field(*window, "Terms of lines to hide")->isVisible());
    Click(Child<QToolButton>(window.get(), "More filters"));
    QVERIFY(Field(*window, "Terms of lines to hide")->isVisible());
    QVERIFY(Child<QComboBox>(window.get(), "Lines of context")->isVisible());
    Click(Child<QToolButton>(window.get(), "More filters"));
    QVERIFY(!Field(*window, "Terms of lines to hide")->isVisible());
}

void tst_FilterInWindow::textIsOneText()
{
    const WindowTest test(Fruit());
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 5, Patience);
    Type(*window, "red \"cherry\"");
    QTRY_COMPARE_WITH_TIMEOUT(Messages(*window), QStringList({"red \"cherry\" pie"}), Patience);
}

void tst_FilterInWindow::hidesTerms()
{
    const WindowTest test(Fruit());
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 5, Patience);
    Click(Child<QToolButton>(window.get(), "More filters"));
    Field(*window, "Terms of lines to hide")->setFocus();
    QTest::keyClicks(QApplication::focusWidget(), "Pear \"red a\"");
    QTRY_COMPARE_WITH_TIMEOUT(Messages(*window),
                              QStringList({"green apple", "red \"cherry\" pie", "plum"}), Patience);
    QTest::mouseClick(Child<QCheckBox>(window.get(), "Match case"), Qt::LeftButton, Qt::NoModifier,
                      QPoint(8, 8));
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 4, Patience);
}

void tst_FilterInWindow::requiresTerms()
{
    const WindowTest test(Fruit());
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 5, Patience);
    Type(*window, "e");
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 5, Patience);
    Click(Child<QToolButton>(window.get(), "More filters"));
    Field(*window, "Terms that lines also contain")->setFocus();
    QTest::keyClicks(QApplication::focusWidget(), "apple green");
    QTRY_COMPARE_WITH_TIMEOUT(Messages(*window), QStringList({"green apple"}), Patience);
}

void tst_FilterInWindow::leastSeverity()
{
    const WindowTest test(Fruit());
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 5, Patience);
    Click(Child<QToolButton>(window.get(), "More filters"));
    auto* least = Child<QComboBox>(window.get(), "Least severity");
    Choose(least, "At least Warning");
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 3, Patience);
    QVERIFY(!Child<QToolButton>(window.get(), "Show Notification")->isChecked());
    Choose(least, "Only Fatal");
    QTRY_COMPARE_WITH_TIMEOUT(Messages(*window), QStringList({"green pear"}), Patience);
    Choose(least, "All severities");
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 5, Patience);

    // The box says what the buttons amount to.
    QTest::keyClick(window.get(), Qt::Key_1, Qt::ControlModifier);
    QTRY_COMPARE_WITH_TIMEOUT(least->currentText(), QString("At least Notification"), Patience);
    QTest::keyClick(window.get(), Qt::Key_4, Qt::ControlModifier);
    QTRY_COMPARE_WITH_TIMEOUT(least->currentText(), QString("Some severities"), Patience);
}

void tst_FilterInWindow::context()
{
    const WindowTest test(run(100, QTime(9, 0), "x"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 100, Patience);
    Type(*window, "x 50");
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 1, Patience);
    Click(Child<QToolButton>(window.get(), "More filters"));
    Choose(Child<QComboBox>(window.get(), "Lines of context"), "2 around");
    QTRY_COMPARE_WITH_TIMEOUT(Messages(*window),
                              QStringList({"x 48", "x 49", "x 50", "x 51", "x 52"}), Patience);
    QVERIFY(TestFiles::writeOver(test.logFile(), run(101, QTime(9, 0), "x") +
                                                     entry("10:00:00.000", "Trace", "x 50")));
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 8, Patience);
    Choose(Child<QComboBox>(window.get(), "Lines of context"), "No context");
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 2, Patience);
}

void tst_FilterInWindow::contextIsDimmed()
{
    const WindowTest test(run(100, QTime(9, 0), "x"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 100, Patience);
    Type(*window, "x 50");
    Click(Child<QToolButton>(window.get(), "More filters"));
    Choose(Child<QComboBox>(window.get(), "Lines of context"), "1 around");
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 3, Patience);
    LogView* view = View(*window);
    const auto darkest = [view](int row) {
        const QRect cell = view->visualRect(view->model()->index(row, 0)).adjusted(4, 0, -4, 0);
        const QImage image = view->viewport()->grab(cell).toImage();
        int least = 255;
        for (int y = 0; y < image.height(); ++y) {
            for (int x = 0; x < image.width(); ++x)
                least = std::min(least, image.pixelColor(x, y).lightness());
        }
        return least;
    };
    QTRY_VERIFY_WITH_TIMEOUT(darkest(0) > darkest(1) + 40, Patience);
    QTRY_VERIFY_WITH_TIMEOUT(darkest(2) > darkest(1) + 40, Patience);
}

void tst_FilterInWindow::clears()
{
    const WindowTest test(Fruit());
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 5, Patience);
    Click(Child<QToolButton>(window.get(), "More filters"));
    Field(*window, "Terms of lines to hide")->setFocus();
    QTest::keyClicks(QApplication::focusWidget(), "red");
    Field(*window, "Terms that lines also contain")->setFocus();
    QTest::keyClicks(QApplication::focusWidget(), "pear");
    Choose(Child<QComboBox>(window.get(), "Least severity"), "Only Fatal");
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 1, Patience);
    Choose(Child<QComboBox>(window.get(), "Lines of context"), "1 around");
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 3, Patience);
    QCOMPARE(Child<QToolButton>(window.get(), "More filters")->text(), QString("More (3)"));
    QTest::keyClick(window.get(), Qt::Key_F, Qt::ControlModifier | Qt::ShiftModifier);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 5, Patience);
    QCOMPARE(Child<QComboBox>(window.get(), "Least severity")->currentIndex(), 0);
    QCOMPARE(Child<QComboBox>(window.get(), "Lines of context")->currentIndex(), 0);
    QCOMPARE(Child<QToolButton>(window.get(), "More filters")->text(), QString("More"));
}

void tst_FilterInWindow::escapeGoesToTheTable()
{
    const WindowTest test(Fruit());
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 5, Patience);
    Type(*window, "red");
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 2, Patience);
    QTest::keyClick(Field(*window), Qt::Key_Escape);
    QVERIFY(View(*window)->hasFocus());
    QCOMPARE(Field(*window)->text(), QString("red"));
    Click(Child<QToolButton>(window.get(), "More filters"));
    for (char const* name : {"Terms that lines also contain", "Terms of lines to hide"}) {
        Field(*window, name)->setFocus();
        QTest::keyClick(Field(*window, name), Qt::Key_Escape);
        QVERIFY2(View(*window)->hasFocus(), name);
    }
}

void tst_FilterInWindow::filterByThis()
{
    const WindowTest test(Fruit());
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 5, Patience);
    QTest::mouseClick(Child<QCheckBox>(window.get(), "Regular expression"), Qt::LeftButton,
                      Qt::NoModifier, QPoint(8, 8));
    Choose(*window, 2, LogModel::MessageColumn, Qt::Key_F);
    QTRY_COMPARE_WITH_TIMEOUT(Messages(*window), QStringList({"red \"cherry\" pie"}), Patience);
    QCOMPARE(Field(*window)->text(), QString("red \"cherry\" pie"));
    Panel(*window)->ClearFilter();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 5, Patience);
    Choose(*window, 3, LogModel::TimeColumn, Qt::Key_F);
    QTRY_COMPARE_WITH_TIMEOUT(Messages(*window), QStringList({"green pear"}), Patience);
}

void tst_FilterInWindow::hideThis()
{
    const WindowTest test(Fruit());
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 5, Patience);
    Choose(*window, 1, LogModel::MessageColumn, Qt::Key_H);
    QTRY_COMPARE_WITH_TIMEOUT(
        Messages(*window), QStringList({"red apple", "red \"cherry\" pie", "green pear", "plum"}),
        Patience);
    QVERIFY(Field(*window, "Terms of lines to hide")->isVisible());
    Choose(*window, 3, LogModel::MessageColumn, Qt::Key_H);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 3, Patience);
    QCOMPARE(Field(*window, "Terms of lines to hide")->text(), QString("\"green apple\" plum"));
}

void tst_FilterInWindow::severityOfTheMenu()
{
    const WindowTest test(Fruit());
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 5, Patience);
    Choose(*window, 0, LogModel::SeverityColumn, Qt::Key_H);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 3, Patience);
    QVERIFY(!Child<QToolButton>(window.get(), "Show Trace")->isChecked());
    Choose(*window, 1, LogModel::SeverityColumn, Qt::Key_F);
    QTRY_COMPARE_WITH_TIMEOUT(Messages(*window), QStringList({"red \"cherry\" pie"}), Patience);
}

// Of the whole file, whatever the filter.
void tst_FilterInWindow::severityCounts()
{
    const WindowTest test(Fruit());
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 5, Patience);
    const auto counts = [&] {
        QStringList texts;
        for (char const* name : {"Trace", "Notification", "Warning", "Error", "Fatal", "Other"})
            texts.append(Child<QToolButton>(window.get(), QString("Show %1").arg(name))->text());
        return texts.join(' ');
    };
    QCOMPARE(counts(), QString("2 0 1 1 1 0"));
    Type(*window, "apple");
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 2, Patience);
    Click(Child<QToolButton>(window.get(), "Show Warning"));
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 1, Patience);
    QCOMPARE(counts(), QString("2 0 1 1 1 0"));
    auto* errors = Child<QToolButton>(window.get(), "Show Error");
    QVERIFY2(errors->toolTip().endsWith(": 1 in this file"), qPrintable(errors->toolTip()));
    const QRect place = errors->geometry();
    QVERIFY(TestFiles::writeOver(test.logFile(),
                                 Fruit() + entry("09:00:05.000", "Error", "x").repeated(2000)));
    QTRY_COMPARE_WITH_TIMEOUT(counts(), QString("2 0 1 2.0k 1 0"), Patience);
    QCOMPARE(errors->geometry(), place);
    QTest::keyClick(window.get(), Qt::Key_4, Qt::ControlModifier);
    QTRY_VERIFY(!errors->isChecked());
}

void tst_FilterInWindow::selectionOfTheCurrentLine()
{
    const WindowTest test(Fruit());
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 5, Patience);
    View(*window)->GoToRow(0);
    auto* line = Child<QPlainTextEdit>(window.get(), "Full text of the current line");
    line->setFocus();
    QTest::keyClick(line, Qt::Key_End);
    QTest::keyClick(line, Qt::Key_Left, Qt::ControlModifier | Qt::ShiftModifier);
    QCOMPARE(line->textCursor().selectedText(), QString("apple"));
    QContextMenuEvent event(QContextMenuEvent::Mouse, QPoint(5, 5),
                            line->viewport()->mapToGlobal(QPoint(5, 5)));
    QApplication::sendEvent(line->viewport(), &event);
    QVERIFY(QApplication::activePopupWidget());
    QTest::keyClick(QApplication::activePopupWidget(), Qt::Key_H);
    QTRY_COMPARE_WITH_TIMEOUT(Messages(*window),
                              QStringList({"red \"cherry\" pie", "green pear", "plum"}), Patience);
}

void tst_FilterInWindow::keysOfTheSecondRow()
{
    const WindowTest test(Fruit());
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 5, Patience);
    const auto type = [&](Qt::Key key, char const* text) {
        QTest::keyClick(window.get(), key, Qt::ControlModifier | Qt::ShiftModifier);
        QTest::keyClicks(QApplication::focusWidget(), text);
        QTest::keyClick(QApplication::focusWidget(), Qt::Key_Return);
    };
    type(Qt::Key_L, "apple");
    QCOMPARE(Field(*window, "Terms that lines also contain")->text(), QString("apple"));
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 2, Patience);
    type(Qt::Key_L, "e"); // over the selected text
    QTRY_VERIFY_WITH_TIMEOUT(Rows(*window) > 2, Patience);
    type(Qt::Key_K, "apple");
    QCOMPARE(Field(*window, "Terms of lines to hide")->text(), QString("apple"));
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 3, Patience);
}

// The row shows blanks for the tab and nothing for the colors.
void tst_FilterInWindow::cellWithATab()
{
    const WindowTest test(entry("09:00:00.000", "Trace", "one\ttwo \x1b[31mred\x1b[0m") + Fruit());
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 6, Patience);
    QCOMPARE(Messages(*window).first(), QString("one     two red"));
    View(*window)->GoToRow(0);
    QTest::keyClick(View(*window), Qt::Key_C, Qt::ControlModifier);
    QVERIFY(QGuiApplication::clipboard()->text().endsWith("one\ttwo \x1b[31mred\x1b[0m\n"));
    Choose(*window, 0, LogModel::MessageColumn, Qt::Key_F);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 1, Patience);
    QCOMPARE(Messages(*window), QStringList({"one     two red"}));
}

void tst_FilterInWindow::matchThatBeginsBeforeTheMessage_data()
{
    QTest::addColumn<QString>("text");
    QTest::addColumn<bool>("isExpression");
    QTest::addColumn<bool>("isPainted");

    QTest::newRow("the message") << "plum" << false << true;
    QTest::newRow("with the blank in front of it") << " plum" << false << true;
    QTest::newRow("with the severity") << "Trace plum" << false << true;
    QTest::newRow("only in another cell") << "Trace" << false << false;
    QTest::newRow("the start of the line, not of the message") << "^2025|^plum" << true << false;
}

void tst_FilterInWindow::matchThatBeginsBeforeTheMessage()
{
    QFETCH(QString, text);
    QFETCH(bool, isExpression);
    const WindowTest test(entry("09:00:00.000", "Trace", "plum"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 1, Patience);
    if (isExpression)
        ClickBox(Child<QCheckBox>(window.get(), "Regular expression"));
    Type(*window, qPrintable(text));
    QTest::keyClick(Field(*window), Qt::Key_Return);
    QTRY_VERIFY_WITH_TIMEOUT(
        View(*window)->model()->rowCount() == 1 && !Panel(*window)->model()->isReading(), Patience);
    const QRect cell =
        View(*window)->visualRect(View(*window)->model()->index(0, LogModel::MessageColumn));
    const QImage image = View(*window)->viewport()->grab(cell).toImage();
    bool isPainted = false;
    for (int x = 0; x < image.width(); ++x)
        isPainted =
            isPainted || image.pixelColor(x, image.height() / 2) == QColor(0xff, 0xe0, 0x66);
    QTEST(isPainted, "isPainted");
}

void tst_FilterInWindow::history()
{
    const WindowTest test(Fruit());
    const auto open = [](MainWindow& window) {
        QTest::keyClick(&window, Qt::Key_L, Qt::ControlModifier);
        QTest::keyClick(Field(window), Qt::Key_Down);
        return qobject_cast<QMenu*>(QApplication::activePopupWidget());
    };
    {
        const auto window = WindowTest::show();
        QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 5, Patience);
        for (int i = 0; i < 25; ++i) {
            Type(*window, qPrintable(QString("text %1").arg(i)));
            QTest::keyClick(Field(*window), Qt::Key_Return);
        }
        Type(*window, "pear & plum");
        View(*window)->setFocus(); // also counts
        Type(*window, "text 24");
        QTest::keyClick(Field(*window), Qt::Key_Return);
        QMenu* menu = open(*window);
        QVERIFY(menu);
        QCOMPARE(menu->actions().size(), 20);
        QCOMPARE(menu->actions().at(0)->text(), QString("text 24"));
        QCOMPARE(menu->actions().at(1)->text(), QString("pear && plum"));
        QCOMPARE(menu->actions().at(2)->text(), QString("text 23"));
        QTest::keyClick(menu, Qt::Key_Escape);
        window->close();
    }
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 5, Patience);
    QMenu* menu = open(*window);
    QVERIFY(menu);
    QCOMPARE(menu->actions().size(), 20);
    QTest::keyClick(menu, Qt::Key_Down);
    QTest::keyClick(menu, Qt::Key_Down);
    QTest::keyClick(menu, Qt::Key_Return);
    QCOMPARE(Field(*window)->text(), QString("pear & plum"));
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 0, Patience);
}

void tst_FilterInWindow::historyIsShared()
{
    const WindowTest test(Fruit());
    QVERIFY(TestFiles::write(test.folder() + "other.log", Fruit()));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 5, Patience);
    Type(*window, "pear");
    QTest::keyClick(Field(*window), Qt::Key_Return);
    window->OpenFile(test.folder() + "other.log");
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 5, Patience);
    Click(Child<QToolButton>(Panel(*window), "Earlier filters"));
    auto* menu = qobject_cast<QMenu*>(QApplication::activePopupWidget());
    QVERIFY(menu);
    QCOMPARE(menu->actions().size(), 1);
    QTest::keyClick(menu, Qt::Key_Down);
    QTest::keyClick(menu, Qt::Key_Return);
    QTRY_COMPARE_WITH_TIMEOUT(Messages(*window), QStringList({"green pear"}), Patience);
}

QTEST_MAIN(tst_FilterInWindow)

#include "tst_FilterInWindow.moc"
