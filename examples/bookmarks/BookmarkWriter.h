// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "Bookmark.h"

/// Writes an XBEL 1.0 file.
///
/// @param error  the reason, on failure
/// @return whether all of it was written to the file
bool WriteBookmarks(QString const& path, Bookmark const& root, QString& error);
