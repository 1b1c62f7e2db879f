// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Highlight rules, driven with keys and mouse on a real screen.

#include "WindowParts.h"

#include "app/window/log/HighlightColors.h"
#include "app/window/log/HighlightDialog.h"
#include "app/window/log/HighlightRules.h"

#include <QCheckBox>
#include <QComboBox>
#include <QLabel>
#include <QLineEdit>
#include <QListWidget>
#include <QLoggingCategory>
#include <QMenu>
#include <QPlainTextEdit>
#include <QPushButton>
#include <QStatusBar>

using namespace Velocor;
using namespace WindowParts;

using DemoLog::entry;
using DemoLog::run;

namespace {

constexpr int None = -1;
constexpr int Green = 0;
constexpr int Blue = 1;
constexpr int Red = 4;

QByteArray Fruit()
{
    return entry("09:00:00.000", "Trace", "red apple") +
           entry("09:00:01.000", "Warning", "green apple") +
           entry("09:00:02.000", "Error", "red cherry") + entry("09:00:03.000", "Trace", "plum");
}

QByteArray WithRules(char const* rules)
{
    return QByteArray("<VelocorSettings><MainWindow><highlights>") + rules +
           "</highlights></MainWindow></VelocorSettings>";
}

// The rule's color behind a cell, at the end of its text.
int ColorOf(MainWindow& window, int row, int column = LogModel::MessageColumn)
{
    LogView* view = View(window);
    const QRect cell = view->visualRect(view->model()->index(row, column));
    const QImage image = view->viewport()->grab(cell).toImage();
    const QColor background = image.pixelColor(image.width() - 4, 2);
    for (int color = 0; color < HighlightColors::Count; ++color) {
        if (background == HighlightColors::Background(color, view->palette()))
            return color;
    }
    return None;
}

QVector<int> Colors(MainWindow& window)
{
    QVector<int> colors;
    for (int row = 0; row < Rows(window); ++row)
        colors.append(ColorOf(window, row));
    return colors;
}

void Press(QWidget* parent, char const* text)
{
    const QList<QPushButton*> buttons = parent->findChildren<QPushButton*>();
    for (QPushButton* button : buttons) {
        if (QString(button->text()).remove('&') == text) {
            Click(button);
            return;
        }
    }
    QFAIL(text);
}

void EditRules(MainWindow& window, std::function<void(HighlightDialog*)> const& work)
{
    bool isDone = false;
    WindowTest::whenShown<HighlightDialog>([&](HighlightDialog* dialog) {
        dialog->activateWindow(); // no window manager does it
        QVERIFY(QTest::qWaitForWindowActive(dialog));
        work(dialog);
        isDone = true;
    });
    QTest::keyClick(&window, Qt::Key_H, Qt::ControlModifier | Qt::ShiftModifier);
    QVERIFY(isDone);
}

void AddRule(QDialog* dialog, char const* text)
{
    Press(dialog, "Add");
    auto* field = Child<QLineEdit>(dialog, "Text to highlight");
    QTRY_VERIFY(field->hasFocus());
    QTest::keyClicks(field, text);
}

QString Status(MainWindow& window)
{
    return window.statusBar()->currentMessage();
}

} // namespace

class tst_HighlightInWindow : public QObject
{
    Q_OBJECT

private slots:
    void initTestCase();
    void cleanup();
    void cleanupTestCase();

    void rulesApplyAtOnce();
    void cancelTakesBack();
    void orderDecides();
    void switchedOffAndRemoved();
    void expressions();
    void keyOfADisabledButton();
    void severityStays();
    void besideHits();
    void highlightThis();
    void severityCannotBeHighlighted();
    void selectionOfTheCurrentLine();
    void sharedAndKept();
    void hostileSettings_data();
    void hostileSettings();
    void slowExpression();
};

void tst_HighlightInWindow::initTestCase()
{
    // The X11 plug-in warns when a window disappears while it is being queried, which would end up
    // in a test's log. The environment would be too late: it was read with the application object.
    QLoggingCategory::setFilterRules("qt.qpa.*=false");
}

void tst_HighlightInWindow::cleanup()
{
    const QWidgetList windows = QApplication::topLevelWidgets();
    for (QWidget* window : windows)
        window->hide();
}

