// SPDX-License-Identifier: MIT
// Texts in one pass, by blocks, are the client library's own conversion to the byte.
#include "src/common/Text.h"

#include <Pegasus/Common/String.h>

#include <gtest/gtest.h>

#include <vector>

namespace NKOLVRX20 {
namespace {

TEST(Text, IsWhatTheLibraryMakesOfIt)
{
    constexpr std::size_t kLongest = 35; // two blocks and some more
    for (const int code : {0, 1, 0x7F, 0x80, 0xFF, 0x100, 0x4100, 0x6C34, 0xD800, 0xFFFF}) {
        const auto unit = static_cast<Pegasus::Uint16>(code);
        for (std::size_t size = 1; size <= kLongest; ++size) {
            for (std::size_t at = 0; at < size; ++at) {
                std::vector<Pegasus::Char16> units(size, Pegasus::Char16('a'));
                units[at] = Pegasus::Char16(unit);
                const Pegasus::String text(units.data(), static_cast<Pegasus::Uint32>(size));
                const std::string expected = static_cast<const char*>(text.getCString());
                ASSERT_EQ(expected, ToStdString(text)) << unit << " at " << at << " of " << size;
                ASSERT_EQ(unit != 0 && unit < 0x80, AsciiText(text).has_value()) << unit << " at " << at;
            }
        }
    }
    EXPECT_EQ("", ToStdString(Pegasus::String()));
}

} // namespace
} // namespace NKOLVRX20
