// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/report/Redactor.h"

#include <QSyntaxHighlighter>

#include <vector>

namespace Velocor {

/// Marks the placeholders in a redacted text on the screen.
class PlaceholderMarks : public QSyntaxHighlighter
{
    Q_OBJECT

public:
    /// @param text  owns this
    explicit PlaceholderMarks(QTextDocument* text) : QSyntaxHighlighter(text) {}

    /// The places in the next text of the document, whose lines end with one character.
    void SetPlaces(std::vector<Redactor::Place> const& places) { m_places = places; }

protected:
    void highlightBlock(QString const& text) override;

private:
    std::vector<Redactor::Place> m_places;
};

} // namespace Velocor
