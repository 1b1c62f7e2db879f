// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The window on a real screen, driven with keys and mouse.

#include "ShownSettings.h"
#include "WindowParts.h"
#include "WindowTestCase.h"

#include "app/settingsfile/SettingsFileWriter.h"
#include "app/window/FileTabs.h"
#include "app/window/settings/SettingsEditor.h"
#include "app/window/widgets/ElidedLabel.h"
#include "app/window/widgets/NoticeBar.h"
#include "common/log/TorkLog.h"

#include <QAbstractButton>
#include <QClipboard>
#include <QLabel>
#include <QLineEdit>
#include <QMenu>
#include <QMessageBox>
#include <QPushButton>
#include <QStatusBar>
#include <QTreeView>
#include <QUndoStack>

using namespace Velocor;
using namespace WindowParts;

class tst_SettingsInWindow : public WindowTestCase
{
    Q_OBJECT

private slots:
    void editsSettings();
    void rejectedNameKeepsTheOld_data();
    void rejectedNameKeepsTheOld();
    void rejectedNameChangesNothing();
    void valueOfAnUnusualNameIsEdited();
    void savesWhatIsBeingTyped();
    void escapeLeavesNothingToSave();
    void sizeOfALongValueIsVisible();
    void statusTextsHaveRoom();
    void losesKnowingly_data();
    void losesKnowingly();
    void saveFails();
    void changedMeanwhile();
    void askedBeforeClosing_data();
    void askedBeforeClosing();

    void closesWhileEditing();

    void everyChangeIsUndone();
    void undoneFromTheMenu();
    void typingIsUndoneInItsField();
    void removalIsToldAndUndone();
    void smallRemovalIsNotTold();
    void noticeGoesWithTheNextChange();
    void savedStateIsClean();
    void problemIsToldWhileTyping_data();
    void problemIsToldWhileTyping();
    void rejectedTypingIsNotSavedOver();
    void tabGoesFromValueToValue();
    void keys_data();
    void keys();
    void commandsGoToOneRow();
    void typingFinds();
    void finds_data();
    void finds();
    void findBarByKeyboard();
    void commandsAreInTheMenus();
    void copiesTheValue();
};

void tst_SettingsInWindow::editsSettings()
{
    const ShownSettings shown;
    QTreeView* tree = shown.tree;
    QCOMPARE(tree->model()->rowCount(), 1);
    QCOMPARE(Cell(tree, 0).data().toString(), QString("Editor"));
    QCOMPARE(CellText(tree, 0, 0, 1), QString("Serif"));
    QVERIFY(!Action(*shown.window, "Save")->isEnabled());

    // A value is changed with the keyboard.
    TypeInto(tree, ItemCell(tree, 0, 0, 1), "Sans & Serif");
    Enter(tree);
    QTRY_VERIFY_WITH_TIMEOUT(shown.editor->isModified(), Patience);
    QVERIFY(Action(*shown.window, "Save")->isEnabled());
    QVERIFY(shown.window->findChild<FileTabs*>()->tabText(1).endsWith("*"));

    // A key is added and named; the name is corrected where the store could not write it.
    QList<QPushButton*> buttons = shown.editor->findChildren<QPushButton*>();
    const auto button = [&](QString const& text) {
        return *std::find_if(buttons.begin(), buttons.end(), [&](QPushButton* candidate) {
            return candidate->text().remove('&') == text;
        });
    };
    Click(button("Add Key"));
    QTRY_VERIFY_WITH_TIMEOUT(tree->findChild<QLineEdit*>(), Patience);
    QTest::keyClicks(tree->findChild<QLineEdit*>(), "two words");
    QTest::keyClick(tree->findChild<QLineEdit*>(), Qt::Key_Return);
    QTRY_COMPARE_WITH_TIMEOUT(CellText(tree, 0, 2, 0), QString("twowords"), Patience);
    QTRY_VERIFY_WITH_TIMEOUT(!tree->findChild<QLineEdit*>(), Patience);
    GoTo(tree, ItemCell(tree, 0, 1, 0));
    Click(button("Remove"));
    Click(button("Add Section"));
    QTRY_VERIFY_WITH_TIMEOUT(tree->findChild<QLineEdit*>(), Patience);
    QTest::keyClicks(tree->findChild<QLineEdit*>(), "1 is no name");
    QTest::keyClick(tree->findChild<QLineEdit*>(), Qt::Key_Return);
    QTRY_VERIFY_WITH_TIMEOUT(!tree->findChild<QLineEdit*>(), Patience);
    QCOMPARE(Cell(tree, 1).data().toString(), QString("Section"));

    QTest::keyClick(shown.window.get(), Qt::Key_S, Qt::ControlModifier);
    QVERIFY(!shown.editor->isModified());
    QCOMPARE(TestFiles::read(shown.file),
             QByteArray("<VelocorSettings>\n<Editor>\n<font><![CDATA[Sans & Serif]]></font>\n"
                        "<twowords>value</twowords>\n</Editor>\n<Section>\n</Section>\n"
                        "</VelocorSettings>\n"));
    QCOMPARE(TestFiles::read(shown.file + ".bak"), Settings);

    // Only the first save keeps a copy.
    SetValue(tree, 0, "again");
    QVERIFY(shown.editor->Save());
    QCOMPARE(TestFiles::read(shown.file + ".bak"), Settings);
}

