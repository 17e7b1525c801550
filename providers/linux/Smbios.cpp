// SPDX-License-Identifier: MIT
#include "providers/linux/Smbios.h"

#include "providers/linux/Parse.h"

#include <algorithm>

namespace lnx {
namespace {

constexpr std::size_t kHeaderBytes = 4; // type, length of the area, handle
constexpr std::uint8_t kEndOfTable = 127;
constexpr std::string_view kEndOfTexts("\0\0", 2);

bool isPrintable(std::string_view text)
{
    return std::all_of(text.begin(), text.end(), [](char c) { return c >= ' ' && c <= '~'; });
}

} // namespace

std::optional<std::string> SmbiosStructure::text(std::size_t offset) const
{
    const std::uint8_t wanted = number<std::uint8_t>(offset).value_or(0); // 0: none; the first text is 1
    std::string_view rest = fTexts;
    for (unsigned i = 1; i < wanted && !rest.empty(); ++i) {
        rest.remove_prefix(std::min(rest.find('\0'), rest.size() - 1) + 1);
    }
    const std::string_view found = wanted == 0 ? std::string_view() : trimmed(rest.substr(0, rest.find('\0')));
    return found.empty() || !isPrintable(found) ? std::nullopt : std::optional<std::string>(found);
}

std::vector<SmbiosStructure> smbiosStructures(std::string_view table)
{
    std::vector<SmbiosStructure> found;
    while (table.size() >= kHeaderBytes) {
        const std::size_t length = static_cast<std::uint8_t>(table[1]);
        const std::size_t end = length < kHeaderBytes ? std::string_view::npos : table.find(kEndOfTexts, length);
        if (end == std::string_view::npos) {
            break;
        }
        found.emplace_back(table.substr(0, length), table.substr(length, end + 1 - length));
        if (found.back().type() == kEndOfTable) {
            break;
        }
        table.remove_prefix(end + kEndOfTexts.size());
    }
    return found;
}

} // namespace lnx
