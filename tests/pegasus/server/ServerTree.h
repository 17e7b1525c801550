// SPDX-License-Identifier: MIT
#pragma once

#include "tests/support/ReservedPort.h"

#include <cstdint>
#include <string>
#include <vector>

namespace servertest {

struct ProgramResult
{
    int exitStatus = -1; // negative: the signal that ended it
    std::string out;
    std::string err;
};

// A server tree of its own in a temporary folder, with a consumer name and a port of its own. The programs
// are those of the build. The destructor stops the server, checks nothing, and removes the folder.
class ServerTree
{
  public:
    ServerTree();
    ~ServerTree();
    ServerTree(const ServerTree&) = delete;
    ServerTree& operator=(const ServerTree&) = delete;

    const std::string& home() const { return fHome; }
    const std::string& consumer() const { return fConsumer; }
    std::uint16_t port() const { return fPort.number(); }
    std::string startFile() const { return "/var/tmp/cimserverkol_tc_" + fConsumer + "_start.conf"; }
    std::string log() const;

    // Runs "cimserver", "cimconfig" or "cimmof" with PEGASUS_HOME set. A program that still runs after 30 s is
    // killed.
    ProgramResult run(const std::string& program, const std::vector<std::string>& arguments) const;

    // Starts the server with further "name=value" words. Throws: std::runtime_error when it reports a failure.
    void start(const std::vector<std::string>& properties = {});
    // The server's process; 0 when the tree is free.
    int serverProcess() const;

    // Compiles the two base schemas. Throws: std::runtime_error with what the compiler says.
    void compileBase();
    // Compiles one file.
    void compile(const std::string& nameSpace, const std::string& file);
    // Base schemas, the probe provider's library, classes (root/probe) and registrations.
    void installProbe();

  private:
    std::string fRoot;
    std::string fHome;
    std::string fConsumer;
    test::ReservedPort fPort;
};

// Returns: the path of one of the build's programs.
std::string programPath(const std::string& name);

// Waits until `condition` holds. Returns: false after 10 s.
template <typename Condition> bool eventually(const Condition& condition);

bool waitUntil(bool (*condition)(const void*), const void* argument);

template <typename Condition> bool eventually(const Condition& condition)
{
    return waitUntil([](const void* argument) { return (*static_cast<const Condition*>(argument))(); }, &condition);
}

// Whether a process runs (a zombie counts as ended).
bool isRunning(int pid);
// Processes whose parent is `pid`.
std::vector<int> childrenOf(int pid);

} // namespace servertest
