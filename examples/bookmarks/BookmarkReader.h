// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "Bookmark.h"

#include "common/xml/TorkXml_ParseManager_Base.h"

/// Reads an XBEL 1.0 file: folders, bookmarks and their titles; everything else is skipped.
///
///     BookmarkReader reader;
///     if (!reader.Read(path))
///         reader.FormatErrors(report);
class BookmarkReader : public TorkXml_ParseManager_Base
{
public:
    /// @return false if anything is wrong with the file; the report has the reasons
    bool Read(QString const& path);

    /// The result: the folder that is the whole file.
    Bookmark const& root() const { return m_root; }

    /// Adds an error of the dictionary, with its subject.
    void Fail(int code, QString const& about);

    /// The same, with the current position in the document.
    void FailHere(int code);

    void setDocumentLocator(QXmlLocator* locator) override { m_locator = locator; }
    bool fatalError(QXmlParseException const& exception) override;

protected:
    TorkXml_ParseState_Base* GetFirstState(QString const& name) override;

private:
    Bookmark m_root;
    QXmlLocator* m_locator = nullptr;
    bool m_failed = false;
};
