// SPDX-License-Identifier: MIT
#include "pegasus/base/PercentCoding.h"

#include "pegasus/base/AsciiCase.h"
#include "pegasus/base/NumberText.h"

namespace Pegasus::base {

std::string percentEncoded(std::string_view text, PercentSet kept)
{
    static constexpr char kDigits[] = "0123456789ABCDEF";
    const std::string_view marks = kept == PercentSet::kStrict ? "-_." : "-_.!~*'()";
    std::string out;
    out.reserve(text.size());
    for (const char c : text) {
        if (isAsciiAlnum(c) || marks.find(c) != std::string_view::npos) {
            out += c;
            continue;
        }
        const auto byte = static_cast<unsigned char>(c);
        out += '%';
        out += kDigits[byte >> 4];
        out += kDigits[byte & 15];
    }
    return out;
}

std::string percentDecoded(std::string_view text)
{
    std::string out;
    out.reserve(text.size());
    for (std::size_t i = 0; i < text.size(); ++i) {
        const int high = text[i] == '%' && i + 2 < text.size() ? hexDigitValue(text[i + 1]) : -1;
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
