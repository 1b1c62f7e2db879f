// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// A settings file as text on a real screen: damaged ones are mended with keys.

#include "ShownSettings.h"
#include "WindowParts.h"
#include "WindowTestCase.h"

#include "app/settingsfile/SettingsFileWriter.h"
#include "app/window/settings/NumberedText.h"
#include "app/window/settings/SettingsTextPage.h"
#include "app/window/widgets/NoticeBar.h"

#include <QClipboard>
#include <QLabel>
#include <QLineEdit>
#include <QMenu>
#include <QMessageBox>
#include <QPushButton>
#include <QSpinBox>
#include <QTextBlock>
#include <QTimer>
#include <QTreeView>

using namespace Velocor;
using namespace WindowParts;

class tst_SettingsAsText : public WindowTestCase
{
    Q_OBJECT

private slots:
    void damagedFileIsShownWithItsError();
    void errorIsMarkedAndFound();
    void mendedFileIsReadAndSaved();
    void askedBeforeSavingWhatCannotBeRead();
    void undoneAndRedone();
    void savesByteForByte_data();
    void savesByteForByte();
    void shownButNotEdited_data();
    void shownButNotEdited();
    void errorJustTyped();
    void characterOutsideTheEncoding();
    void whatCanBeReadIsOffered();
    void treeAndTextShowTheSameChanges();
    void sameTextKeepsTheChanges();
    void lostCommentIsAChange();
    void reloadCanBeUndone();
    void closingAsks();
    void findsInTheText_data();
    void findsInTheText();
    void countFollowsTheText();
    void findBarOfTheText();
    void goesToALine_data();
    void goesToALine();
    void keysAreInTheMenu();
    void numbersAndErrorAreDrawn();
};

namespace {

const QByteArray Broken = QByteArray(Settings).replace("</font>", "</fnt>");

// A file in the window, and the parts of its text page.
class ShownText : public ShownSettings
{
public:
    explicit ShownText(QByteArray const& content) : ShownSettings(content)
    {
        page = editor->findChild<SettingsTextPage*>();
        text = static_cast<NumberedText*>(Child<QPlainTextEdit>(editor, "File text"));
    }

    QString state() const { return Child<QLabel>(editor, "State of the text")->text(); }
    QByteArray saved() const { return TestFiles::read(file); }

    // Active again after a message box, or the window's keys would not work.
    void press(Qt::Key key, Qt::KeyboardModifiers modifiers = Qt::NoModifier) const
    {
        QVERIFY(activate(window.get()));
        QTest::keyClick(text->isVisible() ? static_cast<QWidget*>(text) : tree, key, modifiers);
    }

    // Types "o" where it is missing in Broken.
    void mend() const
    {
        press(Qt::Key_F8);
        QTextCursor cursor = text->document()->find("</fnt");
        cursor.setPosition(cursor.selectionStart() + 3);
        text->setTextCursor(cursor);
        QTest::keyClicks(text, "o");
    }

    SettingsTextPage* page = nullptr;
    NumberedText* text = nullptr;
};

} // namespace

void tst_SettingsAsText::damagedFileIsShownWithItsError()
{
    const ShownText shown(Broken);
    const QString told = shown.editor->findChild<NoticeBar*>()->text();
    QVERIFY2(told.contains("tag mismatch") && told.contains("line 3, column"), qPrintable(told));
    QVERIFY(shown.text->isVisible() && shown.text->hasFocus());
    QCOMPARE(shown.text->toPlainText(), QString(Broken));
    QVERIFY(shown.state().startsWith("Line 3, column 17: tag mismatch. Programs get what is "
                                     "before it: 1 section with 1 key."));
    QVERIFY(!Action(*shown.window, "Save")->isEnabled());
    shown.press(Qt::Key_S, Qt::ControlModifier);
    QVERIFY(shown.window->close());
    QCOMPARE(shown.saved(), Broken);
}

