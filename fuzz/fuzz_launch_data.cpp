// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The launch data file: any text either fails or sets options, and never crashes the program.

#include "FuzzInput.h"
#include "XmlMutator.h"

#include "app/LaunchOptionParser.h"

#include <algorithm>
#include <clocale>

namespace {

bool IsSet(LaunchOption const* option)
{
    return option->isSet;
}

} // namespace

extern "C" int LLVMFuzzerInitialize(int*, char***)
{
    std::setlocale(LC_ALL, ""); // as an application does: the text is converted to its encoding
    return 0;
}

extern "C" size_t LLVMFuzzerCustomMutator(uint8_t* data, size_t size, size_t maximum,
                                          unsigned int seed)
{
    return MutateDocument(data, size, maximum, seed, {"arg", "key", "organization", "product"});
}

extern "C" int LLVMFuzzerTestOneInput(uint8_t const* data, size_t size)
{
    LaunchOptionParser parser;
    parser.AddOption(new LaunchOption("organization", "organization", "o", 1, "organization"));
    parser.AddOption(new LaunchOption("product", "product", "p", 1, "product"));

    QString text = QString::fromUtf8(reinterpret_cast<char const*>(data), int(size));
    const bool parsed = parser.ParseOptions(text);
    auto const& options = parser.options;
    const bool anySet = std::any_of(options.begin(), options.end(), IsSet);

    Require(options.size() == 2);
    // A failure without a message is a syntax error, and then nothing at all is applied.
    if (parser.errorText.isEmpty())
        Require(parsed || !anySet);
    else
        Require(!parsed && parser.errorText.startsWith("Unknown key = "));
    for (LaunchOption const* option : options)
        Require(option->isSet || option->value.isEmpty());
    return 0;
}
