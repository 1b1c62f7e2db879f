// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/SpanText.h"

#include "app/logfile/Milliseconds.h"

#include <QCoreApplication>
#include <QLocale>

namespace Velocor {

namespace {

struct Spans
{
    Q_DECLARE_TR_FUNCTIONS(SpanText)
};

QString Number(qint64 value)
{
    return QLocale().toString(value);
}

QString TwoDigits(qint64 value)
{
    return value < 10 ? QLocale().toString(0) + Number(value) : Number(value);
}

QString Seconds(qint64 span)
{
    if (span % Milliseconds::Second == 0)
        return Number(span / Milliseconds::Second);
    return QLocale().toString(static_cast<double>(span) / Milliseconds::Second, 'f', 3);
}

QString Both(QString const& larger, QString const& smaller)
{
    return smaller.isEmpty() ? larger : Spans::tr("%1 %2").arg(larger, smaller);
}

QString Minutes(qint64 count)
{
    if (count == 0)
        return QString();
    return count == 1 ? Spans::tr("1 minute") : Spans::tr("%1 minutes").arg(Number(count));
}

QString Hours(qint64 count)
{
    if (count == 0)
        return QString();
    return count == 1 ? Spans::tr("1 hour") : Spans::tr("%1 hours").arg(Number(count));
}

QString Days(qint64 count)
{
    return count == 1 ? Spans::tr("1 day") : Spans::tr("%1 days").arg(Number(count));
}

QString WholeSeconds(qint64 count)
{
    if (count == 0)
        return QString();
    return count == 1 ? Spans::tr("1 second") : Spans::tr("%1 seconds").arg(Number(count));
}

} // namespace

QString SpanText::Short(qint64 span)
{
    if (span < 0)
        return QLatin1Char('-') + Short(-span);
    if (span < Milliseconds::Second)
        return Spans::tr("%1 ms").arg(Number(span));
    if (span < Milliseconds::Minute)
        return Spans::tr("%1 s").arg(Seconds(span));
    if (span < Milliseconds::Hour)
        return Spans::tr("%1 min %2 s")
            .arg(Number(span / Milliseconds::Minute),
                 TwoDigits(span % Milliseconds::Minute / Milliseconds::Second));
    if (span < Milliseconds::Day)
        return Spans::tr("%1 h %2 min")
            .arg(Number(span / Milliseconds::Hour),
                 TwoDigits(span % Milliseconds::Hour / Milliseconds::Minute));
    return Spans::tr("%1 d %2 h")
        .arg(Number(span / Milliseconds::Day),
             TwoDigits(span % Milliseconds::Day / Milliseconds::Hour));
}

QString SpanText::Words(qint64 span)
{
    if (span < Milliseconds::Second)
        return span == 1 ? Spans::tr("1 millisecond")
                         : Spans::tr("%1 milliseconds").arg(Number(span));
    if (span == Milliseconds::Second)
        return WholeSeconds(1);
    if (span < Milliseconds::Minute)
        return Spans::tr("%1 seconds").arg(Seconds(span));
    if (span < Milliseconds::Hour)
        return Both(Minutes(span / Milliseconds::Minute),
                    WholeSeconds(span % Milliseconds::Minute / Milliseconds::Second));
    if (span < Milliseconds::Day)
        return Both(Hours(span / Milliseconds::Hour),
                    Minutes(span % Milliseconds::Hour / Milliseconds::Minute));
    return Both(Days(span / Milliseconds::Day),
                Hours(span % Milliseconds::Day / Milliseconds::Hour));
}

} // namespace Velocor
