#pragma once

#include <Pegasus/Common/CIMName.h>
#include <Pegasus/Common/String.h>

#include <string>
#include <string_view>

namespace Pegasus::cmpi {

// Returns: the string of UTF-8 text; a byte that is not UTF-8 becomes U+FFFD, since providers pass on what hardware
// says. Throws: nothing but lack of memory.
String fromUtf8(const char* text);

std::string utf8(const String& text);
inline std::string utf8(const CIMName& name)
{
    return utf8(name.getString());
}

// ASCII case-insensitive, as CIM compares names.
bool sameName(std::string_view left, std::string_view right);

// Throws: CMPI_RC_ERR_INVALID_PARAMETER for text that is no CIM name.
CIMName requireName(const char* text);

} // namespace Pegasus::cmpi
