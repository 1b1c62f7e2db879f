// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Values of each kind in the settings editor, changed with keys and mouse.

#include "ShownSettings.h"
#include "WindowTestCase.h"

#include "app/settingsfile/TypedText.h"
#include "app/window/settings/FileListDialog.h"
#include "app/window/settings/SettingsModel.h"
#include "app/window/settings/SizeDialog.h"
#include "app/window/settings/ValueDialog.h"
#include "app/window/settings/WindowPlaceDialog.h"

#include <QColorDialog>
#include <QDialogButtonBox>
#include <QFontDialog>
#include <QLabel>
#include <QListWidget>
#include <QMenu>
#include <QPlainTextEdit>
#include <QPushButton>
#include <QSpinBox>
#include <QUndoStack>

using namespace Velocor;
using namespace WindowParts;

class tst_SettingsByKind : public WindowTestCase
{
    Q_OBJECT

private slots:
    void kindIsShown_data();
    void kindIsShown();
    void iconOfAColorHasIt();
    void checkBoxIsClicked();
    void spaceToggles();
    void numberIsStepped_data();
    void numberIsStepped();
    void guessedNumberBecomesText();
    void chosenNumberStays();
    void colorIsChosen();
    void sizeIsTyped();
    void fontIsChosen();
    void windowPlaceIsFitted();
    void filesAreListed();
    void separatorIsNoName();
    void textIsEditedInALargeField();
    void lineBreaksAreKept();
    void unchangedValueKeepsItsBytes_data();
    void unchangedValueKeepsItsBytes();
    void kindsToChooseFrom();
    void choiceIsTakenBack();
    void tabOpensNoDialog();
    void writtenAsTheStoreDoes();
};

namespace {

enum Item { Wrap, Tabs, Ink, Icon, Family, Recent, Title };

QByteArray const Kinds("<VelocorSettings>\n<Editor>\n<wrap>yes</wrap>\n<tabs>2</tabs>\n"
                       "<ink>1,2,3</ink>\n<icon>16,24</icon>\n"
                       "<font>Sans,10,-1,5,50,0,0,0,0,0</font>\n<recent>/a|/b|/c</recent>\n"
                       "<title>words</title>\n</Editor>\n<ApplicationScreens>\n"
                       "<Main>-50,10,800,600</Main>\n</ApplicationScreens>\n</VelocorSettings>\n");

QString Value(ShownSettings const& shown, int item, int section = 0)
{
    return ItemCell(shown.tree, section, item, 1).data(Qt::EditRole).toString();
}

void Press(ShownSettings const& shown, int item, Qt::Key key,
           Qt::KeyboardModifiers modifiers = Qt::NoModifier, int section = 0)
{
    shown.tree->setFocus();
    GoTo(shown.tree, ItemCell(shown.tree, section, item, 1));
    QTest::keyClick(shown.tree, key, modifiers);
}

// Edits a value with the keyboard in the dialog that this opens; `work` closes it.
template <class Dialog>
void InDialog(ShownSettings const& shown, int item, std::function<void(Dialog*)> const& work,
              Qt::Key key = Qt::Key_F2, Qt::KeyboardModifiers modifiers = Qt::NoModifier,
              int section = 0)
{
    bool isDone = false;
    WindowTest::whenShown<Dialog>([&](Dialog* dialog) {
        QVERIFY(WindowTest::activate(dialog));
        work(dialog);
        isDone = true;
    });
    Press(shown, item, key, modifiers, section);
    QTRY_VERIFY_WITH_TIMEOUT(isDone, Patience);
    QVERIFY(WindowTest::activate(shown.window.get()));
}

// Chooses an entry of the menu of kinds with the keyboard.
void ChooseKind(ShownSettings const& shown, int item, QString const& name)
{
    Press(shown, item, Qt::Key_K, Qt::ControlModifier);
    QMenu* menu = nullptr;
    QTRY_VERIFY_WITH_TIMEOUT((menu = qobject_cast<QMenu*>(QApplication::activePopupWidget())),
                             Patience);
    for (int i = 0; i < menu->actions().size(); ++i) {
        if (menu->activeAction() && ActionText(menu->activeAction()) == name)
            break;
        QTest::keyClick(menu, Qt::Key_Down);
    }
    QCOMPARE(ActionText(menu->activeAction()), name);
    QTest::keyClick(menu, Qt::Key_Return);
    QTRY_VERIFY_WITH_TIMEOUT(!QApplication::activePopupWidget(), Patience);
}

QPushButton* OkButton(QDialog* dialog)
{
    const QList<QDialogButtonBox*> boxes = dialog->findChildren<QDialogButtonBox*>();
    for (QDialogButtonBox const* box : boxes) {
        if (QPushButton* button = box->button(QDialogButtonBox::Ok))
            return button;
    }
    return nullptr;
}

void TypeNumber(QSpinBox* field, QString const& number)
{
    field->setFocus();
    QTest::keyClick(field, Qt::Key_A, Qt::ControlModifier);
    QTest::keyClicks(field, number);
}

} // namespace

