// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/xml/TorkXml_ParseManager_Base.h"

#include "common/xml/TorkXml_FlushUnknownElement.h"

#include <QXmlInputSource>
#include <QXmlSimpleReader>

namespace {

using FolderState = TorkXml_FlushUnknownElement;

class BookmarkReader : public TorkXml_ParseManager_Base
{
    TorkXml_ParseState_Base* GetFirstState(QString const& name) override
    {
        return name == "xbel" ? new FolderState(name, this) : nullptr;
    }
};

} // namespace

QString WhatIsWrong(QXmlInputSource const& source)
{
    QString report;
    QXmlSimpleReader reader;
    BookmarkReader bookmarks;
    reader.setContentHandler(&bookmarks);
    if (!reader.parse(source))
        bookmarks.FormatErrors(report);
    return report;
}
