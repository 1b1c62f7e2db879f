// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/logfile/GrowingBlocks.h"

#include <QtTest>

#include <random>

using namespace Velocor;

namespace {

constexpr size_t BlockSize = 4;

// Counts what is asked of it in the wrong order.
struct Block
{
    std::vector<int> items;
    bool isPacked = false;
    bool isReserved = false;
    static int s_mistakes;

    void reserve()
    {
        s_mistakes += !items.empty();
        isReserved = true;
    }
    void truncate(size_t count)
    {
        s_mistakes += isPacked || count > items.size();
        items.resize(count);
    }
    void pack()
    {
        s_mistakes += isPacked || items.size() != BlockSize;
        isPacked = true;
    }
    void unpack()
    {
        s_mistakes += !isPacked;
        isPacked = false;
    }
};

int Block::s_mistakes = 0;

using List = GrowingBlocks<Block, BlockSize>;

void append(List& list, int item)
{
    Block& block = list.Grow();
    Block::s_mistakes += block.isPacked || !block.isReserved || block.items.size() >= BlockSize;
    block.items.push_back(item);
}

List listOf(int count)
{
    List list;
    for (int item = 0; item < count; ++item)
        append(list, item);
    return list;
}

// All items; empty if a block that has a successor is not packed, or the last one is.
std::vector<int> itemsOf(List const& list)
{
    std::vector<int> items;
    for (size_t item = 0; item < list.size(); ++item) {
        Block const& block = list.at(item);
        const bool isLast = item / BlockSize == (list.size() - 1) / BlockSize;
        if (block.isPacked == isLast || block.items.size() <= item % BlockSize)
            return {};
        items.push_back(block.items[item % BlockSize]);
    }
    return items;
}

} // namespace

class tst_GrowingBlocks : public QObject
{
    Q_OBJECT

private slots:
    void cleanup();
    void anyCalls();
    void truncates_data();
    void truncates();
    void sharesFullBlocks_data();
    void sharesFullBlocks();
    void editsOnlyItself();
};

void tst_GrowingBlocks::cleanup()
{
    QCOMPARE(Block::s_mistakes, 0);
}

// Copies taken at any time stay what they were.
void tst_GrowingBlocks::anyCalls()
{
    std::mt19937 random(1);
    List list;
    std::vector<int> plain;
    List copy;
    std::vector<int> plainCopy;
    for (int step = 0; step < 20000; ++step) {
        const auto pick = [&](size_t limit) {
            return limit == 0 ? 0 : random() % limit;
        };
        switch (pick(12)) {
        case 0: {
            const size_t count =
                plain.size() - pick(std::min<size_t>(plain.size(), 11) + 1) + pick(2);
            list.Truncate(count);
            plain.resize(std::min(count, plain.size()));
            break;
        }
        case 1:
            if (!plain.empty()) {
                const size_t item = pick(plain.size());
                list.Edit(item, [&](Block& block) { block.items[item % BlockSize] = -step; });
                plain[item] = -step;
            }
            break;
        case 2:
            copy = list;
            plainCopy = plain;
            break;
        case 3:
            if (pick(9) == 0) {
                list = List();
                plain.clear();
            }
            break;
        default:
            append(list, step);
            plain.push_back(step);
        }
        QCOMPARE(list.size(), plain.size());
        QCOMPARE(itemsOf(list), plain);
        QCOMPARE(itemsOf(copy), plainCopy);
    }
}

void tst_GrowingBlocks::truncates_data()
{
    QTest::addColumn<int>("before");
    QTest::addColumn<int>("count");
    for (int before : {0, 1, 3, 4, 5, 8, 9, 12}) {
        for (int count = 0; count <= before + 1; ++count)
            QTest::addRow("%d of %d", count, before) << before << count;
    }
}

void tst_GrowingBlocks::truncates()
{
    QFETCH(int, before);
    QFETCH(int, count);
    List list = listOf(before);
    list.Truncate(static_cast<size_t>(count));
    QCOMPARE(itemsOf(list), itemsOf(listOf(std::min(before, count))));
    for (int item = std::min(before, count); item < before; ++item)
        append(list, item);
    QCOMPARE(itemsOf(list), itemsOf(listOf(before)));
}

void tst_GrowingBlocks::sharesFullBlocks_data()
{
    QTest::addColumn<int>("before");
    QTest::addColumn<int>("truncated");
    QTest::addColumn<int>("after");
    QTest::addColumn<int>("shared");
    const auto row = [](char const* name, int before, int truncated, int after, int shared) {
        QTest::newRow(name) << before << truncated << after << shared;
    };
    row("nothing", 0, 0, 0, 0);
    row("a block that is not full", 3, 3, 3, 0);
    row("a block that is full, without a successor", 4, 4, 5, 0);
    row("a full block", 5, 5, 5, 4);
    row("full blocks of a list that has grown", 9, 9, 20, 8);
    row("full blocks before what was removed", 13, 9, 20, 8);
    row("what was removed and added again", 13, 8, 13, 4);
    row("all was removed", 13, 0, 13, 0);
}

void tst_GrowingBlocks::sharesFullBlocks()
{
    QFETCH(int, before);
    QFETCH(int, truncated);
    QFETCH(int, after);
    QFETCH(int, shared);
    const List list = listOf(before);
    List other = list;
    other.Truncate(static_cast<size_t>(truncated));
    for (int item = truncated; item < after; ++item)
        append(other, item);
    QCOMPARE(list.CountShared(other), static_cast<size_t>(shared));
    QCOMPARE(other.CountShared(list), static_cast<size_t>(shared));
    QCOMPARE(itemsOf(list), itemsOf(listOf(before)));
}

void tst_GrowingBlocks::editsOnlyItself()
{
    List list = listOf(13);
    const List copy = list;
    list.Edit(6, [](Block& block) { block.items[2] = 99; });
    list.Edit(12, [](Block& block) { block.items[0] = 98; });
    std::vector<int> expected = itemsOf(listOf(13));
    QCOMPARE(itemsOf(copy), expected);
    expected[6] = 99;
    expected[12] = 98;
    QCOMPARE(itemsOf(list), expected);
    QCOMPARE(list.CountShared(copy), size_t(4));
}

QTEST_APPLESS_MAIN(tst_GrowingBlocks)
#include "tst_GrowingBlocks.moc"
