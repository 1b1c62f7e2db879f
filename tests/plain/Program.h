// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "plain/Rounds.h"

#include <QByteArray>
#include <QDir>
#include <QFileInfo>
#include <QString>
#include <QStringList>
#include <QTemporaryDir>
#include <QtTest>

#include <algorithm>
#include <csignal>
#include <cstdio>
#include <optional>
#include <utility>
#include <vector>

#ifdef Q_OS_UNIX
#include <sys/wait.h>
#include <unistd.h>
#endif

/// Random programs of calls, run on a component and on its plain model, and the shortest program
/// that tells the two apart.
///
/// A pair of component and model has a default constructor and two operations:
///
///     class Lists : public Program::Pair
///     {
///     public:
///         void perform(Program::Draws& draws) // one call on both, chosen by the draws
///         {
///             const int value = draws.below(10);
///             draws.tell([&] { return QString("list.append(%1)").arg(value); });
///             m_list.append(value);
///             m_plain.append(value);
///             same("size", m_list.size(), m_plain.size());
///         }
///         void finish() { same("list", ...); } // what is too slow to compare after each call
///     };
///
///     Program::compare<Lists>("lists", Rounds::count(1000000, 1000000, 10000000), 30);
///
/// A step depends on its own number only, never on the steps before it, so any of them can be left
/// out. On a failure, everything is left out without which the two still differ, and the remaining
/// arguments become as simple as they can be: so let the simplest choice be the one for a draw of
/// 0.
///
/// A program that crashes prints its seed. With that and `VELOCOR_FORK=1` each program runs in a
/// child process, and the shortest that crashes is found, too.
namespace Program {

/// One step: a number from which its draws derive, and which of its draws are 0 instead.
struct Step
{
    quint64 seed = 0;
    quint64 zeros = 0;
};

using Steps = std::vector<Step>;

/// How many draws of a step can be replaced by 0.
constexpr int MaximumZeros = 24;

/// A mixed number, always the same for the same one. SplitMix64.
inline quint64 mixed(quint64 number)
{
    number += Q_UINT64_C(0x9e3779b97f4a7c15);
    number = (number ^ (number >> 30U)) * Q_UINT64_C(0xbf58476d1ce4e5b9);
    number = (number ^ (number >> 27U)) * Q_UINT64_C(0x94d049bb133111eb);
    return number ^ (number >> 31U);
}

/// The random choices of one step.
class Draws
{
public:
    enum Telling { Silent, Kept, Printed };

    explicit Draws(Step const& step, Telling telling = Silent) : m_step(step), m_telling(telling) {}

    /// A number from 0 to `limit` - 1.
    int below(int limit)
    {
        const int draw = m_drawn++;
        if (draw < MaximumZeros && ((m_step.zeros >> unsigned(draw)) & 1U))
            return 0;
        const quint64 number = mixed(m_step.seed + quint64(draw)) >> 32U;
        return int((number * quint64(limit)) >> 32U);
    }

    /// True once in `times`; false for a draw of 0.
    bool once(int times) { return below(times) == times - 1; }

    template <class Value, int Count>
    Value const& oneOf(Value const (&values)[Count])
    {
        return values[below(Count)];
    }

    /// A text of up to `length` of these letters.
    QString text(QString const& letters, int length)
    {
        QString result;
        for (int left = below(length + 1); left > 0; --left)
            result += letters.at(below(letters.length()));
        return result;
    }

    /// How the step reads; what it does next is appended. `text` is only called when the program is
    /// printed.
    template <class Text>
    void tell(Text text)
    {
        if (m_telling == Kept)
            m_told.append(text());
        else if (m_telling == Printed)
            print(text());
    }
    QString told() const { return m_told.isEmpty() ? "(nothing)" : m_told.join("; "); }

private:
    static void print(QString const& text)
    {
        std::printf("    %s\n", qPrintable(text));
        std::fflush(stdout);
    }

