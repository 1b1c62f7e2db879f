// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The find bar of the settings editor, while it hides what does not match, on a real screen.

#include "ShownSettings.h"
#include "WindowParts.h"
#include "WindowTestCase.h"

#include "app/settingsfile/SettingsFileWriter.h"

#include <QLabel>
#include <QLineEdit>
#include <QToolButton>
#include <QTreeView>

using namespace Velocor;
using namespace WindowParts;

class tst_SettingsFiltered : public WindowTestCase
{
    Q_OBJECT

private slots:
    void showsOnly_data();
    void showsOnly();
    void closingShowsAllAgain();
    void currentRowStaysCurrent();
    void collapsedSectionsStaySo();
    void changedValues();
    void savedValuesAreNotChanged();
    void withoutDefaultsNothingDiffers();
    void removesOnlyWhatIsShown();
    void defaultsOnlyWhatIsShown();
    void movesPastWhatIsShown();
    void newKeyIsShown();
    void undoneChangeIsShown();
    void tabSkipsWhatIsHidden();
    void reloadedFileIsFiltered();
    void editingIsTakenFirst();
    void tellsWhichMatch_data();
    void tellsWhichMatch();
    void countFollowsTheFile_data();
    void countFollowsTheFile();
    void countAfterClosing();
    void tabReachesEverySwitch();
};

namespace {

const QByteArray Values("<VelocorSettings>\n<Editor>\n<font>Serif</font>\n<wrap>yes</wrap>\n"
                        "<tab>4</tab>\n</Editor>\n<Empty>\n</Empty>\n<Window>\n<tabs>1</tabs>\n"
                        "<color>1,2,3</color>\n</Window>\n</VelocorSettings>\n");
const QByteArray Defaults("<VelocorSettings>\n<Editor>\n<font>Sans</font>\n<wrap>yes</wrap>\n"
                          "<tab>8</tab>\n</Editor>\n<Window>\n<color>1,2,4</color>\n</Window>\n"
                          "</VelocorSettings>\n");

class ShownFilter : public ShownSettings
{
public:
    explicit ShownFilter(QByteArray const& defaults = Defaults) : ShownSettings(Values)
    {
        if (!defaults.isEmpty() && !TestFiles::write(folder() + "some.defaults.cfg", defaults))
            qFatal("the defaults cannot be written");
        editor->Open(file);
        tree->setFocus();
    }

    QLineEdit* field() const { return Child<QLineEdit>(editor, "Find in names and values"); }

    // Opens the bar, types a text and presses switches by their keys, such as "oc".
    void filter(QString const& text, QString const& switches = "o") const
    {
        tree->setFocus();
        QTest::keyClick(tree, Qt::Key_F, Qt::ControlModifier);
        for (QChar key : switches)
            press(key);
        QTest::keyClicks(field(), text);
    }

    // A button takes its key at once, but is only pressed soon after.
    void press(QChar key) const
    {
        const QHash<QChar, QString> names{
            {'o', "Only Matches"}, {'c', "Changed"}, {'d', "Not Default"}};
        auto const* button = Child<QToolButton>(editor, names.value(key));
        const bool wasChecked = button->isChecked();
        QTest::keyClick(field(), key.toLatin1(), Qt::AltModifier);
        if (button->isEnabled())
            QTRY_COMPARE_WITH_TIMEOUT(button->isChecked(), !wasChecked, Patience);
    }

    // All rows, such as "Editor: font wrap; Empty".
    QString rows() const
    {
        QStringList sections;
        QAbstractItemModel const* model = tree->model();
        for (int i = 0; i < model->rowCount(); ++i) {
            const QModelIndex section = model->index(i, 0);
            QString text = section.data().toString();
            for (int j = 0; j < model->rowCount(section); ++j)
                text += (j == 0 ? ": " : " ") + model->index(j, 0, section).data().toString();
            sections.append(text);
        }
        return sections.join("; ");
    }

    QByteArray bytes() const { return SettingsFileWriter::ToBytes(editor->document()); }
    QString result() const { return Child<QLabel>(editor, "Result of the search")->text(); }

    QString current() const
    {
        const QModelIndex cell = tree->currentIndex();
        return cell.sibling(cell.row(), 0).data().toString();
    }
};

const QString All("Editor: font wrap tab; Empty; Window: tabs color");

} // namespace

