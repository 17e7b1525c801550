// SPDX-License-Identifier: MIT
#include "host/cli/TOwnerCheck.h"

#include "host/cli/TDeployedTree.h"

#include <algorithm>
#include <cerrno>
#include <cstdio>
#include <cstring>
#include <filesystem>
#include <optional>
#include <vector>

#include <grp.h>
#include <pwd.h>
#include <sys/stat.h>
#include <unistd.h>

namespace vrxhost {
namespace {

namespace fs = std::filesystem;

constexpr mode_t kModeBits = 07777;
constexpr int kMaxLinks = 40; // as in the kernel

// The folders below pegasus whose content is run, loaded or compiled.
constexpr const char* kCheckedFolders[] = {"bin", "lib", "provider", "pegSchema"};

std::string UserName(uid_t user)
{
    const passwd* const entry = ::getpwuid(user);
    return entry ? entry->pw_name : "user " + std::to_string(user);
}

// The entry of getpwuid() and getgrgid() is overwritten by the next call, so what is needed of it is copied.
std::optional<std::string> NameOfUserWithPrimaryGroup(uid_t user, gid_t group)
{
    const passwd* const entry = ::getpwuid(user);
    return entry && entry->pw_gid == group ? std::optional<std::string>(entry->pw_name) : std::nullopt;
}

bool HasOtherMembers(gid_t group, const std::string& name)
{
    const ::group* const entry = ::getgrgid(group);
    for (char** member = entry ? entry->gr_mem : nullptr; member && *member; ++member) {
        if (name != *member) {
            return true;
        }
    }
    return !entry;
}

bool IsPrimaryGroupOfAnother(gid_t group, uid_t owner)
{
    bool found = false;
    ::setpwent();
    while (const passwd* const entry = found ? nullptr : ::getpwent()) {
        found = entry->pw_gid == group && entry->pw_uid != owner;
    }
    ::endpwent();
    return found;
}

bool IsPrivateGroup(gid_t group, uid_t owner)
{
    const auto name = NameOfUserWithPrimaryGroup(owner, group);
    return name && !HasOtherMembers(group, *name) && !IsPrimaryGroupOfAnother(group, owner);
}

bool OnlyOwnerMayWrite(const struct stat& status)
{
    return !(status.st_mode & S_IWOTH) && (!(status.st_mode & S_IWGRP) || IsPrivateGroup(status.st_gid, status.st_uid));
}

struct stat StatusOf(const std::string& path)
{
    struct stat status = {};
    if (::stat(path.c_str(), &status) != 0) {
        throw TTreeError(path + " could not be looked at: " + std::strerror(errno));
    }
    return status;
}

void CheckStatus(const std::string& path, const struct stat& status, bool othersMayWrite)
{
    if (!othersMayWrite && (status.st_uid == 0 || status.st_uid == ::geteuid())) {
        return;
    }
    char mode[8];
    std::snprintf(mode, sizeof mode, "%04o", status.st_mode & kModeBits);
    const std::string user = UserName(::geteuid());
    throw TTreeError(ELossKind::kForeignWriter, path + " (owner " + UserName(status.st_uid) + ", mode " + mode +
                                                    ") could be changed by another user; what runs as " + user +
                                                    " must belong to " + (user == "root" ? "root" : "root or " + user) +
                                                    ", and nobody else may write it");
}

// Returns: where the link leads; empty for anything else than a link.
std::string LinkTarget(const std::string& path)
{
    std::error_code error;
    return fs::read_symlink(path, error);
}

void PushNames(const fs::path& path, std::vector<std::string>& names)
{
    const auto size = static_cast<std::ptrdiff_t>(names.size());
    names.insert(names.end(), path.begin(), path.end());
    std::reverse(names.begin() + size, names.end());
}

} // namespace

void TOwnerCheck::CheckFile(const std::string& path)
{
    const std::string resolved = Walk(path);
    const struct stat status = StatusOf(resolved);
    CheckStatus(resolved, status, !OnlyOwnerMayWrite(status));
}

std::string TOwnerCheck::Walk(const std::string& path)
{
    std::string at;
    std::vector<std::string> rest; // the next name is the last
    PushNames(path, rest);
    for (int links = 0; !rest.empty();) {
        const std::string name = rest.back();
        rest.pop_back();
        if (name == "/") {
            at.clear();
        } else if (name == "..") {
            at.erase(std::min(at.size(), at.rfind('/')));
        } else if (!name.empty() && name != ".") {
            CheckFolderAbove(at + "/");
            at += "/" + name;
            const std::string target = LinkTarget(at);
            if (!target.empty()) {
                if (++links > kMaxLinks) {
                    throw TTreeError(path + " could not be looked at: " + std::strerror(ELOOP));
                }
                at.erase(at.rfind('/'));
                PushNames(target, rest);
            }
        }
    }
    return at.empty() ? "/" : at;
}

void TOwnerCheck::CheckFolderAbove(const std::string& path)
{
    if (fFoldersAbove.insert(path).second) {
        const struct stat status = StatusOf(path);
        CheckStatus(path, status, !(status.st_mode & S_ISVTX) && !OnlyOwnerMayWrite(status));
    }
}

void TOwnerCheck::CheckBelow(const std::string& folder)
{
    CheckFile(folder);
    std::error_code error;
    // Vendors' folders may be links.
    constexpr auto kFollow = fs::directory_options::follow_directory_symlink;
    for (fs::recursive_directory_iterator entry(folder, kFollow, error), end; !error && entry != end;
         entry.increment(error))
    {
        CheckFile(entry->path());
        if (entry.depth() == kMaxTreeDepth) {
            entry.disable_recursion_pending();
        }
    }
    if (error) {
        throw TTreeError(folder + " could not be read: " + error.message());
    }
}

void TOwnerCheck::CheckTree(const std::string& root)
{
    CheckFile(root);
    std::error_code error;
    for (fs::directory_iterator entry(root, error), end; !error && entry != end; entry.increment(error)) {
        if (entry->path().filename().string().find(".so") != std::string::npos) {
            CheckFile(entry->path());
        }
    }
    if (error) {
        throw TTreeError(root + " could not be read: " + error.message());
    }
    const fs::path server = fs::path(root) / "pegasus";
    CheckFile(server);
    for (const char* name : kCheckedFolders) {
        if (fs::exists(server / name, error)) {
            CheckBelow(server / name);
        }
    }
}

} // namespace vrxhost
