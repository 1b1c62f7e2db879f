// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// A program with a QuitOnSignal, named after the state in which it gets its signals. It prints a
// line for each step.
//
//     quit_probe core      an event loop without windows
//     quit_probe window    a window that can be closed
//     quit_probe asks      a window that asks for confirmation before it closes
//     quit_probe refuses   a window that never closes
//     quit_probe box       a box before exec(), and a window after it
//     quit_probe boxes     two boxes, one after the other, before exec()
//     quit_probe question  before exec() a box that must be answered; it is, automatically
//     quit_probe dialog    a window and a box over it
//     quit_probe stuck     an event loop that is blocked
//     quit_probe errno     prints how a signal changes errno while the pipe is full
//     quit_probe pipe      prints the flags of the new descriptors
//     quit_probe fork      prints how a forked child ends when it gets SIGTERM, then as core
//     quit_probe after     signals after the object is gone
//     quit_probe wait      no event loop yet when "ready" is printed, and one when the input ends

#include "app/QuitOnSignal.h"

#include <QApplication>
#include <QCloseEvent>
#include <QList>
#include <QMessageBox>
#include <QPushButton>
#include <QTimer>
#include <QWidget>

#include <cerrno>
#include <csignal>
#include <cstdio>
#include <fcntl.h>
#include <sys/wait.h>
#include <unistd.h>

namespace {

void Print(QByteArray const& line)
{
    std::printf("%s\n", line.constData());
    std::fflush(stdout);
}

// Runs once the event loop is running.
void PrintInLoop(char const* line)
{
    QTimer::singleShot(0, QCoreApplication::instance(), [line] { Print(line); });
}

int Exec()
{
    PrintInLoop("loop");
    const int code = QCoreApplication::exec();
    Print("quit");
    return code;
}

void ShowBox(QMessageBox::StandardButtons buttons = QMessageBox::Ok)
{
    QMessageBox box(QMessageBox::Question, "Box", "Box", buttons);
    PrintInLoop("box");
    box.exec();
    Print("box closed");
}

class ProbeWindow : public QWidget
{
public:
    explicit ProbeWindow(QByteArray const& state) : m_state(state) { show(); }

protected:
    void closeEvent(QCloseEvent* event) override
    {
        Print("close");
        if (m_state == "asks")
            ShowBox();
        event->setAccepted(m_state != "refuses");
    }

private:
    QByteArray m_state;
};

int Core(int& argc, char** argv)
{
    const QCoreApplication application(argc, argv);
    const QuitOnSignal quitOnSignal;
    return Exec();
}

int Window(QByteArray const& state)
{
    const ProbeWindow window(state);
    if (state == "dialog")
        QTimer::singleShot(0, qApp, [] { ShowBox(); });
    return Exec();
}

int BoxBeforeExec(int count)
{
    for (int i = 0; i < count; ++i)
        ShowBox();
    const ProbeWindow window("window");
    return Exec();
}

// With two accepting buttons and no rejecting one, the box cannot be closed.
int QuestionBeforeExec()
{
    QTimer::singleShot(600, qApp, [] {
        Print("answer");
        auto* box = qobject_cast<QMessageBox*>(QApplication::activeModalWidget());
        if (box)
            box->button(QMessageBox::Yes)->click();
    });
    ShowBox(QMessageBox::Yes | QMessageBox::YesToAll);
    const ProbeWindow window("window");
    return Exec();
}

int Stuck()
{
    Print("stuck");
    for (;;)
        pause();
}

QList<int> OpenDescriptors()
{
    QList<int> open;
    for (int file = 0; file < 200; ++file) {
        if (fcntl(file, F_GETFD) != -1)
            open.append(file);
    }
    return open;
}

int Errno(QList<int> const& newFiles)
{
    for (int file : newFiles) {
        const char bytes[4096] = {};
        while (write(file, bytes, sizeof bytes) > 0) {}
        while (write(file, bytes, 1) > 0) {}
    }
    const bool isFull = errno == EAGAIN || errno == EBADF;
    errno = ERANGE;
    raise(SIGTERM);
    const int after = errno;
    Print(!isFull ? "not full" : after == ERANGE ? "as before" : "changed");
    return 0;
}

int Pipe(QList<int> const& newFiles)
{
    for (int file : newFiles) {
        const bool isClosedOnExec = fcntl(file, F_GETFD) & FD_CLOEXEC;
        const bool doesNotBlock = fcntl(file, F_GETFL) & O_NONBLOCK;
        Print(QByteArray(isClosedOnExec ? "closed on exec" : "inherited") +
              (doesNotBlock ? ", does not block" : ", blocks"));
    }
    return 0;
}

int Fork()
{
    const pid_t child = fork();
    if (child == 0) {
        for (;;)
            pause();
    }
    int status = 0;
    kill(child, SIGTERM);
    waitpid(child, &status, 0);
    Print(WIFSIGNALED(status) ? "child killed by " + QByteArray::number(WTERMSIG(status))
                              : "child ended");
    QTimer::singleShot(300, qApp, [] { Print("still running"); });
    return Exec();
}

int Wait()
{
    Print("ready");
    while (std::getchar() != EOF) {}
    return Exec();
}

int WithWidgets(QByteArray const& state)
{
    const QList<int> before = OpenDescriptors();
    const QuitOnSignal quitOnSignal;
    QList<int> newFiles;
    for (int file : OpenDescriptors()) {
        if (!before.contains(file))
            newFiles.append(file);
    }

    if (state == "box" || state == "boxes")
        return BoxBeforeExec(state == "box" ? 1 : 2);
    if (state == "question")
        return QuestionBeforeExec();
    if (state == "stuck")
        return Stuck();
    if (state == "errno")
        return Errno(newFiles);
    if (state == "pipe")
        return Pipe(newFiles);
    if (state == "fork")
        return Fork();
    if (state == "wait")
        return Wait();
    return Window(state);
}

} // namespace

int main(int argc, char** argv)
{
    const QByteArray state(argc > 1 ? argv[1] : "");
    if (state == "core")
        return Core(argc, argv);

    const QApplication application(argc, argv);
    if (state != "after")
        return WithWidgets(state);
    {
        const QuitOnSignal quitOnSignal;
    }
    return Exec();
}
