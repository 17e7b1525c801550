// SPDX-License-Identifier: MIT
#pragma once

#include <string>

namespace vrxhost {

// The only way of a text into a page, as an element's content or a quoted attribute.
// Returns: UTF-8 without markup. What a reader cannot see or what reorders a line is shown as an escape: control
// characters, line and paragraph separators, bidirectional overrides, tags, bytes outside UTF-8.
std::string HtmlText(const std::string& text);

// tag: the element's name; attributes from HtmlAttribute may follow it.
std::string HtmlElement(const std::string& tag, const std::string& text);

// Returns: the attribute with a blank before it.
std::string HtmlAttribute(const std::string& name, const std::string& value);

} // namespace vrxhost
