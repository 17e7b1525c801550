// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/wire/XmlError.h"
#include "pegasus/wire/XmlNodes.h"

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>

namespace Pegasus::wire {

// The raw text of an attribute, a view into the message, or the absence of the attribute. It is used like an
// std::optional, but travels in two registers: decoders read millions of them.
class XmlAttribute
{
  public:
    XmlAttribute() = default;
    // Requires: data() is not null.
    XmlAttribute(std::string_view value) : fValue(value) {}

    explicit operator bool() const { return fValue.data() != nullptr; }
    // Require: there is a value.
    const std::string_view& operator*() const { return fValue; }
    const std::string_view* operator->() const { return &fValue; }

  private:
    std::string_view fValue;
};

// One element of a text: a cheap copyable view, valid until its reader goes on.
// Names and values are views into the text; entity and character references are resolved on reading.
// Throws: XmlError from every member that reads, with the element's place.
class XmlElement
{
  public:
    XmlElement() = default;
    XmlElement(const XmlNodes& nodes, std::uint32_t index) : fNodes(&nodes), fIndex(index) {}

    // False after the last sibling, and for the child of an empty element.
    explicit operator bool() const { return fNodes != nullptr; }
    std::string_view name() const { return node().name.in(text()); }
    bool is(std::string_view expectedName) const { return fNodes && name() == expectedName; }

    // As they stand in the text: the start tag, or the empty one; what is between the tags.
    std::string_view startTag() const;
    std::string_view content() const { return node().content.in(text()); }

    // The children that are elements. Text beside them is an error.
    XmlElement firstChild() const;
    XmlElement nextSibling() const;
    // The one child. Throws: XmlError for any other number of children.
    XmlElement onlyChild() const;
    // Throws: XmlError when the element has a child.
    void expectNoChildren() const;
    void expectName(std::string_view expectedName) const;

    // Reads attributes: values[i] gets the value of names[i], or none. Attributes of other names are ignored, as
    // OpenPegasus ignores them: clients and servers add namespaces, languages and types of their own. Throws: XmlError
    // when a listed attribute appears twice.
    template <std::size_t N> void attributes(const std::string_view (&names)[N], XmlAttribute (&values)[N]) const
    {
        readAttributes(names, values, N);
    }

    // The character data of a childless element, with blanks around the raw text taken off and references
    // resolved. Returns: a view into the message or into `scratch`; valid until either changes.
    std::string_view text(std::string& scratch) const;
    // The same with its references unresolved. Empty when it lies in pieces (CDATA sections, comments).
    std::string_view rawText() const;
    // `raw` (an attribute's value) with references resolved; as text().
    std::string_view resolved(std::string_view raw, std::string& scratch) const;

    [[noreturn]] void fail(XmlError::Kind kind, const std::string& cause) const;
    // Fails at an element that may not stand in `parent`, or not at this place.
    [[noreturn]] void failIn(const XmlElement& parent) const;
    XmlPlace place() const;

  private:
    const XmlNode& node() const { return fNodes->node(fIndex); }
    std::string_view text() const { return fNodes->source().text; }
    void readAttributes(const std::string_view* names, XmlAttribute* values, std::size_t count) const;
    std::string_view textInPieces(std::string& scratch) const;

    const XmlNodes* fNodes = nullptr;
    std::uint32_t fIndex = 0;
};

} // namespace Pegasus::wire
