// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The window on a real screen, driven with keys and mouse.

#include "ShownSettings.h"
#include "WindowParts.h"
#include "WindowTestCase.h"

#include "app/window/FileTabs.h"
#include "app/window/settings/SettingsEditor.h"
#include "app/window/widgets/ElidedLabel.h"
#include "app/window/widgets/NoticeBar.h"
#include "common/log/TorkLog.h"

#include <QAbstractButton>
#include <QLineEdit>
#include <QMenuBar>
#include <QMessageBox>
#include <QPlainTextEdit>
#include <QPushButton>
#include <QStatusBar>
#include <QTreeWidget>

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
    void brokenSettings();
    void saveFails();
    void changedMeanwhile();
    void askedBeforeClosing_data();
    void askedBeforeClosing();

    void closesWhileEditing();
};

void tst_SettingsInWindow::editsSettings()
{
    const ShownSettings shown;
    QTreeWidget* tree = shown.tree;
    QCOMPARE(tree->topLevelItemCount(), 1);
    QCOMPARE(tree->topLevelItem(0)->text(0), QString("Editor"));
    QCOMPARE(tree->topLevelItem(0)->child(0)->text(1), QString("Serif"));
    QVERIFY(!Action(*shown.window, "Save")->isEnabled());

    // A value is changed with the keyboard.
    TypeInto(tree, tree->topLevelItem(0)->child(0), 1, "Sans & Serif");
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
    QTRY_COMPARE_WITH_TIMEOUT(tree->topLevelItem(0)->child(2)->text(0), QString("twowords"),
                              Patience);
    QTRY_VERIFY_WITH_TIMEOUT(!tree->findChild<QLineEdit*>(), Patience);
    tree->setCurrentItem(tree->topLevelItem(0)->child(1));
    Click(button("Remove"));
    Click(button("Add Section"));
    QTRY_VERIFY_WITH_TIMEOUT(tree->findChild<QLineEdit*>(), Patience);
    QTest::keyClicks(tree->findChild<QLineEdit*>(), "1 is no name");
    QTest::keyClick(tree->findChild<QLineEdit*>(), Qt::Key_Return);
    QTRY_VERIFY_WITH_TIMEOUT(!tree->findChild<QLineEdit*>(), Patience);
    QCOMPARE(tree->topLevelItem(1)->text(0), QString("Section"));

    QTest::keyClick(shown.window.get(), Qt::Key_S, Qt::ControlModifier);
    QVERIFY(!shown.editor->isModified());
    QCOMPARE(TestFiles::read(shown.file),
             QByteArray("<VelocorSettings>\n<Editor>\n<font><![CDATA[Sans & Serif]]></font>\n"
                        "<twowords>value</twowords>\n</Editor>\n<Section>\n</Section>\n"
                        "</VelocorSettings>\n"));
    QCOMPARE(TestFiles::read(shown.file + ".bak"), Settings);

    // Only the first save keeps a copy.
    tree->topLevelItem(0)->child(0)->setText(1, "again");
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
    QTreeWidget* tree = shown.tree;
    QTreeWidgetItem* section = tree->topLevelItem(0);
    QTreeWidgetItem* item = isSection ? section : section->child(0);
    const QString old = item->text(0);

    TypeInto(tree, item, 0, typed);
    Enter(tree);
    QCOMPARE(item->text(0), old);
    const QString status = Status(*shown.window);
    QVERIFY2(status.startsWith(told), qPrintable(status));

    // A valid name is still taken afterwards.
    TypeInto(tree, item, 0, "valid");
    Enter(tree);
    QCOMPARE(item->text(0), QString("valid"));
    QTest::keyClick(shown.window.get(), Qt::Key_S, Qt::ControlModifier);
    QCOMPARE(TestFiles::read(shown.file), QByteArray(content).replace(old.toLatin1(), "valid"));
}

