// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/base/Utf8.h"

#include <Pegasus/Common/CIMName.h>
#include <Pegasus/Common/String.h>

#include <string>
#include <string_view>

// Texts of CIM objects (UTF-16) as UTF-8, and back. A text may contain U+0000; getCString() would cut it there.
// Thread: any.
namespace Pegasus::base {

// A lone surrogate becomes its three bytes.
inline void appendUtf8(std::string& out, const String& text)
{
    appendUtf8(out, text.getChar16Data(), text.size());
}

inline std::string utf8(const String& text)
{
    std::string out;
    appendUtf8(out, text);
    return out;
}

// Returns: the name; empty for a null name.
inline std::string utf8(const CIMName& name)
{
    return utf8(name.getString());
}

inline std::string utf8(const CIMNamespaceName& name)
{
    return utf8(name.getString());
}

// Throws: Exception "The byte sequence starting at index ... is not valid UTF-8 encoding: ...".
String fromUtf8(std::string_view text);

// For text from elsewhere that must get through: each byte outside valid UTF-8 becomes U+FFFD.
String fromUtf8Repaired(std::string_view text);

} // namespace Pegasus::base
