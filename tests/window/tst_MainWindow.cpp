// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The window on a real screen, driven with keys and mouse.

#include "WindowTest.h"

#include "app/UserMessages.h"
#include "app/window/FileTabs.h"
#include "app/window/PlacesPanel.h"
#include "app/window/ReportDialog.h"
#include "app/window/log/LogFilterBar.h"
#include "app/window/log/LogModel.h"
#include "app/window/log/LogPanel.h"
#include "app/window/log/LogSettingsDialog.h"
#include "app/window/log/LogView.h"
#include "app/window/settings/SettingsEditor.h"
#include "app/window/widgets/NoticeBar.h"

#include <QAbstractButton>
#include <QCheckBox>
#include <QClipboard>
#include <QComboBox>
#include <QDialogButtonBox>
#include <QDropEvent>
#include <QFileDialog>
#include <QHeaderView>
#include <QLabel>
#include <QLineEdit>
#include <QLoggingCategory>
#include <QMenuBar>
#include <QMessageBox>
#include <QMimeData>
#include <QPlainTextEdit>
#include <QPushButton>
#include <QScreen>
#include <QScrollBar>
#include <QSpinBox>
#include <QSplitter>
#include <QStatusBar>
#include <QToolButton>
#include <QTreeWidget>

using namespace Velocor;

using DemoLog::entry;
using DemoLog::run;
using DemoLog::writtenOver;

namespace {

constexpr int Patience = 20000; // milliseconds

QByteArray const Settings("<VelocorSettings>\n<Editor>\n<font>Serif</font>\n<wrap>yes</wrap>\n"
                          "</Editor>\n</VelocorSettings>\n");

template <class Widget>
Widget* Child(QWidget* parent, QString const& accessibleName)
{
    const QList<Widget*> all = parent->findChildren<Widget*>();
    for (Widget* widget : all) {
        if (widget->accessibleName() == accessibleName)
            return widget;
    }
    qWarning("no %s", qPrintable(accessibleName));
    return nullptr;
}

LogPanel* Panel(MainWindow& window)
{
    return window.findChild<FileTabs*>()->currentLog();
}

LogView* View(MainWindow& window)
{
    return Panel(window)->view();
}

int Rows(MainWindow& window)
{
    return Panel(window)->model()->rowCount();
}

// The text in one of the places, in the way that assistive technology finds it.
QString Place(MainWindow& window, QString const& name)
{
    auto const* field = Child<QLineEdit>(&window, name);
    return field ? field->text() : QString();
}

QPoint RowCentre(LogView* view, int row)
{
    return view->visualRect(view->model()->index(row, LogModel::MessageColumn)).center();
}

void Click(QWidget* widget)
{
    QTest::mouseClick(widget, Qt::LeftButton, Qt::NoModifier, widget->rect().center());
}

// Choice boxes react to the box, not to all of the widget's area.
void ClickBox(QCheckBox* box)
{
    QTest::mouseClick(box, Qt::LeftButton, Qt::NoModifier, QPoint(8, box->height() / 2));
}

QString ActionText(QAction const* action)
{
    return QString(action->text()).remove('&');
}

QAction* Action(MainWindow& window, QString const& text)
{
    const QList<QAction*> all = window.findChildren<QAction*>();
    for (QAction* action : all) {
        if (ActionText(action) == text)
            return action;
    }
    return nullptr;
}

// What a screen reader could say of a widget.
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

// Parts that a widget makes for itself and speaks for.
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

class tst_MainWindow : public QObject
{
    Q_OBJECT

private slots:
    void initTestCase();
    void cleanup();

    void fitsTheScreen();
    void identityAndPlaces();
    void copiesAPlace();
    void logsNothingItself();
    void showsTheLog();
    void followsTheLog();
    void followsUntilScrolled();
    void filterByText();
    void filterByExpression();
    void filterBySeverity();
    void pauses();
    void copiesLines();
    void copiesFromTheMenu();
    void opensNoFolder();
    void problems();
    void currentLine();
    void olderFiles();
    void earlierRuns();
    void keepsItsPlace();

    void opensFiles();
    void openDialog();
    void opensBySettings();
    void recentFiles();
    void forgetsMissingFile();
    void dropsFiles();

    void editsSettings();
    void losesKnowingly_data();
    void losesKnowingly();
    void brokenSettings();
    void saveFails();
    void changedMeanwhile();
    void askedBeforeClosing_data();
    void askedBeforeClosing();

    void closesWhileEditing();

    void logSettings();
    void logSettingsRefused();
    void about();
    void saveReport();
    void messageBoxesAreSelectable();

    void keepsItsState();
    void damagedState();
    void logSwitchedOff();

    void names();
    void namesInDialogs();
    void shortcuts();
    void menusByKeyboard();
    void tabOrder();
};

void tst_MainWindow::initTestCase()
{
    // Where a window goes while the X11 plugin asks about it, that warns, over a test's log. The
    // environment would come too late for it: it was read with the application object.
    QLoggingCategory::setFilterRules("qt.qpa.*=false");
}

void tst_MainWindow::cleanup()
{
    const QWidgetList windows = QApplication::topLevelWidgets();
    for (QWidget* window : windows)
        window->hide();
    QGuiApplication::clipboard()->clear();
}

void tst_MainWindow::fitsTheScreen()
{
    const WindowTest test(run(100, QTime(9, 0), "x"));
    const auto window = WindowTest::show();
    const QRect screen = QGuiApplication::primaryScreen()->availableGeometry();
    QVERIFY(window->width() <= screen.width());
    QVERIFY(window->height() <= screen.height());
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 100, Patience);
    // All of the log's controls are to be seen, and so are some lines.
    const QList<QWidget*> all = Panel(*window)->findChildren<QWidget*>();
    for (QWidget* widget : all) {
        if (widget->isVisible() && qobject_cast<QAbstractButton*>(widget))
            QVERIFY2(window->rect().contains(
                         QRect(widget->mapTo(window.get(), QPoint()), widget->size())),
                     qPrintable(widget->accessibleName()));
    }
    QVERIFY(View(*window)->viewport()->height() > 5 * View(*window)->rowHeight(0));
}

