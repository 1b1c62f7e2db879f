// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The XML error handler: any problem is worded, kept, and answered as promised.

#include "FuzzInput.h"

#include "common/xml/TorkErrorHandler.h"

#include <QXmlParseException>

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
        const QXmlParseException problem(message, input.number(), input.number(), input.text(),
                                         input.text());
        if (kind % 3 == 0)
            Require(handler.warning(problem));
        else if (kind % 3 == 1)
            Require(handler.error(problem));
        else
            Require(!handler.fatalError(problem));
        Require(handler.errorString().startsWith("Xml Parse Failure.\n"));
    }
    return 0;
}
