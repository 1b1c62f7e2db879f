// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// What happens to a file while it is in the settings editor: other programs, and this window.

#include "ShownSettings.h"
#include "WindowParts.h"
#include "WindowTestCase.h"

#include "app/runninglog/LogPreferences.h"
#include "app/settingsfile/SettingsFileReader.h"
#include "app/settingsfile/SettingsFileWriter.h"
#include "app/window/settings/FileNotice.h"
#include "app/window/settings/SettingsEditor.h"
#include "app/window/settings/SettingsTextPage.h"
#include "app/window/widgets/NoticeBar.h"

#include <QAbstractButton>
#include <QFileDialog>
#include <QMessageBox>
#include <QUndoStack>

#include <sys/stat.h>
#include <unistd.h>

using namespace Velocor;
using namespace WindowParts;

namespace {

FileNotice* State(SettingsEditor const* editor)
{
    return editor->findChild<FileNotice*>();
}

QAbstractButton* Button(QWidget const* parent, QString const& text)
{
    const QList<QAbstractButton*> buttons = parent->findChildren<QAbstractButton*>();
    for (QAbstractButton* button : buttons) {
        if (button->text() == text)
            return button;
    }
    return nullptr;
}

QStringList VisibleButtons(QWidget const* parent)
{
    QStringList texts;
    const QList<QAbstractButton*> buttons = parent->findChildren<QAbstractButton*>();
    for (QAbstractButton const* button : buttons) {
        if (button->isVisible())
            texts.append(button->text());
    }
    texts.sort();
    return texts;
}

QByteArray WithFont(char const* font)
{
    return QByteArray(Settings).replace("Serif", font);
}

} // namespace

class tst_SettingsOutside : public WindowTestCase
{
    Q_OBJECT

private slots:
    void changeIsToldAndReloaded();
    void reloadCanBeUndone();
    void reloadOfWhatIsNoTreeCanBeUndone_data();
    void reloadOfWhatIsNoTreeCanBeUndone();
    void reloadAsksBeforeItLosesChanges_data();
    void reloadAsksBeforeItLosesChanges();
    void reloadStaysInTheTextAndCanBeUndone();
    void reloadTellsWhatSavingWouldLose();
    void reloadKeepsWhatIsShownOfAnUnreadableFile();
    void mineIsKept();
    void lossesInTheirsAreTold();
    void savesOfOurOwnAreNotTold();
    void malformedFileIsReloaded();
    void removedFileIsToldAndSavedAgain();
    void somethingElseInItsPlace_data();
    void somethingElseInItsPlace();
    void folderIsGone();
    void largeTextIsSavedElsewhere_data();
    void largeTextIsSavedElsewhere();
    void readOnlyIsToldAtOnce();
    void ownersAreTold_data();
    void ownersAreTold();
    void editOfTheWindowsOwnSettingsIsTakenOver_data();
    void editOfTheWindowsOwnSettingsIsTakenOver();
    void restOfTheWindowsOwnSettingsIsWritten();
};

void tst_SettingsOutside::changeIsToldAndReloaded()
{
    const ShownSettings shown;
    FileNotice* state = State(shown.editor);
    QVERIFY(!state->isVisible());
    QVERIFY(TestFiles::writeOver(shown.file, WithFont("other"))); // as long
    QTRY_VERIFY_WITH_TIMEOUT(state->isVisible(), Patience);
    QCOMPARE(state->text(), QString("some.cfg was changed by another program."));
    QCOMPARE(VisibleButtons(state), QStringList({"Compare...", "Dismiss", "Keep Mine", "Reload"}));
    Click(Button(state, "Reload"));
    QCOMPARE(CellText(shown.tree, 0, 0, 1), QString("other"));
    QVERIFY(!state->isVisible());
    QVERIFY(!shown.editor->isModified());
}