void tst_SettingsAsText::errorIsMarkedAndFound()
{
    const ShownText shown(Broken);
    const auto marks = shown.text->extraSelections();
    QCOMPARE(marks.size(), 2);
    QCOMPARE(marks.first().cursor.blockNumber(), 2);
    QCOMPARE(marks.last().cursor.selectionStart() - marks.last().cursor.block().position(), 16);
    QCOMPARE(shown.text->textCursor().blockNumber(), 2);
    shown.press(Qt::Key_Home, Qt::ControlModifier);
    QCOMPARE(shown.text->textCursor().blockNumber(), 0);
    shown.press(Qt::Key_F8);
    QCOMPARE(shown.text->textCursor().blockNumber(), 2);
    QCOMPARE(shown.text->textCursor().positionInBlock(), 16);
    QVERIFY(!shown.text->textCursor().hasSelection()); // or typing would replace it
}

void tst_SettingsAsText::mendedFileIsReadAndSaved()
{
    const ShownText shown(Broken);
    shown.mend();
    QTRY_COMPARE_WITH_TIMEOUT(shown.state(),
                              QString("This text can be read: 1 section with 2 keys."), Patience);
    QVERIFY(shown.text->extraSelections().isEmpty());
    QVERIFY(shown.window->findChild<FileTabs*>()->tabText(1).endsWith("*"));
    QVERIFY(Action(*shown.window, "Save")->isEnabled());
    shown.press(Qt::Key_S, Qt::ControlModifier);
    QCOMPARE(shown.saved(), Settings);
    QCOMPARE(TestFiles::read(shown.file + ".bak"), Broken);
    QVERIFY(!shown.editor->isModified());
    shown.press(Qt::Key_T, Qt::ControlModifier);
    QVERIFY(shown.tree->isVisible() && shown.tree->hasFocus());
    QCOMPARE(CellText(shown.tree, 0, 1, 1), QString("yes"));
    QVERIFY(!shown.editor->isModified());
}

// Even at once, before the pause has passed.
void tst_SettingsAsText::askedBeforeSavingWhatCannotBeRead()
{
    const ShownText shown(Settings);
    shown.press(Qt::Key_T, Qt::ControlModifier);
    QTest::keyClicks(shown.text, "<a>");
    QString told;
    const auto answer = [&](QString const& button) {
        WindowTest::whenShown<QMessageBox>([&, button](QMessageBox* box) {
            told = box->text() + ' ' + box->informativeText();
            const auto buttons = box->findChildren<QPushButton*>();
            for (QPushButton* candidate : buttons) {
                if (candidate->text().remove('&') == button)
                    Click(candidate);
            }
        });
        shown.press(Qt::Key_S, Qt::ControlModifier);
    };
    answer("Cancel");
    QVERIFY2(told.startsWith("Programs cannot read all of some.cfg yet. Line "), qPrintable(told));
    QCOMPARE(shown.saved(), Settings);
    QVERIFY(shown.editor->isModified());
    answer("Save Anyway");
    QCOMPARE(shown.saved(), "<a>" + Settings);
    QCOMPARE(TestFiles::read(shown.file + ".bak"), Settings);
}

void tst_SettingsAsText::undoneAndRedone()
{
    const ShownText shown(Broken);
    QVERIFY(!Action(*shown.window, "Undo")->isEnabled());
    shown.mend();
    QVERIFY(Action(*shown.window, "Undo Edit Text")->isEnabled());
    QVERIFY(!Action(*shown.window, "Redo")->isEnabled());
    shown.press(Qt::Key_Z, Qt::ControlModifier);
    QCOMPARE(shown.page->bytes(), Broken);
    QVERIFY(!shown.editor->isModified());
    QVERIFY(!Action(*shown.window, "Undo")->isEnabled());
    Child<QPushButton>(shown.editor, "Dismiss notice")->setFocus();
    Action(*shown.window, "Redo Edit Text")->trigger();
    QCOMPARE(shown.page->bytes(), Settings);
}

