#pragma once

#include "host/cli/TLossLog.h"
#include "host/cli/TPluginLibrary.h"

#include <host/ICIMNamespace.h>

#include <memory>
#include <string>

namespace vrxhost {

// One use of a plug-in: loaded, its namespace allocated, everything let go in the right order.
// Thread: one at a time.
class TSession
{
  public:
    // Throws: TPluginError when there is no plug-in or no namespace.
    TSession(const std::string& pluginPath, const std::string& consumer);

    // As Close, its sentences dropped.
    ~TSession();

    NKOLVRX20::ICIMNamespace& GetNamespace() { return *fNamespace; }

    // Shuts the namespace down and unloads the plug-in. Nothing that came from it may be held any more.
    // Returns: empty, or what went wrong.
    std::string Close();

  private:
    void Allocate(const std::string& consumer);

    // The host's namespaces outlive the plug-in's use of their addresses.
    boost::shared_ptr<NKOLVRX20::ICIMNamespace> fRepository;
    boost::shared_ptr<NKOLVRX20::ICIMNamespace> fUpcall;
    TPluginLibrary fPlugin;
    boost::shared_ptr<NKOLVRX20::ICIMNamespace> fNamespace;
    bool fClosed = false;
};

} // namespace vrxhost
