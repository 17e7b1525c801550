// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/wire/XmlError.h"
#include "pegasus/wire/XmlLimits.h"

#include <cstddef>
#include <memory>
#include <string>
#include <string_view>

namespace pugi {
struct xml_node_struct;
} // namespace pugi

namespace Pegasus::wire {

class XmlDocument;

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

// One element of a parsed document: a cheap copyable view, valid as long as its document.
// Names and values are views into the message; entity and character references are resolved on reading.
// Throws: XmlError from every member that reads, with the element's place.
class XmlElement
{
  public:
    XmlElement() = default;

    // False after the last sibling, and for the child of an empty element.
    explicit operator bool() const { return fNode != nullptr; }
    std::string_view name() const;
    bool is(std::string_view expectedName) const;

    // The children that are elements. Text beside them is an error.
    XmlElement firstChild() const;
    XmlElement nextSibling() const;
    // The one child. Throws: XmlError for any other number of children.
    XmlElement onlyChild() const;
    // Throws: XmlError when the element has a child.
    void expectNoChildren() const;
    void expectName(std::string_view expectedName) const;

    // Reads attributes: values[i] gets the value of names[i]. Attributes of other names are ignored, as OpenPegasus
    // ignores them: clients and servers add namespaces, languages and types of their own.
    // Throws: XmlError when a listed attribute appears twice.
    template <std::size_t N> void attributes(const std::string_view (&names)[N], XmlAttribute (&values)[N]) const
    {
        readAttributes(names, values, N);
    }
    // For an element whose attributes have no meaning: only their number is checked.
    void ignoreAttributes() const { readAttributes(nullptr, nullptr, 0); }

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
    friend class XmlDocument;
    XmlElement(pugi::xml_node_struct* node, const XmlDocument* document) : fNode(node), fDocument(document) {}

    void readAttributes(const std::string_view* names, XmlAttribute* values, std::size_t count) const;
    std::string_view mixedText(std::string& scratch) const;

    pugi::xml_node_struct* fNode = nullptr;
    const XmlDocument* fDocument = nullptr;
};

// A parser for one document after another. It works in the caller's memory; only its nodes are its own.
// Thread: one thread at a time, its elements included.
class XmlDocument
{
  public:
    explicit XmlDocument(const XmlLimits& limits = XmlLimits());
    ~XmlDocument();
    XmlDocument(const XmlDocument&) = delete;
    XmlDocument& operator=(const XmlDocument&) = delete;

    // Parses a whole message, XML declaration first, and returns its root element.
    // The text is changed in place and must outlive the elements. Earlier elements of this document become invalid.
    // Throws: XmlError (not well formed, over a limit, a DOCTYPE, another encoding than UTF-8).
    XmlElement parseMessage(char* text, std::size_t size);
    // The same without an XML declaration: an object embedded in a string.
    XmlElement parseFragment(char* text, std::size_t size);
    // The same for one element cut out of a message, where `start` is its place there.
    // Requires: the text is one balanced element within the limits, as XmlSlicer delivers it.
    XmlElement parseElement(char* text, std::size_t size, XmlPlace start);

    const XmlLimits& limits() const { return fLimits; }

  private:
    friend class XmlElement;
    struct Tree;

    XmlElement parse(char* text, std::size_t size);
    XmlElement parseChecked(char* text, std::size_t size, bool isMessage);
    XmlPlace placeOf(const char* position) const;
    XmlPlace placeAtOffset(std::size_t offset) const;

    XmlLimits fLimits;
    std::unique_ptr<Tree> fTree;
    const char* fText = nullptr;
    std::size_t fSize = 0;
    XmlPlace fStart;
};

} // namespace Pegasus::wire
