// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>

namespace Pegasus::wire {

// What became of an element that was offered as text, before it is read.
struct XmlOffer
{
    enum class Result
    {
        kRefused, // it is to be read
        kCut,     // it goes on after the text, and may be offered again when more of it is there
        kTaken
    };

    Result result = Result::kRefused;
    std::size_t size = 0; // of the element that was taken
};

} // namespace Pegasus::wire