void tst_SettingsOutside::reloadCanBeUndone()
{
    const ShownSettings shown;
    SetValue(shown.tree, 0, "mine");
    QVERIFY(TestFiles::writeOver(shown.file, WithFont("theirs")));
    QTRY_VERIFY_WITH_TIMEOUT(State(shown.editor)->isVisible(), Patience);
    Click(Button(State(shown.editor), "Reload"));
    QCOMPARE(CellText(shown.tree, 0, 0, 1), QString("theirs"));
    QVERIFY(!shown.editor->isModified());
    QVERIFY(Action(*shown.window, "Undo Reload"));
    QTest::keyClick(shown.window.get(), Qt::Key_Z, Qt::ControlModifier);
    QCOMPARE(CellText(shown.tree, 0, 0, 1), QString("mine"));
    QVERIFY(shown.editor->isModified());
    QVERIFY(shown.tree->isExpanded(Cell(shown.tree, 0)));
    QTest::keyClick(shown.window.get(), Qt::Key_S, Qt::ControlModifier); // asks nothing
    QCOMPARE(TestFiles::read(shown.file), WithFont("mine"));
    QCOMPARE(TestFiles::read(shown.file + ".bak"), WithFont("theirs"));
}

void tst_SettingsOutside::reloadOfWhatIsNoTreeCanBeUndone_data()
{
    QTest::addColumn<QByteArray>("theirs");
    QTest::newRow("malformed") << QByteArray("<VelocorSettings><a>");
    QTest::newRow("empty") << QByteArray();
    QTest::newRow("another root element") << QByteArray("<Other><a><b>1</b></a></Other>");
}

// In the text: the tree has no way back from a file that it cannot show.
void tst_SettingsOutside::reloadOfWhatIsNoTreeCanBeUndone()
{
    QFETCH(QByteArray, theirs);
    const ShownSettings shown;
    auto const* page = shown.editor->findChild<SettingsTextPage*>();
    SetValue(shown.tree, 0, "mine");
    QVERIFY(TestFiles::writeOver(shown.file, theirs));
    QTRY_VERIFY_WITH_TIMEOUT(Button(State(shown.editor), "Reload")->isVisible(), Patience);
    Click(Button(State(shown.editor), "Reload"));
    QVERIFY(page->isVisible() && !State(shown.editor)->isVisible());
    QCOMPARE(page->bytes(), theirs);
    QVERIFY(!shown.editor->isModified());
    const QString told = shown.editor->findChild<NoticeBar*>()->text();
    QVERIFY2(told.endsWith("where Undo brings your changes back."), qPrintable(told));
    Action(*shown.window, "Undo Edit Text")->trigger();
    QCOMPARE(page->bytes(), WithFont("mine"));
    QVERIFY(shown.editor->isModified());
    shown.editor->ShowAsTree();
    QCOMPARE(CellText(shown.tree, 0, 0, 1), QString("mine"));
    QTest::keyClick(shown.window.get(), Qt::Key_S, Qt::ControlModifier); // asks nothing
    QCOMPARE(TestFiles::read(shown.file), WithFont("mine"));
}

void tst_SettingsOutside::reloadAsksBeforeItLosesChanges_data()
{
    QTest::addColumn<QString>("mine");
    QTest::addColumn<bool>("isDiscarded");
    const QString beyondLatin1 = QChar(0x20ac);
    QTest::newRow("a character that no text would have, kept") << beyondLatin1 << false;
    QTest::newRow("a character that no text would have, discarded") << beyondLatin1 << true;
    QTest::newRow("a line break that no text would have, kept") << QString("a\rb") << false;
    QTest::newRow("larger than a text, discarded") << QString(2 << 20, 'x') << true;
}

void tst_SettingsOutside::reloadAsksBeforeItLosesChanges()
{
    QFETCH(QString, mine);
    QFETCH(bool, isDiscarded);
    const ShownSettings shown;
    SettingsDocument changed = shown.editor->document();
    changed.SetValue("Editor", "font", mine);
    QVERIFY(TestFiles::writeOver(shown.file, SettingsFileWriter::ToBytes(changed)));
    shown.editor->Reload();
    SetValue(shown.tree, 1, "other");
    if (CellText(shown.tree, 0, 0, 1) != mine && mine.size() < 100)
        SetValue(shown.tree, 0, mine);
    QVERIFY(TestFiles::writeOver(shown.file, "<VelocorSettings><a>"));
    QTRY_VERIFY_WITH_TIMEOUT(Button(State(shown.editor), "Reload")->isVisible(), Patience);
    QString told;
    WindowTest::whenShown<QMessageBox>([&](QMessageBox* box) {
        told = box->text();
        Click(box->button(isDiscarded ? QMessageBox::Discard : QMessageBox::Cancel));
    });
    Click(Button(State(shown.editor), "Reload"));
    QCOMPARE(told, QString("Discard your changes to some.cfg?"));
    QCOMPARE(shown.tree->isVisible(), !isDiscarded);
    QCOMPARE(shown.editor->isModified(), !isDiscarded);
    QCOMPARE(Button(State(shown.editor), "Reload")->isVisible(), !isDiscarded);
    if (!isDiscarded)
        QCOMPARE(CellText(shown.tree, 0, 1, 1), QString("other"));
}

