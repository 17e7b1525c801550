// SPDX-License-Identifier: MIT
#include "src/common/Files.h"

#include <cerrno>
#include <cstring>

#include <dirent.h>
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

namespace NKOLVRX20 {

namespace {

constexpr mode_t kPublicMode = S_IRUSR | S_IWUSR | S_IRGRP | S_IROTH;

struct TDirectoryCloser
{
    void operator()(DIR* directory) const { static_cast<void>(::closedir(directory)); }
};

bool HasFileType(const std::string& path, mode_t type)
{
    struct stat status = {};
    return ::stat(path.c_str(), &status) == 0 && (status.st_mode & S_IFMT) == type;
}

bool IsRegular(int descriptor)
{
    struct stat status = {};
    return ::fstat(descriptor, &status) == 0 && S_ISREG(status.st_mode);
}

// Returns: why the opened file is refused; null when it may be read.
const char* ReasonAgainst(int descriptor)
{
    struct stat status = {};
    if (::fstat(descriptor, &status) != 0) {
        return std::strerror(errno);
    }
    if (!S_ISREG(status.st_mode)) {
        return "not a regular file";
    }
    return status.st_uid == 0 || status.st_uid == ::geteuid() ? nullptr : "owned by another user";
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
    return TFile(std::fopen(path.c_str(), "re")); // close-on-exec
}

TFile OpenOwnFile(const std::string& path, std::string& reason)
{
    reason.clear();
    // O_NONBLOCK, because opening a pipe would otherwise wait for its writer.
    const int descriptor = ::open(path.c_str(), O_RDONLY | O_NONBLOCK | O_NOFOLLOW | O_NOCTTY | O_CLOEXEC);
    if (descriptor == -1) {
        if (errno != ENOENT) {
            reason = errno == ELOOP ? "a symbolic link" : std::strerror(errno);
        }
        return nullptr;
    }
    // The descriptor is looked at, not the path: what lies there may change in between.
    const char* against = ReasonAgainst(descriptor);
    TFile file(against ? nullptr : ::fdopen(descriptor, "r"));
    if (!file) {
        reason = against ? against : std::strerror(errno);
        static_cast<void>(::close(descriptor));
    }
    return file;
}

bool WritePublicFile(const std::string& path, const std::string& content)
{
    const int descriptor = ::open(
        path.c_str(), O_WRONLY | O_CREAT | O_TRUNC | O_NOFOLLOW | O_NONBLOCK | O_NOCTTY | O_CLOEXEC, kPublicMode);
    if (descriptor == -1) {
        return false;
    }
    const TFile file(IsRegular(descriptor) ? ::fdopen(descriptor, "w") : nullptr);
    if (!file) {
        static_cast<void>(::close(descriptor));
        return false;
    }
    // The umask has changed the mode of a new file. Where the mode belongs to another user, the content still counts.
    static_cast<void>(::fchmod(descriptor, kPublicMode));
    return std::fwrite(content.data(), 1, content.size(), file.get()) == content.size() && std::fflush(file.get()) == 0;
}

} // namespace NKOLVRX20
