// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QPoint>
#include <QSize>

/// A window's rectangle in desktop pixels.
struct TorkWindowRect
{
    QPoint position;
    QSize size;
};

/// Fits a stored window rectangle onto a desktop, so that a window never opens off-screen or
/// smaller than 320 by 200.
///
/// A window that would reach the right or bottom edge is moved to end one pixel before it. Works
/// for any int: sums wrap at 32 bits instead of overflowing. Pure function, any thread.
///
/// @param x, y, width, height  the stored rectangle, in pixels
/// @param desktop  the extent of the desktop, in pixels
TorkWindowRect TorkFitToDesktop(int x, int y, int width, int height, QSize const& desktop);