    Step m_step;
    Telling m_telling;
    int m_drawn = 0;
    QStringList m_told;
};

/// A text as it is written in a program.
inline QString quoted(QString const& text)
{
    if (text.isNull())
        return QStringLiteral("QString()");
    if (text.length() > 500)
        return quoted(text.left(200)) + QStringLiteral("... of %1").arg(text.length());
    QString result = QStringLiteral("\"");
    for (QChar letter : text) {
        if (letter == '\n')
            result += QStringLiteral("\\n");
        else if (letter == '"' || letter == '\\')
            result += QString('\\') + letter;
        else if (letter < ' ' || letter > '~')
            result += QStringLiteral("\\u%1").arg(letter.unicode(), 4, 16, QChar('0'));
        else
            result += letter;
    }
    return result + '"';
}

inline QString quoted(QByteArray const& bytes)
{
    return quoted(QString::fromLatin1(bytes));
}

inline QString quoted(bool value)
{
    return value ? QStringLiteral("true") : QStringLiteral("false");
}

inline QString quoted(QStringList const& texts)
{
    QStringList result;
    for (QString const& text : texts)
        result.append(quoted(text));
    return "{" + result.join(", ") + "}";
}

template <class Number>
QString quoted(Number number)
{
    return QString::number(number);
}

/// Base of a pair: notes the first difference.
class Pair
{
public:
    /// Empty while the two are the same.
    QString const& difference() const { return m_difference; }

protected:
    /// Tells the step: a call in which each # stands for an argument. m_draws is set by then.
    template <class... Arguments>
    void tell(char const* call, Arguments const&... arguments)
    {
        m_draws->tell([&] {
            QString text = QString::fromUtf8(call);
            const QStringList values({quoted(arguments)...});
            for (QString const& value : values)
                text = text.replace(text.indexOf('#'), 1, value);
            return text;
        });
    }

    /// Performs something after the last step, with draws that are the same in every program.
    template <class Function>
    void performLast(Function const& function)
    {
        const Step last;
        Draws draws(last);
        m_draws = &draws;
        function();
    }

    template <class Value>
    void same(char const* what, Value const& real, Value const& plain)
    {
        if (m_difference.isEmpty() && !(real == plain))
            m_difference = QStringLiteral("%1: %2\nplain: %3")
                               .arg(QLatin1String(what), quoted(real), quoted(plain));
    }

    // Without what is in both.
    void same(char const* what, QStringList const& real, QStringList const& plain)
    {
        if (!m_difference.isEmpty() || real == plain)
            return;
        const auto without = [](QStringList texts, QStringList const& others) {
            for (QString const& other : others)
                texts.removeOne(other);
            return texts;
        };
        const QStringList onlyReal = without(real, plain);
        const QStringList onlyPlain = without(plain, real);
        const bool isOrder = onlyReal.isEmpty() && onlyPlain.isEmpty();
        m_difference = QStringLiteral("%1: %2\nplain: %3")
                           .arg(QLatin1String(what), quoted(isOrder ? real : onlyReal),
                                quoted(isOrder ? plain : onlyPlain));
    }

    Draws* m_draws = nullptr;

private:
    QString m_difference;
};

/// A program after which the two differ.
struct Failure
{
    Steps steps;
    QStringList told;
    QString difference;
    int length = 0; ///< how many steps it had when it was found
    int runs = 0;   ///< how many programs it took to shorten it
};

/// Runs a program on a new pair, and cuts it after the step that shows a difference.
///
/// @return the difference; empty if there is none
template <class APair>
QString run(Steps& steps, Draws::Telling telling = Draws::Silent, QStringList* told = nullptr)
{
    APair pair;
    for (size_t i = 0; i < steps.size(); ++i) {
        Draws draws(steps[i], telling);
        pair.perform(draws);
        if (told)
            told->append(draws.told());
        if (!pair.difference().isEmpty()) {
            steps.resize(i + 1);
            return pair.difference();
        }
    }
    pair.finish();
    return pair.difference();
}

/// Whether each program runs in a child process.
inline bool usesChildren()
{
    return qEnvironmentVariableIsSet("VELOCOR_FORK");
}

/// The same in a child process, which may crash.
///
/// @return whether the two differ or the child did not come to its end
template <class APair>
bool failsInChild(Steps steps, Draws::Telling telling = Draws::Silent)
{
#ifdef Q_OS_UNIX
    std::fflush(stdout);
    const pid_t child = ::fork();
    if (child == 0) {
        for (int number : {SIGSEGV, SIGABRT, SIGFPE})
            std::signal(number, SIG_DFL);
        ::_exit(run<APair>(steps, telling).isEmpty() ? 0 : 1);
    }
    int status = -1;
    ::waitpid(child, &status, 0);
    return status != 0;
#else
    return !run<APair>(steps, telling).isEmpty();
#endif
}

/// Says which program crashed, then leaves the crash to the handler that was there.
class CrashNote
{
public:
    CrashNote()
    {
        s_this = this;
        for (int number : {SIGSEGV, SIGABRT, SIGFPE})
            m_before.append(qMakePair(number, std::signal(number, note)));
    }
    ~CrashNote() { restore(); }
    Q_DISABLE_COPY(CrashNote)

    static inline quint32 seed = 0;

private:
    static void note(int number)
    {
        std::printf("VELOCOR_SEED=%u makes the program that crashed the first; VELOCOR_FORK=1 "
                    "shortens it.\n",
                    seed);
        std::fflush(stdout);
        s_this->restore();
        std::raise(number);
    }

