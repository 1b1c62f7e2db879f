// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The XML error handler: any problem is formatted, stored, and answered as documented.

#include "FuzzInput.h"

#include "common/xml/TorkErrorHandler.h"

#include <QXmlParseException>

namespace {

// Placeholders inside the texts are substituted too, so only texts without any have a simple
// expected message.
bool HoldsPlaceholder(QXmlParseException const& problem)
{
    return problem.message().contains('%') || problem.publicId().contains('%') ||
           problem.systemId().contains('%');
}

QString Wording(QXmlParseException const& problem)
{
    return "Xml Parse Failure.\n" + problem.message() + "\nPublic ID: " + problem.publicId() +
           ", System ID: " + problem.systemId() +
           "\nLine: " + QString::number(problem.lineNumber()) +
           ", Column: " + QString::number(problem.columnNumber());
}

} // namespace

extern "C" int LLVMFuzzerInitialize(int*, char***)
{
    SilenceMessages();
    return 0;
}

extern "C" int LLVMFuzzerTestOneInput(uint8_t const* data, size_t size)
{
    FuzzInput input(data, size);
    TorkErrorHandler handler(nullptr);
    Require(handler.errorString().isEmpty());

    while (!input.atEnd()) {
        const uint8_t kind = input.byte();
        const QString message = input.text();
        const int column = input.number();
        const int line = input.number();
        const QString publicId = input.text();
        const QXmlParseException problem(message, column, line, publicId, input.text());
        if (kind % 3 == 0)
            Require(handler.warning(problem));
        else if (kind % 3 == 1)
            Require(handler.error(problem));
        else
            Require(!handler.fatalError(problem));

        if (HoldsPlaceholder(problem))
            Require(handler.errorString().startsWith("Xml Parse Failure.\n"));
        else
            Require(handler.errorString() == Wording(problem));
    }
    return 0;
}
