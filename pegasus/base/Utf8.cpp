// SPDX-License-Identifier: MIT
#include "pegasus/base/Utf8.h"

#include "pegasus/base/ByteBlock.h"

#include <algorithm>
#include <cstdint>

#include <emmintrin.h> // every x86-64 processor has it

namespace Pegasus::base {
namespace {

constexpr std::size_t kBlock = sizeof(__m128i); // bytes, or units in two halves

bool isContinuation(unsigned char byte)
{
    return (byte & 0xC0) == 0x80;
}

__m128i load(const void* from) noexcept
{
    return _mm_loadu_si128(static_cast<const __m128i*>(from));
}

void store(void* to, __m128i block) noexcept
{
    _mm_storeu_si128(static_cast<__m128i*>(to), block);
}

// Copies whole blocks of ASCII, the common case. Returns: how many bytes.
std::size_t copyAsciiBlocks(const char* from, std::size_t size, Char16* to) noexcept
{
    std::size_t done = 0;
    for (; size - done >= kBlock; done += kBlock) {
        const __m128i bytes = load(from + done);
        if (_mm_movemask_epi8(bytes) != 0) {
            break;
        }
        store(to + done, _mm_unpacklo_epi8(bytes, _mm_setzero_si128()));
        store(to + done + kBlock / 2, _mm_unpackhi_epi8(bytes, _mm_setzero_si128()));
    }
    return done;
}

bool isAscii(__m128i units) noexcept
{
    const __m128i beyond = _mm_and_si128(units, _mm_set1_epi16(~0x7F));
    return _mm_movemask_epi8(_mm_cmpeq_epi16(beyond, _mm_setzero_si128())) == 0xFFFF;
}

// Copies half a block of units, if it is ASCII.
bool copyHalfBlock(const Char16* from, char* to) noexcept
{
    const __m128i units = load(from);
    if (!isAscii(units)) {
        return false;
    }
    _mm_storel_epi64(reinterpret_cast<__m128i*>(to), _mm_packus_epi16(units, units));
    return true;
}

// Copies ASCII up to the first other unit. Returns: how many units.
std::size_t copyAscii(const Char16* from, std::size_t count, char* to) noexcept
{
    constexpr std::size_t kHalf = kBlock / 2;
    static_assert(sizeof(Char16) == sizeof(Uint16));
    std::size_t done = 0;
    for (; count - done >= kBlock; done += kBlock) {
        const __m128i first = load(from + done);
        const __m128i second = load(from + done + kHalf);
        if (!isAscii(_mm_or_si128(first, second))) {
            break;
        }
        store(to + done, _mm_packus_epi16(first, second));
    }
    if (count - done >= kHalf && copyHalfBlock(from + done, to + done)) {
        done += kHalf;
    }
    // The last units as half a block that overlaps what is copied already.
    if (count >= kHalf && count - done < kHalf && copyHalfBlock(from + count - kHalf, to + count - kHalf)) {
        return count;
    }
    for (; done < count && Uint16(from[done]) < 0x80; ++done) {
        to[done] = static_cast<char>(Uint16(from[done]));
    }
    return done;
}

struct Sequence
{
    std::uint32_t code;
    std::size_t length; // 0 when it is not valid
};

// Returns: how many bytes the sequence of this lead byte has; 0 for any other byte.
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

// A surrogate counts as valid here.
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

bool isHighSurrogate(std::uint32_t unit)
{
    return (unit & 0xFC00) == 0xD800;
}

bool isLowSurrogate(std::uint32_t unit)
{
    return (unit & 0xFC00) == 0xDC00;
}

// Returns: the length of the valid sequence at `at`, 0 when the bytes there are invalid.
std::size_t validLength(std::string_view bytes, std::size_t at) noexcept
{
    const Sequence next = readSequence(reinterpret_cast<const unsigned char*>(bytes.data() + at), bytes.size() - at);
    return (next.code & 0xFFFFF800u) == 0xD800 ? 0 : next.length;
}

} // namespace

bool isUtf8(std::string_view bytes) noexcept
{
    for (std::size_t at = 0; (at = findMarked(bytes, at, [](const ByteBlock& c) { return c >= 0x80; })) < bytes.size();)
    {
        // Such sequences seldom come alone.
        for (std::size_t i = 0; i < kBlock && at < bytes.size(); ++i) {
            const std::size_t length = validLength(bytes, at);
            if (length == 0) {
                return false;
            }
            at += length;
        }
    }
    return true;
}

std::string repairedUtf8(std::string_view bytes)
{
    std::string out;
    out.reserve(bytes.size());
    for (std::size_t at = 0; at < bytes.size();) {
        const std::size_t length = validLength(bytes, at);
        if (length == 0) {
            appendUtf8(out, 0xFFFD);
        } else {
            out.append(bytes.substr(at, length));
        }
        at += std::max<std::size_t>(length, 1);
    }
    return out;
}

Utf8DecodeResult decodeUtf8(const char* from, std::size_t size, Char16* to) noexcept
{
    std::size_t at = 0;
    while (at < size) {
        const std::size_t copied = copyAsciiBlocks(from + at, size - at, to);
        at += copied;
        to += copied;
        // A block with other bytes, or the last few bytes: decode them, one sequence at a time.
        for (std::size_t i = 0; i < kBlock && at < size; ++i) {
            const auto byte = static_cast<unsigned char>(from[at]);
            if (byte < 0x80) {
                *to++ = Char16(byte);
                ++at;
                continue;
            }
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

void appendUtf8(std::string& out, std::uint32_t code)
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

void appendUtf8(std::string& out, const Char16* units, std::size_t count)
{
    const std::size_t start = out.size();
    out.resize(start + count);
    const std::size_t ascii = copyAscii(units, count, out.data() + start);
    out.resize(start + ascii);
    for (std::size_t i = ascii; i < count; ++i) {
        std::uint32_t code = Uint16(units[i]);
        if (isHighSurrogate(code) && i + 1 < count && isLowSurrogate(Uint16(units[i + 1]))) {
            code = 0x10000 + ((code - 0xD800) << 10) + (Uint16(units[i + 1]) - 0xDC00u);
            ++i;
        }
        appendUtf8(out, code);
    }
}

} // namespace Pegasus::base