void tst_SettingsAsText::savesByteForByte_data()
{
    QTest::addColumn<QByteArray>("content");
    QTest::newRow("plain") << Settings;
    QTest::newRow("a comment and blanks") << QByteArray("<a>\n\t<!-- x -->  <b/>\n\n</a>");
    QTest::newRow("UTF-8") << QByteArray("<a><b><c>\xE2\x82\xAC\xC2\xA0</c></b></a>\n");
    QTest::newRow("byte order mark") << QByteArray("\xEF\xBB\xBF<a><b><c>1</c></b></a>\n");
    QTest::newRow("Latin-1") << QByteArray("<a><b><c>\xE4\xA0</c></b></a>\n");
    QTest::newRow("carriage returns") << QByteArray("<a>\r\n<b>\r\n</b>\r\n</a>\r\n");
}

void tst_SettingsAsText::savesByteForByte()
{
    QFETCH(QByteArray, content);
    const ShownText shown(content + "<");
    QVERIFY(shown.text->isVisible());
    QCOMPARE(shown.page->bytes(), content + "<");
    shown.press(Qt::Key_End, Qt::ControlModifier);
    shown.press(Qt::Key_Backspace);
    shown.press(Qt::Key_S, Qt::ControlModifier);
    QCOMPARE(shown.saved(), content);
}

void tst_SettingsAsText::shownButNotEdited_data()
{
    QTest::addColumn<QByteArray>("content");
    QTest::addColumn<QString>("told");
    QTest::newRow("mixed line breaks") << QByteArray("<a>\r\n<b>\n</a>") << "cannot be edited";
    QTest::newRow("a paragraph separator") << QByteArray("<a>\xE2\x80\xA9") << "cannot be edited";
    QTest::newRow("too large") << "<a>\n" + QByteArray("<b>\n").repeated(300000)
                               << "Only the start of the file is shown";
}

void tst_SettingsAsText::shownButNotEdited()
{
    QFETCH(QByteArray, content);
    QFETCH(QString, told);
    const ShownText shown(content);
    QVERIFY(shown.text->isVisible() && shown.text->isReadOnly());
    QVERIFY2(shown.state().contains(told), qPrintable(shown.state()));
    QTest::keyClicks(shown.text, "x");
    QVERIFY(!shown.editor->isModified());
    shown.press(Qt::Key_S, Qt::ControlModifier);
    QCOMPARE(shown.saved(), content);
}

// F8 does not wait for the pause after which the text is read.
void tst_SettingsAsText::errorJustTyped()
{
    const ShownText shown(Settings);
    shown.press(Qt::Key_T, Qt::ControlModifier);
    shown.text->setTextCursor(shown.text->document()->find("Serif"));
    QTest::keyClicks(shown.text, "</");
    shown.press(Qt::Key_Home, Qt::ControlModifier);
    shown.press(Qt::Key_F8);
    QCOMPARE(shown.text->textCursor().blockNumber(), 2);
    QVERIFY2(shown.state().startsWith("Line 3, column "), qPrintable(shown.state()));
}

void tst_SettingsAsText::characterOutsideTheEncoding()
{
    const QByteArray content = QByteArray(Settings).replace("Serif", "\xE4");
    const ShownText shown(content);
    shown.press(Qt::Key_T, Qt::ControlModifier);
    shown.text->setTextCursor(shown.text->document()->find(QString(QChar(0xe4))));
    QGuiApplication::clipboard()->setText(QString(QChar(0x20ac)));
    shown.press(Qt::Key_V, Qt::ControlModifier);
    shown.press(Qt::Key_F8);
    QVERIFY2(shown.state().startsWith("Line 3, column 7: the file is in Latin-1"),
             qPrintable(shown.state()));
    QString told;
    WindowTest::whenShown<QMessageBox>([&](QMessageBox* box) {
        told = box->informativeText();
        QTest::keyClick(box, Qt::Key_Escape);
    });
    shown.press(Qt::Key_S, Qt::ControlModifier);
    QVERIFY2(told.startsWith("Line 3, column 7"), qPrintable(told));
    QCOMPARE(shown.saved(), content);
}

