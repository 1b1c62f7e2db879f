// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "common/xml/TorkErrorDictionary.h"

/// The possible errors in a bookmark file: codes 2000 to 2003 and their texts.
class BookmarkErrors : public TorkErrorDictionary
{
public:
    enum Code : int {
        CannotRead = 2000,
        CannotWrite = 2001,
        NotWellFormed = 2002,
        NoAddress = 2003
    };

    BookmarkErrors();

    bool decode(int code, QString& text) override;
};
