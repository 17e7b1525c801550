// SPDX-License-Identifier: MIT
#pragma once

#include "display/TValueMap.h"

#include <host/TCIMValue.h>

#include <string>
#include <vector>

namespace NKOLVRX20 {

class ICIMNamedElement;

// What the qualifiers of a declaration (of a property, a method, a parameter) say about texts, read once for all
// elements of a value.
class TTextRules
{
  public:
    // Throws: what the declaration throws.
    explicit TTextRules(const ICIMNamedElement& declaration);

    // The first rule that applies gives the text:
    // 1. Values, for an integer, a string or a char16 that ValueMap has an entry for. Where ValueMap is missing, an
    //    integer is the index into Values.
    // 2. BitValues, for an integer with bits that BitMap names: the texts of those bits, joined by " | ", then the
    //    remaining bits in hexadecimal. Where BitMap is missing, the texts count from bit 0.
    // 3. The plain text. A number gets a blank and Units, or PUnit where Units is missing.
    // Requires: a scalar other than null.
    std::string Text(const TCIMValue& value) const;

  private:
    std::string BitText(unsigned long bits) const;

    const TValueMap fValueMap;
    const std::vector<std::string> fValues;
    const TValueMap fBitMap;
    const std::vector<std::string> fBitValues;
    const std::string fUnit;
};

} // namespace NKOLVRX20
