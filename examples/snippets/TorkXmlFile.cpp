// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/xml/TorkXmlFile.h"

#include "app/UserMessages.h"

#include <QWidget>

void WriteFolder(QString const& path, QWidget* window)
{
    TorkXmlFile writer(path);
    if (!writer.open(QIODevice::WriteOnly))
        WarningMessage(window, writer.errorString(), true);
    writer.WriteElementStart("folder", 1);
    writer.WriteElement("title", "Research");
    writer.WriteElementEnd("folder", 1);
    writer.close();
}
