// SPDX-License-Identifier: MIT
#include "pegasus/mof/MofError.h"

#include "pegasus/base/Utf8.h"

#include <algorithm>
#include <cstdio>

namespace Pegasus::mof {

namespace {

std::size_t lengthByLead(unsigned char lead)
{
    if (lead < 0x80) {
        return 1;
    }
    return lead < 0xE0 ? 2 : lead < 0xF0 ? 3 : 4;
}

// Returns: the length of the character at the start that a terminal shows as it is; 0 when it is to be escaped.
std::size_t shownLength(std::string_view text)
{
    const auto lead = static_cast<unsigned char>(text[0]);
    if ((lead < 0x20 && lead != '\t') || lead == 0x7F) {
        return 0;
    }
    const std::string_view character = text.substr(0, lengthByLead(lead));
    const bool isControl = lead == 0xC2 && character.size() == 2 && static_cast<unsigned char>(character[1]) < 0xA0;
    return !isControl && base::isUtf8(character) ? character.size() : 0;
}

// Returns: blanks below a text. Tabs stay tabs, so that the caret lines up in any terminal.
std::string caretIndent(const std::string& textBefore)
{
    std::string indent;
    for (const char c : textBefore) {
        const bool continuesCharacter = (static_cast<unsigned char>(c) & 0xC0u) == 0x80u;
        if (!continuesCharacter) {
            indent += c == '\t' ? '\t' : ' ';
        }
    }
    return indent;
}

} // namespace

std::string shownText(std::string_view text)
{
    std::string shown;
    shown.reserve(text.size());
    while (!text.empty()) {
        const std::size_t length = shownLength(text);
        if (length == 0) {
            char escape[8];
            std::snprintf(escape, sizeof escape, "\\x%02X", static_cast<unsigned>(static_cast<unsigned char>(text[0])));
            shown += escape;
        } else {
            shown += text.substr(0, length);
        }
        text.remove_prefix(std::max<std::size_t>(length, 1));
    }
    return shown;
}

std::string SourcePlace::text() const
{
    return shownText(file) + ":" + std::to_string(line) + ":" + std::to_string(column);
}

MofError::MofError(SourcePlace place, const std::string& cause)
    : std::runtime_error(place.text() + ": error: " + shownText(cause)), fPlace(std::move(place)), fCause(cause)
{
}

std::string MofError::diagnostic() const
{
    std::string text = std::string(what()) + "\n";
    if (!fPlace.lineText.empty()) {
        const std::string before = shownText(std::string_view(fPlace.lineText).substr(0, fPlace.column - 1));
        text += shownText(fPlace.lineText) + "\n" + caretIndent(before) + "^\n";
    }
    if (fSkippedCount != 0) {
        text += std::to_string(fSkippedCount) + (fSkippedCount == 1 ? " definition after it was not compiled\n"
                                                                    : " definitions after it were not compiled\n");
    }
    return text;
}

FileError::FileError(Kind kind, const std::string& text) : std::runtime_error(shownText(text)), fKind(kind) {}

} // namespace Pegasus::mof
