// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Both XML writers with any sequence of calls: the same results and the same bytes. A sequence of
// balanced calls makes a document, and a reader finds in it what was written.

#include "FuzzInput.h"

#include "common/xml/TorkXmlFile.h"
#include "common/xml/TorkXmlStream.h"

#include <QTemporaryDir>
#include <QXmlDefaultHandler>
#include <QXmlInputSource>
#include <QXmlSimpleReader>

namespace {

// One call of one of the operations, on both writers.
struct Call
{
    enum Operation : uint8_t {
        Open,
        Close,
        CloseAndEnd,
        Start,
        End,
        Element,
        Attribute,
        ElementValue,
        CurrentIndent,
        Count
    };

    uint8_t operation;
    QString name;
    QString value;
    int indent;
};

template <class Writer>
int Apply(Writer& writer, Call const& call)
{
    switch (call.operation % Call::Count) {
    case Call::Open:
        return writer.WriteElementOpen(call.name, call.indent);
    case Call::Close:
        return writer.WriteElementClose(call.name, call.indent);
    case Call::CloseAndEnd:
        return writer.WriteElementCloseAndEnd(call.name, call.indent);
    case Call::Start:
        return writer.WriteElementStart(call.name, call.indent);
    case Call::End:
        return writer.WriteElementEnd(call.name, call.indent);
    case Call::Element:
        return writer.WriteElement(call.name, call.value);
    case Call::Attribute:
        return writer.WriteAttribute(call.name, call.value);
    case Call::ElementValue:
        return writer.WriteElementValue(call.value);
    default:
        return writer.WriteCurrentIndent();
    }
}

// The writers, side by side.
class BothWriters
{
public:
    explicit BothWriters(QString const& path)
        : m_stream(&m_bytes, QIODevice::WriteOnly), m_file(path)
    {
        Require(m_file.open(QIODevice::WriteOnly));
    }

    void apply(Call const& call)
    {
        const int result = Apply(m_stream, call);
        Require(result == 0 || (result == 1005 && call.name.isEmpty()));
        Require(result == Apply(m_file, call));
    }

    /// The stream's output so far, after checking that the file contains the same.
    QByteArray written()
    {
        m_stream.flush();
        m_file.flush();
        QFile file(m_file.name());
        Require(file.open(QIODevice::ReadOnly));
        Require(file.readAll() == m_bytes);
        return m_bytes;
    }

private:
    QByteArray m_bytes;
    TorkXmlStream m_stream;
    TorkXmlFile m_file;
};

// Records the contents of a document, one line per piece; text of only white space is layout.
class Notes : public QXmlDefaultHandler
{
public:
    bool startElement(QString const&, QString const&, QString const& name,
                      QXmlAttributes const& attributes) override
    {
        endText();
        pieces.append("start " + name);
        for (int i = 0; i < attributes.count(); ++i)
            pieces.append("attribute " + attributes.qName(i) + "=" + attributes.value(i));
        return true;
    }

    bool endElement(QString const&, QString const&, QString const& name) override
    {
        endText();
        pieces.append("end " + name);
        return true;
    }

    bool characters(QString const& text) override
    {
        m_text += text;
        return true;
    }

    QStringList pieces;

private:
    void endText()
    {
        if (!m_text.trimmed().isEmpty())
            pieces.append("text " + m_text);
        m_text.clear();
    }

    QString m_text;
};

// The characters of a text that are allowed in a name; never empty.
QString PlainName(QString const& text)
{
    QString name = "e";
    for (QChar c : text) {
        if (c.unicode() < 128 && c.isLetterOrNumber())
            name += c;
    }
    return name;
}

// The printable ASCII of a text without what would end a CDATA section; never empty.
QString PlainValue(QString const& text)
{
    QString value = "v";
    for (QChar c : text) {
        if (c.unicode() >= ' ' && c.unicode() < 127 && !(c == '>' && value.endsWith("]]")))
            value += c;
    }
    return value;
}

// The characters of a text that are allowed in a quoted attribute, which nothing escapes.
QString PlainAttribute(QString const& text)
{
    QString value = PlainValue(text);
    for (char c : {'<', '&', '"'})
        value.remove(QLatin1Char(c));
    return value;
}

// A document of balanced calls, driven by the input; records what a reader has to find in it.
class Document
{
public:
    Document(BothWriters& writers, FuzzInput& input) : m_writers(writers), m_input(input) {}

    QStringList write()
    {
        start(PlainName(m_input.text()));
        while (!m_input.atEnd()) {
            const uint8_t choice = m_input.byte() % 5;
            const QString text = m_input.text();
            if (choice == 0)
                start(PlainName(text));
            else if (choice == 1 && m_open.size() > 1)
                end();
            else if (choice == 2)
                leaf(PlainName(text), PlainValue(m_input.text()));
            else
                withAttributes(PlainName(text), choice == 3);
        }
        while (!m_open.isEmpty())
            end();
        return m_pieces;
    }

private:
    void start(QString const& name)
    {
        m_writers.apply({Call::Start, name, "", 1});
        m_open.append(name);
        m_pieces.append("start " + name);
    }

    void end()
    {
        const QString name = m_open.takeLast();
        m_writers.apply({Call::End, name, "", 1});
        m_pieces.append("end " + name);
    }

    void leaf(QString const& name, QString const& value)
    {
        m_writers.apply({Call::Element, name, value, 0});
        m_pieces << "start " + name << "text " + value << "end " + name;
    }

    void withAttributes(QString const& name, bool isEmpty)
    {
        m_writers.apply({Call::Open, name, "", 1});
        m_pieces.append("start " + name);
        const int count = m_input.byte() % 8;
        for (int i = 0; i < count; ++i) {
            const QString attribute = "a" + QString::number(i);
            const QString value = PlainAttribute(m_input.text());
            m_writers.apply({Call::Attribute, attribute, value, 0});
            m_pieces.append("attribute " + attribute + "=" + value);
        }
        m_writers.apply({isEmpty ? Call::CloseAndEnd : Call::Close, name, "", isEmpty ? 1 : 0});
        if (isEmpty)
            m_pieces.append("end " + name);
        else
            m_open.append(name);
    }

    BothWriters& m_writers;
    FuzzInput& m_input;
    QStringList m_open;
    QStringList m_pieces;
};

void WriteAnything(BothWriters& writers, FuzzInput& input)
{
    while (!input.atEnd()) {
        const uint8_t operation = input.byte();
        const QString name = input.text();
        const QString value = input.text();
        writers.apply({operation, name, value, static_cast<signed char>(input.byte()) % 8});
    }
    writers.written();
}

void WriteDocument(BothWriters& writers, FuzzInput& input)
{
    const QStringList expected = Document(writers, input).write();
    QXmlInputSource source;
    source.setData(writers.written());
    QXmlSimpleReader reader;
    Notes notes;
    reader.setContentHandler(&notes);
    Require(reader.parse(source));
    Require(notes.pieces == expected);
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(uint8_t const* data, size_t size)
{
    static QTemporaryDir folder;
    BothWriters writers(folder.path() + "/out.xml");
    FuzzInput input(data, size);
    if (input.byte() % 2 == 0)
        WriteDocument(writers, input);
    else
        WriteAnything(writers, input);
    return 0;
}
