// SPDX-License-Identifier: MIT
#pragma once

#include <host/INamespaceProvider.h>

#include <boost/shared_ptr.hpp>

#include <string>

namespace NKOLVRX20 {

class TPEGASUSNamespace;

// Records the directory of the plug-in's own file as the module path; runs when the library is loaded.
void CmpiInit();

// The plug-in's entry object: one a process, at most one namespace at a time.
// Thread: the host allocates and clears namespaces from one thread.
class TPEGASUSNamespaceProvider : public INamespaceProvider
{
  public:
    // The entry points: the only symbols that the library exports.

    // Registers the one instance with the host's namespace-provider manager.
    static void Initialize();
    static boost::shared_ptr<TPEGASUSNamespaceProvider> GetInstance();
    // Returns: the current namespace; null before the first allocation and after ClearNamespace.
    static boost::shared_ptr<TPEGASUSNamespace> GetNamespace();
    // Lets the current namespace go. The last owner's release stops its server and removes the repository.
    static void ClearNamespace();
    // Returns: the directory of the plug-in's file, trailing slash omitted; empty when looking it up failed.
    static std::string& GetfgModulePathName();

    // Returns: "pegasus".
    std::string GetName(TCIMContext context) const override;

    // Starts a new private server and returns the "root/cimv2" that it serves, whatever the flag and the name say.
    // The namespace takes the place of the current one at once, and keeps it when starting fails.
    // Throws: TVRXException 3 (unsafe directory or consumer name), 11 (provider tree unreadable), 12 (a program
    // fails to run or times out), 42 (connecting failed); Pegasus::Exception when the server's answer lacks the class.
    // Blocks: at least 4 seconds for each of up to six start attempts, and as long as the programs run.
    boost::shared_ptr<ICIMNamespace> AllocateNamespace(TCIMContext context, bool create,
                                                       std::string name) const override;
    // Returns: 0.
    int GetType(TCIMContext context) const override;
    // Returns: false.
    bool IsIndicationsSupported(TCIMContext context) const override;

  private:
    mutable boost::shared_ptr<TPEGASUSNamespace> fNamespace;
};

} // namespace NKOLVRX20
