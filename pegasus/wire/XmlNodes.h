// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/wire/XmlScanner.h"

#include <cstddef>
#include <cstdint>
#include <string_view>
#include <vector>

namespace Pegasus::wire {

// One element: where its parts are in the text, and its neighbours. Its first child is the next node.
struct XmlNode
{
    XmlSpan name;
    XmlSpan content; // between the tags; empty for an empty tag
    std::uint32_t firstAttribute = 0;
    std::uint32_t nextSibling = 0; // 0: it is the last one
    std::uint16_t attributeCount = 0;
    bool hasChild = false;
    bool hasText = false;      // before the first child; blanks alone do not count
    bool hasSections = false;  // CDATA sections, comments or instructions are among the content
    bool hasTextAfter = false; // before the next sibling, or the end of the parent
};

// The elements of one text in the order of their start tags, entered while the text is read: each byte is looked at
// once, and the nodes are reused for the next text. It checks nesting; XmlScanner checks what is inside a tag.
// Throws: XmlError.
class XmlNodes
{
  public:
    explicit XmlNodes(const XmlLimits& limits);
    XmlNodes(const XmlNodes&) = delete;
    XmlNodes& operator=(const XmlNodes&) = delete;

    // Begins with another root element, which lies in so many others.
    void clear(std::size_t outerDepth = 0);
    // All offsets are in this text. It may be set again while an element arrives: longer, or elsewhere in memory.
    void setSource(const XmlSource& source) { fSource = source; }
    const XmlSource& source() const { return fSource; }

    // Reads the token that begins at `from`. Requires: it lies in the text.
    XmlToken next(std::size_t from);
    // Enters the token that next() has just returned.
    void take(const XmlToken& token, std::size_t from);

    // Reads on from `from`, which lies in the root element, to the end of the element or up to a token that the text
    // cuts. Returns: the offset after what was read. The element is complete when depth() is 0.
    std::size_t read(std::size_t from);

    bool isEmpty() const { return fNodes.empty(); }
    // Returns: how many elements are open.
    std::size_t depth() const { return fOpen.size(); }

    const XmlNode& node(std::uint32_t index) const { return fNodes[index]; }
    const XmlAttributeSpan* attributesOf(const XmlNode& node) const { return fAttributes.data() + node.firstAttribute; }
    const XmlLimits& limits() const { return fLimits; }

  private:
    struct Open
    {
        std::uint32_t node;
        std::uint32_t lastChild; // 0: it has none yet
    };

    void open(const XmlToken& token, std::size_t from);
    std::size_t endTagSize(std::size_t from) const;
    void close(const XmlToken& token, std::size_t from);
    void closeInner(std::size_t from);
    void markText();

    const XmlLimits fLimits;
    const XmlScanner fScanner;
    XmlSource fSource;
    std::vector<XmlNode> fNodes;
    std::vector<XmlAttributeSpan> fAttributes;
    std::vector<Open> fOpen;
    std::size_t fOuterDepth = 0;
    std::size_t fTagAttributes = 0; // where the attributes of the last token begin
};

} // namespace Pegasus::wire
