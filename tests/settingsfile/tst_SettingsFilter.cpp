// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Which keys of a settings file are shown, and changes of its order.

#include "app/settingsfile/SettingsEdit.h"
#include "app/settingsfile/SettingsFilter.h"

#include <QtTest>

using namespace Velocor;

class tst_SettingsFilter : public QObject
{
    Q_OBJECT

private slots:
    void isEmpty_data();
    void isEmpty();
    void shown_data();
    void shown();
    void moves_data();
    void moves();
};

namespace {

SettingsDocument Document()
{
    SettingsDocument document;
    document.SetValue("Colors", "text", "black");
    document.SetValue("Colors", "back", "white");
    document.SetValue("Window", "title", "Colors");
    document.SetValue("Window", "width", "10");
    return document;
}

QStringList KeysOf(SettingsDocument const& document)
{
    QStringList keys;
    for (SettingsDocument::Item const& item : qAsConst(document.sections[0].items))
        keys.append(item.key);
    return keys;
}

} // namespace

void tst_SettingsFilter::isEmpty_data()
{
    QTest::addColumn<QString>("text");
    QTest::addColumn<bool>("onlyChanged");
    QTest::addColumn<bool>("onlyDiffering");
    QTest::addColumn<bool>("expected");
    QTest::newRow("nothing") << "" << false << false << true;
    QTest::newRow("a text") << "x" << false << false << false;
    QTest::newRow("only changed") << "" << true << false << false;
    QTest::newRow("only differing") << "" << false << true << false;
    QTest::newRow("all") << "x" << true << true << false;
}

void tst_SettingsFilter::isEmpty()
{
    QFETCH(QString, text);
    QFETCH(bool, onlyChanged);
    QFETCH(bool, onlyDiffering);
    QTEST((SettingsFilter{text, onlyChanged, onlyDiffering}).isEmpty(), "expected");
}

void tst_SettingsFilter::shown_data()
{
    QTest::addColumn<QString>("text");
    QTest::addColumn<bool>("onlyChanged");
    QTest::addColumn<bool>("onlyDiffering");
    QTest::addColumn<QString>("sections");
    QTest::addColumn<QString>("keys");
    const auto row = [](char const* name, char const* text, bool onlyChanged, bool onlyDiffering,
                        char const* sections, char const* keys) {
        QTest::newRow(name) << text << onlyChanged << onlyDiffering << sections << keys;
    };
    row("everything", "", false, false, "Colors Window", "text back title width");
    row("name of a section, or a value", "colors", false, false, "Colors Window",
        "text back title");
    row("key", "wid", false, false, "Window", "width");
    row("changed", "", true, false, "Colors Window", "back title");
    row("changed, in a section", "window", true, false, "Window", "title");
    row("differing", "", false, true, "Window", "title");
    row("differing, in a section without any", "colors", false, true, "Window", "title");
    row("changed and differing", "", true, true, "Window", "title");
}

void tst_SettingsFilter::shown()
{
    QFETCH(QString, text);
    QFETCH(bool, onlyChanged);
    QFETCH(bool, onlyDiffering);
    const SettingsDocument document = Document();
    SettingsValues saved = document.AllValues();
    saved[{"Colors", "back"}] = "red";
    saved.remove({"Window", "title"});
    SettingsValues defaults;
    defaults[{"Colors", "text"}] = "black";
    defaults[{"Window", "title"}] = "none";
    const SettingsFilter filter{text, onlyChanged, onlyDiffering};
    const SettingsFilter::Shown shown = filter.Of(document, saved, defaults);

    QStringList sections;
    for (const int number : shown.sections)
        sections.append(document.sections[number].name);
    QStringList keys;
    for (int number = 0; number < document.sections.size(); ++number) {
        for (const int item : shown.items[static_cast<size_t>(number)])
            keys.append(document.sections[number].items[item].key);
    }
    QTEST(sections.join(' '), "sections");
    QTEST(keys.join(' '), "keys");
}

void tst_SettingsFilter::moves_data()
{
    QTest::addColumn<int>("from");
    QTest::addColumn<int>("to");
    QTest::addColumn<QString>("expected");
    QTest::newRow("down") << 0 << 2 << "b c a";
    QTest::newRow("up") << 2 << 0 << "c a b";
    QTest::newRow("by one") << 1 << 2 << "a c b";
}

// And back.
void tst_SettingsFilter::moves()
{
    QFETCH(int, from);
    QFETCH(int, to);
    SettingsDocument document;
    for (char const* key : {"a", "b", "c"})
        document.SetValue("S", key, "1");
    SettingsEdit edit;
    edit.kind = SettingsEdit::MoveItem;
    edit.item = from;
    edit.target = to;
    const SettingsEdit back = edit.Apply(document);
    QTEST(KeysOf(document).join(' '), "expected");
    back.Apply(document);
    QCOMPARE(KeysOf(document), QStringList({"a", "b", "c"}));
}

QTEST_GUILESS_MAIN(tst_SettingsFilter)

#include "tst_SettingsFilter.moc"
