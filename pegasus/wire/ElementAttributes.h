// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/wire/XmlText.h"

#include <Pegasus/Common/CIMType.h>
#include <Pegasus/Common/String.h>

#include <cstring>
#include <string>
#include <string_view>

namespace Pegasus::wire {

// Attributes of elements, as the encoder writes them: each function appends ` name="value"` to `out`. Thread: any.

// Up to and including the quote before the value. Most names are known to the compiler, which then makes one text of
// it.
// Requires: a name of 32 bytes at most.
inline void beginAttribute(std::string& out, std::string_view name)
{
    char start[40];
    start[0] = ' ';
    std::memcpy(start + 1, name.data(), name.size());
    std::memcpy(start + 1 + name.size(), "=\"", 2);
    out.append(start, name.size() + 3);
}

// The value is escaped.
inline void appendAttribute(std::string& out, std::string_view name, const String& value)
{
    beginAttribute(out, name);
    appendEscaped(out, value);
    out += '"';
}

// Requires: nothing in the value needs an escape.
inline void appendAttribute(std::string& out, std::string_view name, const char* value)
{
    beginAttribute(out, name);
    out += value;
    out += '"';
}

// The name of a type. Embedded objects travel as strings.
inline void appendType(std::string& out, std::string_view attribute, CIMType type)
{
    const bool isEmbedded = type == CIMTYPE_OBJECT || type == CIMTYPE_INSTANCE;
    appendAttribute(out, attribute, isEmbedded ? "string" : cimTypeToString(type));
}

// Marks an embedded object in both spellings that peers know; nothing for other types.
inline void appendEmbeddedMark(std::string& out, CIMType type)
{
    if (type != CIMTYPE_OBJECT && type != CIMTYPE_INSTANCE) {
        return;
    }
    appendAttribute(out, "EmbeddedObject", cimTypeToString(type));
    appendAttribute(out, "EMBEDDEDOBJECT", cimTypeToString(type));
}

} // namespace Pegasus::wire
