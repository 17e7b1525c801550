// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/mof/DefinitionHandler.h"

#include <Pegasus/Client/CIMClient.h>

#include <map>
#include <string>

namespace Pegasus::cimmof {

// Brings definitions into a server, and remembers the classes that it had to fetch.
//
// Thread: one thread at a time. Throws: Pegasus::Exception whose message names the action that failed.
class ServerHandler : public mof::DefinitionHandler
{
  public:
    // Requires: client is connected and outlives the handler.
    ServerHandler(CIMClient& client, bool hideWarnings) : fClient(client), fHideWarnings(hideWarnings) {}

    // Creates the namespace if it is missing.
    void useNamespace(const CIMNamespaceName& nameSpace) override;
    bool findQualifier(const CIMName& name, CIMQualifierDecl& declaration) override;
    bool findClass(const CIMName& name, CIMClass& found) override;
    bool hasClass(const CIMName& name) override;
    void declareQualifier(const CIMQualifierDecl& declaration) override;
    bool createClass(const CIMClass& newClass) override;
    bool createInstance(const CIMInstance& newInstance) override;
    // To standard error. What fails on OpenPegasus 2.14 also goes to the open log: a host that runs the compiler shows
    // the log, and drops what a compiler prints that succeeds.
    void warn(const std::string& place, const std::string& text) override;

  private:
    CIMClient& fClient;
    bool fHideWarnings;
    CIMNamespaceName fNamespace;
    std::map<std::string, CIMClass> fClasses; // of fNamespace, by name as written
};

} // namespace Pegasus::cimmof