void tst_SettingsInWindow::rejectedNameKeepsTheOld_data()
{
    QTest::addColumn<bool>("isSection");
    QTest::addColumn<QString>("typed");
    QTest::addColumn<QString>("told");

    const auto row = [](char const* name, bool isSection, char const* typed, char const* told) {
        QTest::newRow(name) << isSection << QString::fromUtf8(typed) << QString::fromUtf8(told);
    };
    row("section with a digit first", true, "1st",
        "\"1st\" is not a valid section or key name, so \"Editor\" is kept. ");
    row("key with a digit first", false, "2nd font",
        "\"2ndfont\" is not a valid section or key name, so \"font\" is kept. ");
    row("place markers", false, "%1%2",
        "\"%1%2\" is not a valid section or key name, so \"font\" is kept. ");
    row("nothing", false, " ", "\"\" is not a valid section or key name, so \"font\" is kept. ");
    row("name of another key", false, "wrap",
        "There is already a \"wrap\" here, so \"font\" is kept.");
    row("name of another section", true, "Other",
        "There is already a \"Other\" here, so \"Editor\" is kept.");
}

void tst_SettingsInWindow::rejectedNameKeepsTheOld()
{
    QFETCH(bool, isSection);
    QFETCH(QString, typed);
    QFETCH(QString, told);
    const QByteArray content =
        QByteArray(Settings).replace("</V", "<Other>\n<k>v</k>\n</Other>\n</V");
    const ShownSettings shown(content);
    QTreeView* tree = shown.tree;
    const QPersistentModelIndex item = isSection ? Cell(tree, 0) : ItemCell(tree, 0, 0, 0);
    const QString old = item.data().toString();

    TypeInto(tree, item, typed);
    Enter(tree);
    QCOMPARE(item.data().toString(), old);
    const QString status = Status(*shown.window);
    QVERIFY2(status.startsWith(told), qPrintable(status));

    // A valid name is still taken afterwards.
    TypeInto(tree, item, "valid");
    Enter(tree);
    QCOMPARE(item.data().toString(), QString("valid"));
    QTest::keyClick(shown.window.get(), Qt::Key_S, Qt::ControlModifier);
    QCOMPARE(TestFiles::read(shown.file), QByteArray(content).replace(old.toLatin1(), "valid"));
}

void tst_SettingsInWindow::rejectedNameChangesNothing()
{
    const ShownSettings shown;
    QTreeView* tree = shown.tree;
    TypeInto(tree, Cell(tree, 0), "C++");
    Enter(tree);
    QVERIFY(!shown.editor->isModified());
    QVERIFY(!Action(*shown.window, "Save")->isEnabled());
}

// The store reads names that it cannot write.
void tst_SettingsInWindow::valueOfAnUnusualNameIsEdited()
{
    const ShownSettings shown(QByteArray(Settings).replace("font", "gr\xC3\xB6\xC3\x9F"
                                                                   "e"));
    QTreeView* tree = shown.tree;
    TypeInto(tree, ItemCell(tree, 0, 0, 1), "12");
    Enter(tree);
    QCOMPARE(CellText(tree, 0, 0, 0), QString::fromUtf8("gr\xC3\xB6\xC3\x9F"
                                                        "e"));
    QCOMPARE(CellText(tree, 0, 0, 1), QString("12"));
}

void tst_SettingsInWindow::savesWhatIsBeingTyped()
{
    const ShownSettings shown;
    QTreeView* tree = shown.tree;
    for (char const* typed : {"Sans", "Mono"}) { // the second time after a save
        TypeInto(tree, ItemCell(tree, 0, 0, 1), typed);
        QTest::keyClick(tree->findChild<QLineEdit*>(), Qt::Key_S, Qt::ControlModifier);
        QCOMPARE(TestFiles::read(shown.file), QByteArray(Settings).replace("Serif", typed));
        QVERIFY(!shown.editor->isModified());
        QTRY_VERIFY_WITH_TIMEOUT(!Action(*shown.window, "Save")->isEnabled(), Patience);
        QTRY_VERIFY_WITH_TIMEOUT(!tree->findChild<QLineEdit*>(), Patience);
    }
}

