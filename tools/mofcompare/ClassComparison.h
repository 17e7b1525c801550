#pragma once

#include <Pegasus/Common/CIMClass.h>
#include <Pegasus/Common/CIMQualifierDecl.h>

#include <functional>
#include <string>
#include <vector>

namespace mofcompare {

// Looks up the declaration of a qualifier in the source. Returns false if there is none.
using Declarations = std::function<bool(const Pegasus::CIMName& name, Pegasus::CIMQualifierDecl& declaration)>;

// What differs between a class as its source declares it and the local part of the class as a server gives it back:
// one line each, beginning with the element. Names, order, types, values, qualifiers and their flavors all count;
// a use without flavors in the source has those of its declaration.
std::vector<std::string> differences(const Pegasus::CIMConstClass& source, const Pegasus::CIMConstClass& readBack,
                                     const Declarations& declarations);

std::vector<std::string> differences(const Pegasus::CIMConstQualifierDecl& source,
                                     const Pegasus::CIMConstQualifierDecl& readBack);

} // namespace mofcompare
