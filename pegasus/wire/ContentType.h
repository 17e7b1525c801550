#pragma once

#include <string_view>

namespace Pegasus::wire {

// Returns: whether a Content-Type field announces CIM-XML in UTF-8: application/xml or text/xml, without a parameter or
// with charset=utf-8. Words may be quoted and in any case; blanks between them have no meaning. As in OpenPegasus, a
// message without a charset is UTF-8, and any other parameter is refused.
// Thread: any.
bool isXmlInUtf8(std::string_view contentType) noexcept;

} // namespace Pegasus::wire
