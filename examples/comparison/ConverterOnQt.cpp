// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The converter on plain Qt: XML of books in, HTML out.

#include <QFile>
#include <QTextStream>
#include <QVector>
#include <QXmlStreamReader>
#include <QXmlStreamWriter>

namespace {

struct Book
{
    QString year;
    QString title;
};

Book ReadBook(QXmlStreamReader& reader)
{
    Book book;
    book.year = reader.attributes().value("year").toString();
    while (reader.readNextStartElement()) {
        if (reader.name() == QLatin1String("title"))
            book.title += reader.readElementText(QXmlStreamReader::IncludeChildElements);
        else
            reader.skipCurrentElement();
    }
    return book;
}

QVector<Book> ReadBooks(QXmlStreamReader& reader)
{
    QVector<Book> books;
    if (reader.readNextStartElement() && reader.name() != QLatin1String("books"))
        reader.raiseError("not a list of books");
    while (reader.readNextStartElement()) {
        if (reader.name() == QLatin1String("book"))
            books.append(ReadBook(reader));
        else
            reader.raiseError("unknown element " + reader.name().toString());
    }
    while (!reader.atEnd())
        reader.readNext(); // what follows the list may be wrong, too
    return books;
}

bool WriteList(QString const& path, QVector<Book> const& books)
{
    QFile file(path);
    if (!file.open(QIODevice::WriteOnly))
        return false;
    QXmlStreamWriter out(&file);
    out.setAutoFormatting(true);
    out.writeStartElement("ul");
    for (Book const& book : books) {
        out.writeStartElement("li");
        out.writeAttribute("title", book.year);
        out.writeCharacters(book.title);
        out.writeEndElement();
    }
    out.writeEndElement();
    return !out.hasError() && file.flush();
}

} // namespace

int main(int argc, char** argv)
{
    QFile file(QFile::decodeName(argc > 1 ? argv[1] : ""));
    if (!file.open(QIODevice::ReadOnly)) {
        QTextStream(stderr) << file.fileName() << ": " << file.errorString() << '\n';
        return 2;
    }

    QXmlStreamReader reader(&file);
    const QVector<Book> books = ReadBooks(reader);
    if (reader.hasError()) {
        QTextStream(stderr) << "Line " << reader.lineNumber() << ", column "
                            << reader.columnNumber() << ": " << reader.errorString() << '\n';
        return 1;
    }
    if (!WriteList(QFile::decodeName(argc > 2 ? argv[2] : ""), books)) {
        QTextStream(stderr) << "cannot write\n";
        return 2;
    }
    return 0;
}
