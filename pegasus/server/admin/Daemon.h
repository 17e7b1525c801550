#pragma once

#include "pegasus/base/Descriptor.h"

#include <functional>
#include <string>

namespace Pegasus::server {

// What the launching process tells its caller.
struct LaunchResult
{
    int exitStatus = 0;
    std::string error; // for standard error, without the line's end
};

// Tells the launcher, once, that the server is ready or why there is none. Afterwards, and in the foreground, it does
// nothing.
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

// Runs `server` in a process of its own session with standard input, output and error on /dev/null, umask 077 and no
// other descriptor of the caller's; the working directory stays. Returns: in the launching process, when the signal has
// come or the child has died. Requires: no other thread runs.
LaunchResult launchDaemon(const std::function<void(LaunchSignal&)>& server);

// Closes what the caller left open above standard error, but for `keep` (-1: nothing).
void closeInheritedDescriptors(int keep);

} // namespace Pegasus::server
