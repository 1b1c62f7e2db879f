// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/ByteLiteral.h"
#include "app/logfile/LogEncoding.h"
#include "app/logfile/LogFilter.h"

#include <optional>
#include <vector>

namespace Velocor {

/// Finds the lines that a text filter has to be asked about, without decoding them.
///
/// A filter's texts, its required terms, and the texts that every match of its expression contains
/// are looked for in the bytes of a file. A line without them is no candidate: the answer for it is
/// known. An expression is not asked about such a line either if it would take too long for it.
///
/// A plain value; any thread.
///
///     CandidateSearch search(filter, encoding);
///     known = search.Answer(line, length);
///     match = known ? *known : filter.Find(encoding.Decode(line, length));
class CandidateSearch
{
public:
    /// @param encoding  of the bytes; in UTF-16, every line is a candidate
    CandidateSearch(LogFilter const& filter, LogEncoding const& encoding);

    /// What the filter finds in every line that is no candidate: Yes or No.
    LogFilter::Match answer() const { return m_answer; }

    /// What the filter finds in a line, if its bytes tell; otherwise it has to be asked.
    ///
    /// @param line  without its line end
    std::optional<LogFilter::Match> Answer(char const* line, int length) const;

    /// Finds the first line in [at, end) that may be a candidate.
    ///
    /// @param at  where a line starts
    /// @return a place in that line; `end` if no line there is a candidate
    char const* Find(char const* at, char const* end) const;

    /// Makes Find() faster in files like this sample.
    void Learn(char const* sample, int length);

private:
    bool askAbout(QString const& text, Qt::CaseSensitivity sensitivity, LogEncoding const& encoding,
                  std::vector<ByteLiteral>& literals);

    LogFilter::Match m_answer = LogFilter::Yes;
    bool m_isEveryLine = false;
    bool m_isWhole = true;               // the literals are all of the filter
    std::vector<ByteLiteral> m_required; // without one of them, a line is no candidate ...
    std::vector<ByteLiteral> m_hiding;   // ... unless it has one of these ...
    std::vector<ByteLiteral> m_unclear;  // ... or of these, which may equal an ASCII letter
};

} // namespace Velocor