void tst_SettingsByKind::kindIsShown_data()
{
    QTest::addColumn<int>("section");
    QTest::addColumn<int>("item");
    QTest::addColumn<QString>("kind");

    const auto row = [](char const* name, int section, int item, char const* kind) {
        QTest::newRow(name) << section << item << QString(kind);
    };
    row("yes or no", 0, Wrap, "Yes or no");
    row("number", 0, Tabs, "Number");
    row("color", 0, Ink, "Color");
    row("size", 0, Icon, "Size");
    row("font", 0, Family, "Font");
    row("file list", 0, Recent, "File list");
    row("text", 0, Title, "Text");
    row("window place", 1, 0, "Window place");
}

// To the eye and to a screen reader.
void tst_SettingsByKind::kindIsShown()
{
    QFETCH(int, section);
    QFETCH(int, item);
    QFETCH(QString, kind);
    const ShownSettings shown(Kinds);
    const QModelIndex cell = ItemCell(shown.tree, section, item, 1);
    QCOMPARE(cell.data(Qt::AccessibleDescriptionRole).toString(), kind);
    const bool isYesNo = kind == "Yes or no";
    QCOMPARE(cell.data(Qt::CheckStateRole).isValid(), isYesNo);
    QCOMPARE(cell.data(Qt::DecorationRole).value<QIcon>().isNull(), isYesNo);
    QVERIFY(!Cell(shown.tree, section, 1).data(Qt::DecorationRole).isValid());
}

void tst_SettingsByKind::iconOfAColorHasIt()
{
    const ShownSettings shown(QByteArray(Kinds).replace("1,2,3", "10,200,30"));
    GoTo(shown.tree, Cell(shown.tree, 0));
    QVERIFY(Pixels(shown.tree->viewport(), QColor(10, 200, 30)) > 50);
}

void tst_SettingsByKind::checkBoxIsClicked()
{
    const ShownSettings shown(Kinds);
    const QRect cell = shown.tree->visualRect(ItemCell(shown.tree, 0, Wrap, 1));
    const auto click = [&](int x) {
        QTest::mouseClick(shown.tree->viewport(), Qt::LeftButton, Qt::NoModifier,
                          QPoint(x, cell.center().y()));
    };
    click(cell.left() + 9);
    QCOMPARE(Value(shown, Wrap), QString("no"));
    QCOMPARE(shown.editor->undoStack()->undoText(), QString("Change Value"));
    click(cell.left() + 9);
    QCOMPARE(Value(shown, Wrap), QString("yes"));
    click(cell.left() + 60);
    QCOMPARE(Value(shown, Wrap), QString("yes"));
    QTest::keyClick(shown.window.get(), Qt::Key_Z, Qt::ControlModifier);
    QCOMPARE(Value(shown, Wrap), QString("no"));
}

void tst_SettingsByKind::spaceToggles()
{
    const ShownSettings shown(Kinds);
    Press(shown, Wrap, Qt::Key_Space);
    QCOMPARE(Value(shown, Wrap), QString("no"));
    Press(shown, Wrap, Qt::Key_Space);
    QCOMPARE(Value(shown, Wrap), QString("yes"));
    const QByteArray before = TestFiles::read(shown.file);
    Press(shown, Title, Qt::Key_Space);
    Press(shown, Tabs, Qt::Key_Space);
    QCOMPARE(Value(shown, Title), QString("words"));
    QCOMPARE(Value(shown, Tabs), QString("2"));
    QCOMPARE(TestFiles::read(shown.file), before);
}

