// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/settingsfile/CaselessText.h"

#include <algorithm>

namespace Velocor {

namespace {

// The letters that are the same as this one in another case: for "s", also the long one.
QString CasesOf(QChar letter)
{
    QString cases;
    const QChar folded = letter.toCaseFolded();
    for (int code = 0; code <= 0xffff; ++code) {
        if (QChar(code).toCaseFolded() == folded)
            cases.append(QChar(code));
    }
    return cases;
}

} // namespace

// Fast path for the goal "a key to find, no match": a matcher is slow with one letter.
// tst_PlainSettingsEdits compares it.
CaselessText::CaselessText(QString const& text) : m_matcher(text, Qt::CaseInsensitive)
{
    if (text.size() == 1 && !text.at(0).isSurrogate())
        m_letters = CasesOf(text.at(0));
}

bool CaselessText::IsIn(QString const& other) const
{
    if (m_letters.isEmpty())
        return m_matcher.indexIn(other) >= 0;
    return std::any_of(m_letters.begin(), m_letters.end(),
                       [&](QChar letter) { return other.contains(letter); });
}

} // namespace Velocor
