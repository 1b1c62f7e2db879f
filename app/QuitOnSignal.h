// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QObject>

class QSocketNotifier;

/// Quits on SIGINT, SIGTERM and SIGHUP as the user would: by closing all windows.
///
/// The first signal closes all windows, which save their state and may ask about unsaved work; a
/// window that refuses keeps the program running. The exit code is that of a normal quit. If a
/// message box is open before QCoreApplication::exec(), it is closed and the program ends as soon
/// as exec() starts. A box that cannot be closed is waited for. Without a QApplication there are no
/// windows to close, and the event loop just quits.
///
/// A second signal ends the program immediately, by the default action of that signal, even if the
/// event loop is blocked: nothing is asked or saved. Parent processes and terminals often send one
/// request twice, so signals within a tenth of a second of the first count as the same request.
///
/// A signal that the parent process set to be ignored (nohup, trap '' INT) stays ignored. Child
/// processes do not inherit the pipe, and in a forked child that has not called exec() yet, a
/// signal has its default action.
///
/// The signal handler only writes a byte into a pipe, which is async-signal-safe; the event loop
/// does the rest. One object at a time, on the main thread, created after the application object.
/// The destructor restores the previous handlers. If no pipe can be created, signals keep their
/// default action.
///
///     QApplication app(argc, argv);
///     QuitOnSignal quitOnSignal;
class QuitOnSignal : public QObject
{
    Q_OBJECT

public:
    explicit QuitOnSignal(QObject* parent = nullptr);
    ~QuitOnSignal() override;

private:
    void takeSignal();
    void endProgram();
    void endProgramAfterBox();

    QSocketNotifier* m_notifier = nullptr;
};