void tst_SettingsOutside::reloadStaysInTheTextAndCanBeUndone()
{
    const ShownSettings shown;
    auto const* page = shown.editor->findChild<SettingsTextPage*>();
    shown.editor->ShowAsText();
    QVERIFY(TestFiles::writeOver(shown.file, WithFont("theirs")));
    QTRY_VERIFY_WITH_TIMEOUT(State(shown.editor)->isVisible(), Patience);
    Click(Button(State(shown.editor), "Reload"));
    QVERIFY(page->isVisible() && !shown.editor->isModified());
    QCOMPARE(page->bytes(), WithFont("theirs"));
    shown.editor->Undo();
    QCOMPARE(page->bytes(), Settings);
    QVERIFY(shown.editor->isModified());
}

void tst_SettingsOutside::reloadTellsWhatSavingWouldLose()
{
    const ShownSettings shown;
    auto const* notice = shown.editor->findChild<NoticeBar*>();
    for (bool isLossy : {true, false}) {
        QVERIFY(TestFiles::writeOver(shown.file, (isLossy ? "<!-- why -->" : "") + Settings));
        QTRY_VERIFY_WITH_TIMEOUT(State(shown.editor)->isVisible(), Patience);
        Click(Button(State(shown.editor), "Reload"));
        QCOMPARE(notice->text(), QString(isLossy ? "Saving would lose 1 item in this file." : ""));
    }
}

// Only for those whom permissions bind: the administrator may read everything.
void tst_SettingsOutside::reloadKeepsWhatIsShownOfAnUnreadableFile()
{
    if (geteuid() == 0)
        QSKIP("the administrator can read every file");
    const ShownSettings shown;
    SetValue(shown.tree, 0, "mine");
    QVERIFY(TestFiles::writeOver(shown.file, WithFont("theirs")));
    QTRY_VERIFY_WITH_TIMEOUT(State(shown.editor)->isVisible(), Patience);
    QVERIFY(QFile::setPermissions(shown.file, QFileDevice::WriteOwner));
    Click(Button(State(shown.editor), "Reload"));
    QCOMPARE(Status(*shown.window), QString("some.cfg cannot be read"));
    QVERIFY(shown.tree->isVisible() && shown.editor->isModified());
    QCOMPARE(CellText(shown.tree, 0, 0, 1), QString("mine"));
    QVERIFY(QFile::setPermissions(shown.file, QFileDevice::ReadOwner | QFileDevice::WriteOwner));
    Click(Button(State(shown.editor), "Reload"));
    QCOMPARE(CellText(shown.tree, 0, 0, 1), QString("theirs"));
}

void tst_SettingsOutside::mineIsKept()
{
    const ShownSettings shown;
    QVERIFY(TestFiles::writeOver(shown.file, WithFont("theirs")));
    QTRY_VERIFY_WITH_TIMEOUT(State(shown.editor)->isVisible(), Patience);
    Click(Button(State(shown.editor), "Keep Mine"));
    QVERIFY(!State(shown.editor)->isVisible());
    QVERIFY(shown.editor->isModified()); // although nothing was changed here
    QTest::keyClick(shown.window.get(), Qt::Key_S, Qt::ControlModifier);
    QCOMPARE(TestFiles::read(shown.file), Settings);

    // The next change is told again.
    QVERIFY(TestFiles::writeOver(shown.file, WithFont("others")));
    QTRY_VERIFY_WITH_TIMEOUT(State(shown.editor)->isVisible(), Patience);
}