void tst_MainWindow::identityAndPlaces()
{
    const WindowTest test;
    const auto window = WindowTest::show();
    QCOMPARE(window->windowTitle(), QString("Caption"));
    QCOMPARE(Place(*window, "Organization"), QString("Org"));
    QCOMPARE(Place(*window, "Product"), QString("Product"));
    QCOMPARE(Place(*window, "Installation"), test.folder() + "root/");
    QCOMPARE(Place(*window, "Data"), test.folder() + "data/");
    QCOMPARE(Place(*window, "Documents"), test.folder() + "documents/");
    QCOMPARE(Place(*window, "Log file"), test.logFile());
    QCOMPARE(Place(*window, "Settings file"), test.settingsFile());

    QTest::keyClick(window.get(), Qt::Key_F9);
    QVERIFY(!window->findChild<PlacesPanel*>()->isVisible());
    QTest::keyClick(window.get(), Qt::Key_F9);
    QVERIFY(window->findChild<PlacesPanel*>()->isVisible());
}

void tst_MainWindow::copiesAPlace()
{
    const WindowTest test;
    const auto window = WindowTest::show();
    Click(Child<QToolButton>(window.get(), "Copy: Log file"));
    QCOMPARE(QGuiApplication::clipboard()->text(), test.logFile());
    QCOMPARE(window->statusBar()->currentMessage(), QString("Copied: Log file"));
    QVERIFY(Child<QToolButton>(window.get(), "Open: Data"));
    QVERIFY(!PlacesPanel::OpenPlace(test.folder() + "nowhere/at/all"));
    QVERIFY(!PlacesPanel::OpenPlace(QString()));
}

void tst_MainWindow::logsNothingItself()
{
    const WindowTest test;
    {
        const auto window = WindowTest::show();
        QTest::qWait(1000);
        window->close();
    }
    QVERIFY2(!QFile::exists(test.logFile()), TestFiles::read(test.logFile()));
    QVERIFY(QFile::exists(test.settingsFile()));
}

void tst_MainWindow::showsTheLog()
{
    const WindowTest test(
        writtenOver(run(9, QTime(17, 0), "older", true), run(4, QTime(9, 0), "newer")));
    const auto window = WindowTest::show();
    QTRY_VERIFY_WITH_TIMEOUT(Rows(*window) > 4, Patience);
    LogModel* model = Panel(*window)->model();
    QCOMPARE(model->index(0, 0).data().toString(), QString("Earlier"));
    QCOMPARE(model->index(model->rowCount() - 5, 0).data().toString(), QString("This run"));
    QCOMPARE(model->index(model->rowCount() - 1, 3).data().toString(), QString("newer 3"));
    QCOMPARE(View(*window)->columnSpan(0, 0), int(LogModel::ColumnCount));
    QVERIFY(View(*window)->isColumnHidden(LogModel::ElapsedColumn));
}

void tst_MainWindow::followsTheLog()
{
    const WindowTest test(run(200, QTime(9, 0), "x"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 200, Patience);
    LogView* view = View(*window);
    QTRY_COMPARE(view->verticalScrollBar()->value(), view->verticalScrollBar()->maximum());
    QVERIFY(TestFiles::write(test.logFile(), run(300, QTime(9, 0), "x")));
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 300, Patience);
    QCOMPARE(view->verticalScrollBar()->value(), view->verticalScrollBar()->maximum());
    QVERIFY(view->visualRect(view->model()->index(299, 0)).isValid());
}

void tst_MainWindow::followsUntilScrolled()
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
    QVERIFY(TestFiles::write(test.logFile(), run(300, QTime(9, 0), "x")));
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 300, Patience);
    QCOMPARE(view->verticalScrollBar()->value(), place);

    QTest::keyClick(view, Qt::Key_End, Qt::ControlModifier);
    QVERIFY(Panel(*window)->isFollowing());
    QTest::keyClick(view, Qt::Key_Home, Qt::ControlModifier);
    QTest::keyClick(window.get(), Qt::Key_N, Qt::ControlModifier | Qt::ShiftModifier);
    QVERIFY(Panel(*window)->isFollowing());
    QCOMPARE(view->verticalScrollBar()->value(), view->verticalScrollBar()->maximum());
}

