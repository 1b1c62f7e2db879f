// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The program that docs/start-here.md shows; tst_DocSamples compares them and runs it.

#include "common/xml/TorkXmlGuard.h"
#include "common/xml/TorkXml_ParseManager_Base.h"
#include "common/xml/TorkXml_ParseState_Base.h"

#include <QFile>
#include <QTextStream>
#include <QXmlLocator>
#include <QXmlSimpleReader>

// Counts the pieces in an <order>, and stops at the first item that is wrong.
class OrderReader : public TorkXml_ParseManager_Base
{
public:
    int m_pieces = 0;

    bool hasErrors() const { return m_hasErrors; }

    void Stop(QString const& reason)
    {
        AppendError(QString("Line %1, column %2: %3")
                        .arg(m_locator->lineNumber())
                        .arg(m_locator->columnNumber())
                        .arg(reason));
        m_hasErrors = true;
    }

    // The reader calls this before it parses; the locator is the reader's.
    void setDocumentLocator(QXmlLocator* locator) override { m_locator = locator; }

    // A state stops the parse itself only for text: for attributes and at the end of its element,
    // its answer is ignored.
    bool startElement(QString const& uri, QString const& name, QString const& qName,
                      QXmlAttributes const& attributes) override
    {
        return TorkXml_ParseManager_Base::startElement(uri, name, qName, attributes) &&
               !m_hasErrors;
    }

    bool endElement(QString const& uri, QString const& name, QString const& qName) override
    {
        return TorkXml_ParseManager_Base::endElement(uri, name, qName) && !m_hasErrors;
    }

    // Also called after an error of ours, with nothing new.
    bool fatalError(QXmlParseException const& exception) override
    {
        if (!m_hasErrors)
            Stop(exception.message());
        return false;
    }

protected:
    TorkXml_ParseState_Base* GetFirstState(QString const& name) override;

private:
    QXmlLocator* m_locator = nullptr;
    bool m_hasErrors = false;
};

class ItemState : public TorkXml_ParseState_Base
{
public:
    ItemState(QString const& element, OrderReader& reader)
        : TorkXml_ParseState_Base(element, &reader), m_reader(reader)
    {}

    bool ProcessContent(QString const& name, QString const& content) override
    {
        if (name == "count") {
            m_count = content.toInt();
            if (m_count < 1)
                m_reader.Stop("not a count: " + content);
        }
        return true;
    }

    bool EndElement(QString const&) override
    {
        if (m_count < 1)
            m_reader.Stop("an item without a count");
        m_reader.m_pieces += m_count;
        return true;
    }

private:
    OrderReader& m_reader;
    int m_count = 0;
};

class OrderState : public TorkXml_ParseState_Base
{
public:
    OrderState(QString const& element, OrderReader& reader)
        : TorkXml_ParseState_Base(element, &reader), m_reader(reader)
    {}

    bool ProcessContent(QString const&, QString const& content) override
    {
        const bool isSpace = content.trimmed().isEmpty();
        if (!isSpace)
            m_reader.Stop("text between the items: " + content.trimmed());
        return isSpace;
    }

    TorkXml_ParseState_Base* GetNextState(QString const& name) override
    {
        return name == "item" ? new ItemState(name, m_reader) : nullptr;
    }

private:
    OrderReader& m_reader;
};

TorkXml_ParseState_Base* OrderReader::GetFirstState(QString const& name)
{
    return name == "order" ? new OrderState(name, *this) : nullptr;
}

int main(int argc, char** argv)
{
    QFile file(QFile::decodeName(argc > 1 ? argv[1] : ""));
    if (!file.open(QIODevice::ReadOnly))
        return 2;

    TorkXmlGuard source(&file);
    QXmlSimpleReader reader;
    source.Watch(reader);
    OrderReader order;
    reader.setContentHandler(&order);
    reader.setErrorHandler(&order);
    reader.parse(source);
    if (order.hasErrors()) {
        QString report;
        order.FormatErrors(report);
        QTextStream(stderr) << report;
        return 1;
    }
    QTextStream(stdout) << order.m_pieces << " pieces\n";
    return 0;
}
