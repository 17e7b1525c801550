// SPDX-License-Identifier: MIT
// The private server as a process: port, configuration, start, stop, what an earlier run left, clean-up.
#include "src/common/CoreLog.h"
#include "src/namespace/NamespaceConstants.h"
#include "src/namespace/PortProbe.h"
#include "src/namespace/ResidualServer.h"
#include "src/namespace/TPEGASUSNamespace.h"

#include <csignal>
#include <cstdlib>

#include <unistd.h>

namespace NKOLVRX20 {

namespace {

constexpr unsigned short kHighestPort = 65535;
constexpr unsigned short kLowestPort = 1024;

constexpr char kConfigName[] = "cimconfig";
constexpr unsigned int kStartPauseSeconds = 1; // from the daemon's fork to its first connection
constexpr unsigned int kStopPauseSeconds = 3;  // the grace period of a stopping server before it is killed

} // namespace

// Downwards, because the kernel's default port range for outgoing connections ends at 60999: the highest ports are the
// ones most likely to be free.
unsigned short TPEGASUSNamespace::getAvailablePort()
{
    const TPortProbe probe(fHostAddress);
    if (probe.CanBind(kPreferredPort)) {
        return kPreferredPort;
    }
    LogProgress("Can not bind to port ", kPreferredPort, ", try others");
    for (unsigned short port = kHighestPort; port >= kLowestPort; --port) {
        if (probe.CanBind(port)) {
            return port;
        }
    }
    std::exit(1); // hosts rely on the end of the process here, and on a log without a line of it
}

// The directories are relative to PEGASUS_HOME. The colon after the last one belongs to the form.
void TPEGASUSNamespace::callCimconfig()
{
    std::string directories;
    for (const std::string& vendor : FindSubDirs(fTree.VendorDirectory() + "/")) {
        directories += "provider/" + vendor + ":";
    }
    LogProgress(fTree.Run(kConfigName, {"-s", "providerDir=" + directories}));
}

// The exit status stays with the process service. Here a server that failed to start shows only when connecting fails.
void TPEGASUSNamespace::callCimserver(unsigned short port)
{
    const std::string output =
        fTree.Run(kServerName, {"httpPort=" + std::to_string(port), "enableHttpsConnection=false"});
    ::sleep(kStartPauseSeconds);
    LogProgress(output);
}

// False in doubt: an unknown process must not be killed.
bool TPEGASUSNamespace::isResidualCimserver(int pid)
{
    const TProcessListing listing;
    try {
        return listing.HasServer(pid);
    } catch (const std::exception& exception) {
        LogFailure(exception.what());
        return false;
    }
}

// The start file may be older than the last boot, so that its process id belongs to another program by now: the listing
// decides. The file is removed in every case.
void TPEGASUSNamespace::killResidualCimserver()
{
    const TStartFile startFile(fConsumerName);
    const std::optional<int> pid = startFile.ReadProcessId();
    if (pid && isResidualCimserver(*pid)) {
        teminateCimserver(*pid);
    }
    startFile.Remove();
}

int TPEGASUSNamespace::teminateCimserver(int pid)
{
    LogProgress("Killing process..");
    return ::kill(pid, SIGKILL);
}

void TPEGASUSNamespace::StopCimserver()
{
    LogProgress(fTree.Run(kServerName, {"-s"}));
}

void TPEGASUSNamespace::closeCimserver(bool stopFirst)
{
    if (stopFirst) {
        StopCimserver();
    }
    ::sleep(kStopPauseSeconds);
    killResidualCimserver();
}

void TPEGASUSNamespace::cleanCimserver()
{
    fTree.RemoveRepositories();
}

void TPEGASUSNamespace::cleanup()
{
    closeCimserver(true);
    cleanCimserver();
}

} // namespace NKOLVRX20
