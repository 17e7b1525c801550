#include "pegasus/server/net/Utf8Check.h"

#include <cstdint>
#include <cstring>

namespace Pegasus::server {

namespace {

struct Form
{
    unsigned char first, last; // lead bytes
    unsigned char secondLow, secondHigh;
    unsigned char followers; // bytes behind the lead
};

constexpr Form kForms[] = {
    {0xC2, 0xDF, 0x80, 0xBF, 1}, {0xE0, 0xE0, 0xA0, 0xBF, 2}, {0xE1, 0xEC, 0x80, 0xBF, 2}, {0xED, 0xED, 0x80, 0x9F, 2},
    {0xEE, 0xEF, 0x80, 0xBF, 2}, {0xF0, 0xF0, 0x90, 0xBF, 3}, {0xF1, 0xF3, 0x80, 0xBF, 3}, {0xF4, 0xF4, 0x80, 0x8F, 3},
};

// Returns: the length of the sequence at `at`, 0 if it is none.
std::size_t sequenceLength(std::string_view at)
{
    const auto byte = [&](std::size_t i) { return static_cast<unsigned char>(at[i]); };
    for (const Form& form : kForms) {
        if (byte(0) < form.first || byte(0) > form.last) {
            continue;
        }
        if (at.size() <= form.followers || byte(1) < form.secondLow || byte(1) > form.secondHigh) {
            return 0;
        }
        for (std::size_t i = 2; i <= form.followers; ++i) {
            if ((byte(i) & 0xC0) != 0x80) {
                return 0;
            }
        }
        return form.followers + 1u;
    }
    return 0;
}

} // namespace

bool isUtf8(std::string_view bytes)
{
    while (!bytes.empty()) {
        std::uint64_t word = 0;
        if (bytes.size() >= sizeof word) {
            std::memcpy(&word, bytes.data(), sizeof word);
            if ((word & 0x8080808080808080u) == 0) { // eight ASCII characters at once
                bytes.remove_prefix(sizeof word);
                continue;
            }
        }
        const bool ascii = static_cast<unsigned char>(bytes[0]) < 0x80;
        const std::size_t length = ascii ? 1 : sequenceLength(bytes);
        if (length == 0) {
            return false;
        }
        bytes.remove_prefix(length);
    }
    return true;
}

} // namespace Pegasus::server
