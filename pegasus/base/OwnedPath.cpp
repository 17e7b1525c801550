// SPDX-License-Identifier: MIT
#include "pegasus/base/OwnedPath.h"

#include "pegasus/base/Users.h"

#include <algorithm>
#include <cerrno>
#include <climits>
#include <cstdio>
#include <cstdlib>
#include <memory>
#include <mutex>
#include <optional>
#include <utility>
#include <vector>

#include <grp.h>
#include <pwd.h>
#include <sys/stat.h>
#include <unistd.h>

namespace Pegasus::base {

namespace {

constexpr int kMaxLinks = 40; // as in the kernel

std::optional<gid_t> primaryGroup(uid_t user)
{
    std::vector<char> space(kMaxDatabaseEntryBytes);
    passwd entry = {};
    passwd* found = nullptr;
    return ::getpwuid_r(user, &entry, space.data(), space.size(), &found) == 0 && found != nullptr
               ? std::optional<gid_t>(found->pw_gid)
               : std::nullopt;
}

bool hasOtherMembers(gid_t group, const std::string& name)
{
    std::vector<char> space(kMaxDatabaseEntryBytes);
    ::group entry = {};
    ::group* found = nullptr;
    if (::getgrgid_r(group, &entry, space.data(), space.size(), &found) != 0 || found == nullptr) {
        return true; // unknown members
    }
    char** member = found->gr_mem;
    while (*member != nullptr && name == *member) {
        ++member;
    }
    return *member != nullptr;
}

// A group does not list the users whose primary group it is. The walk through all users has one position in a process.
bool isPrimaryOfAnother(gid_t group, uid_t user)
{
    static std::mutex fgMutex;
    const std::lock_guard<std::mutex> lock(fgMutex);
    std::vector<char> space(kMaxDatabaseEntryBytes);
    passwd entry = {};
    passwd* found = nullptr;
    bool isFound = false;
    int error = 0;
    ::setpwent();
    while (!isFound && (error = ::getpwent_r(&entry, space.data(), space.size(), &found)) == 0) {
        isFound = found->pw_gid == group && found->pw_uid != user;
    }
    ::endpwent();
    return isFound || error != ENOENT; // which is the end of the list
}

bool isPrivateGroup(gid_t group, uid_t user)
{
    return primaryGroup(user) == group && !hasOtherMembers(group, userName(user)) && !isPrimaryOfAnother(group, user);
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
    if (isTrustedUser(info.st_uid) && (sticky || !mayOthersWrite(info))) {
        return {};
    }
    char mode[8];
    std::snprintf(mode, sizeof mode, "%04o", info.st_mode & 07777u);
    const std::string own = ::geteuid() == 0 ? "" : " and " + userName(::geteuid());
    const std::string shown = path.size() > 1 && path.back() == '/' ? path.substr(0, path.size() - 1) : path;
    return shown + " (owner " + userName(info.st_uid) + ", mode " + mode + ") can be changed by users other than root" +
           own;
}

std::string absolute(const std::string& path)
{
    if (path[0] == '/') {
        return path;
    }
    const std::unique_ptr<char, void (*)(void*)> folder(::getcwd(nullptr, 0), std::free);
    return folder ? std::string(folder.get()) + "/" + path : path;
}

// Returns: where the link leads; empty for anything else than a link.
std::string linkTarget(const std::string& path)
{
    char target[PATH_MAX];
    const ssize_t size = ::readlink(path.c_str(), target, sizeof target);
    return std::string(target, size > 0 ? static_cast<std::size_t>(size) : 0);
}

// Follows an absolute path link by link: whoever may write a folder with one of the links chooses where it leads.
class Walk
{
  public:
    explicit Walk(const std::string& path) { push(path); }

    // Returns: the first fault of the folders that the way leads through.
    std::string run()
    {
        std::string fault;
        while (fault.empty() && !fRest.empty()) {
            const std::string name = std::move(fRest.back());
            fRest.pop_back();
            if (name == "..") {
                fAt.erase(std::min(fAt.size(), fAt.rfind('/')));
            } else if (!name.empty() && name != ".") {
                fault = faultOf(fAt + "/", Part::kFolderAbove);
                enter(name);
            }
        }
        return fault;
    }
    // After run() without a fault: where the path leads, without links.
    std::string end() const { return fAt.empty() ? "/" : fAt; }

  private:
    void push(const std::string& path)
    {
        for (std::size_t end = path.size(), slash = 0; slash != std::string::npos; end = slash) {
            slash = end == 0 ? std::string::npos : path.rfind('/', end - 1);
            const std::size_t begin = slash == std::string::npos ? 0 : slash + 1;
            fRest.push_back(path.substr(begin, end - begin));
        }
        if (path[0] == '/') {
            fAt.clear();
        }
    }

    // The path exists, so its links end; should they be changed meanwhile, the bound ends the walk at one of them.
    void enter(const std::string& name)
    {
        const std::string target = fLinkCount < kMaxLinks ? linkTarget(fAt + "/" + name) : std::string();
        if (target.empty()) {
            fAt += "/" + name;
        } else {
            ++fLinkCount;
            push(target);
        }
    }

    std::string fAt;                // without links; empty for the root
    std::vector<std::string> fRest; // the next name is the last
    int fLinkCount = 0;
};

} // namespace

std::string ownershipFault(const std::string& path)
{
    struct stat info = {};
    if (path.empty() || ::stat(path.c_str(), &info) != 0) {
        return {};
    }
    Walk walk(absolute(path));
    const std::string fault = walk.run();
    return fault.empty() ? faultOf(walk.end(), Part::kItself) : fault;
}

} // namespace Pegasus::base