void tst_SettingsOutside::lossesInTheirsAreTold()
{
    const ShownSettings shown;
    QVERIFY(TestFiles::writeOver(shown.file, "<!-- why -->" + Settings));
    QTRY_VERIFY_WITH_TIMEOUT(State(shown.editor)->isVisible(), Patience);
    Click(Button(State(shown.editor), "Keep Mine"));
    QString told;
    WindowTest::whenShown<QMessageBox>([&](QMessageBox* box) {
        told = box->informativeText();
        QTest::keyClick(box, Qt::Key_Escape);
    });
    QTest::keyClick(shown.window.get(), Qt::Key_S, Qt::ControlModifier);
    QCOMPARE(told, QString("Line 1: the comment \"why\""));
    QCOMPARE(TestFiles::read(shown.file), "<!-- why -->" + Settings);
}

void tst_SettingsOutside::savesOfOurOwnAreNotTold()
{
    const ShownSettings shown;
    SetValue(shown.tree, 0, "mine");
    QSignalSpy changes(shown.editor->findChild<FileWatch*>(), &FileWatch::changed);
    QTest::keyClick(shown.window.get(), Qt::Key_S, Qt::ControlModifier);
    QVERIFY(TestFiles::write(shown.folder() + "another", "x")); // so that it looks at the folder
    QTRY_VERIFY_WITH_TIMEOUT(!changes.isEmpty(), Patience);
    QVERIFY(!State(shown.editor)->isVisible());
}

void tst_SettingsOutside::malformedFileIsReloaded()
{
    const ShownSettings shown("<VelocorSettings><a>");
    QVERIFY(!shown.tree->isVisible());
    QVERIFY(TestFiles::writeOver(shown.file, Settings));
    QTRY_VERIFY_WITH_TIMEOUT(State(shown.editor)->isVisible(), Patience);
    Click(Button(State(shown.editor), "Reload"));
    QVERIFY(shown.tree->isVisible());
    QCOMPARE(CellText(shown.tree, 0, 0, 1), QString("Serif"));
}

void tst_SettingsOutside::removedFileIsToldAndSavedAgain()
{
    const ShownSettings shown;
    QVERIFY(QFile::remove(shown.file));
    FileNotice* state = State(shown.editor);
    QTRY_VERIFY_WITH_TIMEOUT(state->isVisible(), Patience);
    QCOMPARE(state->text(), QString("some.cfg was removed. Saving changes creates it again."));
    QCOMPARE(VisibleButtons(state), QStringList({"Dismiss", "Save As..."}));
    SetValue(shown.tree, 0, "mine");
    QTest::keyClick(shown.window.get(), Qt::Key_S, Qt::ControlModifier);
    QCOMPARE(TestFiles::read(shown.file), WithFont("mine"));
    QVERIFY(!state->isVisible());
}

void tst_SettingsOutside::somethingElseInItsPlace_data()
{
    QTest::addColumn<bool>("isFolder");
    QTest::addColumn<QString>("told");
    QTest::newRow("folder") << true << "some.cfg is a folder now, not a file.";
    QTest::newRow("pipe") << false << "some.cfg is not a regular file any more.";
}

void tst_SettingsOutside::somethingElseInItsPlace()
{
    QFETCH(bool, isFolder);
    const ShownSettings shown;
    QVERIFY(QFile::remove(shown.file));
    const QByteArray path = QFile::encodeName(shown.file);
    QCOMPARE(isFolder ? mkdir(path.constData(), 0700) : mkfifo(path.constData(), 0600), 0);
    FileNotice* state = State(shown.editor);
    QFETCH(QString, told);
    QTRY_COMPARE_WITH_TIMEOUT(state->text(), told, Patience);
    QCOMPARE(VisibleButtons(state), QStringList({"Dismiss", "Save As..."}));
}

