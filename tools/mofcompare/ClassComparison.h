// SPDX-License-Identifier: MIT
#pragma once

#include <Pegasus/Common/CIMClass.h>
#include <Pegasus/Common/CIMQualifierDecl.h>

#include <functional>
#include <string>
#include <vector>

namespace mofcompare {

// Looks up the declaration of a qualifier in the source. Returns: whether the source has one.
using Declarations = std::function<bool(const Pegasus::CIMName& name, Pegasus::CIMQualifierDecl& declaration)>;

// Returns: the differences between a class in its source and the local part of the class that a server returns, one
// line each, beginning with the element. It compares names, order, types, values, qualifiers and their flavors; a use
// that leaves its flavors out in the source has those of its declaration.
std::vector<std::string> differences(const Pegasus::CIMConstClass& source, const Pegasus::CIMConstClass& readBack,
                                     const Declarations& declarations);

// The same for a qualifier declaration: one line with both.
// Returns: an empty vector when they are equal.
std::vector<std::string> differences(const Pegasus::CIMConstQualifierDecl& source,
                                     const Pegasus::CIMConstQualifierDecl& readBack);

} // namespace mofcompare