// Qt frees the animation of a clear button when it ends, even if the button is gone by then.
void tst_HighlightInWindow::cleanupTestCase()
{
    QTest::qWait(300);
}

void tst_HighlightInWindow::rulesApplyAtOnce()
{
    const WindowTest test(Fruit());
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 4, Patience);
    QCOMPARE(Colors(*window), QVector<int>({None, None, None, None}));
    EditRules(*window, [&](HighlightDialog* dialog) {
        AddRule(dialog, "apple");
        QCOMPARE(Colors(*window), QVector<int>({Green, Green, None, None}));
        AddRule(dialog, "plum");
        QCOMPARE(Colors(*window), QVector<int>({Green, Green, None, Blue}));
        auto* color = Child<QComboBox>(dialog, "Color");
        color->setFocus();
        QTest::keyClick(color, Qt::Key_R);
        QCOMPARE(Colors(*window), QVector<int>({Green, Green, None, Red}));
        QTest::keyClick(dialog, Qt::Key_Enter);
    });
    QCOMPARE(Colors(*window), QVector<int>({Green, Green, None, Red}));
}

void tst_HighlightInWindow::cancelTakesBack()
{
    const WindowTest test(Fruit());
    QVERIFY(TestFiles::write(test.settingsFile(), WithRules("on blue text any plum")));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 4, Patience);
    EditRules(*window, [&](HighlightDialog* dialog) {
        AddRule(dialog, "apple");
        QCOMPARE(Colors(*window), QVector<int>({Green, Green, None, Blue}));
        QTest::keyClick(dialog, Qt::Key_Escape);
    });
    QCOMPARE(Colors(*window), QVector<int>({None, None, None, Blue}));
}

void tst_HighlightInWindow::orderDecides()
{
    const WindowTest test(Fruit());
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 4, Patience);
    EditRules(*window, [&](HighlightDialog* dialog) {
        AddRule(dialog, "red");
        AddRule(dialog, "apple");
        QCOMPARE(Colors(*window), QVector<int>({Green, Blue, Green, None}));
        Press(dialog, "Move Up");
        QCOMPARE(Colors(*window), QVector<int>({Blue, Blue, Green, None}));
        QCOMPARE(Child<QLineEdit>(dialog, "Text to highlight")->text(), QString("apple"));
        Press(dialog, "Move Down");
        QCOMPARE(Colors(*window), QVector<int>({Green, Blue, Green, None}));
        QTest::keyClick(dialog, Qt::Key_Enter);
    });
}

void tst_HighlightInWindow::switchedOffAndRemoved()
{
    const WindowTest test(Fruit());
    QVERIFY(TestFiles::write(test.settingsFile(),
                             WithRules("on blue text any plum\\u000aon green text any red")));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 4, Patience);
    EditRules(*window, [&](HighlightDialog* dialog) {
        QCOMPARE(Colors(*window), QVector<int>({Green, None, Green, Blue}));
        auto* list = Child<QListWidget>(dialog, "Highlight rules");
        list->setFocus();
        QTest::keyClick(list, Qt::Key_Space);
        QCOMPARE(Colors(*window), QVector<int>({Green, None, Green, None}));
        QTest::keyClick(list, Qt::Key_Space);
        QCOMPARE(Colors(*window), QVector<int>({Green, None, Green, Blue}));
        QTest::keyClick(list, Qt::Key_Down);
        Press(dialog, "Remove");
        QCOMPARE(Colors(*window), QVector<int>({None, None, None, Blue}));
        QCOMPARE(list->count(), 1);
        Press(dialog, "Remove");
        QCOMPARE(list->count(), 0);
        QVERIFY(!Child<QLineEdit>(dialog, "Text to highlight")->isEnabled());
        QTest::keyClick(dialog, Qt::Key_Enter);
    });
    QCOMPARE(Colors(*window), QVector<int>({None, None, None, None}));
}

