// SPDX-License-Identifier: MIT
#include "providers/linux/PciNames.h"

#include "providers/linux/Parse.h"

#include <array>
#include <cstdio>

namespace lnx {
namespace {

constexpr std::array kFiles{"/usr/share/misc/pci.ids", "/usr/share/hwdata/pci.ids"};
constexpr std::size_t kIdDigits = 4;

std::string textOfFile(const SystemTree& tree)
{
    for (const char* file : kFiles) {
        if (auto text = tree.text(file)) {
            return std::move(*text);
        }
    }
    return {};
}

std::string digitsOf(std::uint16_t id)
{
    char digits[kIdDigits + 1];
    std::snprintf(digits, sizeof digits, "%04x", static_cast<unsigned>(id));
    return digits;
}

// Returns: the name in a line "id  name".
std::optional<std::string> nameIn(std::string_view line)
{
    const std::string_view name = trimmed(line.substr(kIdDigits));
    return name.empty() || name.size() > PciNames::kMaxNameBytes ? std::nullopt
                                                                 : std::optional<std::string>(std::string(name));
}

bool isOf(std::string_view line, const std::string& id)
{
    return line.size() > kIdDigits && line.compare(0, kIdDigits, id) == 0 && line[kIdDigits] == ' ';
}

} // namespace

PciNames::PciNames(const SystemTree& tree) : PciNames(textOfFile(tree)) {}

PciNames::PciNames(std::string text) : fText(std::move(text)), fLines(lines(fText)) {}

// A vendor's line begins in the first column; its devices follow after a tab, their subsystems after two.
std::size_t PciNames::findVendor(std::uint16_t id) const
{
    const std::string digits = digitsOf(id);
    std::size_t at = 0;
    while (at < fLines.size() && !isOf(fLines[at], digits)) {
        ++at;
    }
    return at;
}

std::optional<std::string> PciNames::vendor(std::optional<std::uint16_t> vendorId) const
{
    const std::size_t at = vendorId ? findVendor(*vendorId) : fLines.size();
    return at < fLines.size() ? nameIn(fLines[at]) : std::nullopt;
}

std::optional<std::string> PciNames::device(std::optional<std::uint16_t> vendorId,
                                            std::optional<std::uint16_t> deviceId) const
{
    if (!vendorId || !deviceId) {
        return std::nullopt;
    }
    const std::string digits = digitsOf(*deviceId);
    for (std::size_t at = findVendor(*vendorId) + 1; at < fLines.size(); ++at) {
        std::string_view line = fLines[at];
        if (line.empty() || line[0] == '#') {
            continue;
        }
        if (line[0] != '\t') {
            break; // the next vendor
        }
        line.remove_prefix(1);
        if (isOf(line, digits)) {
            return nameIn(line);
        }
    }
    return std::nullopt;
}

} // namespace lnx
