// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/config/TorkConfigFileDocHandler.h"

#include <QDebug>
#include <QXmlInputSource>
#include <QXmlSimpleReader>

void FindEnd(QXmlInputSource const& source)
{
    TorkConfigFileDocHandler handler; // no file to fill: it only keeps track
    QXmlSimpleReader reader;
    reader.setContentHandler(&handler);
    if (!reader.parse(source))
        qDebug() << "broken after" << handler.lastOpenedElement();
}
