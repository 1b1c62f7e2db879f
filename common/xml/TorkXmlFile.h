// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "common/xml/TorkXmlLayout.h"

#include <QFile>
#include <QTextStream>
#include <QXmlInputSource>

/// Writes indented XML element by element into a named file of its own.
///
/// The operations and their output are those of TorkXmlStream, but none of them reports a failed
/// write: see errorString(). One thread at a time.
///
///     TorkXmlFile writer(path);
///     if (!writer.open(QIODevice::WriteOnly))
///         WarningMessage(window, writer.errorString(), true);
///     writer.WriteElementStart("folder", 1);
///     writer.WriteElement("title", "Research");
///     writer.WriteElementEnd("folder", 1);
///     writer.close();
class TorkXmlFile : public QTextStream, public QXmlInputSource
{
public:
    /// A writer without a file name.
    TorkXmlFile();

    /// A writer for the file `name`, which is not opened.
    explicit TorkXmlFile(QString const& name);

    /// Writes out what the text stream still holds and closes the file.
    ~TorkXmlFile() override;

    /// Sets the name of the file, which must not be open.
    void setName(QString const& name);

    /// Opens the file. On failure errorString() has the reason.
    bool open(QIODevice::OpenMode mode);

    /// Closes the file. Collected attributes are not written.
    void close();

    bool isOpen() const;

    /// The toolkit's text for what last went wrong with the file.
    QString errorString() const;

    QString name() const;

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
    /// @return always 0, so that no operation of this class reports 1006
    virtual int Write(QString const& text);

private:
    TorkXmlLayout m_layout;
    QFile m_file;
};
