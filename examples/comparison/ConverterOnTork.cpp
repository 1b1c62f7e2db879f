// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The converter on the framework: XML of books in, HTML out.

#include "common/xml/TorkErrorHandler.h"
#include "common/xml/TorkXmlFile.h"
#include "common/xml/TorkXmlGuard.h"
#include "common/xml/TorkXml_FlushUnknownElement.h"
#include "common/xml/TorkXml_ParseManager_Base.h"
#include "common/xml/TorkXml_ParseState_Base.h"

#include <QFile>
#include <QTextStream>
#include <QVector>
#include <QXmlSimpleReader>

namespace {

struct Book
{
    QString year;
    QString title;
};

class BookState : public TorkXml_ParseState_Base
{
public:
    BookState(QString const& element, TorkXml_ParseManager_Base* manager, Book& book)
        : TorkXml_ParseState_Base(element, manager), m_book(book)
    {}

    bool CanHandleElement(QString const& name) override { return name == "title"; }

    TorkXml_ParseState_Base* GetNextState(QString const& name) override
    {
        return new TorkXml_FlushUnknownElement(name, ParseManager());
    }

    bool ProcessContent(QString const& name, QString const& content) override
    {
        if (name == "year")
            m_book.year = content;
        else if (name == "title")
            m_book.title += content;
        return true;
    }

private:
    Book& m_book;
};

class BooksState : public TorkXml_ParseState_Base
{
public:
    BooksState(QString const& element, TorkXml_ParseManager_Base* manager, QVector<Book>& books)
        : TorkXml_ParseState_Base(element, manager), m_books(books)
    {}

    TorkXml_ParseState_Base* GetNextState(QString const& name) override
    {
        if (name != "book")
            return nullptr;
        m_books.append(Book());
        return new BookState(name, ParseManager(), m_books.last());
    }

    bool ProcessContent(QString const&, QString const&) override { return true; }

private:
    QVector<Book>& m_books;
};

class BookReader : public TorkXml_ParseManager_Base
{
public:
    QVector<Book> m_books;

    bool fatalError(QXmlParseException const& exception) override
    {
        TorkErrorHandler formatter(nullptr);
        AppendError(formatter.format(exception));
        return false;
    }

protected:
    TorkXml_ParseState_Base* GetFirstState(QString const& name) override
    {
        return name == "books" ? new BooksState(name, this, m_books) : nullptr;
    }
};

bool WriteList(QString const& path, QVector<Book> const& books)
{
    TorkXmlFile out(path);
    if (!out.open(QIODevice::WriteOnly))
        return false;
#if QT_VERSION < QT_VERSION_CHECK(6, 0, 0)
    out.setCodec("UTF-8");
#endif
    out.WriteElementStart("ul", 1);
    for (Book const& book : books) {
        out.WriteElementOpen("li", 1);
        out.WriteAttribute("title", book.year.toHtmlEscaped());
        out.WriteElementClose("li", 1);
        out.Write(book.title.toHtmlEscaped());
        out.WriteElementEnd("li", 0);
    }
    out.WriteElementEnd("ul", 1);
    out.flush();
    return out.status() == QTextStream::Ok;
}

} // namespace

int main(int argc, char** argv)
{
    QFile file(QFile::decodeName(argc > 1 ? argv[1] : ""));
    if (!file.open(QIODevice::ReadOnly)) {
        QTextStream(stderr) << file.fileName() << ": " << file.errorString() << '\n';
        return 2;
    }

    TorkXmlGuard source(&file);
    QXmlSimpleReader reader;
    source.Watch(reader);
    BookReader books;
    reader.setContentHandler(&books);
    reader.setErrorHandler(&books);
    if (!reader.parse(source)) {
        QString report;
        books.FormatErrors(report);
        QTextStream(stderr) << report;
        return 1;
    }
    if (!WriteList(QFile::decodeName(argc > 2 ? argv[2] : ""), books.m_books)) {
        QTextStream(stderr) << "cannot write\n";
        return 2;
    }
    return 0;
}
