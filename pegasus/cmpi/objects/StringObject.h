// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/cmpi/objects/TableFunction.h"

#include <memory>
#include <string>

namespace Pegasus::cmpi {

// A CMPIString. Its handle is the text itself: macros of older CMPI headers read it directly.
class StringObject final : public Owned, public CMPIString
{
  public:
    explicit StringObject(std::string text);
    StringObject(const StringObject& other) : StringObject(other.fText) {}

    const std::string& text() const { return fText; }

    Lifetime lifetime = Lifetime::kFrame;
    std::shared_ptr<const bool> holder; // true while an array that was not used yet holds this; may be null

  private:
    std::string fText;
};

extern const CMPIStringFT kStringTable;

} // namespace Pegasus::cmpi
