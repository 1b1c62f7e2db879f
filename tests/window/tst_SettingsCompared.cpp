// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// What saving would write, and other files beside the one in the editor.

#include "ShownSettings.h"
#include "WindowParts.h"
#include "WindowTestCase.h"

#include "app/window/settings/DifferenceDialog.h"
#include "app/window/settings/DifferenceTree.h"
#include "app/window/settings/FileNotice.h"

#include <QFileDialog>
#include <QLabel>
#include <QMessageBox>
#include <QPlainTextEdit>
#include <QPushButton>
#include <QTextBlock>
#include <QUndoStack>

using namespace Velocor;
using namespace WindowParts;

namespace {

// What a dialog shows, row by row: name|difference|left|right|lost.
QStringList ShownRows(DifferenceDialog const* dialog)
{
    QStringList rows;
    const auto add = [&](QTreeWidgetItem const* item) {
        QStringList cells;
        for (int i = 0; i < DifferenceTree::ColumnCount; ++i)
            cells.append(item->text(i));
        rows.append(cells.join('|'));
    };
    for (int i = 0; i < dialog->tree()->topLevelItemCount(); ++i) {
        QTreeWidgetItem const* section = dialog->tree()->topLevelItem(i);
        add(section);
        for (int j = 0; j < section->childCount(); ++j)
            add(section->child(j));
    }
    return rows;
}

// Opens it with its keys.
void WithWritten(ShownSettings const& shown, std::function<void(DifferenceDialog*)> const& work)
{
    WindowTest::whenShown<DifferenceDialog>([&](DifferenceDialog* dialog) {
        QVERIFY(WindowTest::activate(dialog));
        work(dialog);
        QTest::keyClick(dialog, Qt::Key_Escape);
    });
    QTest::keyClick(shown.window.get(), Qt::Key_W, Qt::ControlModifier | Qt::ShiftModifier);
    QVERIFY(WindowTest::activate(shown.window.get()));
}

void WithOther(ShownSettings const& shown, QString const& path,
               std::function<void(DifferenceDialog*)> const& work)
{
    WindowTest::whenShown<QFileDialog>([=](QFileDialog* files) {
        WindowTest::whenShown<DifferenceDialog>([=](DifferenceDialog* dialog) {
            QVERIFY(WindowTest::activate(dialog));
            work(dialog);
            QTest::keyClick(dialog, Qt::Key_Escape);
        });
        files->findChild<QLineEdit*>("fileNameEdit")->setText(path);
        QTest::keyClick(files->findChild<QLineEdit*>("fileNameEdit"), Qt::Key_Return);
    });
    QTest::keyClick(shown.window.get(), Qt::Key_D, Qt::ControlModifier | Qt::ShiftModifier);
    QVERIFY(WindowTest::activate(shown.window.get()));
}

QString Summary(DifferenceDialog* dialog)
{
    return Child<QLabel>(dialog, "Summary")->text();
}

void Press(DifferenceDialog* dialog, QString const& text)
{
    const QList<QAbstractButton*> buttons = dialog->findChildren<QAbstractButton*>();
    for (QAbstractButton* button : buttons) {
        if (button->text() == text) {
            button->setFocus();
            QTest::keyClick(button, Qt::Key_Space);
            return;
        }
    }
    QFAIL(qPrintable("no button " + text));
}

// With the arrow keys.
void GoToRow(DifferenceDialog* dialog, QString const& name)
{
    auto* tree = dialog->findChild<DifferenceTree*>();
    tree->setFocus();
    QTest::keyClick(tree, Qt::Key_Home);
    for (int i = 0; i < 20 && tree->currentItem()->text(0) != name; ++i)
        QTest::keyClick(tree, Qt::Key_Down);
    QCOMPARE(tree->currentItem()->text(0), name);
}

void TakeOver(DifferenceDialog* dialog)
{
    Press(dialog, "&Take Over");
}

QByteArray const Other("<VelocorSettings>\n<Editor>\n<font>Sans</font>\n<tabs>4</tabs>\n"
                       "</Editor>\n<New>\n<a>1</a>\n<b>2</b>\n</New>\n</VelocorSettings>\n");

} // namespace

