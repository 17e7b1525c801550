// SPDX-License-Identifier: MIT
#include "pegasus/repository/LookupKey.h"

#include "pegasus/base/Text.h"
#include "pegasus/repository/LookupKey.h"

#include <charconv>
#include <cstdint>

namespace Pegasus::repository {

namespace {

// Returns: an integer in decimal, whatever its spelling ("-0" becomes "0"); any other text unchanged.
std::string canonicalNumber(const std::string& text)
{
    const bool isNegative = !text.empty() && text[0] == '-';
    const std::string digits = text.substr(isNegative ? 1 : 0);
    const bool isHex = digits.size() > 2 && digits[0] == '0' && (digits[1] == 'x' || digits[1] == 'X');
    const char* begin = digits.data() + (isHex ? 2 : 0);
    const char* end = digits.data() + digits.size();
    std::uint64_t magnitude = 0;
    const auto [stop, error] = std::from_chars(begin, end, magnitude, isHex ? 16 : 10);
    if (error != std::errc() || stop != end) {
        return text;
    }
    return (isNegative && magnitude != 0 ? "-" : "") + std::to_string(magnitude);
}

std::string canonicalValue(const CIMKeyBinding& key)
{
    switch (key.getType()) {
    case CIMKeyBinding::REFERENCE: {
        const CIMObjectPath path(key.getValue());
        return nameKey(path.getNameSpace()) + ":" + pathKey(path);
    }
    case CIMKeyBinding::BOOLEAN:
        return base::foldCase(base::utf8(key.getValue()));
    case CIMKeyBinding::NUMERIC:
        return canonicalNumber(base::utf8(key.getValue()));
    default:
        return base::utf8(key.getValue());
    }
}

} // namespace

// Each value follows its length, which keeps a value apart from a further key. CIMObjectPath keeps its keys sorted.
std::string pathKey(const CIMObjectPath& path)
{
    std::string text = nameKey(path.getClassName());
    const Array<CIMKeyBinding>& keys = path.getKeyBindings();
    for (Uint32 i = 0; i < keys.size(); ++i) {
        const std::string value = canonicalValue(keys[i]);
        text += "." + nameKey(keys[i].getName()) + "=" + std::to_string(value.size()) + ":" + value;
    }
    return text;
}

} // namespace Pegasus::repository
