#include "pegasus/server/admin/TreeOwners.h"

#include "pegasus/base/OwnedPath.h"
#include "pegasus/server/admin/TreeClaim.h"

#include <filesystem>

namespace Pegasus::server {

namespace {

namespace fs = std::filesystem;

void require(const std::string& path)
{
    const std::string fault = base::ownershipFault(path);
    if (!fault.empty()) {
        throw StartError("cimserver not started: " + fault +
                         "; cimconfig -s strictOwners=false -p switches this check off.");
    }
}

// A folder and what lies in it: programs and libraries.
void requireWithContent(const std::string& folder)
{
    require(folder);
    std::error_code ignored; // a folder that is not there has nothing to run
    for (const fs::directory_entry& entry : fs::directory_iterator(folder, ignored)) {
        require(entry.path().string());
    }
}

} // namespace

void requireOwnTree(const Config& config)
{
    if (!config.flag("strictOwners")) {
        return;
    }
    const fs::path program = fs::read_symlink("/proc/self/exe");
    require(program.string());
    require(program.parent_path().string());
    requireWithContent((program.parent_path().parent_path() / "lib").string());
    require(config.home());
    requireWithContent(config.home() + "/bin");
    requireWithContent(config.home() + "/lib");
    require(config.home() + "/provider");
    for (const std::string& folder : config.directories("providerDir")) {
        require(folder);
    }
}

} // namespace Pegasus::server
