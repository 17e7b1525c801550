// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/wire/XmlText.h"

#include <Pegasus/Common/CIMType.h>
#include <Pegasus/Common/String.h>

#include <string>

namespace Pegasus::wire {

// Attributes of elements, as the encoder writes them: each function appends ` name="value"` to `out`. Thread: any.

// The value is escaped.
inline void appendAttribute(std::string& out, const char* name, const String& value)
{
    out += ' ';
    out += name;
    out += "=\"";
    appendEscaped(out, value);
    out += '"';
}

// Requires: nothing in the value needs an escape.
inline void appendAttribute(std::string& out, const char* name, const char* value)
{
    out += ' ';
    out += name;
    out += "=\"";
    out += value;
    out += '"';
}

// The name of a type. Embedded objects travel as strings.
inline void appendType(std::string& out, const char* attribute, CIMType type)
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
