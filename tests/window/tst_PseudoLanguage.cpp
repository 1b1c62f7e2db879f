// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Window, dialogs and menus in two generated languages, one of them written from right to left.

#include "AllDialogs.h"
#include "PseudoLanguage.h"
#include "ShownTexts.h"
#include "WindowParts.h"
#include "WindowTestCase.h"

#include "app/language/Language.h"

#include <QMenu>
#include <QMenuBar>

using namespace Velocor;
using namespace WindowParts;

namespace {

// Whether it is a text for people, and not a name, a number or a plural form, which English has.
bool isText(QString const& text)
{
    static const QRegularExpression word("[A-Za-z]{2}");
    static const QRegularExpression plural("^[0-9., ]+\\S* (line|problem|file|key|item)");
    static const QRegularExpression file("[/\\\\]|\\.(cfg|log)\\W?$|^\\W?(Org|Product)\\W?$");
    return text.contains(word) && !text.contains(plural) && !text.contains(file);
}

void check(QString const& text, QString const& where, QStringList& found)
{
    if (isText(text) && !text.contains('['))
        found.append(where + ": " + text);
}

bool isLanguage(QAction const* action)
{
    const QList<Language> languages = Language::All();
    return std::any_of(languages.begin(), languages.end(), [action](Language const& language) {
        return language.name == action->text();
    });
}

void checkActions(QWidget const* window, QStringList& found)
{
    const QList<QAction*> actions = window->findChildren<QAction*>();
    for (QAction const* action : actions) {
        QObject const* parent = action->parent();
        const bool isOfQt = qobject_cast<QLineEdit const*>(parent) ||
                            qobject_cast<QPlainTextEdit const*>(parent) ||
                            action->objectName().startsWith("_q_");
        if (action->text().isEmpty() || isOfQt || isLanguage(action))
            continue;
        check(action->text(), "action", found);
        check(action->statusTip(), "status tip of " + action->text(), found);
    }
}

void checkHeader(QHeaderView const* header, QStringList& found)
{
    for (int i = 0; header->orientation() == Qt::Horizontal && i < header->count(); ++i)
        check(header->model()->headerData(i, Qt::Horizontal).toString(), "column", found);
}

// The texts of a window that have no brackets.
QStringList untranslated(QWidget* window)
{
    QStringList found;
    checkActions(window, found);
    const QList<QWidget*> widgets = window->findChildren<QWidget*>();
    for (QWidget const* widget : widgets) {
        const QString name = widget->metaObject()->className();
        if (widget->objectName().startsWith("qt_") ||
            qobject_cast<QTabBar*>(widget->parentWidget()))
            continue; // Qt's own texts
        check(widget->accessibleName(), "name of " + name, found);
        check(widget->accessibleDescription(), "description of " + name, found);
        check(widget->statusTip(), "status tip of " + name, found);
        if (auto const* button = qobject_cast<QAbstractButton const*>(widget))
            check(button->text(), name, found);
        if (auto const* label = qobject_cast<QLabel const*>(widget))
            check(label->text(), name, found);
        if (auto const* line = qobject_cast<QLineEdit const*>(widget))
            check(line->placeholderText(), name, found);
        if (auto const* header = qobject_cast<QHeaderView const*>(widget))
            checkHeader(header, found);
    }
    found.removeDuplicates();
    return found;
}

// What is wrong with a window in a generated language.
QString problems(QWidget* window)
{
    return (untranslated(window) + ShownTexts::cutOff(window) + ShownTexts::overlapping(window))
        .join('\n');
}

void addLanguages(QStringList const& names)
{
    QTest::addColumn<PseudoLanguage::Writing>("writing");
    QTest::addColumn<QString>("shown");
    for (QString const& name : names) {
        const QByteArray row = QString(name).remove('&').toUtf8();
        QTest::newRow(row) << PseudoLanguage::Accented << name;
        QTest::newRow(row + ", mirrored") << PseudoLanguage::Mirrored << name;
    }
}

} // namespace

