// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The window in each of its languages.

#include "WindowParts.h"
#include "WindowTestCase.h"

#include "app/language/Language.h"
#include "app/window/FileTabs.h"
#include "app/window/settings/SettingsEditor.h"

#include "common/log/TorkLog.h"

#include <QDirIterator>
#include <QMap>
#include <QMenu>
#include <QMenuBar>
#include <QRegularExpression>
#include <QTreeView>

using namespace Velocor;
using namespace WindowParts;

namespace {

// A program's surroundings in which a language was chosen.
class ChosenLanguage : public WindowTest
{
public:
    explicit ChosenLanguage(QString const& code)
    {
        if (!TestFiles::write(settingsFile(),
                              "<VelocorSettings>\n<MainWindow>\n<language>" + code.toUtf8() +
                                  "</language>\n</MainWindow>\n</VelocorSettings>\n"))
            qFatal("the settings cannot be written");
    }
};

// Those that have the letter of another one in the same menu, and those of menus below.
QStringList SameMnemonics(QList<QAction*> const& actions, QString const& menu)
{
    QStringList same;
    QMap<QString, QString> letters;
    for (QAction* action : actions) {
        const QString text = QString(action->text()).remove("&&");
        const int at = text.indexOf('&');
        if (at >= 0) {
            const QString letter = text.mid(at + 1, 1).toLower();
            if (letters.contains(letter))
                same.append(menu + ": " + letters.value(letter) + ", " + text);
            letters.insert(letter, text);
        }
        if (action->menu())
            same += SameMnemonics(action->menu()->actions(), text);
    }
    return same;
}

// What the program leaves behind, without stamps, the folder of the test, the choice itself, and
// the widths of columns, which fit the names of severities as shown.
QMap<QString, QByteArray> Files(TestRun const& run)
{
    const QRegularExpression stamp("\\d{4}-\\d\\d-\\d\\d[ T]\\d\\d:\\d\\d:\\d\\d\\.\\d{1,3}");
    QMap<QString, QByteArray> files;
    QDirIterator all(run.folder(), QDir::Files | QDir::Hidden, QDirIterator::Subdirectories);
    while (all.hasNext()) {
        const QString path = all.next();
        QString text = QString::fromLatin1(TestFiles::read(path));
        text.replace(stamp, "STAMP").replace(run.folder(), "FOLDER/");
        text.remove(QRegularExpression(
            "<language>[^<]*</language>|<columns(Language)?>[^<]*</columns(Language)?>"));
        files.insert(path.mid(run.folder().size()), text.toLatin1());
    }
    return files;
}

QMap<QString, QByteArray> FilesOfAWindow(QString const& language)
{
    const ChosenLanguage test(language);
    {
        const auto window = WindowTest::show();
        for (QtMsgType type : {QtDebugMsg, QtInfoMsg, QtWarningMsg, QtCriticalMsg})
            TorkLog_MessageHandler(type, QMessageLogContext(), "entry");
        [&] {
            QTRY_VERIFY_WITH_TIMEOUT(Rows(*window) >= 4, Patience);
        }();
        window->close();
    }
    return Files(test);
}

// A settings file with a key that was added to it.
QByteArray SettingsWithKey(QString const& language)
{
    const ChosenLanguage test(language);
    const QString file = test.folder() + "shop.cfg";
    if (!TestFiles::write(file, Settings))
        qFatal("the settings file cannot be written");
    const auto window = WindowTest::show();
    window->OpenFile(file);
    SettingsEditor* editor = window->findChild<FileTabs*>()->currentEditor();
    auto* tree = editor->findChild<QTreeView*>();
    tree->setCurrentIndex(tree->model()->index(0, 0));
    QTest::keyClick(tree, Qt::Key_Insert);
    editor->Save();
    return TestFiles::read(file);
}

} // namespace

class tst_LanguagesInWindow : public WindowTestCase
{
    Q_OBJECT

private slots:
    void menus_data();
    void menus();
    void unknownLanguage();
    void columnsFitTheLanguage();
    void filesDoNotDependOnIt();
    void addedKeyDoesNotDependOnIt();

protected slots:
    void cleanup() override;
};

