#pragma once

#include <Pegasus/Common/CIMName.h>
#include <Pegasus/Common/String.h>

#include <string>
#include <string_view>

namespace Pegasus::cmpi {

// Converts text that a provider passes. Providers pass on what the hardware reports, so the bytes may be anything.
// Requires: `text` ends in a zero byte.
// Returns: the text as a String; each byte that is not part of well-formed UTF-8 becomes U+FFFD.
// Throws: std::bad_alloc only.
String fromUtf8(const char* text);

std::string utf8(const String& text);
inline std::string utf8(const CIMName& name)
{
    return utf8(name.getString());
}

// ASCII case-insensitive, as CIM compares names.
bool sameName(std::string_view left, std::string_view right);

} // namespace Pegasus::cmpi
