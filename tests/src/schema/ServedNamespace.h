// SPDX-License-Identifier: MIT
#pragma once

#include "src/provider/TPEGASUSProvider.h"
#include "src/schema/TPEGASUSClass.h"
#include "tests/src/support/NamespaceRig.h"
#include "tests/support/PeerAnswers.h"
#include "tests/support/ScriptedPeer.h"

#include <Pegasus/Client/CIMClient.h>

#include <string>
#include <vector>

namespace NKOLVRX20 {

inline constexpr char kNsp[] = "root/cimv2";

// A namespace connected to a server that is made of objects, with the standard qualifiers Key, Override, Association,
// Abstract, In and Out (boolean, but Override text) declared.
class TServedNamespace
{
  public:
    TServedNamespace();

    // Returns: the class through the namespace; null when the server refuses it.
    boost::shared_ptr<TPEGASUSClass> Class(const std::string& name, const std::string& timeout = "60");
    // Returns: a connected provider of "root/cimv2".
    boost::shared_ptr<TPEGASUSProvider> MakeProvider(const std::string& cimNamespace = kNsp) const;
    // Returns: "operation name" for each request since the last call.
    std::vector<std::string> TakeRequests();
    Pegasus::Uint32 TimeoutMs() const { return fNamespace->getPegClient()->getTimeout(); }
    std::vector<std::string> Log() { return fRig.fLog.Take(); }

    test::ServedModel fModel;
    test::ScriptedPeer fPeer;
    TNamespaceRig fRig;
    boost::shared_ptr<TPEGASUSNamespace> fNamespace;

  private:
    std::size_t fSeen = 0;
};

// Returns: a boolean qualifier that is true, of the kind that Key is.
Pegasus::CIMQualifier TrueQualifier(const char* name);
Pegasus::CIMQualifier TextQualifier(const char* name, const char* text);
// Returns: a property with the value, and with the qualifier if one is given.
Pegasus::CIMProperty Property(const char* name, const Pegasus::CIMValue& value, const char* qualifier = nullptr);

} // namespace NKOLVRX20
