#include "pegasus/wire/XmlEscape.h"

#include "pegasus/base/Text.h"

namespace Pegasus::wire {
namespace {

// What a character becomes in XML text; null when it stays as it is.
const char* entityOf(char c)
{
    switch (c) {
    case '&':
        return "&amp;";
    case '<':
        return "&lt;";
    case '>':
        return "&gt;";
    case '"':
        return "&quot;";
    case '\'':
        return "&apos;";
    default:
        return nullptr;
    }
}

bool isControl(char c)
{
    return static_cast<unsigned char>(c) < 0x20 || c == 0x7F;
}

void appendCharacterReference(std::string& out, char c)
{
    out += "&#";
    out += std::to_string(static_cast<unsigned char>(c));
    out += ';';
}

} // namespace

void appendEscaped(std::string& out, std::string_view text)
{
    for (std::size_t i = 0; i < text.size(); ++i) {
        const char c = text[i];
        const bool isEdge = i == 0 || i + 1 == text.size();
        if (const char* entity = entityOf(c)) {
            out += entity;
        } else if (isControl(c) || (c == ' ' && (isEdge || text[i - 1] == ' '))) {
            appendCharacterReference(out, c);
        } else {
            out += c;
        }
    }
}

void appendEscaped(std::string& out, const String& text)
{
    appendEscaped(out, base::utf8(text));
}

} // namespace Pegasus::wire
