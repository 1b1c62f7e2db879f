// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QString>

#include <memory>
#include <vector>

/// A bookmark, or a folder of them. The whole file is a folder too.
struct Bookmark
{
    bool isFolder = false;
    QString title;
    QString address; // of a bookmark only
    std::vector<std::unique_ptr<Bookmark>> children;
};