void tst_SettingsInWindow::escapeLeavesNothingToSave()
{
    const ShownSettings shown;
    QTreeView* tree = shown.tree;
    TypeInto(tree, ItemCell(tree, 0, 0, 1), "Sans");
    QVERIFY(Action(*shown.window, "Save")->isEnabled());
    QTest::keyClick(tree->findChild<QLineEdit*>(), Qt::Key_Escape);
    QTRY_VERIFY_WITH_TIMEOUT(!Action(*shown.window, "Save")->isEnabled(), Patience);
    QCOMPARE(CellText(tree, 0, 0, 1), QString("Serif"));
    QCOMPARE(TestFiles::read(shown.file), Settings);
}

void tst_SettingsInWindow::sizeOfALongValueIsVisible()
{
    const ShownSettings shown(
        QByteArray(Settings).replace("Serif", QByteArray("word ").repeated(5000)));
    QTreeView* tree = shown.tree;
    const QString shownText = CellText(tree, 0, 0, 1);
    const int width = tree->visualRect(ItemCell(tree, 0, 0, 1)).width();
    QVERIFY(width > 50 && width < tree->fontMetrics().boundingRect(shownText).width());
    const QString text = tree->fontMetrics().elidedText(shownText, tree->textElideMode(), width);
    QVERIFY2(text.endsWith("(25 kB)"), qPrintable(text));
}

void tst_SettingsInWindow::statusTextsHaveRoom()
{
    const WindowTest test;
    const QString folder = test.folder() + QString("a-long-name/").repeated(15);
    const QString file = folder + "some.cfg";
    QVERIFY(QDir().mkpath(folder));
    QVERIFY(TestFiles::write(file, Settings));
    const auto window = WindowTest::show();
    window->resize(700, 500);
    window->OpenFile(file);
    auto const* summary = static_cast<ElidedLabel*>(Child<QLabel>(window.get(), "Lines shown"));
    QTRY_COMPARE_WITH_TIMEOUT(summary->text(), file, Patience);
    QTRY_VERIFY2_WITH_TIMEOUT(summary->ShownText().endsWith("/some.cfg"),
                              qPrintable(summary->ShownText()), Patience);
    QVERIFY(summary->width() <= window->width());

    // A message has the whole width.
    auto* tree = Child<QTreeView>(window.get(), "Settings");
    TypeInto(tree, Cell(tree, 0), "C++");
    Enter(tree);
    QVERIFY(!Status(*window).isEmpty());
    QVERIFY(!summary->isVisible());
    window->statusBar()->clearMessage();
    QVERIFY(summary->isVisible());
}

void tst_SettingsInWindow::losesKnowingly_data()
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

void tst_SettingsInWindow::losesKnowingly()
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
    auto* tree = Child<QTreeView>(&editor, "Settings");
    SetValue(tree, 0, value);

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

