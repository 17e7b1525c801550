// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <cstdint>
#include <cstring>
#include <string_view>

#include <emmintrin.h> // every x86-64 processor has it

// Sixteen bytes at once, for looking through texts: the compiler has an instruction for each operation on a block.
// Thread: any.
namespace Pegasus::base {

using ByteBlock [[gnu::vector_size(16)]] = unsigned char;

// Requires: as many bytes from there.
inline ByteBlock loadBlock(const char* from)
{
    ByteBlock block;
    std::memcpy(&block, from, sizeof block);
    return block;
}

// `marks` is what a comparison of blocks gives. Returns: a bit for each byte that it holds for, the first byte's
// lowest.
template <typename Marks> unsigned markedBits(const Marks& marks)
{
    static_assert(sizeof marks == sizeof(__m128i));
    __m128i bytes;
    std::memcpy(&bytes, &marks, sizeof bytes);
    return static_cast<unsigned>(_mm_movemask_epi8(bytes));
}

// Returns: the first byte that it holds for; sizeof(ByteBlock) for none.
template <typename Marks> std::size_t firstMarked(const Marks& marks)
{
    const unsigned bits = markedBits(marks);
    return bits != 0 ? static_cast<std::size_t>(__builtin_ctz(bits)) : sizeof(ByteBlock);
}

// Returns: the first byte from `at` on for which the comparison `mark` of a block holds; the text's size when there is
// none. The last bytes are looked at as a block, too: one that overlaps the block before.
template <typename Mark> std::size_t findMarked(std::string_view text, std::size_t at, const Mark& mark)
{
    constexpr std::size_t kSize = sizeof(ByteBlock);
    const char* const bytes = text.data();
    for (; text.size() - at >= kSize; at += kSize) {
        const unsigned bits = markedBits(mark(loadBlock(bytes + at)));
        if (bits != 0) {
            return at + static_cast<std::size_t>(__builtin_ctz(bits));
        }
    }
    const std::size_t rest = text.size() - at;
    unsigned bits = 0;
    if (text.size() >= kSize) {
        bits = markedBits(mark(loadBlock(bytes + text.size() - kSize))) >> (kSize - rest);
    } else {
        char few[kSize] = {};
        std::memcpy(few, bytes + at, rest);
        bits = markedBits(mark(loadBlock(few))) & ((1U << rest) - 1);
    }
    return bits != 0 ? at + static_cast<std::size_t>(__builtin_ctz(bits)) : text.size();
}

// Returns: the first of the two bytes from `at` on; the text's size when it has neither.
inline std::size_t findEither(std::string_view text, std::size_t at, char x, char y)
{
    return findMarked(text, at, [=](const ByteBlock& block) {
        return (block == static_cast<unsigned char>(x)) | (block == static_cast<unsigned char>(y));
    });
}

} // namespace Pegasus::base
