// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/QuitOnSignal.h"

#include <QApplication>
#include <QSocketNotifier>
#include <QWidget>

#include <cerrno>
#include <csignal>
#include <fcntl.h>
#include <unistd.h>

namespace {

int s_pipe[2] = {-1, -1};

extern "C" {

// Static, for a namespace does not keep the name of a C function from other files.
static void WakeEventLoop(int)
{
    const int savedErrno = errno;
    const char byte = 0;
    const ssize_t written = write(s_pipe[1], &byte, 1);
    static_cast<void>(written); // a full pipe has woken the loop already
    errno = savedErrno;
}

} // extern "C"

void Handle(int signalNumber, void (*handler)(int))
{
    struct sigaction action = {};
    action.sa_handler = handler;
    sigemptyset(&action.sa_mask);
    action.sa_flags = SA_RESTART;
    sigaction(signalNumber, &action, nullptr);
}

void DoNotBlockOrInherit(int file)
{
    fcntl(file, F_SETFL, O_NONBLOCK);
    fcntl(file, F_SETFD, FD_CLOEXEC);
}

bool AnyWindowVisible()
{
    const QWidgetList windows = QApplication::topLevelWidgets();
    for (QWidget* window : windows) {
        if (window->isVisible())
            return true;
    }
    return false;
}

} // namespace

QuitOnSignal::QuitOnSignal(QObject* parent) : QObject(parent)
{
    if (pipe(s_pipe) != 0)
        return;

    DoNotBlockOrInherit(s_pipe[0]);
    DoNotBlockOrInherit(s_pipe[1]);
    m_notifier = new QSocketNotifier(s_pipe[0], QSocketNotifier::Read, this);
    connect(m_notifier, &QSocketNotifier::activated, this, [this] { closeWindows(); });
    Handle(SIGINT, WakeEventLoop);
    Handle(SIGTERM, WakeEventLoop);
}

QuitOnSignal::~QuitOnSignal()
{
    if (!m_notifier)
        return;

    Handle(SIGINT, SIG_DFL);
    Handle(SIGTERM, SIG_DFL);
    close(s_pipe[0]);
    close(s_pipe[1]);
}

void QuitOnSignal::closeWindows()
{
    char byte = 0;
    while (read(s_pipe[0], &byte, 1) == 1) {}

    // A window may refuse, as it may towards its user; without any there is nobody to ask.
    QApplication::closeAllWindows();
    if (!AnyWindowVisible())
        QCoreApplication::quit();
}