class tst_SettingsCompared : public WindowTestCase
{
    Q_OBJECT

private slots:
    void writtenIsShown_data();
    void writtenIsShown();
    void savingDoesWhatIsShown();
    void lossesAreInTheirPlaces();
    void everythingIsShownOnDemand();
    void linesAreShownOnDemand();
    void otherFileIsCompared();
    void valuesAreTakenOver_data();
    void valuesAreTakenOver();
    void takingOverMoves();
    void takingOverIsUndone();
    void changedFileIsCompared();
    void unreadableFileIsTold();
    void onlySettingsAreCompared();
};

void tst_SettingsCompared::writtenIsShown_data()
{
    QTest::addColumn<int>("key");
    QTest::addColumn<QStringList>("rows");
    QTest::addColumn<QString>("summary");

    QTest::newRow("nothing") << int(Qt::Key_Home) << QStringList() << "No differences";
    QTest::newRow("removed") << int(Qt::Key_Delete)
                             << QStringList({"Editor||||", "font|Only left|Serif||"})
                             << "1 difference";
    QTest::newRow("moved") << int(Qt::Key_Down)
                           << QStringList({"Editor||||", "wrap|Moved|yes|yes|"}) << "1 difference";
    QTest::newRow("added") << int(Qt::Key_Insert)
                           << QStringList({"Editor||||", "key|Only right||value|"})
                           << "1 difference";
    QTest::newRow("changed") << int(Qt::Key_F2)
                             << QStringList({"Editor||||", "font|Changed|Serif|x|"})
                             << "1 difference";
}

void tst_SettingsCompared::writtenIsShown()
{
    QFETCH(int, key);
    const ShownSettings shown;
    shown.tree->setFocus();
    WindowParts::GoTo(shown.tree, ItemCell(shown.tree, 0, 0, 1));
    QTest::keyClick(shown.tree, Qt::Key(key),
                    key == Qt::Key_Down ? Qt::AltModifier : Qt::NoModifier);
    if (key == Qt::Key_F2) // what is being typed counts
        QTest::keyClicks(shown.tree->findChild<QLineEdit*>(), "x");
    QStringList rows;
    QString summary;
    WithWritten(shown, [&](DifferenceDialog* dialog) {
        rows = ShownRows(dialog);
        summary = Summary(dialog);
    });
    QTEST(rows, "rows");
    QTEST(summary, "summary");
    QCOMPARE(TestFiles::read(shown.file), Settings);
}

void tst_SettingsCompared::savingDoesWhatIsShown()
{
    const ShownSettings shown;
    SetValue(shown.tree, 0, "mine");
    WindowParts::GoTo(shown.tree, ItemCell(shown.tree, 0, 0, 0));
    QTest::keyClick(shown.tree, Qt::Key_Down, Qt::AltModifier);
    QString lines;
    WithWritten(shown, [&](DifferenceDialog* dialog) {
        lines = Child<QPlainTextEdit>(dialog, "Lines: After saving")->toPlainText();
        QCOMPARE(ShownRows(dialog),
                 QStringList({"Editor||||", "wrap|Moved|yes|yes|", "font|Changed|Serif|mine|"}));
    });
    QTest::keyClick(shown.window.get(), Qt::Key_S, Qt::ControlModifier);
    QCOMPARE(QString(TestFiles::read(shown.file)), lines);
}

void tst_SettingsCompared::lossesAreInTheirPlaces()
{
    const ShownSettings shown("<!--all--><R><S x='1'><a>1<!--why--></a><b>2</b></S></R>");
    SetValue(shown.tree, 1, QString(QChar(0x416)));
    QStringList rows;
    WithWritten(shown, [&](DifferenceDialog* dialog) {
        rows = ShownRows(dialog);
        QVERIFY(!dialog->tree()->isColumnHidden(DifferenceTree::LossColumn));
        QCOMPARE(Summary(dialog),
                 QString("1 difference; saving would lose what the last column names"));
    });
    QCOMPARE(rows, QStringList({"(whole file)||||Line 1: the comment \"all\"",
                                "S||||Line 1: the attribute \"x\" of \"S\"",
                                "a||1|1|Line 1: the comment \"why\"",
                                "b|Changed|2|?|S / b: characters outside Latin-1 become \"?\""}));
}

void tst_SettingsCompared::everythingIsShownOnDemand()
{
    const ShownSettings shown;
    WithWritten(shown, [&](DifferenceDialog* dialog) {
        QCOMPARE(ShownRows(dialog), QStringList());
        Press(dialog, "&Differences only");
        QCOMPARE(ShownRows(dialog),
                 QStringList({"Editor||||", "font||Serif|Serif|", "wrap||yes|yes|"}));
    });
}