void tst_SettingsOutside::folderIsGone()
{
    const WindowTest test;
    const QString folder = test.folder() + "going/";
    QVERIFY(TestFiles::write(folder + "some.cfg", Settings));
    const auto window = WindowTest::show();
    window->OpenFile(folder + "some.cfg");
    SettingsEditor const* editor = window->findChild<FileTabs*>()->currentEditor();
    auto* tree = Child<QTreeView>(window.get(), "Settings");
    SetValue(tree, 0, "mine");
    QVERIFY(QDir(folder).removeRecursively());
    FileNotice* state = State(editor);
    QTRY_VERIFY_WITH_TIMEOUT(state->isVisible(), Patience);
    QTRY_COMPARE_WITH_TIMEOUT(state->text(), QString("The folder of some.cfg is gone."), Patience);

    const QString other = test.folder() + "other.cfg";
    WindowTest::whenShown<QFileDialog>([&](QFileDialog* dialog) {
        dialog->findChild<QLineEdit*>("fileNameEdit")->setText(other);
        QTest::keyClick(dialog->findChild<QLineEdit*>("fileNameEdit"), Qt::Key_Return);
    });
    Click(Button(state, "Save As..."));
    QCOMPARE(TestFiles::read(other), WithFont("mine"));
    QCOMPARE(editor->path(), other);
    QVERIFY(!state->isVisible() && !editor->isModified());
    QCOMPARE(window->findChild<FileTabs*>()->tabText(1), QString("other.cfg"));
    QCOMPARE(window->findChild<FileTabs*>()->tabToolTip(1), other);
    QCOMPARE(editor->accessibleName(), QString("other.cfg"));
    QVERIFY(Child<QAbstractButton>(window.get(), "Close other.cfg"));
}

void tst_SettingsOutside::largeTextIsSavedElsewhere_data()
{
    QTest::addColumn<bool>("returns");
    QTest::newRow("the file is gone") << false;
    QTest::newRow("the file is back") << true;
}

// Only its start is in the editor; that must not be taken for the file.
void tst_SettingsOutside::largeTextIsSavedElsewhere()
{
    QFETCH(bool, returns);
    const QByteArray large = "<a>" + QByteArray("<b>\n").repeated(400000);
    const ShownSettings shown(large);
    QVERIFY(QFile::remove(shown.file));
    FileNotice* state = State(shown.editor);
    QTRY_VERIFY_WITH_TIMEOUT(state->isVisible(), Patience);
    const QString other = shown.folder() + "other.cfg";
    QVERIFY(TestFiles::write(other, "other"));
    QString told;
    WindowTest::whenShown<QFileDialog>([&](QFileDialog* dialog) {
        if (returns)
            TestFiles::write(shown.file, large);
        WindowTest::whenShown<QMessageBox>([&](QMessageBox* box) { // that other.cfg exists
            WindowTest::whenShown<QMessageBox>([&](QMessageBox* failure) {
                told = failure->text();
                QTest::keyClick(failure, Qt::Key_Escape);
            });
            Click(box->button(QMessageBox::Yes));
        });
        dialog->findChild<QLineEdit*>("fileNameEdit")->setText(other);
        QTest::keyClick(dialog->findChild<QLineEdit*>("fileNameEdit"), Qt::Key_Return);
    });
    Click(Button(state, "Save As..."));
    QCOMPARE(TestFiles::read(other), returns ? large : QByteArray("other"));
    QCOMPARE(TestFiles::read(other + ".bak"), QByteArray("other"));
    QCOMPARE(shown.editor->path(), returns ? other : shown.file);
    QCOMPARE(told, returns ? QString()
                           : "Could not save " + other + ".\n" + shown.file +
                                 " cannot be read any more.");
}

// Only to those who may not write it: the administrator may write everything.
void tst_SettingsOutside::readOnlyIsToldAtOnce()
{
    const WindowTest test;
    const QString file = test.folder() + "some.cfg";
    QVERIFY(TestFiles::write(file, Settings));
    QVERIFY(QFile::setPermissions(file, QFileDevice::ReadOwner));
    const auto window = WindowTest::show();
    window->OpenFile(file);
    FileNotice const* state = State(window->findChild<FileTabs*>()->currentEditor());
    if (geteuid() == 0) {
        QVERIFY(!state->isVisible());
        return;
    }
    QVERIFY(state->isVisible());
    QCOMPARE(state->text(),
             QString("some.cfg is read-only. Changes can only be saved to another file."));
    QCOMPARE(VisibleButtons(state), QStringList({"Dismiss", "Save As..."}));
}

void tst_SettingsOutside::ownersAreTold_data()
{
    QTest::addColumn<QString>("owner");
    QTest::addColumn<QString>("told");
    QTest::newRow("window") << "window"
                            << "settings of this window. It takes over what you save";
    QTest::newRow("window, through a link")
        << "link"
        << "settings of this window. It takes over what you save";
    QTest::newRow("log") << "log"
                         << "settings of this program's log. It reads them at the next";
    QTest::newRow("nobody") << "nobody"
                            << "";
}

