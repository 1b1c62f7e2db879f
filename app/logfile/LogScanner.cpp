// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/logfile/LogScanner.h"

#include <QFile>
#include <QFileInfo>

#include <algorithm>

namespace Velocor {

namespace {

constexpr int SliceSize = 1 << 20;
constexpr int HeadSize = 256;
constexpr int AnchorSize = 256;

// Within this time, two changes may have the same modification time.
constexpr qint64 StampUncertainty = 2000; // milliseconds

QByteArray BytesAt(QFile& file, qint64 offset, qint64 count)
{
    return file.seek(offset) ? file.read(count) : QByteArray();
}

// Why a file could not be opened; empty if it does not exist.
QString ErrorOf(QFile const& file)
{
    const QFileInfo info(file.fileName());
    if (!info.exists())
        return QString();
    return info.isFile() ? file.errorString() : QObject::tr("Not a regular file");
}

} // namespace

LogScanner::LogScanner(QObject* parent) : QObject(parent), m_rows(std::make_shared<LogRows>())
{
    qRegisterMetaType<LogUpdate>();
    qRegisterMetaType<LogFilter>();
    qRegisterMetaType<LogLineParser>();
}

void LogScanner::Open(int request, QString const& path, LogLineParser const& parser,
                      LogFilter const& filter)
{
    m_request = request;
    m_path = path;
    m_parser = parser;
    m_filter = filter;
    if (isCurrentRequest())
        readFromStart();
}

void LogScanner::SetFilter(int request, LogFilter const& filter)
{
    const bool sameText = filter.HasSameText(m_filter);
    m_request = request;
    m_filter = filter;
    if (!isCurrentRequest())
        m_complete = m_complete && sameText; // the text has not been searched for yet
    else if (sameText && m_complete)
        report(true);
    else
        readFromStart();
}

void LogScanner::startOver()
{
    m_index = LogIndex(m_parser, m_filter);
    m_rows = std::make_shared<LogRows>();
    m_head.clear();
    m_anchor.clear();
    m_size = 0;
    m_modified = QDateTime();
    m_complete = false;
}

void LogScanner::readFromStart()
{
    startOver();
    QFile file(m_path);
    if (!QFileInfo(m_path).isFile() || !file.open(QIODevice::ReadOnly)) {
        m_error = ErrorOf(file);
        reportMissing();
        return;
    }
    m_exists = true;
    m_error.clear();
    if (readFrom(file, m_index.Begin()))
        report(true);
}

void LogScanner::reportMissing()
{
    startOver();
    m_exists = false;
    m_complete = true;
    report(true);
}

// Returns false if a newer request has arrived.
bool LogScanner::readFrom(QFile& file, qint64 offset)
{
    m_modified = QFileInfo(m_path).lastModified();
    const qint64 size = file.size();
    QByteArray slice(SliceSize, Qt::Uninitialized);
    bool more = file.seek(offset);
    int reported = 0;
    while (more) {
        if (!isCurrentRequest())
            return false;
        const qint64 count = file.read(slice.data(), slice.size());
        if (count <= 0)
            break;
        more = m_index.Feed(slice.constData(), static_cast<int>(count));
        const int percent = size > 0 ? static_cast<int>(file.pos() * 100 / size) : 100;
        if (percent >= reported + 10) {
            reported = percent;
            Q_EMIT progressed(m_request, percent);
        }
    }
    m_index.End();
    m_complete = true;
    noteFile(file);
    return true;
}

void LogScanner::noteFile(QFile& file)
{
    m_size = file.size();
    m_anchorEnd = m_index.resumeOffset();
    m_head = BytesAt(file, 0, std::min<qint64>(HeadSize, m_anchorEnd));
    const qint64 start = std::max<qint64>(0, m_anchorEnd - AnchorSize);
    m_anchor = BytesAt(file, start, m_anchorEnd - start);
}

bool LogScanner::isSameFile(QFile& file) const
{
    if (file.size() < m_size || !BytesAt(file, 0, HeadSize).startsWith(m_head))
        return false;
    return BytesAt(file, m_anchorEnd - m_anchor.size(), m_anchor.size()) == m_anchor;
}

bool LogScanner::looksUnchanged() const
{
    const QFileInfo file(m_path);
    if (!file.isFile())
        return !m_exists;
    if (!m_exists || file.size() != m_size || file.lastModified() != m_modified)
        return false;
    return qAbs(m_modified.msecsTo(QDateTime::currentDateTime())) > StampUncertainty;
}

void LogScanner::Poll()
{
    if (m_path.isEmpty() || !isCurrentRequest() || (m_complete && looksUnchanged())) {
        Q_EMIT polled();
        return;
    }

    QFile file(m_path);
    const bool opened = QFileInfo(m_path).isFile() && file.open(QIODevice::ReadOnly);
    if (!opened && (m_exists || !m_complete)) {
        m_error = ErrorOf(file);
        reportMissing();
    } else if (opened && (!m_complete || !m_exists || !isSameFile(file))) {
        readFromStart();
    } else if (opened) {
        readOn(file);
    }
    Q_EMIT polled(); // NOLINT(readability-misleading-indentation): Q_EMIT is empty
}

// Reads what is new. Growth while older runs are left, or a change without anything new, is by
// entries that the index takes for those of an older run, and is found by reading everything again.
void LogScanner::readOn(QFile& file)
{
    m_complete = false; // until the pass is over
    const QDateTime modified = m_modified;
    const bool hasGrown = file.size() != m_size;
    if (hasGrown && m_index.runs() > 1)
        m_index = LogIndex(m_parser, m_filter);
    if (!readFrom(file, m_index.Begin()) || report(false))
        return;

    if (!hasGrown && m_modified != modified) {
        m_complete = false;
        m_index = LogIndex(m_parser, m_filter);
        if (readFrom(file, m_index.Begin()))
            report(false);
    }
}

// Returns whether anything is new.
bool LogScanner::report(bool isReset)
{
    LogUpdate update;
    update.request = m_request;
    update.rows = std::make_shared<LogRows>(m_index.Rows(m_filter));
    if (!isReset)
        update.Compare(*m_rows);
    const bool nothingNew = !update.isReset && update.removed == 0 && update.inserted == 0 &&
                            update.changedTail == 0 && update.rows->size() == m_rows->size() &&
                            m_index.size() == m_lines;
    m_rows = update.rows;
    m_lines = m_index.size();
    update.exists = m_exists;
    update.error = m_error;
    update.lines = m_lines;
    update.hasElapsed = m_index.hasElapsed();
    if (!nothingNew)
        Q_EMIT updated(update);
    return !nothingNew;
}

} // namespace Velocor
