// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/wire/XmlError.h"
#include "pegasus/wire/XmlLimits.h"

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

namespace Pegasus::wire {

// Text that is being read, and the place in the message where it begins.
struct XmlSource
{
    std::string_view text;
    XmlPlace start{1, 1};

    XmlPlace placeAt(std::size_t offset) const;
    [[noreturn]] void fail(XmlError::Kind kind, std::size_t offset, const std::string& cause) const;
    // Throws: XmlError when there is a zero byte before `end`.
    void expectNoZero(std::size_t end) const;
};

// A part of a text. Offsets stay valid when the text moves in memory, as it does while more of it arrives.
struct XmlSpan
{
    std::uint32_t begin = 0;
    std::uint32_t size = 0;

    std::string_view in(std::string_view text) const { return {text.data() + begin, size}; }
};

struct XmlAttributeSpan
{
    XmlSpan name;
    XmlSpan value; // without its quotes
};

// One piece of markup or text.
struct XmlToken
{
    enum class Type
    {
        kIncomplete, // more bytes are needed
        kText,       // everything up to the next '<'
        kStartTag,
        kEmptyTag, // <a/>
        kEndTag,
        kCData,
        kComment,
        kDeclaration, // <?xml ...?>
        kInstruction  // any other <? ?>
    };

    Type type = Type::kIncomplete;
    std::size_t size = 0;
    XmlSpan name{}; // of a tag
};

// Reads one token after the other, by this grammar:
//
//   token        = text | start-tag | empty-tag | end-tag | cdata | comment | instruction
//   text         = one or more bytes other than "<"
//   start-tag    = "<" name (blanks attribute)* blanks? ">"
//   empty-tag    = "<" name (blanks attribute)* blanks? "/>"
//   end-tag      = "</" name blanks? ">"
//   attribute    = name blanks? "=" blanks? ('"' [^"<]* '"' | "'" [^'<]* "'")
//   cdata        = "<![CDATA[" ... "]]>"
//   comment      = "<!--" ... "-->"
//   instruction  = "<?" ... "?>"
//   name         = [A-Za-z_:] or a byte from 0x80, then these and [0-9.-]
//
// Of XML 1.0 it refuses document types, and with them entities of the sender's own: CIM-XML needs neither, and both are
// ways to make a small message large. It is more lenient in what has no effect on the meaning: "]]>" in text, "--" in a
// comment and any content of an instruction pass.
// Throws: XmlError (another declaration, a malformed tag, a token or a number of attributes over its limit).
class XmlScanner
{
  public:
    explicit XmlScanner(const XmlLimits& limits) : fLimits(limits) {}

    // Reads the token that begins at `from`, and appends a tag's attributes to `attributes`. All spans are of the
    // source's text. Requires: from < source.text.size(); the text is smaller than 4 GB.
    XmlToken next(const XmlSource& source, std::size_t from, std::vector<XmlAttributeSpan>& attributes) const;

  private:
    XmlToken markup(const XmlSource& source, std::size_t from, std::vector<XmlAttributeSpan>& attributes) const;
    XmlToken startTag(const XmlSource& source, std::size_t from, std::vector<XmlAttributeSpan>& attributes) const;
    XmlToken endTag(const XmlSource& source, std::size_t from) const;
    XmlToken upTo(XmlToken::Type type, const XmlSource& source, std::size_t from, std::size_t contentAt,
                  std::string_view end, std::size_t limit) const;
    XmlToken checkedTag(const XmlToken& token, const XmlSource& source, std::size_t from) const;

    const XmlLimits& fLimits;
};

// Whether the text from `at` on is a line feed and then markup, as most texts between elements are. It needs no token:
// a blank text may stand anywhere. Requires: at < text.size().
inline bool isLineFeedBetween(std::string_view text, std::size_t at)
{
    return text.data()[at] == '\n' && at + 1 < text.size() && text.data()[at + 1] == '<';
}

// Moves a place over `bytes`.
XmlPlace advance(XmlPlace place, std::string_view bytes);

} // namespace Pegasus::wire
