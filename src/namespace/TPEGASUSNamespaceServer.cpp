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
constexpr unsigned int kStartPauseSeconds = 1;
constexpr unsigned int kStopPauseSeconds = 3;

} // namespace

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
    std::exit(1);
}

void TPEGASUSNamespace::callCimconfig()
{
    std::string directories;
    for (const std::string& vendor : FindSubDirs(fTree.VendorDirectory() + "/")) {
        directories += "provider/" + vendor + ":";
    }
    LogProgress(fTree.Run(kConfigName, {"-s", "providerDir=" + directories}));
}

void TPEGASUSNamespace::callCimserver(unsigned short port)
{
    const std::string output =
        fTree.Run(kServerName, {"httpPort=" + std::to_string(port), "enableHttpsConnection=false"});
    ::sleep(kStartPauseSeconds);
    LogProgress(output);
}

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
