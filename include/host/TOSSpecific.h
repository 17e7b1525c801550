#pragma once

#include <cstddef>
#include <string>
#include <vector>

namespace NKOLVRX20 {

// The host's process and file services.
//
// SpawnProcess runs a program without a shell and captures its standard output. The child gets default signal
// dispositions, an empty signal mask, a process group of its own, and no descriptor above 2 that this process did not
// mean for it. Standard error and a status other than 0 are not an error of the call: the host logs them.
// Time-outs are in seconds, at least 1; one that ends kills the whole group and reaps the child. Output beyond 16 MiB
// and standard error beyond 64 KiB are dropped, and the log says so.
// Throws: TVRXException 12 when the program cannot be run or its time ran out; output holds what was captured. While
// the host shuts down, an exception of its own that is no TVRXException and is not for the caller to handle.
// Blocks: until the child exits (a daemon that it leaves behind does not count) or the time-out ends.
// Thread: safe.
class TOSSpecific
{
  public:
    // Splits the command line at blanks and searches PATH. Output is discarded.
    static void SpawnProcess(const std::string& commandLine, int timeoutSeconds);

    // The same with further arguments appended, as they are.
    static void SpawnProcess(const std::string& commandLine, const std::vector<std::string>& arguments,
                             std::string& output, int timeoutSeconds);

    // Runs exactly this program with exactly these: argv[0] is the name, the environment holds "NAME=value" texts.
    static void SpawnProcess(const std::string& name, const std::vector<std::string>& arguments,
                             const std::string& programPath, const std::vector<std::string>& environment,
                             std::string& output, int timeoutSeconds);

    // Returns: the size in bytes; 0 when the file does not exist or is not a regular file.
    static std::size_t GetFileSize(const std::string& path);
};

} // namespace NKOLVRX20
