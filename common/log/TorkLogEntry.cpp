// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The entries of the log: how one is worded and how it reaches the file, from any thread.

#include "common/log/TorkLog.h"

#include "common/log/TorkLogLock.h"

#include <QDebug>
#include <QMessageLogger>

#include <algorithm>
#include <type_traits>

TorkLog* TorkLog::m_gLog = nullptr;

namespace {

// The stamp that this thread made last: entries come many to a millisecond, and asking for the
// local time costs more than all the rest of an entry. Free of constructors and destructors, so
// that entries may still be written while the program's static objects are destroyed.
struct KeptStamp
{
    quint64 formatGeneration;
    qint64 time;
    int length;
    ushort text[64];
};
static_assert(std::is_trivial<KeptStamp>::value, "lives in thread storage beyond destructors");
thread_local KeptStamp t_stamp;

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
        return QString(QLatin1String(""));
    }
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
    if (m_enabled)
        write(entry(now, severity, message));
    m_lastEntryTime = now;
}

void TorkLog::write(QString const& line)
{
    if (!m_enabled)
        return;

    const QByteArray bytes = line.toLatin1();
    TorkLogLock lock(m_mutex);
    m_writing = 1;
    if (QFile* file = locateLogFile(line)) {
        file->write(bytes);
        file->flush();
        if (m_logPipeToConsole)
            echo(line);
    }
    m_writing = 0;
}

// The lock is held, so that the handler passes the line on to the toolkit's default output.
// Installing it first puts it back in the place of any other, without a moment in which messages
// of other threads would miss the log.
void TorkLog::echo(QString const& line) const
{
    qInstallMessageHandler(TorkLog_MessageHandler);
    QMessageLogger().debug() << line;
}

QString TorkLog::entry(qint64 now, int severity, QString const& message) const
{
    const QLatin1Char blank(' ');
    QString line = stamp(now);
    line.reserve(line.length() + message.length() + 32);
    line += blank;
    line += SeverityText(severity);
    line += blank;
    if (m_logElapsedTime) {
        line += elapsedTime(now);
        line += blank;
    }
    line += message;
    line += QLatin1Char('\n');
    return line;
}

QString TorkLog::stamp(qint64 now) const
{
    if (t_stamp.time == now && t_stamp.formatGeneration == m_formatGeneration)
        return QString(reinterpret_cast<QChar const*>(t_stamp.text), t_stamp.length);

    QString format;
    quint64 generation = 0;
    {
        TorkLogLock lock(m_mutex);
        format = m_dateTimeFormat;
        generation = m_formatGeneration;
    }

    const QString text = QDateTime::fromMSecsSinceEpoch(now).toString(format);
    if (text.length() <= int(std::extent<decltype(t_stamp.text)>::value)) {
        t_stamp.formatGeneration = generation;
        t_stamp.time = now;
        t_stamp.length = text.length();
        std::copy_n(text.utf16(), text.length(), t_stamp.text);
    }
    return text;
}

// Between times of day only: an interval across midnight comes out negative.
QString TorkLog::elapsedTime(qint64 now) const
{
    QString prefix;
    {
        TorkLogLock lock(m_mutex);
        prefix = m_elapsedTimePrefix;
    }
    const QTime last = QDateTime::fromMSecsSinceEpoch(m_lastEntryTime).time();
    const int elapsed = last.msecsTo(QDateTime::fromMSecsSinceEpoch(now).time());
    return prefix + QLatin1Char('[') + QString::number(elapsed) + QLatin1Char(']');
}
