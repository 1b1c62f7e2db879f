// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Signals to real processes. See QuitProbe.cpp.

#include "ProgramRuns.h"

#include <QFile>
#include <QRegularExpression>
#include <QTest>

#include <csignal>
#include <unistd.h>

namespace {

constexpr int Patience = 30000;
constexpr int AnotherRequest = 250; // milliseconds; well past a single request

class Probe
{
public:
    explicit Probe(QString const& state, std::function<void()> const& inChild = {})
    {
        QProcessEnvironment environment = QProcessEnvironment::systemEnvironment();
        environment.insert("QT_QPA_PLATFORM", "offscreen");
        m_process.setProcessEnvironment(environment);
        m_process.inChild = inChild;
        m_process.start(QUIT_PROBE, {state});
    }

    // Skips lines up to this one.
    bool Prints(QByteArray const& line)
    {
        QByteArray next;
        do {
            next = NextLine(m_process);
        } while (!next.isEmpty() && next != line + '\n');
        return !next.isEmpty();
    }

    void Send(int signalNumber) { ::kill(static_cast<pid_t>(m_process.processId()), signalNumber); }

    void EndInput() { m_process.closeWriteChannel(); }

    bool RunsFor(int milliseconds) { return !m_process.waitForFinished(milliseconds); }

    // "exit CODE" or "signal NUMBER", and "" for a process that does not end.
    QString End()
    {
        m_process.waitForFinished(Patience);
        if (m_process.state() != QProcess::NotRunning)
            return QString();
        const bool exited = m_process.exitStatus() == QProcess::NormalExit;
        return QString(exited ? "exit %1" : "signal %1").arg(m_process.exitCode());
    }

    QByteArray Rest() { return m_process.readAllStandardOutput(); }

    // Whether a signal is in one of the masks of the process's status: SigIgn, SigCgt, or ShdPnd
    // for those that it has not taken yet.
    bool IsIn(char const* mask, int signalNumber) const
    {
        QFile status(QString("/proc/%1/status").arg(m_process.processId()));
        if (!status.open(QIODevice::ReadOnly))
            return false;
        const QRegularExpression pattern(QString(mask) + ":\\s*([0-9a-f]+)");
        const QString text = QString::fromLatin1(status.readAll());
        const quint64 bits = pattern.match(text).captured(1).toULongLong(nullptr, 16);
        return (bits >> (signalNumber - 1)) & 1;
    }

private:
    PreparedProcess m_process;
};

void AddSignals()
{
    QTest::addColumn<int>("signalNumber");
    QTest::newRow("SIGINT") << SIGINT;
    QTest::newRow("SIGTERM") << SIGTERM;
    QTest::newRow("SIGHUP") << SIGHUP;
}

QString KilledBy(int signalNumber)
{
    return QString("signal %1").arg(signalNumber);
}

} // namespace

class tst_QuitOnSignal : public QObject
{
    Q_OBJECT

private slots:
    void endsAProgramWithoutWindows_data() { AddSignals(); }
    void endsAProgramWithoutWindows();
    void closesTheWindow_data() { AddSignals(); }
    void closesTheWindow();
    void closesABoxAndTheWindowBelow();
    void aSignalBeforeTheLoopEndsItWhenItStarts();
    void aBoxBeforeTheLoopIsClosedAndTheLoopEnds_data();
    void aBoxBeforeTheLoopIsClosedAndTheLoopEnds();
    void aQuestionBeforeTheLoopIsWaitedFor();
    void aWindowMayRefuseTheFirst();
    void theSecondEndsAtOnce_data();
    void theSecondEndsAtOnce();
    void signalsAtOneMomentAreOneRequest();
    void ignoredByTheParentStaysIgnored_data() { AddSignals(); }
    void ignoredByTheParentStaysIgnored();
    void errnoIsPutBack();
    void childrenDoNotInheritThePipe();
    void aSignalToAForkedChildIsItsOwn();
    void afterTheObjectSignalsHaveTheirDefaultEffect_data() { AddSignals(); }
    void afterTheObjectSignalsHaveTheirDefaultEffect();
};