void tst_HighlightInWindow::expressions()
{
    const WindowTest test(Fruit());
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 4, Patience);
    EditRules(*window, [&](HighlightDialog* dialog) {
        auto* error = Child<QLabel>(dialog, "Problem of the rule");
        AddRule(dialog, "R.D");
        QCOMPARE(Colors(*window), QVector<int>({None, None, None, None}));
        QTest::keyClick(dialog, Qt::Key_E, Qt::AltModifier);
        QTRY_COMPARE(Colors(*window), QVector<int>({Green, None, Green, None}));
        QVERIFY(!error->isVisible());
        QTest::keyClick(dialog, Qt::Key_M, Qt::AltModifier);
        QTRY_COMPARE(Colors(*window), QVector<int>({None, None, None, None}));
        Child<QLineEdit>(dialog, "Text to highlight")->setFocus();
        QTest::keyClicks(QApplication::focusWidget(), "(");
        QVERIFY(error->isVisible());
        QVERIFY2(error->text().startsWith("Invalid regular expression: "),
                 qPrintable(error->text()));
        QTest::keyClick(dialog, Qt::Key_Escape);
    });
}

// The only rule can be moved neither up nor down.
void tst_HighlightInWindow::keyOfADisabledButton()
{
    const WindowTest test(run(2, QTime(9, 0), "x"));
    const auto window = WindowTest::show();
    EditRules(*window, [](HighlightDialog* dialog) {
        AddRule(dialog, "full");
        auto* field = Child<QLineEdit>(dialog, "Text to highlight");
        QTest::keyClick(field, Qt::Key_D, Qt::AltModifier);
        QTest::keyClick(field, Qt::Key_U, Qt::AltModifier);
        QCOMPARE(field->text(), QString("full"));
        QTest::keyClick(field, Qt::Key_D);
        QCOMPARE(field->text(), QString("fulld"));
        dialog->reject();
    });
}

void tst_HighlightInWindow::severityStays()
{
    const WindowTest test(Fruit());
    QVERIFY(TestFiles::write(test.settingsFile(), WithRules("on red text any cherry")));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 4, Patience);
    QCOMPARE(ColorOf(*window, 2, LogModel::TimeColumn), Red);
    QCOMPARE(ColorOf(*window, 2, LogModel::MessageColumn), Red);
    QCOMPARE(ColorOf(*window, 2, LogModel::SeverityColumn), None);
}

// The hits of filter and find are drawn over the rule's color.
void tst_HighlightInWindow::besideHits()
{
    const WindowTest test(Fruit());
    QVERIFY(TestFiles::write(test.settingsFile(), WithRules("on blue text any apple")));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 4, Patience);
    QTest::keyClick(window.get(), Qt::Key_L, Qt::ControlModifier);
    QTest::keyClicks(QApplication::focusWidget(), "red");
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 2, Patience);
    QTest::keyClick(window.get(), Qt::Key_F, Qt::ControlModifier);
    QTest::keyClicks(QApplication::focusWidget(), "app");
    const auto pixels = [&](QRgb color) {
        LogView* view = View(*window);
        const QImage image =
            view->viewport()
                ->grab(view->visualRect(view->model()->index(0, LogModel::MessageColumn)))
                .toImage();
        int count = 0;
        for (int y = 0; y < image.height(); ++y) {
            for (int x = 0; x < image.width(); ++x)
                count += image.pixelColor(x, y) == QColor(color) ? 1 : 0;
        }
        return count;
    };
    QTRY_VERIFY(pixels(0xffffe066) > 50);
    QTRY_VERIFY(pixels(0xff74e0ef) > 50);
    QCOMPARE(ColorOf(*window, 0), Blue);
}

void tst_HighlightInWindow::highlightThis()
{
    const WindowTest test(Fruit());
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 4, Patience);
    LogView* view = View(*window);
    view->GoToRow(3);
    QContextMenuEvent byKey(QContextMenuEvent::Keyboard, QPoint(1, 1));
    QApplication::sendEvent(view->viewport(), &byKey);
    QWidget* menu = QApplication::activePopupWidget();
    QVERIFY(menu);
    QTest::keyClick(menu, Qt::Key_G);
    QCOMPARE(Status(*window), QString("Highlighted; Ctrl+Shift+H changes the rules"));
    view->GoToRow(0);
    QCOMPARE(Colors(*window).mid(1), QVector<int>({None, None, Green}));
}

