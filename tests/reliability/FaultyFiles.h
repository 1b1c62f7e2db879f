// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QString>
#include <QtGlobal>

#include <functional>

/// Makes the system's file calls fail on request, in programs that are built with FaultyFiles.cpp.
///
/// It is between Qt and the C library and counts the calls that concern one folder. Calls on
/// anything else, and all calls while no fault is set, are forwarded. One thread at a time.
///
///     for (int step = 1;; ++step) {
///         FaultyFiles files(folder);
///         files.failAt(step, FaultyFiles::Once, EIO);
///         log.write("x\n");
///         if (!files.reached())
///             break; // it takes fewer calls
///     }
class FaultyFiles
{
public:
    enum Duration { Once, FromThereOn };

    /// Watches all files below a folder that are opened from now on.
    explicit FaultyFiles(QString const& folder);
    ~FaultyFiles();

    Q_DISABLE_COPY(FaultyFiles)

    /// From now on counts the calls; the one numbered `step`, from 1, fails with this error.
    ///
    /// @param call  counts only those of this name in the C library; null for all. All calls that
    ///              ask for the status of a file are named "stat".
    void failAt(int step, Duration duration, int error, char const* call = nullptr);

    /// Does something, once, right before the call numbered `step`, from 1, of this name, as
    /// another program might. The file calls of `action` itself are not counted.
    void before(char const* call, int step, std::function<void()> const& action);

    /// The same for the calls that write: that one accepts only the first half of its bytes.
    void cutShortAt(int step);

    /// From now on accepts only this many bytes; then the disk is full.
    void limitBytes(qint64 bytes);

    /// Clears the fault; the last one can still be queried.
    void mend();

    /// Whether the fault occurred.
    bool reached() const;

    /// Whether a file outside the folder was opened for writing in the meantime.
    bool strayed() const;

    /// The first call that failed: its name in the C library, and its path.
    QString call() const;
    QString path() const;
};
