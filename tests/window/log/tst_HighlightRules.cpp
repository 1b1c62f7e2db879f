// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/HighlightColors.h"
#include "app/window/log/HighlightRules.h"
#include "app/window/widgets/SeverityIcons.h"

#include <QPalette>
#include <QSet>
#include <QtTest>

#include <cmath>

using namespace Velocor;

namespace {

HighlightRule Rule(char const* text, int color, bool isExpression = false, bool isExact = false)
{
    HighlightRule rule;
    rule.text = text;
    rule.color = color;
    rule.isExpression = isExpression;
    rule.isCaseSensitive = isExact;
    return rule;
}

QString Text(QVector<HighlightRule> const& rules)
{
    QStringList texts;
    for (HighlightRule const& rule : rules)
        texts.append(QString("%1:%2%3%4%5")
                         .arg(rule.text)
                         .arg(rule.color)
                         .arg(rule.isExpression ? "e" : "")
                         .arg(rule.isCaseSensitive ? "c" : "")
                         .arg(rule.isOn ? "" : " off"));
    return texts.join('|');
}

// The formula of the WCAG.
qreal Luminance(QColor const& color)
{
    const auto part = [](qreal value) {
        return value <= 0.03928 ? value / 12.92 : std::pow((value + 0.055) / 1.055, 2.4);
    };
    return 0.2126 * part(color.redF()) + 0.7152 * part(color.greenF()) +
           0.0722 * part(color.blueF());
}

qreal Contrast(QColor const& a, QColor const& b)
{
    const qreal first = Luminance(a);
    const qreal second = Luminance(b);
    return (std::max(first, second) + 0.05) / (std::min(first, second) + 0.05);
}

} // namespace

class tst_HighlightRules : public QObject
{
    Q_OBJECT

private slots:
    void colorOf_data();
    void colorOf();
    void firstRuleWins();
    void add();
    void addToMany();
    void comesBack_data();
    void comesBack();
    void hostileTexts_data();
    void hostileTexts();
    void slowExpressionIsStopped();
    void manySlowExpressions();
    void colors_data();
    void colors();
};

void tst_HighlightRules::colorOf_data()
{
    QTest::addColumn<QString>("text");
    QTest::addColumn<QString>("options"); // e: expression, c: case, -: off
    QTest::addColumn<QString>("line");
    QTest::addColumn<bool>("isColored");
    const auto row = [](char const* name, char const* text, char const* options, char const* line,
                        bool isColored) {
        QTest::newRow(name) << QString(text) << QString(options) << QString(line) << isColored;
    };
    row("a text", "disk", "", "the disk is full", true);
    row("another text", "disk", "", "the dish is full", false);
    row("any case", "disk", "", "the Disk is full", true);
    row("matching case", "disk", "c", "the Disk is full", false);
    row("a text is no expression", "d.sk", "", "the disk is full", false);
    row("an expression", "d.sk", "e", "the disk is full", true);
    row("an expression in any case", "D.sk", "e", "the disk is full", true);
    row("an expression matching case", "D.sk", "ec", "the disk is full", false);
    row("an invalid expression", "(", "e", "(", false);
    row("no text", "", "", "the disk is full", false);
    row("an empty expression", "", "e", "the disk is full", false);
    row("switched off", "disk", "-", "the disk is full", false);
    row("markup", "<b>", "", "a <b> c", true);
}

void tst_HighlightRules::colorOf()
{
    QFETCH(QString, text);
    QFETCH(QString, options);
    QFETCH(QString, line);
    QFETCH(bool, isColored);
    HighlightRule rule = Rule(qPrintable(text), 3, options.contains('e'), options.contains('c'));
    rule.isOn = !options.contains('-');
    HighlightRules rules;
    QVERIFY(rules.isIdle());
    rules.SetRules({rule});
    QCOMPARE(rules.ColorOf(line), isColored ? 3 : -1);
}

void tst_HighlightRules::firstRuleWins()
{
    HighlightRules rules;
    const QSignalSpy changed(&rules, &HighlightRules::changed);
    rules.SetRules({Rule("full", 1), Rule("disk", 2)});
    QCOMPARE(changed.count(), 1);
    QCOMPARE(rules.ColorOf("disk full"), 1);
    QCOMPARE(rules.ColorOf("disk"), 2);
    rules.SetRules({Rule("disk", 2), Rule("full", 1)});
    QCOMPARE(rules.ColorOf("disk full"), 2);
}

void tst_HighlightRules::add()
{
    HighlightRules rules;
    QVERIFY(rules.Add("disk").startsWith("Highlighted"));
    QVERIFY(rules.Add("net").startsWith("Highlighted"));
    QCOMPARE(Text(rules.rules()), QString("disk:0|net:1"));
    QVector<HighlightRule> off = rules.rules();
    off[0].isOn = false;
    rules.SetRules(off);
    QVERIFY(rules.Add("DISK").startsWith("Highlighted"));
    QCOMPARE(Text(rules.rules()), QString("disk:0|net:1"));
    rules.Add(QString(5000, 'x'));
    QCOMPARE(rules.rules().last().text, QString(1000, 'x'));
}

void tst_HighlightRules::addToMany()
{
    HighlightRules rules;
    for (int i = 0; i < HighlightRules::MaximumRules; ++i)
        rules.Add(QString("text %1").arg(i));
    QCOMPARE(rules.rules().size(), int(HighlightRules::MaximumRules));
    QCOMPARE(rules.Add("one more"), QString("There are 50 highlight rules already"));
    QCOMPARE(rules.rules().size(), int(HighlightRules::MaximumRules));
    QVERIFY(rules.Add("text 7").startsWith("Highlighted"));
    rules.SetRules(rules.rules() + rules.rules());
    QCOMPARE(rules.rules().size(), int(HighlightRules::MaximumRules));
}

