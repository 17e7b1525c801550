#include "src/common/Files.h"

#include <dirent.h>
#include <fcntl.h>
#include <sys/stat.h>

namespace NKOLVRX20 {

namespace {

struct TDirectoryCloser
{
    void operator()(DIR* directory) const { static_cast<void>(::closedir(directory)); }
};

bool HasFileType(const std::string& path, mode_t type)
{
    struct stat status = {};
    return ::stat(path.c_str(), &status) == 0 && (status.st_mode & S_IFMT) == type;
}

} // namespace

bool IsDirectory(const std::string& path)
{
    return HasFileType(path, S_IFDIR);
}

bool IsRegularFile(const std::string& path)
{
    return HasFileType(path, S_IFREG);
}

bool ReadDirectory(const std::string& path, std::vector<std::string>& names)
{
    const std::unique_ptr<DIR, TDirectoryCloser> directory(::opendir(path.c_str()));
    if (!directory) {
        return false;
    }
    while (const dirent* entry = ::readdir(directory.get())) {
        names.emplace_back(entry->d_name);
    }
    return true;
}

TFile OpenRegularFile(const std::string& path)
{
    if (!IsRegularFile(path)) {
        return nullptr;
    }
    TFile file(std::fopen(path.c_str(), "r"));
    if (file) {
        static_cast<void>(::fcntl(::fileno(file.get()), F_SETFD, FD_CLOEXEC));
    }
    return file;
}

} // namespace NKOLVRX20
