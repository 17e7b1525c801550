// SPDX-License-Identifier: MIT
#include "pegasus/cmpi/broker/MessageText.h"

#include <array>
#include <charconv>
#include <vector>

namespace Pegasus::cmpi {
namespace {

constexpr CMPICount kMaxArguments = 10; // $0 to $9

std::string textOf(const char* text)
{
    return text == nullptr ? std::string() : std::string(text);
}

// As printf's %f in the C locale.
std::string fixedPoint(double value)
{
    std::array<char, 512> text{}; // the longest double has 309 digits before the point
    const auto end = std::to_chars(text.data(), text.data() + text.size(), value, std::chars_format::fixed, 6).ptr;
    return {text.data(), end};
}

std::string nextArgument(va_list args)
{
    const int type = va_arg(args, int);
    switch (type) {
    case CMPI_sint8:
    case CMPI_sint16:
    case CMPI_sint32:
        return std::to_string(va_arg(args, int));
    case CMPI_uint8:
    case CMPI_uint16:
    case CMPI_uint32:
        return std::to_string(va_arg(args, unsigned int));
    case CMPI_boolean:
        return va_arg(args, int) != 0 ? "true" : "false";
    case CMPI_sint64:
        return std::to_string(va_arg(args, CMPISint64));
    case CMPI_uint64:
        return std::to_string(va_arg(args, CMPIUint64));
    case CMPI_real32:
    case CMPI_real64:
        return fixedPoint(va_arg(args, double));
    case CMPI_chars:
        return textOf(va_arg(args, const char*));
    case CMPI_string: {
        const CMPIString* string = va_arg(args, const CMPIString*);
        return string == nullptr ? std::string() : textOf(static_cast<const char*>(string->hdl));
    }
    default: // unknown, but every other kind is passed as a pointer
        va_arg(args, const void*);
        return {};
    }
}

} // namespace

std::string formatMessage(const char* text, CMPICount count, va_list args)
{
    std::vector<std::string> arguments;
    for (CMPICount i = 0; i < count && i < kMaxArguments; ++i) {
        arguments.push_back(nextArgument(args));
    }

    std::string result;
    for (const char* at = text; at != nullptr && *at != '\0'; ++at) {
        if (*at != '$') {
            result += *at;
        } else if (at[1] >= '0' && at[1] <= '9') { // a place without an argument leaves nothing
            const auto place = static_cast<std::size_t>(*++at - '0');
            result += place < arguments.size() ? arguments[place] : std::string();
        }
    }
    return result;
}

} // namespace Pegasus::cmpi
