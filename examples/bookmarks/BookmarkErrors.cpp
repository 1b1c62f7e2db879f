// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "BookmarkErrors.h"

BookmarkErrors::BookmarkErrors() : TorkErrorDictionary("bookmarks", CannotRead)
{
    setMaxErrorCode(NoAddress);
}

bool BookmarkErrors::decode(int code, QString& text)
{
    switch (code) {
    case CannotRead:
        text = "The file cannot be read.";
        return true;
    case CannotWrite:
        text = "The file cannot be written.";
        return true;
    case NotWellFormed:
        text = "The document cannot be understood.";
        return true;
    case NoAddress:
        text = "A bookmark has no address.";
        return true;
    default:
        return TorkErrorDictionary::decode(code, text);
    }
}