void tst_SettingsAsText::whatCanBeReadIsOffered()
{
    const ShownText shown(Broken);
    shown.press(Qt::Key_T, Qt::ControlModifier);
    QVERIFY(shown.tree->isVisible());
    QCOMPARE(shown.tree->model()->rowCount(Cell(shown.tree, 0)), 1);
    QCOMPARE(CellText(shown.tree, 0, 0, 1), QString("Serif"));
    QVERIFY(shown.editor->isModified()); // it is not what is in the file
    QString told;
    WindowTest::whenShown<QMessageBox>([&](QMessageBox* box) {
        told = box->informativeText();
        QTest::keyClick(box, Qt::Key_Escape);
    });
    shown.press(Qt::Key_S, Qt::ControlModifier);
    QVERIFY2(told.startsWith("Line 3: everything from there on (tag mismatch)"), qPrintable(told));
    QCOMPARE(shown.saved(), Broken);

    WindowTest::whenShown<QMessageBox>([&](QMessageBox* box) {
        const auto buttons = box->findChildren<QPushButton*>();
        for (QPushButton* button : buttons) {
            if (button->text().remove('&') == "Save Anyway")
                Click(button);
        }
    });
    shown.press(Qt::Key_S, Qt::ControlModifier);
    QCOMPARE(shown.saved(), QByteArray(Settings).replace("<wrap>yes</wrap>\n", ""));
    QCOMPARE(TestFiles::read(shown.file + ".bak"), Broken);
}

void tst_SettingsAsText::treeAndTextShowTheSameChanges()
{
    const ShownText shown(Settings);
    SetValue(shown.tree, 0, "mine");
    shown.tree->setFocus();
    shown.press(Qt::Key_T, Qt::ControlModifier);
    QVERIFY(shown.text->isVisible() && shown.text->hasFocus());
    QCOMPARE(shown.page->bytes(), QByteArray(Settings).replace("Serif", "mine"));
    QVERIFY(shown.editor->isModified());
    QCOMPARE(shown.saved(), Settings);
    shown.text->setTextCursor(shown.text->document()->find("yes"));
    QTest::keyClicks(shown.text, "no");
    shown.press(Qt::Key_T, Qt::ControlModifier);
    QCOMPARE(CellText(shown.tree, 0, 0, 1), QString("mine"));
    QCOMPARE(CellText(shown.tree, 0, 1, 1), QString("no"));
    QVERIFY(Action(*shown.window, "Undo Edit as Text")->isEnabled());
    shown.press(Qt::Key_Z, Qt::ControlModifier);
    QCOMPARE(CellText(shown.tree, 0, 1, 1), QString("yes"));
    shown.press(Qt::Key_T, Qt::ControlModifier);
    QCOMPARE(shown.page->bytes(), QByteArray(Settings).replace("Serif", "mine"));
}

// To look at the text is no change.
void tst_SettingsAsText::sameTextKeepsTheChanges()
{
    const ShownText shown(Settings);
    SetValue(shown.tree, 0, "mine");
    shown.tree->setFocus();
    for (int i = 0; i < 2; ++i) {
        shown.press(Qt::Key_T, Qt::ControlModifier);
        QVERIFY(shown.text->isVisible());
        shown.press(Qt::Key_T, Qt::ControlModifier);
        QVERIFY(shown.tree->isVisible() && shown.editor->isModified());
    }
    shown.press(Qt::Key_Z, Qt::ControlModifier);
    QCOMPARE(CellText(shown.tree, 0, 0, 1), QString("Serif"));
    QVERIFY(!shown.editor->isModified());
}

