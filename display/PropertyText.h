// A property's value as human-readable text, made from the qualifiers of the property's declaration (DSP0004, 5.6.3).
#pragma once

#include <host/TCIMValue.h>

#include <boost/shared_ptr.hpp>

#include <string>
#include <vector>

namespace NKOLVRX20 {

class ICIMPropertyDecl;

// The text of each element. The first rule that applies gives it:
// 1. Values, for an integer, a string or a char16 that ValueMap has an entry for (an exact entry beats a range, a range
//    beats ".."). Where ValueMap is missing, an integer is the index into Values.
// 2. BitValues, for an integer with bits that BitMap names: the texts of those bits, joined by " | ", and after them
//    the remaining bits in hexadecimal. Where BitMap is missing, the texts count from bit 0.
// 3. The plain text: datetimes as ToUIString, char16 as CharacterText, all others as ToString(10). A number gets a
//    blank and Units, or PUnit where Units is missing.
// The declaration may be null, which leaves the plain text.
// Returns: one text per array element, one for a scalar, an empty list for null.
// Throws: what the declaration throws.
std::vector<std::string> PropertyTexts(const TCIMValue& value, const boost::shared_ptr<ICIMPropertyDecl>& declaration);

// Returns: the same texts joined by ", ".
std::string PropertyText(const TCIMValue& value, const boost::shared_ptr<ICIMPropertyDecl>& declaration);

// Returns: the code unit as one UTF-8 character. An unpaired surrogate becomes U+FFFD.
std::string CharacterText(TCIMChar16 character);

} // namespace NKOLVRX20