void tst_SettingsFiltered::showsOnly_data()
{
    QTest::addColumn<QString>("text");
    QTest::addColumn<QString>("switches");
    QTest::addColumn<QString>("rows");
    QTest::addColumn<QString>("result");

    const auto row = [](char const* name, char const* text, char const* switches, char const* rows,
                        char const* result) {
        QTest::newRow(name) << text << switches << rows << result;
    };
    row("no filter", "tab", "", qPrintable(All), "1 of 2");
    row("a key", "TAB", "o", "Editor: tab; Window: tabs", "1 of 2");
    row("a value", "serif", "o", "Editor: font", "1 of 1");
    row("a section, with all its keys", "wind", "o", "Window: tabs color", "1 of 1");
    row("an empty section", "empty", "o", "Empty", "1 of 1");
    row("nothing", "none", "o", "", "No match");
    row("all", "", "o", qPrintable(All), "");
    row("switched off again", "tab", "oo", qPrintable(All), "1 of 2");
    row("values that differ from their default", "", "d", "Editor: font tab; Window: color",
        "3 keys");
    row("the same with a text", "tab", "od", "Editor: tab", "1 of 1");
    row("the same with a text to find only", "tab", "d", "Editor: font tab; Window: color",
        "1 of 1");
    row("a match that is hidden", "wrap", "d", "Editor: font tab; Window: color", "No match");
    row("changed values of an unchanged file", "", "c", "", "No match");
}

void tst_SettingsFiltered::showsOnly()
{
    QFETCH(QString, text);
    QFETCH(QString, switches);
    const ShownFilter shown;
    shown.filter(text, switches);
    QTEST(shown.rows(), "rows");
    QTEST(shown.result(), "result");
    QVERIFY(!shown.editor->isModified());
    for (int i = 0; i < shown.tree->model()->rowCount(); ++i)
        QVERIFY(shown.tree->isExpanded(Cell(shown.tree, i)));
}

void tst_SettingsFiltered::closingShowsAllAgain()
{
    const ShownFilter shown;
    shown.filter("tab");
    QTest::keyClick(shown.field(), Qt::Key_Escape);
    QVERIFY(!shown.field()->isVisible() && shown.tree->hasFocus());
    QCOMPARE(shown.rows(), All);

    // Opened again, it filters as before.
    QTest::keyClick(shown.tree, Qt::Key_F, Qt::ControlModifier);
    QCOMPARE(shown.rows(), QString("Editor: tab; Window: tabs"));
    QTest::keyClicks(shown.field(), "font");
    QCOMPARE(shown.rows(), QString("Editor: font"));
}

void tst_SettingsFiltered::currentRowStaysCurrent()
{
    const ShownFilter shown;
    GoTo(shown.tree, ItemCell(shown.tree, 2, 0, 0));
    shown.filter("tab");
    QCOMPARE(shown.current(), QString("tabs"));
    QTest::keyClicks(shown.field(), "s");
    QCOMPARE(shown.current(), QString("tabs"));
    shown.filter("color", "");
    QCOMPARE(shown.current(), QString("color"));
    QTest::keyClick(shown.field(), Qt::Key_Escape);
    QCOMPARE(shown.current(), QString("color"));
    QCOMPARE(shown.tree->selectionModel()->selectedRows().size(), 1);
}

void tst_SettingsFiltered::collapsedSectionsStaySo()
{
    const ShownFilter shown;
    shown.tree->collapse(Cell(shown.tree, 0));
    shown.filter("tab");
    QVERIFY(shown.tree->isExpanded(Cell(shown.tree, 0)));
    GoTo(shown.tree, ItemCell(shown.tree, 1, 0, 0));
    shown.field()->setFocus();
    QTest::keyClick(shown.field(), Qt::Key_Escape);
    QVERIFY(!shown.tree->isExpanded(Cell(shown.tree, 0)));
    QVERIFY(shown.tree->isExpanded(Cell(shown.tree, 2)));
}

void tst_SettingsFiltered::changedValues()
{
    const ShownFilter shown;
    SetValue(shown.tree, 2, "5");
    QTest::keyClick(shown.tree, Qt::Key_D, Qt::ControlModifier); // a copy of it
    shown.filter("", "c");
    QCOMPARE(shown.rows(), QString("Editor: tab tab2"));
    QCOMPARE(shown.result(), QString("2 keys"));

    // A value that is as in the file again stays until the filter is changed.
    QVERIFY(shown.tree->model()->rowCount() == 1);
    TypeInto(shown.tree, ItemCell(shown.tree, 0, 0, 1), "4");
    Enter(shown.tree);
    QCOMPARE(shown.rows(), QString("Editor: tab tab2"));
    shown.filter("", "cc");
    QCOMPARE(shown.rows(), QString("Editor: tab2"));
}

