// The private server as a process: port, configuration, start, stop, what an earlier run left, clean-up.
#include "src/common/CoreLog.h"
#include "src/common/Files.h"
#include "src/namespace/NamespaceConstants.h"
#include "src/namespace/Removal.h"
#include "src/namespace/ServerTree.h"
#include "src/namespace/TPEGASUSNamespace.h"

#include <host/TOSSpecific.h>
#include <host/TVRXException.h>

#include <cerrno>
#include <csignal>
#include <cstdlib>
#include <cstring>
#include <fstream>
#include <sstream>

#include <arpa/inet.h>
#include <fcntl.h>
#include <netinet/in.h>
#include <sys/socket.h>
#include <unistd.h>

namespace NKOLVRX20 {

namespace {

constexpr unsigned short kHighestPort = 65535;
constexpr unsigned short kLowestPort = 1024;

constexpr char kServerName[] = "cimserver"; // the program, and how a process listing shows it
constexpr char kConfigName[] = "cimconfig";
constexpr unsigned int kStartPauseSeconds = 1;
constexpr unsigned int kStopPauseSeconds = 3;
constexpr int kListingTimeoutSeconds = 360;

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

// Returns: false when there is no such file. A file without a number gives 0, which no server has.
bool ReadProcessId(const std::string& path, int& pid)
{
    if (!IsRegularFile(path)) {
        return false;
    }
    std::ifstream file(path);
    file.imbue(std::locale::classic());
    file >> pid;
    return file.is_open();
}

std::string ProcessListing()
{
    std::string output;
    try {
        TOSSpecific::SpawnProcess("ps", {"-e"}, output, kListingTimeoutSeconds);
    } catch (const TVRXException&) { // what was captured has to do
    }
    return output;
}

// Returns: whether the listing has the process on a line that names the server.
bool ListsServer(const std::string& listing, const std::string& pid)
{
    std::istringstream lines(listing);
    for (std::string line; std::getline(lines, line);) {
        std::string firstToken;
        if (line.find(kServerName) != std::string::npos && std::istringstream(line) >> firstToken && firstToken == pid)
        {
            return true;
        }
    }
    return false;
}

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
    const std::string listing = ProcessListing();
    LogProgress(listing);
    try {
        return ListsServer(listing, std::to_string(pid));
    } catch (const std::exception& exception) {
        LogFailure(exception.what());
        return false;
    }
}

std::string TPEGASUSNamespace::StartFilePath() const
{
    return "/var/tmp/cimserverkol_tc_" + fConsumerName + "_start.conf";
}

void TPEGASUSNamespace::killResidualCimserver()
{
    const std::string path = StartFilePath();
    int pid = 0;
    if (ReadProcessId(path, pid)) {
        if (isResidualCimserver(pid)) {
            teminateCimserver(pid);
        }
    } else {
        LogProgress("Error opening ", path);
    }
    RemovePath(path, kRemoveFile);
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
