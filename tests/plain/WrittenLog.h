// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "plain/Program.h"

#include <QDate>
#include <QTime>

/// A log file as the runs of a program write it: from the start, over what is there.
class WrittenLog : public Program::Pair
{
protected:
    /// Of any moment from March 2025 on, to the millisecond.
    QByteArray stamp() const
    {
        const QTime clock = QTime::fromMSecsSinceStartOfDay(int(m_time % Day));
        if (!m_isDated)
            return clock.toString("hh-mm-ss,zzz").toLatin1();
        const QDate date = QDate(2025, 3, 1).addDays(m_time / Day);
        return (date.toString("yyyy-MM-dd") + ' ' + clock.toString("hh:mm:ss.zzz")).toLatin1();
    }

    /// An entry some milliseconds after the last one, of any severity or none.
    QByteArray entry(qint64 step, QByteArray const& message)
    {
        static char const* const severities[] = {"Trace", "Notification", "Warning",
                                                 "Error", "Fatal",        ""};
        m_time += step;
        return stamp() + ' ' + m_draws->oneOf(severities) + ' ' + message + '\n';
    }

    void write(QByteArray const& bytes)
    {
        tell("write(#)", bytes);
        writeMany(bytes, 1);
    }

    void writeMany(QByteArray const& bytes, int times)
    {
        const QByteArray all = bytes.repeated(times);
        m_file.replace(m_position, all.size(), all);
        m_position += all.size();
    }

    static constexpr qint64 Day = 86400000; // milliseconds

    QByteArray m_file;
    int m_position = 0;
    qint64 m_time = Day / 3; // since the first day
    bool m_isDated = true;
};
