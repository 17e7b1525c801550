// SPDX-License-Identifier: MIT
#pragma once

#include "host/cli/model/Document.h"

#include <map>
#include <set>
#include <string>
#include <vector>

namespace vrxhost {

// An object of an association, and what belongs to it.
struct TLinkedObject
{
    std::string fPath;
    std::vector<TLinkedObject> fParts;
};

// What associations link. Holds the paths of the linked objects alone.
class TLinks
{
  public:
    // Returns: whether the instance of an association links two objects; else it is left out. The end whose name begins
    // with "Group", "Ante" or "Parent" is above the other, else the first end.
    bool Add(const TClassRecord& association, const TInstanceRecord& link);

    // Returns: the objects, each below the one that it is a part of or depends on. An object that is below several is
    // shown below each, with its own branches once.
    std::vector<TLinkedObject> GetObjects() const;

  private:
    TLinkedObject ObjectOf(const std::string& path, int depth, std::set<std::string>& shown) const;

    std::vector<std::string> fOrder; // of those above
    std::map<std::string, std::vector<std::string>> fParts;
    std::set<std::string> fBelow;
};

// Returns: the objects as lines of text. indent goes before each line.
std::string AssociationTree(const std::vector<TLinkedObject>& objects, const std::string& indent);

} // namespace vrxhost
