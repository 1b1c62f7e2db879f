// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QScrollArea>

namespace Velocor {

/// Scrolls its widget up and down where there is less room than that needs: with large text on a
/// small screen. Anywhere else, it looks as if it were not there.
///
/// What gets the keyboard focus is scrolled into view. The widget is never scrolled sideways, so
/// the area is at least as wide as that.
class TallArea : public QScrollArea
{
    Q_OBJECT

public:
    /// @param content  what to scroll; owned by the area from now on
    explicit TallArea(QWidget* content, QWidget* parent = nullptr);

    QSize sizeHint() const override;
    QSize minimumSizeHint() const override;

private:
    void showFocused(QWidget const* focused);
};

} // namespace Velocor
