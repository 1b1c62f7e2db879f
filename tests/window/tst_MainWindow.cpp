// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The window on a real screen, driven with keys and mouse.

#include "WindowParts.h"
#include "WindowTestCase.h"

#include "app/runninglog/RunMark.h"
#include "app/window/FileTabs.h"
#include "app/window/PlacesPanel.h"
#include "app/window/ProblemReportDialog.h"
#include "app/window/ReportDialog.h"
#include "app/window/log/LogModel.h"
#include "app/window/widgets/ElidedLabel.h"
#include "app/window/widgets/NoticeBar.h"
#include "support/LeftMark.h"

#include <QAbstractButton>
#include <QClipboard>
#include <QComboBox>
#include <QDesktopServices>
#include <QDropEvent>
#include <QFileDialog>
#include <QLabel>
#include <QLineEdit>
#include <QListWidget>
#include <QMenuBar>
#include <QMessageBox>
#include <QMimeData>
#include <QPlainTextEdit>
#include <QPushButton>
#include <QScreen>
#include <QSplitter>
#include <QStandardPaths>
#include <QTextBlock>
#include <QToolBar>
#include <QToolButton>

using namespace Velocor;
using namespace WindowParts;

using DemoLog::run;

namespace {

// The text in one of the locations, found the way assistive technology finds it.
QString Place(MainWindow& window, QString const& name)
{
    auto const* field = Child<QLabel>(&window, name);
    return field ? field->text() : QString();
}

template <class Button>
Button* ChildWithText(QWidget* parent, QString const& text)
{
    const QList<Button*> all = parent->findChildren<Button*>();
    for (Button* button : all) {
        if (button->text().remove('&') == text)
            return button;
    }
    return nullptr;
}

// Takes what would be shown in another program.
class UrlHandler : public QObject
{
    Q_OBJECT

public:
    UrlHandler() { QDesktopServices::setUrlHandler("file", this, "take"); }
    ~UrlHandler() override { QDesktopServices::unsetUrlHandler("file"); }

    QUrl url;

public slots:
    void take(QUrl const& taken) { url = taken; }
};

} // namespace

class tst_MainWindow : public WindowTestCase
{
    Q_OBJECT

private slots:
    void fitsTheScreen();
    void identityAndPlaces();
    void copiesAPlace();
    void logsNothingItself();
    void opensNoFolder();

    void opensFiles();
    void goesFromTabToTab_data();
    void goesFromTabToTab();
    void openDialog();
    void opensBySettings();
    void recentFiles();
    void forgetsMissingFile();
    void dropsFiles();
    void dropsOnlyTheFirstFiles();

    void about();
    void listsShortcuts();
    void opensTheManual();
    void toolBar();
    void placesElidePaths();
    void tellsHowTheLastRunEnded();
    void setsItsSettingsAside();
    void saveReport();
    void choicesOfAReport();
    void marksOfAReport();

    void keepsItsState();
    void damagedState();
};

void tst_MainWindow::fitsTheScreen()
{
    const WindowTest test(run(100, QTime(9, 0), "x"));
    const auto window = WindowTest::show();
    const QRect screen = QGuiApplication::primaryScreen()->availableGeometry();
    QVERIFY(window->width() <= screen.width());
    QVERIFY(window->height() <= screen.height());
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 100, Patience);
    // All of the log's controls are visible, and so are some lines.
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
    QVERIFY(!window->findChild<PlacesPanel*>());
    QTest::keyClick(window.get(), Qt::Key_F9);
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
    QTest::keyClick(window.get(), Qt::Key_F9);
    Click(Child<QToolButton>(window.get(), "Copy: Log file"));
    QCOMPARE(QGuiApplication::clipboard()->text(), test.logFile());
    QCOMPARE(Status(*window), QString("Copied: Log file"));
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

