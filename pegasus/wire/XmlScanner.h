// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/wire/XmlError.h"
#include "pegasus/wire/XmlLimits.h"

#include <cstddef>
#include <string_view>

namespace Pegasus::wire {

// One piece of markup or text at the beginning of some bytes.
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
};

// Finds where tokens end. Names, attributes and nesting are the parser's to check.
// Throws: XmlError (a DOCTYPE or another declaration, a token over its limit).
class XmlScanner
{
  public:
    explicit XmlScanner(const XmlLimits& limits) : fLimits(limits) {}

    // Requires: at least one byte. `place` is where they begin.
    XmlToken next(std::string_view bytes, XmlPlace place) const;

    // Returns: the name in a tag, which begins with "<" or "</".
    static std::string_view tagName(std::string_view tag);

  private:
    XmlToken markup(std::string_view bytes, XmlPlace place) const;
    XmlToken tag(std::string_view bytes, XmlPlace place) const;
    XmlToken upTo(XmlToken::Type type, std::string_view bytes, std::size_t from, std::string_view end,
                  std::size_t limit, XmlPlace place) const;

    const XmlLimits& fLimits;
};

// Moves a place over `bytes`.
XmlPlace advance(XmlPlace place, std::string_view bytes);

} // namespace Pegasus::wire
