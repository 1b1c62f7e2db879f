// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Settings that differ from their defaults, on a real screen, and how they go back to them.

#include "ShownSettings.h"
#include "WindowParts.h"
#include "WindowTestCase.h"

#include "app/settingsfile/SettingsFileReader.h"
#include "common/config/TorkConfigText.h"

#include <QMenu>
#include <QTreeView>

using namespace Velocor;
using namespace WindowParts;

class tst_DefaultsInWindow : public WindowTestCase
{
    Q_OBJECT

private slots:
    void differingValuesAreBold();
    void withoutDefaultsNothingChanges();
    void backToDefault_data();
    void backToDefault();
    void whatHasNoDefaultStays();
    void undoneInOneStep();
    void windowsOwnDefaults();
    void defaultsOfTheExamples_data();
    void defaultsOfTheExamples();
};

namespace {

const QByteArray
    Defaults("<VelocorSettings>\n<A>\n<x>1</x>\n<y>20</y>\n<missing>1</missing>\n</A>\n"
             "<C>\n<z>30</z>\n</C>\n</VelocorSettings>\n");
const QByteArray
    Values("<VelocorSettings>\n<A>\n<x>1</x>\n<y>2</y>\n</A>\n<B>\n<own>9</own>\n</B>\n"
           "<C>\n<z>3</z>\n</C>\n</VelocorSettings>\n");

// A settings file in the window whose program has installed its defaults.
class ShownDefaults : public ShownSettings
{
public:
    explicit ShownDefaults(QByteArray const& defaults = Defaults) : ShownSettings(Values)
    {
        if (!defaults.isEmpty() && !TestFiles::write(folder() + "some.defaults.cfg", defaults))
            qFatal("the defaults cannot be written");
        editor->Open(file);
        tree->setFocus();
    }

    bool isBold(int section, int item) const
    {
        return ItemCell(tree, section, item, 1).data(Qt::FontRole).value<QFont>().bold();
    }

    QString values() const
    {
        QStringList all;
        for (SettingsDocument::Section const& section : editor->document().sections) {
            for (SettingsDocument::Item const& item : section.items)
                all.append(item.key + '=' + item.value);
        }
        return all.join(' ');
    }
};

} // namespace

void tst_DefaultsInWindow::differingValuesAreBold()
{
    const ShownDefaults shown;
    QVERIFY(!shown.isBold(0, 0));
    QVERIFY(shown.isBold(0, 1));
    QVERIFY(!shown.isBold(1, 0)); // has no default
    QVERIFY(shown.isBold(2, 0));
    QVERIFY(!ItemCell(shown.tree, 0, 1, 0).data(Qt::FontRole).value<QFont>().bold());
    const QModelIndex cell = ItemCell(shown.tree, 0, 1, 1);
    QCOMPARE(cell.data(Qt::AccessibleDescriptionRole).toString(), QString("Number. Default: 20"));
    QCOMPARE(cell.data(Qt::ToolTipRole).toString(), QString("Default: 20"));
    QVERIFY(ItemCell(shown.tree, 0, 0, 1).data(Qt::ToolTipRole).isNull());
    SetValue(shown.tree, 1, "20");
    QVERIFY(!shown.isBold(0, 1));
    SetValue(shown.tree, 0, "2");
    QVERIFY(shown.isBold(0, 0));
}

void tst_DefaultsInWindow::withoutDefaultsNothingChanges()
{
    const ShownDefaults shown((QByteArray()));
    QVERIFY(!shown.isBold(0, 1) && !shown.isBold(2, 0));
    for (char const* text : {"Back to Default", "All Back to Default"})
        QVERIFY(!Action(*shown.window, text)->isEnabled());
    GoTo(shown.tree, ItemCell(shown.tree, 0, 1, 0));
    QTest::keyClick(shown.tree, Qt::Key_Backspace, Qt::ControlModifier);
    QVERIFY(!shown.editor->isModified());
}

void tst_DefaultsInWindow::backToDefault_data()
{
    QTest::addColumn<int>("section");
    QTest::addColumn<int>("item");
    QTest::addColumn<bool>("all");
    QTest::addColumn<QString>("values");
    QTest::newRow("one value") << 0 << 1 << false << "x=1 y=20 own=9 z=3";
    QTest::newRow("a section") << 2 << -1 << false << "x=1 y=2 own=9 z=30";
    QTest::newRow("all") << 0 << 0 << true << "x=1 y=20 own=9 z=30";
    QTest::newRow("a value that is the default") << 0 << 0 << false << "x=1 y=2 own=9 z=3";
}

