// SPDX-License-Identifier: MIT
#pragma once

#include <string>
#include <vector>

namespace NKOLVRX20 {

// The vendors' directories, below the root directory (for the server) and below the module path (for discovery).
inline constexpr char kProviderDirectory[] = "/pegasus/provider";

// The server's program, and how a process listing names it.
inline constexpr char kServerName[] = "cimserver";

// The private server's files below the root directory: its programs, its repository, the vendors' libraries.
class TServerTree
{
  public:
    // The search path that the programs get begins with this process's own, as it is now.
    explicit TServerTree(const std::string& root);

    const std::string& Root() const { return fRoot; }
    std::string VendorDirectory() const { return fRoot + kProviderDirectory; }
    // Returns: the LSI provider's directory, with a trailing slash.
    std::string LsiDirectory() const { return VendorDirectory() + "/lsi_mir/"; }

    // Runs one of the server's programs to its end, in the server's environment.
    // Returns: what it wrote to its standard output. Its exit status is the process service's business.
    // Throws: TVRXException 12 when it fails to run or times out.
    // Blocks: until the program ends, at most 32767 seconds.
    std::string Run(const std::string& program, const std::vector<std::string>& arguments) const;

    // Removes the server's repository and the LSI provider's.
    // Requires: a root that is safe in a shell command.
    void RemoveRepositories() const;

  private:
    const std::string fRoot;
    const std::vector<std::string> fEnvironment;
};

} // namespace NKOLVRX20
