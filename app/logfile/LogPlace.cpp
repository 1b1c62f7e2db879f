// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/logfile/LogPlace.h"

#include "app/logfile/ForeignStamp.h"
#include "app/logfile/LogTimeReader.h"
#include "app/logfile/Milliseconds.h"

#include <QDate>
#include <QObject>
#include <QRegularExpression>

namespace Velocor {

namespace {

// More digits than any file has lines, but few enough for a multiplication by a day.
constexpr int MaximumDigits = 9;

LogPlace Wrong(QString const& error)
{
    LogPlace place;
    place.error = error;
    return place;
}

LogPlace Right(LogPlace::Kind kind, qint64 value)
{
    LogPlace place;
    place.kind = kind;
    place.value = value;
    return place;
}

LogPlace LineAt(QString const& digits)
{
    if (digits.size() > MaximumDigits)
        return Wrong(QObject::tr("No file has so many lines."));
    const qint64 number = digits.toLongLong();
    return number > 0 ? Right(LogPlace::Line, number) : Wrong(QObject::tr("The first line is 1."));
}

LogPlace IntervalOf(QRegularExpressionMatch const& match)
{
    const QString digits = match.captured(2);
    const QString unit = match.captured(3);
    if (unit.isEmpty())
        return Wrong(QObject::tr("Add a unit: %1s, %1m, %1h or %1d.").arg(match.captured(0)));
    if (digits.size() > MaximumDigits)
        return Wrong(QObject::tr("The interval is too long."));
    qint64 factor = 1;
    if (unit == QLatin1String("s"))
        factor = Milliseconds::Second;
    else if (unit == QLatin1String("m"))
        factor = Milliseconds::Minute;
    else if (unit == QLatin1String("h"))
        factor = Milliseconds::Hour;
    else if (unit == QLatin1String("d"))
        factor = Milliseconds::Day;
    const qint64 value = digits.toLongLong() * factor;
    return Right(LogPlace::Interval, match.captured(1) == QLatin1String("-") ? -value : value);
}

// `match` has hour, minute, second and fraction as its groups from `group` on.
LogPlace TimeOf(QRegularExpressionMatch const& match, int group)
{
    const int hour = match.captured(group).toInt();
    const int minute = match.captured(group + 1).toInt();
    const int second = match.captured(group + 2).toInt();
    const QString fraction = match.captured(group + 3).leftJustified(3, QLatin1Char('0'), true);
    if (hour > 23)
        return Wrong(QObject::tr("The hours go up to 23."));
    if (minute > 59)
        return Wrong(QObject::tr("The minutes go up to 59."));
    if (second > 59)
        return Wrong(QObject::tr("The seconds go up to 59."));
    return Right(LogPlace::Time, hour * Milliseconds::Hour + minute * Milliseconds::Minute +
                                     second * Milliseconds::Second + fraction.toInt());
}

LogPlace DateTimeOf(QRegularExpressionMatch const& match)
{
    const QString date = match.captured(1);
    if (!QDate::fromString(date, Qt::ISODate).isValid())
        return Wrong(QObject::tr("There is no such day."));
    const LogPlace time = TimeOf(match, 2);
    if (time.kind == LogPlace::Invalid)
        return time;
    // The reader's own count of days.
    static const LogTimeReader reader(QStringLiteral("yyyy-MM-dd hh:mm"));
    const QByteArray midnight = date.toLatin1() + " 00:00";
    return Right(LogPlace::DateTime,
                 reader.Read(midnight.constData(), midnight.size()).key + time.value);
}

// A time stamp as another program writes it, copied from its log.
LogPlace StampIn(QString const& text)
{
    const QByteArray bytes = text.toLatin1();
    const ForeignStamp stamp =
        ForeignStamp::Read(bytes.constData(), bytes.size(), QDate::currentDate());
    const bool isAll = stamp.length > 0 && stamp.length == bytes.size();
    return isAll && stamp.hasDate ? Right(LogPlace::DateTime, stamp.key) : LogPlace();
}

} // namespace

LogPlace LogPlace::Parse(QString const& text)
{
    static const QRegularExpression line(QStringLiteral("^[0-9]+$"));
    static const QRegularExpression interval(QStringLiteral("^([+-]) ?([0-9]+) ?(ms|s|m|h|d|)$"));
    const QString timePattern =
        QStringLiteral("([0-9]{1,2}):([0-9]{2})(?::([0-9]{2})(?:[.,]([0-9]{1,9}))?)?");
    static const QRegularExpression time(QLatin1Char('^') + timePattern + QLatin1Char('$'));
    static const QRegularExpression dateTime(
        QStringLiteral("^([0-9]{4}-[0-9]{2}-[0-9]{2})(?:(?: +|T)%1)?$").arg(timePattern));

    const QString typed = text.trimmed();
    if (typed.isEmpty())
        return LogPlace();
    if (line.match(typed).hasMatch())
        return LineAt(typed);
    QRegularExpressionMatch match = interval.match(typed);
    if (match.hasMatch())
        return IntervalOf(match);
    match = time.match(typed);
    if (match.hasMatch())
        return TimeOf(match, 1);
    match = dateTime.match(typed);
    if (match.hasMatch())
        return DateTimeOf(match);
    const LogPlace stamp = StampIn(typed);
    if (stamp.kind != Invalid)
        return stamp;
    return Wrong(QObject::tr("Neither a line number nor a time."));
}

} // namespace Velocor