class tst_PseudoLanguage : public WindowTestCase
{
    Q_OBJECT

private slots:
    void files_data();
    void files();
    void bars_data();
    void bars();
    void dialogs_data();
    void dialogs();
    void menus_data();
    void menus();
};

void tst_PseudoLanguage::files_data()
{
    addLanguages({"log", "settings", "broken settings"});
}

void tst_PseudoLanguage::files()
{
    QFETCH(PseudoLanguage::Writing, writing);
    QFETCH(QString, shown);
    const PseudoLanguage language(writing);
    QVERIFY(!language.isEmpty());
    const WindowTest test(DemoLog::run(5, QTime(12, 0), "entry"));
    QStringList files;
    if (shown != "log") {
        files.append(test.folder() + "a.cfg");
        QVERIFY(TestFiles::write(files.first(), shown == "settings" ? Settings : "<a"));
    }
    const auto window = WindowTest::show(files);
    QCOMPARE(problems(window.get()), QString());
}

void tst_PseudoLanguage::bars_data()
{
    addLanguages({"&Find", "&Places", "&Activity", "&Time Since", "All Files, &by Time",
                  "Als&o Filter", "Line N&umbers"});
}

// What is shown on request.
void tst_PseudoLanguage::bars()
{
    QFETCH(PseudoLanguage::Writing, writing);
    QFETCH(QString, shown);
    const PseudoLanguage language(writing);
    const WindowTest test(DemoLog::run(5, QTime(12, 0), "entry"));
    const auto window = WindowTest::show();
    QAction* action = Action(*window, language.of(shown).remove('&'));
    QVERIFY(action);
    action->trigger();
    QTest::qWait(0);
    QCOMPARE(problems(window.get()), QString());
}

void tst_PseudoLanguage::dialogs_data()
{
    addLanguages(AllDialogs::names());
}

void tst_PseudoLanguage::dialogs()
{
    QFETCH(PseudoLanguage::Writing, writing);
    QFETCH(QString, shown);
    const PseudoLanguage language(writing);
    const WindowTest test(DemoLog::run(5, QTime(12, 0), "entry"));
    const QString settings = test.folder() + "a.cfg";
    QVERIFY(TestFiles::write(settings, Settings));
    const auto window = WindowTest::show({settings});
    window->findChild<FileTabs*>()->setCurrentIndex(0);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 5, Patience);
    AllDialogs dialogs(*window, [&](QString const& text) { return language.of(text); });
    bool isShown = false;
    dialogs.with(shown, [&](QDialog* dialog) {
        isShown = true;
        QCOMPARE(problems(dialog), QString());
    });
    QVERIFY(isShown);
}

void tst_PseudoLanguage::menus_data()
{
    addLanguages({"0", "1", "2", "3"});
}

// Menus are on the screen as a whole. Their texts are those of the window's actions.
void tst_PseudoLanguage::menus()
{
    QFETCH(PseudoLanguage::Writing, writing);
    QFETCH(QString, shown);
    const PseudoLanguage language(writing);
    const WindowTest test(DemoLog::run(5, QTime(12, 0), "entry"));
    const auto window = WindowTest::show();
    QMenu* menu = window->menuBar()->actions().at(shown.toInt())->menu();
    QList<QMenu*> menus = menu->findChildren<QMenu*>();
    menus.prepend(menu);
    for (QMenu* one : qAsConst(menus)) {
        if (one->isEmpty())
            continue;
        one->popup(window->geometry().center());
        QVERIFY(QTest::qWaitForWindowExposed(one, Patience));
        QVERIFY2(one->windowHandle()->screen()->geometry().contains(one->geometry()),
                 qPrintable(one->title()));
        one->close();
    }
}

QTEST_MAIN(tst_PseudoLanguage)
#include "tst_PseudoLanguage.moc"