void tst_SettingsByKind::numberIsStepped_data()
{
    QTest::addColumn<QString>("before");
    QTest::addColumn<int>("key");
    QTest::addColumn<QString>("after");

    const auto row = [](char const* name, char const* before, int key, char const* after) {
        QTest::newRow(name) << QString(before) << key << QString(after);
    };
    row("Up", "2", Qt::Key_Up, "3");
    row("Down", "0", Qt::Key_Down, "-1");
    row("Page Up", "2", Qt::Key_PageUp, "12");
    row("Page Down", "2", Qt::Key_PageDown, "-8");
    row("not above the store's greatest", "2147483647", Qt::Key_Up, "2147483647");
    row("to the store's greatest", "2147483640", Qt::Key_PageUp, "2147483647");
    row("not below the store's least", "-2147483648", Qt::Key_Down, "-2147483648");
}

void tst_SettingsByKind::numberIsStepped()
{
    QFETCH(QString, before);
    QFETCH(int, key);
    QFETCH(QString, after);
    const ShownSettings shown(QByteArray(Kinds).replace(">2<", '>' + before.toLatin1() + '<'));
    QLineEdit* field = StartEditing(shown.tree, ItemCell(shown.tree, 0, Tabs, 1));
    QTest::keyClick(field, Qt::Key(key));
    QCOMPARE(field->text(), after);
    Enter(shown.tree);
    QCOMPARE(Value(shown, Tabs), after);
}

// A guess may be wrong. What is typed as a number is written as the store writes it.
void tst_SettingsByKind::guessedNumberBecomesText()
{
    const ShownSettings shown(Kinds);
    TypeInto(shown.tree, ItemCell(shown.tree, 0, Tabs, 1), "+07");
    QVERIFY(shown.tree->findChild<QLineEdit*>()->accessibleDescription().isEmpty());
    Enter(shown.tree);
    QCOMPARE(Value(shown, Tabs), QString("7"));
    TypeInto(shown.tree, ItemCell(shown.tree, 0, Tabs, 1), "2147483648");
    QCOMPARE(shown.tree->findChild<QLineEdit*>()->accessibleDescription(),
             QString("Not a number from -2147483648 to 2147483647; the value becomes a text"));
    Enter(shown.tree);
    QCOMPARE(Value(shown, Tabs), QString("2147483648"));
    QCOMPARE(SettingsModel::KindOf(ItemCell(shown.tree, 0, Tabs, 1)), ValueKind::Text);
}

void tst_SettingsByKind::chosenNumberStays()
{
    const ShownSettings shown(Kinds);
    ChooseKind(shown, Title, "Number");
    TypeInto(shown.tree, ItemCell(shown.tree, 0, Title, 1), "x");
    QCOMPARE(shown.tree->findChild<QLineEdit*>()->accessibleDescription(),
             QString("Not a number from -2147483648 to 2147483647"));
    Enter(shown.tree);
    QCOMPARE(Value(shown, Title), QString("words"));
    QVERIFY(!shown.editor->isModified());
    QCOMPARE(Status(*shown.window),
             QString("Not a number from -2147483648 to 2147483647, so \"words\" is kept."));
    TypeInto(shown.tree, ItemCell(shown.tree, 0, Title, 1), "5");
    Enter(shown.tree);
    QCOMPARE(Value(shown, Title), QString("5"));
}

void tst_SettingsByKind::colorIsChosen()
{
    const ShownSettings shown(Kinds);
    InDialog<QColorDialog>(shown, Ink, [](QColorDialog* dialog) {
        QCOMPARE(dialog->currentColor(), QColor(1, 2, 3));
        dialog->setCurrentColor(QColor(40, 50, 60, 70));
        QTest::keyClick(dialog, Qt::Key_Return);
    });
    QCOMPARE(Value(shown, Ink), QString("40,50,60"));
    InDialog<QColorDialog>(shown, Ink, [](QColorDialog* dialog) {
        dialog->setCurrentColor(Qt::red);
        QTest::keyClick(dialog, Qt::Key_Escape);
    });
    QCOMPARE(Value(shown, Ink), QString("40,50,60"));
    QTest::keyClick(shown.window.get(), Qt::Key_Z, Qt::ControlModifier);
    QVERIFY(!shown.editor->isModified());
    QCOMPARE(Value(shown, Ink), QString("1,2,3"));
}

