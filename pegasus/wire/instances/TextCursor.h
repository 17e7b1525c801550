// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/wire/XmlText.h"

#include <cstddef>
#include <cstring>
#include <string>
#include <string_view>
#include <vector>

namespace Pegasus::wire {

// Goes along the text of an element by what is expected there. Each function takes what it names and moves after it, or
// returns false and stays. Thread: one thread at a time.
class TextCursor
{
  public:
    TextCursor(std::string_view text, std::size_t maxTextBytes)
        : fBegin(text.data()), fAt(fBegin), fEnd(fBegin + text.size()), fMaxTextBytes(maxTextBytes)
    {
    }

    // Whether a function failed because the text ended.
    bool isCut() const { return fIsCut; }
    std::size_t position() const { return static_cast<std::size_t>(fAt - fBegin); }

    bool take(std::string_view bytes)
    {
        const std::size_t available = static_cast<std::size_t>(fEnd - fAt);
        if (available < bytes.size()) {
            fIsCut = fIsCut || std::memcmp(fAt, bytes.data(), available) == 0;
            return false;
        }
        if (std::memcmp(fAt, bytes.data(), bytes.size()) != 0) {
            return false;
        }
        fAt += bytes.size();
        return true;
    }

    void skipBlanks()
    {
        while (fAt < fEnd && isBlank(*fAt)) {
            ++fAt;
        }
    }

    // Character data up to the next "<", as XmlElement::text() gives it. It refuses what would fail there, and what is
    // not UTF-8. The view is valid until the next call.
    bool takeText(std::string_view& text);

  private:
    bool resolve(std::string_view& text);

    const char* const fBegin;
    const char* fAt;
    const char* const fEnd;
    const std::size_t fMaxTextBytes;
    bool fIsCut = false;
    std::string fScratch;
};

} // namespace Pegasus::wire
