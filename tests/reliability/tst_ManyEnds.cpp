// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Many runs of the program by one user, which end in ten ways. After each, the next window tells of
// an end that was not normal, once, and of no other.
//
//     VELOCOR_ENDS  how many

#include "app/Installation.h"
#include "app/history/RunEnds.h"
#include "reliability/Figures.h"
#include "support/LeftMark.h"
#include "support/TestFiles.h"

#include <QScopedValueRollback>
#include <QtTest>

#include <algorithm>
#include <csignal>
#include <random>

using namespace Velocor;

namespace {

struct End
{
    char const* name;
    int signalNumber; // 0: the window is closed
    bool isTold;
    bool (*change)(QString const& mark); // of what it left behind
};

const End Ends[] = {
    {"closed", 0, false, nullptr},
    {"told to end", SIGTERM, false, nullptr},
    {"terminal closed", SIGHUP, false, nullptr},
    {"killed", SIGKILL, true, nullptr},
    {"invalid memory access", SIGSEGV, true, nullptr},
    {"aborted", SIGABRT, true, nullptr},
    {"killed, and its process ID used again", SIGKILL, true, LeftMark::useProcessIdAgain},
    {"restored from a backup", SIGKILL, false, LeftMark::restore},
    {"mark of another computer", SIGKILL, false, LeftMark::moveToAnotherComputer},
    {"mark removed", SIGKILL, false,
     [](QString const& mark) {
         return QFile::remove(mark);
     }},
};

QString LogOf(Installation const& installation)
{
    return installation.LogFolder() + "velocor.log";
}

// The mark of a process; empty if there is none.
QString MarkOf(Installation const& installation, pid_t process)
{
    const QDir folder(RunEnds::MarkFolderOf(LogOf(installation)));
    const QStringList names = folder.entryList({QString("*-%1.run").arg(process)});
    return names.isEmpty() ? QString() : folder.filePath(names.first());
}

// What a window tells that starts now and is closed.
QString TextsOf(Installation& installation)
{
    const QScopedValueRollback<QProcessEnvironment> usual(installation.environment);
    installation.AddSpy("close");
    installation.environment.insert("SPY_AWAIT", "Aa"); // made with the notices
    QFile::remove(installation.top + "report.json");
    RunningProgram program(installation);
    if (program.ExitCode() != 0)
        return QStringLiteral("not closed");
    return QJsonDocument(installation.Report()["texts"].toArray()).toJson();
}

} // namespace

class tst_ManyEnds : public QObject
{
    Q_OBJECT

private slots:
    void ends();

private:
    static void end(Installation& installation, End const& how);
};

void tst_ManyEnds::end(Installation& installation, End const& how)
{
    if (how.signalNumber == 0) {
        QVERIFY(TextsOf(installation).contains("Aa"));
        return;
    }
    QFile::remove(LogOf(installation)); // which would say that it has started
    RunningProgram program(installation);
    QTRY_VERIFY_WITH_TIMEOUT(TestFiles::read(LogOf(installation)).contains("app.exec() starting"),
                             Patience);
    const pid_t process = program.Id();
    QTRY_VERIFY_WITH_TIMEOUT(!MarkOf(installation, process).isEmpty(), Patience);
    program.Send(how.signalNumber);
    program.ExitCode();
    if (how.change)
        QVERIFY(how.change(MarkOf(installation, process)));
}

void tst_ManyEnds::ends()
{
    const int wanted = Figures::wanted("VELOCOR_ENDS", int(std::size(Ends)));
    std::mt19937 random(Figures::wanted("VELOCOR_SEED", 1));
    Installation installation;
    int told = 0;
    std::vector<End> next;
    for (int i = 0; i < wanted; ++i) {
        if (next.empty()) {
            next.assign(std::begin(Ends), std::end(Ends));
            std::shuffle(next.begin(), next.end(), random);
        }
        const End how = next.back();
        next.pop_back();
        end(installation, how);
        if (QTest::currentTestFailed())
            return;
        const QString texts = TextsOf(installation);
        QVERIFY2(texts.contains("Aa"), how.name);
        QVERIFY2(texts.contains("did not end normally") == how.isTold, how.name);
        told += how.isTold;
    }
    QVERIFY(!TextsOf(installation).contains("did not end normally"));
    Figures::print(QString("ends: %1 runs in %2 ways, %3 told at the next start, none missed, no "
                           "false alarm")
                       .arg(wanted)
                       .arg(std::size(Ends))
                       .arg(told));
}

QTEST_GUILESS_MAIN(tst_ManyEnds)
#include "tst_ManyEnds.moc"
