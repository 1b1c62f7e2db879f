// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/logfile/LogMarkFinder.h"

#include "app/logfile/LogLineReader.h"

#include <QSet>

namespace Velocor {

namespace {

// The best line for a mark so far.
struct Candidate
{
    qint64 start = -1;
    int neighbors = -1; // how many are the same; without a line, less than with any
};

class Candidates
{
public:
    explicit Candidates(QVector<LogMark> const& marks) : m_marks(marks), m_best(marks.size())
    {
        for (LogMark const& mark : marks)
            m_lengths.insert(mark.line.left(mark.line.indexOf(':')).toInt());
    }

    // All lines in the order of the file.
    void take(QByteArray const& line, qint64 start)
    {
        const bool isNeeded = m_isOpen || m_lengths.contains(line.size());
        const QByteArray identity = isNeeded ? LogMark::IdentityOf(line) : QByteArray();
        close(identity);
        for (int i = 0; isNeeded && i < m_marks.size(); ++i) {
            const bool isSameLog =
                m_marks.at(i).start / LogSource::LogSize == start / LogSource::LogSize;
            if (isSameLog && m_marks.at(i).line == identity)
                offer(i, start);
        }
        m_above = QByteArray(line.constData(), line.size());
        m_hasAbove = true;
    }

    // The lines so far are those of one log; the next one is of another.
    void endLog()
    {
        close(QByteArray());
        m_hasAbove = false;
    }

    QVector<LogMark> end()
    {
        close(QByteArray());
        QVector<LogMark> marks = m_marks;
        for (int i = 0; i < marks.size(); ++i) {
            marks[i].isFound = m_best.at(i).start >= 0;
            if (marks.at(i).isFound)
                marks[i].start = m_best.at(i).start;
        }
        return marks;
    }

private:
    void offer(int i, qint64 start)
    {
        const QByteArray above = m_hasAbove ? LogMark::IdentityOf(m_above) : QByteArray();
        Candidate candidate;
        candidate.start = start;
        candidate.neighbors = above == m_marks.at(i).above ? 1 : 0;
        m_open.append(qMakePair(i, candidate));
        m_isOpen = true;
    }

    // Compares the lines below.
    void close(QByteArray const& below)
    {
        for (auto const& open : qAsConst(m_open)) {
            Candidate candidate = open.second;
            LogMark const& mark = m_marks.at(open.first);
            candidate.neighbors += below == mark.below ? 1 : 0;
            Candidate& best = m_best[open.first];
            const bool isNearer =
                qAbs(candidate.start - mark.start) < qAbs(best.start - mark.start);
            if (candidate.neighbors > best.neighbors ||
                (candidate.neighbors == best.neighbors && isNearer))
                best = candidate;
        }
        m_open.clear();
        m_isOpen = false;
    }

    QVector<LogMark> m_marks;
    QVector<Candidate> m_best;
    QVector<QPair<int, Candidate>> m_open;
    QSet<int> m_lengths; // of the marked lines: checksums of all others are not needed
    QByteArray m_above;
    bool m_hasAbove = false;
    bool m_isOpen = false;
};

} // namespace

LogMarkFinder::LogMarkFinder(QObject* parent) : QObject(parent)
{
    qRegisterMetaType<QVector<LogMark>>("QVector<Velocor::LogMark>");
    qRegisterMetaType<LogFileType>();
    qRegisterMetaType<LogSource>();
}

void LogMarkFinder::Find(int request, LogSource const& source, QVector<LogMark> const& marks,
                         LogFileType const& type)
{
    Candidates candidates(marks);
    LogLineReader reader;
    const size_t logs = !reader.Open(source, type) ? 0 : source.logs ? source.logs->size() : 1;
    for (size_t log = 0; log < logs; ++log) {
        qint64 start = static_cast<qint64>(log) * LogSource::LogSize;
        while (m_currentRequest <= request) {
            const QByteArray line = reader.Line(start);
            if (reader.nextStart() <= start)
                break;
            candidates.take(line, start);
            start = reader.nextStart();
        }
        candidates.endLog();
    }
    if (m_currentRequest <= request)
        Q_EMIT found(request, candidates.end());
}

} // namespace Velocor
