// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QByteArray>
#include <QDateTime>
#include <QFile>
#include <QHash>
#include <QStringList>
#include <QVector>

#include <algorithm>
#include <random>
#include <sys/stat.h>

/// The random life of a program and its log: restarts that write over the log or rotate it, kills
/// in the middle of an entry, pruned files, clocks that are set back and forth, daylight saving. It
/// notes what it writes.
class ProgramLife
{
public:
    /// What is known about a line.
    struct Line
    {
        int run = 0;
        int number = 0;  ///< counts all lines of the program
        int entry = 0;   ///< the number of the first line of its entry
        qint64 time = 0; ///< of its entry: milliseconds, as the clock showed them then
        bool hasStamp = false;
    };

    /// @param start  in milliseconds since 1970
    ProgramLife(QString const& path, int number, qint64 start, quint32 seed)
        : m_path(path), m_program(QByteArray::number(number)), m_random(seed), m_clock(start)
    {
        static const QStringList formats = {"yyyy-MM-dd hh:mm:ss.zzz", "hh:mm:ss.zzz"};
        m_format = formats[chance(4) ? 1 : 0];
        m_hasOneClock = chance(2);
        m_maximumSize = 500 + below(2000);
        m_maximumFiles = 1 + below(4);
        restart();
    }

    /// The number of messages that differ in more than numbers; 30 by default.
    void setKinds(int kinds) { m_kinds = kinds; }

    QStringList formats() const { return {m_format}; }
    QString const& path() const { return m_path; }
    qint64 clock() const { return m_clock; }

    /// Lets some time pass, in which something happens.
    void step()
    {
        m_clock += below(chance(10) ? 4000000 : 4000);
        const int event = below(30);
        if (event < 2)
            restart();
        else if (event == 2 && !m_hasOneClock)
            setClock();
        else if (event == 3)
            writeTorn();
        else
            writeEntries(1 + below(event == 4 ? 40 : 4));
    }

    /// All lines that are in the files.
    QList<QByteArray> lines() const
    {
        QList<QByteArray> all;
        for (QByteArray const& file : m_files) {
            QList<QByteArray> inFile = file.split('\n');
            if (inFile.last().isEmpty())
                inFile.removeLast();
            all += inFile;
        }
        return all;
    }

    /// A line that was written as a whole and not written over since; null for the rest of one.
    Line const* written(QByteArray const& line) const
    {
        const auto found = m_lines.find(line);
        return found == m_lines.end() ? nullptr : &*found;
    }

    /// Whether the times of a run went back, so that its order may be guessed wrongly. Without
    /// dates they do at midnight.
    bool wentBack(int run) const { return m_wentBack[run] || !isDated(); }

    /// Whether the order of all lines can be seen from the files.
    bool isClear() const
    {
        return isDated() && !m_wentBack.contains(true) && !m_isUnclear &&
               !(m_isQuick && endsAligned());
    }

    /// Whether an entry cannot be taken for one whose last line is left of another.
    bool hasWholeEntries() const { return isClear() && !m_isAligned && !endsAligned(); }

    bool isDated() const { return m_format.startsWith('y'); }
    int runs() const { return m_run + 1; }

    /// Makes the files what they are now.
    void save()
    {
        for (int number = 0; number < m_saved; ++number)
            QFile::remove(name(number));
        m_saved = m_files.size();
        for (int number = 0; number < m_files.size(); ++number) {
            QFile file(name(number));
            if (m_files[number].isNull())
                continue;
            if (!file.open(QIODevice::WriteOnly) ||
                file.write(m_files[number]) != m_files[number].size())
                qFatal("cannot write the log");
            file.setFileTime(QDateTime::fromMSecsSinceEpoch(m_modified[number]),
                             QFileDevice::FileModificationTime);
        }
    }

    /// The same, with another time of modification for each step, by which changes are noticed.
    void save(int step)
    {
        save();
        QFile file(m_path);
        if (!file.exists() || !file.open(QIODevice::ReadWrite))
            return; // the log has been rotated, and nothing written since
        const QDateTime modified = file.fileTime(QFileDevice::FileModificationTime);
        file.setFileTime(modified.addMSecs(step), QFileDevice::FileModificationTime);
    }

private:
    int below(int limit) { return static_cast<int>(m_random() % static_cast<unsigned>(limit)); }
    bool chance(int oneIn) { return below(oneIn) == 0; }
    QString name(int number) const
    {
        return number == 0 ? m_path : m_path + '.' + QString::number(number);
    }

    // What remains begins with a whole line, which is not much older: nothing shows where it
    // begins.
    bool endsAligned() const
    {
        QByteArray const& file = m_files.first();
        return m_position > 0 && m_position < file.size() && m_isLineStart[m_position];
    }

