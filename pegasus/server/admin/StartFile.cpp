#include "pegasus/server/admin/StartFile.h"

#include "pegasus/server/admin/PrivateFile.h"

#include <charconv>

#include <unistd.h>

namespace Pegasus::server {

namespace {

constexpr std::size_t kMaxStartFileBytes = 64;
constexpr std::size_t kMaxStatBytes = 4096;

// /proc/<pid>/stat reads "<pid> (<name>) <state> ...".
bool isLivingServer(pid_t pid)
{
    const std::string stat = readSmallFile("/proc/" + std::to_string(pid) + "/stat", kMaxStatBytes);
    const std::string name = std::to_string(pid) + " (cimserver) ";
    return stat.compare(0, name.size(), name) == 0 && stat.size() > name.size() && stat[name.size()] != 'Z' &&
           stat[name.size()] != 'X';
}

} // namespace

StartFile::StartFile(const std::string& consumer) : fPath("/var/tmp/cimserverkol_tc_" + consumer + "_start.conf") {}

void StartFile::write(pid_t pid) const
{
    writePrivateFile(fPath, std::to_string(pid) + "\n");
}

void StartFile::removeIfOf(pid_t pid) const noexcept
{
    try {
        if (this->pid() == pid) {
            ::unlink(fPath.c_str());
        }
    } catch (...) { // out of memory: the file stays and names a dead process, which every reader checks
    }
}

std::optional<pid_t> StartFile::pid() const
{
    const std::string content = readSmallFile(fPath, kMaxStartFileBytes);
    pid_t pid = 0;
    const auto parsed = std::from_chars(content.data(), content.data() + content.size(), pid);
    if (parsed.ec != std::errc() || pid <= 0) {
        return std::nullopt;
    }
    return pid;
}

std::optional<pid_t> StartFile::runningServer() const
{
    const std::optional<pid_t> pid = this->pid();
    return pid && isLivingServer(*pid) ? pid : std::nullopt;
}

} // namespace Pegasus::server
