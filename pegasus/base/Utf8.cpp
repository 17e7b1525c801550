#include "pegasus/base/Utf8.h"

#include <cstdint>
#include <cstring>

namespace Pegasus::utf8 {
namespace {

constexpr std::size_t kBlock = 8;

bool isContinuation(unsigned char byte)
{
    return (byte & 0xC0) == 0x80;
}

// Copies whole blocks of ASCII, the common case. Returns: how many bytes.
std::size_t copyAsciiBlocks(const char* from, std::size_t size, Char16* to) noexcept
{
    std::size_t done = 0;
    for (; size - done >= kBlock; done += kBlock) {
        std::uint64_t block = 0;
        std::memcpy(&block, from + done, kBlock);
        if (block & 0x8080808080808080u) {
            break;
        }
        for (std::size_t i = 0; i < kBlock; ++i) {
            to[done + i] = Char16(static_cast<unsigned char>(from[done + i]));
        }
    }
    return done;
}

struct Sequence
{
    std::uint32_t code;
    std::size_t length; // 0: not valid
};

// How many bytes a lead byte asks for; 0 for a byte that cannot lead.
std::size_t lengthFromLead(unsigned char lead)
{
    if (lead < 0x80) {
        return 1;
    }
    if (lead >= 0xC2 && lead <= 0xDF) {
        return 2;
    }
    if (lead >= 0xE0 && lead <= 0xEF) {
        return 3;
    }
    return lead >= 0xF0 && lead <= 0xF4 ? 4 : 0;
}

Sequence readSequence(const unsigned char* bytes, std::size_t available)
{
    const std::size_t length = lengthFromLead(bytes[0]);
    if (length == 0 || length > available) {
        return {0, 0};
    }
    if (length == 1) {
        return {bytes[0], 1};
    }
    std::uint32_t code = bytes[0] & (0xFFu >> (length + 1));
    for (std::size_t i = 1; i < length; ++i) {
        if (!isContinuation(bytes[i])) {
            return {0, 0};
        }
        code = (code << 6) | (bytes[i] & 0x3Fu);
    }
    const bool overlong = (length == 3 && code < 0x800) || (length == 4 && code < 0x10000);
    return overlong || code > 0x10FFFF ? Sequence{0, 0} : Sequence{code, length};
}

Char16* putCode(Char16* to, std::uint32_t code) noexcept
{
    if (code < 0x10000) {
        *to++ = Char16(static_cast<Uint16>(code));
        return to;
    }
    code -= 0x10000;
    *to++ = Char16(static_cast<Uint16>(0xD800 + (code >> 10)));
    *to++ = Char16(static_cast<Uint16>(0xDC00 + (code & 0x3FF)));
    return to;
}

void appendCode(std::string& out, std::uint32_t code)
{
    if (code < 0x80) {
        out.push_back(static_cast<char>(code));
        return;
    }
    if (code < 0x800) {
        out.push_back(static_cast<char>(0xC0 | (code >> 6)));
    } else {
        if (code < 0x10000) {
            out.push_back(static_cast<char>(0xE0 | (code >> 12)));
        } else {
            out.push_back(static_cast<char>(0xF0 | (code >> 18)));
            out.push_back(static_cast<char>(0x80 | ((code >> 12) & 0x3F)));
        }
        out.push_back(static_cast<char>(0x80 | ((code >> 6) & 0x3F)));
    }
    out.push_back(static_cast<char>(0x80 | (code & 0x3F)));
}

bool isHighSurrogate(std::uint32_t unit)
{
    return (unit & 0xFC00) == 0xD800;
}

bool isLowSurrogate(std::uint32_t unit)
{
    return (unit & 0xFC00) == 0xDC00;
}

} // namespace

DecodeResult decode(const char* from, std::size_t size, Char16* to) noexcept
{
    std::size_t at = 0;
    while (at < size) {
        const std::size_t copied = copyAsciiBlocks(from + at, size - at, to);
        at += copied;
        to += copied;
        // What stopped the blocks: a few more bytes, one sequence at a time.
        for (std::size_t i = 0; i < kBlock && at < size; ++i) {
            const Sequence next = readSequence(reinterpret_cast<const unsigned char*>(from + at), size - at);
            if (next.length == 0) {
                return {to, from + at};
            }
            to = putCode(to, next.code);
            at += next.length;
        }
    }
    return {to, nullptr};
}

void append(std::string& out, const Char16* units, std::size_t count)
{
    out.reserve(out.size() + count);
    for (std::size_t i = 0; i < count; ++i) {
        std::uint32_t code = Uint16(units[i]);
        if (isHighSurrogate(code) && i + 1 < count && isLowSurrogate(Uint16(units[i + 1]))) {
            code = 0x10000 + ((code - 0xD800) << 10) + (Uint16(units[i + 1]) - 0xDC00u);
            ++i;
        }
        appendCode(out, code);
    }
}

} // namespace Pegasus::utf8