void tst_SettingsByKind::sizeIsTyped()
{
    const ShownSettings shown(Kinds);
    InDialog<SizeDialog>(shown, Icon, [](SizeDialog* dialog) {
        QCOMPARE(dialog->size(), QSize(16, 24));
        TypeNumber(Child<QSpinBox>(dialog, "Width"), "-640"); // the store reads no minus sign
        TypeNumber(Child<QSpinBox>(dialog, "Height"), "480");
        QTest::keyClick(Child<QSpinBox>(dialog, "Height"), Qt::Key_Return);
    });
    QCOMPARE(Value(shown, Icon), QString("640,480"));
    QTest::keyClick(shown.window.get(), Qt::Key_Z, Qt::ControlModifier);
    QCOMPARE(Value(shown, Icon), QString("16,24"));
}

void tst_SettingsByKind::fontIsChosen()
{
    const ShownSettings shown(Kinds);
    QFont chosen("Serif", 23);
    chosen.setBold(true);
    InDialog<QFontDialog>(shown, Family, [&](QFontDialog* dialog) {
        dialog->setCurrentFont(chosen);
        chosen = dialog->currentFont(); // which has a family and a style of this system
        QTest::keyClick(dialog, Qt::Key_Return);
    });
    QCOMPARE(Value(shown, Family), TypedText::FromFont(chosen));
    QVERIFY(Value(shown, Family).contains(",23,"));
    QTest::keyClick(shown.window.get(), Qt::Key_Z, Qt::ControlModifier);
    QVERIFY(!shown.editor->isModified());
}

void tst_SettingsByKind::windowPlaceIsFitted()
{
    const ShownSettings shown(Kinds);
    QPoint position;
    QSize size;
    QVERIFY(TypedText::ToWindowPlace("-50,10,800,600", position, size));
    QPoint fitted;
    QSize fittedSize;
    QVERIFY(TypedText::ToWindowPlace("7,-9,100,50", fitted, fittedSize));
    InDialog<WindowPlaceDialog>(
        shown, 0,
        [&](WindowPlaceDialog* dialog) {
            QCOMPARE(dialog->position(), position);
            QCOMPARE(dialog->size(), size);
            auto* picture = Child<QWidget>(dialog, "Picture of the desktop");
            const QColor bar = picture->palette().color(QPalette::Highlight);
            const int large = Pixels(picture, bar);
            TypeNumber(Child<QSpinBox>(dialog, "From the left"), "7");
            TypeNumber(Child<QSpinBox>(dialog, "From the top"), "-9");
            TypeNumber(Child<QSpinBox>(dialog, "Width"), "100");
            TypeNumber(Child<QSpinBox>(dialog, "Height"), "50");
            const int small = Pixels(picture, bar);
            QVERIFY2(small > 0 && small < large, qPrintable(QString::number(small)));
            QCOMPARE(Child<QLabel>(dialog, "Where the window opens")->text(),
                     QString("On this desktop, the window opens at 7, 0 with %1 by %2 pixels")
                         .arg(fittedSize.width())
                         .arg(fittedSize.height()));
            QTest::keyClick(Child<QSpinBox>(dialog, "Height"), Qt::Key_Return);
        },
        Qt::Key_F2, Qt::NoModifier, 1);
    QCOMPARE(Value(shown, 0, 1), QString("7,-9,100,50"));
}

