// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QFile>
#include <QObject>
#include <QTemporaryDir>

class QSocketNotifier;

namespace Velocor {

/// Standard input as a growing file: what arrives is appended to a temporary file, which is removed
/// with the object.
///
/// Reading never blocks the event loop. The destructor ends the input, so that the writer at the
/// other end of a pipe notices. GUI thread; one object at a time.
class StandardInput : public QObject
{
    Q_OBJECT

public:
    explicit StandardInput(QObject* parent = nullptr);
    ~StandardInput() override;

    /// The temporary file, called "Standard input"; empty if it could not be created.
    QString path() const;

Q_SIGNALS:
    /// Reading has stopped early: the input cannot be read, or the file cannot be written.
    void failed(QString const& reason);

private:
    void readSome();
    void stop(QString const& reason);

    QTemporaryDir m_folder;
    QFile m_file;
    QSocketNotifier* m_notifier = nullptr;
};

} // namespace Velocor
