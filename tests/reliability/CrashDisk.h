// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "reliability/DiskRecorder.h"

#include <QByteArray>
#include <QMap>
#include <QSet>
#include <QVector>

#include <random>

/// A disk to which a record of operations is applied, and what a crash leaves of it.
class CrashDisk
{
public:
    /// How the record ends.
    enum Crash {
        Killed,      ///< the programs are killed: all that the system was given stays
        PowerCut,    ///< what was not synced may be missing; changes of folders keep their order
        AnyOrderCut, ///< and changes of folders do not
    };

    struct File
    {
        int node = 0; ///< two names of one file have the same
        QByteArray content;
    };

    /// By path below the folder.
    struct State
    {
        QMap<QByteArray, File> files;
        QSet<QByteArray> folders;
    };

    /// @param base  what is on the disk before the first operation
    CrashDisk(State const& base, QVector<DiskRecorder::Operation> const& record);

    /// What may be on the disk if the crash comes before the operation numbered `end`, from 0; a
    /// kill may come in the middle of it. With the same generator, the same state.
    State stateAt(int end, Crash crash, std::mt19937& random) const;

    /// How many states differ in what was not synced at that moment.
    int openOperations(int end) const;

private:
    // An operation that knows which file it concerns.
    struct Step
    {
        DiskRecorder::Kind kind = DiskRecorder::Mark;
        int node = 0;
        qint64 offset = 0;
        QByteArray path; // of a synced folder, too
        QByteArray target;
        QByteArray bytes;
    };

    static QByteArray folderOf(QByteArray const& path);
    static bool isNaming(Step const& step);
    static void name(State& state, Step const& step);
    bool isSynced(int step, int end) const;
    QByteArray contentAt(int node, int end, Crash crash, std::mt19937& random) const;

    State m_base;
    QMap<int, QByteArray> m_contents; // of the base, by node
    QVector<Step> m_steps;
};