void tst_QuitOnSignal::endsAProgramWithoutWindows()
{
    QFETCH(int, signalNumber);
    Probe probe("core");
    QVERIFY(probe.Prints("loop"));
    probe.Send(signalNumber);
    QCOMPARE(probe.End(), QString("exit 0"));
    QCOMPARE(probe.Rest(), QByteArray("quit\n"));
}

void tst_QuitOnSignal::closesTheWindow()
{
    QFETCH(int, signalNumber);
    Probe probe("window");
    QVERIFY(probe.Prints("loop"));
    probe.Send(signalNumber);
    QCOMPARE(probe.End(), QString("exit 0"));
    QCOMPARE(probe.Rest(), QByteArray("close\nquit\n"));
}

void tst_QuitOnSignal::closesABoxAndTheWindowBelow()
{
    Probe probe("dialog");
    QVERIFY(probe.Prints("box"));
    probe.Send(SIGTERM);
    QCOMPARE(probe.End(), QString("exit 0"));
    QCOMPARE(probe.Rest(), QByteArray("close\nbox closed\nquit\n"));
}

void tst_QuitOnSignal::aSignalBeforeTheLoopEndsItWhenItStarts()
{
    Probe probe("wait");
    QVERIFY(probe.Prints("ready"));
    probe.Send(SIGTERM);
    QVERIFY(probe.RunsFor(100));
    probe.EndInput();
    QCOMPARE(probe.End(), QString("exit 0"));
}

void tst_QuitOnSignal::aBoxBeforeTheLoopIsClosedAndTheLoopEnds_data()
{
    QTest::addColumn<QString>("state");

    QTest::newRow("one box") << "box";
    QTest::newRow("two boxes, one after the other") << "boxes";
}

// The window that is created after the box is closed too.
void tst_QuitOnSignal::aBoxBeforeTheLoopIsClosedAndTheLoopEnds()
{
    QFETCH(QString, state);
    Probe probe(state);
    QVERIFY(probe.Prints("box"));
    probe.Send(SIGTERM);
    QCOMPARE(probe.End(), QString("exit 0"));
    const QByteArray rest = probe.Rest();
    QVERIFY2(rest.contains("\nclose\n") && rest.endsWith("\nquit\n"), rest);
}

void tst_QuitOnSignal::aQuestionBeforeTheLoopIsWaitedFor()
{
    Probe probe("question");
    QVERIFY(probe.Prints("box"));
    probe.Send(SIGTERM);
    QVERIFY(probe.Prints("answer"));
    QCOMPARE(probe.End(), QString("exit 0"));
    const QByteArray rest = probe.Rest();
    QVERIFY2(rest.contains("\nclose\n") && rest.endsWith("\nquit\n"), rest);
}

void tst_QuitOnSignal::aWindowMayRefuseTheFirst()
{
    Probe probe("refuses");
    QVERIFY(probe.Prints("loop"));
    probe.Send(SIGTERM);
    QVERIFY(probe.Prints("close"));
    QVERIFY(probe.RunsFor(AnotherRequest));
    QCOMPARE(probe.Rest(), QByteArray());
}

void tst_QuitOnSignal::theSecondEndsAtOnce_data()
{
    QTest::addColumn<QString>("state");
    QTest::addColumn<QByteArray>("ready");
    QTest::addColumn<QByteArray>("asked");
    QTest::addColumn<int>("first");
    QTest::addColumn<int>("second");

    const QByteArray loop("loop");
    QTest::newRow("the window asks") << "asks" << loop << QByteArray("box") << SIGTERM << SIGTERM;
    QTest::newRow("the window refused")
        << "refuses" << loop << QByteArray("close") << SIGINT << SIGINT;
    QTest::newRow("another signal") << "asks" << loop << QByteArray("box") << SIGHUP << SIGTERM;
    QTest::newRow("the event loop is stuck")
        << "stuck" << QByteArray("stuck") << QByteArray() << SIGINT << SIGINT;
    QTest::newRow("before exec() a box must be answered")
        << "question" << QByteArray("box") << QByteArray() << SIGTERM << SIGTERM;
}

