#pragma once

#include "pegasus/cmpi/objects/TableFunction.h"

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

  private:
    std::string fText;
};

extern const CMPIStringFT kStringTable;

} // namespace Pegasus::cmpi
