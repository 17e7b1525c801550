// SPDX-License-Identifier: MIT
#include "src/common/Text.h"

#include <Pegasus/Common/String.h>

#include <cstring>
#include <utility>

namespace NKOLVRX20 {

namespace {

using Pegasus::Uint16;

// Has a bit above ASCII's for a unit beyond ASCII; for 0 too, at which the library's own conversion of a
// text would end.
constexpr Uint16 Marked(Uint16 unit)
{
    return static_cast<Uint16>(unit | (unit - 1U));
}

// By blocks, for which the compiler uses vector instructions.
// Returns: whether the units are ASCII characters.
bool CopyAscii(const Pegasus::Char16* units, std::size_t count, char* bytes)
{
    constexpr std::size_t kBlock = 16;
    constexpr Uint16 kLast = 0x7F;
    static_assert(sizeof(Pegasus::Char16) == sizeof(Uint16));
    Uint16 seen = 0;
    std::size_t at = 0;
    for (; at + kBlock <= count; at += kBlock) {
        Uint16 block[kBlock];
        std::memcpy(block, units + at, sizeof block);
        char narrow[kBlock];
        for (std::size_t i = 0; i < kBlock; ++i) {
            narrow[i] = static_cast<char>(block[i]);
        }
        for (const Uint16 unit : block) {
            seen |= Marked(unit);
        }
        std::memcpy(bytes + at, narrow, kBlock);
    }
    for (; at < count; ++at) {
        seen |= Marked(units[at]);
        bytes[at] = static_cast<char>(Uint16(units[at]));
    }
    return seen <= kLast;
}

} // namespace

// Most texts are ASCII: they are made in their place, without the copy of the library's own conversion.
std::optional<std::string> AsciiText(const Pegasus::String& text)
{
    std::string bytes(text.size(), '\0');
    return CopyAscii(text.getChar16Data(), bytes.size(), bytes.data()) ? std::make_optional(std::move(bytes))
                                                                       : std::nullopt;
}

bool IsSameText(const Pegasus::String& left, const Pegasus::String& right)
{
    return left.getChar16Data() == right.getChar16Data() || left == right;
}

std::string ToStdString(const Pegasus::String& text)
{
    if (auto ascii = AsciiText(text)) {
        return std::move(*ascii);
    }
    const Pegasus::CString bytes = text.getCString();
    return static_cast<const char*>(bytes);
}

} // namespace NKOLVRX20
