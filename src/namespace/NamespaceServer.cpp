// The private server as a process: port, configuration, start, stop, what an earlier run left, clean-up.
#include "src/common/CoreLog.h"
#include "src/namespace/NamespaceConstants.h"
#include "src/namespace/Removal.h"
#include "src/namespace/ResidualServer.h"
#include "src/namespace/ServerTree.h"
#include "src/namespace/TPEGASUSNamespace.h"

#include <host/TOSSpecific.h>
#include <host/TVRXException.h>

#include <cerrno>
#include <csignal>
#include <cstdlib>
#include <cstring>

#include <arpa/inet.h>
#include <fcntl.h>
#include <netinet/in.h>
#include <sys/socket.h>
#include <unistd.h>

namespace NKOLVRX20 {

namespace {

constexpr unsigned short kHighestPort = 65535;
constexpr unsigned short kLowestPort = 1024;

constexpr char kConfigName[] = "cimconfig";
constexpr unsigned int kStartPauseSeconds = 1;
constexpr unsigned int kStopPauseSeconds = 3;

// A socket that is closed when it goes out of scope.
class TProbeSocket
{
  public:
    TProbeSocket() : fDescriptor(::socket(AF_INET, SOCK_STREAM, 0))
    {
        if (fDescriptor == -1) {
            LogFailure("TPEGASUSNamespace::getAvailablePort failed: no socket: ", std::strerror(errno));
            throw TVRXException(TVRXStatusCode::kServerConnectionFailed);
        }
        static_cast<void>(::fcntl(fDescriptor, F_SETFD, FD_CLOEXEC));
    }
    ~TProbeSocket() { static_cast<void>(::close(fDescriptor)); }
    TProbeSocket(const TProbeSocket&) = delete;
    TProbeSocket& operator=(const TProbeSocket&) = delete;

    bool CanBind(const std::string& host, unsigned short port) const
    {
        sockaddr_in address = {};
        address.sin_family = AF_INET;
        address.sin_addr.s_addr = ::inet_addr(host.c_str());
        address.sin_port = htons(port);
        return ::bind(fDescriptor, reinterpret_cast<const sockaddr*>(&address), sizeof address) == 0;
    }

  private:
    int fDescriptor;
};

} // namespace

unsigned short TPEGASUSNamespace::getAvailablePort()
{
    const TProbeSocket socket;
    if (socket.CanBind(fHostAddress, kPreferredPort)) {
        return kPreferredPort;
    }
    LogProgress("Can not bind to port ", kPreferredPort, ", try others");
    for (unsigned short port = kHighestPort; port >= kLowestPort; --port) {
        if (socket.CanBind(fHostAddress, port)) {
            return port;
        }
    }
    std::exit(1);
}

std::string TPEGASUSNamespace::RunServerProgram(const std::string& name,
                                                const std::vector<std::string>& arguments) const
{
    std::string output;
    TOSSpecific::SpawnProcess(name, arguments, fServerProgramDirectory + name, fServerEnvironment, output,
                              kProgramTimeoutSeconds);
    return output;
}

void TPEGASUSNamespace::callCimconfig()
{
    std::string directories;
    for (const std::string& vendor : FindSubDirs(fRootDirectory + kProviderDirectory + "/")) {
        directories += "provider/" + vendor + ":";
    }
    LogProgress(RunServerProgram(kConfigName, {"-s", "providerDir=" + directories}));
}

void TPEGASUSNamespace::callCimserver(unsigned short port)
{
    const std::string output =
        RunServerProgram(kServerName, {"httpPort=" + std::to_string(port), "enableHttpsConnection=false"});
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
    LogProgress(RunServerProgram(kServerName, {"-s"}));
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
    RemovePath(fRootDirectory + kRepositoryDirectory, kRemoveTree);
    RemovePath(fRootDirectory + kLsiDirectory + "repository.xml", kRemoveTree);
}

void TPEGASUSNamespace::cleanup()
{
    closeCimserver(true);
    cleanCimserver();
}

} // namespace NKOLVRX20
