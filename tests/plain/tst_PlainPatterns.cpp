// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Compares the patterns of messages with expressions that say the same, and their counts with plain
// lists.

#include "app/history/MessagePattern.h"

#include "Rounds.h"

#include <QRegularExpression>
#include <QStringList>
#include <QtTest>

#include <algorithm>
#include <cstdio>
#include <random>

using namespace Velocor;

namespace {

QString PlainPattern(QString const& message)
{
    static const QRegularExpression quoted("\\G(?<![\\pL\\pN])([\"'`]).*?\\1(?![\\pL\\pN])",
                                           QRegularExpression::DotMatchesEverythingOption);
    static const QRegularExpression hexadecimal(
        "\\G(?<![\\pL\\pN])(0x(?=[0-9A-Fa-f]))?+[0-9A-Fa-f](?:[.:,-]?[0-9A-Fa-f])*+(?![\\pL\\pN])");
    static const QRegularExpression decimal("\\G[0-9](?:[.:,-]?[0-9])*");
    static const QRegularExpression digit("[0-9]");
    QString pattern;
    for (int at = 0; at < message.size();) {
        const QRegularExpressionMatch quotes = quoted.match(message, at);
        const QString number = hexadecimal.match(message, at).captured();
        const QString digits = decimal.match(message, at).captured();
        const bool isNumber = number.contains(digit) || number.startsWith("0x");
        const bool isLong = number.size() >= 6 || !digits.isEmpty();
        if (quotes.hasMatch()) {
            pattern += quotes.captured(1) + QChar(0x2026) + quotes.captured(1);
            at += quotes.capturedLength();
        } else if (isNumber && isLong) {
            pattern += '#';
            at += number.size();
        } else if (!digits.isEmpty()) {
            pattern += '#';
            at += digits.size();
        } else {
            pattern += message.at(at);
            ++at;
        }
    }
    return pattern;
}

// Pieces that matter, and letters and numbers beyond ASCII.
QStringList const Pieces = {"0",
                            "1",
                            "29",
                            "a",
                            "F",
                            "face",
                            "g",
                            "x",
                            "0x",
                            ".",
                            ":",
                            ",",
                            "-",
                            " ",
                            "\"",
                            "'",
                            "`",
                            "\n",
                            QString(QChar(0xe9)),
                            QString(QChar(0xb2)),
                            QString(QChar(0x663)),
                            "word"};

// One of a list that makes the plain count.
struct Counted
{
    LogEntry::Severity severity;
    QString text;
    size_t count;
    qint64 first;
    qint64 last;
};

} // namespace

class tst_PlainPatterns : public QObject
{
    Q_OBJECT

private slots:
    void everyShortMessage();
    void randomMessages();
    void randomCounts();
    void cleanupTestCase();

private:
    void compare(QString const& message);
    void find(QString const& message, QString const& pattern);

    qint64 m_messages = 0;
    qint64 m_folded = 0;
    int m_lists = 0;
};

void tst_PlainPatterns::compare(QString const& message)
{
    const QString pattern = MessagePattern::Of(message);
    const QString plain = PlainPattern(message);
    if (pattern != plain)
        QCOMPARE(message + " -> " + pattern, message + " -> " + plain);
    if (m_messages % 8 == 0)
        find(message, pattern);
    ++m_messages;
    m_folded += pattern != message;
}

// No line of a log has line breaks.
void tst_PlainPatterns::find(QString const& message, QString const& pattern)
{
    const QRegularExpression expression(MessagePattern::Expression(pattern),
                                        QRegularExpression::DotMatchesEverythingOption);
    if (!expression.match(message).hasMatch())
        QCOMPARE(message, "a message that " + expression.pattern() + " finds");
}

void tst_PlainPatterns::everyShortMessage()
{
    const QStringList letters = {"0", "7", "a", "g", "x", ".", "-", " ", "\"", "'"};
    const int length = Rounds::isFull() ? 6 : 4;
    int count = 1;
    for (int i = 0; i < length; ++i)
        count *= letters.size() + 1;
    for (int number = 0; number < count && !QTest::currentTestFailed(); ++number) {
        QString message;
        for (int rest = number, i = 0; i < length; ++i, rest /= letters.size() + 1)
            message += letters.value(rest % (letters.size() + 1)); // the last one is empty
        compare(message);
    }
}

void tst_PlainPatterns::randomMessages()
{
    std::mt19937 random(Rounds::seed());
    const int count = Rounds::count(20000, 1000000, 10000000);
    for (int i = 0; i < count && !QTest::currentTestFailed(); ++i) {
        QString message;
        for (int left = static_cast<int>(random() % 20); left > 0; --left)
            message += Pieces.at(static_cast<int>(random() % static_cast<quint32>(Pieces.size())));
        compare(message);
    }
    QVERIFY(m_folded > m_messages / 10 && m_folded < m_messages);
}

// Few patterns, so that they come again.
void tst_PlainPatterns::randomCounts()
{
    std::mt19937 random(Rounds::seed());
    const int count = Rounds::count(300, 20000, 200000);
    for (m_lists = 0; m_lists < count && !QTest::currentTestFailed(); ++m_lists) {
        PatternList list;
        QVector<Counted> plain;
        for (int left = static_cast<int>(random() % 60); left > 0; --left) {
            const auto severity = static_cast<LogEntry::Severity>(random() % 3);
            const QString message =
                Pieces.at(static_cast<int>(random() % 9)) + " " + QString::number(random() % 100);
            const qint64 time = static_cast<qint64>(random() % 1000) - 100;
            list.Add(severity, message, time < 0 ? -1 : time);
            const QString text = PlainPattern(message);
            auto known = std::find_if(plain.begin(), plain.end(), [&](Counted const& counted) {
                return counted.severity == severity && counted.text == text;
            });
            if (known == plain.end())
                known = plain.insert(plain.end(), {severity, text, 0, -1, -1});
            ++known->count;
            if (time < 0)
                continue;
            known->first = known->first < 0 ? time : qMin(known->first, time);
            known->last = qMax(known->last, time);
        }
        std::stable_sort(plain.begin(), plain.end(),
                         [](Counted const& a, Counted const& b) { return a.count > b.count; });
        const std::vector<PatternList::Pattern> sorted = list.Sorted();
        QCOMPARE(sorted.size(), static_cast<size_t>(plain.size()));
        for (int i = 0; i < plain.size(); ++i) {
            PatternList::Pattern const& found = sorted[static_cast<size_t>(i)];
            QCOMPARE(found.severity, plain[i].severity);
            QCOMPARE(found.text, plain[i].text);
            QCOMPARE(found.count, plain[i].count);
            QCOMPARE(found.first, plain[i].first);
            QCOMPARE(found.last, plain[i].last);
        }
    }
}

void tst_PlainPatterns::cleanupTestCase()
{
    std::printf("plain patterns: %lld messages, %lld with something folded, %d lists\n",
                static_cast<long long>(m_messages), static_cast<long long>(m_folded), m_lists);
    std::fflush(stdout);
}

QTEST_GUILESS_MAIN(tst_PlainPatterns)
#include "tst_PlainPatterns.moc"
