// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QStringMatcher>

namespace Velocor {

/// A text to look for in many others, in any letter case.
class CaselessText
{
public:
    explicit CaselessText(QString const& text);

    /// As QString::contains(): every text contains the empty one.
    bool IsIn(QString const& other) const;

private:
    QStringMatcher m_matcher;
    QString m_letters; ///< of a single letter, all its cases
};

} // namespace Velocor
