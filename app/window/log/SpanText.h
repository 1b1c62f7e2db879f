// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QString>

namespace Velocor {

/// Intervals of time as texts for users. Pure, any thread.
class SpanText
{
public:
    /// An interval in its two largest units, such as "12 ms", "1.250 s", "3 min 05 s", "2 h 14 min"
    /// or "3 d 02 h"; smaller ones are cut off.
    ///
    /// @param span  in milliseconds; a negative one gets a minus sign
    static QString Short(qint64 span);

    /// The same in words, such as "3 minutes 5 seconds".
    ///
    /// @param span  in milliseconds, not negative
    static QString Words(qint64 span);
};

} // namespace Velocor
