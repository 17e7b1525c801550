// SPDX-License-Identifier: MIT
#pragma once

#include "host/cli/model/Document.h"

#include <string>
#include <vector>

namespace vrxhost {

// An object of an association, and what belongs to it.
struct TLinkedObject
{
    std::string fPath;
    std::vector<TLinkedObject> fParts;
};

// Returns: the objects that the associations of the classes link, each below the object that it is a part of or depends
// on: the end whose name begins with "Group", "Ante" or "Parent" is above the other, else the first end. An object that
// is below several is shown below each, with its own branches once.
std::vector<TLinkedObject> LinkedObjects(const std::vector<const TClassRecord*>& associations);

// Returns: the same as lines of text. indent goes before each line.
std::string AssociationTree(const std::vector<const TClassRecord*>& associations, const std::string& indent);

} // namespace vrxhost
