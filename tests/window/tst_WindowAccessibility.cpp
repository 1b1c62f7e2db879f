// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The window on a real screen, driven with keys and mouse.

#include "WindowParts.h"
#include "WindowTestCase.h"

#include "app/UserMessages.h"
#include "app/window/ProblemReportDialog.h"
#include "app/window/ReportDialog.h"
#include "app/window/log/GoToDialog.h"
#include "app/window/log/HighlightDialog.h"
#include "app/window/log/LogSettingsDialog.h"
#include "app/window/log/NoteDialog.h"
#include "app/window/settings/DifferenceDialog.h"
#include "app/window/settings/FileListDialog.h"
#include "app/window/settings/LineDialog.h"
#include "app/window/settings/SavedStatesDialog.h"
#include "app/window/settings/SizeDialog.h"
#include "app/window/settings/ValueDialog.h"
#include "app/window/settings/WindowPlaceDialog.h"

#include <QAbstractButton>
#include <QComboBox>
#include <QLabel>
#include <QLineEdit>
#include <QMenuBar>
#include <QMessageBox>
#include <QScreen>
#include <QSpinBox>

using namespace Velocor;
using namespace WindowParts;

using DemoLog::run;

namespace {

// What a screen reader could announce for a widget.
bool HasName(QWidget const* widget)
{
    if (!widget->accessibleName().isEmpty() || !widget->windowTitle().isEmpty())
        return true;
    if (auto const* button = qobject_cast<QAbstractButton const*>(widget))
        return !button->text().isEmpty();
    if (auto const* label = qobject_cast<QLabel const*>(widget))
        return !label->text().isEmpty();
    const QList<QLabel*> labels = widget->window()->findChildren<QLabel*>();
    return std::any_of(labels.begin(), labels.end(),
                       [&](QLabel const* label) { return label->buddy() == widget; });
}

// Parts that a widget creates and is accessible for.
bool IsInnerPart(QWidget const* widget)
{
    const QString name = widget->objectName();
    if (name.startsWith("qt_"))
        return true;
    QWidget const* parent = widget->parentWidget();
    return qobject_cast<QComboBox const*>(parent) || qobject_cast<QSpinBox const*>(parent) ||
           qobject_cast<QLineEdit const*>(parent) || qobject_cast<QMenuBar const*>(parent) ||
           (parent && parent->inherits("QTabBar") && name.isEmpty() &&
            widget->accessibleName().isEmpty());
}

QStringList NamelessControls(QWidget* window)
{
    QStringList nameless;
    const QList<QWidget*> all = window->findChildren<QWidget*>();
    for (QWidget const* widget : all) {
        const bool isControl = widget->focusPolicy() != Qt::NoFocus ||
                               qobject_cast<QAbstractButton const*>(widget) ||
                               qobject_cast<QLabel const*>(widget);
        if (widget->window() == window && isControl && !IsInnerPart(widget) && !HasName(widget))
            nameless.append(QString("%1 \"%2\" in %3")
                                .arg(widget->metaObject()->className(), widget->objectName(),
                                     widget->parentWidget()->metaObject()->className()));
    }
    return nameless;
}

} // namespace

class tst_WindowAccessibility : public WindowTestCase
{
    Q_OBJECT

private slots:
    void messageBoxesAreSelectable();

    void names();
    void namesInDialogs();
    void tableTellsWhatIsShown();
    void shortcuts();
    void menusByKeyboard();
    void tabOrder();
};

void tst_WindowAccessibility::messageBoxesAreSelectable()
{
    const WindowTest test;
    const auto window = WindowTest::show();
    Qt::TextInteractionFlags flags;
    WindowTest::whenShown<QMessageBox>([&](QMessageBox* box) {
        flags = box->textInteractionFlags();
        QTest::keyClick(box, Qt::Key_Escape);
    });
    CriticalMessage(window.get(), "text", true);
    QVERIFY(flags & Qt::TextSelectableByMouse);
    QVERIFY(flags & Qt::TextSelectableByKeyboard);
}

void tst_WindowAccessibility::names()
{
    const WindowTest test(run(5, QTime(9, 0), "x"));
    QVERIFY(TestFiles::write(test.folder() + "some.cfg", Settings));
    QVERIFY(TestFiles::write(test.folder() + "broken.cfg", "<a"));
    const auto window = WindowTest::show();
    QTest::keyClick(window.get(), Qt::Key_F9);
    window->OpenFile(test.folder() + "some.cfg");
    window->OpenFile(test.folder() + "broken.cfg");
    const QStringList nameless = NamelessControls(window.get());
    QVERIFY2(nameless.isEmpty(), qPrintable(nameless.join("; ")));
}