void tst_SettingsInWindow::saveFails()
{
    const WindowTest test;
    const QString folder = test.folder() + "going/";
    const QString file = folder + "some.cfg";
    QVERIFY(TestFiles::write(file, Settings));
    SettingsEditor editor;
    editor.Open(file);
    editor.show();
    SetValue(Child<QTreeView>(&editor, "Settings"), 0, "v");
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

void tst_SettingsInWindow::changedMeanwhile()
{
    const WindowTest test;
    const QString file = test.folder() + "some.cfg";
    QVERIFY(TestFiles::write(file, Settings));
    SettingsEditor editor;
    editor.Open(file);
    editor.show();
    SetValue(Child<QTreeView>(&editor, "Settings"), 0, "v");
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

void tst_SettingsInWindow::askedBeforeClosing_data()
{
    QTest::addColumn<int>("answer");
    QTest::addColumn<bool>("closes");
    QTest::addColumn<bool>("saves");
    QTest::newRow("save") << int(QMessageBox::Save) << true << true;
    QTest::newRow("discard") << int(QMessageBox::Discard) << true << false;
    QTest::newRow("cancel") << int(QMessageBox::Cancel) << false << false;
}

void tst_SettingsInWindow::askedBeforeClosing()
{
    QFETCH(int, answer);
    QFETCH(bool, closes);
    QFETCH(bool, saves);
    const ShownSettings shown;
    SetValue(shown.tree, 0, "new");
    WindowTest::whenShown<QMessageBox>([&](QMessageBox* box) {
        Click(box->button(static_cast<QMessageBox::StandardButton>(answer)));
    });
    QCOMPARE(shown.window->close(), closes);
    QCOMPARE(TestFiles::read(shown.file).contains("<font>new</font>"), saves);
}

// Text typed into a cell is kept even without the Enter key.
void tst_SettingsInWindow::closesWhileEditing()
{
    for (bool close : {true, false}) {
        ShownSettings shown;
        QTreeView* tree = shown.tree;
        TypeInto(tree, ItemCell(tree, 0, 0, 1), "typed");
        if (close) {
            WindowTest::whenShown<QMessageBox>(
                [&](QMessageBox* box) { Click(box->button(QMessageBox::Save)); });
            QVERIFY(shown.window->close());
            QVERIFY(TestFiles::read(shown.file).contains("typed"));
        }
        shown.window.reset(); // even without having been closed
        QCoreApplication::processEvents();
    }
}

namespace {

QByteArray const Several("<VelocorSettings>\n<A>\n<x>1</x>\n<y>2</y>\n</A>\n<B>\n</B>\n"
                         "<C>\n<z>3</z>\n</C>\n</VelocorSettings>\n");

QByteArray Bytes(SettingsEditor const* editor)
{
    return SettingsFileWriter::ToBytes(editor->document());
}

NoticeBar* Bar(SettingsEditor const* editor, QString const& name)
{
    const QList<NoticeBar*> bars = editor->findChildren<NoticeBar*>();
    for (NoticeBar* bar : bars) {
        if (bar->findChild<QAbstractButton*>()->accessibleName() == "Dismiss " + name)
            return bar;
    }
    return nullptr;
}

QLabel const* Hint(QTreeView const* tree)
{
    const QList<QLabel*> labels = tree->findChildren<QLabel*>();
    for (QLabel const* label : labels) {
        if (label->accessibleName() == "Problem with what is typed")
            return label;
    }
    return nullptr;
}

// A row as "A" or "A/x", and the column.
QString CurrentCell(QTreeView const* tree)
{
    const QModelIndex cell = tree->currentIndex();
    const QString name = cell.sibling(cell.row(), 0).data().toString();
    const QString path =
        cell.parent().isValid() ? cell.parent().data().toString() + '/' + name : name;
    return path + (cell.column() == 0 ? " name" : " value");
}

} // namespace

void tst_SettingsInWindow::everyChangeIsUndone()
{
    const ShownSettings shown(Several);
    QTreeView* tree = shown.tree;
    QList<QByteArray> states{Bytes(shown.editor)};
    const auto note = [&] {
        states.append(Bytes(shown.editor));
    };
    const auto press = [&](Qt::Key key, Qt::KeyboardModifiers modifiers) {
        tree->setFocus();
        QTest::keyClick(tree, key, modifiers);
    };
    SetValue(tree, 0, "new");
    note();
    TypeInto(tree, Cell(tree, 1), "renamed");
    Enter(tree);
    note();
    GoTo(tree, ItemCell(tree, 0, 0, 0));
    press(Qt::Key_D, Qt::ControlModifier);
    note();
    press(Qt::Key_Down, Qt::AltModifier);
    note();
    press(Qt::Key_Delete, Qt::NoModifier);
    note();
    GoTo(tree, Cell(tree, 2));
    press(Qt::Key_Up, Qt::AltModifier);
    note();
    press(Qt::Key_Insert, Qt::NoModifier);
    Enter(tree);
    note();
    press(Qt::Key_Insert, Qt::AltModifier);
    Enter(tree);
    note();
    for (int i = 1; i < states.size(); ++i)
        QVERIFY(states.at(i) != states.at(i - 1));

    for (int i = states.size() - 2; i >= 0; --i) {
        QTest::keyClick(shown.window.get(), Qt::Key_Z, Qt::ControlModifier);
        QCOMPARE(Bytes(shown.editor), states.at(i));
    }
    QVERIFY(!shown.editor->isModified());
    QVERIFY(!Action(*shown.window, "Undo")->isEnabled());
    for (int i = 1; i < states.size(); ++i) {
        QTest::keyClick(shown.window.get(), Qt::Key_Z, Qt::ControlModifier | Qt::ShiftModifier);
        QCOMPARE(Bytes(shown.editor), states.at(i));
    }
    QVERIFY(!Action(*shown.window, "Redo")->isEnabled());
}

void tst_SettingsInWindow::undoneFromTheMenu()
{
    const ShownSettings shown(Several);
    const QByteArray before = Bytes(shown.editor);
    SetValue(shown.tree, 1, "new");
    GoTo(shown.tree, Cell(shown.tree, 2));
    QAction* undo = Action(*shown.window, "Undo Change Value");
    QVERIFY(undo && undo->isEnabled());
    undo->trigger();
    QCOMPARE(Bytes(shown.editor), before);
    QCOMPARE(CurrentCell(shown.tree), QString("A/y value"));
    QAction* redo = Action(*shown.window, "Redo Change Value");
    QVERIFY(redo && redo->isEnabled());
    redo->trigger();
    QCOMPARE(CellText(shown.tree, 0, 1, 1), QString("new"));

    // A log has nothing to undo.
    shown.window->findChild<FileTabs*>()->setCurrentIndex(0);
    QVERIFY(!Action(*shown.window, "Undo")->isEnabled());
}

void tst_SettingsInWindow::typingIsUndoneInItsField()
{
    const ShownSettings shown;
    SetValue(shown.tree, 0, "first");
    TypeInto(shown.tree, ItemCell(shown.tree, 0, 1, 1), "second");
    QTest::keyClick(shown.tree->findChild<QLineEdit*>(), Qt::Key_Z, Qt::ControlModifier);
    QCOMPARE(shown.tree->findChild<QLineEdit*>()->text(), QString("yes"));
    QCOMPARE(CellText(shown.tree, 0, 0, 1), QString("first"));
    Action(*shown.window, "Redo")->trigger();
    Enter(shown.tree);
    QCOMPARE(CellText(shown.tree, 0, 0, 1), QString("first"));
}

void tst_SettingsInWindow::removalIsToldAndUndone()
{
    const ShownSettings shown(Several);
    const QByteArray before = Bytes(shown.editor);
    NoticeBar* notice = Bar(shown.editor, "removal");
    QVERIFY(!notice->isVisible());
    GoTo(shown.tree, Cell(shown.tree, 0));
    QTest::keyClick(shown.tree, Qt::Key_Delete);
    QCOMPARE(shown.tree->model()->rowCount(), 2);
    QVERIFY(notice->isVisible());
    QCOMPARE(notice->text(), QString("Removed section A, with 2 keys: x, y"));
    QCOMPARE(Action(*shown.window, "Undo Remove Section")->isEnabled(), true);
    const QList<QAbstractButton*> buttons = notice->findChildren<QAbstractButton*>();
    for (QAbstractButton* button : buttons) {
        if (button->text() == "Undo")
            Click(button);
    }
    QCOMPARE(Bytes(shown.editor), before);
    QVERIFY(!notice->isVisible());
    QCOMPARE(CurrentCell(shown.tree), QString("A name"));
}

void tst_SettingsInWindow::smallRemovalIsNotTold()
{
    const ShownSettings shown(Several);
    GoTo(shown.tree, Cell(shown.tree, 2));
    QTest::keyClick(shown.tree, Qt::Key_Delete);
    QCOMPARE(shown.tree->model()->rowCount(), 2);
    QVERIFY(!Bar(shown.editor, "removal")->isVisible());
}

void tst_SettingsInWindow::noticeGoesWithTheNextChange()
{
    const ShownSettings shown(Several);
    GoTo(shown.tree, ItemCell(shown.tree, 0, 0, 0));
    QTest::keyClick(shown.tree, Qt::Key_Down, Qt::ShiftModifier);
    QTest::keyClick(shown.tree, Qt::Key_Delete);
    QCOMPARE(Bar(shown.editor, "removal")->text(), QString("Removed 2 keys: x, y"));
    QTest::keyClick(shown.tree, Qt::Key_Insert, Qt::AltModifier);
    QVERIFY(!Bar(shown.editor, "removal")->isVisible());
}

// Undoing past a save is a change again.
void tst_SettingsInWindow::savedStateIsClean()
{
    const ShownSettings shown;
    SetValue(shown.tree, 0, "new");
    QTest::keyClick(shown.window.get(), Qt::Key_S, Qt::ControlModifier);
    QVERIFY(!shown.editor->isModified());
    QTest::keyClick(shown.window.get(), Qt::Key_Z, Qt::ControlModifier);
    QVERIFY(shown.editor->isModified());
    QVERIFY(shown.window->findChild<FileTabs*>()->tabText(1).endsWith("*"));
    QTest::keyClick(shown.window.get(), Qt::Key_S, Qt::ControlModifier);
    QCOMPARE(TestFiles::read(shown.file), Settings);
}

void tst_SettingsInWindow::problemIsToldWhileTyping_data()
{
    QTest::addColumn<bool>("isName");
    QTest::addColumn<QString>("typed");
    QTest::addColumn<QString>("told");

    const auto row = [](char const* name, bool isName, char const* typed, char const* told) {
        QTest::newRow(name) << isName << QString::fromUtf8(typed) << QString::fromUtf8(told);
    };
    row("digit first", true, "1",
        "\"1\" is not a valid section or key name. "
        "Use letters, digits, \"_\", \"-\" and \".\"; start with a letter or \"_\"");
    row("name of another key", true, "wrap", "There is already a \"wrap\" here");
    row("name of the root element", true, "VelocorSettings",
        "\"VelocorSettings\" is the name of the root element");
    row("the old name", true, "font", "");
    row("another name", true, "fonts", "");
    row("spaces are removed", true, "my font", "");
    row("value outside Latin-1", false, "\xE2\x82\xAC", "characters outside Latin-1 become \"?\"");
    row("value with the end of CDATA", false, "]]>",
        "a value with \"]]>\" makes the file unreadable");
    row("ordinary value", false, "a & b", "");
}

void tst_SettingsInWindow::problemIsToldWhileTyping()
{
    QFETCH(bool, isName);
    QFETCH(QString, typed);
    QFETCH(QString, told);
    const ShownSettings shown;
    QLineEdit* field = StartEditing(shown.tree, ItemCell(shown.tree, 0, 0, isName ? 0 : 1));
    QGuiApplication::clipboard()->setText(typed); // no key of the tests types all of them
    QTest::keyClick(field, Qt::Key_V, Qt::ControlModifier);
    QCOMPARE(field->text(), typed);
    QLabel const* hint = Hint(shown.tree);
    QCOMPARE(hint->isVisible(), !told.isEmpty());
    QCOMPARE(hint->text(), told);
    QCOMPARE(field->accessibleDescription(), told);
    const bool isColored = field->palette().base() != shown.tree->palette().base();
    QCOMPARE(isColored, !told.isEmpty());
    QVERIFY(!hint->isVisible() || !hint->geometry().intersects(field->geometry()));
    QVERIFY(shown.tree->viewport()->rect().contains(hint->geometry()));

    // It goes as soon as the text is good.
    QTest::keyClick(field, Qt::Key_A, Qt::ControlModifier);
    QTest::keyClicks(field, "good");
    QVERIFY(!hint->isVisible());
    QVERIFY(field->palette().base() == shown.tree->palette().base());
}

void tst_SettingsInWindow::rejectedTypingIsNotSavedOver()
{
    const ShownSettings shown;
    SetValue(shown.tree, 0, "new");
    TypeInto(shown.tree, ItemCell(shown.tree, 0, 0, 0), "1st");
    QTest::keyClick(shown.tree->findChild<QLineEdit*>(), Qt::Key_S, Qt::ControlModifier);
    QVERIFY2(Status(*shown.window).contains("so \"font\" is kept"),
             qPrintable(Status(*shown.window)));
    QCOMPARE(TestFiles::read(shown.file), Settings);
    QTest::keyClick(shown.window.get(), Qt::Key_S, Qt::ControlModifier);
    QCOMPARE(TestFiles::read(shown.file), QByteArray(Settings).replace("Serif", "new"));
}

void tst_SettingsInWindow::tabGoesFromValueToValue()
{
    const ShownSettings shown(Several);
    QTreeView* tree = shown.tree;
    const auto press = [&](Qt::Key key, Qt::KeyboardModifiers modifiers) {
        QPointer<QLineEdit> field(tree->findChild<QLineEdit*>());
        QTest::keyClick(field, key, modifiers);
        QTRY_VERIFY_WITH_TIMEOUT(!field, Patience);
    };
    TypeInto(tree, ItemCell(tree, 0, 0, 0), "renamed");
    press(Qt::Key_Tab, Qt::NoModifier);
    QCOMPARE(CurrentCell(tree), QString("A/renamed value"));
    QTest::keyClicks(tree->findChild<QLineEdit*>(), "one");
    press(Qt::Key_Tab, Qt::NoModifier);
    QCOMPARE(CurrentCell(tree), QString("A/y value"));
    QTest::keyClicks(tree->findChild<QLineEdit*>(), "two");
    press(Qt::Key_Tab, Qt::NoModifier);
    QCOMPARE(CurrentCell(tree), QString("C/z value")); // B is empty
    press(Qt::Key_Backtab, Qt::ShiftModifier);
    QCOMPARE(CurrentCell(tree), QString("A/y value"));
    press(Qt::Key_Tab, Qt::NoModifier);
    press(Qt::Key_Tab, Qt::NoModifier);
    QVERIFY(!tree->findChild<QLineEdit*>());
    QCOMPARE(CellText(tree, 0, 0, 1), QString("one"));
    QCOMPARE(CellText(tree, 0, 1, 1), QString("two"));
    QCOMPARE(CellText(tree, 2, 0, 1), QString("3"));
}

void tst_SettingsInWindow::keys_data()
{
    QTest::addColumn<int>("key");
    QTest::addColumn<int>("modifiers");
    QTest::addColumn<int>("section");
    QTest::addColumn<int>("item");
    QTest::addColumn<QString>("current");
    QTest::addColumn<bool>("isEditing");
    QTest::addColumn<QString>("change");

    const auto row = [](char const* name, int key, int modifiers, int section, int item,
                        char const* current, bool isEditing, char const* change) {
        QTest::newRow(name) << key << modifiers << section << item << current << isEditing
                            << change;
    };
    const int alt = Qt::AltModifier;
    const int control = Qt::ControlModifier;
    row("F2 edits the value", Qt::Key_F2, 0, 0, 0, "A/x value", true, "");
    row("F2 edits the name of a section", Qt::Key_F2, 0, 0, -1, "A name", true, "");
    row("Enter edits the value", Qt::Key_Return, 0, 0, 0, "A/x value", true, "");
    row("Enter of the key pad, too", Qt::Key_Enter, Qt::KeypadModifier, 0, 0, "A/x value", true,
        "");
    row("Shift+F2 edits the name", Qt::Key_F2, Qt::ShiftModifier, 0, 0, "A/x name", true, "");
    row("Insert adds a key", Qt::Key_Insert, 0, 0, 0, "A/key name", true, "Add Key");
    row("Insert adds a key to a section", Qt::Key_Insert, 0, 1, -1, "B/key name", true, "Add Key");
    row("Alt+Insert adds a section", Qt::Key_Insert, alt, 0, 0, "Section name", true,
        "Add Section");
    row("Delete removes a key", Qt::Key_Delete, 0, 0, 0, "A/y name", false, "Remove Key");
    row("Delete removes a section", Qt::Key_Delete, 0, 0, -1, "B name", false, "Remove Section");
    row("Delete removes the last key", Qt::Key_Delete, 0, 2, 0, "C name", false, "Remove Key");
    row("Ctrl+D copies a key", Qt::Key_D, control, 0, 0, "A/x2 name", false, "Duplicate Key");
    row("Ctrl+D copies a section", Qt::Key_D, control, 0, -1, "A2 name", false,
        "Duplicate Section");
    row("Alt+Down moves a key", Qt::Key_Down, alt, 0, 0, "A/x name", false, "Move Key");
    row("Alt+Up moves a section", Qt::Key_Up, alt, 2, -1, "C name", false, "Move Section");
    row("Alt+Up at the top does nothing", Qt::Key_Up, alt, 0, 0, "A/x name", false, "");
    row("Alt+Down at the bottom does nothing", Qt::Key_Down, alt, 2, -1, "C name", false, "");
}

void tst_SettingsInWindow::keys()
{
    QFETCH(int, key);
    QFETCH(int, modifiers);
    QFETCH(int, section);
    QFETCH(int, item);
    QFETCH(QString, current);
    QFETCH(bool, isEditing);
    QFETCH(QString, change);
    const ShownSettings shown(Several);
    QTreeView* tree = shown.tree;
    tree->setFocus();
    GoTo(tree, item < 0 ? Cell(tree, section) : ItemCell(tree, section, item, 0));
    QTest::keyClick(tree, Qt::Key(key), Qt::KeyboardModifiers(modifiers));
    QCOMPARE(CurrentCell(tree), current);
    QCOMPARE(tree->findChild<QLineEdit*>() != nullptr, isEditing);
    QCOMPARE(shown.editor->undoStack()->undoText(), change);
}

// The next command is about the row that the last one went to, and about no other, although the
// Control key was pressed.
void tst_SettingsInWindow::commandsGoToOneRow()
{
    const ShownSettings shown(Several);
    const QByteArray before = Bytes(shown.editor);
    GoTo(shown.tree, ItemCell(shown.tree, 0, 0, 0));
    shown.tree->setFocus();
    QTest::keyClick(shown.tree, Qt::Key_D, Qt::ControlModifier);
    QTest::keyClick(shown.tree, Qt::Key_Delete);
    QCOMPARE(Bytes(shown.editor), before);
    GoTo(shown.tree, Cell(shown.tree, 2));
    QTest::keyClick(shown.window.get(), Qt::Key_Z, Qt::ControlModifier);
    QCOMPARE(CurrentCell(shown.tree), QString("A/x2 name"));
    QTest::keyClick(shown.tree, Qt::Key_Delete);
    QCOMPARE(Bytes(shown.editor), before);
}

void tst_SettingsInWindow::typingFinds()
{
    const ShownSettings shown(Several);
    QTreeView* tree = shown.tree;
    const QByteArray before = Bytes(shown.editor);
    GoTo(tree, ItemCell(tree, 0, 0, 1)); // values are not searched
    QTest::keyClicks(tree, "z");
    QCOMPARE(CurrentCell(tree), QString("C/z name"));
    QVERIFY(!tree->findChild<QLineEdit*>());
    QCOMPARE(Bytes(shown.editor), before);
}

void tst_SettingsInWindow::finds_data()
{
    QTest::addColumn<QString>("text");
    QTest::addColumn<QString>("keys"); // n: next, p: previous
    QTest::addColumn<QString>("current");
    QTest::addColumn<QString>("result");

    const auto row = [](char const* name, char const* text, char const* keys, char const* current,
                        char const* result) {
        QTest::newRow(name) << text << keys << current << result;
    };
    row("a value", "3", "", "C/z value", "1 of 1");
    row("a name in another case", "Y", "", "A/y name", "1 of 1");
    row("a section", "b", "", "B name", "1 of 1");
    row("where it is already", "a", "", "A name", "1 of 1");
    row("the only match again", "z", "nn", "C/z name", "1 of 1");
    row("around the end", "a", "n", "A name", "1 of 1");
    row("from name to value", "1", "", "A/x value", "1 of 1");
    row("the previous one, around the start", "c", "p", "C name", "1 of 1");
    row("nowhere", "none", "", "A name", "No match");
    row("nowhere, asked again", "none", "np", "A name", "No match");
}

void tst_SettingsInWindow::finds()
{
    QFETCH(QString, text);
    QFETCH(QString, keys);
    QFETCH(QString, current);
    QFETCH(QString, result);
    const ShownSettings shown(Several);
    const QByteArray before = Bytes(shown.editor);
    shown.tree->setFocus();
    QTest::keyClick(shown.tree, Qt::Key_F, Qt::ControlModifier);
    auto* field = Child<QLineEdit>(shown.editor, "Find in names and values");
    QVERIFY(field->isVisible() && field->hasFocus());
    QTest::keyClicks(field, text);
    for (QChar key : keys)
        QTest::keyClick(field, Qt::Key_F3, key == 'p' ? Qt::ShiftModifier : Qt::NoModifier);
    QCOMPARE(CurrentCell(shown.tree), current);
    QCOMPARE(Child<QLabel>(shown.editor, "Result of the search")->text(), result);
    QCOMPARE(Bytes(shown.editor), before);
}

// Both ways through all matches, from the bar and from the tree.
void tst_SettingsInWindow::findBarByKeyboard()
{
    const ShownSettings shown(QByteArray(Several).replace(">3<", ">x1<"));
    QTreeView* tree = shown.tree;
    tree->setFocus();
    QTest::keyClick(tree, Qt::Key_F3); // nothing to find yet
    auto* field = Child<QLineEdit>(shown.editor, "Find in names and values");
    QVERIFY(field->hasFocus());
    QTest::keyClicks(field, "x");
    QCOMPARE(CurrentCell(tree), QString("A/x name"));
    QTest::keyClick(field, Qt::Key_Return);
    QCOMPARE(CurrentCell(tree), QString("C/z value"));
    QTest::keyClick(field, Qt::Key_Return, Qt::ShiftModifier);
    QCOMPARE(CurrentCell(tree), QString("A/x name"));
    QTest::keyClick(field, Qt::Key_Escape);
    QVERIFY(!field->isVisible() && tree->hasFocus());
    QTest::keyClick(tree, Qt::Key_F3);
    QCOMPARE(CurrentCell(tree), QString("C/z value"));
    QTest::keyClick(tree, Qt::Key_F3);
    QCOMPARE(CurrentCell(tree), QString("A/x name"));
    QTest::keyClick(tree, Qt::Key_F3, Qt::ShiftModifier);
    QCOMPARE(CurrentCell(tree), QString("C/z value"));
    QVERIFY(!field->isVisible());
}

// The same commands in the window's menu and in the context menu, each with its key.
void tst_SettingsInWindow::commandsAreInTheMenus()
{
    const ShownSettings shown(Several);
    QMenu const* menu = Action(*shown.window, "Settings File")->menu();
    QStringList entries;
    QString letters;
    const QList<QAction*> actions = menu->actions();
    for (QAction const* action : actions) {
        entries.append(ActionText(action) + '\t' + action->shortcut().toString());
        QVERIFY(!action->statusTip().isEmpty());
        letters += action->text().at(action->text().indexOf('&') + 1).toLower();
    }
    QCOMPARE(entries,
             QStringList(
                 {"Edit Value\tF2", "Edit in Large Field\tCtrl+Return", "Toggle\tSpace",
                  "Choose Kind\tCtrl+K", "Rename\tShift+F2", "Add Key\tIns", "Add Section\tAlt+Ins",
                  "Duplicate\tCtrl+D", "Remove\tDel", "Move Up\tAlt+Up", "Move Down\tAlt+Down",
                  "Back to Default\tCtrl+Backspace", "All Back to Default\tCtrl+Shift+Backspace",
                  "Find\tCtrl+F", "Find Next\tF3", "Find Previous\tShift+F3",
                  "Edit as Text\tCtrl+T", "Saved States...\tCtrl+Shift+T"}));
    for (QChar letter : letters)
        QCOMPARE(letters.count(letter), 1);
    QList<QAction*> inContext = shown.tree->actions();
    QCOMPARE(ActionText(inContext.takeFirst()), QString("Undo"));
    QCOMPARE(ActionText(inContext.takeFirst()), QString("Redo"));
    QVERIFY(inContext.takeFirst()->isSeparator());
    QCOMPARE(inContext, actions);

    GoTo(shown.tree, Cell(shown.tree, 0));
    actions.at(8)->trigger();
    QCOMPARE(shown.tree->model()->rowCount(), 2);
    shown.window->findChild<FileTabs*>()->setCurrentIndex(0);
    QVERIFY(menu->isEmpty() && !menu->menuAction()->isEnabled());
}

void tst_SettingsInWindow::copiesTheValue()
{
    const ShownSettings shown;
    shown.tree->setFocus();
    GoTo(shown.tree, ItemCell(shown.tree, 0, 0, 0));
    QTest::keyClick(shown.window.get(), Qt::Key_C, Qt::ControlModifier);
    QCOMPARE(QGuiApplication::clipboard()->text(), QString("Serif"));
}

QTEST_MAIN(tst_SettingsInWindow)

#include "tst_SettingsInWindow.moc"
