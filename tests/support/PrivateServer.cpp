// SPDX-License-Identifier: MIT
#include "tests/support/PrivateServer.h"

#include <csignal>
#include <filesystem>
#include <fstream>
#include <stdexcept>

#include <poll.h>
#include <sys/syscall.h>
#include <unistd.h>

namespace test {

namespace {

std::string newDirectory()
{
    std::string pattern = (std::filesystem::temp_directory_path() / "vrx-server-XXXXXX").string();
    if (!::mkdtemp(pattern.data())) {
        throw std::runtime_error("mkdtemp " + pattern);
    }
    return pattern;
}

void expectSuccess(const ProgramResult& result, const std::string& what)
{
    if (result.exitStatus != 0) {
        throw std::runtime_error(what + " failed with " + std::to_string(result.exitStatus) + ": " + result.out +
                                 result.err);
    }
}

// The descriptor becomes readable when the process has ended; this works for any process, child or other.
bool waitForEnd(pid_t process, int timeoutMs)
{
    const int descriptor = static_cast<int>(::syscall(SYS_pidfd_open, process, 0));
    if (descriptor < 0) {
        return true;
    }
    pollfd end = {descriptor, POLLIN, 0};
    const bool hasEnded = ::poll(&end, 1, timeoutMs) == 1;
    ::close(descriptor);
    return hasEnded;
}

constexpr int kEndTimeoutMs = 20000;

} // namespace

PrivateServer::PrivateServer() : fDirectory(newDirectory())
{
    fConsumer = "test" + std::to_string(::getpid()) + "_" + std::to_string(port());
    std::filesystem::create_directories(home());
}

PrivateServer::~PrivateServer()
{
    if (isRunning()) {
        kill();
    }
    std::error_code ignored;
    std::filesystem::remove("/var/tmp/cimserverkol_tc_" + fConsumer + "_start.conf", ignored);
    std::filesystem::remove_all(fDirectory, ignored);
}

void PrivateServer::start()
{
    expectSuccess(run("cimconfig", {"-s", "consumer=" + fConsumer, "-p"}), "cimconfig");
    expectSuccess(run("cimserver", {"httpPort=" + std::to_string(port()), "enableHttpsConnection=false"}), "cimserver");
    fProcessId = readProcessId();
}

void PrivateServer::stop()
{
    const pid_t process = fProcessId;
    fProcessId = 0;
    expectSuccess(run("cimserver", {"-s"}), "cimserver -s");
    waitForEnd(process, kEndTimeoutMs);
}

void PrivateServer::kill()
{
    const pid_t process = fProcessId;
    fProcessId = 0;
    ::kill(process, SIGKILL);
    if (!waitForEnd(process, kEndTimeoutMs)) {
        throw std::runtime_error("the killed server does not end");
    }
}

ProgramResult PrivateServer::run(const std::string& program, std::vector<std::string> arguments) const
{
    arguments.insert(arguments.begin(), std::string(VRX_PROGRAMS_DIR "/") + program);
    return runProgram(arguments, {"PEGASUS_HOME=" + home()});
}

pid_t PrivateServer::readProcessId() const
{
    std::ifstream file("/var/tmp/cimserverkol_tc_" + fConsumer + "_start.conf");
    pid_t process = 0;
    if (!(file >> process) || process <= 1) {
        throw std::runtime_error("no start file of consumer " + fConsumer);
    }
    return process;
}

bool PrivateServer::isRunning() const
{
    return fProcessId > 1 && ::kill(fProcessId, 0) == 0;
}

} // namespace test
