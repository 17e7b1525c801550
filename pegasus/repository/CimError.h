#pragma once

#include <Pegasus/Common/CIMName.h>
#include <Pegasus/Common/Exception.h>

#include <string>

namespace Pegasus::repository {

// Throws: CIMException with the status code and the UTF-8 text as its message.
[[noreturn]] inline void fail(CIMStatusCode code, const std::string& text)
{
    throw CIMException(code, String(text.c_str()));
}

inline std::string utf8(const String& text)
{
    return std::string(text.getCString());
}

inline std::string utf8(const CIMName& name)
{
    return name.isNull() ? std::string() : utf8(name.getString());
}

} // namespace Pegasus::repository
