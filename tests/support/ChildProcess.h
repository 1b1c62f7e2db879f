// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QByteArray>
#include <QCoreApplication>
#include <QDir>
#include <QMap>
#include <QProcess>
#include <QProcessEnvironment>
#include <QString>
#include <QStringList>
#include <QtTest>

/// Cases that need their own process: because they check what goes to standard error, may hang, end
/// the process, or change what it is allowed to do.
///
/// A case is a function of the test program; the program starts itself again to run it.
///
///     int echoes(QStringList const& arguments) { ...; return 0; }
///
///     void tst_Some::echo()
///     {
///         const ChildProcess::Result child = ChildProcess::run("echo", {folder.path()});
///         QVERIFY2(child.ended(), child.report());
///         QCOMPARE(child.errors, QByteArray("..."));
///     }
///
///     int main(int argc, char** argv)
///     {
///         return ChildProcess::main<tst_Some>(argc, argv, {{"echo", echoes}});
///     }
namespace ChildProcess {

using Case = int (*)(QStringList const& arguments);

/// What a case returns when it cannot be tested on this machine.
const int skipped = 77;

struct Result
{
    bool inTime = false; ///< false: it hung and was killed
    bool crashed = false;
    int exitCode = -1;
    QByteArray output;
    QByteArray errors;

    bool ended() const { return inTime && !crashed && exitCode == 0; }
    bool wasSkipped() const { return inTime && !crashed && exitCode == skipped; }

    /// For the failed check; valid until the next call.
    const char* report() const
    {
        static QByteArray text;
        text = !inTime ? "hung" : crashed ? "crashed" : "exit code " + QByteArray::number(exitCode);
        text += "\noutput: " + output + "\nerrors: " + errors;
        return text.constData();
    }
};

/// @param limit  milliseconds after which the case counts as hanging
inline Result run(QString const& name, QStringList const& arguments = QStringList(),
                  QString const& workingFolder = QString(), int limit = 60000)
{
    QProcessEnvironment environment = QProcessEnvironment::systemEnvironment();
    environment.remove("QT_LOGGING_RULES");
    environment.remove("QT_MESSAGE_PATTERN");
    // Later releases of Qt complain about this name on the very output that is compared.
    environment.remove("QT_LOGGING_TO_CONSOLE");
    environment.insert("QT_FORCE_STDERR_LOGGING", "1");
    if (!environment.contains("LC_ALL")) // a test may be about another language
        environment.insert("LC_ALL", "C.UTF-8");

    QProcess process;
    process.setProcessEnvironment(environment);
    if (!workingFolder.isEmpty())
        process.setWorkingDirectory(workingFolder);
    process.start(QCoreApplication::applicationFilePath(),
                  QStringList({"--case", name}) + arguments);

    Result result;
    result.inTime = process.waitForFinished(limit);
    if (!result.inTime) {
        process.kill();
        process.waitForFinished();
    }
    result.crashed = process.exitStatus() == QProcess::CrashExit;
    result.exitCode = process.exitCode();
    result.output = process.readAllStandardOutput();
    result.errors = process.readAllStandardError();
    return result;
}

template <class Test>
int main(int argc, char** argv, QMap<QString, Case> const& cases)
{
    QCoreApplication application(argc, argv);
    const QStringList arguments = application.arguments();
    if (arguments.value(1) == "--case") {
        const Case chosen = cases.value(arguments.value(2));
        return chosen ? chosen(arguments.mid(3)) : 2;
    }

    Test test;
    return QTest::qExec(&test, argc, argv);
}

} // namespace ChildProcess
