// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Takes screenshots of every view of the window, in light and dark, and of the first ones in
// German, mirrored, in high contrast and with large text:
//
//     window_screenshots FOLDER
//
// The build target "screenshots" runs it on a virtual display and puts them into docs/images.

#include "Palettes.h"

#include "app/language/Language.h"
#include "app/window/FileTabs.h"
#include "app/window/MainWindow.h"
#include "app/window/ReachableStyle.h"
#include "app/window/log/HighlightRules.h"
#include "app/window/log/LogFindBar.h"
#include "app/window/log/LogModel.h"
#include "app/window/log/LogPanel.h"
#include "app/window/log/LogView.h"
#include "app/window/settings/SettingsEditor.h"
#include "common/log/TorkLog.h"
#include "support/DemoLog.h"
#include "support/TestFiles.h"

#include <QAbstractButton>
#include <QAction>
#include <QApplication>
#include <QComboBox>
#include <QLineEdit>
#include <QStyle>
#include <QTabWidget>
#include <QTableView>
#include <QTest>
#include <QTextStream>
#include <QTimer>
#include <QTranslator>
#include <QTreeView>

using namespace Velocor;

namespace {

QString const Home("/tmp/velocor/");

QByteArray const SettingsText("<?xml version=\"1.0\"?>\n"
                              "<VelocorSettings>\n"
                              "<!-- kept by hand -->\n"
                              "<Editor><font>DejaVu Sans,10</font><wrap>yes</wrap></Editor>\n"
                              "<Colors><marker>255,193,77</marker><paper>250,250,245</paper>\n"
                              "<ink>30,30,30</ink></Colors>\n"
                              "<Network><proxy>none</proxy><timeout>30</timeout></Network>\n"
                              "</VelocorSettings>\n");

QByteArray const BrokenText("<VelocorSettings>\n"
                            "<Editor>\n"
                            "<font>DejaVu Sans,10</fnt>\n"
                            "</Editor>\n"
                            "</VelocorSettings>\n");

// An hour of a program that has more and less to do, and once a lot of trouble.
QByteArray BusyHour()
{
    QByteArray log;
    QTime time(14, 0);
    for (int i = 0; time < QTime(15, 0); ++i) {
        const bool isTrouble = time > QTime(14, 37) && time < QTime(14, 40);
        char const* severity = i % 90 == 40 ? "Warning" : "Trace";
        if (isTrouble)
            severity = i % 3 == 0 ? "Error" : "Warning";
        log += DemoLog::entry(time.toString("HH:mm:ss.zzz"), severity,
                              QString("Request %1 answered").arg(4000 + i));
        const int minute = time.minute();
        time = time.addMSecs(isTrouble ? 700 : 900 + qAbs(minute * 7 % 23 - 11) * 300);
    }
    return log;
}

// As the catalog of a language that is written from right to left, with English texts.
class MirroredLayout : public QTranslator
{
public:
    MirroredLayout() { QCoreApplication::installTranslator(this); }
    ~MirroredLayout() override { QCoreApplication::removeTranslator(this); }

    MirroredLayout(MirroredLayout const&) = delete;
    MirroredLayout& operator=(MirroredLayout const&) = delete;

    bool isEmpty() const override { return false; }

    QString translate(char const*, char const* text, char const*, int) const override
    {
        return qstrcmp(text, "QT_LAYOUT_DIRECTION") == 0 ? "RTL" : QString();
    }
};

// The style polishes the colors of a desktop by itself.
void SetColors(QPalette palette)
{
    QApplication::style()->polish(palette);
    QApplication::setPalette(palette);
}

void SetUpProgram()
{
    QCoreApplication::setOrganizationName("Tork");
    QCoreApplication::setApplicationName("Velocor");
    qApp->setProperty("caption", "Velocor");
    qApp->setProperty("RootPath", "/opt/velocor/");
    qApp->setProperty("DataPath", Home);
    qApp->setProperty("DocPath", "/home/ada/Documents/");
    QDir(Home).removeRecursively();
    TorkLog::initialize(Home + "logs/", "velocor", QString(), true);
    TestFiles::write(Home + "logs/velocor.log", DemoLog::lifelike());
    TestFiles::write(Home + "logs/velocor.log.1", DemoLog::run(200, QTime(8, 0), "older", true));
    TestFiles::write(Home + "busy.log", BusyHour());
    TestFiles::write(Home + "viewer.cfg", SettingsText);
    TestFiles::write(Home + "broken.cfg", BrokenText);
}

class Camera
{
public:
    Camera(QString const& folder, QString const& suffix) : m_folder(folder), m_suffix(suffix) {}

