// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/xml/TorkXmlStream.h"

#include "common/xml/TorkXmlFormat_p.h"

TorkXmlStream::TorkXmlStream() = default;

TorkXmlStream::TorkXmlStream(QIODevice* device) : QTextStream(device) {}

TorkXmlStream::TorkXmlStream(QString* string, QIODevice::OpenMode mode) : QTextStream(string, mode)
{}

TorkXmlStream::TorkXmlStream(QByteArray* array, QIODevice::OpenMode mode) : QTextStream(array, mode)
{}

TorkXmlStream::TorkXmlStream(FILE* file, QIODevice::OpenMode mode) : QTextStream(file, mode) {}

TorkXmlStream::~TorkXmlStream() = default;

int TorkXmlStream::WriteElementValue(QString const& value)
{
    return TorkXmlFormat::ElementValue(*this, value);
}

int TorkXmlStream::WriteElementOpen(QString const& name, int indent)
{
    return TorkXmlFormat::ElementOpen(*this, m_layout, name, indent);
}

int TorkXmlStream::WriteElementClose(QString const& name, int indent)
{
    return TorkXmlFormat::ElementClose(*this, m_layout, name, indent);
}

int TorkXmlStream::WriteElementCloseAndEnd(QString const& name, int indent)
{
    return TorkXmlFormat::ElementCloseAndEnd(*this, m_layout, name, indent);
}

int TorkXmlStream::WriteElementStart(QString const& name, int indent)
{
    return TorkXmlFormat::ElementStart(*this, m_layout, name, indent);
}

int TorkXmlStream::WriteElementEnd(QString const& name, int indent)
{
    return TorkXmlFormat::ElementEnd(*this, m_layout, name, indent);
}

int TorkXmlStream::WriteElement(QString const& name, QString const& value)
{
    return TorkXmlFormat::Element(*this, m_layout, name, value);
}

int TorkXmlStream::WriteAttribute(QString const& name, QString const& value)
{
    return TorkXmlFormat::CollectAttribute(*this, m_layout, name, value);
}

int TorkXmlStream::WriteCurrentIndent()
{
    return TorkXmlFormat::CurrentIndent(*this, m_layout);
}

int TorkXmlStream::Write(QString const& text)
{
    *this << text;
    return text.length();
}
