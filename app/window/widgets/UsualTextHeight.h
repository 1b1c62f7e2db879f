// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

namespace Velocor {

/// The height of text, in pixels, that sizes of windows and icons are made for. Larger text needs
/// larger ones.
constexpr int UsualTextHeight = 18;

} // namespace Velocor
