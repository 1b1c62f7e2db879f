// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "common/xml/TorkXmlLayout.h"

#include <QTextStream>
#include <QXmlInputSource>

/// Writes indented XML element by element onto whatever a text stream can write to.
///
/// The caller drives the structure and balances open and end calls; nothing is validated, and
/// names and attribute values are never escaped. Output: docs/xml.md. Operations return 0, 1005
/// for an empty name, or 1006 if Write() reported a negative count; nothing is logged or thrown.
/// They call one another through the virtual slots. One thread at a time.
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
class TorkXmlStream : public QTextStream, public QXmlInputSource
{
public:
    /// A stream without a device yet; give it one with setDevice() or setString().
    TorkXmlStream();

    /// Writes onto `device`, which is not owned and must outlive the writer.
    explicit TorkXmlStream(QIODevice* device);

    /// Writes into `string`, `array` or onto `file`, none of which is owned.
    explicit TorkXmlStream(QString* string, QIODevice::OpenMode mode = QIODevice::ReadWrite);
    explicit TorkXmlStream(QByteArray* array, QIODevice::OpenMode mode = QIODevice::ReadWrite);
    explicit TorkXmlStream(FILE* file, QIODevice::OpenMode mode = QIODevice::ReadWrite);

    /// Flushes the text stream; collected attributes that no close wrote are dropped.
    ~TorkXmlStream() override;

    /// Writes a text, in a CDATA section if it holds one of & \ > < ". Nothing if it is empty.
    /// "]]>" in the text is not split. Returns 0 whatever Write() reported.
    virtual int WriteElementValue(QString const& value);

    /// Writes the indentation and "<name " (with the blank), then raises the level by `indent`;
    /// not if writing failed. WriteAttribute() and a close follow.
    virtual int WriteElementOpen(QString const& name, int indent);

    /// Lowers the level by `indent` and ends the start tag; content follows. Opening and closing
    /// with equal indents leaves the children at the element's own level, and WriteElementEnd()
    /// lowers once more: pass a smaller `indent` for indented children.
    ///
    /// @param name  only checked; if it is empty the collected attributes are dropped
    virtual int WriteElementClose(QString const& name, int indent);

    /// The same for an element without content, which ends here.
    virtual int WriteElementCloseAndEnd(QString const& name, int indent);

    /// Writes the indentation and a start tag without attributes on a line of its own, then
    /// raises the level by `indent`; not if writing failed.
    virtual int WriteElementStart(QString const& name, int indent);

    /// Lowers the level by `indent`, then writes the end tag on a line of its own.
    virtual int WriteElementEnd(QString const& name, int indent);

    /// Writes a leaf element with its text on a line of its own; nothing if `value` is empty.
    virtual int WriteElement(QString const& name, QString const& value);

    /// Collects an attribute for the start tag that is open. What would pass 80 characters starts
    /// a new line at column 0. Returns 1005 or 0, whatever Write() reported.
    virtual int WriteAttribute(QString const& name, QString const& value);

    /// Writes the indentation unit once per level; nothing at level 0 or below. Returns 0.
    virtual int WriteCurrentIndent();

    /// Puts a text out as it stands. All output goes through here.
    ///
    /// @return the number of characters in `text`
    virtual int Write(QString const& text);

private:
    TorkXmlLayout m_layout;
};
