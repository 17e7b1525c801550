// SPDX-License-Identifier: MIT
// Names of CIM elements and of configuration entries: small and capital letters are the same.
#pragma once

#include <string>

namespace vrxhost {

// Returns: true when only the case of letters differs.
bool IsSame(const std::string& left, const std::string& right);

// Returns: the text with its capital letters made small.
std::string SmallLetters(std::string text);

} // namespace vrxhost
