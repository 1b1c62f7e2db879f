// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/log/TorkLogStamp_p.h"

#include "common/TorkQt_p.h"
#include "common/log/TorkLogLock_p.h"

#include <QDateTime>
#include <QLocale>

#include <algorithm>
#include <type_traits>

namespace {

constexpr int Capacity = 64;

// What this thread found out last. Without constructors and destructors, so that entries may still
// be written while the program's static objects are destroyed.
struct Kept
{
    bool isSet; // all zeros are a moment, too: the first of 1970
    qint64 now;
    int zoneLength; // -1: TZ is not set
    char zone[Capacity];
    int timeOfDay;

    quint64 generation; // 0: no stamp
    int stampLength;
    ushort stamp[Capacity];
};
static_assert(std::is_trivial<Kept>::value, "outlives all destructors");
thread_local Kept t_kept;

// Not getenv(): other threads may be setting variables with qputenv().
QByteArray Zone()
{
    return qgetenv("TZ");
}

// An empty TZ is UTC; without TZ it is the system's time zone.
int LengthOf(QByteArray const& zone)
{
    return zone.isNull() ? -1 : zone.size();
}

bool IsKept(qint64 now)
{
    Kept const& kept = t_kept;
    if (!kept.isSet || kept.now != now)
        return false;

    const QByteArray zone = Zone();
    return kept.zoneLength == LengthOf(zone) && std::equal(zone.cbegin(), zone.cend(), kept.zone);
}

// Without a stamp so far. A longer time zone than usual is not kept.
void Keep(QDateTime const& time, qint64 now, QByteArray const& zone)
{
    Kept& kept = t_kept;
    kept.isSet = zone.size() <= Capacity;
    kept.now = now;
    kept.zoneLength = LengthOf(zone);
    if (kept.isSet)
        std::copy(zone.cbegin(), zone.cend(), kept.zone);
    kept.timeOfDay = time.time().msecsSinceStartOfDay();
    kept.generation = 0;
}

void KeepStamp(QString const& stamp, quint64 generation)
{
    if (stamp.length() > Capacity)
        return;
    Kept& kept = t_kept;
    kept.generation = generation;
    kept.stampLength = stamp.length();
    std::copy_n(stamp.utf16(), stamp.length(), kept.stamp);
}

bool IsLatin1(QString const& text)
{
    return std::all_of(text.cbegin(), text.cend(),
                       [](QChar character) { return character.unicode() <= 0xff; });
}

// In some languages the digits are beyond Latin-1, and a whole stamp would be question marks.
QString Stamp(QDateTime const& time, QString const& format)
{
    const QString stamp = TorkQt::DateText(time, format);
    return IsLatin1(stamp) ? stamp : QLocale::c().toString(time, format);
}

} // namespace

int TorkLogStamp::TimeOfDay(qint64 now)
{
    TorkLogLock lock(Mutex());
    if (!IsKept(now)) {
        const QByteArray zone = Zone();
        Keep(QDateTime::fromMSecsSinceEpoch(now), now, zone);
    }
    return t_kept.timeOfDay;
}

int TorkLogStamp::Append(TorkLogLine& line, qint64 now, quint64 generation)
{
    TorkLogLock lock(Mutex());
    Kept const& kept = t_kept;
    if (kept.generation != generation || !IsKept(now))
        return -1;
    line.append(kept.stamp, kept.stampLength);
    return kept.timeOfDay;
}

int TorkLogStamp::Make(TorkLogLine& line, qint64 now, QString const& format, quint64 generation)
{
    TorkLogLock lock(Mutex());
    const QByteArray zone = Zone();
    const QDateTime time = QDateTime::fromMSecsSinceEpoch(now);
    const QString stamp = Stamp(time, format);
    line.append(stamp.utf16(), stamp.length());
    Keep(time, now, zone);
    KeepStamp(stamp, generation);
    return t_kept.timeOfDay;
}

QMutex& TorkLogStamp::Mutex()
{
    // Never deleted: static objects may still write entries while they are destroyed.
    static QMutex& mutex = *new QMutex;
    return mutex;
}
