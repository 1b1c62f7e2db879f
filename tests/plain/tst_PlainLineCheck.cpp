// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Compares the check of lines with comparing the lines: for pairs that differ as lines do that one
// run has written over those of another. Few pairs may have the same check, as many as if checks
// were drawn at random.

#include "app/logfile/LineCheck.h"

#include "Rounds.h"

#include <QByteArray>
#include <QtTest>

#include <cmath>
#include <functional>
#include <random>

using namespace Velocor;

class tst_PlainLineCheck : public QObject
{
    Q_OBJECT

private slots:
    void differentLines_data();
    void differentLines();
    void sameLines();
    void cleanupTestCase();

private:
    int m_pairs = 0;
    int m_same = 0;
};

namespace {

class Lines
{
public:
    int below(int limit) { return int(m_random() % unsigned(limit)); }

    QByteArray text(int length)
    {
        QByteArray text(length, Qt::Uninitialized);
        for (char& c : text)
            c = char(' ' + below(95));
        return text;
    }

    QByteArray changed(QByteArray line, int at, int bits)
    {
        line[at] = char(line[at] ^ bits);
        return line;
    }

private:
    std::mt19937 m_random{Rounds::seed()};
};

using Pair = std::pair<QByteArray, QByteArray>;
using MakePair = std::function<Pair(Lines&, int)>;

quint16 CheckOf(QByteArray const& line)
{
    return LineCheck(line.constData(), size_t(line.size()));
}

Pair OneByte(Lines& lines, int)
{
    const QByteArray line = lines.text(1 + lines.below(200));
    return {line, lines.changed(line, lines.below(line.size()), 1 + lines.below(255))};
}

// The last bits of two bytes, a number of words apart.
Pair TwoDigits(Lines& lines, int)
{
    const QByteArray line = lines.text(60 + lines.below(100));
    const int distance = 8 * (1 + lines.below(6));
    const int at = lines.below(line.size() - distance);
    const QByteArray other = lines.changed(line, at, 1 + lines.below(15));
    return {line, lines.changed(other, at + distance, 1 + lines.below(15))};
}

QByteArray Numbered(int number, int seconds)
{
    return "2026-03-03 09:02:" + QByteArray::number(10 + seconds) + ".031 Trace request " +
           QByteArray::number(number) + " took 12 ms: the document has been saved";
}

Pair NextNumber(Lines&, int i)
{
    return {Numbered(i, 0), Numbered(i + 1, 0)};
}

Pair OtherRun(Lines& lines, int i)
{
    return {Numbered(i, 0), Numbered(i + lines.below(10), 1 + lines.below(49))};
}

Pair Shifted(Lines& lines, int)
{
    const QByteArray line = lines.text(20 + lines.below(200));
    return {line, line.mid(1 + lines.below(10))};
}

Pair CutOff(Lines& lines, int)
{
    const QByteArray line = lines.text(20 + lines.below(200));
    return {line, line.left(line.size() - 1 - lines.below(10))};
}

Pair WordsSwapped(Lines& lines, int)
{
    const QByteArray line = lines.text(64 + lines.below(100));
    const int first = 8 * lines.below(4);
    const int second = first + 8 * (1 + lines.below(4));
    QByteArray other = line;
    other.replace(first, 8, line.mid(second, 8));
    other.replace(second, 8, line.mid(first, 8));
    return {line, other};
}

Pair OtherLength(Lines& lines, int)
{
    const int length = lines.below(400);
    const char c = char(' ' + lines.below(95));
    return {QByteArray(length, c), QByteArray(length + 1 + lines.below(40), c)};
}

Pair Unrelated(Lines& lines, int)
{
    return {lines.text(lines.below(200)), lines.text(lines.below(200))};
}

} // namespace

Q_DECLARE_METATYPE(MakePair)

void tst_PlainLineCheck::differentLines_data()
{
    QTest::addColumn<MakePair>("makePair");
    QTest::newRow("one byte") << MakePair(OneByte);
    QTest::newRow("two digits") << MakePair(TwoDigits);
    QTest::newRow("the next number") << MakePair(NextNumber);
    QTest::newRow("the same entry of another run") << MakePair(OtherRun);
    QTest::newRow("shifted") << MakePair(Shifted);
    QTest::newRow("cut off") << MakePair(CutOff);
    QTest::newRow("words swapped") << MakePair(WordsSwapped);
    QTest::newRow("longer, of the same character") << MakePair(OtherLength);
    QTest::newRow("unrelated") << MakePair(Unrelated);
}

void tst_PlainLineCheck::differentLines()
{
    QFETCH(MakePair, makePair);
    Lines lines;
    const int count = Rounds::count(30000, 1000000);
    int same = 0;
    int pairs = 0;
    for (int i = 0; i < count; ++i) {
        const Pair pair = makePair(lines, i);
        if (pair.first == pair.second)
            continue;
        ++pairs;
        same += CheckOf(pair.first) == CheckOf(pair.second) ? 1 : 0;
    }
    m_pairs += pairs;
    m_same += same;
    const double expected = pairs / 65536.0;
    QVERIFY(pairs > count / 2);
    QVERIFY2(same <= expected + 6 * std::sqrt(expected) + 2, qPrintable(QString::number(same)));
}

// Wherever they are in memory, and whatever follows them.
void tst_PlainLineCheck::sameLines()
{
    Lines lines;
    const int count = Rounds::count(20000, 1000000);
    for (int i = 0; i < count; ++i) {
        const QByteArray line = lines.text(lines.below(200));
        const int before = lines.below(9);
        const QByteArray whole = lines.text(before) + line + lines.text(9);
        QCOMPARE(LineCheck(whole.constData() + before, size_t(line.size())), CheckOf(line));
    }
}

void tst_PlainLineCheck::cleanupTestCase()
{
    std::printf("plain line check: %d pairs of different lines, %d have the same check\n", m_pairs,
                m_same);
}

QTEST_APPLESS_MAIN(tst_PlainLineCheck)
#include "tst_PlainLineCheck.moc"
