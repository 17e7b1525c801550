// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace lnx {

// One structure of the table that the firmware leaves (SMBIOS, DMTF DSP0134): a formatted area, whose fields have
// offsets, and the texts that the fields number. A field that lies outside of the area is absent.
class SmbiosStructure
{
  public:
    // Requires: area has the four bytes of the header; the texts, each with its end, outlive the object as area does.
    SmbiosStructure(std::string_view area, std::string_view texts) : fArea(area), fTexts(texts) {}

    std::uint8_t type() const { return static_cast<std::uint8_t>(fArea[0]); }
    std::uint16_t handle() const { return number<std::uint16_t>(2).value_or(0); }

    // Returns: the number at the offset, little-endian.
    template <typename T> std::optional<T> number(std::size_t offset) const
    {
        if (offset + sizeof(T) > fArea.size()) {
            return std::nullopt;
        }
        std::uint64_t value = 0;
        for (std::size_t i = sizeof(T); i-- > 0;) {
            value = value << 8 | static_cast<std::uint8_t>(fArea[offset + i]);
        }
        return static_cast<T>(value);
    }

    // Returns: the text whose number is at the offset, blanks at its ends cut off; absent for an empty text and for one
    // with bytes other than printable ASCII.
    std::optional<std::string> text(std::size_t offset) const;

  private:
    std::string_view fArea;
    std::string_view fTexts;
};

// Returns: the structures up to the end of the table, or up to the first that does not fit into it. They refer to the
// table's bytes.
std::vector<SmbiosStructure> smbiosStructures(std::string_view table);

} // namespace lnx