// The tree shows no comments.
void tst_SettingsAsText::lostCommentIsAChange()
{
    const ShownText shown(Settings);
    shown.press(Qt::Key_T, Qt::ControlModifier);
    shown.press(Qt::Key_End, Qt::ControlModifier);
    QTest::keyClicks(shown.text, "<!-- x -->");
    shown.press(Qt::Key_T, Qt::ControlModifier);
    QVERIFY(shown.tree->isVisible() && shown.editor->isModified());
}

void tst_SettingsAsText::reloadCanBeUndone()
{
    const ShownText shown(Broken);
    shown.mend();
    QVERIFY(TestFiles::writeOver(shown.file, "<a>"));
    QPushButton* reload = nullptr;
    const auto buttons = shown.editor->findChildren<QPushButton*>();
    for (QPushButton* button : buttons) {
        if (button->text() == "Reload")
            reload = button;
    }
    QTRY_VERIFY_WITH_TIMEOUT(reload->isVisible(), Patience);
    Click(reload);
    QCOMPARE(shown.page->bytes(), QByteArray("<a>"));
    QVERIFY(!shown.editor->isModified());
    shown.text->setFocus();
    shown.press(Qt::Key_Z, Qt::ControlModifier);
    QCOMPARE(shown.page->bytes(), Settings);
    QVERIFY(shown.editor->isModified());
}

void tst_SettingsAsText::closingAsks()
{
    ShownText shown(Broken);
    shown.mend();
    WindowTest::whenShown<QMessageBox>(
        [&](QMessageBox* box) { Click(box->button(QMessageBox::Save)); });
    QVERIFY(shown.window->close());
    QCOMPARE(shown.saved(), Settings);
}

void tst_SettingsAsText::findsInTheText_data()
{
    QTest::addColumn<QString>("wanted");
    QTest::addColumn<QString>("keys"); // n: next, p: previous
    QTest::addColumn<QString>("found");
    QTest::addColumn<QString>("result");

    const auto row = [](char const* name, char const* wanted, char const* keys, char const* found,
                        char const* result) {
        QTest::newRow(name) << wanted << keys << found << result;
    };
    // <R> / <A>font</A> / <B>Font font</B> / </R>
    row("the first", "font", "", "2:3 font", "1 of 3");
    row("in another case", "FONT", "n", "3:3 Font", "2 of 3");
    row("the next on the same line", "font", "nn", "3:8 font", "3 of 3");
    row("around the end", "font", "nnn", "2:3 font", "1 of 3, continued from the top");
    row("the previous one, around the start", "font", "p", "3:8 font",
        "3 of 3, continued from the bottom");
    row("back again", "font", "pp", "3:3 Font", "2 of 3");
    row("on again", "font", "pppnn", "3:8 font", "3 of 3");
    row("no overlap", "ff", "", "4:3 ff", "1 of 2");
    row("no overlap, the next", "ff", "n", "4:5 ff", "2 of 2");
    row("no overlap, backward", "ff", "p", "4:5 ff", "2 of 2, continued from the bottom");
    row("no overlap, the previous", "ff", "pp", "4:3 ff", "1 of 2");
    row("a space is also a non-breaking one", "o n", "", "4:9 o\u00a0n", "1 of 1");
    row("nowhere", "zzz", "", "1:0 ", "No match");
    row("nowhere, asked again", "zzz", "np", "1:0 ", "No match");
}

