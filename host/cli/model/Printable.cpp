// SPDX-License-Identifier: MIT
#include "host/cli/model/Printable.h"

#include <algorithm>
#include <cstdint>
#include <cstdio>

namespace vrxhost {
namespace {

struct TCharacter
{
    std::uint32_t fCode = 0;
    std::size_t fBytes = 0; // 0: the byte begins no character
};

// Overlong forms, surrogates and codes above U+10FFFF are invalid (RFC 3629).
TCharacter CharacterAt(const std::string& text, std::size_t at)
{
    const auto byte = [&text](std::size_t i) { return static_cast<unsigned char>(i < text.size() ? text[i] : 0); };
    const unsigned char first = byte(at);
    if (first < 0x80) {
        return {first, 1};
    }
    const std::size_t count = first >= 0xf0 ? 4 : first >= 0xe0 ? 3 : 2;
    if (first < 0xc2 || first > 0xf4) {
        return {};
    }
    std::uint32_t code = first & (0xffu >> (count + 1));
    for (std::size_t i = 1; i < count; ++i) {
        if ((byte(at + i) & 0xc0) != 0x80) {
            return {};
        }
        code = code << 6 | (byte(at + i) & 0x3fu);
    }
    constexpr std::uint32_t kLeast[] = {0, 0, 0x80, 0x800, 0x10000};
    const bool isValid = code >= kLeast[count] && code <= 0x10ffff && (code < 0xd800 || code > 0xdfff);
    return isValid ? TCharacter{code, count} : TCharacter{};
}

// Characters that have no place in a value's text, in ranges.
bool IsHidden(std::uint32_t code)
{
    constexpr std::uint32_t kRanges[][2] = {{0x00, 0x1f},     {0x7f, 0x9f},     {0xad, 0xad},     {0x61c, 0x61c},
                                            {0x200b, 0x200b}, {0x200e, 0x200f}, {0x2028, 0x202e}, {0x2060, 0x206f},
                                            {0xfeff, 0xfeff}, {0xfff9, 0xfffb}, {0xfffe, 0xffff}, {0xe0000, 0xe0fff}};
    return std::any_of(std::begin(kRanges), std::end(kRanges),
                       [code](const auto& range) { return code >= range[0] && code <= range[1]; });
}

std::string Escape(std::uint32_t code)
{
    char text[16];
    if (code < 0x80) {
        std::snprintf(text, sizeof text, "\\x%02x", code);
    } else {
        std::snprintf(text, sizeof text, "\\u{%x}", code);
    }
    return text;
}

std::string EscapedByte(char c)
{
    char text[8];
    std::snprintf(text, sizeof text, "\\x%02x", static_cast<unsigned char>(c));
    return text;
}

std::string Shown(const TCharacter& character, const std::string& bytes)
{
    if (character.fCode == '\n' || character.fCode == '\t') {
        return character.fCode == '\n' ? "\\n" : "\\t";
    }
    return IsHidden(character.fCode) ? Escape(character.fCode) : bytes;
}

} // namespace

std::string Printable(const std::string& text)
{
    std::string printable;
    for (std::size_t at = 0; at < text.size();) {
        const TCharacter character = CharacterAt(text, at);
        printable +=
            character.fBytes == 0 ? EscapedByte(text[at]) : Shown(character, text.substr(at, character.fBytes));
        at += std::max<std::size_t>(character.fBytes, 1);
    }
    return printable;
}

} // namespace vrxhost
