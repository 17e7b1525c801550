#pragma once

#include "tests/support/RunProgram.h"

#include <string>
#include <vector>

#include <sys/types.h>

namespace test {

// A real cimserver in a temporary tree of its own, with a consumer name and a port of its own; stopped and removed at
// the end. The programs come from the build tree.
class PrivateServer
{
  public:
    // Creates the tree. Throws std::runtime_error.
    PrivateServer();
    ~PrivateServer();
    PrivateServer(const PrivateServer&) = delete;
    PrivateServer& operator=(const PrivateServer&) = delete;

    // Throws std::runtime_error with the server's words if it does not start.
    void start();
    // In good order. Requires: the schema of root/PG_Internal is compiled. Throws std::runtime_error.
    void stop();
    // As a crash would; returns when the process is gone.
    void kill();

    // cimmof, cimconfig or cimserver with these arguments, in the tree's environment.
    ProgramResult run(const std::string& program, std::vector<std::string> arguments) const;

    const std::string& directory() const { return fDirectory; }  // of the whole tree
    std::string home() const { return fDirectory + "/pegasus"; } // PEGASUS_HOME
    int port() const { return fPort; }
    pid_t processId() const { return fProcessId; }

  private:
    pid_t readProcessId() const;
    bool isRunning() const;

    std::string fDirectory;
    std::string fConsumer;
    int fPort = 0;
    pid_t fProcessId = 0;
};

} // namespace test
