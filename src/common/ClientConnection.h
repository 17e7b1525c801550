// SPDX-License-Identifier: MIT
#pragma once

#include <memory>
#include <string>

namespace Pegasus {
class CIMClient;
}

namespace NKOLVRX20 {

// The log texts of a connection; all else about it is the same for every owner.
struct TConnectionTexts
{
    const char* fCreationFailed;
    const char* fEnter;
    const char* fSucceeded;
    const char* fFailed;
};

// The one way in which the plug-in makes and connects a CIM client.
// Ownership: owns the client; it lives until the connection is destroyed.
// Thread: one at a time.
class TClientConnection
{
  public:
    // The texts must outlive the connection.
    explicit TClientConnection(const TConnectionTexts& texts);
    ~TClientConnection();

    TClientConnection(const TClientConnection&) = delete;
    TClientConnection& operator=(const TClientConnection&) = delete;

    // Makes the client on first use, and gives it the short timeout of an unconnected client.
    // Throws: TVRXException 42.
    void Init();

    // Connects, with three tries and a pause of one second after each failure; returns at once when connected.
    // From then on an operation waits as long as its own timeout says; the default is hours.
    // Requires: Init.
    // Throws: TVRXException 42 after the third failure.
    // Blocks: while a connection attempt is pending, and for the pauses.
    void Connect(const std::string& host, unsigned short port, const std::string& user, const std::string& password);

    // Returns: true once a Connect has succeeded, also when the server has gone since.
    bool IsConnected() const { return fConnected; }

    // Returns: the client; null before Init.
    Pegasus::CIMClient* GetClient() const { return fClient.get(); }

  private:
    const TConnectionTexts& fTexts;
    std::unique_ptr<Pegasus::CIMClient> fClient;
    bool fConnected = false;
};

// What a namespace and a provider share: a client of their own, for all calls made on their behalf.
class TClientOwner
{
  public:
    bool isConnected() const { return fConnection.IsConnected(); }
    // Returns: the client; null before it was made. Ownership: stays here.
    Pegasus::CIMClient* getPegClient() const { return fConnection.GetClient(); }
    // Returns: the client.
    // Throws: Pegasus::NotConnectedException before the first successful connect, so that a caller's handler for a
    // failed call answers for this too.
    Pegasus::CIMClient& ConnectedClient() const;

  protected:
    explicit TClientOwner(const TConnectionTexts& texts) : fConnection(texts) {}
    ~TClientOwner() = default;

    TClientConnection fConnection;
};

} // namespace NKOLVRX20
