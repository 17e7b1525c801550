// SPDX-License-Identifier: MIT
#include "pegasus/wire/ContentType.h"

#include "pegasus/base/AsciiCase.h"

#include <algorithm>

namespace Pegasus::wire {
namespace {

constexpr std::string_view kHttpBlanks = " \t";
constexpr std::string_view kUsual = "application/xml; charset=utf-8"; // as nearly all clients and servers write it

bool isHttpBlank(std::string_view text) noexcept
{
    return text.find_first_not_of(kHttpBlanks) == std::string_view::npos;
}

// Removes the next word from `text`: a token, a quoted text (its quotes dropped), or one of the separators.
std::string_view takeWord(std::string_view& text) noexcept
{
    text.remove_prefix(std::min(text.find_first_not_of(kHttpBlanks), text.size()));
    if (text.empty()) {
        return text;
    }
    if (text.front() == '"') {
        const std::size_t end = std::min(text.find('"', 1), text.size());
        const std::string_view word = text.substr(1, end - 1);
        text.remove_prefix(std::min(end + 1, text.size()));
        return word;
    }
    const std::size_t size = std::clamp<std::size_t>(text.find_first_of(" \t;="), 1, text.size());
    const std::string_view word = text.substr(0, size);
    text.remove_prefix(size);
    return word;
}

} // namespace

bool isXmlInUtf8(std::string_view contentType) noexcept
{
    if (contentType == kUsual) {
        return true;
    }
    const std::string_view type = takeWord(contentType);
    if (!base::equalNoCase(type, "application/xml") && !base::equalNoCase(type, "text/xml")) {
        return false;
    }
    if (isHttpBlank(contentType)) {
        return true;
    }
    return takeWord(contentType) == ";" && base::equalNoCase(takeWord(contentType), "charset") &&
           takeWord(contentType) == "=" && base::equalNoCase(takeWord(contentType), "utf-8") &&
           isHttpBlank(contentType);
}

} // namespace Pegasus::wire
