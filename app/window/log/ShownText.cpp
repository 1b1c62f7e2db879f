// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/ShownText.h"

namespace Velocor {

namespace {

constexpr int TabWidth = 8; // characters
constexpr ushort Escape = 0x1b;

bool IsBetween(QChar c, ushort first, ushort last)
{
    return c.unicode() >= first && c.unicode() <= last;
}

// Where a control sequence ends that starts at `at`, also if the text ends in it; `at` if there is
// none: "Escape [", digits and the like, and one letter.
int EndOfSequence(QString const& text, int at)
{
    if (text.at(at).unicode() != Escape || at + 1 == text.size() ||
        text.at(at + 1) != QLatin1Char('['))
        return at;
    int end = at + 2;
    while (end < text.size() && IsBetween(text.at(end), 0x20, 0x3f))
        ++end;
    if (end == text.size())
        return end;
    return IsBetween(text.at(end), 0x40, 0x7e) ? end + 1 : at;
}

} // namespace

QString ShownText(QString const& text)
{
    QString shown;
    shown.reserve(text.size());
    for (int at = 0; at < text.size();) {
        const QChar c = text.at(at);
        const int end = EndOfSequence(text, at);
        if (end > at) {
            at = end;
            continue;
        }
        ++at;
        if (c == QLatin1Char('\t'))
            shown += QString(TabWidth - shown.size() % TabWidth, QLatin1Char(' '));
        else
            shown += c.unicode() < 0x20 || c.unicode() == 0x7f ? QChar(QLatin1Char(' ')) : c;
    }
    return shown;
}

} // namespace Velocor
