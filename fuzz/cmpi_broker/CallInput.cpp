// SPDX-License-Identifier: MIT
#include "fuzz/cmpi_broker/CallInput.h"

#include <array>
#include <cstddef>
#include <utility>

namespace fuzz {

namespace {

// Returns: the texts in their order. Each stays a literal of its own, so that a read beyond its end is found.
template <typename... Text> constexpr std::array<const char*, sizeof...(Text)> listOf(Text... texts)
{
    return {{texts...}};
}

} // namespace

const char* CallInput::text()
{
    static constexpr auto kTexts =
        listOf("F", "G", "Link", "f", "Unknown", "no name", "", "Id", "Number", "Text", "B", "C", "N", "R", "L", "D",
               "SA", "UA", "DA", "CA", "E", "EA", "From", "To", "Small", "id", kNamespace, "root/nowhere",
               "20240229235959.123456+120", "00000001020304.000005:000", "20240229******.******+000",
               "99999999235959.999999:000", "$0 $1 $2 $9 $", "a\xFFz", "\xC3\xA9", "\x01", "CMPIInstance", "WQL",
               "select * from F", "CMPIInvocationFlags", "CMPIInitNameSpace");
    // A choice of 0xFE is a text of the input itself, 0xFF is null.
    constexpr std::uint8_t kOwn = 0xFE;
    const std::uint8_t choice = byte();
    if (choice < kOwn) {
        return kTexts[choice % kTexts.size()];
    }
    if (choice != kOwn) {
        return nullptr;
    }
    std::string own;
    for (std::size_t left = byte(); left > 0 && !isAtEnd(); --left) {
        own += static_cast<char>(byte());
    }
    return fOwn.emplace_back(std::move(own)).c_str();
}

} // namespace fuzz
