// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/xml/TorkXmlFile.h"

#include "common/xml/TorkXmlFormat_p.h"

TorkXmlFile::TorkXmlFile() = default;

TorkXmlFile::TorkXmlFile(QString const& name)
{
    setName(name);
}

TorkXmlFile::~TorkXmlFile()
{
    // The file is destroyed before the text stream, which would otherwise flush to freed memory.
    setDevice(nullptr);
}

void TorkXmlFile::setName(QString const& name)
{
    m_file.setFileName(name);
    setDevice(&m_file);
}

bool TorkXmlFile::open(QIODevice::OpenMode mode)
{
    if (!m_file.open(mode))
        return false;

    setDevice(&m_file);
    return true;
}

void TorkXmlFile::close()
{
    m_file.close();
}

bool TorkXmlFile::isOpen() const
{
    return m_file.isOpen();
}

QString TorkXmlFile::errorString() const
{
    return m_file.errorString();
}

QString TorkXmlFile::name() const
{
    return m_file.fileName();
}

int TorkXmlFile::WriteElementValue(QString const& value)
{
    return TorkXmlFormat::ElementValue(*this, value);
}

int TorkXmlFile::WriteElementOpen(QString const& name, int indent)
{
    return TorkXmlFormat::ElementOpen(*this, m_layout, name, indent);
}

int TorkXmlFile::WriteElementClose(QString const& name, int indent)
{
    return TorkXmlFormat::ElementClose(*this, m_layout, name, indent);
}

int TorkXmlFile::WriteElementCloseAndEnd(QString const& name, int indent)
{
    return TorkXmlFormat::ElementCloseAndEnd(*this, m_layout, name, indent);
}

int TorkXmlFile::WriteElementStart(QString const& name, int indent)
{
    return TorkXmlFormat::ElementStart(*this, m_layout, name, indent);
}

int TorkXmlFile::WriteElementEnd(QString const& name, int indent)
{
    return TorkXmlFormat::ElementEnd(*this, m_layout, name, indent);
}

int TorkXmlFile::WriteElement(QString const& name, QString const& value)
{
    return TorkXmlFormat::Element(*this, m_layout, name, value);
}

int TorkXmlFile::WriteAttribute(QString const& name, QString const& value)
{
    return TorkXmlFormat::CollectAttribute(*this, m_layout, name, value);
}

int TorkXmlFile::WriteCurrentIndent()
{
    return TorkXmlFormat::CurrentIndent(*this, m_layout);
}

int TorkXmlFile::Write(QString const& text)
{
    *this << text;
    return 0;
}