void tst_SettingsByKind::filesAreListed()
{
    const ShownSettings shown(Kinds);
    InDialog<FileListDialog>(shown, Recent, [](FileListDialog* dialog) {
        QCOMPARE(dialog->entries(), QStringList({"/a", "/b", "/c"}));
        auto* list = Child<QListWidget>(dialog, "Files");
        // The buttons show that they are pressed first.
        const auto press = [&](Qt::Key key, QStringList const& entries) {
            QTest::keyClick(dialog, key, Qt::AltModifier);
            QTRY_COMPARE_WITH_TIMEOUT(dialog->entries(), entries, Patience);
        };
        press(Qt::Key_D, {"/b", "/a", "/c"});
        QCOMPARE(list->currentRow(), 1);
        QTest::keyClick(list, Qt::Key_Down);
        press(Qt::Key_U, {"/b", "/c", "/a"});
        press(Qt::Key_R, {"/b", "/a"});
        press(Qt::Key_A, {"", "/b", "/a"});
        QTRY_VERIFY_WITH_TIMEOUT(list->findChild<QLineEdit*>(), Patience);
        QTest::keyClicks(list->findChild<QLineEdit*>(), "/new");
        QTest::keyClick(list->findChild<QLineEdit*>(), Qt::Key_Return);
        QTRY_VERIFY_WITH_TIMEOUT(!list->findChild<QLineEdit*>(), Patience);
        QTest::keyClick(dialog, Qt::Key_Return);
    });
    QCOMPARE(Value(shown, Recent), QString("/new|/b|/a"));
    QTest::keyClick(shown.window.get(), Qt::Key_Z, Qt::ControlModifier);
    QCOMPARE(Value(shown, Recent), QString("/a|/b|/c"));
}

void tst_SettingsByKind::separatorIsNoName()
{
    const ShownSettings shown(Kinds);
    InDialog<FileListDialog>(shown, Recent, [](FileListDialog* dialog) {
        auto* list = Child<QListWidget>(dialog, "Files");
        QPushButton const* ok = OkButton(dialog);
        auto const* problem = Child<QLabel>(dialog, "Problem with the files");
        const auto type = [&](QString const& text) {
            // With the keyboard focus, the list gets a current item.
            QTRY_VERIFY_WITH_TIMEOUT(list->currentIndex().isValid(), Patience);
            QTest::keyClick(list, Qt::Key_F2);
            QTRY_VERIFY_WITH_TIMEOUT(list->findChild<QLineEdit*>(), Patience);
            QTest::keyClicks(list->findChild<QLineEdit*>(), text);
            QTest::keyClick(list->findChild<QLineEdit*>(), Qt::Key_Return);
            QTRY_VERIFY_WITH_TIMEOUT(!list->findChild<QLineEdit*>(), Patience);
        };
        QVERIFY(ok->isEnabled());
        type("/x|y");
        QVERIFY(!ok->isEnabled() && !problem->text().isEmpty());
        type("/x");
        QVERIFY(ok->isEnabled() && problem->text().isEmpty());
        QTest::keyClick(dialog, Qt::Key_Return);
    });
    QCOMPARE(Value(shown, Recent), QString("/x|/b|/c"));
}

// Whatever the kind.
void tst_SettingsByKind::textIsEditedInALargeField()
{
    const ShownSettings shown(Kinds);
    for (Item item : {Title, Ink}) {
        InDialog<ValueDialog>(
            shown, item,
            [](ValueDialog* dialog) {
                auto* text = Child<QPlainTextEdit>(dialog, "Value");
                QTest::keyClick(text, Qt::Key_A, Qt::ControlModifier);
                QTest::keyClicks(text, "large");
                Click(OkButton(dialog));
            },
            Qt::Key_Return, Qt::ControlModifier);
        QCOMPARE(Value(shown, item), QString("large"));
    }
}

// A field in a cell would lose them.
void tst_SettingsByKind::lineBreaksAreKept()
{
    const ShownSettings shown(QByteArray(Kinds).replace("words", "two\nlines"));
    InDialog<ValueDialog>(shown, Title, [](ValueDialog* dialog) {
        auto* text = Child<QPlainTextEdit>(dialog, "Value");
        QTest::keyClicks(text, "x");
        Click(OkButton(dialog));
    });
    QVERIFY2(Value(shown, Title).endsWith("two\nlines"), qPrintable(Value(shown, Title)));
    QVERIFY(Value(shown, Title).startsWith('x'));
}

