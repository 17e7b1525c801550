// SPDX-License-Identifier: MIT
#pragma once

#include "host/cli/TDeployedTree.h"

#include <string>

namespace vrxhost {

// A root of the user's own, for a tree that is read-only to the user, such as an installed package: its folders are
// real and its files are links to the tree's. Whatever a run writes or removes (repository, configuration, log, a
// vendor's file that the plug-in deletes) lies there, and a removed link leaves the tree's file in place.
class TPrivateRoot
{
  public:
    // directory: the user's choice; when it is empty, a tree that can be written is its own root, unless its mark
    // names a place for what runs write.
    // Throws: TTreeError when there is no place to write in.
    TPrivateRoot(const TDeployedTree& tree, const std::string& directory);

    // Returns: the root to work in: the private one or the tree's own.
    const std::string& GetPath() const { return fPath; }

    // Replaces the links, so that they follow the tree's updates; files that the user put beside them stay.
    // Returns at once for the tree's own root. Requires: exclusive use of the root. Throws: TTreeError when laying the
    // links fails, or the directory holds a folder pegasus of other origin.
    void Lay() const;

  private:
    std::string fTree;
    std::string fPath;
};

} // namespace vrxhost
