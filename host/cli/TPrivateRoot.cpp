// SPDX-License-Identifier: MIT
#include "host/cli/TPrivateRoot.h"

#include "host/cli/TOwnerCheck.h"

#include <cstdlib>
#include <filesystem>
#include <vector>

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

namespace vrxhost {
namespace {

namespace fs = std::filesystem;

constexpr mode_t kOwnerOnly = 0700;
constexpr char kPlannedConfiguration[] = "pegasus/cimserver_planned.conf";
constexpr const char* kMirroredFolders[] = {"pegasus/bin", "pegasus/lib", "pegasus/provider", "pegasus/pegSchema"};

bool MayWrite(const fs::path& folder)
{
    return ::faccessat(AT_FDCWD, folder.c_str(), W_OK | X_OK, AT_EACCESS) == 0;
}

std::string Variable(const char* name)
{
    const char* const value = std::getenv(name);
    return value ? value : "";
}

// The plug-in refuses a root with a character that a shell reads.
bool IsUsableByDefault(const fs::path& path)
{
    return path.is_absolute() && path.string().find_first_of(" \"'\\`$&|;<>()*?[]{}!#~") == std::string::npos;
}

// In /tmp anybody can make a link of that name, so that folder must be a real one.
fs::path FolderInTmp()
{
    return "/tmp/vrxhost-" + std::to_string(::geteuid());
}

std::vector<fs::path> DefaultDirectories(const TDeployedTree& tree)
{
    const fs::path state = Variable("XDG_STATE_HOME");
    const fs::path home = Variable("HOME");
    std::vector<fs::path> directories = {FolderInTmp() / tree.GetId()};
    if (state.is_absolute() || home.is_absolute()) {
        const fs::path parent = state.is_absolute() ? state : home / ".local/state";
        directories.insert(directories.begin(), parent / "vrxhost" / tree.GetId());
    }
    if (!tree.GetState().empty()) {
        directories.insert(directories.begin(), tree.GetState());
    }
    return directories;
}

void MakeFolders(const fs::path& path)
{
    if (!path.has_relative_path() || fs::is_directory(path)) {
        return;
    }
    MakeFolders(path.parent_path());
    if (::mkdir(path.c_str(), kOwnerOnly) != 0 && !fs::is_directory(path)) {
        throw fs::filesystem_error("cannot create", path, std::error_code(errno, std::generic_category()));
    }
}

// Returns: the real path; empty when the directory is unsafe, or making it or writing to it fails.
std::string MakePrivateDirectory(const fs::path& path)
{
    try {
        MakeFolders(path);
        if (!MayWrite(path) || (path.parent_path() == FolderInTmp() && fs::is_symlink(path.parent_path()))) {
            return "";
        }
        TOwnerCheck().CheckFile(path);
        return fs::canonical(path);
    } catch (const fs::filesystem_error&) {
        return "";
    } catch (const TTreeError&) { // another user made a folder of that name
        return "";
    }
}

// All links below the mirrored folders are an earlier run's; a folder that becomes empty goes with them.
void RemoveLinks(const fs::path& folder)
{
    for (const auto& entry : fs::directory_iterator(folder)) {
        if (entry.is_symlink()) {
            fs::remove(entry);
        } else if (entry.is_directory()) {
            RemoveLinks(entry);
            ::rmdir(entry.path().c_str()); // fails when something is left
        }
    }
}

// Anything but a link is the user's and stays.
void Link(const fs::path& file, const fs::path& link)
{
    const fs::file_status status = fs::symlink_status(link);
    if (fs::is_symlink(status)) {
        fs::remove(link);
    }
    if (fs::is_symlink(status) || !fs::exists(status)) {
        fs::create_symlink(file, link);
    }
}

void Mirror(const fs::path& from, const fs::path& to, int depth)
{
    MakeFolders(to);
    for (const auto& entry : fs::directory_iterator(from)) {
        if (!entry.is_directory()) {
            Link(entry, to / entry.path().filename());
        } else if (depth < kMaxTreeDepth) {
            Mirror(entry, to / entry.path().filename(), depth + 1);
        }
    }
}

// Only an earlier run makes the mark a link; a source tree or a deployed tree is somebody's, with a repository to lose.
void RefuseForeignContent(const fs::path& root)
{
    if (fs::exists(root / "pegasus") && !fs::is_empty(root / "pegasus") && !fs::is_symlink(root / kTreeMark)) {
        throw TTreeError(ELossKind::kState,
                         "the state directory " + root.string() + " holds a folder pegasus that vrxhost did not make");
    }
}

// What was planned for the tree's server holds here too; the user's own later plans stay.
void CopyPlannedConfiguration(const fs::path& from, const fs::path& to)
{
    if (::access(from.c_str(), R_OK) == 0) {
        fs::copy_file(from, to, fs::copy_options::update_existing);
    }
}

} // namespace

TPrivateRoot::TPrivateRoot(const TDeployedTree& tree, const std::string& directory)
    : fTree(tree.GetRoot()), fPath(fTree)
{
    if (directory.empty() && tree.GetState().empty() && MayWrite(fTree) && MayWrite(fTree + "/pegasus")) {
        return;
    }
    std::string tried;
    for (const fs::path& candidate : directory.empty() ? DefaultDirectories(tree) : std::vector<fs::path>{directory}) {
        fPath = directory.empty() && !IsUsableByDefault(candidate) ? "" : MakePrivateDirectory(candidate);
        if (!fPath.empty()) {
            return;
        }
        tried += (tried.empty() ? "" : " nor ") + candidate.string();
    }
    throw TTreeError(directory.empty() ? ELossKind::kNoState : ELossKind::kState,
                     directory.empty() ? "neither the tree " + fTree + " nor " + tried +
                                             " can be written; --state names a directory that can"
                                       : "the state directory " + directory +
                                             " cannot be made or written, or others may write it or a folder above");
}

void TPrivateRoot::Lay() const
{
    if (fPath == fTree) {
        return;
    }
    try {
        const fs::path root = fPath;
        RefuseForeignContent(root);
        MakeFolders(root / "pegasus");
        Link(fs::path(fTree) / kTreeMark, root / kTreeMark);
        for (const char* folder : kMirroredFolders) {
            MakeFolders(root / folder);
            RemoveLinks(root / folder);
            if (fs::is_directory(fs::path(fTree) / folder)) {
                Mirror(fs::path(fTree) / folder, root / folder, 0);
            }
        }
        for (const auto& entry : fs::directory_iterator(fTree)) {
            const fs::path name = entry.path().filename();
            if (name.string().find(".so") != std::string::npos || name == "vrx.conf") {
                Link(entry, root / name);
            }
        }
        CopyPlannedConfiguration(fs::path(fTree) / kPlannedConfiguration, root / kPlannedConfiguration);
    } catch (const fs::filesystem_error& e) {
        throw TTreeError(ELossKind::kState,
                         "the private root could not be laid: " + e.path1().string() + ": " + e.code().message());
    }
}

} // namespace vrxhost
