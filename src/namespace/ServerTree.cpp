// SPDX-License-Identifier: MIT
#include "src/namespace/ServerTree.h"

#include "src/namespace/Removal.h"

#include <host/TOSSpecific.h>

#include <cstdlib>

namespace NKOLVRX20 {

namespace {

// Seconds that one of the server's programs may take.
constexpr int kProgramTimeoutSeconds = 32767;

constexpr char kPegasusHome[] = "/pegasus";
constexpr char kProgramDirectory[] = "/pegasus/bin/";
constexpr char kLibraryDirectory[] = "/pegasus/lib";
constexpr char kRepositoryDirectory[] = "/pegasus/repository";

// The vendors whose directories the server searches for libraries. The others' libraries are found through the
// registration of their providers.
constexpr const char* kLibraryVendors[] = {"/broadcom", "/mellanox", "/intelCDM", "/brocade", "/fusionio", "/nvidia"};
constexpr char kProgramVendor[] = "/mellanox";

// The inherited library path is left out on purpose, to keep the host's own libraries out of the server.
std::string LibraryPath(const std::string& root)
{
    std::string path = root + kLibraryDirectory + ":" + root;
    for (const char* vendor : kLibraryVendors) {
        path += ":" + root + kProviderDirectory + vendor;
    }
    return path;
}

std::string ProgramPath(const std::string& root)
{
    const char* inherited = std::getenv("PATH");
    return std::string(inherited ? inherited : "") + ":" + root + ":" + root + kProviderDirectory + kProgramVendor;
}

std::vector<std::string> ServerEnvironment(const std::string& root)
{
    return {"PEGASUS_HOME=" + root + kPegasusHome, "LD_LIBRARY_PATH=" + LibraryPath(root), "PATH=" + ProgramPath(root)};
}

} // namespace

TServerTree::TServerTree(const std::string& root) : fRoot(root), fEnvironment(ServerEnvironment(root)) {}

std::string TServerTree::Run(const std::string& program, const std::vector<std::string>& arguments) const
{
    std::string output;
    TOSSpecific::SpawnProcess(program, arguments, fRoot + kProgramDirectory + program, fEnvironment, output,
                              kProgramTimeoutSeconds);
    return output;
}

void TServerTree::RemoveRepositories() const
{
    RemovePath(fRoot + kRepositoryDirectory, kRemoveTree);
    RemovePath(LsiDirectory() + "repository.xml", kRemoveTree);
}

} // namespace NKOLVRX20
