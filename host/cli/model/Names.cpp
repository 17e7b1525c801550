// SPDX-License-Identifier: MIT
#include "host/cli/model/Names.h"

#include <algorithm>
#include <cctype>

#include <strings.h>

namespace vrxhost {

bool IsSame(const std::string& left, const std::string& right)
{
    return ::strcasecmp(left.c_str(), right.c_str()) == 0;
}

std::string SmallLetters(std::string text)
{
    std::transform(text.begin(), text.end(), text.begin(), [](unsigned char c) { return std::tolower(c); });
    return text;
}

} // namespace vrxhost