void tst_SettingsFiltered::savedValuesAreNotChanged()
{
    const ShownFilter shown;
    SetValue(shown.tree, 2, "5");
    QVERIFY(shown.editor->Save());
    shown.filter("", "c");
    QCOMPARE(shown.rows(), QString());
    QCOMPARE(shown.result(), QString("No match"));
    QTest::keyClick(shown.field(), Qt::Key_Escape);
    SetValue(shown.tree, 2, "4");
    shown.filter("", "");
    QCOMPARE(shown.rows(), QString("Editor: tab"));
}

void tst_SettingsFiltered::withoutDefaultsNothingDiffers()
{
    const ShownFilter shown((QByteArray()));
    shown.filter("", "d");
    QVERIFY(!Child<QToolButton>(shown.editor, "Not Default")->isEnabled());
    QCOMPARE(shown.rows(), All);
}

void tst_SettingsFiltered::removesOnlyWhatIsShown()
{
    const ShownFilter shown;
    const QByteArray before = shown.bytes();
    shown.filter("tab");
    QTest::keyClick(shown.field(), Qt::Key_Tab);
    shown.tree->setFocus();
    shown.tree->selectAll();
    QTest::keyClick(shown.tree, Qt::Key_Delete);
    QCOMPARE(shown.rows(), QString("Editor; Window"));
    shown.field()->setFocus();
    QTest::keyClick(shown.field(), Qt::Key_Escape);
    QCOMPARE(shown.rows(), QString("Editor: font wrap; Empty; Window: color"));
    QTest::keyClick(shown.tree, Qt::Key_Z, Qt::ControlModifier);
    QCOMPARE(shown.bytes(), before);

    // A section that is shown in full goes as a whole.
    shown.filter("window", "");
    shown.tree->setFocus();
    GoTo(shown.tree, Cell(shown.tree, 0));
    QTest::keyClick(shown.tree, Qt::Key_Delete);
    shown.field()->setFocus();
    QTest::keyClick(shown.field(), Qt::Key_Escape);
    QCOMPARE(shown.rows(), QString("Editor: font wrap tab; Empty"));
}

void tst_SettingsFiltered::defaultsOnlyWhatIsShown()
{
    const ShownFilter shown;
    shown.filter("tab");
    shown.tree->setFocus();
    GoTo(shown.tree, Cell(shown.tree, 0));
    QTest::keyClick(shown.tree, Qt::Key_Backspace, Qt::ControlModifier);
    QVERIFY(shown.bytes().contains("<tab>8</tab>"));
    QVERIFY(shown.bytes().contains("<font>Serif</font>"));

    // "All" are all keys of the file.
    QTest::keyClick(shown.tree, Qt::Key_Backspace, Qt::ControlModifier | Qt::ShiftModifier);
    QVERIFY(shown.bytes().contains("<font>Sans</font>"));
    QVERIFY(shown.bytes().contains("<color>1,2,4</color>"));
}

void tst_SettingsFiltered::movesPastWhatIsShown()
{
    const ShownFilter shown;
    shown.filter("r"); // the sections Editor and, because of the color, Window
    QCOMPARE(shown.rows(), QString("Editor: font wrap tab; Window: color"));
    shown.tree->setFocus();
    GoTo(shown.tree, Cell(shown.tree, 1));
    QTest::keyClick(shown.tree, Qt::Key_Up, Qt::AltModifier);
    QCOMPARE(shown.rows(), QString("Window: color; Editor: font wrap tab"));
    QTest::keyClick(shown.tree, Qt::Key_Up, Qt::AltModifier); // is the first
    shown.field()->setFocus();
    QTest::keyClick(shown.field(), Qt::Key_Escape);
    QCOMPARE(shown.rows(), QString("Window: tabs color; Editor: font wrap tab; Empty"));
}

void tst_SettingsFiltered::newKeyIsShown()
{
    const ShownFilter shown;
    shown.filter("tabs");
    QCOMPARE(shown.rows(), QString("Window: tabs"));
    shown.tree->setFocus();
    QTest::keyClick(shown.tree, Qt::Key_Insert);
    QTRY_VERIFY_WITH_TIMEOUT(shown.tree->findChild<QLineEdit*>(), Patience);
    QTest::keyClicks(shown.tree->findChild<QLineEdit*>(), "added");
    QTest::keyClick(shown.tree->findChild<QLineEdit*>(), Qt::Key_Return);
    QTRY_COMPARE_WITH_TIMEOUT(shown.rows(), QString("Window: tabs added"), Patience);
}

