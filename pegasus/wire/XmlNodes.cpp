// SPDX-License-Identifier: MIT
#include "pegasus/wire/XmlNodes.h"

#include "pegasus/wire/XmlText.h"

#include <cstring>
#include <iterator>

namespace Pegasus::wire {

using Kind = XmlError::Kind;
using Type = XmlToken::Type;

namespace {

// More than any usual element has. The memory of a bigger one is given back, because readers live long.
constexpr std::size_t kKeptNodes = 64UL * 1024;
// Enough for a request or a small answer without growing.
constexpr std::size_t kFirstNodes = 64;
constexpr std::size_t kFirstDepth = 16;

template <typename Item> void clearList(std::vector<Item>& items)
{
    items.clear();
    if (items.capacity() > kKeptNodes) {
        items.shrink_to_fit();
    }
}

} // namespace

XmlNodes::XmlNodes(const XmlLimits& limits) : fLimits(limits), fScanner(fLimits)
{
    fNodes.reserve(kFirstNodes);
    fAttributes.reserve(kFirstNodes);
    fOpen.reserve(kFirstDepth);
}

void XmlNodes::clear(std::size_t outerDepth)
{
    clearList(fNodes);
    clearList(fAttributes);
    fOpen.clear();
    fOuterDepth = outerDepth;
}

XmlToken XmlNodes::next(std::size_t from)
{
    fTagAttributes = fAttributes.size();
    return fScanner.next(fSource, from, fAttributes);
}

std::size_t XmlNodes::read(std::size_t from)
{
    while (from < fSource.text.size() && !fOpen.empty()) {
        if (isLineFeedBetween(fSource.text, from)) {
            ++from;
        }
        if (const std::size_t size = endTagSize(from)) {
            closeInner(from);
            from += size;
            continue;
        }
        const XmlToken token = next(from);
        const bool mayGoOn = token.type == Type::kText && from + token.size == fSource.text.size();
        if (token.type == Type::kIncomplete || mayGoOn) {
            break;
        }
        take(token, from);
        from += token.size;
    }
    return from;
}

// Most end tags need no token. Returns: the size of the inner element's end tag if it stands there as peers write it;
// else 0.
std::size_t XmlNodes::endTagSize(std::size_t from) const
{
    const char* const tag = fSource.text.data() + from;
    const std::size_t available = fSource.text.size() - from;
    if (tag[0] != '<' || available < 2 || tag[1] != '/') {
        return 0;
    }
    const XmlSpan name = fNodes[fOpen.back().node].name;
    const std::size_t size = std::size_t(name.size) + std::size("</>") - 1;
    const bool isThere = size <= available && tag[size - 1] == '>' &&
                         std::memcmp(tag + 2, fSource.text.data() + name.begin, name.size) == 0;
    return isThere && size <= fLimits.maxTagBytes ? size : 0;
}

void XmlNodes::take(const XmlToken& token, std::size_t from)
{
    switch (token.type) {
    case Type::kStartTag:
    case Type::kEmptyTag:
        return open(token, from);
    case Type::kEndTag:
        return close(token, from);
    case Type::kText:
        if (!isBlank(fSource.text.substr(from, token.size))) {
            markText();
        }
        break;
    case Type::kCData:
        markText();
        [[fallthrough]];
    default:
        fNodes[fOpen.back().node].hasSections = true;
    }
}

void XmlNodes::open(const XmlToken& token, std::size_t from)
{
    if (fOuterDepth + fOpen.size() >= fLimits.maxDepth) {
        fSource.fail(Kind::kTooLarge, from, "elements nested more than " + std::to_string(fLimits.maxDepth) + " deep");
    }
    if (fNodes.size() >= fLimits.maxElements) {
        fSource.fail(Kind::kTooLarge, from, "more than " + std::to_string(fLimits.maxElements) + " elements in one");
    }
    const auto index = static_cast<std::uint32_t>(fNodes.size());
    XmlNode& node = fNodes.emplace_back();
    node.name = token.name;
    node.content.begin = static_cast<std::uint32_t>(from + token.size);
    node.firstAttribute = static_cast<std::uint32_t>(fTagAttributes);
    node.attributeCount = static_cast<std::uint16_t>(fAttributes.size() - fTagAttributes);
    if (!fOpen.empty()) {
        Open& parent = fOpen.back();
        if (parent.lastChild == 0) {
            fNodes[parent.node].hasChild = true;
        } else {
            fNodes[parent.lastChild].nextSibling = index;
        }
        parent.lastChild = index;
    }
    if (token.type == Type::kStartTag) {
        fOpen.push_back({index, 0});
    }
}

void XmlNodes::close(const XmlToken& token, std::size_t from)
{
    if (token.name.in(fSource.text) != fNodes[fOpen.back().node].name.in(fSource.text)) {
        fSource.fail(Kind::kNotWellFormed, from, "Start-end tags mismatch");
    }
    closeInner(from);
}

// Ends the inner element, whose end tag begins at `from`.
void XmlNodes::closeInner(std::size_t from)
{
    XmlNode& node = fNodes[fOpen.back().node];
    node.content.size = static_cast<std::uint32_t>(from - node.content.begin);
    fOpen.pop_back();
}

// Notes that text stands here, which is wrong beside elements.
void XmlNodes::markText()
{
    const Open& inner = fOpen.back();
    if (inner.lastChild == 0) {
        fNodes[inner.node].hasText = true;
    } else {
        fNodes[inner.lastChild].hasTextAfter = true;
    }
}

} // namespace Pegasus::wire
