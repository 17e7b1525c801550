// MOF compilation by the server's own compiler.
#include "src/common/CoreLog.h"
#include "src/common/Files.h"
#include "src/namespace/TPEGASUSNamespace.h"

#include <host/TVRXException.h>

namespace NKOLVRX20 {

void TPEGASUSNamespace::callCimmof(const std::string& cimNamespace, const std::string& mofPath)
{
    LogProgress(RunServerProgram("cimmof", {"-n", cimNamespace, "-aE", mofPath}));
}

std::vector<std::string> TPEGASUSNamespace::FindMofFiles(const std::string& directory, const std::string& pattern)
{
    std::vector<std::string> names;
    ReadDirectory(directory, names);
    std::vector<std::string> paths;
    for (const std::string& name : names) {
        if (name.find(pattern) != std::string::npos) {
            paths.push_back(directory + "/" + name);
        }
    }
    return paths;
}

std::vector<std::string> TPEGASUSNamespace::BuildMofPath(const std::string& path, const std::string& pattern)
{
    const std::string::size_type slash = path.rfind('/');
    if (slash == std::string::npos) {
        throw TVRXException(TVRXStatusCode::kBadPath);
    }
    return FindMofFiles(path.substr(0, slash), pattern);
}

} // namespace NKOLVRX20
