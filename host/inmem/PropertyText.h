#pragma once

#include <host/ICIMPropertyDecl.h>

#include <string>
#include <vector>

namespace NKOLVRX20 {

// A property's value as a person reads it. Integers and strings are looked up in the declaration's ValueMap and Values
// (ranges included; DSP0004, 5.6.3); other numbers get the declaration's Units, or PUnit. Without a declaration the
// plain text remains.
// Returns: one text per array element, one for a scalar, none for null.
std::vector<std::string> PropertyTexts(const TCIMValue& value, const boost::shared_ptr<ICIMPropertyDecl>& declaration);

// Returns: the same joined by ", ".
std::string PropertyText(const TCIMValue& value, const boost::shared_ptr<ICIMPropertyDecl>& declaration);

} // namespace NKOLVRX20