void tst_SettingsFiltered::undoneChangeIsShown()
{
    const ShownFilter shown;
    SetValue(shown.tree, 0, "Sans");
    shown.filter("tabs");
    shown.tree->setFocus();
    QTest::keyClick(shown.tree, Qt::Key_Z, Qt::ControlModifier);
    QCOMPARE(shown.rows(), QString("Editor: font; Window: tabs"));
    QCOMPARE(shown.current(), QString("font"));
    QVERIFY(shown.tree->isExpanded(Cell(shown.tree, 0)));
}

void tst_SettingsFiltered::tabSkipsWhatIsHidden()
{
    const ShownFilter shown;
    shown.filter("tab");
    shown.tree->setFocus();
    GoTo(shown.tree, ItemCell(shown.tree, 0, 0, 1));
    QTest::keyClick(shown.tree, Qt::Key_F2);
    QTRY_VERIFY_WITH_TIMEOUT(shown.tree->findChild<QLineEdit*>(), Patience);
    QTest::keyClick(shown.tree->findChild<QLineEdit*>(), Qt::Key_Tab);
    QTRY_COMPARE_WITH_TIMEOUT(shown.current(), QString("tabs"), Patience);
}

void tst_SettingsFiltered::reloadedFileIsFiltered()
{
    const ShownFilter shown;
    shown.filter("tab");
    QVERIFY(TestFiles::write(shown.file, QByteArray(Values).replace("font", "table")));
    shown.editor->Reload();
    QCOMPARE(shown.rows(), QString("Editor: table tab; Window: tabs"));
    QCOMPARE(shown.result(), QString("1 of 3")); // the value of "table" is still Serif
}

void tst_SettingsFiltered::editingIsTakenFirst()
{
    const ShownFilter shown;
    shown.filter("", "o");
    TypeInto(shown.tree, ItemCell(shown.tree, 0, 0, 1), "Mono");
    QTest::keyClicks(shown.field(), "mono");
    QCOMPARE(shown.rows(), QString("Editor: font"));
    QVERIFY(shown.bytes().contains("<font>Mono</font>"));
}

void tst_SettingsFiltered::tellsWhichMatch_data()
{
    QTest::addColumn<QString>("text");
    QTest::addColumn<QString>("keys"); // n: next, p: previous, u and d: up and down in the tree
    QTest::addColumn<QString>("current");
    QTest::addColumn<QString>("result");

    const auto row = [](char const* name, char const* text, char const* keys, char const* current,
                        char const* result) {
        QTest::newRow(name) << text << keys << current << result;
    };
    // "e" is in all names but the key "tab" and "tabs": Editor font(Serif) wrap(yes) Empty
    row("the first", "e", "", "Editor", "1 of 4");
    row("in another case", "E", "", "Editor", "1 of 4");
    row("the next", "e", "n", "font", "2 of 4");
    row("the last", "e", "nnn", "Empty", "4 of 4");
    row("around the end", "e", "nnnn", "Editor", "1 of 4");
    row("around the start", "e", "p", "Empty", "4 of 4");
    row("back", "e", "nnp", "font", "2 of 4");
    row("a row without a match", "e", "nnd", "tab", "4 matches");
    row("the next after that", "e", "nndn", "Empty", "4 of 4");
    row("the previous before that", "e", "nndp", "wrap", "3 of 4");
    row("a match that one goes to", "e", "dd", "wrap", "3 of 4");
    row("one match", "empty", "", "Empty", "1 of 1");
    row("one match, elsewhere", "empty", "u", "tab", "1 match");
    row("one match, again and again", "empty", "nnp", "Empty", "1 of 1");
    row("in a name and its value, one match", "wrap", "", "wrap", "1 of 1");
    row("no match", "zzz", "np", "Editor", "No match");
}

void tst_SettingsFiltered::tellsWhichMatch()
{
    QFETCH(QString, text);
    QFETCH(QString, keys);
    const ShownFilter shown;
    shown.filter(text, "");
    for (QChar key : keys) {
        if (key == 'n' || key == 'p')
            QTest::keyClick(shown.field(), Qt::Key_F3,
                            key == 'p' ? Qt::ShiftModifier : Qt::NoModifier);
        else
            QTest::keyClick(shown.tree, key == 'u' ? Qt::Key_Up : Qt::Key_Down);
    }
    QTEST(shown.current(), "current");
    QFETCH(QString, result);
    QTRY_COMPARE_WITH_TIMEOUT(shown.result(), result, Patience);
}

