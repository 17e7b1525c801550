// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/wire/XmlSlicer.h"

#include <Pegasus/Common/CIMClass.h>

#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

namespace Pegasus::client {

// The last classes that were decoded, each with its text, so that an equal answer costs a comparison. A program that
// builds a hierarchy reads a class for its superclass's name, goes up to the root likewise, and comes back to read each
// class again for what it declares.
//
// A class is kept as a copy, because the program may change the one that it got, and leaves with the answer that takes
// it: a copy costs a tenth of decoding, and what is asked for a third time seldom is.
// Thread: one thread at a time.
class KnownClasses
{
  public:
    // Keeps what a CLASS was decoded into; `bytes` is what the decoder counted for it.
    void learn(const wire::XmlElement& element, const CIMClass& decoded, std::size_t bytes);
    // Takes an element that begins the text if it is a kept one. Returns: what became of it; a taken one is in
    // `decoded` and in bytes(), and no longer here.
    wire::XmlOffer take(std::string_view text, CIMClass& decoded);
    // Returns: what was counted for the last taken class.
    std::size_t bytes() const { return fBytes; }

  private:
    struct Known
    {
        std::string text;
        CIMClass decoded;
        std::size_t bytes = 0;
    };

    std::vector<Known> fClasses; // the oldest first
    std::size_t fBytes = 0;
};

} // namespace Pegasus::client
