// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/xml/TorkXmlGuard.h"

#include "common/xml/TorkXml_ParseManager_Base.h"

#include <QFile>
#include <QXmlSimpleReader>

void ReadUntrusted(QString const& path, TorkXml_ParseManager_Base& manager)
{
    QFile file(path);
    TorkXmlGuard source(&file);
    QXmlSimpleReader reader;
    source.Watch(reader);
    reader.setContentHandler(&manager);
    reader.parse(source);
}
