// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QObject>

class QSocketNotifier;

/// Ends the program on SIGINT and SIGTERM as its user would: by closing its windows.
///
/// A signal handler may do next to nothing, so it only writes a byte into a pipe; the event loop
/// does the rest. The exit code is that of a normal quit. One object at a time, on the main
/// thread; where pipes cannot be had, signals keep their default effect.
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
    void closeWindows();

    QSocketNotifier* m_notifier = nullptr;
};
