// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "BookmarkReader.h"

#include "BookmarkErrors.h"

#include "common/xml/TorkErrorHandler.h"
#include "common/xml/TorkXmlGuard.h"
#include "common/xml/TorkXml_FlushUnknownElement.h"
#include "common/xml/TorkXml_ParseState_Base.h"

#include <QFile>
#include <QXmlLocator>
#include <QXmlSimpleReader>

namespace {

// <title>: text, which may come in several pieces.
class TitleState : public TorkXml_ParseState_Base
{
public:
    TitleState(QString const& element, TorkXml_ParseManager_Base* manager, Bookmark& owner)
        : TorkXml_ParseState_Base(element, manager), m_owner(owner)
    {}

    bool ProcessContent(QString const& name, QString const& content) override
    {
        if (IsElement(name)) // otherwise an attribute
            m_text += content;
        return true;
    }

    TorkXml_ParseState_Base* GetNextState(QString const& name) override
    {
        return new TorkXml_FlushUnknownElement(name, ParseManager());
    }

    bool EndElement(QString const&) override
    {
        m_owner.title = m_text.simplified(); // line breaks and indentation are not part of it
        return true;
    }

private:
    Bookmark& m_owner;
    QString m_text;
};

// <bookmark href="...">: a title, and a lot of browser metadata.
class BookmarkState : public TorkXml_ParseState_Base
{
public:
    BookmarkState(QString const& element, BookmarkReader& reader, Bookmark& bookmark)
        : TorkXml_ParseState_Base(element, &reader), m_reader(reader), m_bookmark(bookmark)
    {}

    bool ProcessContent(QString const& name, QString const& content) override
    {
        if (name == "xlink:href") // the manager's name for any href
            m_bookmark.address = content;
        return true;
    }

    TorkXml_ParseState_Base* GetNextState(QString const& name) override
    {
        if (name == "title")
            return new TitleState(name, ParseManager(), m_bookmark);
        return new TorkXml_FlushUnknownElement(name, ParseManager());
    }

    bool EndElement(QString const&) override
    {
        if (m_bookmark.address.isEmpty())
            m_reader.FailHere(BookmarkErrors::NoAddress);
        return true;
    }

private:
    BookmarkReader& m_reader;
    Bookmark& m_bookmark;
};

// <folder>, and <xbel> itself: a title, bookmarks and further folders.
class FolderState : public TorkXml_ParseState_Base
{
public:
    FolderState(QString const& element, BookmarkReader& reader, Bookmark& folder)
        : TorkXml_ParseState_Base(element, &reader), m_reader(reader), m_folder(folder)
    {}

    // Attributes, and the white space between the children.
    bool ProcessContent(QString const&, QString const&) override { return true; }

    TorkXml_ParseState_Base* GetNextState(QString const& name) override
    {
        if (name == "title")
            return new TitleState(name, ParseManager(), m_folder);
        if (name == "bookmark")
            return new BookmarkState(name, m_reader, AddChild(false));
        if (name == "folder")
            return new FolderState(name, m_reader, AddChild(true));
        return new TorkXml_FlushUnknownElement(name, ParseManager());
    }

private:
    Bookmark& AddChild(bool isFolder)
    {
        m_folder.children.push_back(std::make_unique<Bookmark>());
        m_folder.children.back()->isFolder = isFolder;
        return *m_folder.children.back();
    }

    BookmarkReader& m_reader;
    Bookmark& m_folder;
};

} // namespace

bool BookmarkReader::Read(QString const& path)
{
    m_root.isFolder = true;

    QFile file(path);
    if (!file.open(QIODevice::ReadOnly)) {
        Fail(BookmarkErrors::CannotRead, path + ": " + file.errorString());
        return false;
    }

    // An untrusted file: the guard stops the parse before it takes all memory, or hours.
    TorkXmlGuard source(&file);
    QXmlSimpleReader reader;
    source.Watch(reader);
    reader.setContentHandler(this);
    reader.setErrorHandler(this);
    return reader.parse(source) && !m_failed;
}

TorkXml_ParseState_Base* BookmarkReader::GetFirstState(QString const& name)
{
    return name == "xbel" ? new FolderState(name, *this, m_root) : nullptr;
}

bool BookmarkReader::fatalError(QXmlParseException const& exception)
{
    TorkErrorHandler formatter(nullptr);
    Fail(BookmarkErrors::NotWellFormed, formatter.format(exception));
    return false;
}

void BookmarkReader::Fail(int code, QString const& about)
{
    QString text;
    BookmarkErrors().decode(code, text);
    AppendError(text + '\n' + about, code);
    m_failed = true;
}

void BookmarkReader::FailHere(int code)
{
    Fail(code, QString("Line: %1, Column: %2")
                   .arg(m_locator->lineNumber())
                   .arg(m_locator->columnNumber()));
}
