#include "pegasus/repository/Names.h"

#include "pegasus/repository/Failure.h"

#include <charconv>
#include <cstdint>

namespace Pegasus::repository {

std::string foldCase(std::string text)
{
    for (char& c : text) {
        if (c >= 'A' && c <= 'Z') {
            c = static_cast<char>(c - 'A' + 'a');
        }
    }
    return text;
}

std::string folded(const CIMName& name)
{
    return foldCase(utf8(name));
}

std::string folded(const CIMNamespaceName& name)
{
    return name.isNull() ? std::string() : foldCase(utf8(name.getString()));
}

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

} // namespace Pegasus::repository