void tst_HighlightInWindow::severityCannotBeHighlighted()
{
    const WindowTest test(Fruit());
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 4, Patience);
    LogView* view = View(*window);
    const QPoint at = view->visualRect(view->model()->index(1, LogModel::SeverityColumn)).center();
    QContextMenuEvent event(QContextMenuEvent::Mouse, at, view->viewport()->mapToGlobal(at));
    QApplication::sendEvent(view->viewport(), &event);
    auto* menu = qobject_cast<QMenu*>(QApplication::activePopupWidget());
    QVERIFY(menu);
    const QList<QAction*> actions = menu->actions();
    for (QAction const* action : actions)
        QCOMPARE(action->isEnabled(), ActionText(action) != "Highlight This");
    menu->close();
}

void tst_HighlightInWindow::selectionOfTheCurrentLine()
{
    const WindowTest test(Fruit());
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 4, Patience);
    View(*window)->GoToRow(3);
    auto* line = Child<QPlainTextEdit>(window.get(), "Full text of the current line");
    line->moveCursor(QTextCursor::End);
    line->moveCursor(QTextCursor::PreviousWord, QTextCursor::KeepAnchor);
    QCOMPARE(line->textCursor().selectedText(), QString("plum"));
    QContextMenuEvent event(QContextMenuEvent::Keyboard, QPoint(1, 1));
    QApplication::sendEvent(line, &event);
    QWidget* menu = QApplication::activePopupWidget();
    QVERIFY(menu);
    QTest::keyClick(menu, Qt::Key_G);
    View(*window)->GoToRow(0);
    QCOMPARE(ColorOf(*window, 3), Green);
}

void tst_HighlightInWindow::sharedAndKept()
{
    const WindowTest test(Fruit());
    const QString other = test.folder() + "other.log";
    QVERIFY(TestFiles::write(other, entry("09:00:00.000", "Trace", "apple pie")));
    {
        const auto window = WindowTest::show();
        QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 4, Patience);
        EditRules(*window, [&](HighlightDialog* dialog) {
            AddRule(dialog, "apple");
            QTest::keyClick(dialog, Qt::Key_Enter);
        });
        QCOMPARE(ColorOf(*window, 0), Green);
        window->OpenFile(other);
        QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 1, Patience);
        QCOMPARE(ColorOf(*window, 0), Green);
        QVERIFY(window->close());
    }
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 1, Patience);
    QCOMPARE(ColorOf(*window, 0), Green);
}

void tst_HighlightInWindow::hostileSettings_data()
{
    QTest::addColumn<QByteArray>("rules");
    QTest::newRow("garbage") << QByteArray(100000, 'x');
    QTest::newRow("lines of garbage") << QByteArray("on red\\u000a").repeated(20000);
    QTest::newRow("many rules") << QByteArray("on red text any apple\\u000a").repeated(20000);
    QTest::newRow("many slow rules")
        << QByteArray("on red expression any \\u0028[a-z ]+\\u0029+[0-9]\\u0024\\u000a")
               .repeated(20000);
    QTest::newRow("broken escapes") << QByteArray("on red text any \\u00");
}

void tst_HighlightInWindow::hostileSettings()
{
    QFETCH(QByteArray, rules);
    const WindowTest test(run(40, QTime(9, 0), QByteArray(3000, 'a')));
    QVERIFY(TestFiles::write(test.settingsFile(), WithRules(rules)));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 40, Patience);
    View(*window)->viewport()->grab();
    QVERIFY(window->findChild<FileTabs*>()->highlightRules()->rules().size() <=
            HighlightRules::MaximumRules);
}

void tst_HighlightInWindow::slowExpression()
{
    const WindowTest test(run(40, QTime(9, 0), QByteArray(3000, 'a') + '-'));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 40, Patience);
    EditRules(*window, [&](HighlightDialog* dialog) {
        AddRule(dialog, "(a+)+[b-z]$");
        QTest::keyClick(dialog, Qt::Key_E, Qt::AltModifier);
        QTRY_VERIFY(Child<QCheckBox>(dialog, "Regular expression")->isChecked());
        QTest::keyClick(dialog, Qt::Key_Enter);
    });
    QTRY_COMPARE(Status(*window),
                 QString("The highlight rule \"(a+)+[b-z]$\" takes too long and is not applied"));
}

QTEST_MAIN(tst_HighlightInWindow)

#include "tst_HighlightInWindow.moc"
