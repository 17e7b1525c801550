// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/wire/XmlElement.h"
#include "pegasus/wire/XmlNodes.h"

#include <cstddef>
#include <string_view>

namespace Pegasus::wire {

// A reader of whole texts, one after the other. A text stays as it is and must outlive its elements, which become
// invalid when the next one is read.
// Throws: XmlError (not well formed, over a limit, a DOCTYPE, another encoding than UTF-8).
// Thread: one thread at a time, its elements included.
class XmlDocument
{
  public:
    explicit XmlDocument(const XmlLimits& limits = XmlLimits()) : fNodes(limits) {}

    // Reads a message, XML declaration first. Returns: its root element.
    XmlElement parseMessage(std::string_view text);
    // The same without an XML declaration: an object embedded in a string, or one that was stored.
    XmlElement parseFragment(std::string_view text);

  private:
    void begin(std::string_view text);
    std::size_t readDeclaration();
    XmlElement parseFrom(std::size_t at);
    void takeOutside(const XmlToken& token, std::size_t at);

    XmlNodes fNodes;
};

} // namespace Pegasus::wire
