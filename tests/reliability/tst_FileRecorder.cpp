// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The library with which tst_Trust watches programs sees each call that it intercepts: otherwise
// finding nothing would prove nothing.

#include "support/ChildProcess.h"
#include "support/TestFiles.h"

#include <QTemporaryDir>
#include <QtTest>

#include <cstdio>
#include <cstdlib>
#include <fcntl.h>
#include <spawn.h>
#include <sys/stat.h>
#include <unistd.h>

class tst_FileRecorder : public QObject
{
    Q_OBJECT

private slots:
    void sees_data();
    void sees();
    void seesOnlyWriting();
    void seesNamesWithoutAFolder();
};

namespace {

char s_name[] = "true";
char* s_arguments[] = {s_name, nullptr};

struct Call
{
    char const* name;
    char const* note; // followed by a blank and the path
    void (*make)(char const* path);
};

// The path does not exist at first, and no call has to succeed.
const Call calls[] = {
    {"open", "open",
     [](char const* path) {
         open(path, O_WRONLY | O_CREAT, 0600);
     }},
    {"open to truncate", "open",
     [](char const* path) {
         open(path, O_RDONLY | O_TRUNC);
     }},
    {"open64", "open",
     [](char const* path) {
         open64(path, O_RDWR);
     }},
    {"openat", "open",
     [](char const* path) {
         openat(AT_FDCWD, path, O_WRONLY);
     }},
    {"openat64", "open",
     [](char const* path) {
         openat64(AT_FDCWD, path, O_CREAT, 0600);
     }},
    {"creat", "open",
     [](char const* path) {
         creat(path, 0600);
     }},
    {"fopen", "open",
     [](char const* path) {
         fopen(path, "a");
     }},
    {"fopen64", "open",
     [](char const* path) {
         fopen64(path, "r+");
     }},
    {"mkfifo", "open",
     [](char const* path) {
         mkfifo(path, 0600);
     }},
    {"mkdir", "mkdir",
     [](char const* path) {
         mkdir(path, 0700);
     }},
    {"rename from", "rename",
     [](char const* path) {
         rename(path, "/nonexistent/x");
     }},
    {"rename to", "rename",
     [](char const* path) {
         rename("/nonexistent/x", path);
     }},
    {"renameat from", "rename",
     [](char const* path) {
         renameat(AT_FDCWD, path, AT_FDCWD, "/nonexistent/x");
     }},
    {"renameat to", "rename",
     [](char const* path) {
         renameat(AT_FDCWD, "/nonexistent/x", AT_FDCWD, path);
     }},
    {"renameat2 from", "rename",
     [](char const* path) {
         renameat2(AT_FDCWD, path, AT_FDCWD, "/nonexistent/x", 0);
     }},
    {"renameat2 to", "rename",
     [](char const* path) {
         renameat2(AT_FDCWD, "/nonexistent/x", AT_FDCWD, path, 0);
     }},
    {"unlink", "remove",
     [](char const* path) {
         unlink(path);
     }},
    {"unlinkat", "remove",
     [](char const* path) {
         unlinkat(AT_FDCWD, path, 0);
     }},
    {"remove", "remove",
     [](char const* path) {
         remove(path);
     }},
    {"rmdir", "remove",
     [](char const* path) {
         rmdir(path);
     }},
    {"chmod", "chmod",
     [](char const* path) {
         chmod(path, 0600);
     }},
    {"execve", "start",
     [](char const* path) {
         execve(path, s_arguments, environ);
     }},
    {"execv", "start",
     [](char const* path) {
         execv(path, s_arguments);
     }},
    {"execvp", "start",
     [](char const* path) {
         execvp(path, s_arguments);
     }},
    {"execvpe", "start",
     [](char const* path) {
         execvpe(path, s_arguments, environ);
     }},
    {"execl", "start",
     [](char const* path) {
         execl(path, s_name, nullptr);
     }},
    {"execlp", "start",
     [](char const* path) {
         execlp(path, s_name, nullptr);
     }},
    {"execle", "start",
     [](char const* path) {
         execle(path, s_name, nullptr, environ);
     }},
    {"posix_spawn", "start",
     [](char const* path) {
         posix_spawn(nullptr, path, nullptr, nullptr, s_arguments, environ);
     }},
    {"posix_spawnp", "start",
     [](char const* path) {
         posix_spawnp(nullptr, path, nullptr, nullptr, s_arguments, environ);
     }},
    {"popen", "shell",
     [](char const* path) {
         pclose(popen(path, "r"));
     }},
    // Their results must not be ignored.
    {"link", "link",
     [](char const* path) {
         std::exit(link("/nonexistent/x", path) == 0);
     }},
    {"linkat", "link",
     [](char const* path) {
         std::exit(linkat(AT_FDCWD, "/nonexistent/x", AT_FDCWD, path, 0) == 0);
     }},
    {"symlink", "link",
     [](char const* path) {
         std::exit(symlink("x", path) != 0);
     }},
    {"truncate", "open",
     [](char const* path) {
         std::exit(truncate(path, 1) == 0);
     }},
    {"truncate64", "open",
     [](char const* path) {
         std::exit(truncate64(path, 1) == 0);
     }},
    {"chown", "chmod",
     [](char const* path) {
         std::exit(chown(path, 0, 0) == 0);
     }},
    {"system", "shell",
     [](char const* path) {
         std::exit(system(path) == 0);
     }},
};

// Those that complete a name: the path ends in six letters X, which they replace.
const Call completions[] = {
    {"mkstemp", "open",
     [](char const* path) {
         mkstemp(const_cast<char*>(path));
     }},
    {"mkstemp64", "open",
     [](char const* path) {
         mkstemp64(const_cast<char*>(path));
     }},
    {"mkostemp", "open",
     [](char const* path) {
         mkostemp(const_cast<char*>(path), 0);
     }},
    {"mkostemp64", "open",
     [](char const* path) {
         mkostemp64(const_cast<char*>(path), 0);
     }},
    {"mkdtemp", "mkdir",
     [](char const* path) {
         mkdtemp(const_cast<char*>(path));
     }},
};

int makesCall(QStringList const& arguments)
{
    QByteArray path = QFile::encodeName(arguments.at(1));
    for (Call const& call : calls) {
        if (arguments.at(0) == call.name)
            call.make(path.data());
    }
    for (Call const& call : completions) {
        if (arguments.at(0) == call.name)
            call.make(path.data());
    }
    return 0;
}

// Reads in several ways, and starts a program that PATH does not contain.
int makesOtherCalls(QStringList const& arguments)
{
    const QByteArray path = QFile::encodeName(arguments.at(0));
    fopen(path.constData(), "r");
    open(path.constData(), O_RDONLY);
    openat(AT_FDCWD, path.constData(), O_RDONLY | O_CLOEXEC);
    TestFiles::read(arguments.at(0));
    return 0;
}

int startsWithoutFolder(QStringList const&)
{
    execvp("no such program", s_arguments);
    return 0;
}

// The lines of the report.
QStringList notesOf(QString const& name, QStringList const& arguments, QString const& folder)
{
    const QString report = folder + "/report";
    qputenv("LD_PRELOAD", FILE_RECORDER);
    qputenv("FILE_RECORDER", QFile::encodeName(report));
    const ChildProcess::Result child = ChildProcess::run(name, arguments, folder);
    qunsetenv("LD_PRELOAD");
    qunsetenv("FILE_RECORDER");
    if (!child.ended())
        return {child.report()};
    return QFile::exists(report) ? QString::fromLocal8Bit(TestFiles::read(report)).split('\n')
                                 : QStringList();
}

} // namespace