void tst_SettingsAsText::findsInTheText()
{
    QFETCH(QString, wanted);
    QFETCH(QString, keys);
    const QByteArray content("<R>\n<A>font</A>\n<B>Font font</B>\n"
                             "<C>fffff o\xC2\xA0n</C>\n</R>\n");
    const ShownText shown(content);
    shown.press(Qt::Key_T, Qt::ControlModifier);
    shown.press(Qt::Key_Home, Qt::ControlModifier);
    shown.press(Qt::Key_F, Qt::ControlModifier);
    auto* field = Child<QLineEdit>(shown.editor, "Find in the text");
    QVERIFY(field->isVisible() && field->hasFocus());
    QTest::keyClicks(field, wanted);
    for (QChar key : keys)
        QTest::keyClick(field, Qt::Key_F3, key == 'p' ? Qt::ShiftModifier : Qt::NoModifier);
    QTextCursor cursor = shown.text->textCursor();
    const QString found = cursor.selectedText();
    cursor.setPosition(cursor.selectionStart());
    QTEST(
        QString("%1:%2 %3").arg(cursor.blockNumber() + 1).arg(cursor.positionInBlock()).arg(found),
        "found");
    QTEST(Child<QLabel>(shown.editor, "Result of the search in the text")->text(), "result");
    QVERIFY(!shown.editor->isModified());
}

void tst_SettingsAsText::countFollowsTheText()
{
    const ShownText shown("<R>\n<A>font</A>\n<B>Font font</B>\n</R>\n");
    shown.press(Qt::Key_T, Qt::ControlModifier);
    shown.press(Qt::Key_Home, Qt::ControlModifier);
    shown.press(Qt::Key_F, Qt::ControlModifier);
    auto* field = Child<QLineEdit>(shown.editor, "Find in the text");
    const auto result = [&] {
        return Child<QLabel>(shown.editor, "Result of the search in the text")->text();
    };
    QTest::keyClicks(field, "font");
    QTest::keyClick(field, Qt::Key_F3, Qt::ShiftModifier);
    QCOMPARE(result(), QString("3 of 3, continued from the bottom"));
    shown.press(Qt::Key_Home, Qt::ControlModifier);
    QTRY_COMPARE_WITH_TIMEOUT(result(), QString("3 matches"), Patience);
    QTest::keyClicks(shown.text, "font Font ");
    QTRY_COMPARE_WITH_TIMEOUT(result(), QString("5 matches"), Patience);
    shown.press(Qt::Key_F3);
    QCOMPARE(result(), QString("3 of 5"));
    shown.press(Qt::Key_Delete);
    QTRY_COMPARE_WITH_TIMEOUT(result(), QString("4 matches"), Patience);
    shown.press(Qt::Key_Z, Qt::ControlModifier);
    QTRY_COMPARE_WITH_TIMEOUT(result(), QString("5 matches"), Patience);
    QTest::keyClick(field, Qt::Key_Escape);
    shown.press(Qt::Key_A, Qt::ControlModifier);
    QTest::keyClicks(shown.text, "font");
    shown.press(Qt::Key_F, Qt::ControlModifier);
    QCOMPARE(result(), QString("1 match"));
    QTest::keyClick(field, Qt::Key_End);
    QTest::keyClick(field, Qt::Key_Backspace);
    QCOMPARE(result(), QString("1 of 1, continued from the top"));
    field->clear();
    QCOMPARE(result(), QString());
}

void tst_SettingsAsText::findBarOfTheText()
{
    const ShownText shown(Broken);
    shown.press(Qt::Key_F3); // nothing to find yet
    auto* field = Child<QLineEdit>(shown.editor, "Find in the text");
    QVERIFY(field->isVisible() && field->hasFocus());
    QTest::keyClicks(field, "wrap");
    QTest::keyClick(field, Qt::Key_Escape);
    QVERIFY(!field->isVisible() && shown.text->hasFocus());
    QCOMPARE(shown.text->textCursor().selectedText(), QString("wrap"));
    const int first = shown.text->textCursor().selectionStart();
    shown.press(Qt::Key_F3);
    QVERIFY(shown.text->textCursor().selectionStart() > first);
    shown.press(Qt::Key_F3, Qt::ShiftModifier);
    QCOMPARE(shown.text->textCursor().selectionStart(), first);

    // Opened again, typing replaces what was searched for; the keys of the page work in the field.
    shown.press(Qt::Key_F, Qt::ControlModifier);
    QTest::keyClicks(field, "Ed");
    QCOMPARE(field->text(), QString("Ed"));
    QTest::keyClick(field, Qt::Key_F8);
    QCOMPARE(shown.text->textCursor().blockNumber(), 2);
}