    void restart()
    {
        ++m_run;
        m_wentBack.append(false);
        const bool isAligned = !m_files.isEmpty() && endsAligned();
        m_isAligned = m_isAligned || isAligned;
        m_isUnclear = m_isUnclear || (isAligned && m_isQuick);
        m_isQuick = chance(3);
        m_clock +=
            m_isQuick ? 60000 + below(100000) : 7200000 + below(chance(4) ? 1000000000 : 20000000);
        if (!m_files.isEmpty() && m_files.first().size() + 40 > m_maximumSize)
            rotate();
        m_position = 0;
        const QString format = m_format;
        m_format = "yyyy-MM-dd hh:mm:ss.zzz"; // until the settings are loaded
        for (int entry = below(4); entry > 0; --entry)
            write(entryText());
        m_format = format;
        writeEntries(1);
    }

    void rotate()
    {
        m_files.prepend(QByteArray());
        m_isLineStart.clear();
        m_modified.prepend(m_clock);
        while (m_files.size() > m_maximumFiles + 1) {
            m_files.removeLast();
            m_modified.removeLast();
        }
    }

    void setClock()
    {
        static const QVector<int> seconds = {-3600, 3600, -90, -1, 40, -86400, -5000};
        m_clock += seconds[below(seconds.size())] * qint64(1000);
    }

    QByteArray tag()
    {
        return 'P' + m_program + " L" + QByteArray::number(++m_number) + ' ' +
               QByteArray(below(m_kinds), 'm');
    }

    // An entry of one or more lines, which are noted.
    QByteArray entryText()
    {
        static char const* const severities[] = {"Trace", "Notification", "Warning", "Error"};
        const QDateTime now = QDateTime::fromMSecsSinceEpoch(m_clock);
        const qint64 time = now.date().toJulianDay() * 86400000 + now.time().msecsSinceStartOfDay();
        if (time < m_lastTime)
            m_wentBack[m_run] = true;
        m_lastTime = time;
        const QByteArray stamp = now.toString(m_format).toLatin1();
        QByteArray text = stamp + ' ' + severities[below(4)] + ' ' + tag();
        m_pending = {{text, {m_run, m_number, m_number, time, true}}};
        const int entry = m_number;
        while (chance(6)) {
            const QByteArray line = tag();
            m_pending.append({line, {m_run, m_number, entry, time, false}});
            text += '\n' + line;
        }
        return text + '\n';
    }

    void writeEntries(int count)
    {
        for (; count > 0; --count) {
            m_clock += chance(8) ? below(2000000) : below(3000);
            write(entryText());
        }
    }

    // A kill in the middle of an entry, and the next start.
    void writeTorn()
    {
        const QByteArray text = entryText();
        m_pending.clear();
        m_isUnclear = m_isUnclear || m_isQuick; // what is left may look like the end of this entry
        write(text.left(below(text.size())));
        restart();
    }

    void write(QByteArray const& text)
    {
        if (m_files.isEmpty()) {
            m_files.append(QByteArray());
            m_modified.append(0);
        }
        for (QPair<QByteArray, Line> const& line : m_pending)
            m_lines.insert(line.first, line.second);
        m_pending.clear();
        QByteArray& file = m_files.first();
        const int end = m_position + text.size();
        if (end > file.size()) {
            file.resize(end);
            m_isLineStart.resize(end + 1);
        }
        std::copy(text.begin(), text.end(), file.begin() + m_position);
        for (int at = m_position; at < end; ++at)
            m_isLineStart[at] = at == 0 || file[at - 1] == '\n';
        if (end == file.size() || text.isEmpty())
            m_isLineStart[end] = text.endsWith('\n');
        m_position = end;
        m_modified.first() = m_clock;
    }

    QString m_path;
    QByteArray m_program;
    std::mt19937 m_random;
    QString m_format;
    bool m_hasOneClock = false;
    int m_maximumSize = 0;
    int m_maximumFiles = 0;

    qint64 m_clock;
    qint64 m_lastTime = 0;
    int m_run = -1;
    int m_kinds = 30;
    int m_number = 0;
    int m_position = 0;
    int m_saved = 0;
    bool m_isQuick = false; // the run began soon after the one before
    bool m_isAligned = false;
    bool m_isUnclear = false; // in some file, nothing shows where a run ended
    QVector<bool> m_wentBack;
    QVector<bool> m_isLineStart; // in the current file, also of what is left of old lines
    QList<QByteArray> m_files;   // the current one first
    QVector<qint64> m_modified;
    QVector<QPair<QByteArray, Line>> m_pending;
    QHash<QByteArray, Line> m_lines;
};
