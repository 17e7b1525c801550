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

// Returns: the objects that the associations of the classes link, each below the object that it is a part of or depends
// on: the end whose name begins with "Group", "Ante" or "Parent" is above the other, else the first end. An object that
// is below several is shown below each, with its own branches once. indent goes before each line.
std::string AssociationTree(const std::vector<const TClassRecord*>& associations, const std::string& indent);

} // namespace vrxhost
