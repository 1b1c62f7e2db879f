// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/RowSpans.h"

#include "app/logfile/Milliseconds.h"
#include "app/window/log/LogModel.h"
#include "app/window/log/SpanText.h"

#include <algorithm>

namespace Velocor {

namespace {

constexpr qint64 HalfDay = 12 * Milliseconds::Hour;

} // namespace

RowSpans::Time RowSpans::timeOf(int row) const
{
    Time time;
    if (!(m_model.state().rows->mark(static_cast<size_t>(row)) & LogRows::Timed))
        return time;
    const LogEntry entry = m_model.Entry(row);
    time.key = entry.timeKey;
    time.hasDate = entry.hasDate;
    time.text = entry.time;
    return time;
}

RowSpans::Span RowSpans::between(Time const& from, Time const& to)
{
    Span span;
    span.isKnown = from.key >= 0 && to.key >= 0 && from.hasDate == to.hasDate;
    span.length = to.key - from.key;
    if (!to.hasDate && span.length < -HalfDay)
        span.length += Milliseconds::Day;
    else if (!to.hasDate && span.length > HalfDay)
        span.length -= Milliseconds::Day;
    return span;
}

// An entry of an earlier run is not the one above, nor is one of another program.
RowSpans::Span RowSpans::spanAbove(int row) const
{
    const Time time = timeOf(row);
    if (time.key < 0)
        return Span();
    const int end = std::max(-1, row - 1 - MostAbove);
    for (int above = row - 1; above > end && m_model.LineStart(above) >= 0; --above) {
        if ((m_model.state().rows->mark(static_cast<size_t>(above)) & LogRows::Timed) &&
            m_model.LogOf(above) == m_model.LogOf(row))
            return between(timeOf(above), time);
    }
    return Span();
}

bool RowSpans::MeasureFrom(int row)
{
    if (row < 0 || row >= m_model.logRowCount())
        return false;
    const Time time = timeOf(m_model.EntryRows(row).first);
    if (time.key < 0)
        return false;
    m_base = time;
    return true;
}

QString RowSpans::Since(int row) const
{
    const Span span = m_base.key < 0 ? spanAbove(row) : between(m_base, timeOf(row));
    return span.isKnown ? SpanText::Short(span.length) : QString();
}

QString RowSpans::Gap(int row) const
{
    if (m_leastGap <= 0)
        return QString();
    const Span span = spanAbove(row);
    return span.isKnown && span.length >= m_leastGap ? SpanText::Words(span.length) : QString();
}

} // namespace Velocor
