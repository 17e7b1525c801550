// SPDX-License-Identifier: MIT
// A property's value as human-readable text, made from the qualifiers of the property's declaration (DSP0004, 5.6.3).
#pragma once

#include <host/TCIMValue.h>

#include <boost/shared_ptr.hpp>

#include <string>
#include <vector>

namespace NKOLVRX20 {

class ICIMNamedElement;
class ICIMPropertyDecl;

// The text of each element, by the rules of TTextRules; the plain text where the declaration is null.
// Returns: one text per array element, one for a scalar, an empty list for null.
// Throws: what the declaration throws.
std::vector<std::string> PropertyTexts(const TCIMValue& value, const boost::shared_ptr<ICIMPropertyDecl>& declaration);

// Returns: the same texts joined by ", ".
std::string PropertyText(const TCIMValue& value, const boost::shared_ptr<ICIMPropertyDecl>& declaration);

// Returns: the same for a value that a method or a parameter declares; the declaration may be null.
std::string ElementText(const TCIMValue& value, const ICIMNamedElement* declaration);

} // namespace NKOLVRX20
