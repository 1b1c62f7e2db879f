// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "common/TorkExport.h"
#include "common/xml/TorkXmlLayout.h"

#include <QFile>
#include <QTextStream>
#include <QXmlInputSource>

/// Writes indented XML element by element into a named file that it owns.
///
/// Operations and output are those of TorkXmlStream, which documents them; output: docs/xml.md. The
/// caller drives the structure and balances open and end calls; nothing is validated, and names and
/// attribute values are never escaped.
///
/// Errors: no operation reports a failed write, as the text stream buffers the output. To learn of
/// a full disk, call flush() and check status() and errorString() before close(). A file that is
/// cut short by a failed write is not removed.
///
/// Qt 6 writes UTF-8; with Qt 5, the file is in the locale's encoding unless you call
/// setCodec("UTF-8") before the first text. The file is written in place: to replace an existing
/// file atomically, write to a QSaveFile through a TorkXmlStream instead. One thread at a time.
///
///     TorkXmlFile writer(path);
///     if (!writer.open(QIODevice::WriteOnly))
///         WarningMessage(window, writer.errorString(), true);
///     writer.WriteElementStart("folder", 1);
///     writer.WriteElement("title", "Research");
///     writer.WriteElementEnd("folder", 1);
///     writer.close();
class TORK_EXPORT TorkXmlFile : public QTextStream, public QXmlInputSource
{
public:
    /// A writer without a file name; call setName() before open().
    TorkXmlFile();

    /// A writer for the file `name`, which is not opened.
    explicit TorkXmlFile(QString const& name);

    /// Writes out what the text stream still buffers and closes the file. Collected attributes that
    /// no close wrote are dropped.
    ~TorkXmlFile() override;

    /// Sets the name of the file, which must not be open. Creates nothing.
    ///
    /// @param name  a path; its directory must exist when the file is opened
    void setName(QString const& name);

    /// Opens the file.
    ///
    /// @param mode  as for QFile::open(); QIODevice::WriteOnly truncates an existing file
    /// @return whether the file is open; if not, errorString() has the reason
    bool open(QIODevice::OpenMode mode);

    /// Writes out what the text stream still buffers and closes the file; nothing if none is open.
    /// Collected attributes are not written. The level of indentation is kept.
    void close();

    /// Whether the file is open.
    bool isOpen() const;

    /// Qt's text for the last problem with the file, in the user's language; "Unknown error" if
    /// there was none.
    QString errorString() const;

    /// The name of the file, as it was set; empty if none was.
    QString name() const;

    /// @copydoc TorkXmlStream::WriteElementValue
    virtual int WriteElementValue(QString const& value);

    /// @copydoc TorkXmlStream::WriteElementOpen
    virtual int WriteElementOpen(QString const& name, int indent);

    /// @copydoc TorkXmlStream::WriteElementClose
    virtual int WriteElementClose(QString const& name, int indent);

    /// @copydoc TorkXmlStream::WriteElementCloseAndEnd
    virtual int WriteElementCloseAndEnd(QString const& name, int indent);

    /// @copydoc TorkXmlStream::WriteElementStart
    virtual int WriteElementStart(QString const& name, int indent);

    /// @copydoc TorkXmlStream::WriteElementEnd
    virtual int WriteElementEnd(QString const& name, int indent);

    /// @copydoc TorkXmlStream::WriteElement
    virtual int WriteElement(QString const& name, QString const& value);

    /// @copydoc TorkXmlStream::WriteAttribute
    virtual int WriteAttribute(QString const& name, QString const& value);

    /// @copydoc TorkXmlStream::WriteCurrentIndent
    virtual int WriteCurrentIndent();

    /// Writes a text unchanged. All output goes through here, so overriding it is enough to see or
    /// change all of it.
    ///
    /// @return always 0, so no operation of this class returns 1006
    virtual int Write(QString const& text);

private:
    TorkXmlLayout m_layout;
    QFile m_file;
};
