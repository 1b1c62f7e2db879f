// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/history/HistoryTime.h"

#include "app/logfile/DayNumber.h"
#include "app/logfile/ForeignStamp.h"
#include "app/logfile/Milliseconds.h"

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
    return ForeignStamp::KeyOfEpoch(QDateTime::currentMSecsSinceEpoch());
}

} // namespace Velocor