void tst_WindowAccessibility::namesInDialogs()
{
    const WindowTest test;
    LogSettingsDialog settings;
    QCOMPARE(NamelessControls(&settings), QStringList());
    ReportDialog text("Title", "Heading", "Text");
    QCOMPARE(NamelessControls(&text), QStringList());
    ProblemReportDialog report({{"Part", "Text", {}}}, Redactor());
    QCOMPARE(NamelessControls(&report), QStringList());
    GoToDialog goTo(10, true, nullptr);
    QCOMPARE(NamelessControls(&goTo), QStringList());
    NoteDialog note("text", nullptr);
    QCOMPARE(NamelessControls(&note), QStringList());
    DifferenceDialog differences("Title", nullptr);
    differences.SetSides({"Left", SettingsDocument(), "a"}, {"Right", SettingsDocument(), "b"});
    differences.AllowTakeOver();
    QCOMPARE(NamelessControls(&differences), QStringList());
    SavedStatesDialog states(SavedStates(), test.folder() + "some.cfg", true);
    QCOMPARE(NamelessControls(&states), QStringList());
    SizeDialog size("name", QSize(1, 2));
    QCOMPARE(NamelessControls(&size), QStringList());
    LineDialog line(1, 10);
    QCOMPARE(NamelessControls(&line), QStringList());
    ValueDialog value("name", "a\nb");
    QCOMPARE(NamelessControls(&value), QStringList());
    WindowPlaceDialog place("name", QPoint(1, 2), QSize(3, 4));
    QCOMPARE(NamelessControls(&place), QStringList());
    FileListDialog files("name", {"a", "b"});
    QCOMPARE(NamelessControls(&files), QStringList());
    HighlightDialog highlights(std::make_shared<HighlightRules>(), nullptr);
    QCOMPARE(NamelessControls(&highlights), QStringList());
}

void tst_WindowAccessibility::tableTellsWhatIsShown()
{
    const WindowTest test(run(5, QTime(9, 0), "x"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 5, Patience);
    QTRY_VERIFY_WITH_TIMEOUT(View(*window)->accessibleDescription().startsWith("5 lines"),
                             Patience);
    auto* filter = Child<QLineEdit>(window.get(), "Filter by text");
    filter->setText("x 3");
    QTRY_VERIFY_WITH_TIMEOUT(View(*window)->accessibleDescription().startsWith("1 of 5 lines"),
                             Patience);
    filter->setText("y");
    QTRY_VERIFY_WITH_TIMEOUT(View(*window)->accessibleDescription().startsWith("No lines match"),
                             Patience);
}

// Every action that does something has a shortcut and a status tip, and no two share one. One of
// several to choose from needs no shortcut: its menu is enough.
void tst_WindowAccessibility::shortcuts()
{
    const WindowTest test;
    const auto window = WindowTest::show();
    QMap<QString, QString> taken;
    const QList<QMenu*> menus = window->menuBar()->findChildren<QMenu*>();
    QVERIFY(menus.size() >= 5);
    for (QMenu const* menu : menus) {
        const QList<QAction*> actions = menu->actions();
        for (QAction const* action : actions) {
            if (action->isSeparator() || action->menu())
                continue;
            const QString shortcut = action->shortcut().toString();
            if (action->actionGroup() && shortcut.isEmpty()) {
                QVERIFY2(!action->statusTip().isEmpty(), qPrintable(action->text()));
                continue;
            }
            QVERIFY2(!shortcut.isEmpty(), qPrintable(action->text()));
            QVERIFY2(!taken.contains(shortcut), qPrintable(action->text() + taken.value(shortcut)));
            QVERIFY2(!action->statusTip().isEmpty(), qPrintable(action->text()));
            taken.insert(shortcut, action->text());
        }
    }
}

// Within each menu, every entry has a unique mnemonic.
void tst_WindowAccessibility::menusByKeyboard()
{
    const WindowTest test;
    const auto window = WindowTest::show();
    QList<QList<QAction*>> levels{window->menuBar()->actions()};
    for (QAction const* top : window->menuBar()->actions()) {
        levels.append(top->menu()->actions());
        for (QAction const* action : top->menu()->actions()) {
            if (action->text() == "En&coding" || action->text() == "Anal&yze")
                levels.append(action->menu()->actions());
        }
    }
    for (QList<QAction*> const& level : levels) {
        QString letters;
        for (QAction const* action : level) {
            if (action->isSeparator())
                continue;
            const int mark = action->text().indexOf('&');
            QVERIFY2(mark >= 0, qPrintable(action->text()));
            const QChar letter = action->text().at(mark + 1).toLower();
            QVERIFY2(!letters.contains(letter), qPrintable(action->text()));
            letters.append(letter);
        }
    }
}

// The Tab key reaches every control of the log once before it returns to the first.
void tst_WindowAccessibility::tabOrder()
{
    const WindowTest test(run(5, QTime(9, 0), "x"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 5, Patience);
    QTest::keyClick(window.get(), Qt::Key_F9);
    Child<QComboBox>(window.get(), "Log file")->setFocus();
    QStringList order;
    for (int i = 0; i < 60 && (order.isEmpty() ||
                               QApplication::focusWidget()->accessibleName() != order.first());
         ++i) {
        QWidget const* widget = QApplication::focusWidget();
        auto const* button = qobject_cast<QAbstractButton const*>(widget);
        order.append(widget->accessibleName().isEmpty() && button ? button->text()
                                                                  : widget->accessibleName());
        QTest::keyClick(QApplication::focusWidget(), Qt::Key_Tab);
    }
    QCOMPARE(
        QStringList(order.mid(0, 9)),
        QStringList({"Log file", "Filter by text", "Match case", "Regular expression", "Show Trace",
                     "Show Notification", "Show Warning", "Show Error", "Show Fatal"}));
    QVERIFY(order.contains("Log entries"));
    QVERIFY(order.contains("Full text of the current line"));
    QVERIFY(order.contains("Copy: Organization"));
    QVERIFY2(order.size() < 60, qPrintable(order.join("; ")));
}

QTEST_MAIN(tst_WindowAccessibility)

#include "tst_WindowAccessibility.moc"
