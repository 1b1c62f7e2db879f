// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "Bookmark.h"

/// Writes an XBEL 1.0 file.
///
/// @param error  what went wrong, on failure
/// @return whether all of it has reached the file
bool WriteBookmarks(QString const& path, Bookmark const& root, QString& error);
