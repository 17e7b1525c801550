#include "pegasus/mof/MofError.h"

namespace Pegasus::mof {

std::string SourcePlace::text() const
{
    return file + ":" + std::to_string(line) + ":" + std::to_string(column);
}

MofError::MofError(SourcePlace place, const std::string& cause)
    : std::runtime_error(place.text() + ": error: " + cause), fPlace(std::move(place)), fCause(cause)
{
}

namespace {

// Returns: blanks up to the column. Tabs stay tabs, so that the caret lines up in any terminal.
std::string caretIndent(const std::string& lineText, std::size_t column)
{
    std::string indent;
    for (std::size_t i = 0; i + 1 < column && i < lineText.size(); ++i) {
        const auto byte = static_cast<unsigned char>(lineText[i]);
        const bool continuesCharacter = (byte & 0xC0u) == 0x80u;
        if (!continuesCharacter) {
            indent += byte == '\t' ? '\t' : ' ';
        }
    }
    return indent;
}

} // namespace

std::string MofError::diagnostic() const
{
    std::string text = std::string(what()) + "\n";
    if (!fPlace.lineText.empty()) {
        text += fPlace.lineText + "\n" + caretIndent(fPlace.lineText, fPlace.column) + "^\n";
    }
    if (fSkippedCount != 0) {
        text += std::to_string(fSkippedCount) + (fSkippedCount == 1 ? " definition after it was not compiled\n"
                                                                    : " definitions after it were not compiled\n");
    }
    return text;
}

} // namespace Pegasus::mof
