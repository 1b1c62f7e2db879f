// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The search for a filter's texts in bytes: if it knows what the filter finds in a line, the filter
// finds that, whatever the text, the expression, the terms and the encoding.

#include "FuzzInput.h"

#include "app/logfile/CandidateSearch.h"

using namespace Velocor;

extern "C" int LLVMFuzzerTestOneInput(uint8_t const* data, size_t size)
{
    FuzzInput input(data, size);
    const unsigned options = input.byte();
    const LogEncoding encoding = options & 1U ? LogEncoding::Utf8 : LogEncoding::Latin1;
    LogFilter filter;
    if (!filter.SetText(input.text(), options & 2U, options & 4U))
        return 0;
    const LogTerms required(input.text(), options & 8U);
    filter.SetTerms(required, LogTerms(input.text(), options & 16U));
    const QByteArray line = input.rest().replace('\n', ' ');

    CandidateSearch search(filter, encoding);
    if (options & 32U)
        search.Learn(line.constData(), line.size());
    const std::optional<LogFilter::Match> known = search.Answer(line.constData(), line.size());
    const LogFilter::Match match = filter.Find(encoding.Decode(line.constData(), line.size()));
    Require(!known || match == *known || match == LogFilter::TooLong);
    const bool isFound = search.Find(line.constBegin(), line.constEnd()) != line.constEnd();
    Require(isFound || line.isEmpty() || known == search.answer());
    return 0;
}
