// SPDX-License-Identifier: MIT
// vrxhost: a command-line host for a namespace-provider plug-in.
#include "host/cli/Options.h"
#include "host/cli/Replay.h"
#include "host/cli/Settings.h"
#include "host/cli/TDeployedTree.h"
#include "host/cli/TOwnerCheck.h"
#include "host/cli/TPluginLibrary.h"
#include "host/cli/TPrivateRoot.h"
#include "host/cli/TRun.h"
#include "host/cli/model/Document.h"
#include "host/cli/model/ErrorReport.h"
#include "host/core/TCoreLogger.h"
#include "host/core/TUniqueFd.h"

#include <host/TVRXException.h>

#include <cerrno>
#include <csignal>
#include <cstring>
#include <filesystem>
#include <iostream>
#include <stdexcept>

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
    log.fOnFailure = [file = options.fLogFile](const std::string& reason) {
        ReportError("the log file " + file + " could not be written: " + reason + "; the run goes on without");
    };
    try {
        TCoreLogger::Instance().Configure(log);
    } catch (const NKOLVRX20::TVRXException&) {
        ReportError("the log file " + options.fLogFile + " could not be opened; the run goes on without");
        log.fFile.clear();
        TCoreLogger::Instance().Configure(log);
    }
}

// What runs below the root, and below the plug-in where that lies in another tree, is run as the user.
// Throws: TTreeError.
void CheckOwners(const TOptions& options, TOwnerCheck& owners)
{
    owners.CheckTree(options.fRoot);
    const std::filesystem::path plugin = options.fPlugin;
    if (!std::filesystem::exists(plugin)) {
        return; // loading it reports that
    }
    owners.CheckFile(plugin);
    if (plugin.parent_path() != options.fRoot && std::filesystem::exists(plugin.parent_path() / "pegasus")) {
        owners.CheckTree(plugin.parent_path());
    }
}

// Enters the root and keeps every other vrxhost out of it: two hosts would stop each other's server.
// Returns: the lock.
// Throws: TFailure.
NKOLVRX20::TUniqueFd EnterRoot(const std::string& root)
{
    NKOLVRX20::TUniqueFd directory(::open(root.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC));
    if (!directory || ::fchdir(directory.Get()) != 0) {
        throw TFailure(ELossKind::kRoot,
                       "the root directory " + root + " could not be entered: " + std::strerror(errno));
    }
    if (::flock(directory.Get(), LOCK_EX | LOCK_NB) != 0) {
        throw errno == EWOULDBLOCK ? TFailure(ELossKind::kBusyRoot, "another vrxhost is at work in " + root)
                                   : TFailure(ELossKind::kRoot, "the root directory " + root +
                                                                    " could not be locked: " + std::strerror(errno));
    }
    return directory;
}

// Before there is a run: the reason, and in the formats that have room for it a document with an empty list of
// providers.
EExitStatus Refuse(const TOptions& options, const std::exception& reason, EExitStatus status)
{
    ReportError(reason.what());
    TDocument document;
    document.fHead = MakeHead(options.fCommandName);
    document.fHead.fEnded = TimeNow();
    document.fComplete = false;
    document.fLosses.push_back(LossOf(reason));
    if (options.fCommand) {
        options.fCommand->Complete(document);
    }
    if (options.fFormat == "json" || options.fFormat == "ndjson" || options.fFormat == "html" ||
        !document.fChecks.empty())
    {
        const auto write = [](const std::string& text) { std::cout << text; };
        const auto format = MakeFormat(options.fFormat, options.fFormatOptions, write);
        format->BeginStream(document.fHead);
        std::cout << format->Finish(document) << std::flush;
    }
    return status;
}

// The number of a closed stream would go to the next file that is opened, such as the root's lock, and the document's
// descriptor would replace that file. The stand-in fails when it is used as the stream is.
void FillStandardStreams()
{
    for (int fd = STDIN_FILENO; fd <= STDERR_FILENO; ++fd) {
        if (::fcntl(fd, F_GETFD) < 0) {
            static_cast<void>(::open("/dev/null", fd == STDIN_FILENO ? O_WRONLY : O_RDONLY));
        }
    }
}

// Throws: TFailure when the help or the version could not be written.
EExitStatus EndOfHelp()
{
    if (!std::cout.flush()) {
        throw TFailure(ELossKind::kOther, "standard output could not be written");
    }
    return kComplete;
}

EExitStatus Run(TOptions& options)
{
    std::signal(SIGPIPE, SIG_IGN); // a reader that has gone is a write error here
    std::signal(SIGXFSZ, SIG_IGN); // and so is a file that may not grow
    if (!options.fReplay.empty()) {
        LoadSettings(options.fConfigFile, options.fSettings); // a record needs none; mistakes are reported all the same
        return Replay(options);
    }
    const TPrivateRoot root(TDeployedTree(options.fRoot), options.fState);
    TOwnerCheck owners;
    owners.CheckFile(root.GetPath());
    const NKOLVRX20::TUniqueFd rootLock = EnterRoot(root.GetPath());
    root.Lay();
    SetRoot(TDeployedTree(root.GetPath()), options);
    CheckOwners(options, owners);
    LoadSettings(options.fConfigFile, options.fSettings);
    std::signal(SIGCHLD, SIG_DFL); // inherited as ignored, it would hide how programs ended
    OpenLog(options);
    TRun run(options);
    const EExitStatus result = run.Execute();
    if (TPluginLibrary::HasLeftThreads()) {
        ::_exit(result);
    }
    return result;
}

int Main(int argc, const char* const* argv)
{
    TOptions options;
    try {
        return ParseOptions(argc, argv, options) ? Run(options) : EndOfHelp();
    } catch (const TUsageError& e) {
        return Refuse(options, e, kUsage);
    } catch (const TTreeError& e) {
        return Refuse(options, e, kUsage);
    } catch (const std::runtime_error& e) {
        return Refuse(options, e, kFailed);
    }
}

} // namespace
} // namespace vrxhost

int main(int argc, char** argv)
{
    vrxhost::FillStandardStreams();
    try {
        return vrxhost::Main(argc, argv);
    } catch (const std::exception& e) {
        vrxhost::ReportError(e.what());
        return vrxhost::kFailed;
    }
}