void tst_HighlightRules::comesBack_data()
{
    QTest::addColumn<QString>("text");
    QTest::newRow("a word") << "disk";
    QTest::newRow("blanks") << " disk  full ";
    QTest::newRow("only a blank") << " ";
    QTest::newRow("no text") << "";
    QTest::newRow("an expression") << "^(a|b)\\s+\"c\"$";
    QTest::newRow("beyond ASCII") << QString::fromUtf8("K\xC3\xB6ln \xF0\x9F\x98\x80");
}

void tst_HighlightRules::comesBack()
{
    QFETCH(QString, text);
    QVector<HighlightRule> all;
    for (int i = 0; i < 8; ++i) {
        HighlightRule rule = Rule("", i % HighlightColors::Count, i & 1, i & 2);
        rule.text = text;
        rule.isOn = i & 4;
        all.append(rule);
    }
    HighlightRules rules;
    rules.SetRules(all);
    HighlightRules other;
    other.SetFromText(rules.ToText());
    QCOMPARE(Text(other.rules()), Text(all));
}

void tst_HighlightRules::hostileTexts_data()
{
    QTest::addColumn<QString>("stored");
    QTest::addColumn<QString>("rules");
    const auto row = [](char const* name, QString const& stored, QString const& rules) {
        QTest::newRow(name) << stored << rules;
    };
    row("nothing", "", "");
    row("garbage", QString(100000, 'x'), "");
    row("only line ends", QString(100000, '\n'), "");
    row("only blanks", QString(100000, ' '), "");
    row("a missing field", "on red text\non red text any", "");
    row("an unknown color", "on mauve text any a\non blue text any b", "b:1");
    row("unknown words", "x red y z a", "a:4 off");
    row("no rule between rules", "on red text any a\n?\non red text any b", "a:4|b:4");
    row("a long text", "on red text any " + QString(5000, 'y'), QString(1000, 'y') + ":4");
    row("too many", QString("on red text any a\n").repeated(5000),
        QString("a:4|").repeated(50).chopped(1));
    row("an invalid expression", "on red expression any (((", "(((:4e");
    row("an end without a line end", "on red text any a\n", "a:4");
}

void tst_HighlightRules::hostileTexts()
{
    QFETCH(QString, stored);
    HighlightRules rules;
    rules.SetFromText(stored);
    QTEST(Text(rules.rules()), "rules");
    rules.ColorOf("on red text any a (((");
}

// The line is colored by the rules after it, and the rule is not asked again.
void tst_HighlightRules::slowExpressionIsStopped()
{
    HighlightRules rules;
    QSignalSpy stopped(&rules, &HighlightRules::stopped);
    rules.SetRules({Rule("(a+)+[b-z]$", 1, true), Rule("aaa", 2)});
    QCOMPARE(rules.ColorOf("ab"), 1);
    QCOMPARE(rules.ColorOf(QString(200, 'a') + "1"), 2);
    QCOMPARE(stopped.count(), 0);
    QVERIFY(stopped.wait());
    QCOMPARE(stopped.first().first().toString(),
             QString("The highlight rule \"(a+)+[b-z]$\" takes too long and is not applied"));
    QCOMPARE(rules.ColorOf("ab"), -1);
    rules.SetRules(rules.rules());
    QCOMPARE(rules.ColorOf("ab"), 1);
}

// Each of them is stopped once; nothing is asked after that.
void tst_HighlightRules::manySlowExpressions()
{
    HighlightRules rules;
    QVector<HighlightRule> slow(HighlightRules::MaximumRules, Rule("(a+)+[b-z]$", 1, true));
    rules.SetRules(slow);
    QSignalSpy stopped(&rules, &HighlightRules::stopped);
    QCOMPARE(rules.ColorOf(QString(4096, 'a') + "1"), -1);
    QVERIFY(rules.isIdle());
    QTRY_COMPARE(stopped.count(), int(HighlightRules::MaximumRules));
}

void tst_HighlightRules::colors_data()
{
    QTest::addColumn<int>("color");
    QTest::addColumn<bool>("isDark");
    for (int color = 0; color < HighlightColors::Count; ++color) {
        for (bool isDark : {false, true})
            QTest::newRow(qPrintable(HighlightColors::Key(color) + (isDark ? ", dark" : "")))
                << color << isDark;
    }
}

void tst_HighlightRules::colors()
{
    QFETCH(int, color);
    QFETCH(bool, isDark);
    QPalette palette;
    palette.setColor(QPalette::Base, isDark ? QColor(0x1e, 0x1e, 0x1e) : QColor(Qt::white));
    QCOMPARE(SeverityIcons::IsDark(palette), isDark);
    const QColor background = HighlightColors::Background(color, palette);
    QVERIFY(Contrast(background, HighlightColors::Text(palette)) > 7);
    QVERIFY(background != palette.color(QPalette::Base));
    for (int other = 0; other < color; ++other)
        QVERIFY(HighlightColors::Background(other, palette) != background);
    QVERIFY(!HighlightColors::Name(color).isEmpty());
    QCOMPARE(HighlightColors::FromKey(HighlightColors::Key(color)), color);
}

QTEST_MAIN(tst_HighlightRules)

#include "tst_HighlightRules.moc"
