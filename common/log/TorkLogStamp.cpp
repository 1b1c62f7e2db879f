// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/log/TorkLogStamp.h"

#include <QDateTime>

#include <algorithm>
#include <ctime>
#include <type_traits>

namespace {

constexpr int Capacity = 64;

// Who words a stamp within the minute: the toolkit, or Fill() where it is known to say the same.
enum Wording : int { NotComparedYet = 0, ByFill, ByToolkit };

// What this thread found out last. Free of constructors and destructors, so that entries may still
// be written while the program's static objects are destroyed.
struct Kept
{
    qint64 minute;
    long zone;
    qint64 offset;
    int year;
    int month;
    int day;
    int hour;
    int minuteOfHour;

    quint64 generation;
    Wording wording;
    int formatLength;
    ushort format[Capacity];

    qint64 stampTime;
    int stampLength;
    ushort stamp[Capacity];
};
static_assert(std::is_trivial<Kept>::value, "outlives all destructors");
thread_local Kept t_kept;

// Changes where the program is moved to another time zone.
long Zone()
{
#ifdef __GLIBC__
    return ::timezone;
#else
    return 0;
#endif
}

// The distance from UTC holds for the whole minute: no time zone changes its clocks within one.
void LookAtClock(Kept& kept, qint64 now)
{
    kept.offset = QDateTime::fromMSecsSinceEpoch(now).offsetFromUtc() * qint64(1000);
    kept.minute = now / 60000;
    kept.zone = Zone();

    const QDateTime time = QDateTime::fromMSecsSinceEpoch(now + kept.offset, Qt::UTC);
    kept.year = time.date().year();
    kept.month = time.date().month();
    kept.day = time.date().day();
    kept.hour = time.time().hour();
    kept.minuteOfHour = time.time().minute();
    kept.wording = kept.offset % 60000 == 0 ? NotComparedYet : ByToolkit;
    kept.stampTime = -1;
}

QString ToolkitStamp(qint64 now, QString const& format)
{
    const bool needsZone = format.contains(QLatin1Char('t'));
    const QDateTime time =
        needsZone ? QDateTime::fromMSecsSinceEpoch(now)
                  : QDateTime::fromMSecsSinceEpoch(TorkLogStamp::wallClock(now), Qt::UTC);
    return time.toString(format);
}

void Keep(Kept& kept, qint64 now, QString const& stamp)
{
    kept.stampTime = now;
    kept.stampLength = stamp.length();
    std::copy_n(stamp.utf16(), stamp.length(), kept.stamp);
}

// Writes `number` with at least `width` digits at `to`; returns the end.
ushort* Digits(ushort* to, int number, int width)
{
    const int length = std::max(width, number > 999 ? 4 : number > 99 ? 3 : number > 9 ? 2 : 1);
    for (int i = length - 1; i >= 0; --i) {
        to[i] = static_cast<ushort>('0' + number % 10);
        number /= 10;
    }
    return to + length;
}

// The number that `count` times `letter` stands for in a format; -1 where it stands for none, or
// where only the toolkit knows.
int Number(Kept const& kept, int ofMinute, ushort letter, int count)
{
    const bool isShort = count <= 2;
    switch (letter) {
    case 'y':
        return count == 4 ? kept.year : -1;
    case 'M':
        return isShort ? kept.month : -1;
    case 'd':
        return isShort ? kept.day : -1;
    case 'h':
    case 'H':
        return isShort ? kept.hour : -1;
    case 'm':
        return isShort ? kept.minuteOfHour : -1;
    case 's':
        return isShort ? ofMinute / 1000 : -1;
    case 'z':
        return count == 1 || count == 3 ? ofMinute % 1000 : -1;
    default:
        return -1;
    }
}

bool IsLetter(ushort character)
{
    return (character >= 'a' && character <= 'z') || (character >= 'A' && character <= 'Z');
}

// Makes the stamp from numbers and what stands between them, for a tenth of the toolkit's work.
// False for all other formats, and `kept.stamp` is then undefined.
bool Fill(Kept& kept, qint64 now)
{
    const int ofMinute = static_cast<int>(now % 60000);
    ushort* to = kept.stamp;
    for (int i = 0; i < kept.formatLength;) {
        const ushort letter = kept.format[i];
        int count = 1;
        while (i + count < kept.formatLength && kept.format[i + count] == letter)
            ++count;
        i += count;

        if (kept.stamp + Capacity - to < std::max(count, 4) || letter == '\'')
            return false;
        const int number = Number(kept, ofMinute, letter, count);
        if (number >= 0)
            to = Digits(to, number, count);
        else if (!IsLetter(letter))
            to = std::fill_n(to, count, letter);
        else
            return false;
    }
    kept.stampTime = now;
    kept.stampLength = static_cast<int>(to - kept.stamp);
    return true;
}

// Fill() is trusted for the rest of a minute for which it once said what the toolkit says.
Wording Compare(Kept& kept, qint64 now, QString const& stamp)
{
    const bool isSame = Fill(kept, now) && stamp.length() == kept.stampLength &&
                        std::equal(kept.stamp, kept.stamp + kept.stampLength, stamp.utf16());
    return isSame ? ByFill : ByToolkit;
}

void AppendAndKeep(TorkLogLine& line, qint64 now, QString const& format)
{
    Kept& kept = t_kept;
    const QString stamp = ToolkitStamp(now, format);
    if (kept.wording == NotComparedYet)
        kept.wording = Compare(kept, now, stamp);
    if (stamp.length() <= Capacity)
        Keep(kept, now, stamp);
    else
        kept.stampTime = -1;
    line.append(stamp.utf16(), stamp.length());
}

} // namespace

qint64 TorkLogStamp::wallClock(qint64 now)
{
    Kept& kept = t_kept;
    if (kept.minute != now / 60000 || kept.zone != Zone())
        LookAtClock(kept, now);
    return now + kept.offset;
}

bool TorkLogStamp::append(TorkLogLine& line, qint64 now, quint64 generation)
{
    Kept& kept = t_kept;
    if (kept.generation != generation)
        return false;

    wallClock(now);
    const bool isKept = kept.stampTime == now || (kept.wording == ByFill && Fill(kept, now));
    if (isKept)
        line.append(kept.stamp, kept.stampLength);
    else
        AppendAndKeep(line, now,
                      QString(reinterpret_cast<QChar const*>(kept.format), kept.formatLength));
    return true;
}

void TorkLogStamp::learn(TorkLogLine& line, qint64 now, QString const& format, quint64 generation)
{
    Kept& kept = t_kept;
    const bool fits = format.length() <= Capacity;
    kept.generation = fits ? generation : 0;
    kept.wording = fits ? NotComparedYet : ByToolkit;
    kept.formatLength = fits ? format.length() : 0;
    std::copy_n(format.utf16(), kept.formatLength, kept.format);
    AppendAndKeep(line, now, format);
}
