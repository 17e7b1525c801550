// vrxhost: a command-line host for a namespace-provider plug-in.
#include "host/cli/Options.h"
#include "host/cli/Say.h"
#include "host/cli/TPluginLibrary.h"
#include "host/cli/TRun.h"
#include "host/core/TCoreLogger.h"
#include "host/core/TUniqueFd.h"

#include <host/TVRXException.h>

#include <cerrno>
#include <csignal>
#include <cstring>
#include <iostream>

#include <fcntl.h>
#include <sys/file.h>
#include <unistd.h>

namespace vrxhost {
namespace {

using NKOLVRX20::ILogger;
using NKOLVRX20::TCoreLogger;

void OpenLog(const TOptions& options)
{
    TCoreLogger::TOptions log;
    log.fToStandardError = options.fVerbose;
    log.fLeastSevere = ILogger::kDebug;
    log.fFile = options.fLogFile;
    log.fTruncate = true;
    try {
        TCoreLogger::Instance().Configure(log);
    } catch (const NKOLVRX20::TVRXException&) {
        Say("the log file " + options.fLogFile + " could not be opened; going on without");
        log.fFile.clear();
        TCoreLogger::Instance().Configure(log);
    }
}

// Enters the root and keeps every other vrxhost out of it: two hosts would stop each other's server.
// Returns: the lock, none when it failed and was told.
NKOLVRX20::TUniqueFd EnterRoot(const std::string& root)
{
    NKOLVRX20::TUniqueFd directory(::open(root.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC));
    if (!directory || ::fchdir(directory.Get()) != 0) {
        Say("the root directory " + root + " could not be entered: " + std::strerror(errno));
    } else if (::flock(directory.Get(), LOCK_EX | LOCK_NB) != 0) {
        Say(errno == EWOULDBLOCK ? "another vrxhost is at work in " + root
                                 : "the root directory " + root + " could not be locked: " + std::strerror(errno));
    } else {
        return directory;
    }
    return NKOLVRX20::TUniqueFd();
}

int Main(int argc, const char* const* argv)
{
    TOptions options;
    const int status = ParseOptions(argc, argv, options);
    if (status >= 0) {
        return status;
    }
    const NKOLVRX20::TUniqueFd rootLock = EnterRoot(options.fRoot);
    if (!rootLock) {
        return kFailed;
    }
    std::signal(SIGPIPE, SIG_IGN); // a reader that has gone is a write error here
    OpenLog(options);
    TRun run(options);
    const EExitStatus result = run.Execute();
    if (TPluginLibrary::HasLeftThreads()) {
        ::_exit(result);
    }
    return result;
}

} // namespace
} // namespace vrxhost

int main(int argc, char** argv)
{
    try {
        return vrxhost::Main(argc, argv);
    } catch (const std::exception& e) {
        std::cerr << "vrxhost: " << e.what() << std::endl;
        return vrxhost::kFailed;
    }
}
