// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The entries of the log: how one is formatted and written to the file, from any thread.

#include "common/log/TorkLog.h"

#include "common/log/TorkEmptyText_p.h"
#include "common/log/TorkLatin1_p.h"
#include "common/log/TorkLogLock_p.h"
#include "common/log/TorkLogStamp_p.h"
#include "common/log/TorkLogWriter_p.h"

#include <QDebug>

#include <algorithm>

namespace {

QString SeverityText(int severity)
{
    switch (severity) {
    case TorkLog::Trace:
        return QObject::tr("Trace");
    case TorkLog::Notification:
        return QObject::tr("Notification");
    case TorkLog::Warning:
        return QObject::tr("Warning");
    case TorkLog::Error:
        return QObject::tr("Error");
    case TorkLog::Fatal:
        return QObject::tr("Fatal");
    default:
        return TorkEmptyText();
    }
}

ushort const* Units(QString const& text)
{
    return reinterpret_cast<ushort const*>(text.constData());
}

void Append(TorkLogLine& line, QString const& text)
{
    line.append(Units(text), text.length());
}

} // namespace

QString& TorkLog::severityName(EventSeverity severity)
{
    m_severityName = SeverityText(severity);
    return m_severityName;
}

void TorkLog::write(int severity, QString const& message)
{
    const qint64 now = QDateTime::currentMSecsSinceEpoch();
    m_lastEntryTime = m_enabled ? writeEntry(now, severity, message) : TorkLogStamp::TimeOfDay(now);
}

// Returns the time of day of `now`.
int TorkLog::writeEntry(qint64 now, int severity, QString const& message)
{
    const ushort blank = ' ';
    TorkLogLine line;
    const int timeOfDay = appendStamp(line, now);
    line.append(blank);
    Append(line, SeverityText(severity));
    line.append(blank);
    if (m_logElapsedTime) {
        Append(line, elapsedTime(timeOfDay));
        line.append(blank);
    }
    Append(line, message);
    line.append('\n');
    writeLine(line.constData(), line.length());
    return timeOfDay;
}

void TorkLog::write(QString const& line)
{
    if (m_enabled)
        writeLine(Units(line), line.length());
}

void TorkLog::writeLine(ushort const* line, int length)
{
    QVarLengthArray<char, 512> bytes(length);
    std::transform(line, line + length, bytes.data(), TorkToLatin1);

    TorkLogLock lock(m_mutex);
    m_writing = 1;
    // A file that is opened for this entry already has room for it.
    const bool wasOpen = m_writer->isOpen();
    const qint64 limit = wasOpen ? qint64(m_maxLogFileSize) : TorkLogWriter::NoLimit;
    if (wasOpen || locate(length)) {
        m_writer->write(bytes.constData(), length, limit);
        if (m_logPipeToConsole)
            echo(QString(reinterpret_cast<QChar const*>(line), length));
    }
    m_writing = 0;
}

// The lock is held, so the handler passes the line on to Qt's default output. Installing it first
// replaces any other handler, without a moment in which messages of other threads would miss the
// log.
void TorkLog::echo(QString const& line) const
{
    qInstallMessageHandler(TorkLog_MessageHandler);
    qDebug() << line;
}

// Returns the time of day of `now`.
int TorkLog::appendStamp(TorkLogLine& line, qint64 now) const
{
    const int timeOfDay = TorkLogStamp::Append(line, now, m_formatGeneration);
    if (timeOfDay >= 0)
        return timeOfDay;

    QString format;
    quint64 generation = 0;
    {
        TorkLogLock lock(m_mutex);
        format = m_dateTimeFormat;
        generation = m_formatGeneration;
    }
    return TorkLogStamp::Make(line, now, format, generation);
}

// The difference between times of day: negative across midnight.
QString TorkLog::elapsedTime(int timeOfDay) const
{
    QString prefix;
    {
        TorkLogLock lock(m_mutex);
        prefix = m_elapsedTimePrefix;
    }
    const int elapsed = timeOfDay - m_lastEntryTime;
    return prefix + QLatin1Char('[') + QString::number(elapsed) + QLatin1Char(']');
}