void tst_SettingsInWindow::rejectedNameChangesNothing()
{
    const ShownSettings shown;
    QTreeWidget* tree = shown.tree;
    TypeInto(tree, tree->topLevelItem(0), 0, "C++");
    Enter(tree);
    QVERIFY(!shown.editor->isModified());
    QVERIFY(!Action(*shown.window, "Save")->isEnabled());
}

// The store reads names that it cannot write.
void tst_SettingsInWindow::valueOfAnUnusualNameIsEdited()
{
    const ShownSettings shown(QByteArray(Settings).replace("font", "gr\xC3\xB6\xC3\x9F"
                                                                   "e"));
    QTreeWidget* tree = shown.tree;
    QTreeWidgetItem* item = tree->topLevelItem(0)->child(0);
    TypeInto(tree, item, 1, "12");
    Enter(tree);
    QCOMPARE(item->text(0), QString::fromUtf8("gr\xC3\xB6\xC3\x9F"
                                              "e"));
    QCOMPARE(item->text(1), QString("12"));
}

void tst_SettingsInWindow::savesWhatIsBeingTyped()
{
    const ShownSettings shown;
    QTreeWidget* tree = shown.tree;
    for (char const* typed : {"Sans", "Mono"}) { // the second time after a save
        TypeInto(tree, tree->topLevelItem(0)->child(0), 1, typed);
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
    QTreeWidget* tree = shown.tree;
    TypeInto(tree, tree->topLevelItem(0)->child(0), 1, "Sans");
    QVERIFY(Action(*shown.window, "Save")->isEnabled());
    QTest::keyClick(tree->findChild<QLineEdit*>(), Qt::Key_Escape);
    QTRY_VERIFY_WITH_TIMEOUT(!Action(*shown.window, "Save")->isEnabled(), Patience);
    QCOMPARE(tree->topLevelItem(0)->child(0)->text(1), QString("Serif"));
    QCOMPARE(TestFiles::read(shown.file), Settings);
}

void tst_SettingsInWindow::sizeOfALongValueIsVisible()
{
    const ShownSettings shown(
        QByteArray(Settings).replace("Serif", QByteArray("word ").repeated(5000)));
    QTreeWidget* tree = shown.tree;
    QTreeWidgetItem const* item = tree->topLevelItem(0)->child(0);
    const int width = tree->visualItemRect(item).width() - tree->columnWidth(0);
    QVERIFY(width > 50 && width < tree->fontMetrics().boundingRect(item->text(1)).width());
    const QString text =
        tree->fontMetrics().elidedText(item->text(1), tree->textElideMode(), width);
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
    auto* tree = Child<QTreeWidget>(window.get(), "Settings");
    TypeInto(tree, tree->topLevelItem(0), 0, "C++");
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

void tst_SettingsInWindow::brokenSettings()
{
    const QByteArray broken = QByteArray(Settings).replace("</font>", "</fnt>");
    const ShownSettings shown(broken);
    const QString told = shown.editor->findChild<NoticeBar*>()->text();
    QVERIFY2(told.contains("tag mismatch") && told.contains("line 3, column"), qPrintable(told));
    auto const* text = Child<QPlainTextEdit>(shown.editor, "File text");
    QVERIFY(text->isVisible() && text->isReadOnly());
    QCOMPARE(text->toPlainText(), QString(broken));
    QCOMPARE(text->textCursor().blockNumber(), 2);
    QVERIFY(!shown.editor->Save());
    QVERIFY(!Action(*shown.window, "Save")->isEnabled());
    QCOMPARE(TestFiles::read(shown.file), broken);
    shown.window->close();
    QCOMPARE(TestFiles::read(shown.file), broken);
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

void tst_SettingsInWindow::changedMeanwhile()
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
    shown.tree->topLevelItem(0)->child(0)->setText(1, "new");
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
        QTreeWidget* tree = shown.tree;
        TypeInto(tree, tree->topLevelItem(0)->child(0), 1, "typed");
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

QTEST_MAIN(tst_SettingsInWindow)

#include "tst_SettingsInWindow.moc"
