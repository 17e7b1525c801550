// SPDX-License-Identifier: MIT
#include "pegasus/server/admin/TreeClaim.h"

#include "pegasus/base/OwnedPath.h"
#include "pegasus/server/admin/Log.h"
#include "pegasus/server/admin/ProcessHandle.h"
#include "pegasus/server/admin/StartFile.h"

#include <filesystem>
#include <system_error>

#include <fcntl.h>
#include <sys/stat.h>

namespace Pegasus::server {

namespace {

namespace fs = std::filesystem;

constexpr int kMaxReplacements = 3; // others may be starting at the same time
constexpr std::chrono::seconds kOrderlyEndTimeout{1};

// Whether the folder that a server had opened as its repository has been deleted, moved or replaced.
bool isRepositoryGone(const base::TreeLockRecord& record)
{
    struct stat info = {};
    return !record.repository.empty() && (::stat(record.repository.c_str(), &info) != 0 ||
                                          info.st_dev != record.device || info.st_ino != record.inode);
}

// Ends the server that holds the tree if its repository is gone. Returns: its process; 0 if it is to be left alone.
pid_t endLeftOverServer(const std::string& home)
{
    const base::TreeLockStatus status = base::readTreeLock(home);
    const pid_t pid = status.record.pid;
    const ProcessHandle process(pid);
    if (status.state != base::TreeLockState::kHeld || !isRepositoryGone(status.record) || !process.runsThisProgram()) {
        return 0;
    }
    process.end(kOrderlyEndTimeout);
    StartFile::remove(status.record.startFile, pid);
    return pid;
}

// A killed server holds its lock until the kernel has taken down its last thread; its program is gone before that.
// Returns: whether the tree may be free now.
bool waitForDyingHolder(const std::string& home)
{
    const base::TreeLockStatus status = base::readTreeLock(home);
    const ProcessHandle process(status.record.pid);
    return status.state != base::TreeLockState::kHeld ||
           (!process.hasProgram() && process.waitForEnd(kOrderlyEndTimeout));
}

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
    std::error_code ignored; // of a missing folder, which is empty here
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

TreeClaim::~TreeClaim()
{
    StartFile::remove(fRecord.startFile, fRecord.pid);
    if (fAnnounced) {
        fLock.release();
    }
}

void TreeClaim::lock(const std::string& home)
{
    for (int i = 0; !fLock.acquire(home); ++i) {
        const bool mayTry = i < kMaxReplacements;
        if (mayTry && waitForDyingHolder(home)) {
            continue;
        }
        fReplaced = mayTry ? endLeftOverServer(home) : 0;
        if (fReplaced == 0) {
            throw StartError("Unable to start CIMServer. CIMServer is already running.");
        }
    }
}

void TreeClaim::take(const Config& config)
try {
    lock(config.home());
    fRecord.pid = ::getpid();
    fRecord.port = config.flag("enableHttpConnection") ? static_cast<std::uint16_t>(config.number("httpPort")) : 0;
    fRecord.startFile = StartFile::pathOf(config.text("consumer"));
    fLock.write(fRecord);
    config.save();
} catch (const std::system_error& error) {
    std::string text = "cimserver not started: Failed to save configuration properties to file: cannot open file: " +
                       currentConfigPath(config.home()) + ". Configuration property not set.";
    if (error.code() != std::errc::no_such_file_or_directory) { // OpenPegasus's sentence is about a missing home
        text += std::string("\n") + error.what();
    }
    throw StartError(text);
}

void TreeClaim::announce(const std::string& repository)
{
    fAnnounced = true;
    if (fReplaced != 0) {
        Log::write(LogLevel::kWarning,
                   "Ended the server of process " + std::to_string(fReplaced) + ", whose repository was gone.");
    }
    struct stat info = {};
    fRepository.reset(::open(repository.c_str(), O_PATH | O_DIRECTORY | O_CLOEXEC));
    if (::fstat(fRepository.get(), &info) == 0) {
        fRecord.repository = repository;
        fRecord.device = info.st_dev;
        fRecord.inode = info.st_ino;
        fLock.write(fRecord);
    }
    try {
        StartFile::write(fRecord.startFile, fRecord.pid);
        Log::write(LogLevel::kInformation, "Wrote the start file " + fRecord.startFile + ".");
    } catch (const std::system_error& error) {
        Log::write(LogLevel::kWarning, std::string("No start file: ") + error.what() +
                                           "; programs that look for it do not find this server.");
    }
}

} // namespace Pegasus::server
