#pragma once

#include <string_view>

namespace Pegasus::server {

// Whether the bytes are UTF-8 (RFC 3629: no overlong forms, no surrogates, nothing above U+10FFFF).
bool isUtf8(std::string_view bytes);

} // namespace Pegasus::server
