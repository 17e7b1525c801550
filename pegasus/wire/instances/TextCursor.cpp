// SPDX-License-Identifier: MIT
#include "pegasus/wire/instances/TextCursor.h"

#include "pegasus/base/ByteBlock.h"
#include "pegasus/base/Utf8.h"

#include <memory>

namespace Pegasus::wire {
namespace {

using Block = base::ByteBlock;

// Returns: the first byte that ends a text or needs a closer look: "<", "&", a carriage return, a zero, a byte of a
// character beyond ASCII.
const char* findSpecial(const char* at, const char* end)
{
    for (; end - at >= std::ptrdiff_t(sizeof(Block)); at += sizeof(Block)) {
        const Block c = base::loadBlock(at);
        const std::size_t first = base::firstMarked((c == '<') | (c == '&') | (c == '\r') | (c == 0) | (c >= 0x80));
        if (first < sizeof(Block)) {
            return at + first;
        }
    }
    while (at < end && *at != '<' && *at != '&' && *at != '\r' && static_cast<signed char>(*at) > 0) {
        ++at;
    }
    return at;
}

bool isDecodable(std::string_view utf8)
{
    const std::unique_ptr<Char16[]> units(new Char16[utf8.size()]);
    return base::decodeUtf8(utf8.data(), utf8.size(), units.get()).invalid == nullptr;
}

} // namespace

bool TextCursor::takeText(std::string_view& text)
{
    const char* const special = findSpecial(fAt, fEnd);
    const void* const found = std::memchr(special, '<', static_cast<std::size_t>(fEnd - special));
    if (found == nullptr) {
        fIsCut = true;
        return false;
    }
    const char* const end = static_cast<const char*>(found);
    const std::size_t size = static_cast<std::size_t>(end - fAt);
    text = trimBlanks({fAt, size});
    if (size > fMaxTextBytes || (special != end && !resolve(text))) {
        return false;
    }
    fAt = end;
    return true;
}

// Makes of a text with special bytes what it stands for.
bool TextCursor::resolve(std::string_view& text)
{
    if (text.find('\0') != std::string_view::npos) {
        return false;
    }
    if (needsResolving(text)) {
        fScratch.clear();
        if (!resolveReferences(text, fScratch).empty()) {
            return false;
        }
        text = fScratch;
    }
    return isDecodable(text);
}

} // namespace Pegasus::wire
