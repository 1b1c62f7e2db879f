// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QString>
#include <QtGlobal>

/// Makes the system's file calls fail on request, in programs that are built with FaultyFiles.cpp.
///
/// It stands between the toolkit and the C library and counts the calls that concern one folder.
/// Calls on anything else, and all calls while no fault is set, go straight through. One thread at
/// a time.
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
    void failAt(int step, Duration duration, int error);

    /// The same for the calls that write: that one takes over only the first half of its bytes.
    void cutShortAt(int step);

    /// From now on takes only this many bytes; then the disk is full.
    void limitBytes(qint64 bytes);

    /// Puts an end to the fault; the last one can still be asked for.
    void mend();

    /// Whether the fault came about.
    bool reached() const;

    /// Whether a file outside the folder was opened for writing meanwhile.
    bool strayed() const;

    /// The first call that failed: its name in the C library, and the path it was about.
    QString call() const;
    QString path() const;
};
