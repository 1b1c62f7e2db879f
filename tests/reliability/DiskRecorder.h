// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QByteArray>
#include <QString>
#include <QVector>
#include <QtGlobal>

/// Records what a program and the processes forked from it do to the files below one folder, in
/// programs that are built with DiskRecorder.cpp. It is between Qt and the C library.
///
/// Only one process and one thread may be using the files at a time.
namespace DiskRecorder {

enum Kind {
    Open,     ///< creates the file, if it is missing and `flags` say so; without a path: unnamed
    Write,    ///< `bytes` at `offset`
    Truncate, ///< to `offset` bytes
    Sync,
    Close,
    Rename, ///< `path` to `target`
    Link,   ///< the open file, or `path` if `file` is 0, to `target`
    Unlink,
    MakeFolder,
    Mark ///< not an operation: `offset` is its number
};

struct Operation
{
    Kind kind = Mark;
    quint64 file = 0; ///< of an open file; unique among all processes, but for one at a time
    int flags = 0;
    qint64 offset = 0;
    QByteArray path; ///< below the folder
    QByteArray target;
    QByteArray bytes;
};

/// Starts a record of this folder, which ends in "/". Unnamed files may be refused, as some file
/// systems do.
void start(QString const& folder, bool hasUnnamedFiles = true);

/// Ends the record and returns it.
QVector<Operation> stop();

/// Adds a mark to the record. Returns the number of operations before it, marks included.
int mark(int number);

/// The process that begins the operation numbered `operation` from now, from 1, is killed before
/// it or, if it writes, after some of its bytes. 0: it lives.
void killAt(int operation, int bytes);

/// From now on only this many bytes can be written; a negative number: any.
void limitBytes(qint64 bytes);

} // namespace DiskRecorder
