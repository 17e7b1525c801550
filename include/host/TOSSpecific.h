// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <string>
#include <vector>

namespace NKOLVRX20 {

// The host's process and file services.
//
// SpawnProcess runs a program directly (no shell) and captures its standard output. An implementer provides that
//   - output receives the standard output, also when the call throws: what was captured until then;
//   - the call returns when the child itself has exited, even while a daemon that it leaves behind holds the pipe
//     open: "cimserver" starts in this way and keeps running;
//   - a status other than 0 and text on standard error leave the call a success. They are hidden from the caller, so
//     the host logs them, and a host that needs to know that "cimserver" failed looks here;
//   - timeouts are in seconds.
// In the reference host: the child gets default signal dispositions, an empty signal mask, a process group of its own,
// and the descriptors 0 to 2 alone. A timeout below 1 counts as 1; when it ends, the whole group is killed and the
// child reaped. Output beyond 16 MiB and standard error beyond 64 KiB are dropped, and the log says so.
// Throws: TVRXException 12 when the program fails to run or runs out of time. While the host shuts down, an exception
// of the host's own that does not derive from TVRXException: plug-ins let it pass.
// Blocks: until the child exits or the timeout ends.
// Thread: safe.
class TOSSpecific
{
  public:
    // Splits the command line at blanks and searches PATH; the child inherits the environment. Output is discarded.
    static void SpawnProcess(const std::string& commandLine, int timeoutSeconds);

    // The same with further arguments appended, as they are.
    // Here: "ps" with "-e" (360 seconds) and "bcu -v" (300 seconds).
    static void SpawnProcess(const std::string& commandLine, const std::vector<std::string>& arguments,
                             std::string& output, int timeoutSeconds);

    // Runs exactly this program with exactly these arguments and this environment: argv[0] is the name, the environment
    // holds "NAME=value" texts and nothing is inherited.
    // Here: R/pegasus/bin/cimserver, cimconfig and cimmof (32767 seconds each).
    static void SpawnProcess(const std::string& name, const std::vector<std::string>& arguments,
                             const std::string& programPath, const std::vector<std::string>& environment,
                             std::string& output, int timeoutSeconds);

    // Returns: the size in bytes; 0 for a missing file and for anything but a regular file.
    // Here: asked for each *.classes.xml before it is read.
    static std::size_t GetFileSize(const std::string& path);
};

} // namespace NKOLVRX20
