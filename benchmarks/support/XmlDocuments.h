// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "common/xml/TorkXml_FlushUnknownElement.h"
#include "common/xml/TorkXml_ParseManager_Base.h"

#include <QFile>
#include <QString>
#include <QXmlInputSource>
#include <QXmlSimpleReader>

/// Writes a document of records, each of five elements with attributes and text, until it has at
/// least `bytes` bytes or `elements` elements; 0 means no such limit.
///
/// @return the number of elements
int WriteGeneratedDocument(QString const& fileName, qint64 bytes, int elements);

/// Skips a whole document, one flush state per element.
class SkippingManager : public TorkXml_ParseManager_Base
{
public:
    TorkXml_ParseState_Base* GetFirstState(QString const& name) override
    {
        return new TorkXml_FlushUnknownElement(name, this);
    }
};

/// Reads a document piece by piece with Qt's SAX reader.
bool ReadDocument(QString const& fileName, QXmlDefaultHandler& handler);
