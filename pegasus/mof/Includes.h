// SPDX-License-Identifier: MIT
#pragma once

#include <filesystem>
#include <string>
#include <vector>

namespace Pegasus::mof {

// Finds included files. A vendor's file may include what lies below the folder of the compilation's first file and
// below the -I folders, links resolved: a diagnostic then shows nothing of other files of the machine.
class Includes
{
  public:
    // `firstFile`: the file that is compiled. `directories`: the -I folders.
    Includes(const std::string& firstFile, const std::vector<std::string>& directories);

    // Looks in the including file's directory (with its slash, or empty), the current directory and the -I folders, in
    // this order. An absolute name is taken as it is. Returns: the path; empty when there is no such file.
    std::string find(const std::string& name, const std::string& includingDirectory) const;

    // Returns: whether the existing file lies below one of the folders.
    bool isOwn(const std::string& path) const;

  private:
    std::vector<std::string> fDirectories;
    std::vector<std::filesystem::path> fOwnFolders; // links resolved
};

} // namespace Pegasus::mof
