// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The window on a real screen, driven with keys and mouse.

#include "WindowParts.h"

#include "app/window/FileTabs.h"
#include "app/window/settings/SettingsEditor.h"
#include "app/window/widgets/NoticeBar.h"

#include <QAbstractButton>
#include <QClipboard>
#include <QLineEdit>
#include <QLoggingCategory>
#include <QMenuBar>
#include <QMessageBox>
#include <QPlainTextEdit>
#include <QPushButton>
#include <QTreeWidget>

using namespace Velocor;
using namespace WindowParts;

class tst_SettingsInWindow : public QObject
{
    Q_OBJECT

private slots:
    void initTestCase();
    void cleanup();

    void editsSettings();
    void losesKnowingly_data();
    void losesKnowingly();
    void brokenSettings();
    void saveFails();
    void changedMeanwhile();
    void askedBeforeClosing_data();
    void askedBeforeClosing();

    void closesWhileEditing();
};

void tst_SettingsInWindow::initTestCase()
{
    // The X11 plug-in warns when a window disappears while it is being queried, which would end up
    // in a test's log. The environment would be too late: it was read with the application object.
    QLoggingCategory::setFilterRules("qt.qpa.*=false");
}

void tst_SettingsInWindow::cleanup()
{
    const QWidgetList windows = QApplication::topLevelWidgets();
    for (QWidget* window : windows)
        window->hide();
    QGuiApplication::clipboard()->clear();
}

void tst_SettingsInWindow::editsSettings()
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

    // A key is added and named; the name is corrected where the store could not write it.
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
    const WindowTest test;
    const QString file = test.folder() + "some.cfg";
    const QByteArray broken = QByteArray(Settings).replace("</font>", "</fnt>");
    QVERIFY(TestFiles::write(file, broken));
    const auto window = WindowTest::show();
    window->OpenFile(file);
    auto* editor = window->findChild<FileTabs*>()->currentEditor();
    const QString told = editor->findChild<NoticeBar*>()->text();
    QVERIFY2(told.contains("tag mismatch") && told.contains("line 3, column"), qPrintable(told));
    auto const* text = Child<QPlainTextEdit>(editor, "File text");
    QVERIFY(text->isVisible() && text->isReadOnly());
    QCOMPARE(text->toPlainText(), QString(broken));
    QCOMPARE(text->textCursor().blockNumber(), 2);
    QVERIFY(!editor->Save());
    QVERIFY(!Action(*window, "Save")->isEnabled());
    QCOMPARE(TestFiles::read(file), broken);
    window->close();
    QCOMPARE(TestFiles::read(file), broken);
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

// Text typed into a cell is kept even without the Enter key.
void tst_SettingsInWindow::closesWhileEditing()
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
        window.reset(); // even without having been closed
        QCoreApplication::processEvents();
    }
}

QTEST_MAIN(tst_SettingsInWindow)

#include "tst_SettingsInWindow.moc"