void tst_DefaultsInWindow::backToDefault()
{
    QFETCH(int, section);
    QFETCH(int, item);
    QFETCH(bool, all);
    const ShownDefaults shown;
    const QString before = shown.values();
    GoTo(shown.tree, item < 0 ? Cell(shown.tree, section) : ItemCell(shown.tree, section, item, 0));
    Qt::KeyboardModifiers modifiers = Qt::ControlModifier;
    if (all)
        modifiers |= Qt::ShiftModifier;
    QTest::keyClick(shown.tree, Qt::Key_Backspace, modifiers);
    QTEST(shown.values(), "values");
    const bool isChanged = shown.values() != before;
    QCOMPARE(shown.editor->isModified(), isChanged);
    QCOMPARE(shown.editor->UndoText(), QString(isChanged ? "Back to Default" : ""));
}

void tst_DefaultsInWindow::whatHasNoDefaultStays()
{
    const ShownDefaults shown;
    GoTo(shown.tree, Cell(shown.tree, 1));
    QTest::keyClick(shown.tree, Qt::Key_Backspace, Qt::ControlModifier);
    QVERIFY(!shown.editor->isModified());
}

void tst_DefaultsInWindow::undoneInOneStep()
{
    const ShownDefaults shown;
    const QString before = shown.values();
    shown.tree->selectAll(); // sections and their keys: each key once
    Action(*shown.window, "Back to Default")->trigger();
    QCOMPARE(shown.values(), QString("x=1 y=20 own=9 z=30"));
    QTest::keyClick(shown.window.get(), Qt::Key_Z, Qt::ControlModifier);
    QCOMPARE(shown.values(), before);
    QVERIFY(!shown.editor->isModified());
}

// What is installed is what the window saves after a first start.
void tst_DefaultsInWindow::windowsOwnDefaults()
{
    const SettingsDocument defaults =
        SettingsFileReader::Read(PROJECT_FOLDER "/packaging/velocor.defaults.cfg");
    QVERIFY(defaults.isParsed && defaults.lossCount == 0);
    const WindowTest test;
    QVERIFY(WindowTest::show()->close());
    const SettingsDocument saved = SettingsFileReader::Read(test.settingsFile());
    QVERIFY(!defaults.sections.isEmpty());
    for (SettingsDocument::Section const& section : defaults.sections) {
        for (SettingsDocument::Item const& item : section.items)
            QCOMPARE(item.key + '=' + saved.Value(section.name, item.key, "(none)"),
                     item.key + '=' + item.value);
    }
}

void tst_DefaultsInWindow::defaultsOfTheExamples_data()
{
    QTest::addColumn<QString>("place");
    QTest::addColumn<QString>("section");
    QTest::newRow("notes") << "notes/notes"
                           << "Notes";
    QTest::newRow("starter") << "starter/starter"
                             << "Files";
}

// At the place where they are installed.
void tst_DefaultsInWindow::defaultsOfTheExamples()
{
    QFETCH(QString, place);
    QFETCH(QString, section);
    const QByteArray defaults =
        TestFiles::read(PROJECT_FOLDER "/examples/" + place + ".defaults.cfg");
    const QByteArray name = section.toLatin1();
    const ShownSettings shown("<VelocorSettings>\n<" + name + ">\n<recent>one|two</recent>\n</" +
                              name + ">\n</VelocorSettings>\n");
    QVERIFY(TestFiles::write(shown.folder() + "some.defaults.cfg", defaults));
    shown.editor->Open(shown.file);
    QVERIFY(shown.editor->ShowsTree());
    shown.tree->setFocus();
    QVERIFY(ItemCell(shown.tree, 0, 0, 1).data(Qt::FontRole).value<QFont>().bold());
    QTest::keyClick(shown.tree, Qt::Key_Backspace, Qt::ControlModifier | Qt::ShiftModifier);
    QCOMPARE(CellText(shown.tree, 0, 0, 1), TorkConfigText::EncodeValue(QString()));
    QVERIFY(shown.editor->Save());
    QCOMPARE(TestFiles::read(shown.file), defaults);
}

QTEST_MAIN(tst_DefaultsInWindow)

#include "tst_DefaultsInWindow.moc"