void tst_QuitOnSignal::theSecondEndsAtOnce()
{
    QFETCH(QString, state);
    QFETCH(QByteArray, ready);
    QFETCH(QByteArray, asked);
    QFETCH(int, first);
    QFETCH(int, second);
    Probe probe(state);
    QVERIFY(probe.Prints(ready));
    probe.Send(first);
    if (!asked.isEmpty())
        QVERIFY(probe.Prints(asked));
    QTRY_VERIFY_WITH_TIMEOUT(!probe.IsIn("ShdPnd", first), Patience);
    QVERIFY(probe.RunsFor(AnotherRequest));
    probe.Send(second);
    QCOMPARE(probe.End(), KilledBy(second));
    QCOMPARE(probe.Rest(), QByteArray());
}

// As timeout(1) and a closing terminal do: they signal both the process and its group.
void tst_QuitOnSignal::signalsAtOneMomentAreOneRequest()
{
    Probe probe("asks");
    QVERIFY(probe.Prints("loop"));
    probe.Send(SIGSTOP);
    probe.Send(SIGTERM);
    probe.Send(SIGHUP);
    probe.Send(SIGINT);
    probe.Send(SIGCONT);
    QVERIFY(probe.Prints("box"));
    QVERIFY(probe.RunsFor(AnotherRequest));
}

void tst_QuitOnSignal::ignoredByTheParentStaysIgnored()
{
    QFETCH(int, signalNumber);
    Probe probe("window", [signalNumber] { std::signal(signalNumber, SIG_IGN); });
    QVERIFY(probe.Prints("loop"));
    for (int other : {SIGINT, SIGTERM, SIGHUP}) {
        QCOMPARE(probe.IsIn("SigIgn", other), other == signalNumber);
        QCOMPARE(probe.IsIn("SigCgt", other), other != signalNumber);
    }
    probe.Send(signalNumber);
    QVERIFY(probe.RunsFor(AnotherRequest));
    QCOMPARE(probe.Rest(), QByteArray());
    probe.Send(signalNumber == SIGTERM ? SIGINT : SIGTERM);
    QCOMPARE(probe.End(), QString("exit 0"));
}

void tst_QuitOnSignal::errnoIsPutBack()
{
    Probe probe("errno");
    QCOMPARE(probe.End(), QString("exit 0"));
    QCOMPARE(probe.Rest(), QByteArray("as before\n"));
}

void tst_QuitOnSignal::childrenDoNotInheritThePipe()
{
    Probe probe("pipe");
    QCOMPARE(probe.End(), QString("exit 0"));
    const QByteArray end("closed on exec, does not block\n");
    QCOMPARE(probe.Rest(), end + end);
}

void tst_QuitOnSignal::aSignalToAForkedChildIsItsOwn()
{
    Probe probe("fork");
    QVERIFY(probe.Prints("child killed by " + QByteArray::number(SIGTERM)));
    QVERIFY(probe.Prints("still running"));
    probe.Send(SIGTERM);
    QCOMPARE(probe.End(), QString("exit 0"));
}

void tst_QuitOnSignal::afterTheObjectSignalsHaveTheirDefaultEffect()
{
    QFETCH(int, signalNumber);
    Probe probe("after");
    QVERIFY(probe.Prints("loop"));
    probe.Send(signalNumber);
    QCOMPARE(probe.End(), KilledBy(signalNumber));
}

QTEST_GUILESS_MAIN(tst_QuitOnSignal)
#include "tst_QuitOnSignal.moc"
