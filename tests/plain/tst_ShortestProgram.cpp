// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The search for the shortest failing program, with models that are wrong in known ways.

#include "plain/Program.h"

#include <QtTest>

#include <numeric>

class tst_ShortestProgram : public QObject
{
    Q_OBJECT

private slots:
    void shortest_data();
    void shortest();
    void argumentsAreAsSimpleAsTheyCanBe();
    void crash();
    void nothingToFind();
    void sameProgramForTheSameNumber();
    void failsTheTest();
};

namespace {

// A stack whose model forgets what is below the topmost `Depth` values.
template <int Depth>
class Stacks : public Program::Pair
{
public:
    void perform(Program::Draws& draws)
    {
        const int kind = draws.below(3);
        const int value = draws.below(1000);
        if (kind == 0) {
            draws.tell([&] { return QString("push(%1)").arg(value); });
            m_stack.append(value);
            m_plain.append(value);
            m_plain = m_plain.mid(qMax(0, m_plain.size() - Depth));
        } else if (kind == 1) {
            draws.tell([] { return QString("pop()"); });
            if (!m_stack.isEmpty())
                m_stack.removeLast();
            if (!m_plain.isEmpty())
                m_plain.removeLast();
        } else {
            draws.tell([] { return QString("size()"); });
            same("size", m_stack.size(), m_plain.size());
        }
    }
    void finish() {}

private:
    QList<int> m_stack;
    QList<int> m_plain;
};

// Differs at its end once the steps 1 to `Count` have come in this order, whatever is in between.
template <int Count>
class Sequence : public Program::Pair
{
public:
    void perform(Program::Draws& draws)
    {
        const int kind = draws.below(Count + 1);
        draws.tell([&] { return QString("step %1").arg(kind); });
        if (kind == m_next)
            ++m_next;
    }
    void finish() { same("reached", m_next > Count, false); }

private:
    int m_next = 1;
};

// Differs from a large number on.
class Numbers : public Program::Pair
{
public:
    void perform(Program::Draws& draws)
    {
        const int unused = draws.below(1000);
        const int value = draws.below(1000);
        const QString text = draws.text("abc", 10);
        draws.tell([&] { return QString("take(%1, %2, %3)").arg(unused).arg(value).arg(text); });
        same("large", value > 500, false);
    }
    void finish() {}
};

// Crashes at step 2 after step 1.
class Crashing : public Program::Pair
{
public:
    void perform(Program::Draws& draws)
    {
        const int kind = draws.below(10);
        if (kind == 2 && m_isArmed)
            std::raise(SIGSEGV);
        m_isArmed = m_isArmed || kind == 1;
    }
    void finish() {}

private:
    bool m_isArmed = false;
};

using Search = std::optional<Program::Failure> (*)();

template <class APair>
std::optional<Program::Failure> Found()
{
    quint32 programs = 0;
    return Program::search<APair>(Rounds::seed(), 100000, 100, programs);
}

} // namespace

Q_DECLARE_METATYPE(Search)

void tst_ShortestProgram::shortest_data()
{
    QTest::addColumn<Search>("search");
    QTest::addColumn<QStringList>("kinds");

    const auto row = [](char const* name, Search search, QStringList const& kinds) {
        QTest::newRow(name) << search << kinds;
    };
    row("one push and its size", Found<Stacks<0>>, {"push", "size"});
    row("two pushes and their size", Found<Stacks<1>>, {"push", "push", "size"});
    row("six pushes and their size", Found<Stacks<5>>,
        {"push", "push", "push", "push", "push", "push", "size"});
    row("one step, compared at the end", Found<Sequence<1>>, {"step 1"});
    row("three steps in order", Found<Sequence<3>>, {"step 1", "step 2", "step 3"});
    row("ten steps in order", Found<Sequence<10>>,
        {"step 1", "step 2", "step 3", "step 4", "step 5", "step 6", "step 7", "step 8", "step 9",
         "step 10"});
}

void tst_ShortestProgram::shortest()
{
    QFETCH(Search, search);
    QFETCH(QStringList, kinds);
    const std::optional<Program::Failure> failure = search();
    QVERIFY(failure);
    QStringList found;
    for (QString const& step : failure->told)
        found.append(step.section('(', 0, 0));
    QCOMPARE(found, kinds);
    QCOMPARE(failure->steps.size(), size_t(kinds.size()));
    QVERIFY(!failure->difference.isEmpty());
    QVERIFY(failure->length >= kinds.size());
}

void tst_ShortestProgram::argumentsAreAsSimpleAsTheyCanBe()
{
    const std::optional<Program::Failure> failure = Found<Numbers>();
    QVERIFY(failure);
    QCOMPARE(failure->told.size(), 1);
    const QString step = failure->told.first();
    QVERIFY2(step.startsWith("take(0, ") && step.endsWith(", )"), qPrintable(step));
    QVERIFY(step.section(", ", 1, 1).toInt() > 500);
    QCOMPARE(failure->difference, QString("large: true\nplain: false"));
}

void tst_ShortestProgram::crash()
{
#ifdef Q_OS_UNIX
    qputenv("VELOCOR_FORK", "1");
    const std::optional<Program::Failure> failure = Found<Crashing>();
    qunsetenv("VELOCOR_FORK");
    QVERIFY(failure);
    QCOMPARE(failure->steps.size(), size_t(2));
#else
    QSKIP("There are no child processes.");
#endif
}

void tst_ShortestProgram::nothingToFind()
{
    quint32 programs = 0;
    QVERIFY(!Program::search<Stacks<1000>>(Rounds::seed(), 100000, 100, programs));
    QVERIFY(programs >= 1000);
    QVERIFY(programs < 10000);
}

void tst_ShortestProgram::sameProgramForTheSameNumber()
{
    const Program::Steps steps = Program::made(7, 50);
    const Program::Steps again = Program::made(7, 50);
    QCOMPARE(steps.size(), again.size());
    for (size_t i = 0; i < steps.size(); ++i)
        QCOMPARE(steps[i].seed, again[i].seed);

    // All lengths and all numbers occur.
    std::vector<int> lengths(51);
    std::vector<int> numbers(10);
    for (quint32 number = 0; number < 5000; ++number) {
        const Program::Steps made = Program::made(number, 50);
        ++lengths[made.size()];
        Program::Draws draws(made[0]);
        draws.below(3);
        ++numbers[size_t(draws.below(10))];
    }
    QCOMPARE(lengths[0], 0);
    QVERIFY(std::all_of(lengths.begin() + 1, lengths.end(), [](int count) { return count > 50; }));
    QVERIFY(std::all_of(numbers.begin(), numbers.end(), [](int count) { return count > 400; }));
}

void tst_ShortestProgram::failsTheTest()
{
    QEXPECT_FAIL("", "the model forgets", Continue);
    Program::compare<Stacks<1>>("stacks", 10000, 100);
}

QTEST_APPLESS_MAIN(tst_ShortestProgram)
#include "tst_ShortestProgram.moc"
