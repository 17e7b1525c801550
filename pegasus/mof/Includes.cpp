// SPDX-License-Identifier: MIT
#include "pegasus/mof/Includes.h"

#include <algorithm>
#include <system_error>

namespace Pegasus::mof {

namespace fs = std::filesystem;

namespace {

bool isFile(const std::string& path)
{
    std::error_code error;
    const fs::file_type type = fs::status(path, error).type();
    return type != fs::file_type::not_found && type != fs::file_type::none && type != fs::file_type::directory;
}

// Returns: an empty path for one that does not exist.
fs::path resolved(const fs::path& path)
{
    std::error_code error;
    return fs::canonical(path, error);
}

fs::path folderOf(const std::string& file)
{
    std::error_code error;
    return fs::absolute(file, error).parent_path();
}

bool isBelow(const fs::path& path, const fs::path& folder)
{
    const auto ends = std::mismatch(folder.begin(), folder.end(), path.begin(), path.end());
    return !folder.empty() && ends.first == folder.end();
}

} // namespace

// The first file may be a link, as all files of a private root are: the folder of its target counts too.
Includes::Includes(const std::string& firstFile, const std::vector<std::string>& directories)
    : fDirectories(directories), fOwnFolders({resolved(folderOf(firstFile))})
{
    const fs::path target = resolved(firstFile);
    if (!target.empty()) {
        fOwnFolders.push_back(target.parent_path());
    }
    for (const std::string& directory : directories) {
        fOwnFolders.push_back(resolved(directory));
    }
}

std::string Includes::find(const std::string& name, const std::string& includingDirectory) const
{
    const bool isAbsolute = !name.empty() && name[0] == '/';
    if (!isAbsolute && isFile(includingDirectory + name)) {
        return includingDirectory + name;
    }
    if (isFile(name)) {
        return name;
    }
    for (const std::string& directory : fDirectories) {
        if (!isAbsolute && isFile(directory + "/" + name)) {
            return directory + "/" + name;
        }
    }
    return "";
}

bool Includes::isOwn(const std::string& path) const
{
    const fs::path file = resolved(path);
    return std::any_of(fOwnFolders.begin(), fOwnFolders.end(),
                       [&file](const fs::path& folder) { return isBelow(file, folder); });
}

} // namespace Pegasus::mof