void tst_FileRecorder::sees_data()
{
    QTest::addColumn<QString>("name");
    QTest::addColumn<QString>("note");

    for (Call const& call : calls)
        QTest::newRow(call.name) << "path" << QString(call.note) + " %1/path";
    for (Call const& call : completions)
        QTest::newRow(call.name) << "pathXXXXXX" << QString(call.note) + " %1/path......";
}

void tst_FileRecorder::sees()
{
    QFETCH(QString, name);
    QFETCH(QString, note);
    const QTemporaryDir folder;
    const QStringList notes =
        notesOf("call", {QTest::currentDataTag(), folder.path() + '/' + name}, folder.path());
    const QRegularExpression expected('^' + note.arg(folder.path()) + '$');
    QVERIFY2(notes.indexOf(expected) >= 0, qPrintable(notes.join('\n')));
}

void tst_FileRecorder::seesOnlyWriting()
{
    const QTemporaryDir folder;
    const QString path = folder.path() + "/path";
    QVERIFY(TestFiles::write(path, "x"));
    const QStringList notes = notesOf("other calls", {path}, folder.path());
    QCOMPARE(notes.filter(path), QStringList());
}

void tst_FileRecorder::seesNamesWithoutAFolder()
{
    const QTemporaryDir folder;
    const QStringList notes = notesOf("without folder", {}, folder.path());
    QVERIFY2(notes.contains("search no such program"), qPrintable(notes.join('\n')));
}

int main(int argc, char** argv)
{
    return ChildProcess::main<tst_FileRecorder>(argc, argv,
                                                {{"call", makesCall},
                                                 {"other calls", makesOtherCalls},
                                                 {"without folder", startsWithoutFolder}});
}

#include "tst_FileRecorder.moc"
