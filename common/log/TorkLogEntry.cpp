// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The entries of the log: how one is worded and how it reaches the file, from any thread.

#include "common/log/TorkLog.h"

#include "common/log/TorkLogLock.h"

#include <QDebug>
#include <QMessageLogger>

#include <algorithm>
#include <ctime>
#include <type_traits>

TorkLog* TorkLog::m_gLog = nullptr;

namespace {

// What this thread found out last about the local time and wrote as a time stamp. Entries come many
// to a millisecond, and asking for the local time costs more than all the rest of an entry. Free
// of constructors and destructors, so that entries may still be written while the program's static
// objects are destroyed.
struct KeptTime
{
    qint64 minute;
    long zone;
    qint64 offset;

    quint64 formatGeneration;
    qint64 stampTime;
    int stampLength;
    ushort stamp[64];
};
static_assert(std::is_trivial<KeptTime>::value, "outlives all destructors");
thread_local KeptTime t_kept;

// Changes where the program is moved to another time zone.
long Zone()
{
#ifdef __GLIBC__
    return ::timezone;
#else
    return 0;
#endif
}

// The wall clock's time as milliseconds since an epoch of its own. The distance from UTC holds for
// the whole minute: no time zone changes its clocks within one.
qint64 WallClock(qint64 now)
{
    const qint64 minute = now / 60000;
    if (t_kept.minute != minute || t_kept.zone != Zone()) {
        t_kept.offset = QDateTime::fromMSecsSinceEpoch(now).offsetFromUtc() * qint64(1000);
        t_kept.minute = minute;
        t_kept.zone = Zone();
    }
    return now + t_kept.offset;
}

// Milliseconds since midnight.
int TimeOfDay(qint64 wallClock)
{
    return static_cast<int>(wallClock % (24 * 60 * 60 * 1000));
}

QString Stamp(qint64 now, QString const& format)
{
    const bool needsZone = format.contains(QLatin1Char('t'));
    const QDateTime time = needsZone ? QDateTime::fromMSecsSinceEpoch(now)
                                     : QDateTime::fromMSecsSinceEpoch(WallClock(now), Qt::UTC);
    return time.toString(format);
}

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

qint64 TorkLog::wallClock()
{
    return WallClock(QDateTime::currentMSecsSinceEpoch());
}

void TorkLog::write(int severity, QString const& message)
{
    const qint64 now = QDateTime::currentMSecsSinceEpoch();
    if (m_enabled)
        write(entry(now, severity, message));
    m_lastEntryTime = WallClock(now);
}

void TorkLog::write(QString const& line)
{
    if (!m_enabled)
        return;

    const QByteArray bytes = line.toLatin1();
    TorkLogLock lock(m_mutex);
    m_writing = 1;
    if (QFile* file = locate(line.length())) {
        file->write(bytes);
        m_flushed = file->flush();
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
    QMessageLogger(nullptr, 0, nullptr).debug() << line;
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
    if (t_kept.stampTime == now && t_kept.formatGeneration == m_formatGeneration)
        return QString(reinterpret_cast<QChar const*>(t_kept.stamp), t_kept.stampLength);

    QString format;
    quint64 generation = 0;
    {
        TorkLogLock lock(m_mutex);
        format = m_dateTimeFormat;
        generation = m_formatGeneration;
    }

    const QString text = Stamp(now, format);
    if (text.length() <= int(std::extent<decltype(t_kept.stamp)>::value)) {
        t_kept.formatGeneration = generation;
        t_kept.stampTime = now;
        t_kept.stampLength = text.length();
        std::copy_n(text.utf16(), text.length(), t_kept.stamp);
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
    const int elapsed = TimeOfDay(WallClock(now)) - TimeOfDay(m_lastEntryTime);
    return prefix + QLatin1Char('[') + QString::number(elapsed) + QLatin1Char(']');
}
