// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The program that docs/xml.md shows; tst_DocSamples compares them and runs it.

#include "common/xml/TorkErrorHandler.h"
#include "common/xml/TorkXmlGuard.h"
#include "common/xml/TorkXml_FlushUnknownElement.h"
#include "common/xml/TorkXml_ParseManager_Base.h"
#include "common/xml/TorkXml_ParseState_Base.h"

#include <QFile>
#include <QStringList>
#include <QTextStream>
#include <QXmlSimpleReader>

// <library>: collects the text of each <title> and skips all other elements.
class LibraryState : public TorkXml_ParseState_Base
{
public:
    LibraryState(QString const& element, TorkXml_ParseManager_Base* manager, QStringList& titles)
        : TorkXml_ParseState_Base(element, manager), m_titles(titles)
    {}

    bool CanHandleElement(QString const& name) override
    {
        if (name == "title")
            m_titles.append(QString());
        return name == "title";
    }

    TorkXml_ParseState_Base* GetNextState(QString const& name) override
    {
        return new TorkXml_FlushUnknownElement(name, ParseManager());
    }

    // Also gets the attributes of <library>, and the white space between elements.
    bool ProcessContent(QString const&, QString const& content) override
    {
        if (CurrentElement() == "title")
            m_titles.last() += content; // long texts arrive in pieces
        return true;
    }

private:
    QStringList& m_titles;
};

class TitleReader : public TorkXml_ParseManager_Base
{
public:
    QStringList m_titles;

    TorkXml_ParseState_Base* GetFirstState(QString const& name) override
    {
        return name == "library" ? new LibraryState(name, this, m_titles) : nullptr;
    }

    // A malformed document, one beyond a limit, and the position where a parse was stopped.
    bool fatalError(QXmlParseException const& exception) override
    {
        TorkErrorHandler formatter(nullptr);
        AppendError(formatter.format(exception));
        return false;
    }
};

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
    TitleReader titles;
    reader.setContentHandler(&titles);
    reader.setErrorHandler(&titles);
    if (!reader.parse(source)) {
        QString report;
        titles.FormatErrors(report);
        QTextStream(stderr) << report;
        return 1;
    }
    QTextStream(stdout) << titles.m_titles.join('\n') << '\n';
    return 0;
}
