// SPDX-License-Identifier: MIT
// How properties and instances are shown to people.
#pragma once

#include "host/cli/formats/IFormat.h"

namespace vrxhost {

// Returns: the value's text; sizes, rates and long numbers as people read them unless options.fRaw.
std::string ValueText(const TPropertyRecord& property, const TPropertyDeclRecord* declaration,
                      const TFormatOptions& options);

// Returns: whether the property is shown: it has a value, differs from what the class and the system are called, and is
// stable where that is asked for.
bool IsShown(const TClassRecord& each, const TPropertyRecord& property, const TFormatOptions& options);

// Returns: whether the document may hold the property: with options.fStable only what two runs have in common.
bool IsKept(const TClassRecord& each, const TPropertyRecord& property, const TFormatOptions& options);

// Returns: the class of an object path, and the values of the keys that tell instances of it apart:
// "LNX_NetworkPort eth0".
std::string PathLabel(const std::string& path);

// Returns: the path as an instance of the same object has it, without host and namespace.
std::string LocalPath(const std::string& path);

// Returns: the names of the properties that at least one of the class's instances shows, keys first, since they tell
// instances apart.
std::vector<std::string> ShownColumns(const TClassRecord& each, const TFormatOptions& options);

// Returns: what the class says about the values of a property, "2 Unknown, 3 Other"; empty when it says nothing.
std::string ValueList(const TPropertyDeclRecord& property);

// Returns: the number whose text people see, as it was delivered; empty for null, an array, whatever is not a number,
// and a number that has a name.
std::string ShownNumber(const TPropertyRecord& property, const TPropertyDeclRecord* declaration);

// Returns: the outcome of a check, with the time that it took unless the document is stable.
std::string CheckText(const TCheck& check, const TFormatOptions& options);

} // namespace vrxhost