void tst_MainWindow::filterByText()
{
    const WindowTest test(run(30, QTime(9, 0), "Entry"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 30, Patience);
    QTest::keyClick(window.get(), Qt::Key_F, Qt::ControlModifier);
    QVERIFY(Child<QLineEdit>(window.get(), "Filter by text")->hasFocus());
    QTest::keyClicks(QApplication::focusWidget(), "entry 2");
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 11, Patience);
    auto const* summary = Child<QLabel>(window.get(), "Lines shown");
    QTRY_VERIFY2(summary->text().startsWith("11 of 30 lines"), qPrintable(summary->text()));

    ClickBox(Child<QCheckBox>(window.get(), "Match case"));
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 0, Patience);
    QTest::keyClick(window.get(), Qt::Key_F, Qt::ControlModifier | Qt::ShiftModifier);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 30, Patience);

    // Marks are drawn in a colour that is nowhere else.
    QTest::keyClick(window.get(), Qt::Key_F, Qt::ControlModifier);
    QTest::keyClicks(QApplication::focusWidget(), "Entry 7");
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 1, Patience);
    LogView* view = View(*window);
    const auto yellowPixels = [&] {
        const QImage image = view->viewport()->grab().toImage();
        int count = 0;
        for (int y = 0; y < image.height(); ++y) {
            for (int x = 0; x < image.width(); ++x)
                count += image.pixelColor(x, y) == QColor(0xff, 0xe0, 0x66) ? 1 : 0;
        }
        return count;
    };
    QTRY_VERIFY_WITH_TIMEOUT(yellowPixels() > 50, Patience);
    Panel(*window)->ClearFilter();
    QTRY_COMPARE_WITH_TIMEOUT(yellowPixels(), 0, Patience);
}

void tst_MainWindow::filterByExpression()
{
    const WindowTest test(run(30, QTime(9, 0), "x"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 30, Patience);
    ClickBox(Child<QCheckBox>(window.get(), "Regular expression"));
    QTest::keyClick(window.get(), Qt::Key_F, Qt::ControlModifier);
    QTest::keyClicks(QApplication::focusWidget(), "x (3|4)$");
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 2, Patience);

    auto const* error = Child<QLabel>(window.get(), "Error in the filter");
    QVERIFY(!error->isVisible());
    QTest::keyClicks(QApplication::focusWidget(), "(");
    QTRY_VERIFY(error->isVisible());
    QVERIFY2(error->text().contains("at character"), qPrintable(error->text()));
    QCOMPARE(Rows(*window), 2);
    QTest::keyClick(QApplication::focusWidget(), Qt::Key_Backspace);
    QTRY_VERIFY(!error->isVisible());
}

void tst_MainWindow::filterBySeverity()
{
    const WindowTest test(entry("09:00:00.000", "Trace", "a") +
                          entry("09:00:01.000", "Error", "b"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 2, Patience);
    Click(Child<QToolButton>(window.get(), "Show Trace"));
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 1, Patience);
    QTest::keyClick(window.get(), Qt::Key_4, Qt::ControlModifier);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 0, Patience);
    QTest::keyClick(window.get(), Qt::Key_1, Qt::ControlModifier);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 1, Patience);
}

void tst_MainWindow::pauses()
{
    const WindowTest test(run(2, QTime(9, 0), "x"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 2, Patience);
    QTest::keyClick(window.get(), Qt::Key_P, Qt::ControlModifier | Qt::ShiftModifier);
    QVERIFY(Child<QLabel>(window.get(), "Lines shown")->text().endsWith("paused"));
    QVERIFY(TestFiles::write(test.logFile(), run(5, QTime(9, 0), "x")));
    QTest::qWait(4 * LogModel::PollInterval);
    QCOMPARE(Rows(*window), 2);
    QTest::keyClick(window.get(), Qt::Key_P, Qt::ControlModifier | Qt::ShiftModifier);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 5, Patience);
}

void tst_MainWindow::copiesLines()
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
    QCOMPARE(window->statusBar()->currentMessage(), QString("20 line(s) copied"));
}

// From the menu too, a text field in focus is meant before the log is.
void tst_MainWindow::copiesFromTheMenu()
{
    const QByteArray log = run(3, QTime(9, 0), "x");
    const WindowTest test(log);
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 3, Patience);
    View(*window)->clearSelection();
    window->setFocus();
    Action(*window, "Copy")->trigger();
    QCOMPARE(window->statusBar()->currentMessage(), QString("No line is selected"));
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

void tst_MainWindow::opensNoFolder()
{
    const WindowTest test;
    const auto window = WindowTest::show();
    window->OpenFile(test.folder() + "documents");
    QCOMPARE(window->statusBar()->currentMessage(), test.folder() + "documents is a folder");
}

void tst_MainWindow::problems()
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
    QCOMPARE(View(*window)->currentIndex().row(), 3);
    QCOMPARE(window->statusBar()->currentMessage(), QString("No further warning or error below"));
    QTest::keyClick(window.get(), Qt::Key_F8, Qt::ShiftModifier);
    QCOMPARE(View(*window)->currentIndex().row(), 1);
    QTest::keyClick(window.get(), Qt::Key_F8, Qt::ShiftModifier);
    QCOMPARE(window->statusBar()->currentMessage(), QString("No further warning or error above"));
}

