// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <cstdint>
#include <cstring>
#include <string_view>

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

// `marks` is what a comparison of blocks gives. Returns: the first byte that it holds for; sizeof(ByteBlock) for none.
template <typename Marks> std::size_t firstMarked(const Marks& marks)
{
    static_assert(sizeof marks == sizeof(ByteBlock));
    std::uint64_t halves[2];
    std::memcpy(halves, &marks, sizeof halves);
    if (halves[0] != 0) {
        return static_cast<std::size_t>(__builtin_ctzll(halves[0])) / 8;
    }
    return halves[1] != 0 ? 8 + static_cast<std::size_t>(__builtin_ctzll(halves[1])) / 8 : sizeof(ByteBlock);
}

// Returns: the first of the two bytes from `at` on; the text's size when it has neither.
inline std::size_t findEither(std::string_view text, std::size_t at, char x, char y)
{
    const char* const bytes = text.data();
    for (; text.size() - at >= sizeof(ByteBlock); at += sizeof(ByteBlock)) {
        const ByteBlock block = loadBlock(bytes + at);
        const std::size_t first =
            firstMarked((block == static_cast<unsigned char>(x)) | (block == static_cast<unsigned char>(y)));
        if (first < sizeof(ByteBlock)) {
            return at + first;
        }
    }
    while (at < text.size() && bytes[at] != x && bytes[at] != y) {
        ++at;
    }
    return at;
}

} // namespace Pegasus::base
