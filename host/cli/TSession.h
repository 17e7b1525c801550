// SPDX-License-Identifier: MIT
#pragma once

#include "host/cli/TPluginLibrary.h"
#include "host/cli/losses/TLossLog.h"

#include <host/ICIMNamespace.h>

#include <memory>
#include <string>

namespace vrxhost {

// Returns: where a plug-in looks for its vendors: a folder beside itself.
std::string ProviderDirectory(const std::string& pluginPath);

// One use of a plug-in: loaded, its namespace opened (more than once, if need be), everything released in the right
// order. Thread: one at a time.
class TSession
{
  public:
    // Loads the plug-in.
    // Throws: TPluginError.
    TSession(const std::string& pluginPath, const std::string& consumer);

    // As Close, its sentences dropped.
    ~TSession();

    // Allocates the namespace. Requires: the session is closed.
    // Throws: TPluginError.
    // Blocks: for the start of the server, and as long again for each attempt that fails.
    void Open();

    // Shuts the namespace down, so that it can be opened again. Requires: everything that came from it is released.
    void Clear();

    NKOLVRX20::ICIMNamespace& GetNamespace() { return *fNamespace; }

    // Shuts the namespace down and unloads the plug-in. Requires: as Clear.
    // Returns: empty, or what went wrong.
    std::string Close();

  private:
    void Allocate();

    const std::string fPluginPath;
    const std::string fConsumer;
    // The host's namespaces outlive the plug-in's use of their addresses.
    boost::shared_ptr<NKOLVRX20::ICIMNamespace> fRepository;
    boost::shared_ptr<NKOLVRX20::ICIMNamespace> fUpcall;
    TPluginLibrary fPlugin;
    boost::shared_ptr<NKOLVRX20::ICIMNamespace> fNamespace;
    bool fClosed = false;
};

} // namespace vrxhost
