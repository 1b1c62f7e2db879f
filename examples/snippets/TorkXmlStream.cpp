// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/xml/TorkXmlStream.h"

QString FolderAsXml()
{
    QString xml;
    TorkXmlStream writer(&xml, QIODevice::WriteOnly);
    writer.WriteElementStart("folder", 1);
    writer.WriteElement("title", "R&D"); //   <title><![CDATA[R&D]]></title>
    writer.WriteElementOpen("bookmark", 1);
    writer.WriteAttribute("href", "http://example.org/");
    writer.WriteElementCloseAndEnd("bookmark", 1);
    writer.WriteElementEnd("folder", 1);
    writer.flush();
    return xml;
}
