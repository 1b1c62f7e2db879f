// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/xml/TorkErrorDictionary.h"

namespace {

class BookmarkErrors : public TorkErrorDictionary
{
public:
    BookmarkErrors() : TorkErrorDictionary("bookmarks", 2000) { setMaxErrorCode(2000); }
    bool decode(int code, QString& text) override
    {
        if (code != 2000)
            return TorkErrorDictionary::decode(code, text);
        text = "A bookmark without an address.";
        return true;
    }
};

} // namespace

QString ErrorText(int code)
{
    QString text;
    BookmarkErrors().decode(code, text);
    return text;
}