void tst_SettingsCompared::linesAreShownOnDemand()
{
    const ShownSettings shown;
    SetValue(shown.tree, 1, "no");
    WithWritten(shown, [&](DifferenceDialog* dialog) {
        auto* left = Child<QPlainTextEdit>(dialog, "Lines: The file now");
        auto* right = Child<QPlainTextEdit>(dialog, "Lines: After saving");
        QVERIFY(!left->isVisible());
        Press(dialog, "&Lines");
        QVERIFY(left->isVisible() && right->isVisible());
        QCOMPARE(left->toPlainText(), QString(Settings));
        QCOMPARE(right->toPlainText(), QString(Settings).replace("yes", "no"));
        QCOMPARE(left->extraSelections().size(), 1);
        QCOMPARE(left->extraSelections().first().cursor.block().text(),
                 QString("<wrap>yes</wrap>"));
    });
}

void tst_SettingsCompared::otherFileIsCompared()
{
    const ShownSettings shown;
    const QString other = shown.folder() + "other.cfg";
    QVERIFY(TestFiles::write(other, Other));
    QStringList rows;
    QString title;
    WithOther(shown, other, [&](DifferenceDialog* dialog) {
        rows = ShownRows(dialog);
        title = dialog->tree()->headerItem()->text(DifferenceTree::RightColumn);
    });
    QCOMPARE(title, QString("other.cfg"));
    QCOMPARE(rows, QStringList({"Editor||||", "font|Changed|Serif|Sans|", "tabs|Only right||4|",
                                "wrap|Only left|yes||", "New|Only right|||", "a|Only right||1|",
                                "b|Only right||2|"}));
}

void tst_SettingsCompared::valuesAreTakenOver_data()
{
    QTest::addColumn<QString>("name");
    QTest::addColumn<QByteArray>("inside");

    const auto row = [](char const* test, char const* name, char const* inside) {
        QTest::newRow(test) << QString(name) << QByteArray(inside);
    };
    row("a value", "font", "<Editor>\n<font>Sans</font>\n<wrap>yes</wrap>\n</Editor>\n");
    row("a new key", "tabs",
        "<Editor>\n<font>Serif</font>\n<tabs>4</tabs>\n<wrap>yes</wrap>\n</Editor>\n");
    row("a missing key", "wrap", "<Editor>\n<font>Serif</font>\n</Editor>\n");
    row("a section with all in it", "New",
        "<Editor>\n<font>Serif</font>\n<wrap>yes</wrap>\n</Editor>\n"
        "<New>\n<a>1</a>\n<b>2</b>\n</New>\n");
    row("a key of a new section", "b",
        "<Editor>\n<font>Serif</font>\n<wrap>yes</wrap>\n</Editor>\n<New>\n<b>2</b>\n</New>\n");
}

void tst_SettingsCompared::valuesAreTakenOver()
{
    QFETCH(QString, name);
    QFETCH(QByteArray, inside);
    const ShownSettings shown;
    const QString other = shown.folder() + "other.cfg";
    QVERIFY(TestFiles::write(other, Other));
    WithOther(shown, other, [&](DifferenceDialog* dialog) {
        GoToRow(dialog, name);
        const int before = dialog->tree()->difference().count();
        TakeOver(dialog);
        QVERIFY(dialog->tree()->difference().count() < before);
    });
    QCOMPARE(shown.editor->undoStack()->undoText(), QString("Take Over"));
    QTest::keyClick(shown.window.get(), Qt::Key_S, Qt::ControlModifier);
    QCOMPARE(TestFiles::read(shown.file), "<VelocorSettings>\n" + inside + "</VelocorSettings>\n");
}

void tst_SettingsCompared::takingOverMoves()
{
    const ShownSettings shown;
    const QString other = shown.folder() + "other.cfg";
    const QByteArray moved("<VelocorSettings>\n<Editor>\n<wrap>yes</wrap>\n<font>Serif</font>\n"
                           "</Editor>\n</VelocorSettings>\n");
    QVERIFY(TestFiles::write(other, moved));
    WithOther(shown, other, [&](DifferenceDialog* dialog) {
        GoToRow(dialog, "wrap");
        TakeOver(dialog);
        QVERIFY(dialog->tree()->difference().isEmpty());
    });
    QTest::keyClick(shown.window.get(), Qt::Key_S, Qt::ControlModifier);
    QCOMPARE(TestFiles::read(shown.file), moved);
    QTest::keyClick(shown.window.get(), Qt::Key_Z, Qt::ControlModifier);
    QTest::keyClick(shown.window.get(), Qt::Key_S, Qt::ControlModifier);
    QCOMPARE(TestFiles::read(shown.file), Settings);
}

