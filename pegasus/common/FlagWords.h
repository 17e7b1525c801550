#pragma once

#include <Pegasus/Common/String.h>

#include <initializer_list>
#include <string>

namespace Pegasus {

// The words of the bits that are set, lowest bit first, with a blank between.
inline String joinFlagWords(Uint32 bits, std::initializer_list<const char*> words)
{
    std::string text;
    Uint32 bit = 1;
    for (const char* word : words) {
        if (bits & bit) {
            text.append(text.empty() ? "" : " ").append(word);
        }
        bit <<= 1;
    }
    return String(text.c_str());
}

} // namespace Pegasus
