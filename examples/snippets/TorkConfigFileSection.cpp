// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/config/TorkConfigFileSection.h"

QString WindowTitle()
{
    TorkConfigFileSection section("Window");
    section.AddValue("title", "Bookmarks");
    QString title;
    section.FindValue("title", title); // true, "Bookmarks"
    return title;
}
