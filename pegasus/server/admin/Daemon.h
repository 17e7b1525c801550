// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/base/Descriptor.h"

#include <functional>
#include <string>

namespace Pegasus::server {

// What the launching process reports to its caller.
struct LaunchResult
{
    int exitStatus = 0;
    std::string error; // one line for standard error
};

// Reports to the launcher, once, that the server is ready or why its start failed. Later calls are ignored, and so
// is every call in the foreground.
// Thread: one at a time.
class LaunchSignal
{
  public:
    LaunchSignal() = default;
    explicit LaunchSignal(base::Descriptor pipe) : fPipe(std::move(pipe)) {}

    void ready();
    void failed(const std::string& error);

  private:
    void send(char kind, const std::string& text);

    base::Descriptor fPipe;
};

// Runs `server` in a process with a session of its own, standard input, output and error on /dev/null, umask 077 and
// the caller's working directory. The caller's other descriptors are closed there.
// Returns: in the launching process, what the signal reported, or that the child ended before.
// Throws: std::system_error. Requires: the caller has one thread.
// Blocks: until then.
LaunchResult launchDaemon(const std::function<void(LaunchSignal&)>& server);

// Opens /dev/null as standard input, output and error where the caller has closed them, so that a file that is opened
// later gets a number above them.
void openStandardDescriptors();

// Closes all descriptors above standard error except `keep`; with -1, all of them.
void closeInheritedDescriptors(int keep);

} // namespace Pegasus::server
