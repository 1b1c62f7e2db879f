// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QFile>
#include <QObject>
#include <QTemporaryDir>

class QSocketNotifier;

namespace Velocor {

/// Standard input, or another pipe that the program was started with, as a growing file: what
/// arrives is appended to a temporary file, which is removed with the object.
///
/// Reading never blocks the event loop. The destructor ends the input, so that the writer at the
/// other end of a pipe notices. GUI thread; one object at a time.
class StandardInput : public QObject
{
    Q_OBJECT

public:
    /// @param descriptor  0, or that of the pipe
    explicit StandardInput(int descriptor = 0, QObject* parent = nullptr);
    ~StandardInput() override;

    /// The temporary file, called "Standard input" or "Pipe" and its number; empty if it could not
    /// be created.
    QString path() const;

    /// The descriptor of a pipe that the program was started with, if a path means one, as that of
    /// `<(command)` in a shell does; -1 for any other.
    static int PipeOf(QString const& path);

Q_SIGNALS:
    /// Reading has stopped early: the input cannot be read, or the file cannot be written.
    void failed(QString const& reason);

private:
    void readSome();
    void stop(QString const& reason);

    int m_descriptor;
    QTemporaryDir m_folder;
    QFile m_file;
    QSocketNotifier* m_notifier = nullptr;
};

} // namespace Velocor
