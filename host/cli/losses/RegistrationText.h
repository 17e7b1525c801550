// SPDX-License-Identifier: MIT
#pragma once

#include <string>
#include <vector>

namespace vrxhost {

// Returns: what the modules of a registration file name as their libraries ("acme" for libacme.so).
std::vector<std::string> LocationsOf(const std::string& registrationFile);

// The server refuses a registration whose provider or module it does not know, and its sentence names neither. The file
// has the names: this compares them with each other.
// Returns: which provider or module the file names without an instance, and which it has, as the end of a sentence;
// empty when the names agree or the file cannot be read.
std::string DescribeUnknownNames(const std::string& registrationFile);

} // namespace vrxhost