    void restore()
    {
        for (auto const& handler : m_before)
            std::signal(handler.first, handler.second);
        m_before.clear();
    }

    static inline CrashNote* s_this = nullptr;
    QVector<QPair<int, void (*)(int)>> m_before;
};

/// Leaves out what a failing program does not need to fail: first halves of it, then ever smaller
/// pieces down to single steps, then arguments.
template <class APair>
Failure shortened(Steps steps)
{
    Failure failure;
    failure.length = int(steps.size());
    const auto stillFails = [&](Steps candidate) {
        ++failure.runs;
        const bool fails =
            usesChildren() ? failsInChild<APair>(candidate) : !run<APair>(candidate).isEmpty();
        if (!fails)
            return false;
        steps = candidate;
        return true;
    };

    const auto leaveOut = [&] {
        size_t piece = std::max<size_t>(1, steps.size() / 2);
        for (bool isDone = false; !isDone;) {
            bool leftOut = false;
            for (size_t at = 0; at < steps.size() && steps.size() > 1;) {
                Steps candidate = steps;
                const auto begin = candidate.begin() + std::ptrdiff_t(at);
                const size_t count = std::min(piece, steps.size() - at);
                candidate.erase(begin, begin + std::ptrdiff_t(count));
                if (!candidate.empty() && stillFails(candidate))
                    leftOut = true;
                else
                    at += piece;
            }
            isDone = piece == 1 && !leftOut;
            if (!leftOut || piece > steps.size())
                piece = std::max<size_t>(1, std::min(piece, steps.size()) / 2);
        }
    };
    const auto simplify = [&] {
        for (size_t at = 0; at < steps.size(); ++at) {
            for (int draw = 0; draw < MaximumZeros && at < steps.size(); ++draw) {
                Steps candidate = steps;
                candidate[at].zeros |= quint64(1) << unsigned(draw);
                stillFails(candidate);
            }
        }
    };

    stillFails(steps);
    leaveOut();
    simplify();
    leaveOut(); // what simpler steps do not need

    failure.steps = steps;
    if (usesChildren())
        failure.difference = "in a child process";
    else
        failure.difference = run<APair>(steps, Draws::Kept, &failure.told);
    return failure;
}

/// The program with this number: up to `length` steps.
inline Steps made(quint32 number, int length)
{
    const quint64 seed = mixed(number);
    Steps steps(size_t(1 + int(seed % quint64(length))));
    for (size_t i = 0; i < steps.size(); ++i)
        steps[i].seed = mixed(seed + i);
    return steps;
}

/// Runs programs until their steps are as many as requested.
///
/// @param programs  receives their number
/// @return the first failing program, shortened
template <class APair>
std::optional<Failure> search(quint32 seed, int count, int length, quint32& programs)
{
    programs = 0;
    for (int done = 0; done < count; ++programs) {
        Steps steps = made(seed + programs, length);
        done += int(steps.size());
        const Steps whole = steps;
        CrashNote::seed = seed + programs;
        if (usesChildren() ? failsInChild<APair>(steps) : !run<APair>(steps).isEmpty())
            return shortened<APair>(whole);
    }
    return std::nullopt;
}

/// Runs programs, and fails the test with the shortest one after which the pair differs. Prints one
/// line.
///
/// @param count  the number of steps in all programs together
/// @param length  the number of steps in the longest program
template <class APair>
void compare(char const* name, int count, int length)
{
    quint32 programs = 0;
    const CrashNote note;
    const std::optional<Failure> failure = search<APair>(Rounds::seed(), count, length, programs);
    if (failure) {
        std::printf(
            "%s: VELOCOR_SEED=%u makes this program of %d steps the first. The shortest that "
            "still fails, after %d others:\n    %s\n%s\n",
            name, Rounds::seed() + programs, failure->length, failure->runs,
            qPrintable(failure->told.join("\n    ")), qPrintable(failure->difference));
        std::fflush(stdout);
        if (usesChildren())
            failsInChild<APair>(failure->steps, Draws::Printed);
    } else {
        std::printf("plain %s: %d steps in %u programs, each with the outcome of the plain model\n",
                    name, count, programs);
    }
    QVERIFY2(!failure, failure ? qPrintable(failure->told.join("; ")) : "");
}

/// Lets temporary folders be in memory where there is a folder for that: programs make thousands.
inline void useMemoryForFiles()
{
    if (!qEnvironmentVariableIsSet("TMPDIR") && QFileInfo("/dev/shm").isWritable())
        qputenv("TMPDIR", "/dev/shm");
}

} // namespace Program
