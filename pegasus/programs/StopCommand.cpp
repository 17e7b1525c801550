// SPDX-License-Identifier: MIT
#include "pegasus/base/Text.h"
#include "pegasus/base/TreeLockFile.h"
#include "pegasus/programs/ServerCommand.h"
#include "pegasus/server/admin/ProcessHandle.h"
#include "pegasus/server/admin/StartFile.h"

#include <Pegasus/Client/CIMClient.h>

#include <iostream>

namespace Pegasus::programs {

namespace {

constexpr Uint32 kAnswerTimeoutMs = 60'000;
constexpr std::chrono::seconds kEndTimeout{60};
constexpr std::chrono::seconds kTermTimeout{10};

int forceShutdown(const std::string& reason, const server::ProcessHandle& process, const base::TreeLockRecord& record)
{
    std::cerr << "Error in server shutdown: " << reason << "\nForced shutdown initiated.\n";
    process.end(kTermTimeout);
    server::StartFile::remove(record.startFile, record.pid);
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

int stopServer(const std::string& home)
{
    const base::TreeLockStatus status = base::readTreeLock(home);
    if (status.state != base::TreeLockState::kHeld || status.record.pid <= 0) {
        std::cerr << "Unable to connect to CIM Server.  CIM Server may not be running.\n";
        return 1;
    }
    const server::ProcessHandle process(status.record.pid);
    try {
        askToEnd();
    } catch (const CIMException& error) {
        const bool empty = error.getCode() == CIM_ERR_INVALID_NAMESPACE;
        return forceShutdown(empty ? "The repository may be empty." : base::utf8(error.getMessage()), process,
                             status.record);
    } catch (const Exception& error) {
        return forceShutdown(base::utf8(error.getMessage()), process, status.record);
    }
    if (!process.waitForEnd(kEndTimeout)) {
        return forceShutdown("The server does not end.", process, status.record);
    }
    std::cout << "CIM Server stopped.\n";
    return 0;
}

} // namespace Pegasus::programs
