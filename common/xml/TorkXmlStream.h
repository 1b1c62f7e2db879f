// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "common/TorkExport.h"
#include "common/xml/TorkXmlLayout.h"

#include <QTextStream>
#include <QXmlInputSource>

/// Writes indented XML element by element to anything that a text stream can write to.
///
/// The caller drives the structure and balances open and end calls; nothing is validated, and
/// names and attribute values are never escaped. Output: docs/xml.md. Operations return 0, 1005
/// for an empty name, or 1006 if Write() returned a negative count; see TorkXmlResult. Nothing is
/// logged or thrown. Operations call each other virtually. One thread at a time.
///
///     QString xml;
///     TorkXmlStream writer(&xml, QIODevice::WriteOnly);
///     writer.WriteElementStart("folder", 1);
///     writer.WriteElement("title", "R&D"); //   <title><![CDATA[R&D]]></title>
///     writer.WriteElementOpen("bookmark", 1);
///     writer.WriteAttribute("href", "http://example.org/");
///     writer.WriteElementCloseAndEnd("bookmark", 1);
///     writer.WriteElementEnd("folder", 1);
///     writer.flush();
class TORK_EXPORT TorkXmlStream : public QTextStream, public QXmlInputSource
{
public:
    /// A stream without a device; give it one with setDevice() or setString().
    TorkXmlStream();

    /// Writes to `device`, which is not owned and must outlive the writer.
    explicit TorkXmlStream(QIODevice* device);

    /// Writes to `string`, `array` or `file`, none of which is owned.
    explicit TorkXmlStream(QString* string, QIODevice::OpenMode mode = QIODevice::ReadWrite);
    explicit TorkXmlStream(QByteArray* array, QIODevice::OpenMode mode = QIODevice::ReadWrite);
    explicit TorkXmlStream(FILE* file, QIODevice::OpenMode mode = QIODevice::ReadWrite);

    /// Flushes the text stream; collected attributes that no close wrote are dropped.
    ~TorkXmlStream() override;

    /// Writes a text, in a CDATA section if it contains one of & \ > < ". Nothing if it is empty.
    /// "]]>" in the text is not split. Returns 0 whatever Write() returned.
    virtual int WriteElementValue(QString const& value);

    /// Writes the indentation and "<name " (with the space), then raises the level by `indent`
    /// unless writing failed. WriteAttribute() and a close follow.
    virtual int WriteElementOpen(QString const& name, int indent);

    /// Lowers the level by `indent` and ends the start tag; content follows. If open and close have
    /// the same `indent`, the children are at the element's own level, and WriteElementEnd() lowers
    /// it once more: pass a smaller `indent` to indent the children.
    ///
    /// @param name  only checked; if it is empty the collected attributes are dropped
    virtual int WriteElementClose(QString const& name, int indent);

    /// The same for an element without content, which ends here.
    virtual int WriteElementCloseAndEnd(QString const& name, int indent);

    /// Writes the indentation and a start tag without attributes on its own line, then raises the
    /// level by `indent` unless writing failed.
    virtual int WriteElementStart(QString const& name, int indent);

    /// Lowers the level by `indent`, then writes the end tag on its own line.
    virtual int WriteElementEnd(QString const& name, int indent);

    /// Writes a leaf element with its text on its own line; nothing if `value` is empty.
    virtual int WriteElement(QString const& name, QString const& value);

    /// Collects an attribute for the open start tag. One that would exceed 80 characters starts a
    /// new line at column 0. Returns 1005 or 0, whatever Write() returned.
    virtual int WriteAttribute(QString const& name, QString const& value);

    /// Writes the indentation unit once per level; nothing at level 0 or below. Returns 0.
    virtual int WriteCurrentIndent();

    /// Writes a text unchanged. All output goes through here.
    ///
    /// @return the number of characters in `text`
    virtual int Write(QString const& text);

private:
    TorkXmlLayout m_layout;
};
