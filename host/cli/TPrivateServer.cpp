// SPDX-License-Identifier: MIT
#include "host/cli/TPrivateServer.h"

#include <cerrno>
#include <climits>
#include <csignal>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <vector>

#include <fcntl.h>
#include <poll.h>
#include <unistd.h>

extern "C" {
#include <sys/pidfd.h> // C only in glibc 2.36
}

#include "host/cli/model/ErrorReport.h"
#include "host/core/TProcessLog.h"
#include "host/core/TUniqueFd.h"

#include <host/TOSSpecific.h>

namespace vrxhost {
namespace {

using NKOLVRX20::TUniqueFd;

constexpr int kConfigTimeoutSeconds = 30;
constexpr int kOrderlyEndMs = 2000;

std::string RealPath(const std::string& path)
{
    char resolved[PATH_MAX];
    return ::realpath(path.c_str(), resolved) ? resolved : "";
}

// Returns: the first token of the file as a process id; 0 when it is missing or invalid.
pid_t ReadProcessId(const std::string& path)
{
    const TUniqueFd file(::open(path.c_str(), O_RDONLY | O_CLOEXEC | O_NOFOLLOW));
    char text[32] = "";
    if (!file || ::read(file.Get(), text, sizeof text - 1) <= 0) {
        return 0;
    }
    const long id = std::strtol(text, nullptr, 10);
    return id > 1 && id <= INT_MAX ? static_cast<pid_t>(id) : 0;
}

bool HasExited(const TUniqueFd& process, int timeoutMs)
{
    pollfd fd = {process.Get(), POLLIN, 0};
    return ::poll(&fd, 1, timeoutMs) > 0;
}

} // namespace

TPrivateServer::TPrivateServer(const std::string& root, const std::string& consumer) : fRoot(root), fConsumer(consumer)
{
}

std::string TPrivateServer::SetConsumer() const
{
    const std::vector<std::string> environment = {"PEGASUS_HOME=" + fRoot + "/pegasus",
                                                  "LD_LIBRARY_PATH=" + fRoot + "/pegasus/lib:" + fRoot,
                                                  "PATH=/usr/bin:/bin"};
    std::string output;
    const std::string error = ErrorOf([&] {
        NKOLVRX20::TOSSpecific::SpawnProcess("cimconfig", {"-s", "consumer=" + fConsumer, "-p"},
                                             fRoot + "/pegasus/bin/cimconfig", environment, output,
                                             kConfigTimeoutSeconds);
    });
    std::string reason = error;
    for (const auto& failed : NKOLVRX20::TProcessLog::Instance().Take()) {
        reason = failed.GetReason() + (failed.fErrorOutput.empty() ? "" : ": " + failed.fErrorOutput);
    }
    return reason;
}

void TPrivateServer::End() const
{
    const pid_t id = ReadProcessId("/var/tmp/cimserverkol_tc_" + fConsumer + "_start.conf");
    // The descriptor first: what is checked through it afterwards is about this very process.
    const TUniqueFd process(id ? ::pidfd_open(id, 0) : -1);
    if (!process) {
        return;
    }
    const std::string program = RealPath("/proc/" + std::to_string(id) + "/exe");
    if (program.empty() || program != RealPath(fRoot + "/pegasus/bin/cimserver")) {
        return;
    }
    ::pidfd_send_signal(process.Get(), SIGTERM, nullptr, 0);
    if (!HasExited(process, kOrderlyEndMs)) {
        ::pidfd_send_signal(process.Get(), SIGKILL, nullptr, 0);
    }
}

// An agent is called cimprovagt, runs a program of the tree, and has the module among its arguments.
bool TPrivateServer::IsAgentOf(const std::string& process, const std::set<std::string>& modules) const
{
    std::string name;
    std::getline(std::ifstream(process + "/comm"), name);
    const std::string program = RealPath(process + "/exe");
    const std::string programs = RealPath(fRoot + "/pegasus/bin") + "/";
    const bool isOurs = program == RealPath(fRoot + "/pegasus/bin/cimserver") || program.rfind(programs, 0) == 0;
    if (name != "cimprovagt" || program.empty() || !isOurs) {
        return false;
    }
    std::ifstream arguments(process + "/cmdline");
    for (std::string argument; std::getline(arguments, argument, '\0');) {
        if (modules.count(argument) > 0) {
            return true;
        }
    }
    return false;
}

void TPrivateServer::EndAgents(const std::set<std::string>& modules) const
{
    std::error_code error;
    for (const auto& entry : std::filesystem::directory_iterator("/proc", error)) {
        const std::string name = entry.path().filename();
        if (name.find_first_not_of("0123456789") != std::string::npos) {
            continue;
        }
        // The descriptor first, as in End.
        const TUniqueFd process(::pidfd_open(std::atoi(name.c_str()), 0));
        if (process && IsAgentOf(entry.path(), modules)) {
            ::pidfd_send_signal(process.Get(), SIGKILL, nullptr, 0);
        }
    }
}

} // namespace vrxhost
