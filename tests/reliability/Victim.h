// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QByteArray>
#include <QString>
#include <QtGlobal>

#include <atomic>

/// The program that logs and saves until it is killed, and what it shares with its killer.
namespace Victim {

/// What the victim reports in shared memory, which outlives it.
struct Report
{
    std::atomic<quint64> running;
    std::atomic<quint64> entryBegun;
    std::atomic<quint64> entryReturned;
    std::atomic<quint64> saveBegun;
    std::atomic<quint64> saveReturned;
};

/// The message of an entry. Most are short; some span several pages of memory, and a few are longer
/// than the file's buffer.
inline QByteArray message(quint64 run, quint64 entry)
{
    const int length = entry % 500 == 499 ? 20000
                       : entry % 50 == 49 ? 5000
                                          : static_cast<int>((run + entry * 7) % 60);
    return '<' + QByteArray::number(run) + '.' + QByteArray::number(entry) + ' ' +
           QByteArray(length, static_cast<char>('a' + entry % 26)) + '>';
}

/// The same as a line of the file; the stamp is set to the letter T.
inline QByteArray line(quint64 run, quint64 entry)
{
    return "T Error " + message(run, entry) + '\n';
}

/// The values of a save.
inline QByteArray filler(quint64 save)
{
    return QByteArray(static_cast<int>(100 + save * 131 % 9000),
                      static_cast<char>('a' + save % 26));
}

/// The configuration file after it.
inline QByteArray configuration(quint64 run, quint64 save)
{
    return "<VelocorSettings>\n<state>\n<version>" + QByteArray::number(run) + '.' +
           QByteArray::number(save) + "</version>\n<filler>" + filler(save) +
           "</filler>\n</state>\n</VelocorSettings>\n";
}

} // namespace Victim
