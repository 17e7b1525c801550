// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/base/TreeLockFile.h"

#include <Pegasus/Common/Config.h>

#include <string>

struct sockaddr;

// How the client library of a staged tree reaches a server on this machine's loopback interface: by the private socket
// of the tree's own server, which nobody else can take the place of. Any user may listen on a TCP port.
// Thread: any.
namespace Pegasus::client {

enum class Route
{
    kTcp,        // the tree has no server of its own
    kTreeSocket, // the tree's server serves this port
    kRefused     // whoever listens on this port is not the tree's server
};

// Returns: the way to the server of a port, by the state of the tree's lock.
Route routeTo(Uint32 port, const base::TreeLockStatus& lock);

// Returns: the home folder `R/pegasus` of the tree whose `R/pegasus/lib` holds the library; empty when the library lies
// elsewhere, as in a build folder. Links stay unresolved: the folders of a tree may hold links to another one's files.
std::string homeOfLibrary(const std::string& libraryPath);
// The same for this library, by the path by which it was loaded.
const std::string& treeHome();

bool isLoopback(const sockaddr& address);

// Decides about a server at a loopback address. Empty home: TCP.
// Returns: whether to connect to the private socket in `home`; else to the port.
// Throws: CannotConnectException when the tree's server does not serve the port. `address` is what it names.
bool isReachedBySocket(const std::string& home, Uint32 port, const std::string& address);

// Returns: why the server of a TCP connection within this machine is untrusted, with port and user; empty when
// it is root's or belongs to this process's own user. Blocks: for the kernel's answers, at most 2 s.
std::string serverFault(int fd, Uint32 port);

} // namespace Pegasus::client
