// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

namespace Velocor {

/// Tells assistive technology about widgets of which Qt says too little: a label with an accessible
/// name says its text, too, and when it changes; the handle of a splitter is a separator; an
/// Announcer is a notification.
///
/// Applies to widgets that assistive technology has not asked about yet. Only in the GUI thread.
void InstallAccessibleParts();

} // namespace Velocor
