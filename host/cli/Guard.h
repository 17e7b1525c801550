#pragma once

#include <string>

namespace vrxhost {

// Returns: what the exception being handled says: a status code and its text, a standard exception's text, or the
// type's name. Requires: called inside a catch block.
std::string DescribeCurrentException();

// Runs a call into the plug-in; nothing that it throws goes further.
// Returns: empty when it returned, else what it threw.
template <typename Call> std::string Guarded(const Call& call)
{
    try {
        call();
        return "";
    } catch (...) {
        return DescribeCurrentException();
    }
}

} // namespace vrxhost
