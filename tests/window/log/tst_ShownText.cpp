// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/ShownText.h"

#include <QtTest>

using namespace Velocor;

class tst_ShownText : public QObject
{
    Q_OBJECT

private slots:
    void shownText_data();
    void shownText();
};

void tst_ShownText::shownText_data()
{
    QTest::addColumn<QString>("text");
    QTest::addColumn<QString>("shown");
    const auto row = [](char const* name, char const* text, char const* shown) {
        QTest::newRow(name) << QString::fromUtf8(text) << QString::fromUtf8(shown);
    };
    row("text", "one  two", "one  two");
    row("empty", "", "");
    row("tab", "a\tb", "a       b");
    row("tab at a multiple of 8", "12345678\tb", "12345678        b");
    row("two tabs", "1234567\t\tb", "1234567         b");
    row("tab at the start", "\tb", "        b");
    row("color", "\x1b[31mred\x1b[0m text", "red text");
    row("color of several numbers", "\x1b[1;38;5;208mred\x1b[m", "red");
    row("colors count for no tab", "\x1b[31ma\x1b[0m\tb", "a       b");
    row("erased line", "\x1b[2Kred", "red");
    row("text ends in a sequence", "red\x1b[31", "red");
    row("text ends in its start", "red\x1b[", "red");
    row("escape alone",
        "a\x1b"
        "b",
        "a b");
    row("no sequence", "a\x1b[\xc3\xa9", "a [\xc3\xa9");
    row("other control characters", "a\x01\x7f\rb", "a   b");
    row("brackets", "[31m", "[31m");
}

void tst_ShownText::shownText()
{
    QFETCH(QString, text);
    QTEST(ShownText(text), "shown");
}

QTEST_APPLESS_MAIN(tst_ShownText)

#include "tst_ShownText.moc"
