// SPDX-License-Identifier: MIT
// What went wrong, as text: what an exception says, what an unknown name may have meant, and how the user hears of it.
#pragma once

#include "host/cli/model/Loss.h"

#include <functional>
#include <string>
#include <vector>

namespace vrxhost {

// What a command asks for does not exist: a sentence.
class TRequestError : public TFailure
{
  public:
    using TFailure::TFailure;
};

// Writes a sentence of the host's own to standard error, after "vrxhost: ".
void ReportError(const std::string& sentence);

// Has something else write the lines of ReportError from now on; null for standard error alone.
// Thread: one at a time, while nothing is reported.
void RouteReports(std::function<void(const std::string& line)> write);

// Returns: the text of the exception being handled: a status code with its text, a standard exception's text, or the
// type's name. Requires: called inside a catch block.
std::string DescribeCurrentException();

// Runs a call into the plug-in and keeps every exception, of whatever type, from going further.
// Returns: empty after a normal return, else the exception's text.
template <typename Call> std::string ErrorOf(const Call& call)
{
    try {
        call();
        return "";
    } catch (...) {
        return DescribeCurrentException();
    }
}

// For the end of a sentence about an unknown name.
// Returns: "; did you mean NAME?" with the most similar of the names, case ignored; empty when all are too different.
std::string Suggestion(const std::string& unknown, const std::vector<std::string>& names);

} // namespace vrxhost