void tst_MainWindow::opensNoFolder()
{
    const WindowTest test;
    const auto window = WindowTest::show();
    window->OpenFile(test.folder() + "documents");
    QCOMPARE(Status(*window), test.folder() + "documents is a folder");
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

void tst_MainWindow::goesFromTabToTab_data()
{
    QTest::addColumn<Qt::Key>("onward");
    QTest::addColumn<Qt::Key>("back");
    QTest::newRow("tab") << Qt::Key_Tab << Qt::Key_Backtab;
    QTest::newRow("page") << Qt::Key_PageDown << Qt::Key_PageUp;
}

// From any control, and with the keyboard in the page that is shown.
void tst_MainWindow::goesFromTabToTab()
{
    QFETCH(Qt::Key, onward);
    QFETCH(Qt::Key, back);
    const WindowTest test(run(100, QTime(9, 0), "x"));
    for (char const* name : {"a.log", "b.log"})
        TestFiles::write(test.folder() + name, run(100, QTime(9, 0), "x"));
    TestFiles::write(test.folder() + "c.cfg", Settings);
    const auto window = WindowTest::show();
    auto* tabs = window->findChild<FileTabs*>();
    for (char const* name : {"a.log", "b.log", "c.cfg"})
        tabs->OpenFile(test.folder() + name);
    const auto press = [&](Qt::Key key) {
        const bool isBacktab = key == Qt::Key_Backtab;
        QTest::keyClick(QApplication::focusWidget(), key,
                        Qt::ControlModifier | (isBacktab ? Qt::ShiftModifier : Qt::NoModifier));
        QVERIFY(tabs->currentWidget()->isAncestorOf(QApplication::focusWidget()));
    };
    for (int expected : {0, 1, 2, 3, 0, 1}) {
        press(onward);
        QCOMPARE(tabs->currentIndex(), expected);
        if (tabs->currentLog())
            QVERIFY(View(*window)->hasFocus());
    }
    Child<QComboBox>(tabs->currentWidget(), "Log file")->setFocus();
    for (int expected : {0, 3, 2}) {
        press(back);
        QCOMPARE(tabs->currentIndex(), expected);
    }
    Child<QLineEdit>(tabs->currentWidget(), "Filter by text")->setFocus();
    press(onward);
    QCOMPARE(tabs->currentIndex(), 3);
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
    QVERIFY(!isSettings("<34>Nov 22 14:03:02 host su: text\n"));
    QVERIFY(!isSettings("<165>1 2026-11-22T14:03:02.003Z host app - ID47 - text\n"));
    QVERIFY(isSettings("<3"));
    QVERIFY(isSettings("<>"));
    QVERIFY(isSettings("<1234></1234>"));
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
    QVERIFY(Status(*window).endsWith(" does not exist"));
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

// A whole folder that was selected by mistake does not open hundreds of tabs.
void tst_MainWindow::dropsOnlyTheFirstFiles()
{
    const WindowTest test;
    QList<QUrl> urls;
    for (int i = 0; i < 22; ++i) {
        const QString file = test.folder() + QString("%1.log").arg(i, 2, 10, QChar('0'));
        QVERIFY(TestFiles::write(file, "x\n"));
        urls.append(QUrl::fromLocalFile(file));
    }
    const auto window = WindowTest::show();
    QMimeData files;
    files.setUrls(urls);
    QDragEnterEvent enter(QPoint(50, 50), Qt::CopyAction, &files, Qt::LeftButton, Qt::NoModifier);
    QCoreApplication::sendEvent(window.get(), &enter);
    QDropEvent drop(QPoint(50, 50), Qt::CopyAction, &files, Qt::LeftButton, Qt::NoModifier);
    QCoreApplication::sendEvent(window.get(), &drop);
    auto const* tabs = window->findChild<FileTabs*>();
    QCOMPARE(tabs->count(), 21); // and the log of the program
    QCOMPARE(tabs->tabText(20), QString("19.log"));
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
    QTest::keyClick(window.get(), Qt::Key_F1, Qt::ShiftModifier);
    const QString copied = QGuiApplication::clipboard()->text();
    for (QString const& part : {QString("License: MIT\n"), QString("\nrapidxml: "),
                                QString("\nRunning with Qt: "), test.logFile()})
        QVERIFY2(copied.contains(part), qPrintable(copied));
}

// Whatever the menus have, and the buttons with keys of their own.
void tst_MainWindow::listsShortcuts()
{
    const WindowTest test;
    const auto window = WindowTest::show();
    QString list;
    WindowTest::whenShown<ReportDialog>([&](ReportDialog* dialog) {
        list = Child<QPlainTextEdit>(dialog, "Keyboard Shortcuts")->toPlainText();
        QTest::keyClick(dialog, Qt::Key_Escape);
    });
    QTest::keyClick(window.get(), Qt::Key_F1, Qt::ControlModifier);
    int actions = 0;
    for (QMenu const* menu : window->menuBar()->findChildren<QMenu*>()) {
        for (QAction const* action : menu->actions()) {
            if (action->shortcut().isEmpty())
                continue;
            const QRegularExpression line(
                "(?m)^  " +
                QRegularExpression::escape(action->shortcut().toString(QKeySequence::NativeText)) +
                " +" + QRegularExpression::escape(action->statusTip()) + "$");
            QVERIFY2(line.match(list).hasMatch(), qPrintable(action->text() + list));
            ++actions;
        }
    }
    QVERIFY(actions > 15);
    QVERIFY2(list.contains(QRegularExpression("(?m)^  Ctrl\\+4 +Show Error$")), qPrintable(list));
    QCOMPARE(list.count("Show Error"), 1);
    QVERIFY2(list.contains(QRegularExpression("(?m)^  Ctrl\\+Tab +Next Tab$")), qPrintable(list));
}

void tst_MainWindow::opensTheManual()
{
    const WindowTest test;
    const auto window = WindowTest::show();
    const QString folder =
        QStandardPaths::writableLocation(QStandardPaths::GenericDataLocation) + "/doc/velocor/";
    QFile::remove(folder + "window.md");
    UrlHandler handler;
    QTest::keyClick(window.get(), Qt::Key_F1);
    if (handler.url.isEmpty()) // one may be installed on this system
        QVERIFY2(Status(*window).startsWith("The manual is not installed"),
                 qPrintable(Status(*window)));
    QVERIFY(TestFiles::write(folder + "window.md", "# The window\n"));
    QTest::keyClick(window.get(), Qt::Key_F1);
    QCOMPARE(handler.url, QUrl::fromLocalFile(folder + "window.md"));
    QVERIFY(QFile::remove(folder + "window.md"));
}

// They do what the menu items do, and say which keys do the same.
void tst_MainWindow::toolBar()
{
    const WindowTest test(run(100, QTime(9, 0), "x"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 100, Patience);
    auto const* bar = Child<QToolBar>(window.get(), "Tools");
    const auto button = [&](char const* text) {
        return static_cast<QToolButton*>(bar->widgetForAction(Action(*window, text)));
    };
    for (char const* text : {"Open...", "Reload", "Pause", "Follow Newest", "Previous Problem",
                             "Next Problem", "Filter", "Places"}) {
        QVERIFY2(button(text) && button(text)->isVisible(), text);
        QVERIFY2(!button(text)->icon().isNull(), text);
        const QString keys = Action(*window, text)->shortcut().toString();
        QVERIFY2(button(text)->toolTip().endsWith("(" + keys + ")"), text);
    }
    Click(button("Pause"));
    QVERIFY(Panel(*window)->isPaused());
    Click(button("Pause"));
    QVERIFY(!Panel(*window)->isPaused());
    Click(button("Follow Newest"));
    QVERIFY(!Panel(*window)->isFollowing());
    Click(button("Next Problem"));
    QVERIFY(View(*window)->currentIndex().isValid());
    Click(button("Filter"));
    QCOMPARE(QApplication::focusWidget()->accessibleName(), QString("Filter by text"));
    Click(button("Places"));
    QVERIFY(window->findChild<PlacesPanel*>()->isVisible());
    Click(button("Places"));
    QVERIFY(!window->findChild<PlacesPanel*>()->isVisible());
}

// The middle of a path is left out, not its file name.
void tst_MainWindow::placesElidePaths()
{
    const WindowTest test;
    QCoreApplication::instance()->setProperty(
        "DocPath", "/home/" + QString("a-long-name/").repeated(30) + "documents/");
    const auto window = WindowTest::show();
    QTest::keyClick(window.get(), Qt::Key_F9);
    auto const* place = static_cast<ElidedLabel*>(Child<QLabel>(window.get(), "Documents"));
    QVERIFY2(place->ShownText().startsWith("/home/"), qPrintable(place->ShownText()));
    QVERIFY2(place->ShownText().endsWith("documents/"), qPrintable(place->ShownText()));
    QVERIFY(place->toolTip().contains(QString("a-long-name/").repeated(30)));
}

// It says so in a bar, from which the user can see the end of that run and make a report.
void tst_MainWindow::tellsHowTheLastRunEnded()
{
    const WindowTest test(run(3, QTime(9, 0), "now"));
    QVERIFY(TestFiles::write(test.logFile() + ".1", run(2, QTime(8, 0), "crashed")));
    {
        const auto window = WindowTest::show();
        for (QLabel const* label : window->findChildren<QLabel*>())
            QVERIFY(label->accessibleName() != "How the last run ended");
    }
    QVERIFY(!LeftMark::make(test.logFile(), RunMark::ProgramStart() - 60000).isEmpty());
    const auto window = WindowTest::show();
    auto const* text = Child<QLabel>(window.get(), "How the last run ended");
    QVERIFY(text && text->isVisible());
    QVERIFY2(text->text().endsWith(" did not end normally."), qPrintable(text->text()));

    QString shown;
    WindowTest::whenShown<ReportDialog>([&](ReportDialog* dialog) {
        shown = Child<QPlainTextEdit>(dialog, "Last Entries")->toPlainText();
        dialog->reject();
    });
    Click(Child<QPushButton>(window.get(), "Show the last entries of that run"));
    QCOMPARE(shown, QString(run(2, QTime(8, 0), "crashed")));
    bool isReported = false;
    WindowTest::whenShown<ProblemReportDialog>([&](ProblemReportDialog* dialog) {
        isReported = true;
        dialog->reject();
    });
    Click(Child<QPushButton>(window.get(), "Report how the last run ended"));
    QVERIFY(isReported);
    Click(Child<QPushButton>(window.get(), "Dismiss how the last run ended"));
    QVERIFY(!text->isVisible());
}

// Only when the user says so, and then it does not write them again.
void tst_MainWindow::setsItsSettingsAside()
{
    const WindowTest test(run(3, QTime(9, 0), "now"));
    QVERIFY(TestFiles::write(test.settingsFile(), Settings));
    QVERIFY(TestFiles::write(test.settingsFile() + ".set-aside-1", "earlier"));
    for (int end : {30000, 40000, 50000})
        QVERIFY(!LeftMark::make(test.logFile(), RunMark::ProgramStart() - end).isEmpty());
    const auto window = WindowTest::show();
    auto const* text = Child<QLabel>(window.get(), "How the last run ended");
    QVERIFY2(text->text().contains(test.settingsFile()), qPrintable(text->text()));
    QCOMPARE(TestFiles::read(test.settingsFile()), Settings);
    auto* button = Child<QPushButton>(window.get(), "Set the settings of this window aside");
    Click(button);
    QVERIFY2(text->text().contains(test.settingsFile() + ".set-aside-2"), qPrintable(text->text()));
    QVERIFY(!button->isVisible());
    window->close();
    QVERIFY(!QFile::exists(test.settingsFile()));
    QCOMPARE(TestFiles::read(test.settingsFile() + ".set-aside-2"), Settings);
}

// What is saved is what is shown.
void tst_MainWindow::saveReport()
{
    const WindowTest test(run(3, QTime(9, 0), "by ada@example.org"));
    const auto window = WindowTest::show();
    const QString folder = test.folder() + "report";
    QString shown;
    WindowTest::whenShown<ProblemReportDialog>([&](ProblemReportDialog* dialog) {
        auto const* text = Child<QPlainTextEdit>(dialog, "Report");
        QVERIFY2(text->toPlainText().startsWith("# Report\n"), qPrintable(text->toPlainText()));
        Child<QComboBox>(dialog, "File of the report")->setCurrentText("last-run.log");
        shown = text->toPlainText();
        Click(ChildWithText<QPushButton>(dialog, "Copy File"));
        WindowTest::whenShown<QFileDialog>([&](QFileDialog* chooser) {
            chooser->selectNameFilter("New folder (*)");
            auto* name = chooser->findChild<QLineEdit*>("fileNameEdit");
            name->setText(folder);
            QTest::keyClick(name, Qt::Key_Return);
        });
        Click(ChildWithText<QPushButton>(dialog, "Save..."));
    });
    QTest::keyClick(window.get(), Qt::Key_R, Qt::ControlModifier | Qt::ShiftModifier);
    QTRY_VERIFY_WITH_TIMEOUT(QFile::exists(folder + "/report.md"), Patience);
    QVERIFY2(shown.contains("by <mail-1> 0\n"), qPrintable(shown));
    QCOMPARE(QString(TestFiles::read(folder + "/last-run.log")), shown);
    QCOMPARE(QGuiApplication::clipboard()->text(), shown);
}

// Parts that are not ticked and words of the user are not in the report; what the user wants back
// is.
void tst_MainWindow::choicesOfAReport()
{
    ProblemReportDialog dialog({{"One", "ada@example.org and Blue Moon\n", {{"1.log", "x\n"}}},
                                {"Two", "bob@example.org\n", {{"2.log", "y\n"}}}},
                               Redactor());
    dialog.show();
    auto const* text = Child<QPlainTextEdit>(&dialog, "Report");
    auto* files = Child<QComboBox>(&dialog, "File of the report");
    auto* secrets = Child<QListWidget>(&dialog, "Replaced by placeholders");
    QCOMPARE(files->count(), 3);
    QCOMPARE(secrets->count(), 2);
    QCOMPARE(secrets->item(1)->text(), QString("<mail-2>  bob@example.org"));
    files->setCurrentText("2.log");
    ChildWithText<QCheckBox>(&dialog, "Two")->setChecked(false);
    QCOMPARE(files->count(), 2);
    QCOMPARE(files->currentText(), QString("report.md"));
    QCOMPARE(secrets->count(), 1);
    QVERIFY(text->toPlainText().contains("<mail-1> and Blue Moon\n"));
    QVERIFY(!text->toPlainText().contains("Two"));

    secrets->item(0)->setCheckState(Qt::Unchecked);
    QTRY_VERIFY_WITH_TIMEOUT(text->toPlainText().contains("ada@example.org and"), Patience);
    QCOMPARE(secrets->item(0)->checkState(), Qt::Unchecked);
    secrets->item(0)->setCheckState(Qt::Checked);
    QTRY_VERIFY_WITH_TIMEOUT(text->toPlainText().contains("<mail-1> and"), Patience);
    Child<QLineEdit>(&dialog, "Also replace")->setText("xyz, blue moon");
    QTRY_VERIFY_WITH_TIMEOUT(text->toPlainText().contains("<mail-1> and <word-1>\n"), Patience);
    QCOMPARE(text->toPlainText(), dialog.report().files().front().content.text);
}

// Placeholders have another background, and nothing else has.
void tst_MainWindow::marksOfAReport()
{
    ProblemReportDialog dialog({{"One", "1\n12 ada@example.org 3\n", {}}}, Redactor());
    auto const* text = Child<QPlainTextEdit>(&dialog, "Report");
    QStringList marked;
    for (QTextBlock block = text->document()->begin(); block.isValid(); block = block.next()) {
        const auto formats = block.layout()->formats();
        for (QTextLayout::FormatRange const& range : formats) {
            if (range.format.background().style() != Qt::NoBrush)
                marked.append(block.text().mid(range.start, range.length));
        }
    }
    QCOMPARE(marked, QStringList({"<mail-1>"}));
}

void tst_MainWindow::keepsItsState()
{
    const WindowTest test;
    QRect geometry;
    QList<int> panes;
    {
        const auto window = WindowTest::show();
        window->setGeometry(60, 70, 640, 420);
        QTRY_COMPARE_WITH_TIMEOUT(window->geometry(), QRect(60, 70, 640, 420), Patience);
        QTest::keyClick(window.get(), Qt::Key_F9);
        QTest::keyClick(window.get(), Qt::Key_B, Qt::ControlModifier | Qt::AltModifier);
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
        QTRY_COMPARE_WITH_TIMEOUT(window->size(), geometry.size(), Patience);
        QTRY_VERIFY_WITH_TIMEOUT((window->pos() - geometry.topLeft()).manhattanLength() < 100,
                                 Patience);
        QTRY_COMPARE_WITH_TIMEOUT(window->findChild<QSplitter*>()->sizes(), panes, Patience);
        QCOMPARE(View(*window)->columnWidth(LogModel::TimeColumn), 123);
        QVERIFY(!window->findChild<QToolBar*>()->isVisible());
        QVERIFY(!Action(*window, "Tool Bar")->isChecked());
        QTest::keyClick(window.get(), Qt::Key_F9);
        QTest::keyClick(window.get(), Qt::Key_B, Qt::ControlModifier | Qt::AltModifier);
        window->close();
    }
    const auto window = WindowTest::show();
    QVERIFY(!window->findChild<PlacesPanel*>());
    QVERIFY(!Action(*window, "Places")->isChecked());
    QVERIFY(window->findChild<QToolBar*>()->isVisible());
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
    Click(Child<QPushButton>(notice, "Dismiss notice"));
    QVERIFY(!notice->isVisible());
    window->close();
    QCOMPARE(TestFiles::read(test.settingsFile() + ".damaged-1"),
             QByteArray("<VelocorSettings><Main"));
}

QTEST_MAIN(tst_MainWindow)

#include "tst_MainWindow.moc"