void tst_SettingsCompared::takingOverIsUndone()
{
    const ShownSettings shown;
    const QString other = shown.folder() + "other.cfg";
    QVERIFY(TestFiles::write(other, Other));
    WithOther(shown, other, [&](DifferenceDialog* dialog) {
        GoToRow(dialog, "font");
        TakeOver(dialog);
        QVERIFY(!ShownRows(dialog).contains("font|Changed|Serif|Sans|"));
        QTest::keyClick(dialog, Qt::Key_Z, Qt::ControlModifier);
        // The button shows that it is pressed first.
        QTRY_VERIFY_WITH_TIMEOUT(ShownRows(dialog).contains("font|Changed|Serif|Sans|"), Patience);
        GoToRow(dialog, "wrap");
        TakeOver(dialog);
    });
    QCOMPARE(shown.tree->model()->rowCount(Cell(shown.tree, 0)), 1);
    QTest::keyClick(shown.window.get(), Qt::Key_Z, Qt::ControlModifier);
    QCOMPARE(CellText(shown.tree, 0, 1, 1), QString("yes"));
    QVERIFY(!shown.editor->isModified());
}

void tst_SettingsCompared::changedFileIsCompared()
{
    const ShownSettings shown;
    SetValue(shown.tree, 0, "mine");
    QVERIFY(TestFiles::writeOver(
        shown.file, QByteArray(Settings).replace("Serif", "theirs").replace("yes", "no")));
    auto* state = shown.editor->findChild<FileNotice*>();
    QTRY_VERIFY_WITH_TIMEOUT(state->isVisible(), Patience);
    QPushButton* compare = nullptr;
    const QList<QPushButton*> buttons = state->findChildren<QPushButton*>();
    for (QPushButton* button : buttons) {
        if (button->text() == "Compare...")
            compare = button;
    }
    QVERIFY(compare && compare->isVisible());
    WindowTest::whenShown<DifferenceDialog>([&](DifferenceDialog* dialog) {
        QCOMPARE(ShownRows(dialog),
                 QStringList({"Editor||||", "font|Changed|mine|theirs|", "wrap|Changed|yes|no|"}));
        GoToRow(dialog, "wrap");
        TakeOver(dialog);
        QTest::keyClick(dialog, Qt::Key_Escape);
    });
    Click(compare);
    QCOMPARE(CellText(shown.tree, 0, 0, 1), QString("mine"));
    QCOMPARE(CellText(shown.tree, 0, 1, 1), QString("no"));
}

void tst_SettingsCompared::unreadableFileIsTold()
{
    const ShownSettings shown;
    const QString other = shown.folder() + "other.cfg";
    QVERIFY(TestFiles::write(other, "<a"));
    QString text;
    WindowTest::whenShown<QFileDialog>([&](QFileDialog* files) {
        WindowTest::whenShown<QMessageBox>([&](QMessageBox* box) {
            text = box->text();
            QTest::keyClick(box, Qt::Key_Escape);
        });
        files->findChild<QLineEdit*>("fileNameEdit")->setText(other);
        QTest::keyClick(files->findChild<QLineEdit*>("fileNameEdit"), Qt::Key_Return);
    });
    QTest::keyClick(shown.window.get(), Qt::Key_D, Qt::ControlModifier | Qt::ShiftModifier);
    QVERIFY2(text.startsWith("Cannot compare with " + other), qPrintable(text));
}

void tst_SettingsCompared::onlySettingsAreCompared()
{
    const ShownSettings shown;
    QVERIFY(Action(*shown.window, "What Will Be Written...")->isEnabled());
    QVERIFY(Action(*shown.window, "Compare With...")->isEnabled());
    QVERIFY(TestFiles::write(shown.folder() + "bad.cfg", "<a"));
    shown.window->OpenFile(shown.folder() + "bad.cfg");
    QVERIFY(!Action(*shown.window, "What Will Be Written...")->isEnabled());
    shown.window->findChild<FileTabs*>()->setCurrentIndex(0);
    QVERIFY(!Action(*shown.window, "Compare With...")->isEnabled());
}

QTEST_MAIN(tst_SettingsCompared)

#include "tst_SettingsCompared.moc"
