// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <optional>
#include <string>
#include <vector>

namespace NKOLVRX20 {

// Holds all signed and unsigned integers of CIM.
using TWideInteger = __int128;

// The entries of a ValueMap or BitMap qualifier: which of them a value belongs to (DSP0004, 5.6.3).
class TValueMap
{
  public:
    // An entry is an integer literal of CIM ("10", octal "012", "0xA", "1010b", each with an optional sign, at most 64
    // bits), a range of such literals ("3..7", "..7", "3.."), ".." for all remaining numbers, or any text. A malformed
    // literal counts as text.
    explicit TValueMap(const std::vector<std::string>& entries);

    // Returns: the index of the entry that covers the number, if there is one. An exact entry beats a range, and a
    // range beats ".."; of equals the first one counts. In an empty map a number is its own index.
    std::optional<std::size_t> Find(TWideInteger number) const;

    // Returns: the index of the entry with exactly this text, if there is one.
    std::optional<std::size_t> Find(const std::string& text) const;

  private:
    enum class EKind // in order of precedence
    {
        kExact,
        kRange,
        kRest,
        kText
    };

    struct TEntry
    {
        std::string fText;
        EKind fKind = EKind::kText;
        TWideInteger fLow = 0; // both bounds belong to the entry
        TWideInteger fHigh = 0;

        bool Covers(TWideInteger number) const;
    };

    static TEntry ParseEntry(const std::string& text);

    std::vector<TEntry> fEntries;
};

} // namespace NKOLVRX20
