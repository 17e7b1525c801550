// SPDX-License-Identifier: MIT
#include "tests/pegasus/server/ServerTree.h"

#include "pegasus/base/TreeLockFile.h"

#include <chrono>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <sstream>
#include <stdexcept>

#include <poll.h>
#include <signal.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

namespace servertest {

namespace fs = std::filesystem;

namespace {

constexpr std::chrono::seconds kProgramLimit{120};
constexpr std::chrono::seconds kEventLimit{60};

std::string makeRoot()
{
    std::string path = (fs::temp_directory_path() / "server-test-XXXXXX").string();
    if (::mkdtemp(path.data()) == nullptr) {
        throw std::runtime_error("cannot make a temporary folder");
    }
    return path;
}

std::string readFile(const std::string& path)
{
    std::ifstream file(path);
    std::ostringstream text;
    text << file.rdbuf();
    return text.str();
}

int waitFor(pid_t pid)
{
    const auto deadline = std::chrono::steady_clock::now() + kProgramLimit;
    int status = 0;
    while (::waitpid(pid, &status, WNOHANG) == 0) {
        if (std::chrono::steady_clock::now() > deadline) {
            ::kill(pid, SIGKILL);
        }
        ::poll(nullptr, 0, 2);
    }
    return WIFEXITED(status) ? WEXITSTATUS(status) : -WTERMSIG(status);
}

} // namespace

std::string programPath(const std::string& name)
{
    return std::string(PROGRAM_DIRECTORY) + "/" + name;
}

bool waitUntil(bool (*condition)(const void*), const void* argument)
{
    const auto deadline = std::chrono::steady_clock::now() + kEventLimit;
    while (!condition(argument)) {
        if (std::chrono::steady_clock::now() > deadline) {
            return false;
        }
        ::poll(nullptr, 0, 5);
    }
    return true;
}

bool isRunning(int pid)
{
    const std::string stat = readFile("/proc/" + std::to_string(pid) + "/stat");
    const std::size_t name = stat.rfind(") ");
    return name != std::string::npos && stat[name + 2] != 'Z' && stat[name + 2] != 'X';
}

std::vector<int> childrenOf(int pid)
{
    std::vector<int> children;
    for (const auto& task : fs::directory_iterator("/proc/" + std::to_string(pid) + "/task")) {
        std::istringstream list(readFile(task.path().string() + "/children"));
        for (int child; list >> child;) {
            children.push_back(child);
        }
    }
    return children;
}

ServerTree::ServerTree() : fRoot(makeRoot()), fHome(fRoot + "/pegasus")
{
    fConsumer = fs::path(fRoot).filename().string();
    fs::create_directories(fHome + "/lib");
    const ProgramResult planned = run("cimconfig", {"-s", "consumer=" + fConsumer, "-p"});
    if (planned.exitStatus != 0) {
        throw std::runtime_error("cimconfig: " + planned.out + planned.err);
    }
}

ServerTree::~ServerTree()
{
    const int pid = serverProcess();
    if (pid > 0 && isRunning(pid)) {
        ::kill(pid, SIGTERM);
        if (!eventually([&] { return !isRunning(pid); })) {
            ::kill(pid, SIGKILL);
        }
    }
    std::error_code ignored;
    fs::remove_all(startFile(), ignored);
    fs::remove_all(fRoot, ignored);
}

std::string ServerTree::log() const
{
    return readFile(fHome + "/cimserver.log");
}

ProgramResult ServerTree::run(const std::string& program, const std::vector<std::string>& arguments) const
{
    const std::string out = fRoot + "/out." + program;
    const std::string err = fRoot + "/err." + program;
    std::vector<char*> argv = {const_cast<char*>(program.c_str())};
    for (const std::string& argument : arguments) {
        argv.push_back(const_cast<char*>(argument.c_str()));
    }
    argv.push_back(nullptr);
    const std::string path = programPath(program);
    const pid_t pid = ::fork();
    if (pid == 0) {
        ::setenv("PEGASUS_HOME", fHome.c_str(), 1);
        if (::freopen(out.c_str(), "w", stdout) == nullptr || ::freopen(err.c_str(), "w", stderr) == nullptr) {
            ::_exit(126);
        }
        ::execv(path.c_str(), argv.data());
        ::_exit(127);
    }
    ProgramResult result;
    result.exitStatus = waitFor(pid);
    result.out = readFile(out);
    result.err = readFile(err);
    return result;
}

void ServerTree::start(const std::vector<std::string>& properties)
{
    std::vector<std::string> words = {"httpPort=" + std::to_string(port()), "enableHttpsConnection=false"};
    words.insert(words.end(), properties.begin(), properties.end());
    const ProgramResult result = run("cimserver", words);
    if (result.exitStatus != 0) {
        throw std::runtime_error("cimserver: " + result.out + result.err);
    }
}

int ServerTree::serverProcess() const
{
    return Pegasus::base::readTreeLock(fHome).record.pid;
}

void ServerTree::compile(const std::string& nameSpace, const std::string& file)
{
    const ProgramResult result = run("cimmof", {"-n", nameSpace, "-aE", file});
    if (result.exitStatus != 0) {
        throw std::runtime_error("cimmof " + file + ": " + result.out + result.err);
    }
}

void ServerTree::compileBase()
{
    for (const std::string name : {"PG_Internal", "PG_InterOp"}) {
        compile("root/" + name, std::string(SCHEMA_DIRECTORY) + "/" + name + "/" + name + ".mof");
    }
}

void ServerTree::installProbe()
{
    compileBase();
    fs::create_directories(fHome + "/provider/probe");
    fs::copy_file(PROBE_LIBRARY, fHome + "/provider/probe/libprobe.so", fs::copy_options::overwrite_existing);
    const ProgramResult result = run("cimconfig", {"-s", "providerDir=provider/probe:"});
    if (result.exitStatus != 0) {
        throw std::runtime_error("cimconfig: " + result.out + result.err);
    }
    compile("root/probe", std::string(TEST_SOURCES) + "/probe.mof");
    compile("root/PG_InterOp", std::string(TEST_SOURCES) + "/probe.registration.mof");
}

} // namespace servertest
