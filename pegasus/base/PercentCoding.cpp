// SPDX-License-Identifier: MIT
#include "pegasus/base/PercentCoding.h"

#include "pegasus/base/AsciiCase.h"
#include "pegasus/base/NumberText.h"

#include <algorithm>
#include <array>

namespace Pegasus::base {
namespace {

using ByteSet = std::array<bool, 256>;

constexpr ByteSet keptBytes(std::string_view marks)
{
    ByteSet kept{};
    for (std::size_t c = 0; c < kept.size(); ++c) {
        kept[c] = isAsciiAlnum(static_cast<char>(c)) || marks.find(static_cast<char>(c)) != std::string_view::npos;
    }
    return kept;
}

constexpr ByteSet kStrict = keptBytes("-_.");
constexpr ByteSet kUnreserved = keptBytes("-_.!~*'()");

} // namespace

void appendPercentEncoded(std::string& out, std::string_view text, PercentSet kept)
{
    static constexpr char kDigits[] = "0123456789ABCDEF";
    const ByteSet& isKept = kept == PercentSet::kStrict ? kStrict : kUnreserved;
    const std::size_t start = out.size();
    out.resize(start + text.size() * 3); // the longest form of each byte
    char* end = out.data() + start;
    for (const char c : text) {
        const auto byte = static_cast<unsigned char>(c);
        if (isKept[byte]) {
            *end++ = c;
            continue;
        }
        *end++ = '%';
        *end++ = kDigits[byte >> 4];
        *end++ = kDigits[byte & 15];
    }
    out.resize(static_cast<std::size_t>(end - out.data()));
}

std::string percentEncoded(std::string_view text, PercentSet kept)
{
    std::string out;
    appendPercentEncoded(out, text, kept);
    return out;
}

std::string percentDecoded(std::string_view text)
{
    std::string out;
    out.reserve(text.size());
    for (std::size_t i = 0; i < text.size(); ++i) {
        const std::size_t percent = std::min(text.find('%', i), text.size());
        out.append(text, i, percent - i);
        i = percent;
        if (i == text.size()) {
            break;
        }
        const int high = i + 2 < text.size() ? hexDigitValue(text[i + 1]) : -1;
        const int low = high >= 0 ? hexDigitValue(text[i + 2]) : -1;
        if (low < 0) {
            out += text[i];
            continue;
        }
        out += static_cast<char>(high * 16 + low);
        i += 2;
    }
    return out;
}

} // namespace Pegasus::base
