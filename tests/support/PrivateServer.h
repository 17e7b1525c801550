// SPDX-License-Identifier: MIT
#pragma once

#include "tests/support/ReservedPort.h"
#include "tests/support/RunProgram.h"

#include <string>
#include <vector>

#include <sys/types.h>

namespace test {

// A real cimserver with its own temporary tree, consumer name and port. The destructor stops it and removes the tree.
// The programs come from the build tree.
class PrivateServer
{
  public:
    // Creates the tree. Throws: std::runtime_error.
    PrivateServer();
    ~PrivateServer();
    PrivateServer(const PrivateServer&) = delete;
    PrivateServer& operator=(const PrivateServer&) = delete;

    // Throws: std::runtime_error with the server's message when it fails to start.
    void start();
    // Stops the server with "cimserver -s". Requires: the schema of root/PG_Internal is compiled.
    // Throws: std::runtime_error.
    void stop();
    // Kills the server, as a crash would; returns when the process has ended.
    void kill();

    // Runs cimmof, cimconfig or cimserver in the tree's environment.
    ProgramResult run(const std::string& program, std::vector<std::string> arguments) const;

    const std::string& directory() const { return fDirectory; }  // of the whole tree
    std::string home() const { return fDirectory + "/pegasus"; } // PEGASUS_HOME
    int port() const { return fPort.number(); }
    pid_t processId() const { return fProcessId; }

  private:
    pid_t readProcessId() const;
    bool isRunning() const;

    std::string fDirectory;
    std::string fConsumer;
    ReservedPort fPort;
    pid_t fProcessId = 0;
};

} // namespace test
