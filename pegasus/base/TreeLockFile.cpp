// SPDX-License-Identifier: MIT
#include "pegasus/base/TreeLockFile.h"

#include "pegasus/base/Users.h"

#include <cerrno>
#include <charconv>
#include <string_view>
#include <system_error>

#include <fcntl.h>
#include <sys/stat.h>

namespace Pegasus::base {

namespace {

constexpr std::size_t kMaxLockFileBytes = 16u << 10; // two paths and some numbers

[[noreturn]] void fail(const char* operation, const std::string& path)
{
    throw std::system_error(errno, std::generic_category(), std::string(operation) + " " + path);
}

struct flock wholeFile()
{
    struct flock lock = {};
    lock.l_type = F_WRLCK;
    lock.l_whence = SEEK_SET;
    return lock;
}

bool isOwnRegularFile(const Descriptor& file)
{
    struct stat info = {};
    return ::fstat(file.get(), &info) == 0 && S_ISREG(info.st_mode) && isTrustedUser(info.st_uid);
}

bool isHeld(const Descriptor& file)
{
    struct flock lock = wholeFile();
    return ::fcntl(file.get(), F_OFD_GETLK, &lock) == 0 && lock.l_type != F_UNLCK;
}

std::string contentOf(const Descriptor& file)
{
    std::string content(kMaxLockFileBytes, '\0');
    ssize_t size = -1;
    do {
        size = ::pread(file.get(), content.data(), content.size(), 0);
    } while (size < 0 && errno == EINTR);
    content.resize(size < 0 ? 0 : static_cast<std::size_t>(size));
    return content;
}

// Returns: 0 if the text fails to parse.
template <typename Number> Number numberIn(std::string_view text)
{
    Number number = 0;
    const auto parsed = std::from_chars(text.data(), text.data() + text.size(), number);
    return parsed.ec == std::errc() ? number : 0;
}

void setField(TreeLockRecord& record, std::string_view name, std::string_view value)
{
    if (name == "pid") {
        record.pid = numberIn<pid_t>(value);
    } else if (name == "port") {
        record.port = numberIn<std::uint16_t>(value);
    } else if (name == "startFile") {
        record.startFile = value;
    } else if (name == "repository") {
        record.repository = value;
    } else if (name == "device") {
        record.device = numberIn<std::uint64_t>(value);
    } else if (name == "inode") {
        record.inode = numberIn<std::uint64_t>(value);
    }
}

TreeLockRecord parse(std::string_view text)
{
    TreeLockRecord record;
    for (std::size_t end = 0; (end = text.find('\n')) != std::string_view::npos; text.remove_prefix(end + 1)) {
        const std::string_view line = text.substr(0, end);
        const std::size_t equals = line.find('=');
        if (equals != std::string_view::npos) {
            setField(record, line.substr(0, equals), line.substr(equals + 1));
        }
    }
    return record;
}

std::string format(const TreeLockRecord& record)
{
    std::string text = "pid=" + std::to_string(record.pid) + "\nport=" + std::to_string(record.port) +
                       "\nstartFile=" + record.startFile + "\n";
    if (!record.repository.empty()) {
        text += "repository=" + record.repository + "\ndevice=" + std::to_string(record.device) +
                "\ninode=" + std::to_string(record.inode) + "\n";
    }
    return text;
}

} // namespace

std::string treeLockPath(const std::string& home)
{
    return home + "/cimserver.lock";
}

TreeLockStatus readTreeLock(const std::string& home)
{
    const std::string path = treeLockPath(home);
    const Descriptor file(::open(path.c_str(), O_RDONLY | O_NOFOLLOW | O_NONBLOCK | O_NOCTTY | O_CLOEXEC));
    if (!file && errno != ENOENT && errno != ELOOP) {
        fail("cannot read", path);
    }
    if (!file || !isOwnRegularFile(file)) {
        return {};
    }
    if (!isHeld(file)) {
        return {TreeLockState::kFree, {}};
    }
    return {TreeLockState::kHeld, parse(contentOf(file))};
}

bool takeTreeLock(const Descriptor& file)
{
    struct flock lock = wholeFile();
    return ::fcntl(file.get(), F_OFD_SETLK, &lock) == 0;
}

// A reader sees the old content, an empty file, or the beginning of the new content; parse() takes whole lines only.
void writeTreeLock(const Descriptor& file, const TreeLockRecord& record)
{
    const std::string text = format(record);
    if (::ftruncate(file.get(), 0) != 0 ||
        ::pwrite(file.get(), text.data(), text.size(), 0) != static_cast<ssize_t>(text.size()))
    {
        fail("cannot write", "the lock file of process " + std::to_string(record.pid));
    }
}

} // namespace Pegasus::base
