// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QObject>

class QSocketNotifier;

/// Ends the program on SIGINT, SIGTERM and SIGHUP as its user would: by closing its windows.
///
/// The first signal closes all windows, which save their state and may ask about unsaved work; a
/// window that refuses keeps the program running. The exit code is that of a normal quit. If an
/// event loop of a box runs before QCoreApplication::exec(), the box is closed and the program ends
/// as soon as exec() starts. A box that does not let itself be closed is waited for. Without a
/// QApplication there are no windows to close, and the event loop just quits.
///
/// The second signal ends the program at once, by that signal's default effect, even if its event
/// loop is stuck: nobody is asked and no state is saved. Parent processes and terminals often send
/// one request twice, so signals that follow the first within a tenth of a second belong to it.
///
/// A signal that the parent process set to be ignored (nohup, trap '' INT) stays ignored. Child
/// processes do not inherit anything: not the pipe, and until they start a program of their own,
/// a signal has its default effect on them.
///
/// A signal handler may do next to nothing, so it only writes a byte into a pipe; the event loop
/// does the rest. One object at a time, on the main thread, made after the application object.
/// Its destructor puts the previous effects back. If there is no pipe to be had, signals keep their
/// default effect.
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
