// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/history/HistoryTime.h"

#include "app/logfile/DayNumber.h"
#include "app/logfile/ForeignStamp.h"
#include "app/logfile/LogPlace.h"
#include "app/logfile/Milliseconds.h"

#include <cstdio>

namespace Velocor {

QDateTime HistoryTime::DateTime(qint64 time)
{
    if (time < 0)
        return QDateTime();
    const QDate known(2000, 1, 1);
    const qint64 days = time / Milliseconds::Day - DayNumber(2000, 1, 1);
    const auto timeOfDay = static_cast<int>(time % Milliseconds::Day);
    return QDateTime(known.addDays(days), QTime::fromMSecsSinceStartOfDay(timeOfDay), Qt::UTC);
}

qint64 HistoryTime::Now()
{
    return OfEpoch(QDateTime::currentMSecsSinceEpoch());
}

qint64 HistoryTime::OfEpoch(qint64 milliseconds)
{
    return ForeignStamp::KeyOfEpoch(milliseconds);
}

qint64 HistoryTime::OfUser(QString const& text, qint64 now)
{
    const LogPlace place = LogPlace::Parse(text);
    switch (place.kind) {
    case LogPlace::DateTime:
        return place.value;
    case LogPlace::Time:
        return now - now % Milliseconds::Day + place.value;
    case LogPlace::Interval:
        return qMax<qint64>(0, now + place.value);
    default:
        return -1;
    }
}

QByteArray HistoryTime::Text(qint64 time)
{
    const QDateTime moment = DateTime(time);
    const QDate date = moment.date();
    const QTime timeOfDay = moment.time();
    char text[64];
    const int length = std::snprintf(text, sizeof text, "%04d-%02d-%02dT%02d:%02d:%02d.%03d",
                                     date.year(), date.month(), date.day(), timeOfDay.hour(),
                                     timeOfDay.minute(), timeOfDay.second(), timeOfDay.msec());
    return QByteArray(text, length);
}

qint64 HistoryTime::FromText(QByteArray const& text)
{
    const LogPlace place = LogPlace::Parse(QString::fromLatin1(text));
    return place.kind == LogPlace::DateTime ? place.value : -1;
}

} // namespace Velocor
