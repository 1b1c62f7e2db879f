// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The saved states of a settings file on a real screen: listed, compared, brought back, removed.

#include "ShownSettings.h"
#include "WindowParts.h"
#include "WindowTestCase.h"

#include "app/settingsfile/SavedStates.h"
#include "app/window/settings/DifferenceDialog.h"
#include "app/window/settings/DifferenceTree.h"
#include "app/window/settings/SavedStatesDialog.h"
#include "app/window/settings/SettingsTextPage.h"

#include <QHeaderView>
#include <QMessageBox>
#include <QPushButton>
#include <QTreeWidget>

using namespace Velocor;
using namespace WindowParts;

class tst_SettingsStates : public WindowTestCase
{
    Q_OBJECT

private slots:
    void statesAreListedWithTheirChanges();
    void othersStateIsKeptToo();
    void stateIsBroughtBackAndUndone();
    void damagedStateIsBroughtBackAsText();
    void commentsAreBroughtBackToo();
    void takesThePlaceOfATextThatCannotBeEdited();
    void stateIsCompared();
    void removedAfterAsking();
    void backupStaysTheFirstState();
    void problemIsTold();
};

namespace {

QByteArray WithFont(QByteArray const& font)
{
    return QByteArray(Settings).replace("Serif", font);
}

class ShownStates : public ShownSettings
{
public:
    using ShownSettings::ShownSettings;

    void save(QString const& value) const
    {
        QVERIFY(activate(window.get()));
        SetValue(tree, 0, value);
        QTest::keyClick(window.get(), Qt::Key_S, Qt::ControlModifier);
        QVERIFY(!editor->isModified());
    }

    // Opens the dialog with its key, and closes it afterwards.
    void open(std::function<void(SavedStatesDialog*)> const& work) const
    {
        QVERIFY(activate(window.get()));
        whenShown<SavedStatesDialog>([&](SavedStatesDialog* dialog) {
            work(dialog);
            if (dialog->isVisible())
                dialog->reject();
        });
        QWidget* page = editor->focusProxy();
        page->setFocus();
        QTest::keyClick(QApplication::focusWidget(), Qt::Key_T,
                        Qt::ControlModifier | Qt::ShiftModifier);
    }

    QStringList listed() const
    {
        QStringList changes;
        open([&](SavedStatesDialog* dialog) {
            auto const* list = dialog->findChild<QTreeWidget*>();
            for (int i = 0; i < list->topLevelItemCount(); ++i)
                changes.append(list->topLevelItem(i)->text(2));
        });
        return changes;
    }
};

QPushButton* Button(QWidget* parent, QString const& text)
{
    const QList<QPushButton*> buttons = parent->findChildren<QPushButton*>();
    for (QPushButton* button : buttons) {
        if (button->text().remove('&') == text)
            return button;
    }
    return nullptr;
}

void PressEnterOn(QPushButton* button)
{
    button->setFocus();
    QTest::keyClick(button, Qt::Key_Space);
}

} // namespace

void tst_SettingsStates::statesAreListedWithTheirChanges()
{
    const ShownStates shown;
    QCOMPARE(shown.listed(), QStringList());
    shown.save("mine");
    QCOMPARE(shown.listed(), QStringList({"Editor/font", "Oldest one kept"}));
    shown.save("yours");
    QCOMPARE(shown.listed(), QStringList({"Editor/font", "Editor/font", "Oldest one kept"}));
    QCOMPARE(QFileInfo(shown.file).dir().entryList({"some*"}, QDir::Files),
             QStringList({"some.cfg", "some.cfg.bak"}));
}

// What another program wrote in between would be lost by the save.
void tst_SettingsStates::othersStateIsKeptToo()
{
    const ShownStates shown;
    shown.save("mine");
    QVERIFY(TestFiles::writeOver(shown.file, WithFont("theirs")));
    shown.editor->Reload();
    shown.save("again");
    QCOMPARE(shown.listed().size(), 4);
}

void tst_SettingsStates::stateIsBroughtBackAndUndone()
{
    const ShownStates shown;
    shown.save("mine");
    shown.save("yours");
    shown.open([](SavedStatesDialog* dialog) {
        auto* list = dialog->findChild<QTreeWidget*>();
        QVERIFY(list->hasFocus());
        QTest::keyClick(list, Qt::Key_End);
        PressEnterOn(Button(dialog, "Bring Back"));
    });
    QCOMPARE(CellText(shown.tree, 0, 0, 1), QString("Serif"));
    QVERIFY(shown.editor->isModified());
    QCOMPARE(TestFiles::read(shown.file), WithFont("yours"));
    QVERIFY(Action(*shown.window, "Undo Bring Back"));
    QVERIFY(WindowTest::activate(shown.window.get()));
    QTest::keyClick(shown.window.get(), Qt::Key_Z, Qt::ControlModifier);
    QCOMPARE(CellText(shown.tree, 0, 0, 1), QString("yours"));
    QVERIFY(!shown.editor->isModified());
}

