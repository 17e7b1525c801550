// SPDX-License-Identifier: MIT
#include "pegasus/base/OwnedPath.h"

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <memory>
#include <vector>

#include <grp.h>
#include <pwd.h>
#include <sys/stat.h>
#include <unistd.h>

namespace Pegasus::base {

namespace {

constexpr std::size_t kMaxDatabaseEntryBytes = 64u << 10; // of one user or group

// Returns: the user's name, or the number of an unnamed user.
std::string userName(uid_t user)
{
    std::vector<char> space(kMaxDatabaseEntryBytes);
    passwd entry = {};
    passwd* found = nullptr;
    return ::getpwuid_r(user, &entry, space.data(), space.size(), &found) == 0 && found != nullptr
               ? found->pw_name
               : std::to_string(user);
}

// Whether the group has the user's name, and all its listed members are that user.
bool isPrivateGroup(gid_t group, uid_t user)
{
    std::vector<char> space(kMaxDatabaseEntryBytes);
    ::group entry = {};
    ::group* found = nullptr;
    if (::getgrgid_r(group, &entry, space.data(), space.size(), &found) != 0 || found == nullptr) {
        return false;
    }
    const std::string name = userName(user);
    if (name != found->gr_name) {
        return false;
    }
    char** member = found->gr_mem;
    while (*member != nullptr && name == *member) {
        ++member;
    }
    return *member == nullptr;
}

bool isTrusted(uid_t user)
{
    return user == 0 || user == ::geteuid();
}

bool mayOthersWrite(const struct stat& info)
{
    if ((info.st_mode & S_IWOTH) != 0) {
        return true;
    }
    return (info.st_mode & S_IWGRP) != 0 && !isPrivateGroup(info.st_gid, 0) &&
           !isPrivateGroup(info.st_gid, ::geteuid());
}

enum class Part
{
    kItself,
    kFolderAbove
};

// What is wrong with one file or folder; empty when it is in order.
std::string faultOf(const std::string& path, Part part)
{
    struct stat info = {};
    if (::stat(path.c_str(), &info) != 0) {
        return {};
    }
    const bool sticky = part == Part::kFolderAbove && (info.st_mode & S_ISVTX) != 0;
    if (isTrusted(info.st_uid) && (sticky || !mayOthersWrite(info))) {
        return {};
    }
    char mode[8];
    std::snprintf(mode, sizeof mode, "%04o", info.st_mode & 07777u);
    const std::string own = ::geteuid() == 0 ? "" : " and " + userName(::geteuid());
    return path + " (owner " + userName(info.st_uid) + ", mode " + mode + ") can be changed by users other than root" +
           own;
}

// The first fault of the folders above a path, from the root down.
std::string faultAbove(const std::string& path)
{
    std::string fault = faultOf("/", Part::kFolderAbove);
    for (std::size_t slash = path.find('/', 1); fault.empty() && slash != std::string::npos;
         slash = path.find('/', slash + 1))
    {
        fault = faultOf(path.substr(0, slash), Part::kFolderAbove);
    }
    return fault;
}

std::string absolute(const std::string& path)
{
    if (path[0] == '/') {
        return path;
    }
    const std::unique_ptr<char, void (*)(void*)> folder(::getcwd(nullptr, 0), std::free);
    return folder ? std::string(folder.get()) + "/" + path : path;
}

std::string withoutSlashAtEnd(std::string path)
{
    while (path.size() > 1 && path.back() == '/') {
        path.pop_back();
    }
    return path;
}

} // namespace

std::string ownershipFault(const std::string& path)
{
    const std::unique_ptr<char, void (*)(void*)> real(::realpath(path.c_str(), nullptr), std::free);
    if (!real) {
        return {};
    }
    const std::string written = withoutSlashAtEnd(absolute(path));
    std::string fault = faultAbove(written);
    if (fault.empty() && written != real.get()) {
        fault = faultAbove(real.get());
    }
    return fault.empty() ? faultOf(real.get(), Part::kItself) : fault;
}

} // namespace Pegasus::base