void tst_SettingsFiltered::countFollowsTheFile_data()
{
    QTest::addColumn<QString>("change"); // of the current row, "font"
    QTest::addColumn<QString>("result");
    const auto row = [](char const* name, char const* change, char const* result) {
        QTest::newRow(name) << change << result;
    };
    row("a value", "value", "2 matches");
    row("a value taken back", "value undo", "1 of 3");
    row("made again", "value undo redo", "2 matches");
    row("a key less", "remove", "1 of 2");
    row("a key less, taken back", "remove undo", "1 of 3");
    row("a key more", "copy", "2 of 4");
    row("moved past another", "down", "2 of 3");
    row("moved past two", "down down", "3 of 3");
    row("a file that was read again", "reload", "1 of 4");
    row("only changed values", "only", "1 of 1");
}

void tst_SettingsFiltered::countFollowsTheFile()
{
    QFETCH(QString, change);
    const ShownFilter shown;
    SetValue(shown.tree, 2, "Serif 4"); // of the key "tab"
    QVERIFY(shown.editor->Save());
    GoTo(shown.tree, ItemCell(shown.tree, 0, 0, 0));
    shown.filter("r", "");
    QTest::keyClick(shown.field(), Qt::Key_A, Qt::ControlModifier);
    QTest::keyClicks(shown.field(), "serif");
    SetValue(shown.tree, 1, "serif"); // of the key "wrap"
    GoTo(shown.tree, ItemCell(shown.tree, 0, 0, 0));
    QTRY_COMPARE_WITH_TIMEOUT(shown.result(), QString("1 of 3"), Patience);

    const QStringList changes = change.split(' ');
    for (QString const& step : changes) {
        if (step == "value")
            SetValue(shown.tree, 0, "Sans");
        else if (step == "reload")
            QVERIFY(TestFiles::write(shown.file, QByteArray(Values)
                                                     .replace("yes", "serif")
                                                     .replace("4", "serif")
                                                     .replace("1<", "serif<")));
        if (step == "reload")
            shown.editor->Reload();
        else if (step == "undo")
            QTest::keyClick(shown.tree, Qt::Key_Z, Qt::ControlModifier);
        else if (step == "redo")
            QTest::keyClick(shown.tree, Qt::Key_Z, Qt::ControlModifier | Qt::ShiftModifier);
        else if (step == "remove")
            QTest::keyClick(shown.tree, Qt::Key_Delete);
        else if (step == "copy")
            QTest::keyClick(shown.tree, Qt::Key_D, Qt::ControlModifier);
        else if (step == "down")
            QTest::keyClick(shown.tree, Qt::Key_Down, Qt::AltModifier);
        else if (step == "only")
            shown.press('c');
        QCoreApplication::processEvents(); // or the result could still be the former one
    }
    QFETCH(QString, result);
    QTRY_COMPARE_WITH_TIMEOUT(shown.result(), result, Patience);
}

// While the bar was closed, the file has changed.
void tst_SettingsFiltered::countAfterClosing()
{
    const ShownFilter shown;
    shown.filter("tab", "");
    QTest::keyClick(shown.field(), Qt::Key_Escape);
    GoTo(shown.tree, ItemCell(shown.tree, 0, 2, 0));
    QTest::keyClick(shown.tree, Qt::Key_D, Qt::ControlModifier);
    QTest::keyClick(shown.tree, Qt::Key_F, Qt::ControlModifier);
    QCOMPARE(shown.result(), QString("2 of 3"));
}

void tst_SettingsFiltered::tabReachesEverySwitch()
{
    const ShownFilter shown;
    shown.filter("", "");
    QStringList order;
    for (int i = 0; i < 8; ++i) {
        order.append(QApplication::focusWidget()->accessibleName());
        QTest::keyClick(QApplication::focusWidget(), Qt::Key_Tab);
    }
    QCOMPARE(QStringList(order.mid(0, 7)),
             QStringList({"Find in names and values", "Only Matches", "Changed", "Not Default",
                          "Find previous", "Find next", "Close the find bar"}));
}

QTEST_MAIN(tst_SettingsFiltered)
#include "tst_SettingsFiltered.moc"
