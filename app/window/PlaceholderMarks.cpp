// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/PlaceholderMarks.h"

#include "app/window/widgets/BlendedColor.h"

#include <QGuiApplication>
#include <QPalette>
#include <QTextCharFormat>
#include <QTextDocument>

#include <algorithm>

namespace Velocor {

void PlaceholderMarks::highlightBlock(QString const& text)
{
    const QPalette colors = QGuiApplication::palette();
    QTextCharFormat format;
    format.setBackground(
        Blended(colors.color(QPalette::Base), colors.color(QPalette::Highlight), 0.3));
    const int start = currentBlock().position();
    const int end = start + static_cast<int>(text.size());
    auto place = std::lower_bound(m_places.begin(), m_places.end(), start,
                                  [](Redactor::Place const& candidate, int position) {
                                      return candidate.start + candidate.length <= position;
                                  });
    for (; place != m_places.end() && place->start < end; ++place)
        setFormat(std::max(0, place->start - start), place->length, format);
}

} // namespace Velocor