void tst_SettingsOutside::ownersAreTold()
{
    QFETCH(QString, owner);
    QFETCH(QString, told);
    const WindowTest test;
    const QString other = test.folder() + "some.cfg";
    const QString file = owner == "window" ? test.settingsFile()
                         : owner == "log"  ? LogPreferences::FileName()
                                           : other;
    if (owner == "link")
        QVERIFY(QFile::link(test.settingsFile(), other));
    if (owner != "log")
        QVERIFY(TestFiles::write(owner == "link" ? test.settingsFile() : file, Settings));
    const auto window = WindowTest::show();
    window->OpenFile(file);
    SettingsEditor const* editor = window->findChild<FileTabs*>()->currentEditor();
    QVERIFY(editor);
    auto const* notice = editor->findChild<NoticeBar*>();
    QCOMPARE(notice->isVisible(), !told.isEmpty());
    QVERIFY2(notice->text().contains(told), qPrintable(notice->text()));
}

void tst_SettingsOutside::editOfTheWindowsOwnSettingsIsTakenOver_data()
{
    QTest::addColumn<QString>("edit");
    QTest::newRow("a value that the window writes") << "value";
    QTest::newRow("a value of somebody else") << "foreign";
    QTest::newRow("a removed key") << "removed";
    QTest::newRow("a new key") << "added";
}

void tst_SettingsOutside::editOfTheWindowsOwnSettingsIsTakenOver()
{
    QFETCH(QString, edit);
    const WindowTest test;
    QVERIFY(TestFiles::write(test.settingsFile(),
                             "<VelocorSettings>\n<MainWindow>\n<zoom>0</zoom>\n"
                             "<foreign>old</foreign>\n</MainWindow>\n</VelocorSettings>\n"));
    const auto window = WindowTest::show();
    window->OpenFile(test.settingsFile());
    auto* tree = Child<QTreeView>(window.get(), "Settings");
    if (edit == "value") {
        SetValue(tree, 0, "3");
    } else if (edit == "foreign") {
        SetValue(tree, 1, "new");
    } else {
        GoTo(tree, ItemCell(tree, 0, 1, 0));
        QTest::keyClick(tree, edit == "removed" ? Qt::Key_Delete : Qt::Key_Insert);
    }
    if (edit == "added")
        Enter(tree);
    QTest::keyClick(window.get(), Qt::Key_S, Qt::ControlModifier);
    QVERIFY(window->close());
    const SettingsDocument written = SettingsFileReader::Read(test.settingsFile());
    QCOMPARE(written.Value("MainWindow", "zoom"), QString(edit == "value" ? "3" : "0"));
    QCOMPARE(written.Value("MainWindow", "foreign", "none"), QString(edit == "foreign"   ? "new"
                                                                     : edit == "removed" ? "none"
                                                                                         : "old"));
    QCOMPARE(written.Value("MainWindow", "key", "none"),
             QString(edit == "added" ? "value" : "none"));
}

void tst_SettingsOutside::restOfTheWindowsOwnSettingsIsWritten()
{
    const WindowTest test;
    QVERIFY(TestFiles::write(test.settingsFile(),
                             "<VelocorSettings>\n<MainWindow>\n<zoom>0</zoom>\n"
                             "<toolBarShown>yes</toolBarShown>\n</MainWindow>\n"
                             "</VelocorSettings>\n"));
    const auto window = WindowTest::show();
    window->OpenFile(test.settingsFile());
    SetValue(Child<QTreeView>(window.get(), "Settings"), 0, "3");
    QTest::keyClick(window.get(), Qt::Key_S, Qt::ControlModifier);
    QTest::keyClick(window.get(), Qt::Key_B, Qt::ControlModifier | Qt::AltModifier);
    QVERIFY(window->close());
    const SettingsDocument written = SettingsFileReader::Read(test.settingsFile());
    QCOMPARE(written.Value("MainWindow", "toolBarShown"), QString("no"));
    QCOMPARE(written.Value("MainWindow", "currentFile").isEmpty(), false);
    QVERIFY(!written.Value("ApplicationScreens", "MainWindow").isEmpty());
}

QTEST_MAIN(tst_SettingsOutside)

#include "tst_SettingsOutside.moc"
