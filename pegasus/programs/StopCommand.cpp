#include "pegasus/programs/StopCommand.h"

#include "pegasus/base/Descriptor.h"
#include "pegasus/base/LocalSocket.h"
#include "pegasus/server/admin/StartFile.h"

#include <Pegasus/Client/CIMClient.h>

#include <iostream>
#include <system_error>

#include <poll.h>
#include <signal.h>
#include <sys/socket.h>
#include <sys/syscall.h>
#include <sys/types.h>

namespace Pegasus::programs {

namespace {

using server::Descriptor;

constexpr std::chrono::milliseconds kConnectTimeout{1000};
constexpr Uint32 kAnswerTimeoutMs = 60'000;
constexpr int kEndTimeoutMs = 60'000;
constexpr int kTermTimeoutMs = 10'000;

// The process that listens on the local socket; it outlives every file that could name it.
pid_t listeningProcess(const std::string& home)
{
    try {
        const Descriptor socket = base::connectLocalSocket(home, base::Deadline::after(kConnectTimeout));
        ucred peer = {};
        socklen_t size = sizeof peer;
        return ::getsockopt(socket.get(), SOL_SOCKET, SO_PEERCRED, &peer, &size) == 0 ? peer.pid : 0;
    } catch (const std::system_error&) {
        return 0;
    }
}

// A process by a handle of its own: a later process of the same number is never waited for or hurt.
class ProcessHandle
{
  public:
    explicit ProcessHandle(pid_t pid) : fHandle(static_cast<int>(::syscall(SYS_pidfd_open, pid, 0))) {}

    bool waitForEnd(int timeoutMs) const
    {
        pollfd wait = {fHandle.get(), POLLIN, 0};
        return !fHandle || ::poll(&wait, 1, timeoutMs) > 0;
    }
    void send(int signal) const { ::syscall(SYS_pidfd_send_signal, fHandle.get(), signal, nullptr, 0); }

  private:
    Descriptor fHandle;
};

int forceShutdown(const std::string& reason, const ProcessHandle& process, pid_t pid, const std::string& consumer)
{
    std::cerr << "Error in server shutdown: " << reason << "\nForced shutdown initiated.\n";
    process.send(SIGTERM);
    if (!process.waitForEnd(kTermTimeoutMs)) {
        process.send(SIGKILL);
        process.waitForEnd(kEndTimeoutMs);
    }
    server::StartFile(consumer).removeIfOf(pid);
    return 1;
}

void askToEnd()
{
    CIMClient client;
    client.setTimeout(kAnswerTimeoutMs);
    client.connectLocal();
    Array<CIMParamValue> in;
    Array<CIMParamValue> out;
    in.append(CIMParamValue(String("force"), CIMValue(Boolean(true))));
    in.append(CIMParamValue(String("timeout"), CIMValue(Uint32(30))));
    client.invokeMethod(CIMNamespaceName("root/PG_Internal"), CIMObjectPath("PG_ShutdownService"), CIMName("shutdown"),
                        in, out);
}

} // namespace

int stopServer(const std::string& home, const std::string& consumer)
{
    const pid_t pid = listeningProcess(home);
    if (pid <= 0) {
        std::cerr << "Unable to connect to CIM Server.  CIM Server may not be running.\n";
        return 1;
    }
    const ProcessHandle process(pid);
    try {
        askToEnd();
    } catch (const CIMException& error) {
        const bool empty = error.getCode() == CIM_ERR_INVALID_NAMESPACE;
        return forceShutdown(empty ? "The repository may be empty." : std::string(error.getMessage().getCString()),
                             process, pid, consumer);
    } catch (const Exception& error) {
        return forceShutdown(std::string(error.getMessage().getCString()), process, pid, consumer);
    }
    if (!process.waitForEnd(kEndTimeoutMs)) {
        return forceShutdown("The server does not end.", process, pid, consumer);
    }
    std::cout << "CIM Server stopped.\n";
    return 0;
}

} // namespace Pegasus::programs
