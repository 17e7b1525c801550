// SPDX-License-Identifier: MIT
#include "pegasus/mof/MofError.h"

#include "pegasus/mof/ShownText.h"

namespace Pegasus::mof {

std::string SourcePlace::text() const
{
    return shownText(file) + ":" + std::to_string(line) + ":" + std::to_string(column);
}

MofError::MofError(SourcePlace place, const std::string& cause)
    : std::runtime_error(place.text() + ": error: " + shownText(cause)), fPlace(std::move(place)), fCause(cause)
{
}

namespace {

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