void tst_LanguagesInWindow::cleanup()
{
    WindowTestCase::cleanup();
    Language::Use("en");
}

void tst_LanguagesInWindow::menus_data()
{
    QTest::addColumn<QString>("open");
    QTest::newRow("en") << "Open...";
    QTest::newRow("de") << QString::fromUtf8("\xC3\x96"
                                             "ffnen...");
    QTest::newRow("fr") << "Ouvrir...";
}

void tst_LanguagesInWindow::menus()
{
    const QString code = QTest::currentDataTag();
    const ChosenLanguage test(code);
    const auto window = WindowTest::show();
    QFETCH(QString, open);
    QVERIFY(Action(*window, open));
    const QStringList same = SameMnemonics(window->menuBar()->actions(), "menu bar");
    QVERIFY2(same.isEmpty(), qPrintable(same.join('\n')));
    QStringList chosen;
    const QList<QAction*> actions = window->findChildren<QAction*>();
    for (QAction* action : actions) {
        if (action->isChecked() && action->data() == code)
            chosen.append(action->text());
    }
    QCOMPARE(chosen.size(), 1);
}

void tst_LanguagesInWindow::unknownLanguage()
{
    const ChosenLanguage test("tlh");
    {
        const auto window = WindowTest::show();
        QVERIFY(Action(*window, "System Language"));
        QVERIFY(Action(*window, "System Language")->isChecked());
        window->close();
    }
    QVERIFY(!TestFiles::read(test.settingsFile()).contains("tlh"));
}

// A width that the user chose is kept, but only for the language that it was chosen in.
void tst_LanguagesInWindow::columnsFitTheLanguage()
{
    const ChosenLanguage test("en");
    const auto widthsIn = [](QString const& code, std::function<void(MainWindow&)> const& work) {
        const auto window = WindowTest::show();
        Panel(*window)->SetTextFont(QFont());
        work(*window);
        const QList<int> widths = Panel(*window)->columnWidths();
        const QList<QAction*> actions = window->findChildren<QAction*>();
        for (QAction* action : actions) {
            if (action->actionGroup() && action->data() == code)
                action->trigger();
        }
        window->close();
        return widths;
    };
    const QList<int> english = widthsIn("en", [](MainWindow& window) {
        View(window)->setColumnWidth(LogModel::SeverityColumn, 60);
    });
    QCOMPARE(english.at(LogModel::SeverityColumn), 60);
    QCOMPARE(widthsIn("fr", [](MainWindow&) {}), english);
    const QList<int> french = widthsIn("de", [](MainWindow& window) {
        const QString longest = "Avertissement";
        QVERIFY(View(window)->columnWidth(LogModel::SeverityColumn) >
                View(window)->fontMetrics().boundingRect(longest).width() + 24);
    });
    QVERIFY(french != english);
}

void tst_LanguagesInWindow::filesDoNotDependOnIt()
{
    const QMap<QString, QByteArray> english = FilesOfAWindow("en");
    QVERIFY(english.value("data/logs/app.log").contains("Warning"));
    QVERIFY(english.contains("data/velocor.cfg"));
    const QStringList names = english.keys();
    for (char const* code : {"de", "fr"}) {
        const QMap<QString, QByteArray> others = FilesOfAWindow(code);
        QCOMPARE(QStringList(others.keys()), names);
        for (QString const& name : names)
            QCOMPARE(others.value(name).split('\n'), english.value(name).split('\n'));
    }
}

void tst_LanguagesInWindow::addedKeyDoesNotDependOnIt()
{
    const QByteArray english = SettingsWithKey("en");
    QVERIFY2(english.contains("<key>value</key>"), english);
    for (char const* code : {"de", "fr"})
        QCOMPARE(SettingsWithKey(code), english);
}

QTEST_MAIN(tst_LanguagesInWindow)

#include "tst_LanguagesInWindow.moc"
