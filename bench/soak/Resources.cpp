// SPDX-License-Identifier: MIT
#include "bench/soak/Resources.h"

#include <algorithm>
#include <cctype>
#include <filesystem>
#include <fstream>
#include <iterator>

#include <malloc.h>
#include <unistd.h>

namespace fs = std::filesystem;

namespace soak {

TResources TakeResources()
{
    const struct mallinfo2 heap = ::mallinfo2();
    std::size_t pages = 0;
    std::size_t residentPages = 0;
    std::ifstream("/proc/self/statm") >> pages >> residentPages;
    const auto descriptors = std::distance(fs::directory_iterator("/proc/self/fd"), {});
    return {static_cast<std::size_t>(descriptors), heap.uordblks + heap.hblkhd,
            residentPages * static_cast<std::size_t>(::sysconf(_SC_PAGESIZE))};
}

std::vector<pid_t> ProcessesOf(const std::string& root)
{
    std::vector<pid_t> found;
    for (const auto& entry : fs::directory_iterator("/proc")) {
        const std::string name = entry.path().filename();
        std::error_code gone;
        if (std::all_of(name.begin(), name.end(), [](unsigned char c) { return std::isdigit(c); }) &&
            fs::read_symlink(entry.path() / "exe", gone).string().rfind(root + "/", 0) == 0)
        {
            found.push_back(static_cast<pid_t>(std::stol(name)));
        }
    }
    return found;
}

std::string StartFile(const std::string& consumer)
{
    return "/var/tmp/cimserverkol_tc_" + consumer + "_start.conf";
}

pid_t ServerProcess(const std::string& root, const std::string& consumer)
{
    pid_t id = 0;
    std::ifstream(StartFile(consumer)) >> id;
    const std::vector<pid_t> ours = ProcessesOf(root);
    return std::find(ours.begin(), ours.end(), id) == ours.end() ? 0 : id;
}

} // namespace soak