    void take(QWidget& widget, QString const& name) const
    {
        QTest::qWait(500);
        const QString path = m_folder + "/" + name + m_suffix + ".png";
        if (widget.grab().save(path))
            QTextStream(stdout) << path << "\n";
        else
            QTextStream(stderr) << path << " cannot be written\n";
    }

private:
    QString m_folder;
    QString m_suffix;
};

LogPanel* PanelOf(MainWindow& window)
{
    return window.findChild<LogPanel*>();
}

template <class Widget>
Widget* ByName(QWidget* parent, QString const& accessibleName)
{
    const QList<Widget*> all = parent->findChildren<Widget*>();
    for (Widget* widget : all) {
        if (widget->accessibleName() == accessibleName)
            return widget;
    }
    qFatal("no %s", qPrintable(accessibleName));
}

void Trigger(MainWindow& window, QString const& item)
{
    const QList<QAction*> actions = window.findChildren<QAction*>();
    for (QAction* action : actions) {
        if (QString(action->text()).remove('&') == item)
            action->trigger();
    }
}

void TakeLogViews(MainWindow& window, Camera const& camera)
{
    LogPanel* panel = PanelOf(window);
    auto* table = panel->findChild<QTableView*>();
    panel->GoToProblem(-1);
    camera.take(window, "window");

    auto* filter = panel->findChild<QLineEdit*>();
    filter->setText("index");
    camera.take(window, "filter");
    auto* more = ByName<QAbstractButton>(panel, "More filters");
    more->setChecked(true);
    ByName<QLineEdit>(panel, "Terms of lines to hide")->setText("opened");
    ByName<QComboBox>(panel, "Lines of context")->setCurrentIndex(1);
    camera.take(window, "more");
    panel->ClearFilter();
    more->setChecked(false);
    table->clearSelection();

    panel->SetSince(true);
    panel->SetLeastGap(10 * 1000);
    camera.take(window, "since");
    panel->SetSince(false);
    panel->SetLeastGap(0);

    panel->GoToProblem(-1);
    panel->ToggleMark();
    panel->OpenFind();
    panel->findChild<LogFindBar*>()->findChild<QLineEdit*>()->setText("saved");
    panel->FindNext(-1);
    camera.take(window, "find");
    panel->FindNext(-1);
    panel->GoToMark(1);
    panel->ToggleMark();
    panel->findChild<LogFindBar*>()->Close();
    table->clearSelection();
}

// What a program writes that keeps trying.
QByteArray Repetitive()
{
    QByteArray log;
    QTime time(9, 10, 0, 20);
    const auto add = [&](char const* severity, QString const& message) {
        log += DemoLog::entry(time.toString("HH:mm:ss.zzz"), severity, message);
        time = time.addMSecs(87 + 13 * (message.size() % 5));
    };
    add("Notification", "Synchronizing 1215 documents");
    for (int document = 0; document < 61; ++document)
        add("Trace",
            QString("Sent \"minutes-%1.xml\", %2 bytes").arg(document).arg(811 * document));
    for (int round = 1; round <= 5; ++round) {
        add("Warning", QString("192.168.7.20 does not answer, next attempt in %1 s").arg(round));
        time = time.addSecs(round);
    }
    add("Error", "Stopped after 5 attempts");
    for (int document = 0; document < 24; ++document)
        add("Trace", QString("Kept \"minutes-%1.xml\" for later").arg(61 + document));
    add("Notification", "61 of 1215 documents are up to date");
    return log;
}

void TakeRepeats(MainWindow& window, Camera const& camera)
{
    const QString path = Home + "logs/sync.log";
    TestFiles::write(path, Repetitive());
    window.OpenFile(path);
    LogPanel* panel = window.findChild<FileTabs*>()->currentLog();
    panel->SetFoldsRepeats(true);
    QTest::qWait(500);
    panel->GoToProblem(-1);
    panel->GoToProblem(-1);
    panel->model()->SetRepeatsOpen(panel->view()->CurrentRow(), true);
    camera.take(window, "repeats");
    window.findChild<FileTabs*>()->CloseCurrent();
    QTest::qWait(100); // it is deleted only then
    QFile::remove(path);
}

void TakeAllFiles(MainWindow& window, Camera const& camera)
{
    LogPanel* panel = PanelOf(window);
    Trigger(window, "All Files, by Time");
    QTest::qWait(1000);
    panel->model()->SetFolded(0, true);
    QTest::qWait(500);
    panel->GoToProblem(1);
    panel->view()->scrollToTop();
    camera.take(window, "all-files");
    Trigger(window, "All Files, by Time");
    QTest::qWait(1000);
    panel->findChild<QTableView*>()->clearSelection();
}

void TakeActivity(MainWindow& window, Camera const& camera)
{
    window.OpenFile(Home + "busy.log");
    Trigger(window, "Activity");
    LogPanel* panel = window.findChild<FileTabs*>()->currentLog();
    QTest::qWait(500);
    panel->GoToProblem(-1);
    camera.take(window, "activity");

    auto* more = ByName<QAbstractButton>(panel, "More filters");
    more->setChecked(true);
    ByName<QLineEdit>(panel, "From")->setText("2025-03-03 14:35");
    ByName<QLineEdit>(panel, "Until")->setText("2025-03-03 14:42");
    QTest::qWait(1000);
    panel->GoToProblem(-1);
    camera.take(window, "times");
    panel->ClearFilter();
    more->setChecked(false);
    Trigger(window, "Activity");
    Trigger(window, "Close Tab");
}

// And the bar that says that something is wrong with the log.
void TakePlaces(MainWindow& window, Camera const& camera)
{
    TorkLog::logger()->setEnable(false);
    Trigger(window, "Places");
    QTest::qWait(2500); // the log is checked every two seconds
    camera.take(window, "places");
    TorkLog::logger()->setEnable(true);
    Trigger(window, "Places");
    QTest::qWait(2500);
}

// Of the dialog that a menu item opens.
void TakeDialog(MainWindow& window, QString const& item, Camera const& camera, QString const& name)
{
    QTimer::singleShot(0, [&] {
        QWidget* dialog = QApplication::activeModalWidget();
        camera.take(*dialog, name);
        dialog->close();
    });
    Trigger(window, item);
}

void TakeDialogs(MainWindow& window, Camera const& camera)
{
    TakeDialog(window, "Log Settings...", camera, "log-settings");
    TakeDialog(window, "About Velocor", camera, "about");
    TakeDialog(window, "Keyboard Shortcuts", camera, "shortcuts");
    TakeDialog(window, "Save Report...", camera, "report");
}

// Sorted by severity, as soon as all is counted.
void TakePatterns(MainWindow& window, Camera const& camera)
{
    QTest::qWait(500); // a tab that was closed is gone before the dialog waits
    QTimer::singleShot(0, [&] {
        QWidget* dialog = QApplication::activeModalWidget();
        QTest::qWait(500);
        dialog->findChild<QTreeView*>()->sortByColumn(1, Qt::DescendingOrder);
        camera.take(*dialog, "patterns");
        dialog->close();
    });
    Trigger(window, "Patterns...");
}

void TakeHighlights(MainWindow& window, Camera const& camera)
{
    HighlightRules* rules = window.findChild<FileTabs*>()->highlightRules();
    rules->Add("index");
    rules->Add("import");
    Trigger(window, "Line Wrap");
    camera.take(window, "highlight");
    TakeDialog(window, "Highlight Rules...", camera, "highlight-rules");
    rules->SetRules({});
    Trigger(window, "Line Wrap");
}

// Without changing the file.
void TakeEditing(MainWindow& window, Camera const& camera)
{
    SettingsEditor* editor = window.findChild<FileTabs*>()->currentEditor();
    auto* tree = editor->findChild<QTreeView*>();
    tree->setFocus();
    tree->setCurrentIndex(tree->model()->index(1, 0));
    QTest::keyClick(tree, Qt::Key_Delete);
    tree->setCurrentIndex(tree->model()->index(0, 0, tree->model()->index(1, 0)));
    QTest::keyClick(tree, Qt::Key_F2, Qt::ShiftModifier);
    QTest::keyClicks(tree->findChild<QLineEdit*>(), "timeout");
    camera.take(window, "settings-editing");
    QTest::keyClick(tree->findChild<QLineEdit*>(), Qt::Key_Escape);
    TakeDialog(window, "What Will Be Written...", camera, "settings-written");
    editor->Undo();
    QTest::keyClick(tree, Qt::Key_F, Qt::ControlModifier);
    QTest::keyClicks(ByName<QLineEdit>(editor, "Find in names and values"), "255");
    auto* onlyMatches = ByName<QAbstractButton>(editor, "Only Matches");
    onlyMatches->click();
    camera.take(window, "settings-find");
    onlyMatches->click();
    QTest::keyClick(ByName<QLineEdit>(editor, "Find in names and values"), Qt::Key_Escape);
}

void TakeAll(QString const& folder, QString const& suffix)
{
    const Camera camera(folder, suffix);
    MainWindow window;
    window.resize(1080, 680);
    window.show();
    QTest::qWait(1000);
    TakeLogViews(window, camera);
    TakeRepeats(window, camera);
    TakeAllFiles(window, camera);
    TakeHighlights(window, camera);
    TakeActivity(window, camera);
    TakePatterns(window, camera);
    TakePlaces(window, camera);
    TakeDialogs(window, camera);

    window.OpenFile(Home + "viewer.cfg");
    camera.take(window, "settings");
    TakeEditing(window, camera);
    window.OpenFile(Home + "broken.cfg");
    camera.take(window, "broken-settings");

    window.findChild<QTabWidget*>()->setCurrentIndex(0);
    window.resize(800, 560);
    camera.take(window, "small");
    TestFiles::write(Home + "velocor.cfg", "<VelocorSettings>\n<MainWindow>\n<pan");
    MainWindow damaged;
    damaged.resize(1080, 680);
    damaged.show();
    camera.take(damaged, "damaged");
    QDir(Home).remove("velocor.cfg");
    QDir(Home).remove("velocor.cfg.damaged-1"); // or the next one gets another name
}

// The first view for other readers.
void TakeWindow(QString const& folder, QString const& name)
{
    const Camera camera(folder, QString());
    MainWindow window;
    window.show();
    QTest::qWait(1000);
    PanelOf(window)->GoToProblem(-1);
    camera.take(window, name);
    window.OpenFile(Home + "viewer.cfg");
    camera.take(window, "settings" + name.mid(QString("window").size()));
}

void TakeForOthers(QString const& folder)
{
    TestFiles::write(Home + "velocor.cfg", "<VelocorSettings><MainWindow><language>de</language>"
                                           "</MainWindow></VelocorSettings>");
    TakeWindow(folder, "window-german");
    QDir(Home).remove("velocor.cfg");
    Language::Use("en");
    {
        const MirroredLayout mirrored;
        TakeWindow(folder, "window-mirrored");
    }
    SetColors(Palettes::highContrast());
    TakeWindow(folder, "window-contrast");
    SetColors(Palettes::light());
    QFont large = QApplication::font();
    large.setPointSize(24);
    QApplication::setFont(large);
    TakeWindow(folder, "window-large");
}

} // namespace

int main(int argc, char** argv)
{
    QApplication application(argc, argv);
    const QString folder = application.arguments().value(1, ".");
    QApplication::setStyle(new ReachableStyle); // of Fusion, on a display without a desktop
    SetUpProgram();
    SetColors(Palettes::light());
    TakeAll(folder, QString());
    SetColors(Palettes::dark());
    TakeAll(folder, "-dark");
    SetColors(Palettes::light());
    TakeForOthers(folder);
    TorkLog::shutdown();
    QDir(Home).removeRecursively();
    return 0;
}