void tst_SettingsAsText::goesToALine_data()
{
    QTest::addColumn<QString>("typed");
    QTest::addColumn<Qt::Key>("key");
    QTest::addColumn<int>("line");
    QTest::newRow("a line") << "4" << Qt::Key_Return << 4;
    QTest::newRow("cancelled") << "4" << Qt::Key_Escape << 3;
    QTest::newRow("beyond the end") << "99" << Qt::Key_Return << 3;
}

void tst_SettingsAsText::goesToALine()
{
    QFETCH(QString, typed);
    QFETCH(Qt::Key, key);
    const ShownText shown(Broken); // with the cursor in line 3, where the error is
    QTimer::singleShot(0, shown.text, [&] {
        QTRY_VERIFY_WITH_TIMEOUT(QApplication::activeModalWidget(), Patience);
        QWidget* dialog = QApplication::activeModalWidget();
        auto* number = dialog->findChild<QSpinBox*>();
        QTest::keyClicks(number, typed);
        QTest::keyClick(number, key);
        if (dialog->isVisible()) // a number that cannot be entered
            QTest::keyClick(dialog, Qt::Key_Escape);
    });
    shown.press(Qt::Key_G, Qt::ControlModifier);
    QTEST(shown.text->textCursor().blockNumber() + 1, "line");
    QVERIFY(shown.text->hasFocus());
}

void tst_SettingsAsText::keysAreInTheMenu()
{
    const ShownText shown(Broken);
    QMenu const* menu = Action(*shown.window, "Settings File")->menu();
    QStringList entries;
    const QList<QAction*> actions = menu->actions();
    for (QAction const* action : actions) {
        entries.append(ActionText(action) + '\t' + action->shortcut().toString());
        QVERIFY(!action->statusTip().isEmpty());
    }
    QCOMPARE(entries, QStringList({"Go to Error\tF8", "Show as Settings\tCtrl+T", "Find\tCtrl+F",
                                   "Find Next\tF3", "Find Previous\tShift+F3",
                                   "Go to Line...\tCtrl+G", "Saved States...\tCtrl+Shift+T"}));
    QVERIFY(actions.first()->isEnabled());
    shown.mend();
    QTRY_VERIFY_WITH_TIMEOUT(!actions.first()->isEnabled(), Patience);
    QVERIFY(!Action(*shown.window, "What Will Be Written...")->isEnabled());
    actions.at(1)->trigger();
    QVERIFY(shown.tree->isVisible());
    QVERIFY(menu->actions().size() > 7);
    QVERIFY(Action(*shown.window, "What Will Be Written...")->isEnabled());
}

void tst_SettingsAsText::numbersAndErrorAreDrawn()
{
    const ShownText shown(Broken);
    const int margin = shown.text->viewport()->x();
    QVERIFY(margin > 20);
    const QImage image = shown.text->grab().toImage().scaled(shown.text->size());
    const auto colorsIn = [&](int line) {
        const QRect row =
            shown.text->cursorRect(QTextCursor(shown.text->document()->findBlockByNumber(line)));
        QSet<QRgb> colors;
        for (int x = 2; x < margin; ++x)
            colors.insert(image.pixel(x, row.center().y() + shown.text->viewport()->y()));
        return colors.size();
    };
    QVERIFY(colorsIn(0) > 1); // a number on its background
    QVERIFY(colorsIn(5) > 1);
    const QTextBlock error = shown.text->document()->findBlockByNumber(2);
    const QRect place = shown.text->cursorRect(QTextCursor(error));
    const QPoint end(shown.text->width() - 30, place.center().y() + shown.text->viewport()->y());
    QVERIFY(image.pixelColor(end) != shown.text->palette().color(QPalette::Base));
}

QTEST_MAIN(tst_SettingsAsText)

#include "tst_SettingsAsText.moc"
