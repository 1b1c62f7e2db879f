// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The places where a text is found; tst_PlainSearch compares many more.

#include "app/logfile/ByteLiteral.h"
#include "support/GuardedBytes.h"

#include <QtTest>

using namespace Velocor;

class tst_ByteLiteral : public QObject
{
    Q_OBJECT

private slots:
    void places_data();
    void places();
    void nextPlaces();
    void nearMisses();
    void nothingElse();
    void letterCase_data();
    void letterCase();
};

void tst_ByteLiteral::places_data()
{
    QTest::addColumn<QByteArray>("wanted");
    QTest::addColumn<QByteArray>("rare"); // the others are frequent

    QTest::newRow("a byte") << QByteArray("k") << QByteArray();
    QTest::newRow("a byte that is rare") << QByteArray("k") << QByteArray("k");
    QTest::newRow("two bytes") << QByteArray("kl") << QByteArray();
    QTest::newRow("two bytes, the second is rarer") << QByteArray("kl") << QByteArray("l");
    QTest::newRow("a word, as it is") << QByteArray("klmno") << QByteArray();
    QTest::newRow("a word whose first byte is rare") << QByteArray("klmno") << QByteArray("k");
    QTest::newRow("a word whose last byte is rare") << QByteArray("klmno") << QByteArray("o");
    QTest::newRow("a word with a rare byte within") << QByteArray("klmno") << QByteArray("m");
    QTest::newRow("a word whose ends are rare") << QByteArray("klmno") << QByteArray("ko");
    QTest::newRow("a byte three times") << QByteArray("kkk") << QByteArray("k");
    QTest::newRow("longer than a block")
        << QByteArray("k" + QByteArray(50, 'x') + "l") << QByteArray("l");
}

// In texts of every size up to some blocks, wherever the wanted one is in them; cut off, it is not
// found, and nothing around the text is read.
void tst_ByteLiteral::places()
{
    QFETCH(QByteArray, wanted);
    QFETCH(QByteArray, rare);
    ByteLiteral literal(wanted, false);
    QCOMPARE(literal.size(), wanted.size());
    ByteLiteral::Frequencies frequencies = {};
    frequencies.fill(9);
    for (const char byte : qAsConst(rare))
        frequencies[static_cast<unsigned char>(byte)] = 1;
    if (!rare.isEmpty())
        literal.Learn(frequencies);

    GuardedBytes guarded;
    for (int size = 0; size <= 110; ++size) {
        for (int place = 0; place <= size; ++place) {
            QByteArray bytes(size, '.');
            bytes.replace(place, wanted.size(), wanted);
            bytes.truncate(size);
            const bool isWhole = place + wanted.size() <= size;
            for (bool isAtEnd : {false, true}) {
                char const* const at = guarded.Put(bytes, isAtEnd);
                QCOMPARE(int(literal.Find(at, at + size) - at), isWhole ? place : size);
                QCOMPARE(literal.IsIn(at, size), isWhole);
            }
        }
    }
}

// From any byte on, the next place is found, even if it overlaps the one before.
void tst_ByteLiteral::nextPlaces()
{
    const QByteArray bytes = QByteArray("aXaXa").repeated(30);
    const ByteLiteral literal("aXa", false);
    for (int from = 0; from < bytes.size(); ++from) {
        const int expected = bytes.indexOf("aXa", from);
        QCOMPARE(
            int(literal.Find(bytes.constBegin() + from, bytes.constEnd()) - bytes.constBegin()),
            expected < 0 ? bytes.size() : expected);
    }
}

// Any byte of the text may be the one that differs, whatever is looked for first.
void tst_ByteLiteral::nearMisses()
{
    const QByteArray wanted("klmno");
    for (const char rare : wanted) {
        ByteLiteral literal(wanted, false);
        ByteLiteral::Frequencies frequencies = {};
        frequencies.fill(9);
        frequencies[static_cast<unsigned char>(rare)] = 1;
        literal.Learn(frequencies);
        for (int other = 0; other < wanted.size(); ++other) {
            QByteArray bytes = wanted;
            bytes[other] = '.';
            QVERIFY(!literal.IsIn(bytes.constData(), bytes.size()));
            bytes = bytes.repeated(20);
            QVERIFY(!literal.IsIn(bytes.constData(), bytes.size()));
        }
    }

    // The block looks as if the text were in it, and the bytes end with its first ones.
    GuardedBytes guarded;
    const QByteArray bytes = "k.m" + QByteArray(29, '.') + "kl";
    char const* const at = guarded.Put(bytes, true);
    QVERIFY(!ByteLiteral("klm", false).IsIn(at, bytes.size()));
}

// The first of many places, in blocks that hold nothing but the text.
void tst_ByteLiteral::nothingElse()
{
    const QByteArray bytes(100, 'k');
    for (int size = 1; size <= bytes.size(); ++size) {
        const ByteLiteral literal(QByteArray(size, 'k'), false);
        QCOMPARE(literal.Find(bytes.constBegin(), bytes.constEnd()), bytes.constBegin());
    }
}

void tst_ByteLiteral::letterCase_data()
{
    QTest::addColumn<QByteArray>("wanted");
    QTest::addColumn<bool>("isAnyCase");
    QTest::addColumn<QByteArray>("bytes");
    QTest::addColumn<bool>("isFound");
    const auto row = [](char const* name, char const* wanted, bool isAnyCase, char const* bytes,
                        bool isFound) {
        QTest::newRow(name) << QByteArray(wanted) << isAnyCase << QByteArray(bytes) << isFound;
    };
    row("the same case", "aZ", false, "aZ", true);
    row("another case", "aZ", false, "Az", false);
    row("any case", "aZ", true, "Az", true);
    row("any case of one letter only", "a1", true, "A1", true);
    row("what would be a digit in another case", "1", true, "\x11", false);
    row("what would be a mark in another case", "@", true, "`", false);
    row("after the letters", "[", true, "{", false);
    row("before the letters", "`", true, "@", false);
    row("letters that are not ASCII", "\xE4", true, "\xC4", false);
}

// Alone and in a block, before and after the frequencies of upper and lower case are known.
void tst_ByteLiteral::letterCase()
{
    QFETCH(QByteArray, wanted);
    QFETCH(bool, isAnyCase);
    QFETCH(QByteArray, bytes);
    for (QByteArray const& text :
         {bytes, bytes + QByteArray(60, '.'), QByteArray(50, '.') + bytes}) {
        ByteLiteral literal(wanted, isAnyCase);
        QTEST(literal.IsIn(text.constData(), text.size()), "isFound");
        for (const char rare : qAsConst(bytes)) {
            ByteLiteral::Frequencies frequencies = {};
            frequencies.fill(9);
            frequencies[static_cast<unsigned char>(rare)] = 1;
            literal.Learn(frequencies);
            QTEST(literal.IsIn(text.constData(), text.size()), "isFound");
        }
    }
}

QTEST_GUILESS_MAIN(tst_ByteLiteral)
#include "tst_ByteLiteral.moc"
