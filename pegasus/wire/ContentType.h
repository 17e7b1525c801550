// SPDX-License-Identifier: MIT
#pragma once

#include <string_view>

namespace Pegasus::wire {

// Returns: whether a Content-Type field announces CIM-XML in UTF-8: application/xml or text/xml, alone or with
// charset=utf-8. Words may be quoted and in any case; blanks between them are ignored. As in OpenPegasus, UTF-8 is the
// default charset, and any other parameter is refused.
// Thread: any.
bool isXmlInUtf8(std::string_view contentType) noexcept;

} // namespace Pegasus::wire
