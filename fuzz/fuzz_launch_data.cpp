// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The launch data file: any text either fails or sets options, and never harms the program.

#include "FuzzInput.h"

#include "app/LaunchOptionParser.h"

extern "C" int LLVMFuzzerTestOneInput(uint8_t const* data, size_t size)
{
    LaunchOptionParser parser;
    parser.AddOption(new LaunchOption("organization", "organization", "o", 1, "organization"));
    parser.AddOption(new LaunchOption("product", "product", "p", 1, "product"));

    QString text = QString::fromUtf8(reinterpret_cast<char const*>(data), int(size));
    const bool parsed = parser.ParseOptions(text);
    Require(!parsed || parser.errorText.isEmpty());
    for (LaunchOption const* option : parser.options)
        Require(option->isSet || option->value.isEmpty());
    return 0;
}