void tst_MainWindow::currentLine()
{
    const QString text(3000, 'y');
    const WindowTest test(entry("09:00:00.000", "Trace", text + " end"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 1, Patience);
    QTest::mouseClick(View(*window)->viewport(), Qt::LeftButton, Qt::NoModifier,
                      RowCentre(View(*window), 0));
    auto const* line = Child<QPlainTextEdit>(window.get(), "The current line in full");
    QVERIFY(line->toPlainText().endsWith("yyy end"));
}

void tst_MainWindow::olderFiles()
{
    const WindowTest test(run(2, QTime(9, 0), "x"));
    QVERIFY(TestFiles::write(test.logFile() + ".1", run(7, QTime(8, 0), "one")));
    QVERIFY(TestFiles::write(test.logFile() + ".2", run(9, QTime(7, 0), "two")));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 2, Patience);
    auto* files = Child<QComboBox>(window.get(), "Log file");
    QVERIFY(files);
    files->showPopup();
    QCOMPARE(files->count(), 3);
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

void tst_MainWindow::earlierRuns()
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

// The newest run writes over the first rows of the earlier part; the rows in view and the selection
// stay what they are.
void tst_MainWindow::keepsItsPlace()
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
        return QStringList({view->model()->index(view->rowAt(0), 3).data().toString(),
                            view->model()->index(view->currentIndex().row(), 3).data().toString(),
                            view->model()
                                ->index(view->selectionModel()->selectedRows().value(0).row(), 3)
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
    QTRY_COMPARE_WITH_TIMEOUT(view->model()->index(Rows(*window) - 1, 3).data().toString(),
                              QString("newer 99"), Patience);
    QCOMPARE(texts(), before);
}

void tst_MainWindow::opensFiles()
{
    const WindowTest test(run(2, QTime(9, 0), "x"));
    const QString log = test.folder() + "other.log";
    const QString settings = test.folder() + "some.cfg";
    QVERIFY(TestFiles::write(log, run(5, QTime(9, 0), "y")));
    QVERIFY(TestFiles::write(settings, Settings));
    const auto window = WindowTest::show();
    auto* tabs = window->findChild<FileTabs*>();
    window->OpenFile(log);
    QCOMPARE(tabs->count(), 2);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 5, Patience);
    window->OpenFile(settings);
    QCOMPARE(tabs->count(), 3);
    QVERIFY(tabs->currentEditor());
    QVERIFY(!Action(*window, "Pause")->isEnabled());
    window->OpenFile(log);
    QCOMPARE(tabs->count(), 3);
    QCOMPARE(tabs->currentIndex(), 1);
    QTest::keyClick(window.get(), Qt::Key_W, Qt::ControlModifier);
    QCOMPARE(tabs->count(), 2);
    tabs->setCurrentIndex(1);
    Click(Child<QToolButton>(tabs, "Close some.cfg"));
    QCOMPARE(tabs->count(), 1);
    QVERIFY(!Action(*window, "Close Tab")->isEnabled());
    tabs->CloseCurrent();
    QCOMPARE(tabs->count(), 1);
}

void tst_MainWindow::openDialog()
{
    const WindowTest test;
    const QString settings = test.folder() + "data/some.cfg";
    QVERIFY(TestFiles::write(settings, Settings));
    const auto window = WindowTest::show();
    WindowTest::whenShown<QFileDialog>([&](QFileDialog* dialog) {
        auto* name = dialog->findChild<QLineEdit*>("fileNameEdit");
        name->setText(settings);
        QTest::keyClick(name, Qt::Key_Return);
    });
    QTest::keyClick(window.get(), Qt::Key_O, Qt::ControlModifier);
    QVERIFY(window->findChild<FileTabs*>()->currentEditor());
}

void tst_MainWindow::opensBySettings()
{
    const QTemporaryDir folder;
    const auto isSettings = [&](QByteArray const& content) {
        TestFiles::write(folder.filePath("x"), content);
        return FileTabs::IsSettingsFile(folder.filePath("x"));
    };
    QVERIFY(isSettings("<a/>"));
    QVERIFY(isSettings("\n \t<a/>"));
    QVERIFY(isSettings("\xEF\xBB\xBF<a/>"));
    QVERIFY(!isSettings(""));
    QVERIFY(!isSettings("2025-03-03 <a/>"));
    QVERIFY(!FileTabs::IsSettingsFile(folder.filePath("none")));
}

void tst_MainWindow::recentFiles()
{
    const WindowTest test;
    const QString first = test.folder() + "first.log";
    const QString second = test.folder() + QString::fromUtf8("K\xC3\xB6ln \xE2\x82\xAC.log");
    QVERIFY(TestFiles::write(first, run(3, QTime(9, 0), "y")));
    QVERIFY(TestFiles::write(second, run(3, QTime(9, 0), "y")));
    {
        const auto window = WindowTest::show();
        QVERIFY(!Action(*window, "Open Recent")->isEnabled());
        window->OpenFile(first);
        window->OpenFile(second);
        window->close();
    }
    const auto window = WindowTest::show();
    QMenu* menu = Action(*window, "Open Recent")->menu();
    QVERIFY(menu->isEnabled());
    QCOMPARE(menu->actions().at(0)->toolTip(), second);
    QCOMPARE(menu->actions().at(1)->toolTip(), first);
    menu->actions().at(1)->trigger();
    QCOMPARE(Panel(*window)->path(), first);
    QCOMPARE(menu->actions().at(0)->toolTip(), first);
}

void tst_MainWindow::forgetsMissingFile()
{
    const WindowTest test;
    const QString file = test.folder() + "first.log";
    QVERIFY(TestFiles::write(file, run(3, QTime(9, 0), "y")));
    const auto window = WindowTest::show();
    window->OpenFile(file);
    window->findChild<FileTabs*>()->CloseCurrent();
    QVERIFY(QFile::remove(file));
    QMenu* menu = Action(*window, "Open Recent")->menu();
    for (QMessageBox::StandardButton answer : {QMessageBox::No, QMessageBox::Yes}) {
        QVERIFY(menu->isEnabled());
        WindowTest::whenShown<QMessageBox>([&](QMessageBox* box) {
            QVERIFY(box->text().contains(file));
            Click(box->button(answer));
        });
        menu->actions().first()->trigger();
    }
    QVERIFY(!menu->isEnabled());
    QCOMPARE(window->findChild<FileTabs*>()->count(), 1);
    window->OpenFile(test.folder() + "never there");
    QVERIFY(window->statusBar()->currentMessage().startsWith("There is no file"));
}

void tst_MainWindow::dropsFiles()
{
    const WindowTest test;
    const QString log = test.folder() + "other.log";
    const QString settings = test.folder() + "some.cfg";
    QVERIFY(TestFiles::write(log, run(5, QTime(9, 0), "y")));
    QVERIFY(TestFiles::write(settings, Settings));
    const auto window = WindowTest::show();
    QMimeData files;
    files.setUrls(
        {QUrl::fromLocalFile(log), QUrl("http://example.org/x"), QUrl::fromLocalFile(settings)});
    QDragEnterEvent enter(QPoint(50, 50), Qt::CopyAction, &files, Qt::LeftButton, Qt::NoModifier);
    QVERIFY(QCoreApplication::sendEvent(window.get(), &enter) && enter.isAccepted());
    QDropEvent drop(QPoint(50, 50), Qt::CopyAction, &files, Qt::LeftButton, Qt::NoModifier);
    QCoreApplication::sendEvent(window.get(), &drop);
    QCOMPARE(window->findChild<FileTabs*>()->count(), 3);

    QMimeData text;
    text.setText("no file");
    QDragEnterEvent textEnter(QPoint(50, 50), Qt::CopyAction, &text, Qt::LeftButton,
                              Qt::NoModifier);
    textEnter.ignore();
    QCoreApplication::sendEvent(window.get(), &textEnter);
    QVERIFY(!textEnter.isAccepted());
}

void tst_MainWindow::editsSettings()
{
    const WindowTest test;
    const QString file = test.folder() + "some.cfg";
    QVERIFY(TestFiles::write(file, Settings));
    const auto window = WindowTest::show();
    window->OpenFile(file);
    auto* editor = window->findChild<FileTabs*>()->currentEditor();
    auto* tree = Child<QTreeWidget>(editor, "Settings");
    QCOMPARE(tree->topLevelItemCount(), 1);
    QCOMPARE(tree->topLevelItem(0)->text(0), QString("Editor"));
    QCOMPARE(tree->topLevelItem(0)->child(0)->text(1), QString("Serif"));
    QVERIFY(!Action(*window, "Save")->isEnabled());

    // A value is changed with the keyboard.
    tree->setFocus();
    tree->setCurrentItem(tree->topLevelItem(0)->child(0), 1);
    QTest::keyClick(tree, Qt::Key_F2);
    QTRY_VERIFY(tree->findChild<QLineEdit*>());
    QTest::keyClicks(tree->findChild<QLineEdit*>(), "Sans & Serif");
    QTest::keyClick(tree->findChild<QLineEdit*>(), Qt::Key_Return);
    QTRY_VERIFY(!tree->findChild<QLineEdit*>());
    QTRY_VERIFY(editor->isModified());
    QVERIFY(Action(*window, "Save")->isEnabled());
    QVERIFY(window->findChild<FileTabs*>()->tabText(1).endsWith("*"));

    // A key is added and gets a name, which is put right where the store could not write it.
    QList<QPushButton*> buttons = editor->findChildren<QPushButton*>();
    const auto button = [&](QString const& text) {
        return *std::find_if(buttons.begin(), buttons.end(), [&](QPushButton* candidate) {
            return candidate->text().remove('&') == text;
        });
    };
    Click(button("Add Key"));
    QTRY_VERIFY(tree->findChild<QLineEdit*>());
    QTest::keyClicks(tree->findChild<QLineEdit*>(), "two words");
    QTest::keyClick(tree->findChild<QLineEdit*>(), Qt::Key_Return);
    QTRY_COMPARE(tree->topLevelItem(0)->child(2)->text(0), QString("twowords"));
    QTRY_VERIFY(!tree->findChild<QLineEdit*>());
    tree->setCurrentItem(tree->topLevelItem(0)->child(1));
    Click(button("Remove"));
    Click(button("Add Section"));
    QTRY_VERIFY(tree->findChild<QLineEdit*>());
    QTest::keyClicks(tree->findChild<QLineEdit*>(), "1 is no name");
    QTest::keyClick(tree->findChild<QLineEdit*>(), Qt::Key_Return);
    QTRY_VERIFY(!tree->findChild<QLineEdit*>());
    QCOMPARE(tree->topLevelItem(1)->text(0), QString("Section"));

    QTest::keyClick(window.get(), Qt::Key_S, Qt::ControlModifier);
    QVERIFY(!editor->isModified());
    QCOMPARE(TestFiles::read(file),
             QByteArray("<VelocorSettings>\n<Editor>\n<font><![CDATA[Sans & Serif]]></font>\n"
                        "<twowords>value</twowords>\n</Editor>\n<Section>\n</Section>\n"
                        "</VelocorSettings>\n"));
    QCOMPARE(TestFiles::read(file + ".bak"), Settings);

    // Only the first save keeps a copy.
    tree->topLevelItem(0)->child(0)->setText(1, "again");
    QVERIFY(editor->Save());
    QCOMPARE(TestFiles::read(file + ".bak"), Settings);
}

void tst_MainWindow::losesKnowingly_data()
{
    QTest::addColumn<QByteArray>("content");
    QTest::addColumn<QString>("value");
    QTest::addColumn<QString>("told");
    QTest::newRow("a comment") << Settings.left(18) + "<!-- mine -->" + Settings.mid(18) << "v"
                               << "the comment \"mine\"";
    QTest::newRow("an attribute") << QByteArray(Settings).replace("<wrap>", "<wrap a='1'>") << "v"
                                  << "the attribute \"a\"";
    QTest::newRow("nesting") << QByteArray(Settings).replace("yes", "yes<b>1</b>") << "v"
                             << "the nesting of the element \"b\"";
    QTest::newRow("outside Latin-1")
        << Settings << QString::fromUtf8("\xE2\x82\xAC") << "characters outside Latin-1";
    QTest::newRow("end of CDATA") << Settings << "]]>"
                                  << "\"]]>\"";
}

void tst_MainWindow::losesKnowingly()
{
    QFETCH(QByteArray, content);
    QFETCH(QString, value);
    QFETCH(QString, told);
    const WindowTest test;
    const QString file = test.folder() + "some.cfg";
    QVERIFY(TestFiles::write(file, content));
    SettingsEditor editor;
    editor.Open(file);
    editor.show();
    auto* tree = Child<QTreeWidget>(&editor, "Settings");
    tree->topLevelItem(0)->child(0)->setText(1, value);

    QString text;
    WindowTest::whenShown<QMessageBox>([&](QMessageBox* box) {
        text = box->informativeText();
        QTest::keyClick(box, Qt::Key_Escape);
    });
    QVERIFY(!editor.Save());
    QVERIFY2(text.contains(told), qPrintable(text));
    QCOMPARE(TestFiles::read(file), content);
    QVERIFY(!QFile::exists(file + ".bak"));
}

void tst_MainWindow::brokenSettings()
{
    const WindowTest test;
    const QString file = test.folder() + "some.cfg";
    const QByteArray broken = QByteArray(Settings).replace("</font>", "</fnt>");
    QVERIFY(TestFiles::write(file, broken));
    const auto window = WindowTest::show();
    window->OpenFile(file);
    auto* editor = window->findChild<FileTabs*>()->currentEditor();
    const QString told = editor->findChild<NoticeBar*>()->text();
    QVERIFY2(told.contains("tag mismatch") && told.contains("line 3, column"), qPrintable(told));
    auto const* text = Child<QPlainTextEdit>(editor, "The file as text");
    QVERIFY(text->isVisible() && text->isReadOnly());
    QCOMPARE(text->toPlainText(), QString(broken));
    QCOMPARE(text->textCursor().blockNumber(), 2);
    QVERIFY(!editor->Save());
    QVERIFY(!Action(*window, "Save")->isEnabled());
    QCOMPARE(TestFiles::read(file), broken);
    window->close();
    QCOMPARE(TestFiles::read(file), broken);
}

void tst_MainWindow::saveFails()
{
    const WindowTest test;
    const QString folder = test.folder() + "going/";
    const QString file = folder + "some.cfg";
    QVERIFY(TestFiles::write(file, Settings));
    SettingsEditor editor;
    editor.Open(file);
    editor.show();
    Child<QTreeWidget>(&editor, "Settings")->topLevelItem(0)->child(0)->setText(1, "v");
    QVERIFY(QDir(folder).removeRecursively());
    QString text;
    WindowTest::whenShown<QMessageBox>([&](QMessageBox* box) {
        text = box->text();
        QTest::keyClick(box, Qt::Key_Return);
    });
    QVERIFY(!editor.Save());
    QVERIFY2(text.contains("Unable to save " + file), qPrintable(text));
    QVERIFY(editor.isModified());
}

void tst_MainWindow::changedMeanwhile()
{
    const WindowTest test;
    const QString file = test.folder() + "some.cfg";
    QVERIFY(TestFiles::write(file, Settings));
    SettingsEditor editor;
    editor.Open(file);
    editor.show();
    Child<QTreeWidget>(&editor, "Settings")->topLevelItem(0)->child(0)->setText(1, "v");
    QTest::qWait(50);
    const QByteArray others = QByteArray(Settings).replace("Serif", "theirs");
    QVERIFY(TestFiles::write(file, others));
    QString text;
    WindowTest::whenShown<QMessageBox>([&](QMessageBox* box) {
        text = box->text();
        QTest::keyClick(box, Qt::Key_Escape);
    });
    QVERIFY(!editor.Save());
    QVERIFY2(text.contains("changed by another program"), qPrintable(text));
    QCOMPARE(TestFiles::read(file), others);
}

void tst_MainWindow::askedBeforeClosing_data()
{
    QTest::addColumn<int>("answer");
    QTest::addColumn<bool>("closes");
    QTest::addColumn<bool>("saves");
    QTest::newRow("save") << int(QMessageBox::Save) << true << true;
    QTest::newRow("discard") << int(QMessageBox::Discard) << true << false;
    QTest::newRow("cancel") << int(QMessageBox::Cancel) << false << false;
}

void tst_MainWindow::askedBeforeClosing()
{
    QFETCH(int, answer);
    QFETCH(bool, closes);
    QFETCH(bool, saves);
    const WindowTest test;
    const QString file = test.folder() + "some.cfg";
    QVERIFY(TestFiles::write(file, Settings));
    const auto window = WindowTest::show();
    window->OpenFile(file);
    auto* editor = window->findChild<FileTabs*>()->currentEditor();
    Child<QTreeWidget>(editor, "Settings")->topLevelItem(0)->child(0)->setText(1, "new");
    WindowTest::whenShown<QMessageBox>([&](QMessageBox* box) {
        Click(box->button(static_cast<QMessageBox::StandardButton>(answer)));
    });
    QCOMPARE(window->close(), closes);
    QCOMPARE(TestFiles::read(file).contains("<font>new</font>"), saves);
}

// What has been typed into a cell counts, also without the Enter key.
void tst_MainWindow::closesWhileEditing()
{
    for (bool close : {true, false}) {
        const WindowTest test;
        const QString file = test.folder() + "some.cfg";
        QVERIFY(TestFiles::write(file, Settings));
        auto window = WindowTest::show();
        window->OpenFile(file);
        auto* tree = Child<QTreeWidget>(window.get(), "Settings");
        tree->setFocus();
        tree->setCurrentItem(tree->topLevelItem(0)->child(0), 1);
        QTest::keyClick(tree, Qt::Key_F2);
        QTRY_VERIFY(tree->findChild<QLineEdit*>());
        QTest::keyClicks(tree->findChild<QLineEdit*>(), "typed");
        if (close) {
            WindowTest::whenShown<QMessageBox>(
                [&](QMessageBox* box) { Click(box->button(QMessageBox::Save)); });
            QVERIFY(window->close());
            QVERIFY(TestFiles::read(file).contains("typed"));
        }
        window.reset(); // also without having been closed
        QCoreApplication::processEvents();
    }
}

void tst_MainWindow::logSettings()
{
    const WindowTest test(run(1, QTime(9, 0), "x"));
    const auto window = WindowTest::show();
    WindowTest::whenShown<LogSettingsDialog>([&](LogSettingsDialog* dialog) {
        Child<QSpinBox>(dialog, "Older files kept")->setValue(5);
        const QList<QCheckBox*> boxes = dialog->findChildren<QCheckBox*>();
        for (QCheckBox* box : boxes) {
            if (box->text().contains("time since"))
                ClickBox(box);
        }
        auto* format = Child<QLineEdit>(dialog, "Date format");
        format->selectAll();
        QTest::keyClicks(format, "'at' hh:mm");
        QVERIFY(Child<QLabel>(dialog, "Sample of an entry")->text().startsWith("at "));
        QVERIFY(Child<QLabel>(dialog, "Sample of an entry")->text().contains("dT:[250]"));
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

void tst_MainWindow::logSettingsRefused()
{
    const WindowTest test;
    const QByteArray before = TestFiles::read(test.folder() + "data/logs/logsettings.cfg");
    LogSettingsDialog dialog;
    dialog.show();
    QAbstractButton* ok = dialog.findChild<QDialogButtonBox*>()->button(QDialogButtonBox::Ok);
    QVERIFY(ok->isEnabled());
    for (char const* bad : {"", "a/b", "..", "\xC3\xA4"}) {
        Child<QLineEdit>(&dialog, "Name of the log files")->setText(QString::fromUtf8(bad));
        QVERIFY2(!ok->isEnabled(), bad);
        dialog.accept();
        QVERIFY(dialog.isVisible());
    }
    QVERIFY(!Child<QLabel>(&dialog, "Problem with the settings")->text().isEmpty());
    dialog.reject();
    QCOMPARE(TestFiles::read(test.folder() + "data/logs/logsettings.cfg"), before);
}

void tst_MainWindow::about()
{
    const WindowTest test;
    const auto window = WindowTest::show();
    WindowTest::whenShown<ReportDialog>([&](ReportDialog* dialog) {
        const QList<QPushButton*> buttons = dialog->findChildren<QPushButton*>();
        for (QPushButton* button : buttons) {
            if (button->text().remove('&') == "Copy")
                Click(button);
        }
        QTest::keyClick(dialog, Qt::Key_Escape);
    });
    QTest::keyClick(window.get(), Qt::Key_F1);
    const QString copied = QGuiApplication::clipboard()->text();
    QVERIFY2(copied.contains("Toolkit running: ") && copied.contains(test.logFile()),
             qPrintable(copied));
}

void tst_MainWindow::saveReport()
{
    const QByteArray log = run(5, QTime(9, 0), "x");
    const WindowTest test(log);
    const auto window = WindowTest::show();
    const QString file = test.folder() + "report.txt";
    WindowTest::whenShown<ReportDialog>([&](ReportDialog* dialog) {
        // What is saved is what is shown.
        auto const* shown = Child<QPlainTextEdit>(dialog, "Save Report");
        QCOMPARE(shown->toPlainText().right(log.size()), QString(log));
        WindowTest::whenShown<QFileDialog>([&](QFileDialog* chooser) {
            auto* name = chooser->findChild<QLineEdit*>("fileNameEdit");
            name->setText(file);
            QTest::keyClick(name, Qt::Key_Return);
        });
        const QList<QPushButton*> buttons = dialog->findChildren<QPushButton*>();
        for (QPushButton* button : buttons) {
            if (button->text().remove('&') == "Save...")
                Click(button);
        }
    });
    QTest::keyClick(window.get(), Qt::Key_R, Qt::ControlModifier | Qt::ShiftModifier);
    QTRY_VERIFY_WITH_TIMEOUT(QFile::exists(file), Patience);
    QVERIFY(TestFiles::read(file).endsWith(log));
    const ReportDialog dialog("T", "H", "text", true);
    QVERIFY(!dialog.SaveTo(test.folder() + "no/such/file").isEmpty());
}

void tst_MainWindow::messageBoxesAreSelectable()
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

void tst_MainWindow::keepsItsState()
{
    const WindowTest test;
    QRect geometry;
    QList<int> panes;
    {
        const auto window = WindowTest::show();
        window->setGeometry(60, 70, 640, 420);
        QTest::qWait(100);
        QTest::keyClick(window.get(), Qt::Key_F9);
        QTest::keyClick(window.get(), Qt::Key_F9);
        window->findChild<QSplitter*>()->setSizes({220, 420});
        View(*window)->setColumnWidth(LogModel::TimeColumn, 123);
        QTest::qWait(100);
        geometry = window->geometry();
        panes = window->findChild<QSplitter*>()->sizes();
        window->close();
    }
    const QByteArray file = TestFiles::read(test.settingsFile());
    QVERIFY2(file.contains("<ApplicationScreens>\n<MainWindow>"), file);
    {
        const auto window = WindowTest::show();
        QTest::qWait(100);
        QCOMPARE(window->size(), geometry.size());
        QVERIFY((window->pos() - geometry.topLeft()).manhattanLength() < 100);
        QCOMPARE(window->findChild<QSplitter*>()->sizes(), panes);
        QCOMPARE(View(*window)->columnWidth(LogModel::TimeColumn), 123);
        QTest::keyClick(window.get(), Qt::Key_F9);
        window->close();
    }
    const auto window = WindowTest::show();
    QVERIFY(!window->findChild<PlacesPanel*>()->isVisible());
    QVERIFY(!Action(*window, "Places")->isChecked());
}

void tst_MainWindow::damagedState()
{
    const WindowTest test;
    QVERIFY(TestFiles::write(test.settingsFile(), "<VelocorSettings><Main"));
    const auto window = WindowTest::show();
    auto* notice = window->findChild<NoticeBar*>();
    QVERIFY(notice->isVisible());
    QVERIFY2(notice->text().contains(test.settingsFile() + ".damaged-1"),
             qPrintable(notice->text()));
    Click(Child<QPushButton>(notice, "Dismiss the notice"));
    QVERIFY(!notice->isVisible());
    window->close();
    QCOMPARE(TestFiles::read(test.settingsFile() + ".damaged-1"),
             QByteArray("<VelocorSettings><Main"));
}

void tst_MainWindow::logSwitchedOff()
{
    const WindowTest test;
    TorkLog::logger()->setEnable(false);
    const auto window = WindowTest::show();
    auto const* state = Child<QLabel>(window.get(), "State of the log");
    QTRY_COMPARE_WITH_TIMEOUT(state->text(), QString("The log is switched off"), Patience);
    TorkLog::logger()->setEnable(true);
    QTRY_COMPARE_WITH_TIMEOUT(state->text(), QString(), Patience);
}

void tst_MainWindow::names()
{
    const WindowTest test(run(5, QTime(9, 0), "x"));
    QVERIFY(TestFiles::write(test.folder() + "some.cfg", Settings));
    QVERIFY(TestFiles::write(test.folder() + "broken.cfg", "<a"));
    const auto window = WindowTest::show();
    window->OpenFile(test.folder() + "some.cfg");
    window->OpenFile(test.folder() + "broken.cfg");
    const QStringList nameless = NamelessControls(window.get());
    QVERIFY2(nameless.isEmpty(), qPrintable(nameless.join("; ")));
}

void tst_MainWindow::namesInDialogs()
{
    const WindowTest test;
    LogSettingsDialog settings;
    QCOMPARE(NamelessControls(&settings), QStringList());
    ReportDialog report("Title", "Heading", "Text", true);
    QCOMPARE(NamelessControls(&report), QStringList());
}

// Every action that does something has a shortcut and a status tip, and no two share one.
void tst_MainWindow::shortcuts()
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
            QVERIFY2(!shortcut.isEmpty(), qPrintable(action->text()));
            QVERIFY2(!taken.contains(shortcut), qPrintable(action->text() + taken.value(shortcut)));
            QVERIFY2(!action->statusTip().isEmpty(), qPrintable(action->text()));
            taken.insert(shortcut, action->text());
        }
    }
}

// In each menu every entry has a letter of its own.
void tst_MainWindow::menusByKeyboard()
{
    const WindowTest test;
    const auto window = WindowTest::show();
    QList<QList<QAction*>> levels{window->menuBar()->actions()};
    for (QAction const* top : window->menuBar()->actions())
        levels.append(top->menu()->actions());
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

// The tab key reaches every control of the log once before it comes back to the first.
void tst_MainWindow::tabOrder()
{
    const WindowTest test(run(5, QTime(9, 0), "x"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 5, Patience);
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
    QCOMPARE(QStringList(order.mid(0, 11)),
             QStringList({"Log file", "Pause", "Follow newest", "Filter by text", "Match case",
                          "Regular expression", "Show Trace", "Show Notification", "Show Warning",
                          "Show Error", "Show Fatal"}));
    QVERIFY(order.contains("Log entries"));
    QVERIFY(order.contains("The current line in full"));
    QVERIFY(order.contains("Copy: Organization"));
    QVERIFY(order.size() < 60);
}

QTEST_MAIN(tst_MainWindow)
#include "tst_MainWindow.moc"
