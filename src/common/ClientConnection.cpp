// SPDX-License-Identifier: MIT
#include "src/common/ClientConnection.h"

#include "src/common/CoreLog.h"

#include <Pegasus/Client/CIMClient.h>
#include <host/TVRXException.h>

#include <unistd.h>

namespace NKOLVRX20 {

namespace {

constexpr Pegasus::Uint32 kCreationTimeoutMs = 10000;
// About 18 hours: every call is expected to set a timeout of its own.
constexpr Pegasus::Uint32 kConnectedTimeoutMs = 65535000;
constexpr int kTries = 3;
constexpr unsigned int kPauseSeconds = 1;

} // namespace

TClientConnection::TClientConnection(const TConnectionTexts& texts) : fTexts(texts) {}

TClientConnection::~TClientConnection() = default;

void TClientConnection::Init()
{
    try {
        if (!fClient) {
            fClient = std::make_unique<Pegasus::CIMClient>();
        }
        fClient->setTimeout(kCreationTimeoutMs);
    } catch (const Pegasus::Exception& exception) {
        LogProgress(fTexts.fCreationFailed, ToStdString(exception.getMessage()));
        throw TVRXException(TVRXStatusCode::kServerConnectionFailed);
    }
}

void TClientConnection::Connect(const std::string& host, unsigned short port, const std::string& user,
                                const std::string& password)
{
    if (fConnected) {
        return;
    }
    LogProgress(fTexts.fEnter);
    for (int failedTries = 1; failedTries <= kTries; ++failedTries) {
        try {
            // Also the timeout of all later calls, until one of them sets its own.
            fClient->setTimeout(kConnectedTimeoutMs);
            fClient->connect(host.c_str(), port, user.c_str(), password.c_str());
            fConnected = true;
            LogProgress(fTexts.fSucceeded);
            return;
        } catch (const Pegasus::Exception& exception) {
            LogProgress(fTexts.fFailed, ToStdString(exception.getMessage()), " try to reconnect ", failedTries);
            ::sleep(kPauseSeconds); // after the last try too: a namespace restarts its server next
        }
    }
    throw TVRXException(TVRXStatusCode::kServerConnectionFailed);
}

Pegasus::CIMClient& TClientOwner::ConnectedClient() const
{
    if (!isConnected()) {
        throw Pegasus::NotConnectedException();
    }
    return *getPegClient();
}

} // namespace NKOLVRX20
