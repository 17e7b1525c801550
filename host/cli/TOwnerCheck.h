// SPDX-License-Identifier: MIT
#pragma once

#include <set>
#include <string>

namespace vrxhost {

// How deep a folder of a tree is looked through; links may lead round in circles.
inline constexpr int kMaxTreeDepth = 8;

// Refuses programs and libraries that somebody else could have put in place: what is checked must belong to root or to
// the user of this process and be writable by nobody else. A group counts as its owner when nobody else is in it. The
// same holds for each folder above, except that there the sticky bit makes up for a writable folder.
// Thread: one at a time.
class TOwnerCheck
{
  public:
    // What the plug-in or the server runs or loads below a root: its libraries, and pegasus minus what a run writes.
    // Throws: TTreeError with path, owner and mode.
    void CheckTree(const std::string& root);

    // The file or folder that the path leads to.
    // Throws: as CheckTree.
    void CheckFile(const std::string& path);

  private:
    void CheckBelow(const std::string& folder);
    // Follows an absolute path link by link, because whoever may change a folder on the way may change where it leads.
    // Returns: where it leads.
    std::string Walk(const std::string& path);
    void CheckFolderAbove(const std::string& path);

    std::set<std::string> fFoldersAbove; // that were found in order
};

} // namespace vrxhost
