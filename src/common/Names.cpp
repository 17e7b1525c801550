// SPDX-License-Identifier: MIT
#include "src/common/Names.h"

#include "src/common/CoreLog.h"

#include <host/TVRXException.h>

#include <algorithm>
#include <cctype>

namespace NKOLVRX20 {

namespace {

// The C library's tests: in an 8-bit locale of the host's process the locale's letters count too.
bool IsNamePart(char character)
{
    return character == '_' || std::isalnum(static_cast<unsigned char>(character)) != 0;
}

} // namespace

std::string LowerCase(std::string text)
{
    for (char& character : text) {
        character = static_cast<char>(std::tolower(static_cast<unsigned char>(character)));
    }
    return text;
}

bool IsCimName(const std::string& name)
{
    const bool startsWithDigit = !name.empty() && std::isdigit(static_cast<unsigned char>(name.front())) != 0;
    return !startsWithDigit && std::all_of(name.begin(), name.end(), IsNamePart);
}

std::string NormalizedName(const std::string& name)
{
    std::string normalized = LowerCase(name);
    if (!IsCimName(normalized)) {
        LogFailure("PEGASUS: CIM name '", name, "' is invalid");
        throw TVRXException(TVRXStatusCode::kInvalidName);
    }
    return normalized;
}

} // namespace NKOLVRX20
