#pragma once

#include "pegasus/server/admin/Config.h"

namespace Pegasus::server {

// What a server of this configuration is going to run must be changeable by nobody but root and its own user: this
// program and its libraries, and in the tree the home folder, bin, lib, provider and the folders of providerDir.
// Vendors' libraries are looked at when an agent loads them. Nothing is looked at with strictOwners=false.
//
// Throws: StartError with path, owner and mode.
void requireOwnTree(const Config& config);

} // namespace Pegasus::server
