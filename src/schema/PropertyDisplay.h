// A property's value in words, by the qualifiers of its declaration (DSP0004, 5.6.3).
#pragma once

#include <host/TCIMValue.h>

#include <boost/shared_ptr.hpp>

#include <string>
#include <vector>

namespace NKOLVRX20 {

// The first of these that applies to an integer or a string: the Values text of its ValueMap entry (an entry for the
// very value before a range, a range before the claim of all the rest, ".."), or of its place where there is no
// ValueMap; the BitValues texts of the bits that are set, joined by " | "; the plain text and, after a number, a blank
// and the Units or else the PUnit.
// Returns: one text for each element of an array, one for a scalar, none for null. The declaration may be null.
std::vector<std::string> DisplayTexts(const TCIMValue& value, const boost::shared_ptr<ICIMPropertyDecl>& declaration);

// Returns: the texts with ", " between them.
std::string JoinDisplayTexts(const std::vector<std::string>& texts);

} // namespace NKOLVRX20
