#include "pegasus/mof/IncludeSearch.h"

#include <sys/stat.h>

namespace Pegasus::mof {

namespace {

bool isFile(const std::string& path)
{
    struct stat status = {};
    return ::stat(path.c_str(), &status) == 0 && !S_ISDIR(status.st_mode);
}

} // namespace

std::string findInclude(const std::string& name, const std::string& includingDirectory,
                        const std::vector<std::string>& includeDirectories)
{
    const bool isAbsolute = !name.empty() && name[0] == '/';
    if (!isAbsolute && isFile(includingDirectory + name)) {
        return includingDirectory + name;
    }
    if (isFile(name)) {
        return name;
    }
    if (isAbsolute) {
        return "";
    }
    for (const std::string& directory : includeDirectories) {
        if (isFile(directory + "/" + name)) {
            return directory + "/" + name;
        }
    }
    return "";
}

} // namespace Pegasus::mof