void tst_SettingsByKind::unchangedValueKeepsItsBytes_data()
{
    QTest::addColumn<QString>("kind");
    QTest::addColumn<QString>("value");
    QTest::newRow("color") << "Color"
                           << "255-0-0";
    QTest::newRow("size") << "Size"
                          << "800-600";
    QTest::newRow("size with fields that are no numbers") << "Size"
                                                          << "a,b";
    QTest::newRow("list") << "File list"
                          << "one";
}

// Reading and writing would change them.
void tst_SettingsByKind::unchangedValueKeepsItsBytes()
{
    QFETCH(QString, kind);
    QFETCH(QString, value);
    const ShownSettings shown(QByteArray(Kinds).replace("words", value.toLatin1()));
    ChooseKind(shown, Title, kind);
    InDialog<QDialog>(shown, Title,
                      [](QDialog* dialog) { QTest::keyClick(dialog, Qt::Key_Return); });
    QCOMPARE(Value(shown, Title), value);
    QVERIFY(!shown.editor->isModified());
}

void tst_SettingsByKind::kindsToChooseFrom()
{
    const ShownSettings shown(Kinds);
    for (int section : {0, 1}) {
        Press(shown, 0, Qt::Key_K, Qt::ControlModifier, section);
        QTRY_VERIFY_WITH_TIMEOUT(QApplication::activePopupWidget(), Patience);
        auto* menu = qobject_cast<QMenu*>(QApplication::activePopupWidget());
        QStringList entries;
        const QList<QAction*> actions = menu->actions();
        for (QAction const* action : actions)
            entries.append(ActionText(action) + (action->isChecked() ? "*" : ""));
        QStringList expected{"Text", "Yes or no", "Number", "Color", "Size", "Font", "File list"};
        if (section == 1)
            expected.insert(6, "Window place");
        expected.prepend(section == 0 ? "Guess: Yes or no*" : "Guess: Window place*");
        QCOMPARE(entries, expected);
        QTest::keyClick(menu, Qt::Key_Escape);
        QTRY_VERIFY_WITH_TIMEOUT(!QApplication::activePopupWidget(), Patience);
    }
    QVERIFY(!shown.editor->isModified());
}

void tst_SettingsByKind::choiceIsTakenBack()
{
    const ShownSettings shown(Kinds);
    const QModelIndex cell = ItemCell(shown.tree, 0, Ink, 1);
    ChooseKind(shown, Ink, "Text");
    QCOMPARE(SettingsModel::KindOf(cell), ValueKind::Text);
    TypeInto(shown.tree, cell, "7,8,9"); // in its cell
    Enter(shown.tree);
    QCOMPARE(Value(shown, Ink), QString("7,8,9"));
    QCOMPARE(SettingsModel::KindOf(cell), ValueKind::Text);
    ChooseKind(shown, Ink, "Guess: Color");
    QCOMPARE(SettingsModel::KindOf(cell), ValueKind::Color);
}

void tst_SettingsByKind::tabOpensNoDialog()
{
    const ShownSettings shown(Kinds);
    StartEditing(shown.tree, ItemCell(shown.tree, 0, Tabs, 1));
    QTest::keyClick(shown.tree->findChild<QLineEdit*>(), Qt::Key_Tab);
    QTRY_VERIFY_WITH_TIMEOUT(!shown.tree->findChild<QLineEdit*>(), Patience);
    QCOMPARE(shown.tree->currentIndex(), ItemCell(shown.tree, 0, Ink, 1));
    QCoreApplication::processEvents();
    QVERIFY(!QApplication::activeModalWidget());
}

void tst_SettingsByKind::writtenAsTheStoreDoes()
{
    const ShownSettings shown(Kinds);
    Press(shown, Wrap, Qt::Key_Space);
    InDialog<SizeDialog>(shown, Icon, [](SizeDialog* dialog) {
        TypeNumber(Child<QSpinBox>(dialog, "Width"), "9");
        QTest::keyClick(dialog, Qt::Key_Return);
    });
    QTest::keyClick(shown.window.get(), Qt::Key_S, Qt::ControlModifier);
    QCOMPARE(TestFiles::read(shown.file),
             QByteArray(Kinds).replace("yes", "no").replace("16,24", "9,24"));
}

QTEST_MAIN(tst_SettingsByKind)

#include "tst_SettingsByKind.moc"
