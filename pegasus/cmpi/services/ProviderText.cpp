#include "pegasus/cmpi/services/ProviderText.h"

#include <Pegasus/Common/Exception.h>

#include <algorithm>
#include <cstring>

namespace Pegasus::cmpi {
namespace {

// The length of the well-formed UTF-8 sequence at `at`, 0 when there is none.
std::size_t sequenceLength(const unsigned char* at, const unsigned char* end)
{
    const unsigned char lead = *at;
    if (lead < 0x80) {
        return 1;
    }
    const std::size_t length = lead >= 0xF0 && lead <= 0xF4 ? 4 : lead >= 0xE0 ? 3 : lead >= 0xC2 ? 2 : 0;
    if (length == 0 || lead > 0xF4 || static_cast<std::size_t>(end - at) < length) {
        return 0;
    }
    for (std::size_t i = 1; i < length; ++i) {
        if ((at[i] & 0xC0) != 0x80) {
            return 0;
        }
    }
    const bool overlong = (lead == 0xE0 && at[1] < 0xA0) || (lead == 0xF0 && at[1] < 0x90);
    const bool outside = (lead == 0xED && at[1] > 0x9F) || (lead == 0xF4 && at[1] > 0x8F);
    return overlong || outside ? 0 : length;
}

std::string repaired(const char* text)
{
    const auto* at = reinterpret_cast<const unsigned char*>(text);
    const unsigned char* end = at + std::strlen(text);
    std::string result;
    while (at != end) {
        const std::size_t length = sequenceLength(at, end);
        if (length == 0) {
            result += "\xEF\xBF\xBD";
        } else {
            result.append(reinterpret_cast<const char*>(at), length);
        }
        at += std::max<std::size_t>(length, 1);
    }
    return result;
}

constexpr char lower(char c)
{
    return c >= 'A' && c <= 'Z' ? static_cast<char>(c - 'A' + 'a') : c;
}

} // namespace

String fromUtf8(const char* text)
{
    try {
        return String(text);
    } catch (const Exception&) {
        return String(repaired(text).c_str());
    }
}

std::string utf8(const String& text)
{
    return static_cast<const char*>(text.getCString());
}

bool sameName(std::string_view left, std::string_view right)
{
    return left.size() == right.size() &&
           std::equal(left.begin(), left.end(), right.begin(), [](char a, char b) { return lower(a) == lower(b); });
}

} // namespace Pegasus::cmpi