void tst_SettingsStates::damagedStateIsBroughtBackAsText()
{
    const QByteArray broken = QByteArray(Settings).replace("</font>", "</fnt>");
    const ShownStates shown(broken);
    auto* page = shown.editor->findChild<SettingsTextPage*>();
    page->Replace(Settings);
    QVERIFY(shown.editor->Save());
    QCOMPARE(shown.listed(), QStringList({"Mended", "Damaged: tag mismatch"}));
    shown.editor->ShowAsTree();
    shown.open([](SavedStatesDialog* dialog) {
        QTest::keyClick(dialog->findChild<QTreeWidget*>(), Qt::Key_Down);
        PressEnterOn(Button(dialog, "Bring Back"));
    });
    QVERIFY(page->isVisible());
    QCOMPARE(page->bytes(), broken);
    shown.editor->Undo();
    QCOMPARE(page->bytes(), Settings);
}

// The tree would bring back only its values.
void tst_SettingsStates::commentsAreBroughtBackToo()
{
    const QByteArray commented = QByteArray(Settings).replace("<Editor>", "<!-- why --><Editor>");
    const ShownStates shown(commented);
    WindowTest::whenShown<QMessageBox>(
        [](QMessageBox* box) { PressEnterOn(Button(box, "Save Anyway")); });
    shown.save("mine");
    QCOMPARE(TestFiles::read(shown.file), WithFont("mine"));
    shown.open([](SavedStatesDialog* dialog) {
        QTest::keyClick(dialog->findChild<QTreeWidget*>(), Qt::Key_End);
        PressEnterOn(Button(dialog, "Bring Back"));
    });
    QVERIFY(shown.editor->Save());
    QCOMPARE(TestFiles::read(shown.file), commented);
}

void tst_SettingsStates::takesThePlaceOfATextThatCannotBeEdited()
{
    const ShownStates shown;
    shown.save("mine");
    const QByteArray mixed = "<a>\r\n<b>\n</a>";
    QVERIFY(TestFiles::writeOver(shown.file, mixed));
    shown.editor->Reload();
    auto const* page = shown.editor->findChild<SettingsTextPage*>();
    QVERIFY(page->isVisible() && page->isReadOnly());
    shown.open([](SavedStatesDialog* dialog) { PressEnterOn(Button(dialog, "Bring Back")); });
    QCOMPARE(page->bytes(), WithFont("mine"));
    QVERIFY(shown.editor->isModified());
    QVERIFY(shown.editor->Save());
    QCOMPARE(TestFiles::read(shown.file), WithFont("mine"));
}

void tst_SettingsStates::stateIsCompared()
{
    const ShownStates shown;
    shown.save("mine");
    int differences = -1;
    shown.open([&](SavedStatesDialog* dialog) {
        QTest::keyClick(dialog->findChild<QTreeWidget*>(), Qt::Key_Down);
        WindowTest::whenShown<DifferenceDialog>([&](DifferenceDialog* difference) {
            differences = difference->tree()->difference().count();
            difference->reject();
        });
        PressEnterOn(Button(dialog, "Compare..."));
    });
    QCOMPARE(differences, 1);
}

void tst_SettingsStates::removedAfterAsking()
{
    const ShownStates shown;
    shown.save("mine");
    for (bool agreed : {false, true}) {
        shown.open([&](SavedStatesDialog* dialog) {
            WindowTest::whenShown<QMessageBox>([&](QMessageBox* box) {
                PressEnterOn(Button(box, agreed ? "Remove All" : "Cancel"));
            });
            PressEnterOn(Button(dialog, "Remove All..."));
        });
        QCOMPARE(shown.listed().size(), agreed ? 0 : 2);
    }
    QCOMPARE(TestFiles::read(shown.file), WithFont("mine"));
    QCOMPARE(TestFiles::read(shown.file + ".bak"), Settings);
}

void tst_SettingsStates::backupStaysTheFirstState()
{
    const ShownStates shown;
    for (int i = 0; i < 3; ++i)
        shown.save(QString::number(i));
    QCOMPARE(TestFiles::read(shown.file + ".bak"), Settings);
}

// The file is saved all the same.
void tst_SettingsStates::problemIsTold()
{
    const ShownStates shown;
    QVERIFY(TestFiles::write(shown.folder() + "in the way", "x"));
    shown.editor->SetStates(SavedStates(shown.folder() + "in the way/"));
    shown.save("mine");
    QCOMPARE(TestFiles::read(shown.file), WithFont("mine"));
    const QString status = Status(*shown.window);
    QVERIFY2(status.startsWith("Saved some.cfg, but its state is not kept: Cannot create"),
             qPrintable(status));
}

QTEST_MAIN(tst_SettingsStates)

#include "tst_SettingsStates.moc"
