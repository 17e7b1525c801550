// SPDX-License-Identifier: MIT
#pragma once

#include <string>
#include <string_view>

// Percent-coding (RFC 3986): a byte as "%XX", two upper-case hexadecimal digits.
// Thread: any.
namespace Pegasus::base {

// The characters that stay as they are besides ASCII letters and digits.
enum class PercentSet
{
    kStrict,     // "-_.": what a client sends in its CIM header fields
    kUnreserved, // "-_.!~*'()": RFC 2396's unreserved, what OpenPegasus's server sends and compares with
};

void appendPercentEncoded(std::string& out, std::string_view text, PercentSet kept);
std::string percentEncoded(std::string_view text, PercentSet kept);

// Returns: the text with its escapes decoded, whatever set it was encoded with. A "%" that lacks two hexadecimal
// digits after it stays as it is.
std::string percentDecoded(std::string_view text);

} // namespace Pegasus::base
