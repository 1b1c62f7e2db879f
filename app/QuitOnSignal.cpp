// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/QuitOnSignal.h"

#include <QApplication>
#include <QSocketNotifier>
#include <QTimer>
#include <QWidget>

#include <atomic>
#include <cerrno>
#include <csignal>
#include <ctime>
#include <fcntl.h>
#include <unistd.h>

namespace {

constexpr int Signals[] = {SIGINT, SIGTERM, SIGHUP};
constexpr int SignalCount = sizeof(Signals) / sizeof(Signals[0]);
constexpr long long None = -1;
constexpr long long OneRequest = 100; // milliseconds
constexpr int BoxInterval = 50;       // milliseconds

int s_pipe[2] = {-1, -1};
pid_t s_process = 0;
struct sigaction s_before[SignalCount];

std::atomic<long long> s_firstSignal{None}; // its time in milliseconds
static_assert(ATOMIC_LLONG_LOCK_FREE == 2, "used by a signal handler");

long long Milliseconds()
{
    timespec now = {};
    clock_gettime(CLOCK_MONOTONIC, &now);
    return now.tv_sec * 1000LL + now.tv_nsec / 1000000;
}

void Handle(int signalNumber, void (*handler)(int))
{
    struct sigaction action = {};
    action.sa_handler = handler;
    sigemptyset(&action.sa_mask);
    for (int other : Signals)
        sigaddset(&action.sa_mask, other);
    action.sa_flags = SA_RESTART;
    sigaction(signalNumber, &action, nullptr);
}

void WakeEventLoop()
{
    const char byte = 0;
    const ssize_t written = write(s_pipe[1], &byte, 1);
    static_cast<void>(written); // if the pipe is full, the loop wakes anyway
}

// Takes effect when the handler returns: until then the signal is blocked.
void DieOf(int signalNumber)
{
    Handle(signalNumber, SIG_DFL);
    raise(signalNumber);
}

extern "C" {

// Static, because a namespace does not hide the name of a C function from other files.
static void QuitOnSignalHandler(int signalNumber)
{
    const int savedErrno = errno;
    const long long now = Milliseconds();
    long long first = None;
    // A forked child shares the pipe, but its signals are not for the parent.
    const bool isForked = getpid() != s_process;
    if (!isForked && s_firstSignal.compare_exchange_strong(first, now))
        WakeEventLoop();
    else if (isForked || now - first >= OneRequest)
        DieOf(signalNumber);
    errno = savedErrno;
}

} // extern "C"

bool IsIgnored(struct sigaction const& action)
{
    return action.sa_handler == SIG_IGN;
}

void DoNotBlockOrInherit(int file)
{
    fcntl(file, F_SETFL, O_NONBLOCK);
    fcntl(file, F_SETFD, FD_CLOEXEC);
}

bool HasWidgets()
{
    return qobject_cast<QApplication*>(QCoreApplication::instance()) != nullptr;
}

bool IsBoxOpen()
{
    return HasWidgets() && QApplication::activeModalWidget();
}

// Returns false if a window refused to close.
bool CloseWindows()
{
    if (!HasWidgets())
        return true;
    QApplication::closeAllWindows();
    const QWidgetList windows = QApplication::topLevelWidgets();
    for (QWidget const* window : windows) {
        if (window->isVisible())
            return false;
    }
    return true;
}

} // namespace

QuitOnSignal::QuitOnSignal(QObject* parent) : QObject(parent)
{
    if (pipe(s_pipe) != 0)
        return;

    DoNotBlockOrInherit(s_pipe[0]);
    DoNotBlockOrInherit(s_pipe[1]);
    m_notifier = new QSocketNotifier(s_pipe[0], QSocketNotifier::Read, this);
    connect(m_notifier, &QSocketNotifier::activated, this, [this] { takeSignal(); });

    s_process = getpid();
    s_firstSignal = None;
    for (int i = 0; i < SignalCount; ++i) {
        sigaction(Signals[i], nullptr, &s_before[i]);
        if (!IsIgnored(s_before[i]))
            Handle(Signals[i], QuitOnSignalHandler);
    }
}

QuitOnSignal::~QuitOnSignal()
{
    if (!m_notifier)
        return;

    for (int i = 0; i < SignalCount; ++i)
        sigaction(Signals[i], &s_before[i], nullptr);
    close(s_pipe[0]);
    close(s_pipe[1]);
}

void QuitOnSignal::takeSignal()
{
    char byte = 0;
    while (read(s_pipe[0], &byte, 1) == 1) {}
    endProgram();
}

void QuitOnSignal::endProgram()
{
    const bool boxWasOpen = IsBoxOpen();
    if (CloseWindows()) {
        QCoreApplication::quit();
        // Before exec(), that only ended the loop of a message box. After exec(), this never runs.
        QTimer::singleShot(0, this, &QuitOnSignal::endProgram);
    } else if (boxWasOpen) {
        // It blocked the other windows, or belongs to a window that is about to close.
        QTimer::singleShot(BoxInterval, this, &QuitOnSignal::endProgramAfterBox);
    }
}

void QuitOnSignal::endProgramAfterBox()
{
    if (IsBoxOpen())
        QTimer::singleShot(BoxInterval, this, &QuitOnSignal::endProgramAfterBox);
    else
        endProgram();
}
