// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

namespace Velocor {

/// Whether Qt runs on a platform without a display or window manager: "offscreen" or
/// "minimal". Needs the application object; GUI thread.
bool IsScreenlessPlatform();

} // namespace Velocor
