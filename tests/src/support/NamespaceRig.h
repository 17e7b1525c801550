// SPDX-License-Identifier: MIT
#pragma once

#include "src/namespace/TPEGASUSNamespace.h"
#include "tests/src/support/CapturedLog.h"
#include "tests/src/support/FakeCimServer.h"
#include "tests/src/support/OutsideWorld.h"
#include "tests/src/support/StatusOf.h"
#include "tests/src/support/TempTree.h"

#include <host/TCIMValue.h>

#include <boost/shared_ptr.hpp>

#include <string>
#include <vector>

namespace NKOLVRX20 {

// What a namespace needs around it: a working directory R and a module path M of its own, a consumer of its own, the
// captured log, and a TOutsideWorld between it and the machine. One at a time.
class TNamespaceRig
{
  public:
    TNamespaceRig();
    ~TNamespaceRig();

    std::string R() const { return fRoot.Path(); }
    std::string M() const { return fModule.Path(); }
    // Returns: a context with this rig's consumer.
    TCIMContext Context() const;
    std::string StartFile() const;
    boost::shared_ptr<TPEGASUSNamespace> MakeNamespace() const;
    // Returns: a namespace that knows its consumer, after start attempts that all failed.
    boost::shared_ptr<TPEGASUSNamespace> MakeNamespaceWithConsumer();
    // Returns: a namespace that is connected to the server, which listens from now on.
    boost::shared_ptr<TPEGASUSNamespace> MakeConnectedNamespace(TFakeCimServer& server);
    // Makes the server's port the only free one.
    void OfferPortOf(const TFakeCimServer& server);
    // Puts a provider's requested-class file below M. Returns: its path.
    std::string WriteProvider(const std::string& vendor, const std::string& file, const std::string& content) const;
    // Writes R, M and the start file's name for what they stand for, so that rows can be written down.
    std::string Abbreviate(std::string text) const;
    std::vector<std::string> Abbreviate(const std::vector<std::string>& texts) const;

    const TTempTree fRoot;
    const TTempTree fModule;
    const std::string fConsumer;
    TCapturedLog fLog;
    TOutsideWorld fWorld;

  private:
    const std::string fOldDirectory;
    const std::string fOldModulePath;
};

// Returns: what a removal hands to the shell.
std::string RemovalOf(const std::string& path, const std::string& options = "-rf");

} // namespace NKOLVRX20
